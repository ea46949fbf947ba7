// Empty and touched single frames.
#include "simulator/Presence.h"

#include "parameters/ParamTable.h"
#include "simulator/Label.h"
#include "simulator/Sensor.h"

namespace host {
namespace {

constexpr int32_t kGreatestGradient = 8;  // grey levels from one edge to the other

}  // namespace

std::vector<uint8_t> SimulateEmptyFrame(uint64_t seed) {
    SimRandom random(Mix64(seed ^ 0xE7037ED1A0B428DBULL));
    GreyModel model;
    model.background = random.Range(230, 252);
    model.pattern = random.Range(1, 5);
    model.noise16 = random.Range(16, 58);
    model.patternSeed = random.Next();
    const std::vector<SkinPoint> air(static_cast<size_t>(kPresenceWidth * kPresenceHeight));
    std::vector<uint8_t> greys = MakeGreys(model, air, kPresenceWidth, random.Range(-5, 5), random);
    const int32_t slopeX = random.Range(-kGreatestGradient, kGreatestGradient);
    const int32_t slopeY = random.Range(-kGreatestGradient, kGreatestGradient);
    int32_t index = 0;
    for (uint8_t& grey : greys) {
        const int32_t x = index % kPresenceWidth - kPresenceWidth / 2;
        const int32_t y = index / kPresenceWidth - kPresenceHeight / 2;
        const int32_t slope = slopeX * x / kPresenceWidth + slopeY * y / kPresenceHeight;
        grey = static_cast<uint8_t>(ClampTo(grey + slope, 0, 255));
        ++index;
    }
    return greys;
}

std::vector<uint8_t> SimulateTouchedFrame(uint64_t seed, bool plain) {
    SimRandom random(Mix64(seed ^ 0x8EBC6AF09C88C6E3ULL));
    const SimPlan plan = PlanOfKind(random.Next(), Mode::Fp, plain, SimKind::Rest);
    const SensorWindow window = SensorWindow::Of(ParamsForMode(Mode::Fp, plain));
    Skin skin({plan.seed, plan.period16, plan.skin == SkinState::Dry ? 80 : 0});
    const ContactPatch patch = {plan.semiX16, plan.semiY16, random.Range(24, 64), random.Next()};
    FingerState finger;
    finger.x16 = random.Range(-window.width * 8, window.width * 8);
    finger.y16 = random.Range(-window.height * 8, window.height * 8);
    finger.pressure = plan.pressure;
    std::vector<SkinPoint> points = SenseSkin(skin, patch, finger, window);
    FrameTruth truth;
    MeasureContact(points, kPresenceWidth, truth);
    if (PresenceOf(truth, Mode::Fp) != Presence::Present) {
        finger.x16 = 0;  // too far out: put it on the middle
        finger.y16 = 0;
        points = SenseSkin(skin, patch, finger, window);
    }
    return MakeGreys(GreyModelOf(plan), points, kPresenceWidth, random.Range(-5, 5), random);
}

}  // namespace host
