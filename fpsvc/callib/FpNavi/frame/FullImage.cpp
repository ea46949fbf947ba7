#include "frame/FullImage.h"

#include <cstring>

#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr uint8_t kTypeGap = 255;  // class of a pixel that no sensor pixel belongs to

// The three bands, border, centre and border, into which one axis of the frame is cut.
struct Bands {
    int32_t target[3];  // first pixel in the full image
    int32_t length[3];  // pixels
};

Bands CutBands(int32_t bound, int32_t center, int32_t gap) {
    return Bands{{0, bound + gap, bound + center + 2 * gap}, {bound, center, bound}};
}

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

// Spreads one plane of the frame into that of the full image. source [in]: rows of the frame, one
// behind the other; target [out]: rows of the full image; value: of gap pixels.
void SpreadPlane(const uint8_t* source, const Bands& rows, const Bands& columns, uint8_t value,
                 uint8_t* target) {
    const int32_t bound = columns.length[0];
    const int32_t center = columns.length[1];
    const int32_t fullWidth = columns.target[2] + bound;
    FillBytes(value, fullWidth * (rows.target[2] + rows.length[2]), target);
    for (int32_t r = 0; r < 3; ++r) {
        uint8_t* row = target + rows.target[r] * fullWidth;
        for (int32_t n = 0; n < rows.length[r]; ++n, row += fullWidth) {
            CopyBytes(source, bound, row);
            CopyBytes(source + bound, center, row + columns.target[1]);
            CopyBytes(source + bound + center, bound, row + columns.target[2]);
            source += 2 * bound + center;
        }
    }
}

// Tiles of negative size cannot be cut out, and negative gaps would lay tiles over each other.
bool TilesUsable() {
    return s_boundWidth >= 0 && s_centerWidth >= 0 && s_gapWidth >= 0 && s_boundHeight >= 0 &&
           s_centerHeight >= 0 && s_gapHeight >= 0 && FullImageGeometryUsable();
}

// img has buffers and the size of the nine usable tiles.
bool SourceFits(const NaviFrame_t* img) {
    return img != nullptr && img->pData != nullptr && img->pType != nullptr &&
           img->width == s_centerWidth + 2 * s_boundWidth &&
           img->height == s_centerHeight + 2 * s_boundHeight;
}

}  // namespace

int32_t GetFullImg(const NaviFrame_t* img, NaviFrame_t* full_img) {
    if (full_img == nullptr || !TilesUsable() || !SourceFits(img))
        return -1;
    full_img->width = img->width + 2 * s_gapWidth;
    full_img->height = img->height + 2 * s_gapHeight;
    const int32_t size = full_img->width * full_img->height;  // at most 2^24
    if (!ReplaceBuffers(full_img, size))
        return -1;
    const Bands columns = CutBands(s_boundWidth, s_centerWidth, s_gapWidth);
    const Bands rows = CutBands(s_boundHeight, s_centerHeight, s_gapHeight);
    SpreadPlane(img->pData, rows, columns, 0, full_img->pData);
    SpreadPlane(img->pType, rows, columns, kTypeGap, full_img->pType);
    return 0;
}

}  // namespace fpnavi
