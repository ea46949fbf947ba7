#include "RandomGesture.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <limits>
#include <string>

#include "StepSearchParams.h"

namespace fpnavi_test {
namespace {

using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

// What SetNaviParam derives sizes from; drawing them anew makes another sensor.
constexpr const char* kGeometryNames[] = {
    "s_modeFlag",      "s_blockWidthHg",  "s_blockHeightHg",  "s_blockColNumHg",
    "s_blockRowNumHg", "s_imageWidthHg",  "s_imageHeightHg",  "s_blockWidthFp",
    "s_blockHeightFp", "s_blockColNumFp", "s_blockRowNumFp",  "s_centerWidth",
    "s_centerHeight",  "s_boundWidth",    "s_boundHeight",    "s_gapWidth",
    "s_gapHeight",     "s_templateWidth", "s_templateHeight", "s_multiBloclkFlag",
    "s_candidateNum",  "s_logShowFlag",
};

bool IsGeometry(const char* name) {
    return std::any_of(std::begin(kGeometryNames), std::end(kGeometryNames),
                       [name](const char* other) { return std::string_view(name) == other; });
}

int32_t Around(SimRandom& random, int32_t value) {
    switch (random.Below(4)) {
        case 0:
            return random.Range(-1, 4);
        case 1:
            return value + random.Range(-2, 2);
        case 2:
            return value + value * random.Range(-50, 50) / 100;
        default:
            return random.Range(0, 120);
    }
}

void SetFlags(SimRandom& random, ParamBlock& params) {
    ParamValue(params, "s_logShowFlag") = random.Below(2);
    ParamValue(params, "s_dimensionlessFlag") = random.Chance(30) ? 1 : 0;
    ParamValue(params, "s_sensorBackFlag") = random.Chance(30) ? 1 : 0;
    ParamValue(params, "s_directionControlFlag") = random.Below(4);
    ParamValue(params, "s_multiBloclkFlag") = random.Chance(25) ? 0 : 1;
}

}  // namespace

ParamBlock VariedParams(SimRandom& random, host::Mode mode) {
    ParamBlock params = host::ParamsForMode(mode, random.Chance(30));
    for (size_t i = 0; i < params.size(); ++i) {
        if (!IsGeometry(host::ParamTable()[i].name) && random.Chance(16))
            params[i] = Around(random, params[i]);
    }
    SetFlags(random, params);
    if (random.Chance(20))
        ParamValue(params, "s_candidateNum") = random.Range(1, 150);
    return params;
}

namespace {

// Half of a pair's comparisons that the plain model may take; a frame of 200 x 200 takes 40,000 for
// one candidate.
constexpr double kMostCompared = 3e5;
constexpr int32_t kLargestSide = 200;

FrameSize SensorSize(SimRandom& random) {
    if (random.Chance(1))
        return {random.Range(130, kLargestSide), random.Range(130, kLargestSide)};
    if (random.Chance(30))
        return {random.Range(1, 24), random.Range(1, 24)};
    return RandomSize(random);
}

// A divisor of side.
int32_t BlockSide(SimRandom& random, int32_t side) {
    int32_t block = random.Range(1, side);
    while (side % block != 0)
        --block;
    return block;
}

void SetSensor(SimRandom& random, host::Mode mode, FrameSize size, ParamBlock& params) {
    const std::string suffix = mode == host::Mode::Hg ? "Hg" : "Fp";
    const int32_t blockWidth = BlockSide(random, size.width);
    const int32_t blockHeight = BlockSide(random, size.height);
    ParamValue(params, "s_blockWidth" + suffix) = blockWidth;
    ParamValue(params, "s_blockHeight" + suffix) = blockHeight;
    ParamValue(params, "s_blockColNum" + suffix) = size.width / blockWidth;
    ParamValue(params, "s_blockRowNum" + suffix) = size.height / blockHeight;
    ParamValue(params, "s_imageWidthHg") = size.width;
    ParamValue(params, "s_imageHeightHg") = size.height;
}

// Tiles and templates of size, without another grid of blocks.
void SetTilesOfSensor(SimRandom& random, FrameSize size, ParamBlock& params) {
    ParamBlock drawn = params;
    DrawSearch(random, size, kMostCompared, drawn);
    for (const char* const name : {"s_centerWidth", "s_centerHeight", "s_boundWidth",
                                   "s_boundHeight", "s_gapWidth", "s_gapHeight", "s_templateWidth",
                                   "s_templateHeight", "s_multiBloclkFlag", "s_candidateNum"})
        ParamValue(params, name) = ParamValue(drawn, name);
    if (random.Chance(4))
        ParamValue(params, "s_boundWidth") = random.Range(-1, size.width + 1);
    if (random.Chance(4))
        ParamValue(params, "s_boundHeight") = random.Range(-1, size.height + 1);
    ParamValue(params, "s_overlapAreaMinFp") = random.Range(-1, 60);
    ParamValue(params, "s_overlapAreaMinNoMove") = random.Range(-1, 60);
}

}  // namespace

ParamBlock OtherGeometryParams(SimRandom& random, host::Mode mode) {
    ParamBlock params = VariedParams(random, mode);
    const FrameSize size = SensorSize(random);
    SetSensor(random, mode, size, params);
    SetTilesOfSensor(random, size, params);
    return params;
}

ParamBlock SameSensorParams(SimRandom& random, const ParamBlock& params) {
    ParamBlock changed = params;
    for (size_t i = 0; i < changed.size(); ++i) {
        if (!IsGeometry(host::ParamTable()[i].name) && random.Chance(16))
            changed[i] = Around(random, changed[i]);
    }
    SetFlags(random, changed);
    if (random.Chance(50))
        SetTilesOfSensor(random, PictureSize(params), changed);
    return changed;
}

FrameSize PictureSize(const ParamBlock& params) {
    constexpr int32_t kMostSide = 4096;
    constexpr int32_t kMostPixels = 1 << 16;
    const host::Geometry geometry = host::GeometryOf(params);
    for (const int32_t factor :
         {geometry.blockWidth, geometry.blockColNum, geometry.blockHeight, geometry.blockRowNum}) {
        if (factor < 1 || factor > kMostSide)
            return {64, 64};
    }
    const bool fits = int64_t{geometry.Width()} * geometry.Height() <= kMostPixels;
    return fits ? FrameSize{geometry.Width(), geometry.Height()} : FrameSize{64, 64};
}

int32_t RandomFrameCount(SimRandom& random, FrameSize size) {
    const size_t pixels = size.Pixels();
    if (pixels > 10000)
        return random.Range(2, 3);
    if (pixels > 3000)
        return random.Range(2, 6);
    return random.Chance(1) ? 110 : random.Range(2, 12);
}

ParamBlock HostileParams(SimRandom& random, host::Mode mode) {
    constexpr int32_t kBoundaries[] = {
        std::numeric_limits<int32_t>::min(), -1, 0, 1, 2, 127, 255, 256, 4096, 4097, 65536,
        std::numeric_limits<int32_t>::max()};
    ParamBlock params =
        random.Chance(50) ? VariedParams(random, mode) : OtherGeometryParams(random, mode);
    for (size_t i = 0; i < params.size(); ++i) {
        if (std::string_view(host::ParamTable()[i].name) != "s_modeFlag" && random.Chance(8))
            params[i] = random.Chance(30) ? params[i] + random.Range(-1, 1)
                                          : kBoundaries[random.Below(std::size(kBoundaries))];
    }
    return params;
}

namespace {

// Byte comparisons of the search at most: four wide templates and four tall ones.
double SearchWork(const ParamBlock& params) {
    const auto value = [&params](const char* name) {
        return static_cast<double>(ParamValue(params, name));
    };
    const double width = std::max(value("s_templateWidth"), 0.0);
    const double height = std::max(value("s_templateHeight"), 0.0);
    const double rows = value("s_centerHeight") + 1;
    const double columns =
        value("s_boundHeight") + value("s_centerWidth") - value("s_boundWidth") + 1;
    const auto placements = [rows, columns](double w, double h) {
        return std::max(rows - h, 0.0) * std::max(columns - w, 0.0);
    };
    return 4 * (placements(width, height) + placements(height, width)) * width * height;
}

}  // namespace

bool CheapEnough(const ParamBlock& params) {
    const auto value = [&params](const char* name) {
        return static_cast<double>(ParamValue(params, name));
    };
    const host::Geometry geometry = host::GeometryOf(params);
    const double image = static_cast<double>(geometry.blockWidth) * geometry.blockColNum *
                         geometry.blockHeight * geometry.blockRowNum;
    const double full =
        (value("s_centerWidth") + 2 * (value("s_gapWidth") + value("s_boundWidth"))) *
        (value("s_centerHeight") + 2 * (value("s_gapHeight") + value("s_boundHeight")));
    const double match = value("s_candidateNum") * std::max(image, full);
    const double shifts =
        (2 * value("s_smallMoveTolRow") + 1) * (2 * value("s_smallMoveTolCol") + 1) * image;
    constexpr double kCheap = 4e6;
    constexpr double kRefused = 268435456;  // 2^28
    const double work = match + shifts + SearchWork(params);
    return work < kCheap || work > 4 * kRefused;
}

MovingPicture::MovingPicture(uint64_t seed, int32_t width, int32_t height)
    : m_random(seed), m_seed(seed), m_width(width), m_height(height) {
    m_style = m_random.Below(6);
    m_shape = m_random.Below(4);
    m_period = m_random.Range(3, 12);
    m_slope = m_random.Range(-8, 8);
    m_background = m_random.Chance(80) ? m_random.Range(200, 255) : m_random.Range(0, 255);
    m_noise = m_random.Chance(50) ? m_random.Range(0, 12) : 0;
    const int32_t reach = m_random.Chance(30) ? 0 : (m_random.Chance(80) ? 6 : 20);
    m_dx = m_random.Range(-reach, reach);
    m_dy = m_random.Range(-reach, reach);
    m_size = m_random.Range(20, 110);
}

uint8_t MovingPicture::GreyAt(int32_t column, int32_t row) const {
    const int64_t x = int64_t{column} + m_x + 1000;
    const int64_t y = int64_t{row} + m_y + 1000;
    const uint64_t place = static_cast<uint64_t>(y) << 32 | static_cast<uint64_t>(x);
    const uint64_t hash = host::Mix64(place ^ m_seed);
    const int64_t phase = (8 * x + m_slope * y + static_cast<int64_t>(hash % 5)) / 8;
    const int32_t wave = static_cast<int32_t>(((phase % m_period) + m_period) % m_period);
    switch (m_style) {
        case 0:
            return static_cast<uint8_t>(hash & 0xFFU);
        case 1:
            return (hash & 1U) != 0 ? 255 : 0;
        case 2:
            return static_cast<uint8_t>(m_seed & 0xFFU);
        case 3:
            return static_cast<uint8_t>((hash & 3U) == 0 ? 10 : 200);
        default:
            return static_cast<uint8_t>(40 + 160 * wave / m_period +
                                        static_cast<int32_t>(hash % 9));
    }
}

bool MovingPicture::InFinger(int32_t column, int32_t row) const {
    const int64_t dx = 2 * int64_t{column} - m_width - (m_shape == 3 ? 2 * m_x : 0);
    const int64_t dy = 2 * int64_t{row} - m_height - (m_shape == 3 ? 2 * m_y : 0);
    const int64_t width = int64_t{m_width} * m_size / 100 + 1;
    const int64_t height = int64_t{m_height} * m_size / 100 + 1;
    switch (m_shape) {
        case 0:
            return true;
        case 1:
            return std::abs(dx) < width && std::abs(dy) < height;
        default:
            return dx * dx * height * height + dy * dy * width * width <
                   width * width * height * height;
    }
}

std::vector<uint8_t> MovingPicture::Next() {
    std::vector<uint8_t> image(static_cast<size_t>(m_width) * static_cast<size_t>(m_height));
    if (m_random.Chance(20)) {
        m_dx += m_random.Range(-2, 2);
        m_dy += m_random.Range(-2, 2);
    }
    m_x += m_dx;
    m_y += m_dy;
    const bool empty = m_random.Chance(4);
    size_t at = 0;
    for (int32_t row = 0; row < m_height; ++row) {
        for (int32_t column = 0; column < m_width; ++column) {
            int32_t grey = m_background;
            if (!empty && InFinger(column, row))
                grey = GreyAt(column, row);
            if (m_noise > 0)
                grey += m_random.Range(-m_noise, m_noise);
            image[at++] = static_cast<uint8_t>(std::clamp(grey, 0, 255));
        }
    }
    return image;
}

}  // namespace fpnavi_test
