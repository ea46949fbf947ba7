// The frame-pair driver: which frames it takes, which methods run, what the record receives. The
// double scan's share stands in DoubleScanModeTest.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "driver/OrientationCalc.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

using Image = std::vector<uint8_t>;

int32_t Feed(const Image& image, int32_t timeOut = 0) {
    return OrientationCalc(image.data(), image.data(), timeOut);
}

// A black rectangle of 16 x 32 pixels (26 percent) in the 40 x 48 hg image, its left column given:
// centroid 100 * (left + 8) / 40 - 50, row 0.
Image HgImage(int32_t left, int32_t columns = 16) {
    return RectImage(40, 48, 8, left, 32, columns);
}

class Driver : public NaviTest {
  protected:
    NaviVoteInfo_t* m_record = PrintNaviLog();
};

TEST_F(Driver, NullArgumentsFailAndChangeNothing) {
    Params().Apply();
    const Image image(2016, 255);
    EXPECT_EQ(OrientationCalc(nullptr, image.data(), 0), -1);
    EXPECT_EQ(OrientationCalc(image.data(), nullptr, 0), -1);
    EXPECT_EQ(s_frameNum, 0);
    EXPECT_EQ(Feed(image), 0) << "not the sticky failure";
}

TEST_F(Driver, TimeOutOneIgnoresTheFrame) {
    Params().Apply();
    const Image image(2016, 255);
    EXPECT_EQ(Feed(image, 1), 0);
    EXPECT_EQ(s_frameNum, 0);
    EXPECT_TRUE(IsEmpty(s_imageCurr));
}

TEST_F(Driver, OtherTimeOutsAreNone) {
    Params().Apply();
    const Image image(2016, 255);
    EXPECT_EQ(Feed(image, 2), 0);
    EXPECT_EQ(s_frameNum, 1);
    EXPECT_EQ(Feed(image, -1), 0);
    EXPECT_EQ(s_frameNum, 2);
}

TEST_F(Driver, FirstFrameMakesNoEntry) {
    Params().Set("s_modeFlag", 1).Apply();
    EXPECT_EQ(Feed(HgImage(4)), 0);
    EXPECT_EQ(s_frameNum, 1);
    EXPECT_EQ(m_record->calc_cnt, 0);
    EXPECT_EQ(s_imageCurr.width, 40);
    EXPECT_TRUE(IsEmpty(s_imagePrev));
    EXPECT_EQ(Bytes(s_imageCurr.pData, 1920), HgImage(4));
}

TEST_F(Driver, HgPairIsRecordedByItsCentroids) {
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(12)), 0);
    EXPECT_EQ(m_record->calc_cnt, 1);
    EXPECT_EQ(m_record->xc[0], -20);  // 1200 / 40 - 50
    EXPECT_EQ(m_record->xc[1], 0);    // 2000 / 40 - 50
    EXPECT_EQ(m_record->yc[0], 0);
    EXPECT_EQ(m_record->yc[1], 0);
    EXPECT_EQ(m_record->cvr[0], 26);  // 51200 / 1920
    EXPECT_EQ(m_record->cvr[1], 26);
    EXPECT_EQ(m_record->dx_ct[0], 8);  // 20 * 40 / 100
    EXPECT_EQ(m_record->dy_ct[0], 0);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_RIGHT);
}

TEST_F(Driver, SecondPairRewritesTheProvisionalEntry) {
    Params().Set("s_modeFlag", 1).Apply();
    for (const int32_t left : {4, 12, 2})
        ASSERT_EQ(Feed(HgImage(left)), 0);
    EXPECT_EQ(m_record->calc_cnt, 2);
    EXPECT_EQ(m_record->xc[1], 0);
    EXPECT_EQ(m_record->xc[2], -25);  // 1000 / 40 - 50
    EXPECT_EQ(m_record->dx_ct[1], -10);
    EXPECT_EQ(m_record->vkey_ct[1], VKEY_LEFT);
}

