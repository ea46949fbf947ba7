// FpNaviClear: the state of a gesture emptied for the next one.
#include <cstring>

#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "gesture/NaviVoteInfo.h"
#include "motion/DoubleScan.h"

void FpNaviClear() {
    using namespace fpnavi;
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
