// Parameter files: TOML with the names of the parameter block.
//
//     s_minDelta = 5
//     _NAVI_range_mean.RANGE_LOW = 140
#ifndef FPNAVI_HOST_PARAMFILE_H
#define FPNAVI_HOST_PARAMFILE_H

#include <string>
#include <string_view>
#include <vector>

#include "parameters/ParamTable.h"

namespace host {

// One parameter that a file sets.
struct ParamSetting {
    size_t index = 0;  // in the block
    int32_t value = 0;
    std::string place;  // "line:column" of the value
};

// What a file sets, in no particular order. Error, with "line:column", for a file that is no TOML,
// an unknown name, a value that is no integer or one outside the 32-bit range.
std::vector<ParamSetting> ReadParamSettings(const std::string& path);

// The same for text; fileName is what errors name.
std::vector<ParamSetting> ParseParamSettings(std::string_view text, const std::string& fileName);

// The parameters of a file over base: what the file does not mention keeps base's value.
// Error as ReadParamSettings.
ParamBlock ReadParamFile(const std::string& path, const ParamBlock& base = DefaultParams());

// The same for text; fileName is what errors name.
ParamBlock ParseParams(std::string_view text, const std::string& fileName,
                       const ParamBlock& base = DefaultParams());

// A file with all parameters in their order; values that differ from the default say so in a
// comment. ParseParams of it gives params again.
std::string ParamFileText(const ParamBlock& params);

}  // namespace host

#endif  // FPNAVI_HOST_PARAMFILE_H
