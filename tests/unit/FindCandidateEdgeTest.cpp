// The candidate search on frames that are not there or of another size, templates without area, and
// templates of which one kind has more columns of placements than the other.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "matching/CandidateSearch.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class CandidatesEdge : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Params().Apply();
    }
    static int32_t Find() {
        std::vector<int32_t> di(static_cast<size_t>(s_candidateNum));
        std::vector<int32_t> dj(static_cast<size_t>(s_candidateNum));
        return fpnavi::FindCandidate(di.data(), dj.data());
    }
};

TEST_F(CandidatesEdge, OneFrameAloneIsRefused) {
    // Of equal coverage, 0, the templates are cut from the current frame.
    TestFrame frame(56, 36, 10);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    EXPECT_EQ(Find(), -1) << "nothing to cut from";
    FpNaviClear();
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    EXPECT_EQ(Find(), -1) << "nothing to search";
}

TEST_F(CandidatesEdge, TemplateWithoutAreaIsRefused) {
    TestFrame frame(56, 36, 10);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    EXPECT_EQ(Find(), 0);
    Params().Set("s_templateHeight", 0).Apply();
    EXPECT_EQ(Find(), -1);
}

TEST_F(CandidatesEdge, WidestTemplateIsFoundInTheLastPlaceOfTheTallestFrame) {
    // 61 rows of 8 placements of 16 x 4 pixels; the tall templates see no finger. Template 0, cut
    // at (0, 8), lies in the other frame at (60, 7), the last placement: 60 rows, -1 column.
    Params params;
    params.Set("s_multiBloclkFlag", 0).Set("s_candidateNum", 1);
    params.Set("s_blockWidthFp", 32).Set("s_blockHeightFp", 64);
    params.Set("s_blockColNumFp", 1).Set("s_blockRowNumFp", 1);
    params.Set("s_boundWidth", 0).Set("s_boundHeight", 0);
    params.Set("s_centerWidth", 23).Set("s_centerHeight", 64);
    params.Set("s_templateWidth", 16).Set("s_templateHeight", 4).Apply();
    TestFrame searched(32, NoisePatch(0, 0, 64, 32));
    TestFrame cut(32, NoisePatch(500, 500, 64, 32));
    for (int32_t row = 0; row < 4; ++row) {
        for (int32_t column = 0; column < 16; ++column)
            cut.Grey(row, 8 + column) = searched.Grey(60 + row, 7 + column);
    }
    cut.Mark(0, 8, 4, 16).Mark(60, 8, 4, 16);
    ASSERT_EQ(ImgCopy(&s_imagePrev, searched.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, cut.Get()), 0);
    int32_t di = 0;
    int32_t dj = 0;
    ASSERT_EQ(fpnavi::FindCandidate(&di, &dj), 0);
    EXPECT_EQ(di, 60);
    EXPECT_EQ(dj, -1);
}

TEST_F(CandidatesEdge, FramesThatAreNotOfTheImagesSizeAreRefused) {
    for (const int32_t width : {55, 56, 57}) {
        for (const int32_t height : {35, 36, 37}) {
            TestFrame frame(width, height, 10);
            ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
            ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
            EXPECT_EQ(Find(), width == 56 && height == 36 ? 0 : -1) << width << " x " << height;
        }
    }
}

// All placements differ by 0, so the kept ones come by row, column and template. The wide
// templates, 65 x 4, have the columns 0 to 63, the tall ones, 4 x 65, the columns 0 to 124: 4
// placements for each of the first 64 columns of row 0, 2 for each of the other 61, and one of
// row 1.
TEST_F(CandidatesEdge, ColumnsThatOneKindOfTemplatesLacksAreTakenFromTheOther) {
    constexpr int32_t kRowOne = 64 * 4 + 61 * 2;
    Params params;
    params.Set("s_multiBloclkFlag", 0).Set("s_candidateNum", kRowOne + 1);
    params.Set("s_blockWidthFp", 128).Set("s_blockHeightFp", 72);
    params.Set("s_blockColNumFp", 1).Set("s_blockRowNumFp", 1);
    params.Set("s_boundWidth", 0).Set("s_boundHeight", 0);
    params.Set("s_centerWidth", 128).Set("s_centerHeight", 72);
    params.Set("s_templateWidth", 65).Set("s_templateHeight", 4).Apply();
    TestFrame frame(128, 72, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    const SearchParams search = CurrentSearchParams();
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    TemplateSet set;
    ASSERT_TRUE(CutTemplates(search, pair, &set));
    std::vector<uint64_t> block(PlanMemory(search, set, nullptr).bytes / sizeof(uint64_t) + 1);
    const SearchMemory memory = PlanMemory(search, set, reinterpret_cast<uint8_t*>(block.data()));
    std::vector<int32_t> di(kRowOne + 1);
    std::vector<int32_t> dj(kRowOne + 1);
    SelectCandidates(set, ScorePlacements(search, set, pair, memory),
                     {di.data(), dj.data(), kRowOne + 1});
    // Cut at (0, 31), (68, 31), (3, 124) and (3, 0).
    std::vector<int32_t> expectedDi;
    std::vector<int32_t> expectedDj;
    for (int32_t column = 0; column < 125; ++column) {
        if (column < 64) {
            expectedDi.insert(expectedDi.end(), {0, -68});
            expectedDj.insert(expectedDj.end(), {column - 31, column - 31});
        }
        expectedDi.insert(expectedDi.end(), {-3, -3});
        expectedDj.insert(expectedDj.end(), {column - 124, column});
    }
    expectedDi.push_back(1);
    expectedDj.push_back(-31);
    EXPECT_EQ(di, expectedDi);
    EXPECT_EQ(dj, expectedDj);
}

}  // namespace
