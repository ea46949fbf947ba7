// The subcommands of fpnavi. Each adds its options to the program and says what to run when it is
// the one that the arguments name.
#ifndef FPNAVI_TOOLS_COMMANDS_H
#define FPNAVI_TOOLS_COMMANDS_H

#include <CLI/CLI.hpp>
#include <functional>

#include "replay/Explain.h"

namespace command {

// Exit codes of the program.
inline constexpr int kFine = 0;
inline constexpr int kFound = 1;     // wrong keys, failed calls, a calibration out of its band
inline constexpr int kUsage = 2;     // the command line makes no sense
inline constexpr int kBadInput = 3;  // a file, its content, or stdout

// Runs the chosen subcommand. Returns an exit code; throws for bad input.
using Action = std::function<int()>;

void AddSynth(CLI::App* app, Action* action);
void AddImport(CLI::App* app, Action* action);
void AddReplay(CLI::App* app, Action* action);
void AddParams(CLI::App* app, Action* action);
void AddTune(CLI::App* app, Action* action);

// Writes the frame-by-frame table of a gesture and its vote, as text or as JSON lines.
void WriteExplanation(const host::Explanation& explanation, bool json);

}  // namespace command

#endif  // FPNAVI_TOOLS_COMMANDS_H
