// The candidate search on frames that are not there, and templates without area.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "matching/CandidateHeap.h"
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

}  // namespace
