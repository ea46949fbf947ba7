// Which placements become candidates: the smallest keys, so that of equally good ones the first by
// row, column and template are taken; sentinels where there are too few.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;
using Moves = std::vector<std::pair<int32_t, int32_t>>;  // rows, columns

Moves MovesOf(const Candidates& candidates) {
    Moves moves;
    for (size_t n = 0; n < candidates.di.size(); ++n)
        moves.emplace_back(candidates.di[n], candidates.dj[n]);
    return moves;
}

Moves Sorted(Moves moves) {
    std::sort(moves.begin(), moves.end());
    return moves;
}

// A frame of 12 x 10 with borders of 2, templates of 2 x 1: the four of the centre lie at (2, 5),
// (7, 5), (4, 9) and (4, 2). The wide ones have 6 rows of 7 placements, the tall ones 5 rows of 8;
// all start at row 2, column 2.
constexpr FrameSize kSize = {12, 10};
constexpr int32_t kPlacements = 2 * 6 * 7 + 2 * 5 * 8;

void SetSearch(int32_t num) {
    SetStepParams(kSize, {{"s_boundWidth", 2},
                          {"s_boundHeight", 2},
                          {"s_centerWidth", 8},
                          {"s_centerHeight", 6},
                          {"s_gapWidth", 0},
                          {"s_gapHeight", 0},
                          {"s_multiBloclkFlag", 0},
                          {"s_templateWidth", 2},
                          {"s_templateHeight", 1},
                          {"s_overlapAreaMinFp", 0},
                          {"s_candidateNum", num}});
}

void LoadFull(const std::vector<uint8_t>& prev, const std::vector<uint8_t>& curr) {
    LoadPair({prev, FlatBytes(kSize, 1), curr, FlatBytes(kSize, 1)});
}

// Calls visit(row, column, template) for the placements of all four templates in the order of their
// keys.
template <typename Visit>
void ForEachPlacement(Visit visit) {
    for (int32_t row = 2; row < 8; ++row) {
        for (int32_t column = 2; column < 10; ++column) {
            for (size_t k = 0; k < 4; ++k) {
                if (k < 2 ? column < 9 : row < 7)
                    visit(row, column, k);
            }
        }
    }
}

// Their displacements.
Moves AllByKey() {
    constexpr int32_t kRow[] = {2, 7, 4, 4};
    constexpr int32_t kColumn[] = {5, 5, 9, 2};
    Moves moves;
    ForEachPlacement([&](int32_t row, int32_t column, size_t k) {
        moves.emplace_back(row - kRow[k], column - kColumn[k]);
    });
    return moves;
}

// The first of expected, then sentinels: row 0, column 0 against template 0.
void ExpectSelected(const Moves& expected, int32_t num) {
    Moves first(
        expected.begin(),
        expected.begin() + std::min<ptrdiff_t>(num, static_cast<ptrdiff_t>(expected.size())));
    first.resize(static_cast<size_t>(num), {-2, -5});
    EXPECT_EQ(CompareCandidates(), 0);
    EXPECT_EQ(Sorted(MovesOf(ModuleCandidates())), Sorted(first)) << num;
    EXPECT_EQ(Sorted(MovesOf(SelectedCandidates())), Sorted(first)) << num;
}

// All placements differ by nothing: every number wanted is a cut through ties, but for as many as
// there are, one less and one more.
TEST(StepSelection, EveryNumberOfTiesTakesTheFirstByRowColumnAndTemplate) {
    const Moves all = AllByKey();
    ASSERT_EQ(static_cast<int32_t>(all.size()), kPlacements);
    for (int32_t num = 1; num <= kPlacements + 3; ++num) {
        SetSearch(num);
        LoadFull(FlatBytes(kSize, 80), FlatBytes(kSize, 80));
        ASSERT_EQ(PlacementCount(), kPlacements);
        ExpectSelected(all, num);
        EXPECT_EQ(MovesOf(SelectedCandidates()).front(), all.front());
        ASSERT_FALSE(::testing::Test::HasFailure());
    }
}

// Grey 84 in the right half of the previous frame: placements there differ by 4, those across the
// border by 2. The better ones are kept with all ties that are wanted, one less, and one more.
TEST(StepSelection, BetterPlacementsComeBeforeTheFirstTies) {
    std::vector<uint8_t> prev = FlatBytes(kSize, 80);
    for (size_t p = 0; p < prev.size(); ++p)
        prev[p] = p % 12 >= 6 ? 84 : 80;
    const Moves all = AllByKey();
    std::vector<std::pair<int32_t, size_t>> ranked;  // difference, place in all
    size_t at = 0;
    ForEachPlacement([&](int32_t /*row*/, int32_t column, size_t k) {
        const int32_t across = k < 2 && column == 5 ? 2 : (column >= 6 ? 4 : 0);
        ranked.emplace_back(across, at++);
    });
    std::sort(ranked.begin(), ranked.end());
    Moves expected;
    for (const auto& [difference, place] : ranked)
        expected.push_back(all[place]);
    for (int32_t num = 1; num <= kPlacements + 1; ++num) {
        SetSearch(num);
        LoadFull(prev, FlatBytes(kSize, 80));
        ExpectSelected(expected, num);
        ASSERT_FALSE(::testing::Test::HasFailure());
    }
}

