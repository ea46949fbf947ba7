// Sixteen bytes at a time: the few operations that the compilers do not find by themselves, for
// SSE2, for NEON, and as plain loops for every other processor. All give the same results.
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

#if defined(__SSE2__) && !defined(FPNAVI_PLAIN_LANES)

using Bytes16 = __m128i;
using Sums = __m128i;  // partial sums: one in the low half of each 64 bits

// Four unsigned 32-bit numbers, each in the low half of 64 bits.
struct Quads {
    __m128i first;   // numbers 0 and 1
    __m128i second;  // numbers 2 and 3
};

inline Bytes16 Load16(const uint8_t* p) {
    return _mm_loadu_si128(reinterpret_cast<const __m128i*>(p));
}
inline void Store16(uint8_t* p, Bytes16 a) {
    _mm_storeu_si128(reinterpret_cast<__m128i*>(p), a);
}
inline Bytes16 Splat16(uint8_t value) {
    return _mm_set1_epi8(static_cast<char>(value));
}
inline Bytes16 And16(Bytes16 a, Bytes16 b) {
    return _mm_and_si128(a, b);
}
inline Bytes16 Or16(Bytes16 a, Bytes16 b) {
    return _mm_or_si128(a, b);
}
// a and not b.
inline Bytes16 AndNot16(Bytes16 a, Bytes16 b) {
    return _mm_andnot_si128(b, a);
}
// max(a - b, 0).
inline Bytes16 Excess16(Bytes16 a, Bytes16 b) {
    return _mm_subs_epu8(a, b);
}
// 255 where a == b, else 0.
inline Bytes16 Equal16(Bytes16 a, Bytes16 b) {
    return _mm_cmpeq_epi8(a, b);
}
// Eight bytes at low, then eight at high.
inline Bytes16 LoadHalves(const uint8_t* low, const uint8_t* high) {
    return _mm_unpacklo_epi64(_mm_loadl_epi64(reinterpret_cast<const __m128i*>(low)),
                              _mm_loadl_epi64(reinterpret_cast<const __m128i*>(high)));
}
// min(a * (whole + part / 2^16), 255), truncated, for eight 16-bit numbers a <= 255. whole <= 255,
// and part is 0 when whole is 255: no sum exceeds 255 * 255 < 2^16.
inline __m128i ScaleWords(__m128i a, __m128i whole, __m128i part) {
    const __m128i scaled = _mm_add_epi16(_mm_mullo_epi16(a, whole), _mm_mulhi_epu16(a, part));
    return _mm_sub_epi16(scaled, _mm_subs_epu16(scaled, _mm_set1_epi16(255)));
}
// min(a * factor / 2^16, 255), truncated; factor <= 255 * 2^16.
inline Bytes16 Scale16(Bytes16 a, uint32_t factor) {
    const __m128i whole = _mm_set1_epi16(static_cast<int16_t>(factor >> 16));
    const __m128i part = _mm_set1_epi16(static_cast<int16_t>(factor & 0xFFFFU));
    return _mm_packus_epi16(ScaleWords(_mm_unpacklo_epi8(a, _mm_setzero_si128()), whole, part),
                            ScaleWords(_mm_unpackhi_epi8(a, _mm_setzero_si128()), whole, part));
}
// Bit i is the top bit of byte i.
inline uint32_t TopBits16(Bytes16 a) {
    return static_cast<uint32_t>(_mm_movemask_epi8(a));
}

