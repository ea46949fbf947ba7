// Plans of simulated gestures, drawn from a seed.
#include "simulator/Plan.h"

#include <array>

#include "simulator/Arithmetic.h"

namespace host {
namespace {

struct KindShare {
    SimKind kind;
    int32_t percent;
};

// The mixture of kinds; the shares add up to 100.
constexpr std::array<KindShare, 11> kMixture = {{{SimKind::Stroke, 45},
                                                 {SimKind::Drift, 6},
                                                 {SimKind::Fast, 4},
                                                 {SimKind::Slow, 4},
                                                 {SimKind::Small, 4},
                                                 {SimKind::Big, 4},
                                                 {SimKind::Diagonal, 5},
                                                 {SimKind::Reversal, 4},
                                                 {SimKind::Rest, 10},
                                                 {SimKind::Tap, 8},
                                                 {SimKind::LongPress, 6}}};

SimKind DrawKind(SimRandom& random) {
    int32_t left = random.Below(100);
    for (const KindShare& share : kMixture) {
        left -= share.percent;
        if (left < 0)
            return share.kind;
    }
    return SimKind::Stroke;
}

// Degrees off the axis.
int32_t DrawSlant(SimKind kind, SimRandom& random) {
    const int32_t sign = random.Chance(50) ? 1 : -1;
    switch (kind) {
        case SimKind::Drift:
            return sign * random.Range(12, 24);
        case SimKind::Diagonal:
            return sign * random.Range(40, 50);
        default:
            return sign * random.Range(0, 10);
    }
}

int32_t DrawSpeed16(SimKind kind, SimRandom& random) {
    switch (kind) {
        case SimKind::Fast:
            return random.Range(144, 176);
        case SimKind::Slow:
            return random.Range(16, 32);
        case SimKind::Small:
            return random.Range(10, 24);
        case SimKind::Rest:
        case SimKind::Tap:
        case SimKind::LongPress:
            return 0;
        default:
            return random.Range(58, 126);
    }
}

// Frames at full speed, so that the travel suits the sensor: travel pixels, give or take a quarter.
int32_t DrawFrames(const SimPlan& plan, SimRandom& random) {
    switch (plan.kind) {
        case SimKind::Rest:
            return random.Range(8, 20);
        case SimKind::Tap:
            return random.Range(1, 4);
        case SimKind::LongPress:
            return random.Range(30, 50);
        case SimKind::Slow:
            return random.Range(10, 20);
        case SimKind::Small:
            return ClampTo(random.Range(48, 112) / plan.speed16, 2, 8);
        default:
            break;
    }
    const int32_t usual = plan.mode == Mode::Hg ? 26 : (plan.plain ? 40 : 64);
    const int32_t travel16 = random.Range(usual * 12, usual * 20);
    return ClampTo(travel16 / plan.speed16, 4, 45);
}

void DrawPatch(SimPlan& plan, SimRandom& random) {
    const bool wide = plan.kind == SimKind::Big;
    if (plan.mode == Mode::Hg) {
        // A moving patch is smaller than the window of 40 x 48, so that it is seen to move.
        const bool still = IsResting(plan.kind) || plan.kind == SimKind::Small;
        const int32_t least = wide ? 23 : (still ? 19 : 16);
        const int32_t most = wide ? 32 : (still ? 28 : 18);
        plan.semiX16 = random.Range(least, most) * kSubPixels;
        plan.semiY16 = plan.semiX16 * random.Range(95, 110) / 100;
    } else {
        plan.semiX16 = random.Range(wide ? 95 : 50, wide ? 115 : 85) * kSubPixels;
        plan.semiY16 = plan.semiX16 * random.Range(75, 110) / 100;
    }
}

}  // namespace

const char* SimKindName(SimKind kind) {
    static constexpr std::array<const char*, 11> kNames = {
        "stroke", "drift",    "fast",   "slow", "small",    "big",
        "diag",   "reversal", "nomove", "tap",  "longpress"};
    return kNames[static_cast<size_t>(kind)];
}

bool IsResting(SimKind kind) {
    return kind == SimKind::Rest || kind == SimKind::Tap || kind == SimKind::LongPress;
}

SimPlan PlanOfKind(uint64_t seed, Mode mode, bool plain, SimKind kind) {
    SimRandom random(Mix64(seed ^ 0x94D049BB133111EBULL));
    SimPlan plan;
    plan.seed = seed;
    plan.mode = mode;
    plan.plain = mode == Mode::Hg || (mode == Mode::Fp && plain);
    plan.kind = kind;
    plan.angle = (90 * random.Below(4) + DrawSlant(kind, random) + 360) % 360;
    plan.speed16 = DrawSpeed16(kind, random);
    plan.frames = DrawFrames(plan, random);
    plan.lead = random.Range(0, 3);
    plan.land = random.Range(1, 3);
    plan.lift = random.Range(1, 3);
    plan.tail = random.Range(1, 3);
    plan.timeOut = kind == SimKind::LongPress ? random.Chance(60) : random.Chance(3);
    plan.pressure = random.Range(mode == Mode::Hg ? 235 : 190, 256);
    DrawPatch(plan, random);
    plan.period16 = random.Range(112, 160);
    plan.noise16 = random.Range(16, 58);
    const int32_t state = random.Below(100);
    plan.skin = state < 5 ? SkinState::Wet : (state < 11 ? SkinState::Dry : SkinState::Normal);
    plan.stretch = random.Chance(40) ? random.Range(0, 30) : 0;
    return plan;
}

SimPlan RandomPlan(uint64_t seed, Mode mode) {
    SimRandom random(Mix64(seed ^ 0xD6E8FEB86659FD93ULL));
    const SimKind kind = DrawKind(random);
    const bool plain = mode == Mode::Hg || (mode == Mode::Fp && random.Chance(18));
    return PlanOfKind(seed, mode, plain, kind);
}

}  // namespace host
