#include "Tables.h"

#include <map>

namespace bench {
namespace {

bool s_failed = false;

}  // namespace

void AddRow(const std::string& name, const Options& options,
            const std::function<void(benchmark::State&)>& function) {
    benchmark::RegisterBenchmark(name.c_str(), function)
        ->UseManualTime()
        ->Iterations(options.rounds)
        ->Unit(benchmark::kMicrosecond);
}

std::vector<Times> Measure(benchmark::State& state, const std::vector<TimedCall>& calls,
                           size_t pairs) {
    std::vector<Times> times(calls.size(), Times(pairs));
    for (auto _ : state)
        state.SetIterationTime(TakeTurns(calls, pairs, &times) * 1e-9);
    return times;
}

double TimeStep(const Step& step, const FramePair& pair) {
    step.prepare(pair);
    const double time = TimeOf([&] { step.run(pair); });
    step.finish();
    return time;
}

bool BothAgree(benchmark::State& state, PairKind kind, const PairSet& set) {
    SetBothParams(set.params);
    bool agree = !set.pairs.empty();
    for (const FramePair& pair : set.pairs)
        agree = agree && SameRecords(kind, pair);
    if (!agree) {
        s_failed = true;
        state.SkipWithError(set.pairs.empty()
                                ? "no pairs"
                                : "the plain model and the module give different records");
    }
    return agree;
}

bool AnyFailed() {
    return s_failed;
}

const PairSet& PairsOf(PairKind kind, int32_t count, const FrameSize& size) {
    static std::map<std::pair<PairKind, std::string>, PairSet> sets;
    const std::pair<PairKind, std::string> key = {kind, NameOf(size)};
    const auto found = sets.find(key);
    if (found != sets.end())
        return found->second;
    return sets.emplace(key, MakePairs(kind, count, size)).first->second;
}

}  // namespace bench
