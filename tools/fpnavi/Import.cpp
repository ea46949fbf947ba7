// fpnavi import: .fng recordings, or the raw dump of a host service, into a corpus.
#include <fmt/core.h>

#include <filesystem>
#include <memory>
#include <set>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "common/Error.h"
#include "importers/FngImport.h"
#include "importers/RawImport.h"
#include "parameters/ParamFile.h"
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
    bool json = false;
};

bool Exists(const std::string& path) {
    std::error_code ignored;  // Create says what is wrong with a path that cannot be followed
    return std::filesystem::exists(path, ignored);
}

host::Store OpenOrCreate(const std::string& path) {
    return Exists(path) ? host::Store::OpenForAppending(path) : host::Store::Create(path);
}

void Report(const Options& options, int64_t gestures, int64_t frames, const host::Store& store) {
    if (options.json) {
        WriteJson("import", {{"corpus", options.corpus},
                             {"gestures", gestures},
                             {"frames", frames},
                             {"total", store.Count()}});
        return;
    }
    Write(fmt::format("{}: {} gestures with {} frames imported, {} in all\n",
                      Printable(options.corpus), gestures, frames, store.Count()));
}

// Reads all recordings once before anything is written, so that a bad one among them leaves the
// corpus as it was. Returns their number.
int64_t CheckPaths(const Options& options) {
    std::set<std::string> ids;
    if (Exists(options.corpus)) {
        for (std::string& id : host::Store::OpenForReading(options.corpus).Ids())
            ids.insert(std::move(id));
    }
    int64_t count = 0;
    for (const std::string& path : options.paths)
        host::ImportFng(path, [&](host::Gesture&& gesture) {
            if (!ids.insert(gesture.id).second)
                throw host::Error(
                    path, fmt::format("gesture '{}'", gesture.id),
                    fmt::format("the id is taken, expected one that is new to {}", options.corpus));
            ++count;
        });
    return count;
}

int RunFng(const Options& options) {
    const int64_t count = CheckPaths(options);
    host::Store store = OpenOrCreate(options.corpus);
    int64_t frames = 0;
    {
        // All or nothing: after a kill or a full disk the same command can be run again.
        host::Store::Batch batch(store);
        Progress progress("imported", count, true);
        for (const std::string& path : options.paths)
            host::ImportFng(path, [&](host::Gesture&& gesture) {
                store.Append(gesture);
                frames += static_cast<int64_t>(gesture.frames.size());
                progress.Step();
            });
        batch.Commit();
    }
    Report(options, count, frames, store);
    return kFine;
}

int RunRaw(const Options& options) {
    host::RawRecording recording;
    recording.id = options.id;
    recording.framesPath = options.raw;
    recording.registersPath = options.registers;
    recording.mode = host::ParseMode(options.mode).value();
    recording.params = host::ParamsForMode(recording.mode, false);
    if (!options.params.empty())
        recording.params = host::ReadParamFile(options.params, recording.params);
    recording.end = host::ParseEnd(options.end).value();
    if (!options.label.empty())
        recording.label = host::ParseKey(options.label);
    recording.libraryVersion = FPNAVI_VERSION;
    const host::Gesture gesture = host::ImportRaw(recording);
    host::Store store = OpenOrCreate(options.corpus);
    store.Append(gesture);
    Report(options, 1, static_cast<int64_t>(gesture.frames.size()), store);
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
                                         ".fng files, or directories of them with their index.csv")
                             ->check(NotEmpty("a file or a directory"));
    AddRawOptions(sub, options.get(), paths);
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