TEST_F(Driver, HgRunsNoFingerprintMethod) {
    // Identical frames: the no-move test would say so in vkey_fp.
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(14)), 0);
    EXPECT_EQ(m_record->calc_cnt, 2);
    for (int32_t n = 0; n < 2; ++n) {
        EXPECT_EQ(m_record->vkey_fp[n], 0);
        EXPECT_EQ(m_record->dx_fp[n], 0);
        EXPECT_EQ(m_record->dy_fp[n], 0);
        EXPECT_EQ(m_record->diff[n], 0);
    }
    EXPECT_TRUE(IsEmpty(s_fullImageCurr));
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_NO_MOVE);
}

TEST_F(Driver, HgNoMoveKeepsThePreviousCentroidOnATie) {
    // One column: centroid -20 to 1300 / 40 - 50 = -18, 2 * 40 / 100 = 0 pixels.
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(5)), 0);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_NO_MOVE);
    EXPECT_EQ(m_record->dx_ct[0], 0);
    EXPECT_EQ(m_record->xc[0], -20);
    EXPECT_EQ(m_record->xc[1], -20);
}

TEST_F(Driver, HgNoMoveKeepsTheCentroidOfTheLargerCoverage) {
    // 17 columns: centroid 1250 / 40 - 50 = -19, coverage 54400 / 1920 = 28.
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(4, 17)), 0);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_NO_MOVE);
    EXPECT_EQ(m_record->xc[0], -19);
    EXPECT_EQ(m_record->xc[1], -19);
    EXPECT_EQ(m_record->cvr[0], 26) << "coverages stay";
    EXPECT_EQ(m_record->cvr[1], 28);
}

TEST_F(Driver, PairBelowTheLeastCoverageIsDropped) {
    // 9 of 40 columns of 32 rows: 28800 / 1920 = 15 percent; 8 columns: 13 percent.
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(4, 8)), 0);
    EXPECT_EQ(m_record->calc_cnt, 0) << "the current frame covers too little";
    ASSERT_EQ(Feed(HgImage(4)), 0);
    EXPECT_EQ(m_record->calc_cnt, 0) << "the previous frame covers too little";
    ASSERT_EQ(Feed(HgImage(4, 9)), 0);
    EXPECT_EQ(m_record->calc_cnt, 1) << "15 is enough";
    EXPECT_EQ(s_frameNum, 4) << "dropped frames count";
}

TEST_F(Driver, ContentOfDataPrevIsIgnored) {
    Params().Set("s_modeFlag", 1).Apply();
    const Image other(1920, 0);
    const Image first = HgImage(4);
    const Image second = HgImage(12);
    ASSERT_EQ(OrientationCalc(other.data(), first.data(), 0), 0);
    ASSERT_EQ(OrientationCalc(other.data(), second.data(), 0), 0);
    EXPECT_EQ(m_record->xc[0], -20);
    EXPECT_EQ(m_record->cvr[0], 26);
}

TEST_F(Driver, NothingHappensOnceTheFingerHasLeft) {
    if (s_doubleScanFlag == 1)
        GTEST_SKIP() << "the double scan of an earlier test decides about the finger";
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    const Image white(1920, 255);
    ASSERT_EQ(vmk_fp_navigation_detect_finger_status(white.data()), 0);
    EXPECT_EQ(Feed(HgImage(12)), 0);
    EXPECT_EQ(s_frameNum, 1);
    EXPECT_EQ(m_record->calc_cnt, 0);
}

TEST_F(Driver, FpFramesAtRestAreNoMoveByBothMethods) {
    Params().Apply();
    const Image noise = NoisePatch(0, 0, 36, 56);
    ASSERT_EQ(Feed(noise), 0);
    ASSERT_EQ(Feed(noise), 0);
    EXPECT_EQ(m_record->calc_cnt, 1);
    EXPECT_EQ(m_record->vkey_fp[0], VKEY_NO_MOVE);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_NO_MOVE);
    EXPECT_EQ(m_record->dx_fp[0], 0);
    EXPECT_EQ(m_record->dy_fp[0], 0);
    EXPECT_EQ(m_record->dx_ct[0], 0);
    EXPECT_EQ(m_record->dy_ct[0], 0);
    EXPECT_EQ(m_record->xc[0], m_record->xc[1]);
    EXPECT_EQ(m_record->yc[0], m_record->yc[1]);
}

// The 56 x 36 fp image with 200 as background and a finger of two greys, columns alternating.
Image FpFinger(int32_t left, int32_t columns) {
    TestFrame image(56, 36, 200);
    for (int32_t column = left; column < left + columns; ++column)
        image.Paint(0, column, 36, 1, column % 2 == 0 ? 10 : 30);
    return image.Greys();
}

