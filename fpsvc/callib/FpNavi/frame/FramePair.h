// Two frames laid out for comparison, and the comparison itself: the grey differences of the pixels
// that are finger in both, at any displacement. Owns nothing; the mask of a frame lies in the room
// behind its classes.
#ifndef FPNAVI_FRAMEPAIR_H
#define FPNAVI_FRAMEPAIR_H

#include <algorithm>
#include <cstdint>

#include "FpNavi.h"
#include "base/NaviSimd.h"

namespace fpnavi {

// What a comparison reads of a frame: rows of width bytes each, one behind the other.
struct LaidFrame {
    const uint8_t* grey;
    const uint8_t* mask;  // 255 where the pixel is finger, else 0
    int32_t width;
    int32_t height;
    int32_t area;  // pixels that are finger
};

// Fills the mask of img, which has pixels and room behind them. Valid until a buffer of img
// changes.
LaidFrame LayOut(const NaviFrame_t& img);

// The working state of a frame pair: a value of whoever evaluates the pair, handed down to all
// steps.
struct FramePair {
    LaidFrame prev;
    LaidFrame curr;
    bool cutFromPrev;  // the frame with less coverage gives the templates; on a tie the current one

    const LaidFrame& Cut() const { return cutFromPrev ? prev : curr; }
    const LaidFrame& Searched() const { return cutFromPrev ? curr : prev; }
};

// Lays out both frames, which have been measured.
FramePair LayOutPair(const NaviFrame_t& prev, const NaviFrame_t& curr);

// The two frames have pixels and are of one size.
bool AreComparable(const NaviFrame_t* prev, const NaviFrame_t* curr);

// Places first to last - 1 of one axis; empty when last <= first.
struct Span {
    int32_t first;
    int32_t last;

    int32_t Length() const { return last > first ? last - first : 0; }
};

// The places of span whose counterparts, offset further on, lie in other.
inline Span Meet(const Span& span, const Span& other, int32_t offset) {
    return {std::max(span.first, other.first - offset), std::min(span.last, other.last - offset)};
}

inline constexpr int32_t kBandMax = 3;  // border, centre, border

// Places of one axis that meet those of the other frame at one offset: spans in ascending order,
// none empty, none overlapping another.
struct Meeting {
    int32_t offset;
    int32_t places;  // in all spans
    int32_t count;
    Span spans[kBandMax];

    void Add(const Span& span) {
        if (span.Length() == 0)
            return;
        places += span.Length();
        spans[count++] = span;
    }
};

// Up to 64 neighbouring columns of a meeting: steps of sixteen reach from the first of them to the
// last. The bytes of mask are 255 for the columns that meet, 0 for others and beyond the last step.
struct ColumnPiece {
    int32_t column;
    int32_t steps;
    Bytes16 mask[4];
};

// Columns that meet, none or some, with the first piece of them, which is all in most frames.
struct Columns {
    Meeting meeting;
    ColumnPiece head;

    bool Empty() const { return meeting.count == 0; }
};

Columns CutColumns(const Meeting& meeting);

// Pixel (r, c) of the first frame meets (r + rows.offset, c + columns.offset) of the second, for
// each place r of rows and c of columns. All of these lie inside both frames; columns are not
// empty.
struct Pairing {
    const Meeting* rows;
    const Columns* columns;
};

// Pixels of the pairing that are finger in both frames.
int32_t CommonArea(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing);

// Sum of the grey differences over the pairing's common area. Stops early, with a sum of at least
// limit, once limit is reached: a sum only grows.
int64_t DifferenceSum(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                      int64_t limit);

}  // namespace fpnavi

#endif  // FPNAVI_FRAMEPAIR_H
