// GetNaviBlock: from the sensor's block order to rows. The row fix-up needs mode 2 and stands in
// DoubleScanModeTest.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <limits>
#include <numeric>
#include <vector>

#include "Fixtures.h"

namespace {

using namespace fpnavi_test;

constexpr int32_t kFpSize = 2016;  // 56 x 36

Params FpGeometry(int32_t blockWidth, int32_t blockHeight, int32_t columns, int32_t rows) {
    return Params()
        .Set("s_blockWidthFp", blockWidth)
        .Set("s_blockHeightFp", blockHeight)
        .Set("s_blockColNumFp", columns)
        .Set("s_blockRowNumFp", rows);
}

class NaviBlock : public NaviTest {
  protected:
    // The call fails and writes nothing.
    static void ExpectRefused(const Params& params) {
        ASSERT_EQ(params.Apply(), 0);
        const std::vector<uint8_t> raw(64, 1);
        std::vector<uint8_t> image(64, 9);
        EXPECT_EQ(GetNaviBlock(raw.data(), 8, 8, image.data()), -1);
        EXPECT_EQ(image, std::vector<uint8_t>(64, 9));
    }
};

TEST_F(NaviBlock, NullPointersFail) {
    Params().Apply();
    std::vector<uint8_t> bytes(kFpSize, 3);
    EXPECT_EQ(GetNaviBlock(nullptr, 56, 36, bytes.data()), -1);
    EXPECT_EQ(GetNaviBlock(bytes.data(), 56, 36, nullptr), -1);
    EXPECT_EQ(bytes, std::vector<uint8_t>(kFpSize, 3));
}

TEST_F(NaviBlock, OneBlockPerImageIsTheIdentity) {
    FpGeometry(6, 5, 1, 1).Apply();
    const std::vector<uint8_t> raw = NoisePatch(0, 0, 5, 6);
    std::vector<uint8_t> image(30);
    ASSERT_EQ(GetNaviBlock(raw.data(), 6, 5, image.data()), 0);
    EXPECT_EQ(image, raw);
}

TEST_F(NaviBlock, DefaultFpBlocksLandInTheirPlaces) {
    Params().Apply();
    std::vector<uint8_t> raw(kFpSize, 0);
    raw[16] = 1;   // first byte of block 1: row 0, column 8
    raw[8] = 2;    // second row of block 0: row 1, column 0
    raw[112] = 3;  // first byte of block 7 = 7 * 16: row 2, column 0
    raw[2015] = 4;
    std::vector<uint8_t> image(kFpSize, 9);
    ASSERT_EQ(GetNaviBlock(raw.data(), 56, 36, image.data()), 0);
    EXPECT_EQ(image[8], 1);
    EXPECT_EQ(image[56], 2);
    EXPECT_EQ(image[112], 3);
    EXPECT_EQ(image[2015], 4);
    EXPECT_EQ(std::accumulate(image.begin(), image.end(), 0), 1 + 2 + 3 + 4);
}

TEST_F(NaviBlock, DefaultHgBlocksLandInTheirPlaces) {
    Params().Set("s_modeFlag", 1).Apply();
    std::vector<uint8_t> raw(1920, 0);
    raw[32] = 1;   // first byte of block 1: row 0, column 8
    raw[160] = 2;  // first byte of block 5 = 5 * 32: row 4, column 0
    std::vector<uint8_t> image(1920, 9);
    ASSERT_EQ(GetNaviBlock(raw.data(), 40, 48, image.data()), 0);
    EXPECT_EQ(image[8], 1);
    EXPECT_EQ(image[160], 2);  // 4 * 40
    EXPECT_EQ(std::accumulate(image.begin(), image.end(), 0), 1 + 2);
}

TEST_F(NaviBlock, SizeArgumentsDoNotMatterWithoutTheRowFixUp) {
    Params().Apply();
    const std::vector<uint8_t> raw = NoisePatch(0, 0, 36, 56);
    std::vector<uint8_t> expected(kFpSize);
    ASSERT_EQ(GetNaviBlock(raw.data(), 56, 36, expected.data()), 0);
    for (const int32_t size : {0, -1, 1000000, std::numeric_limits<int32_t>::min()}) {
        std::vector<uint8_t> image(kFpSize);
        EXPECT_EQ(GetNaviBlock(raw.data(), size, size, image.data()), 0);
        EXPECT_EQ(image, expected);
    }
}

TEST_F(NaviBlock, DirectionControlOneAloneKeepsRowZero) {
    Params().Set("s_directionControlFlag", 1).Set("s_modeFlag", 0).Apply();
    const std::vector<uint8_t> raw = NoisePatch(0, 0, 36, 56);
    std::vector<uint8_t> image(kFpSize);
    ASSERT_EQ(GetNaviBlock(raw.data(), 56, 36, image.data()), 0);
    // Row 0 holds the first rows of blocks 0 to 6.
    for (size_t x = 0; x < 56; ++x)
        EXPECT_EQ(image[x], raw[(x / 8) * 16 + x % 8]) << x;
}

TEST_F(NaviBlock, NonPositiveBlockSizesAndCountsAreRefused) {
    ExpectRefused(FpGeometry(0, 2, 4, 4));
    ExpectRefused(FpGeometry(2, 0, 4, 4));
    ExpectRefused(FpGeometry(2, 2, 0, 4));
    ExpectRefused(FpGeometry(2, 2, 4, 0));
    ExpectRefused(FpGeometry(-2, 2, -4, 4));  // the product, 8, looks like a width
    ExpectRefused(FpGeometry(2, -2, 4, -4));
    ExpectRefused(FpGeometry(-2, -2, -4, -4));
}

TEST_F(NaviBlock, SidesAbove4096AreRefused) {
    ExpectRefused(FpGeometry(4097, 1, 1, 1));
    ExpectRefused(FpGeometry(1, 1, 1, 4097));
    ExpectRefused(FpGeometry(8, 1, 513, 1));  // 4104
}

TEST_F(NaviBlock, SidesOf4096Work) {
    const std::vector<uint8_t> raw = NoisePatch(0, 0, 1, 4096);
    std::vector<uint8_t> image(4096);
    FpGeometry(4096, 1, 1, 1).Apply();
    EXPECT_EQ(GetNaviBlock(raw.data(), 4096, 1, image.data()), 0);
    EXPECT_EQ(image, raw);
    FpGeometry(1, 1, 1, 4096).Apply();
    EXPECT_EQ(GetNaviBlock(raw.data(), 1, 4096, image.data()), 0);
    EXPECT_EQ(image, raw);
}

TEST_F(NaviBlock, ASideThatOnlyWrapsIntoRangeIsRefused) {
    constexpr int32_t kMax = std::numeric_limits<int32_t>::max();
    ExpectRefused(FpGeometry(kMax, 1, kMax, 1));  // (2^31 - 1)^2 is 1 in 32 bits
    ExpectRefused(FpGeometry(1, kMax, 1, kMax));
}

// Writes image block after block: the order in which the sensor delivers it.
std::vector<uint8_t> BlockOrder(const std::vector<uint8_t>& image, int32_t blockWidth,
                                int32_t blockHeight, int32_t columns, int32_t rows) {
    std::vector<uint8_t> raw;
    for (int32_t blockRow = 0; blockRow < rows; ++blockRow) {
        for (int32_t blockColumn = 0; blockColumn < columns; ++blockColumn) {
            for (int32_t y = 0; y < blockHeight; ++y) {
                for (int32_t x = 0; x < blockWidth; ++x) {
                    const int32_t row = blockRow * blockHeight + y;
                    const int32_t column = blockColumn * blockWidth + x;
                    raw.push_back(image[static_cast<size_t>(row * columns * blockWidth + column)]);
                }
            }
        }
    }
    return raw;
}

RC_GTEST_PROP(NaviBlockProperty, InvertsTheBlockOrderOfEveryGeometry, ()) {
    const auto side = rc::gen::inRange<int32_t>(1, 13);
    const int32_t blockWidth = *side;
    const int32_t blockHeight = *side;
    const int32_t columns = *side;
    const int32_t rows = *side;
    const std::vector<uint8_t> image =
        NoisePatch(*rc::gen::arbitrary<int16_t>(), 0, blockHeight * rows, blockWidth * columns);
    FpGeometry(blockWidth, blockHeight, columns, rows).Apply();
    std::vector<uint8_t> result(image.size());
    const std::vector<uint8_t> raw = BlockOrder(image, blockWidth, blockHeight, columns, rows);
    RC_ASSERT(GetNaviBlock(raw.data(), blockWidth * columns, 0, result.data()) == 0);
    RC_ASSERT(result == image);
}

}  // namespace
