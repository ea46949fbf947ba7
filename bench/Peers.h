// What else a user could take for the displacement of a pair, where OpenCV is installed.
#ifndef BENCH_PEERS_H
#define BENCH_PEERS_H

#include <vector>

#include "FramePairs.h"

namespace bench {

struct Peer {
    const char* name;
    void (*run)(const FramePair& pair);
};

// Empty without OpenCV. One thread.
std::vector<Peer> Peers();

}  // namespace bench

#endif  // BENCH_PEERS_H
