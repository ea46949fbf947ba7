#include "FindCandidate.h"

#include <algorithm>
#include <cstdlib>
#include <utility>

#include "NaviFrame.h"
#include "NaviMath.h"
#include "NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kTpltMax = 8;
constexpr int32_t kKeyFieldMax = 255;           // rows and columns have 8 bits in a key
constexpr uint32_t kKeySentinel = 0xFF000000U;  // difference 255 at row 0, column 0, template 0
constexpr int32_t kTpltCoverageMin = 49;        // percent of a template that must be exceeded

// A rectangle cut out of the template frame, and what turns a placement into a displacement.
struct Template {
    int32_t width;
    int32_t height;
    int32_t i0;  // top row in the frame
    int32_t j0;  // left column
    int32_t di;  // gap rows between the template's tile and the top of the full image
    int32_t dj;  // gap columns likewise
};

// The rows and columns that a template's top-left corner takes in the searched frame, inclusive.
struct Placements {
    int64_t iFirst;
    int64_t iLast;
    int64_t jFirst;
    int64_t jLast;

    bool Empty() const { return iLast < iFirst || jLast < jFirst; }
};

// Templates 0 to 3 lie at the top, bottom, right and left inside the centre region, 4 to 7 just
// outside it, in the border tiles, and carry the gap between.
void CutTemplates(Template (&tplts)[kTpltMax]) {
    const int32_t wUD = s_tpltWidthUD;
    const int32_t hUD = s_tpltHeightUD;
    const int32_t wLR = s_tpltWidthLR;
    const int32_t hLR = s_tpltHeightLR;
    const int32_t bottom = WrapSub(s_imageHeight, s_boundHeight);
    const int32_t right = WrapAdd(s_boundWidth, s_centerWidth);
    const int32_t midUD = WrapSub(s_imageWidth, wUD) / 2;
    const int32_t midLR = WrapSub(s_imageHeight, hLR) / 2;
    const int32_t gh = s_gapHeight;
    const int32_t gw = s_gapWidth;
    tplts[0] = {wUD, hUD, s_boundHeight, midUD, gh, gw};
    tplts[1] = {wUD, hUD, WrapSub(bottom, hUD), midUD, gh, gw};
    tplts[2] = {wLR, hLR, midLR, WrapSub(WrapSub(s_imageWidth, s_boundWidth), wLR), gh, gw};
    tplts[3] = {wLR, hLR, midLR, s_boundWidth, gh, gw};
    tplts[4] = {wUD, hUD, WrapSub(s_boundHeight, hUD), midUD, 0, gw};
    tplts[5] = {wUD, hUD, bottom, midUD, WrapMul(2, gh), gw};
    tplts[6] = {wLR, hLR, midLR, right, gh, WrapMul(2, gw)};
    tplts[7] = {wLR, hLR, midLR, WrapSub(s_boundWidth, wLR), gh, 0};
}

// The rectangle has no pixel, or all of them lie in the frame.
bool InsideFrame(int64_t i0, int64_t j0, const Template& tplt) {
    if (tplt.width < 1 || tplt.height < 1)
        return true;
    return i0 >= 0 && j0 >= 0 && tplt.height <= s_imageHeight && tplt.width <= s_imageWidth &&
           i0 <= s_imageHeight - tplt.height && j0 <= s_imageWidth - tplt.width;
}

// At least half of the template lies in the finger area. type: class map of the template frame.
bool IsValid(const Template& tplt, const uint8_t* type, int32_t tpltSize) {
    int32_t cnt = 0;
    for (int32_t m = 0; m < tplt.height; ++m) {
        for (int32_t n = 0; n < tplt.width; ++n)
            cnt += type[(tplt.i0 + m) * s_imageWidth + tplt.j0 + n] == 1 ? 1 : 0;
    }
    return 100 * int64_t{cnt} / tpltSize > kTpltCoverageMin;
}

// The last column is counted from s_boundHeight: with unequal borders the region is shifted.
Placements PlacementsOf(const Template& tplt) {
    return {s_boundHeight, int64_t{s_centerHeight} + s_boundHeight - tplt.height, s_boundWidth,
            int64_t{s_boundHeight} + s_centerWidth - tplt.width};
}

bool PlacementsUsable(const Placements& where, const Template& tplt) {
    return where.Empty() || (where.iLast <= kKeyFieldMax && where.jLast <= kKeyFieldMax &&
                             InsideFrame(where.iFirst, where.jFirst, tplt) &&
                             InsideFrame(where.iLast, where.jLast, tplt));
}

// Mean grey difference between the template in pd1 and the placement (i, j) in pd2, 0..255.
int32_t PlacementDiff(const Template& tplt, const uint8_t* pd1, const uint8_t* pd2, int32_t i,
                      int32_t j, int32_t tpltSize) {
    int64_t sum = 0;
    for (int32_t m = 0; m < tplt.height; ++m) {
        const uint8_t* const placed = pd2 + (i + m) * s_imageWidth + j;
        const uint8_t* const cut = pd1 + (tplt.i0 + m) * s_imageWidth + tplt.j0;
        for (int32_t n = 0; n < tplt.width; ++n)
            sum += GreyDiff(placed[n], cut[n]);
    }
    return static_cast<int32_t>(sum / tpltSize);
}

