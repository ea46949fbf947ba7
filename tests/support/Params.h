// A parameter block by name, starting from the documented defaults, and read access to what the
// module has stored. The defaults stand here once more, so that the module's own are tested.
#ifndef TESTS_SUPPORT_PARAMS_H
#define TESTS_SUPPORT_PARAMS_H

#include <array>
#include <cstdint>
#include <string_view>
#include <vector>

#include "FpNavi.h"

namespace fpnavi_test {

struct ParamEntry {
    const char* name;
    int32_t defaultValue;
    const void* variable;  // 32 bits, signed or unsigned

    int32_t Stored() const;
};

// In the order of the parameter block.
const std::array<ParamEntry, FPNAVI_PARAM_NUM>& ParamTable();

// Ends the process for an unknown name.
size_t ParamIndex(std::string_view name);

class Params {
  public:
    Params();  // the defaults
    Params& Set(std::string_view name, int32_t value);
    Params& SetAll(int32_t value);
    int32_t Apply() const;  // SetNaviParam
    const std::array<int32_t, FPNAVI_PARAM_NUM>& Values() const { return m_values; }

  private:
    std::array<int32_t, FPNAVI_PARAM_NUM> m_values{};
};

// The module's derived variables, and its parameter variables in block order.
std::vector<int32_t> DerivedState();
std::vector<int32_t> StoredState();

}  // namespace fpnavi_test

#endif  // TESTS_SUPPORT_PARAMS_H
