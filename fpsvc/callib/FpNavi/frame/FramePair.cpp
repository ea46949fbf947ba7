// Requirement: area and difference sum of the pixels that are finger in both frames, at any of some
// hundred displacements of a pair.
//
// Observation: with masks of 0 and 255 a difference that does not count is |0 - 0|, so that sixteen
// pixel pairs take a few operations without a branch. The columns that meet are those of all rows.
//
// Algorithm: the masks of both frames are made once for each pair, those of the columns once for
// each displacement of columns. Columns are cut into pieces of at most 64; a piece runs down all
// rows, and every four rows its sum is compared with the limit.
#include "frame/FramePair.h"

#include <algorithm>
#include <limits>

#include "base/BitRows.h"
#include "frame/NaviFrame.h"

namespace fpnavi {
namespace {

constexpr int32_t kPieceSteps = kWordPixels / kLanes;  // of a piece
constexpr int32_t kRowsPerCheck = 4;  // rows summed up between two comparisons with the limit

// The piece that starts at the first column >= column of meeting, which has one.
ColumnPiece CutPiece(const Meeting& meeting, int32_t column) {
    const Span* span = meeting.spans;
    while (span->last <= column)
        ++span;
    ColumnPiece piece;
    piece.column = std::max(span->first, column);
    uint64_t bits = 0;
    for (; span < meeting.spans + meeting.count; ++span) {
        const int32_t start = std::max(span->first - piece.column, 0);
        if (start >= kWordPixels)
            break;
        bits |= BitsBetween(start, span->last - piece.column);
    }
    piece.steps = (kWordPixels - 1 - __builtin_clzll(bits)) / kLanes + 1;
    for (int32_t step = 0; step < kPieceSteps; ++step, bits >>= kLanes)
        piece.mask[step] = Equal16(SpreadBits(bits), Splat16(1));
    return piece;
}

// The s-th span of rows in the order in which they are summed up: the middle one shows more finger
// than the borders, so that a limit is reached with fewer rows.
const Span& MiddleFirst(const Meeting& rows, int32_t s) {
    return rows.spans[rows.count < kBandMax || s == 2 ? s : 1 - s];
}

// Adds up what the pixel pairs of a piece show that are finger in both frames: their grey
// differences with kDiffs, else their number. Stops once the sum reaches limit.
template <bool kDiffs, int32_t kSteps>
int64_t SumPiece(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                 const ColumnPiece& piece, int64_t limit) {
    const int32_t offset = pairing.rows->offset * first.width + pairing.columns->meeting.offset;
    const auto addRow = [&](Sums sums, int32_t row) {
        int32_t at = row * first.width + piece.column;
        for (int32_t step = 0; step < kSteps; ++step, at += kLanes) {
            const Bytes16 finger =
                And16(Load16(first.mask + at), Load16(second.mask + at + offset));
            const Bytes16 common = And16(finger, piece.mask[step]);
            if constexpr (kDiffs)
                sums = AddDiffs(sums, And16(Load16(first.grey + at), common),
                                And16(Load16(second.grey + at + offset), common));
            else
                sums = AddBytes(sums, And16(common, Splat16(1)));
        }
        return sums;
    };
    int64_t sum = 0;
    for (int32_t s = 0; s < pairing.rows->count && sum < limit; ++s) {
        const Span& rows = MiddleFirst(*pairing.rows, s);
        for (int32_t row = rows.first; row < rows.last && sum < limit;) {
            Sums sums = NoSums();
            for (const int32_t end = std::min(row + kRowsPerCheck, rows.last); row < end; ++row)
                sums = addRow(sums, row);
            sum += Total(sums);
        }
    }
    return sum;
}

using SumPieceOf = int64_t (*)(const LaidFrame&, const LaidFrame&, const Pairing&,
                               const ColumnPiece&, int64_t);

// For pieces of 1 to 4 steps.
template <bool kDiffs>
constexpr SumPieceOf kSumPiece[kPieceSteps] = {SumPiece<kDiffs, 1>, SumPiece<kDiffs, 2>,
                                               SumPiece<kDiffs, 3>, SumPiece<kDiffs, 4>};

// SumPiece over all pieces of the columns, from left to right.
template <bool kDiffs>
int64_t SumPairing(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                   int64_t limit) {
    const Meeting& columns = pairing.columns->meeting;
    if (columns.count == 0)
        return 0;
    const ColumnPiece& head = pairing.columns->head;
    int64_t sum = kSumPiece<kDiffs>[head.steps - 1](first, second, pairing, head, limit);
    int32_t end = head.column + kWordPixels;
    while (sum < limit && end < columns.spans[columns.count - 1].last) {
        const ColumnPiece piece = CutPiece(columns, end);
        sum += kSumPiece<kDiffs>[piece.steps - 1](first, second, pairing, piece, limit - sum);
        end = piece.column + kWordPixels;
    }
    return sum;
}

}  // namespace

LaidFrame LayOut(const NaviFrame_t& img) {
    const int32_t size = img.width * img.height;
    uint8_t* const mask = img.pType + RoomStart(img.width, img.height);
    const Bytes16 one = Splat16(1);
    Sums sums = NoSums();  // at most 2^24
    int32_t p = 0;
    for (; p + kLanes <= size; p += kLanes) {
        const Bytes16 finger = Equal16(Load16(img.pType + p), one);
        Store16(mask + p, finger);
        sums = AddBytes(sums, And16(finger, one));
    }
    int32_t area = Total(sums);
    for (; p < size; ++p) {
        mask[p] = img.pType[p] == 1 ? 255 : 0;
        area += mask[p] & 1;
    }
    return {img.pData, mask, img.width, img.height, area};
}

FramePair LayOutPair(const NaviFrame_t& prev, const NaviFrame_t& curr) {
    return {LayOut(prev), LayOut(curr), curr.cvr > prev.cvr};
}

bool AreComparable(const NaviFrame_t* prev, const NaviFrame_t* curr) {
    return HasPixels(prev) && HasPixels(curr) && prev->width == curr->width &&
           prev->height == curr->height;
}

Columns CutColumns(const Meeting& meeting) {
    return {meeting, meeting.count > 0 ? CutPiece(meeting, 0) : ColumnPiece{}};
}

int32_t CommonArea(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing) {
    const int64_t noLimit = std::numeric_limits<int64_t>::max();
    return static_cast<int32_t>(SumPairing<false>(first, second, pairing, noLimit));
}

int64_t DifferenceSum(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                      int64_t limit) {
    return SumPairing<true>(first, second, pairing, limit);
}

}  // namespace fpnavi
