// What holds from the load of the module until the first SetNaviParam. In a process of its own, as
// ctest runs each test, all of this file runs; a test that comes after a SetNaviParam is skipped.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class BeforeSetNaviParam : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        if (s_tpltNum != 0)
            GTEST_SKIP() << "SetNaviParam has run in this process";
    }
};

TEST_F(BeforeSetNaviParam, EveryParameterHasItsDefault) {
    for (const ParamEntry& entry : ParamTable())
        EXPECT_EQ(entry.Stored(), entry.defaultValue) << entry.name;
}

TEST_F(BeforeSetNaviParam, EveryDerivedValueIsZero) {
    EXPECT_EQ(DerivedState(), std::vector<int32_t>(14, 0));
}

TEST_F(BeforeSetNaviParam, NullArrayFailsAndLeavesEveryDefaultInPlace) {
    EXPECT_EQ(SetNaviParam(nullptr), -1);
    for (const ParamEntry& entry : ParamTable())
        EXPECT_EQ(entry.Stored(), entry.defaultValue) << entry.name;
    EXPECT_EQ(DerivedState(), std::vector<int32_t>(14, 0));
}

TEST_F(BeforeSetNaviParam, FramesAreEmptyAndSurviveTheClear) {
    for (int pass = 0; pass < 2; ++pass) {
        EXPECT_TRUE(IsEmpty(s_imageCurr));
        EXPECT_TRUE(IsEmpty(s_imagePrev));
        EXPECT_TRUE(IsEmpty(s_fullImageCurr));
        EXPECT_TRUE(IsEmpty(s_fullImagePrev));
        EXPECT_EQ(PrintNaviLog()->calc_cnt, 0);
        FpNaviClear();
    }
}

TEST_F(BeforeSetNaviParam, GetNaviBlockFailsAndWritesNothing) {
    const std::vector<uint8_t> raw(2016, 7);
    std::vector<uint8_t> image(2016, 9);
    EXPECT_EQ(GetNaviBlock(raw.data(), 56, 36, image.data()), -1);
    EXPECT_EQ(image, std::vector<uint8_t>(2016, 9));
}

TEST_F(BeforeSetNaviParam, ImgInitRejectsEverySize) {
    const std::vector<uint8_t> image(2016, 7);
    NaviFrame_t frame{};
    EXPECT_EQ(ImgInit(&frame, 0, s_imageHeight, 0, s_imageWidth, image.data()), -1);
    EXPECT_EQ(ImgInit(&frame, 0, 36, 0, 56, image.data()), -1);
    EXPECT_TRUE(IsEmpty(frame));
}

TEST_F(BeforeSetNaviParam, OrientationCalcFails) {
    const std::vector<uint8_t> image(2016, 7);
    EXPECT_EQ(OrientationCalc(image.data(), image.data(), 0), -1);
    EXPECT_TRUE(IsEmpty(s_imageCurr));
}

TEST_F(BeforeSetNaviParam, FingerStatusAsksTheTextureTestOfAnEmptyImageAndAnswersNoFinger) {
    const std::vector<uint8_t> image(2016, 7);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(image.data()), 0);
    ASSERT_EQ(FingerBlkFake::Calls().size(), 1U);
    EXPECT_EQ(FingerBlkFake::Calls()[0].width, 0);
    EXPECT_EQ(FingerBlkFake::Calls()[0].height, 0);
}

TEST_F(BeforeSetNaviParam, GeometryIsUnset) {
    EXPECT_TRUE(ImageGeometryUnset());
    EXPECT_FALSE(ImageGeometryUsable());
}

TEST_F(BeforeSetNaviParam, EmptyRecordVotesNoMove) {
    // fp mode by default: an empty record fails the movement test.
    EXPECT_EQ(Voting(1), VKEY_NO_MOVE);
    EXPECT_EQ(Voting(0), -1);
}

}  // namespace
