// How much work the steps have with a pair, in units that do not depend on the size of its frames.
#ifndef BENCH_PAIRWORK_H
#define BENCH_PAIRWORK_H

#include <cstdint>

#include "FramePairs.h"

namespace bench {

enum class Unit : int32_t {
    None,        // a step without a unit of its own
    FramePixel,  // a pixel of one frame, gaps left out
    Placement,   // a template pixel at one placement, of the templates that are in the finger
    Match,       // a frame pixel under one candidate
    Joint,       // the two before it together
};

struct PairWork {
    double pixels = 0;
    double placements = 0;
    double matches = 0;

    // 1 for Unit::None.
    double Of(Unit unit) const;
};

// The plain model, whose parameters are the pair's, works through the pair.
PairWork MeasureWork(const FramePair& pair);

}  // namespace bench

#endif  // BENCH_PAIRWORK_H
