// The calibration loop: grab a frame, tune, write the DC register, until the module says that it is
// done. Records each call by reading the module's state; writes none of it.
//
// The module remembers across runs: the first call after a completed run still sees that run's
// last recommendation, and forgets it at its end.
#ifndef FPNAVI_HOST_TUNERUN_H
#define FPNAVI_HOST_TUNERUN_H

#include <cstdint>
#include <functional>
#include <vector>

#include "parameters/ParamTable.h"

namespace host {

// What one call of _NAVI_Tune saw and left behind. A call that was not measured (the DC was below
// its lower limit and has been reset) has only its registers, DC values and result; the rest are
// those of the measurement before.
struct TuneCall {
    uint32_t registerBefore = 0;
    uint32_t registerAfter = 0;
    int32_t dcBefore = 0;
    int32_t dcAfter = 0;
    bool measured = false;
    uint32_t mean = 0;        // grey of the selected corner block
    int32_t topGrey = 0;      // grey of its brightest pixels; -1 for none
    uint32_t gainFactor = 0;  // grey per DC, in hundredths
    int32_t effective = 3;    // flags: -1 below the band, 0 inside, 1 above, 3 never measured
    int32_t recommended = 3;
    int32_t recommendedTop = 3;
    bool saturated = false;
    int32_t direction = 0;       // 1 up, -1 down; cleared by the first call after a completed run
    uint32_t step = 0;           // likewise
    uint32_t noMoreProcess = 0;  // 0 no further step, 2 stepped, look again
    int32_t result = 0;          // of _NAVI_Tune
};

enum class TuneEnd : int32_t {
    InBand,      // the mean lies in the effective band
    AtLimit,     // the DC lies at a limit and would have to go further
    CallLimit,   // _NAVI_TimeOut_threshold ran out; the last step has not been looked at
    NoStep,      // done without a step for any other reason
    NotNeeded,   // hg mode
    Unfinished,  // no more frames, or maxCalls reached
    Failed,      // GetNaviBlock or _NAVI_Tune returned -1
};

// "in band", "at limit", "call limit", "no step", "not needed", "unfinished", "failed".
const char* TuneEndName(TuneEnd end);

struct TuneSetup {
    ParamBlock params = DefaultParams();  // given to SetNaviParam first
    uint32_t start = 0;                   // DC register of the first frame
    uint32_t gain20 = 0;
    uint32_t gain2C = 0;
    int32_t maxCalls = 64;
};

struct TuneRun {
    std::vector<TuneCall> calls;
    uint32_t lastRegister = 0;  // what is in the sensor at the end
    TuneEnd end = TuneEnd::Unfinished;
};

// The next frame in sensor order, grabbed with dac in the DC register; empty when there is none.
using FrameSource = std::function<std::vector<uint8_t>(uint32_t dac)>;

// Runs the loop in this process. Throws Error, with source as the file's name, for parameters
// without a usable geometry (image sides of 1 to 4096) and for a frame of another size.
TuneRun RunTuning(const TuneSetup& setup, const FrameSource& grab, const std::string& source);

// The DC value in a register of the layout (1 low byte, 0 difference of bytes 1 and 0), signed;
// fallback for any other layout.
int32_t DcOfRegister(int32_t layout, uint32_t value, int32_t fallback = 0);

// value with the DC in 0..255 written to it as the layout has it; value itself in other layouts.
uint32_t RegisterOfDc(int32_t layout, int32_t dc, uint32_t value);

}  // namespace host

#endif  // FPNAVI_HOST_TUNERUN_H
