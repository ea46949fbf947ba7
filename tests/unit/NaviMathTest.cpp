// The integer helpers: wrapping arithmetic, the integer square root.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <cstdint>
#include <limits>

#include "base/NaviMath.h"

namespace {

using namespace fpnavi;

constexpr int32_t kMin = std::numeric_limits<int32_t>::min();
constexpr int32_t kMax = std::numeric_limits<int32_t>::max();

TEST(WrapArithmetic, KeepsTheLow32Bits) {
    EXPECT_EQ(WrapAdd(kMax, 1), kMin);
    EXPECT_EQ(WrapSub(kMin, 1), kMax);
    // (2^31 - 1)^2 = 2^62 - 2^32 + 1
    EXPECT_EQ(WrapMul(kMax, kMax), 1);
    EXPECT_EQ(WrapMul(65536, 65536), 0);
    EXPECT_EQ(WrapAddU(0xFFFFFFFFU, 2U), 1U);
    EXPECT_EQ(WrapSubU(0U, 1U), 0xFFFFFFFFU);
}

TEST(WrapArithmetic, AbsOfTheSmallestIntegerIsItself) {
    EXPECT_EQ(WrapAbs(kMin), kMin);
    EXPECT_EQ(WrapAbs(-5), 5);
    EXPECT_EQ(WrapAbs(5), 5);
    EXPECT_EQ(WrapDiv(kMin, -1), kMin);
}

TEST(WrapArithmetic, DivisionTruncatesTowardZero) {
    EXPECT_EQ(WrapDiv(-7, 2), -3);
    EXPECT_EQ(WrapDiv(7, -2), -3);
}

TEST(IntSqrt, SmallValues) {
    EXPECT_EQ(IntSqrt(0), 0);
    EXPECT_EQ(IntSqrt(1), 1);
    EXPECT_EQ(IntSqrt(3), 1);
    EXPECT_EQ(IntSqrt(4), 2);
    EXPECT_EQ(IntSqrt(15), 3);
    EXPECT_EQ(IntSqrt(16), 4);
}

TEST(IntSqrt, LargestValueWithAnExactRoot) {
    // 32767^2 = 1073676289 <= 2^30 - 1 < 32768^2 = 2^30
    EXPECT_EQ(IntSqrt(1073741823), 32767);
}

TEST(IntSqrt, SquaresWrapFromTwoToThe30On) {
    // 16 shifts by two: hi 65536, lo 32768. mid 49152: 49152^2 = 2415919104 wraps below zero, so
    // x is above it and lo rises past every mid; the last correction adds one to 65536.
    EXPECT_EQ(IntSqrt(1073741824), 65537);
}

TEST(IntSqrt, NegativeValuesGiveMinusOne) {
    // No shift: hi 1, lo 0; mid 0 gives hi -1; 0 is above x, so 0 - 1.
    EXPECT_EQ(IntSqrt(-1), -1);
    EXPECT_EQ(IntSqrt(-1000000), -1);
    EXPECT_EQ(IntSqrt(kMin), -1);
}

TEST(IntSqrt, FloorAroundEveryPerfectSquareBelowTwoToThe30) {
    for (int32_t root = 1; root < 32768; ++root) {
        ASSERT_EQ(IntSqrt(root * root), root);
        ASSERT_EQ(IntSqrt(root * root - 1), root - 1);
        ASSERT_EQ(IntSqrt(root * root + root), root);
    }
}

RC_GTEST_PROP(IntSqrt, IsTheFloorBelowTwoToThe30, ()) {
    const int32_t x = *rc::gen::inRange<int32_t>(0, 1 << 30);
    const int64_t root = IntSqrt(x);
    RC_ASSERT(root >= 0);
    RC_ASSERT(root * root <= x);
    RC_ASSERT((root + 1) * (root + 1) > x);
}

}  // namespace
