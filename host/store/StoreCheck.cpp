// The rules for a gesture in a store, checked when it is written and when it is read.
#include <fmt/format.h>

#include "common/Error.h"
#include "parameters/ParamTable.h"
#include "recording/Keys.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

// An empty text is no problem.
std::string GeometryProblem(const Gesture& gesture) {
    const Geometry& g = gesture.geometry;
    if (!(g == GeometryOf(gesture.params)))
        return "the geometry is not the one that the parameters give";
    if (g.blockWidth < 1 || g.blockHeight < 1 || g.blockColNum < 1 || g.blockRowNum < 1 ||
        int64_t{g.blockWidth} * g.blockColNum > kMaxImageSide ||
        int64_t{g.blockHeight} * g.blockRowNum > kMaxImageSide)
        return fmt::format("{} x {} blocks of {} x {} pixels, expected image sides of 1 to {}",
                           g.blockColNum, g.blockRowNum, g.blockWidth, g.blockHeight,
                           kMaxImageSide);
    return "";
}

std::string OutcomeProblem(const Gesture& gesture) {
    if (gesture.end != GestureEnd::Lift && gesture.end != GestureEnd::TimeOut)
        return "unknown end, expected lift or timeout";
    if (gesture.label && !IsKey(*gesture.label))
        return fmt::format("label {}, expected a key of 0 to 5", *gesture.label);
    for (const int32_t key : gesture.accepted) {
        if (!IsKey(key))
            return fmt::format("accepted key {}, expected 0 to 5", key);
    }
    return "";
}

std::string FrameProblem(const RecordedFrame& frame, size_t index, const Geometry& g) {
    // Both sides are at most 4096.
    const auto frameSize = static_cast<size_t>(g.Width() * g.Height());
    if (frame.raw.size() != frameSize)
        return fmt::format("frame {} has {} bytes, expected {} ({} x {})", index, frame.raw.size(),
                           frameSize, g.Width(), g.Height());
    if (frame.presence && *frame.presence != Presence::Absent &&
        *frame.presence != Presence::Present && *frame.presence != Presence::Sliver)
        return fmt::format("frame {} has presence {}, expected -1, 0 or 1", index,
                           static_cast<int32_t>(*frame.presence));
    return "";
}

std::string Problem(const Gesture& gesture) {
    if (gesture.id.empty())
        return "the id is empty, expected a name";
    if (gesture.mode != ModeOf(gesture.params))
        return fmt::format("mode {}, expected {} as s_modeFlag gives it", ModeName(gesture.mode),
                           ModeName(ModeOf(gesture.params)));
    std::string problem = GeometryProblem(gesture);
    if (problem.empty())
        problem = OutcomeProblem(gesture);
    for (size_t i = 0; i < gesture.frames.size() && problem.empty(); ++i)
        problem = FrameProblem(gesture.frames[i], i, gesture.geometry);
    return problem;
}

}  // namespace

void CheckGesture(const Gesture& gesture, const std::string& file) {
    const std::string problem = Problem(gesture);
    if (!problem.empty())
        throw Error(file, GesturePlace(gesture.id), problem);
}

}  // namespace host
