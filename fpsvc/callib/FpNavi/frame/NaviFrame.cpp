#include "frame/NaviFrame.h"

#include <cstdlib>
#include <cstring>

#include "param/NaviParam.h"

namespace fpnavi {

NaviFrame_t s_imageCurr;
NaviFrame_t s_imagePrev;
NaviFrame_t s_fullImageCurr;
NaviFrame_t s_fullImagePrev;

namespace {

void ReleaseBuffers(NaviFrame_t* img) {
    std::free(img->pData);
    img->pData = nullptr;
    std::free(img->pType);
    img->pType = nullptr;
}

}  // namespace

bool HasPixels(const NaviFrame_t* img) {
    return img != nullptr && img->pData != nullptr && img->pType != nullptr && img->width >= 1 &&
           img->height >= 1;
}

bool ReplaceBuffers(NaviFrame_t* img, int32_t size, uint8_t type) {
    ReleaseBuffers(img);
    const size_t bytes = static_cast<size_t>(size);
    img->pData = static_cast<uint8_t*>(std::malloc(bytes));
    img->pType = static_cast<uint8_t*>(std::malloc(bytes));
    if (img->pData == nullptr || img->pType == nullptr) {
        ReleaseBuffers(img);
        return false;
    }
    std::memset(img->pData, 0, bytes);
    std::memset(img->pType, type, bytes);
    return true;
}

int32_t ImgInit(NaviFrame_t* img, int32_t i_start, int32_t i_end, int32_t j_start, int32_t j_end,
                const uint8_t* data) {
    if (img == nullptr || data == nullptr || i_start < 0 || j_start < 0 || i_end <= i_start ||
        j_end <= j_start || i_end > s_imageHeight || j_end > s_imageWidth)
        return -1;
    const int32_t height = i_end - i_start;
    const int32_t width = j_end - j_start;
    if (!ReplaceBuffers(img, height * width, 0))
        return -1;
    img->height = height;
    img->width = width;
    for (int32_t y = 0; y < height; ++y)
        std::memcpy(img->pData + y * width, data + (i_start + y) * s_imageWidth + j_start,
                    static_cast<size_t>(width));
    img->cvr = 0;
    img->range = 0;
    img->xc = 0;
    img->yc = 0;
    return 0;
}

void ImgClear(NaviFrame_t* img) {
    if (img == nullptr)
        return;
    ReleaseBuffers(img);
    *img = NaviFrame_t{};
}

int32_t ImgCopy(NaviFrame_t* img_dst, const NaviFrame_t* img_src) {
    if (img_dst == nullptr || !HasPixels(img_src))
        return -1;
    img_dst->height = img_src->height;
    img_dst->width = img_src->width;
    const int32_t size = img_src->width * img_src->height;
    if (!ReplaceBuffers(img_dst, size, 0))
        return -1;
    std::memcpy(img_dst->pData, img_src->pData, static_cast<size_t>(size));
    std::memcpy(img_dst->pType, img_src->pType, static_cast<size_t>(size));
    img_dst->cvr = img_src->cvr;
    img_dst->xc = img_src->xc;
    img_dst->yc = img_src->yc;
    img_dst->range = img_src->range;
    return 0;
}

}  // namespace fpnavi
