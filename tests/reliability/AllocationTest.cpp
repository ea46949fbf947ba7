// Every allocation of a gesture fails, alone and from there on for good: results and state are the
// model's, nothing leaks, and the next gesture is the one of a fresh process.
//
// Pairs: after a failure the frame makes at most one more attempt, and later frames of the gesture
// make none. So two failures of one gesture are neighbours, which is the failure for good
// (AtMostOneAttemptFollows). Pairs across two gestures are run one by one.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <functional>

#include "FailingMalloc.h"
#include "SmallGesture.h"
#include "Twin.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"

namespace fpnavi_test {
namespace {

using host::Mode;

constexpr int32_t kFrames = 3;  // no pair, first pair, a pair with full images from before
constexpr size_t kRecordInts = sizeof(NaviVoteInfo_t) / sizeof(int32_t);

struct Scenario {
    const char* name;
    SmallSensor sensor;
    int32_t laterAllocations;  // of a frame that has one before it

    SmallGesture Gesture(uint64_t seed) const { return MakeSmallGesture(sensor, kFrames, seed); }
};

// A first frame takes its two buffers. A later one also copies it (two more); template matching
// takes three lists, and with gaps two full images of two buffers. More than 64 columns take the
// loops for frames of any size.
constexpr int32_t kFirstAllocations = 2;
constexpr Scenario kScenarios[] = {
    {"FpTiles", {Mode::Fp, true, 16, 12}, 11},
    {"FpPlain", {Mode::Fp, false, 16, 12}, 7},
    {"FpWideTiles", {Mode::Fp, true, 72, 12}, 11},
    {"FpWidePlain", {Mode::Fp, false, 72, 12}, 7},
    {"HgTiles", {Mode::Hg, true, 16, 12}, 4},
    {"HgPlain", {Mode::Hg, false, 16, 12}, 4},
    {"DoubleScanTiles", {Mode::DoubleScan, true, 16, 12}, 11},
    {"DoubleScanPlain", {Mode::DoubleScan, false, 16, 12}, 7},
};

// The failing allocation, counted from 1 over the frames of a gesture.
struct Failure {
    int32_t number = 0;  // 0: none
    bool forGood = false;
};

struct Outcome {
    std::array<int32_t, kFrames> results{};
    int32_t key = -1;
    int32_t pairs = 0;
    int32_t failures = 0;
    int32_t allocations = 0;
    int32_t frees = 0;
    int32_t live = 0;
    std::array<int32_t, kRecordInts> record{};
};

void Fail(const Failure& failure) {
    if (failure.number == 0)
        FailingMalloc::Count();
    else if (failure.forGood)
        FailingMalloc::FailFrom(failure.number);
    else
        FailingMalloc::FailNth(failure.number);
}

// The module alone, from one FpNaviClear to the next.
Outcome Replay(const SmallGesture& gesture, const Failure& failure) {
    Outcome outcome;
    std::vector<uint8_t> image(gesture.frames[0].size());
    ::SetNaviParam(gesture.params.data());
    ::FpNaviClear();
    Fail(failure);
    for (size_t frame = 0; frame < kFrames; ++frame) {
        if (gesture.mode == Mode::DoubleScan)
            ::GetDoubleScanNaviBlock(0, ZoneRows(static_cast<int32_t>(frame)));
        ::GetNaviBlock(gesture.frames[frame].data(), gesture.width, 0, image.data());
        outcome.results[frame] = ::OrientationCalc(image.data(), image.data(), 0);
    }
    outcome.key = ::Voting(1);
    outcome.pairs = fpnavi::s_voteInfo.calc_cnt;
    std::copy_n(reinterpret_cast<const int32_t*>(::PrintNaviLog()), kRecordInts,
                outcome.record.begin());
    ::FpNaviClear();
    FailingMalloc::Off();
    outcome.failures = FailingMalloc::Failures();
    outcome.allocations = FailingMalloc::Allocations();
    outcome.frees = FailingMalloc::Frees();
    outcome.live = FailingMalloc::Live();
    return outcome;
}

bool WriteAll(int file, const char* data, size_t size) {
    size_t done = 0;
    ssize_t n = 1;
    while (done < size && n > 0) {
        n = write(file, data + done, size - done);
        done += n > 0 ? static_cast<size_t>(n) : 0;
    }
    return done == size;
}

size_t ReadAll(int file, char* data, size_t size) {
    size_t done = 0;
    ssize_t n = 1;
    while (done < size && n > 0) {
        n = read(file, data + done, size - done);
        done += n > 0 ? static_cast<size_t>(n) : 0;
    }
    return done;
}

// What run returns for 0 to count - 1, in one process of its own that starts as a copy of this one:
// the module of this process is left to Twin.
std::vector<Outcome> InChild(size_t count, const std::function<Outcome(size_t)>& run) {
    int ends[2] = {-1, -1};
    EXPECT_EQ(pipe(ends), 0);
    const pid_t child = fork();
    if (child == 0) {
        bool written = true;
        for (size_t i = 0; i < count; ++i) {
            const Outcome outcome = run(i);
            written = written &&
                      WriteAll(ends[1], reinterpret_cast<const char*>(&outcome), sizeof outcome);
        }
        _exit(written ? 0 : 1);
    }
    close(ends[1]);
    std::vector<Outcome> outcomes(count);
    const size_t size = count * sizeof(Outcome);
    EXPECT_EQ(ReadAll(ends[0], reinterpret_cast<char*>(outcomes.data()), size), size);
    close(ends[0]);
    int status = 1;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, 0);
    return outcomes;
}

// Zeroes what a gesture may inherit: entries of xc_ds and yc_ds behind those that it wrote.
std::array<int32_t, kRecordInts> Own(const Outcome& outcome) {
    std::array<int32_t, kRecordInts> record = outcome.record;
    const auto written = static_cast<size_t>(outcome.pairs) + 1;
    for (const size_t start :
         {offsetof(NaviVoteInfo_t, xc_ds) / 4, offsetof(NaviVoteInfo_t, yc_ds) / 4})
        std::fill(record.begin() + static_cast<std::ptrdiff_t>(start + written),
                  record.begin() + static_cast<std::ptrdiff_t>(start + FPNAVI_VOTE_CAPACITY), 0);
    return record;
}

int32_t Allocations(const Scenario& scenario) {
    return kFirstAllocations + (kFrames - 1) * scenario.laterAllocations;
}

class FailedAllocation : public ::testing::TestWithParam<Scenario> {
  protected:
    // Every allocation of the scenario's gesture, failing alone and for good.
    static std::vector<Failure> AllFailures() {
        std::vector<Failure> failures;
        for (int32_t number = 1; number <= Allocations(GetParam()); ++number) {
            failures.push_back({number, false});
            failures.push_back({number, true});
        }
        return failures;
    }

