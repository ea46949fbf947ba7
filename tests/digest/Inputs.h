// The gestures and calibrations whose outputs are hashed. They are drawn from fixed seeds with
// integers alone and never depend on what either side answers, but for the calibrations: there the
// simulated front end shows what the DC register asks for.
#ifndef TESTS_DIGEST_INPUTS_H
#define TESTS_DIGEST_INPUTS_H

#include <cstdint>
#include <functional>

#include "HashedCalls.h"

namespace fpnavi_test {

// Called after each gesture and calibration with the name of its group and its number in it.
using Progress = std::function<void(const char* group, int64_t index)>;

// About `gestures` gestures and half as many calibrations. The groups with double scan come last,
// because it stays on: fp and hg without it, calibrations, double scan, fp and hg once more.
void RunAll(HashedCalls& calls, int64_t gestures, const Progress& progress);

// Gesture index of a group; mode as in host::Mode.
void RunSimulated(HashedCalls& calls, host::Mode mode, uint64_t seed);
void RunVaried(HashedCalls& calls, host::Mode mode, uint64_t seed);
void RunOtherGeometry(HashedCalls& calls, host::Mode mode, uint64_t seed);
void RunHostile(HashedCalls& calls, host::Mode mode, uint64_t seed);

// A calibration of a simulated front end, to its end or for 16 calls.
void CalibrateFrontEnd(HashedCalls& calls, host::Mode mode, uint64_t seed);
// Frames and registers at random, parameters from sane to hostile.
void CalibrateAtRandom(HashedCalls& calls, host::Mode mode, uint64_t seed);

}  // namespace fpnavi_test

#endif  // TESTS_DIGEST_INPUTS_H
