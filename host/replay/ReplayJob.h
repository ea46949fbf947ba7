// Gestures to be replayed in child processes: their list, and how a child reads them.
#ifndef FPNAVI_HOST_REPLAYJOB_H
#define FPNAVI_HOST_REPLAYJOB_H

#include <cstdint>
#include <functional>
#include <optional>
#include <string>

#include "store/Store.h"

namespace host {

// Gives the gesture of a head's seq.
using GestureReader = std::function<Gesture(int64_t seq)>;

struct ReplayJob {
    std::string source = "replay";  // what errors name as the file of the gestures
    // The gestures one after the other; empty at the end. Called in the parent, which forks: it
    // must leave no file open.
    std::function<std::optional<GestureHead>()> next;
    // Called once in each child process; what it opens is the child's own.
    std::function<GestureReader()> openReader;
    int32_t processes = 0;  // at work at once; 0: one for each processor
};

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYJOB_H
