// What a file of --params sets.
#ifndef FPNAVI_TOOLS_SETTINGS_H
#define FPNAVI_TOOLS_SETTINGS_H

#include <string>
#include <vector>

#include "parameters/ParamFile.h"

namespace command {

// The settings of the file; none for an empty path, when the option was not given.
std::vector<host::ParamSetting> ReadSettings(const std::string& path);

// A warning for each setting of a parameter that no step of the library reads. Call it when all
// checks of the settings are done, so that an error comes alone.
void WarnOfUnread(const std::string& path, const std::vector<host::ParamSetting>& settings);

}  // namespace command

#endif  // FPNAVI_TOOLS_SETTINGS_H
