#include "Recorder.h"

#include <algorithm>

#include "FingerDetect.h"
#include "Reference.h"
#include "recording/Keys.h"
#include "simulator/Sensor.h"

namespace fpnavi_test {
namespace {

const int32_t* ModuleRecord() {
    return reinterpret_cast<const int32_t*>(::PrintNaviLog());
}

const int32_t* ReferenceRecord() {
    return reinterpret_cast<const int32_t*>(reference::PrintNaviLog());
}

int32_t ReferenceStatus(const uint8_t* data) {
    reference::FingerBLKTest = ::FingerBLKTest;
    return reference::vmk_fp_navigation_detect_finger_status(data);
}

// Where the arrays of the record start, in integers, and how many entries pairs pairs fill.
struct Array {
    const char* name;
    size_t start;
    bool ofFrames;  // one entry more than pairs
};

constexpr Array kArrays[] = {
    {"xc", 1, true},         {"yc", 101, true},       {"cvr", 201, true},     {"dx_ct", 301, false},
    {"dy_ct", 401, false},   {"dx_fp", 501, false},   {"dy_fp", 601, false},  {"diff", 701, false},
    {"vkey_fp", 801, false}, {"vkey_ct", 901, false}, {"xc_ds", 1003, true},  {"yc_ds", 1103, true},
    {"cvr_ds", 1203, true},  {"dx_ds", 1303, false},  {"dy_ds", 1403, false},
};

}  // namespace

const Implementation kModule = {::SetNaviParam,
                                ::FpNaviClear,
                                ::GetDoubleScanNaviBlock,
                                ::GetNaviBlock,
                                ::vmk_fp_navigation_detect_finger_status,
                                ::OrientationCalc,
                                ::Voting,
                                ModuleRecord};

const Implementation kReference = {
    reference::SetNaviParam, reference::FpNaviClear, reference::GetDoubleScanNaviBlock,
    reference::GetNaviBlock, ReferenceStatus,        reference::OrientationCalc,
    reference::Voting,       ReferenceRecord};

Outcome Record(const Implementation& implementation, const host::Gesture& gesture) {
    const int32_t width = gesture.geometry.Width();
    std::vector<uint8_t> image(gesture.frames.empty() ? 0 : gesture.frames[0].raw.size());
    implementation.setParam(gesture.params.data());
    implementation.clear();
    bool seen = false;
    int32_t timeOut = 1;
    for (const host::RecordedFrame& frame : gesture.frames) {
        if (gesture.mode == host::Mode::DoubleScan)
            implementation.zones(frame.reg24, frame.reg28);
        implementation.block(frame.raw.data(), width, gesture.geometry.Height(), image.data());
        const int32_t status = implementation.status(image.data());
        implementation.frame(image.data(), image.data(), 0);
        seen = seen || status == 1;
        if (seen && status == 0) {
            timeOut = 0;
            break;
        }
    }
    Outcome outcome;
    outcome.key = implementation.vote(timeOut);
    std::copy_n(implementation.record(), kRecordInts, outcome.record.begin());
    return outcome;
}

std::string OutcomeLine(const std::string& id, const Outcome& outcome) {
    const auto pairs = static_cast<size_t>(outcome.record[0]);
    std::string line =
        id + " key " + host::KeyName(outcome.key) + " pairs " + std::to_string(pairs);
    for (const Array& array : kArrays) {
        line += std::string(" ") + array.name;
        const size_t entries = array.ofFrames ? pairs + 1 : pairs;
        for (size_t i = 0; i < entries; ++i)
            line += (i == 0 ? ' ' : ',') + std::to_string(outcome.record[array.start + i]);
    }
    return line + " sums " + std::to_string(outcome.record[1001]) + "," +
           std::to_string(outcome.record[1002]);
}

std::vector<host::Gesture> GoldenGestures(host::Mode mode) {
    constexpr host::SimKind kKinds[] = {host::SimKind::Stroke,   host::SimKind::Drift,
                                        host::SimKind::Diagonal, host::SimKind::Reversal,
                                        host::SimKind::Slow,     host::SimKind::Rest,
                                        host::SimKind::Tap,      host::SimKind::LongPress};
    std::vector<host::Gesture> gestures;
    for (const host::SimKind kind : kKinds) {
        const bool plain = mode == host::Mode::Fp && gestures.size() % 2 == 1;
        const uint64_t seed = 7000 + static_cast<uint64_t>(gestures.size());
        const host::SimPlan plan = host::PlanOfKind(seed, mode, plain, kind);
        gestures.push_back(host::Simulate(
            plan, host::ModeName(mode) + "-" + (plain ? "plain-" : "") + host::SimKindName(kind)));
    }
    return gestures;
}

}  // namespace fpnavi_test
