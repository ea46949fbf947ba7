// Random gestures through the module and the reference model: equal call by call.
//
// FPNAVI_COMPARE_GESTURES sets the number of gestures of all tests together (default 10,000),
// FPNAVI_COMPARE_SEED another seed.
#include <gtest/gtest.h>

#include <cstdint>
#include <cstdlib>
#include <iterator>

#include "RandomGesture.h"
#include "SimCorpus.h"
#include "SimFrame.h"
#include "SimSensor.h"
#include "Twin.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::SimRandom;

int64_t FromEnvironment(const char* name, int64_t otherwise) {
    const char* const text = std::getenv(name);
    return text != nullptr ? std::atoll(text) : otherwise;
}

// This test's part of all gestures, in percent.
int64_t Gestures(int64_t percent) {
    return std::max<int64_t>(FromEnvironment("FPNAVI_COMPARE_GESTURES", 10000) * percent / 100, 1);
}

uint64_t SeedOf(uint64_t test, int64_t index) {
    const auto seed = static_cast<uint64_t>(FromEnvironment("FPNAVI_COMPARE_SEED", 1));
    return host::Mix64(seed * 1000003 + test) + static_cast<uint64_t>(index);
}

// A gesture of the simulated sensor, replayed as a host does it, under params.
void ReplaySimulated(const host::Gesture& gesture, const host::ParamBlock& params) {
    Twin& twin = Twin::Get();
    twin.SetParam(&params);
    twin.Clear();
    for (const host::RecordedFrame& frame : gesture.frames) {
        if (gesture.mode == Mode::DoubleScan)
            twin.Zones(frame.reg24, frame.reg28);
        twin.Block(frame.raw, gesture.geometry.Width());
        twin.Status();
        twin.Frame(0);
    }
    twin.Vote(0);
    twin.Vote(1);
}

void ReplaySimulatedKind(uint64_t test, Mode mode, int64_t percent) {
    const int64_t count = Gestures(percent);
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        const host::SimPlan plan = host::RandomPlan(random.Next(), mode);
        const host::Gesture gesture = host::Simulate(plan, "compared");
        ReplaySimulated(gesture, random.Chance(40) ? gesture.params : VariedParams(random, mode));
        ASSERT_FALSE(Twin::Get().Difference())
            << *Twin::Get().Difference() << " of gesture " << i << " (" << gesture.notes << ")";
    }
    ::testing::Test::RecordProperty("calls", static_cast<int>(Twin::Get().Calls()));
}

// One call chosen at random, most of the time the next step of a gesture.
void RandomStep(SimRandom& random, MovingPicture& picture, Mode mode) {
    Twin& twin = Twin::Get();
    if (mode == Mode::DoubleScan || random.Chance(3)) {
        const auto reg24 = static_cast<uint32_t>(random.Next());  // first, with every compiler
        twin.Zones(reg24, static_cast<uint32_t>(random.Next()));
    }
    twin.SetImage(picture.Next());
    if (random.Chance(80))
        twin.Status(random.Chance(1));
    const int32_t timeOut = random.Chance(4) ? random.Range(-1, 2) : 0;
    twin.Frame(timeOut, random.Chance(1), random.Chance(1));
    if (random.Chance(5))
        twin.Vote(random.Below(3));
}

using MakeParams = host::ParamBlock (*)(SimRandom&, Mode);

// Gestures of moving pictures under parameters of the given making.
void ReplayPictures(uint64_t test, Mode mode, MakeParams makeParams, int64_t percent) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(percent);
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        host::ParamBlock params = makeParams(random, mode);
        while (!CheapEnough(params))
            params = makeParams(random, mode);
        twin.SetParam(&params);
        if (!Twin::ImageFits())
            continue;
        twin.Clear();
        const host::Geometry geometry = host::GeometryOf(params);
        const bool sane = geometry.blockWidth > 0 && geometry.blockColNum > 0 &&
                          geometry.blockWidth <= 4096 && geometry.blockColNum <= 4096 &&
                          geometry.blockHeight > 0 && geometry.blockRowNum > 0 &&
                          geometry.blockHeight <= 4096 && geometry.blockRowNum <= 4096 &&
                          geometry.Width() * geometry.Height() <= 1 << 16;
        MovingPicture picture(random.Next(), sane ? geometry.Width() : 64,
                              sane ? geometry.Height() : 64);
        const int32_t frames = random.Chance(2) ? 110 : random.Range(2, 12);
        for (int32_t frame = 0; frame < frames; ++frame)
            RandomStep(random, picture, mode);
        twin.Vote(1);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
    ::testing::Test::RecordProperty("calls", static_cast<int>(twin.Calls()));
}

