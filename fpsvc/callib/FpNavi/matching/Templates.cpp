#include "matching/Templates.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kKeyFieldMax = 255;     // rows and columns have 8 bits in a key
constexpr int32_t kTpltCoverageMin = 49;  // percent of a template that must be exceeded

// Templates 0 to 3 lie at the top, bottom, right and left inside the centre region, 4 to 7 next to
// them outside, in the border tiles; di and dj count the gaps before each.
void PlaceTemplates(const SearchParams& p, Template (&tplts)[kTpltMax]) {
    const int32_t wUD = p.tpltWidthUD;
    const int32_t hUD = p.tpltHeightUD;
    const int32_t wLR = p.tpltWidthLR;
    const int32_t hLR = p.tpltHeightLR;
    const int32_t bottom = WrapSub(p.imageHeight, p.boundHeight);
    const int32_t right = WrapAdd(p.boundWidth, p.centerWidth);
    const int32_t midUD = WrapSub(p.imageWidth, wUD) / 2;
    const int32_t midLR = WrapSub(p.imageHeight, hLR) / 2;
    const int32_t gh = p.gapHeight;
    const int32_t gw = p.gapWidth;
    tplts[0] = {wUD, hUD, p.boundHeight, midUD, gh, gw};
    tplts[1] = {wUD, hUD, WrapSub(bottom, hUD), midUD, gh, gw};
    tplts[2] = {wLR, hLR, midLR, WrapSub(WrapSub(p.imageWidth, p.boundWidth), wLR), gh, gw};
    tplts[3] = {wLR, hLR, midLR, p.boundWidth, gh, gw};
    tplts[4] = {wUD, hUD, WrapSub(p.boundHeight, hUD), midUD, 0, gw};
    tplts[5] = {wUD, hUD, bottom, midUD, WrapMul(2, gh), gw};
    tplts[6] = {wLR, hLR, midLR, right, gh, WrapMul(2, gw)};
    tplts[7] = {wLR, hLR, midLR, WrapSub(p.boundWidth, wLR), gh, 0};
}

// No pixels; the other side may be huge.
bool IsEmpty(const Template& tplt) {
    return tplt.width < 1 || tplt.height < 1;
}

// A rectangle of the template's size at (i0, j0) has no pixel, or all of them lie in the frame.
bool InsideFrame(const SearchParams& params, int64_t i0, int64_t j0, const Template& tplt) {
    if (IsEmpty(tplt))
        return true;
    return i0 >= 0 && j0 >= 0 && tplt.height <= params.imageHeight &&
           tplt.width <= params.imageWidth && i0 <= params.imageHeight - tplt.height &&
           j0 <= params.imageWidth - tplt.width;
}

// At least half of the template's pixels are finger in frame.
bool IsValid(const Template& tplt, const LaidFrame& frame, int32_t tpltSize) {
    if (IsEmpty(tplt))
        return false;
    const Meeting rows = {0, tplt.height, 1, {{tplt.i0, tplt.i0 + tplt.height}}};
    const Columns columns = CutColumns({0, tplt.width, 1, {{tplt.j0, tplt.j0 + tplt.width}}});
    const int64_t cnt = CommonArea(frame, frame, {&rows, &columns});
    return 100 * cnt / tpltSize > kTpltCoverageMin;
}

bool PlacementsUsable(const SearchParams& params, const Placements& where, const Template& tplt) {
    return where.Empty() || (where.iLast <= kKeyFieldMax && where.jLast <= kKeyFieldMax &&
                             InsideFrame(params, where.iFirst, where.jFirst, tplt) &&
                             InsideFrame(params, where.iLast, where.jLast, tplt));
}

}  // namespace

SearchParams CurrentSearchParams() {
    return {s_imageWidth,   s_imageHeight,     s_boundWidth,
            s_boundHeight,  s_centerWidth,     s_centerHeight,
            s_gapWidth,     s_gapHeight,       IsTiled(),
            s_tpltNum,      s_tpltWidthUD,     s_tpltHeightUD,
            s_tpltWidthLR,  s_tpltHeightLR,    WrapMul(s_templateHeight, s_templateWidth),
            s_candidateNum, s_overlapAreaMinFp};
}

// The last column is counted from boundHeight: with unequal borders the region is shifted.
Placements PlacementsOf(const SearchParams& params, const Template& tplt) {
    return {params.boundHeight, int64_t{params.centerHeight} + params.boundHeight - tplt.height,
            params.boundWidth, int64_t{params.boundHeight} + params.centerWidth - tplt.width};
}

bool CutTemplates(const SearchParams& params, const FramePair& pair, TemplateSet* set) {
    const LaidFrame& cut = pair.Cut();
    if (params.tpltSize < 1 || cut.width != params.imageWidth || cut.height != params.imageHeight)
        return false;
    set->gapHeight = params.gapHeight;
    set->gapWidth = params.gapWidth;
    set->tpltSize = params.tpltSize;
    PlaceTemplates(params, set->tplts);
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const Template& tplt = set->tplts[k];
        set->valid[k] = false;
        if (k >= params.tpltNum)
            continue;
        if (!InsideFrame(params, tplt.i0, tplt.j0, tplt))
            return false;
        set->valid[k] = IsValid(tplt, cut, params.tpltSize);
        if (set->valid[k] && !PlacementsUsable(params, PlacementsOf(params, tplt), tplt))
            return false;
    }
    return true;
}

Displacement DisplacementOf(const TemplateSet& set, uint32_t key) {
    const int32_t i = static_cast<int32_t>(key >> 16 & 0xFFU);
    const int32_t j = static_cast<int32_t>(key >> 8 & 0xFFU);
    const Template& tplt = set.tplts[key & 0xFFU];
    return {WrapSub(WrapAdd(i, set.gapHeight), WrapAdd(tplt.i0, tplt.di)),
            WrapSub(WrapAdd(j, set.gapWidth), WrapAdd(tplt.j0, tplt.dj))};
}

}  // namespace fpnavi
