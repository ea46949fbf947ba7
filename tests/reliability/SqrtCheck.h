// The module's integer square root against the square of its result, and against the plain model
// where squares wrap.
#ifndef TESTS_RELIABILITY_SQRTCHECK_H
#define TESTS_RELIABILITY_SQRTCHECK_H

#include <cstdint>
#include <optional>

#include "RefMath.h"
#include "base/NaviMath.h"

namespace fpnavi_test {

constexpr int64_t kSquaresWrapFrom = int64_t{1} << 30;

// result is the floor of the root of x below 2^30, -1 below 0, and what the model's steps give
// above.
inline bool IsRoot(int64_t x, int64_t result) {
    if (x < 0)
        return result == -1;
    if (x >= kSquaresWrapFrom)
        return result == reference::IntSqrt(static_cast<int32_t>(x));
    return result >= 0 && result * result <= x && x < (result + 1) * (result + 1);
}

// The first of from, from + step, ... below to whose root is wrong; from and to - 1 are 32-bit.
inline std::optional<int64_t> FirstWrongRoot(int64_t from, int64_t to, int64_t step) {
    for (int64_t x = from; x < to; x += step) {
        if (!IsRoot(x, fpnavi::IntSqrt(static_cast<int32_t>(x))))
            return x;
    }
    return std::nullopt;
}

}  // namespace fpnavi_test

#endif  // TESTS_RELIABILITY_SQRTCHECK_H
