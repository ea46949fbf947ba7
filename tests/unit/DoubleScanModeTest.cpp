// Everything that needs mode 2. The double scan stays on for the life of the process, so this file
// is linked last; tests of other files that it would change are skipped behind it.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "motion/DoubleScan.h"
#include "param/NaviParam.h"
#include "vote/Voting.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr uint32_t kSevenCells = 0xFE000000U;  // row 0, columns 0 to 6
constexpr uint32_t kEightCells = 0xFF000000U;  // row 0
constexpr int32_t kSize = 2016;

class DoubleScanMode : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Params().Set("s_modeFlag", 2).Apply();
    }
    static Params ModeTwo() { return Params().Set("s_modeFlag", 2); }
    static int32_t Feed(const std::vector<uint8_t>& image) {
        return OrientationCalc(image.data(), image.data(), 0);
    }
    static int32_t Status() {
        const std::vector<uint8_t> white(kSize, 255);
        return vmk_fp_navigation_detect_finger_status(white.data());
    }
};

TEST_F(DoubleScanMode, GeometryIsThatOfTheFpModes) {
    EXPECT_EQ(s_imageWidth, 56);
    EXPECT_EQ(s_imageHeight, 36);
    EXPECT_EQ(s_doubleScanFlag, 1);
}

TEST_F(DoubleScanMode, FlagSurvivesOtherModesAndTheClear) {
    for (const int32_t mode : {0, 1, 3}) {
        ASSERT_EQ(Params().Set("s_modeFlag", mode).Apply(), 0);
        EXPECT_EQ(s_doubleScanFlag, 1);
        FpNaviClear();
        EXPECT_EQ(s_doubleScanFlag, 1);
        EXPECT_EQ(SetNaviParam(nullptr), -1);
        EXPECT_EQ(s_doubleScanFlag, 1);
    }
}

// GetNaviBlock of noise.
std::vector<uint8_t> Resorted(int32_t width) {
    const std::vector<uint8_t> raw = NoisePatch(0, 0, 36, 56);
    std::vector<uint8_t> image(kSize);
    EXPECT_EQ(GetNaviBlock(raw.data(), width, 36, image.data()), 0);
    return image;
}

TEST_F(DoubleScanMode, VerticalControlReplacesRowZeroByRowOne) {
    const std::vector<uint8_t> plain = Resorted(56);
    ModeTwo().Set("s_directionControlFlag", 1).Apply();
    const std::vector<uint8_t> fixed = Resorted(56);
    for (size_t x = 0; x < 56; ++x)
        EXPECT_EQ(fixed[x], plain[56 + x]);
    EXPECT_EQ(std::vector<uint8_t>(fixed.begin() + 56, fixed.end()),
              std::vector<uint8_t>(plain.begin() + 56, plain.end()));
}

TEST_F(DoubleScanMode, OtherDirectionControlsKeepRowZero) {
    const std::vector<uint8_t> plain = Resorted(56);
    for (const int32_t flag : {0, 2, 3}) {
        ModeTwo().Set("s_directionControlFlag", flag).Apply();
        EXPECT_EQ(Resorted(56), plain);
    }
    for (size_t x = 0; x < 8; ++x)
        EXPECT_EQ(plain[x], NoiseAt(0, static_cast<int32_t>(x)));  // row 0 of block 0
}

TEST_F(DoubleScanMode, RowFixUpGoesByTheModeAndNotByTheStickyFlag) {
    const std::vector<uint8_t> plain = Resorted(56);
    for (const int32_t mode : {0, 3}) {
        Params().Set("s_modeFlag", mode).Set("s_directionControlFlag", 1).Apply();
        ASSERT_EQ(s_doubleScanFlag, 1);
        EXPECT_EQ(Resorted(56), plain);
    }
}

