// The tables that fpnavi_bench prints, and what their rows have in common.
#ifndef BENCH_TABLES_H
#define BENCH_TABLES_H

#include <functional>
#include <string>
#include <vector>

#include "Report.h"
#include "Steps.h"
#include "Timing.h"

namespace bench {

struct Options {
    int32_t pairs = 300;  // of each kind, at the default size
    int32_t rounds = 9;
};

struct Table {
    const char* option;  // that asks for it; empty for the one without options
    TableFormat format;
    void (*addRows)(const Options& options);
};

// Every step and whole pairs at the default size.
extern const Table kStepTable;
// Whole pairs at other sizes, and what a step takes there by its units of work.
extern const Table kSizeTable;
// What else a user could take for the displacement of a pair.
extern const Table kPeerTable;

// Adds a benchmark that sets its counters after options.rounds iterations.
void AddRow(const std::string& name, const Options& options,
            const std::function<void(benchmark::State&)>& function);

// Runs the calls on all pairs in the rounds of state: the times of each call.
std::vector<Times> Measure(benchmark::State& state, const std::vector<TimedCall>& calls,
                           size_t pairs);

// Nanoseconds of the step, prepared and finished outside of them.
double TimeStep(const Step& step, const FramePair& pair);

// Sets both sides' parameters to those of set. True when both give the same record for each of its
// pairs, of which there is at least one; otherwise state has the error and AnyFailed holds.
bool BothAgree(benchmark::State& state, PairKind kind, const PairSet& set);
bool AnyFailed();

// The pairs of a kind and size, made once.
const PairSet& PairsOf(PairKind kind, int32_t count, const FrameSize& size);

}  // namespace bench

#endif  // BENCH_TABLES_H
