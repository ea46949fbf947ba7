// The benchmarks: every step and whole pairs, the plain model and the module in the same run.
//
//   fpnavi_bench [--json] [--pairs=N] [--rounds=N] [--benchmark_filter=REGEX ...]
#include <algorithm>
#include <cstdlib>
#include <functional>
#include <map>
#include <string>
#include <vector>

#include "Peers.h"
#include "Report.h"
#include "Steps.h"
#include "Timing.h"

namespace bench {
namespace {

int32_t s_pairNum = 300;
int32_t s_rounds = 9;
bool s_failed = false;

const PairSet& PairsOf(PairKind kind) {
    static std::map<PairKind, PairSet> sets;
    const auto found = sets.find(kind);
    if (found != sets.end())
        return found->second;
    return sets.emplace(kind, MakePairs(kind, s_pairNum)).first->second;
}

double TimeStep(const Step& step, const FramePair& pair) {
    step.prepare(pair);
    const double time = TimeOf([&] { step.run(pair); });
    step.finish();
    return time;
}

void Compare(benchmark::State& state, const Comparison& comparison) {
    const PairSet& set = PairsOf(comparison.kind);
    SetBothParams(set.params);
    for (const FramePair& pair : set.pairs) {
        if (!SameRecords(comparison.kind, pair)) {
            s_failed = true;
            state.SkipWithError("the plain model and the module give different records");
            return;
        }
    }
    Times plain(set.pairs.size());
    Times shipped(set.pairs.size());
    bool plainFirst = true;
    for (auto _ : state) {
        double sum = 0;
        for (size_t i = 0; i < set.pairs.size(); ++i, plainFirst = !plainFirst) {
            if (plainFirst)
                plain.Add(i, TimeStep(comparison.plain, set.pairs[i]));
            const double time = TimeStep(comparison.shipped, set.pairs[i]);
            if (!plainFirst)
                plain.Add(i, TimeStep(comparison.plain, set.pairs[i]));
            shipped.Add(i, time);
            sum += time;
        }
        state.SetIterationTime(sum / static_cast<double>(set.pairs.size()) * 1e-9);
    }
    state.counters[kPlain] = plain.MedianMicroseconds();
    state.counters[kShipped] = shipped.MedianMicroseconds();
    state.counters[kRatio] = plain.MedianMicroseconds() / shipped.MedianMicroseconds();
}

void TimePeer(benchmark::State& state, const Peer& peer) {
    const PairSet& set = PairsOf(PairKind::Moved);
    Times times(set.pairs.size());
    for (auto _ : state) {
        double sum = 0;
        for (size_t i = 0; i < set.pairs.size(); ++i) {
            const double time = TimeOf([&] { peer.run(set.pairs[i]); });
            times.Add(i, time);
            sum += time;
        }
        state.SetIterationTime(sum / static_cast<double>(set.pairs.size()) * 1e-9);
    }
    state.counters[kPeer] = times.MedianMicroseconds();
}

void Register(const std::string& name, const std::function<void(benchmark::State&)>& function) {
    benchmark::RegisterBenchmark(name.c_str(), function)
        ->UseManualTime()
        ->Iterations(s_rounds)
        ->Unit(benchmark::kMicrosecond);
}

// Takes the options of this program out of the arguments; the others are the library's.
void ReadOptions(std::vector<std::string>* arguments) {
    std::vector<std::string> rest;
    for (const std::string& argument : *arguments) {
        if (argument == "--json")
            rest.emplace_back("--benchmark_format=json");
        else if (argument.rfind("--pairs=", 0) == 0)
            s_pairNum = std::max(std::atoi(argument.c_str() + 8), 1);
        else if (argument.rfind("--rounds=", 0) == 0)
            s_rounds = std::max(std::atoi(argument.c_str() + 9), 1);
        else
            rest.push_back(argument);
    }
    *arguments = rest;
}

bool WantsTable(const std::vector<std::string>& arguments) {
    for (const std::string& argument : arguments) {
        if (argument.rfind("--benchmark_format", 0) == 0)
            return false;
    }
    return true;
}

int Main(std::vector<std::string> arguments) {
    ReadOptions(&arguments);
    const bool table = WantsTable(arguments);
    std::vector<char*> pointers;
    for (std::string& argument : arguments)
        pointers.push_back(argument.data());
    int count = static_cast<int>(pointers.size());
    benchmark::Initialize(&count, pointers.data());
    if (benchmark::ReportUnrecognizedArguments(count, pointers.data()))
        return 2;
    const std::vector<Peer> peers = Peers();
    for (const Peer& peer : peers)
        Register(peer.name, [&peer](benchmark::State& state) { TimePeer(state, peer); });
    for (const Comparison& comparison : Comparisons())
        Register(comparison.name,
                 [&comparison](benchmark::State& state) { Compare(state, comparison); });
    if (table) {
        TableReporter reporter;
        benchmark::RunSpecifiedBenchmarks(&reporter);
    } else {
        benchmark::RunSpecifiedBenchmarks();
    }
    return s_failed ? 1 : 0;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
    return bench::Main(std::vector<std::string>(argv, argv + argc));
}
