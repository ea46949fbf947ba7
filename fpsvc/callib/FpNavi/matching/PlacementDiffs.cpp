// A strip is as wide as the template and runs down one column of placements; its rows follow each
// other without gaps. So the pixels of every placement in it are consecutive bytes, as those of the
// template are, and four steps of sixteen compare them.
#include "matching/PlacementDiffs.h"

#include <cstring>

#include "base/BitRows.h"
#include "base/NaviSimd.h"

namespace fpnavi {
namespace {

constexpr int32_t kTpltPixels = 64;
constexpr int32_t kSteps = kTpltPixels / kLanes;
constexpr int32_t kStripBytes = kWordPixels * kLanes + kTpltPixels;

PlacementDiffs s_diffs[kTpltMax];

// A template's pixels one behind the other, filled up with zeroes.
struct Packed {
    Bytes16 bytes[kSteps];
};

Packed LoadPacked(const uint8_t (&bytes)[kTpltPixels]) {
    Packed packed;
    for (int32_t step = 0; step < kSteps; ++step)
        packed.bytes[step] = Load16(bytes + step * kLanes);
    return packed;
}

Packed Pack(const Template& tplt, const NaviFrame_t& frame) {
    uint8_t bytes[kTpltPixels] = {};
    for (int32_t m = 0; m < tplt.height; ++m)
        std::memcpy(bytes + m * tplt.width, frame.pData + (tplt.i0 + m) * frame.width + tplt.j0,
                    static_cast<size_t>(tplt.width));
    return LoadPacked(bytes);
}

// Divides sums of tpltSize greys by tpltSize, 1..64, without a division: the reciprocal in 1/2^20,
// rounded up, is too large by less than tpltSize / 2^20 of a sum, at most 63 * 255 * 64 < 2^20.
struct MeanOf {
    explicit MeanOf(int32_t tpltSize)
        : reciprocal((1U << 20) / static_cast<uint32_t>(tpltSize) +
                     ((1U << 20) % static_cast<uint32_t>(tpltSize) != 0 ? 1U : 0U)) {}
    uint8_t operator()(int32_t sum) const {
        return static_cast<uint8_t>(static_cast<uint32_t>(sum) * reciprocal >> 20);
    }
    uint32_t reciprocal;
};

// Copies width bytes of each row, from image down, one behind the other. Sixteen are copied at a
// time; what is too much is overwritten by the next row. image has 16 bytes of room behind it.
void CutStrip(const uint8_t* image, int32_t stride, int32_t rows, int32_t width, uint8_t* strip) {
    for (int32_t r = 0; r < rows; ++r)
        Store16(strip + r * width, Load16(image + r * stride));
}

// Sum of the differences between a template of full steps of sixteen pixels and a rest, and the
// placement at patch. rest: 255 for each byte of the last step that belongs to the template.
template <int32_t kFullSteps>
int32_t DifferenceSum(const uint8_t* patch, const Packed& tplt, Bytes16 rest) {
    Sums sums = NoSums();
    for (int32_t step = 0; step < kFullSteps; ++step)
        sums = AddDiffs(sums, Load16(patch + step * kLanes), tplt.bytes[step]);
    if constexpr (kFullSteps < kSteps)
        sums = AddDiffs(sums, And16(Load16(patch + kFullSteps * kLanes), rest),
                        tplt.bytes[kFullSteps]);
    return Total(sums);
}

// The valid templates of one size, which are placed at the same rows and columns.
struct Alike {
    int32_t count;
    int32_t k[kTpltMax];
    Packed packed[kTpltMax];
};

void CollectAlike(const TemplateSet& set, int32_t k, Alike* alike) {
    alike->count = 0;
    for (int32_t other = k; other < kTpltMax; ++other) {
        // All templates have the same two sides: those of one width are of one height.
        if (!set.valid[other] || set.tplts[other].width != set.tplts[k].width)
            continue;
        alike->k[alike->count] = other;
        alike->packed[alike->count] = Pack(set.tplts[other], *set.cut);
        ++alike->count;
    }
}

// Scores one column of placements, rows of them, in a strip of the template's width; the results
// go to diff and the places columns further on.
template <int32_t kFullSteps>
void ScoreColumn(const uint8_t* strip, int32_t width, int32_t rows, const Packed& tplt,
                 Bytes16 rest, MeanOf meanOf, uint8_t* diff, int32_t columns) {
    const Packed packed = tplt;  // a copy that no byte written through diff can touch
    for (int32_t i = 0; i < rows; ++i) {
        *diff = meanOf(DifferenceSum<kFullSteps>(strip, packed, rest));
        strip += width;
        diff += columns;
    }
}

// Scores the placements of all templates of one size. image: the searched frame.
template <int32_t kFullSteps>
void ScoreAlike(const TemplateSet& set, const Alike& alike, const uint8_t* image) {
    const int32_t width = set.tplts[alike.k[0]].width;
    const int32_t height = set.tplts[alike.k[0]].height;
    const PlacementDiffs& where = s_diffs[alike.k[0]];
    const int32_t rows = where.rows;
    const int32_t columns = where.columns;
    uint8_t restBytes[kLanes] = {};
    std::memset(restBytes, 255, static_cast<size_t>(set.tpltSize % kLanes));
    const Bytes16 rest = Load16(restBytes);
    const MeanOf meanOf(set.tpltSize);
    const int32_t stride = set.searched->width;
    const uint8_t* const corner = image + where.iFirst * stride + where.jFirst;
    uint8_t strip[kStripBytes] = {};
    for (int32_t j = 0; j < columns; ++j) {
        CutStrip(corner + j, stride, rows + height - 1, width, strip);
        for (int32_t t = 0; t < alike.count; ++t)
            ScoreColumn<kFullSteps>(strip, width, rows, alike.packed[t], rest, meanOf,
                                    s_diffs[alike.k[t]].diff + j, columns);
    }
}

void ScoreAlike(const TemplateSet& set, const Alike& alike, const uint8_t* image) {
    switch (set.tpltSize / kLanes) {
        case 0:
            return ScoreAlike<0>(set, alike, image);
        case 1:
            return ScoreAlike<1>(set, alike, image);
        case 2:
            return ScoreAlike<2>(set, alike, image);
        case 3:
            return ScoreAlike<3>(set, alike, image);
        default:
            return ScoreAlike<4>(set, alike, image);
    }
}

int32_t CountOf(int64_t first, int64_t last) {
    return static_cast<int32_t>(last - first + 1);
}

void PrepareTable(const TemplateSet& set, int32_t k) {
    const Placements where = PlacementsOf(set.tplts[k]);
    PlacementDiffs& table = s_diffs[k];
    const bool placed = set.valid[k] && !where.Empty();
    table.iFirst = placed ? static_cast<int32_t>(where.iFirst) : 0;
    table.jFirst = placed ? static_cast<int32_t>(where.jFirst) : 0;
    table.rows = placed ? CountOf(where.iFirst, where.iLast) : 0;
    table.columns = placed ? CountOf(where.jFirst, where.jLast) : 0;
    for (int32_t p = table.Count(); p % kLanes != 0; ++p)
        table.diff[p] = 255;
}

}  // namespace

bool CanTabulate(const TemplateSet& set) {
    if (set.tpltSize > kTpltPixels || !FitsWords(set.searched->width, set.searched->height))
        return false;
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const Placements where = PlacementsOf(set.tplts[k]);
        if (!set.valid[k] || where.Empty())
            continue;
        if (set.tplts[k].width > kLanes ||
            CountOf(where.iFirst, where.iLast) * CountOf(where.jFirst, where.jLast) > kPlacementMax)
            return false;
    }
    return true;
}

const PlacementDiffs* TabulatePlacements(const TemplateSet& set) {
    uint8_t image[kWordPixels * kWordPixels + kLanes];  // with room for the last step
    const int32_t size = set.searched->width * set.searched->height;
    std::memcpy(image, set.searched->pData, static_cast<size_t>(size));
    std::memset(image + size, 0, kLanes);
    for (int32_t k = 0; k < kTpltMax; ++k)
        PrepareTable(set, k);
    bool done[kTpltMax] = {};
    for (int32_t k = 0; k < kTpltMax; ++k) {
        if (done[k] || s_diffs[k].rows == 0)
            continue;
        Alike alike;
        CollectAlike(set, k, &alike);
        ScoreAlike(set, alike, image);
        for (int32_t t = 0; t < alike.count; ++t)
            done[alike.k[t]] = true;
    }
    return s_diffs;
}

}  // namespace fpnavi
