// The candidate search for templates and placements of every size that decides how it is done: the
// pieces of a template, the blocks of placements, the words of a row of them, and the ends of a
// key's fields.
#include <gtest/gtest.h>

#include <algorithm>

#include "StepFrames.h"
#include "StepTestPair.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

// Both frames full of finger, so that every template is placed; noise or ridges, moved.
PairBytes FullPair(SimRandom& random, FrameSize size) {
    PairBytes pair = RandomPair(random, size);
    pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
    return pair;
}

// Searches frames of size with borders of bound and a template of width x height.
void Search(SimRandom& random, FrameSize size, int32_t bound, FrameSize tplt, bool tiled) {
    host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    SetTiles(params, size, bound, random.Below(2));
    ParamValue(params, "s_multiBloclkFlag") = tiled ? 1 : 0;
    ParamValue(params, "s_templateWidth") = tplt.width;
    ParamValue(params, "s_templateHeight") = tplt.height;
    ParamValue(params, "s_candidateNum") = random.Range(1, 40);
    SetStepParams(params);
    LoadPair(FullPair(random, size));
    EXPECT_EQ(CompareCandidates(), 0);
    EXPECT_GT(PlacementCount(), 0);
    ASSERT_FALSE(::testing::Test::HasFailure())
        << size.width << " x " << size.height << ", border " << bound << ", template " << tplt.width
        << " x " << tplt.height << ", tiled " << tiled;
}

// A centre for rows x columns placements of a template that lies or stands.
void SearchAround(SimRandom& random, FrameSize tplt, int32_t more) {
    const int32_t longest = std::max(tplt.width, tplt.height);
    const int32_t centre = longest + more;
    Search(random, {centre + 4, centre + 4}, 2, tplt, false);
    // All eight templates: those of the border tiles need the border to hold them.
    if (longest <= 65)
        Search(random, {centre + 2 * longest, centre + 2 * longest}, longest, tplt, true);
}

TEST(StepTemplates, EverySizeUpTo20x20GivesTheSameArrays) {
    for (int32_t width = 1; width <= 20; ++width) {
        for (int32_t height = 1; height <= 20; ++height) {
            SimRandom random = StepRandom(321, width * 100 + height);
            Search(random, {56, 50}, 10, {width, height}, false);
            Search(random, {81, 79}, 20, {width, height}, true);
        }
    }
}

TEST(StepTemplates, SidesAtEveryEdgeGiveTheSameArrays) {
    for (const int32_t width : {1, 2, 15, 16, 17, 63, 64, 65, 127, 128, 129}) {
        for (const int32_t height : {1, 2, 15, 16, 17, 63, 64, 65, 127, 128, 129}) {
            SimRandom random = StepRandom(322, width * 1000 + height);
            SearchAround(random, {width, height}, 3);
        }
    }
}

// 64 pixels are one piece; 65 are two, or as many as they have groups of 16 columns.
TEST(StepTemplates, Of64And65PixelsGiveTheSameArrays) {
    constexpr FrameSize kTemplates[] = {{64, 1}, {32, 2}, {16, 4}, {8, 8},  {4, 16}, {2, 32},
                                        {1, 64}, {65, 1}, {13, 5}, {5, 13}, {1, 65}};
    for (const FrameSize tplt : kTemplates) {
        for (int32_t n = 0; n < 10; ++n) {
            SimRandom random = StepRandom(323, tplt.width * 100 + n);
            SearchAround(random, tplt, random.Range(0, 20));
        }
    }
}

TEST(StepTemplates, Of16And17ColumnsGiveTheSameArrays) {
    for (const FrameSize tplt : {FrameSize{16, 3}, {17, 3}, {16, 4}, {17, 4}, {16, 5}, {17, 5}}) {
        for (int32_t n = 0; n < 10; ++n) {
            SimRandom random = StepRandom(324, tplt.width * 100 + tplt.height * 10 + n);
            SearchAround(random, tplt, random.Range(0, 20));
        }
    }
}

TEST(StepTemplates, OfOneRowOrOneColumnGiveTheSameArrays) {
    for (int32_t side = 1; side <= 70; ++side) {
        SimRandom random = StepRandom(325, side);
        SearchAround(random, {side, 1}, 5);
        SearchAround(random, {1, side}, 5);
    }
}

