// Pre-processing: binarisation threshold, finger mask, contrast stretch, and the four together.
#include <gtest/gtest.h>

#include <utility>
#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

struct Threshold {
    int32_t thr = -7;
    int32_t scale = -7;
};

Threshold ThresholdOf(TestFrame& frame) {
    Threshold result;
    EXPECT_EQ(CalcBiThr(frame.Get(), &result.thr, &result.scale), 0);
    return result;
}

// A frame of one row holding each grey as often as said.
std::vector<uint8_t> Greys(const std::vector<std::pair<uint8_t, size_t>>& counts) {
    std::vector<uint8_t> greys;
    for (const auto& [grey, count] : counts)
        greys.insert(greys.end(), count, grey);
    return greys;
}

class BiThr : public NaviTest {};

TEST_F(BiThr, TwoClassesAreSplitJustAboveTheDarkOne) {
    // mean 105; from t = 11 on 2 * 95^2 + 2 * 95^2, the lowest t is kept.
    TestFrame frame(4, Greys({{10, 2}, {200, 2}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 11);
    EXPECT_EQ(result.scale, 190);
}

TEST_F(BiThr, FlatImageHasThresholdAndContrastZero) {
    for (const int grey : {0, 77, 254, 255}) {
        TestFrame frame(10, 10, static_cast<uint8_t>(grey));
        const Threshold result = ThresholdOf(frame);
        EXPECT_EQ(result.thr, 0) << grey;
        EXPECT_EQ(result.scale, 0) << grey;
    }
}

TEST_F(BiThr, CountersOf256WrapToZero) {
    TestFrame frame(32, Greys({{10, 256}, {200, 256}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 0);
    EXPECT_EQ(result.scale, 0);
}

TEST_F(BiThr, OnlyTheRemainderOfAWrappedCounterCounts) {
    // The 256 tens vanish; mean (2560 + 200 + 400) / 260 = 12. Classes {100, 100} and {200, 200}:
    // t = 1..100: 4 * (150 - 12)^2 = 76176; t = 101: 2 * 88^2 + 2 * 188^2 = 86176.
    TestFrame frame(260, Greys({{10, 256}, {100, 2}, {200, 2}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 101);
    EXPECT_EQ(result.scale, 100);
}

TEST_F(BiThr, Grey255CountsInTheMeanButInNeitherClass) {
    // mean (20 + 510) / 4 = 132. t = 1: all below t empty, above {10, 10}: 2 * (10 - 132)^2 is
    // positive already, and no later t exceeds it.
    TestFrame frame(4, Greys({{10, 2}, {255, 2}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 1);
    EXPECT_EQ(result.scale, 10);
}

TEST_F(BiThr, Grey254IsInTheUpperClassOfEveryThreshold) {
    // mean (20 + 508) / 4 = 132; t = 11: 2 * 122^2 + 2 * 122^2.
    TestFrame frame(4, Greys({{10, 2}, {254, 2}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 11);
    EXPECT_EQ(result.scale, 244);
}

TEST_F(BiThr, LargestThresholdIs254) {
    // mean (253 * 1 + 254 * 3) / 4 = 253; t = 254: {253}: 0, {254 x 3}: 3 * 1; t <= 253: mean of
    // the one class 253: 0.
    TestFrame frame(4, Greys({{253, 1}, {254, 3}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 254);
    EXPECT_EQ(result.scale, 1);
}

TEST_F(BiThr, TruncatedMeanOfOneClassCanBeatTwoClasses) {
    // mean (0 + 4 + 255) / 4 = 64. t = 1: {0}: 64^2, {2, 2}: 2 * 62^2, 11784 together; t = 3:
    // {0, 2, 2} of mean 4 / 3 = 1: 3 * 63^2 = 11907, against an empty class of mean 0.
    TestFrame frame(4, Greys({{0, 1}, {2, 2}, {255, 1}}));
    const Threshold result = ThresholdOf(frame);
    EXPECT_EQ(result.thr, 3);
    EXPECT_EQ(result.scale, 1);
}

TEST_F(BiThr, RefusesNullPointersAndEmptyFrames) {
    TestFrame frame(4, 4, 3);
    const NaviFrame_t good = *frame.Get();
    int32_t thr = 5;
    int32_t scale = 6;
    EXPECT_EQ(CalcBiThr(frame.Get(), nullptr, &scale), -1);
    EXPECT_EQ(CalcBiThr(frame.Get(), &thr, nullptr), -1);
    frame->pType = nullptr;
    EXPECT_EQ(CalcBiThr(frame.Get(), &thr, &scale), -1);
    *frame.Get() = good;
    frame->pData = nullptr;
    EXPECT_EQ(CalcBiThr(frame.Get(), &thr, &scale), -1);
    *frame.Get() = good;
    frame->width = 0;
    EXPECT_EQ(CalcBiThr(frame.Get(), &thr, &scale), -1);
    frame->width = -4;
    EXPECT_EQ(CalcBiThr(frame.Get(), &thr, &scale), -1);
    EXPECT_EQ(thr, 5);
    EXPECT_EQ(scale, 6);
}

class FingerRidge : public NaviTest {};

TEST_F(FingerRidge, PixelsAtTheThresholdAreMarked) {
    TestFrame frame(3, {10, 50, 51}, 1);
    GetFingerRidge(frame.Get(), 50);
    EXPECT_EQ(frame.Types(), (std::vector<uint8_t>{1, 1, 0}));
}

TEST_F(FingerRidge, EverythingBetweenTwoDarkPixelsOfARowOrColumnIsFinger) {
    TestFrame frame(5, 5, 200);
    frame.Grey(0, 0) = frame.Grey(0, 4) = frame.Grey(4, 0) = 10;
    GetFingerRidge(frame.Get(), 50);
    TestFrame expected(5, 5);
    expected.Mark(0, 0, 1, 5).Mark(0, 0, 5, 1);
    EXPECT_EQ(frame.Types(), expected.Types());
}

TEST_F(FingerRidge, FillingIsDoneTwiceAndNotThrice) {
    // Columns of pass 1 join (0,0) and (6,0); rows of pass 2 join (3,0) and (3,4); columns of pass
    // 2 join (3,2) and (8,2). A third pass would join (7,2) and (7,6).
    TestFrame frame(7, 9, 200);
    for (const auto& [row, column] :
         std::vector<std::pair<int32_t, int32_t>>{{0, 0}, {6, 0}, {3, 4}, {8, 2}, {7, 6}})
        frame.Grey(row, column) = 10;
    GetFingerRidge(frame.Get(), 50);
    TestFrame expected(7, 9);
    expected.Mark(0, 0, 7, 1).Mark(3, 0, 1, 5).Mark(3, 2, 6, 1).Mark(7, 6, 1, 1);
    EXPECT_EQ(frame.Types(), expected.Types());
}

TEST_F(FingerRidge, NoDarkPixelClearsTheMask) {
    TestFrame frame(6, 4, 200, 1);
    GetFingerRidge(frame.Get(), 50);
    EXPECT_EQ(frame.Types(), std::vector<uint8_t>(24, 0));
}

class Stretch : public NaviTest {};

TEST_F(Stretch, PercentilePointsBecomeTheEndsOfTheScale) {
    Params().Set("s_cutOffPercent", 3).Apply();
    // One masked pixel of each grey 1..100: the cumulative count of grey g is g. Limits 300 and
    // 9700: 100 * 3 <= 300 < 100 * 4 gives min 3; 100 * 96 < 9700 <= 100 * 97 gives max 97.
    std::vector<uint8_t> greys;
    for (int grey = 1; grey <= 100; ++grey)
        greys.push_back(static_cast<uint8_t>(grey));
    TestFrame frame(100, greys, 1);
    ASSERT_EQ(StretchRange(frame.Get(), 255), 0);
    EXPECT_EQ(frame.Grey(0, 2), 0);     // 3
    EXPECT_EQ(frame.Grey(0, 96), 255);  // 97
    EXPECT_EQ(frame.Grey(0, 0), 0);     // 1: -2 * 255 / 94 clamps
    EXPECT_EQ(frame.Grey(0, 99), 255);  // 100: 97 * 255 / 94 = 263 clamps
    EXPECT_EQ(frame.Grey(0, 49), 127);  // 50: 47 * 255 / 94 = 127.5
    EXPECT_EQ(frame.Grey(0, 3), 2);     // 4: 255 / 94 = 2.7
}

TEST_F(Stretch, PixelsOutsideTheMaskKeepTheirGrey) {
    Params().Set("s_cutOffPercent", 0).Apply();
    TestFrame frame(4, {10, 20, 20, 10}, 1);
    frame.Type(0, 2) = 0;
    frame.Type(0, 3) = 255;
    // masked {10, 20}, limits 0 and 200: min 9 (nothing up to 9, one up to 10), max 20;
    // 10 -> 1 * 255 / 11 = 23, 20 -> 255.
    ASSERT_EQ(StretchRange(frame.Get(), 255), 0);
    EXPECT_EQ(frame.Greys(), (std::vector<uint8_t>{23, 255, 20, 10}));
}

TEST_F(Stretch, ScaleIsTheTopOfTheResult) {
    Params().Set("s_cutOffPercent", 0).Apply();
    TestFrame frame(2, {10, 20}, 1);
    ASSERT_EQ(StretchRange(frame.Get(), 110), 0);
    EXPECT_EQ(frame.Greys(), (std::vector<uint8_t>{10, 110}));  // 1 and 11 times 110 / 11
}

TEST_F(Stretch, GreyZeroIsCounted) {
    Params().Set("s_cutOffPercent", 3).Apply();
    // 10 of 100 are 0: the low limit 300 is passed before grey 1, so min stays 0; max is 100, for
    // 100 * 10 < 9700 <= 100 * 100. Without the zeros 90 would not reach 9700 and nothing changed.
    TestFrame frame(100, Greys({{0, 10}, {100, 90}}), 1);
    ASSERT_EQ(StretchRange(frame.Get(), 255), 0);
    EXPECT_EQ(frame.Greys(), Greys({{0, 10}, {255, 90}}));
}

TEST_F(Stretch, NoMaskedPixelChangesNothing) {
    Params().Apply();
    TestFrame frame(8, NoisePatch(0, 0, 8, 8), 0);
    ASSERT_EQ(StretchRange(frame.Get(), 255), 0);
    EXPECT_EQ(frame.Greys(), NoisePatch(0, 0, 8, 8));
}

TEST_F(Stretch, RefusesAFrameWithoutPixels) {
    TestFrame frame(4, 4, 3, 1);
    const NaviFrame_t good = *frame.Get();
    frame->pType = nullptr;
    EXPECT_EQ(StretchRange(frame.Get(), 255), -1);
    *frame.Get() = good;
    frame->pData = nullptr;
    EXPECT_EQ(StretchRange(frame.Get(), 255), -1);
    *frame.Get() = good;
    frame->height = 0;
    EXPECT_EQ(StretchRange(frame.Get(), 255), -1);
}

class PreProcess : public NaviTest {};

TEST_F(PreProcess, HgMarksGreysUpTo128AndNothingElse) {
    Params().Set("s_modeFlag", 1).Apply();
    TestFrame frame(40, 48, 129, 1);
    frame.Grey(0, 0) = 128;
    frame.Grey(0, 1) = 0;
    frame.Grey(0, 3) = 100;  // between two dark pixels nothing is filled
    const std::vector<uint8_t> greys = frame.Greys();
    ASSERT_EQ(ImgPreProcess(frame.Get()), 0);
    TestFrame expected(40, 48);
    expected.Type(0, 0) = expected.Type(0, 1) = expected.Type(0, 3) = 1;
    EXPECT_EQ(frame.Types(), expected.Types());
    EXPECT_EQ(frame.Greys(), greys);
    EXPECT_EQ(frame->range, 0);
}

TEST_F(PreProcess, FpStoresContrastMaskAndStretchedGreys) {
    Params().Apply();
    // 1008 pixels of 10 (240 beyond three wraps), 1008 of 200 (the same): mean 105, t = 11.
    TestFrame frame(56, 36, 200);
    frame.Paint(0, 0, 36, 28, 10);
    ASSERT_EQ(ImgPreProcess(frame.Get()), 0);
    EXPECT_EQ(frame->range, 190);
    TestFrame expected(56, 36);
    expected.Mark(0, 0, 36, 28);
    EXPECT_EQ(frame.Types(), expected.Types());
    // The mask is flat 10: min 9, max 10, so 10 becomes 255.
    EXPECT_EQ(frame.Grey(0, 0), 255);
    EXPECT_EQ(frame.Grey(35, 27), 255);
    EXPECT_EQ(frame.Grey(0, 28), 200);
}

TEST_F(PreProcess, FlatImageHasAnEmptyMaskAndIsUnchanged) {
    Params().Apply();
    TestFrame frame(56, 36, 77, 1);
    ASSERT_EQ(ImgPreProcess(frame.Get()), 0);
    EXPECT_EQ(frame->range, 0);
    EXPECT_EQ(frame.Types(), std::vector<uint8_t>(2016, 0));
    EXPECT_EQ(frame.Greys(), std::vector<uint8_t>(2016, 77));
}

TEST_F(PreProcess, FlatBlackImageIsAllFingerAndUnchanged) {
    Params().Apply();
    TestFrame frame(56, 36, 0);
    ASSERT_EQ(ImgPreProcess(frame.Get()), 0);
    EXPECT_EQ(frame.Types(), std::vector<uint8_t>(2016, 1));
    EXPECT_EQ(frame.Greys(), std::vector<uint8_t>(2016, 0));
}

TEST_F(PreProcess, FpRefusesAFrameWithoutPixels) {
    Params().Apply();
    NaviFrame_t empty{};
    EXPECT_EQ(ImgPreProcess(&empty), -1);
}

}  // namespace
