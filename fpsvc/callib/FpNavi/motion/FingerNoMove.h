// The no-move test: do two frames show the same ridges at nearly the same place? Owns nothing.
#ifndef FPNAVI_FINGERNOMOVE_H
#define FPNAVI_FINGERNOMOVE_H

#include <cstdint>

#include "FpNavi.h"
#include "frame/FramePair.h"

namespace fpnavi {

// Outcomes of FingerNoMove.
inline constexpr int32_t kNoMoveFailed = -1;       // frames of different sizes or without pixels
inline constexpr int32_t kNoMoveResting = 0;       // some small shift makes the frames equal enough
inline constexpr int32_t kNoMoveMoved = 1;         // none does
inline constexpr int32_t kNoMoveUndetermined = 2;  // no shift has enough common finger area

// What the test reads of the parameters.
struct NoMoveLimits {
    int32_t boundWidth;      // pixels of the left and right border band
    int32_t boundHeight;     // pixels of the top and bottom border band
    int32_t tolRow;          // largest shift, rows
    int32_t tolCol;          // largest shift, columns
    int32_t overlapAreaMin;  // pixels that are finger in both frames, for a shift to count
    int32_t diffTol;         // mean grey difference below which the finger rests
};

NoMoveLimits CurrentNoMoveLimits();

// Compares the frames of pair, which are of one size, at every shift within the limits. Returns one
// of the outcomes above, but kNoMoveFailed.
int32_t TestNoMove(const FramePair& pair, const NoMoveLimits& limits);

// The same for two frames as they are, with the current limits. Returns one of the outcomes above.
int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERNOMOVE_H
