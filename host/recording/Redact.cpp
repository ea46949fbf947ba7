// One number is left of each frame.
#include "recording/Redact.h"

#include <algorithm>
#include <numeric>

namespace host {

void Redact(Gesture& gesture) {
    for (RecordedFrame& frame : gesture.frames) {
        if (frame.raw.empty())
            continue;
        const uint64_t sum = std::accumulate(frame.raw.begin(), frame.raw.end(), uint64_t{0});
        const auto mean = static_cast<uint8_t>(sum / frame.raw.size());
        std::fill(frame.raw.begin(), frame.raw.end(), mean);
    }
    if (std::find(gesture.tags.begin(), gesture.tags.end(), kRedactedTag) == gesture.tags.end())
        gesture.tags.emplace_back(kRedactedTag);
}

}  // namespace host
