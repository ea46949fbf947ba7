// The vote record of the gesture. Owns s_voteInfo; the motion methods and the driver write its
// entries at calc_cnt, the driver advances calc_cnt, the hg vote writes dx_sum and dy_sum.
#ifndef FPNAVI_NAVIVOTEINFO_H
#define FPNAVI_NAVIVOTEINFO_H

#include "FpNavi.h"

namespace fpnavi {

extern NaviVoteInfo_t s_voteInfo;

// Zeroes the record but for xc_ds and yc_ds, which keep what the last double scan wrote.
void VoteInfoClear(NaviVoteInfo_t* voteInfo);

}  // namespace fpnavi

#endif  // FPNAVI_NAVIVOTEINFO_H
