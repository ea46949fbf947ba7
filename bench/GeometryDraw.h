// Random parameters and frames for the search of a geometry at which the module is slow.
#ifndef BENCH_GEOMETRYDRAW_H
#define BENCH_GEOMETRYDRAW_H

#include <string>

#include "FramePairs.h"

namespace bench {

struct GeometryDraw {
    uint64_t number = 0;
    PairSet set;          // some pairs under the same parameters
    std::string outcome;  // what the plain model does with the first pair
    std::string text;     // parameters that differ from the default, and the kind of frames
};

// The draw of that number; equal seeds and numbers give equal draws. Its parameters pass the checks
// of both sides before any work, mostly suit the frames, and keep a pair of the plain model to some
// 100 ms. Both sides have its parameters afterwards.
GeometryDraw DrawGeometry(uint64_t seed, uint64_t number);

}  // namespace bench

#endif  // BENCH_GEOMETRYDRAW_H