uint32_t MakeKey(int32_t diff, int32_t i, int32_t j, int32_t k) {
    return static_cast<uint32_t>(diff) << 24 | static_cast<uint32_t>(i) << 16 |
           static_cast<uint32_t>(j) << 8 | static_cast<uint32_t>(k);
}

// Scores every placement of template k and keeps the s_candidateNum smallest keys met so far in
// candidateList, whose root is the worst of them.
void SearchTemplate(const Template& tplt, int32_t k, const uint8_t* pd1, const uint8_t* pd2,
                    int32_t tpltSize, uint32_t* candidateList) {
    const Placements where = PlacementsOf(tplt);
    if (where.Empty())
        return;
    const int32_t iLast = static_cast<int32_t>(where.iLast);  // usable: 0..255
    const int32_t jLast = static_cast<int32_t>(where.jLast);
    for (int32_t i = s_boundHeight; i <= iLast; ++i) {
        for (int32_t j = s_boundWidth; j <= jLast; ++j) {
            const int32_t diff = PlacementDiff(tplt, pd1, pd2, i, j, tpltSize);
            const uint32_t candidate = MakeKey(diff, i, j, k);
            if (candidate >= candidateList[0])
                continue;
            candidateList[0] = candidate;
            MaxHeapify(candidateList, s_candidateNum, 0);
        }
    }
}

// Searches all valid templates. Returns false when one of them or a placement of a valid one would
// leave the frame.
bool SearchTemplates(const Template (&tplts)[kTpltMax], int32_t tpltSize, uint32_t* candidateList) {
    // The frame with less finger gives the templates, the other one has room to find them.
    const bool cutFromPrev = s_imageCurr.cvr > s_imagePrev.cvr;
    const NaviFrame_t& cut = cutFromPrev ? s_imagePrev : s_imageCurr;
    const NaviFrame_t& searched = cutFromPrev ? s_imageCurr : s_imagePrev;
    const int32_t tpltNum = std::min(s_tpltNum, kTpltMax);
    int32_t tpltValidFlag[kTpltMax] = {};
    for (int32_t k = 0; k < tpltNum; ++k) {
        if (!InsideFrame(tplts[k].i0, tplts[k].j0, tplts[k]))
            return false;
        tpltValidFlag[k] = IsValid(tplts[k], cut.pType, tpltSize) ? 1 : 0;
        if (tpltValidFlag[k] == 1 && !PlacementsUsable(PlacementsOf(tplts[k]), tplts[k]))
            return false;
    }
    for (int32_t k = 0; k < tpltNum; ++k) {
        if (tpltValidFlag[k] == 1)
            SearchTemplate(tplts[k], k, cut.pData, searched.pData, tpltSize, candidateList);
    }
    return true;
}

// Turns the keys, in the order of the heap's array, into displacements.
void ConvertKeys(const Template (&tplts)[kTpltMax], const uint32_t* candidateList,
                 int32_t* candidate_di, int32_t* candidate_dj) {
    for (int32_t m = 0; m < s_candidateNum; ++m) {
        const uint32_t key = candidateList[m];
        const int32_t i = static_cast<int32_t>(key >> 16 & 0xFFU);
        const int32_t j = static_cast<int32_t>(key >> 8 & 0xFFU);
        const Template& tplt = tplts[key & 0xFFU];
        candidate_di[m] = WrapSub(WrapAdd(i, s_gapHeight), WrapAdd(tplt.i0, tplt.di));
        candidate_dj[m] = WrapSub(WrapAdd(j, s_gapWidth), WrapAdd(tplt.j0, tplt.dj));
    }
}

}  // namespace

int32_t MaxHeapify(uint32_t* arr, int32_t len, int32_t i) {
    if (arr == nullptr || len < 1)
        return -1;
    if (i < 0 || i >= len)
        return 0;
    // Children of i are 2i + 1 and 2i + 2; none exists from len / 2 on, so that nothing overflows.
    while (i < len / 2) {
        const int32_t left = 2 * i + 1;
        int32_t max = arr[left] > arr[i] ? left : i;
        if (left < len - 1 && arr[left + 1] > arr[max])
            max = left + 1;
        if (max == i)
            break;
        std::swap(arr[i], arr[max]);
        i = max;
    }
    return 0;
}

int32_t FindCandidate(int32_t* candidate_di, int32_t* candidate_dj) {
    const int32_t tpltSize = WrapMul(s_templateHeight, s_templateWidth);
    if (candidate_di == nullptr || candidate_dj == nullptr || tpltSize < 1 || s_candidateNum < 1 ||
        !HasPixels(&s_imageCurr) || !HasPixels(&s_imagePrev))
        return -1;
    Template tplts[kTpltMax];
    CutTemplates(tplts);
    const size_t num = static_cast<size_t>(s_candidateNum);
    uint32_t* const candidateList = static_cast<uint32_t*>(std::malloc(num * sizeof(uint32_t)));
    if (candidateList == nullptr)
        return -1;
    std::fill_n(candidateList, num, kKeySentinel);
    const bool searched = SearchTemplates(tplts, tpltSize, candidateList);
    if (searched)
        ConvertKeys(tplts, candidateList, candidate_di, candidate_dj);
    std::free(candidateList);
    return searched ? 0 : -1;
}

}  // namespace fpnavi
