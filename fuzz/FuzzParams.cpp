#include "FuzzParams.h"

#include <limits>
#include <string>

#include "param/NaviParam.h"

namespace fpnavi_fuzz {
namespace {

using host::ParamBlock;
using host::ParamValue;

constexpr int32_t kBoundaries[] = {std::numeric_limits<int32_t>::min(),
                                   -65536,
                                   -256,
                                   -1,
                                   0,
                                   1,
                                   2,
                                   63,
                                   64,
                                   65,
                                   127,
                                   128,
                                   255,
                                   256,
                                   4096,
                                   4097,
                                   32768,
                                   65536,
                                   65537,
                                   1 << 30,
                                   std::numeric_limits<int32_t>::max()};

host::Mode PickMode(ByteSource& source) {
    constexpr host::Mode kModes[] = {host::Mode::Fp, host::Mode::Fp, host::Mode::Hg};
    const host::Mode mode = source.Pick(kModes);
    return kDoubleScan ? host::Mode::DoubleScan : mode;
}

// A sensor of a few hundred pixels at most, so that a run takes little time.
void MakeSmall(ByteSource& source, ParamBlock& params) {
    const bool hg = ParamValue(params, "s_modeFlag") == 1;
    const std::string suffix = hg ? "Hg" : "Fp";
    const auto draw = [&](const std::string& name, int32_t low, int32_t high) {
        return ParamValue(params, name) = source.Range(low, high);
    };
    const int32_t width =
        draw("s_blockWidth" + suffix, 1, 8) * draw("s_blockColNum" + suffix, 1, 5);
    const int32_t height =
        draw("s_blockHeight" + suffix, 1, 8) * draw("s_blockRowNum" + suffix, 1, 4);
    ParamValue(params, "s_imageWidthHg") = width;
    ParamValue(params, "s_imageHeightHg") = height;
    const int32_t boundWidth = draw("s_boundWidth", 0, width / 2);
    const int32_t boundHeight = draw("s_boundHeight", 0, height / 2);
    ParamValue(params, "s_centerWidth") = width - 2 * boundWidth;
    ParamValue(params, "s_centerHeight") = height - 2 * boundHeight;
    draw("s_gapWidth", 0, 12);
    draw("s_gapHeight", 0, 12);
    draw("s_templateWidth", 1, 10);
    draw("s_templateHeight", 1, 8);
    draw("s_candidateNum", 1, 40);
    draw("s_overlapAreaMinFp", 0, 40);
    draw("s_overlapAreaMinNoMove", 0, 40);
}

// The switches, each of which opens another way through the code. A zero leaves the defaults.
void SetSwitches(uint8_t bits, ParamBlock& params) {
    ParamValue(params, "s_directionControlFlag") ^= bits & 3;
    ParamValue(params, "s_sensorBackFlag") ^= bits >> 2 & 1;
    ParamValue(params, "s_dimensionlessFlag") ^= bits >> 3 & 1;
    ParamValue(params, "s_multiBloclkFlag") ^= bits >> 4 & 1;
    ParamValue(params, "s_highSensitiveMode") ^= bits >> 5 & 1;
}

int32_t WrapAdd(int32_t a, int32_t b) {
    return static_cast<int32_t>(static_cast<uint32_t>(a) + static_cast<uint32_t>(b));
}

int32_t Changed(ByteSource& source, int32_t value, bool anything) {
    const int32_t kind = source.U8() % 16;
    if (kind < 6)
        return WrapAdd(value, source.Range(-3, 3));
    if (kind < 11)
        return source.Range(-1, 120);
    if (kind < 13 || (anything && kind == 13))
        return source.Pick(kBoundaries);
    return anything ? source.I32() : source.Range(0, 1);
}

ParamBlock Make(ByteSource& source, bool anything) {
    const host::Mode mode = PickMode(source);
    const uint8_t base = source.U8();
    ParamBlock params = host::ParamsForMode(mode, (base & 1) != 0);
    ParamValue(params, "s_logShowFlag") = (base & 4) != 0 ? 1 : 0;
    if ((base & 0x18) != 0x18)
        MakeSmall(source, params);
    SetSwitches(source.U8(), params);
    const int32_t changes = source.Range(0, 12);
    for (int32_t i = 0; i < changes; ++i) {
        const size_t index = source.U8() % params.size();
        params[index] = Changed(source, params[index], anything);
    }
    return params;
}

// The mode is one of this program's.
ParamBlock InMode(ParamBlock params) {
    int32_t& mode = ParamValue(params, "s_modeFlag");
    if (mode == 2 && !kDoubleScan)
        mode = 0;
    return params;
}

double AtLeast0(double count) {
    return count > 0 ? count : 0;
}

double SearchWork(double tpltWidth, double tpltHeight) {
    using namespace fpnavi;
    const double rows = AtLeast0(double{1} + s_centerHeight - tpltHeight);
    const double columns =
        AtLeast0(double{1} + s_boundHeight + s_centerWidth - tpltWidth - s_boundWidth);
    return rows * columns * AtLeast0(tpltWidth) * AtLeast0(tpltHeight);
}

}  // namespace

ParamBlock ChangedParams(ByteSource& source) {
    ParamBlock params = InMode(Make(source, source.OneIn(8)));
    // Whatever has been changed: this program is about the double scan, or it is not.
    if (kDoubleScan)
        ParamValue(params, "s_modeFlag") = 2;
    return params;
}

ParamBlock AnyParams(ByteSource& source) {
    if (source.OneIn(8)) {
        ParamBlock params{};
        for (int32_t& value : params)
            value = source.I32();
        return InMode(params);
    }
    return InMode(Make(source, true));
}

bool PairIsCheap(double limit) {
    using namespace fpnavi;
    constexpr double kRefused = 1073741824;  // 2^30, four times what the module accepts
    const double image = AtLeast0(s_imageWidth) * AtLeast0(s_imageHeight);
    const double full = AtLeast0(s_fullImageWidth) * AtLeast0(s_fullImageHeight);
    const double shifts =
        AtLeast0(2.0 * s_smallMoveTolRow + 1) * AtLeast0(2.0 * s_smallMoveTolCol + 1) * image;
    const double match = AtLeast0(s_candidateNum) * (IsTiled() ? full : image);
    const int32_t ofEachShape = s_tpltNum / 2;
    const double search = ofEachShape * (SearchWork(s_tpltWidthUD, s_tpltHeightUD) +
                                         SearchWork(s_tpltWidthLR, s_tpltHeightLR));
    const double work = shifts + match + search;
    return IsHg() || work <= limit || work > kRefused;
}

}  // namespace fpnavi_fuzz
