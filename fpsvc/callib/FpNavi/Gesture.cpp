#include "Gesture.h"

#include <cstring>

#include "DoubleScan.h"
#include "NaviFrame.h"
#include "NaviVoteInfo.h"

namespace fpnavi {

int32_t s_frameNum = 0;
int32_t s_lastFrameFlag = 0;
int32_t s_tuneOkFlag = 0;

}  // namespace fpnavi

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
