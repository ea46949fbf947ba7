// The frame pairs that everything in this directory works on: consecutive frames of simulated or
// recorded gestures, chosen by what the plain model does with them.
#ifndef BENCH_FRAMEPAIRS_H
#define BENCH_FRAMEPAIRS_H

#include <cstdint>
#include <string>
#include <vector>

#include "FpNavi.h"
#include "FrameSize.h"
#include "recording/Recording.h"

namespace bench {

enum class PairKind : int32_t {
    Moved,       // fp, nine tiles: both frames covered enough, the pair reaches template matching
    Still,       // fp, nine tiles: a resting finger with sensor noise, found to rest
    Hg,          // hg mode: a moving finger, the pair is counted
    DoubleScan,  // double scan, nine tiles: as Moved, with the registers of both frames
};

// A frame as OrientationCalc takes it, and its double-scan registers.
struct Frame {
    std::vector<uint8_t> image;  // row by row
    uint32_t reg24 = 0;
    uint32_t reg28 = 0;
};

// Pixels from the first frame to the second, x to the right, y downwards.
struct Shift {
    double x = 0;
    double y = 0;
};

struct FramePair {
    Frame first;
    Frame second;
    Shift truth;  // of the finger; not kept in files
};

struct PairSet {
    int32_t params[FPNAVI_PARAM_NUM] = {};
    std::vector<FramePair> pairs;
};

// count pairs of the kind under default parameters, at most two of a gesture. The same pairs for
// every version of the library. Uses the plain model, whose gesture is clear and whose parameters
// are params afterwards; after DoubleScan it stays in double scan.
PairSet MakePairs(PairKind kind, int32_t count);

// The same for frames of a size, whose layout is that of the kind; not for DoubleScan. The default
// sizes give the pairs of the function above. Fewer pairs, even none, for sizes at which hardly any
// suit.
PairSet MakePairs(PairKind kind, int32_t count, const FrameSize& size);

// Adds up to count pairs of gesture that suit the kind; set's parameters must be the plain model's.
void AddPairsOf(const host::Gesture& gesture, PairKind kind, int32_t count, PairSet* set);

// Files of pairs, for the programs that must not spend instructions on simulating; of one machine's
// byte order. Both return false when the file cannot be written or read.
bool WritePairs(const std::string& path, const PairSet& set);
bool ReadPairs(const std::string& path, PairSet* set);

}  // namespace bench

#endif  // BENCH_FRAMEPAIRS_H
