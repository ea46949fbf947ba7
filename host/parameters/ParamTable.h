// The 78 parameters by name: defaults, what the code does with each, and the mode and geometry that
// they give.
#ifndef FPNAVI_HOST_PARAMTABLE_H
#define FPNAVI_HOST_PARAMTABLE_H

#include <array>
#include <optional>
#include <string_view>

#include "recording/Recording.h"

namespace host {

struct ParamInfo {
    const char* name;      // "s_modeFlag"; halves of a band as "_NAVI_range_mean.RANGE_LOW"
    int32_t defaultValue;  // holds until SetNaviParam
    const char* meaning;   // one line: what the code does with it
};

// In the order of the parameter block.
const std::array<ParamInfo, FPNAVI_PARAM_NUM>& ParamTable();

// Index of the parameter in the block; empty for an unknown name.
std::optional<size_t> ParamIndex(std::string_view name);

// False for a parameter that is stored and that no step of the module reads.
bool IsRead(size_t index);

ParamBlock DefaultParams();

// Value of the parameter in params; name must be known.
int32_t& ParamValue(ParamBlock& params, std::string_view name);
int32_t ParamValue(const ParamBlock& params, std::string_view name);

// The mode that params select: s_modeFlag 1 is hg, 2 double scan, any other value acts as fp.
Mode ModeOf(const ParamBlock& params);

// Block grid of the raw data under params: the hg set when s_modeFlag is 1, else the fp set.
Geometry GeometryOf(const ParamBlock& params);

// Parameters for a mode, else default; plain frames (one contiguous window) get gaps of 0.
ParamBlock ParamsForMode(Mode mode, bool plainLayout);

}  // namespace host

#endif  // FPNAVI_HOST_PARAMTABLE_H
