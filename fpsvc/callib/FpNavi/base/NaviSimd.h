// Sixteen bytes at a time, by the vectors that GCC and clang have for every processor. Intrinsics
// stand where the compilers do not find the instruction, with plain code for every other processor
// beside them. All give the same results. Owns nothing.
#ifndef FPNAVI_NAVISIMD_H
#define FPNAVI_NAVISIMD_H

#include <algorithm>
#include <cstdint>
#include <cstring>

#if defined(__SSE2__) && !defined(FPNAVI_PLAIN_LANES)
#include <emmintrin.h>
#elif defined(__ARM_NEON) && !defined(FPNAVI_PLAIN_LANES)
#include <arm_neon.h>
#endif

namespace fpnavi {

inline constexpr int32_t kLanes = 16;

using Bytes16 = uint8_t __attribute__((vector_size(16)));
using Quads = uint32_t __attribute__((vector_size(16)));
using Sums = Quads;  // partial sums: 0 and 1 of the first eight bytes, 2 and 3 of the others

inline Bytes16 Load16(const uint8_t* p) {
    Bytes16 a;
    std::memcpy(&a, p, sizeof a);
    return a;
}
inline void Store16(uint8_t* p, Bytes16 a) {
    std::memcpy(p, &a, sizeof a);
}
inline void StoreQuads(uint32_t* p, Quads a) {
    std::memcpy(p, &a, sizeof a);
}
inline Bytes16 Splat16(uint8_t value) {
    return Bytes16{} + value;
}
inline Bytes16 And16(Bytes16 a, Bytes16 b) {
    return a & b;
}
inline Bytes16 Or16(Bytes16 a, Bytes16 b) {
    return a | b;
}
// a and not b.
inline Bytes16 AndNot16(Bytes16 a, Bytes16 b) {
    return a & ~b;
}
// max(a - b, 0).
inline Bytes16 Excess16(Bytes16 a, Bytes16 b) {
    return (a > b ? a : b) - b;
}
// 255 where a == b, else 0.
inline Bytes16 Equal16(Bytes16 a, Bytes16 b) {
    return reinterpret_cast<Bytes16>(a == b);
}
// The bytes 0 to 15.
inline Bytes16 LaneNumbers() {
    return Bytes16{0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15};
}
// 255 for the first count bytes, 0 for the others; 0 <= count <= 16.
inline Bytes16 FirstBytes(int32_t count) {
    return reinterpret_cast<Bytes16>(LaneNumbers() < Splat16(static_cast<uint8_t>(count)));
}
// Bit i % 8 of byte i.
inline Bytes16 LaneBits() {
    return Bytes16{1, 2, 4, 8, 16, 32, 64, 128, 1, 2, 4, 8, 16, 32, 64, 128};
}
// The lowest sixteen bits as bytes 0 or 1.
inline Bytes16 SpreadBits(uint64_t bits) {
    using Longs = uint64_t __attribute__((vector_size(16)));
    constexpr uint64_t kEachByte = 0x0101010101010101;
    const Longs bytes = {(bits & 0xFFU) * kEachByte, (bits >> 8 & 0xFFU) * kEachByte};
    const Bytes16 set = reinterpret_cast<Bytes16>(bytes) & LaneBits();
    return Equal16(set, LaneBits()) & Splat16(1);
}

inline Sums NoSums() {
    return Sums{};
}
inline Sums AddSums(Sums a, Sums b) {
    return a + b;
}

#if defined(__SSE2__) && !defined(FPNAVI_PLAIN_LANES)

// Adds |a - b|.
inline Sums AddDiffs(Sums sums, Bytes16 a, Bytes16 b) {
    return sums + reinterpret_cast<Sums>(
                      _mm_sad_epu8(reinterpret_cast<__m128i>(a), reinterpret_cast<__m128i>(b)));
}
inline Sums AddBytes(Sums sums, Bytes16 a) {
    return AddDiffs(sums, a, Bytes16{});
}
// Adds sums 1 and 3, which are 0 here, to sums 0 and 2. On NEON they become 0.
inline Sums AddPairs(Sums sums) {
    return sums;
}
// Bit i is the top bit of byte i.
inline uint32_t TopBits16(Bytes16 a) {
    return static_cast<uint32_t>(_mm_movemask_epi8(reinterpret_cast<__m128i>(a)));
}
// min(a * factor / 2^16, 255), truncated, for eight 16-bit numbers a <= 255. The upper half of
// factor times a plus the lower half times a is at most 255 * 255 < 2^16.
inline __m128i ScaleWords(__m128i a, uint32_t factor) {
    const __m128i whole = _mm_mullo_epi16(a, _mm_set1_epi16(static_cast<int16_t>(factor >> 16)));
    const __m128i part = _mm_mulhi_epu16(a, _mm_set1_epi16(static_cast<int16_t>(factor & 0xFFFFU)));
    const __m128i scaled = _mm_add_epi16(whole, part);
    return _mm_sub_epi16(scaled, _mm_subs_epu16(scaled, _mm_set1_epi16(255)));
}
// min(a * factor / 2^16, 255), truncated; factor <= 255 * 2^16.
inline Bytes16 Scale16(Bytes16 a, uint32_t factor) {
    const __m128i bytes = reinterpret_cast<__m128i>(a);
    return reinterpret_cast<Bytes16>(
        _mm_packus_epi16(ScaleWords(_mm_unpacklo_epi8(bytes, _mm_setzero_si128()), factor),
                         ScaleWords(_mm_unpackhi_epi8(bytes, _mm_setzero_si128()), factor)));
}
// Stores four numbers below 256 as bytes.
inline void StoreBytes(uint8_t* p, Quads a) {
    const __m128i words = _mm_packs_epi32(reinterpret_cast<__m128i>(a), _mm_setzero_si128());
    const int32_t bytes = _mm_cvtsi128_si32(_mm_packus_epi16(words, words));
    std::memcpy(p, &bytes, sizeof bytes);
}

#else

#if defined(__ARM_NEON) && !defined(FPNAVI_PLAIN_LANES)
inline Sums AddBytes(Sums sums, Bytes16 a) {
    return vpadalq_u16(sums, vpaddlq_u8(a));
}
inline Sums AddDiffs(Sums sums, Bytes16 a, Bytes16 b) {
    return AddBytes(sums, vabdq_u8(a, b));
}
inline Sums AddPairs(Sums sums) {
    return reinterpret_cast<Sums>(vpaddlq_u32(sums));
}
#else
inline Sums AddBytes(Sums sums, Bytes16 a) {
    for (int32_t i = 0; i < kLanes; ++i)
        sums[i / 8 * 2] += a[i];
    return sums;
}
inline Sums AddDiffs(Sums sums, Bytes16 a, Bytes16 b) {
    return AddBytes(sums, Excess16(a, b) | Excess16(b, a));
}
inline Sums AddPairs(Sums sums) {
    return sums;
}
#endif
inline uint32_t TopBits16(Bytes16 a) {
    const Bytes16 bits = reinterpret_cast<Bytes16>(a > 127) & LaneBits();
    const Sums halves = AddPairs(AddBytes(NoSums(), bits));
    return halves[0] | halves[2] << 8;
}
inline Bytes16 Scale16(Bytes16 a, uint32_t factor) {
    for (int32_t i = 0; i < kLanes; ++i)
        a[i] = static_cast<uint8_t>(std::min(a[i] * factor >> 16, 255U));
    return a;
}
inline void StoreBytes(uint8_t* p, Quads a) {
    for (int32_t i = 0; i < 4; ++i)
        p[i] = static_cast<uint8_t>(a[i]);
}

#endif

// The sum of all partial sums, which is below 2^31.
inline int32_t Total(Sums sums) {
    const Sums halves = AddPairs(sums);
    return static_cast<int32_t>(halves[0] + halves[2]);
}
// Sums 0 and 1 plus sums 2 and 3: of a, then of b.
inline Sums AddHalves(Sums a, Sums b) {
    return __builtin_shufflevector(a, b, 0, 1, 4, 5) + __builtin_shufflevector(a, b, 2, 3, 6, 7);
}
// The totals of four vectors of partial sums, in their order.
inline Quads Totals(Sums a, Sums b, Sums c, Sums d) {
    const Sums ab = AddPairs(AddHalves(a, b));
    const Sums cd = AddPairs(AddHalves(c, d));
    return __builtin_shufflevector(ab, cd, 0, 2, 4, 6);
}
// Stores a * factor / 2^shift, truncated, as four bytes at p [out]. Every product is below 2^32,
// every quotient below 256.
inline void StoreScaled(uint8_t* p, Quads a, uint32_t factor, int32_t shift) {
    StoreBytes(p, a * factor >> shift);
}

}  // namespace fpnavi

#endif  // FPNAVI_NAVISIMD_H
