#include "frame/MaskedFrame.h"

#include <cstring>

#include "base/NaviSimd.h"

namespace fpnavi {

MaskedFrame s_maskedFirst;
MaskedFrame s_maskedSecond;

namespace {

constexpr int32_t kRowSteps = kWordPixels / kLanes;

// The place of pixel (row, 0) in a plane; a column offset of -64..63 stays inside the plane.
int32_t RowPlace(int32_t row) {
    return kWordPixels + row * kRowStride;
}

// 255 for each column that is set.
void SpreadMask(uint64_t columns, Bytes16 (&mask)[kRowSteps]) {
    uint8_t bytes[kWordPixels];
    SpreadBits(columns, kWordPixels, bytes);
    for (int32_t step = 0; step < kRowSteps; ++step)
        mask[step] = Equal16(Load16(bytes + step * kLanes), Splat16(1));
}

constexpr int32_t kRowsPerCheck = 3;  // the sum is compared with the limit after these

// Grey differences of sixteen pixel pairs, 0 where one is not finger.
Bytes16 Differences(const uint8_t* low1, const uint8_t* high1, const uint8_t* low2,
                    const uint8_t* high2) {
    return Or16(Excess16(Load16(low1), Load16(high2)), Excess16(Load16(low2), Load16(high1)));
}

// Adds the differences of one row of each frame, at these places of their planes.
Sums AddRowDifferences(Sums sums, const MaskedFrame& first, int32_t place1,
                       const MaskedFrame& second, int32_t place2,
                       const Bytes16 (&mask)[kRowSteps]) {
    for (int32_t step = 0; step < kRowSteps; ++step) {
        const int32_t at1 = place1 + step * kLanes;
        const int32_t at2 = place2 + step * kLanes;
        sums = AddBytes(sums, And16(Differences(first.low + at1, first.high + at1, second.low + at2,
                                                second.high + at2),
                                    mask[step]));
    }
    return sums;
}

// Lays out sixteen pixels; bit i of the result says that pixel i is finger.
uint32_t LayOutStep(const uint8_t* grey, const uint8_t* type, uint8_t* low, uint8_t* high) {
    const Bytes16 mask = Equal16(Load16(type), Splat16(1));
    const Bytes16 masked = And16(Load16(grey), mask);
    Store16(low, masked);
    Store16(high, Or16(masked, AndNot16(Splat16(255), mask)));
    return TopBits16(mask);
}

// Lays out a row of width pixels and returns its finger columns. The last step starts so that it
// ends with the row; a row shorter than a step is lengthened with pixels outside the finger.
uint64_t LayOutRow(const uint8_t* grey, const uint8_t* type, int32_t width, uint8_t* low,
                   uint8_t* high) {
    if (width < kLanes) {
        uint8_t longGrey[kLanes] = {};
        uint8_t longType[kLanes] = {};
        std::memcpy(longGrey, grey, static_cast<size_t>(width));
        std::memcpy(longType, type, static_cast<size_t>(width));
        return LayOutStep(longGrey, longType, low, high);
    }
    uint64_t finger = 0;
    for (int32_t c = 0; c + kLanes <= width; c += kLanes)
        finger |= static_cast<uint64_t>(LayOutStep(grey + c, type + c, low + c, high + c)) << c;
    const int32_t last = width - kLanes;
    return finger |
           static_cast<uint64_t>(LayOutStep(grey + last, type + last, low + last, high + last))
               << last;
}

}  // namespace

void LayOut(const NaviFrame_t& img, MaskedFrame* masked) {
    // A frame of the same size leaves the bytes around it as they were.
    if (masked->width != img.width || masked->height != img.height) {
        std::memset(masked->low, 0, sizeof masked->low);
        std::memset(masked->high, 255, sizeof masked->high);
        masked->width = img.width;
        masked->height = img.height;
    }
    masked->area = 0;
    for (int32_t row = 0; row < img.height; ++row) {
        const int32_t at = row * img.width;
        masked->finger[row] = LayOutRow(img.pData + at, img.pType + at, img.width,
                                        masked->low + RowPlace(row), masked->high + RowPlace(row));
        masked->area += CountBits(masked->finger[row]);
    }
}

int32_t CommonArea(const MaskedFrame& first, const MaskedFrame& second, const Pairing& pairing) {
    int32_t area = 0;
    for (uint64_t rows = pairing.rows; rows != 0; rows &= rows - 1) {
        const int32_t row = __builtin_ctzll(rows);
        area += CountBits(first.finger[row] & pairing.columns &
                          ShiftBits(second.finger[row + pairing.rowOffset], pairing.columnOffset));
    }
    return area;
}

int64_t DifferenceSum(const MaskedFrame& first, const MaskedFrame& second, const Pairing& pairing,
                      int64_t limit) {
    Bytes16 mask[kRowSteps];
    SpreadMask(pairing.columns, mask);
    const int32_t offset = pairing.rowOffset * kRowStride + pairing.columnOffset;
    int64_t sum = 0;
    uint64_t rows = pairing.rows;
    while (rows != 0 && sum < limit) {
        Sums sums = NoSums();
        for (int32_t n = 0; n < kRowsPerCheck && rows != 0; ++n, rows &= rows - 1) {
            const int32_t place = RowPlace(__builtin_ctzll(rows));
            sums = AddRowDifferences(sums, first, place, second, place + offset, mask);
        }
        sum += Total(sums);
    }
    return sum;
}

}  // namespace fpnavi
