// The frame-pair driver: OrientationCalc takes a frame, keeps the previous one and hands the pair
// to OrntCalcProcess, which runs the methods in order of cost and fills one entry of the record.
// A failure empties both frames, so all further frames of the gesture fail too.

#include <cstdint>
#include <initializer_list>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

namespace {

// Most pixel comparisons one pair may cost; more than any sensible parameter block reaches.
constexpr int64_t kMaxWork = int64_t{1} << 28;

// A factor below 1 makes the product 0. Saturates so low that a dozen products can be added.
int64_t SaturatedProduct(std::initializer_list<int64_t> factors) {
    const int64_t most = INT64_MAX / 16;
    for (const int64_t factor : factors) {
        if (factor < 1)
            return 0;
    }
    int64_t product = 1;
    for (const int64_t factor : factors)
        product = product > most / factor ? most : product * factor;
    return product;
}

int64_t SearchWork() {
    MatchTemplate templates[kTemplateNum];
    BuildTemplates(templates);
    int64_t work = 0;
    for (int32_t k = 0; k < s_tpltNum; ++k) {
        const SearchRange range = PlacementsOf(templates[k]);
        work += SaturatedProduct({range.lastRow - range.firstRow + 1,
                                  range.lastColumn - range.firstColumn + 1, templates[k].tpltWidth,
                                  templates[k].tpltHeight});
    }
    return work;
}

int64_t MatchWork() {
    if (s_multiBloclkFlag == 1)
        return SaturatedProduct({s_candidateNum, s_fullImageWidth, s_fullImageHeight});
    return SaturatedProduct({s_candidateNum, s_imageWidth, s_imageHeight});
}

int64_t NoMoveWork() {
    return SaturatedProduct({2 * int64_t{s_smallMoveTolRow} + 1, 2 * int64_t{s_smallMoveTolCol} + 1,
                             s_imageWidth, s_imageHeight});
}

// Keeps the centroid of the frame with the larger coverage at both ends of pair n.
void EqualiseCentroids(int32_t n) {
    if (s_imageCurr.cvr <= s_voteInfo.cvr[n]) {
        s_voteInfo.xc[n + 1] = s_voteInfo.xc[n];
        s_voteInfo.yc[n + 1] = s_voteInfo.yc[n];
    } else {
        s_voteInfo.xc[n] = s_imageCurr.xc;
        s_voteInfo.yc[n] = s_imageCurr.yc;
    }
}

void RecordCentroids(int32_t n) {
    s_voteInfo.xc[n] = s_imagePrev.xc;
    s_voteInfo.yc[n] = s_imagePrev.yc;
    s_voteInfo.xc[n + 1] = s_imageCurr.xc;
    s_voteInfo.yc[n + 1] = s_imageCurr.yc;
    s_voteInfo.cvr[n] = s_imagePrev.cvr;
    s_voteInfo.cvr[n + 1] = s_imageCurr.cvr;
}

void FinishHgPair(int32_t n) {
    if (s_voteInfo.vkey_ct[n] == VKEY_NO_MOVE) {
        s_voteInfo.dx_ct[n] = 0;
        s_voteInfo.dy_ct[n] = 0;
        EqualiseCentroids(n);
    }
}

// A pair without movement overrides the centroid verdict.
void RecordNoMove(int32_t n) {
    s_voteInfo.vkey_fp[n] = VKEY_NO_MOVE;
    s_voteInfo.dx_fp[n] = 0;
    s_voteInfo.dy_fp[n] = 0;
    s_voteInfo.dx_ct[n] = 0;
    s_voteInfo.dy_ct[n] = 0;
    s_voteInfo.vkey_ct[n] = VKEY_NO_MOVE;
    EqualiseCentroids(n);
}

int32_t FinishFpPair(int32_t n) {
    const int32_t outcome = FingerNoMove(&s_imagePrev, &s_imageCurr);
    if (outcome == kFingerFailed)
        return -1;
    if (outcome == kFingerNoMove) {
        RecordNoMove(n);
        return 0;
    }
    if (outcome == kFingerUndetermined) {
        s_voteInfo.dx_fp[n] = 0;
        s_voteInfo.dy_fp[n] = 0;
        s_voteInfo.vkey_fp[n] = VKEY_NONE;
        return 0;
    }
    if (s_imagePrev.cvr < s_coverageMinFp || s_imageCurr.cvr < s_coverageMinFp)
        return 0;
    return CalcImgJoint();
}

}  // namespace

