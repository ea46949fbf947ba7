#include "SmallGesture.h"

#include "simulator/Arithmetic.h"

namespace fpnavi_test {
namespace {

constexpr int32_t kBlocks = 4;  // in a row and in a column
constexpr int32_t kBound = 2;   // pixels of a border tile
constexpr int32_t kStep = 2;    // pixels that the skin moves from frame to frame

uint8_t SkinAt(int32_t row, int32_t column, uint64_t seed) {
    const uint64_t place =
        static_cast<uint64_t>(static_cast<uint32_t>(row)) << 32 | static_cast<uint32_t>(column);
    return static_cast<uint8_t>(host::Mix64(place ^ host::Mix64(seed)) & 0xFFU);
}

}  // namespace

host::ParamBlock SmallParams(const SmallSensor& sensor) {
    host::ParamBlock params = host::ParamsForMode(sensor.mode, false);
    const auto set = [&params](const char* name, int32_t value) {
        host::ParamValue(params, name) = value;
    };
    const bool hg = sensor.mode == host::Mode::Hg;
    set(hg ? "s_blockWidthHg" : "s_blockWidthFp", sensor.width / kBlocks);
    set(hg ? "s_blockHeightHg" : "s_blockHeightFp", sensor.height / kBlocks);
    set(hg ? "s_blockColNumHg" : "s_blockColNumFp", kBlocks);
    set(hg ? "s_blockRowNumHg" : "s_blockRowNumFp", kBlocks);
    set("s_imageWidthHg", sensor.width);
    set("s_imageHeightHg", sensor.height);
    set("s_multiBloclkFlag", sensor.multi ? 1 : 0);
    set("s_centerWidth", sensor.width - 2 * kBound);
    set("s_centerHeight", sensor.height - 2 * kBound);
    set("s_boundWidth", kBound);
    set("s_boundHeight", kBound);
    set("s_gapWidth", 3);
    set("s_gapHeight", 3);
    set("s_templateWidth", 3);
    set("s_templateHeight", 2);
    set("s_candidateNum", 5);
    set("s_overlapAreaMinFp", 8);
    set("s_overlapAreaMinNoMove", 8);
    set("s_smallMoveTolCol", 1);
    set("s_smallMoveTolRow", 1);
    return params;
}

SmallGesture MakeSmallGesture(const SmallSensor& sensor, int32_t frameNum, uint64_t seed) {
    SmallGesture gesture{sensor.mode, sensor.width, SmallParams(sensor), {}};
    for (int32_t frame = 0; frame < frameNum; ++frame) {
        std::vector<uint8_t> raw;
        for (int32_t row = 0; row < sensor.height; ++row) {
            for (int32_t column = 0; column < sensor.width; ++column)
                raw.push_back(SkinAt(row + kStep * frame, column, seed));
        }
        gesture.frames.push_back(raw);
    }
    return gesture;
}

uint32_t ZoneRows(int32_t index) {
    return 0xFFFF0000U >> (8 * (index % 3));
}

}  // namespace fpnavi_test
