// Eight unsigned 16-bit words at a time, as the texture test needs them: for SSE2, for NEON, and as
// plain loops for every other processor. All give the same results; sums and differences wrap.
#ifndef FINGERDETECT_WORDLANES_H
#define FINGERDETECT_WORDLANES_H

#include <cstdint>

#if defined(__SSE2__) && !defined(FPNAVI_PLAIN_LANES)
#include <emmintrin.h>
#elif defined(__ARM_NEON) && !defined(FPNAVI_PLAIN_LANES)
#include <arm_neon.h>
#endif

namespace finger_detect {

constexpr int32_t kLanes = 8;

#if defined(__SSE2__) && !defined(FPNAVI_PLAIN_LANES)

using Words = __m128i;
struct Energies {
    __m128i low, high;
};

inline Words NoWords() {
    return _mm_setzero_si128();
}
// The eight bytes at p.
inline Words LoadBytes(const uint8_t* p) {
    const __m128i bytes = _mm_loadl_epi64(reinterpret_cast<const __m128i*>(p));
    return _mm_unpacklo_epi8(bytes, _mm_setzero_si128());
}
inline void Store(uint16_t* p, Words a) {
    _mm_storeu_si128(reinterpret_cast<__m128i*>(p), a);
}
inline Words Add(Words a, Words b) {
    return _mm_add_epi16(a, b);
}
inline Words Sub(Words a, Words b) {
    return _mm_sub_epi16(a, b);
}
// (a * factor) >> 16.
inline Words MulHigh(Words a, uint16_t factor) {
    return _mm_mulhi_epu16(a, _mm_set1_epi16(static_cast<int16_t>(factor)));
}

inline Energies NoEnergies() {
    return {_mm_setzero_si128(), _mm_setzero_si128()};
}
// Adds a * a of each word, read as signed.
inline Energies AddSquares(Energies sums, Words a) {
    const __m128i low = _mm_unpacklo_epi16(a, _mm_setzero_si128());
    const __m128i high = _mm_unpackhi_epi16(a, _mm_setzero_si128());
    return {_mm_add_epi32(sums.low, _mm_madd_epi16(low, low)),
            _mm_add_epi32(sums.high, _mm_madd_epi16(high, high))};
}
inline void Store(int32_t* p, Energies sums) {
    _mm_storeu_si128(reinterpret_cast<__m128i*>(p), sums.low);
    _mm_storeu_si128(reinterpret_cast<__m128i*>(p + kLanes / 2), sums.high);
}

#elif defined(__ARM_NEON) && !defined(FPNAVI_PLAIN_LANES)

using Words = uint16x8_t;
struct Energies {
    int32x4_t low, high;
};

inline Words NoWords() {
    return vdupq_n_u16(0);
}
inline Words LoadBytes(const uint8_t* p) {
    return vmovl_u8(vld1_u8(p));
}
inline void Store(uint16_t* p, Words a) {
    vst1q_u16(p, a);
}
inline Words Add(Words a, Words b) {
    return vaddq_u16(a, b);
}
inline Words Sub(Words a, Words b) {
    return vsubq_u16(a, b);
}
inline Words MulHigh(Words a, uint16_t factor) {
    const uint32x4_t low = vmull_n_u16(vget_low_u16(a), factor);
    const uint32x4_t high = vmull_n_u16(vget_high_u16(a), factor);
    return vcombine_u16(vshrn_n_u32(low, 16), vshrn_n_u32(high, 16));
}

inline Energies NoEnergies() {
    return {vdupq_n_s32(0), vdupq_n_s32(0)};
}
inline Energies AddSquares(Energies sums, Words a) {
    const int16x8_t s = vreinterpretq_s16_u16(a);
    return {vmlal_s16(sums.low, vget_low_s16(s), vget_low_s16(s)),
            vmlal_s16(sums.high, vget_high_s16(s), vget_high_s16(s))};
}
inline void Store(int32_t* p, Energies sums) {
    vst1q_s32(p, sums.low);
    vst1q_s32(p + kLanes / 2, sums.high);
}

#else

struct Words {
    uint16_t lane[kLanes];
};
struct Energies {
    int32_t lane[kLanes];
};

inline Words NoWords() {
    return {};
}
inline Words LoadBytes(const uint8_t* p) {
    Words a;
    for (int32_t i = 0; i < kLanes; ++i)
        a.lane[i] = p[i];
    return a;
}
inline void Store(uint16_t* p, const Words& a) {
    for (int32_t i = 0; i < kLanes; ++i)
        p[i] = a.lane[i];
}
inline Words Add(const Words& a, const Words& b) {
    Words sum;
    for (int32_t i = 0; i < kLanes; ++i)
        sum.lane[i] = static_cast<uint16_t>(a.lane[i] + b.lane[i]);
    return sum;
}
inline Words Sub(const Words& a, const Words& b) {
    Words difference;
    for (int32_t i = 0; i < kLanes; ++i)
        difference.lane[i] = static_cast<uint16_t>(a.lane[i] - b.lane[i]);
    return difference;
}
inline Words MulHigh(const Words& a, uint16_t factor) {
    Words high;
    for (int32_t i = 0; i < kLanes; ++i)
        high.lane[i] = static_cast<uint16_t>(static_cast<uint32_t>(a.lane[i]) * factor >> 16);
    return high;
}

inline Energies NoEnergies() {
    return {};
}
inline Energies AddSquares(Energies sums, const Words& a) {
    for (int32_t i = 0; i < kLanes; ++i) {
        const int32_t value = static_cast<int16_t>(a.lane[i]);
        sums.lane[i] += value * value;
    }
    return sums;
}
inline void Store(int32_t* p, const Energies& sums) {
    for (int32_t i = 0; i < kLanes; ++i)
        p[i] = sums.lane[i];
}

#endif

}  // namespace finger_detect

#endif  // FINGERDETECT_WORDLANES_H
