// Frames of any size for the search of slow geometries: ridges, or what has none.
#ifndef BENCH_DRAWNFRAMES_H
#define BENCH_DRAWNFRAMES_H

#include "FramePairs.h"
#include "simulator/Frame.h"

namespace bench {

class DrawnFrames {
  public:
    // Mostly ridges, sometimes noise or one grey level.
    DrawnFrames(const host::ParamBlock& params, host::SimRandom& random);

    // A pair that mostly moves by 4 to 8 pixels and sometimes rests.
    FramePair Next(host::SimRandom& random) const;

    const char* Name() const;

  private:
    enum class Content { Ridges, Noise, Flat };

    Frame Ridges(const host::FingerState& finger, host::SimRandom& random) const;
    Frame Picture(const host::FingerState& finger, host::SimRandom& random) const;

    host::SensorWindow m_window;
    host::ContactPatch m_patch;
    int32_t m_skin;  // which of a few
    Content m_content;
};

}  // namespace bench

#endif  // BENCH_DRAWNFRAMES_H
