// Requirement: bring the mean grey of the measured block into the effective band in few calls, each
// of which sees one frame; the DC stays between its lower limit and 255.
//
// Observation: the gain factor says how many greys a DC step is worth, so one division sizes the
// step. That fails on a saturated frame, whose grey does not say how far away the target is.
//
// Algorithm: step by distance to the target / gain factor, at least 16 on a saturated frame. When
// such a frame changes sides from one call to the next, the step overshot: bisect.
#include "tuning/TuneStep.h"

#include <algorithm>

#include "base/NaviMath.h"
#include "tuning/TuneRegisters.h"

namespace fpnavi {
namespace {

constexpr int32_t kGreyTarget = 180;     // the middle of the recommended bands
constexpr uint32_t kStepSaturated = 16;  // least step on a saturated frame
constexpr int32_t kUnknown = 3;          // no recommendation yet
constexpr uint32_t kByteMask = 0xFF;

// The DC step that brings grey to the target, at least 1. Deliberate: at the target it stays what
// it was before. With a gain factor of 0 the size is unknown: 1.
uint32_t StepToTarget(int32_t grey, uint32_t gainFactor, uint32_t before) {
    if (grey == kGreyTarget)
        return before;
    const int32_t distance =
        grey < kGreyTarget ? WrapSub(kGreyTarget, grey) : WrapSub(grey, kGreyTarget);
    const uint32_t enlarged = static_cast<uint32_t>(WrapMul(_NAVI_ENLARGE_K, distance));
    return gainFactor == 0 ? 1U : std::max(enlarged / gainFactor, 1U);
}

// A saturated frame whose recommendation differs from that of the last call: the last step
// overshot.
bool Overshot(const DcState& dc, const GreyReading& reading) {
    const bool known = dc.recommendPre != kUnknown && dc.recommendPre != 0;
    const bool dcMoved = (dc.current & kByteMask) != (dc.pre & kByteMask);
    const bool flipped = dc.recommendPre != reading.recommend;
    return known && reading.nonLinear != 0 && dcMoved && flipped;
}

// Bisect: the mean of current and previous DC, or the previous one when they are neighbours.
uint32_t Bisected(const DcState& dc) {
    const uint32_t d = WrapSubU(dc.current & kByteMask, dc.pre & kByteMask);
    if (d == 1 || d == WrapSubU(0, 1))
        return dc.pre;
    return WrapAddU(dc.pre, dc.current) >> 1;
}

}  // namespace

DcState SizeStep(const DcState& before, const GreyReading& reading) {
    DcState after = before;
    after.stepTop =
        StepToTarget(static_cast<int32_t>(reading.top), reading.gainFactor, before.stepTop);
    after.stepMean =
        StepToTarget(static_cast<int32_t>(reading.mean), reading.gainFactor, before.stepMean);
    if (reading.recommend == 0) {
        after.orient = 0;
        after.step = 0;
    } else if (reading.recommend == 1 || reading.recommend == -1) {
        after.orient = -reading.recommend;
        after.step = after.stepMean;
    }
    if (reading.nonLinear != 0)
        after.step = std::max(after.step, kStepSaturated);
    return after;
}

DcState ApplyStep(const DcState& before, int32_t effective, int32_t reference) {
    DcState after = before;
    after.noMoreProcess = 0;
    if (before.orient != 1 && before.orient != -1)
        return after;
    const bool raise = before.orient == 1;
    const auto lowest = static_cast<uint32_t>(reference);
    if (before.current == (raise ? kDcMax : lowest)) {  // no further in the wanted direction
        after.recommendPre = kUnknown;
        return after;
    }
    if (raise)
        after.current = std::min(WrapAddU(before.current, before.step), kDcMax);
    else if (static_cast<int32_t>(before.current) >
             WrapAdd(reference, static_cast<int32_t>(before.step)))
        after.current = WrapSubU(before.current, before.step);
    else
        after.current = lowest;
    after.noMoreProcess = effective == 0 ? 1 : 2;
    return after;
}

DcState DecideStep(const DcState& before, const GreyReading& reading, int32_t reference) {
    DcState after = before;
    if (reading.effective == 0) {
        after.noMoreProcess = 0;
        after.orient = 0;
        after.step = 0;
        return after;
    }
    if (Overshot(before, reading)) {
        after.current = Bisected(before);
        return after;
    }
    return ApplyStep(SizeStep(before, reading), reading.effective, reference);
}

}  // namespace fpnavi
