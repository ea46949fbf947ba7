// Template matching, first stage: templates cut from the frame with the smaller coverage are slid
// over the central region of the other frame, and the s_candidateNum best placements of all
// templates together are kept in a max-heap of 32-bit keys.

#include <cstdlib>

#include "RefInternal.h"
#include "RefMath.h"
#include "Reference.h"

namespace reference {

// Calls itself once a level, at most 17 times for the largest list.
// NOLINTNEXTLINE(misc-no-recursion)
int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i) {
    if (arr == nullptr || len < 1)
        return -1;
    if (i >= len)
        return 0;
    const int64_t left = 2 * int64_t{i} + 1;
    const int64_t right = left + 1;
    int64_t max = i;
    uint32_t max_val = arr[i];
    if (left < len && arr[left] > max_val) {
        max = left;
        max_val = arr[left];
    }
    if (right < len && arr[right] > max_val) {
        max = right;
        max_val = arr[right];
    }
    if (max == i)
        return 0;
    arr[max] = arr[i];
    arr[i] = max_val;
    return MaxHeapify(arr, len, Wrap32(max)) == -1 ? -1 : 0;
}

// Templates 0 to 3 lie along the inside of the margins, 4 to 7 just outside the centre; the latter
// belong to border tiles, so their displacements carry a gap more or less.
void BuildTemplates(MatchTemplate (&templates)[kTemplateNum]) {
    const int32_t wud = s_tpltWidthUD;
    const int32_t hud = s_tpltHeightUD;
    const int32_t wlr = s_tpltWidthLR;
    const int32_t hlr = s_tpltHeightLR;
    const int32_t gh = s_gapHeight;
    const int32_t gw = s_gapWidth;
    const int32_t middleColumn = WrapSub32(s_imageWidth, wud) / 2;
    const int32_t middleRow = WrapSub32(s_imageHeight, hlr) / 2;
    const int32_t centerBottom = WrapSub32(s_imageHeight, s_boundHeight);
    const int32_t centerRight = WrapSub32(s_imageWidth, s_boundWidth);
    templates[0] = {wud, hud, s_boundHeight, middleColumn, gh, gw};
    templates[1] = {wud, hud, WrapSub32(centerBottom, hud), middleColumn, gh, gw};
    templates[2] = {wlr, hlr, middleRow, WrapSub32(centerRight, wlr), gh, gw};
    templates[3] = {wlr, hlr, middleRow, s_boundWidth, gh, gw};
    templates[4] = {wud, hud, WrapSub32(s_boundHeight, hud), middleColumn, 0, gw};
    templates[5] = {wud, hud, centerBottom, middleColumn, WrapMul32(2, gh), gw};
    templates[6] = {
        wlr, hlr, middleRow, WrapAdd32(s_boundWidth, s_centerWidth), gh, WrapMul32(2, gw)};
    templates[7] = {wlr, hlr, middleRow, WrapSub32(s_boundWidth, wlr), gh, 0};
}

// The last column is built on the bound's height, not its width: it shows only where the two
// differ, and it is meant to stay.
SearchRange PlacementsOf(const MatchTemplate& tplt) {
    return {
        s_boundHeight,
        int64_t{s_centerHeight} + s_boundHeight - tplt.tpltHeight,
        s_boundWidth,
        int64_t{s_boundHeight} + s_centerWidth - tplt.tpltWidth,
    };
}

