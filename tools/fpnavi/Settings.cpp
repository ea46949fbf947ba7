#include "Settings.h"

#include <fmt/core.h>

#include "Output.h"

namespace command {

std::vector<host::ParamSetting> ReadSettings(const std::string& path) {
    return path.empty() ? std::vector<host::ParamSetting>() : host::ReadParamSettings(path);
}

void WarnOfUnread(const std::string& path, const std::vector<host::ParamSetting>& settings) {
    for (const host::ParamSetting& setting : settings) {
        if (!host::IsRead(setting.index))
            WriteWarning(fmt::format("{}:{}: {} is stored and never read: it changes nothing", path,
                                     setting.place, host::ParamTable()[setting.index].name));
    }
}

}  // namespace command
