// Arithmetic of the model. Every 32-bit operation that may leave its range is written with one of
// these helpers: the operation is done in 64 bits and its low 32 bits are kept, so wrapping is
// always deliberate and never undefined. IntSqrt, the integer root of the vote, is declared here
// too because its products wrap in the same way.

#ifndef REFERENCE_REFMATH_H
#define REFERENCE_REFMATH_H

#include <cstdint>

namespace reference {

inline int32_t Wrap32(int64_t value) {
    return static_cast<int32_t>(value);
}
inline int32_t WrapAdd32(int32_t a, int32_t b) {
    return Wrap32(int64_t{a} + b);
}
inline int32_t WrapSub32(int32_t a, int32_t b) {
    return Wrap32(int64_t{a} - b);
}
inline int32_t WrapMul32(int32_t a, int32_t b) {
    return Wrap32(int64_t{a} * b);
}
inline int32_t WrapNeg32(int32_t a) {
    return Wrap32(-int64_t{a});
}

// |a|, where the smallest value has no positive counterpart and stays as it is.
inline int32_t WrapAbs32(int32_t a) {
    return a < 0 ? WrapNeg32(a) : a;
}

// a / b toward zero, b not 0; the smallest value divided by -1 stays as it is.
inline int32_t WrapDiv32(int32_t a, int32_t b) {
    return Wrap32(int64_t{a} / b);
}

inline uint32_t WrapU32(int64_t value) {
    return static_cast<uint32_t>(value);
}
inline uint32_t WrapAddU32(uint32_t a, uint32_t b) {
    return WrapU32(int64_t{a} + b);
}
inline uint32_t WrapSubU32(uint32_t a, uint32_t b) {
    return WrapU32(int64_t{a} - b);
}
inline uint32_t WrapMulU32(uint32_t a, uint32_t b) {
    return static_cast<uint32_t>(uint64_t{a} * b);
}

inline int32_t Max32(int32_t a, int32_t b) {
    return a > b ? a : b;
}
inline int32_t Min32(int32_t a, int32_t b) {
    return a < b ? a : b;
}

// Distance of two grey levels, 0..255.
inline int32_t GreyDistance(uint8_t a, uint8_t b) {
    return a > b ? a - b : b - a;
}

// The floor of the square root for 0 <= x < 2^30, -1 for a negative x. From 2^30 upwards the
// products wrap and the result is no root (2^30 gives 65537); callers depend on it staying so.
int32_t IntSqrt(int32_t x);

}  // namespace reference

#endif
