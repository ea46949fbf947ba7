// The vote of the fp modes: two motion estimates per pair, the "ct" one (centroid or double scan)
// and the "fp" one (template match), are summed over the gesture and turned into weighted scores
// of the four directions.

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

constexpr int32_t precision_times = 100;         // scale of shares and lengths
constexpr int32_t sqrt_precision_times = 10000;  // its square, under the root
constexpr int32_t kShown = 11;                   // entries the log block shows

enum Direction : int32_t { kUp = 0, kRight = 1, kDown = 2, kLeft = 3, kDirectionNum = 4 };

struct GestureSums {
    int32_t dx_sum_fp;
    int32_t dy_sum_fp;
    int32_t dx_sum_ct;
    int32_t dy_sum_ct;
    int32_t method_ct[kDirectionNum];
    int32_t method_fp[kDirectionNum];
    int32_t count_of_diff_result;  // pairs whose template verdict is no move
};

std::vector<int32_t> FirstEntries(const int32_t* values) {
    return std::vector<int32_t>(values, values + kShown);
}

std::vector<int32_t> FirstPairs(const int32_t* dx, const int32_t* dy) {
    std::vector<int32_t> pairs;
    for (int32_t k = 0; k < kShown; ++k) {
        pairs.push_back(dx[k]);
        pairs.push_back(dy[k]);
    }
    return pairs;
}

void Log(int32_t line, const char* format, const std::vector<int32_t>& values) {
    LogLine("Voting_fp_mode", line, FormatValues(format, values));
}

// The single-value lines pass eleven values to ten conversions, and only the fp pairs have a blank
// before the closing brace; readers of the log know the lines like that.
void LogVoteInformation() {
    const NaviVoteInfo_t& info = s_voteInfo;
    const int32_t n = PairsOf(info);
    Log(508, "##################### Vote information ########################\n", {});
    Log(510, "calculate count = %d\n", {n});
    Log(512, "Initial and final centroid position are (%d, %d) and (%d, %d).\n",
        {info.xc[0], info.yc[0], info.xc[n], info.yc[n]});
    Log(516, "Centroid method result array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
        FirstEntries(info.vkey_ct));
    Log(521,
        "Centroid results (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) "
        "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d)}\n",
        FirstPairs(info.dx_ct, info.dy_ct));
    Log(523,
        "Initial and final centroid position of hardware navigation are (%d, %d) and (%d, %d).\n",
        {info.xc_ds[0], info.yc_ds[0], info.xc_ds[n], info.yc_ds[n]});
    Log(528,
        "Centroid results of hardware navigation (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) "
        "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d)}\n",
        FirstPairs(info.dx_ds, info.dy_ds));
    Log(532, "Fingerprint match result array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
        FirstEntries(info.vkey_fp));
    Log(537,
        "Fingerprint results (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) "
        "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) }\n",
        FirstPairs(info.dx_fp, info.dy_fp));
    Log(541, "Fingerprint diff array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
        FirstEntries(info.diff));
}

int32_t SquaredLength(int32_t dx, int32_t dy) {
    return WrapAdd32(WrapMul32(dx, dx), WrapMul32(dy, dy));
}

// In hundredths.
int32_t ScaledLength(int32_t dx, int32_t dy) {
    return IntSqrt(WrapMul32(sqrt_precision_times, SquaredLength(dx, dy)));
}

// Splits 100 percent between the pair's vertical and horizontal direction; -1 without travel.
int32_t AddShares(int32_t dx, int32_t dy, int32_t (&method)[kDirectionNum]) {
    const int32_t dx_tmp = WrapMul32(sqrt_precision_times, WrapAbs32(dx));
    const int32_t dy_tmp = WrapMul32(sqrt_precision_times, WrapAbs32(dy));
    const int32_t sum_tmp = WrapAdd32(dx_tmp, dy_tmp);
    if (sum_tmp == 0)
        return -1;
    int32_t& vertical = method[dy > 0 ? kUp : kDown];
    int32_t& horizontal = method[dx > 0 ? kRight : kLeft];
    vertical = WrapAdd32(vertical, WrapDiv32(WrapMul32(precision_times, dy_tmp), sum_tmp));
    horizontal = WrapAdd32(horizontal, WrapDiv32(WrapMul32(precision_times, dx_tmp), sum_tmp));
    return 0;
}

