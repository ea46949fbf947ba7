#include "RandomGesture.h"

#include <algorithm>
#include <cstdlib>
#include <iterator>
#include <limits>

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

ParamBlock OtherGeometryParams(SimRandom& random, host::Mode mode) {
    ParamBlock params = VariedParams(random, mode);
    const char* const suffix = mode == host::Mode::Hg ? "Hg" : "Fp";
    const auto set = [&params](const std::string& name, int32_t value) {
        ParamValue(params, name) = value;
    };
    const int32_t blockWidth = random.Range(1, 9);
    const int32_t blockHeight = random.Range(1, 9);
    const int32_t colNum = random.Range(1, 8);
    const int32_t rowNum = random.Range(1, 10);
    set(std::string("s_blockWidth") + suffix, blockWidth);
    set(std::string("s_blockHeight") + suffix, blockHeight);
    set(std::string("s_blockColNum") + suffix, colNum);
    set(std::string("s_blockRowNum") + suffix, rowNum);
    const int32_t width = blockWidth * colNum;
    const int32_t height = blockHeight * rowNum;
    set("s_imageWidthHg", width);
    set("s_imageHeightHg", height);
    const int32_t boundWidth = random.Range(0, width / 2);
    const int32_t boundHeight =
        random.Chance(50) ? std::min(boundWidth, height / 2) : random.Range(0, height / 2);
    set("s_boundWidth", boundWidth);
    set("s_boundHeight", boundHeight);
    const int32_t mismatch = random.Chance(12) ? random.Range(-3, 3) : 0;
    set("s_centerWidth", width - 2 * boundWidth + mismatch);
    set("s_centerHeight", height - 2 * boundHeight);
    set("s_gapWidth", random.Range(0, 20));
    set("s_gapHeight", random.Range(0, 20));
    set("s_templateWidth", random.Range(1, 12));
    set("s_templateHeight", random.Range(1, 8));
    set("s_candidateNum", random.Range(1, 60));
    set("s_overlapAreaMinFp", random.Range(-1, 60));
    set("s_overlapAreaMinNoMove", random.Range(-1, 60));
    return params;
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
    const double work = match + shifts;
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
