// fpnavi import: .fng recordings, or the raw dump of a host service, into a corpus.
#include <fmt/core.h>

#include <filesystem>
#include <map>
#include <memory>
#include <set>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "Settings.h"
#include "common/Error.h"
#include "importers/FngImport.h"
#include "importers/RawImport.h"
#include "recording/Keys.h"
#include "store/Store.h"

namespace command {
namespace {

struct Options {
    std::string corpus;
    std::vector<std::string> paths;
    std::string raw;
    std::string registers;
    std::string mode;
    std::string params;
    std::string end = "lift";
    std::string label;
    std::string id;
    bool skipExisting = false;
    bool json = false;
};

bool Exists(const std::string& path) {
    std::error_code ignored;  // Create says what is wrong with a path that cannot be followed
    return std::filesystem::exists(path, ignored);
}

host::Store OpenOrCreate(const std::string& path) {
    return Exists(path) ? host::Store::OpenForAppending(path) : host::Store::Create(path);
}

// What an import did.
struct Counts {
    int64_t gestures = 0;
    int64_t frames = 0;
    int64_t skipped = 0;  // the corpus has their ids already
};

void Append(const host::Gesture& gesture, host::Store* store, Counts* counts) {
    store->Append(gesture);
    ++counts->gestures;
    counts->frames += static_cast<int64_t>(gesture.frames.size());
}

void Report(const Options& options, const Counts& counts, const host::Store& store) {
    if (options.json) {
        WriteJson("import", {{"corpus", options.corpus},
                             {"gestures", counts.gestures},
                             {"frames", counts.frames},
                             {"skipped", counts.skipped},
                             {"total", store.Count()}});
        return;
    }
    const std::string skipped =
        options.skipExisting ? fmt::format("{} skipped, ", counts.skipped) : "";
    Write(fmt::format("{}: {} gestures with {} frames imported, {}{} in all\n",
                      Printable(options.corpus), counts.gestures, counts.frames, skipped,
                      store.Count()));
}

[[noreturn]] void FailTaken(const std::string& file, const std::string& id,
                            const std::string& taker) {
    throw host::Error(file, fmt::format("gesture '{}'", id),
                      fmt::format("the id is taken by {}, expected a new one", taker));
}

// Where an id was seen: the corpus, or a file of this import.
using Takers = std::map<std::string, std::string>;

Takers TakersOf(const std::string& corpus) {
    Takers takers;
    if (Exists(corpus)) {
        for (std::string& id : host::Store::OpenForReading(corpus).Ids())
            takers.emplace(std::move(id), corpus);
    }
    return takers;
}

// Reads all recordings once before anything is written, so that a bad one among them leaves the
// corpus as it was. Returns their number.
int64_t CheckPaths(const Options& options) {
    Takers takers = TakersOf(options.corpus);
    std::set<std::string> imported;
    int64_t count = 0;
    for (const std::string& path : options.paths)
        host::ImportFng(path, [&](host::Gesture&& gesture, const std::string& file) {
            const auto [taker, isNew] = takers.emplace(gesture.id, file);
            const bool isTwice = !imported.insert(gesture.id).second;
            if (isTwice || (!isNew && !options.skipExisting))
                FailTaken(file, gesture.id, taker->second);
            ++count;
        });
    return count;
}

int RunFng(const Options& options) {
    const int64_t count = CheckPaths(options);
    host::Store store = OpenOrCreate(options.corpus);
    Counts counts;
    {
        // All or nothing: after a kill or a full disk the same command can be run again.
        host::Store::Batch batch(store);
        Progress progress("imported", count, true);
        for (const std::string& path : options.paths)
            host::ImportFng(path, [&](host::Gesture&& gesture, const std::string&) {
                if (options.skipExisting && store.Contains(gesture.id))
                    ++counts.skipped;
                else
                    Append(gesture, &store, &counts);
                progress.Step();
            });
        batch.Commit();
    }
    Report(options, counts, store);
    return kFine;
}

int RunRaw(const Options& options) {
    host::RawRecording recording;
    recording.id = options.id;
    recording.framesPath = options.raw;
    recording.registersPath = options.registers;
    recording.mode = host::ParseMode(options.mode).value();
    recording.params = host::ParamsForMode(recording.mode, false);
    recording.paramFile = options.params;
    recording.settings = ReadSettings(options.params);
    recording.end = host::ParseEnd(options.end).value();
    if (!options.label.empty())
        recording.label = host::ParseKey(options.label);
    recording.libraryVersion = FPNAVI_VERSION;
    const host::Gesture gesture = host::ImportRaw(recording);
    WarnOfUnread(options.params, recording.settings);
    host::Store store = OpenOrCreate(options.corpus);
    Counts counts;
    const bool isTaken = store.Contains(gesture.id);
    if (isTaken && !options.skipExisting)
        FailTaken(options.raw, gesture.id, options.corpus);
    if (isTaken)
        ++counts.skipped;
    else
        Append(gesture, &store, &counts);
    Report(options, counts, store);
    return kFine;
}

void AddRawOptions(CLI::App* sub, Options* options, CLI::Option* paths) {
    CLI::Option* raw = sub->add_option("--raw", options->raw,
                                       "Raw frames in sensor order, back to back: one gesture")
                           ->check(NotEmpty("a file"))
                           ->excludes(paths);
    CLI::Option* mode = sub->add_option("--mode", options->mode, "Mode of the dump: fp, hg or ds")
                            ->check(OneOf("mode", host::ModeNames()))
                            ->needs(raw);
    raw->needs(mode);
    sub->add_option("--registers", options->registers,
                    "Two little-endian 32-bit words a frame: register 24, register 28 (mode ds)")
        ->check(NotEmpty("a file"))
        ->needs(raw);
    sub->add_option("--params", options->params,
                    "TOML file of values by name, over the defaults of the mode")
        ->check(NotEmpty("a file"))
        ->needs(raw);
    sub->add_option("--end", options->end, "How the gesture ended: lift (default) or timeout")
        ->check(OneOf("end", host::EndNames()))
        ->needs(raw);
    sub->add_option("--label", options->label,
                    "The true key: NONE, UP, DOWN, RIGHT, LEFT or NO_MOVE")
        ->check(OneOf("key", host::KeyNames()))
        ->needs(raw);
    sub->add_option("--id", options->id, "Id of the gesture (default: the dump's file name)")
        ->check(GestureId())
        ->needs(raw);
}

}  // namespace

void AddImport(CLI::App* app, Action* action) {
    CLI::App* sub = app->add_subcommand("import", "Add recordings to a corpus");
    auto options = std::make_shared<Options>();
    sub->add_option("CORPUS", options->corpus, "Corpus to add to; made if there is none")
        ->required();
    CLI::Option* paths = sub->add_option("PATH", options->paths,
                                         ".fng files, or directories of them, with their index.csv")
                             ->check(NotEmpty("a file or a directory"));
    AddRawOptions(sub, options.get(), paths);
    sub->add_flag("--skip-existing", options->skipExisting,
                  "Leave out gestures whose ids the corpus has already");
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->footer(
        "Examples:\n"
        "  fpnavi import corpus.db recordings/\n"
        "  fpnavi import corpus.db --raw dump.bin --mode hg --label LEFT\n"
        "  fpnavi import corpus.db --raw dump.bin --registers regs.bin --mode ds --id tuesday-1\n"
        "Frames are pictures of a fingerprint: keep the corpus as biometric data.");
    sub->callback([options, action] {
        if (options->raw.empty() && options->paths.empty())
            throw CLI::RequiredError("PATH or --raw");
        *action = [options] { return options->raw.empty() ? RunFng(*options) : RunRaw(*options); };
    });
}

}  // namespace command
