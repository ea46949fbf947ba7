// Integer helpers of the module: the named arithmetic that may wrap and the integer square root.
// Everything else in the module is shown not to overflow. Owns nothing.
//
// The Wrap functions compute in 64 bits and keep the low 32, that is two's complement arithmetic.
#ifndef FPNAVI_NAVIMATH_H
#define FPNAVI_NAVIMATH_H

#include <cstdint>

namespace fpnavi {

inline constexpr int32_t kGreyMax = 255;  // largest 8-bit grey level

inline int32_t Wrap(int64_t value) {
    return static_cast<int32_t>(value);
}

inline int32_t WrapAdd(int32_t a, int32_t b) {
    return Wrap(static_cast<int64_t>(a) + b);
}

inline int32_t WrapSub(int32_t a, int32_t b) {
    return Wrap(static_cast<int64_t>(a) - b);
}

inline int32_t WrapMul(int32_t a, int32_t b) {
    return Wrap(static_cast<int64_t>(a) * b);
}

// |a|. WrapAbs(INT32_MIN) == INT32_MIN.
inline int32_t WrapAbs(int32_t a) {
    return a < 0 ? WrapSub(0, a) : a;
}

// a / b truncated toward zero for b != 0. WrapDiv(INT32_MIN, -1) == INT32_MIN.
inline int32_t WrapDiv(int32_t a, int32_t b) {
    return Wrap(static_cast<int64_t>(a) / b);
}

// Low 32 bits of a + b, a - b, a * b.
inline uint32_t WrapAddU(uint32_t a, uint32_t b) {
    return static_cast<uint32_t>(static_cast<uint64_t>(a) + b);
}

inline uint32_t WrapSubU(uint32_t a, uint32_t b) {
    return static_cast<uint32_t>(static_cast<int64_t>(a) - static_cast<int64_t>(b));
}

inline uint32_t WrapMulU(uint32_t a, uint32_t b) {
    return static_cast<uint32_t>(static_cast<uint64_t>(a) * b);
}

// Integer square root by bisection. Returns the floor of the root for 0 <= x < 2^30 and -1 for
// x < 0. Deliberate: from 2^30 on the squares wrap and the result is whatever the steps give (2^30
// gives 65537). The fp vote reaches that for a pair displaced by 328 pixels or more.
inline int32_t IntSqrt(int32_t x) {
    int32_t bits = 0;  // of the root; at most 16
    for (int32_t rest = x; rest > 0; rest >>= 2)
        ++bits;
    int32_t hi = 1 << bits;
    int32_t lo = hi >> 1;
    while (lo < hi) {
        const int32_t mid = (lo + hi) >> 1;
        if (x > WrapMul(mid, mid))
            lo = mid + 1;
        else
            hi = mid - 1;
    }
    if (WrapMul(lo + 1, lo + 1) <= x)
        return lo + 1;
    return WrapMul(lo, lo) > x ? lo - 1 : lo;
}

}  // namespace fpnavi

#endif  // FPNAVI_NAVIMATH_H
