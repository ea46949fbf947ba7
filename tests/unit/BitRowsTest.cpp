// Bits of a word as bytes, by the table that the compiler makes and by the function that it makes
// it with.
#include <gtest/gtest.h>

#include <cstring>
#include <memory>

#include "base/BitRows.h"

namespace {

using namespace fpnavi;

TEST(SpreadTable, LowestBitIsTheFirstByte) {
    const auto table = std::make_unique<SpreadTable>(MakeSpreadTable());
    const uint8_t expected[8] = {1, 0, 0, 0, 1, 1, 0, 1};
    EXPECT_EQ(std::memcmp(table->bytes[0xB1], expected, 8), 0);  // 1011 0001
    EXPECT_EQ(std::memcmp(table.get(), &kSpreadTable, sizeof kSpreadTable), 0);
}

TEST(SpreadBits, LowestSixteenBitsBecomeBytes) {
    uint8_t bytes[kLanes];
    Store16(bytes, SpreadBits(0xF85B1));  // 1000 0101 1011 0001
    const uint8_t expected[kLanes] = {1, 0, 0, 0, 1, 1, 0, 1, 1, 0, 1, 0, 0, 0, 0, 1};
    EXPECT_EQ(std::memcmp(bytes, expected, kLanes), 0);
}

}  // namespace
