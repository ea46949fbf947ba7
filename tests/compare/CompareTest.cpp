// Gestures of the simulated sensor through the module and the reference model: equal call by call.
#include <gtest/gtest.h>

#include <cstdint>
#include <iterator>

#include "CompareRun.h"
#include "RandomGesture.h"
#include "Twin.h"
#include "simulator/Corpus.h"
#include "simulator/Frame.h"
#include "simulator/Sensor.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::SimRandom;

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

constexpr int32_t kReplays = 4;  // of a simulated gesture, the first as it was recorded

void ReplaySimulatedKind(uint64_t test, Mode mode, int64_t percent) {
    const int64_t count = Gestures(percent);
    GestureCounts counts;
    host::Gesture gesture;
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        if (i % kReplays == 0)
            gesture = host::Simulate(host::RandomPlan(random.Next(), mode), "compared");
        const host::ParamBlock params =
            i % kReplays == 0 ? gesture.params : VariedParams(random, mode);
        ReplaySimulated(gesture, params);
        counts.Note(params);
        ASSERT_FALSE(Twin::Get().Difference())
            << *Twin::Get().Difference() << " of gesture " << i << " (" << gesture.notes << ")";
    }
    counts.Record();
}

TEST(CompareSimulated, FpMode) {
    ReplaySimulatedKind(1, Mode::Fp, 2);
}
TEST(CompareSimulated, HgMode) {
    ReplaySimulatedKind(2, Mode::Hg, 3);
}
TEST(CompareSimulated, DoubleScanMode) {
    ReplaySimulatedKind(3, Mode::DoubleScan, 2);
}

// Simulated gestures during which the host writes counts of pairs into the record, with all log
// lines of the votes.
void ReplayWithWrittenCounts(uint64_t test, Mode mode, int64_t percent) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(percent);
    const int32_t counts[] = {INT32_MIN, -100, -1, 0, 1, 97, 98, 99, 100, 101, 1503, INT32_MAX};
    host::Gesture gesture;
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(test, i));
        if (i % kReplays == 0)
            gesture = host::Simulate(host::RandomPlan(random.Next(), mode), "compared");
        host::ParamBlock params = gesture.params;
        host::ParamValue(params, "s_logShowFlag") = 1;
        twin.SetParam(&params);
        twin.Clear();
        for (const host::RecordedFrame& frame : gesture.frames) {
            if (random.Chance(40))
                Twin::SetPairCount(counts[random.Below(static_cast<int32_t>(std::size(counts)))]);
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
    ReplayWithWrittenCounts(61, Mode::Fp, 1);
}
TEST(CompareWrittenPairCounts, HgMode) {
    ReplayWithWrittenCounts(62, Mode::Hg, 1);
}
TEST(CompareWrittenPairCounts, DoubleScanMode) {
    ReplayWithWrittenCounts(63, Mode::DoubleScan, 1);
}

TEST(CompareNullParameters, AreRefusedAlike) {
    Twin::Get().SetParam(nullptr);
    EXPECT_FALSE(Twin::Get().Difference());
}

}  // namespace
}  // namespace fpnavi_test
