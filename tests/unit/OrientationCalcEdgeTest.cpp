// What a resting pair leaves in an entry of the record that is not empty, and which frame of a pair
// is measured; maps of a double scan that is off.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "driver/OrientationCalc.h"
#include "frame/NaviFrame.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class DriverEdge : public NaviTest {};

TEST_F(DriverEdge, RestingPairOverwritesTheMatchOfItsEntry) {
    Params().Apply();
    const std::vector<uint8_t> frame = NoisePatch(0, 0, 36, 56);
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->dx_fp[0] = 99;
    record->dy_fp[0] = 99;
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    ASSERT_EQ(record->calc_cnt, 1);
    EXPECT_EQ(record->vkey_fp[0], VKEY_NO_MOVE);
    EXPECT_EQ(record->dx_fp[0], 0);
    EXPECT_EQ(record->dy_fp[0], 0);
}

// One pixel of finger, (24, 3) of a 40 x 48 hg image, in both frames: a coverage of 0 percent,
// column 350 / 40 - 50 = -42, row 50 - 2450 / 48 = -1.
class MeasuredFrames : public NaviTest {
  protected:
    // The centroid of the previous frame in the record when it came with these measures.
    static std::vector<int32_t> Recorded(int32_t xc, int32_t yc, int32_t cvr) {
        FpNaviClear();
        Params().Set("s_modeFlag", 1).Set("s_coverageMinEff", 0).Apply();
        TestFrame frame(40, 48, 10);
        frame.Type(24, 3) = 1;
        EXPECT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
        frame->xc = xc;
        frame->yc = yc;
        frame->cvr = cvr;
        EXPECT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
        EXPECT_EQ(OrntCalcProcess(), 0);
        const NaviVoteInfo_t* const record = PrintNaviLog();
        EXPECT_EQ(record->calc_cnt, 1);
        return {record->xc[0], record->yc[0], record->cvr[0]};
    }
};

TEST_F(MeasuredFrames, PreviousFrameWithoutMeasuresIsMeasured) {
    EXPECT_EQ(Recorded(0, 0, 0), (std::vector<int32_t>{-42, -1, 0}));
}

TEST_F(MeasuredFrames, AnyMeasureOfThePreviousFrameKeepsAllThree) {
    EXPECT_EQ(Recorded(33, 0, 0), (std::vector<int32_t>{33, 0, 0}));
    EXPECT_EQ(Recorded(-33, 0, 0), (std::vector<int32_t>{-33, 0, 0}));
    EXPECT_EQ(Recorded(0, 33, 0), (std::vector<int32_t>{0, 33, 0}));
    EXPECT_EQ(Recorded(0, -33, 0), (std::vector<int32_t>{0, -33, 0}));
    EXPECT_EQ(Recorded(0, 0, 33), (std::vector<int32_t>{0, 0, 33}));
    EXPECT_EQ(Recorded(1, 1, 1), (std::vector<int32_t>{1, 1, 1}));
}

TEST_F(DriverEdge, MapsWithoutTheDoubleScanAreNotRecorded) {
    if (s_doubleScanFlag == 1)
        GTEST_SKIP() << "the double scan of an earlier test stays on";
    Params().Set("s_modeFlag", 1).Apply();
    NaviVoteInfo_t* const record = PrintNaviLog();
    for (auto* const entries : {&record->xc_ds, &record->yc_ds, &record->cvr_ds})
        (*entries)[0] = (*entries)[1] = 99;
    ASSERT_EQ(GetDoubleScanNaviBlock(0xFFFFFFFFU, 0), 0);
    ASSERT_EQ(GetDoubleScanNaviBlock(0, 0xFFFFFFFFU), 0);
    const std::vector<uint8_t> frame = RectImage(40, 48, 8, 4, 32, 16);
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    ASSERT_EQ(record->calc_cnt, 1);
    for (int32_t n = 0; n < 2; ++n) {
        EXPECT_EQ(record->xc_ds[n], 99) << n;
        EXPECT_EQ(record->yc_ds[n], 99) << n;
        EXPECT_EQ(record->cvr_ds[n], 99) << n;
    }
}

}  // namespace
