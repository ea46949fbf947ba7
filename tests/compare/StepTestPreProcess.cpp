// The steps of pre-processing against the plain model: threshold, finger area, stretch.
#include <gtest/gtest.h>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "frame/PreProcess.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

void CompareThreshold(const TwinFrame& twin, ::NaviFrame_t* module, reference::NaviFrame_t* plain) {
    int32_t thr = -1;
    int32_t scale = -1;
    int32_t thrPlain = -2;
    int32_t scalePlain = -2;
    ASSERT_EQ(fpnavi::CalcBiThr(module, &thr, &scale), 0);
    ASSERT_EQ(reference::CalcBiThr(plain, &thrPlain, &scalePlain), 0);
    ASSERT_EQ(thr, thrPlain);
    ASSERT_EQ(scale, scalePlain);
    ASSERT_TRUE(twin.Same());
}

TEST(StepCalcBiThr, RandomFramesGiveTheSameThresholdAndScale) {
    const int64_t cases = StepCases(24000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(101, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        TwinFrame twin{size, RandomGreys(random, size), FlatBytes(size, 0)};
        CompareThreshold(twin, twin.Module(), twin.Plain());
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
    words.ExpectAll();
}

TEST(StepCalcBiThr, FramesBeyondTheCountersRangeGiveTheSame) {
    const int64_t cases = StepCases(3000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(102, i);
        const FrameSize size = {random.Range(100, 260), random.Range(2, 120)};
        TwinFrame twin{size, RandomGreys(random, size), FlatBytes(size, 0)};
        CompareThreshold(twin, twin.Module(), twin.Plain());
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
}

TEST(StepGetFingerRidge, RandomFramesGiveTheSameArea) {
    const int64_t cases = StepCases(70000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(111, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        const int32_t thr = RandomThreshold(random, 0, 255);
        TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
        fpnavi::GetFingerRidge(twin.Module(), thr);
        reference::GetFingerRidge(twin.Plain(), thr);
        ASSERT_TRUE(twin.Same()) << "case " << i << ", " << size.width << " x " << size.height
                                 << ", threshold " << thr;
    }
    words.ExpectAll();
}

// Few dark pixels: what is between them, in rows and columns, decides everything.
TEST(StepGetFingerRidge, SparsePixelsSpanTheSameArea) {
    const int64_t cases = StepCases(70000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(112, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        std::vector<uint8_t> greys = FlatBytes(size, 200);
        for (int32_t n = random.Below(8); n > 0; --n)
            greys[static_cast<size_t>(random.Below(static_cast<int32_t>(greys.size())))] = 99;
        TwinFrame twin{size, greys, RandomTypes(random, size)};
        fpnavi::GetFingerRidge(twin.Module(), 100);
        reference::GetFingerRidge(twin.Plain(), 100);
        ASSERT_TRUE(twin.Same()) << "case " << i << ", " << size.width << " x " << size.height;
    }
    words.ExpectAll();
}

TEST(StepStretchRange, RandomFramesGiveTheSameGreys) {
    const int64_t cases = StepCases(70000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(121, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        const int32_t cutOff =
            random.Chance(5) ? random.Range(-50000000, 50000000) : RandomThreshold(random, -1, 101);
        if (i % 8 == 0)
            SetStepParams({8, 8}, {{"s_cutOffPercent", cutOff}});
        const uint8_t scale = static_cast<uint8_t>(random.Chance(50) ? 255 : random.Below(256));
        TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::StretchRange(twin.Module(), scale),
                  reference::StretchRange(twin.Plain(), scale));
        ASSERT_TRUE(twin.Same()) << "case " << i << ", " << size.width << " x " << size.height
                                 << ", cut-off " << reference::s_cutOffPercent << ", scale "
                                 << int32_t{scale};
    }
    words.ExpectAll();
}

// Two greys at every distance, and every scale: all divisors that a span can be.
TEST(StepStretchRange, EverySpanAndScaleRoundsTheSame) {
    SetStepParams({8, 8}, {{"s_cutOffPercent", 0}});
    const FrameSize size = {256, 1};
    std::vector<uint8_t> types = FlatBytes(size, 1);
    for (int32_t span = 1; span < 256; ++span) {
        for (int32_t scale = span % 5; scale < 256; scale += 5) {
            std::vector<uint8_t> greys = FlatBytes(size, 0);
            for (size_t p = 0; p < greys.size(); ++p)
                greys[p] = static_cast<uint8_t>(p % static_cast<size_t>(span + 1));
            TwinFrame twin(size, greys, types);
            ASSERT_EQ(fpnavi::StretchRange(twin.Module(), static_cast<uint8_t>(scale)), 0);
            ASSERT_EQ(reference::StretchRange(twin.Plain(), static_cast<uint8_t>(scale)), 0);
            ASSERT_TRUE(twin.Same()) << "span " << span << ", scale " << scale;
        }
    }
}

// 50 pixels of grey 10, 45 of 20 and 5 of 200, a tenth cut off at each end: more than 10 pixels lie
// up to grey 10, which makes 9 the least, and 90 up to grey 20, the largest. Scale 100 stretches 1
// to 100 / 11 and 11 to 100; 191 gives 1736, which is clamped at 255 and not at the scale.
TEST(StepStretchRange, GreysAboveThePercentileClampAt255NotAtTheScale) {
    SetStepParams({8, 8}, {{"s_cutOffPercent", 10}});
    const FrameSize size = {100, 1};
    std::vector<uint8_t> greys(50, 10);
    greys.resize(95, 20);
    greys.resize(100, 200);
    TwinFrame twin(size, greys, FlatBytes(size, 1));
    ASSERT_EQ(fpnavi::StretchRange(twin.Module(), 100), 0);
    ASSERT_EQ(reference::StretchRange(twin.Plain(), 100), 0);
    EXPECT_TRUE(twin.Same());
    EXPECT_EQ(twin.Module()->pData[0], 9);
    EXPECT_EQ(twin.Module()->pData[94], 100);
    EXPECT_EQ(twin.Module()->pData[99], 255);
}

// A smaller share of bright pixels than is cut off, below every scale.
TEST(StepStretchRange, EveryScaleClampsAlike) {
    for (int32_t scale = 0; scale < 256; ++scale) {
        SimRandom random = StepRandom(122, scale);
        SetStepParams({8, 8}, {{"s_cutOffPercent", random.Range(1, 40)}});
        const FrameSize size = RandomSize(random);
        TwinFrame twin(size, RandomGreys(random, size), FlatBytes(size, 1));
        ASSERT_EQ(fpnavi::StretchRange(twin.Module(), static_cast<uint8_t>(scale)), 0);
        ASSERT_EQ(reference::StretchRange(twin.Plain(), static_cast<uint8_t>(scale)), 0);
        ASSERT_TRUE(twin.Same()) << "scale " << scale;
    }
}

TEST(StepImgPreProcess, RandomFramesComeOutTheSame) {
    const int64_t cases = StepCases(16000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(131, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        SetStepParams(size, {{"s_cutOffPercent", random.Range(0, 12)}});
        TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::ImgPreProcess(twin.Module()), reference::ImgPreProcess(twin.Plain()));
        ASSERT_TRUE(twin.Same()) << "case " << i << ", " << size.width << " x " << size.height;
    }
    words.ExpectAll();
}

// Every width of one word and a little more. Buffers end with the space behind the last pixel, so
// that the address sanitizer sees a step that reads or writes on.
TEST(StepImgPreProcess, EverySizeStaysInItsRoom) {
    SimRandom random = StepRandom(132, 0);
    for (int32_t width = 1; width <= 70; ++width) {
        for (const int32_t height : {1, 2, 3, 15, 16, 17, 63, 64, 65}) {
            const FrameSize size = {width, height};
            SetStepParams(size);
            TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
            ASSERT_EQ(fpnavi::ImgPreProcess(twin.Module()), reference::ImgPreProcess(twin.Plain()));
            ASSERT_TRUE(twin.Same()) << width << " x " << height;
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
