// The state of a gesture: frames, vote record, double-scan maps, counters and flags. FpNaviClear
// starts a new gesture, PrintNaviLog shows the record. ResetAll, for tests, undoes everything.

#include <cstring>

#include "RefInternal.h"
#include "Reference.h"

namespace reference {

NaviFrame_t s_imageCurr = {};
NaviFrame_t s_imagePrev = {};
NaviFrame_t s_fullImageCurr = {};
NaviFrame_t s_fullImagePrev = {};
NaviVoteInfo_t s_voteInfo = {};
int32_t s_frameNum = 0;
int32_t s_lastFrameFlag = 0;
int32_t s_tuneOkFlag = 0;
uint8_t DoubleScanZonePrev[64] = {};
uint8_t DoubleScanZoneCurr[64] = {};

namespace {

void ResetDerivedValues() {
    s_blockWidth = 0;
    s_blockHeight = 0;
    s_blockColNum = 0;
    s_blockRowNum = 0;
    s_doubleScanFlag = 0;
    s_imageHeight = 0;
    s_imageWidth = 0;
    s_fullImageHeight = 0;
    s_fullImageWidth = 0;
    s_tpltNum = 0;
    s_tpltHeightUD = 0;
    s_tpltWidthUD = 0;
    s_tpltHeightLR = 0;
    s_tpltWidthLR = 0;
}

}  // namespace

// xc_ds and yc_ds are left alone on purpose: they show the previous gesture's positions until the
// double-scan method writes them again.
void VoteInfoClear(NaviVoteInfo_t* voteInfo) {
    voteInfo->calc_cnt = 0;
    for (int32_t i = 0; i < kVoteCapacity; ++i) {
        voteInfo->xc[i] = 0;
        voteInfo->yc[i] = 0;
        voteInfo->cvr[i] = 0;
        voteInfo->dx_ct[i] = 0;
        voteInfo->dy_ct[i] = 0;
        voteInfo->dx_fp[i] = 0;
        voteInfo->dy_fp[i] = 0;
        voteInfo->diff[i] = 0;
        voteInfo->vkey_fp[i] = 0;
        voteInfo->vkey_ct[i] = 0;
        voteInfo->dx_ds[i] = 0;
        voteInfo->dy_ds[i] = 0;
        voteInfo->cvr_ds[i] = 0;
    }
    voteInfo->dx_sum = 0;
    voteInfo->dy_sum = 0;
}

void FpNaviClear() {
    s_lastFrameFlag = 0;
    s_tuneOkFlag = 0;
    s_frameNum = 0;
    std::memset(DoubleScanZonePrev, 0, sizeof DoubleScanZonePrev);
    std::memset(DoubleScanZoneCurr, 0, sizeof DoubleScanZoneCurr);
    VoteInfoClear(&s_voteInfo);
    ImgClear(&s_imageCurr);
    ImgClear(&s_imagePrev);
    ImgClear(&s_fullImageCurr);
    ImgClear(&s_fullImagePrev);
}

int32_t PairsOf(const NaviVoteInfo_t& info) {
    if (info.calc_cnt < 0)
        return 0;
    return info.calc_cnt > kMaxPairs ? kMaxPairs : info.calc_cnt;
}

NaviVoteInfo_t* PrintNaviLog() {
    return &s_voteInfo;
}

void ResetAll() {
    FpNaviClear();
    s_voteInfo = NaviVoteInfo_t{};
    StoreParams(kDefaultParams);
    ResetDerivedValues();
    ResetTuningState();
    ResetTestHooks();
}

}  // namespace reference
