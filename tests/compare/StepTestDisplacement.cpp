// Scores of displacements where something changes: rows, bands and displacements either side of a
// step of sixteen and of a word, tiles without a gap, with one, and such that do not add up.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "frame/NaviFrame.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

// A displacement at, or one beside, an edge or the full side; of either sign.
int32_t EdgeDisplacement(SimRandom& random, int32_t side) {
    const int32_t edge = random.Chance(30) ? side + random.Range(-2, 1) : RandomEdge(random);
    const int32_t length = random.Chance(20) ? random.Range(0, 2) : std::min(edge, side + 1);
    return random.Chance(50) ? length : -length;
}

ParamBlock MatchParams(FrameSize size, int32_t boundWidth, int32_t boundHeight, int32_t gapWidth,
                       int32_t gapHeight, bool tiled) {
    ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    SetTiles(params, size, boundWidth, gapWidth);
    ParamValue(params, "s_boundHeight") = boundHeight;
    ParamValue(params, "s_centerHeight") = size.height - 2 * boundHeight;
    ParamValue(params, "s_gapHeight") = gapHeight;
    ParamValue(params, "s_multiBloclkFlag") = tiled ? 1 : 0;
    ParamValue(params, "s_overlapAreaMinFp") = 0;
    return params;
}

TEST(StepDisplacementScore, EdgesOfSizesBordersAndDisplacementsGiveTheSameScore) {
    const std::vector<FrameSize> sizes = EdgeSizes();
    const int64_t cases = StepCases(12 * static_cast<int64_t>(sizes.size()));
    CaseClasses meets("score", {"below_255", "255"});
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(431, i);
        const FrameSize size = sizes[static_cast<size_t>(i) % sizes.size()];
        const int32_t boundWidth = RandomLength(random, size.width / 2);
        const int32_t boundHeight = RandomLength(random, size.height / 2);
        const int32_t gapWidth = random.Chance(50) ? random.Below(2) : RandomLength(random, 70);
        const int32_t gapHeight = random.Chance(50) ? random.Below(2) : RandomLength(random, 70);
        const ParamBlock params =
            MatchParams(size, boundWidth, boundHeight, gapWidth, gapHeight, random.Chance(70));
        PairBytes pair = RandomPair(random, size);
        if (random.Chance(40))
            pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
        ASSERT_TRUE(LoadMatchPair(params, pair));
        const FrameSize compared = ComparedSize();
        for (int32_t n = 0; n < 10; ++n) {
            const int32_t di = EdgeDisplacement(random, compared.height);
            const int32_t dj = EdgeDisplacement(random, compared.width);
            const int32_t score = PlainScore(di, dj);
            meets.Note(score == 255 ? 1 : 0);
            ASSERT_EQ(ModuleScore(di, dj), score)
                << "case " << i << ", displacement " << di << ", " << dj;
        }
    }
    meets.ExpectAll();
}

// Without a gap the full image is the frame, whatever the borders.
TEST(StepDisplacementScore, TilesWithoutAGapAreTheFrame) {
    const int64_t cases = StepCases(2000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(432, i);
        const FrameSize size = RandomSize(random);
        const PairBytes pair = RandomPair(random, size);
        const int32_t boundWidth = RandomLength(random, size.width / 2);
        const int32_t boundHeight = RandomLength(random, size.height / 2);
        const int32_t di = random.Range(-size.height, size.height);
        const int32_t dj = random.Range(-size.width, size.width);
        ASSERT_TRUE(LoadMatchPair(MatchParams(size, boundWidth, boundHeight, 0, 0, false), pair));
        const int32_t frame = ModuleScore(di, dj);
        ASSERT_TRUE(LoadMatchPair(MatchParams(size, boundWidth, boundHeight, 0, 0, true), pair));
        ASSERT_EQ(ModuleScore(di, dj), frame) << "case " << i;
        ASSERT_EQ(PlainScore(di, dj), frame) << "case " << i;
    }
}

// A gap of one pixel in either axis, both or none: every displacement of small frames.
TEST(StepDisplacementScore, GapsOfNoneAndOneAtEveryDisplacement) {
    for (int32_t side = 3; side <= 12; ++side) {
        for (int32_t gaps = 0; gaps < 4; ++gaps) {
            SimRandom random = StepRandom(433, side * 4 + gaps);
            const FrameSize size = {side, 15 - side};
            const int32_t bound = random.Range(0, std::min(size.width, size.height) / 2);
            ASSERT_TRUE(LoadMatchPair(MatchParams(size, bound, bound, gaps & 1, gaps >> 1, true),
                                      RandomPair(random, size)));
            for (int32_t di = -size.height - 3; di <= size.height + 3; ++di) {
                for (int32_t dj = -size.width - 3; dj <= size.width + 3; ++dj)
                    ASSERT_EQ(ModuleScore(di, dj), PlainScore(di, dj))
                        << side << ", gaps " << gaps << ", displacement " << di << ", " << dj;
            }
        }
    }
}

