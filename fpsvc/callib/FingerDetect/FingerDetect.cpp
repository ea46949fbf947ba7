// The texture test: how much ridge structure is in each of five blocks of a frame, and how dark.
//
// Each pixel passes a small band-pass: a 3 x 3 binomial blur, which takes off most of the white
// noise, minus the mean of the 9 x 9 window around the pixel, which takes off offset, gradient and
// slow shade. Both are symmetric about the pixel and alike in all directions, so skin with ridges
// 5 to 11 pixels apart passes whatever way it runs. A block's response is the root mean square of
// its passed pixels. All is summed over 4 x 4 cells, of which each of the five blocks holds 2 x 2.
//
// Requirement: the band-pass of every pixel whose window fits, to the last digit, for sides
// from 16.
//
// Observation: both filters are separable, and a row is part of nine windows.
//
// Algorithm: strips of eight columns, each from the top down. A row is filtered across once. The
// window sum slides down: a row enters, the row nine above leaves. A blur waits until the window
// around its centre is complete. The last strip ends with the last column and skips the columns
// that belong to the strip before it.
#include "FingerDetect.h"

#include "WordLanes.h"

namespace finger_detect {
namespace {

constexpr int32_t kRadius = 4;                // of the window, pixels
constexpr int32_t kWindow = 2 * kRadius + 1;  // its side
// 16 / 81 in 1/65536, rounded up: a window of one grey g gives exactly 16 g for all g to 255.
constexpr uint16_t kMean16Factor = 12946;
// From 1/16 grey level to the unit of the response, half a grey level. With it the usual threshold
// 7 lies midway, by ratio, between the strongest empty frame and the weakest touched one.
constexpr int32_t kResponseDivisor = 8;
constexpr int32_t kMinSide = 16;  // a block then has 4 x 4 pixels whose window fits
constexpr int32_t kMaxSide = 1 << 15;
constexpr int32_t kCells = 4;  // cells across, and down
constexpr int32_t kBlocks = 5;
constexpr int32_t kGreyRows = 257;    // 257 * 255 < 2^16
constexpr int32_t kEnergyRows = 128;  // 128 * 4080^2 < 2^31

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

// Sums over the cells. With sides up to 2^15 a cell has at most 2^26 pixels: grey < 2^34, and
// energy < 4080^2 * 2^26 < 2^50; four of them stay far below 2^63.
struct CellSums {
    int64_t grey[kCells][kCells + 1];  // the last column takes what is to be skipped
    int64_t energy[kCells][kCells + 1];
};

// Eight columns of a frame from first on, and the cell column that each of them adds to.
struct Strip {
    int32_t first;
    int32_t cellCol[kLanes];
};

// Eight pixels of a row, filtered across.
struct Row {
    Words sum;   // of 9 pixels around, at most 9 * 255
    Words blur;  // weights 1 2 1, at most 4 * 255
};

// What a strip keeps of the rows before.
struct BandPass {
    Words windowSum;                     // of the last nine rows, at most 81 * 255 < 2^16
    Words blur;                          // across, of the last row
    Words twoBlurs;                      // of the last two rows, summed
    Words waiting0, waiting1, waiting2;  // blurs whose window is not complete, the oldest first
};

int32_t Max(int32_t a, int32_t b) {
    return a > b ? a : b;
}
int32_t Min(int32_t a, int32_t b) {
    return a < b ? a : b;
}

// First column (row) of cell i of a frame that is size wide (high); CellStart(size, 4) is its end.
// At most 4 * 2^15 before the division.
int32_t CellStart(int32_t size, int32_t i) {
    return size * i / kCells;
}

// The strip of columns x to x + 7, moved back when it would not end before column end; those before
// x belong to the strip before and are skipped.
Strip StripAt(int32_t x, int32_t end, int32_t width) {
    Strip strip = {Min(x, end - kLanes), {}};
    for (int32_t i = 0; i < kLanes; ++i) {
        const int32_t column = strip.first + i;
        int32_t cellCol = 0;
        for (int32_t cell = 1; cell < kCells; ++cell)
            cellCol += column >= CellStart(width, cell) ? 1 : 0;
        strip.cellCol[i] = column >= x ? cellCol : kCells;
    }
    return strip;
}

// Largest root with root * root <= value; value in 0..2^24 - 1.
int32_t IntSqrt(int32_t value) {
    int32_t root = 0;
    for (int32_t bit = 1 << 11; bit > 0; bit >>= 1) {
        const int32_t trial = root + bit;
        if (trial * trial <= value)
            root = trial;
    }
    return root;
}

// Filters eight pixels of a row; the first of them is p[kRadius], 16 bytes are read.
Row FilterAcross(const uint8_t* p) {
    const Words centre = LoadBytes(p + 4);
    const Words inner = Add(Add(LoadBytes(p + 3), LoadBytes(p + 5)), centre);
    const Words before = Add(Add(LoadBytes(p), LoadBytes(p + 1)), LoadBytes(p + 2));
    const Words after = Add(Add(LoadBytes(p + 6), LoadBytes(p + 7)), LoadBytes(p + 8));
    return {Add(Add(before, inner), after), Add(inner, centre)};
}

// Moves the band-pass down by the row that enters; leaving: sums of the row nine above. Returns the
// passed pixels of the row kRadius above, in 1/16 grey level, at most 4080 to either side of 0;
// without meaning for the first eight rows.
Words Slide(const Row& entering, Words leaving, BandPass* band) {
    const Words twoBlurs = Add(band->blur, entering.blur);
    const Words blur = band->waiting0;
    band->waiting0 = band->waiting1;
    band->waiting1 = band->waiting2;
    band->waiting2 = Add(band->twoBlurs, twoBlurs);
    band->twoBlurs = twoBlurs;
    band->blur = entering.blur;
    band->windowSum = Add(band->windowSum, Sub(entering.sum, leaving));
    return Sub(blur, MulHigh(band->windowSum, kMean16Factor));
}

// Adds what a strip's columns sum up to, lane by lane, to the cells of a row.
template <typename Lane>
void AddToCells(const Lane* lanes, const Strip& strip, int64_t* cellsOfRow) {
    for (int32_t i = 0; i < kLanes; ++i)
        cellsOfRow[strip.cellCol[i]] += lanes[i];
}

// Takes the first eight rows of the strip whose windows begin in that column; rowSums[8] is free
// for the ninth.
void TakeFirstRows(const Image& image, int32_t column, BandPass* band, Words (&rowSums)[kWindow]) {
    for (int32_t y = 0; y < kWindow - 1; ++y) {
        const Row entering = FilterAcross(image.Row(y) + column);
        Slide(entering, NoWords(), band);
        rowSums[y] = entering.sum;
    }
    rowSums[kWindow - 1] = NoWords();
}

// Adds the energy of the strip's pixels whose window fits; a window reaches kRadius columns beyond
// the strip, all of them in the frame.
void AddStripEnergy(const Image& image, const Strip& strip, CellSums* cells) {
    const int32_t column = strip.first - kRadius;
    BandPass band = {};
    Words rowSums[kWindow];  // a ring
    TakeFirstRows(image, column, &band, rowSums);
    Words* const last = rowSums + kWindow - 1;
    Words* oldest = last;
    for (int32_t cellRow = 0, y = kRadius; cellRow < kCells; ++cellRow) {
        const int32_t end = Min(CellStart(image.height, cellRow + 1), image.height - kRadius);
        while (y < end) {
            const int32_t stop = Min(y + kEnergyRows, end);
            Energies sums = NoEnergies();
            for (; y < stop; ++y) {
                const Row entering = FilterAcross(image.Row(y + kRadius) + column);
                sums = AddSquares(sums, Slide(entering, *oldest, &band));
                *oldest = entering.sum;
                oldest = oldest < last ? oldest + 1 : rowSums;
            }
            int32_t energies[kLanes];
            Store(energies, sums);
            AddToCells(energies, strip, cells->energy[cellRow]);
        }
    }
}

void AddStripGrey(const Image& image, const Strip& strip, CellSums* cells) {
    int32_t y = 0;
    for (int32_t cellRow = 0; cellRow < kCells; ++cellRow) {
        const int32_t end = CellStart(image.height, cellRow + 1);
        while (y < end) {
            const int32_t stop = Min(y + kGreyRows, end);
            Words sums = NoWords();
            for (; y < stop; ++y)
                sums = Add(sums, LoadBytes(image.Row(y) + strip.first));
            uint16_t greys[kLanes];
            Store(greys, sums);
            AddToCells(greys, strip, cells->grey[cellRow]);
        }
    }
}

void SumCells(const Image& image, CellSums* cells) {
    for (int32_t x = 0; x < image.width; x += kLanes)
        AddStripGrey(image, StripAt(x, image.width, image.width), cells);
    const int32_t end = image.width - kRadius;
    for (int32_t x = kRadius; x < end; x += kLanes)
        AddStripEnergy(image, StripAt(x, end, image.width), cells);
}

// Columns (rows) of the block that begins with cell i; those less than margin from the frame's edge
// are left out.
int32_t BlockSpan(int32_t size, int32_t i, int32_t margin) {
    return Min(CellStart(size, i + 2), size - margin) - Max(CellStart(size, i), margin);
}

// Pixels of a block, at most 2^28.
int32_t BlockPixels(const Image& image, CellPlace place, int32_t margin) {
    return BlockSpan(image.width, place.col, margin) * BlockSpan(image.height, place.row, margin);
}

int64_t BlockSum(const int64_t (&cells)[kCells][kCells + 1], CellPlace place) {
    return cells[place.row][place.col] + cells[place.row][place.col + 1] +
           cells[place.row + 1][place.col] + cells[place.row + 1][place.col + 1];
}

void StoreBlock(const Image& image, const CellSums& cells, int32_t block, int32_t* results) {
    const CellPlace place = kBlockPlace[block];
    const int64_t meanEnergy =  // <= 4080^2 < 2^24
        BlockSum(cells.energy, place) / BlockPixels(image, place, kRadius);
    const int64_t meanGrey = BlockSum(cells.grey, place) / BlockPixels(image, place, 0);
    results[block] = IntSqrt(static_cast<int32_t>(meanEnergy)) / kResponseDivisor;
    results[kBlocks + block] = static_cast<int32_t>(meanGrey);
}

}  // namespace
}  // namespace finger_detect

void FingerBLKTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                   int32_t /*mode*/) {
    using namespace finger_detect;
    if (image == nullptr || results == nullptr || width < kMinSide || height < kMinSide ||
        width > kMaxSide || height > kMaxSide)
        return;
    const Image frame = {image, width, height};
    CellSums cells = {};
    SumCells(frame, &cells);
    for (int32_t block = 0; block < kBlocks; ++block)
        StoreBlock(frame, cells, block, results);
}