// Adds pair i; -1 when a motionless pair would have to be scored.
int32_t AddPair(int32_t i, GestureSums* sums) {
    const int32_t cx = s_doubleScanFlag == 1 ? s_voteInfo.dx_ds[i] : s_voteInfo.dx_ct[i];
    const int32_t cy = s_doubleScanFlag == 1 ? s_voteInfo.dy_ds[i] : s_voteInfo.dy_ct[i];
    const int32_t fx = s_voteInfo.dx_fp[i];
    const int32_t fy = s_voteInfo.dy_fp[i];
    const bool fpTrusted = s_voteInfo.diff[i] <= s_diffThresholdStr;
    sums->dx_sum_ct = WrapAdd32(sums->dx_sum_ct, cx);
    sums->dy_sum_ct = WrapAdd32(sums->dy_sum_ct, cy);
    if (fpTrusted) {
        sums->dx_sum_fp = WrapAdd32(sums->dx_sum_fp, fx);
        sums->dy_sum_fp = WrapAdd32(sums->dy_sum_fp, fy);
    }
    if (s_voteInfo.vkey_fp[i] == VKEY_NO_MOVE) {
        ++sums->count_of_diff_result;
        return 0;
    }
    const int32_t length_judge_ct = ScaledLength(cx, cy);
    const int32_t length_judge_fp = ScaledLength(fx, fy);
    const int32_t leastLength = WrapMul32(precision_times, s_minDelta);
    if (length_judge_ct >= leastLength && AddShares(cx, cy, sums->method_ct) == -1)
        return -1;
    if (fpTrusted && length_judge_fp >= leastLength) {
        if (length_judge_fp == 0 || AddShares(fx, fy, sums->method_fp) == -1)
            return -1;
    }
    return 0;
}

// Whether the gesture moved far enough, in enough pairs, for a key.
bool HasMoved(const GestureSums& sums, int32_t ct_final_distance, int32_t fp_final_distance) {
    if (PairsOf(s_voteInfo) == 0)
        return false;
    const int32_t final_ct_and_fp = WrapAdd32(ct_final_distance, fp_final_distance);
    if (final_ct_and_fp <= s_totalMoveThreshold)
        return false;
    const int32_t movingPairs = PairsOf(s_voteInfo) - sums.count_of_diff_result;
    return movingPairs > 1 || s_directionControlFlag != 1;
}

// The best direction; of equal scores the later of up, down, right, left.
int32_t ChooseKey(const GestureSums& sums) {
    int32_t score[kDirectionNum];
    for (int32_t d = 0; d < kDirectionNum; ++d) {
        const int32_t fp = WrapMul32(s_fpImp, sums.method_fp[d]);
        const int32_t ct = WrapMul32(s_ctImp, sums.method_ct[d]);
        score[d] = WrapAdd32(fp, ct) / precision_times;
    }
    const int32_t score_max =
        Max32(Max32(score[kUp], score[kRight]), Max32(score[kDown], score[kLeft]));
    const bool allEqual = score[kUp] == score[kRight] && score[kRight] == score[kDown] &&
                          score[kDown] == score[kLeft];
    if (allEqual && s_open_vkey_none_navi == 1)
        return VKEY_NONE;
    int32_t vkey_value = VKEY_UP;
    if (score[kDown] == score_max)
        vkey_value = VKEY_DOWN;
    if (score[kRight] == score_max)
        vkey_value = VKEY_RIGHT;
    if (score[kLeft] == score_max)
        vkey_value = VKEY_LEFT;
    return vkey_value;
}

// A vote forced while the finger is still down, over a short travel.
bool IsLongPress(int32_t ct_final_distance, int32_t fp_final_distance) {
    return s_lastFrameFlag == 0 && ct_final_distance < s_totalMoveThresholdLongpressCt &&
           fp_final_distance < s_totalMoveThresholdLongpressFp;
}

}  // namespace

int32_t Voting_fp_mode() {
    if (s_logShowFlag == 1)
        LogVoteInformation();
    GestureSums sums = {};
    const int32_t pairs = PairsOf(s_voteInfo);
    for (int32_t i = 0; i < pairs; ++i) {
        if (AddPair(i, &sums) == -1)
            return -1;
    }
    const int32_t ct_final_distance = IntSqrt(SquaredLength(sums.dx_sum_ct, sums.dy_sum_ct));
    const int32_t fp_final_distance = IntSqrt(SquaredLength(sums.dx_sum_fp, sums.dy_sum_fp));
    const bool hardlyMoved =
        ct_final_distance < s_ct_none_threshold && ct_final_distance > 0 && fp_final_distance == 0;
    if (hardlyMoved && sums.count_of_diff_result == 0 && s_open_vkey_none_navi == 1)
        return VKEY_NONE;
    if (sums.count_of_diff_result != 0 && fp_final_distance <= s_fpMoveThreshold &&
        ct_final_distance <= s_ct_not_move_threshold)
        return VKEY_NO_MOVE;
    if (!HasMoved(sums, ct_final_distance, fp_final_distance))
        return VKEY_NO_MOVE;
    const int32_t vkey_value = ChooseKey(sums);
    return IsLongPress(ct_final_distance, fp_final_distance) ? VKEY_NO_MOVE : vkey_value;
}

}  // namespace reference
