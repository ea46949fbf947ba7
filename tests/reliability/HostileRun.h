// A short gesture, tuning calls and the votes under a parameter block, in module and plain model.
#ifndef TESTS_RELIABILITY_HOSTILERUN_H
#define TESTS_RELIABILITY_HOSTILERUN_H

#include <cstdint>

#include "recording/Recording.h"

namespace fpnavi_test {

// How far the gesture of a block came.
struct Reached {
    bool alone = false;     // too much for the model
    int64_t aloneMs = 0;    // processor time of all its calls then
    bool centroid = false;  // a pair was counted
    bool noMove = false;    // the no-move test judged a pair
    bool match = false;     // template matching did
    bool key = false;       // the vote of a counted pair gave a key
};

// Runs the block with the picture of seed and fails the test after a crash or a difference, with
// the result false. A block whose searches are too much for the model runs in the module alone, in
// a process of its own.
bool RunHostile(const host::ParamBlock& params, host::Mode mode, uint64_t seed, Reached* reached);

}  // namespace fpnavi_test

#endif  // TESTS_RELIABILITY_HOSTILERUN_H
