// GetFingerRidge: the finger area, everything between two dark pixels of a row or a column.
#include <algorithm>
#include <cstdint>

#include "base/BitRows.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

constexpr int32_t kPasses = 2;

// Marks all from the first to the last marked pixel of a line: count pixels, stride bytes apart.
void FillLine(uint8_t* line, int32_t count, int32_t stride) {
    int32_t idxMin = count;
    int32_t idxMax = -1;
    for (int32_t i = 0; i < count; ++i) {
        if (line[i * stride] != 1)
            continue;
        idxMin = std::min(idxMin, i);
        idxMax = i;
    }
    for (int32_t i = idxMin; i <= idxMax; ++i)
        line[i * stride] = 1;
}

void FillBytes(NaviFrame_t* img, int32_t thr) {
    const int32_t width = img->width;
    const int32_t height = img->height;
    for (int32_t p = 0; p < width * height; ++p)
        img->pType[p] = img->pData[p] <= thr ? 1 : 0;
    for (int32_t pass = 0; pass < kPasses; ++pass) {
        for (int32_t row = 0; row < height; ++row)
            FillLine(img->pType + row * width, width, 1);
        for (int32_t column = 0; column < width; ++column)
            FillLine(img->pType + column, height, width);
    }
}

// All columns at once: a pixel lies between two marked ones when one is marked at or above it and
// one at or below it.
void FillColumns(uint64_t* rows, int32_t height) {
    uint64_t atOrBelow[kWordPixels];
    uint64_t marked = 0;
    for (int32_t row = height - 1; row >= 0; --row) {
        marked |= rows[row];
        atOrBelow[row] = marked;
    }
    marked = 0;
    for (int32_t row = 0; row < height; ++row) {
        marked |= rows[row];
        rows[row] = marked & atOrBelow[row];
    }
}

void FillWords(NaviFrame_t* img, int32_t thr) {
    uint64_t rows[kWordPixels];
    for (int32_t row = 0; row < img->height; ++row)
        rows[row] =
            AtMostBits(img->pData + row * img->width, img->width, static_cast<uint8_t>(thr));
    for (int32_t pass = 0; pass < kPasses; ++pass) {
        for (int32_t row = 0; row < img->height; ++row)
            rows[row] = SpanBits(rows[row]);
        FillColumns(rows, img->height);
    }
    for (int32_t row = 0; row < img->height; ++row)
        SpreadBits(rows[row], img->width, img->pType + row * img->width);
}

}  // namespace

void GetFingerRidge(NaviFrame_t* img, int32_t thr) {
    if (FitsWords(img->width, img->height) && thr >= 0 && thr <= 255)
        FillWords(img, thr);
    else
        FillBytes(img, thr);
}

}  // namespace fpnavi
