// Samples of what exhaustive_sqrt checks in full.
#include <gtest/gtest.h>

#include <limits>

#include "SqrtCheck.h"

namespace fpnavi_test {
namespace {

constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
constexpr int64_t kEnd = int64_t{std::numeric_limits<int32_t>::max()} + 1;

TEST(SampledRoots, Every65537thInput) {
    EXPECT_EQ(FirstWrongRoot(kMin, kEnd, 65537), std::nullopt);
}

TEST(SampledRoots, AroundEverySquare) {
    for (int64_t root = 0; root <= 46340; ++root) {
        const int64_t square = root * root;
        ASSERT_EQ(FirstWrongRoot(square - 2, std::min(square + 3, kEnd), 1), std::nullopt) << root;
    }
}

TEST(SampledRoots, AroundEveryPowerOfTwoAndTheEnds) {
    for (int64_t power = 1; power < kEnd; power *= 2)
        ASSERT_EQ(FirstWrongRoot(power - 9, power + 9, 1), std::nullopt) << power;
    EXPECT_EQ(FirstWrongRoot(kMin, kMin + 1000, 1), std::nullopt);
    EXPECT_EQ(FirstWrongRoot(kEnd - 1000, kEnd, 1), std::nullopt);
}

TEST(SampledRoots, ACheckTellsWrongOnes) {
    EXPECT_TRUE(IsRoot(15, 3));
    EXPECT_FALSE(IsRoot(15, 4));
    EXPECT_FALSE(IsRoot(16, 3));
    EXPECT_FALSE(IsRoot(-1, 0));
    EXPECT_FALSE(IsRoot(kSquaresWrapFrom, 32768));
}

}  // namespace
}  // namespace fpnavi_test
