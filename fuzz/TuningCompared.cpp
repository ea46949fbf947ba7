// Calibrations through the module and the plain model, call by call: any register and gains, frames
// of any brightness, parameters changed in between. Wrong is every difference.
#include <cstdio>
#include <cstdlib>

#include "FuzzFrames.h"
#include "FuzzParams.h"
#include "Twin.h"
#include "param/NaviParam.h"

namespace {

using fpnavi_fuzz::ByteSource;
using fpnavi_test::Twin;
using host::ParamBlock;
using host::ParamValue;

constexpr int64_t kBytesMax = 1 << 16;
constexpr int32_t kCallsMax = 40;

// Bytes of the module's image, at least 1.
int64_t ImageBytes() {
    if (fpnavi::s_imageWidth < 1 || fpnavi::s_imageHeight < 1)
        return 1;
    return int64_t{fpnavi::s_imageWidth} * fpnavi::s_imageHeight;
}

// Values that the calibration reads, changed more often than all the others.
void ChangeTuning(ByteSource& source, ParamBlock& params) {
    const size_t first = *host::ParamIndex("_NAVI_TimeOut_threshold");
    const size_t last = *host::ParamIndex("_NAVI_top_mean_interval.RANGE_HIGH");
    const int32_t changes = source.Range(0, 6);
    for (int32_t i = 0; i < changes; ++i) {
        int32_t& value = params[first + source.U8() % (last - first + 1)];
        const uint8_t kind = source.U8() % 8;
        value = kind < 4 ? source.Range(-1, 8) : kind < 7 ? source.U8() : source.I32();
    }
}

void SetParams(ByteSource& source) {
    ParamBlock params = fpnavi_fuzz::ChangedParams(source);
    ChangeTuning(source, params);
    Twin::Get().SetParam(&params);
}

// One grey, or two in stripes: what a calibration sees before a finger comes.
std::vector<uint8_t> Frame(ByteSource& source) {
    return fpnavi_fuzz::RepeatedBytes(source, static_cast<size_t>(ImageBytes()));
}

// Ends the calibration that an input before this one has begun.
void StartAfresh() {
    ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    ParamValue(params, "_NAVI_TimeOut_threshold") = 1;
    ParamValue(params, "_NAVI_DC_REF") = 0;
    Twin& twin = Twin::Get();
    twin.SetParam(&params);
    twin.Clear();
    twin.SetDac(255);
    twin.Tune(std::vector<uint8_t>(static_cast<size_t>(ImageBytes())), 0, 0);
}

void Calibrate(ByteSource& source) {
    Twin& twin = Twin::Get();
    const uint32_t mask = source.OneIn(8) ? 0xFFFFFFFFU : 0x00070707U;
    const uint32_t gain20 = source.U32() & mask;
    const uint32_t gain2C = source.U32() & mask;
    twin.SetDac(source.U32());
    for (int32_t calls = 0; calls < kCallsMax && !source.Empty(); ++calls) {
        const uint8_t what = source.U8() % 32;
        if (what == 29)
            twin.SetDac(source.U32());
        if (what == 30)
            twin.Clear();
        if (what == 31)
            SetParams(source);
        if (ImageBytes() > kBytesMax)
            return;
        twin.Tune(Frame(source), gain20, gain2C);
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    ByteSource source(data, size);
    StartAfresh();
    SetParams(source);
    Calibrate(source);
    const Twin& twin = Twin::Get();
    if (twin.Difference()) {
        std::fprintf(stderr, "module and model differ: %s\n", twin.Difference()->c_str());
        std::abort();
    }
    return 0;
}
