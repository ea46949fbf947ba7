// Replays many gestures in child processes: the module's state is file-level, so parallel work is
// by process, and the double scan stays on for the life of one, so its gestures get their own.
#ifndef FPNAVI_HOST_REPLAYPROCESS_H
#define FPNAVI_HOST_REPLAYPROCESS_H

#include <functional>
#include <string>
#include <vector>

#include "replay/Replay.h"

namespace host {

// Gives the gesture at an index of the ids.
using GestureReader = std::function<Gesture(size_t index)>;

struct ReplayJob {
    std::string source = "replay";  // what errors name as the file of the gestures
    std::vector<std::string> ids;
    // Called once in each child process; what it opens is the child's own.
    std::function<GestureReader()> openReader;
    int32_t processes = 0;  // at once; 0: one for each processor
};

using ResultSink = std::function<void(size_t index, const ReplayResult& result)>;

// Replays the gestures and gives each result to sink, in the order of the ids; the results carry no
// calls of single frames. A child that crashes is replaced: the gesture it was at is wrong, with
// the crash as its error. Throws Error for an exception of a reader or of ReplayHere, and when no
// process can be started; all children have ended then.
void ReplayMany(const ReplayJob& job, const ResultSink& sink);

// The same for gestures in memory.
std::vector<ReplayResult> ReplayAll(const std::vector<Gesture>& gestures, int32_t processes = 0);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYPROCESS_H
