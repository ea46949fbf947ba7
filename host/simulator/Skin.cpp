// The ridge pattern: the phase of a cosine is the distance from the core line, bent by smooth
// noise, plus one turn around each minutia; the height is the cosine with noise of three sizes.
#include "simulator/Skin.h"

#include "simulator/Arithmetic.h"

namespace host {
namespace {

constexpr int32_t kSide = 2 * Skin::kReach + 4;  // cells per side of the kept area
constexpr int32_t kMinutiaCount = 30;            // one in about 46 x 46 pixels

// Noise layers; each has its own lattice.
enum NoiseLayer : size_t { kBendX, kBendY, kPhase, kAmplitude, kBlotch, kGrain, kBreak };

constexpr uint32_t kCellBits[] = {6, 6, 4, 4, 3, 2, 2};  // of the layers: cells of 2^bits pixels
constexpr int32_t kLatticeReach = 128;                   // at least kReach, whole cells of each

// Atan2 of whole-pixel distances, from a table: it is needed 30 times for each cell.
class TurnTable {
  public:
    TurnTable() : m_turns(static_cast<size_t>(kSpan) * kSpan) {
        for (int32_t i = 0; i < kSpan * kSpan; ++i)
            m_turns[static_cast<size_t>(i)] = static_cast<uint16_t>(Atan2(i / kSpan, i % kSpan));
    }

    // |x|, |y| below kSpan.
    uint32_t At(int32_t y, int32_t x) const {
        const int32_t index = (y < 0 ? -y : y) * kSpan + (x < 0 ? -x : x);
        const uint32_t turn = m_turns[static_cast<size_t>(index)];
        const uint32_t half = x < 0 ? kFullTurn / 2 - turn : turn;
        return y < 0 ? kFullTurn - half : half;
    }

  private:
    static constexpr int32_t kSpan = 2 * Skin::kReach + 4;

    std::vector<uint16_t> m_turns;
};

}  // namespace

Skin::Skin(const SkinShape& shape)
    : m_shape(shape),
      m_heights(static_cast<size_t>(kSide) * kSide, 0),
      m_known(static_cast<size_t>(kSide) * kSide, 0) {
    SimRandom random(Mix64(shape.seed ^ 0x5DEECE66DULL));
    for (const uint32_t bits : kCellBits)
        m_layers.emplace_back(random.Next(), kLatticeReach, bits);
    m_coreX16 = random.Range(-50, 50) * kSubPixels;
    m_coreY16 = random.Range(-50, 50) * kSubPixels;
    m_coreAxis = static_cast<uint32_t>(random.Below(65536));
    // Half of the fingers are loops (the core line has no end), the others whorls.
    m_coreLength16 = (random.Chance(50) ? 4000 : random.Range(0, 40)) * kSubPixels;
    m_blotch = random.Range(24, 50);
    m_grain = random.Range(16, 40);
    for (int32_t i = 0; i < kMinutiaCount; ++i) {
        const int32_t x = random.Range(-kReach, kReach);
        const int32_t y = random.Range(-kReach, kReach);
        m_minutiae.push_back({x, y, i % 2 == 0});
    }
}

int32_t Skin::CoreDistance16(int32_t x16, int32_t y16) const {
    const int32_t x = x16 - m_coreX16;
    const int32_t y = y16 - m_coreY16;
    // Rotated into the core's axis; |x|, |y| stay below 2^13, so the products below 2^29.
    const int32_t along = (x * Cos(m_coreAxis) + y * Sin(m_coreAxis)) / kSinOne;
    const int32_t across = (y * Cos(m_coreAxis) - x * Sin(m_coreAxis)) / kSinOne;
    int32_t beyond = 0;
    if (along < 0)
        beyond = along;
    else if (along > m_coreLength16)
        beyond = along - m_coreLength16;
    const int64_t square =
        static_cast<int64_t>(beyond) * beyond + static_cast<int64_t>(across) * across;
    return static_cast<int32_t>(SquareRoot(static_cast<uint64_t>(square)));
}

uint32_t Skin::RidgePhase(int32_t x, int32_t y) const {
    // Bends of up to 10 pixels over 64.
    const int32_t bendX = m_layers[kBendX].At(x, y) * 5 / 4;
    const int32_t bendY = m_layers[kBendY].At(x, y) * 5 / 4;
    const int32_t distance = CoreDistance16(x * kSubPixels + bendX, y * kSubPixels + bendY);
    const uint32_t turnPer16 = kFullTurn / static_cast<uint32_t>(m_shape.period16);
    uint32_t phase = static_cast<uint32_t>(distance) * turnPer16;
    // A quarter turn of wander: ridges are not equally wide.
    phase += static_cast<uint32_t>(m_layers[kPhase].At(x, y) * 128);
    static const TurnTable turns;
    for (const Minutia& minutia : m_minutiae) {
        const uint32_t turn = turns.At(y - minutia.y, x - minutia.x);
        phase = minutia.clockwise ? phase + turn : phase - turn;
    }
    return phase;
}

int32_t Skin::ComputeHeight(int32_t x, int32_t y) const {
    int32_t height = Cos(RidgePhase(x, y)) * 180 / kSinOne;
    height = ClampTo(height, -128, 128);  // steeper flanks than a cosine has
    const int32_t amplitude = 200 + m_layers[kAmplitude].At(x, y) / 3;
    height = height * amplitude / 256;
    height += m_layers[kBlotch].At(x, y) * m_blotch / 64;
    height += m_layers[kGrain].At(x, y) * m_grain / 64;
    if (m_shape.dryness > 0 && height > 0) {
        const int32_t gap = m_layers[kBreak].At(x, y) + 128;
        height -= height * ClampTo(gap * 2 - 200, 0, 255) / 255 * m_shape.dryness / 100;
    }
    return ClampTo(height + 128, 0, 255);
}

uint8_t Skin::CellHeight(int32_t x, int32_t y) {
    const auto index = static_cast<size_t>((y + kReach) * kSide + x + kReach);
    if (m_known[index] == 0) {
        m_heights[index] = static_cast<uint8_t>(ComputeHeight(x, y));
        m_known[index] = 1;
    }
    return m_heights[index];
}

int32_t Skin::HeightAt(int32_t x16, int32_t y16) {
    const int32_t limit = kReach * kSubPixels;
    x16 = ClampTo(x16, -limit, limit);
    y16 = ClampTo(y16, -limit, limit);
    const int32_t x = FloorDiv(x16, kSubPixels);
    const int32_t y = FloorDiv(y16, kSubPixels);
    const int32_t restX = x16 - x * kSubPixels;
    const int32_t restY = y16 - y * kSubPixels;
    const int32_t top = CellHeight(x, y) * (kSubPixels - restX) + CellHeight(x + 1, y) * restX;
    const int32_t bottom =
        CellHeight(x, y + 1) * (kSubPixels - restX) + CellHeight(x + 1, y + 1) * restX;
    return (top * (kSubPixels - restY) + bottom * restY) / (kSubPixels * kSubPixels);
}

void Skin::AddGradient(int32_t x16, int32_t y16, SkinGradient& sum) {
    const int64_t dx = HeightAt(x16 + kSubPixels, y16) - HeightAt(x16 - kSubPixels, y16);
    const int64_t dy = HeightAt(x16, y16 + kSubPixels) - HeightAt(x16, y16 - kSubPixels);
    sum.xx += dx * dx;
    sum.xy += dx * dy;
    sum.yy += dy * dy;
}

}  // namespace host
