// The votes: from the record to a key. Owns nothing.
#ifndef FPNAVI_VOTING_H
#define FPNAVI_VOTING_H

#include <cstdint>

namespace fpnavi {

// The vote of the hg mode: centroid verdicts and total centroid travel of s_voteInfo, the latter
// stored in its dx_sum and dy_sum. Returns a key, never VKEY_NONE.
int32_t Voting_hg_mode();

// The vote of the fp modes over s_voteInfo: per-pair shares of template matching and centroid (or
// double scan), weighed into one score for each direction. Returns a key, or -1 when a motionless
// pair was to be scored, which only s_minDelta <= 0 lets happen.
int32_t Voting_fp_mode();

// Logs the record as the fp vote finds it: ten lines over s_voteInfo, always its first eleven
// entries.
void LogVoteInfo();

}  // namespace fpnavi

#endif  // FPNAVI_VOTING_H
