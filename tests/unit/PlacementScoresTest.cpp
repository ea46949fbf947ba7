// The tables of a search against the mean grey difference of each placement, pixel by pixel.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <random>
#include <vector>

#include "Fixtures.h"
#include "frame/FramePair.h"
#include "matching/PlacementScores.h"
#include "matching/Templates.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

// A frame of width x height in tiles, searched with templates of tpltWidth x tpltHeight.
SearchParams ParamsOf(int32_t width, int32_t height, int32_t bound, int32_t tpltWidth,
                      int32_t tpltHeight, bool tiled) {
    SearchParams params = {};
    params.imageWidth = width;
    params.imageHeight = height;
    params.boundWidth = params.boundHeight = bound;
    params.centerWidth = width - 2 * bound;
    params.centerHeight = height - 2 * bound;
    params.tiled = tiled;
    params.tpltNum = tiled ? 8 : 4;
    params.tpltWidthUD = params.tpltHeightLR = tpltWidth;
    params.tpltHeightUD = params.tpltWidthLR = tpltHeight;
    params.tpltSize = tpltWidth * tpltHeight;
    params.candidateNum = 5;
    return params;
}

int32_t PlainMean(TestFrame& cut, TestFrame& searched, const Template& tplt, int32_t i, int32_t j) {
    int64_t sum = 0;
    for (int32_t r = 0; r < tplt.height; ++r) {
        for (int32_t c = 0; c < tplt.width; ++c)
            sum += std::abs(cut.Grey(tplt.i0 + r, tplt.j0 + c) - searched.Grey(i + r, j + c));
    }
    return static_cast<int32_t>(sum / (tplt.width * tplt.height));
}

// Noise, or what makes the largest sums: black against white.
struct Frames {
    TestFrame cut;
    TestFrame searched;

    Frames(int32_t width, int32_t height, bool noise)
        : cut(width, height, 255, 1), searched(width, height, 0, 1) {
        for (int32_t row = 0; noise && row < height; ++row) {
            for (int32_t column = 0; column < width; ++column) {
                cut.Grey(row, column) = NoiseAt(row, column, 3);
                searched.Grey(row, column) = NoiseAt(row, column, 4);
            }
        }
    }
};

// The table of template k: where it starts, its sides, and every mean.
void CompareTable(Frames& frames, const SearchParams& params, const Template& tplt,
                  const PlacementTable& table) {
    ASSERT_EQ(table.iFirst, params.boundHeight);
    ASSERT_EQ(table.jFirst, params.boundWidth);
    ASSERT_EQ(table.rows, params.centerHeight - tplt.height + 1);
    ASSERT_EQ(table.columns, params.centerWidth - tplt.width + 1);
    const uint8_t* diff = table.diff;
    for (int32_t row = 0; row < table.rows; ++row) {
        for (int32_t column = 0; column < table.columns; ++column)
            ASSERT_EQ(*diff++, PlainMean(frames.cut, frames.searched, tplt, table.iFirst + row,
                                         table.jFirst + column))
                << "placement " << row << ", " << column;
    }
}

// All templates are finger; the memory of the search ends with its block.
void CompareScores(const SearchParams& params, bool noise) {
    Frames frames(params.imageWidth, params.imageHeight, noise);
    const FramePair pair = {LayOut(*frames.searched.Get()), LayOut(*frames.cut.Get()), false};
    TemplateSet set;
    ASSERT_TRUE(CutTemplates(params, pair, &set));
    const SearchMemory plan = PlanMemory(params, set, nullptr);
    EXPECT_EQ(plan.keys, nullptr);
    EXPECT_EQ(plan.scores, nullptr);
    std::vector<uint8_t> block(plan.bytes, 0x5A);
    const SearchMemory memory = PlanMemory(params, set, block.data());
    EXPECT_EQ(memory.bytes, plan.bytes);
    const PlacementTables tables = ScorePlacements(params, set, pair, memory);
    int32_t count = 0;
    ASSERT_EQ(tables.count, params.tpltNum);
    for (int32_t k = 0; k < params.tpltNum; ++k) {
        EXPECT_EQ(tables.of[k].k, k);
        CompareTable(frames, params, set.tplts[k], tables.of[k]);
        ASSERT_FALSE(::testing::Test::HasFailure()) << "template " << k;
        EXPECT_EQ(tables.of[k].diff, tables.of[0].diff + count) << "tables follow each other";
        count += tables.of[k].rows * tables.of[k].columns;
    }
    EXPECT_EQ(tables.placements, count);
}

TEST(ScorePlacements, EveryTemplateSizeGivesTheMeans) {
    for (int32_t width = 1; width <= 20; ++width) {
        for (int32_t height = 1; height <= 20; ++height) {
            CompareScores(ParamsOf(64, 62, 20, width, height, true), true);
            ASSERT_FALSE(HasFailure()) << width << " x " << height;
        }
    }
}

// Pieces of every width, cut off at every row.
TEST(ScorePlacements, LongTemplatesGiveTheMeans) {
    for (int32_t width = 1; width <= 17; ++width) {
        for (const int32_t height : {21, 31, 32, 33, 63, 64, 65, 70}) {
            CompareScores(ParamsOf(height + 6, height + 5, 2, width, height, false), true);
            ASSERT_FALSE(HasFailure()) << width << " x " << height;
        }
    }
}

