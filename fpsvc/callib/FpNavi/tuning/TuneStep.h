// Tuning, the decision: in which direction and how far the DC goes, within its limits. Owns nothing
// and reads no state: each function computes the next state from the state before and a reading.
#ifndef FPNAVI_TUNESTEP_H
#define FPNAVI_TUNESTEP_H

#include <cstdint>

#include "tuning/TuneMeasure.h"

namespace fpnavi {

// The state of the DC that one call leaves to the next.
struct DcState {
    uint32_t current;        // the DC that is being tuned
    uint32_t pre;            // DC that was in the sensor at the last call
    int32_t recommendPre;    // the reading's recommend of the call before; 3 without one
    uint32_t stepTop;        // step that would bring the top grey to 180; kept only
    uint32_t stepMean;       // step that would bring the mean to 180
    uint32_t step;           // step to apply
    int32_t orient;          // 1 raise, -1 lower, 0 neither
    uint32_t noMoreProcess;  // 0 no further step needed, 1 stepped though the mean is effective,
                             // 2 stepped, look again
};

// Direction and size of the next step.
DcState SizeStep(const DcState& before, const GreyReading& reading);

// Applies the step to the DC, within reference..kDcMax. reference: least DC, _NAVI_DC_REF;
// effective: of the reading.
DcState ApplyStep(const DcState& before, int32_t effective, int32_t reference);

// The decision of a call: no step while the mean is in the effective band; bisection after a step
// that overshot; else SizeStep and ApplyStep. reference: least DC, _NAVI_DC_REF.
DcState DecideStep(const DcState& before, const GreyReading& reading, int32_t reference);

}  // namespace fpnavi

#endif  // FPNAVI_TUNESTEP_H
