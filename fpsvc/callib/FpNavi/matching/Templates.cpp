#include "matching/Templates.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "frame/NaviFrame.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kKeyFieldMax = 255;     // rows and columns have 8 bits in a key
constexpr int32_t kTpltCoverageMin = 49;  // percent of a template that must be exceeded

// Templates 0 to 3 lie at the top, bottom, right and left inside the centre region, 4 to 7 just
// outside it, in the border tiles, and carry the gap between.
void PlaceTemplates(Template (&tplts)[kTpltMax]) {
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

// No pixels; one of the sides may be huge all the same.
bool IsEmpty(const Template& tplt) {
    return tplt.width < 1 || tplt.height < 1;
}

// The rectangle at (i0, j0) has no pixel, or all of them lie in the frame.
bool InsideFrame(int64_t i0, int64_t j0, const Template& tplt) {
    if (IsEmpty(tplt))
        return true;
    return i0 >= 0 && j0 >= 0 && tplt.height <= s_imageHeight && tplt.width <= s_imageWidth &&
           i0 <= s_imageHeight - tplt.height && j0 <= s_imageWidth - tplt.width;
}

// At least half of the template lies in the finger area. type: class map of the template frame.
bool IsValid(const Template& tplt, const uint8_t* type, int32_t tpltSize) {
    if (IsEmpty(tplt))
        return false;
    int32_t cnt = 0;
    for (int32_t m = 0; m < tplt.height; ++m) {
        for (int32_t n = 0; n < tplt.width; ++n)
            cnt += type[(tplt.i0 + m) * s_imageWidth + tplt.j0 + n] == 1 ? 1 : 0;
    }
    return 100 * int64_t{cnt} / tpltSize > kTpltCoverageMin;
}

bool PlacementsUsable(const Placements& where, const Template& tplt) {
    return where.Empty() || (where.iLast <= kKeyFieldMax && where.jLast <= kKeyFieldMax &&
                             InsideFrame(where.iFirst, where.jFirst, tplt) &&
                             InsideFrame(where.iLast, where.jLast, tplt));
}

}  // namespace

// The last column is counted from s_boundHeight: with unequal borders the region is shifted.
Placements PlacementsOf(const Template& tplt) {
    return {s_boundHeight, int64_t{s_centerHeight} + s_boundHeight - tplt.height, s_boundWidth,
            int64_t{s_boundHeight} + s_centerWidth - tplt.width};
}

bool CutTemplates(TemplateSet* set) {
    const bool cutFromPrev = s_imageCurr.cvr > s_imagePrev.cvr;
    set->cut = cutFromPrev ? &s_imagePrev : &s_imageCurr;
    set->searched = cutFromPrev ? &s_imageCurr : &s_imagePrev;
    set->tpltSize = WrapMul(s_templateHeight, s_templateWidth);
    if (set->tpltSize < 1 || !HasPixels(set->cut) || !HasPixels(set->searched))
        return false;
    PlaceTemplates(set->tplts);
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const Template& tplt = set->tplts[k];
        set->valid[k] = false;
        if (k >= s_tpltNum)
            continue;
        if (!InsideFrame(tplt.i0, tplt.j0, tplt))
            return false;
        set->valid[k] = IsValid(tplt, set->cut->pType, set->tpltSize);
        if (set->valid[k] && !PlacementsUsable(PlacementsOf(tplt), tplt))
            return false;
    }
    return true;
}

Displacement DisplacementOf(const Template (&tplts)[kTpltMax], uint32_t key) {
    const int32_t i = static_cast<int32_t>(key >> 16 & 0xFFU);
    const int32_t j = static_cast<int32_t>(key >> 8 & 0xFFU);
    const Template& tplt = tplts[key & 0xFFU];
    return {WrapSub(WrapAdd(i, s_gapHeight), WrapAdd(tplt.i0, tplt.di)),
            WrapSub(WrapAdd(j, s_gapWidth), WrapAdd(tplt.j0, tplt.dj))};
}

}  // namespace fpnavi
