// Words of a row and their bits at every edge.
#include <gtest/gtest.h>

#include <random>
#include <vector>

#include "base/BitRows.h"

namespace {

using namespace fpnavi;

TEST(WordsOf, AnotherWordBeginsAfter64Pixels) {
    EXPECT_EQ(WordsOf(1), 1);
    EXPECT_EQ(WordsOf(63), 1);
    EXPECT_EQ(WordsOf(64), 1);
    EXPECT_EQ(WordsOf(65), 2);
    EXPECT_EQ(WordsOf(128), 2);
    EXPECT_EQ(WordsOf(129), 3);
    EXPECT_EQ(WordsOf(4096), 64);
}

bool BitOf(uint64_t bits, int32_t bit) {
    return (bits >> bit & 1U) != 0;
}

TEST(FirstBits, HasAsManyBitsAsAskedFor) {
    for (int32_t count = 1; count <= 130; ++count) {
        for (int32_t bit = 0; bit < 64; ++bit)
            ASSERT_EQ(BitOf(FirstBits(count), bit), bit < count) << count << ", bit " << bit;
    }
}

TEST(BitsBetween, EveryPairOfEnds) {
    for (int32_t first = 0; first < 64; ++first) {
        for (int32_t last = first + 1; last <= 130; ++last) {
            const uint64_t bits = BitsBetween(first, last);
            for (int32_t bit = 0; bit < 64; ++bit)
                ASSERT_EQ(BitOf(bits, bit), first <= bit && bit < last)
                    << first << " to " << last << ", bit " << bit;
        }
    }
}

// The row ends 15 bytes before its memory does, and these are all small.
TEST(AtMostBits, EveryWidthAndNoPixelBehindIt) {
    std::mt19937 random(41);
    for (int32_t width = 1; width <= kWordPixels; ++width) {
        for (const int32_t value : {0, 1, 100, 127, 128, 254, 255}) {
            std::vector<uint8_t> row(static_cast<size_t>(width) + 15, 0);
            for (int32_t c = 0; c < width; ++c)
                row[static_cast<size_t>(c)] = static_cast<uint8_t>(
                    random() % 2 == 0 ? static_cast<uint32_t>(value) + random() % 2 : random());
            const uint64_t bits = AtMostBits(row.data(), width, static_cast<uint8_t>(value));
            for (int32_t bit = 0; bit < 64; ++bit)
                ASSERT_EQ(BitOf(bits, bit), bit < width && row[static_cast<size_t>(bit)] <= value)
                    << "width " << width << ", value " << value << ", bit " << bit;
        }
    }
}

}  // namespace
