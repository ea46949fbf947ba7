#include "DrawnFrames.h"

#include <algorithm>

#include "parameters/ParamTable.h"
#include "simulator/Arithmetic.h"
#include "simulator/Sensor.h"

namespace bench {
namespace {

constexpr int32_t kSkins = 4;
constexpr int32_t kSpan = 2 * host::Skin::kReach - 20;  // pixels of skin in sight
constexpr int32_t kWholePatch16 = 8000 * host::kSubPixels;

host::Skin& SkinOf(int32_t index) {
    static std::vector<host::Skin> skins = {host::Skin({1, 112, 0}), host::Skin({2, 128, 0}),
                                            host::Skin({3, 144, 0}), host::Skin({4, 160, 0})};
    return skins[static_cast<size_t>(index)];
}

// The skin ends: what lies further out is seen in a mirror.
int32_t Mirrored(int32_t position) {
    const int32_t place = position % (2 * kSpan);
    return place < kSpan ? place : 2 * kSpan - 1 - place;
}

// The window of params, as large as the skin; tiles that do not make up the frame count as one.
host::SensorWindow WindowOf(const host::ParamBlock& params) {
    const host::Geometry geometry = host::GeometryOf(params);
    host::SensorWindow window = host::SensorWindow::Of(params);
    if (static_cast<int32_t>(window.columns.size()) != geometry.Width() ||
        static_cast<int32_t>(window.rows.size()) != geometry.Height()) {
        host::ParamBlock single = params;
        host::ParamValue(single, "s_multiBloclkFlag") = 0;
        window = host::SensorWindow::Of(single);
    }
    for (std::vector<int32_t>* const axis : {&window.columns, &window.rows}) {
        for (int32_t& position : *axis)
            position = Mirrored(position);
    }
    window.width = std::min(window.width, kSpan);
    window.height = std::min(window.height, kSpan);
    return window;
}

}  // namespace

DrawnFrames::DrawnFrames(const host::ParamBlock& params, host::SimRandom& random)
    : m_window(WindowOf(params)), m_skin(random.Below(kSkins)) {
    const int32_t share = random.Below(100);
    m_content = share < 85 ? Content::Ridges : (share < 95 ? Content::Noise : Content::Flat);
    const bool hg = host::ParamValue(params, "s_modeFlag") == 1;
    const int32_t side16 = std::min(m_window.width, m_window.height) * host::kSubPixels;
    const bool whole = !hg && random.Chance(80);
    m_patch.semiX16 = whole ? kWholePatch16 : side16 * random.Range(30, 100) / 100 + 1;
    m_patch.semiY16 = m_patch.semiX16;
    m_patch.roughSeed = random.Next();
}

Frame DrawnFrames::Ridges(const host::FingerState& finger, host::SimRandom& random) const {
    const std::vector<host::SkinPoint> points =
        host::SenseSkin(SkinOf(m_skin), m_patch, finger, m_window);
    const int32_t width = static_cast<int32_t>(m_window.columns.size());
    return {host::MakeGreys(host::GreyModel(), points, width, 0, random)};
}

Frame DrawnFrames::Picture(const host::FingerState& finger, host::SimRandom& random) const {
    if (m_content == Content::Ridges)
        return Ridges(finger, random);
    Frame frame;
    frame.image.assign(m_window.columns.size() * m_window.rows.size(), 100);
    for (uint8_t& grey : frame.image) {
        if (m_content == Content::Noise)
            grey = static_cast<uint8_t>(random.Below(256));
    }
    return frame;
}

FramePair DrawnFrames::Next(host::SimRandom& random) const {
    host::FingerState finger;
    finger.pressure = 256;
    finger.x16 = random.Range(-4, 4) * host::kSubPixels;
    finger.y16 = random.Range(-4, 4) * host::kSubPixels;
    FramePair pair;
    pair.first = Picture(finger, random);
    if (random.Chance(85)) {
        const int32_t way = random.Range(4 * host::kSubPixels, 8 * host::kSubPixels);
        const int32_t slant = random.Range(-way / 6, way / 6);
        const bool sideways = random.Chance(50);
        const int32_t sign = random.Chance(50) ? 1 : -1;
        finger.x16 += sideways ? sign * way : slant;
        finger.y16 += sideways ? slant : sign * way;
    }
    pair.second = Picture(finger, random);
    return pair;
}

const char* DrawnFrames::Name() const {
    static const char* const names[] = {"ridges", "noise", "flat"};
    return names[static_cast<int32_t>(m_content)];
}

}  // namespace bench
