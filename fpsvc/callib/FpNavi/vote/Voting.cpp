// Voting: when a vote is due, which mode votes, and what the host's settings make of the key.
#include "vote/Voting.h"

#include "base/NaviLog.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// On the back of the device left and right are exchanged.
int32_t MirrorForBack(int32_t vkey_value) {
    if (IsOnBack() && vkey_value == VKEY_RIGHT)
        return VKEY_LEFT;
    if (IsOnBack() && vkey_value == VKEY_LEFT)
        return VKEY_RIGHT;
    return vkey_value;
}

// Keys of an axis that the host does not want become no move.
int32_t FilterDirection(int32_t vkey_value) {
    const bool horizontal = vkey_value == VKEY_RIGHT || vkey_value == VKEY_LEFT;
    const bool vertical = vkey_value == VKEY_UP || vkey_value == VKEY_DOWN;
    const bool unwanted = s_directionControlFlag == kDirectionNone ||
                          (s_directionControlFlag == kDirectionVertical && horizontal) ||
                          (s_directionControlFlag == kDirectionHorizontal && vertical);
    return unwanted ? VKEY_NO_MOVE : vkey_value;
}

}  // namespace
}  // namespace fpnavi

int32_t Voting(int32_t time_out) {
    using namespace fpnavi;
    if (time_out != 1 && !FingerLifted())
        return -1;
    const int32_t voted = IsHg() ? Voting_hg_mode() : Voting_fp_mode();
    const int32_t vkey_value = FilterDirection(MirrorForBack(voted));
    if (LogShown())
        NAVI_LOG("Voting", 498, "TQCODE -- TARQEN_FP_NAVI -- Voting - FINAL VKEY VALUE = %d!!\n",
                 vkey_value);
    return vkey_value;
}