int32_t OrntCalcProcess() {
    const int32_t n = PairsOf(s_voteInfo);
    if (n >= kMaxPairs) {
        return 0;  // the record is full; its entries stay as they are
    }
    if (s_modeFlag != 1 && SearchWork() + MatchWork() + NoMoveWork() > kMaxWork)
        return -1;
    if (GetCenterAndCoverage(&s_imagePrev) == -1 || GetCenterAndCoverage(&s_imageCurr) == -1)
        return -1;
    if (s_doubleScanFlag == 1 &&
        CalcDoubleScanMove(DoubleScanZonePrev, DoubleScanZoneCurr, &s_voteInfo) == -1)
        return -1;
    if (s_imagePrev.cvr < s_coverageMinEff || s_imageCurr.cvr < s_coverageMinEff)
        return 0;
    CalcCenterMove(&s_imagePrev, &s_imageCurr, &s_voteInfo);
    RecordCentroids(n);
    if (s_modeFlag == 1)
        FinishHgPair(n);
    else if (FinishFpPair(n) == -1)
        return -1;
    s_voteInfo.calc_cnt = n + 1;
    return 0;
}

namespace {

bool AreSizesUsable() {
    if (!IsUsableImage())
        return false;
    if (s_modeFlag == 1)
        return true;
    if (s_candidateNum < 1 || s_candidateNum > 65536)
        return false;
    return s_multiBloclkFlag != 1 ||
           (IsSide(s_centerWidth + 2 * (int64_t{s_gapWidth} + s_boundWidth)) &&
            IsSide(s_centerHeight + 2 * (int64_t{s_gapHeight} + s_boundHeight)));
}

int32_t LoadCurrentFrame(const uint8_t* data) {
    return ImgInit(&s_imageCurr, 0, s_imageHeight, 0, s_imageWidth, data);
}

int32_t TakeFirstFrame(const uint8_t* data) {
    if (LoadCurrentFrame(data) == -1)
        return -1;
    if (ImgPreProcess(&s_imageCurr) == -1) {
        ImgClear(&s_imageCurr);
        return -1;
    }
    return 0;
}

int32_t TakeLaterFrame(const uint8_t* data) {
    if (ImgCopy(&s_imagePrev, &s_imageCurr) == -1)
        return -1;
    ImgClear(&s_imageCurr);
    if (LoadCurrentFrame(data) == -1 || ImgPreProcess(&s_imageCurr) == -1)
        return -1;
    return OrntCalcProcess();
}

int32_t DropBothFrames() {
    ImgClear(&s_imageCurr);
    ImgClear(&s_imagePrev);
    return -1;
}

}  // namespace

// data_prev only has to be non-null: the previous frame is the module's own.
int32_t OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr, int32_t time_out) {
    if (s_logShowFlag == 1)
        LogLine("OrientationCalc", 328, "TQCODE - OrientationCalc - Navi.ver.01.07.10!\n");
    if (data_prev == nullptr || data_curr == nullptr)
        return -1;
    if (s_lastFrameFlag == 1 || time_out == 1)
        return 0;
    s_frameNum = WrapAdd32(s_frameNum, 1);
    if (!AreSizesUsable())
        return DropBothFrames();
    if (s_frameNum == 1)
        return TakeFirstFrame(data_curr);
    return TakeLaterFrame(data_curr) == -1 ? DropBothFrames() : 0;
}

}  // namespace reference
