#include "replay/ReplayCorpus.h"

#include <memory>

#include "common/Files.h"
#include "parameters/ParamFile.h"
#include "store/Store.h"

namespace host {

ParamOverrides ReadOverrides(const std::string& path) {
    const std::vector<uint8_t> bytes = ReadWholeFile(path);
    const std::string text(bytes.begin(), bytes.end());
    // Over two bases that differ everywhere, only what the file sets comes out the same.
    ParamBlock zeros;
    zeros.fill(0);
    ParamBlock ones;
    ones.fill(1);
    const ParamBlock overZeros = ParseParams(text, path, zeros);
    const ParamBlock overOnes = ParseParams(text, path, ones);
    ParamOverrides overrides;
    for (size_t i = 0; i < overZeros.size(); ++i) {
        if (overZeros[i] == overOnes[i])
            overrides.emplace_back(i, overZeros[i]);
    }
    return overrides;
}

void ApplyOverrides(const ParamOverrides& overrides, ParamBlock* params) {
    for (const auto& [index, value] : overrides)
        params->at(index) = value;
}

void ReplayCorpus(const CorpusReplay& replay, const ResultSink& sink) {
    ReplayJob job;
    job.source = replay.path;
    job.processes = replay.processes;
    job.ids = Store::OpenForReading(replay.path).Ids();  // closed again: no process shares it
    job.openReader = [&replay, &ids = job.ids] {
        const auto store = std::make_shared<Store>(Store::OpenForReading(replay.path));
        return GestureReader([store, &replay, &ids](size_t index) {
            Gesture gesture = store->Read(ids[index]);
            ApplyOverrides(replay.overrides, &gesture.params);
            return gesture;
        });
    };
    ReplayMany(job, sink);
}

}  // namespace host
