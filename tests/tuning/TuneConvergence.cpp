// tune_convergence [COUNT [SEED]]: how the calibration of COUNT random front ends (default 10000)
// ends, with the call limit at its default and off, by how steep the sensor is per DC step.
//
// All runs are made back to back in one process, as a device makes them. Before each run of the
// first two tables a frame inside the band ends whatever was open and leaves nothing to remember;
// the third table leaves that out. Exit code 0, 2 for arguments that make no sense.
#include <fmt/core.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <exception>
#include <string>
#include <vector>

#include "replay/TuneRun.h"
#include "simulator/FrontEnd.h"

namespace {

constexpr int32_t kBound = 64;  // calls of a run without a limit
constexpr int32_t kTopDc = 255;
constexpr int64_t kMaxCount = 10'000'000;

constexpr size_t kEnds = static_cast<size_t>(host::TuneEnd::Failed) + 1;

// Why the register that was left behind does not show a mean in the band.
enum class Cause {
    None,       // it does
    TooDark,    // no DC is bright enough
    TooBright,  // no DC is dark enough
    Narrow,     // no DC hits the band between two that miss it
    TooSoon,    // the call limit ran out before a DC that exists was found
    Steps,      // the run ended or went on without finding it
};
constexpr size_t kCauses = static_cast<size_t>(Cause::Steps) + 1;

struct Group {
    const char* name;
    int32_t factor;  // true grey per DC step in hundredths, below this
};
constexpr std::array<Group, 5> kGroups = {{{"below 2", 200},
                                           {"2 to 5", 500},
                                           {"5 to 10", 1000},
                                           {"10 to 40", 4000},
                                           {"40 and more", INT32_MAX}}};

struct Outcome {
    host::TuneEnd end = host::TuneEnd::Unfinished;
    size_t calls = 0;
    bool good = false;  // a fresh frame with the register left behind lies in the band
    Cause cause = Cause::None;
};

struct Counts {
    int64_t runs = 0;
    int64_t good = 0;
    int64_t callLimitGood = 0;
    std::array<int64_t, kEnds> ends{};
    std::array<int64_t, kCauses> causes{};
    std::vector<size_t> calls;  // of the runs that ended

