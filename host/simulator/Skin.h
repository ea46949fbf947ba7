// The skin of one simulated finger: a ridge pattern with a core, minutiae and irregularities.
//
// The pattern is a function of the seed and the position alone. It is computed where it is needed
// and kept, so that a finger that moves shows the same skin again.
#ifndef FPNAVI_HOST_SKIN_H
#define FPNAVI_HOST_SKIN_H

#include <cstddef>
#include <cstdint>
#include <vector>

#include "simulator/Arithmetic.h"

namespace host {

// What a finger's skin looks like.
struct SkinShape {
    uint64_t seed = 0;
    int32_t period16 = 144;  // ridge to ridge in 1/16 pixel, 112 to 160 (7 to 10 pixels)
    int32_t dryness = 0;     // 0 .. 100: how much of the ridges is broken
};

// Gradient energy of skin heights over a patch, summed over its points.
struct SkinGradient {
    int64_t xx = 0;
    int64_t xy = 0;
    int64_t yy = 0;
};

class Skin {
  public:
    explicit Skin(const SkinShape& shape);

    // Height of the skin, 0 deepest valley .. 255 top of a ridge, at a position in 1/16 pixel from
    // the finger's centre, x to the right, y downwards; bilinear between whole pixels. Positions
    // further out than kReach pixels show the skin at kReach.
    int32_t HeightAt(int32_t x16, int32_t y16);

    // Adds the gradient at a position (as HeightAt) to sum.
    void AddGradient(int32_t x16, int32_t y16, SkinGradient& sum);

    static constexpr int32_t kReach = 126;

  private:
    // A ridge that begins or forks: the phase turns once around it.
    struct Minutia {
        int32_t x;
        int32_t y;
        bool clockwise;
    };

    uint8_t CellHeight(int32_t x, int32_t y);
    int32_t ComputeHeight(int32_t x, int32_t y) const;
    uint32_t RidgePhase(int32_t x, int32_t y) const;
    int32_t CoreDistance16(int32_t x16, int32_t y16) const;

    SkinShape m_shape;
    std::vector<Lattice> m_layers;  // of noise
    int32_t m_coreX16;
    int32_t m_coreY16;
    int32_t m_coreLength16;  // the core is a line; ridges run around it
    uint32_t m_coreAxis;
    int32_t m_blotch;  // strength of the irregularities of 8 and of 4 pixels, in 1/64
    int32_t m_grain;
    std::vector<Minutia> m_minutiae;
    std::vector<uint8_t> m_heights;
    std::vector<uint8_t> m_known;
};

}  // namespace host

#endif  // FPNAVI_HOST_SKIN_H
