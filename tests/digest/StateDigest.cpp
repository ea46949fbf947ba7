// state_digest [--model] [--trace] [--expect FILE] [SET]: one hash over everything that the library
// answers to a fixed set of gestures and calibrations, "small" (default) or "large".
//
// --model: of the plain model in place of the module. --trace: a line with the running hash after
// each gesture and calibration, to find the first that differs. --expect: the line of the set in
// FILE must be the one found. Exit code 0, 1 for another line, 2 for arguments that make no sense.
#include <cinttypes>
#include <cstdio>
#include <string>

#include "Expected.h"
#include "HashedCalls.h"
#include "Inputs.h"

namespace {

using namespace fpnavi_test;

constexpr int64_t kSmall = 400;   // gestures: half a minute of an emulator, not optimised
constexpr int64_t kLarge = 1600;  // gestures

struct Options {
    bool model = false;
    bool trace = false;
    std::string expect;  // a file; empty for none
    std::string set = "small";
};

bool ReadOptions(int argc, char** argv, Options* options) {
    for (int i = 1; i < argc; ++i) {
        const std::string argument = argv[i];
        if (argument == "--model")
            options->model = true;
        else if (argument == "--trace")
            options->trace = true;
        else if (argument == "--expect" && i + 1 < argc)
            options->expect = argv[++i];
        else if (argument == "small" || argument == "large")
            options->set = argument;
        else
            return false;
    }
    return true;
}

void PrintCounts(const Counts& counts) {
    std::printf("finger absent %" PRId64 ", refused %" PRId64 ", tuning calls %" PRId64
                ", votes: not due %" PRId64 ", none %" PRId64 ", up %" PRId64 ", down %" PRId64
                ", right %" PRId64 ", left %" PRId64 ", no move %" PRId64 "\n",
                counts.absent, counts.refused, counts.tuneCalls, counts.results[0],
                counts.results[1], counts.results[2], counts.results[3], counts.results[4],
                counts.results[5], counts.results[6]);
}

int Compare(const Options& options, const std::string& found) {
    const std::string expected = ReadExpected(options.expect, options.set).value_or("no such line");
    if (found == expected)
        return 0;
    std::fprintf(stderr, "expected by %s:\n%s\n", options.expect.c_str(), expected.c_str());
    return 1;
}

}  // namespace

int main(int argc, char** argv) {
    Options options;
    if (!ReadOptions(argc, argv, &options)) {
        std::fprintf(stderr,
                     "usage: state_digest [--model] [--trace] [--expect FILE] [small|large]\n");
        return 2;
    }
    HashedCalls calls(options.model ? ModelSide() : ModuleSide());
    RunAll(calls, options.set == "large" ? kLarge : kSmall,
           [&calls, &options](const char* group, int64_t index) {
               if (options.trace)
                   std::printf("%016" PRIx64 " after %s %" PRId64 "\n", calls.Hash(), group, index);
           });
    const std::string found = ExpectedLine(options.set, calls.Seen(), calls.Hash());
    PrintCounts(calls.Seen());
    std::printf("%s\n", found.c_str());
    return options.expect.empty() ? 0 : Compare(options, found);
}
