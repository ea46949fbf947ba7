// The table of the default size: each step of the plain model and of the module, in turn.
#include "Tables.h"

namespace bench {
namespace {

void Compare(benchmark::State& state, const Options& options, const Comparison& comparison) {
    const bool hg = comparison.kind == PairKind::Hg;
    const PairSet& set = PairsOf(comparison.kind, options.pairs, hg ? kDefaultHg : kDefaultFp);
    if (!BothAgree(state, comparison.kind, set))
        return;
    const auto timed = [&set](const Step& step) {
        return [&set, &step](size_t pair) { return TimeStep(step, set.pairs[pair]); };
    };
    const std::vector<Times> times =
        Measure(state, {timed(comparison.plain), timed(comparison.shipped)}, set.pairs.size());
    state.counters[kPlain] = times[0].MedianMicroseconds();
    state.counters[kShipped] = times[1].MedianMicroseconds();
    state.counters[kRatio] = times[0].MedianMicroseconds() / times[1].MedianMicroseconds();
}

void AddSteps(const Options& options) {
    for (const Comparison& comparison : Comparisons())
        AddRow(comparison.name, options, [options, &comparison](benchmark::State& state) {
            Compare(state, options, comparison);
        });
}

}  // namespace

const Table kStepTable = {
    "",
    {{"step"},
     {{"plain us", kPlain, "%.2f"}, {"shipped us", kShipped, "%.2f"}, {"ratio", kRatio, "%.1f"}}},
    AddSteps};

}  // namespace bench
