// GetNaviBlock: the sensor's blocks sorted into rows.
#include <cstring>

#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Copies one block, stored row by row at raw, to its place in the image that starts at corner.
void PlaceBlock(const uint8_t* raw, uint8_t* corner) {
    for (int32_t row = 0; row < s_blockHeight; ++row)
        std::memcpy(corner + row * s_imageWidth, raw + row * s_blockWidth,
                    static_cast<size_t>(s_blockWidth));
}

// The first row of a double scan carries no finger when only vertical keys are wanted: the row
// below takes its place. In increasing order, so that a width other than the image's repeats.
void CopySecondRowOverFirst(int32_t width, uint8_t* image) {
    const int32_t size = s_imageWidth * s_imageHeight;  // at most 2^24
    for (int32_t i = 0; i < width && i < size - width; ++i)
        image[i] = image[width + i];
}

}  // namespace
}  // namespace fpnavi

int32_t GetNaviBlock(const uint8_t* p_data_origin, int32_t width, int32_t /*height*/,
                     uint8_t* p_data_resort) {
    using namespace fpnavi;
    if (p_data_origin == nullptr || p_data_resort == nullptr || !ImageGeometryUsable())
        return -1;
    const int32_t blkSize = s_blockHeight * s_blockWidth;
    const int32_t blkNum = s_blockRowNum * s_blockColNum;
    for (int32_t b = 0; b < blkNum; ++b) {
        const int32_t row = b / s_blockColNum * s_blockHeight;
        const int32_t column = b % s_blockColNum * s_blockWidth;
        PlaceBlock(p_data_origin + b * blkSize, p_data_resort + row * s_imageWidth + column);
    }
    if (s_directionControlFlag == kDirectionVertical && IsDoubleScan())
        CopySecondRowOverFirst(width, p_data_resort);
    return 0;
}
