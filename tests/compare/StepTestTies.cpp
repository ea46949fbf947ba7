// What decides between candidates that match equally well: their order in the heap. And candidates
// of which none is a placement.
#include <gtest/gtest.h>

#include <algorithm>
#include <set>
#include <utility>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "matching/PairMatch.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

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

// Widths of one word, two and three, and either side of their ends.
constexpr int32_t kWidths[] = {40, 56, 63, 64, 65, 127, 128, 129};

// Of displacements that match equally well the first in the heap's array is taken. The frames
// repeat a pattern, so that many do; a run without a tie that this order decides proves nothing and
// fails.
TEST(StepCalcImgJointTrap, TiesAreDecidedByTheHeapsOrder) {
    const int64_t cases = StepCases(1500);
    int32_t many = 0;  // ties of more displacements than are sought one by one
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
        many += ties.best.size() > 16 ? 1 : 0;
        decided += ties.byHeap != ties.byKey ? 1 : 0;
    }
    EXPECT_GT(many, 0);
    EXPECT_GT(decided, 0);
    RecordProperty("many", many);
    RecordProperty("decided", decided);
}

// No candidate has enough common area: all score 255, and the first in the array wins.
TEST(StepCalcImgJointTrap, FirstCandidateWinsWhenAllScore255) {
    for (const int32_t width : kWidths) {
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
    for (const int32_t width : kWidths) {
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

// CalcImgJoint of both on the current pair, the same records, and the first of the heap's best.
Ties CompareTies() {
    const JointOutcome outcome = CalcJoint();
    EXPECT_EQ(outcome.module, 0);
    EXPECT_TRUE(SameState());
    const Ties ties = FindTies();
    EXPECT_EQ(::PrintNaviLog()->dy_fp[0], ties.byHeap.first);
    EXPECT_EQ(::PrintNaviLog()->dx_fp[0], -ties.byHeap.second);
    return ties;
}

// A frame of one grey that is finger where template 0 lies alone, in a frame of the same grey:
// every placement matches, each at a displacement of its own. The first 16 are kept in a short
// list.
TEST(StepCalcImgJointTrap, EveryNumberOfTiesGivesTheFirstOfTheHeap) {
    const FrameSize size = {40, 30};
    std::vector<uint8_t> types = FlatBytes(size, 0);
    for (int32_t row = 8; row < 11; ++row) {
        for (int32_t column = 18; column < 22; ++column)
            types[static_cast<size_t>(row * size.width + column)] = 1;
    }
    for (int32_t num = 1; num <= 40; ++num) {
        SetStepParams(size, {{"s_boundWidth", 8},
                             {"s_boundHeight", 8},
                             {"s_centerWidth", 24},
                             {"s_centerHeight", 14},
                             {"s_templateWidth", 4},
                             {"s_templateHeight", 3},
                             {"s_multiBloclkFlag", 0},
                             {"s_overlapAreaMinFp", 0},
                             {"s_dimensionlessFlag", 0},
                             {"s_candidateNum", num}});
        LoadPair({FlatBytes(size, 70), FlatBytes(size, 1), FlatBytes(size, 70), types});
        const Ties ties = CompareTies();
        ASSERT_EQ(static_cast<int32_t>(ties.best.size()), num);
        ASSERT_EQ(::PrintNaviLog()->diff[0], 0);
        ASSERT_FALSE(::testing::Test::HasFailure()) << num << " candidates";
    }
}

// Flat frames full of finger: all templates propose, many of them the same displacements, and all
// displacements match.
TEST(StepCalcImgJointTrap, TiesOfAllTemplatesGiveTheFirstOfTheHeap) {
    for (int32_t num = 1; num <= 60; ++num) {
        for (const int32_t tiled : {0, 1}) {
            const FrameSize size = {40, 30};
            SetStepParams(size, {{"s_templateWidth", 4},
                                 {"s_templateHeight", 3},
                                 {"s_multiBloclkFlag", tiled},
                                 {"s_overlapAreaMinFp", 0},
                                 {"s_dimensionlessFlag", 0},
                                 {"s_candidateNum", num}});
            LoadPair(
                {FlatBytes(size, 70), FlatBytes(size, 1), FlatBytes(size, 70), FlatBytes(size, 1)});
            CompareTies();
            ASSERT_FALSE(::testing::Test::HasFailure()) << num << " candidates";
        }
    }
}

// Periodic frames of every edge in one axis.
TEST(StepCalcImgJointTrap, TiesAtEveryEdgeGiveTheFirstOfTheHeap) {
    const int64_t cases = StepCases(1200);
    CaseClasses tied("tied", {"1", "2_to_16", "more"});
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(514, i);
        FrameSize size = {random.Range(20, 40), RandomEdge(random)};
        if (random.Chance(50))
            size = {size.height, size.width};
        const int32_t bound = random.Range(0, 5);
        SetStepParams(size, {{"s_boundWidth", bound},
                             {"s_boundHeight", bound},
                             {"s_centerWidth", size.width - 2 * bound},
                             {"s_centerHeight", size.height - 2 * bound},
                             {"s_gapWidth", random.Below(3)},
                             {"s_gapHeight", random.Below(3)},
                             {"s_templateWidth", random.Range(1, 6)},
                             {"s_templateHeight", bound},
                             {"s_multiBloclkFlag", random.Below(2)},
                             {"s_overlapAreaMinFp", random.Range(-1, 60)},
                             {"s_dimensionlessFlag", 0},
                             {"s_candidateNum", random.Range(1, 60)}});
        const Pattern pattern = RandomPattern(random);
        LoadPair({RepeatPattern(pattern, size, 0, 0), FlatBytes(size, 1),
                  RepeatPattern(pattern, size, random.Below(9), 1), FlatBytes(size, 1)});
        if (PlainCandidates().result != 0)
            continue;
        const Ties ties = CompareTies();
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        tied.Note(ties.best.size() < 2 ? 0 : (ties.best.size() <= 16 ? 1 : 2));
    }
    tied.ExpectAll();
}

}  // namespace
}  // namespace fpnavi_test
