// fpnavi: records of finger gestures made, imported, replayed and explained.
#include <fmt/core.h>

#include <algorithm>
#include <csignal>
#include <exception>

#include "Commands.h"
#include "Output.h"
#include "common/Text.h"

namespace {

constexpr const char* kFooter = R"(Examples:
  fpnavi synth corpus.db --count 200 --seed 1
  fpnavi import corpus.db recordings/
  fpnavi replay corpus.db
  fpnavi replay corpus.db --gesture s_fp_tiled_000
  fpnavi params --mode hg
  fpnavi tune --seed 1

Exit codes: 0 fine, 1 wrong keys, failed calls or a failed calibration, 2 usage, 3 bad input or
output.
Recordings hold pictures of fingerprints: store and share them as biometric data.)";

// The first word that is no option names the subcommand. Checked before all else, since a --help
// beside an unknown one would be taken for a question about the program.
void CheckSubcommand(const CLI::App& app, int argc, char** argv) {
    const auto isWord = [](const char* text) { return text[0] != '-'; };
    char** const word = std::find_if(argv + 1, argv + argc, isWord);
    if (word == argv + argc)
        return;
    std::vector<std::string> names;
    for (const CLI::App* sub : app.get_subcommands([](const CLI::App*) { return true; }))
        names.push_back(sub->get_name());
    if (std::find(names.begin(), names.end(), *word) != names.end())
        return;
    throw CLI::ValidationError(fmt::format("unknown subcommand '{}', {}", command::Printable(*word),
                                           host::Suggestion(*word, {names.begin(), names.end()})));
}

int Run(int argc, char** argv) {
    CLI::App app{"Finger navigation: makes, imports, replays and explains gesture recordings.",
                 "fpnavi"};
    app.footer(kFooter);
    app.set_version_flag("--version", fmt::format("fpnavi {}", FPNAVI_VERSION));
    app.require_subcommand(1);
    command::Action action;
    command::AddSynth(&app, &action);
    command::AddImport(&app, &action);
    command::AddReplay(&app, &action);
    command::AddParams(&app, &action);
    command::AddTune(&app, &action);
    try {
        CheckSubcommand(app, argc, argv);
        app.parse(argc, argv);
    } catch (const CLI::ParseError& error) {
        // Help and version arrive here too, with code 0.
        return app.exit(error) == 0 ? command::kFine : command::kUsage;
    }
    return action();
}

}  // namespace

int main(int argc, char** argv) {
    command::GuardStandardStreams();
    // A limit on the size of files is an error that is told, as a full disk is.
    std::signal(SIGXFSZ, SIG_IGN);
    int code = command::kBadInput;
    try {
        code = Run(argc, argv);
    } catch (const std::exception& error) {
        command::WriteError(error.what());
    }
    return command::FinishOutput() ? code : command::kBadInput;
}
