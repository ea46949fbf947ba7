// Integer arithmetic of the simulator; see Arithmetic.h.
#include "simulator/Arithmetic.h"

#include <array>
#include <cmath>

namespace host {
namespace {

constexpr uint64_t kGoldenStep = 0x9E3779B97F4A7C15ULL;  // odd, bits spread evenly

// Standard deviation of the sum of four uniform bytes: sqrt(4 * (256^2 - 1) / 12).
constexpr int32_t kByteSumDeviation = 148;
constexpr int32_t kByteSumMean = 510;

// 32767 * sin(i / 64 of a right angle).
constexpr std::array<int32_t, 65> kSinTable = {
    0,     804,   1608,  2410,  3212,  4011,  4808,  5602,  6393,  7179,  7962,  8739,  9512,
    10278, 11039, 11793, 12539, 13279, 14010, 14732, 15446, 16151, 16846, 17530, 18204, 18868,
    19519, 20159, 20787, 21403, 22005, 22594, 23170, 23731, 24279, 24811, 25329, 25832, 26319,
    26790, 27245, 27683, 28105, 28510, 28898, 29268, 29621, 29956, 30273, 30571, 30852, 31113,
    31356, 31580, 31785, 31971, 32137, 32285, 32412, 32521, 32609, 32678, 32728, 32757, 32767};

// atan(i / 64) in 1/65536 turn.
constexpr std::array<int32_t, 65> kAtanTable = {
    0,    163,  326,  489,  651,  813,  975,  1136, 1297, 1457, 1617, 1775, 1933,
    2090, 2246, 2401, 2555, 2708, 2860, 3010, 3159, 3307, 3453, 3599, 3742, 3884,
    4025, 4164, 4302, 4438, 4572, 4705, 4836, 4966, 5094, 5220, 5344, 5467, 5589,
    5708, 5826, 5943, 6058, 6171, 6282, 6392, 6500, 6607, 6712, 6815, 6917, 7018,
    7117, 7214, 7310, 7405, 7498, 7589, 7679, 7768, 7856, 7942, 8026, 8110, 8192};

// Linear between two entries; step is the distance of the entries, a power of two.
int32_t Interpolate(const std::array<int32_t, 65>& table, int32_t position, int32_t step) {
    const auto index = static_cast<size_t>(position / step);
    const int32_t rest = position % step;
    if (rest == 0)
        return table[index];
    return table[index] + (table[index + 1] - table[index]) * rest / step;
}

int32_t LatticeValue(uint64_t seed, uint32_t column, uint32_t row) {
    const uint64_t key = seed ^ ((static_cast<uint64_t>(row) << 32) | column) * kGoldenStep;
    return static_cast<int32_t>(Mix64(key) >> 56) - 128;
}

// 3 t^2 - 2 t^3 in 1/256 for t in 1/256, 0 .. 255.
int32_t SmoothStep(uint32_t t) {
    return static_cast<int32_t>(t * t * (768 - 2 * t) / 65536);
}

// Coordinates above 0, so that cells are found by a shift.
uint32_t LatticeCell(int32_t x) {
    return static_cast<uint32_t>(x + (1 << 20));
}

// value(column, row) at the corners of the cell of (x, y), interpolated.
template <typename Value>
int32_t Smoothed(int32_t x, int32_t y, uint32_t cellBits, Value value) {
    const uint32_t column = LatticeCell(x) >> cellBits;
    const uint32_t row = LatticeCell(y) >> cellBits;
    const uint32_t inCell = (1U << cellBits) - 1;
    const int32_t sx = SmoothStep((LatticeCell(x) & inCell) << (8 - cellBits));
    const int32_t sy = SmoothStep((LatticeCell(y) & inCell) << (8 - cellBits));
    const int32_t top = value(column, row) * (256 - sx) + value(column + 1, row) * sx;
    const int32_t bottom = value(column, row + 1) * (256 - sx) + value(column + 1, row + 1) * sx;
    return FloorDiv(top * (256 - sy) + bottom * sy, 65536);
}

}  // namespace

uint64_t SimRandom::Next() {
    m_state += kGoldenStep;
    return Mix64(m_state);
}

int32_t SimRandom::Below(int32_t count) {
    return static_cast<int32_t>(((Next() >> 32) * static_cast<uint64_t>(count)) >> 32);
}

int32_t SimRandom::Range(int32_t low, int32_t high) {
    return low + Below(high - low + 1);
}

bool SimRandom::Chance(int32_t percent) {
    return Below(100) < percent;
}

int32_t SimRandom::Noise(int32_t deviation16) {
    const uint64_t bits = Next();
    const auto sum = static_cast<int32_t>((bits & 255) + ((bits >> 8) & 255) +
                                          ((bits >> 16) & 255) + ((bits >> 24) & 255));
    const int32_t scaled = (sum - kByteSumMean) * deviation16;
    return FloorDiv(scaled + kByteSumDeviation * 8, kByteSumDeviation * 16);
}

int32_t Sin(uint32_t angle) {
    const auto rest = static_cast<int32_t>(angle % kQuarterTurn);
    switch (angle / kQuarterTurn % 4) {
        case 0:
            return Interpolate(kSinTable, rest, 256);
        case 1:
            return Interpolate(kSinTable, 16384 - rest, 256);
        case 2:
            return -Interpolate(kSinTable, rest, 256);
        default:
            return -Interpolate(kSinTable, 16384 - rest, 256);
    }
}

int32_t Cos(uint32_t angle) {
    return Sin(angle + kQuarterTurn);
}

uint32_t Atan2(int32_t y, int32_t x) {
    const int32_t absX = x < 0 ? -x : x;
    const int32_t absY = y < 0 ? -y : y;
    if (absX == 0 && absY == 0)
        return 0;
    const bool steep = absY > absX;
    // The ratio of the smaller to the larger side in 1/4096; 2^18 * 2^12 fits 31 bits.
    const int32_t ratio = steep ? absX * 4096 / absY : absY * 4096 / absX;
    int32_t angle = Interpolate(kAtanTable, ratio, 64);
    angle = steep ? 16384 - angle : angle;
    angle = x < 0 ? 32768 - angle : angle;
    return static_cast<uint32_t>(y < 0 ? 65536 - angle : angle) % kFullTurn;
}

uint32_t AngleOfDegrees(int32_t degrees) {
    const int32_t turn = (degrees % 360 + 360) % 360;
    return static_cast<uint32_t>(turn * 65536 / 360);
}

// The processor's root may be off where value has more than 53 bits or the double was rounded up to
// a square; it is within 1 of the true one, since doubles have 53 bits and the root 31.
uint32_t SquareRoot(uint64_t value) {
    auto root = static_cast<uint64_t>(std::sqrt(static_cast<double>(value)));
    while (root * root > value)
        --root;
    while ((root + 1) * (root + 1) <= value)
        ++root;
    return static_cast<uint32_t>(root);
}

int32_t LatticeNoise(uint64_t seed, int32_t x, int32_t y, uint32_t cellBits) {
    return Smoothed(x, y, cellBits, [seed](uint32_t column, uint32_t row) {
        return LatticeValue(seed, column, row);
    });
}

Lattice::Lattice(uint64_t seed, int32_t reach, uint32_t cellBits)
    : m_cellBits(cellBits),
      m_first(LatticeCell(-reach) >> cellBits),
      m_side((LatticeCell(reach) >> cellBits) - m_first + 2),
      m_values(static_cast<size_t>(m_side) * m_side) {
    size_t index = 0;
    for (uint32_t row = m_first; row < m_first + m_side; ++row) {
        for (uint32_t column = m_first; column < m_first + m_side; ++column)
            m_values[index++] = static_cast<int8_t>(LatticeValue(seed, column, row));
    }
}

int32_t Lattice::At(int32_t x, int32_t y) const {
    return Smoothed(x, y, m_cellBits, [this](uint32_t column, uint32_t row) {
        return int32_t{m_values[static_cast<size_t>(row - m_first) * m_side + (column - m_first)]};
    });
}

}  // namespace host
