#include "HostileBlocks.h"

#include <algorithm>
#include <array>
#include <cstdlib>
#include <iterator>
#include <limits>
#include <string_view>

namespace fpnavi_test {
namespace {

using host::ParamBlock;
using host::SimRandom;

// Sizes and counts: 0 of them is no sensor.
constexpr std::string_view kSizeNames[] = {
    "s_blockWidthHg",   "s_blockHeightHg", "s_blockColNumHg", "s_blockRowNumHg", "s_imageWidthHg",
    "s_imageHeightHg",  "s_sensorWidth",   "s_sensorHeight",  "s_blockWidthFp",  "s_blockHeightFp",
    "s_blockColNumFp",  "s_blockRowNumFp", "s_centerWidth",   "s_centerHeight",  "s_templateWidth",
    "s_templateHeight", "s_candidateNum",
};

// Switches with a default of 0 or 1, drawn evenly: many values matter on one side only.
constexpr std::string_view kSwitchNames[] = {
    "s_sensorBackFlag", "s_multiBloclkFlag",     "s_dimensionlessFlag", "s_downSampleFlag",
    "iDCMode",          "s_open_vkey_none_navi", "s_highSensitiveMode", "s_logShowFlag",
};

template <size_t kNum>
bool IsOneOf(const std::string_view (&names)[kNum], std::string_view name) {
    return std::find(std::begin(names), std::end(names), name) != std::end(names);
}

size_t IndexOf(std::string_view name) {
    return host::ParamIndex(name).value();
}

int32_t Sane(SimRandom& random, std::string_view name, int32_t value) {
    const bool size = IsOneOf(kSizeNames, name);
    return random.Range(size ? 1 : 0, std::max(2 * std::abs(value), 3));
}

int32_t Near(SimRandom& random, int32_t value) {
    const int32_t reach = std::abs(value) / 5;
    return value + random.Range(-reach, reach);
}

using Marks = std::array<bool, FPNAVI_PARAM_NUM>;

// Centre and borders of one axis make up the image, as far as they stand at no boundary.
void FitTiles(ParamBlock& params, const Marks& atBoundary, int32_t side, const char* boundName,
              const char* centerName) {
    const size_t bound = IndexOf(boundName);
    const size_t center = IndexOf(centerName);
    if (side < 1 || side > 4096)
        return;
    if (!atBoundary[bound])
        params[bound] = std::min(params[bound], (side - 1) / 2);
    if (!atBoundary[center] && !atBoundary[bound])
        params[center] = side - 2 * params[bound];
}

void FitSizes(ParamBlock& params, const Marks& atBoundary) {
    const host::Geometry geometry = host::GeometryOf(params);
    const auto side = [](int32_t size, int32_t number) {
        return static_cast<int32_t>(std::clamp<int64_t>(int64_t{size} * number, 0, 5000));
    };
    FitTiles(params, atBoundary, side(geometry.blockWidth, geometry.blockColNum), "s_boundWidth",
             "s_centerWidth");
    FitTiles(params, atBoundary, side(geometry.blockHeight, geometry.blockRowNum), "s_boundHeight",
             "s_centerHeight");
}

}  // namespace

std::vector<int32_t> BoundaryValues(int32_t defaultValue) {
    std::vector<int32_t> values = {
        std::numeric_limits<int32_t>::min(), -1, 0, 1, defaultValue - 1, defaultValue + 1, 255, 256,
        std::numeric_limits<int32_t>::max()};
    std::sort(values.begin(), values.end());
    values.erase(std::unique(values.begin(), values.end()), values.end());
    return values;
}

ParamBlock RandomHostileBlock(SimRandom& random, host::Mode mode) {
    constexpr int32_t kOneIn = 60;
    ParamBlock params = host::ParamsForMode(mode, random.Chance(30));
    Marks atBoundary{};
    for (size_t i = 0; i < params.size(); ++i) {
        const std::string_view name = host::ParamTable()[i].name;
        if (name == "s_modeFlag")
            continue;
        if (random.Below(kOneIn) == 0) {
            const std::vector<int32_t> values = BoundaryValues(params[i]);
            params[i] =
                values[static_cast<size_t>(random.Below(static_cast<int32_t>(values.size())))];
            atBoundary[i] = true;
        } else if (IsOneOf(kSwitchNames, name)) {
            params[i] = random.Below(2);
        } else if (random.Chance(20)) {
            params[i] = Sane(random, name, params[i]);
        } else {
            params[i] = Near(random, params[i]);
        }
    }
    FitSizes(params, atBoundary);
    return params;
}

}  // namespace fpnavi_test
