// Contact, grey levels, block order and zone registers of the simulated sensor.
#include "simulator/Frame.h"

#include "parameters/ParamTable.h"

namespace host {
namespace {

constexpr uint32_t kRoughBits = 7;  // the edge of the contact wanders over 2^7 / 16 = 8 pixels
constexpr int32_t kRoughDivisor = 2560;
constexpr int32_t kZones = 8;         // cells of the double-scan map per side
constexpr int32_t kZoneProbes = 4;    // contact is probed at 4 x 4 points of a cell
constexpr int32_t kFlipPercent = 10;  // of the cells that are about half covered

// Physical positions of a row or column of tiles: border, gap, centre, gap, border.
std::vector<int32_t> TilePositions(int32_t border, int32_t gap, int32_t centre) {
    std::vector<int32_t> positions;
    for (int32_t i = 0; i < centre + 2 * border; ++i) {
        const int32_t gaps = (i >= border ? 1 : 0) + (i >= border + centre ? 1 : 0);
        positions.push_back(i + gaps * gap);
    }
    return positions;
}

// Pressure flattens the tip: the contact area, not its diameter, grows evenly.
int32_t PressedAxis(int32_t semi16, int32_t pressure) {
    return semi16 * static_cast<int32_t>(SquareRoot(static_cast<uint64_t>(pressure) * 256)) / 256;
}

// Fixed pattern of so many pixels in rows of width: each row, column and block of 8 x 4 is a little
// off.
std::vector<int32_t> PatternOf(const GreyModel& model, size_t pixels, size_t width) {
    const auto level = [&model](uint64_t key) {
        return static_cast<int32_t>(Mix64(model.patternSeed + key) >> 56) - 128;
    };
    std::vector<int32_t> columns;
    for (uint64_t column = 0; column < width; ++column)
        columns.push_back(level(column));
    std::vector<int32_t> pattern;
    pattern.reserve(pixels);
    for (uint64_t row = 0; row * width < pixels; ++row) {
        const int32_t rowLevel = level(1000 + row);
        int32_t block = 0;
        for (uint64_t column = 0; column < width; ++column) {
            if (column % 8 == 0)
                block = level(100000 + row / 4 * 100 + column / 8);
            const int32_t off = columns[static_cast<size_t>(column)] + rowLevel + block;
            pattern.push_back(off * model.pattern / 256);
        }
    }
    return pattern;
}

// Contact of a cell of the zone map in 1/255 of its area.
int32_t ZoneContact(const PressedPatch& pressed, const FingerState& finger,
                    const SensorWindow& window, int32_t column, int32_t row) {
    int32_t sum = 0;
    for (int32_t probe = 0; probe < kZoneProbes * kZoneProbes; ++probe) {
        const int32_t u = column * kZoneProbes + probe % kZoneProbes;
        const int32_t v = row * kZoneProbes + probe / kZoneProbes;
        const int32_t x16 = (2 * u + 1) * window.width * kSubPixels / (2 * kZones * kZoneProbes);
        const int32_t y16 = (2 * v + 1) * window.height * kSubPixels / (2 * kZones * kZoneProbes);
        sum +=
            pressed.At(x16 - window.width * 8 - finger.x16, y16 - window.height * 8 - finger.y16);
    }
    return sum / (kZoneProbes * kZoneProbes);
}

}  // namespace

SensorWindow SensorWindow::Of(const ParamBlock& params) {
    SensorWindow window;
    const Geometry geometry = GeometryOf(params);
    const bool tiled =
        ParamValue(params, "s_modeFlag") != 1 && ParamValue(params, "s_multiBloclkFlag") == 1;
    window.columns =
        tiled ? TilePositions(ParamValue(params, "s_boundWidth"), ParamValue(params, "s_gapWidth"),
                              ParamValue(params, "s_centerWidth"))
              : TilePositions(0, 0, geometry.Width());
    window.rows = tiled ? TilePositions(ParamValue(params, "s_boundHeight"),
                                        ParamValue(params, "s_gapHeight"),
                                        ParamValue(params, "s_centerHeight"))
                        : TilePositions(0, 0, geometry.Height());
    window.width = window.columns.back() + 1;
    window.height = window.rows.back() + 1;
    return window;
}

PressedPatch::PressedPatch(const ContactPatch& patch, int32_t pressure)
    : m_patch(patch),
      m_semiX(PressedAxis(patch.semiX16, pressure)),
      m_semiY(PressedAxis(patch.semiY16, pressure)),
      m_semi(m_semiX < m_semiY ? m_semiX : m_semiY) {
    if (m_semi < 1)
        return;
    constexpr int32_t kFarRadius = 1300;
    const int32_t wander = 128 * (m_semi + patch.edge16) / kRoughDivisor;  // the greatest
    int32_t radius = 0;
    while (radius <= kFarRadius && SmoothDepth(radius) - wander >= patch.edge16)
        ++radius;
    m_fullBelow = int64_t{radius} * radius;
    while (radius <= kFarRadius && SmoothDepth(radius) + wander > 0)
        ++radius;
    const int64_t none = int64_t{radius} * radius;
    constexpr int64_t kFar = int64_t{kFarRadius} * kFarRadius + 1;
    m_noneFrom = none < kFar ? none : kFar;
}

int32_t PressedPatch::At(int32_t x16, int32_t y16) const {
    if (m_noneFrom == 0)
        return 0;
    // Radius in 1/1024 of the ellipse; most points need no root.
    const int64_t x = x16 * 1024 / m_semiX;
    const int64_t y = y16 * 1024 / m_semiY;
    const int64_t square = x * x + y * y;
    if (square >= m_noneFrom)
        return 0;
    if (square < m_fullBelow)
        return 255;
    const auto radius = static_cast<int32_t>(SquareRoot(static_cast<uint64_t>(square)));
    // The edge wanders by up to an eighth of its own width and a twentieth of the radius.
    const int32_t rough = LatticeNoise(m_patch.roughSeed, x16, y16, kRoughBits);
    const int32_t depth16 = SmoothDepth(radius) + rough * (m_semi + m_patch.edge16) / kRoughDivisor;
    return ClampTo(depth16 * 255 / m_patch.edge16, 0, 255);
}

std::vector<SkinPoint> SenseSkin(Skin& skin, const ContactPatch& patch, const FingerState& finger,
                                 const SensorWindow& window) {
    const PressedPatch pressed(patch, finger.pressure);
    std::vector<SkinPoint> points;
    points.reserve(window.rows.size() * window.columns.size());
    for (const int32_t row : window.rows) {
        for (const int32_t column : window.columns) {
            const int32_t x16 = (2 * column + 1 - window.width) * 8 - finger.x16;
            const int32_t y16 = (2 * row + 1 - window.height) * 8 - finger.y16;
            SkinPoint point;
            point.contact = static_cast<uint8_t>(pressed.At(x16, y16));
            if (point.contact > 0) {
                const int32_t skinX16 = x16 - x16 * finger.stretchX / 1024;
                const int32_t skinY16 = y16 - y16 * finger.stretchY / 1024;
                point.height = static_cast<uint8_t>(skin.HeightAt(skinX16, skinY16));
            }
            points.push_back(point);
        }
    }
    return points;
}

int32_t GreyOf(const GreyModel& model, SkinPoint point) {
    const int32_t skin = model.valley + (model.ridge - model.valley) * point.height / 255;
    const int32_t gained = 128 + (skin - 128) * model.gain256 / 256;
    return model.background + (gained - model.background) * point.contact / 255;
}

std::vector<uint8_t> MakeGreys(const GreyModel& model, const std::vector<SkinPoint>& points,
                               int32_t width, int32_t offset, SimRandom& random) {
    const std::vector<int32_t> pattern =
        PatternOf(model, points.size(), static_cast<size_t>(width));
    std::vector<uint8_t> greys(points.size());
    for (size_t i = 0; i < points.size(); ++i) {
        const int32_t grey =
            GreyOf(model, points[i]) + offset + pattern[i] + random.Noise(model.noise16);
        greys[i] = static_cast<uint8_t>(ClampTo(grey, 0, 255));
    }
    return greys;
}

std::vector<uint8_t> ToBlockOrder(const std::vector<uint8_t>& picture, const Geometry& geometry) {
    std::vector<uint8_t> raw;
    raw.reserve(picture.size());
    for (int32_t block = 0; block < geometry.blockColNum * geometry.blockRowNum; ++block) {
        const int32_t row0 = block / geometry.blockColNum * geometry.blockHeight;
        const int32_t column0 = block % geometry.blockColNum * geometry.blockWidth;
        for (int32_t row = row0; row < row0 + geometry.blockHeight; ++row) {
            const auto start = picture.begin() + row * geometry.Width() + column0;
            raw.insert(raw.end(), start, start + geometry.blockWidth);
        }
    }
    return raw;
}

std::vector<uint8_t> FromBlockOrder(const std::vector<uint8_t>& raw, const Geometry& geometry) {
    std::vector<uint8_t> picture(raw.size());
    const int32_t blockSize = geometry.blockHeight * geometry.blockWidth;
    for (int32_t row = 0; row < geometry.Height(); ++row) {
        for (int32_t column = 0; column < geometry.Width(); ++column) {
            const int32_t block =
                row / geometry.blockHeight * geometry.blockColNum + column / geometry.blockWidth;
            const int32_t inside =
                row % geometry.blockHeight * geometry.blockWidth + column % geometry.blockWidth;
            picture[static_cast<size_t>(row * geometry.Width() + column)] =
                raw[static_cast<size_t>(block * blockSize + inside)];
        }
    }
    return picture;
}

ZoneRegisters SenseZones(const ContactPatch& patch, const FingerState& finger,
                         const SensorWindow& window, SimRandom& random) {
    const PressedPatch pressed(patch, finger.pressure);
    ZoneRegisters registers;
    for (int32_t row = 0; row < kZones; ++row) {
        for (int32_t column = 0; column < kZones; ++column) {
            const int32_t contact = ZoneContact(pressed, finger, window, column, row);
            bool covered = contact > 127;
            if (contact > 90 && contact < 165 && random.Chance(kFlipPercent))
                covered = !covered;
            const int32_t bit = 31 - 8 * (row % 4) - column;
            (row < 4 ? registers.reg28 : registers.reg24) |= (covered ? 1U : 0U) << bit;
        }
    }
    return registers;
}

}  // namespace host
