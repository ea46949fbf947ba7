// Gestures in memory, replayed as those of a store are.
#include "replay/ReplayProcess.h"

namespace host {

std::vector<ReplayResult> ReplayAll(const std::vector<Gesture>& gestures, int32_t processes) {
    ReplayJob job;
    job.processes = processes;
    job.next = [&gestures, index = size_t{0}]() mutable -> std::optional<GestureHead> {
        if (index == gestures.size())
            return std::nullopt;
        const Gesture& gesture = gestures[index];
        GestureHead head;
        head.seq = static_cast<int64_t>(index++);
        head.id = gesture.id;
        head.mode = gesture.mode;
        head.label = gesture.label;
        head.tier = gesture.tier;
        head.frameCount = static_cast<int32_t>(gesture.frames.size());
        return head;
    };
    job.openReader = [&gestures] {
        return GestureReader(
            [&gestures](int64_t seq) { return gestures[static_cast<size_t>(seq)]; });
    };
    std::vector<ReplayResult> results;
    ReplayMany(job, [&results](size_t, const ReplayResult& result) { results.push_back(result); });
    return results;
}

}  // namespace host