TEST(CompareSimulated, FpMode) {
    ReplaySimulatedKind(1, Mode::Fp, 10);
}
TEST(CompareSimulated, HgMode) {
    ReplaySimulatedKind(2, Mode::Hg, 8);
}
TEST(CompareSimulated, DoubleScanMode) {
    ReplaySimulatedKind(3, Mode::DoubleScan, 7);
}

TEST(CompareVariedParameters, FpMode) {
    ReplayPictures(11, Mode::Fp, VariedParams, 10);
}
TEST(CompareVariedParameters, HgMode) {
    ReplayPictures(12, Mode::Hg, VariedParams, 8);
}
TEST(CompareVariedParameters, DoubleScanMode) {
    ReplayPictures(13, Mode::DoubleScan, VariedParams, 7);
}

TEST(CompareOtherGeometries, FpMode) {
    ReplayPictures(21, Mode::Fp, OtherGeometryParams, 12);
}
TEST(CompareOtherGeometries, HgMode) {
    ReplayPictures(22, Mode::Hg, OtherGeometryParams, 4);
}
TEST(CompareOtherGeometries, DoubleScanMode) {
    ReplayPictures(23, Mode::DoubleScan, OtherGeometryParams, 4);
}

TEST(CompareHostileParameters, FpMode) {
    ReplayPictures(31, Mode::Fp, HostileParams, 10);
}
TEST(CompareHostileParameters, HgMode) {
    ReplayPictures(32, Mode::Hg, HostileParams, 5);
}
TEST(CompareHostileParameters, DoubleScanMode) {
    ReplayPictures(33, Mode::DoubleScan, HostileParams, 5);
}

TEST(CompareFailedAllocations, EveryAllocationOfALaterFrame) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(5);
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(41, i));
        const host::SimPlan plan = host::RandomPlan(random.Next(), Mode::Fp);
        const host::Gesture gesture = host::Simulate(plan, "compared");
        twin.SetParam(&gesture.params);
        twin.Clear();
        const size_t failing =
            static_cast<size_t>(random.Below(static_cast<int32_t>(gesture.frames.size())));
        for (size_t frame = 0; frame < gesture.frames.size(); ++frame) {
            twin.Block(gesture.frames[frame].raw, gesture.geometry.Width());
            twin.Status();
            if (frame == failing)
                twin.FailAllocation(random.Range(1, 12), random.Chance(50));
            twin.Frame(0);
        }
        twin.Vote(1);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
}

// Simulated gestures during which the host writes counts of pairs into the record, with all log
// lines of the votes.
void ReplayWithWrittenCounts(uint64_t test, Mode mode, int64_t percent) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(percent);
    const int32_t counts[] = {INT32_MIN, -100, -1, 0, 1, 97, 98, 99, 100, 101, 1503, INT32_MAX};
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        const host::SimPlan plan = host::RandomPlan(random.Next(), mode);
        const host::Gesture gesture = host::Simulate(plan, "compared");
        host::ParamBlock params = gesture.params;
        host::ParamValue(params, "s_logShowFlag") = 1;
        twin.SetParam(&params);
        twin.Clear();
        for (const host::RecordedFrame& frame : gesture.frames) {
            if (random.Chance(40))
                twin.SetPairCount(counts[random.Below(static_cast<int32_t>(std::size(counts)))]);
            if (mode == Mode::DoubleScan)
                twin.Zones(frame.reg24, frame.reg28);
            twin.Block(frame.raw, gesture.geometry.Width());
            twin.Status();
            twin.Frame(0);
            if (random.Chance(30))
                twin.Vote(1);
        }
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of gesture " << i;
    }
}

