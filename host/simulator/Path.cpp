// Speed and pressure profiles of a simulated finger.
#include "simulator/Path.h"

namespace host {
namespace {

constexpr int32_t kTremor16 = 2;  // a resting finger stays within about an eighth of a pixel

struct Step {
    int32_t speed256 = 0;  // share of the plan's speed, in 1/256; negative on the way back
    int32_t pressure = 0;
};

// The finger lands at half its speed and leaves at full speed.
std::vector<Step> Profile(const SimPlan& plan) {
    std::vector<Step> steps(static_cast<size_t>(plan.lead));
    for (int32_t i = 1; i <= plan.land; ++i)
        steps.push_back({i == 1 ? 0 : 128, plan.pressure * i / (plan.land + 1)});
    for (int32_t i = 0; i < plan.frames; ++i) {
        const bool back = plan.kind == SimKind::Reversal && i >= plan.frames / 2;
        const bool turning = plan.kind == SimKind::Reversal && i == plan.frames / 2;
        steps.push_back({turning ? 0 : (back ? -256 : 256), plan.pressure});
    }
    if (plan.timeOut)
        return steps;
    const int32_t last = plan.kind == SimKind::Reversal ? -256 : 256;
    for (int32_t i = plan.lift; i >= 1; --i)
        steps.push_back({last, plan.pressure * i / (plan.lift + 1)});
    steps.insert(steps.end(), static_cast<size_t>(plan.tail), Step{});
    return steps;
}

// Moves the path so that the middle of its touching part is at the centre of the window, give or
// take jitter16.
void Centre(std::vector<FingerState>& path, int32_t jitter16, SimRandom& random) {
    const FingerState* first = nullptr;
    const FingerState* last = nullptr;
    for (const FingerState& state : path) {
        if (state.pressure > 0) {
            first = first == nullptr ? &state : first;
            last = &state;
        }
    }
    if (first == nullptr)
        return;
    const int32_t moveX = random.Range(-jitter16, jitter16) - (first->x16 + last->x16) / 2;
    const int32_t moveY = random.Range(-jitter16, jitter16) - (first->y16 + last->y16) / 2;
    for (FingerState& state : path) {
        state.x16 += moveX;
        state.y16 += moveY;
    }
}

}  // namespace

std::vector<FingerState> FingerPath(const SimPlan& plan, SimRandom& random) {
    const uint32_t angle = AngleOfDegrees(plan.angle);
    const int32_t cosine = Cos(angle);
    const int32_t sine = -Sin(angle);  // y grows downwards, angles turn upwards
    // Positions are carried in 1/256 of 1/16 pixel, so that slow motion is even.
    int64_t x = 0;
    int64_t y = 0;
    const std::vector<Step> steps = Profile(plan);
    const auto count = static_cast<int32_t>(steps.size());
    std::vector<FingerState> path;
    for (int32_t i = 0; i < count; ++i) {
        const Step step = steps[static_cast<size_t>(i)];
        const int64_t way =
            static_cast<int64_t>(plan.speed16) * step.speed256 * random.Range(94, 106) / 100;
        x += way * cosine / kSinOne;
        y += way * sine / kSinOne;
        FingerState state;
        state.x16 = static_cast<int32_t>(x / 256);
        state.y16 = static_cast<int32_t>(y / 256);
        if (step.pressure > 0) {
            state.x16 += random.Range(-kTremor16, kTremor16);
            state.y16 += random.Range(-kTremor16, kTremor16);
        }
        state.pressure = step.pressure;
        // Friction pulls the skin more and more along the motion.
        const int32_t stretch = plan.speed16 == 0 ? 0 : plan.stretch * i / count;
        state.stretchX = stretch * (cosine < 0 ? -cosine : cosine) / kSinOne;
        state.stretchY = stretch * (sine < 0 ? -sine : sine) / kSinOne;
        path.push_back(state);
    }
    const int32_t jitter = plan.mode == Mode::Hg ? 2 : 6;
    Centre(path, jitter * kSubPixels, random);
    return path;
}

}  // namespace host
