// The frames of recordings, parted by finger, and those of the simulated sensor.
#include "PresenceFrames.h"

#include <fmt/format.h>

#include <map>
#include <utility>

#include "common/Error.h"
#include "importers/FngImport.h"
#include "simulator/Frame.h"
#include "simulator/Presence.h"

namespace presence {
namespace {

void Append(std::vector<KnownFrame> from, std::vector<KnownFrame>& to) {
    for (KnownFrame& frame : from)
        to.push_back(std::move(frame));
}

std::vector<KnownFrame> KnownFrames(const host::Gesture& gesture) {
    std::vector<KnownFrame> known;
    if (gesture.geometry.Width() != kWidth || gesture.geometry.Height() != kHeight)
        return known;
    for (const host::RecordedFrame& frame : gesture.frames) {
        if (frame.presence.has_value() && *frame.presence != host::Presence::Sliver)
            known.push_back({host::FromBlockOrder(frame.raw, gesture.geometry),
                             *frame.presence == host::Presence::Present});
    }
    return known;
}

}  // namespace

std::vector<FrameGroup> RecordedGroups(const std::string& directory) {
    const std::string indexPath = directory + "/index.csv";
    const auto index = host::ReadFngIndex(indexPath);
    std::map<std::string, std::vector<KnownFrame>> framesOfFinger;  // in alphabetical order
    host::ImportFng(directory, [&](host::Gesture&& gesture, const std::string&) {
        const auto row = index.find(gesture.id);
        if (row == index.end())
            throw host::Error(indexPath, gesture.id, "expected a row for this recording");
        std::vector<KnownFrame> known = KnownFrames(gesture);
        if (!known.empty())
            Append(std::move(known), framesOfFinger[row->second.source]);
    });
    if (framesOfFinger.size() < 2)
        throw host::Error(
            directory, "",
            fmt::format("expected {} x {} recordings of two fingers", kWidth, kHeight));
    std::vector<FrameGroup> groups = {{"first half", "", {}}, {"second half", "", {}}};
    size_t turn = 0;
    for (auto& [finger, frames] : framesOfFinger) {
        FrameGroup& group = groups[turn % 2];
        group.fingers += (group.fingers.empty() ? "" : " ") + finger;
        Append(std::move(frames), group.frames);
        turn++;
    }
    return groups;
}

FrameGroup SimulatedGroup(int32_t count) {
    static_assert(kWidth == host::kPresenceWidth && kHeight == host::kPresenceHeight);
    FrameGroup group = {"simulated", "", {}};
    for (int32_t i = 0; i < count; i++) {
        const uint64_t seed = static_cast<uint64_t>(i);
        group.frames.push_back({host::SimulateEmptyFrame(seed), false});
        group.frames.push_back({host::SimulateTouchedFrame(seed, i % 2 == 1), true});
    }
    return group;
}

}  // namespace presence
