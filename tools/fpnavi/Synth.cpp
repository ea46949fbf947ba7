// fpnavi synth: a corpus of simulated gestures.
#include <fmt/core.h>

#include <cstdint>
#include <memory>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "simulator/Corpus.h"
#include "store/Store.h"

namespace command {
namespace {

constexpr uint64_t kCountMax = 100'000'000;

struct Options {
    std::string corpus;
    int64_t count = 0;
    int64_t first = 0;
    uint64_t seed = 1;
    bool force = false;
    bool append = false;
    bool json = false;
};

host::Store Open(const Options& options) {
    if (options.append)
        return host::Store::OpenForAppending(options.corpus);
    return host::Store::Create(options.corpus, options.force ? host::Store::IfExists::Replace
                                                             : host::Store::IfExists::Fail);
}

int Run(const Options& options) {
    host::Store store = Open(options);
    int64_t frames = 0;
    {
        Progress progress("simulated", options.count, true);
        for (int64_t i = 0; i < options.count; ++i) {
            const host::Gesture gesture =
                host::SimulateCorpusGesture(options.seed, options.first + i);
            store.Append(gesture);
            frames += static_cast<int64_t>(gesture.frames.size());
            progress.Step();
        }
    }
    if (options.json)
        WriteJson("synth", {{"corpus", options.corpus},
                            {"seed", options.seed},
                            {"gestures", options.count},
                            {"frames", frames},
                            {"total", store.Count()}});
    else
        Write(fmt::format("{}: {} gestures with {} frames written, {} in all\n",
                          Printable(options.corpus), options.count, frames, store.Count()));
    return kFine;
}

}  // namespace

void AddSynth(CLI::App* app, Action* action) {
    CLI::App* sub = app->add_subcommand("synth", "Write a corpus of simulated gestures");
    auto options = std::make_shared<Options>();
    sub->add_option("CORPUS", options->corpus, "Corpus to write; must not exist yet")->required();
    sub->add_option("--count", options->count, "Number of gestures")
        ->required()
        ->check(WholeNumber(1, kCountMax));
    sub->add_option("--seed", options->seed, "Equal seeds give equal gestures (default 1)")
        ->check(WholeNumber());
    sub->add_option("--first", options->first, "Index of the first gesture in its seed (default 0)")
        ->check(WholeNumber(0, kCountMax));
    CLI::Option* force = sub->add_flag("--force", options->force, "Replace an existing corpus");
    sub->add_flag("--append", options->append, "Add to an existing corpus")->excludes(force);
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->footer(
        "Examples:\n"
        "  fpnavi synth corpus.db --count 200 --seed 1\n"
        "  fpnavi synth corpus.db --count 100 --seed 1 --first 200 --append");
    sub->callback([options, action] { *action = [options] { return Run(*options); }; });
}

}  // namespace command
