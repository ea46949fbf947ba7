// Template matching as a whole against the plain model: the record's entries, the full images, the
// failures, and what decides between candidates that match equally well.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <utility>
#include <vector>

#include "FailingMalloc.h"
#include "StepFrames.h"
#include "StepTestPair.h"
#include "matching/CandidateSearch.h"
#include "matching/PairMatch.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

// Runs CalcImgJoint of both on the pair that draw(random, size) loads, case by case.
template <typename DrawPair>
void CompareJoints(uint64_t test, int64_t cases, DrawPair draw) {
    int64_t joined = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        SetStepParams(params);
        draw(random, SizeOf(params));
        const JointOutcome outcome = CalcJoint();
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        ASSERT_EQ(outcome.module, outcome.plain) << "case " << i;
        ASSERT_TRUE(SameState()) << "case " << i;
        if (outcome.module == 0)
            ++joined;
    }
    EXPECT_GT(joined, cases / 3) << "most parameters allowed no search";
    EXPECT_LT(joined, cases) << "nothing failed";
}

TEST(StepCalcImgJoint, RandomClassMapsGiveTheSameRecord) {
    CompareJoints(501, StepCases(6000),
                  [](SimRandom& random, FrameSize size) { LoadPair(RandomPair(random, size)); });
}

TEST(StepCalcImgJoint, PreProcessedFramesGiveTheSameRecord) {
    CompareJoints(502, StepCases(5000), [](SimRandom& random, FrameSize size) {
        LoadPreProcessed(RandomPair(random, size));
    });
}

TEST(StepCalcImgJoint, PeriodicFramesGiveTheSameRecord) {
    CompareJoints(503, StepCases(5000), [](SimRandom& random, FrameSize size) {
        const Pattern pattern = RandomPattern(random);
        const int32_t column = random.Below(9);
        const int32_t row = random.Below(9);
        LoadPair({RepeatPattern(pattern, size, 0, 0), RandomTypes(random, size),
                  RepeatPattern(pattern, size, column, row), RandomTypes(random, size)});
    });
}

// The device's own geometry, and the same without gaps and in one block.
TEST(StepCalcImgJoint, DefaultGeometryGivesTheSameRecord) {
    const int64_t cases = StepCases(2500);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(504, i);
        host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, random.Chance(30));
        ParamValue(params, "s_multiBloclkFlag") = random.Chance(70) ? 1 : 0;
        SetStepParams(params);
        LoadPreProcessed(RandomPair(random, SizeOf(params)));
        const JointOutcome outcome = CalcJoint();
        ASSERT_EQ(outcome.module, 0);
        ASSERT_EQ(outcome.plain, 0);
        ASSERT_TRUE(SameState()) << "case " << i;
    }
}

// One allocation fails, alone or with all that follow: the same failures, the same frames left.
TEST(StepCalcImgJoint, FailedAllocationsLeaveTheSameState) {
    const int64_t cases = StepCases(4000);
    int64_t failures = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(505, i);
        SetStepParams(RandomSearchParams(random, {random.Range(20, 70), random.Range(20, 66)}));
        LoadPair(RandomPair(random, {fpnavi::s_imageWidth, fpnavi::s_imageHeight}));
        const int32_t number = random.Range(1, 9);
        const bool forGood = random.Chance(50);
        if (forGood)
            FailingMalloc::FailFrom(number);
        else
            FailingMalloc::FailNth(number);
        const int32_t module = fpnavi::CalcImgJoint();
        FailingMalloc::Off();
        reference::s_allocationCount = 1;
        reference::s_failAllocation = forGood ? -1 : number;
        reference::s_failAllocationsFrom = forGood ? number : -1;
        const int32_t plain = reference::CalcImgJoint();
        reference::s_failAllocation = -1;
        reference::s_failAllocationsFrom = -1;
        failures += module != 0 ? 1 : 0;
        ASSERT_EQ(module, plain) << "case " << i << ", allocation " << number;
        ASSERT_TRUE(SameState()) << "case " << i << ", allocation " << number;
    }
    EXPECT_GT(failures, 0);
}

using Move = std::pair<int32_t, int32_t>;  // rows, columns

// What the candidates of the current pair score, and what the plain model would take.
struct Ties {
    std::set<Move> best;  // different displacements with the best score
    Move byHeap;          // the first of them in the heap's array
    Move byKey;           // the first of them by key: what a search without the heap would take
};

Ties FindTies() {
    const Candidates candidates = PlainCandidates();
    EXPECT_EQ(candidates.result, 0);
    const std::vector<uint32_t> keys = ModuleKeys();
    EXPECT_EQ(keys.size(), candidates.di.size());
    Ties ties;
    int32_t least = 256;
    uint32_t leastKey = 0;
    std::set<std::pair<Move, int32_t>> known;
    for (size_t n = 0; n < keys.size(); ++n) {
        const Move move = {candidates.di[n], candidates.dj[n]};
        const int32_t score = PlainScore(move.first, move.second);
        if (score < least) {
            ties.best.clear();
            ties.byHeap = move;
        }
        if (score < least || (score == least && keys[n] < leastKey)) {
            ties.byKey = move;
            leastKey = keys[n];
        }
        least = std::min(least, score);
        if (score == least)
            ties.best.insert(move);
    }
    return ties;
}

