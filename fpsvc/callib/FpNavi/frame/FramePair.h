// Two frames laid out for comparison, and the grey differences of the pixels that are finger in
// both, at any displacement. Owns nothing; a frame's mask lies in the space behind its classes.
#ifndef FPNAVI_FRAMEPAIR_H
#define FPNAVI_FRAMEPAIR_H

#include <algorithm>
#include <cstdint>

#include "FpNavi.h"
#include "base/NaviSimd.h"

namespace fpnavi {

// What a comparison reads of a frame: height rows of width bytes, one behind the other. grey and
// mask point into the frame's buffers; at least 15 bytes behind the last row can be read.
struct LaidFrame {
    const uint8_t* grey;
    const uint8_t* mask;  // 255 where the pixel is finger, else 0
    int32_t width;
    int32_t height;
    int32_t area;  // pixels that are finger
};

// Fills the mask of img, which has pixels and space behind them (FrameBytes). The result points
// into the buffers of img and is valid until one of them changes.
LaidFrame LayOut(const NaviFrame_t& img);

// The working state of a frame pair: the driver of the pair makes it and passes it to all steps.
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

// The places p of span for which p + offset lies in other.
inline Span Meet(const Span& span, const Span& other, int32_t offset) {
    return {std::max(span.first, other.first - offset), std::min(span.last, other.last - offset)};
}

inline constexpr int32_t kBandMax = 3;  // border, centre, border

// Places p of one axis that meet p + offset of the other frame: count spans, none empty. Those of
// columns are in ascending order, and none overlaps another.
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

// Up to 64 columns from column on, in steps of sixteen up to the last one that meets: the last step
// reaches at most 15 columns beyond it. Bytes of mask: 255 for a column that meets, else 0.
struct ColumnPiece {
    int32_t column;
    int32_t steps;
    Bytes16 mask[4];
};

// Columns that meet, and the first piece of them, empty when none meets.
struct Columns {
    Meeting meeting;
    ColumnPiece head;
};

Columns CutColumns(const Meeting& meeting);

// Pixel (r, c) of the first frame meets (r + offset of rows, c + offset of columns) of the second,
// which has the same size, for each place r of rows and c of columns. All of these lie inside both.
struct Pairing {
    const Meeting* rows;
    const Columns* columns;
};

// Pixels of the pairing that are finger in both frames, those of two spans twice: at most 2^25.
int32_t CommonArea(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing);

// Sum of the grey differences over the pairing's common area. Once the sum reaches limit it may
// stop and return what it has, at least limit.
int64_t DifferenceSum(const LaidFrame& first, const LaidFrame& second, const Pairing& pairing,
                      int64_t limit);

}  // namespace fpnavi

#endif  // FPNAVI_FRAMEPAIR_H
