// The estimate of a pair's work at its limit of 2^28 comparisons: one method at a time takes it up
// whole, and one step more of any size that enters is too much.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "param/NaviLimits.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class PairWorkLimit : public NaviTest {};

// Nothing to search, nothing to match, no shift to test; one tile.
Params NoWork() {
    return Params()
        .Set("s_multiBloclkFlag", 0)
        .Set("s_centerHeight", -100)
        .Set("s_candidateNum", 0)
        .Set("s_smallMoveTolRow", -1)
        .Set("s_smallMoveTolCol", -1);
}

bool Acceptable(const Params& params) {
    params.Apply();
    return PairWorkAcceptable();
}

// An image of one block.
Params& Image(Params& params, int32_t width, int32_t height) {
    return params.Set("s_blockWidthFp", width)
        .Set("s_blockHeightFp", height)
        .Set("s_blockColNumFp", 1)
        .Set("s_blockRowNumFp", 1);
}

TEST_F(PairWorkLimit, MatchIsCandidatesTimesPixels) {
    Params params = NoWork();
    Image(params, 4096, 1024).Set("s_candidateNum", 64);  // 2^22 * 2^6
    EXPECT_TRUE(Acceptable(params));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 65)));
    EXPECT_FALSE(Acceptable(Image(params, 4096, 1025).Set("s_candidateNum", 64)));
}

TEST_F(PairWorkLimit, MatchOfTilesIsCandidatesTimesPixelsOfTheFullImage) {
    // Full image: 1008 + 2 * (3 + 5) = 1024 wide, 2032 + 2 * (2 + 6) = 2048 high. The region is
    // lower than the template, so that nothing is searched. 2^21 * 2^7.
    Params params = NoWork();
    Image(params, 1, 1).Set("s_multiBloclkFlag", 1);
    params.Set("s_centerWidth", 1008).Set("s_boundWidth", 3).Set("s_gapWidth", 5);
    params.Set("s_centerHeight", 2032).Set("s_boundHeight", 2).Set("s_gapHeight", 6);
    params.Set("s_templateHeight", 3000).Set("s_templateWidth", 3000);
    EXPECT_TRUE(Acceptable(params.Set("s_candidateNum", 128)));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 129)));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 128).Set("s_gapWidth", 6)));
}

// Four templates of 32 x 32 at 256 x 256 placements each: 2^2 * 2^10 * 2^16. Rows 287 - 32 + 1,
// columns 5 + 285 - 32 - 3 + 1: the last column is counted from the border's height.
Params Search() {
    return NoWork()
        .Set("s_templateWidth", 32)
        .Set("s_templateHeight", 32)
        .Set("s_centerHeight", 287)
        .Set("s_boundHeight", 5)
        .Set("s_centerWidth", 285)
        .Set("s_boundWidth", 3);
}

TEST_F(PairWorkLimit, SearchIsPlacementsTimesPixelsOfAllTemplates) {
    EXPECT_TRUE(Acceptable(Search()));
    EXPECT_FALSE(Acceptable(Search().Set("s_centerHeight", 288)));
    EXPECT_FALSE(Acceptable(Search().Set("s_centerWidth", 286)));
    EXPECT_FALSE(Acceptable(Search().Set("s_boundHeight", 6)));
    EXPECT_FALSE(Acceptable(Search().Set("s_boundWidth", 2)));
}

TEST_F(PairWorkLimit, SearchHasTwiceTheTemplatesWithTiles) {
    // Rows 159 - 32 + 1 = 128 make up for it.
    Params params = Search();
    params.Set("s_multiBloclkFlag", 1).Set("s_centerHeight", 159);
    EXPECT_TRUE(Acceptable(params));
    EXPECT_FALSE(Acceptable(params.Set("s_centerHeight", 160)));
}

TEST_F(PairWorkLimit, SearchCountsWideAndTallTemplatesEach) {
    // 64 x 16 and 16 x 64 pixels in a region of 295 x 295: 280 * 232 placements of each, 1024
    // pixels, two of each: 266076160 < 2^28. In 297 x 297 they are 282 * 234: 270286848.
    Params params = NoWork();
    params.Set("s_templateWidth", 64).Set("s_templateHeight", 16);
    params.Set("s_boundHeight", 0).Set("s_boundWidth", 0);
    EXPECT_TRUE(Acceptable(params.Set("s_centerHeight", 295).Set("s_centerWidth", 295)));
    EXPECT_FALSE(Acceptable(params.Set("s_centerHeight", 297).Set("s_centerWidth", 297)));
    // 63 rows are lower than the tall one, and take the wide ones alone: 48 * 2000 placements.
    EXPECT_TRUE(Acceptable(params.Set("s_centerHeight", 63).Set("s_centerWidth", 2063)));
}

TEST_F(PairWorkLimit, NoMoveTestIsShiftsTimesPixelsAndAddsToTheMatch) {
    // 2^12 pixels; 3 * 5 shifts leave 2^16 - 15 candidates, 5 * 5 shifts 2^16 - 25.
    Params params = NoWork();
    Image(params, 64, 64);
    params.Set("s_smallMoveTolRow", 1).Set("s_smallMoveTolCol", 2);
    EXPECT_TRUE(Acceptable(params.Set("s_candidateNum", 65521)));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 65522)));
    params.Set("s_smallMoveTolRow", 2);
    EXPECT_TRUE(Acceptable(params.Set("s_candidateNum", 65511)));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 65512)));
}

TEST_F(PairWorkLimit, AllThreeAddUp) {
    // The search takes 2^2 * 2^10 * 2^15 = 2^27, the match 2^12 * (2^15 - 1), one shift 2^12.
    Params params = Search();
    Image(params, 64, 64).Set("s_centerHeight", 159);
    params.Set("s_smallMoveTolRow", 0).Set("s_smallMoveTolCol", 0);
    EXPECT_TRUE(Acceptable(params.Set("s_candidateNum", 32767)));
    EXPECT_FALSE(Acceptable(params.Set("s_candidateNum", 32768)));
}

}  // namespace
