// Data as the sensor delivers it: block-ordered frames re-sorted into rows, and the 8 x 8
// double-scan map unpacked from two registers and measured.

#include <cstring>

#include "RefInternal.h"
#include "Reference.h"

namespace reference {

namespace {

// The products are taken without wrapping: with wrapped ones the blocks would not fit the image.
bool IsBlockGridConsistent() {
    return int64_t{s_blockHeight} * s_blockRowNum == s_imageHeight &&
           int64_t{s_blockWidth} * s_blockColNum == s_imageWidth;
}

// Replaces the first `width` bytes by the ones that follow them, inside the image only.
void CopySecondRowUp(int32_t width, uint8_t* image) {
    const int64_t size = int64_t{s_imageWidth} * s_imageHeight;
    for (int64_t i = 0; i < width && width + i < size; ++i)
        image[i] = image[width + i];
}

}  // namespace

// `height` is not used: the geometry is the parameter block's.
int32_t GetNaviBlock(const uint8_t* p_data_origin, int32_t width, int32_t /*height*/,
                     uint8_t* p_data_resort) {
    if (p_data_origin == nullptr || p_data_resort == nullptr)
        return -1;
    if (!IsUsableImage() || !IsBlockGridConsistent())
        return -1;
    const int32_t blkSize = s_blockHeight * s_blockWidth;
    const int32_t blkNum = s_blockRowNum * s_blockColNum;
    for (int32_t b = 0; b < blkNum; ++b) {
        for (int32_t k = 0; k < blkSize; ++k) {
            const int32_t row = s_blockHeight * (b / s_blockColNum) + k / s_blockWidth;
            const int32_t column = s_blockWidth * (b % s_blockColNum) + k % s_blockWidth;
            p_data_resort[s_imageWidth * row + column] = p_data_origin[b * blkSize + k];
        }
    }
    if (s_directionControlFlag == 1 && s_modeFlag == 2)
        CopySecondRowUp(width, p_data_resort);
    return 0;
}

int32_t GetDoubleScanNaviBlock(uint32_t gReg24, uint32_t gReg28) {
    const int32_t width = 8;
    const int32_t height = 8;
    std::memcpy(DoubleScanZonePrev, DoubleScanZoneCurr, sizeof DoubleScanZonePrev);
    int32_t count = 0;
    for (int32_t r = 0; r < height; ++r) {
        for (int32_t c = 0; c < width; ++c) {
            const uint32_t reg = r < 4 ? gReg28 : gReg24;
            const int32_t bit = r < 4 ? 31 - 8 * r - c : 63 - 8 * r - c;
            DoubleScanZoneCurr[count] = static_cast<uint8_t>((reg >> bit) & 1U);
            ++count;
        }
    }
    return 0;
}

int32_t DoubleScanGetCenterAndCoverage(const uint8_t* DoubleScanZone, int32_t* xc, int32_t* yc,
                                       int32_t* cvr) {
    if (DoubleScanZone == nullptr || xc == nullptr || yc == nullptr || cvr == nullptr)
        return -1;
    const int32_t width = 8;
    const int32_t height = 8;
    const int32_t size = width * height;
    int32_t cnt = 0;
    int32_t x = 0;  // at most 64 * 750
    int32_t y = 0;
    for (int32_t cur = 0; cur < size; ++cur) {
        if (DoubleScanZone[cur] == 1) {
            ++cnt;
            x += 100 * (cur % width) + 50;
            y += 100 * (cur / width) + 50;
        }
    }
    if (cnt == 0) {
        *xc = 0;
        *yc = 0;
        *cvr = 0;
        return 0;
    }
    *xc = x / (width * cnt) - 50;
    *yc = 50 - y / (height * cnt);
    *cvr = 100 * cnt / size;
    return 0;
}

}  // namespace reference
