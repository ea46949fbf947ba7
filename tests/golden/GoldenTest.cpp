// The records of two dozen simulated gestures, kept in records.txt, from both implementations.
#include <gtest/gtest.h>

#include <fstream>
#include <map>

#include "Recorder.h"

namespace fpnavi_test {
namespace {

// The kept lines by the gesture's id.
std::map<std::string, std::string> KeptLines() {
    std::ifstream file(FPNAVI_GOLDEN_RECORDS);
    std::map<std::string, std::string> lines;
    for (std::string line; std::getline(file, line);)
        lines[line.substr(0, line.find(' '))] = line;
    return lines;
}

void ExpectKeptRecords(const Implementation& implementation, host::Mode mode) {
    const std::map<std::string, std::string> kept = KeptLines();
    ASSERT_EQ(kept.size(), 24U) << "in " << FPNAVI_GOLDEN_RECORDS;
    for (const host::Gesture& gesture : GoldenGestures(mode)) {
        ASSERT_EQ(kept.count(gesture.id), 1U) << gesture.id;
        EXPECT_EQ(OutcomeLine(gesture.id, Record(implementation, gesture)), kept.at(gesture.id));
    }
}

TEST(GoldenRecords, ModuleInFpMode) {
    ExpectKeptRecords(kModule, host::Mode::Fp);
}
TEST(GoldenRecords, ReferenceInFpMode) {
    ExpectKeptRecords(kReference, host::Mode::Fp);
}
TEST(GoldenRecords, ModuleInHgMode) {
    ExpectKeptRecords(kModule, host::Mode::Hg);
}
TEST(GoldenRecords, ReferenceInHgMode) {
    ExpectKeptRecords(kReference, host::Mode::Hg);
}
TEST(GoldenRecords, ModuleInDoubleScanMode) {
    ExpectKeptRecords(kModule, host::Mode::DoubleScan);
}
TEST(GoldenRecords, ReferenceInDoubleScanMode) {
    ExpectKeptRecords(kReference, host::Mode::DoubleScan);
}

}  // namespace
}  // namespace fpnavi_test