TEST_F(DoubleScanMode, FixUpOfWidthZeroOrLessIsNone) {
    const std::vector<uint8_t> plain = Resorted(56);
    ModeTwo().Set("s_directionControlFlag", 1).Apply();
    for (const int32_t width : {0, -1, -56, std::numeric_limits<int32_t>::min()})
        EXPECT_EQ(Resorted(width), plain) << width;
}

TEST_F(DoubleScanMode, FixUpTouchesOnlyBytesInsideTheImage) {
    const std::vector<uint8_t> plain = Resorted(56);
    ModeTwo().Set("s_directionControlFlag", 1).Apply();
    for (const int32_t width :
         {1, 1008, 1500, 2015, 2016, 5000, std::numeric_limits<int32_t>::max()}) {
        std::vector<uint8_t> expected = plain;
        for (int64_t i = 0; i < width && i + width < kSize; ++i)
            expected[static_cast<size_t>(i)] = expected[static_cast<size_t>(i + width)];
        EXPECT_EQ(Resorted(width), expected) << width;
    }
}

TEST_F(DoubleScanMode, StatusOfANullFrameFailsAndKeepsTheFlag) {
    GetDoubleScanNaviBlock(0, kEightCells);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(nullptr), -1);
    EXPECT_EQ(s_lastFrameFlag, 0);
    FpNaviClear();
    ASSERT_EQ(Status(), 0);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(nullptr), -1);
    EXPECT_EQ(s_lastFrameFlag, 1);
}

TEST_F(DoubleScanMode, SevenCellsAreNoFingerAndEightAreOne) {
    GetDoubleScanNaviBlock(0, kSevenCells);  // 10 percent, not above 10
    EXPECT_EQ(Status(), 0);
    EXPECT_EQ(s_lastFrameFlag, 1);
    GetDoubleScanNaviBlock(0, kEightCells);  // 12 percent
    EXPECT_EQ(Status(), 1);
    EXPECT_EQ(s_lastFrameFlag, 0);
    EXPECT_TRUE(FingerBlkFake::Calls().empty()) << "the frame is not looked at";
}

TEST_F(DoubleScanMode, CoverageAtTheThresholdIsNoFinger) {
    ModeTwo().Set("s_DoubleScanCvrThreshold", 12).Apply();
    GetDoubleScanNaviBlock(0, kEightCells);
    EXPECT_EQ(Status(), 0);
}

TEST_F(DoubleScanMode, EmptyMapIsNoFingerEvenUnderANegativeThreshold) {
    ModeTwo().Set("s_DoubleScanCvrThreshold", -1).Apply();
    GetDoubleScanNaviBlock(0, 0);
    EXPECT_EQ(Status(), 0);
    EXPECT_EQ(s_lastFrameFlag, 1);
    GetDoubleScanNaviBlock(1, 0);
    EXPECT_EQ(Status(), 1) << "one cell, 1 percent";
}

TEST_F(DoubleScanMode, StickyDoubleScanDecidesInTheHgModeToo) {
    Params().Set("s_modeFlag", 1).Apply();
    const std::vector<uint8_t> black(kSize, 0);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(black.data()), 0) << "the map is empty";
    GetDoubleScanNaviBlock(0, kEightCells);
    EXPECT_EQ(Status(), 1) << "the frame is white";
}

TEST_F(DoubleScanMode, CountedPairRecordsTheMaps) {
    const std::vector<uint8_t> noise = NoisePatch(0, 0, 36, 56);
    GetDoubleScanNaviBlock(0, 0x80000000U);  // (-44, 44)
    ASSERT_EQ(Feed(noise), 0);
    GetDoubleScanNaviBlock(0, 0x01000000U);  // row 0, column 7: (43, 44)
    ASSERT_EQ(Feed(noise), 0);
    const NaviVoteInfo_t* record = PrintNaviLog();
    EXPECT_EQ(record->calc_cnt, 1);
    EXPECT_EQ(record->xc_ds[0], -44);
    EXPECT_EQ(record->xc_ds[1], 43);
    EXPECT_EQ(record->cvr_ds[1], 1);
    EXPECT_EQ(record->dx_ds[0], 87);
    EXPECT_EQ(record->dy_ds[0], 0);
    EXPECT_EQ(record->vkey_fp[0], VKEY_NO_MOVE) << "the frames rest";
}