TEST_F(Driver, UndeterminedPairKeepsTheCentroidVerdict) {
    // 20 of 56 columns: 35 percent; centroid 100 * 14 / 56 - 50 = -25, then 24: 42 - 50 = -8;
    // 17 * 56 / 100 = 9 pixels. No shift can reach a common area of 100000.
    Params().Set("s_overlapAreaMinNoMove", 100000).Apply();
    ASSERT_EQ(Feed(FpFinger(4, 20)), 0);
    ASSERT_EQ(Feed(FpFinger(14, 20)), 0);
    EXPECT_EQ(m_record->calc_cnt, 1);
    EXPECT_EQ(m_record->cvr[0], 35);
    EXPECT_EQ(m_record->xc[0], -25);
    EXPECT_EQ(m_record->xc[1], -8);
    EXPECT_EQ(m_record->dx_ct[0], 9);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_RIGHT);
    EXPECT_EQ(m_record->vkey_fp[0], VKEY_NONE);
    EXPECT_EQ(m_record->dx_fp[0], 0);
    EXPECT_EQ(m_record->diff[0], 0);
    EXPECT_TRUE(IsEmpty(s_fullImageCurr)) << "template matching did not run";
}

TEST_F(Driver, MovedPairOfLowCoverageSkipsTemplateMatching) {
    // A tolerant threshold of 0 makes every determined pair a moved one.
    Params().Set("s_diffThresholdTol", 0).Apply();
    ASSERT_EQ(Feed(FpFinger(4, 20)), 0);
    ASSERT_EQ(Feed(FpFinger(4, 20)), 0);
    EXPECT_EQ(m_record->calc_cnt, 1);
    EXPECT_EQ(m_record->cvr[0], 35) << "below 50";
    EXPECT_EQ(m_record->vkey_fp[0], VKEY_NONE);
    EXPECT_EQ(m_record->vkey_ct[0], VKEY_NO_MOVE) << "by the centroid: 0 pixels, 35 percent";
    EXPECT_TRUE(IsEmpty(s_fullImageCurr));
}

TEST_F(Driver, MovedPairIsMatchedByTemplates) {
    // Four columns to the right, seen through one window without gaps.
    Params().Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    ASSERT_EQ(Feed(NoisePatch(100, 100, 36, 56)), 0);
    ASSERT_EQ(Feed(NoisePatch(100, 96, 36, 56)), 0);
    EXPECT_EQ(m_record->calc_cnt, 1);
    EXPECT_EQ(m_record->dx_fp[0], 4);
    EXPECT_EQ(m_record->dy_fp[0], 0);
    EXPECT_EQ(m_record->vkey_fp[0], VKEY_RIGHT);
    EXPECT_LE(m_record->diff[0], 30);
    EXPECT_EQ(s_fullImageCurr.width, 56);
}

TEST_F(Driver, FirstFailureSticksUntilTheClear) {
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Feed(HgImage(4)), 0);
    ASSERT_EQ(Feed(HgImage(12)), 0);
    FailingMalloc::FailNth(1);
    EXPECT_EQ(Feed(HgImage(20)), -1);
    FailingMalloc::Off();
    EXPECT_TRUE(IsEmpty(s_imageCurr));
    EXPECT_TRUE(IsEmpty(s_imagePrev));
    EXPECT_EQ(m_record->calc_cnt, 1) << "entries stay";
    for (int32_t call = 0; call < 3; ++call)
        EXPECT_EQ(Feed(HgImage(20)), -1);
    EXPECT_EQ(s_frameNum, 6) << "failed calls count";
    FpNaviClear();
    EXPECT_EQ(Feed(HgImage(4)), 0);
}

TEST_F(Driver, FailureOfTheFirstFrameSticksToo) {
    Params().Apply();
    const Image noise = NoisePatch(0, 0, 36, 56);
    for (const int nth : {1, 2}) {
        FpNaviClear();
        FailingMalloc::FailNth(nth);
        EXPECT_EQ(Feed(noise), -1);
        FailingMalloc::Off();
        EXPECT_EQ(FailingMalloc::Live(), 0);
        EXPECT_EQ(Feed(noise), -1);
        EXPECT_EQ(Feed(noise), -1);
    }
}

