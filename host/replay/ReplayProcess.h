// Replays many gestures in child processes: the module's state is file-level, so parallel work is
// by process, and the double scan stays on for the life of one, so its gestures get their own.
#ifndef FPNAVI_HOST_REPLAYPROCESS_H
#define FPNAVI_HOST_REPLAYPROCESS_H

#include <cstddef>
#include <cstdint>
#include <functional>
#include <vector>

#include "replay/Replay.h"
#include "replay/ReplayJob.h"

namespace host {

using ResultSink = std::function<void(size_t index, const ReplayResult& result)>;

// Replays the gestures and gives each result to sink as soon as it and all before it are there; the
// results carry no calls of single frames. Each gesture is read once, and the gestures and results
// in memory are at most 256 for each of the processes. A gesture that the reader or ReplayHere
// throws for is unreadable, with what they say as its error. A child that crashes is replaced: the
// gesture it was at is wrong, with the crash as its error. Throws Error for an exception of
// openReader, and when no process can be started, and what next and sink throw; all children have
// ended then.
void ReplayMany(const ReplayJob& job, const ResultSink& sink);

// The same for gestures in memory.
std::vector<ReplayResult> ReplayAll(const std::vector<Gesture>& gestures, int32_t processes = 0);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYPROCESS_H
