// Writes the records of the golden gestures to stdout, as the reference model makes them. Run it,
// and look at the difference, when the simulator or the model changed on purpose:
//   golden_write > tests/golden/records.txt
#include <cstdio>

#include "Recorder.h"

int main() {
    using namespace fpnavi_test;
    // Double scan last: it stays on for the life of the process.
    for (const host::Mode mode : {host::Mode::Fp, host::Mode::Hg, host::Mode::DoubleScan}) {
        for (const host::Gesture& gesture : GoldenGestures(mode)) {
            const Outcome outcome = Record(kReference, gesture);
            std::printf("%s\n", OutcomeLine(gesture.id, outcome).c_str());
        }
    }
    return std::fflush(stdout) == 0 ? 0 : 1;
}
