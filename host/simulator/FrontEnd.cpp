// Grey levels of the simulated front end, and the drawing of its plans.
#include "simulator/FrontEnd.h"

#include <algorithm>

namespace host {
namespace {

constexpr int32_t kGreyAtCentre = 180;
constexpr int32_t kReferenceFactor = 374;  // hundredths of a grey per DC at the reference gain
constexpr int32_t kReferenceRatio = 240;   // 40 * 3 * 2, the amplifiers' product there
constexpr int32_t kGreatestDrift16 = 160;  // the sensor stays within 10 greys of where it began
constexpr int32_t kFarGrey = 4096;         // beyond it every pixel is saturated anyway
constexpr int32_t kRatios21[8] = {10, 20, 40, 56, 70, 80, 112, 140};

int32_t Field(uint32_t value, uint32_t shift) {
    return static_cast<int32_t>(std::min((value >> shift) & 0xFU, 7U));
}

int32_t Byte(uint32_t value, uint32_t index) {
    return static_cast<int32_t>((value >> (8 * index)) & 0xFFU);
}

// Two bytes whose difference is dc: low and low + dc, low any value for which the sum is at most
// 255.
uint32_t BytePair(int32_t dc, uint32_t bits) {
    const uint32_t low = (bits & 0xFFU) % static_cast<uint32_t>(256 - dc);
    return ((low + static_cast<uint32_t>(dc)) << 8) | low;
}

// A finger over the whole window, or one whose centre lies beyond an edge or a corner of it.
FingerState FingerOf(Touch touch, const SensorWindow& window, SimRandom& random) {
    FingerState finger;
    finger.pressure = touch == Touch::None ? 0 : 256;
    const int32_t x16 = window.width * 16 / 2;
    const int32_t y16 = window.height * 16 / 2;
    const int32_t column = random.Range(-1, 1);
    const int32_t row = column == 0 ? 1 : random.Range(-1, 1);
    if (touch == Touch::Partial) {
        finger.x16 = column * x16;
        finger.y16 = row * y16;
    }
    return finger;
}

void DrawGain(SimRandom& random, FrontEndPlan* plan) {
    const int32_t spread = random.Below(3);  // reference, near it, anywhere
    const auto field = [&](int32_t reference) {
        const int32_t near = random.Range(-1, 1);
        const int32_t any = random.Below(8);
        const int32_t value = spread == 0 ? reference : (spread == 1 ? reference + near : any);
        return static_cast<uint32_t>(value);
    };
    // A draw a line, since operands of one expression may be evaluated in any order. All other bits
    // of the registers are none of the tuning's business.
    const uint32_t high20 = field(2);
    const uint32_t low20 = field(7) % 8;
    const uint32_t high2C = field(1);
    const uint32_t low2C = field(2);
    const uint64_t others = random.Next();
    plan->gain20 =
        (static_cast<uint32_t>(others >> 32) & ~0x000F0F00U) | (high20 << 16) | (low20 << 8);
    plan->gain2C = (static_cast<uint32_t>(others) & ~0x00000F0FU) | (high2C << 8) | low2C;
}

}  // namespace

FrontEndPlan RandomFrontEnd(uint64_t seed) {
    SimRandom random(Mix64(seed ^ 0x6A09E667F3BCC909ULL));
    FrontEndPlan plan;
    plan.seed = random.Next();
    plan.layout = random.Below(2);
    DrawGain(random, &plan);
    plan.startDc = random.Chance(80) ? random.Range(128, 255) : random.Range(0, 255);
    plan.startBits = static_cast<uint32_t>(random.Next());
    plan.mismatch = random.Range(70, 140);
    plan.centre16 =
        random.Chance(90) ? random.Range(138 * 16, 245 * 16) : random.Range(90 * 16, 300 * 16);
    plan.contrast = random.Range(40, 120);
    const int32_t touch = random.Below(100);
    plan.touch = touch < 60 ? Touch::None : (touch < 85 ? Touch::Covered : Touch::Partial);
    plan.pattern = random.Range(1, 4);
    plan.noise16 = random.Range(16, 64);
    plan.drift16 = random.Range(0, 32);
    return plan;
}

uint32_t StartRegister(const FrontEndPlan& plan) {
    const int32_t dc = ClampTo(plan.startDc, 0, 255);
    if (plan.layout != 0)
        return (plan.startBits & ~0xFFU) | static_cast<uint32_t>(dc);
    return (BytePair(dc, plan.startBits >> 16) << 16) | BytePair(dc, plan.startBits);
}

int32_t TrueGainFactor(const FrontEndPlan& plan) {
    const int32_t ratio = kRatios21[Field(plan.gain20, 16)] * (Field(plan.gain2C, 8) + 1) *
                          (Field(plan.gain2C, 0) + 1);
    // At most 374 * 8960 / 240 = 13962; a mismatch of a few hundred percent stays far below 2^31.
    return kReferenceFactor * ratio / kReferenceRatio * ClampTo(plan.mismatch, 0, 1000) / 100;
}

FrontEnd::FrontEnd(const FrontEndPlan& plan, const ParamBlock& params)
    : m_plan(plan),
      m_geometry(GeometryOf(params)),
      m_random(plan.seed),
      m_factor(TrueGainFactor(plan)) {
    const SensorWindow window = SensorWindow::Of(params);
    const auto pixels = static_cast<size_t>(m_geometry.Width() * m_geometry.Height());
    if (plan.touch == Touch::None || window.columns.size() * window.rows.size() != pixels) {
        m_points.assign(pixels, SkinPoint());
        return;
    }
    Skin skin({m_random.Next(), m_random.Range(112, 160), 0});
    // Half axes in tenths of the window: a centred finger reaches over every corner, one that lies
    // half a window off leaves the far ones free.
    const int32_t tenths = plan.touch == Touch::Covered ? 12 : 7;
    const ContactPatch patch = {window.width * 16 * tenths / 10, window.height * 16 * tenths / 10,
                                48, m_random.Next()};
    const FingerState finger = FingerOf(plan.touch, window, m_random);
    m_points = SenseSkin(skin, patch, finger, window);
}

std::vector<uint8_t> FrontEnd::Picture(int32_t dc) {
    // |dc * 16 - centre| < 2^14 and the factor < 2^18: below 2^31 only in 64 bits.
    const int64_t above16 = static_cast<int64_t>(dc * 16 - m_plan.centre16) * m_factor / 100;
    const auto level16 = static_cast<int32_t>(std::clamp<int64_t>(
        kGreyAtCentre * 16 + above16 + m_drift16, -kFarGrey * 16, kFarGrey * 16));
    GreyModel model;
    model.background = FloorDiv(level16, 16);
    model.ridge = model.background - m_plan.contrast;
    model.valley = model.background - m_plan.contrast / 4;
    model.pattern = m_plan.pattern;
    model.noise16 = m_plan.noise16;
    model.patternSeed = m_plan.seed;
    return MakeGreys(model, m_points, m_geometry.Width(), 0, m_random);
}

std::vector<uint8_t> FrontEnd::Grab(uint32_t dac) {
    m_drift16 = ClampTo(m_drift16 + m_random.Range(-m_plan.drift16, m_plan.drift16),
                        -kGreatestDrift16, kGreatestDrift16);
    if (m_plan.layout != 0)
        return ToBlockOrder(Picture(Byte(dac, 0)), m_geometry);
    const int32_t even = Byte(dac, 1) - Byte(dac, 0);
    const int32_t odd = Byte(dac, 3) - Byte(dac, 2);
    std::vector<uint8_t> picture = Picture(even);
    if (odd != even) {
        const std::vector<uint8_t> other = Picture(odd);
        const auto width = static_cast<size_t>(m_geometry.Width());
        for (size_t i = 0; i < picture.size(); ++i) {
            if (i % width % 2 == 1)
                picture[i] = other[i];
        }
    }
    return ToBlockOrder(picture, m_geometry);
}

}  // namespace host
