// The plan of a simulated gesture: everything that the simulator turns into frames.
#ifndef FPNAVI_HOST_PLAN_H
#define FPNAVI_HOST_PLAN_H

#include <cstdint>
#include <string>

#include "recording/Recording.h"

namespace host {

enum class SimKind : int32_t {
    Stroke,     // 3.5 to 8 pixels per frame along an axis
    Drift,      // the same, 12 to 24 degrees off
    Fast,       // 9 to 11 pixels per frame
    Slow,       // 1 to 2 pixels per frame
    Small,      // 3 to 7 pixels in all
    Big,        // a stroke with a patch wider than the window
    Diagonal,   // about 45 degrees
    Reversal,   // there and back
    Rest,       // the finger lands, rests and leaves
    Tap,        // it rests for a few frames only
    LongPress,  // it rests long, often until the host's time-out
};

// The kind as it stands in tags, e.g. "stroke".
const char* SimKindName(SimKind kind);

// True for the kinds without intended motion.
bool IsResting(SimKind kind);

enum class SkinState : int32_t {
    Normal,
    Wet,  // low contrast
    Dry,  // broken ridges
};

// Counts of frames and lengths are at least 0, half axes and the ridge period at least 1.
struct SimPlan {
    uint64_t seed = 0;  // of everything that the other fields leave open
    Mode mode = Mode::Fp;
    bool plain = false;  // fp only: one contiguous window instead of nine tiles
    SimKind kind = SimKind::Stroke;
    int32_t angle = 0;       // degrees: 0 right, 90 up, 180 left, 270 down
    int32_t speed16 = 80;    // 1/16 pixel per frame
    int32_t frames = 8;      // with the finger at its speed (or at rest)
    int32_t lead = 1;        // empty frames before the finger lands
    int32_t land = 2;        // frames in which pressure grows
    int32_t lift = 2;        // frames in which it falls
    int32_t tail = 2;        // empty frames afterwards; at least 1 unless timeOut
    bool timeOut = false;    // the recording ends with the finger down
    int32_t pressure = 256;  // at rest, 1 .. 256
    int32_t semiX16 = 960;   // half axes of the contact patch at full pressure, 1/16 pixel
    int32_t semiY16 = 720;
    int32_t period16 = 144;  // ridge period, 112 .. 160
    int32_t noise16 = 32;    // white noise, standard deviation in 1/16 grey
    SkinState skin = SkinState::Normal;
    int32_t stretch = 0;  // greatest stretch of the skin along the motion, in 1/1024
};

// A plan of the given kind with everything else drawn from seed, as people do it.
SimPlan PlanOfKind(uint64_t seed, Mode mode, bool plain, SimKind kind);

// A plan with the kind drawn from seed too: about half plain strokes along an axis, a quarter
// rests, taps and long presses, the rest drifts, diagonals, reversals, slow, small, fast and big
// ones.
SimPlan RandomPlan(uint64_t seed, Mode mode);

}  // namespace host

#endif  // FPNAVI_HOST_PLAN_H
