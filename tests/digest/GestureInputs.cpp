// Gestures: of the simulated sensor, and moving pictures under parameters from sane to hostile.
#include "Inputs.h"
#include "RandomGesture.h"
#include "parameters/ParamTable.h"
#include "simulator/Sensor.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::ParamBlock;
using host::SimRandom;

using MakeParams = ParamBlock (*)(SimRandom&, Mode);

// Parameters whose frames fit and whose searches end soon under an emulator too.
ParamBlock UsableParams(SimRandom& random, Mode mode, MakeParams make) {
    ParamBlock params = make(random, mode);
    while (!CheapEnough(params) || !HashedCalls::Fits(params))
        params = make(random, mode);
    return params;
}

// Registers first, as a host reads them; each draw in a statement of its own, since compilers are
// free in the order of arguments.
void RandomZones(HashedCalls& calls, SimRandom& random) {
    const uint32_t reg24 = static_cast<uint32_t>(random.Next());
    const uint32_t reg28 = static_cast<uint32_t>(random.Next());
    calls.Zones(reg24, reg28);
}

// One frame, most of the time as a host takes it: now and then without its finger test, with a
// time-out, null pointers or a vote in between.
void RandomStep(HashedCalls& calls, SimRandom& random, MovingPicture& picture, Mode mode,
                int32_t width) {
    if (mode == Mode::DoubleScan || random.Chance(3))
        RandomZones(calls, random);
    calls.Block(picture.Next(), width);
    if (random.Chance(80))
        calls.Status(random.Chance(1));
    const int32_t timeOut = random.Chance(4) ? random.Range(-1, 2) : 0;
    const bool nullPrev = random.Chance(1);
    const bool nullCurr = random.Chance(1);
    calls.Frame(timeOut, nullPrev, nullCurr);
    if (random.Chance(5))
        calls.Vote(random.Below(3));
}

void RunPictures(HashedCalls& calls, Mode mode, uint64_t seed, MakeParams make) {
    SimRandom random(seed);
    const ParamBlock params = UsableParams(random, mode, make);
    const host::Geometry geometry = host::GeometryOf(params);
    const bool image = geometry.blockWidth > 0 && geometry.blockHeight > 0 &&
                       geometry.blockColNum > 0 && geometry.blockRowNum > 0;
    const int32_t width = image ? geometry.Width() : 64;
    const int32_t height = image ? geometry.Height() : 64;
    MovingPicture picture(random.Next(), width, height);
    calls.SetParam(params);
    calls.Clear();
    const int32_t frames = random.Chance(1) ? 110 : random.Range(2, 10);
    for (int32_t frame = 0; frame < frames; ++frame)
        RandomStep(calls, random, picture, mode, random.Chance(90) ? width : random.Range(-1, 99));
    calls.Vote(1);
    calls.EndGesture();
}

}  // namespace

void RunSimulated(HashedCalls& calls, Mode mode, uint64_t seed) {
    SimRandom random(seed);
    const host::Gesture gesture = host::Simulate(host::RandomPlan(random.Next(), mode), "digest");
    ParamBlock params = random.Chance(60) ? gesture.params : VariedParams(random, mode);
    host::ParamValue(params, "s_logShowFlag") = random.Below(2);
    calls.SetParam(params);
    calls.Clear();
    for (const host::RecordedFrame& frame : gesture.frames) {
        if (mode == Mode::DoubleScan)
            calls.Zones(frame.reg24, frame.reg28);
        calls.Block(frame.raw, gesture.geometry.Width());
        calls.Status();
        calls.Frame(0);
    }
    calls.Vote(0);
    calls.Vote(1);
    calls.EndGesture();
}

void RunVaried(HashedCalls& calls, Mode mode, uint64_t seed) {
    RunPictures(calls, mode, seed, VariedParams);
}

void RunOtherGeometry(HashedCalls& calls, Mode mode, uint64_t seed) {
    RunPictures(calls, mode, seed, OtherGeometryParams);
}

void RunHostile(HashedCalls& calls, Mode mode, uint64_t seed) {
    RunPictures(calls, mode, seed, HostileParams);
}

}  // namespace fpnavi_test
