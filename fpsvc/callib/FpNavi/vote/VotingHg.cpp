#include <algorithm>

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "vote/Voting.h"

namespace fpnavi {
namespace {

// Verdicts of the first calc_cnt pairs, counted.
struct VerdictCounts {
    int32_t byKey[VKEY_NO_MOVE + 1];

    int32_t Moving() const {
        return byKey[VKEY_UP] + byKey[VKEY_DOWN] + byKey[VKEY_RIGHT] + byKey[VKEY_LEFT];
    }
};

VerdictCounts CountVerdicts(int32_t calc_cnt) {
    VerdictCounts counts = {};
    for (int32_t i = 0; i < calc_cnt; ++i) {
        const int32_t vkey = s_voteInfo.vkey_ct[i];
        if (vkey >= VKEY_NONE && vkey <= VKEY_NO_MOVE)
            ++counts.byKey[vkey];
    }
    return counts;
}

// A stroke along one axis: the keys of its two directions, and the first and last place of the
// centroid on it.
struct Axis {
    int32_t positive;
    int32_t negative;
    int32_t first;
    int32_t last;
};

int32_t VoteAlong(const Axis& axis, const Axis& across, const VerdictCounts& counts) {
    const int32_t total = WrapSub(axis.last, axis.first);
    if (WrapAbs(total) < s_totalMoveThreshold)
        return VKEY_NO_MOVE;
    // A centroid that crossed the middle has moved, whatever the verdicts of single pairs are.
    if (WrapMul(axis.first, axis.last) < 0)
        return total > 0 ? axis.positive : axis.negative;
    const int32_t move_cnt = counts.Moving();
    if (move_cnt < s_moveCntEffThr &&
        (counts.byKey[VKEY_NO_MOVE] >= move_cnt || move_cnt <= s_moveCntMinThr))
        return VKEY_NO_MOVE;
    // The verdicts along the axis have one direction, and are more than those of either key across.
    const int32_t positive = counts.byKey[axis.positive];
    const int32_t negative = counts.byKey[axis.negative];
    const int32_t mostAcross =
        std::max(counts.byKey[across.positive], counts.byKey[across.negative]);
    if (positive > mostAcross && negative == 0)
        return axis.positive;
    return negative > mostAcross && positive == 0 ? axis.negative : VKEY_NO_MOVE;
}

}  // namespace

int32_t Voting_hg_mode() {
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const Axis horizontal = {VKEY_RIGHT, VKEY_LEFT, s_voteInfo.xc[0], s_voteInfo.xc[calc_cnt]};
    const Axis vertical = {VKEY_UP, VKEY_DOWN, s_voteInfo.yc[0], s_voteInfo.yc[calc_cnt]};
    s_voteInfo.dx_sum = WrapSub(horizontal.last, horizontal.first);
    s_voteInfo.dy_sum = WrapSub(vertical.last, vertical.first);
    const VerdictCounts counts = CountVerdicts(calc_cnt);
    if (counts.Moving() == 0)
        return VKEY_NO_MOVE;
    const int32_t ax = WrapAbs(s_voteInfo.dx_sum);
    const int32_t ay = WrapAbs(s_voteInfo.dy_sum);
    if (WrapMul(100, std::max(ax, ay)) < WrapMul(120, std::min(ax, ay)))
        return VKEY_NO_MOVE;
    return ax > ay ? VoteAlong(horizontal, vertical, counts)
                   : VoteAlong(vertical, horizontal, counts);
}

}  // namespace fpnavi
