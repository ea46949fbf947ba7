// fpnavi replay: a corpus replayed and judged, or one gesture of it explained.
#include <fmt/core.h>

#include <algorithm>
#include <memory>
#include <optional>
#include <stdexcept>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "ResultLines.h"
#include "Settings.h"
#include "common/Error.h"
#include "recording/Keys.h"
#include "replay/ReplayCorpus.h"
#include "store/Store.h"

namespace command {
namespace {

constexpr size_t kIdWidthMax = 40;  // longer ids push their line to the right

struct Options {
    std::string corpus;
    std::string params;
    std::string gesture;
    int32_t jobs = 0;
    bool json = false;
    bool quiet = false;
    bool failFast = false;
};

host::ParamOverrides Overrides(const Options& options) {
    if (options.params.empty())
        return {};
    const host::ParamOverrides overrides = host::ReadOverrides(options.params);
    WarnOfUnread(overrides.file, overrides.settings);
    return overrides;
}

int RunOne(const Options& options) {
    const host::ParamOverrides overrides = Overrides(options);
    const host::Store store = host::Store::OpenForReading(options.corpus);
    if (!store.Contains(options.gesture))
        throw host::Error(options.corpus, "",
                          fmt::format("no gesture '{}'; expected one of its {} ids",
                                      options.gesture, store.Count()));
    host::Gesture gesture = store.Read(options.gesture);
    host::CheckOverrides(overrides, gesture.params, gesture.id);
    host::ApplyOverrides(overrides, &gesture.params);
    const host::Explanation explanation = host::ExplainHere(gesture, options.corpus);
    WriteExplanation(explanation, options.json);
    return explanation.result.verdict == host::Verdict::Wrong ? kFound : kFine;
}

// The lines of the gestures, as they come.
class Lines {
  public:
    Lines(const Options& options, int64_t longestId)
        : m_options(options), m_table(Columns(static_cast<size_t>(longestId))) {
        if (!options.json && !options.quiet)
            m_table.Head();
    }

    void Write(const host::ReplayResult& result) const {
        if (m_options.quiet)
            return;
        if (m_options.json) {
            WriteJson("gesture", ResultJson(result));
            return;
        }
        m_table.Row({result.id, host::ModeName(result.mode),
                     result.label ? host::KeyName(*result.label) : "-", ShownKey(result.key),
                     Cell(result.pairs),
                     Cell(host::VerdictName(result.verdict), VerdictColour(result.verdict)),
                     result.errors.empty() ? "" : result.errors.front()});
    }

  private:
    static std::vector<Column> Columns(size_t longestId) {
        return {{"id", std::min(longestId, kIdWidthMax)},
                {"mode", 4},
                {"label", 7},
                {"key", 7},
                {"pairs", 0, true},
                {"verdict", 10},
                {"", 0}};
    }

    const Options& m_options;
    Table m_table;
};

// A corpus from its first line to its summary.
class Report {
  public:
    explicit Report(const Options& options) : m_options(options) {}

    void Start(const host::StoreExtent& extent) {
        m_lines.emplace(m_options, extent.longestId);
        m_progress.emplace("replayed", extent.count, m_options.quiet || !StdoutIsTerminal());
    }

    void Add(const host::ReplayResult& result) {
        const bool unreadable = result.verdict == host::Verdict::Unreadable;
        if (unreadable && m_options.failFast)
            throw std::runtime_error(result.errors.front());
        if (unreadable && m_firstError.empty())
            m_firstError = result.errors.front();
        m_summary.Add(result);
        m_lines->Write(result);
        m_progress->Step();
    }

    int Finish() {
        m_progress.reset();
        if (!m_options.json && !m_options.quiet)
            Write("\n");
        m_summary.Write(m_options.json);
        const int64_t unreadable = m_summary.Count(host::Verdict::Unreadable);
        if (unreadable > 1)
            m_firstError += fmt::format(" (the first of {} such gestures)", unreadable);
        if (unreadable > 0)
            WriteError(m_firstError);
        if (unreadable > 0)
            return kBadInput;
        return m_summary.Count(host::Verdict::Wrong) > 0 ? kFound : kFine;
    }

  private:
    const Options& m_options;
    std::optional<Lines> m_lines;
    std::optional<Progress> m_progress;
    Summary m_summary;
    std::string m_firstError;
};

int RunAll(const Options& options) {
    host::CorpusReplay replay;
    replay.path = options.corpus;
    replay.overrides = Overrides(options);
    replay.processes = options.jobs;
    Report report(options);
    host::ReplayCorpus(
        replay, [&](const host::StoreExtent& extent) { report.Start(extent); },
        [&](size_t, const host::ReplayResult& result) { report.Add(result); });
    return report.Finish();
}

}  // namespace

void AddReplay(CLI::App* app, Action* action) {
    CLI::App* sub = app->add_subcommand("replay", "Replay a corpus and judge the keys it gives");
    auto options = std::make_shared<Options>();
    sub->add_option("CORPUS", options->corpus, "Corpus to replay")->required();
    CLI::Option* gesture =
        sub->add_option("--gesture", options->gesture, "Explain this gesture frame by frame")
            ->check(GestureId());
    sub->add_option("--params", options->params,
                    "TOML file of values by name, over those of the recordings")
        ->check(NotEmpty("a file"));
    sub->add_option("--jobs", options->jobs, "Processes at once (default: one for each processor)")
        ->check(WholeNumber(1, 1024))
        ->excludes(gesture);
    sub->add_flag("--fail-fast", options->failFast, "End at the first gesture that cannot be read")
        ->excludes(gesture);
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->add_flag("--quiet", options->quiet, "The summary only")->excludes(gesture);
    sub->footer(
        "Examples:\n"
        "  fpnavi replay corpus.db --quiet\n"
        "  fpnavi replay corpus.db --params trial.toml --json\n"
        "  fpnavi replay corpus.db --gesture s_fp_tiled_000\n\n"
        "Exit codes: 0 fine, also for gestures without label; 1 wrong keys or failed calls found;\n"
        "3 gestures that cannot be read, bad parameters or output. The highest one holds.");
    sub->callback([options, action] {
        *action = [options] {
            return options->gesture.empty() ? RunAll(*options) : RunOne(*options);
        };
    });
}

}  // namespace command
