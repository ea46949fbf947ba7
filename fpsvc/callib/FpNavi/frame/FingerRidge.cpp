// GetFingerRidge: the finger area, everything between two dark pixels of a row or a column.
//
// Requirement: twice over, mark all from the first to the last marked pixel of each row, then of
// each column.
// Observation: a pixel lies between two marked ones of its column when one is marked at or above
// it and one at or below it.
// Algorithm: a row is a run of 64-bit words. A row is filled by masks, 64 columns by ORs upwards,
// which are kept, and downwards.
#include <algorithm>
#include <cstdint>
#include <cstring>

#include "base/BitRows.h"
#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"

namespace fpnavi {
namespace {

// Marks all from the first to the last marked pixel of a row.
void FillRow(uint64_t* row, int32_t words) {
    uint64_t* first = row;
    uint64_t* last = row + words - 1;
    while (first < last && *first == 0)
        ++first;
    while (first < last && *last == 0)
        --last;
    if (*first == 0)
        return;
    const uint64_t head = BitsFrom(__builtin_ctzll(*first));
    const uint64_t tail = ~uint64_t{0} >> __builtin_clzll(*last);
    std::fill(first, last, ~uint64_t{0});
    *last = tail;
    *first &= head;
}

// Marks all from the first to the last marked pixel of each column. bits [in, out]: count words in
// rows of words; below [out]: as many words of scratch.
void FillColumns(uint64_t* bits, uint64_t* below, int32_t words, int32_t count) {
    for (int32_t w = 0; w < words; ++w) {
        uint64_t marked = 0;
        for (int32_t at = count - words + w; at >= 0; at -= words) {
            marked |= bits[at];
            below[at] = marked;
        }
        marked = 0;
        for (int32_t at = w; at < count; at += words) {
            marked |= bits[at];
            bits[at] = marked & below[at];
        }
    }
}

// Writes the classes row by row, sixteen at a time. Bytes beyond the end of a row are overwritten
// by the next row; behind the last row they lie in the space behind the pixels.
void WriteClasses(const uint64_t* word, NaviFrame_t* img) {
    uint8_t* type = img->pType;
    for (int32_t row = 0; row < img->height; ++row, type += img->width) {
        uint64_t bits = 0;
        for (int32_t c = 0; c < img->width; c += kLanes, bits >>= kLanes) {
            if (c % kWordPixels == 0)
                bits = *word++;
            Store16(type + c, SpreadBits(bits));
        }
    }
}

}  // namespace

void GetFingerRidge(NaviFrame_t* img, int32_t thr) {
    auto* const bits = reinterpret_cast<uint64_t*>(img->pData + RoomStart(img->width, img->height));
    const int32_t words = WordsOf(img->width);
    const int32_t count = img->height * words;
    if (thr < 0) {  // no grey is below 0
        std::memset(img->pType, 0, static_cast<size_t>(img->width * img->height));
        return;
    }
    const uint8_t most = static_cast<uint8_t>(std::min(thr, kGreyMax));
    uint64_t* word = bits;
    for (int32_t row = 0; row < img->height; ++row) {
        const uint8_t* const grey = img->pData + row * img->width;
        for (int32_t c = 0; c < img->width; c += kWordPixels)
            *word++ = AtMostBits(grey + c, std::min(img->width - c, kWordPixels), most);
    }
    for (int32_t pass = 0; pass < 2; ++pass) {
        for (int32_t at = 0; at < count; at += words)
            FillRow(bits + at, words);
        FillColumns(bits, bits + count, words, count);
    }
    WriteClasses(bits, img);
}

}  // namespace fpnavi
