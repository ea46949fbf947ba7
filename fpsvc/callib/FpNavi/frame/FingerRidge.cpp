// GetFingerRidge: the finger area, everything between two dark pixels of a row or a column.
//
// Requirement: twice over, mark all from the first to the last marked pixel of each row, then of
// each column.
// Observation: a pixel lies between two marked ones of its column when one is marked at or above
// it and one at or below it.
// Algorithm: a row is a run of 64-bit words. Between two marked pixels of a row is a mask; columns
// are ORs upwards, which are kept, and downwards, 64 columns at a time.
#include <algorithm>
#include <cstdint>

#include "base/BitRows.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

constexpr int32_t kPasses = 2;

// The frame's bits: height rows of words 64-bit words each, and scratch of the same size. Both lie
// behind the greys of the frame.
struct Rows {
    uint64_t* bits;
    uint64_t* scratch;
    int32_t words;
    int32_t height;
};

void MarkDark(const NaviFrame_t& img, uint8_t thr, const Rows& rows) {
    uint64_t* bits = rows.bits;
    for (int32_t row = 0; row < img.height; ++row) {
        const uint8_t* const grey = img.pData + row * img.width;
        for (int32_t c = 0; c < img.width; c += kWordPixels)
            *bits++ = AtMostBits(grey + c, std::min(img.width - c, kWordPixels), thr);
    }
}

// Marks all from the first to the last marked pixel of a row.
void FillRow(uint64_t* row, int32_t words) {
    int32_t first = 0;
    while (first < words && row[first] == 0)
        ++first;
    if (first == words)
        return;
    int32_t last = words - 1;
    while (row[last] == 0)
        --last;
    const uint64_t head = BitsFrom(__builtin_ctzll(row[first]));
    const uint64_t tail = ~uint64_t{0} >> __builtin_clzll(row[last]);
    if (first == last) {
        row[first] = head & tail;
        return;
    }
    row[first] = head;
    std::fill(row + first + 1, row + last, ~uint64_t{0});
    row[last] = tail;
}

void FillColumns(const Rows& rows) {
    for (int32_t w = 0; w < rows.words; ++w) {
        uint64_t marked = 0;
        for (int32_t at = (rows.height - 1) * rows.words + w; at >= 0; at -= rows.words) {
            marked |= rows.bits[at];
            rows.scratch[at] = marked;
        }
        marked = 0;
        for (int32_t at = w; at < rows.height * rows.words; at += rows.words) {
            marked |= rows.bits[at];
            rows.bits[at] = marked & rows.scratch[at];
        }
    }
}

// Writes the classes row by row, sixteen at a time. Bytes beyond the end of a row are overwritten
// by the next row; behind the last row they lie in the space behind the pixels.
void WriteClasses(const Rows& rows, NaviFrame_t* img) {
    const uint64_t* word = rows.bits;
    for (int32_t row = 0; row < img->height; ++row) {
        uint8_t* const type = img->pType + row * img->width;
        for (int32_t first = 0; first < img->width; first += kWordPixels) {
            uint64_t bits = *word++;
            const int32_t last = std::min(first + kWordPixels, img->width);
            for (int32_t c = first; c < last; c += kLanes, bits >>= kLanes)
                Store16(type + c, SpreadBits(bits));
        }
    }
}

}  // namespace

void GetFingerRidge(NaviFrame_t* img, int32_t thr) {
    auto* const room = reinterpret_cast<uint64_t*>(img->pData + RoomStart(img->width, img->height));
    const int32_t words = WordsOf(img->width);
    const Rows rows = {room, room + img->height * words, words, img->height};
    // No grey is below 0, and none above 255.
    if (thr >= 0)
        MarkDark(*img, static_cast<uint8_t>(std::min(thr, kGreyMax)), rows);
    else
        std::fill_n(rows.bits, img->height * words, uint64_t{0});
    for (int32_t pass = 0; pass < kPasses; ++pass) {
        for (int32_t row = 0; row < img->height; ++row)
            FillRow(rows.bits + row * words, words);
        FillColumns(rows);
    }
    WriteClasses(rows, img);
}

}  // namespace fpnavi
