// Parameters: mostly what a sensor could have, one in ten odd. Frames: mostly ridges that move.
#include "GeometryDraw.h"

#include <algorithm>

#include "DrawnFrames.h"
#include "Reference.h"
#include "Steps.h"
#include "param/NaviLimits.h"
#include "parameters/ParamTable.h"
#include "simulator/Arithmetic.h"

namespace bench {
namespace {

using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

constexpr int64_t kWorkMax = 25000000;   // comparisons of a pair: some 100 ms of the plain model
constexpr int64_t kWorkSmall = 2000000;  // up to here a draw has several pairs
constexpr size_t kPairs = 4;
constexpr int32_t kOddPercent = 10;

struct Sides {
    int32_t width;
    int32_t height;
};

int32_t DrawSide(SimRandom& random) {
    const int32_t share = random.Below(100);
    return random.Range(16, share < 60 ? 128 : (share < 90 ? 256 : 512));
}

// Borders and centre of one axis. Odd ones reach beyond half of the side, or leave pixels out.
void DrawTiles(SimRandom& random, int32_t side, const std::string& axis, ParamBlock* params) {
    int32_t border = random.Range(0, std::min(side / 3, 24));
    int32_t centre = side - 2 * border;
    if (random.Chance(kOddPercent)) {
        border = random.Chance(30) ? 0 : random.Range(0, side);
        centre = std::max(random.Chance(50) ? side - 2 * border : random.Range(1, side), 0);
    }
    ParamValue(*params, "s_bound" + axis) = border;
    ParamValue(*params, "s_center" + axis) = centre;
    ParamValue(*params, "s_gap" + axis) = random.Chance(30) ? 0 : random.Range(0, 40);
}

void DrawTemplate(SimRandom& random, ParamBlock* params) {
    int32_t& width = ParamValue(*params, "s_templateWidth");
    int32_t& height = ParamValue(*params, "s_templateHeight");
    const int32_t share = random.Below(100);
    if (share < 10) {
        width = height = 1;
    } else if (share < 20) {  // as large as the centre allows, turned too
        width = height = std::max(1, std::min(ParamValue(*params, "s_centerWidth"),
                                              ParamValue(*params, "s_centerHeight")));
    } else if (share < 70) {
        width = random.Range(3, 24);
        height = random.Range(2, 16);
    }
}

void DrawSearch(SimRandom& random, int32_t pixels, ParamBlock* params) {
    if (random.Chance(60))
        ParamValue(*params, "s_candidateNum") = random.Range(1, random.Chance(50) ? 500 : 5000);
    if (random.Chance(40)) {
        const int32_t most = random.Chance(50) ? 4 : 20;
        ParamValue(*params, "s_smallMoveTolCol") = random.Range(0, most);
        ParamValue(*params, "s_smallMoveTolRow") = random.Range(0, most);
    }
    if (random.Chance(20))
        ParamValue(*params, "s_overlapAreaMinFp") = random.Range(0, pixels);
}

ParamBlock DrawParams(SimRandom& random) {
    const bool hg = random.Chance(8);
    const Sides sides = {DrawSide(random), DrawSide(random)};
    ParamBlock params = ParamsOf({sides.width, sides.height, hg ? Layout::Hg : Layout::Tiled});
    if (hg)
        return params;
    ParamValue(params, "s_multiBloclkFlag") = random.Chance(70) ? 1 : 0;
    DrawTiles(random, sides.width, "Width", &params);
    DrawTiles(random, sides.height, "Height", &params);
    if (random.Chance(60))  // equal borders, as on most sensors
        ParamValue(params, "s_boundHeight") =
            std::min(ParamValue(params, "s_boundWidth"), (sides.height - 1) / 2);
    if (ParamValue(params, "s_multiBloclkFlag") == 1 && !random.Chance(kOddPercent))
        ParamValue(params, "s_centerHeight") =
            std::max(sides.height - 2 * ParamValue(params, "s_boundHeight"), 1);
    DrawTemplate(random, &params);
    DrawSearch(random, sides.width * sides.height, &params);
    return params;
}

// Comparisons of two bytes that the plain model takes at most; both sides have the parameters.
int64_t WorkOfPair() {
    const auto product = [](int64_t a, int64_t b) { return a * b; };
    const int64_t pixels = product(reference::s_imageWidth, reference::s_imageHeight);
    if (reference::s_modeFlag == 1)
        return pixels;
    const int64_t matched = reference::s_multiBloclkFlag == 1
                                ? product(reference::s_fullImageWidth, reference::s_fullImageHeight)
                                : pixels;
    const int64_t placements = product(reference::s_centerWidth, reference::s_centerHeight);
    const int64_t tpltSize = product(reference::s_templateWidth, reference::s_templateHeight);
    const int64_t shifts =
        product(2 * reference::s_smallMoveTolRow + 1, 2 * reference::s_smallMoveTolCol + 1);
    return reference::s_candidateNum * matched + placements * tpltSize * reference::s_tpltNum +
           shifts * pixels;
}

// What the plain model does with the pair.
std::string OutcomeOf(const FramePair& pair) {
    reference::FpNaviClear();
    for (const Frame* const frame : {&pair.first, &pair.second}) {
        if (reference::OrientationCalc(frame->image.data(), frame->image.data(), 0) != 0)
            return "refused";
    }
    if (reference::s_voteInfo.calc_cnt == 0)
        return "not counted";
    if (reference::s_modeFlag == 1)
        return "hg";
    const reference::NaviFrame_t& prev = reference::s_imagePrev;
    const reference::NaviFrame_t& curr = reference::s_imageCurr;
    const int32_t moved = reference::FingerNoMove(&prev, &curr);
    if (moved != reference::kFingerMoved)
        return moved == reference::kFingerNoMove ? "resting" : "undecided";
    return std::min(prev.cvr, curr.cvr) < reference::s_coverageMinFp ? "thin" : "matched";
}

// The parameters that the size does not imply.
std::string TextOf(const ParamBlock& params, const std::string& frames) {
    const host::Geometry geometry = host::GeometryOf(params);
    const ParamBlock usual = host::DefaultParams();
    std::string text =
        std::to_string(geometry.Width()) + "x" + std::to_string(geometry.Height()) + " " + frames;
    for (size_t i = 0; i < params.size(); ++i) {
        const std::string name = host::ParamTable()[i].name;
        if (params[i] != usual[i] && name.rfind("s_block", 0) != 0)
            text += " " + name + "=" + std::to_string(params[i]);
    }
    return text;
}

// Sets both sides' parameters; false when the draw is not worth its time.
bool Acceptable(const ParamBlock& params) {
    SetBothParams(params.data());
    return fpnavi::GestureGeometryUsable() &&
           (reference::s_modeFlag == 1 || fpnavi::PairWorkAcceptable()) && WorkOfPair() <= kWorkMax;
}

}  // namespace

GeometryDraw DrawGeometry(uint64_t seed, uint64_t number) {
    SimRandom random(host::Mix64(host::Mix64(seed) + number));
    GeometryDraw draw;
    draw.number = number;
    for (;;) {
        const ParamBlock params = DrawParams(random);
        if (!Acceptable(params))
            continue;
        const DrawnFrames frames(params, random);
        draw.set.pairs.assign(1, frames.Next(random));
        draw.outcome = OutcomeOf(draw.set.pairs.front());
        if (draw.outcome != "matched" && draw.outcome != "hg" && !random.Chance(kOddPercent))
            continue;
        while (draw.set.pairs.size() < kPairs && WorkOfPair() <= kWorkSmall)
            draw.set.pairs.push_back(frames.Next(random));
        std::copy(params.begin(), params.end(), draw.set.params);
        draw.text = TextOf(params, frames.Name());
        return draw;
    }
}

}  // namespace bench
