// Rows of up to 64 pixels as one 64-bit word each: bit c is column c. Owns nothing.
#ifndef FPNAVI_BITROWS_H
#define FPNAVI_BITROWS_H

#include <array>
#include <cstdint>
#include <cstring>

#include "base/NaviSimd.h"

namespace fpnavi {

inline constexpr int32_t kWordPixels = 64;  // columns of a word, and rows of a small frame

// Sides, of a frame with pixels, that the word-wide paths take.
inline bool FitsWords(int32_t width, int32_t height) {
    return width <= kWordPixels && height <= kWordPixels;
}

// The first count bits; 0 <= count <= 64.
inline uint64_t FirstBits(int32_t count) {
    return count >= kWordPixels ? ~uint64_t{0} : (uint64_t{1} << count) - 1;
}

// One side of a frame, cut into border, centre and border.
struct Thirds {
    uint64_t first;
    uint64_t centre;
    uint64_t last;
};

// The borders of bound pixels lie inside a side that fits a word and do not overlap.
inline bool CanCutThirds(int32_t side, int32_t bound) {
    return bound >= 0 && bound <= side / 2;
}

inline Thirds CutThirds(int32_t side, int32_t bound) {
    const uint64_t first = FirstBits(bound);
    const uint64_t upToLast = FirstBits(side - bound);
    return {first, upToLast & ~first, FirstBits(side) & ~upToLast};
}

// Column c of the result is column c + offset of bits; columns outside are 0.
inline uint64_t ShiftBits(uint64_t bits, int32_t offset) {
    if (offset >= kWordPixels || offset <= -kWordPixels)
        return 0;
    return offset >= 0 ? bits >> offset : (bits & FirstBits(kWordPixels + offset)) << -offset;
}

// Number of bits set, by halving; the baseline of the processors has no instruction for it.
inline int32_t CountBits(uint64_t bits) {
    bits = bits - (bits >> 1 & 0x5555555555555555U);
    bits = (bits & 0x3333333333333333U) + (bits >> 2 & 0x3333333333333333U);
    bits = (bits + (bits >> 4)) & 0x0F0F0F0F0F0F0F0FU;
    bits = bits + (bits >> 8);
    bits = bits + (bits >> 16);
    bits = bits + (bits >> 32);
    return static_cast<int32_t>(bits & 0x7FU);
}

// All bits from the lowest to the highest that is set.
inline uint64_t SpanBits(uint64_t bits) {
    if (bits == 0)
        return 0;
    return FirstBits(kWordPixels - __builtin_clzll(bits)) & ~FirstBits(__builtin_ctzll(bits));
}

// Bit c is set where test(byte c) is 255 in the row's width bytes; test works on sixteen of them.
// Nothing outside the row is read.
template <typename Test>
inline uint64_t TestRow(const uint8_t* row, int32_t width, Test test) {
    uint8_t padded[kLanes] = {};
    if (width < kLanes) {
        std::memcpy(padded, row, static_cast<size_t>(width));
        return TopBits16(test(Load16(padded))) & FirstBits(width);
    }
    uint64_t bits = 0;
    for (int32_t c = 0; c + kLanes <= width; c += kLanes)
        bits |= static_cast<uint64_t>(TopBits16(test(Load16(row + c)))) << c;
    const int32_t last = width - kLanes;  // once more what the last full step left, and before
    return bits | static_cast<uint64_t>(TopBits16(test(Load16(row + last)))) << last;
}

// Bit c is set where byte c of the row is value.
inline uint64_t EqualBits(const uint8_t* row, int32_t width, uint8_t value) {
    return TestRow(row, width,
                   [wanted = Splat16(value)](Bytes16 bytes) { return Equal16(bytes, wanted); });
}

// Bit c is set where byte c of the row is at most value.
inline uint64_t AtMostBits(const uint8_t* row, int32_t width, uint8_t value) {
    return TestRow(row, width, [most = Splat16(value)](Bytes16 bytes) {
        return Equal16(Excess16(bytes, most), Splat16(0));
    });
}

// A byte for each bit: 1 where it is set, else 0. For each value of eight bits.
struct SpreadTable {
    uint8_t bytes[256][8];
};

constexpr SpreadTable MakeSpreadTable() {
    SpreadTable table = {};
    for (uint32_t value = 0; value < 256; ++value) {
        for (uint32_t bit = 0; bit < 8; ++bit)
            table.bytes[value][bit] = static_cast<uint8_t>(value >> bit & 1U);
    }
    return table;
}

inline constexpr SpreadTable kSpreadTable = MakeSpreadTable();

// Writes the first width bits as bytes 0 or 1.
inline void SpreadBits(uint64_t bits, int32_t width, uint8_t* bytes) {
    int32_t c = 0;
    for (; c + 8 <= width; c += 8)
        std::memcpy(bytes + c, kSpreadTable.bytes[bits >> c & 0xFFU], 8);
    if (c < width)
        std::memcpy(bytes + c, kSpreadTable.bytes[bits >> c & 0xFFU],
                    static_cast<size_t>(width - c));
}

}  // namespace fpnavi

#endif  // FPNAVI_BITROWS_H
