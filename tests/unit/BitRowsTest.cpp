// Bits of a word as bytes, by the table that the compiler makes and by the function that it makes
// it with.
#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <vector>

#include "base/BitRows.h"

namespace {

using namespace fpnavi;

TEST(SpreadTable, LowestBitIsTheFirstByte) {
    const auto table = std::make_unique<SpreadTable>(MakeSpreadTable());
    const uint8_t expected[8] = {1, 0, 0, 0, 1, 1, 0, 1};
    EXPECT_EQ(std::memcmp(table->bytes[0xB1], expected, 8), 0);  // 1011 0001
    EXPECT_EQ(std::memcmp(table.get(), &kSpreadTable, sizeof kSpreadTable), 0);
}

TEST(SpreadBits, WritesTheGivenNumberOfBytes) {
    std::vector<uint8_t> bytes(12, 9);
    SpreadBits(0x5B1, 11, bytes.data());  // 101 1011 0001
    EXPECT_EQ(bytes, (std::vector<uint8_t>{1, 0, 0, 0, 1, 1, 0, 1, 1, 0, 1, 9}));
    SpreadBits(0, 8, bytes.data());
    EXPECT_EQ(bytes, (std::vector<uint8_t>{0, 0, 0, 0, 0, 0, 0, 0, 1, 0, 1, 9}));
}

}  // namespace