    // Calls check with each of them and the outcome of the gesture under it.
    static void ForEachOutcome(const std::function<void(const Failure&, const Outcome&)>& check) {
        const SmallGesture gesture = GetParam().Gesture(1);
        const std::vector<Failure> failures = AllFailures();
        const std::vector<Outcome> outcomes =
            InChild(failures.size(), [&](size_t i) { return Replay(gesture, failures[i]); });
        for (size_t i = 0; i < failures.size(); ++i) {
            SCOPED_TRACE(Name(failures[i]));
            check(failures[i], outcomes[i]);
        }
    }

    static std::string Name(const Failure& failure) {
        return "allocation " + std::to_string(failure.number) +
               (failure.forGood ? " for good" : " alone");
    }
};

// First, before this process has used the module.
TEST_P(FailedAllocation, NextGestureIsThatOfAFreshProcess) {
    const SmallGesture failed = GetParam().Gesture(1);
    const SmallGesture next = GetParam().Gesture(2);
    const Outcome fresh = InChild(1, [&](size_t) { return Replay(next, {}); })[0];
    EXPECT_EQ(fresh.pairs, kFrames - 1);
    const std::vector<Failure> failures = AllFailures();
    const std::vector<Outcome> outcomes = InChild(failures.size(), [&](size_t i) {
        const Outcome before = Replay(failed, failures[i]);
        Outcome outcome = Replay(next, {});
        outcome.failures = before.failures;
        return outcome;
    });
    for (size_t i = 0; i < failures.size(); ++i) {
        SCOPED_TRACE(Name(failures[i]));
        EXPECT_GE(outcomes[i].failures, 1);
        EXPECT_EQ(outcomes[i].results, fresh.results);
        EXPECT_EQ(outcomes[i].key, fresh.key);
        EXPECT_EQ(Own(outcomes[i]), Own(fresh));
    }
}

TEST_P(FailedAllocation, WithoutAnyEveryMethodIsReached) {
    const SmallGesture gesture = GetParam().Gesture(1);
    const Outcome outcome = InChild(1, [&](size_t) { return Replay(gesture, {}); })[0];
    EXPECT_EQ(outcome.results, (std::array<int32_t, kFrames>{0, 0, 0}));
    EXPECT_EQ(outcome.pairs, kFrames - 1);
    EXPECT_EQ(outcome.allocations, Allocations(GetParam()));
    EXPECT_EQ(outcome.frees, Allocations(GetParam()));
}

TEST_P(FailedAllocation, LeaksNothing) {
    ForEachOutcome([](const Failure&, const Outcome& outcome) {
        EXPECT_GE(outcome.failures, 1);
        EXPECT_EQ(outcome.live, 0);
        EXPECT_EQ(outcome.allocations, outcome.frees);
    });
}

TEST_P(FailedAllocation, FailsItsFrameAndTheRestOfTheGesture) {
    ForEachOutcome([](const Failure& failure, const Outcome& outcome) {
        const int32_t later = failure.number - kFirstAllocations - 1;
        const int32_t failing = later < 0 ? 0 : 1 + later / GetParam().laterAllocations;
        for (int32_t frame = 0; frame < kFrames; ++frame)
            EXPECT_EQ(outcome.results[static_cast<size_t>(frame)], frame < failing ? 0 : -1);
    });
}

TEST_P(FailedAllocation, AtMostOneAttemptFollows) {
    ForEachOutcome([](const Failure& failure, const Outcome& outcome) {
        EXPECT_LE(outcome.allocations + outcome.failures, failure.number + 1);
    });
}

// Module and model side by side, with a failing allocation numbered over the gesture.
void ReplayTwin(const Scenario& scenario, const SmallGesture& gesture, const Failure& failure) {
    Twin& twin = Twin::Get();
    twin.SetParam(&gesture.params);
    twin.Clear();
    int32_t before = 0;
    for (int32_t frame = 0; frame < kFrames; ++frame) {
        const int32_t own = frame == 0 ? kFirstAllocations : scenario.laterAllocations;
        if (failure.number > before && (failure.number <= before + own))
            twin.FailAllocation(failure.number - before, failure.forGood);
        else if (failure.number > 0 && failure.number <= before && failure.forGood)
            twin.FailAllocation(1, true);
        if (gesture.mode == Mode::DoubleScan)
            twin.Zones(0, ZoneRows(frame));
        twin.Block(gesture.frames[static_cast<size_t>(frame)], gesture.width);
        twin.Frame(0);
        before += own;
    }
    twin.Vote(1);
    twin.Clear();
}

TEST_P(FailedAllocation, GivesTheModelsResultsAndState) {
    SmallGesture gesture = GetParam().Gesture(1);
    for (const int32_t logs : {0, 1}) {
        host::ParamValue(gesture.params, "s_logShowFlag") = logs;
        for (const Failure& failure : AllFailures()) {
            ReplayTwin(GetParam(), gesture, failure);
            ASSERT_EQ(Twin::Get().Difference().value_or("none"), "none") << Name(failure);
        }
    }
}

TEST_P(FailedAllocation, PairsInTwoGesturesGiveTheModelsResults) {
    const SmallGesture first = GetParam().Gesture(1);
    const SmallGesture second = GetParam().Gesture(2);
    for (int32_t one = 1; one <= Allocations(GetParam()); ++one) {
        for (int32_t other = 1; other <= Allocations(GetParam()); ++other) {
            ReplayTwin(GetParam(), first, {one, false});
            ReplayTwin(GetParam(), second, {other, false});
            ASSERT_EQ(Twin::Get().Difference().value_or("none"), "none") << one << ", " << other;
        }
    }
}

INSTANTIATE_TEST_SUITE_P(EveryOne, FailedAllocation, ::testing::ValuesIn(kScenarios),
                         [](const auto& scenario) { return std::string(scenario.param.name); });

}  // namespace
}  // namespace fpnavi_test
