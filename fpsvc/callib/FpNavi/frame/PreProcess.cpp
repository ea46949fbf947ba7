// ImgPreProcess: the steps of each mode, in their order.
#include "frame/PreProcess.h"

#include "base/NaviMath.h"
#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Marks the dark pixels; the hg sensor needs nothing more. The last step also reads and writes
// bytes in the space behind the pixels.
void MarkDarkPixels(NaviFrame_t* img) {
    const Bytes16 meanThr = Splat16(128);
    const Bytes16 one = Splat16(1);
    const int32_t size = s_imageHeight * s_imageWidth;
    for (int32_t p = 0; p < size; p += kLanes) {
        const Bytes16 above = Excess16(Load16(img->pData + p), meanThr);
        Store16(img->pType + p, And16(Equal16(above, Splat16(0)), one));
    }
}

}  // namespace

// The greys are counted once: the threshold needs their histogram, the stretch the same histogram
// without the pixels outside the finger area.
int32_t ImgPreProcess(NaviFrame_t* img) {
    if (IsHg()) {
        MarkDarkPixels(img);
        return 0;
    }
    if (!HasPixels(img))
        return -1;
    const int32_t size = img->width * img->height;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, size, hist);
    const BiThreshold split = SplitGreys(hist, size);
    img->range = static_cast<uint8_t>(split.scale);  // at most 254
    GetFingerRidge(img, split.thr);
    StretchFinger(img, kGreyMax, s_cutOffPercent, hist);
    return 0;
}

}  // namespace fpnavi
