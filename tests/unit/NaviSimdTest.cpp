// The sixteen-byte operations against one byte after the other, at all values that these can have.
// The same tests run with the plain loops in place of the processor's operations.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <random>

#include "base/NaviSimd.h"

namespace {

using namespace fpnavi;

using Lanes = std::array<uint8_t, kLanes>;

Bytes16 Load(const Lanes& lanes) {
    return Load16(lanes.data());
}

Lanes Stored(Bytes16 bytes) {
    Lanes lanes;
    Store16(lanes.data(), bytes);
    return lanes;
}

Lanes RandomLanes(std::mt19937& random) {
    Lanes lanes;
    for (uint8_t& lane : lanes)
        lane = static_cast<uint8_t>(random() & 255U);
    return lanes;
}

// The bytes from first to first + 15.
Lanes From(int32_t first) {
    Lanes lanes;
    for (int32_t i = 0; i < kLanes; ++i)
        lanes[static_cast<size_t>(i)] = static_cast<uint8_t>(first + i);
    return lanes;
}

template <typename Plain>
void ExpectEachByte(const Lanes& result, const Lanes& a, uint8_t b, Plain plain) {
    for (size_t i = 0; i < a.size(); ++i)
        ASSERT_EQ(result[i], static_cast<uint8_t>(plain(a[i], b))) << int32_t{a[i]} << ", " << +b;
}

TEST(NaviSimd, OperationsOnAllPairsOfBytes) {
    for (int32_t first = 0; first < 256; first += kLanes) {
        const Lanes lanes = From(first);
        const Bytes16 a = Load(lanes);
        for (int32_t value = 0; value < 256; ++value) {
            const auto b = static_cast<uint8_t>(value);
            const Bytes16 all = Splat16(b);
            ExpectEachByte(Stored(And16(a, all)), lanes, b, [](int x, int y) { return x & y; });
            ExpectEachByte(Stored(Or16(a, all)), lanes, b, [](int x, int y) { return x | y; });
            ExpectEachByte(Stored(AndNot16(a, all)), lanes, b, [](int x, int y) { return x & ~y; });
            ExpectEachByte(Stored(Excess16(a, all)), lanes, b,
                           [](int x, int y) { return std::max(x - y, 0); });
            ExpectEachByte(Stored(Equal16(a, all)), lanes, b,
                           [](int x, int y) { return x == y ? 255 : 0; });
        }
    }
}

void ExpectScaled(uint32_t factor) {
    for (int32_t first = 0; first < 256; first += kLanes) {
        const Lanes scaled = Stored(Scale16(Load(From(first)), factor));
        for (uint32_t i = 0; i < kLanes; ++i) {
            const uint64_t product = (static_cast<uint64_t>(first) + i) * factor >> 16;
            ASSERT_EQ(scaled[i], std::min<uint64_t>(product, 255))
                << static_cast<uint32_t>(first) + i << " * " << factor;
        }
    }
}

TEST(Scale16, EveryQuotientOfAScaleAndARange) {
    for (uint32_t scale = 0; scale < 256; ++scale) {
        for (uint32_t range = 1; range < 256; ++range)
            ExpectScaled(((scale << 16) + range - 1) / range);
    }
}

TEST(Scale16, FactorsAroundWholeNumbersAndTheLargest) {
    for (uint32_t whole = 0; whole <= 255; ++whole) {
        for (const uint32_t part : {0U, 1U, 0x7FFFU, 0x8000U, 0x8001U, 0xFFFFU})
            ExpectScaled(std::min(whole << 16 | part, 255U << 16));
    }
}

TEST(FirstBytes, EveryCount) {
    for (int32_t count = 0; count <= kLanes; ++count) {
        const Lanes lanes = Stored(FirstBytes(count));
        for (int32_t i = 0; i < kLanes; ++i)
            EXPECT_EQ(lanes[static_cast<size_t>(i)], i < count ? 255 : 0)
                << count << ", byte " << i;
    }
}

TEST(LaneNumbers, AreTheBytesFrom0To15) {
    EXPECT_EQ(Stored(LaneNumbers()), From(0));
}

TEST(SpreadBits, LowestSixteenBitsBecomeBytes) {
    for (uint32_t bits = 0; bits <= 0x2FFFF; ++bits) {
        const Lanes lanes = Stored(SpreadBits(bits));
        for (size_t i = 0; i < lanes.size(); ++i)
            ASSERT_EQ(lanes[i], bits >> i & 1U) << bits << ", byte " << i;
    }
}

TEST(TopBits16, TakesTheTopBitOfEachByteAlone) {
    for (int32_t byte = 0; byte < kLanes; ++byte) {
        for (int32_t bit = 0; bit < 8; ++bit) {
            Lanes lanes{};
            lanes[static_cast<size_t>(byte)] = static_cast<uint8_t>(1 << bit);
            EXPECT_EQ(TopBits16(Load(lanes)), bit == 7 ? 1U << byte : 0U);
        }
    }
}

int32_t PlainDifference(const Lanes& a, const Lanes& b) {
    int32_t sum = 0;
    for (size_t i = 0; i < a.size(); ++i)
        sum += std::max(a[i], b[i]) - std::min(a[i], b[i]);
    return sum;
}

TEST(Sums, BytesAndDifferencesAddUp) {
    std::mt19937 random(51);
    for (int32_t round = 0; round < 2000; ++round) {
        Sums sums = NoSums();
        int32_t expected = 0;
        for (uint64_t n = random() % 20; n > 0; --n) {
            const Lanes a = RandomLanes(random);
            const Lanes b = RandomLanes(random);
            const Lanes none{};
            sums = AddDiffs(sums, Load(a), Load(b));
            sums = AddBytes(sums, Load(b));
            expected += PlainDifference(a, b) + PlainDifference(b, none);
        }
        ASSERT_EQ(Total(sums), expected);
        ASSERT_EQ(Total(AddSums(sums, sums)), 2 * expected);
    }
}

TEST(Sums, OfWhiteBytesUpToTwoToTheThirtyFirst) {
    const Bytes16 white = Splat16(255);
    Sums sums = NoSums();
    int64_t expected = 0;
    for (; expected + 255 * kLanes < int64_t{1} << 31; expected += 255 * kLanes)
        sums = AddBytes(sums, white);
    EXPECT_EQ(Total(sums), expected);
}

Sums SumsOf(std::mt19937& random, uint32_t* total) {
    const Lanes a = RandomLanes(random);
    const Lanes b = RandomLanes(random);
    const Lanes c = RandomLanes(random);
    const Lanes d = RandomLanes(random);
    *total = static_cast<uint32_t>(PlainDifference(a, b) + PlainDifference(c, d));
    return AddDiffs(AddDiffs(NoSums(), Load(a), Load(b)), Load(c), Load(d));
}

TEST(Totals, OfFourComeInTheirOrder) {
    std::mt19937 random(52);
    for (int32_t round = 0; round < 2000; ++round) {
        uint32_t expected[4];
        const Sums a = SumsOf(random, &expected[0]);
        const Sums b = SumsOf(random, &expected[1]);
        const Sums c = SumsOf(random, &expected[2]);
        const Sums d = SumsOf(random, &expected[3]);
        uint32_t totals[5] = {0, 0, 0, 0, 77};
        StoreQuads(totals, Totals(a, b, c, d));
        ASSERT_TRUE(std::equal(expected, expected + 4, totals));
        ASSERT_EQ(totals[4], 77U);
    }
}

// Sums of up to 64 greys, divided by 64 and by less, as far as the quotient is a byte.
TEST(StoreScaled, EverySumOfUpTo64Greys) {
    for (uint32_t sum = 0; sum <= 64 * 255; ++sum) {
        Sums sums = NoSums();
        Lanes rest{};
        uint32_t left = sum;
        for (; left >= 255 * kLanes; left -= 255 * kLanes)
            sums = AddBytes(sums, Splat16(255));
        for (uint8_t& lane : rest) {
            lane = static_cast<uint8_t>(std::min(left, 255U));
            left -= lane;
        }
        sums = AddBytes(sums, Load(rest));
        const uint32_t divisor = std::max((sum + 254) / 255, 1U);
        for (const uint32_t pixels : {divisor, (divisor + 64) / 2, 64U}) {
            const uint32_t factor = ((1U << 20) + pixels - 1) / pixels;
            uint8_t bytes[5] = {0, 0, 0, 0, 77};
            StoreScaled(bytes, Totals(sums, NoSums(), sums, sums), factor, 20);
            const auto mean = static_cast<uint8_t>(sum / pixels);
            const uint8_t expected[5] = {mean, 0, mean, mean, 77};
            ASSERT_TRUE(std::equal(expected, expected + 5, bytes)) << sum << " / " << pixels;
        }
    }
}

}  // namespace
