#include "gesture/Gesture.h"

#include <cstddef>
#include <cstring>

void fpnavi::VoteInfoClear(NaviVoteInfo_t* voteInfo) {
    std::memset(voteInfo, 0, offsetof(NaviVoteInfo_t, xc_ds));
    for (auto* entries : {&voteInfo->cvr_ds, &voteInfo->dx_ds, &voteInfo->dy_ds})
        std::memset(*entries, 0, sizeof *entries);
}

NaviVoteInfo_t* PrintNaviLog() {
    return &fpnavi::s_voteInfo;
}
