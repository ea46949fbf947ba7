// The state of a gesture: its flags and the vote record. Owns the four variables below, which
// FpNaviClear resets. The motion methods and the driver write the record's entries at PairCount,
// the driver advances calc_cnt, the hg vote writes dx_sum and dy_sum.
#ifndef FPNAVI_GESTURE_H
#define FPNAVI_GESTURE_H

#include <algorithm>
#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

inline int32_t s_frameNum = 0;       // frames taken in this gesture; OrientationCalc counts
inline int32_t s_lastFrameFlag = 0;  // 1 after a frame without a finger; FingerStatus sets it
inline int32_t s_tuneOkFlag = 0;     // 1 when the last tuning call completed; Tune sets it
inline NaviVoteInfo_t s_voteInfo;

inline constexpr int32_t kPairCountMax = FPNAVI_VOTE_CAPACITY - 1;  // pair n also fills entry n + 1

// The frame tested last showed no finger.
inline bool FingerLifted() {
    return s_lastFrameFlag == 1;
}

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

#endif  // FPNAVI_GESTURE_H
