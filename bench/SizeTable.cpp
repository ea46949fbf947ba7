// The table of other sizes. Whole pairs: the plain model and the module in turn. Steps: the
// module's time for a unit of work by what the same step takes at the default size, in the same
// run.
#include <algorithm>
#include <map>

#include "Tables.h"

namespace bench {
namespace {

constexpr int32_t kPairsLeast = 25;
constexpr int32_t kRoundsLeast = 3;
constexpr int32_t kManyPixels = 96 * 64;  // larger frames get a third of the rounds

// The default sizes come before those that are compared with them.
constexpr FrameSize kSizes[] = {
    kDefaultFp,
    {56, 38, Layout::Tiled},
    {60, 36, Layout::Tiled},
    {64, 64, Layout::Tiled},
    {72, 36, Layout::Tiled},
    {96, 64, Layout::Tiled},
    {56, 36, Layout::OneWindow},
    {80, 80, Layout::OneWindow},
    {128, 96, Layout::OneWindow},
    {200, 120, Layout::OneWindow},
    kDefaultHg,
    {80, 96, Layout::Hg},
};

bool IsDefault(const FrameSize& size) {
    return size == kDefaultFp || size == kDefaultHg;
}

// Large frames have many branches of their own: a set of about the same number of pixels is as hard
// for the branch predictor to learn.
Options OptionsFor(const FrameSize& size, const Options& options) {
    const int32_t pixels = size.width * size.height;
    const int32_t pairs = options.pairs * (kDefaultFp.width * kDefaultFp.height) / pixels;
    Options result = options;
    result.pairs = std::clamp(pairs, std::min(kPairsLeast, options.pairs), options.pairs);
    if (pixels > kManyPixels)
        result.rounds = std::max(options.rounds / 3, std::min(kRoundsLeast, options.rounds));
    return result;
}

// The work of each pair of set, whose parameters both sides have afterwards. Empty, and state has
// the error, when the sides disagree.
const std::vector<PairWork>& WorkOf(benchmark::State& state, PairKind kind, const PairSet& set) {
    static std::map<const PairSet*, std::vector<PairWork>> known;
    std::vector<PairWork>& work = known[&set];
    if (!work.empty()) {
        SetBothParams(set.params);
    } else if (BothAgree(state, kind, set)) {
        for (const FramePair& pair : set.pairs)
            work.push_back(MeasureWork(pair));
    }
    return work;
}

// Sets the counters of the module's time by the units of its work.
void CountUnits(benchmark::State& state, const Times& shipped, const std::vector<PairWork>& work,
                const Comparison& comparison, bool isDefault) {
    static std::map<std::string, double> ofDefault;
    if (comparison.unit == Unit::None)
        return;
    std::vector<double> units;
    units.reserve(work.size());
    for (const PairWork& pair : work)
        units.push_back(std::max(pair.Of(comparison.unit), 1.0));
    const double perUnit = shipped.MedianPerUnit(units);
    state.counters[kPerUnit] = perUnit;
    if (isDefault)
        ofDefault[comparison.name] = perUnit;
    const auto found = ofDefault.find(comparison.name);
    if (found != ofDefault.end())
        state.counters[kTimesDefault] = perUnit / found->second;
}

void MeasureAt(benchmark::State& state, const FrameSize& size, const Options& options,
               const Comparison& comparison) {
    const PairSet& set = PairsOf(comparison.kind, options.pairs, size);
    const std::vector<PairWork>& work = WorkOf(state, comparison.kind, set);
    if (work.empty())
        return;
    std::vector<TimedCall> calls;
    if (comparison.whole)
        calls.emplace_back([&](size_t i) { return TimeStep(comparison.plain, set.pairs[i]); });
    calls.emplace_back([&](size_t i) { return TimeStep(comparison.shipped, set.pairs[i]); });
    const std::vector<Times> times = Measure(state, calls, set.pairs.size());
    const double shipped = times.back().MedianMicroseconds();
    state.counters[kShipped] = shipped;
    if (comparison.whole) {
        state.counters[kPlain] = times.front().MedianMicroseconds();
        state.counters[kRatio] = times.front().MedianMicroseconds() / shipped;
    }
    CountUnits(state, times.back(), work, comparison, IsDefault(size));
}

void AddSizes(const Options& wanted) {
    for (const FrameSize& size : kSizes) {
        const Options options = OptionsFor(size, wanted);
        for (const Comparison& comparison : Comparisons()) {
            if (comparison.kind == PairKind::DoubleScan ||
                (comparison.kind == PairKind::Hg) != (size.layout == Layout::Hg))
                continue;
            AddRow(NameOf(size) + ": " + comparison.name, options,
                   [&size, options, &comparison](benchmark::State& state) {
                       MeasureAt(state, size, options, comparison);
                   });
        }
    }
}

}  // namespace

const Table kSizeTable = {"--geometries",
                          {{"size", "step"},
                           {{"plain us", kPlain, "%.2f"},
                            {"shipped us", kShipped, "%.2f"},
                            {"ratio", kRatio, "%.2f"},
                            {"ns a unit", kPerUnit, "%.4f"},
                            {"x default", kTimesDefault, "%.2f"}}},
                          AddSizes};

}  // namespace bench