inline Sums NoSums() {
    return _mm_setzero_si128();
}
inline Sums AddBytes(Sums sums, Bytes16 a) {
    return _mm_add_epi32(sums, _mm_sad_epu8(a, _mm_setzero_si128()));
}
// Adds |a - b|.
inline Sums AddDiffs(Sums sums, Bytes16 a, Bytes16 b) {
    return _mm_add_epi32(sums, _mm_sad_epu8(a, b));
}
inline Sums AddSums(Sums a, Sums b) {
    return _mm_add_epi32(a, b);
}
// The sum of all partial sums, which is below 2^31.
inline int32_t Total(Sums sums) {
    return _mm_cvtsi128_si32(_mm_add_epi32(sums, _mm_srli_si128(sums, 8)));
}
// The totals of four vectors of partial sums, in their order.
inline Quads Totals(Sums a, Sums b, Sums c, Sums d) {
    return {_mm_add_epi32(_mm_unpacklo_epi64(a, b), _mm_unpackhi_epi64(a, b)),
            _mm_add_epi32(_mm_unpacklo_epi64(c, d), _mm_unpackhi_epi64(c, d))};
}
inline __m128i InOneVector(const Quads& a) {
    return _mm_castps_si128(_mm_shuffle_ps(_mm_castsi128_ps(a.first), _mm_castsi128_ps(a.second),
                                           _MM_SHUFFLE(2, 0, 2, 0)));
}
inline void StoreQuads(uint32_t* p, const Quads& a) {
    _mm_storeu_si128(reinterpret_cast<__m128i*>(p), InOneVector(a));
}
// Stores a * factor / 2^shift, truncated, as four bytes at p [out]. Every product is below 2^32,
// every quotient below 256.
inline void StoreScaled(uint8_t* p, const Quads& a, uint32_t factor, int32_t shift) {
    const __m128i by = _mm_set1_epi32(static_cast<int32_t>(factor));
    const __m128i places = _mm_cvtsi32_si128(shift);
    const __m128i quads = InOneVector({_mm_srl_epi64(_mm_mul_epu32(a.first, by), places),
                                       _mm_srl_epi64(_mm_mul_epu32(a.second, by), places)});
    const __m128i words = _mm_packs_epi32(quads, quads);
    const int32_t bytes = _mm_cvtsi128_si32(_mm_packus_epi16(words, words));
    std::memcpy(p, &bytes, sizeof bytes);
}

// The sum of the sixteen counts at p [in], which is below 2^31.
inline int32_t SumCounts16(const int32_t* p) {
    const auto four = [p](int32_t i) {
        return _mm_loadu_si128(reinterpret_cast<const __m128i*>(p + i));
    };
    const __m128i sums =
        _mm_add_epi32(_mm_add_epi32(four(0), four(4)), _mm_add_epi32(four(8), four(12)));
    const __m128i pairs = _mm_add_epi32(sums, _mm_srli_si128(sums, 8));
    return _mm_cvtsi128_si32(_mm_add_epi32(pairs, _mm_srli_si128(pairs, 4)));
}

#elif defined(__ARM_NEON) && !defined(FPNAVI_PLAIN_LANES)

using Bytes16 = uint8x16_t;
using Sums = uint32x4_t;
using Quads = uint32x4_t;

inline Bytes16 Load16(const uint8_t* p) {
    return vld1q_u8(p);
}
inline void Store16(uint8_t* p, Bytes16 a) {
    vst1q_u8(p, a);
}
inline Bytes16 Splat16(uint8_t value) {
    return vdupq_n_u8(value);
}
inline Bytes16 And16(Bytes16 a, Bytes16 b) {
    return vandq_u8(a, b);
}
inline Bytes16 Or16(Bytes16 a, Bytes16 b) {
    return vorrq_u8(a, b);
}
inline Bytes16 AndNot16(Bytes16 a, Bytes16 b) {
    return vbicq_u8(a, b);
}
inline Bytes16 Excess16(Bytes16 a, Bytes16 b) {
    return vqsubq_u8(a, b);
}
inline Bytes16 Equal16(Bytes16 a, Bytes16 b) {
    return vceqq_u8(a, b);
}
inline Bytes16 LoadHalves(const uint8_t* low, const uint8_t* high) {
    return vcombine_u8(vld1_u8(low), vld1_u8(high));
}
inline uint8x8_t Scale8(uint8x8_t a, uint32_t factor) {
    const uint16x4_t part = vdup_n_u16(static_cast<uint16_t>(factor & 0xFFFFU));
    const uint16x8_t wide = vmovl_u8(a);
    const uint16x8_t fraction = vcombine_u16(vshrn_n_u32(vmull_u16(vget_low_u16(wide), part), 16),
                                             vshrn_n_u32(vmull_u16(vget_high_u16(wide), part), 16));
    return vqmovn_u16(
        vaddq_u16(vmulq_u16(wide, vdupq_n_u16(static_cast<uint16_t>(factor >> 16))), fraction));
}
inline Bytes16 Scale16(Bytes16 a, uint32_t factor) {
    return vcombine_u8(Scale8(vget_low_u8(a), factor), Scale8(vget_high_u8(a), factor));
}
inline uint32_t TopBits16(Bytes16 a) {
    static const uint8_t kWeights[kLanes] = {1, 2, 4, 8, 16, 32, 64, 128,
                                             1, 2, 4, 8, 16, 32, 64, 128};
    const uint8x16_t set = vtstq_u8(a, vdupq_n_u8(0x80));
    const uint64x2_t sums = vpaddlq_u32(vpaddlq_u16(vpaddlq_u8(vandq_u8(set, vld1q_u8(kWeights)))));
    return static_cast<uint32_t>(vgetq_lane_u64(sums, 0) | vgetq_lane_u64(sums, 1) << 8);
}

