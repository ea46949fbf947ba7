// Looks for parameters at which the module is slower than the plain model.
//
//   geometry_search [--draws=N] [--first=K] [--seed=S] [--report=N] [--write=FILE]
//
// Times pairs of N random draws (default 1000, from number K on), both versions in turn, the least
// processor time of some rounds, and prints those with the least ratios of plain to shipped. A
// ratio below 1.05 is measured three times more; the median counts.
// --write: the pairs of the draw with the least ratio, for pair_driver. Exit code 1 when a draw is
// more than 5 percent slower in all three, or when the two versions give different records.
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "GeometryDraw.h"
#include "Steps.h"
#include "Timing.h"

namespace bench {
namespace {

constexpr double kDoubtful = 1.05;    // plain by shipped: measured again
constexpr double kSlower = 1 / 1.05;  // plain by shipped: more than 5 percent slower
constexpr size_t kRepeats = 3;
constexpr double kNanoseconds = 4e7;  // of the plain model for one draw
constexpr double kRoundsLeast = 5;
constexpr double kRoundsMost = 51;

struct Arguments {
    uint64_t draws = 1000;
    uint64_t first = 0;
    uint64_t seed = 1;
    size_t report = 20;
    std::string write;
};

struct Finding {
    GeometryDraw draw;  // without its pairs
    double plainUs = 0;
    double shippedUs = 0;
    std::vector<double> ratios;  // the first, and those measured again

    double Ratio() const { return Median(ratios); }
    bool Slower() const {
        return ratios.size() > kRepeats &&
               *std::max_element(ratios.begin() + 1, ratios.end()) < kSlower;
    }
};

bool ReadArguments(int argc, char** argv, Arguments* arguments) {
    for (int i = 1; i < argc; ++i) {
        char* const equals = std::strchr(argv[i], '=');
        if (equals == nullptr)
            return false;
        const std::string name(argv[i], equals);
        const uint64_t number = std::strtoull(equals + 1, nullptr, 10);
        if (name == "--draws")
            arguments->draws = number;
        else if (name == "--first")
            arguments->first = number;
        else if (name == "--seed")
            arguments->seed = number;
        else if (name == "--report")
            arguments->report = static_cast<size_t>(number);
        else if (name == "--write")
            arguments->write = equals + 1;
        else
            return false;
    }
    return true;
}

const Comparison& WholePair() {
    for (const Comparison& comparison : Comparisons()) {
        if (comparison.whole && comparison.kind == PairKind::Moved)
            return comparison;
    }
    std::abort();  // the list has it
}

double TimeOfPair(const Step& step, const FramePair& pair) {
    step.prepare(pair);
    return ThreadTimeOf([&] { step.run(pair); });
}

// Times all pairs of draw, whose parameters both sides have.
Finding TimeDraw(const GeometryDraw& draw) {
    const std::vector<FramePair>& pairs = draw.set.pairs;
    const std::vector<TimedCall> calls = {
        [&](size_t i) { return TimeOfPair(WholePair().plain, pairs[i]); },
        [&](size_t i) { return TimeOfPair(WholePair().shipped, pairs[i]); }};
    const double once = std::max(calls[0](0), 1.0) * static_cast<double>(pairs.size());
    const double rounds = std::clamp(kNanoseconds / once, kRoundsLeast, kRoundsMost);
    std::vector<Times> times(calls.size(), Times(pairs.size()));
    for (int32_t round = 0; round < static_cast<int32_t>(rounds); ++round)
        TakeTurns(calls, pairs.size(), &times);
    Finding finding;
    finding.draw = draw;
    finding.draw.set.pairs.clear();
    finding.plainUs = times[0].LeastMicroseconds();
    finding.shippedUs = times[1].LeastMicroseconds();
    finding.ratios = {finding.plainUs / finding.shippedUs};
    return finding;
}

bool SameRecordsFor(const GeometryDraw& draw) {
    for (const FramePair& pair : draw.set.pairs) {
        if (!SameRecords(PairKind::Moved, pair)) {
            std::printf("different records, draw %llu: %s\n",
                        static_cast<unsigned long long>(draw.number), draw.text.c_str());
            return false;
        }
    }
    return true;
}

Finding Examine(const GeometryDraw& draw) {
    Finding finding = TimeDraw(draw);
    const bool doubtful = finding.Ratio() < kDoubtful;
    while (doubtful && finding.ratios.size() <= kRepeats)
        finding.ratios.push_back(TimeDraw(draw).Ratio());
    return finding;
}

void Print(const Finding& finding) {
    std::printf("| %llu | %.2f |", static_cast<unsigned long long>(finding.draw.number),
                finding.Ratio());
    for (const double ratio : finding.ratios)
        std::printf(" %.2f", ratio);
    std::printf(" | %.2f | %.2f | %s | %s |\n", finding.plainUs, finding.shippedUs,
                finding.draw.outcome.c_str(), finding.draw.text.c_str());
}

// Sorts the findings, the slowest first, and prints the first of them.
void Report(std::vector<Finding>* findings, size_t count) {
    std::sort(findings->begin(), findings->end(),
              [](const Finding& a, const Finding& b) { return a.Ratio() < b.Ratio(); });
    std::printf(
        "| draw | ratio | each time | plain us | shipped us | outcome | frames, parameters |\n");
    std::printf("|---:|---:|---|---:|---:|---|---|\n");
    for (size_t i = 0; i < std::min(count, findings->size()); ++i)
        Print((*findings)[i]);
    const auto count_if = [findings](auto condition) {
        return static_cast<int>(std::count_if(findings->begin(), findings->end(), condition));
    };
    std::printf("\n%zu draws: %d with a ratio below 1.05, %d more than 5 percent slower\n",
                findings->size(), count_if([](const Finding& f) { return f.Ratio() < kDoubtful; }),
                count_if([](const Finding& f) { return f.Slower(); }));
}

int Search(const Arguments& arguments) {
    const bool progress = isatty(STDERR_FILENO) == 1;
    std::vector<Finding> findings;
    bool same = true;
    for (uint64_t n = 0; n < arguments.draws; ++n) {
        const GeometryDraw draw = DrawGeometry(arguments.seed, arguments.first + n);
        same = SameRecordsFor(draw) && same;
        findings.push_back(Examine(draw));
        if (progress)
            std::fprintf(stderr, "\r%zu of %zu", findings.size(),
                         static_cast<size_t>(arguments.draws));
    }
    if (progress)
        std::fputc('\n', stderr);
    Report(&findings, arguments.report);
    const bool written =
        arguments.write.empty() || findings.empty() ||
        WritePairs(arguments.write, DrawGeometry(arguments.seed, findings.front().draw.number).set);
    if (!written)
        std::fprintf(stderr, "geometry_search: cannot write %s\n", arguments.write.c_str());
    const bool slower = std::any_of(findings.begin(), findings.end(),
                                    [](const Finding& finding) { return finding.Slower(); });
    return same && written && !slower ? 0 : 1;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
    bench::Arguments arguments;
    if (!bench::ReadArguments(argc, argv, &arguments)) {
        std::fputs(
            "usage: geometry_search [--draws=N] [--first=K] [--seed=S] [--report=N] "
            "[--write=FILE]\n",
            stderr);
        return 2;
    }
    return bench::Search(arguments);
}
