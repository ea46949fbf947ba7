// Cuts raw dumps into frames.
#include "importers/RawImport.h"

#include <fmt/format.h>

#include <algorithm>
#include <filesystem>

#include "common/Error.h"
#include "common/Files.h"
#include "importers/FileId.h"
#include "parameters/ParamCheck.h"
#include "recording/Keys.h"
#include "store/Store.h"

namespace host {

namespace {

constexpr size_t kRegisterBytes = 8;  // reg24 and reg28 of one frame

void ReadFrames(const RawRecording& recording, Gesture& gesture) {
    const Geometry& g = gesture.geometry;
    const std::vector<uint8_t> bytes = ReadWholeFile(recording.framesPath);
    // CheckGesture has limited both sides to 4096.
    const auto frameSize = static_cast<size_t>(g.Width() * g.Height());
    const std::string settings =
        ImageSettings(recording.settings, recording.paramFile, gesture.params);
    const std::string expected =
        fmt::format("frames of {} bytes ({} x {}, mode {}{}{})", frameSize, g.Width(), g.Height(),
                    ModeName(gesture.mode), settings.empty() ? "" : "; ", settings);
    if (bytes.empty())
        throw Error(recording.framesPath, "", "the file is empty, expected " + expected);
    const size_t remainder = bytes.size() % frameSize;
    if (remainder != 0)
        throw Error(recording.framesPath, fmt::format("byte {}", bytes.size() - remainder),
                    fmt::format("a remainder of {} bytes after {} frames, expected {}", remainder,
                                bytes.size() / frameSize, expected));
    for (auto start = bytes.begin(); start != bytes.end();) {
        const auto end = start + static_cast<std::ptrdiff_t>(frameSize);
        RecordedFrame frame;
        frame.raw.assign(start, end);
        gesture.frames.push_back(std::move(frame));
        start = end;
    }
}

void ReadRegisters(const RawRecording& recording, Gesture& gesture) {
    const std::string& path = recording.registersPath;
    if (path.empty() && gesture.mode == Mode::DoubleScan)
        throw Error(recording.framesPath, "", "mode ds without a file of registers, expected one");
    if (path.empty())
        return;
    if (gesture.mode != Mode::DoubleScan)
        throw Error(path, "",
                    fmt::format("registers in mode {}, expected them in mode ds only",
                                ModeName(gesture.mode)));
    const std::vector<uint8_t> bytes = ReadWholeFile(path);
    const size_t expected = gesture.frames.size() * kRegisterBytes;
    if (bytes.size() != expected)
        throw Error(path, fmt::format("byte {}", std::min(bytes.size(), expected)),
                    fmt::format("{} bytes, expected {} ({} for each of {} frames)", bytes.size(),
                                expected, kRegisterBytes, gesture.frames.size()));
    const uint8_t* entry = bytes.data();
    for (RecordedFrame& frame : gesture.frames) {
        frame.reg24 = ReadLe32(entry);
        frame.reg28 = ReadLe32(entry + kRegisterBytes / 2);
        entry += kRegisterBytes;
    }
}

}  // namespace

Gesture ImportRaw(const RawRecording& recording) {
    const std::filesystem::path path(recording.framesPath);
    Gesture gesture;
    gesture.id = recording.id.empty() ? IdOfFile(recording.framesPath) : recording.id;
    gesture.params = recording.params;
    ParamValue(gesture.params, "s_modeFlag") = static_cast<int32_t>(recording.mode);
    gesture.params = WithSettings(recording.settings, gesture.params);
    CheckMode(recording.settings, recording.paramFile, recording.mode);
    CheckImage(recording.settings, recording.paramFile, gesture.params);
    gesture.mode = recording.mode;
    gesture.geometry = GeometryOf(gesture.params);
    gesture.end = recording.end;
    gesture.label = recording.label;
    if (recording.label)
        gesture.accepted = {*recording.label};
    gesture.libraryVersion = recording.libraryVersion;
    gesture.notes = "imported from " + path.filename().string();
    CheckGesture(gesture, recording.framesPath);
    ReadFrames(recording, gesture);
    ReadRegisters(recording, gesture);
    return gesture;
}

}  // namespace host
