// GetFullImg: the nine tiles of a frame spread apart.
#include <cstring>

#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr uint8_t kTypeGap = 255;  // class of a pixel that no sensor pixel belongs to

// Inline: bands are short, often of 8 or 40 pixels, and a call for each takes longer than the copy.
inline void CopyBytes(const uint8_t* source, int32_t count, uint8_t* target) {
    for (; count >= kLanes; count -= kLanes, source += kLanes, target += kLanes)
        Store16(target, Load16(source));
    if ((count & 8) != 0) {
        std::memcpy(target, source, 8);
        source += 8;
        target += 8;
    }
    for (count &= 7; count > 0; --count)
        *target++ = *source++;
}

void FillBytes(uint8_t value, int32_t count, uint8_t* target) {
    constexpr int32_t kStep = 4 * kLanes;
    const Bytes16 bytes = Splat16(value);
    for (; count >= kStep; count -= kStep, target += kStep) {
        for (int32_t n = 0; n < kStep; n += kLanes)
            Store16(target + n, bytes);
    }
    std::memset(target, value, static_cast<size_t>(count));
}

// Spreads one plane of the frame into that of full. source [in]: rows of the frame, one behind the
// other; target [out]: rows of full; value: of gap pixels.
void SpreadPlane(const uint8_t* source, const NaviFrame_t& full, uint8_t value, uint8_t* target) {
    const int32_t bound = s_boundWidth;
    const int32_t center = s_centerWidth;
    const int32_t gap = s_gapWidth;
    const int32_t heights[] = {s_boundHeight, s_centerHeight, s_boundHeight};
    FillBytes(value, full.width * full.height, target);
    int32_t at = 0;
    for (const int32_t height : heights) {
        for (int32_t row = 0; row < height; ++row, at += full.width) {
            CopyBytes(source, bound, target + at);
            CopyBytes(source + bound, center, target + at + bound + gap);
            CopyBytes(source + bound + center, bound, target + at + bound + center + 2 * gap);
            source += 2 * bound + center;
        }
        at += s_gapHeight * full.width;
    }
}

// The nine tiles are usable, and img has buffers and their size. Tiles of negative size cannot be
// cut out, and negative gaps would lay tiles over each other.
bool TilesFit(const NaviFrame_t* img) {
    return s_boundWidth >= 0 && s_centerWidth >= 0 && s_gapWidth >= 0 && s_boundHeight >= 0 &&
           s_centerHeight >= 0 && s_gapHeight >= 0 && FullImageGeometryUsable() && img != nullptr &&
           img->pData != nullptr && img->pType != nullptr &&
           img->width == s_centerWidth + 2 * s_boundWidth &&
           img->height == s_centerHeight + 2 * s_boundHeight;
}

}  // namespace

int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img) {
    if (full_img == nullptr || !TilesFit(img))
        return -1;
    full_img->width = img->width + 2 * s_gapWidth;
    full_img->height = img->height + 2 * s_gapHeight;
    if (!ReplaceBuffers(full_img, full_img->width * full_img->height))  // at most 2^24
        return -1;
    SpreadPlane(img->pData, *full_img, 0, full_img->pData);
    SpreadPlane(img->pType, *full_img, kTypeGap, full_img->pType);
    return 0;
}

}  // namespace fpnavi