inline Sums NoSums() {
    return vdupq_n_u32(0);
}
inline Sums AddBytes(Sums sums, Bytes16 a) {
    return vpadalq_u16(sums, vpaddlq_u8(a));
}
inline Sums AddDiffs(Sums sums, Bytes16 a, Bytes16 b) {
    return AddBytes(sums, vabdq_u8(a, b));
}
inline Sums AddSums(Sums a, Sums b) {
    return vaddq_u32(a, b);
}
inline int32_t Total(Sums sums) {
    const uint64x2_t halves = vpaddlq_u32(sums);
    return static_cast<int32_t>(vgetq_lane_u64(halves, 0) + vgetq_lane_u64(halves, 1));
}
inline uint32x2_t PairTotals(Sums a, Sums b) {
    return vpadd_u32(vpadd_u32(vget_low_u32(a), vget_high_u32(a)),
                     vpadd_u32(vget_low_u32(b), vget_high_u32(b)));
}
inline Quads Totals(Sums a, Sums b, Sums c, Sums d) {
    return vcombine_u32(PairTotals(a, b), PairTotals(c, d));
}
inline void StoreQuads(uint32_t* p, Quads a) {
    vst1q_u32(p, a);
}
inline void StoreScaled(uint8_t* p, Quads a, uint32_t factor, int32_t shift) {
    const uint16x4_t words =
        vmovn_u32(vshlq_u32(vmulq_u32(a, vdupq_n_u32(factor)), vdupq_n_s32(-shift)));
    const uint32_t bytes =
        vget_lane_u32(vreinterpret_u32_u8(vmovn_u16(vcombine_u16(words, words))), 0);
    std::memcpy(p, &bytes, sizeof bytes);
}

inline int32_t SumCounts16(const int32_t* p) {
    const int32x4_t sums = vaddq_s32(vaddq_s32(vld1q_s32(p), vld1q_s32(p + 4)),
                                     vaddq_s32(vld1q_s32(p + 8), vld1q_s32(p + 12)));
    const int64x2_t pairs = vpaddlq_s32(sums);
    return static_cast<int32_t>(vgetq_lane_s64(pairs, 0) + vgetq_lane_s64(pairs, 1));
}

#else

struct Bytes16 {
    uint8_t byte[kLanes];
};
using Sums = int32_t;
struct Quads {
    int32_t number[4];
};

template <typename Operation>
inline Bytes16 ForEachByte(const Bytes16& a, const Bytes16& b, Operation operation) {
    Bytes16 result;
    for (int32_t i = 0; i < kLanes; ++i)
        result.byte[i] = static_cast<uint8_t>(operation(a.byte[i], b.byte[i]));
    return result;
}

