// The texture test: how much ridge structure is in each of five blocks of a frame, and how dark.
//
// Each pixel passes a small band-pass: a 3 x 3 binomial blur, which takes off most of the white
// noise, minus the mean of the 9 x 9 window around the pixel, which takes off offset, gradient and
// slow shade. Both are symmetric about the pixel and alike in all directions, so skin with ridges
// 5 to 11 pixels apart passes whatever way it runs. A block's response is the root mean square of
// its passed pixels. All is summed over 4 x 4 cells, of which each of the five blocks holds 2 x 2.
#include "FingerDetect.h"

namespace {

constexpr int32_t kRadius = 4;                // of the window, pixels
constexpr int32_t kWindow = 2 * kRadius + 1;  // its side
// 16 / 81 in 1/65536, rounded up: a window of one grey g gives exactly 16 g for all g to 255.
constexpr int32_t kMean16Factor = 12946;
// From 1/16 grey level to the unit of the response, half a grey level. With it the usual threshold
// 7 lies midway, by ratio, between the strongest empty frame and the weakest touched one.
constexpr int32_t kResponseDivisor = 8;
constexpr int32_t kMinSide = 16;  // a block then has 4 x 4 pixels whose window fits
constexpr int32_t kMaxSide = 1 << 15;
constexpr int32_t kStripWidth = 64;  // columns worked on at a time
constexpr int32_t kCells = 4;        // cells across, and down
constexpr int32_t kBlocks = 5;

// Upper left cell of each block; a block is 2 x 2 cells.
struct CellPlace {
    int32_t row, col;
};
constexpr CellPlace kBlockPlace[kBlocks] = {{1, 1}, {0, 0}, {0, 2}, {2, 0}, {2, 2}};

struct Image {
    const uint8_t* pixels;
    int32_t width, height;
    const uint8_t* Row(int32_t y) const { return pixels + static_cast<int64_t>(y) * width; }
};

// Sums over one cell. With sides up to 2^15 a cell has at most 2^26 pixels: grey < 2^34, and energy
// < 4080^2 * 2^26 < 2^50; four of them stay far below 2^63.
struct CellSums {
    int64_t grey, energy;
    int64_t pixels;    // all of the cell's
    int64_t filtered;  // those whose window lies in the frame
};

// First column (row) of cell i of a frame that is size wide (high); CellStart(size, 4) is its end.
int32_t CellStart(int32_t size, int32_t i) {
    return size * i / kCells;
}

int32_t Max(int32_t a, int32_t b) {
    return a > b ? a : b;
}
int32_t Min(int32_t a, int32_t b) {
    return a < b ? a : b;
}

// Largest root with root * root <= value; value in 0..2^24 - 1.
int32_t IntSqrt(int32_t value) {
    int32_t root = 0;
    for (int32_t bit = 1 << 11; bit > 0; bit >>= 1) {
        const int32_t trial = root + bit;
        if (trial * trial <= value) {
            root = trial;
        }
    }
    return root;
}

// Sums of the 9 rows around row kRadius, for count columns from left - kRadius on. Each is at most
// 9 * 255. 16 bits hold it, and let the compiler work on eight columns at once.
void StartColumnSums(const Image& image, int32_t left, int32_t count, uint16_t* sums) {
    for (int32_t i = 0; i < count; i++) {
        int32_t sum = 0;
        for (int32_t y = 0; y < kWindow; y++) {
            sum += image.Row(y)[left - kRadius + i];
        }
        sums[i] = static_cast<uint16_t>(sum);
    }
}

// Moves the sums from row y - 1 to row y.
void SlideColumnSums(const Image& image, int32_t y, int32_t left, int32_t count, uint16_t* sums) {
    const uint8_t* enters = image.Row(y + kRadius) + left - kRadius;
    const uint8_t* leaves = image.Row(y - kRadius - 1) + left - kRadius;
    for (int32_t i = 0; i < count; i++) {
        sums[i] = static_cast<uint16_t>(sums[i] + enters[i] - leaves[i]);
    }
}

// 16 times the mean of the window over count columns: mean16[i] belongs to columnSums[i + kRadius].
// A window sum is at most 81 * 255, so the product stays below 2^29.
void WindowMeans(const uint16_t* columnSums, int32_t count, uint16_t* mean16) {
    for (int32_t i = 0; i < count; i++) {
        const uint16_t* c = columnSums + i;
        const int32_t sum = c[0] + c[1] + c[2] + c[3] + c[4] + c[5] + c[6] + c[7] + c[8];
        mean16[i] = static_cast<uint16_t>((sum * kMean16Factor) >> 16);
    }
}

// Band-passes columns left..left + count - 1 (count at most kStripWidth) of row y, whose column
// sums are given. passed: in 1/16 grey level, at most 4080 to either side of 0.
void BandPass(const Image& image, int32_t y, int32_t left, int32_t count,
              const uint16_t* columnSums, int16_t* passed) {
    uint16_t mean16[kStripWidth];
    WindowMeans(columnSums, count, mean16);
    const uint8_t* above = image.Row(y - 1) + left;
    const uint8_t* here = image.Row(y) + left;
    const uint8_t* below = image.Row(y + 1) + left;
    for (int32_t i = 0; i < count; i++) {
        const int32_t before = above[i - 1] + 2 * here[i - 1] + below[i - 1];
        const int32_t centre = above[i] + 2 * here[i] + below[i];
        const int32_t after = above[i + 1] + 2 * here[i + 1] + below[i + 1];
        passed[i] = static_cast<int16_t>(before + 2 * centre + after - mean16[i]);
    }
}

// Adds the energy of count passed pixels (at most kStripWidth), the first of them in column left,
// to the cells of a cell row. 64 * 4080^2 < 2^30.
void AddPassed(const int16_t* passed, int32_t left, int32_t count, int32_t width,
               CellSums* cellsOfRow) {
    for (int32_t cellCol = 0; cellCol < kCells; cellCol++) {
        const int32_t begin = Max(CellStart(width, cellCol) - left, 0);
        const int32_t end = Min(CellStart(width, cellCol + 1) - left, count);
        int32_t energy = 0;
        for (int32_t i = begin; i < end; i++) {
            energy += passed[i] * passed[i];
        }
        cellsOfRow[cellCol].energy += energy;
        cellsOfRow[cellCol].filtered += Max(end - begin, 0);
    }
}

// Adds the energy of every pixel whose window fits, a strip of columns at a time.
void AddEnergy(const Image& image, CellSums (*cells)[kCells]) {
    uint16_t columnSums[kStripWidth + kWindow - 1];
    int16_t passed[kStripWidth];
    for (int32_t x = kRadius; x < image.width - kRadius; x += kStripWidth) {
        const int32_t count = Min(kStripWidth, image.width - kRadius - x);
        const int32_t sumCount = count + kWindow - 1;
        StartColumnSums(image, x, sumCount, columnSums);
        int32_t cellRow = 0;
        for (int32_t y = kRadius; y < image.height - kRadius; y++) {
            if (y > kRadius) {
                SlideColumnSums(image, y, x, sumCount, columnSums);
            }
            while (y >= CellStart(image.height, cellRow + 1)) {
                cellRow++;
            }
            BandPass(image, y, x, count, columnSums, passed);
            AddPassed(passed, x, count, image.width, cells[cellRow]);
        }
    }
}

void AddGrey(const Image& image, CellSums (*cells)[kCells]) {
    for (int32_t i = 0; i < kCells * kCells; i++) {
        const int32_t cellRow = i / kCells;
        const int32_t cellCol = i % kCells;
        const int32_t left = CellStart(image.width, cellCol);
        const int32_t right = CellStart(image.width, cellCol + 1);
        CellSums& cell = cells[cellRow][cellCol];
        for (int32_t y = CellStart(image.height, cellRow); y < CellStart(image.height, cellRow + 1);
             y++) {
            const uint8_t* row = image.Row(y);
            int32_t sum = 0;  // 2^13 columns of 255 stay below 2^31
            for (int32_t x = left; x < right; x++) {
                sum += row[x];
            }
            cell.grey += sum;
            cell.pixels += right - left;
        }
    }
}

void StoreBlock(const CellSums (*cells)[kCells], int32_t block, int32_t* results) {
    const CellPlace place = kBlockPlace[block];
    CellSums sums = {};
    for (int32_t i = 0; i < 4; i++) {
        const CellSums& cell = cells[place.row + i / 2][place.col + i % 2];
        sums.grey += cell.grey;
        sums.energy += cell.energy;
        sums.pixels += cell.pixels;
        sums.filtered += cell.filtered;
    }
    const int32_t meanEnergy =
        static_cast<int32_t>(sums.energy / sums.filtered);  // <= 4080^2 < 2^24
    results[block] = IntSqrt(meanEnergy) / kResponseDivisor;
    results[kBlocks + block] = static_cast<int32_t>(sums.grey / sums.pixels);
}

}  // namespace

void FingerBLKTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                   int32_t /*mode*/) {
    if (image == nullptr || results == nullptr || width < kMinSide || height < kMinSide ||
        width > kMaxSide || height > kMaxSide) {
        return;
    }
    const Image frame = {image, width, height};
    CellSums cells[kCells][kCells] = {};
    AddGrey(frame, cells);
    AddEnergy(frame, cells);
    for (int32_t block = 0; block < kBlocks; block++) {
        StoreBlock(cells, block, results);
    }
}
