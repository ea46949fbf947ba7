// fpnavi tune: the calibration of the DC register against a simulated front end or recorded frames.
#include <fmt/core.h>

#include <memory>
#include <optional>

#include "Commands.h"
#include "OptionChecks.h"
#include "Output.h"
#include "Settings.h"
#include "importers/RawImport.h"
#include "parameters/ParamCheck.h"
#include "replay/TuneRun.h"
#include "simulator/FrontEnd.h"

namespace command {
namespace {

constexpr uint64_t kCallsMax = 1'000'000;

struct Options {
    std::optional<uint64_t> seed;
    std::optional<int32_t> layout;
    std::optional<uint32_t> start;
    std::optional<uint32_t> gain20;
    std::optional<uint32_t> gain2C;
    std::string params;
    std::string raw;
    int32_t calls = 64;
    bool json = false;
};

std::string Hex(uint32_t value) {
    return fmt::format("0x{:08X}", value);
}

// Below the band, inside, above, or never measured.
const char* FlagName(int32_t flag) {
    switch (flag) {
        case -1:
            return "below";
        case 0:
            return "in";
        case 1:
            return "above";
        default:
            return "-";
    }
}

host::ParamBlock ParamsOf(const Options& options) {
    const std::vector<host::ParamSetting> settings = ReadSettings(options.params);
    host::ParamBlock params = host::WithSettings(settings, host::DefaultParams());
    host::CheckImage(settings, options.params, params);
    WarnOfUnread(options.params, settings);
    if (options.layout)
        host::ParamValue(params, "iDCMode") = *options.layout;
    return params;
}

// Recorded frames come without a plan: the reference gain, the middle of the DC's usable range.
host::FrontEndPlan PlanOf(const Options& options, const host::ParamBlock& params) {
    host::FrontEndPlan plan =
        options.raw.empty() ? host::RandomFrontEnd(options.seed.value_or(1)) : host::FrontEndPlan();
    plan.layout = host::ParamValue(params, "iDCMode") == 0 ? 0 : 1;
    plan.gain20 = options.gain20.value_or(plan.gain20);
    plan.gain2C = options.gain2C.value_or(plan.gain2C);
    return plan;
}

host::TuneRun RunSimulated(const Options& options, const host::FrontEndPlan& plan,
                           const host::TuneSetup& setup) {
    std::unique_ptr<host::FrontEnd> sensor;  // made once the geometry has been found usable
    return host::RunTuning(
        setup,
        [&](uint32_t dac) {
            if (!sensor)
                sensor = std::make_unique<host::FrontEnd>(plan, setup.params);
            return sensor->Grab(dac);
        },
        options.params.empty() ? "tune" : options.params);
}

host::TuneRun RunRecorded(const Options& options, const host::TuneSetup& setup) {
    host::RawRecording recording;
    recording.framesPath = options.raw;
    recording.params = setup.params;
    // Modes fp and ds share their frames; the tuning reads no double-scan registers.
    if (host::ModeOf(setup.params) == host::Mode::Hg)
        recording.mode = host::Mode::Hg;
    const host::Gesture gesture = host::ImportRaw(recording);
    size_t next = 0;
    return host::RunTuning(
        setup,
        [&](uint32_t) {
            return next < gesture.frames.size() ? gesture.frames[next++].raw
                                                : std::vector<uint8_t>();
        },
        options.raw);
}

void WriteJsonCall(size_t number, const host::TuneCall& call) {
    Json line = {{"call", number},
                 {"register_before", Hex(call.registerBefore)},
                 {"register_after", Hex(call.registerAfter)},
                 {"dc_before", call.dcBefore},
                 {"dc_after", call.dcAfter},
                 {"measured", call.measured},
                 {"result", call.result}};
    if (call.measured)
        line.update({{"mean", call.mean},
                     {"top_grey", call.topGrey},
                     {"gain_factor", call.gainFactor},
                     {"flag_effective", call.effective},
                     {"flag_recommended", call.recommended},
                     {"flag_recommended_top", call.recommendedTop},
                     {"saturated", call.saturated},
                     {"direction", call.direction},
                     {"step", call.step},
                     {"no_more_process", call.noMoreProcess}});
    WriteJson("tune_call", line);
}

void WriteTextCall(const Table& table, size_t number, const host::TuneCall& call) {
    const auto shown = [&call](const std::string& text) {
        return Cell(call.measured ? text : std::string("-"));
    };
    const auto flag = [&](int32_t value) { return shown(FlagName(value)); };
    table.Row({Cell(static_cast<int64_t>(number)), Hex(call.registerBefore),
               Hex(call.registerAfter), Cell(call.dcBefore), Cell(call.dcAfter),
               shown(std::to_string(call.mean)), shown(std::to_string(call.topGrey)),
               flag(call.effective), flag(call.recommended), flag(call.recommendedTop),
               shown(call.saturated ? "yes" : "no"), shown(fmt::format("{:+d}", call.direction)),
               shown(std::to_string(call.step)), Cell(call.result)});
}

// Frames in the band at the end, or nothing to calibrate.
bool IsCalibrated(const host::TuneRun& run) {
    if (run.end == host::TuneEnd::NotNeeded)
        return true;
    return run.end == host::TuneEnd::InBand && !run.calls.back().saturated;
}

int Run(const Options& options) {
    host::TuneSetup setup;
    setup.params = ParamsOf(options);
    const host::FrontEndPlan plan = PlanOf(options, setup.params);
    setup.start = options.start.value_or(host::StartRegister(plan));
    setup.gain20 = plan.gain20;
    setup.gain2C = plan.gain2C;
    setup.maxCalls = options.calls;
    const host::TuneRun run =
        options.raw.empty() ? RunSimulated(options, plan, setup) : RunRecorded(options, setup);
    const Table table({{"call", 0, true},
                       {"before", 10},
                       {"after", 10},
                       {"dc", 3, true},
                       {"to", 3, true},
                       {"mean", 0, true},
                       {"top", 3, true},
                       {"mean is", 7},
                       {"advised", 7},
                       {"top is", 6},
                       {"saturated"},
                       {"dir", 3, true},
                       {"step", 0, true},
                       {"result", 0, true}});
    if (!options.json)
        table.Head();
    for (size_t i = 0; i < run.calls.size(); ++i) {
        if (options.json)
            WriteJsonCall(i + 1, run.calls[i]);
        else
            WriteTextCall(table, i + 1, run.calls[i]);
    }
    if (options.json)
        WriteJson("tune", {{"end", host::TuneEndName(run.end)},
                           {"calls", run.calls.size()},
                           {"gain20", Hex(plan.gain20)},
                           {"gain2c", Hex(plan.gain2C)},
                           {"register", Hex(run.lastRegister)}});
    else
        Write(fmt::format("\n{} after {} calls, register {}, gain registers {} and {}\n",
                          host::TuneEndName(run.end), run.calls.size(), Hex(run.lastRegister),
                          Hex(plan.gain20), Hex(plan.gain2C)));
    return IsCalibrated(run) ? kFine : kFound;
}

}  // namespace

void AddTune(CLI::App* app, Action* action) {
    CLI::App* sub = app->add_subcommand("tune", "Calibrate the DC register, call by call");
    auto options = std::make_shared<Options>();
    CLI::Option* seed =
        sub->add_option("--seed", options->seed, "Simulated front end to draw (default 1)")
            ->check(WholeNumber());
    sub->add_option("--raw", options->raw,
                    "Recorded frames instead: raw, in sensor order, back to back")
        ->check(NotEmpty("a file"))
        ->excludes(seed);
    sub->add_option("--layout", options->layout,
                    "Layout of the DC register: 1 low byte, 0 differences of bytes (default: "
                    "iDCMode of the parameters)")
        ->check(WholeNumber(0, 1));
    sub->add_option("--start", options->start,
                    "DC register of the first frame, e.g. 0x123456C0 (default: as drawn; DC 191 "
                    "for recorded frames)")
        ->check(Register());
    sub->add_option("--gain20", options->gain20,
                    "First gain register (default: as drawn; 0x00020700 for recorded frames)")
        ->check(Register());
    sub->add_option("--gain2c", options->gain2C,
                    "Second gain register (default: as drawn; 0x00000102 for recorded frames)")
        ->check(Register());
    sub->add_option("--params", options->params, "TOML file of values by name, over the defaults")
        ->check(NotEmpty("a file"));
    sub->add_option("--calls", options->calls, "Calls at most (default 64)")
        ->check(WholeNumber(1, kCallsMax));
    sub->add_flag("--json", options->json, "One JSON object a line");
    sub->footer(
        "Examples:\n"
        "  fpnavi tune --seed 7 --start 0x12345650\n"
        "  fpnavi tune --raw frames.bin --layout 0 --json");
    sub->callback([options, action] { *action = [options] { return Run(*options); }; });
}

}  // namespace command
