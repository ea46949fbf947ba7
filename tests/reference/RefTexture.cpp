// The texture test as docs/finger-detect.md defines it: each pixel's 3 x 3 blur minus the mean of
// its 9 x 9 window, the root mean square of that over a block, and the block's mean grey.

#include "RefTexture.h"

namespace reference {

namespace {

constexpr int32_t kMargin = 4;  // pixels nearer to the edge have no whole window

struct Picture {
    const uint8_t* greys;
    int32_t width;
    int32_t height;

    int32_t At(int32_t x, int32_t y) const { return greys[int64_t{y} * width + x]; }
};

struct Area {
    int32_t left;
    int32_t top;
    int32_t right;
    int32_t bottom;
};

// Blur minus mean, in 1/16 grey level. The quotient 16 / 81 is 12946 / 65536, which gives 16 g for
// a window of one grey g.
int32_t PassedPixel(const Picture& picture, int32_t x, int32_t y) {
    const int32_t weights[3] = {1, 2, 1};
    int32_t blur = 0;
    int32_t sum = 0;
    for (int32_t dy = -kMargin; dy <= kMargin; ++dy) {
        for (int32_t dx = -kMargin; dx <= kMargin; ++dx) {
            const int32_t grey = picture.At(x + dx, y + dy);
            sum += grey;
            if (dx >= -1 && dx <= 1 && dy >= -1 && dy <= 1)
                blur += weights[dx + 1] * weights[dy + 1] * grey;
        }
    }
    return blur - sum * 12946 / 65536;
}

int64_t Root(int64_t value) {
    int64_t root = 0;
    while ((root + 1) * (root + 1) <= value)
        ++root;
    return root;
}

void MeasureArea(const Picture& picture, const Area& area, int32_t* response, int32_t* mean) {
    int64_t energy = 0;
    int64_t grey = 0;
    int64_t filtered = 0;
    int64_t pixels = 0;
    for (int32_t y = area.top; y < area.bottom; ++y) {
        for (int32_t x = area.left; x < area.right; ++x) {
            grey += picture.At(x, y);
            ++pixels;
            if (x >= kMargin && x < picture.width - kMargin && y >= kMargin &&
                y < picture.height - kMargin) {
                const int64_t passed = PassedPixel(picture, x, y);
                energy += passed * passed;
                ++filtered;
            }
        }
    }
    *response = static_cast<int32_t>(Root(energy / filtered) / 8);
    *mean = static_cast<int32_t>(grey / pixels);
}

}  // namespace

void TextureTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                 int32_t /*mode*/) {
    if (image == nullptr || results == nullptr || width < 16 || height < 16 || width > 32768 ||
        height > 32768)
        return;
    const Picture picture = {image, width, height};
    const int32_t columns[5] = {0, width / 4, width / 2, width * 3 / 4, width};
    const int32_t rows[5] = {0, height / 4, height / 2, height * 3 / 4, height};
    const Area areas[5] = {{columns[1], rows[1], columns[3], rows[3]},
                           {columns[0], rows[0], columns[2], rows[2]},
                           {columns[2], rows[0], columns[4], rows[2]},
                           {columns[0], rows[2], columns[2], rows[4]},
                           {columns[2], rows[2], columns[4], rows[4]}};
    for (int32_t block = 0; block < 5; ++block)
        MeasureArea(picture, areas[block], &results[block], &results[5 + block]);
}

}  // namespace reference
