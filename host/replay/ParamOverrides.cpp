#include "replay/ParamOverrides.h"

#include <fmt/core.h>

#include <string_view>

#include "common/Error.h"
#include "recording/Keys.h"
#include "replay/Replay.h"

namespace host {
namespace {

const char* NameOf(const ParamSetting& setting) {
    return ParamTable()[setting.index].name;
}

// What this one setting changes that a recording cannot do without; empty if nothing.
std::string ChangeBy(const ParamSetting& setting, const ParamBlock& params) {
    ParamBlock changed = params;
    changed[setting.index] = setting.value;
    if (ModeOf(changed) != ModeOf(params))
        return fmt::format("mode from {} to {}", ModeName(ModeOf(params)),
                           ModeName(ModeOf(changed)));
    return GeometryOf(changed) == GeometryOf(params) ? "" : "geometry";
}

bool SetsFingerTest(const ParamSetting& setting) {
    const std::string_view name = NameOf(setting);
    return name == "s_imageWidthHg" || name == "s_imageHeightHg";
}

}  // namespace

ParamOverrides ReadOverrides(const std::string& path) {
    return {path, ReadParamSettings(path)};
}

void ApplyOverrides(const ParamOverrides& overrides, ParamBlock* params) {
    for (const ParamSetting& setting : overrides.settings)
        params->at(setting.index) = setting.value;
}

void CheckOverrides(const ParamOverrides& overrides, const ParamBlock& params,
                    const std::string& id) {
    const auto refuse = [&](const ParamSetting& setting, const std::string& what) {
        throw Error(overrides.file, setting.place,
                    fmt::format("{} = {} {}, expected {} as recorded", NameOf(setting),
                                setting.value, what, params[setting.index]));
    };
    for (const ParamSetting& setting : overrides.settings) {
        const std::string change = ChangeBy(setting, params);
        if (!change.empty())
            refuse(setting, fmt::format("changes the {} of gesture '{}'", change, id));
    }
    ParamBlock changed = params;
    ApplyOverrides(overrides, &changed);
    const std::string problem = FingerTestProblem(changed);
    if (problem.empty() || !FingerTestProblem(params).empty())
        return;
    for (const ParamSetting& setting : overrides.settings) {
        if (SetsFingerTest(setting) && setting.value != params[setting.index])
            refuse(setting, fmt::format("does not go with gesture '{}': {}", id, problem));
    }
}

}  // namespace host
