// fpnavi synth: a corpus of simulated gestures.
#include <fmt/core.h>

#include <chrono>
#include <cstdint>
#include <filesystem>
#include <memory>
#include <vector>

#include "Commands.h"
#include "Interrupt.h"
#include "OptionChecks.h"
#include "Output.h"
#include "common/Error.h"
#include "simulator/Corpus.h"
#include "simulator/Sensor.h"
#include "store/Replacement.h"
#include "store/Store.h"

namespace command {
namespace {

using Clock = std::chrono::steady_clock;

constexpr uint64_t kCountMax = 100'000'000;

// Gestures that wait for being stored together, about 9 MB, or those of so much time.
constexpr size_t kWaitingMax = 256;
constexpr std::chrono::seconds kWaitingTime{1};

struct Options {
    std::string corpus;
    int64_t count = 0;
    int64_t first = 0;
    uint64_t seed = 1;
    int32_t jobs = 0;
    bool force = false;
    bool discardRecordings = false;
    bool append = false;
    bool json = false;
};

// What is on the disk.
struct Stored {
    int64_t gestures = 0;
    int64_t frames = 0;
};

// Appends gestures, those of about a second in one transaction.
class Writer {
  public:
    Writer(host::Store* store, Stored* stored) : m_store(store), m_stored(stored) {}

    void Add(host::Gesture&& gesture) {
        m_waiting.push_back(std::move(gesture));
        if (m_waiting.size() >= kWaitingMax || Clock::now() - m_since >= kWaitingTime)
            Flush();
    }

    void Flush() {
        Stored more = *m_stored;
        host::Store::Batch batch(*m_store);
        for (const host::Gesture& gesture : m_waiting) {
            m_store->Append(gesture);
            ++more.gestures;
            more.frames += static_cast<int64_t>(gesture.frames.size());
        }
        batch.Commit();
        *m_stored = more;
        m_waiting.clear();
        m_since = Clock::now();
    }

  private:
    host::Store* m_store;
    Stored* m_stored;
    std::vector<host::Gesture> m_waiting;
    Clock::time_point m_since = Clock::now();
};

void Fill(const Options& options, host::Store* store, Stored* stored) {
    Progress progress("simulated", options.count, true);
    Writer writer(store, stored);
    host::SimulateCorpus({options.seed, options.first, options.count}, options.jobs,
                         [&](host::Gesture&& gesture) {
                             writer.Add(std::move(gesture));
                             progress.Step();
                             return InterruptingSignal() == 0;
                         });
    writer.Flush();
}

// What is kept of work that was cut short, and the command line that goes on with it.
std::string HowToGoOn(const Options& options, const Stored& stored) {
    const int64_t kept = options.force ? 0 : stored.gestures;
    std::string line =
        fmt::format("fpnavi synth {} --count {} --seed {} --first {}", ShellWord(options.corpus),
                    options.count - kept, options.seed, options.first + kept);
    line += options.force ? " --force" : " --append";
    line += options.discardRecordings ? " --discard-recordings" : "";
    line += options.jobs > 0 ? fmt::format(" --jobs {}", options.jobs) : "";
    line += options.json ? " --json" : "";
    if (options.force)
        return fmt::format("{} is as it was; to begin again: {}", Printable(options.corpus), line);
    return fmt::format("{}: {} of {} gestures are stored; to go on: {}", Printable(options.corpus),
                       kept, options.count, line);
}

void Report(const Options& options, const Stored& stored, const host::Store& store) {
    if (options.json)
        WriteJson("synth", {{"corpus", options.corpus},
                            {"seed", options.seed},
                            {"gestures", stored.gestures},
                            {"frames", stored.frames},
                            {"total", store.Count()}});
    else
        Write(fmt::format("{}: {} gestures with {} frames written, {} in all\n",
                          Printable(options.corpus), stored.gestures, stored.frames,
                          store.Count()));
}

// Fills the store. Returns false when it was cut short, which is told.
bool FillOrTell(const Options& options, host::Store* store, Stored* stored) {
    try {
        Fill(options, store, stored);
    } catch (const host::Error& error) {
        WriteError(error.what());
        WriteError(HowToGoOn(options, *stored));
        return false;
    }
    if (InterruptingSignal() == 0 || stored->gestures == options.count)
        return true;
    WriteError("interrupted");
    WriteError(HowToGoOn(options, *stored));
    return false;
}

int RunAppending(const Options& options) {
    std::error_code ignored;  // Create says what is wrong with a path that cannot be followed
    if (!options.append &&
        std::filesystem::exists(std::filesystem::symlink_status(options.corpus, ignored)))
        throw host::Error(options.corpus, "",
                          "is there already; --force replaces it, --append adds to it");
    host::Store store = options.append ? host::Store::OpenForAppending(options.corpus)
                                       : host::Store::Create(options.corpus);
    Stored stored;
    if (!FillOrTell(options, &store, &stored))
        return kBadInput;
    Report(options, stored, store);
    return kFine;
}

// Recordings cannot be made again.
void RefuseRecordings(const host::Store& former) {
    const int64_t recordings = former.CountWithoutTag(host::kSimulatedTag);
    if (recordings > 0)
        throw host::Error(former.Path(), "",
                          fmt::format("will not be replaced: holds {} gestures that are not "
                                      "simulated; --discard-recordings gives them up",
                                      recordings));
}

int RunReplacing(const Options& options) {
    host::Replacement replacement(options.corpus, [&](const host::Store& former) {
        if (!options.discardRecordings)
            RefuseRecordings(former);
    });
    Stored stored;
    if (!FillOrTell(options, &replacement.Content(), &stored))
        return kBadInput;
    Report(options, stored, replacement.TakePlace());
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
    sub->add_option("--jobs", options->jobs,
                    "Gestures simulated at once (default: one for each processor)")
        ->check(CLI::Range(1, 1024));
    CLI::Option* force = sub->add_flag("--force", options->force, "Replace an existing corpus");
    sub->add_flag("--discard-recordings", options->discardRecordings,
                  "With --force: replace it also when it holds gestures that are not simulated")
        ->needs(force);
    sub->add_flag("--append", options->append, "Add to an existing corpus")->excludes(force);
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->footer(
        "Examples:\n"
        "  fpnavi synth corpus.db --count 200 --seed 1\n"
        "  fpnavi synth corpus.db --count 100 --seed 1 --first 200 --append");
    sub->callback([options, action] {
        *action = [options] {
            CatchInterrupts();
            const int code = options->force ? RunReplacing(*options) : RunAppending(*options);
            if (code != kFine)
                EndByInterrupt();
            return code;
        };
    });
}

}  // namespace command
