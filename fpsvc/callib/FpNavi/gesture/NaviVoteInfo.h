// The vote record of the gesture. Owns s_voteInfo; the motion methods and the driver write its
// entries at PairCount, the driver advances calc_cnt, the hg vote writes dx_sum and dy_sum.
#ifndef FPNAVI_NAVIVOTEINFO_H
#define FPNAVI_NAVIVOTEINFO_H

#include <algorithm>
#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

inline constexpr int32_t kPairCountMax = FPNAVI_VOTE_CAPACITY - 1;  // pair n also fills entry n + 1

extern NaviVoteInfo_t s_voteInfo;

// The pairs that voteInfo holds, 0..kPairCountMax: all readers of calc_cnt take it from here. The
// host has the record in its hands and may have written any count: a negative one is taken for 0, a
// larger one for kPairCountMax, and what is stored stays as it is. So the votes and their log lines
// are those of 0 or 99 pairs; the driver adds no pair to 99 or more, and to a negative count it
// adds the pair as the first and stores 1.
inline int32_t PairCount(const NaviVoteInfo_t& voteInfo) {
    return std::clamp(voteInfo.calc_cnt, 0, kPairCountMax);
}

// Zeroes the record but for xc_ds and yc_ds, which keep what the last double scan wrote.
void VoteInfoClear(NaviVoteInfo_t* voteInfo);

}  // namespace fpnavi

#endif  // FPNAVI_NAVIVOTEINFO_H
