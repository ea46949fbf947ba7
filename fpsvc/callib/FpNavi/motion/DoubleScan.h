// The hardware double scan: the 8 x 8 zone maps of the last two frames, their measurement and the
// displacement between them. Owns both maps; FpNaviClear zeroes them.
#ifndef FPNAVI_DOUBLESCAN_H
#define FPNAVI_DOUBLESCAN_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

inline constexpr int32_t kZoneCells = 64;  // 8 rows of 8 cells

extern uint8_t DoubleScanZonePrev[kZoneCells];  // 1 covered, 0 not; row-major, row 0 on top
extern uint8_t DoubleScanZoneCurr[kZoneCells];

// Measures the map DoubleScanZone [in], kZoneCells bytes: centroid xc, yc [out] (percent of the map
// from its centre, x to the right, y upwards) and coverage cvr [out] (percent) of the cells that
// are exactly 1; all 0 when no cell is. Returns 0, or -1 for a null pointer.
int32_t DoubleScanGetCenterAndCoverage(const uint8_t* DoubleScanZone, int32_t* xc, int32_t* yc,
                                       int32_t* cvr);

// Writes the double-scan entries of voteInfo [in, out] at calc_cnt (frame entries also at calc_cnt
// + 1) for the maps pPrev and pCurr [in], kZoneCells bytes each. Returns 0, or -1 with nothing
// written when a map is null or all pairs are counted.
int32_t CalcDoubleScanMove(const uint8_t* pPrev, const uint8_t* pCurr, NaviVoteInfo_t* voteInfo);

}  // namespace fpnavi

#endif  // FPNAVI_DOUBLESCAN_H
