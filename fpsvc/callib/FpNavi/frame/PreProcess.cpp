// ImgPreProcess: the steps of each mode, in their order.
#include "frame/PreProcess.h"

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Marks the dark pixels; the hg sensor needs nothing more.
void MarkDarkPixels(NaviFrame_t* img) {
    const uint8_t meanThr = 128;
    const int32_t size = s_imageHeight * s_imageWidth;
    for (int32_t p = 0; p < size; ++p)
        img->pType[p] = img->pData[p] <= meanThr ? 1 : 0;
}

}  // namespace

int32_t ImgPreProcess(NaviFrame_t* img) {
    if (s_modeFlag == 1) {
        MarkDarkPixels(img);
        return 0;
    }
    int32_t thr = 0;
    int32_t scale = 0;
    if (CalcBiThr(img, &thr, &scale) != 0)
        return -1;
    img->range = static_cast<uint8_t>(scale);  // at most 254
    GetFingerRidge(img, thr);
    return StretchRange(img, kGreyMax);
}

}  // namespace fpnavi
