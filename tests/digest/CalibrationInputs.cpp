// Calibrations: of simulated front ends, and frames and registers at random.
#include <algorithm>

#include "Inputs.h"
#include "RandomGesture.h"
#include "parameters/ParamTable.h"
#include "simulator/FrontEnd.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::ParamBlock;
using host::SimRandom;

constexpr int32_t kCallsMax = 16;  // of one calibration

int32_t ImageWidth(const ParamBlock& params) {
    return host::GeometryOf(params).Width();
}

// Sane or hostile parameters, with the tuning's own switches drawn more often than the others.
ParamBlock TuningParams(SimRandom& random, Mode mode) {
    ParamBlock params;
    do {
        params = random.Chance(60) ? VariedParams(random, mode) : HostileParams(random, mode);
    } while (!HashedCalls::Fits(params));
    host::ParamValue(params, "iDCMode") = random.Chance(90) ? random.Below(2) : 2;
    if (random.Chance(20))
        host::ParamValue(params, "_NAVI_blk_selection_mode") = random.Range(-1, 4);
    if (random.Chance(30))
        host::ParamValue(params, "_NAVI_TimeOut_threshold") = random.Range(-1, 6);
    return params;
}

std::vector<uint8_t> RandomFrame(SimRandom& random, int32_t level, int32_t spread) {
    std::vector<uint8_t> frame(4096);  // the picture of the default sensors and more
    for (uint8_t& grey : frame)
        grey = static_cast<uint8_t>(std::clamp(level + random.Range(-spread, spread), 0, 255));
    return frame;
}

}  // namespace

void CalibrateFrontEnd(HashedCalls& calls, Mode mode, uint64_t seed) {
    SimRandom random(seed);
    const host::FrontEndPlan plan = host::RandomFrontEnd(random.Next());
    ParamBlock params = host::ParamsForMode(mode, random.Chance(30));
    host::ParamValue(params, "iDCMode") = plan.layout;
    host::ParamValue(params, "_NAVI_TimeOut_threshold") = random.Chance(50) ? 2 : 0;
    host::ParamValue(params, "_NAVI_blk_selection_mode") = random.Below(4);
    host::FrontEnd sensor(plan, params);
    calls.SetParam(params);
    calls.SetDac(host::StartRegister(plan));
    for (int32_t call = 0; call < kCallsMax; ++call) {
        calls.Block(sensor.Grab(calls.Dac()), ImageWidth(params));
        if (calls.Tune(plan.gain20, plan.gain2C) != 0)
            break;
    }
    if (random.Chance(50))
        calls.Clear();
    calls.EndCalibration();
}

void CalibrateAtRandom(HashedCalls& calls, Mode mode, uint64_t seed) {
    SimRandom random(seed);
    calls.SetParam(TuningParams(random, mode));
    calls.SetDac(static_cast<uint32_t>(random.Next()));
    const uint32_t gainMask = random.Chance(90) ? 0x00070707U : 0xFFFFFFFFU;
    const uint32_t gain20 = static_cast<uint32_t>(random.Next()) & gainMask;
    const uint32_t gain2C = static_cast<uint32_t>(random.Next()) & gainMask;
    const int32_t base = random.Range(0, 255);
    const int32_t spread = random.Chance(40) ? 2 : random.Range(1, 100);
    const int32_t number = random.Range(1, 8);
    for (int32_t call = 0; call < number; ++call) {
        const int32_t level = base + random.Range(-60, 60);
        calls.Block(RandomFrame(random, level, spread), 0);
        calls.Tune(gain20, gain2C);
        if (random.Chance(10))
            calls.SetDac(static_cast<uint32_t>(random.Next()));
        if (random.Chance(10))
            calls.Clear();
    }
    calls.EndCalibration();
}

}  // namespace fpnavi_test