    void Add(const Outcome& outcome) {
        runs++;
        good += outcome.good ? 1 : 0;
        callLimitGood += outcome.good && outcome.end == host::TuneEnd::CallLimit ? 1 : 0;
        ends[static_cast<size_t>(outcome.end)]++;
        causes[static_cast<size_t>(outcome.cause)]++;
        if (outcome.end != host::TuneEnd::Unfinished)
            calls.push_back(outcome.calls);
    }
    int64_t Ends(host::TuneEnd end) const { return ends[static_cast<size_t>(end)]; }
    int64_t Causes(Cause cause) const { return causes[static_cast<size_t>(cause)]; }
};

// The darkest corner's mean, as the default selection takes it.
int32_t DarkestCorner(const std::vector<uint8_t>& raw, const host::Geometry& geometry) {
    const std::vector<uint8_t> picture = host::FromBlockOrder(raw, geometry);
    const int32_t width = geometry.Width();
    const int32_t height = geometry.Height();
    int32_t darkest = kTopDc;
    for (const int32_t top : {0, 3 * height / 4}) {
        for (const int32_t left : {0, 3 * width / 4}) {
            int32_t sum = 0;
            for (int32_t i = 0; i < width / 4 * (height / 4); ++i)
                sum += picture[static_cast<size_t>((top + i / (width / 4)) * width + left +
                                                   i % (width / 4))];
            darkest = std::min(darkest, sum / (width / 4 * (height / 4)));
        }
    }
    return darkest;
}

bool InBand(int32_t mean) {
    return mean >= 140 && mean <= 220;
}

// What the sensor can do at all: the mean at every DC of the range, on a sensor of the same plan.
Cause CauseOf(const host::FrontEndPlan& plan, const host::TuneSetup& setup,
              const host::TuneRun& run) {
    const host::Geometry geometry = host::GeometryOf(setup.params);
    host::FrontEnd sensor(plan, setup.params);
    int32_t reachable = 0;
    int32_t least = kTopDc;
    int32_t most = 0;
    for (int32_t dc = 128; dc <= kTopDc; ++dc) {
        const int32_t mean =
            DarkestCorner(sensor.Grab(host::RegisterOfDc(plan.layout, dc, 0)), geometry);
        reachable += InBand(mean) ? 1 : 0;
        least = std::min(least, mean);
        most = std::max(most, mean);
    }
    if (reachable == 0 && most < 140)
        return Cause::TooDark;
    if (reachable == 0 && least > 220)
        return Cause::TooBright;
    if (reachable == 0)
        return Cause::Narrow;
    return run.end == host::TuneEnd::CallLimit ? Cause::TooSoon : Cause::Steps;
}

Outcome Calibrate(const host::FrontEndPlan& plan, const host::TuneSetup& setup) {
    host::FrontEnd sensor(plan, setup.params);
    const host::TuneRun run = host::RunTuning(
        setup, [&sensor](uint32_t dac) { return sensor.Grab(dac); }, "tune_convergence");
    Outcome outcome;
    outcome.end = run.end;
    outcome.calls = run.calls.size();
    outcome.good =
        InBand(DarkestCorner(sensor.Grab(run.lastRegister), host::GeometryOf(setup.params)));
    if (!outcome.good)
        outcome.cause = CauseOf(plan, setup, run);
    return outcome;
}

// A frame of grey 180 in the band: completes at once and is remembered as nothing to step away
// from.
void Settle(const host::TuneSetup& setup) {
    const host::Geometry geometry = host::GeometryOf(setup.params);
    const std::vector<uint8_t> flat(static_cast<size_t>(geometry.Width() * geometry.Height()), 180);
    host::TuneSetup settling = setup;
    settling.start = host::RegisterOfDc(host::ParamValue(setup.params, "iDCMode"), 192, 0);
    host::RunTuning(
        settling, [&flat](uint32_t) { return flat; }, "tune_convergence");
}

size_t Percentile(std::vector<size_t> values, size_t percent) {
    if (values.empty())
        return 0;
    std::sort(values.begin(), values.end());
    return values[(values.size() - 1) * percent / 100];
}

void PrintHead(const std::string& title) {
    fmt::print(
        "{}\n{:<14}{:>7}{:>9}{:>12}{:>10}{:>9}{:>9}{:>12}{:>8}{:>5}{:>5} | {:>6}{:>8}{:>8}"
        "{:>9}{:>7}\n",
        title, "grey per DC", "runs", "in band", "call limit", "(good)", "at limit", "no step",
        "unfinished", "good", "p50", "p99", "dark", "bright", "narrow", "too soon", "steps");
}

void PrintRow(const std::string& name, const Counts& counts) {
    fmt::print(
        "{:<14}{:>7}{:>9}{:>12}{:>10}{:>9}{:>9}{:>12}{:>8}{:>5}{:>5} | {:>6}{:>8}{:>8}"
        "{:>9}{:>7}\n",
        name, counts.runs, counts.Ends(host::TuneEnd::InBand),
        counts.Ends(host::TuneEnd::CallLimit), counts.callLimitGood,
        counts.Ends(host::TuneEnd::AtLimit), counts.Ends(host::TuneEnd::NoStep),
        counts.Ends(host::TuneEnd::Unfinished), counts.good, Percentile(counts.calls, 50),
        Percentile(counts.calls, 99), counts.Causes(Cause::TooDark),
        counts.Causes(Cause::TooBright), counts.Causes(Cause::Narrow),
        counts.Causes(Cause::TooSoon), counts.Causes(Cause::Steps));
}

host::TuneSetup SetupOf(const host::FrontEndPlan& plan, int32_t limit) {
    host::TuneSetup setup;
    host::ParamValue(setup.params, "iDCMode") = plan.layout;
    host::ParamValue(setup.params, "_NAVI_TimeOut_threshold") = limit;
    setup.start = host::StartRegister(plan);
    setup.gain20 = plan.gain20;
    setup.gain2C = plan.gain2C;
    setup.maxCalls = kBound;
    return setup;
}

void Run(const std::string& title, int64_t count, uint64_t seed, int32_t limit, bool settle) {
    std::array<Counts, kGroups.size()> groups;
    Counts all;
    for (int64_t i = 0; i < count; ++i) {
        const host::FrontEndPlan plan =
            host::RandomFrontEnd(host::Mix64(seed) + static_cast<uint64_t>(i));
        const host::TuneSetup setup = SetupOf(plan, limit);
        if (settle)
            Settle(setup);
        const Outcome outcome = Calibrate(plan, setup);
        size_t group = 0;
        while (host::TrueGainFactor(plan) >= kGroups[group].factor)
            ++group;
        groups[group].Add(outcome);
        all.Add(outcome);
    }
    PrintHead(title);
    for (size_t i = 0; i < kGroups.size(); ++i)
        PrintRow(kGroups[i].name, groups[i]);
    PrintRow("all", all);
    fmt::print("\n");
}

}  // namespace

int main(int argc, char** argv) {
    const int64_t count = argc > 1 ? std::strtoll(argv[1], nullptr, 10) : 10000;
    const uint64_t seed = argc > 2 ? std::strtoull(argv[2], nullptr, 10) : 1;
    if (argc > 3 || count < 1 || count > kMaxCount) {
        fmt::print(stderr, "usage: tune_convergence [COUNT [SEED]], COUNT 1 to {}\n", kMaxCount);
        return 2;
    }
    try {
        Run("limit of 2 calls", count, seed, 2, true);
        Run(fmt::format("no limit, {} calls at most", kBound), count, seed, 0, true);
        Run("limit of 2 calls, remembering the run before", count, seed, 2, false);
    } catch (const std::exception& error) {
        fmt::print(stderr, "tune_convergence: {}\n", error.what());
        return 3;
    }
    return 0;
}
