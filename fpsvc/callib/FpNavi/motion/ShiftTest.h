// The no-move test on small frames: the same outcome without the least difference itself. Owns
// nothing.
#ifndef FPNAVI_SHIFTTEST_H
#define FPNAVI_SHIFTTEST_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// Frames of img's size fit words, and the border bands lie inside them.
bool CanTestShifts(const NaviFrame_t& img);

// The outcome of FingerNoMove for two frames of one size that CanTestShifts.
int32_t TestShifts(const NaviFrame_t& img_prev, const NaviFrame_t& img_curr);

}  // namespace fpnavi

#endif  // FPNAVI_SHIFTTEST_H
