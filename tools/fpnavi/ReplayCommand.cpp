// fpnavi replay: a corpus replayed and judged, or one gesture of it explained.
#include <fmt/core.h>

#include <algorithm>
#include <memory>

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
};

int ExitCode(bool wrong) {
    return wrong ? kFound : kFine;
}

host::ParamOverrides Overrides(const Options& options) {
    host::ParamOverrides overrides;
    const std::vector<host::ParamSetting> settings = ReadSettings(options.params);
    for (const host::ParamSetting& setting : settings)
        overrides.emplace_back(setting.index, setting.value);
    WarnOfUnread(options.params, settings);
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
    host::ApplyOverrides(overrides, &gesture.params);
    const host::Explanation explanation = host::ExplainHere(gesture, options.corpus);
    WriteExplanation(explanation, options.json);
    return ExitCode(explanation.result.verdict == host::Verdict::Wrong);
}

// The lines of the gestures, as they come.
class Lines {
  public:
    Lines(const Options& options, const std::vector<std::string>& ids)
        : m_options(options), m_table(Columns(ids)) {
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
    static std::vector<Column> Columns(const std::vector<std::string>& ids) {
        size_t width = 0;
        for (const std::string& id : ids)
            width = std::max(width, std::min(id.size(), kIdWidthMax));
        return {{"id", width},      {"mode", 4},    {"label", 7}, {"key", 7},
                {"pairs", 0, true}, {"verdict", 8}, {"", 0}};
    }

    const Options& m_options;
    Table m_table;
};

int RunAll(const Options& options) {
    host::CorpusReplay replay;
    replay.path = options.corpus;
    replay.overrides = Overrides(options);
    replay.processes = options.jobs;
    const std::vector<std::string> ids = host::Store::OpenForReading(options.corpus).Ids();
    const Lines lines(options, ids);
    Summary summary;
    {
        Progress progress("replayed", static_cast<int64_t>(ids.size()),
                          options.quiet || !StdoutIsTerminal());
        host::ReplayCorpus(replay, [&](size_t, const host::ReplayResult& result) {
            summary.Add(result);
            lines.Write(result);
            progress.Step();
        });
    }
    if (!options.json && !options.quiet)
        Write("\n");
    summary.Write(options.json);
    return ExitCode(summary.Wrong() > 0);
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
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->add_flag("--quiet", options->quiet, "The summary only")->excludes(gesture);
    sub->footer(
        "Examples:\n"
        "  fpnavi replay corpus.db --quiet\n"
        "  fpnavi replay corpus.db --params trial.toml --json\n"
        "  fpnavi replay corpus.db --gesture s_fp_tiled_000");
    sub->callback([options, action] {
        *action = [options] {
            return options->gesture.empty() ? RunAll(*options) : RunOne(*options);
        };
    });
}

}  // namespace command
