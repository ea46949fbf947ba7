// The path of a simulated finger: where it is and how hard it presses, frame by frame.
#ifndef FPNAVI_HOST_PATH_H
#define FPNAVI_HOST_PATH_H

#include <vector>

#include "simulator/Frame.h"
#include "simulator/Plan.h"

namespace host {

// One state per frame: plan.lead empty ones, the landing, the motion or rest, the lift and
// plan.tail empty ones (lift and tail are left out with plan.timeOut). The middle of the way lies
// near the centre of the window. Draws from random only.
std::vector<FingerState> FingerPath(const SimPlan& plan, SimRandom& random);

}  // namespace host

#endif  // FPNAVI_HOST_PATH_H