TEST(CompareWrittenPairCounts, FpMode) {
    ReplayWithWrittenCounts(61, Mode::Fp, 3);
}
TEST(CompareWrittenPairCounts, HgMode) {
    ReplayWithWrittenCounts(62, Mode::Hg, 3);
}
TEST(CompareWrittenPairCounts, DoubleScanMode) {
    ReplayWithWrittenCounts(63, Mode::DoubleScan, 3);
}

// An image of any size that the parameters may ask for; its first 4096 pixels are noise around a
// level.
std::vector<uint8_t> NoisyImage(int32_t level, int32_t spread, SimRandom& random) {
    std::vector<uint8_t> image(size_t{1} << 20);
    for (size_t p = 0; p < 4096; ++p)
        image[p] = static_cast<uint8_t>(std::clamp(level + random.Range(-spread, spread), 0, 255));
    return image;
}

// Tuning runs with gestures between them.
TEST(CompareTuning, RunsOfAllModes) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(20);
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(51, i));
        const Mode mode = random.Chance(5) ? Mode::Hg : Mode::Fp;
        host::ParamBlock params =
            random.Chance(60) ? VariedParams(random, mode) : HostileParams(random, mode);
        host::ParamValue(params, "iDCMode") = random.Chance(90) ? random.Below(2) : 2;
        if (random.Chance(20))
            host::ParamValue(params, "_NAVI_blk_selection_mode") = random.Range(-1, 4);
        if (random.Chance(30))
            host::ParamValue(params, "_NAVI_TimeOut_threshold") = random.Range(-1, 6);
        twin.SetParam(&params);
        if (!Twin::ImageFits())
            continue;
        twin.SetDac(static_cast<uint32_t>(random.Next()));
        const uint32_t gainMask = random.Chance(90) ? 0x00070707U : 0xFFFFFFFFU;
        const uint32_t gain20 = static_cast<uint32_t>(random.Next()) & gainMask;
        const uint32_t gain2C = static_cast<uint32_t>(random.Next()) & gainMask;
        const int32_t base = random.Range(0, 255);
        const int32_t spread = random.Chance(40) ? 2 : random.Range(1, 100);
        for (int32_t call = 0; call < random.Range(1, 8); ++call) {
            twin.Tune(NoisyImage(base + random.Range(-60, 60), spread, random), gain20, gain2C);
            if (random.Chance(10))
                twin.SetDac(static_cast<uint32_t>(random.Next()));
            if (random.Chance(10))
                twin.Clear();
        }
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of run " << i;
    }
}

// Block sizes and counts of either sign whose products are those of a small image. The frame is no
// larger than the sides say.
TEST(CompareTuning, BlockFactorsOfAnySign) {
    Twin& twin = Twin::Get();
    for (uint32_t signs = 0; signs < 16; ++signs) {
        for (const int32_t height : {9, 5}) {  // 5 * 4 * 56 divides by 16, 5 * 3 * 56 does not
            for (const int32_t rows : {4, 3}) {
                host::ParamBlock params = host::ParamsForMode(Mode::Fp, false);
                const auto set = [&](const char* name, int32_t value, uint32_t sign) {
                    host::ParamValue(params, name) = (signs >> sign & 1U) != 0 ? -value : value;
                };
                set("s_blockWidthFp", 8, 0);
                set("s_blockColNumFp", 7, 1);
                set("s_blockHeightFp", height, 2);
                set("s_blockRowNumFp", rows, 3);
                twin.SetParam(&params);
                const bool image = signs == 0;
                const std::vector<uint8_t> frame(image ? 8 * 7 * 9 * 4 : 1, 230);
                twin.SetDac(200);
                twin.Tune(frame, 0x00020700U, 0x00000102U);
                twin.Tune(frame, 0x00020700U, 0x00000102U);
                ASSERT_FALSE(twin.Difference()) << *twin.Difference() << ", signs " << signs;
            }
        }
    }
}

TEST(CompareNullParameters, AreRefusedAlike) {
    Twin::Get().SetParam(nullptr);
    EXPECT_FALSE(Twin::Get().Difference());
}

}  // namespace
}  // namespace fpnavi_test
