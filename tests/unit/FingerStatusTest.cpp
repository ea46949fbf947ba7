// The finger-status entry: which detector answers, and what the answer does to the gesture. The
// double-scan detector behind the entry stands in DoubleScanModeTest.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <vector>

#include "Fixtures.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "presence/FingerStatus.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class ZoneDetect : public NaviTest {};

TEST_F(ZoneDetect, CoverageIsTheTruncatedPercentOfTheCells) {
    std::array<uint8_t, 64> zone{};
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 0);
    std::fill_n(zone.begin(), 7, uint8_t{1});
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 10);  // 700 / 64
    zone[63] = 1;
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 12);  // 800 / 64
    zone.fill(1);
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 100);
}

TEST_F(ZoneDetect, OnlyCellsOfExactlyOneCount) {
    std::array<uint8_t, 64> zone{};
    zone.fill(2);
    zone[3] = 255;
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 0);
    zone[10] = 1;
    EXPECT_EQ(DoubleScanFingerDetect(zone.data()), 1);
}

class StatusEntry : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        if (s_doubleScanFlag == 1)
            GTEST_SKIP() << "the double scan of an earlier test decides";
    }
    static int32_t Status(uint8_t grey) {
        const std::vector<uint8_t> frame(2016, grey);
        return vmk_fp_navigation_detect_finger_status(frame.data());
    }
};

TEST_F(StatusEntry, NullFrameFailsInEveryModeAndKeepsTheFlag) {
    for (const int32_t mode : {0, 1, 3}) {
        Params().Set("s_modeFlag", mode).Apply();
        FpNaviClear();
        EXPECT_EQ(vmk_fp_navigation_detect_finger_status(nullptr), -1);
        EXPECT_EQ(s_lastFrameFlag, 0);
        ASSERT_EQ(Status(255), 0);
        EXPECT_EQ(vmk_fp_navigation_detect_finger_status(nullptr), -1);
        EXPECT_EQ(s_lastFrameFlag, 1);
    }
}

TEST_F(StatusEntry, NoFingerEndsTheGestureAndAFingerResumesIt) {
    Params().Set("s_modeFlag", 1).Apply();
    EXPECT_EQ(Status(255), 0);
    EXPECT_EQ(s_lastFrameFlag, 1);
    EXPECT_EQ(Status(100), 1);
    EXPECT_EQ(s_lastFrameFlag, 0);
}

TEST_F(StatusEntry, HgModeTakesTheHgDetector) {
    Params().Set("s_modeFlag", 1).Apply();
    EXPECT_EQ(Status(180), 1);
    EXPECT_TRUE(FingerBlkFake::Calls().empty());
}

TEST_F(StatusEntry, OtherModesTakeTheFpDetector) {
    for (const int32_t mode : {0, 3, -1}) {
        Params().Set("s_modeFlag", mode).Apply();
        FingerBlkFake::Reset();
        EXPECT_EQ(Status(180), 0) << "flat and without texture";
        EXPECT_EQ(FingerBlkFake::Calls().size(), 1U);
        FingerBlkFake::SetAnswer([](int32_t* results) { results[4] = 7; });
        EXPECT_EQ(Status(180), 1);
        EXPECT_EQ(s_lastFrameFlag, 0);
    }
}

TEST_F(StatusEntry, HgModeWithoutAnImageFails) {
    Params().Set("s_modeFlag", 1).Set("s_blockWidthHg", 0).Apply();
    EXPECT_EQ(Status(0), -1);
    EXPECT_EQ(s_lastFrameFlag, 0);
}

TEST_F(StatusEntry, ImpossibleHgSizeFailsAndKeepsTheFlag) {
    Params().Set("s_modeFlag", 1).Apply();
    ASSERT_EQ(Status(255), 0);
    const std::vector<std::pair<int32_t, int32_t>> sizes = {{0, 48},  {40, 0},   {-40, 48},
                                                            {-1, -1}, {4097, 1}, {1, 4097}};
    for (const auto& [width, height] : sizes) {
        Params()
            .Set("s_modeFlag", 1)
            .Set("s_imageWidthHg", width)
            .Set("s_imageHeightHg", height)
            .Apply();
        EXPECT_EQ(Status(0), -1) << width << " x " << height;
        EXPECT_EQ(s_lastFrameFlag, 1);
    }
}

}  // namespace
