// Any bytes as a .fng recording, or as the index beside such recordings when they do not begin like
// one. Wrong is any exception but host::Error, and a gesture that a store would not take.
#include <cstring>

#include "InputFile.h"
#include "common/Error.h"
#include "importers/FngImport.h"
#include "parameters/ParamTable.h"
#include "store/Store.h"

namespace {

using fpnavi_fuzz::InputFile;

constexpr char kMagic[] = {'F', 'N', 'G'};

void ReadRecording(InputFile& file) {
    host::Gesture gesture;
    try {
        gesture = host::ReadFng(file.Path());
    } catch (const host::Error&) {
        return;
    }
    host::CheckGesture(gesture, file.Path());
}

// What a .fng file gives, for the rows of an index to be applied to.
host::Gesture Recorded(const host::FngIndexRow& row) {
    host::Gesture gesture;
    gesture.id = "input";
    gesture.mode = row.mode;
    gesture.params = host::ParamsForMode(row.mode, !row.tiled);
    gesture.geometry = host::GeometryOf(gesture.params);
    gesture.label = row.expect;
    gesture.end = row.end;
    gesture.tags = {row.tiled ? "tiled" : "plain"};
    host::RecordedFrame frame;
    frame.raw.resize(static_cast<size_t>(gesture.geometry.Width() * gesture.geometry.Height()));
    gesture.frames.assign(row.frames && *row.frames < 20 ? *row.frames : 1, frame);
    return gesture;
}

void ReadIndex(InputFile& file) {
    std::map<std::string, host::FngIndexRow> rows;
    try {
        rows = host::ReadFngIndex(file.Path());
    } catch (const host::Error&) {
        return;
    }
    for (const auto& [id, row] : rows) {
        host::Gesture gesture = Recorded(row);
        try {
            host::ApplyFngIndex(row, file.Path(), gesture);
        } catch (const host::Error&) {
            continue;
        }
        host::CheckGesture(gesture, file.Path());
    }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    static InputFile file("input.fng");
    file.Write(data, size);
    if (size >= sizeof kMagic && std::memcmp(data, kMagic, sizeof kMagic) == 0)
        ReadRecording(file);
    else
        ReadIndex(file);
    return 0;
}
