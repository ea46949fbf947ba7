// A simulated analogue front end: what the sensor shows at each value of its DC register. It is
// what the tuning steers, and answers a little off from what the gain tables promise.
//
// Integers only, as in all of the simulator; equal plans and equal registers give equal frames.
#ifndef FPNAVI_HOST_FRONTEND_H
#define FPNAVI_HOST_FRONTEND_H

#include <cstdint>
#include <vector>

#include "parameters/ParamTable.h"
#include "simulator/Frame.h"

namespace host {

enum class Touch { None, Covered, Partial };  // nothing, a finger all over, one at an edge

struct FrontEndPlan {
    uint64_t seed = 0;              // of skin, fixed pattern, noise and drift
    int32_t layout = 1;             // of the DC register, as iDCMode: 1 low byte, 0 differences
    uint32_t gain20 = 0x00020700U;  // gain registers; these two are the reference gain
    uint32_t gain2C = 0x00000102U;
    int32_t startDc = 191;        // in the register at power-up, 0..255
    uint32_t startBits = 0;       // what else is in it
    int32_t mismatch = 100;       // true grey per DC, percent of what the tables say
    int32_t centre16 = 191 * 16;  // DC in 1/16 at which the untouched sensor shows grey 180
    int32_t contrast = 90;        // grey from untouched down to the top of a ridge
    Touch touch = Touch::None;
    int32_t pattern = 2;   // amplitude of the fixed pattern, grey
    int32_t noise16 = 32;  // white noise, standard deviation in 1/16 grey
    int32_t drift16 = 8;   // greatest change from frame to frame, in 1/16 grey
};

// A plan drawn from seed: both layouts, a third each at the reference gain, near it and anywhere
// in the tables' range; centres mostly within the DC's range, starts mostly above its lower limit.
FrontEndPlan RandomFrontEnd(uint64_t seed);

// The DC register at power-up.
uint32_t StartRegister(const FrontEndPlan& plan);

// Grey per DC step of plan, in hundredths: 374 at the reference gain, scaled by the amplifiers and
// by the mismatch. Gain fields above 7 count as 7.
int32_t TrueGainFactor(const FrontEndPlan& plan);

class FrontEnd {
  public:
    // params: for the geometry and the window of the frames; image sides 1 to 4096.
    FrontEnd(const FrontEndPlan& plan, const ParamBlock& params);

    // The next frame with dac in the DC register, in sensor order. In layout 0 the even columns
    // follow the lower pair of bytes and the odd ones the upper.
    std::vector<uint8_t> Grab(uint32_t dac);

  private:
    std::vector<uint8_t> Picture(int32_t dc);

    FrontEndPlan m_plan;
    Geometry m_geometry;
    std::vector<SkinPoint> m_points;
    SimRandom m_random;
    int32_t m_factor;
    int32_t m_drift16 = 0;
};

}  // namespace host

#endif  // FPNAVI_HOST_FRONTEND_H
