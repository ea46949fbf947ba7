// Replays a store of gestures, optionally with some parameters changed.
#ifndef FPNAVI_HOST_REPLAYCORPUS_H
#define FPNAVI_HOST_REPLAYCORPUS_H

#include <string>

#include "replay/ParamOverrides.h"
#include "replay/ReplayProcess.h"

namespace host {

struct CorpusReplay {
    std::string path;
    ParamOverrides overrides;
    int32_t processes = 0;  // at work at once; 0: one for each processor
};

// Replays the gestures that the store at path has at the start, each result to sink in the store's
// order. start is called once before, when nothing stands against the replay. Throws Error as
// Store, ReplayMany and CheckOverrides do.
void ReplayCorpus(const CorpusReplay& replay, const std::function<void(const StoreExtent&)>& start,
                  const ResultSink& sink);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYCORPUS_H
