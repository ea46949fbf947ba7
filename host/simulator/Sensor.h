// The simulated sensor: from a plan to a recorded gesture that knows its answers.
#ifndef FPNAVI_HOST_SENSOR_H
#define FPNAVI_HOST_SENSOR_H

#include <string>

#include "recording/Recording.h"
#include "simulator/Frame.h"
#include "simulator/Plan.h"

namespace host {

// A tag of every simulated gesture and of no other.
inline constexpr const char* kSimulatedTag = "simulated";

// Grey levels, fixed pattern and noise of the sensor that plan uses.
GreyModel GreyModelOf(const SimPlan& plan);

// The gesture of plan: raw frames in block order, registers in double-scan mode, true positions and
// presence, label, accepted keys, tier, tags (kind, layout, state of the skin) and a note with the
// seed. Depends on plan and id alone: equal plans give equal bytes everywhere.
Gesture Simulate(const SimPlan& plan, std::string id);

}  // namespace host

#endif  // FPNAVI_HOST_SENSOR_H
