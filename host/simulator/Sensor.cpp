// Runs a plan: path, skin, frames, answers.
#include "simulator/Sensor.h"

#include <utility>

#include "parameters/ParamTable.h"
#include "simulator/Label.h"
#include "simulator/Path.h"

namespace host {
namespace {

constexpr int32_t kGradientStep = 4;   // pixels between the points whose gradient is taken
constexpr int32_t kGreatestDrift = 5;  // of the grey offset during a gesture

// Independent random numbers for each part of the simulation, so that one does not shift the
// others.
enum SeedPart : uint64_t { kSkinPart = 1, kPathPart, kPatchPart, kGreyPart, kNoisePart, kZonePart };

uint64_t PartSeed(const SimPlan& plan, SeedPart part) {
    return Mix64(plan.seed + part * 0xA0761D6478BD642FULL);
}

// Adds the gradient of the skin that the window sees.
void AddSeenGradient(Skin& skin, const ContactPatch& patch, const FingerState& finger,
                     const SensorWindow& window, SkinGradient& sum) {
    const PressedPatch pressed(patch, finger.pressure);
    for (int32_t y = 0; y < window.height; y += kGradientStep) {
        for (int32_t x = 0; x < window.width; x += kGradientStep) {
            const int32_t x16 = (2 * x + 1 - window.width) * 8 - finger.x16;
            const int32_t y16 = (2 * y + 1 - window.height) * 8 - finger.y16;
            if (pressed.At(x16, y16) > 127)
                skin.AddGradient(x16, y16, sum);
        }
    }
}

// Percent of the gradient energy that lies along the motion of plan.
int32_t Crossing(const SimPlan& plan, const SkinGradient& sum) {
    const uint32_t angle = AngleOfDegrees(plan.angle);
    const int64_t cosine = Cos(angle);
    const int64_t sine = -Sin(angle);
    // At most 50 frames of 510 points of 510^2: energies stay below 2^33, their products with a
    // cosine below 2^48.
    const int64_t along = sum.xx * cosine / kSinOne * cosine / kSinOne +
                          2 * (sum.xy * cosine / kSinOne * sine / kSinOne) +
                          sum.yy * sine / kSinOne * sine / kSinOne;
    const int64_t total = sum.xx + sum.yy;
    return total == 0 ? 0 : static_cast<int32_t>(100 * along / total);
}

int32_t CountBits(uint32_t bits) {
    int32_t count = 0;
    for (; bits != 0; bits &= bits - 1)
        ++count;
    return count;
}

RecordedFrame MakeFrame(const Gesture& gesture, const FrameTruth& truth,
                        const std::vector<uint8_t>& greys, ZoneRegisters zones) {
    RecordedFrame frame;
    frame.raw = ToBlockOrder(greys, gesture.geometry);
    frame.reg24 = zones.reg24;
    frame.reg28 = zones.reg28;
    frame.x16 = truth.finger.x16;
    frame.y16 = truth.finger.y16;
    frame.presence = PresenceOf(truth, gesture.mode);
    return frame;
}

std::string NoteOf(const SimPlan& plan) {
    return "simulated; seed " + std::to_string(plan.seed) + ", " + std::to_string(plan.angle) +
           " degrees, " + std::to_string(plan.speed16) + "/16 pixel per frame, ridge period " +
           std::to_string(plan.period16) + "/16 pixel";
}

}  // namespace

GreyModel GreyModelOf(const SimPlan& plan) {
    SimRandom random(PartSeed(plan, kGreyPart));
    const bool hg = plan.mode == Mode::Hg;
    GreyModel model;
    model.background = random.Range(234, 252);
    model.ridge = hg ? random.Range(15, 45) : random.Range(35, 80);
    model.valley = hg ? random.Range(80, 125) : random.Range(165, 215);
    model.gain256 = random.Range(235, 270);
    if (plan.skin == SkinState::Wet)
        model.valley = model.ridge + (model.valley - model.ridge) * random.Range(35, 60) / 100;
    model.pattern = random.Range(1, 4);
    model.noise16 = plan.noise16;
    model.patternSeed = random.Next();
    return model;
}

Gesture Simulate(const SimPlan& plan, std::string id) {
    Gesture gesture;
    gesture.id = std::move(id);
    gesture.mode = plan.mode;
    gesture.params = ParamsForMode(plan.mode, plan.plain);
    gesture.geometry = GeometryOf(gesture.params);
    gesture.end = plan.timeOut ? GestureEnd::TimeOut : GestureEnd::Lift;
    const SensorWindow window = SensorWindow::Of(gesture.params);
    Skin skin({PartSeed(plan, kSkinPart), plan.period16, plan.skin == SkinState::Dry ? 80 : 0});
    SimRandom patchRandom(PartSeed(plan, kPatchPart));
    const ContactPatch patch = {plan.semiX16, plan.semiY16, patchRandom.Range(24, 64),
                                patchRandom.Next()};
    const GreyModel greyModel = GreyModelOf(plan);
    SimRandom pathRandom(PartSeed(plan, kPathPart));
    SimRandom noiseRandom(PartSeed(plan, kNoisePart));
    SimRandom zoneRandom(PartSeed(plan, kZonePart));

    const std::vector<FingerState> path = FingerPath(plan, pathRandom);
    std::vector<FrameTruth> truths;
    SkinGradient gradient;
    int32_t offset = 0;
    for (const FingerState& finger : path) {
        FrameTruth truth;
        truth.finger = finger;
        const std::vector<SkinPoint> points = SenseSkin(skin, patch, finger, window);
        ZoneRegisters zones;
        if (plan.mode == Mode::DoubleScan) {
            zones = SenseZones(patch, finger, window, zoneRandom);
            truth.zones = CountBits(zones.reg24) + CountBits(zones.reg28);
            truth.touched = truth.zones > 0;
        }
        MeasureContact(points, gesture.geometry.Width(), truth);
        offset = ClampTo(offset + noiseRandom.Range(-1, 1), -kGreatestDrift, kGreatestDrift);
        const std::vector<uint8_t> greys =
            MakeGreys(greyModel, points, gesture.geometry.Width(), offset, noiseRandom);
        gesture.frames.push_back(MakeFrame(gesture, truth, greys, zones));
        truths.push_back(truth);
        if (plan.kind == SimKind::Stroke) {  // the only kind that is judged by its skin
            AddSeenGradient(skin, patch, finger, window, gradient);
        }
    }

    Answers answers = JudgeGesture(plan, truths, Crossing(plan, gradient));
    gesture.label = answers.label;
    gesture.accepted = std::move(answers.accepted);
    gesture.tier = std::move(answers.tier);
    gesture.tags = {kSimulatedTag, std::move(answers.kindTag), plan.plain ? "plain" : "tiled"};
    if (plan.skin != SkinState::Normal)
        gesture.tags.emplace_back(plan.skin == SkinState::Wet ? "wet" : "dry");
    gesture.notes = NoteOf(plan);
    return gesture;
}

}  // namespace host
