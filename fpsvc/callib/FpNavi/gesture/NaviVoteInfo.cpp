#include "gesture/NaviVoteInfo.h"

#include <algorithm>
#include <iterator>

namespace fpnavi {

NaviVoteInfo_t s_voteInfo;

void VoteInfoClear(NaviVoteInfo_t* voteInfo) {
    voteInfo->calc_cnt = 0;
    for (auto* entries :
         {&voteInfo->xc, &voteInfo->yc, &voteInfo->cvr, &voteInfo->dx_ct, &voteInfo->dy_ct,
          &voteInfo->dx_fp, &voteInfo->dy_fp, &voteInfo->diff, &voteInfo->vkey_fp,
          &voteInfo->vkey_ct, &voteInfo->dx_ds, &voteInfo->dy_ds, &voteInfo->cvr_ds})
        std::fill(std::begin(*entries), std::end(*entries), 0);
    voteInfo->dx_sum = 0;
    voteInfo->dy_sum = 0;
}

}  // namespace fpnavi

NaviVoteInfo_t* PrintNaviLog() {
    return &fpnavi::s_voteInfo;
}
