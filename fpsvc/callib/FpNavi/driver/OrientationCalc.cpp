#include "driver/OrientationCalc.h"

#include "base/NaviLog.h"
#include "base/NaviMath.h"
#include "frame/FramePair.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "gesture/Gesture.h"
#include "gesture/NaviVoteInfo.h"
#include "matching/PairMatch.h"
#include "motion/CenterMove.h"
#include "motion/DoubleScan.h"
#include "motion/FingerNoMove.h"
#include "param/NaviLimits.h"
#include "param/NaviMode.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kPairMax = FPNAVI_VOTE_CAPACITY - 1;  // entry n + 1 of the last pair must fit

// Loads and pre-processes the whole image at data into s_imageCurr.
int32_t LoadFrame(const uint8_t* data) {
    if (ImgInit(&s_imageCurr, 0, s_imageHeight, 0, s_imageWidth, data) != 0)
        return -1;
    return ImgPreProcess(&s_imageCurr);
}

// The current frame becomes the previous one, data the current one, and the pair is evaluated.
int32_t NextFrame(const uint8_t* data) {
    if (ImgCopy(&s_imagePrev, &s_imageCurr) != 0)
        return -1;
    ImgClear(&s_imageCurr);
    if (LoadFrame(data) != 0)
        return -1;
    return OrntCalcProcess();
}

// A frame starts with measures of 0, and only GetCenterAndCoverage changes them. So a frame whose
// measures are all 0 is not measured yet, or measuring it again gives the same zeros.
bool IsMeasured(const NaviFrame_t& img) {
    return img.cvr != 0 || img.xc != 0 || img.yc != 0;
}

bool CoversLess(int32_t coverage) {
    return s_imagePrev.cvr < coverage || s_imageCurr.cvr < coverage;
}

void RecordCenters(int32_t n) {
    s_voteInfo.xc[n] = s_imagePrev.xc;
    s_voteInfo.yc[n] = s_imagePrev.yc;
    s_voteInfo.xc[n + 1] = s_imageCurr.xc;
    s_voteInfo.yc[n + 1] = s_imageCurr.yc;
    s_voteInfo.cvr[n] = s_imagePrev.cvr;
    s_voteInfo.cvr[n + 1] = s_imageCurr.cvr;
}

// The finger rests: the centroid moved only because the contact changed. Both frames of the pair
// get the centroid of the frame that shows more finger, the previous one on a tie.
void RecordRest(int32_t n) {
    s_voteInfo.dx_ct[n] = 0;
    s_voteInfo.dy_ct[n] = 0;
    s_voteInfo.vkey_ct[n] = VKEY_NO_MOVE;
    if (s_imageCurr.cvr <= s_voteInfo.cvr[n]) {
        s_voteInfo.xc[n + 1] = s_voteInfo.xc[n];
        s_voteInfo.yc[n + 1] = s_voteInfo.yc[n];
    } else {
        s_voteInfo.xc[n] = s_imageCurr.xc;
        s_voteInfo.yc[n] = s_imageCurr.yc;
    }
}

void RecordFingerprint(int32_t n, int32_t vkey) {
    s_voteInfo.vkey_fp[n] = vkey;
    s_voteInfo.dx_fp[n] = 0;
    s_voteInfo.dy_fp[n] = 0;
}

// The fingerprint methods of the fp modes, cheapest first.
int32_t CompareFingerprints(int32_t n) {
    if (!AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    const int32_t outcome = TestNoMove(pair);
    if (outcome == kNoMoveMoved)
        return CoversLess(s_coverageMinFp) ? 0 : MatchPair(pair);
    const bool resting = outcome == kNoMoveResting;
    RecordFingerprint(n, resting ? VKEY_NO_MOVE : VKEY_NONE);
    if (resting)
        RecordRest(n);
    return 0;
}

}  // namespace

int32_t OrntCalcProcess() {
    const int32_t n = PairCount(s_voteInfo);
    if (n >= kPairMax)
        return 0;
    if (!IsHg() && !PairWorkAcceptable())
        return -1;
    // The previous frame was measured as the current one of the last pair, but for the first pair.
    if (!IsMeasured(s_imagePrev) && GetCenterAndCoverage(&s_imagePrev) != 0)
        return -1;
    if (GetCenterAndCoverage(&s_imageCurr) != 0)
        return -1;
    if (ScansTwice())
        CalcDoubleScanMove(DoubleScanZonePrev, DoubleScanZoneCurr, &s_voteInfo);
    if (CoversLess(s_coverageMinEff))
        return 0;
    CalcCenterMove(&s_imagePrev, &s_imageCurr, &s_voteInfo);
    RecordCenters(n);
    if (IsHg()) {
        if (s_voteInfo.vkey_ct[n] == VKEY_NO_MOVE)
            RecordRest(n);
    } else if (CompareFingerprints(n) != 0) {
        return -1;
    }
    s_voteInfo.calc_cnt = n + 1;
    return 0;
}

}  // namespace fpnavi

int32_t OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr, int32_t time_out) {
    using namespace fpnavi;
    if (LogShown())
        NAVI_LOG("OrientationCalc", 328, "TQCODE - OrientationCalc - Navi.ver.01.07.10!\n");
    if (data_prev == nullptr || data_curr == nullptr)
        return -1;
    if (FingerLifted() || time_out == 1)
        return 0;
    s_frameNum = WrapAdd(s_frameNum, 1);
    int32_t result = -1;
    if (GestureGeometryUsable())
        result = s_frameNum == 1 ? LoadFrame(data_curr) : NextFrame(data_curr);
    // A failed frame leaves both empty, so that all further frames of the gesture fail too.
    if (result != 0) {
        ImgClear(&s_imageCurr);
        ImgClear(&s_imagePrev);
    }
    return result;
}
