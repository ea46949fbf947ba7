// Parameter blocks at and around the limits of their values.
#ifndef TESTS_RELIABILITY_HOSTILEBLOCKS_H
#define TESTS_RELIABILITY_HOSTILEBLOCKS_H

#include <cstdint>
#include <vector>

#include "parameters/ParamTable.h"
#include "simulator/Arithmetic.h"

namespace fpnavi_test {

// The values at which a parameter with this default may turn: the ends of the type, around 0,
// around the default, around 255. Without repetitions.
std::vector<int32_t> BoundaryValues(int32_t defaultValue);

// Each value but the mode from one of three: its boundaries (one in 60, so that most blocks hold
// one or a few), its default and up to 20 percent around it, or its sane range, 0 to twice the
// default and at least to 3 (from 1 for sizes, 0 or 1 evenly for switches). Sizes that belong
// together (tiles and image) are fitted to each other, unless they stand at a boundary.
host::ParamBlock RandomHostileBlock(host::SimRandom& random, host::Mode mode);

}  // namespace fpnavi_test

#endif  // TESTS_RELIABILITY_HOSTILEBLOCKS_H
