// The finger tests and their block measures against the plain model. The last test switches the
// double scan on, which stays for the life of the process.
#include <gtest/gtest.h>

#include <algorithm>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "Twin.h"
#include "gesture/Gesture.h"
#include "presence/FingerStatus.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

FrameSize StatusSize(SimRandom& random) {
    if (random.Chance(20))
        return {random.Range(1, 8), random.Range(1, 8)};
    return RandomSize(random);
}

TEST(StepBlockMeasures, RandomFramesGiveTheSame) {
    const int64_t cases = StepCases(40000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(601, i);
        const FrameSize size = StatusSize(random);
        const int32_t cutOff =
            random.Chance(5) ? random.Range(-50000000, 50000000) : RandomThreshold(random, -1, 101);
        SetStepParams(size, {{"s_cutOffPercent", cutOff}});
        const std::vector<uint8_t> greys = RandomGreys(random, size);
        int32_t module = -99;
        int32_t plain = -98;
        ASSERT_EQ(fpnavi::GetBlkMeanMin(greys.data(), &module), 0);
        ASSERT_EQ(reference::GetBlkMeanMin(greys.data(), &plain), 0);
        ASSERT_EQ(module, plain) << "least mean, case " << i;
        ASSERT_EQ(fpnavi::GetBlkMeanDiff(greys.data(), &module), 0);
        ASSERT_EQ(reference::GetBlkMeanDiff(greys.data(), &plain), 0);
        ASSERT_EQ(module, plain) << "spread of means, case " << i;
        ASSERT_EQ(fpnavi::GetGreyRange(greys.data(), &module), 0);
        ASSERT_EQ(reference::GetGreyRange(greys.data(), &plain), 0);
        ASSERT_EQ(module, plain) << "grey range, case " << i;
    }
}

TEST(StepBlockMeasures, EverySizeReadsNothingBehindTheLastPixel) {
    SimRandom random = StepRandom(602, 0);
    for (int32_t width = 1; width <= 70; ++width) {
        for (const int32_t height : {1, 2, 3, 4, 5, 8, 17, 36, 65}) {
            const FrameSize size = {width, height};
            SetStepParams(size);
            const std::vector<uint8_t> greys = RandomGreys(random, size);
            int32_t module[3] = {-9, -9, -9};
            int32_t plain[3] = {-8, -8, -8};
            fpnavi::GetBlkMeanMin(greys.data(), &module[0]);
            fpnavi::GetBlkMeanDiff(greys.data(), &module[1]);
            fpnavi::GetGreyRange(greys.data(), &module[2]);
            reference::GetBlkMeanMin(greys.data(), &plain[0]);
            reference::GetBlkMeanDiff(greys.data(), &plain[1]);
            reference::GetGreyRange(greys.data(), &plain[2]);
            for (size_t n = 0; n < 3; ++n)
                ASSERT_EQ(module[n], plain[n]) << width << " x " << height << ", measure " << n;
        }
    }
}

// Sides beyond those of random frames; greys of both a flat and a random frame.
TEST(StepBlockMeasures, LargeFramesGiveTheSame) {
    SimRandom random = StepRandom(603, 0);
    for (const FrameSize size : {FrameSize{127, 128}, FrameSize{300, 257}, FrameSize{640, 481}}) {
        SetStepParams(size);
        std::vector<uint8_t> greys(size.Pixels(), 250);
        for (int32_t round = 0; round < 3; ++round) {
            int32_t module[3] = {-9, -9, -9};
            int32_t plain[3] = {-8, -8, -8};
            fpnavi::GetBlkMeanMin(greys.data(), &module[0]);
            fpnavi::GetBlkMeanDiff(greys.data(), &module[1]);
            fpnavi::GetGreyRange(greys.data(), &module[2]);
            reference::GetBlkMeanMin(greys.data(), &plain[0]);
            reference::GetBlkMeanDiff(greys.data(), &plain[1]);
            reference::GetGreyRange(greys.data(), &plain[2]);
            for (size_t n = 0; n < 3; ++n)
                ASSERT_EQ(module[n], plain[n])
                    << size.width << " x " << size.height << ", measure " << n;
            for (uint8_t& grey : greys)
                grey = static_cast<uint8_t>(random.Below(round == 0 ? 256 : 40));
        }
    }
}

// The status of both sides, which is the same, as is the flag that it leaves.
int32_t Status(const std::vector<uint8_t>& greys) {
    const int32_t module = ::vmk_fp_navigation_detect_finger_status(greys.data());
    EXPECT_EQ(module, reference::vmk_fp_navigation_detect_finger_status(greys.data()));
    EXPECT_EQ(fpnavi::s_lastFrameFlag, reference::s_lastFrameFlag);
    return module;
}

