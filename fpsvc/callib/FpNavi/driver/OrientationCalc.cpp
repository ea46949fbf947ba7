#include "driver/OrientationCalc.h"

#include <cstring>

#include "base/NaviLog.h"
#include "base/NaviMath.h"
#include "frame/FramePair.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "gesture/Gesture.h"
#include "matching/PairMatch.h"
#include "motion/CenterMove.h"
#include "motion/DoubleScan.h"
#include "motion/FingerNoMove.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Loads and pre-processes the whole image at data into s_imageCurr.
int32_t LoadFrame(const uint8_t* data) {
    if (ImgInit(&s_imageCurr, 0, s_imageHeight, 0, s_imageWidth, data) != 0)
        return -1;
    return ImgPreProcess(&s_imageCurr);
}

// The current frame becomes the previous one, unless it is the gesture's first, and data the
// current one. Evaluates the pair.
int32_t NextFrame(const uint8_t* data) {
    const bool first = s_frameNum == 1;
    if (!first) {
        if (ImgCopy(&s_imagePrev, &s_imageCurr) != 0)
            return -1;
        ImgClear(&s_imageCurr);
    }
    if (LoadFrame(data) != 0)
        return -1;
    return first ? 0 : OrntCalcProcess();
}

// A frame starts with measures of 0, and only GetCenterAndCoverage changes them. So a frame whose
// measures are all 0 is not measured yet, or measuring it again gives the same zeros.
bool IsMeasured(const NaviFrame_t& img) {
    return img.cvr != 0 || img.xc != 0 || img.yc != 0;
}

bool CoversLess(int32_t coverage) {
    return s_imagePrev.cvr < coverage || s_imageCurr.cvr < coverage;
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

// The fingerprint methods of the fp modes, cheapest first.
int32_t CompareFingerprints(int32_t n) {
    if (!AreComparable(&s_imagePrev, &s_imageCurr))
        return -1;
    const FramePair pair = LayOutPair(s_imagePrev, s_imageCurr);
    const int32_t outcome = TestNoMove(pair, CurrentNoMoveLimits());
    if (outcome == kNoMoveMoved)
        return CoversLess(s_coverageMinFp) ? 0 : MatchPair(pair);
    s_voteInfo.vkey_fp[n] = VKEY_NONE;
    s_voteInfo.dx_fp[n] = 0;
    s_voteInfo.dy_fp[n] = 0;
    if (outcome == kNoMoveResting) {
        s_voteInfo.vkey_fp[n] = VKEY_NO_MOVE;
        RecordRest(n);
    }
    return 0;
}

}  // namespace

int32_t OrntCalcProcess() {
    const int32_t n = PairCount(s_voteInfo);
    if (n == kPairCountMax)
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
    s_voteInfo.xc[n] = s_imagePrev.xc;
    s_voteInfo.yc[n] = s_imagePrev.yc;
    s_voteInfo.cvr[n] = s_imagePrev.cvr;
    s_voteInfo.xc[n + 1] = s_imageCurr.xc;
    s_voteInfo.yc[n + 1] = s_imageCurr.yc;
    s_voteInfo.cvr[n + 1] = s_imageCurr.cvr;
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
    const int32_t result = GestureGeometryUsable() ? NextFrame(data_curr) : -1;
    // A failed frame leaves both empty, so that all further frames of the gesture fail too.
    if (result != 0) {
        ImgClear(&s_imageCurr);
        ImgClear(&s_imagePrev);
    }
    return result;
}

void FpNaviClear() {
    using namespace fpnavi;
    s_lastFrameFlag = 0;
    s_tuneOkFlag = 0;
    s_frameNum = 0;
    std::memset(DoubleScanZonePrev, 0, sizeof DoubleScanZonePrev);
    std::memset(DoubleScanZoneCurr, 0, sizeof DoubleScanZoneCurr);
    VoteInfoClear(&s_voteInfo);
    for (auto* img : {&s_imageCurr, &s_imagePrev, &s_fullImageCurr, &s_fullImagePrev})
        ImgClear(img);
}
