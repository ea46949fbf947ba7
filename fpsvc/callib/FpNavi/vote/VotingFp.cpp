#include "vote/VotingFp.h"

#include <algorithm>
#include <iterator>
#include <optional>

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "gesture/NaviVoteInfo.h"
#include "param/NaviParam.h"
#include "vote/VoteInfoLog.h"

namespace fpnavi {
namespace {

constexpr int32_t precision_times = 100;         // shares in percent, lengths in hundredths
constexpr int32_t sqrt_precision_times = 10000;  // its square, under a square root

// A displacement, x to the right, y upwards.
struct Move {
    int32_t dx;
    int32_t dy;
};

// Percentages summed over the pairs: how much of the way went in each direction.
struct DirectionSums {
    int32_t up;
    int32_t right;
    int32_t down;
    int32_t left;
};

// What the pairs of a gesture add up to.
struct Tally {
    Move sumCt;
    Move sumFp;
    DirectionSums method_ct;
    DirectionSums method_fp;
    int32_t count_of_diff_result;  // pairs that template matching or the no-move test saw rest
};

Move CtMove(int32_t i) {
    if (ScansTwice())
        return {s_voteInfo.dx_ds[i], s_voteInfo.dy_ds[i]};
    return {s_voteInfo.dx_ct[i], s_voteInfo.dy_ct[i]};
}

Move FpMove(int32_t i) {
    return {s_voteInfo.dx_fp[i], s_voteInfo.dy_fp[i]};
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

bool LongEnough(int32_t length_judge) {
    return length_judge >= WrapMul(precision_times, s_minDelta);
}

// Adds the shares of one pair's move, in percent, to the sums. Returns false for a move without
// extent, which has no shares.
bool AddShares(const Move& move, DirectionSums* sums) {
    const int32_t dx_tmp = WrapMul(sqrt_precision_times, WrapAbs(move.dx));
    const int32_t dy_tmp = WrapMul(sqrt_precision_times, WrapAbs(move.dy));
    const int32_t sum_tmp = WrapAdd(dx_tmp, dy_tmp);
    if (sum_tmp == 0)
        return false;
    int32_t& vertical = move.dy > 0 ? sums->up : sums->down;
    int32_t& horizontal = move.dx > 0 ? sums->right : sums->left;
    vertical = WrapAdd(vertical, WrapDiv(WrapMul(precision_times, dy_tmp), sum_tmp));
    horizontal = WrapAdd(horizontal, WrapDiv(WrapMul(precision_times, dx_tmp), sum_tmp));
    return true;
}

// Adds the shares of pair i by both methods. Returns false when a motionless pair was to be scored.
bool ScorePair(int32_t i, bool fpTrusted, Tally* tally) {
    const Move ct = CtMove(i);
    const Move fp = FpMove(i);
    if (LongEnough(LengthJudge(ct)) && !AddShares(ct, &tally->method_ct))
        return false;
    const int32_t length_judge_fp = LengthJudge(fp);
    if (!fpTrusted || !LongEnough(length_judge_fp))
        return true;
    return length_judge_fp != 0 && AddShares(fp, &tally->method_fp);
}

// Adds up all pairs; empty when a motionless pair was to be scored.
std::optional<Tally> TallyPairs() {
    Tally tally = {};
    const int32_t calc_cnt = PairCount(s_voteInfo);
    for (int32_t i = 0; i < calc_cnt; ++i) {
        const bool fpTrusted = s_voteInfo.diff[i] <= s_diffThresholdStr;
        Accumulate(CtMove(i), &tally.sumCt);
        if (fpTrusted)
            Accumulate(FpMove(i), &tally.sumFp);
        if (s_voteInfo.vkey_fp[i] == VKEY_NO_MOVE) {
            ++tally.count_of_diff_result;
            continue;
        }
        if (!ScorePair(i, fpTrusted, &tally))
            return std::nullopt;
    }
    return tally;
}

// A mixed score of both methods for one direction.
int32_t MixScore(int32_t fp, int32_t ct) {
    return WrapAdd(WrapMul(s_fpImp, fp), WrapMul(s_ctImp, ct)) / precision_times;
}

// The key of the largest score; of equal ones the later in the order up, down, right, left wins.
int32_t ChooseKey(const DirectionSums& fp, const DirectionSums& ct) {
    const int32_t score[] = {MixScore(fp.up, ct.up), MixScore(fp.down, ct.down),
                             MixScore(fp.right, ct.right), MixScore(fp.left, ct.left)};
    const int32_t score_max = *std::max_element(std::begin(score), std::end(score));
    const int32_t score_min = *std::min_element(std::begin(score), std::end(score));
    if (score_min == score_max && MayAnswerNone())
        return VKEY_NONE;
    int32_t vkey_value = VKEY_NONE;
    for (int32_t d = 0; d < 4; ++d) {
        if (score[d] == score_max)
            vkey_value = VKEY_UP + d;
    }
    return vkey_value;
}

// What the distances alone decide: a key, or empty when the scores have to.
std::optional<int32_t> JudgeDistances(const Tally& tally, int32_t ct_final_distance,
                                      int32_t fp_final_distance) {
    const int32_t calc_cnt = PairCount(s_voteInfo);
    const bool anyRest = tally.count_of_diff_result != 0;
    const bool hardlyMoved =
        ct_final_distance < s_ct_none_threshold && ct_final_distance > 0 && fp_final_distance == 0;
    if (hardlyMoved && !anyRest && MayAnswerNone())
        return VKEY_NONE;
    if (anyRest && fp_final_distance <= s_fpMoveThreshold &&
        ct_final_distance <= s_ct_not_move_threshold)
        return VKEY_NO_MOVE;
    const int32_t final_ct_and_fp = WrapAdd(ct_final_distance, fp_final_distance);
    const bool oneMovingPair = calc_cnt - tally.count_of_diff_result <= 1;
    if (calc_cnt == 0 || final_ct_and_fp <= s_totalMoveThreshold ||
        (oneMovingPair && s_directionControlFlag == kDirectionVertical))
        return VKEY_NO_MOVE;
    return std::nullopt;
}

}  // namespace

int32_t Voting_fp_mode() {
    if (LogShown())
        LogVoteInfo();
    const std::optional<Tally> tally = TallyPairs();
    if (!tally)
        return -1;
    const int32_t ct_final_distance = IntSqrt(SquaredLength(tally->sumCt));
    const int32_t fp_final_distance = IntSqrt(SquaredLength(tally->sumFp));
    if (const auto decided = JudgeDistances(*tally, ct_final_distance, fp_final_distance))
        return *decided;
    // The finger is still down after a short way: a long press.
    if (!FingerLifted() && ct_final_distance < s_totalMoveThresholdLongpressCt &&
        fp_final_distance < s_totalMoveThresholdLongpressFp)
        return VKEY_NO_MOVE;
    return ChooseKey(tally->method_fp, tally->method_ct);
}

}  // namespace fpnavi
