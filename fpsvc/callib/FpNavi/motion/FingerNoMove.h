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

// Compares the frames of pair, which are of one size, at every shift within s_smallMoveTolRow and
// s_smallMoveTolCol. Returns one of the outcomes above, but kNoMoveFailed.
int32_t TestNoMove(const FramePair& pair);

// The same for two frames as they are. Returns one of the outcomes above.
int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERNOMOVE_H
