// Sums of blocks of a frame: every width and place of a row's end, and nothing outside the frame.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <memory>
#include <random>

#include "base/ByteSums.h"

namespace {

using fpnavi::SumBlock;

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
    const std::unique_ptr<uint8_t[]> frame(new uint8_t[fpnavi::kMostSummed]);
    std::fill_n(frame.get(), fpnavi::kMostSummed, uint8_t{255});
    EXPECT_EQ(SumBlock(frame.get(), 0, fpnavi::kMostSummed, 1, 0), 255 << 22);
    EXPECT_EQ(SumBlock(frame.get(), 0, 2048, 2048, 2048), 255 << 22);
}

TEST(SumBlock, NoRowsSumUpToNothing) {
    const uint8_t frame[1] = {9};
    EXPECT_EQ(SumBlock(frame, 0, 1, 0, 1), 0);
}

}  // namespace
