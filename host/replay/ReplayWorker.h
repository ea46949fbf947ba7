// The child process's side of a replay: it takes tasks from its parent and answers each gesture.
#ifndef FPNAVI_HOST_REPLAYWORKER_H
#define FPNAVI_HOST_REPLAYWORKER_H

#include "replay/ReplayJob.h"

namespace host {

// The child's life: answers the tasks that come through socket until the parent closes it. With
// doubleScan it takes gestures of that mode only, without it all others. Never returns.
[[noreturn]] void RunWorker(const ReplayJob& job, bool doubleScan, int socket);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYWORKER_H
