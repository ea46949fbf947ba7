// Many gestures in child processes: order, isolation of the double scan, crashes, errors.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>
#include <filesystem>
#include <fstream>

#include "GestureBuilder.h"
#include "common/Error.h"
#include "replay/ReplayCorpus.h"
#include "replay/ReplayProcess.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Mode;
using host::ReplayAll;
using host::ReplayResult;
using host_test::GestureBuilder;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

Gesture Right(const std::string& id) {
    return GestureBuilder(Mode::Fp, id).Skin(0).Skin(6).Skin(12).Empty().Label(VKEY_RIGHT).Get();
}

// The map's left half, then its right half, then nothing.
Gesture DoubleScan(const std::string& id) {
    return GestureBuilder(Mode::DoubleScan, id)
        .Skin(0)
        .Registers(0xF0F0F0F0, 0xF0F0F0F0)
        .Skin(6)
        .Registers(0x0F0F0F0F, 0x0F0F0F0F)
        .Empty()
        .Label(VKEY_RIGHT)
        .Get();
}

Gesture Resting(const std::string& id) {
    return GestureBuilder(Mode::Fp, id).Skin(0).Skin(0).Empty().Label(VKEY_NO_MOVE).Get();
}

std::vector<std::string> Ids(const std::vector<ReplayResult>& results) {
    std::vector<std::string> ids;
    ids.reserve(results.size());
    for (const ReplayResult& result : results)
        ids.push_back(result.id);
    return ids;
}

// True when condition holds in a process of its own.
bool HoldsInChild(const std::function<bool()>& condition) {
    const pid_t pid = fork();
    if (pid == 0)
        _exit(condition() ? 0 : 1);
    int status = 0;
    return pid > 0 && waitpid(pid, &status, 0) == pid && WIFEXITED(status) &&
           WEXITSTATUS(status) == 0;
}

TEST(ReplayProcess, ADoubleScanGestureDoesNotChangeTheOnesAfterIt) {
    const std::vector<ReplayResult> alone = ReplayAll({Right("a")}, 1);
    const std::vector<ReplayResult> after = ReplayAll({DoubleScan("d"), Right("a")}, 1);
    ASSERT_EQ(after.size(), 2U);
    EXPECT_EQ(after[0].pairs, 1);
    EXPECT_EQ(alone[0].pairs, 2);
    EXPECT_EQ(after[1].pairs, 2);
    EXPECT_EQ(after[1].key, VKEY_RIGHT);
}

TEST(ReplayProcess, OneProcessRefusesOtherModesAfterADoubleScan) {
    EXPECT_TRUE(HoldsInChild([] {
        if (!host::ReplayHere(DoubleScan("d")).errors.empty())
            return false;
        try {
            host::ReplayHere(Right("a"));
        } catch (const host::Error&) {
            return true;
        }
        return false;
    }));
}

TEST(ReplayProcess, ResultsComeInOrderWhateverTheNumberOfProcesses) {
    const std::vector<Gesture> gestures = {Right("a"),      DoubleScan("b"), Resting("c"),
                                           Right("d"),      Resting("e"),    DoubleScan("f"),
                                           DoubleScan("g"), Right("h")};
    for (const int32_t processes : {1, 2, 3, 20}) {
        const std::vector<ReplayResult> results = ReplayAll(gestures, processes);
        EXPECT_THAT(Ids(results), ElementsAre("a", "b", "c", "d", "e", "f", "g", "h"));
        EXPECT_EQ(results[2].key, VKEY_NO_MOVE);
        EXPECT_EQ(results[7].key, VKEY_RIGHT);
        EXPECT_EQ(results[6].mode, Mode::DoubleScan);
    }
}

TEST(ReplayProcess, ResultsCarryWhatIsKnownOfTheGesture) {
    Gesture gesture = Right("named");
    gesture.tier = "core";
    const ReplayResult result = ReplayAll({gesture}, 1).at(0);
    EXPECT_EQ(result.id, "named");
    EXPECT_EQ(result.tier, "core");
    EXPECT_EQ(result.label, VKEY_RIGHT);
    EXPECT_EQ(result.frameCount, 4);
    EXPECT_EQ(result.pairs, 2);
    EXPECT_EQ(result.voteTimeOut, 0);
    EXPECT_EQ(result.verdict, host::Verdict::Right);
}

