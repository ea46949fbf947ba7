// Corpora of simulated gestures: the i-th gesture of a seed, in any order and without memory.
//
// Modes: 45 % fp with nine tiles, 10 % fp plain, 25 % hg, 20 % double scan. Kinds in each mode:
// 45 % strokes along an axis, 24 % rests, taps and long presses, 31 % drifts, diagonals, reversals,
// fast, slow, small and very wide ones (see RandomPlan).
#ifndef FPNAVI_HOST_CORPUS_H
#define FPNAVI_HOST_CORPUS_H

#include <cstdint>

#include "recording/Recording.h"
#include "simulator/Plan.h"

namespace host {

// Plan of gesture index (from 0) of the corpus of seed.
SimPlan CorpusPlan(uint64_t seed, int64_t index);

// The gesture itself; its id is "sim-<seed>-<index>", the index in at least 7 digits.
Gesture SimulateCorpusGesture(uint64_t seed, int64_t index);

}  // namespace host

#endif  // FPNAVI_HOST_CORPUS_H
