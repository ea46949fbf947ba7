#include "FrameSize.h"

#include <algorithm>
#include <cstdio>

#include "parameters/ParamTable.h"
#include "simulator/Frame.h"
#include "simulator/Path.h"
#include "simulator/Sensor.h"

namespace bench {
namespace {

constexpr int32_t kSideMin = 17;  // two borders of 8 and a pixel between
constexpr int32_t kSideMax = 4096;
constexpr int32_t kMargin = 12;      // pixels of skin that landing, lifting and jitter may take
constexpr int32_t kFramesLeast = 4;  // at full speed

host::Mode ModeOf(const host::ParamBlock& params) {
    return host::ParamValue(params, "s_modeFlag") == 1 ? host::Mode::Hg : host::Mode::Fp;
}

// The finger covers as much of the window as it does of the default one, and stays within the skin.
host::SimPlan FitPlan(host::SimPlan plan, const host::SensorWindow& window) {
    const host::Mode mode = plan.mode;
    const host::SensorWindow usual =
        host::SensorWindow::Of(host::ParamsForMode(mode, mode == host::Mode::Hg));
    const int32_t percent =
        std::max({100, 100 * window.width / usual.width, 100 * window.height / usual.height});
    plan.semiX16 = plan.semiX16 * percent / 100;
    plan.semiY16 = plan.semiY16 * percent / 100;
    const int32_t side = std::max(window.width, window.height);
    const int32_t travel16 = (2 * (host::Skin::kReach - kMargin) - side) * host::kSubPixels;
    if (plan.speed16 > 0)
        plan.frames = std::min(plan.frames, std::max(travel16 / plan.speed16, kFramesLeast));
    return plan;
}

host::RecordedFrame FrameOf(const std::vector<uint8_t>& greys, const host::Geometry& geometry,
                            const host::FingerState& finger) {
    host::RecordedFrame frame;
    frame.raw = host::ToBlockOrder(greys, geometry);
    frame.x16 = finger.x16;
    frame.y16 = finger.y16;
    return frame;
}

}  // namespace

std::string NameOf(const FrameSize& size) {
    static const char* const layouts[] = {"tiled", "window", "hg"};
    return std::to_string(size.width) + "x" + std::to_string(size.height) + " " +
           layouts[static_cast<int32_t>(size.layout)];
}

bool ParseSides(const std::string& text, FrameSize* size) {
    int32_t width = 0;
    int32_t height = 0;
    char rest = '\0';
    if (std::sscanf(text.c_str(), "%4dx%4d%c", &width, &height, &rest) != 2 ||
        std::min(width, height) < kSideMin || std::max(width, height) > kSideMax)
        return false;
    size->width = width;
    size->height = height;
    return true;
}

host::ParamBlock ParamsOf(const FrameSize& size) {
    const bool hg = size.layout == Layout::Hg;
    host::ParamBlock params =
        host::ParamsForMode(hg ? host::Mode::Hg : host::Mode::Fp, size.layout != Layout::Tiled);
    const std::string set = hg ? "Hg" : "Fp";
    const auto give = [&params](const std::string& name, int32_t value) {
        host::ParamValue(params, name) = value;
    };
    give("s_blockWidth" + set, size.width);
    give("s_blockHeight" + set, size.height);
    give("s_blockColNum" + set, 1);
    give("s_blockRowNum" + set, 1);
    if (hg) {  // the area of the finger test
        give("s_imageWidthHg", size.width);
        give("s_imageHeightHg", size.height);
        return params;
    }
    give("s_centerWidth", size.width - 2 * host::ParamValue(params, "s_boundWidth"));
    give("s_centerHeight", size.height - 2 * host::ParamValue(params, "s_boundHeight"));
    return params;
}

host::Gesture SimulateSized(const host::SimPlan& wanted, const host::ParamBlock& params) {
    host::Gesture gesture;
    gesture.params = params;
    gesture.mode = ModeOf(params);
    gesture.geometry = host::GeometryOf(params);
    const host::SensorWindow window = host::SensorWindow::Of(params);
    const host::SimPlan plan = FitPlan(wanted, window);
    host::SimRandom random(plan.seed);
    host::Skin skin({random.Next(), plan.period16, 0});
    const host::ContactPatch patch = {plan.semiX16, plan.semiY16, random.Range(24, 64),
                                      random.Next()};
    const host::GreyModel grey = host::GreyModelOf(plan);
    for (const host::FingerState& finger : host::FingerPath(plan, random)) {
        const std::vector<host::SkinPoint> points = host::SenseSkin(skin, patch, finger, window);
        const int32_t width = gesture.geometry.Width();
        gesture.frames.push_back(
            FrameOf(host::MakeGreys(grey, points, width, 0, random), gesture.geometry, finger));
    }
    return gesture;
}

}  // namespace bench