// Random frames of few levels: the same set as the plain model's list, one of the best first.
TEST(StepSelection, RandomFramesGiveTheSameSet) {
    const int64_t cases = StepCases(6000);
    CaseClasses ties("last_kept", {"none_dropped", "ties_dropped"});
    CaseClasses fewer("placements", {"enough", "fewer_than_candidates"});
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(351, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        SetStepParams(params);
        LoadPair(RandomPair(random, SizeOf(params)));
        const Candidates plain = PlainCandidates();
        if (plain.result != 0)
            continue;
        const Candidates selected = SelectedCandidates();
        ASSERT_EQ(Sorted(MovesOf(selected)), Sorted(MovesOf(plain))) << "case " << i;
        const std::vector<uint32_t> keys = ModuleKeys();
        const size_t worst =
            static_cast<size_t>(std::max_element(keys.begin(), keys.end()) - keys.begin());
        fewer.Note(keys[worst] >> 24 == 255 ? 1 : 0);
        fpnavi::s_candidateNum += 1;
        ties.Note((ModuleKeys().front() >> 24) == keys[worst] >> 24 && keys[worst] >> 24 < 255 ? 1
                                                                                               : 0);
        fpnavi::s_candidateNum -= 1;
    }
    ties.ExpectAll();
    fewer.ExpectAll();
}

// Equal noise twice: each of the eight templates finds its own place, and proposes no displacement.
TEST(StepSelection, EveryTemplateProposesTheSameDisplacement) {
    const FrameSize size = {56, 48};
    SetStepParams(size, {{"s_candidateNum", 8},
                         {"s_overlapAreaMinFp", 0},
                         {"s_dimensionlessFlag", 0},
                         {"s_boundWidth", 12},
                         {"s_boundHeight", 12},
                         {"s_centerWidth", 32},
                         {"s_centerHeight", 24},
                         {"s_templateWidth", 8},
                         {"s_templateHeight", 5}});
    SimRandom random = StepRandom(352, 0);
    std::vector<uint8_t> noise = FlatBytes(size, 0);
    for (uint8_t& grey : noise)
        grey = static_cast<uint8_t>(random.Below(256));
    LoadPair({noise, FlatBytes(size, 1), noise, FlatBytes(size, 1)});
    EXPECT_EQ(CompareCandidates(), 0);
    // Templates 4 to 7 lie in the border, where nothing is placed: four of eight.
    const Moves moves = MovesOf(SelectedCandidates());
    EXPECT_EQ(std::count(moves.begin(), moves.end(), std::make_pair(0, 0)), 4);
    const JointOutcome outcome = CalcJoint();
    EXPECT_EQ(outcome.module, 0);
    EXPECT_TRUE(SameState());
    EXPECT_EQ(::PrintNaviLog()->dx_fp[0], 0);
    EXPECT_EQ(::PrintNaviLog()->dy_fp[0], 0);
    EXPECT_EQ(::PrintNaviLog()->diff[0], 0);
}

// Both frames full of finger, black against white: every placement differs by 255, and the list
// keeps its sentinels, which stand for row 0, column 0 of template 0.
TEST(StepSelection, DifferenceOf255NeverReplacesASentinel) {
    for (const int32_t width : kEdges) {
        if (width < 21)
            continue;
        const FrameSize size = {width, 36};
        for (const int32_t brightest : {255, 254}) {
            SetStepParams(size, {{"s_boundWidth", 8},
                                 {"s_boundHeight", 8},
                                 {"s_centerWidth", width - 16},
                                 {"s_centerHeight", 20},
                                 {"s_templateWidth", 4},
                                 {"s_templateHeight", 4},
                                 {"s_candidateNum", 9}});
            LoadPair({FlatBytes(size, 0), FlatBytes(size, 1),
                      FlatBytes(size, static_cast<uint8_t>(brightest)), FlatBytes(size, 1)});
            EXPECT_EQ(CompareCandidates(), 0);
            for (const Moves& moves :
                 {MovesOf(ModuleCandidates()), MovesOf(SelectedCandidates())}) {
                // Template 0 lies at row 8 (the border) and column (width - 4) / 2 of the frame.
                const Moves sentinels(9, {-8, -(width - 4) / 2});
                EXPECT_EQ(moves == sentinels, brightest == 255) << width;
            }
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
