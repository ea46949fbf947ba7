// The vote of the hg mode: centroid verdicts and total centroid travel. Owns nothing.
#ifndef FPNAVI_VOTINGHG_H
#define FPNAVI_VOTINGHG_H

#include <cstdint>

namespace fpnavi {

// Votes over s_voteInfo and stores the total travel in its dx_sum and dy_sum. Returns a key,
// never VKEY_NONE.
int32_t Voting_hg_mode();

}  // namespace fpnavi

#endif  // FPNAVI_VOTINGHG_H