inline Bytes16 Load16(const uint8_t* p) {
    Bytes16 a;
    std::memcpy(a.byte, p, kLanes);
    return a;
}
inline void Store16(uint8_t* p, const Bytes16& a) {
    std::memcpy(p, a.byte, kLanes);
}
inline Bytes16 Splat16(uint8_t value) {
    Bytes16 a;
    std::memset(a.byte, value, kLanes);
    return a;
}
inline Bytes16 And16(const Bytes16& a, const Bytes16& b) {
    return ForEachByte(a, b, [](uint8_t x, uint8_t y) { return x & y; });
}
inline Bytes16 Or16(const Bytes16& a, const Bytes16& b) {
    return ForEachByte(a, b, [](uint8_t x, uint8_t y) { return x | y; });
}
inline Bytes16 AndNot16(const Bytes16& a, const Bytes16& b) {
    return ForEachByte(a, b, [](uint8_t x, uint8_t y) { return x & ~y; });
}
inline Bytes16 Excess16(const Bytes16& a, const Bytes16& b) {
    return ForEachByte(a, b, [](uint8_t x, uint8_t y) { return x > y ? x - y : 0; });
}
inline Bytes16 Equal16(const Bytes16& a, const Bytes16& b) {
    return ForEachByte(a, b, [](uint8_t x, uint8_t y) { return x == y ? 255 : 0; });
}
inline Bytes16 LoadHalves(const uint8_t* low, const uint8_t* high) {
    Bytes16 a;
    std::memcpy(a.byte, low, kLanes / 2);
    std::memcpy(a.byte + kLanes / 2, high, kLanes / 2);
    return a;
}
inline Bytes16 Scale16(const Bytes16& a, uint32_t factor) {
    return ForEachByte(a, a,
                       [factor](uint8_t x, uint8_t) { return std::min(x * factor >> 16, 255U); });
}
inline uint32_t TopBits16(const Bytes16& a) {
    uint32_t bits = 0;
    for (int32_t i = 0; i < kLanes; ++i)
        bits |= static_cast<uint32_t>(a.byte[i] >> 7) << i;
    return bits;
}

inline Sums NoSums() {
    return 0;
}
inline Sums AddBytes(Sums sums, const Bytes16& a) {
    for (const uint8_t byte : a.byte)
        sums += byte;
    return sums;
}
inline Sums AddDiffs(Sums sums, const Bytes16& a, const Bytes16& b) {
    for (int32_t i = 0; i < kLanes; ++i)
        sums += a.byte[i] > b.byte[i] ? a.byte[i] - b.byte[i] : b.byte[i] - a.byte[i];
    return sums;
}
inline Sums AddSums(Sums a, Sums b) {
    return a + b;
}
inline int32_t Total(Sums sums) {
    return sums;
}
inline Quads Totals(Sums a, Sums b, Sums c, Sums d) {
    return {{a, b, c, d}};
}
inline void StoreQuads(uint32_t* p, const Quads& a) {
    for (int32_t i = 0; i < 4; ++i)
        p[i] = static_cast<uint32_t>(a.number[i]);
}
inline void StoreScaled(uint8_t* p, const Quads& a, uint32_t factor, int32_t shift) {
    for (int32_t i = 0; i < 4; ++i)
        p[i] = static_cast<uint8_t>(static_cast<uint32_t>(a.number[i]) * factor >> shift);
}

inline int32_t SumCounts16(const int32_t* p) {
    int32_t sum = 0;
    for (int32_t i = 0; i < kLanes; ++i)
        sum += p[i];
    return sum;
}

#endif

// 255 for the first count bytes, 0 for the others; 0 <= count <= 16.
inline Bytes16 FirstBytes(int32_t count) {
    static const uint8_t kEdge[2 * kLanes] = {255, 255, 255, 255, 255, 255, 255, 255,
                                              255, 255, 255, 255, 255, 255, 255, 255};
    return Load16(kEdge + kLanes - count);
}

// The bytes 0 to 15.
inline Bytes16 LaneNumbers() {
    static const uint8_t kNumbers[kLanes] = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11, 12, 13, 14, 15};
    return Load16(kNumbers);
}

}  // namespace fpnavi

#endif  // FPNAVI_NAVISIMD_H
