// Replays a store of gestures, optionally with some parameters changed.
#ifndef FPNAVI_HOST_REPLAYCORPUS_H
#define FPNAVI_HOST_REPLAYCORPUS_H

#include <string>
#include <utility>
#include <vector>

#include "replay/ReplayProcess.h"

namespace host {

// Parameters by index in the block and their values, to be laid over those of recordings.
using ParamOverrides = std::vector<std::pair<size_t, int32_t>>;

// The parameters that a TOML file names, no others. Throws Error as ReadParamFile does.
ParamOverrides ReadOverrides(const std::string& path);

void ApplyOverrides(const ParamOverrides& overrides, ParamBlock* params);

struct CorpusReplay {
    std::string path;
    ParamOverrides overrides;
    int32_t processes = 0;  // at once; 0: one for each processor
};

// Replays the store at path, each result to sink in the store's order. Throws Error as Store and
// ReplayMany do, so for overrides that change a gesture's mode or geometry.
void ReplayCorpus(const CorpusReplay& replay, const ResultSink& sink);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAYCORPUS_H
