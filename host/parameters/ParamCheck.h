// Settings of a parameter file that contradict what they are used for, told at their place in the
// file.
#ifndef FPNAVI_HOST_PARAMCHECK_H
#define FPNAVI_HOST_PARAMCHECK_H

#include <string>
#include <vector>

#include "parameters/ParamFile.h"

namespace host {

// Error when a setting of s_modeFlag selects another mode.
void CheckMode(const std::vector<ParamSetting>& settings, const std::string& file, Mode mode);

// Error when settings are why params have no image with sides of 1 to 4096 pixels. params hold the
// settings.
void CheckImage(const std::vector<ParamSetting>& settings, const std::string& file,
                const ParamBlock& params);

// The settings that the size of the image under params comes from, for messages: "s_blockColNumFp =
// 8 at p.toml:2:19", separated by commas; empty for none.
std::string ImageSettings(const std::vector<ParamSetting>& settings, const std::string& file,
                          const ParamBlock& params);

}  // namespace host

#endif  // FPNAVI_HOST_PARAMCHECK_H