// One row of three tiles, one pixel each, all different: 10, 20, 30 against themselves. With a gap
// of 1 pixel a displacement by 2 lets a tile meet the next one, and one by 1 lets none meet.
TEST(StepDisplacementScore, NeighbouringTilesMeetAGapFurther) {
    const FrameSize size = {3, 1};
    const PairBytes pair = {{10, 20, 30}, FlatBytes(size, 1), {10, 20, 30}, FlatBytes(size, 1)};
    ASSERT_TRUE(LoadMatchPair(MatchParams(size, 1, 0, 1, 0, true), pair));
    const int32_t expected[] = {0, 255, 10, 255, 20, 255};
    for (int32_t dj = 0; dj < 6; ++dj) {
        EXPECT_EQ(ModuleScore(0, dj), expected[dj]) << dj;
        EXPECT_EQ(ModuleScore(0, -dj), expected[dj]) << -dj;
        EXPECT_EQ(PlainScore(0, dj), expected[dj]) << dj;
    }
    ASSERT_TRUE(LoadMatchPair(MatchParams(size, 1, 0, 0, 0, true), pair));
    const int32_t together[] = {0, 10, 20, 255};
    for (int32_t dj = 0; dj < 4; ++dj)
        EXPECT_EQ(ModuleScore(0, dj), together[dj]) << dj;
}

// Tiles that do not make up the frame give no full image: the pair fails, and nothing meets.
TEST(StepDisplacementScore, TilesThatDoNotAddUpMeetNowhere) {
    for (const FrameSize size : {FrameSize{40, 30}, FrameSize{129, 17}, FrameSize{16, 65}}) {
        for (const int32_t wrong : {-2, -1, 1, 2}) {
            for (const char* const name : {"s_centerWidth", "s_centerHeight", "s_boundWidth"}) {
                ParamBlock params = MatchParams(size, 4, 4, 2, 2, true);
                ParamValue(params, name) += wrong;
                ParamValue(params, "s_templateWidth") = 3;
                ParamValue(params, "s_templateHeight") = 2;
                const std::vector<uint8_t> greys = FlatBytes(size, 9);
                ASSERT_FALSE(
                    LoadMatchPair(params, {greys, FlatBytes(size, 1), greys, FlatBytes(size, 1)}));
                EXPECT_EQ(ModuleScore(0, 0), 255) << name << wrong;
                EXPECT_EQ(ModuleScore(1, -1), 255) << name << wrong;
                const JointOutcome outcome = CalcJoint();
                EXPECT_EQ(outcome.module, -1) << name << wrong;
                EXPECT_EQ(outcome.plain, -1) << name << wrong;
                EXPECT_TRUE(SameState()) << name << wrong;
            }
        }
    }
}

// Black against a flat grey: the sum reaches its limit with the last pixel, or not at all, wherever
// the one pixel is that lacks a grey level.
TEST(StepDisplacementScoreTrap, EarlyStopIsExactAtTheLimit) {
    for (const FrameSize size : EdgeSizes()) {
        for (const bool tiled : {false, true}) {
            SimRandom random = StepRandom(434, size.width * 1000 + size.height);
            const int32_t bound = random.Range(0, 7);
            const int32_t grey = random.Range(1, 255);
            std::vector<uint8_t> greys = FlatBytes(size, static_cast<uint8_t>(grey));
            for (const bool oneLess : {false, true}) {
                if (oneLess)
                    --greys[static_cast<size_t>(random.Below(static_cast<int32_t>(greys.size())))];
                ASSERT_TRUE(LoadMatchPair(
                    MatchParams(size, bound, bound, 4, 3, tiled),
                    {FlatBytes(size, 0), FlatBytes(size, 1), greys, FlatBytes(size, 1)}));
                const int32_t score = oneLess ? grey - 1 : grey;
                ASSERT_EQ(ModuleScore(0, 0, score), score);
                if (score > 0) {
                    ASSERT_GT(ModuleScore(0, 0, score - 1), score - 1);
                }
                ASSERT_EQ(ModuleScore(0, 0), score);
            }
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
