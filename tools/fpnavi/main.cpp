// fpnavi: records of finger gestures made, imported, replayed and explained.
#include <fmt/core.h>

#include <csignal>
#include <exception>

#include "Commands.h"
#include "Output.h"

namespace {

constexpr const char* kFooter = R"(Examples:
  fpnavi synth corpus.db --count 200 --seed 1
  fpnavi import corpus.db recordings/
  fpnavi replay corpus.db
  fpnavi replay corpus.db --gesture s_fp_tiled_000
  fpnavi params --mode hg
  fpnavi tune --seed 1

Exit codes: 0 fine, 1 wrong keys or failed calls, 2 usage, 3 bad input or output.
Recordings hold pictures of fingerprints: store and share them as biometric data.)";

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
