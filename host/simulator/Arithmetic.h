// The simulator's arithmetic: a generator of its own, trigonometry from tables, lattice noise.
//
// Integers only (the square root starts from a floating one and corrects it), no right shift of
// negative numbers, no plain char: the same bytes come out on every processor and compiler. Angles
// are in 1/65536 turn; positions in 1/16 pixel end in 16.
#ifndef FPNAVI_HOST_ARITHMETIC_H
#define FPNAVI_HOST_ARITHMETIC_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace host {

constexpr int32_t kSubPixels = 16;        // steps of a position per pixel
constexpr int32_t kSinOne = 32767;        // Sin and Cos of a full amplitude
constexpr uint32_t kFullTurn = 65536;     // one turn
constexpr uint32_t kQuarterTurn = 16384;  // a right angle

// A well mixed 64-bit value of key; equal keys give equal values.
inline uint64_t Mix64(uint64_t key) {
    key = (key ^ (key >> 30)) * 0xBF58476D1CE4E5B9ULL;
    key = (key ^ (key >> 27)) * 0x94D049BB133111EBULL;
    return key ^ (key >> 31);
}

// Quotient rounded towards minus infinity; divisor above 0.
constexpr int32_t FloorDiv(int32_t value, int32_t divisor) {
    const int32_t quotient = value / divisor;
    return value % divisor < 0 ? quotient - 1 : quotient;
}

// Pseudo-random numbers from a 64-bit seed: a counter that is mixed.
class SimRandom {
  public:
    explicit SimRandom(uint64_t seed) : m_state(seed) {}

    uint64_t Next();

    // 0 .. count - 1; count at least 1.
    int32_t Below(int32_t count);

    // low .. high, both inclusive; low <= high.
    int32_t Range(int32_t low, int32_t high);

    // True in percent of 100 cases.
    bool Chance(int32_t percent);

    // Bell-shaped around 0 with the standard deviation deviation16 / 16, rounded.
    int32_t Noise(int32_t deviation16);

  private:
    uint64_t m_state;
};

// -kSinOne .. kSinOne; angle in 1/65536 turn, any value.
int32_t Sin(uint32_t angle);
int32_t Cos(uint32_t angle);

// Direction of (x, y) as an angle, 0 .. 65535; 0 for the zero vector. |x|, |y| below 2^18.
uint32_t Atan2(int32_t y, int32_t x);

// Angle of degrees, any sign.
uint32_t AngleOfDegrees(int32_t degrees);

// Largest integer whose square is at most value; value below 2^62.
uint32_t SquareRoot(uint64_t value);

// Smooth noise, -128 .. 127, over a lattice of 2^cellBits units, cellBits at most 8; |x|, |y| <
// 2^20.
int32_t LatticeNoise(uint64_t seed, int32_t x, int32_t y, uint32_t cellBits);

// The same noise from a table of the lattice: for many places near the origin.
class Lattice {
  public:
    // reach: a multiple of 2^cellBits; At may be asked for -reach .. reach.
    Lattice(uint64_t seed, int32_t reach, uint32_t cellBits);

    int32_t At(int32_t x, int32_t y) const;

  private:
    uint32_t m_cellBits;
    uint32_t m_first;  // column and row of the first value
    uint32_t m_side;
    std::vector<int8_t> m_values;
};

constexpr int32_t ClampTo(int32_t value, int32_t low, int32_t high) {
    return value < low ? low : (value > high ? high : value);
}

}  // namespace host

#endif  // FPNAVI_HOST_ARITHMETIC_H
