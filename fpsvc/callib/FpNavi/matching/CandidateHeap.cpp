#include "matching/CandidateHeap.h"

#include <algorithm>
#include <utility>

#include "base/NaviSimd.h"

namespace fpnavi {
namespace {

// Offers the placements of a row of template k to the heap keys [in, out], num of them. The root is
// the worst key kept and only becomes smaller, so placements whose difference is above the root's
// get no key. Reads up to 15 bytes behind the row.
void OfferRow(const PlacementTable& table, int32_t row, int32_t k, uint32_t* keys, int32_t num) {
    const uint8_t* const diff = table.diff + row * table.columns;
    for (int32_t c = 0; c < table.columns; c += kLanes) {
        const Bytes16 worst = Splat16(static_cast<uint8_t>(keys[0] >> 24));
        const Bytes16 above = Excess16(Load16(diff + c), worst);
        uint32_t bits = TopBits16(Equal16(above, Splat16(0)));
        for (; bits != 0 && c + __builtin_ctz(bits) < table.columns; bits &= bits - 1) {
            const int32_t column = c + __builtin_ctz(bits);
            const uint32_t key =
                MakeKey(diff[column], table.iFirst + row, table.jFirst + column, k);
            if (key >= keys[0])
                continue;
            keys[0] = key;
            MaxHeapify(keys, num, 0);
        }
    }
}

}  // namespace

int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i) {
    if (arr == nullptr || len < 1)
        return -1;
    if (i < 0 || i >= len)
        return 0;
    // Children of i are 2i + 1 and 2i + 2; none exists from len / 2 on, so that nothing overflows.
    while (i < len / 2) {
        const int32_t left = 2 * i + 1;
        int32_t max = arr[left] > arr[i] ? left : i;
        if (left < len - 1 && arr[left + 1] > arr[max])
            max = left + 1;
        if (max == i)
            break;
        std::swap(arr[i], arr[max]);
        i = max;
    }
    return 0;
}

void RankCandidates(const PlacementTables& tables, uint32_t* keys, int32_t num) {
    std::fill_n(keys, static_cast<size_t>(num), kKeySentinel);
    for (int32_t k = 0; k < kTpltMax; ++k) {
        for (int32_t row = 0; row < tables.of[k].rows; ++row)
            OfferRow(tables.of[k], row, k, keys, num);
    }
}

}  // namespace fpnavi
