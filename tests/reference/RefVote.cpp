// The vote: Voting decides whether one is due, dispatches by mode, applies the mounting and the
// direction filter and logs the key. The hg rule, on centroid verdicts alone, is here as well.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

struct VerdictCounts {
    int32_t move_cnt;
    int32_t no_move_cnt;
    int32_t ofKey[6];  // indexed by key value
};

// One axis of the stroke: the keys of its two directions and of the axis across it.
struct Axis {
    int32_t positiveKey;
    int32_t negativeKey;
    int32_t crossKey1;
    int32_t crossKey2;
};

constexpr Axis kHorizontal = {VKEY_RIGHT, VKEY_LEFT, VKEY_DOWN, VKEY_UP};
constexpr Axis kVertical = {VKEY_UP, VKEY_DOWN, VKEY_LEFT, VKEY_RIGHT};

VerdictCounts CountVerdicts(int32_t calc_cnt) {
    VerdictCounts counts = {};
    for (int32_t i = 0; i < calc_cnt; ++i) {
        const int32_t vkey = s_voteInfo.vkey_ct[i];
        if (vkey == VKEY_NO_MOVE) {
            ++counts.no_move_cnt;
        } else if (vkey >= VKEY_UP && vkey <= VKEY_LEFT) {
            ++counts.ofKey[vkey];
            ++counts.move_cnt;
        }
    }
    return counts;
}

bool CountRuleAccepts(const VerdictCounts& counts) {
    if (counts.move_cnt >= s_moveCntEffThr)
        return true;
    return counts.no_move_cnt < counts.move_cnt && counts.move_cnt > s_moveCntMinThr;
}

// More verdicts than each key across, and not a single opposite one.
bool Prevails(const VerdictCounts& counts, const Axis& axis, int32_t key, int32_t opposite) {
    return counts.ofKey[key] > counts.ofKey[axis.crossKey1] &&
           counts.ofKey[key] > counts.ofKey[axis.crossKey2] && counts.ofKey[opposite] == 0;
}

int32_t DecideAxis(const VerdictCounts& counts, const Axis& axis, int32_t init, int32_t final,
                   int32_t total) {
    if (WrapAbs32(total) < s_totalMoveThreshold)
        return VKEY_NO_MOVE;
    if (WrapMul32(init, final) < 0)
        return total > 0 ? axis.positiveKey : axis.negativeKey;
    if (Prevails(counts, axis, axis.positiveKey, axis.negativeKey))
        return CountRuleAccepts(counts) ? axis.positiveKey : VKEY_NO_MOVE;
    if (Prevails(counts, axis, axis.negativeKey, axis.positiveKey))
        return CountRuleAccepts(counts) ? axis.negativeKey : VKEY_NO_MOVE;
    return VKEY_NO_MOVE;
}

}  // namespace

int32_t Voting_hg_mode() {
    const int32_t calc_cnt = PairsOf(s_voteInfo);
    const int32_t x_init = s_voteInfo.xc[0];
    const int32_t y_init = s_voteInfo.yc[0];
    const int32_t x_final = s_voteInfo.xc[calc_cnt];
    const int32_t y_final = s_voteInfo.yc[calc_cnt];
    const int32_t total_dx = WrapSub32(x_final, x_init);
    const int32_t total_dy = WrapSub32(y_final, y_init);
    s_voteInfo.dx_sum = total_dx;
    s_voteInfo.dy_sum = total_dy;
    const VerdictCounts counts = CountVerdicts(calc_cnt);
    if (counts.move_cnt == 0)
        return VKEY_NO_MOVE;
    const int32_t ax = WrapAbs32(total_dx);
    const int32_t ay = WrapAbs32(total_dy);
    if (WrapMul32(100, Max32(ax, ay)) < WrapMul32(120, Min32(ax, ay)))
        return VKEY_NO_MOVE;
    if (ax > ay)
        return DecideAxis(counts, kHorizontal, x_init, x_final, total_dx);
    return DecideAxis(counts, kVertical, y_init, y_final, total_dy);
}

namespace {

int32_t ApplyMounting(int32_t vkey_value) {
    if (s_sensorBackFlag != 1)
        return vkey_value;
    if (vkey_value == VKEY_RIGHT)
        return VKEY_LEFT;
    return vkey_value == VKEY_LEFT ? VKEY_RIGHT : vkey_value;
}

int32_t ApplyDirectionControl(int32_t vkey_value) {
    const bool horizontal = vkey_value == VKEY_RIGHT || vkey_value == VKEY_LEFT;
    const bool vertical = vkey_value == VKEY_UP || vkey_value == VKEY_DOWN;
    if (s_directionControlFlag == 0 || (s_directionControlFlag == 1 && horizontal) ||
        (s_directionControlFlag == 2 && vertical))
        return VKEY_NO_MOVE;
    return vkey_value;
}

}  // namespace

int32_t Voting(int32_t time_out) {
    if (time_out != 1 && s_lastFrameFlag != 1)
        return -1;
    int32_t vkey_value = s_modeFlag == 1 ? Voting_hg_mode() : Voting_fp_mode();
    vkey_value = ApplyDirectionControl(ApplyMounting(vkey_value));
    if (s_logShowFlag == 1)
        LogLine("Voting", 498,
                FormatValues("TQCODE -- TARQEN_FP_NAVI -- Voting - FINAL VKEY VALUE = %d!!\n",
                             {vkey_value}));
    return vkey_value;
}

}  // namespace reference
