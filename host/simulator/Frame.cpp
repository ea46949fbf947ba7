// Contact, grey levels, block order and zone registers of the simulated sensor.
#include "simulator/Frame.h"

#include "parameters/ParamTable.h"

namespace host {
namespace {

constexpr uint32_t kRoughBits = 7;    // the edge of the contact wanders over 2^7 / 16 = 8 pixels
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

// Fixed pattern of a pixel: its row, its column and its block are each a little off.
int32_t PatternAt(const GreyModel& model, int32_t column, int32_t row) {
    const auto uColumn = static_cast<uint64_t>(column);
    const auto uRow = static_cast<uint64_t>(row);
    const auto level = [&model](uint64_t key) {
        return static_cast<int32_t>(Mix64(model.patternSeed + key) >> 56) - 128;
    };
    const int32_t sum =
        level(uColumn) + level(1000 + uRow) + level(100000 + uRow / 4 * 100 + uColumn / 8);
    return sum * model.pattern / 256;
}

// Contact of a cell of the zone map in 1/255 of its area.
int32_t ZoneContact(const ContactPatch& patch, const FingerState& finger,
                    const SensorWindow& window, int32_t column, int32_t row) {
    int32_t sum = 0;
    for (int32_t probe = 0; probe < kZoneProbes * kZoneProbes; ++probe) {
        const int32_t u = column * kZoneProbes + probe % kZoneProbes;
        const int32_t v = row * kZoneProbes + probe / kZoneProbes;
        const int32_t x16 = (2 * u + 1) * window.width * kSubPixels / (2 * kZones * kZoneProbes);
        const int32_t y16 = (2 * v + 1) * window.height * kSubPixels / (2 * kZones * kZoneProbes);
        sum += ContactAt(patch, finger.pressure, x16 - window.width * 8 - finger.x16,
                         y16 - window.height * 8 - finger.y16);
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

int32_t ContactAt(const ContactPatch& patch, int32_t pressure, int32_t x16, int32_t y16) {
    const int32_t semiX = PressedAxis(patch.semiX16, pressure);
    const int32_t semiY = PressedAxis(patch.semiY16, pressure);
    if (semiX < 1 || semiY < 1)
        return 0;
    // Radius in 1/1024 of the ellipse; far outside needs no root.
    const int64_t x = static_cast<int64_t>(x16) * 1024 / semiX;
    const int64_t y = static_cast<int64_t>(y16) * 1024 / semiY;
    const int64_t square = x * x + y * y;
    constexpr int64_t kFar = 1300 * 1300;
    if (square > kFar)
        return 0;
    const auto radius = static_cast<int32_t>(SquareRoot(static_cast<uint64_t>(square)));
    const int32_t semi = semiX < semiY ? semiX : semiY;
    // The edge wanders by up to an eighth of its own width and a twentieth of the radius.
    const int32_t rough = LatticeNoise(patch.roughSeed, x16, y16, kRoughBits);
    const int32_t depth16 = (1024 - radius) * semi / 1024 + rough * (semi + patch.edge16) / 2560;
    return ClampTo(depth16 * 255 / patch.edge16, 0, 255);
}

std::vector<SkinPoint> SenseSkin(Skin& skin, const ContactPatch& patch, const FingerState& finger,
                                 const SensorWindow& window) {
    std::vector<SkinPoint> points;
    points.reserve(window.rows.size() * window.columns.size());
    for (const int32_t row : window.rows) {
        for (const int32_t column : window.columns) {
            const int32_t x16 = (2 * column + 1 - window.width) * 8 - finger.x16;
            const int32_t y16 = (2 * row + 1 - window.height) * 8 - finger.y16;
            SkinPoint point;
            point.contact = static_cast<uint8_t>(ContactAt(patch, finger.pressure, x16, y16));
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
    std::vector<uint8_t> greys;
    greys.reserve(points.size());
    int32_t index = 0;
    for (const SkinPoint point : points) {
        const int32_t grey = GreyOf(model, point) + offset +
                             PatternAt(model, index % width, index / width) +
                             random.Noise(model.noise16);
        greys.push_back(static_cast<uint8_t>(ClampTo(grey, 0, 255)));
        ++index;
    }
    return greys;
}

std::vector<uint8_t> ToBlockOrder(const std::vector<uint8_t>& picture, const Geometry& geometry) {
    std::vector<uint8_t> raw;
    raw.reserve(picture.size());
    for (int32_t block = 0; block < geometry.blockColNum * geometry.blockRowNum; ++block) {
        const int32_t row0 = block / geometry.blockColNum * geometry.blockHeight;
        const int32_t column0 = block % geometry.blockColNum * geometry.blockWidth;
        for (int32_t k = 0; k < geometry.blockHeight * geometry.blockWidth; ++k) {
            const int32_t row = row0 + k / geometry.blockWidth;
            const int32_t column = column0 + k % geometry.blockWidth;
            raw.push_back(picture[static_cast<size_t>(row * geometry.Width() + column)]);
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
    ZoneRegisters registers;
    for (int32_t row = 0; row < kZones; ++row) {
        for (int32_t column = 0; column < kZones; ++column) {
            const int32_t contact = ZoneContact(patch, finger, window, column, row);
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
