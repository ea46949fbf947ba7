// The integer square root, a bisection between two powers of two with a final correction.

#include "RefMath.h"

namespace reference {

int32_t IntSqrt(int32_t x) {
    if (x == 0)
        return 0;
    int32_t n = 0;
    for (int32_t rest = x; rest > 0; rest >>= 2)
        ++n;
    int32_t hi = 1 << n;  // n is at most 16
    int32_t lo = hi >> 1;
    while (lo < hi) {
        const int32_t mid = WrapAdd32(lo, hi) >> 1;
        if (x > WrapMul32(mid, mid))
            lo = mid + 1;
        else
            hi = mid - 1;
    }
    if (WrapMul32(lo + 1, lo + 1) <= x)
        return lo + 1;
    if (WrapMul32(lo, lo) > x)
        return lo - 1;
    return lo;
}

}  // namespace reference
