// Requirement: area and difference sum of the pixels that are finger in both frames, at any of some
// hundred displacements of a pair.
//
// Observation: with masks of 0 and 255 a difference that does not count is |0 - 0|, so that sixteen
// pixel pairs take a few operations without a branch. The columns that meet are the same in all
// rows.
//
// Algorithm: the masks of both frames are made once for each pair, the masks of the columns once
// for each displacement of columns. Columns are cut into pieces of at most 64, of which the masks
// stay in registers; a piece runs down all rows, and every four rows its sum is compared with the
// limit.
#include "frame/FramePair.h"

#include <algorithm>

#include "base/BitRows.h"
#include "frame/NaviFrame.h"

namespace fpnavi {
namespace {

constexpr int32_t kPieceSteps = kWordPixels / kLanes;  // of a piece
constexpr int32_t kRowsPerCheck = 4;  // rows summed up between two comparisons with the limit

// Makes piece [out] the one that starts at the first column >= column of meeting. Returns false,
// with piece unchanged, when there is none.
bool CutPiece(const Meeting& meeting, int32_t column, ColumnPiece* piece) {
    int32_t s = 0;
    while (s < meeting.count && meeting.spans[s].last <= column)
        ++s;
    if (s == meeting.count)
        return false;
    piece->column = std::max(meeting.spans[s].first, column);
    uint64_t bits = 0;
    for (; s < meeting.count; ++s) {
        const Span& span = meeting.spans[s];
        const int32_t start = std::max(span.first - piece->column, 0);
        if (start >= kWordPixels)
            break;
        bits |= BitsBetween(start, span.last - piece->column);
    }
    const int32_t last = kWordPixels - 1 - __builtin_clzll(bits);
    piece->steps = last / kLanes + 1;
    for (int32_t step = 0; step < kPieceSteps; ++step, bits >>= kLanes)
        piece->mask[step] = Equal16(SpreadBits(bits), Splat16(1));
    return true;
}

// Calls visit(piece) for all pieces of columns, from left to right, until it returns false.
template <typename Visit>
void ForEachPiece(const Columns& columns, Visit visit) {
    const Meeting& meeting = columns.meeting;
    int32_t end = columns.head.column + kWordPixels;
    if (!visit(columns.head) || meeting.spans[meeting.count - 1].last <= end)
        return;
    ColumnPiece piece;
    for (; CutPiece(meeting, end, &piece); end = piece.column + kWordPixels) {
        if (!visit(piece))
            return;
    }
}

// Where the two frames are read: byte n of all four pointers is one pixel pair.
struct PixelPairs {
    const uint8_t* grey1;
    const uint8_t* mask1;
    const uint8_t* grey2;
    const uint8_t* mask2;
};

// The pair of pixel (row, column) of the first frame.
PixelPairs PairsAt(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                   int32_t row, int32_t column) {
    const int32_t at1 = row * first.width + column;
    const int32_t at2 =
        (row + pairing.rows->offset) * second.width + column + pairing.columns->meeting.offset;
    return {first.grey + at1, first.mask + at1, second.grey + at2, second.mask + at2};
}

// 255 for the sixteen pixel pairs at place that are finger in both frames, and in mask.
Bytes16 CommonMask(const PixelPairs& pairs, int32_t place, Bytes16 mask) {
    return And16(And16(Load16(pairs.mask1 + place), Load16(pairs.mask2 + place)), mask);
}

// Adds the differences of the row at place, sixteen pixel pairs for each step.
template <int32_t kSteps>
Sums AddRow(Sums sums, const PixelPairs& pairs, int32_t place, const Bytes16 (&mask)[kPieceSteps]) {
    for (int32_t step = 0; step < kSteps; ++step, place += kLanes) {
        const Bytes16 common = CommonMask(pairs, place, mask[step]);
        sums = AddDiffs(sums, And16(Load16(pairs.grey1 + place), common),
                        And16(Load16(pairs.grey2 + place), common));
    }
    return sums;
}

// Sum of the differences over rows of a piece, width bytes apart; stops once it reaches limit.
template <int32_t kSteps>
int64_t SumRows(const PixelPairs& pairs, int32_t width, int32_t rows, const ColumnPiece& piece,
                int64_t limit) {
    Bytes16 mask[kPieceSteps];
    for (int32_t step = 0; step < kPieceSteps; ++step)
        mask[step] = piece.mask[step];
    int64_t sum = 0;
    int32_t place = 0;
    while (rows > 0 && sum < limit) {
        Sums sums = NoSums();
        const int32_t end = rows > kRowsPerCheck ? rows - kRowsPerCheck : 0;
        for (; rows > end; --rows, place += width)
            sums = AddRow<kSteps>(sums, pairs, place, mask);
        sum += Total(sums);
    }
    return sum;
}

// Pixels in rows of a piece, width bytes apart, that are finger in both frames; at most
// 64 * 4096 = 2^18.
template <int32_t kSteps>
int32_t CountRows(const PixelPairs& pairs, int32_t width, int32_t rows, const ColumnPiece& piece) {
    const Bytes16 one = Splat16(1);
    Bytes16 mask[kPieceSteps];
    for (int32_t step = 0; step < kPieceSteps; ++step)
        mask[step] = And16(piece.mask[step], one);
    Sums sums = NoSums();
    for (int32_t place = 0; rows > 0; --rows, place += width) {
        for (int32_t step = 0; step < kSteps; ++step)
            sums = AddBytes(sums, CommonMask(pairs, place + step * kLanes, mask[step]));
    }
    return Total(sums);
}

using SumRowsOf = int64_t (*)(const PixelPairs&, int32_t, int32_t, const ColumnPiece&, int64_t);
using CountRowsOf = int32_t (*)(const PixelPairs&, int32_t, int32_t, const ColumnPiece&);

// For pieces of 1 to 4 steps.
constexpr SumRowsOf kSumRows[kPieceSteps] = {SumRows<1>, SumRows<2>, SumRows<3>, SumRows<4>};
constexpr CountRowsOf kCountRows[kPieceSteps] = {CountRows<1>, CountRows<2>, CountRows<3>,
                                                 CountRows<4>};

// The s-th span of rows in the order in which they are summed up: the middle one shows more finger
// than the borders, so that a limit is reached with fewer rows.
int32_t MiddleFirst(int32_t s, int32_t count) {
    return count < kBandMax ? s : (s == 0 ? 1 : (s == 1 ? 0 : 2));
}

}  // namespace

LaidFrame LayOut(const NaviFrame_t& img) {
    const int32_t size = img.width * img.height;
    uint8_t* const mask = img.pType + RoomStart(img.width, img.height);
    const Bytes16 one = Splat16(1);
    int32_t area = 0;
    int32_t p = 0;
    Sums sums = NoSums();  // at most 2^24
    for (; p + kLanes <= size; p += kLanes) {
        const Bytes16 finger = Equal16(Load16(img.pType + p), one);
        Store16(mask + p, finger);
        sums = AddBytes(sums, And16(finger, one));
    }
    for (; p < size; ++p) {
        mask[p] = img.pType[p] == 1 ? 255 : 0;
        area += mask[p] & 1;
    }
    return {img.pData, mask, img.width, img.height, area + Total(sums)};
}

FramePair LayOutPair(const NaviFrame_t& prev, const NaviFrame_t& curr) {
    return {LayOut(prev), LayOut(curr), curr.cvr > prev.cvr};
}

bool AreComparable(const NaviFrame_t* prev, const NaviFrame_t* curr) {
    return HasPixels(prev) && HasPixels(curr) && prev->width == curr->width &&
           prev->height == curr->height;
}

Columns CutColumns(const Meeting& meeting) {
    Columns columns = {meeting, {}};
    CutPiece(meeting, 0, &columns.head);
    return columns;
}

int32_t CommonArea(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing) {
    int32_t area = 0;
    ForEachPiece(*pairing.columns, [&](const ColumnPiece& piece) {
        for (int32_t s = 0; s < pairing.rows->count; ++s) {
            const Span& rows = pairing.rows->spans[s];
            area += kCountRows[piece.steps - 1](
                PairsAt(first, second, pairing, rows.first, piece.column), first.width,
                rows.Length(), piece);
        }
        return true;
    });
    return area;
}

int64_t DifferenceSum(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                      int64_t limit) {
    int64_t sum = 0;
    ForEachPiece(*pairing.columns, [&](const ColumnPiece& piece) {
        for (int32_t s = 0; s < pairing.rows->count && sum < limit; ++s) {
            const Span& rows = pairing.rows->spans[MiddleFirst(s, pairing.rows->count)];
            sum +=
                kSumRows[piece.steps - 1](PairsAt(first, second, pairing, rows.first, piece.column),
                                          first.width, rows.Length(), piece, limit - sum);
        }
        return sum < limit;
    });
    return sum;
}

}  // namespace fpnavi