TEST_F(Driver, EveryFailingAllocationOfALaterFrameFailsItAndLeaksNothing) {
    Params().Apply();
    const Image first = NoisePatch(0, 0, 36, 56);
    const Image second = NoisePatch(500, 500, 36, 56);
    for (const bool forGood : {false, true}) {
        for (int nth = 1;; ++nth) {
            FpNaviClear();
            ASSERT_EQ(Feed(first), 0);
            if (forGood)
                FailingMalloc::FailFrom(nth);
            else
                FailingMalloc::FailNth(nth);
            const int32_t result = Feed(second);
            const bool failed = FailingMalloc::Failures() > 0;
            FpNaviClear();
            FailingMalloc::Off();
            EXPECT_EQ(FailingMalloc::Live(), 0) << nth;
            EXPECT_EQ(result, failed ? -1 : 0) << nth;
            if (!failed) {
                // Two buffers each of the two frames and the two full images, the candidate arrays
                // and their list.
                EXPECT_EQ(nth, 12);
                break;
            }
        }
    }
}

TEST_F(Driver, FailedTemplateMatchingEmptiesBothFrames) {
    Params().Set("s_templateWidth", 0).Apply();
    ASSERT_EQ(Feed(NoisePatch(0, 0, 36, 56)), 0);
    EXPECT_EQ(Feed(NoisePatch(500, 500, 36, 56)), -1);
    EXPECT_TRUE(IsEmpty(s_imageCurr));
    EXPECT_TRUE(IsEmpty(s_imagePrev));
    EXPECT_EQ(m_record->calc_cnt, 0);
}

TEST_F(Driver, GeometryChangedInMidGestureFailsTheFpPair) {
    Params().Apply();
    ASSERT_EQ(Feed(NoisePatch(0, 0, 36, 56)), 0);
    Params().Set("s_blockColNumFp", 8).Set("s_centerWidth", 48).Apply();
    EXPECT_EQ(Feed(NoisePatch(0, 0, 36, 64)), -1) << "frames of different sizes";
    EXPECT_TRUE(IsEmpty(s_imageCurr));
}

TEST_F(Driver, HundredthPairIsNotEvaluated) {
    Params().Set("s_modeFlag", 1).Apply();
    for (int32_t frame = 0; frame < 100; ++frame)
        ASSERT_EQ(Feed(HgImage(frame % 2 == 0 ? 4 : 12)), 0);
    ASSERT_EQ(m_record->calc_cnt, 99);
    EXPECT_EQ(m_record->xc[99], 0) << "frame 99 is at the right";
    const NaviVoteInfo_t before = *m_record;
    EXPECT_EQ(Feed(HgImage(20)), 0);
    EXPECT_EQ(Feed(HgImage(2)), 0);
    EXPECT_EQ(std::memcmp(m_record, &before, sizeof(before)), 0) << "all entries are intact";
    // 50 moves to the right, 49 to the left, first -20, last 0: left verdicts refuse the key.
    EXPECT_EQ(Voting(1), VKEY_NO_MOVE);
}

TEST_F(Driver, TwoIdenticalGesturesGiveIdenticalRecords) {
    Params().Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    NaviVoteInfo_t records[2];
    for (NaviVoteInfo_t& record : records) {
        FpNaviClear();
        for (int32_t frame = 0; frame < 6; ++frame)
            ASSERT_EQ(Feed(NoisePatch(100 + 3 * frame, 100 - frame * frame, 36, 56)), 0);
        record = *m_record;
    }
    EXPECT_EQ(records[0].calc_cnt, 5);
    EXPECT_EQ(std::memcmp(&records[0], &records[1], sizeof(records[0])), 0);
}

TEST_F(Driver, PairOfWhichOneFrameHasNoPixelsFails) {
    Params().Apply();
    TestFrame frame(56, 36, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    EXPECT_EQ(OrntCalcProcess(), -1) << "no current frame";
    ImgClear(&s_imagePrev);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    EXPECT_EQ(OrntCalcProcess(), -1) << "no previous frame";
    EXPECT_EQ(m_record->calc_cnt, 0);
}

}  // namespace