TEST(StepTemplates, SquaresGiveTheSameArrays) {
    for (int32_t side = 1; side <= 40; ++side) {
        SimRandom random = StepRandom(326, side);
        SearchAround(random, {side, side}, 5);
    }
}

// As many rows and columns of placements as the centre has, for a template of one pixel.
TEST(StepPlacements, RowsAndColumnsAtEveryEdgeGiveTheSameArrays) {
    constexpr int32_t kCounts[] = {1,  2,  3,  4,  5,  15,  16,  17, 31,
                                   32, 33, 63, 64, 65, 127, 128, 129};
    for (const int32_t rows : kCounts) {
        for (const int32_t columns : kCounts) {
            SimRandom random = StepRandom(331, rows * 1000 + columns);
            Search(random, {columns + 4, rows + 4}, 2, {1, 1}, false);
            ASSERT_EQ(PlacementCount(), 4 * rows * columns);
        }
    }
}

// The same for a template of more than one piece.
TEST(StepPlacements, RowsAndColumnsOfTwoPiecesGiveTheSameArrays) {
    constexpr int32_t kCounts[] = {1, 2, 3, 4, 5, 15, 16, 17, 31, 32, 33};
    for (const int32_t rows : kCounts) {
        for (const int32_t columns : kCounts) {
            SimRandom random = StepRandom(332, rows * 1000 + columns);
            Search(random, {columns + 12, rows + 12}, 2, {9, 9}, false);
            ASSERT_EQ(PlacementCount(), 4 * rows * columns);
        }
    }
}

void SetSquareTemplate(FrameSize size) {
    SetStepParams(size, {{"s_boundWidth", 2},
                         {"s_boundHeight", 2},
                         {"s_centerWidth", size.width - 4},
                         {"s_centerHeight", size.height - 4},
                         {"s_multiBloclkFlag", 0},
                         {"s_templateWidth", 2},
                         {"s_templateHeight", 2},
                         {"s_candidateNum", 1}});
}

// Black against white but for four greys, which lie at (row, column) in the searched frame.
// Template 0 has them at row 2, in the middle columns.
void FindAt(FrameSize size, int32_t row, int32_t column) {
    SetSquareTemplate(size);
    std::vector<uint8_t> searched = FlatBytes(size, 0);
    std::vector<uint8_t> cut = FlatBytes(size, 255);
    const int32_t left = (size.width - 2) / 2;
    for (int32_t r = 0; r < 2; ++r) {
        for (int32_t c = 0; c < 2; ++c) {
            const auto grey = static_cast<uint8_t>(100 + 20 * r + 3 * c);
            cut[static_cast<size_t>((2 + r) * size.width + left + c)] = grey;
            searched[static_cast<size_t>((row + r) * size.width + column + c)] = grey;
        }
    }
    LoadPair({searched, FlatBytes(size, 1), cut, FlatBytes(size, 1)});
    EXPECT_EQ(CompareCandidates(), 0);
    const Candidates found = ModuleCandidates();
    EXPECT_EQ(found.di, std::vector<int32_t>{row - 2});
    EXPECT_EQ(found.dj, std::vector<int32_t>{column - left});
}

// The last placement lies at row 2 + centre - 2 and column 2 + centre - 2.
TEST(StepPlacements, LastRowAndColumnOfAKeyAreFound) {
    FindAt({259, 12}, 3, 255);
    FindAt({12, 259}, 255, 4);
    FindAt({259, 12}, 8, 255);
    FindAt({12, 259}, 255, 8);
    FindAt({259, 259}, 255, 255);
}

TEST(StepPlacements, LastOfABlockAndOfAWordAreFound) {
    for (const int32_t row : {2, 17, 18, 33, 34, 65, 66, 129, 130}) {
        for (const int32_t column : {2, 17, 18, 33, 34, 65, 66, 129, 130})
            FindAt({134, 134}, row, column);
    }
}

// Row or column 256 has no place in a key: both refuse the search.
TEST(StepPlacements, RowOrColumn256IsRefused) {
    for (const FrameSize size : {FrameSize{260, 12}, FrameSize{12, 260}}) {
        SetSquareTemplate(size);
        SimRandom random = StepRandom(341, size.width);
        LoadPair(FullPair(random, size));
        EXPECT_EQ(CompareCandidates(), -1);
    }
}

}  // namespace
}  // namespace fpnavi_test
