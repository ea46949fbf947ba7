// Parameters of a file, laid over those of recordings.
#ifndef FPNAVI_HOST_PARAMOVERRIDES_H
#define FPNAVI_HOST_PARAMOVERRIDES_H

#include <string>
#include <vector>

#include "parameters/ParamFile.h"

namespace host {

struct ParamOverrides {
    std::string file;  // as errors name it
    std::vector<ParamSetting> settings;
};

// The parameters that a TOML file sets, no others. Throws Error as ReadParamSettings does.
ParamOverrides ReadOverrides(const std::string& path);

void ApplyOverrides(const ParamOverrides& overrides, ParamBlock* params);

// Throws Error, with the file, the place and the name of the parameter, when overrides change the
// mode or the geometry of a gesture recorded with params, or make its hg finger test read beyond
// its frames. id is the gesture's.
void CheckOverrides(const ParamOverrides& overrides, const ParamBlock& params,
                    const std::string& id);

}  // namespace host

#endif  // FPNAVI_HOST_PARAMOVERRIDES_H