TEST(StepFingerStatus, FpModeGivesTheSame) {
    const int64_t cases = StepCases(12000);
    int64_t fingers = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(611, i);
        const FrameSize size = StatusSize(random);
        SetStepParams(size, {{"s_fftResThreshold", RandomThreshold(random, 10, 120)},
                             {"s_meanThresholdFp", RandomThreshold(random, 10, 120)},
                             {"s_blkMeanDiffThreshold", RandomThreshold(random, 0, 60)},
                             {"s_rangeThreshold", RandomThreshold(random, 0, 100)},
                             {"s_cutOffPercent", RandomThreshold(random, 0, 12)}});
        fingers += Status(RandomGreys(random, size));
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
    EXPECT_GT(fingers, 0);
    EXPECT_LT(fingers, cases);
}

TEST(StepFingerStatus, HgModeGivesTheSame) {
    const int64_t cases = StepCases(30000);
    int64_t fingers = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(612, i);
        const FrameSize size = StatusSize(random);
        host::ParamBlock params = host::ParamsForMode(host::Mode::Hg, false);
        const auto set = [&params](const char* name, int32_t value) {
            host::ParamValue(params, name) = value;
        };
        set("s_blockWidthHg", size.width);
        set("s_blockHeightHg", size.height);
        set("s_blockColNumHg", 1);
        set("s_blockRowNumHg", 1);
        const bool smaller = random.Chance(20);
        set("s_imageWidthHg", smaller ? random.Range(0, size.width) : size.width);
        set("s_imageHeightHg", smaller ? random.Range(-1, size.height) : size.height);
        set("s_meanThreshold", RandomThreshold(random, 60, 240));
        set("s_highSensitiveMode", random.Below(2));
        SetStepParams(params);
        fingers += std::max(Status(RandomGreys(random, size)), 0);
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
    EXPECT_GT(fingers, 0);
    EXPECT_LT(fingers, cases);
}

// A mean of exactly the threshold is a finger in the hg mode; a spread or a range of exactly its
// threshold is one in the fp mode.
TEST(StepFingerStatusTrap, MeasuresOfExactlyTheThresholdDecideAlike) {
    const FrameSize size = {16, 16};
    host::ParamBlock params = host::ParamsForMode(host::Mode::Hg, false);
    for (const char* const name :
         {"s_blockWidthHg", "s_blockHeightHg", "s_imageWidthHg", "s_imageHeightHg"})
        host::ParamValue(params, name) = 16;
    host::ParamValue(params, "s_blockColNumHg") = 1;
    host::ParamValue(params, "s_blockRowNumHg") = 1;
    host::ParamValue(params, "s_meanThreshold") = 100;
    for (int32_t sensitive = 0; sensitive < 2; ++sensitive) {
        host::ParamValue(params, "s_highSensitiveMode") = sensitive;
        SetStepParams(params);
        EXPECT_EQ(Status(FlatBytes(size, 100)), 1);
        EXPECT_EQ(Status(FlatBytes(size, 101)), 0);
    }
    std::vector<uint8_t> darkQuadrant = FlatBytes(size, 200);
    for (size_t row = 8; row < 16; ++row)
        std::fill_n(darkQuadrant.begin() + static_cast<int64_t>(16 * row + 8), 8, uint8_t{100});
    EXPECT_EQ(Status(darkQuadrant), 1);
    darkQuadrant.back() = 164;  // 64 levels more on 64 pixels: a mean of 101
    EXPECT_EQ(Status(darkQuadrant), 0);
}

TEST(StepFingerStatusDoubleScan, RandomMapsGiveTheSame) {
    host::ParamBlock params = host::ParamsForMode(host::Mode::DoubleScan, false);
    const std::vector<uint8_t> greys(SizeOf(params).Pixels(), 128);
    const int64_t cases = StepCases(5000);
    int64_t fingers = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(621, i);
        host::ParamValue(params, "s_DoubleScanCvrThreshold") = RandomThreshold(random, 0, 60);
        SetStepParams(params);
        const auto zones = [&random] {
            const uint64_t bits = random.Next() & random.Next();
            return random.Chance(20) ? 0U : static_cast<uint32_t>(bits);
        };
        const uint32_t reg24 = zones();
        Twin::Get().Zones(reg24, zones());
        fingers += Status(greys);
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
    }
    ASSERT_FALSE(Twin::Get().Difference()) << *Twin::Get().Difference();
    EXPECT_GT(fingers, 0);
    EXPECT_LT(fingers, cases);
}

}  // namespace
}  // namespace fpnavi_test
