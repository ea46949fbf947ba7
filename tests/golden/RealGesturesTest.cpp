// Strokes of real fingers with known answers: every plain one gets its key, none a wrong one.
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>

#include "importers/FngImport.h"
#include "recording/Keys.h"
#include "replay/ReplayProcess.h"

namespace fpnavi_test {
namespace {

std::string RealDataDirectory() {
    const char* const set = std::getenv("FPNAVI_REALDATA");
    return std::string(set != nullptr ? set : FPNAVI_REALDATA_DEFAULT) + "/gestures";
}

class RealGestures : public ::testing::Test {
  protected:
    void SetUp() override {
        if (!std::filesystem::exists(RealDataDirectory()))
            GTEST_SKIP() << "no recordings of real fingers at " << RealDataDirectory();
        m_results = host::ReplayAll(host::ImportFng(RealDataDirectory()));
        ASSERT_FALSE(m_results.empty());
    }

    std::vector<host::ReplayResult> m_results;
};

TEST_F(RealGestures, EveryCoreGestureGetsItsKey) {
    size_t core = 0;
    for (const host::ReplayResult& result : m_results) {
        if (result.tier != "core")
            continue;
        ++core;
        EXPECT_EQ(result.verdict, host::Verdict::Right)
            << result.id << " got " << host::KeyName(result.key);
    }
    EXPECT_GT(core, 0U);
}

TEST_F(RealGestures, NoGestureGetsAKeyOutsideItsAcceptedOnes) {
    for (const host::ReplayResult& result : m_results) {
        EXPECT_NE(result.verdict, host::Verdict::Wrong)
            << result.id << " got " << host::KeyName(result.key);
        EXPECT_TRUE(result.errors.empty()) << result.id;
    }
}

}  // namespace
}  // namespace fpnavi_test
