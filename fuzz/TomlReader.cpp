// Any bytes as a parameter file. Wrong is any exception but host::Error, and parameters that a file
// written of them does not give again.
#include <algorithm>
#include <string_view>

#include "InputFile.h"
#include "common/Error.h"
#include "parameters/ParamFile.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    const std::string_view text(reinterpret_cast<const char*>(data), size);
#ifdef FPNAVI_FUZZ_ASCII
    if (std::any_of(data, data + size, [](uint8_t byte) { return byte >= 0x80; }))
        return 0;
#endif
    host::ParamBlock params{};
    try {
        params = host::ParseParams(text, "input.toml");
    } catch (const host::Error&) {
        return 0;
    }
    const host::ParamBlock again = host::ParseParams(host::ParamFileText(params), "again.toml");
    fpnavi_fuzz::Require(again == params, "a written parameter file gives the same parameters");
    return 0;
}
