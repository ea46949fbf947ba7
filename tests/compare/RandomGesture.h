// Random parameter blocks and frames for the comparison of module and reference model, from sane to
// hostile. The same seed gives the same everywhere.
#ifndef TESTS_COMPARE_RANDOMGESTURE_H
#define TESTS_COMPARE_RANDOMGESTURE_H

#include <cstdint>
#include <vector>

#include "StepSizes.h"
#include "parameters/ParamTable.h"
#include "simulator/Arithmetic.h"

namespace fpnavi_test {

// The mode's defaults with about one in six of the thresholds and flags drawn anew around theirs.
host::ParamBlock VariedParams(host::SimRandom& random, host::Mode mode);

// Another sensor of 1 x 1 to 200 x 200 pixels, its sides often at the edges: block grid, tiles,
// gaps, templates and candidate number drawn, the larger the frame the fewer comparisons for the
// plain model; one in sixteen has tiles that do not match the image.
host::ParamBlock OtherGeometryParams(host::SimRandom& random, host::Mode mode);

// The same sensor with other tiles, templates and thresholds.
host::ParamBlock SameSensorParams(host::SimRandom& random, const host::ParamBlock& params);

// Sides of the frames of a gesture under params; 64 x 64 where these make no sense.
FrameSize PictureSize(const host::ParamBlock& params);

// Frames of a gesture: few of large ones.
int32_t RandomFrameCount(host::SimRandom& random, FrameSize size);

// One in twelve of the values at a boundary of its type or of sense.
host::ParamBlock HostileParams(host::SimRandom& random, host::Mode mode);

// The searches of a pair under params take few enough comparisons for the plain model, or so many
// that the module refuses the pair.
bool CheapEnough(const host::ParamBlock& params);

// Frames of a moving picture: ridges, noise, two levels or flat, in an ellipse, a rectangle or the
// whole frame, with jumps, rests and empty frames.
class MovingPicture {
  public:
    MovingPicture(uint64_t seed, int32_t width, int32_t height);
    std::vector<uint8_t> Next();
    // The frames from now on.
    void SetSize(int32_t width, int32_t height) {
        m_width = width;
        m_height = height;
    }

  private:
    uint8_t GreyAt(int32_t column, int32_t row) const;
    bool InFinger(int32_t column, int32_t row) const;

    host::SimRandom m_random;
    uint64_t m_seed;
    int32_t m_width;
    int32_t m_height;
    int32_t m_style;
    int32_t m_shape;
    int32_t m_period;
    int32_t m_slope;
    int32_t m_background;
    int32_t m_noise;
    int32_t m_x = 0;
    int32_t m_y = 0;
    int32_t m_dx;
    int32_t m_dy;
    int32_t m_size;
};

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_RANDOMGESTURE_H
