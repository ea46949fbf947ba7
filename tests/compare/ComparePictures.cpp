// Gestures of moving pictures, of any sensor and under any parameters, through the module and the
// reference model: equal call by call.
#include <gtest/gtest.h>

#include <cstdint>
#include <iterator>

#include "CompareRun.h"
#include "RandomGesture.h"
#include "Twin.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

// How often, in percent of the frames, the finger test is called: mostly it sees no finger in a
// picture, and then the gesture has ended.
int32_t RandomStatusShare(SimRandom& random) {
    constexpr int32_t kShares[] = {0, 0, 0, 5, 30, 80};
    return kShares[random.Below(static_cast<int32_t>(std::size(kShares)))];
}

// One call chosen at random, most of the time the next step of a gesture.
void RandomStep(SimRandom& random, MovingPicture& picture, Mode mode, int32_t statusShare) {
    Twin& twin = Twin::Get();
    if (mode == Mode::DoubleScan || random.Chance(3)) {
        const auto reg24 = static_cast<uint32_t>(random.Next());  // first, with every compiler
        twin.Zones(reg24, static_cast<uint32_t>(random.Next()));
    }
    twin.SetImage(picture.Next());
    if (random.Chance(statusShare))
        twin.Status(random.Chance(1));
    const int32_t timeOut = random.Chance(4) ? random.Range(-1, 2) : 0;
    twin.Frame(timeOut, random.Chance(1), random.Chance(1));
    if (random.Chance(5))
        twin.Vote(random.Below(3));
}

using MakeParams = ParamBlock (*)(SimRandom&, Mode);

ParamBlock CheapParams(SimRandom& random, Mode mode, MakeParams makeParams) {
    ParamBlock params = makeParams(random, mode);
    while (!CheapEnough(params))
        params = makeParams(random, mode);
    return params;
}

// Gestures of moving pictures under parameters of the given making.
void ReplayPictures(uint64_t test, Mode mode, MakeParams makeParams, int64_t percent) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(percent);
    GestureCounts counts;
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        const ParamBlock params = CheapParams(random, mode, makeParams);
        twin.SetParam(&params);
        if (!twin.ImageFits()) {
            counts.Note("image_too_large");
            continue;
        }
        twin.Clear();
        const FrameSize size = PictureSize(params);
        MovingPicture picture(random.Next(), size.width, size.height);
        const int32_t statusShare = RandomStatusShare(random);
        for (int32_t frames = RandomFrameCount(random, size); frames > 0; --frames)
            RandomStep(random, picture, mode, statusShare);
        counts.Note(params);
        twin.Vote(1);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
    counts.Record();
}

TEST(CompareVariedParameters, FpMode) {
    ReplayPictures(11, Mode::Fp, VariedParams, 12);
}
TEST(CompareVariedParameters, HgMode) {
    ReplayPictures(12, Mode::Hg, VariedParams, 5);
}
TEST(CompareVariedParameters, DoubleScanMode) {
    ReplayPictures(13, Mode::DoubleScan, VariedParams, 4);
}

TEST(CompareOtherGeometries, FpMode) {
    ReplayPictures(21, Mode::Fp, OtherGeometryParams, 26);
}
TEST(CompareOtherGeometries, HgMode) {
    ReplayPictures(22, Mode::Hg, OtherGeometryParams, 5);
}
TEST(CompareOtherGeometries, DoubleScanMode) {
    ReplayPictures(23, Mode::DoubleScan, OtherGeometryParams, 6);
}

TEST(CompareHostileParameters, FpMode) {
    ReplayPictures(31, Mode::Fp, HostileParams, 8);
}
TEST(CompareHostileParameters, HgMode) {
    ReplayPictures(32, Mode::Hg, HostileParams, 3);
}
TEST(CompareHostileParameters, DoubleScanMode) {
    ReplayPictures(33, Mode::DoubleScan, HostileParams, 3);
}

// Either the default sensor or another.
ParamBlock AnySensorParams(SimRandom& random, Mode mode) {
    return random.Chance(40) ? VariedParams(random, mode) : OtherGeometryParams(random, mode);
}

// What a host may set between two frames: thresholds, tiles, another sensor, another mode.
ParamBlock ChangedParams(SimRandom& random, Mode mode, const ParamBlock& params,
                         GestureCounts& counts) {
    const int32_t what = random.Below(10);
    if (what < 6) {
        counts.Note("change_of_thresholds_or_tiles");
        return SameSensorParams(random, params);
    }
    if (what < 8) {
        ParamBlock changed = params;
        const bool hg = ParamValue(params, "s_modeFlag") == 1;
        ParamValue(changed, "s_modeFlag") = hg ? (mode == Mode::DoubleScan ? 2 : 0) : 1;
        counts.Note("change_of_mode");
        return changed;
    }
    counts.Note("change_of_sensor");
    return CheapParams(random, random.Chance(80) ? mode : Mode::Hg, AnySensorParams);
}

// The parameters change between frames of a gesture. mode: of the gestures at first.
void ReplayChanges(uint64_t test, Mode mode, int64_t percent) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(percent);
    GestureCounts counts;
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        ParamBlock params = CheapParams(random, mode, AnySensorParams);
        twin.SetParam(&params);
        twin.Clear();
        FrameSize size = PictureSize(params);
        MovingPicture picture(random.Next(), size.width, size.height);
        const int32_t statusShare = RandomStatusShare(random);
        for (int32_t frames = RandomFrameCount(random, size); frames > 0; --frames) {
            if (random.Chance(25)) {
                const ParamBlock changed = ChangedParams(random, mode, params, counts);
                if (!CheapEnough(changed))
                    continue;
                params = changed;
                twin.SetParam(&params);
                size = PictureSize(params);
                picture.SetSize(size.width, size.height);
            }
            RandomStep(random, picture, mode, statusShare);
        }
        counts.Note(params);
        twin.Vote(1);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
    counts.Record();
}

TEST(CompareChangedParameters, FpAndHgMode) {
    ReplayChanges(71, Mode::Fp, 6);
}
TEST(CompareChangedParameters, DoubleScanAndHgMode) {
    ReplayChanges(72, Mode::DoubleScan, 4);
}

TEST(CompareFailedAllocations, AnyAllocationOfALaterFrame) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(3);
    GestureCounts counts;
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(41, i));
        const ParamBlock params = CheapParams(random, Mode::Fp, AnySensorParams);
        twin.SetParam(&params);
        twin.Clear();
        const FrameSize size = PictureSize(params);
        MovingPicture picture(random.Next(), size.width, size.height);
        const int32_t frames = RandomFrameCount(random, size);
        const int32_t failing = random.Below(frames);
        for (int32_t frame = 0; frame < frames; ++frame) {
            twin.SetImage(picture.Next());
            if (frame == failing)
                twin.FailAllocation(random.Range(1, 12), random.Chance(50));
            twin.Frame(0);
        }
        counts.Note(params);
        twin.Vote(1);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
    counts.Record();
}

}  // namespace
}  // namespace fpnavi_test
