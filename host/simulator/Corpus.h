// Corpora of simulated gestures: the i-th gesture of a seed, in any order and without memory.
//
// Modes: 45 % fp with nine tiles, 10 % fp plain, 25 % hg, 20 % double scan. Kinds in each mode:
// 45 % strokes along an axis, 24 % rests, taps and long presses, 31 % drifts, diagonals, reversals,
// fast, slow, small and very wide ones (see RandomPlan).
#ifndef FPNAVI_HOST_CORPUS_H
#define FPNAVI_HOST_CORPUS_H

#include <cstdint>
#include <functional>

#include "recording/Recording.h"
#include "simulator/Plan.h"

namespace host {

// Plan of gesture index (from 0) of the corpus of seed.
SimPlan CorpusPlan(uint64_t seed, int64_t index);

// The gesture itself; its id is "sim-<seed>-<index>", the index in at least 7 digits.
Gesture SimulateCorpusGesture(uint64_t seed, int64_t index);

// Gestures first .. first + count - 1 of a seed.
struct CorpusPart {
    uint64_t seed = 1;
    int64_t first = 0;
    int64_t count = 0;
};

// Calls take with each gesture of part, in their order, in the calling thread; so many threads (0:
// one for each processor) simulate them meanwhile. take returns false to end it. What take throws
// ends it, too.
void SimulateCorpus(const CorpusPart& part, int32_t threads,
                    const std::function<bool(Gesture&&)>& take);

}  // namespace host

#endif  // FPNAVI_HOST_CORPUS_H