// Placements from one to more than two blocks in either axis.
TEST(ScorePlacements, EveryNumberOfPlacementsGivesTheMeans) {
    for (const int32_t more : {0, 1, 2, 3, 14, 15, 16, 17, 30, 31, 32, 33}) {
        for (const int32_t other : {0, 1, 2, 3, 14, 15, 16, 17, 30, 31, 32, 33}) {
            CompareScores(ParamsOf(12 + 4 + more, 12 + 4 + other, 2, 12, 5, false), true);
            CompareScores(ParamsOf(13 + 4 + more, 13 + 4 + other, 2, 13, 5, false), true);
            ASSERT_FALSE(HasFailure()) << more << ", " << other;
        }
    }
}

TEST(ScorePlacements, LargestSumsGive255) {
    for (const int32_t side : {1, 4, 8, 9, 64, 200}) {
        CompareScores(ParamsOf(side + 6, side + 5, 2, side, side, false), false);
        ASSERT_FALSE(HasFailure()) << side;
    }
}

// Bytes from the start of the block to a part of the memory.
ptrdiff_t At(const void* part, const std::vector<uint8_t>& block) {
    return static_cast<const uint8_t*>(part) - block.data();
}

// The parts follow each other, each in steps of 16 bytes.
void ExpectPlan(const SearchParams& params, uint8_t type, int32_t placements) {
    TestFrame frame(params.imageWidth, params.imageHeight, 9, type);
    const FramePair pair = {LayOut(*frame.Get()), LayOut(*frame.Get()), false};
    TemplateSet set;
    ASSERT_TRUE(CutTemplates(params, pair, &set));
    std::vector<uint8_t> block(PlanMemory(params, set, nullptr).bytes);
    const SearchMemory memory = PlanMemory(params, set, block.data());
    ptrdiff_t at = 0;
    EXPECT_EQ(At(memory.keys, block), at);
    at += (4 * params.candidateNum + 15) / 16 * 16;
    EXPECT_EQ(At(memory.strips, block), at);
    at += 16 * (15 * 16 + 2 * 64);  // sixteen strips of a block
    EXPECT_EQ(At(memory.sums, block), at);
    at += 4 * 16 * 16 * 4;  // of four templates at 16 x 16 placements
    EXPECT_EQ(At(memory.slots, block), at);
    at += kMeetingSlots * static_cast<ptrdiff_t>(sizeof(MeetingSlot));
    EXPECT_EQ(At(memory.scores, block), at);
    at += (placements + 16 + 15) / 16 * 16;
    EXPECT_EQ(static_cast<ptrdiff_t>(block.size()), at);
}

TEST(PlanMemory, TakesWhatASearchNeeds) {
    ExpectPlan(ParamsOf(40, 30, 8, 12, 5, true), 0, 0);
    // 13 * 10 placements of the wide templates, 20 * 3 of the tall.
    ExpectPlan(ParamsOf(40, 30, 8, 12, 5, true), 1, 4 * (13 * 10 + 20 * 3));
    ExpectPlan(ParamsOf(24, 19, 0, 17, 5, false), 1, 2 * (8 * 15 + 20 * 3));
    ExpectPlan(ParamsOf(19, 18, 0, 5, 17, false), 1, 2 * (15 * 2 + 3 * 14));
    // One template at 17 placements: one more than two steps hold with the 16 bytes behind them.
    SearchParams params = ParamsOf(28, 5, 0, 12, 5, false);
    params.tpltNum = 1;
    ExpectPlan(params, 1, 17);
}

// Without finger no template is valid.
TEST(ScorePlacements, TemplatesOutsideTheFingerAreNotPlaced) {
    const SearchParams params = ParamsOf(40, 30, 8, 12, 5, true);
    TestFrame frame(40, 30, 9, 0);
    TestFrame finger(40, 30, 9, 1);
    const FramePair pair = {LayOut(*finger.Get()), LayOut(*frame.Get()), false};
    TemplateSet set;
    ASSERT_TRUE(CutTemplates(params, pair, &set));
    std::vector<uint8_t> block(PlanMemory(params, set, nullptr).bytes);
    const PlacementTables tables =
        ScorePlacements(params, set, pair, PlanMemory(params, set, block.data()));
    EXPECT_EQ(tables.count, 0);
    EXPECT_EQ(tables.placements, 0);
}

// 4096 x 4095 pixels, of which one lacks a grey level for a mean of 255: the remainder is as large
// as it gets, and so is what the reciprocal is rounded up by.
TEST(ScorePlacements, LargestTemplateIsDividedExactly) {
    SearchParams params = ParamsOf(4096, 4095, 0, 4096, 4095, false);
    params.tpltNum = 1;
    TestFrame cut(4096, 4095, 255, 1);
    TestFrame searched(4096, 4095, 0, 1);
    const FramePair pair = {LayOut(*searched.Get()), LayOut(*cut.Get()), false};
    TemplateSet set;
    ASSERT_TRUE(CutTemplates(params, pair, &set));
    std::vector<uint8_t> block(PlanMemory(params, set, nullptr).bytes);
    const SearchMemory memory = PlanMemory(params, set, block.data());
    const PlacementTables tables = ScorePlacements(params, set, pair, memory);
    ASSERT_EQ(tables.placements, 1);
    EXPECT_EQ(tables.of[0].diff[0], 255);
    searched.Grey(4094, 4095) = 1;
    EXPECT_EQ(ScorePlacements(params, set, pair, memory).of[0].diff[0], 254);
}

}  // namespace
