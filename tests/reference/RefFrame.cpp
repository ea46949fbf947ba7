// The navigation frame: loading a frame from the host's image, releasing it, copying it, and
// spreading it into the full image with blank bands between its nine tiles. A frame owns both of
// its buffers or none.

#include <cstdlib>
#include <cstring>

#include "RefInternal.h"
#include "Reference.h"

namespace reference {

namespace {

void ReleaseBuffers(NaviFrame_t* img) {
    std::free(img->pData);
    img->pData = nullptr;
    std::free(img->pType);
    img->pType = nullptr;
}

// Tries both allocations, the class map also after a failed first one.
bool AllocateBuffers(NaviFrame_t* img, int64_t size) {
    img->pData = static_cast<uint8_t*>(Allocate(size));
    img->pType = static_cast<uint8_t*>(Allocate(size));
    if (img->pData == nullptr || img->pType == nullptr) {
        ReleaseBuffers(img);
        return false;
    }
    return true;
}

// 0, 1 or 2: the band of a position along an axis cut into bound, center, bound.
int32_t BandOf(int32_t position, int32_t bound, int32_t center) {
    if (position < bound)
        return 0;
    return position < bound + center ? 1 : 2;
}

}  // namespace

int32_t ImgInit(NaviFrame_t* img, int32_t i_start, int32_t i_end, int32_t j_start, int32_t j_end,
                const uint8_t* data) {
    if (img == nullptr || data == nullptr || i_end <= i_start || j_end <= j_start)
        return -1;
    if (i_start < 0 || j_start < 0 || i_start > s_imageHeight || i_end > s_imageHeight ||
        j_start > s_imageWidth || j_end > s_imageWidth)
        return -1;
    ReleaseBuffers(img);
    const int32_t height = i_end - i_start;
    const int32_t width = j_end - j_start;
    const int64_t size = int64_t{height} * width;
    if (!AllocateBuffers(img, size)) {
        return -1;  // width and height keep their old values
    }
    std::memset(img->pData, 0, static_cast<size_t>(size));
    std::memset(img->pType, 0, static_cast<size_t>(size));
    img->height = height;
    img->width = width;
    for (int32_t y = 0; y < height; ++y) {
        for (int32_t x = 0; x < width; ++x) {
            const int64_t source = (int64_t{i_start} + y) * s_imageWidth + j_start + x;
            img->pData[int64_t{y} * width + x] = data[source];
        }
    }
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
    img->height = 0;
    img->width = 0;
    img->cvr = 0;
    img->range = 0;
    img->xc = 0;
    img->yc = 0;
}

int32_t ImgCopy(NaviFrame_t* img_dst, const NaviFrame_t* img_src) {
    if (img_dst == nullptr || img_src == nullptr || img_src->pData == nullptr ||
        img_src->pType == nullptr || img_src->height <= 0 || img_src->width <= 0)
        return -1;
    ReleaseBuffers(img_dst);
    img_dst->height = img_src->height;
    img_dst->width = img_src->width;
    const int64_t size = int64_t{img_src->width} * img_src->height;
    img_dst->pData = static_cast<uint8_t*>(Allocate(size));
    if (img_dst->pData == nullptr)
        return -1;
    img_dst->pType = static_cast<uint8_t*>(Allocate(size));
    if (img_dst->pType == nullptr) {
        ReleaseBuffers(img_dst);
        return -1;
    }
    std::memcpy(img_dst->pData, img_src->pData, static_cast<size_t>(size));
    std::memcpy(img_dst->pType, img_src->pType, static_cast<size_t>(size));
    img_dst->cvr = img_src->cvr;
    img_dst->xc = img_src->xc;
    img_dst->yc = img_src->yc;
    img_dst->range = img_src->range;
    return 0;
}

namespace {

// Whether a source side is the sum of its three tiles and the spread side fits 32 bits.
bool TilesFit(int32_t side, int32_t bound, int32_t center, int32_t gap) {
    if (bound < 0 || center < 0 || gap < 0)
        return false;
    const int64_t tiles = int64_t{center} + 2 * int64_t{bound};
    return side == tiles && tiles + 2 * int64_t{gap} <= INT32_MAX;
}

// A pixel moves by one gap for each blank band before it.
void PlaceTiles(const NaviFrame_t* img, NaviFrame_t* full_img) {
    for (int32_t y = 0; y < img->height; ++y) {
        const int64_t row = y + int64_t{BandOf(y, s_boundHeight, s_centerHeight)} * s_gapHeight;
        for (int32_t x = 0; x < img->width; ++x) {
            const int64_t column = x + int64_t{BandOf(x, s_boundWidth, s_centerWidth)} * s_gapWidth;
            const int64_t source = int64_t{y} * img->width + x;
            const int64_t target = row * full_img->width + column;
            full_img->pData[target] = img->pData[source];
            full_img->pType[target] = img->pType[source];
        }
    }
}

}  // namespace

// cvr, range, xc and yc of the destination keep their values.
int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img) {
    if (img == nullptr || full_img == nullptr || img->pData == nullptr || img->pType == nullptr)
        return -1;
    if (!TilesFit(img->width, s_boundWidth, s_centerWidth, s_gapWidth) ||
        !TilesFit(img->height, s_boundHeight, s_centerHeight, s_gapHeight))
        return -1;
    full_img->width = s_centerWidth + 2 * (s_boundWidth + s_gapWidth);
    full_img->height = s_centerHeight + 2 * (s_boundHeight + s_gapHeight);
    ReleaseBuffers(full_img);
    const int64_t size = int64_t{full_img->width} * full_img->height;
    if (!AllocateBuffers(full_img, size)) {
        return -1;  // the new width and height stay
    }
    // All gap first; the tiles then cover everything that is none.
    std::memset(full_img->pData, 0, static_cast<size_t>(size));
    std::memset(full_img->pType, 255, static_cast<size_t>(size));
    PlaceTiles(img, full_img);
    return 0;
}

}  // namespace reference
