// The measured steps, each for the plain model and for the module.
#ifndef BENCH_STEPS_H
#define BENCH_STEPS_H

#include <vector>

#include "FramePairs.h"
#include "PairWork.h"

namespace bench {

// One step of one side: prepare brings it into the state in which the step is due, run is the step
// and all that is timed, finish releases what prepare took.
struct Step {
    void (*prepare)(const FramePair& pair);
    void (*run)(const FramePair& pair);
    void (*finish)();
};

struct Comparison {
    const char* name;
    PairKind kind;
    Unit unit;   // of the step's work
    bool whole;  // a call of the library, not a step within one
    Step plain;
    Step shipped;
};

// In the order in which they have to run: the double scan is last, since it lasts for the process.
const std::vector<Comparison>& Comparisons();

// Both sides take params, and the plain model the module's texture test.
void SetBothParams(const int32_t* params);

// Both sides give the same results and the same record for pair.
bool SameRecords(PairKind kind, const FramePair& pair);

}  // namespace bench

#endif  // BENCH_STEPS_H