TEST_F(DoubleScanMode, DroppedPairKeepsItsMapsButIsNotCounted) {
    const std::vector<uint8_t> flat(kSize, 200);  // no finger area: coverage 0
    GetDoubleScanNaviBlock(0, 0x80000000U);
    ASSERT_EQ(Feed(flat), 0);
    GetDoubleScanNaviBlock(0, 0x01000000U);
    ASSERT_EQ(Feed(flat), 0);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 0);
    EXPECT_EQ(PrintNaviLog()->dx_ds[0], 87);
    EXPECT_EQ(PrintNaviLog()->xc_ds[1], 43);
}

TEST_F(DoubleScanMode, DoubleScanOfTheDriverGoesByTheStickyFlag) {
    const std::vector<uint8_t> noise = NoisePatch(0, 0, 36, 56);
    for (const int32_t mode : {0, 1}) {
        Params().Set("s_modeFlag", mode).Apply();
        FpNaviClear();
        GetDoubleScanNaviBlock(0, 0x80000000U);
        ASSERT_EQ(Feed(noise), 0);
        GetDoubleScanNaviBlock(0, 0x01000000U);
        ASSERT_EQ(Feed(noise), 0);
        EXPECT_EQ(PrintNaviLog()->dx_ds[0], 87) << mode;
    }
}

TEST_F(DoubleScanMode, HundredthPairSkipsTheDoubleScanStepToo) {
    const std::vector<uint8_t> noise = NoisePatch(0, 0, 36, 56);
    for (int32_t frame = 0; frame < 100; ++frame)
        ASSERT_EQ(Feed(noise), 0);
    ASSERT_EQ(PrintNaviLog()->calc_cnt, 99);
    GetDoubleScanNaviBlock(0, 0x80000000U);
    EXPECT_EQ(Feed(noise), 0);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 99);
    EXPECT_EQ(PrintNaviLog()->xc_ds[99], 0);
    EXPECT_EQ(PrintNaviLog()->dx_ds[99], 0);
    EXPECT_EQ(Voting(1), VKEY_NO_MOVE);
}

TEST_F(DoubleScanMode, VoteTakesTheDoubleScanInPlaceOfTheCentroid) {
    // Untrusted matches: the centroid says up, the maps say left.
    NaviVoteInfo_t* record = PrintNaviLog();
    record->calc_cnt = 1;
    record->diff[0] = 255;
    record->dy_ct[0] = 40;
    record->dx_ds[0] = -40;
    EXPECT_EQ(Voting_fp_mode(), VKEY_LEFT);
    record->dx_ds[0] = 0;
    EXPECT_EQ(Voting_fp_mode(), VKEY_NO_MOVE) << "no double-scan travel at all";
    Params().Set("s_modeFlag", 0).Apply();
    record->dx_ds[0] = 40;
    EXPECT_EQ(Voting_fp_mode(), VKEY_RIGHT) << "by the sticky flag";
}

TEST_F(DoubleScanMode, ClearKeepsTheCentroidsOfTheMapsOnly) {
    const std::vector<uint8_t> noise = NoisePatch(0, 0, 36, 56);
    GetDoubleScanNaviBlock(0, 0x80000000U);
    ASSERT_EQ(Feed(noise), 0);
    GetDoubleScanNaviBlock(0, 0x01000000U);
    ASSERT_EQ(Feed(noise), 0);
    FpNaviClear();
    const NaviVoteInfo_t* record = PrintNaviLog();
    EXPECT_EQ(record->xc_ds[0], -44);
    EXPECT_EQ(record->yc_ds[1], 44);
    EXPECT_EQ(record->dx_ds[0], 0);
    EXPECT_EQ(record->cvr_ds[0], 0);
}

}  // namespace
