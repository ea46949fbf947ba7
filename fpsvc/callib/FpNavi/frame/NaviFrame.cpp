#include "frame/NaviFrame.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "base/BitRows.h"
#include "base/NaviSimd.h"
#include "param/NaviLimits.h"
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

bool ReplaceBuffers(NaviFrame_t* img, int32_t bytes) {
    ReleaseBuffers(img);
    const size_t size = static_cast<size_t>(bytes);
    img->pData = static_cast<uint8_t*>(std::malloc(size));
    img->pType = static_cast<uint8_t*>(std::malloc(size));
    const bool made = img->pData != nullptr && img->pType != nullptr;
    if (!made)
        ReleaseBuffers(img);
    return made;
}

int32_t RoomStart(int32_t width, int32_t height) {
    return (width * height + kLanes - 1) / kLanes * kLanes;
}

int32_t FrameBytes(int32_t width, int32_t height) {
    const int32_t mask = width * height + kLanes;
    // The bit rows of the finger fill, and as many words of scratch.
    const int32_t fill = 2 * height * WordsOf(width) * static_cast<int32_t>(sizeof(uint64_t));
    return RoomStart(width, height) + std::max(mask, fill);
}

int32_t ImgInit(NaviFrame_t* img, int32_t i_start, int32_t i_end, int32_t j_start, int32_t j_end,
                const uint8_t* data) {
    if (img == nullptr || data == nullptr || i_start < 0 || j_start < 0 || i_end <= i_start ||
        j_end <= j_start || i_end > s_imageHeight || j_end > s_imageWidth)
        return -1;
    const int32_t height = i_end - i_start;
    const int32_t width = j_end - j_start;
    if (!ReplaceBuffers(img, FrameBytes(width, height)))
        return -1;
    *img = {width, height, img->pData, img->pType, 0, 0, 0, 0};
    // Rows of the whole width follow each other in data too.
    const uint8_t* const first = data + i_start * s_imageWidth + j_start;
    const int32_t run = width == s_imageWidth ? width * height : width;
    for (int32_t at = 0, from = 0; at < width * height; at += run, from += s_imageWidth)
        std::memcpy(img->pData + at, first + from, static_cast<size_t>(run));
    std::memset(img->pType, 0, static_cast<size_t>(width * height));
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
    if (!ReplaceBuffers(img_dst, FrameBytes(img_src->width, img_src->height)))
        return -1;
    const size_t pixels = static_cast<size_t>(img_src->width * img_src->height);
    std::memcpy(img_dst->pData, img_src->pData, pixels);
    std::memcpy(img_dst->pType, img_src->pType, pixels);
    *img_dst = {img_src->width, img_src->height, img_dst->pData, img_dst->pType,
                img_src->cvr,   img_src->range,  img_src->xc,    img_src->yc};
    return 0;
}

}  // namespace fpnavi

int32_t GetNaviBlock(const uint8_t* p_data_origin, int32_t width, int32_t /*height*/,
                     uint8_t* p_data_resort) {
    using namespace fpnavi;
    if (p_data_origin == nullptr || p_data_resort == nullptr || !ImageGeometryUsable())
        return -1;
    const int32_t blkNum = s_blockRowNum * s_blockColNum;
    for (int32_t b = 0; b < blkNum; ++b) {
        const int32_t top = b / s_blockColNum * s_blockHeight;
        const int32_t left = b % s_blockColNum * s_blockWidth;
        for (int32_t row = 0; row < s_blockHeight; ++row)
            std::memcpy(p_data_resort + (top + row) * s_imageWidth + left,
                        p_data_origin + (b * s_blockHeight + row) * s_blockWidth,
                        static_cast<size_t>(s_blockWidth));
    }
    // The first row of a double scan carries no finger when only vertical keys are wanted: the row
    // below takes its place. In increasing order, so that a width other than the image's repeats.
    if (s_directionControlFlag == kDirectionVertical && IsDoubleScan()) {
        const int32_t size = s_imageWidth * s_imageHeight;  // at most 2^24
        for (int32_t i = 0; i < width && i < size - width; ++i)
            p_data_resort[i] = p_data_resort[width + i];
    }
    return 0;
}