// Of displacements that match equally well the first in the heap's array is taken. The frames
// repeat a pattern, so that many do; a run without a tie that this order decides proves nothing and
// fails.
TEST(StepCalcImgJointTrap, TiesAreDecidedByTheHeapsOrder) {
    const int64_t cases = StepCases(1500);
    int32_t tied = 0;
    int32_t decided = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(511, i);
        host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, random.Chance(30));
        ParamValue(params, "s_multiBloclkFlag") = random.Chance(60) ? 1 : 0;
        ParamValue(params, "s_candidateNum") = random.Range(20, 120);
        ParamValue(params, "s_dimensionlessFlag") = 0;
        SetStepParams(params);
        const FrameSize size = SizeOf(params);
        const Pattern pattern = RandomPattern(random);
        const int32_t column = random.Below(9);
        const int32_t row = random.Below(9);
        LoadPair({RepeatPattern(pattern, size, 0, 0), FlatBytes(size, 1),
                  RepeatPattern(pattern, size, column, row), FlatBytes(size, 1)});
        const JointOutcome outcome = CalcJoint();
        ASSERT_EQ(outcome.module, 0);
        ASSERT_TRUE(SameState()) << "case " << i;
        const Ties ties = FindTies();
        // Equal coverage: the templates are the current frame's, and rows count upwards.
        ASSERT_EQ(::PrintNaviLog()->dy_fp[0], ties.byHeap.first) << "case " << i;
        ASSERT_EQ(::PrintNaviLog()->dx_fp[0], -ties.byHeap.second) << "case " << i;
        tied += ties.best.size() > 1 ? 1 : 0;
        decided += ties.byHeap != ties.byKey ? 1 : 0;
    }
    EXPECT_GT(tied, 0);
    EXPECT_GT(decided, 0);
    RecordProperty("tied", tied);
    RecordProperty("decided", decided);
}

// No candidate has enough common area: all score 255, and the first in the array wins.
TEST(StepCalcImgJointTrap, FirstCandidateWinsWhenAllScore255) {
    for (const int32_t width : {56, 66}) {
        for (const int32_t multi : {0, 1}) {
            const FrameSize size = {width, 36};
            SetStepParams(size, {{"s_overlapAreaMinFp", static_cast<int32_t>(size.Pixels())},
                                 {"s_multiBloclkFlag", multi},
                                 {"s_dimensionlessFlag", 0},
                                 {"s_candidateNum", 30},
                                 {"s_diffThresholdStr", 255},
                                 {"s_boundWidth", 8},
                                 {"s_boundHeight", 8},
                                 {"s_centerWidth", width - 16},
                                 {"s_centerHeight", 20}});
            SimRandom random = StepRandom(512, width);
            PairBytes pair = RandomPair(random, size);
            pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
            LoadPair(pair);
            const JointOutcome outcome = CalcJoint();
            ASSERT_EQ(outcome.module, 0);
            ASSERT_TRUE(SameState());
            const Candidates candidates = PlainCandidates();
            EXPECT_EQ(::PrintNaviLog()->diff[0], 255);
            EXPECT_EQ(::PrintNaviLog()->dy_fp[0], candidates.di[0]);
            EXPECT_EQ(::PrintNaviLog()->dx_fp[0], -candidates.dj[0]);
        }
    }
}

// Black against white with templates of the current frame: no placement is better than a sentinel,
// so that all candidates are the sentinels' displacement.
TEST(StepCalcImgJointTrap, SentinelsAloneGiveTheSentinelsDisplacement) {
    for (const int32_t width : {56, 66}) {
        const FrameSize size = {width, 36};
        SetStepParams(size, {{"s_overlapAreaMinFp", 0},
                             {"s_dimensionlessFlag", 0},
                             {"s_templateWidth", 12},
                             {"s_templateHeight", 5}});
        LoadPair(
            {FlatBytes(size, 0), FlatBytes(size, 1), FlatBytes(size, 255), FlatBytes(size, 1)});
        const JointOutcome outcome = CalcJoint();
        ASSERT_EQ(outcome.module, 0);
        ASSERT_TRUE(SameState());
        // Row 0, column 0 against template 0 at row 8 and column (width - 12) / 2.
        EXPECT_EQ(::PrintNaviLog()->dy_fp[0], -8);
        EXPECT_EQ(::PrintNaviLog()->dx_fp[0], (width - 12) / 2);
        EXPECT_EQ(::PrintNaviLog()->diff[0], 255);
    }
}

// The list is longer than all placements together: sentinels stay in it and take part in the match.
TEST(StepCalcImgJointTrap, ListsLongerThanThePlacementsGiveTheSame) {
    const int64_t cases = StepCases(1000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(513, i);
        const FrameSize size = {random.Range(12, 66), random.Range(12, 16)};
        SetStepParams(size, {{"s_boundWidth", 4},
                             {"s_boundHeight", 4},
                             {"s_centerWidth", size.width - 8},
                             {"s_centerHeight", size.height - 8},
                             {"s_templateWidth", 4},
                             {"s_templateHeight", 3},
                             {"s_overlapAreaMinFp", random.Range(-1, 30)},
                             {"s_candidateNum", random.Range(60, 900)}});
        PairBytes pair = RandomPair(random, size);
        pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
        LoadPair(pair);
        const JointOutcome outcome = CalcJoint();
        ASSERT_EQ(outcome.module, 0);
        ASSERT_EQ(outcome.plain, 0);
        ASSERT_TRUE(SameState()) << "case " << i;
    }
}

}  // namespace
}  // namespace fpnavi_test
