// Sixteen bytes at a time: the few operations that the compilers do not find by themselves, for
// SSE2, for NEON, and as plain loops for every other processor. All give the same results.
#ifndef FPNAVI_NAVISIMD_H
#define FPNAVI_NAVISIMD_H

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
using Sums = __m128i;  // partial sums of byte differences

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
// The sum of all; below 2^31.
inline int32_t Total(Sums sums) {
    return _mm_cvtsi128_si32(_mm_add_epi32(sums, _mm_srli_si128(sums, 8)));
}

// The sum of sixteen counts; below 2^31.
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
inline int32_t Total(Sums sums) {
    const uint64x2_t halves = vpaddlq_u32(sums);
    return static_cast<int32_t>(vgetq_lane_u64(halves, 0) + vgetq_lane_u64(halves, 1));
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
inline int32_t Total(Sums sums) {
    return sums;
}

inline int32_t SumCounts16(const int32_t* p) {
    int32_t sum = 0;
    for (int32_t i = 0; i < kLanes; ++i)
        sum += p[i];
    return sum;
}

#endif

}  // namespace fpnavi

#endif  // FPNAVI_NAVISIMD_H
