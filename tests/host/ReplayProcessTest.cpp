// Many gestures in child processes: order, isolation of the double scan, crashes, errors.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <csignal>
#include <optional>
#include <stdexcept>

#include "HostTestSupport.h"
#include "ReplayTestSupport.h"
#include "common/Error.h"
#include "replay/ReplayProcess.h"

namespace {

using host::Gesture;
using host::Mode;
using host::ReplayAll;
using host::ReplayResult;
using host::Verdict;
using host_test::DoubleScan;
using host_test::Ids;
using host_test::Resting;
using host_test::Right;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

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

// A job over gestures, whose reader does something else first.
host::ReplayJob JobOver(const std::vector<Gesture>& gestures,
                        const std::function<void(size_t)>& beforeReading) {
    host::ReplayJob job;
    job.processes = 1;
    job.next = [&gestures, index = size_t{0}]() mutable -> std::optional<host::GestureHead> {
        if (index == gestures.size())
            return std::nullopt;
        host::GestureHead head;
        head.seq = static_cast<int64_t>(index);
        head.id = gestures[index].id;
        head.mode = gestures[index++].mode;
        head.tier = "hard";
        return head;
    };
    job.openReader = [&gestures, beforeReading] {
        return host::GestureReader([&gestures, beforeReading](int64_t seq) {
            const auto index = static_cast<size_t>(seq);
            beforeReading(index);
            return gestures[index];
        });
    };
    return job;
}

std::vector<ReplayResult> ResultsOf(const host::ReplayJob& job) {
    std::vector<ReplayResult> results;
    host::ReplayMany(job, [&](size_t, const ReplayResult& result) { results.push_back(result); });
    return results;
}

TEST(ReplayProcess, ACrashIsReportedWithTheGestureAndTheRestIsReplayed) {
    const std::vector<Gesture> gestures = {Right("a"), Right("b"), Right("c")};
    const std::vector<ReplayResult> results = ResultsOf(JobOver(gestures, [](size_t index) {
        if (index == 1)
            std::raise(SIGKILL);
    }));
    ASSERT_THAT(Ids(results), ElementsAre("a", "b", "c"));
    EXPECT_THAT(results[1].errors, ElementsAre(HasSubstr("signal 9")));
    EXPECT_EQ(results[1].verdict, Verdict::Wrong);
    EXPECT_EQ(results[1].tier, "hard");
    EXPECT_EQ(results[2].key, VKEY_RIGHT);
}

TEST(ReplayProcess, AGestureThatCannotBeReadIsOneResultAndTheRestIsReplayed) {
    const std::vector<Gesture> gestures = {Right("a"), DoubleScan("b"), Right("c")};
    const std::vector<ReplayResult> results = ResultsOf(JobOver(gestures, [](size_t index) {
        if (index < 2)
            throw host::Error("some.db", "gesture", "is damaged");
    }));
    ASSERT_THAT(Ids(results), ElementsAre("a", "b", "c"));
    for (const size_t i : {size_t{0}, size_t{1}}) {
        EXPECT_EQ(results[i].verdict, Verdict::Unreadable);
        EXPECT_THAT(results[i].errors, ElementsAre("some.db: gesture: is damaged"));
        EXPECT_EQ(results[i].mode, gestures[i].mode);
        EXPECT_EQ(results[i].tier, "hard");
        EXPECT_EQ(results[i].key, -1);
    }
    EXPECT_EQ(results[2].verdict, Verdict::Right);
}

TEST(ReplayProcess, AGestureThatTheModuleCannotBeGivenIsOneResult) {
    Gesture odd = Right("odd");
    odd.frames[1].raw.pop_back();
    const std::vector<ReplayResult> results = ReplayAll({odd, Right("a")}, 1);
    EXPECT_EQ(results.at(0).verdict, Verdict::Unreadable);
    EXPECT_THAT(results.at(0).errors, ElementsAre(HasSubstr("gesture 'odd'")));
    EXPECT_EQ(results.at(1).verdict, Verdict::Right);
}

// Each reading leaves a byte in a pipe, from whichever process.
TEST(ReplayProcess, EachGestureIsReadOnce) {
    int ends[2];
    ASSERT_EQ(pipe(ends), 0);
    const std::vector<Gesture> gestures = {Right("a"), DoubleScan("b"), Right("c"),
                                           DoubleScan("d")};
    ResultsOf(JobOver(gestures, [&](size_t index) {
        const auto byte = static_cast<char>('a' + index);
        if (write(ends[1], &byte, 1) != 1)
            std::raise(SIGKILL);
    }));
    close(ends[1]);
    std::string reads(100, ' ');
    const ssize_t count = read(ends[0], reads.data(), reads.size());
    close(ends[0]);
    reads.resize(static_cast<size_t>(std::max<ssize_t>(count, 0)));
    std::sort(reads.begin(), reads.end());
    EXPECT_EQ(reads, "abcd");
}

// The list goes on only while results are given: whatever the order of the modes, few gestures are
// under way at any moment.
TEST(ReplayProcess, GesturesAndResultsUnderWayAreBounded) {
    const Gesture plain = Right("p");
    const Gesture twice = DoubleScan("d");
    constexpr size_t kGestures = 1500;
    const auto isTwice = [](size_t index) { return index == 0 || index > kGestures / 2; };
    for (const int32_t processes : {1, 2}) {
        size_t listed = 0;
        size_t given = 0;
        size_t most = 0;
        host::ReplayJob job;
        job.processes = processes;
        job.next = [&]() -> std::optional<host::GestureHead> {
            if (listed == kGestures)
                return std::nullopt;
            host::GestureHead head;
            head.seq = static_cast<int64_t>(listed);
            head.mode = isTwice(listed++) ? Mode::DoubleScan : Mode::Fp;
            most = std::max(most, listed - given);
            return head;
        };
        job.openReader = [&] {
            return host::GestureReader(
                [&](int64_t seq) { return isTwice(static_cast<size_t>(seq)) ? twice : plain; });
        };
        host::ReplayMany(job,
                         [&](size_t index, const ReplayResult&) { EXPECT_EQ(index, given++); });
        EXPECT_EQ(given, kGestures);
        EXPECT_LE(most, 256U * static_cast<size_t>(processes));
    }
}

TEST(ReplayProcess, AResultIsGivenBeforeTheListEnds) {
    const std::vector<Gesture> gestures = {DoubleScan("d"), Right("a")};
    size_t given = 0;
    size_t givenAtTheEnd = 0;
    size_t listed = 0;
    host::ReplayJob job = JobOver(gestures, [](size_t) {});
    job.openReader = [&gestures] {
        return host::GestureReader([&gestures](int64_t seq) { return gestures[seq == 0 ? 0 : 1]; });
    };
    job.next = [&]() -> std::optional<host::GestureHead> {
        constexpr size_t kMore = 1000;  // than may be under way
        if (listed == kMore) {
            givenAtTheEnd = given;
            return std::nullopt;
        }
        host::GestureHead head;
        head.seq = static_cast<int64_t>(listed);
        head.mode = listed++ == 0 ? Mode::DoubleScan : Mode::Fp;
        return head;
    };
    host::ReplayMany(job, [&](size_t, const ReplayResult&) { ++given; });
    EXPECT_EQ(given, 1000U);
    EXPECT_GE(givenAtTheEnd, 1000U - 256U);
}

TEST(ReplayProcess, AnErrorOfOpeningTheReaderEndsTheReplay) {
    const std::vector<Gesture> gestures = {Right("a")};
    host::ReplayJob job = JobOver(gestures, [](size_t) {});
    job.openReader = []() -> host::GestureReader {
        throw host::Error("some.db", "", "cannot be opened");
    };
    EXPECT_EQ(host_test::ErrorOf([&] { ResultsOf(job); }), "some.db: cannot be opened");
}

TEST(ReplayProcess, WhatTheSinkThrowsEndsTheReplay) {
    const std::vector<Gesture> gestures = {Right("a"), Right("b")};
    const auto replay = [&] {
        host::ReplayMany(JobOver(gestures, [](size_t) {}),
                         [](size_t, const ReplayResult&) { throw std::runtime_error("enough"); });
    };
    EXPECT_THROW(replay(), std::runtime_error);
    EXPECT_EQ(waitpid(-1, nullptr, WNOHANG), -1);  // no child is left
}

}  // namespace
