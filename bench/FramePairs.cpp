// Chooses pairs from simulated gestures of clean, well pressed fingers.
#include "FramePairs.h"

#include <algorithm>

#include "ParamTable.h"
#include "Reference.h"
#include "SimFrame.h"
#include "SimSensor.h"

namespace bench {
namespace {

constexpr uint64_t kFirstSeed = 20240517;
constexpr int32_t kPairsOfGesture = 2;
constexpr int32_t kCoverageMin = 50;  // percent of both frames of a moved pair

host::SimPlan PlanOf(PairKind kind, uint64_t seed) {
    const bool hg = kind == PairKind::Hg;
    const bool doubleScan = kind == PairKind::DoubleScan;
    const host::Mode mode =
        hg ? host::Mode::Hg : (doubleScan ? host::Mode::DoubleScan : host::Mode::Fp);
    const host::SimKind motion =
        kind == PairKind::Still ? host::SimKind::Rest : host::SimKind::Stroke;
    host::SimPlan plan = host::PlanOfKind(seed, mode, false, motion);
    plan.skin = host::SkinState::Normal;
    plan.pressure = 256;
    return plan;
}

int32_t TakeFrame(const Frame& frame, bool doubleScan) {
    if (doubleScan)
        reference::GetDoubleScanNaviBlock(frame.reg24, frame.reg28);
    return reference::OrientationCalc(frame.image.data(), frame.image.data(), 0);
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

void AddPairsOf(const host::Gesture& gesture, PairKind kind, PairSet* set) {
    int32_t taken = 0;
    const size_t frames = gesture.frames.size();
    for (size_t n = 0; n + 1 < frames && taken < kPairsOfGesture; ++n) {
        FramePair pair = {SortedFrame(gesture, gesture.frames[n]),
                          SortedFrame(gesture, gesture.frames[n + 1])};
        if (!Suits(kind, pair))
            continue;
        set->pairs.push_back(std::move(pair));
        ++taken;
    }
}

}  // namespace

PairSet MakePairs(PairKind kind, int32_t count) {
    PairSet set;
    const host::SimPlan plan = PlanOf(kind, kFirstSeed);
    const host::ParamBlock params = host::ParamsForMode(plan.mode, plan.plain);
    std::copy(params.begin(), params.end(), set.params);
    reference::SetNaviParam(set.params);
    const size_t wanted = static_cast<size_t>(count);
    for (uint64_t seed = kFirstSeed; set.pairs.size() < wanted; ++seed)
        AddPairsOf(host::Simulate(PlanOf(kind, seed), "bench"), kind, &set);
    set.pairs.resize(wanted);
    reference::FpNaviClear();
    return set;
}

}  // namespace bench
