#include "StepSearchParams.h"

#include <algorithm>
#include <iterator>

#include "StepFrames.h"

namespace fpnavi_test {
namespace {

using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

struct TemplateSize {
    int32_t width;
    int32_t height;
};

// Either side of what a piece of a template holds, 64 pixels and 16 columns, lying and standing;
// and squares, with which the wide and the tall templates are of one size.
constexpr TemplateSize kTemplates[] = {
    {12, 5}, {16, 4}, {4, 16}, {17, 4}, {4, 17}, {16, 1}, {17, 1},  {1, 16},  {1, 17},
    {8, 8},  {13, 5}, {5, 13}, {1, 64}, {64, 1}, {1, 65}, {65, 1},  {16, 5},  {15, 4},
    {3, 21}, {3, 22}, {9, 9},  {1, 1},  {32, 2}, {33, 2}, {16, 16}, {17, 17}, {2, 32}};

TemplateSize RandomTemplate(SimRandom& random, FrameSize size, int32_t bound) {
    if (random.Chance(35))
        return kTemplates[random.Below(static_cast<int32_t>(std::size(kTemplates)))];
    if (random.Chance(20))
        return {random.Range(1, 20), random.Range(1, 20)};
    const int32_t least = std::min(size.width, size.height);
    return {random.Range(1, std::clamp(least, 1, 20)), random.Range(1, std::clamp(bound, 1, 8))};
}

// Neither the search nor the match of a pair takes more byte comparisons.
bool CheapSearch(const ParamBlock& params, double most) {
    const auto value = [&params](const char* name) {
        return static_cast<double>(ParamValue(params, name));
    };
    const double full =
        (value("s_centerWidth") + 2 * (value("s_gapWidth") + value("s_boundWidth"))) *
        (value("s_centerHeight") + 2 * (value("s_gapHeight") + value("s_boundHeight")));
    const double search = 8 * std::max(value("s_centerWidth"), 1.0) *
                          std::max(value("s_centerHeight"), 1.0) * value("s_templateWidth") *
                          value("s_templateHeight");
    return search < most && full * value("s_candidateNum") < most && full < 4e5;
}

// A border for a side; half of them small enough that templates find placements.
int32_t RandomBound(SimRandom& random, int32_t side) {
    return random.Chance(50) ? random.Range(0, side / 3) : RandomLength(random, side / 2);
}

void DrawTiles(SimRandom& random, FrameSize size, ParamBlock& params) {
    const auto set = [&params](const char* name, int32_t value) {
        ParamValue(params, name) = value;
    };
    const int32_t bound = RandomBound(random, std::min(size.width, size.height));
    SetTiles(params, size, bound, random.Chance(30) ? random.Below(2) : random.Range(0, 20));
    if (random.Chance(30)) {
        const int32_t boundHeight = RandomBound(random, size.height);
        set("s_boundHeight", boundHeight);
        set("s_centerHeight", size.height - 2 * boundHeight);
        set("s_gapHeight", random.Range(0, random.Chance(10) ? 90 : 20));
    }
    if (random.Chance(6))
        set("s_centerWidth", std::max(size.width - 2 * bound + random.Range(-3, 3), 0));
    const TemplateSize tplt = RandomTemplate(random, size, bound);
    set("s_templateWidth", tplt.width);
    set("s_templateHeight", tplt.height);
    set("s_multiBloclkFlag", random.Chance(60) ? 1 : 0);
    set("s_candidateNum", random.Chance(30) ? random.Range(1, 6) : random.Range(1, 200));
}

}  // namespace

void SetTiles(ParamBlock& params, FrameSize size, int32_t bound, int32_t gap) {
    ParamValue(params, "s_blockWidthFp") = size.width;
    ParamValue(params, "s_blockHeightFp") = size.height;
    ParamValue(params, "s_blockColNumFp") = 1;
    ParamValue(params, "s_blockRowNumFp") = 1;
    ParamValue(params, "s_boundWidth") = bound;
    ParamValue(params, "s_boundHeight") = bound;
    ParamValue(params, "s_centerWidth") = size.width - 2 * bound;
    ParamValue(params, "s_centerHeight") = size.height - 2 * bound;
    ParamValue(params, "s_gapWidth") = gap;
    ParamValue(params, "s_gapHeight") = gap;
}

void DrawSearch(SimRandom& random, FrameSize size, double most, ParamBlock& params) {
    do {
        DrawTiles(random, size, params);
    } while (!CheapSearch(params, most));
}

ParamBlock RandomSearchParams(SimRandom& random, FrameSize size) {
    ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    DrawSearch(random, size, 1e6, params);
    const auto set = [&params](const char* name, int32_t value) {
        ParamValue(params, name) = value;
    };
    set("s_overlapAreaMinFp", RandomThreshold(random, -1, static_cast<int32_t>(size.Pixels())));
    if (random.Chance(60))
        set("s_overlapAreaMinFp", random.Range(-1, 40));
    set("s_diffThresholdStr", RandomThreshold(random, 0, 60));
    set("s_singleMoveThreshold", RandomThreshold(random, 0, 6));
    set("s_dimensionlessFlag", random.Chance(30) ? 1 : 0);
    set("s_sensorWidth", RandomThreshold(random, 1, 200));
    set("s_downSampleFlag", random.Chance(20) ? 1 : 0);
    set("s_logShowFlag", 0);
    return params;
}

void SearchClasses::Note(const ParamBlock& params) {
    const auto value = [&params](const char* name) { return ParamValue(params, name); };
    const int32_t width = value("s_templateWidth");
    const int32_t height = value("s_templateHeight");
    const int32_t rows = value("s_centerHeight") - height + 1;
    const int32_t columns =
        value("s_boundHeight") + value("s_centerWidth") - width - value("s_boundWidth") + 1;
    m_words.NoteWidth(value("s_blockWidthFp"));
    m_pieces.Note(width <= 16 && width * height <= 64 ? 0 : 1);
    m_blocks.Note(rows <= 16 && columns <= 16 ? 0 : 1);
    const bool gaps = value("s_gapWidth") > 0 || value("s_gapHeight") > 0;
    m_tiled.Note(value("s_multiBloclkFlag") != 1 ? 0 : (gaps ? 2 : 1));
}

void SearchClasses::ExpectAll() const {
    m_words.ExpectAll();
    m_pieces.ExpectAll();
    m_blocks.ExpectAll();
    m_tiled.ExpectAll();
}

}  // namespace fpnavi_test