namespace {

struct FramePair {
    const NaviFrame_t* templateFrame;
    const NaviFrame_t* searchedFrame;
};

// Ties cut the templates from the current frame.
FramePair ChooseFrames() {
    if (s_imageCurr.cvr > s_imagePrev.cvr)
        return {&s_imagePrev, &s_imageCurr};
    return {&s_imageCurr, &s_imagePrev};
}

bool HasPixels(const MatchTemplate& tplt) {
    return tplt.tpltWidth >= 1 && tplt.tpltHeight >= 1;
}

bool LiesInFrame(const MatchTemplate& tplt) {
    return tplt.tplt_i0 >= 0 && tplt.tplt_j0 >= 0 &&
           int64_t{tplt.tplt_i0} + tplt.tpltHeight <= s_imageHeight &&
           int64_t{tplt.tplt_j0} + tplt.tpltWidth <= s_imageWidth;
}

// At least half of the template lies in the finger area.
bool IsValidTemplate(const MatchTemplate& tplt, const uint8_t* pt1, int32_t tpltSize) {
    if (tplt.tpltWidth < 1) {
        return false;  // no pixels, however many rows
    }
    int32_t cnt = 0;
    for (int32_t m = 0; m < tplt.tpltHeight; ++m) {
        for (int32_t n = 0; n < tplt.tpltWidth; ++n) {
            if (pt1[(tplt.tplt_i0 + m) * s_imageWidth + tplt.tplt_j0 + n] == 1)
                ++cnt;
        }
    }
    return WrapMul32(100, cnt) / tpltSize > 49;
}

bool IsEmpty(const SearchRange& range) {
    return range.lastRow < range.firstRow || range.lastColumn < range.firstColumn;
}

// Every placement lies in the frame and its corner fits the two 8-bit fields of a key.
bool AllPlacementsFit(const SearchRange& range, const MatchTemplate& tplt) {
    return range.firstRow >= 0 && range.firstColumn >= 0 && range.lastRow <= 255 &&
           range.lastColumn <= 255 && range.lastRow + tplt.tpltHeight <= s_imageHeight &&
           range.lastColumn + tplt.tpltWidth <= s_imageWidth;
}

int32_t PlacementDifference(const MatchTemplate& tplt, int32_t i, int32_t j, const uint8_t* pd1,
                            const uint8_t* pd2, int32_t tpltSize) {
    int64_t sum = 0;
    for (int32_t m = 0; m < tplt.tpltHeight; ++m) {
        for (int32_t n = 0; n < tplt.tpltWidth; ++n) {
            const uint8_t searched = pd2[(i + m) * s_imageWidth + j + n];
            const uint8_t wanted = pd1[(tplt.tplt_i0 + m) * s_imageWidth + tplt.tplt_j0 + n];
            sum += GreyDistance(searched, wanted);
        }
    }
    return static_cast<int32_t>(sum / tpltSize);
}

// Bits 31..24 difference, 23..16 row, 15..8 column, 7..0 template.
uint32_t PackCandidate(int32_t diff, int32_t i, int32_t j, int32_t k) {
    return (static_cast<uint32_t>(diff & 0xFF) << 24) | (static_cast<uint32_t>(i) << 16) |
           (static_cast<uint32_t>(j) << 8) | static_cast<uint32_t>(k);
}

// Slides template k over its placements; the heap root is the worst key kept.
int32_t SearchTemplate(const MatchTemplate& tplt, int32_t k, const FramePair& frames,
                       int32_t tpltSize, uint32_t* candidateList) {
    const SearchRange range = PlacementsOf(tplt);
    if (IsEmpty(range))
        return 0;
    if (!AllPlacementsFit(range, tplt))
        return -1;
    for (int32_t i = Wrap32(range.firstRow); i <= range.lastRow; ++i) {
        for (int32_t j = Wrap32(range.firstColumn); j <= range.lastColumn; ++j) {
            const int32_t diff = PlacementDifference(tplt, i, j, frames.templateFrame->pData,
                                                     frames.searchedFrame->pData, tpltSize);
            const uint32_t candidate = PackCandidate(diff, i, j, k);
            if (candidate < candidateList[0]) {
                candidateList[0] = candidate;
                if (MaxHeapify(candidateList, s_candidateNum, 0) == -1)
                    return -1;
            }
        }
    }
    return 0;
}

int32_t SearchAllTemplates(const MatchTemplate (&templates)[kTemplateNum], int32_t tpltSize,
                           uint32_t* candidateList) {
    const FramePair frames = ChooseFrames();
    int32_t tpltValidFlag[kTemplateNum] = {};
    for (int32_t k = 0; k < s_tpltNum; ++k) {
        if (!HasPixels(templates[k]))
            continue;
        if (!LiesInFrame(templates[k]))
            return -1;
        tpltValidFlag[k] =
            IsValidTemplate(templates[k], frames.templateFrame->pType, tpltSize) ? 1 : 0;
    }
    for (int32_t k = 0; k < s_tpltNum; ++k) {
        if (tpltValidFlag[k] == 1 &&
            SearchTemplate(templates[k], k, frames, tpltSize, candidateList) == -1)
            return -1;
    }
    return 0;
}

// In the heap's own order; sentinels convert like every other key.
void ConvertCandidates(const MatchTemplate (&templates)[kTemplateNum],
                       const uint32_t* candidateList, int32_t* candidate_di,
                       int32_t* candidate_dj) {
    for (int32_t m = 0; m < s_candidateNum; ++m) {
        const uint32_t key = candidateList[m];
        const int32_t i = static_cast<int32_t>((key >> 16) & 0xFF);
        const int32_t j = static_cast<int32_t>((key >> 8) & 0xFF);
        const MatchTemplate& tplt = templates[key & 0xFF];
        candidate_di[m] = WrapSub32(WrapAdd32(i, s_gapHeight), WrapAdd32(tplt.tplt_i0, tplt.di));
        candidate_dj[m] = WrapSub32(WrapAdd32(j, s_gapWidth), WrapAdd32(tplt.tplt_j0, tplt.dj));
    }
}

}  // namespace

int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj) {
    const int32_t tpltSize = WrapMul32(s_templateHeight, s_templateWidth);
    if (tpltSize < 1)
        return -1;
    MatchTemplate templates[kTemplateNum];
    BuildTemplates(templates);
    const int64_t bytes = int64_t{s_candidateNum} * static_cast<int64_t>(sizeof(uint32_t));
    uint32_t* candidateList = static_cast<uint32_t*>(Allocate(bytes));
    if (candidateList == nullptr)
        return -1;
    for (int32_t m = 0; m < s_candidateNum; ++m) {
        candidateList[m] = 0xFF000000U;  // difference 255 at row 0, column 0, template 0
    }
    const int32_t result = SearchAllTemplates(templates, tpltSize, candidateList);
    if (result == 0)
        ConvertCandidates(templates, candidateList, candidate_di, candidate_dj);
    std::free(candidateList);
    return result;
}

}  // namespace reference
