// What the threshold search could get wrong, each case made for one of these mistakes. The
// expected numbers are worked out beside them.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <limits>
#include <utility>

#include "StepFrames.h"
#include "frame/PreProcess.h"

namespace fpnavi_test {
namespace {

struct Threshold {
    int32_t thr;
    int32_t scale;

    bool operator==(const Threshold& other) const {
        return thr == other.thr && scale == other.scale;
    }
};

std::ostream& operator<<(std::ostream& out, const Threshold& threshold) {
    return out << "threshold " << threshold.thr << ", scale " << threshold.scale;
}

// The threshold of a one-row frame of the given counts of greys; the same from both sides.
Threshold ThresholdOf(std::initializer_list<std::pair<int32_t, uint8_t>> countedGreys) {
    std::vector<uint8_t> greys;
    for (const auto& [count, grey] : countedGreys)
        greys.insert(greys.end(), static_cast<size_t>(count), grey);
    const FrameSize size = {static_cast<int32_t>(greys.size()), 1};
    TwinFrame twin(size, greys, FlatBytes(size, 0));
    Threshold module = {-1, -1};
    Threshold plain = {-2, -2};
    EXPECT_EQ(fpnavi::CalcBiThr(twin.Module(), &module.thr, &module.scale), 0);
    EXPECT_EQ(reference::CalcBiThr(twin.Plain(), &plain.thr, &plain.scale), 0);
    EXPECT_EQ(module, plain);
    return module;
}

// 256 pixels of grey 0 count as none. The mean is 30000 / 456 = 65. Threshold 1: 200 * 85^2 =
// 1445000; threshold 101: 100 * 35^2 + 100 * 135^2 = 1945000. Counted in full, threshold 1 would
// have 256 * 65^2 + 1445000 = 2526600 and win.
TEST(StepCalcBiThrTrap, CountersWrapAt256) {
    EXPECT_EQ(ThresholdOf({{256, 0}, {100, 100}, {100, 200}}), (Threshold{101, 100}));
}

// The mean of all pixels is 10000 / 356 = 28, so that the 100 pixels that still count lie apart
// from it; the mean of these alone, 100, would leave no threshold any variance. In the second frame
// 10 pixels still count, and lie at the mean of all; the sum of the wrapped counts, 1000 for 522
// pixels, would give them a distance.
TEST(StepCalcBiThrTrap, MeanIsTakenBeforeTheCountersWrap) {
    EXPECT_EQ(ThresholdOf({{256, 0}, {100, 100}}), (Threshold{1, 100}));
    EXPECT_EQ(ThresholdOf({{256, 50}, {256, 150}, {10, 100}}), (Threshold{0, 0}));
}

// Grey 255 moves the mean to 177, but threshold 1 has the 100 pixels of grey 100 above it alone:
// 100 * 77^2. As part of the class, 255 would leave it no distance, and 101 would win.
TEST(StepCalcBiThrTrap, Grey255IsInNeitherClass) {
    EXPECT_EQ(ThresholdOf({{100, 100}, {100, 255}}), (Threshold{1, 100}));
}

// Grey 0 does not occur. Threshold 1 and threshold 101 part the pixels alike, into none and all;
// the first one tried is kept.
TEST(StepCalcBiThrTrap, FirstThresholdIsTriedThoughItsBinIsEmpty) {
    EXPECT_EQ(ThresholdOf({{10, 100}, {30, 255}}), (Threshold{1, 100}));
    EXPECT_EQ(ThresholdOf({{10, 0}, {30, 255}}), (Threshold{1, 0}));
}

// Every threshold from 11 to 200 parts the pixels alike; the first is kept.
TEST(StepCalcBiThrTrap, FirstOfEqualThresholdsIsKept) {
    EXPECT_EQ(ThresholdOf({{50, 10}, {50, 200}}), (Threshold{11, 190}));
}

TEST(StepCalcBiThrTrap, FlatFramesHaveNoThreshold) {
    for (int32_t grey = 0; grey < 256; ++grey)
        EXPECT_EQ(ThresholdOf({{77, static_cast<uint8_t>(grey)}}), (Threshold{0, 0})) << grey;
}

// The classes' sums of squares pass 2^31 only beside a mean that has wrapped itself, from 2^31 /
// 254 pixels on. 255 pixels of each grey below 254, the rest 254: the mean is near -246, the class
// above threshold 1 has about 64,000 pixels 373 levels from it.
TEST(StepCalcBiThrTrap, VarianceThatPasses32BitsWrapsAlike) {
    const FrameSize size = {4096, 2100};
    std::vector<uint8_t> greys = FlatBytes(size, 254);
    size_t p = 0;
    for (int32_t grey = 0; grey < 254; ++grey) {
        for (int32_t n = 0; n < 255; ++n)
            greys[p++] = static_cast<uint8_t>(grey);
    }
    int64_t sum = 0;
    for (const uint8_t grey : greys)
        sum += grey;
    ASSERT_GT(sum, std::numeric_limits<int32_t>::max());
    const int64_t mean = (sum - (int64_t{1} << 32)) / static_cast<int64_t>(size.Pixels());
    ASSERT_LT(mean, -240);
    constexpr int64_t kAbove = 253 * 255;  // pixels of the greys 1..253
    ASSERT_GT(kAbove * (127 - mean) * (127 - mean), int64_t{1} << 32);

    TwinFrame twin(size, greys, FlatBytes(size, 0));
    Threshold module = {-1, -1};
    Threshold plain = {-2, -2};
    EXPECT_EQ(fpnavi::CalcBiThr(twin.Module(), &module.thr, &module.scale), 0);
    EXPECT_EQ(reference::CalcBiThr(twin.Plain(), &plain.thr, &plain.scale), 0);
    EXPECT_EQ(module, plain);
}

// A mean just above and below the wrap of its sum, for the same greys otherwise.
TEST(StepCalcBiThrTrap, LargeFramesOfNoiseWrapAlike) {
    for (uint64_t n = 0; n < 3; ++n) {
        host::SimRandom random = StepRandom(141, static_cast<int64_t>(n));
        const FrameSize size = {4096, random.Range(2056, 3300)};
        std::vector<uint8_t> greys(size.Pixels());
        for (uint8_t& grey : greys)
            grey = static_cast<uint8_t>(255 - (random.Next() & (n == 0 ? 1U : 127U)));
        TwinFrame twin(size, greys, FlatBytes(size, 0));
        Threshold module = {-1, -1};
        Threshold plain = {-2, -2};
        EXPECT_EQ(fpnavi::CalcBiThr(twin.Module(), &module.thr, &module.scale), 0);
        EXPECT_EQ(reference::CalcBiThr(twin.Plain(), &plain.thr, &plain.scale), 0);
        EXPECT_EQ(module, plain) << "frame " << n;
    }
}

// The first bit of a row, the last bit of it, and the last row.
TEST(StepGetFingerRidgeTrap, EdgesSpanFromTheFirstPixelToTheLast) {
    for (const FrameSize size : EdgeSizes()) {
        std::vector<uint8_t> greys = FlatBytes(size, 9);
        greys.front() = 3;
        greys.back() = 3;
        greys[static_cast<size_t>(size.width) - 1] = 3;
        TwinFrame twin(size, greys, FlatBytes(size, 255));
        fpnavi::GetFingerRidge(twin.Module(), 3);
        reference::GetFingerRidge(twin.Plain(), 3);
        EXPECT_TRUE(twin.Same());
        // The first row and the last column at first; then rows reach from neither to any other.
        const uint8_t* const type = twin.Module()->pType;
        EXPECT_EQ(std::count(type, type + size.width, 1), size.width);
        EXPECT_EQ(std::count(type, type + size.Pixels(), 1), size.width + size.height - 1);
    }
}

// Two pixels at any two places of a row, words apart: all between them is finger, nothing else is.
TEST(StepGetFingerRidgeTrap, EveryRunOfARowIsFilled) {
    constexpr FrameSize kSize = {193, 1};
    for (int32_t first = 0; first < kSize.width; ++first) {
        for (int32_t last = first; last < kSize.width; ++last) {
            std::vector<uint8_t> greys = FlatBytes(kSize, 200);
            greys[static_cast<size_t>(first)] = greys[static_cast<size_t>(last)] = 7;
            TwinFrame twin(kSize, greys, FlatBytes(kSize, 1));
            fpnavi::GetFingerRidge(twin.Module(), 7);
            std::vector<uint8_t> expected = FlatBytes(kSize, 0);
            std::fill(expected.begin() + first, expected.begin() + last + 1, uint8_t{1});
            ASSERT_TRUE(std::equal(expected.begin(), expected.end(), twin.Module()->pType))
                << first << " to " << last;
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
