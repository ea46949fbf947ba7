// What else a user could take for the displacement of a pair at the default size.
#ifndef BENCH_PEERS_H
#define BENCH_PEERS_H

#include <string>
#include <vector>

#include "FramePairs.h"

namespace bench {

struct Peer {
    const char* name;
    Shift (*run)(const FramePair& pair);
};

// OpenCV's, on one thread; empty without OpenCV.
std::vector<Peer> OpenCvPeers();

// 25 blocks of 8 x 8 pixels, each searched within 8 pixels on both axes, and the middle one of
// their displacements.
Shift MatchBlocks(const FramePair& pair);

struct RecordedPairs {
    std::string label;
    PairSet set;
};

// Up to count moved pairs for each layout, from recordings over real prints in FPNAVI_REALDATA or
// beside the project. Empty, with a line to stderr that says why, where there are none.
std::vector<RecordedPairs> ReadRecordedPairs(int32_t count);

}  // namespace bench

#endif  // BENCH_PEERS_H
