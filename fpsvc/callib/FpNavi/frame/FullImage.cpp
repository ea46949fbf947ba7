#include "frame/FullImage.h"

#include <cstring>

#include "frame/NaviFrame.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr uint8_t kTypeGap = 255;  // class of a pixel that no sensor pixel belongs to

// The three bands, border, centre and border, into which one axis of the frame is cut.
struct Bands {
    int32_t source[3];  // first pixel in the frame
    int32_t target[3];  // first pixel in the full image
    int32_t length[3];  // pixels
};

Bands CutBands(int32_t bound, int32_t center, int32_t gap) {
    return Bands{{0, bound, bound + center},
                 {0, bound + gap, bound + center + 2 * gap},
                 {bound, center, bound}};
}

// Copies one frame row, cut into bands, to a full-image row; the gaps keep what they hold.
void SpreadRow(const uint8_t* source, const Bands& columns, uint8_t* target) {
    for (int32_t b = 0; b < 3; ++b)
        std::memcpy(target + columns.target[b], source + columns.source[b],
                    static_cast<size_t>(columns.length[b]));
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
    if (!ReplaceBuffers(full_img, size, kTypeGap))
        return -1;
    const Bands columns = CutBands(s_boundWidth, s_centerWidth, s_gapWidth);
    const Bands rows = CutBands(s_boundHeight, s_centerHeight, s_gapHeight);
    for (int32_t b = 0; b < 3; ++b) {
        for (int32_t r = 0; r < rows.length[b]; ++r) {
            const int32_t from = (rows.source[b] + r) * img->width;
            const int32_t to = (rows.target[b] + r) * full_img->width;
            SpreadRow(img->pData + from, columns, full_img->pData + to);
            SpreadRow(img->pType + from, columns, full_img->pType + to);
        }
    }
    return 0;
}

}  // namespace fpnavi
