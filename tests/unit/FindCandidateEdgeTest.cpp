// The candidate search on frames that are not there, and templates without area.
#include <gtest/gtest.h>

#include <vector>

#include "FindCandidate.h"
#include "Fixtures.h"
#include "NaviFrame.h"
#include "NaviParam.h"

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

}  // namespace
