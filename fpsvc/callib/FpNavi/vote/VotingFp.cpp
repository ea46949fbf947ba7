#include <algorithm>
#include <iterator>
#include <optional>

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "vote/Voting.h"

namespace fpnavi {
namespace {

constexpr int32_t precision_times = 100;         // shares in percent, lengths in hundredths
constexpr int32_t sqrt_precision_times = 10000;  // its square, under a square root

// A displacement, x to the right, y upwards.
struct Move {
    int32_t dx;
    int32_t dy;
};

// What the pairs of a gesture add up to. Shares are percentages summed over the pairs: how much of
// the way went up, down, right and left.
struct Tally {
    Move sumCt;
    Move sumFp;
    int32_t method_ct[4];
    int32_t method_fp[4];
    int32_t count_of_diff_result;  // pairs that template matching or the no-move test saw rest
};

Move CtMove(int32_t i) {
    if (ScansTwice())
        return {s_voteInfo.dx_ds[i], s_voteInfo.dy_ds[i]};
    return {s_voteInfo.dx_ct[i], s_voteInfo.dy_ct[i]};
}

void Accumulate(const Move& move, Move* sum) {
    sum->dx = WrapAdd(sum->dx, move.dx);
    sum->dy = WrapAdd(sum->dy, move.dy);
}

int32_t SquaredLength(const Move& move) {
    return WrapAdd(WrapMul(move.dx, move.dx), WrapMul(move.dy, move.dy));
}

// Length of a pair's move in hundredths.
int32_t LengthJudge(const Move& move) {
    return IntSqrt(WrapMul(sqrt_precision_times, SquaredLength(move)));
}

// Adds the shares of one pair's move to the sums. Returns false for a move without extent, which
// has no shares.
bool AddShares(const Move& move, int32_t (&sums)[4]) {
    const int32_t dx_tmp = WrapMul(sqrt_precision_times, WrapAbs(move.dx));
    const int32_t dy_tmp = WrapMul(sqrt_precision_times, WrapAbs(move.dy));
    const int32_t sum_tmp = WrapAdd(dx_tmp, dy_tmp);
    if (sum_tmp == 0)
        return false;
    int32_t& vertical = sums[move.dy > 0 ? 0 : 1];
    int32_t& horizontal = sums[move.dx > 0 ? 2 : 3];
    vertical = WrapAdd(vertical, WrapDiv(WrapMul(precision_times, dy_tmp), sum_tmp));
    horizontal = WrapAdd(horizontal, WrapDiv(WrapMul(precision_times, dx_tmp), sum_tmp));
    return true;
}

// Adds up all pairs; empty when a motionless pair was to be scored.
std::optional<Tally> TallyPairs() {
    Tally tally = {};
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const int32_t length_min = WrapMul(precision_times, s_minDelta);
    for (int32_t i = 0; i < calc_cnt; ++i) {
        const Move ct = CtMove(i);
        const Move fp = {s_voteInfo.dx_fp[i], s_voteInfo.dy_fp[i]};
        const bool fpTrusted = s_voteInfo.diff[i] <= s_diffThresholdStr;
        Accumulate(ct, &tally.sumCt);
        if (fpTrusted)
            Accumulate(fp, &tally.sumFp);
        if (s_voteInfo.vkey_fp[i] == VKEY_NO_MOVE) {
            ++tally.count_of_diff_result;
            continue;
        }
        if (LengthJudge(ct) >= length_min && !AddShares(ct, tally.method_ct))
            return std::nullopt;
        const int32_t length_fp = LengthJudge(fp);
        if (fpTrusted && length_fp >= length_min &&
            (length_fp == 0 || !AddShares(fp, tally.method_fp)))
            return std::nullopt;
    }
    return tally;
}

// The key of the largest mixed score of both methods; of equal ones the last.
int32_t ChooseKey(const Tally& tally) {
    int32_t score[4];
    for (int32_t d = 0; d < 4; ++d)
        score[d] =
            WrapAdd(WrapMul(s_fpImp, tally.method_fp[d]), WrapMul(s_ctImp, tally.method_ct[d])) /
            precision_times;
    const auto [least, most] = std::minmax_element(std::begin(score), std::end(score));
    if (*least == *most && MayAnswerNone())
        return VKEY_NONE;
    return VKEY_UP + static_cast<int32_t>(most - score);
}

}  // namespace

int32_t Voting_fp_mode() {
    if (LogShown())
        LogVoteInfo();
    const std::optional<Tally> tally = TallyPairs();
    if (!tally)
        return -1;
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const int32_t rest_cnt = tally->count_of_diff_result;
    const int32_t ct_final_distance = IntSqrt(SquaredLength(tally->sumCt));
    const int32_t fp_final_distance = IntSqrt(SquaredLength(tally->sumFp));
    const bool hardlyMoved =
        ct_final_distance < s_ct_none_threshold && ct_final_distance > 0 && fp_final_distance == 0;
    if (hardlyMoved && rest_cnt == 0 && MayAnswerNone())
        return VKEY_NONE;
    const bool rested = rest_cnt != 0 && fp_final_distance <= s_fpMoveThreshold &&
                        ct_final_distance <= s_ct_not_move_threshold;
    const bool tooShort =
        calc_cnt == 0 || WrapAdd(ct_final_distance, fp_final_distance) <= s_totalMoveThreshold;
    const bool oneMovingPair =
        calc_cnt - rest_cnt <= 1 && s_directionControlFlag == kDirectionVertical;
    // The finger is still down after a short way.
    const bool longPress = !FingerLifted() && ct_final_distance < s_totalMoveThresholdLongpressCt &&
                           fp_final_distance < s_totalMoveThresholdLongpressFp;
    return rested || tooShort || oneMovingPair || longPress ? VKEY_NO_MOVE : ChooseKey(*tally);
}

}  // namespace fpnavi
