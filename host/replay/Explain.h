// A gesture frame by frame: what each method found, and which gate or test decided each pair.
//
// The module has no hook for this. The trace is read from its state before and after each call;
// where the record cannot tell, the no-move test, which only reads, is run once more.
#ifndef FPNAVI_HOST_EXPLAIN_H
#define FPNAVI_HOST_EXPLAIN_H

#include <optional>
#include <vector>

#include "replay/Replay.h"

namespace host {

// What became of a frame.
enum class SettledBy : int32_t {
    NoFinger,            // ignored: the finger is not on the sensor
    FirstFrame,          // taken; there is no pair yet
    CoverageMinimum,     // pair dropped: a frame covers less than s_coverageMinEff
    CentroidOnly,        // hg mode has no other method
    NoMoveTest,          // the frames show the same ridges at the same place
    NoMoveUndetermined,  // too little common finger area for the no-move test
    TemplateCoverage,    // moved; a frame covers less than s_coverageMinFp
    TemplateMatch,       // moved; the templates were matched
    RecordFull,          // pair dropped: the record is full
    Failed,              // a call returned -1
};

struct CentroidMove {
    int32_t dx = 0;  // pixels (percent if dimensionless), right
    int32_t dy = 0;  // up
    int32_t key = VKEY_NONE;
};

struct DoubleScanMove {
    int32_t dx = 0;        // percent of the map, right
    int32_t dy = 0;        // up
    int32_t coverage = 0;  // of the current map, percent
};

struct FingerprintMove {
    int32_t dx = 0;  // pixels (percent if dimensionless), right
    int32_t dy = 0;  // up
    int32_t key = VKEY_NONE;
    std::optional<int32_t> difference;  // mean grey difference of the match; empty: not matched
};

struct TrueMove {
    double dx = 0;  // pixels, right
    double dy = 0;  // up
};

struct FrameTrace {
    size_t frame = 0;     // index in the recording
    int32_t status = -1;  // finger status: 1 present, 0 absent, -1 error
    SettledBy settledBy = SettledBy::Failed;
    std::optional<int32_t> pair;      // entry of the record that was counted
    std::optional<int32_t> coverage;  // of the frame that was taken, percent
    int32_t xc = 0;                   // its centroid, percent, right; 0 without coverage
    int32_t yc = 0;                   // up
    std::optional<CentroidMove> centroid;
    std::optional<DoubleScanMove> doubleScan;
    std::optional<FingerprintMove> fingerprint;
    std::optional<TrueMove> truth;  // against the frame taken before this one
};

struct Explanation {
    ReplayResult result;
    std::vector<FrameTrace> frames;  // that the module was given
};

// Replays gesture in this process, as ReplayHere does, and traces it. Throws as ReplayHere does.
Explanation ExplainHere(const Gesture& gesture, const std::string& source = "replay");

// "no-move test" and the like.
const char* SettledByName(SettledBy settledBy);

}  // namespace host

#endif  // FPNAVI_HOST_EXPLAIN_H
