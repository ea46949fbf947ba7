// The vote of the fp modes: per-pair shares of template matching and centroid (or double scan),
// weighed into one score for each direction. Owns nothing.
#ifndef FPNAVI_VOTINGFP_H
#define FPNAVI_VOTINGFP_H

#include <cstdint>

namespace fpnavi {

// Votes over s_voteInfo. Returns a key, or -1 when a motionless pair was to be scored, which only
// s_minDelta <= 0 lets happen.
int32_t Voting_fp_mode();

}  // namespace fpnavi

#endif  // FPNAVI_VOTINGFP_H
