// Writes the golden gestures to stdout with the record and the key that the reference model gives,
// in the flat form of GoldenGestureFile.h, for programs that cannot link the simulator.
#include <algorithm>
#include <cstdio>

#include "GoldenGestureFile.h"
#include "Recorder.h"

namespace {

bool Write(const void* data, size_t bytes) {
    return std::fwrite(data, 1, bytes, stdout) == bytes;
}

bool WriteGesture(const host::Gesture& gesture) {
    using namespace fpnavi_test;
    const Outcome outcome = Record(kReference, gesture);
    GoldenGestureHead head{};
    std::copy(gesture.params.begin(), gesture.params.end(), head.params);
    std::copy(outcome.record.begin(), outcome.record.end(), head.record);
    head.key = outcome.key;
    head.doubleScan = gesture.mode == host::Mode::DoubleScan ? 1 : 0;
    head.width = gesture.geometry.Width();
    head.height = gesture.geometry.Height();
    head.frames = static_cast<int32_t>(gesture.frames.size());
    if (!Write(&head, sizeof head))
        return false;
    for (const host::RecordedFrame& frame : gesture.frames) {
        const uint32_t registers[] = {frame.reg24, frame.reg28};
        if (!Write(registers, sizeof registers) || !Write(frame.raw.data(), frame.raw.size()))
            return false;
    }
    return true;
}

}  // namespace

int main() {
    // Double scan last: it stays on for the life of the process.
    for (const host::Mode mode : {host::Mode::Fp, host::Mode::Hg, host::Mode::DoubleScan}) {
        for (const host::Gesture& gesture : fpnavi_test::GoldenGestures(mode)) {
            if (!WriteGesture(gesture)) {
                std::fprintf(stderr, "golden_gestures: stdout: cannot write\n");
                return 1;
            }
        }
    }
    return std::fflush(stdout) == 0 ? 0 : 1;
}
