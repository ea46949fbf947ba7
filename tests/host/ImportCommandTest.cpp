// fpnavi import: ids that are taken, and --skip-existing.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <nlohmann/json.hpp>

#include "CommandSupport.h"
#include "FngTestSupport.h"
#include "store/Store.h"

namespace {

using host_test::CommandEnd;
using host_test::FngBytes;
using host_test::RunCommand;
using host_test::WriteBytes;
using ::testing::HasSubstr;
using ::testing::StartsWith;

class ImportCommand : public ::testing::Test {
  protected:
    void SetUp() override {
        m_folder = host_test::TestDirectory();
        std::filesystem::create_directory(m_folder + "/in");
        for (const char* name : {"a", "b"})
            WriteBytes(m_folder + "/in/" + name + ".fng", FngBytes());
        WriteBytes(m_folder + "/a.bin", host_test::Bytes(2016, 100));
    }

    CommandEnd Import(const std::vector<std::string>& more) const {
        std::vector<std::string> words = {"import", Corpus()};
        words.insert(words.end(), more.begin(), more.end());
        return RunCommand(words, m_folder + "/out");
    }

    std::string Corpus() const { return m_folder + "/c.db"; }

    std::string Out() const {
        const std::vector<uint8_t> bytes = host_test::ReadBytes(m_folder + "/out");
        return {bytes.begin(), bytes.end()};
    }

    int64_t Count() const { return host::Store::OpenForReading(Corpus()).Count(); }

    std::string m_folder;
};

TEST_F(ImportCommand, ATakenIdNamesTheFileAndTheCorpus) {
    ASSERT_EQ(Import({m_folder + "/in/a.fng"}).exitCode, 0);
    const CommandEnd end = Import({m_folder + "/in"});
    EXPECT_EQ(end.exitCode, 3);
    EXPECT_EQ(end.err, "fpnavi: " + m_folder + "/in/a.fng: gesture 'a': the id is taken by " +
                           Corpus() + ", expected a new one\n");
    EXPECT_EQ(Count(), 1);
}

TEST_F(ImportCommand, TwoFilesOfOneIdAreBothNamed) {
    std::filesystem::create_directory(m_folder + "/in/more");
    WriteBytes(m_folder + "/in/more/b.FNG", FngBytes());
    for (const char* flag : {"--json", "--skip-existing"}) {
        const CommandEnd end = Import({m_folder + "/in", flag});
        EXPECT_EQ(end.exitCode, 3);
        EXPECT_THAT(end.err, StartsWith("fpnavi: " + m_folder +
                                        "/in/more/b.FNG: gesture 'b': the "
                                        "id is taken by " +
                                        m_folder + "/in/b.fng"));
        EXPECT_FALSE(std::filesystem::exists(Corpus()));
    }
}

TEST_F(ImportCommand, ADumpWhoseIdIsTakenIsNamed) {
    const std::vector<std::string> dump = {"--raw", m_folder + "/a.bin", "--mode", "fp"};
    ASSERT_EQ(Import(dump).exitCode, 0);
    const CommandEnd end = Import(dump);
    EXPECT_EQ(end.exitCode, 3);
    EXPECT_THAT(end.err,
                StartsWith("fpnavi: " + m_folder + "/a.bin: gesture 'a': the id is taken"));
    EXPECT_EQ(Count(), 1);
}

TEST_F(ImportCommand, ExistingOnesAreSkippedOnDemand) {
    ASSERT_EQ(Import({m_folder + "/in/a.fng", "--skip-existing"}).exitCode, 0);
    EXPECT_THAT(Out(), HasSubstr("1 gestures with 2 frames imported, 0 skipped, 1 in all"));
    ASSERT_EQ(Import({m_folder + "/in", "--skip-existing"}).exitCode, 0);
    EXPECT_THAT(Out(), HasSubstr("1 gestures with 2 frames imported, 1 skipped, 2 in all"));
    ASSERT_EQ(Import({m_folder + "/in", "--skip-existing", "--json"}).exitCode, 0);
    const nlohmann::json line = nlohmann::json::parse(Out());
    EXPECT_EQ(line.at("gestures"), 0);
    EXPECT_EQ(line.at("skipped"), 2);
    EXPECT_EQ(line.at("total"), 2);
    const CommandEnd dump =
        Import({"--raw", m_folder + "/a.bin", "--mode", "fp", "--skip-existing"});
    EXPECT_EQ(dump.exitCode, 0);
    EXPECT_EQ(Count(), 2);
}

}  // namespace