TEST(ReplayProcess, NothingToReplayIsFine) {
    EXPECT_THAT(ReplayAll({}), IsEmpty());
}

TEST(ReplayProcess, ACrashIsReportedWithTheGestureAndTheRestIsReplayed) {
    const std::vector<Gesture> gestures = {Right("a"), Right("b"), Right("c")};
    host::ReplayJob job;
    job.processes = 1;
    job.ids = {"a", "b", "c"};
    job.openReader = [&gestures] {
        return host::GestureReader([&gestures](size_t index) {
            if (index == 1)
                std::raise(SIGKILL);
            return gestures[index];
        });
    };
    std::vector<ReplayResult> results;
    host::ReplayMany(job, [&](size_t, const ReplayResult& result) { results.push_back(result); });
    ASSERT_THAT(Ids(results), ElementsAre("a", "b", "c"));
    EXPECT_THAT(results[1].errors, ElementsAre(HasSubstr("signal 9")));
    EXPECT_EQ(results[1].verdict, host::Verdict::Wrong);
    EXPECT_EQ(results[2].key, VKEY_RIGHT);
}

TEST(ReplayProcess, AnErrorOfTheReaderNamesTheSource) {
    host::ReplayJob job;
    job.source = "some.db";
    job.ids = {"a"};
    job.openReader = [] {
        return host::GestureReader(
            [](size_t) -> Gesture { throw host::Error("some.db", "gesture 'a'", "is damaged"); });
    };
    try {
        host::ReplayMany(job, [](size_t, const ReplayResult&) {});
        FAIL() << "no error";
    } catch (const host::Error& error) {
        EXPECT_STREQ(error.what(), "some.db: gesture 'a': is damaged");
    }
}

class ReplayCorpus : public ::testing::Test {
  protected:
    void SetUp() override {
        std::string name = (std::filesystem::temp_directory_path() / "fpnavi-XXXXXX").string();
        ASSERT_NE(mkdtemp(name.data()), nullptr);
        m_folder = name;
    }
    void TearDown() override { std::filesystem::remove_all(m_folder); }

    std::string Write(const char* name, const std::string& text) const {
        const std::string path = m_folder / name;
        std::ofstream(path) << text;
        return path;
    }

    std::filesystem::path m_folder;
};

TEST_F(ReplayCorpus, ReplaysAStoreInItsOrderWithOverrides) {
    host::CorpusReplay replay;
    replay.path = m_folder / "corpus.db";
    {
        host::Store store = host::Store::Create(replay.path);
        for (const Gesture& gesture : {DoubleScan("z"), Right("y"), Resting("x")})
            store.Append(gesture);
    }
    std::vector<ReplayResult> results;
    const host::ResultSink sink = [&](size_t, const ReplayResult& result) {
        results.push_back(result);
    };
    host::ReplayCorpus(replay, sink);
    EXPECT_THAT(Ids(results), ElementsAre("z", "y", "x"));
    EXPECT_EQ(results[1].key, VKEY_RIGHT);
    results.clear();
    replay.overrides = host::ReadOverrides(Write("back.toml", "s_sensorBackFlag = 1\n"));
    host::ReplayCorpus(replay, sink);
    EXPECT_EQ(results[1].key, VKEY_LEFT);
}

TEST_F(ReplayCorpus, OverridesAreWhatTheFileNamesAndNoMore) {
    const host::ParamOverrides overrides = host::ReadOverrides(Write(
        "some.toml", "s_minDelta = 0\ns_sensorBackFlag = 1\n_NAVI_range_mean.RANGE_LOW = 7\n"));
    host::ParamBlock params = host::DefaultParams();
    host::ParamBlock expected = params;
    host::ApplyOverrides(overrides, &params);
    host::ParamValue(expected, "s_minDelta") = 0;
    host::ParamValue(expected, "s_sensorBackFlag") = 1;
    host::ParamValue(expected, "_NAVI_range_mean.RANGE_LOW") = 7;
    EXPECT_EQ(params, expected);
    EXPECT_EQ(overrides.size(), 3U);
}

}  // namespace
