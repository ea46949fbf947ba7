// The centroid method: where the finger's centre of mass is in a frame, and how far it has moved
// between two. Owns nothing.
#ifndef FPNAVI_CENTERMOVE_H
#define FPNAVI_CENTERMOVE_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// Measures xc, yc and cvr of img from its class map, all 0 without finger. Returns 0, or -1 for a
// frame without pixels (it stays as it is).
int32_t GetCenterAndCoverage(NaviFrame_t* img);

// Writes dx_ct, dy_ct and vkey_ct of the pair of measured frames at calc_cnt of voteInfo.
// Returns 0.
int32_t CalcCenterMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr,
                       NaviVoteInfo_t* voteInfo);

}  // namespace fpnavi

#endif  // FPNAVI_CENTERMOVE_H
