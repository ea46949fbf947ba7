// Sums of blocks of a frame: every width and place of a row's end, and nothing outside the frame.
// Counting bytes and four blocks by grey level, and the levels at which counts exceed their limits.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <iterator>
#include <memory>
#include <random>
#include <vector>

#include "base/GreyHistogram.h"

namespace {

using namespace fpnavi;

struct Block {
    int32_t left, top, width, height;
};

int32_t PlainSum(const uint8_t* frame, int32_t stride, const Block& block) {
    int32_t sum = 0;
    for (int32_t row = block.top; row < block.top + block.height; ++row) {
        for (int32_t column = block.left; column < block.left + block.width; ++column)
            sum += frame[row * stride + column];
    }
    return sum;
}

// The frame ends where its memory does, so that the address sanitizer sees a read beside it.
TEST(SumBlock, EveryBlockOfSmallFrames) {
    std::mt19937 random(21);
    const int32_t height = 2;
    for (int32_t stride = 1; stride <= 90; ++stride) {
        const size_t size = static_cast<size_t>(stride * height);
        const std::unique_ptr<uint8_t[]> frame(new uint8_t[size]);
        for (size_t p = 0; p < size; ++p)
            frame[p] = static_cast<uint8_t>(random() & 255U);
        for (Block block = {0, 0, 1, 1}; block.left < stride; ++block.left) {
            for (block.width = 1; block.left + block.width <= stride; ++block.width) {
                for (block.top = 0; block.top < height; ++block.top) {
                    block.height = height - block.top;
                    ASSERT_EQ(SumBlock(frame.get(), block.top * stride + block.left, block.width,
                                       block.height, stride),
                              PlainSum(frame.get(), stride, block))
                        << block.width << " x " << block.height << " at " << block.left << ", "
                        << block.top << " of " << stride << " columns";
                }
            }
        }
    }
}

TEST(SumBlock, LargestWhiteBlockDoesNotOverflow) {
    const std::unique_ptr<uint8_t[]> frame(new uint8_t[kMostSummed]);
    std::fill_n(frame.get(), kMostSummed, uint8_t{255});
    EXPECT_EQ(SumBlock(frame.get(), 0, kMostSummed, 1, 0), 255 << 22);
    EXPECT_EQ(SumBlock(frame.get(), 0, 2048, 2048, 2048), 255 << 22);
}

TEST(SumBlock, NoRowsSumUpToNothing) {
    const uint8_t frame[1] = {9};
    EXPECT_EQ(SumBlock(frame, 0, 1, 0, 1), 0);
}

using Histogram = std::array<int32_t, kGreyLevels>;

Histogram PlainCounts(const std::vector<uint8_t>& values) {
    Histogram hist{};
    for (const uint8_t value : values)
        ++hist[value];
    return hist;
}

// Runs of one value and random ones, of every count up to 40.
TEST(CountBytes, EveryCountOfValues) {
    std::mt19937 random(33);
    for (size_t count = 0; count <= 40; ++count) {
        for (const uint32_t levels : {1U, 2U, 256U}) {
            std::vector<uint8_t> values(count);
            for (uint8_t& value : values)
                value = static_cast<uint8_t>(255 - random() % levels);
            const Histogram expected = PlainCounts(values);
            int32_t hist[kGreyLevels];
            std::fill(std::begin(hist), std::end(hist), -7);
            CountBytes(values.data(), static_cast<int32_t>(count), hist);
            for (size_t level = 0; level < kGreyLevels; ++level)
                ASSERT_EQ(hist[level], expected[level]) << count << " values, grey " << level;
        }
    }
}

TEST(ByteCounter, CallsAddUpWhereverTheyAreCut) {
    std::mt19937 random(34);
    std::vector<uint8_t> values(300);
    for (uint8_t& value : values)
        value = static_cast<uint8_t>(random() % 5 * 60);
    const Histogram expected = PlainCounts(values);
    for (int32_t round = 0; round < 200; ++round) {
        ByteCounter counter;
        for (size_t at = 0; at < values.size();) {
            const size_t count = std::min<size_t>(random() % 12, values.size() - at);
            counter.Add(values.data() + at, static_cast<int32_t>(count));
            at += count;
        }
        for (size_t level = 0; level < kGreyLevels; ++level)
            ASSERT_EQ(counter.Of(static_cast<int32_t>(level)), expected[level]) << "grey " << level;
    }
}

TEST(CountFourBlocks, EachBlockHasItsOwnTable) {
    std::mt19937 random(31);
    for (int32_t width = 0; width <= 9; ++width) {
        for (int32_t height = 0; height <= 4; ++height) {
            const int32_t stride = 4 * width + height;  // up to four columns more than the blocks
            const size_t size = static_cast<size_t>(stride * height);
            const std::unique_ptr<uint8_t[]> greys(new uint8_t[size]);
            Histogram expected[kBlocksCounted] = {};
            for (size_t p = 0; p < size; ++p) {
                greys[p] = static_cast<uint8_t>(random() & 255U);
                const size_t column = p % static_cast<size_t>(stride);
                if (column < static_cast<size_t>(4 * width))
                    ++expected[column / static_cast<size_t>(width)][greys[p]];
            }
            int32_t hist[kBlocksCounted][kGreyLevels];
            CountFourBlocks(greys.get(), width, height, stride, hist);
            for (size_t block = 0; block < kBlocksCounted; ++block) {
                for (size_t level = 0; level < kGreyLevels; ++level)
                    ASSERT_EQ(hist[block][level], expected[block][level])
                        << width << " x " << height << ", block " << block << ", grey " << level;
            }
        }
    }
}

int32_t PlainLevelAbove(const Histogram& hist, int32_t limit) {
    int32_t upTo = 0;
    for (int32_t level = 1; level < kGreyLevels; ++level) {
        upTo += hist[static_cast<size_t>(level)];
        if (upTo > limit)
            return level;
    }
    return kGreyLevels;
}

void ExpectPlainLevels(const Histogram& hist, int32_t low, int32_t high) {
    const LevelPair levels = FirstLevelsAbove(hist.data(), low, high);
    EXPECT_EQ(levels.low, PlainLevelAbove(hist, low)) << "low limit " << low;
    EXPECT_EQ(levels.high, PlainLevelAbove(hist, high)) << "high limit " << high;
}

TEST(FirstLevelsAbove, OneLevelWithPixelsIsFoundWhereverItLies) {
    for (size_t level = 1; level < kGreyLevels; ++level) {
        Histogram hist{};
        hist[level] = 5;
        const LevelPair levels = FirstLevelsAbove(hist.data(), 4, 5);
        EXPECT_EQ(levels.low, static_cast<int32_t>(level));
        EXPECT_EQ(levels.high, kGreyLevels) << "never more than five";
    }
}

TEST(FirstLevelsAbove, PixelsOfGreyZeroDoNotCount) {
    Histogram hist{};
    hist[0] = 1 << 20;
    EXPECT_EQ(FirstLevelsAbove(hist.data(), 0, INT32_MAX).low, kGreyLevels);
    hist[1] = 1;
    EXPECT_EQ(FirstLevelsAbove(hist.data(), 0, INT32_MAX).low, 1);
    EXPECT_EQ(FirstLevelsAbove(hist.data(), 1, INT32_MAX).low, kGreyLevels);
}

TEST(FirstLevelsAbove, RandomCountsAndLimitsInEitherOrder) {
    std::mt19937 random(32);
    const auto below = [&random](uint32_t bound) {
        return static_cast<int32_t>(static_cast<uint32_t>(random()) % bound);
    };
    for (int32_t round = 0; round < 3000; ++round) {
        Histogram hist{};
        const int32_t levels = 1 + below(round % 2 == 0 ? 5 : 300);
        for (int32_t i = 0; i < levels; ++i)
            hist[static_cast<size_t>(below(kGreyLevels))] += below(9);
        ExpectPlainLevels(hist, below(20), below(1500));
        ExpectPlainLevels(hist, below(1500), below(20));
    }
}

}  // namespace
