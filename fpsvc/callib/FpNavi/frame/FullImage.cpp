#include "frame/FullImage.h"

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
    int32_t gap;        // pixels between two bands
};

Bands CutBands(int32_t bound, int32_t center, int32_t gap) {
    return Bands{{0, bound + gap, bound + center + 2 * gap}, {bound, center, bound}, gap};
}

// Sixteen bytes are written at a time, from left to right and from top to bottom: what is too much
// is overwritten by what follows, and behind the last pixel there is room.
[[gnu::always_inline]] inline void CopyBytes(const uint8_t* source, int32_t count,
                                             uint8_t* target) {
    for (uint8_t* const end = target + count; target < end; target += kLanes, source += kLanes)
        Store16(target, Load16(source));
}

[[gnu::always_inline]] inline void FillBytes(Bytes16 value, int32_t count, uint8_t* target) {
    for (uint8_t* const end = target + count; target < end; target += kLanes)
        Store16(target, value);
}

// Spreads a row of the frame: its three bands, and what is between them.
[[gnu::always_inline]] inline void SpreadRow(const uint8_t* source, const Bands& columns,
                                             Bytes16 gap, uint8_t* target) {
    const int32_t bound = columns.length[0];
    const int32_t center = columns.length[1];
    CopyBytes(source, bound, target);
    FillBytes(gap, columns.gap, target + bound);
    CopyBytes(source + bound, center, target + columns.target[1]);
    FillBytes(gap, columns.gap, target + columns.target[1] + center);
    CopyBytes(source + bound + center, bound, target + columns.target[2]);
}

// Spreads one plane of the frame into the full image's; gap pixels are value.
void SpreadPlane(const uint8_t* source, Bands rows, Bands columns, uint8_t value, uint8_t* target) {
    const Bytes16 gap = Splat16(value);
    const int32_t width = 2 * columns.length[0] + columns.length[1];
    const int32_t fullWidth = width + 2 * columns.gap;
    for (int32_t r = 0; r < 3; ++r) {
        for (int32_t n = 0; n < rows.length[r]; ++n, source += width, target += fullWidth)
            SpreadRow(source, columns, gap, target);
        const int32_t gapBytes = r < 2 ? rows.gap * fullWidth : 0;
        FillBytes(gap, gapBytes, target);
        target += gapBytes;
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
    if (!ReplaceBuffers(full_img, size + kLanes))
        return -1;
    const Bands columns = CutBands(s_boundWidth, s_centerWidth, s_gapWidth);
    const Bands rows = CutBands(s_boundHeight, s_centerHeight, s_gapHeight);
    SpreadPlane(img->pData, rows, columns, 0, full_img->pData);
    SpreadPlane(img->pType, rows, columns, kTypeGap, full_img->pType);
    return 0;
}

}  // namespace fpnavi
