// Chooses pairs; the simulated ones come from gestures of clean, well pressed fingers.
#include "FramePairs.h"

#include <algorithm>
#include <functional>
#include <optional>

#include "Reference.h"
#include "parameters/ParamTable.h"
#include "simulator/Frame.h"
#include "simulator/Sensor.h"

namespace bench {
namespace {

constexpr uint64_t kFirstSeed = 20240517;
constexpr int32_t kPairsOfGesture = 2;
constexpr uint64_t kSeedsOfPair = 50;  // tried for each wanted pair before giving up
constexpr int32_t kCoverageMin = 50;   // percent of both frames of a moved pair

// oneWindow: without gaps between the tiles.
host::SimPlan PlanOf(PairKind kind, bool oneWindow, uint64_t seed) {
    const bool hg = kind == PairKind::Hg;
    const bool doubleScan = kind == PairKind::DoubleScan;
    const host::Mode mode =
        hg ? host::Mode::Hg : (doubleScan ? host::Mode::DoubleScan : host::Mode::Fp);
    const host::SimKind motion =
        kind == PairKind::Still ? host::SimKind::Rest : host::SimKind::Stroke;
    host::SimPlan plan = host::PlanOfKind(seed, mode, oneWindow, motion);
    plan.skin = host::SkinState::Normal;
    plan.pressure = 256;
    return plan;
}

int32_t TakeFrame(const Frame& frame, bool doubleScan) {
    if (doubleScan)
        reference::GetDoubleScanNaviBlock(frame.reg24, frame.reg28);
    return reference::OrientationCalc(frame.image.data(), frame.image.data(), 0);
}

// Ridges, as the fp finger test asks for: stretched to the full range, the noise of an untouched
// sensor would pass for a moving finger.
bool ShowsFinger(const Frame& frame) {
    int32_t range = 0;
    return reference::GetGreyRange(frame.image.data(), &range) == 0 &&
           range >= reference::s_rangeThreshold;
}

// The plain model does with the pair what its kind asks for.
bool Suits(PairKind kind, const FramePair& pair) {
    const bool doubleScan = kind == PairKind::DoubleScan;
    reference::FpNaviClear();
    if (TakeFrame(pair.first, doubleScan) != 0 || TakeFrame(pair.second, doubleScan) != 0 ||
        reference::s_voteInfo.calc_cnt != 1)
        return false;
    if (kind == PairKind::Hg)
        return true;
    if (!ShowsFinger(pair.first) || !ShowsFinger(pair.second))
        return false;
    if (std::min(reference::s_imagePrev.cvr, reference::s_imageCurr.cvr) < kCoverageMin)
        return false;
    const int32_t outcome =
        reference::FingerNoMove(&reference::s_imagePrev, &reference::s_imageCurr);
    return outcome ==
           (kind == PairKind::Still ? reference::kFingerNoMove : reference::kFingerMoved);
}

Frame SortedFrame(const host::Gesture& gesture, const host::RecordedFrame& frame) {
    return {host::FromBlockOrder(frame.raw, gesture.geometry), frame.reg24, frame.reg28};
}

// count pairs, fewer where hardly any suit, of the gestures that simulate gives for one seed after
// the other.
PairSet Collect(PairKind kind, int32_t count, const host::ParamBlock& params,
                const std::function<host::Gesture(uint64_t)>& simulate) {
    PairSet set;
    std::copy(params.begin(), params.end(), set.params);
    reference::SetNaviParam(set.params);
    const uint64_t seeds = kFirstSeed + kSeedsOfPair * static_cast<uint64_t>(count);
    for (uint64_t seed = kFirstSeed; seed < seeds && set.pairs.size() < static_cast<size_t>(count);
         ++seed) {
        const int32_t wanted = count - static_cast<int32_t>(set.pairs.size());
        AddPairsOf(simulate(seed), kind, std::min(wanted, kPairsOfGesture), &set);
    }
    reference::FpNaviClear();
    return set;
}

Shift TruthOf(const host::RecordedFrame& first, const host::RecordedFrame& second) {
    const auto pixels = [](std::optional<int32_t> from, std::optional<int32_t> to) {
        return static_cast<double>(to.value_or(0) - from.value_or(0)) / host::kSubPixels;
    };
    return {pixels(first.x16, second.x16), pixels(first.y16, second.y16)};
}

}  // namespace

void AddPairsOf(const host::Gesture& gesture, PairKind kind, int32_t count, PairSet* set) {
    int32_t taken = 0;
    const size_t frames = gesture.frames.size();
    for (size_t n = 0; n + 1 < frames && taken < count; ++n) {
        const host::RecordedFrame& first = gesture.frames[n];
        const host::RecordedFrame& second = gesture.frames[n + 1];
        FramePair pair = {SortedFrame(gesture, first), SortedFrame(gesture, second),
                          TruthOf(first, second)};
        if (!Suits(kind, pair))
            continue;
        set->pairs.push_back(std::move(pair));
        ++taken;
    }
}

PairSet MakePairs(PairKind kind, int32_t count) {
    const host::SimPlan plan = PlanOf(kind, false, kFirstSeed);
    return Collect(kind, count, host::ParamsForMode(plan.mode, plan.plain), [kind](uint64_t seed) {
        return host::Simulate(PlanOf(kind, false, seed), "bench");
    });
}

PairSet MakePairs(PairKind kind, int32_t count, const FrameSize& size) {
    if (size == kDefaultFp || size == kDefaultHg)
        return MakePairs(kind, count);
    const host::ParamBlock params = ParamsOf(size);
    const bool oneWindow = size.layout == Layout::OneWindow;
    return Collect(kind, count, params, [&](uint64_t seed) {
        return SimulateSized(PlanOf(kind, oneWindow, seed), params);
    });
}

}  // namespace bench
