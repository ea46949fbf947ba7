// fpnavi params: the parameter block with names, values, defaults and meanings.
#include <memory>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "Settings.h"
#include "parameters/ParamTable.h"
#include "recording/Keys.h"

namespace command {
namespace {

struct Options {
    std::string file;
    std::string mode;
    bool json = false;
};

int Run(const Options& options) {
    const host::Mode mode = host::ParseMode(options.mode).value_or(host::Mode::Fp);
    const std::vector<host::ParamSetting> settings = ReadSettings(options.file);
    const host::ParamBlock params = host::WithSettings(settings, host::ParamsForMode(mode, false));
    WarnOfUnread(options.file, settings);
    const Table table(
        {{"index", 0, true}, {"name", 36}, {"value", 6, true}, {"default", 0, true}, {"meaning"}});
    if (!options.json)
        table.Head();
    for (size_t i = 0; i < params.size(); ++i) {
        const host::ParamInfo& info = host::ParamTable()[i];
        const bool changed = params[i] != info.defaultValue;
        if (options.json) {
            WriteJson("param", {{"index", i},
                                {"name", info.name},
                                {"value", params[i]},
                                {"default", info.defaultValue},
                                {"meaning", info.meaning}});
            continue;
        }
        table.Row({Cell(static_cast<int64_t>(i)), info.name,
                   Cell(std::to_string(params[i]), changed ? Colour::Bold : Colour::None),
                   Cell(info.defaultValue), info.meaning});
    }
    return kFine;
}

}  // namespace

void AddParams(CLI::App* app, Action* action) {
    CLI::App* sub = app->add_subcommand("params", "List the parameters and what they do");
    auto options = std::make_shared<Options>();
    sub->add_option("--params", options->file,
                    "TOML file of values by name, over those of the mode")
        ->check(NotEmpty("a file"));
    sub->add_option("--mode", options->mode, "Mode: fp (default), hg or ds")
        ->check(OneOf("mode", host::ModeNames()));
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->callback([options, action] { *action = [options] { return Run(*options); }; });
}

}  // namespace command
