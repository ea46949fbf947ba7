// Reading .fng files byte by byte: everything that the format fixes is checked.
#include "importers/FngImport.h"

#include <fmt/format.h>

#include <algorithm>
#include <cstring>
#include <filesystem>

#include "common/Error.h"
#include "common/Files.h"
#include "importers/FileId.h"
#include "parameters/ParamTable.h"
#include "recording/Keys.h"

namespace host {

namespace {

// Header fields by byte offset; numbers are little-endian and 16 bits wide unless told otherwise.
constexpr size_t kHeaderSize = 32;
constexpr char kMagic[] = {'F', 'N', 'G', '1'};
constexpr size_t kVersionOffset = 4;
constexpr size_t kFlagsOffset = 6;
constexpr size_t kWidthOffset = 8;
constexpr size_t kHeightOffset = 10;
constexpr size_t kFrameCountOffset = 12;
constexpr size_t kModeOffset = 14;    // 8 bits
constexpr size_t kLayoutOffset = 15;  // 8 bits
constexpr size_t kBlockWidthOffset = 16;
constexpr size_t kBlockHeightOffset = 18;
constexpr size_t kBlockColNumOffset = 20;
constexpr size_t kBlockRowNumOffset = 22;
constexpr size_t kLabelOffset = 24;  // 8 bits
constexpr size_t kEndOffset = 25;    // 8 bits
constexpr size_t kReservedOffset = 26;

constexpr int kVersion = 1;
constexpr int kFlagBlocks = 1;     // block-ordered bytes follow each frame
constexpr int kFlagRegisters = 2;  // zone registers are meaningful
constexpr int kNoLabel = 255;

// Before the pixels of each frame.
constexpr size_t kFrameHeadSize = 16;
constexpr size_t kReg28Offset = 4;
constexpr size_t kXOffset = 8;
constexpr size_t kYOffset = 10;
constexpr size_t kContactOffset = 12;   // 8 bits
constexpr size_t kPresenceOffset = 13;  // 8 bits, signed
constexpr size_t kFrameReservedOffset = 14;

// A whole file with the position-keeping errors that its checks need.
struct FngFile {
    std::string path;
    std::vector<uint8_t> bytes;
    int flags = 0;

    int U8(size_t offset) const { return bytes[offset]; }
    int U16(size_t offset) const { return ReadLe16(&bytes[offset]); }
    bool HasBlocks() const { return (flags & kFlagBlocks) != 0; }
    bool HasRegisters() const { return (flags & kFlagRegisters) != 0; }

    [[noreturn]] void Fail(size_t offset, const std::string& problem) const {
        throw Error(path, fmt::format("byte {}", offset), problem);
    }
    // The 16-bit field must have that value.
    void Expect16(size_t offset, int expected, const char* name) const {
        if (U16(offset) != expected)
            Fail(offset, fmt::format("{} {}, expected {}", name, U16(offset), expected));
    }
};

void CheckStart(FngFile& file) {
    if (file.bytes.size() < kHeaderSize)
        file.Fail(file.bytes.size(), fmt::format("the file is truncated, expected a header of {} "
                                                 "bytes",
                                                 kHeaderSize));
    if (std::memcmp(file.bytes.data(), kMagic, sizeof kMagic) != 0)
        file.Fail(0, "not a .fng recording, expected it to begin with FNG1");
    file.Expect16(kVersionOffset, kVersion, "version");
    file.flags = file.U16(kFlagsOffset);
    if ((file.flags & ~(kFlagBlocks | kFlagRegisters)) != 0)
        file.Fail(kFlagsOffset, fmt::format("flags {:#x}, expected bits 0 and 1 only", file.flags));
}

void ReadModeAndParams(const FngFile& file, Gesture& gesture) {
    const int mode = file.U8(kModeOffset);
    if (mode > static_cast<int>(Mode::DoubleScan))
        file.Fail(kModeOffset, fmt::format("mode {}, expected 0 fp, 1 hg or 2 ds", mode));
    gesture.mode = static_cast<Mode>(mode);
    if (file.HasRegisters() != (gesture.mode == Mode::DoubleScan))
        file.Fail(kFlagsOffset,
                  fmt::format("flags {:#x}, expected bit 1 (registers) in mode ds and in no other",
                              file.flags));
    const int layout = file.U8(kLayoutOffset);
    if (layout > 1)
        file.Fail(kLayoutOffset, fmt::format("layout {}, expected 0 plain or 1 tiled", layout));
    if (layout == 1 && gesture.mode == Mode::Hg)
        file.Fail(kLayoutOffset, "layout 1 (tiled), expected 0 in mode hg");
    gesture.params = ParamsForMode(gesture.mode, layout == 0);
    gesture.geometry = GeometryOf(gesture.params);
    gesture.tags.emplace_back(layout == 0 ? "plain" : "tiled");
}

void CheckGeometry(const FngFile& file, const Geometry& geometry) {
    file.Expect16(kBlockWidthOffset, geometry.blockWidth, "block width");
    file.Expect16(kBlockHeightOffset, geometry.blockHeight, "block height");
    file.Expect16(kBlockColNumOffset, geometry.blockColNum, "blocks per row");
    file.Expect16(kBlockRowNumOffset, geometry.blockRowNum, "block rows");
    file.Expect16(kWidthOffset, geometry.Width(), "width");
    file.Expect16(kHeightOffset, geometry.Height(), "height");
}

void ReadOutcome(const FngFile& file, Gesture& gesture) {
    const int label = file.U8(kLabelOffset);
    if (label != kNoLabel && !IsKey(label))
        file.Fail(kLabelOffset, fmt::format("key {}, expected 0 to 5 or 255 for none", label));
    if (label != kNoLabel) {
        gesture.label = label;
        gesture.accepted = {label};
    }
    const int end = file.U8(kEndOffset);
    if (end > 1)
        file.Fail(kEndOffset, fmt::format("end {}, expected 0 lift or 1 timeout", end));
    gesture.end = static_cast<GestureEnd>(end);
    for (size_t offset = kReservedOffset; offset < kHeaderSize; ++offset) {
        if (file.U8(offset) != 0)
            file.Fail(offset, fmt::format("reserved byte {}, expected 0", file.U8(offset)));
    }
}

// Bytes of the pixels of one frame as they follow each other in the file.
size_t PixelBytes(const FngFile& file, const Geometry& geometry) {
    return static_cast<size_t>(geometry.Width() * geometry.Height()) * (file.HasBlocks() ? 2 : 1);
}

size_t CheckSize(const FngFile& file, const Geometry& geometry) {
    const auto count = static_cast<size_t>(file.U16(kFrameCountOffset));
    if (count == 0)
        file.Fail(kFrameCountOffset, "0 frames, expected at least 1");
    const size_t expected = kHeaderSize + count * (kFrameHeadSize + PixelBytes(file, geometry));
    if (file.bytes.size() < expected)
        file.Fail(
            file.bytes.size(),
            fmt::format("the file is truncated, expected {} bytes for {} frames", expected, count));
    if (file.bytes.size() > expected)
        file.Fail(expected, fmt::format("{} bytes after the last frame, expected {} bytes for {} "
                                        "frames",
                                        file.bytes.size() - expected, expected, count));
    return count;
}

// The image at rows, row by row, in the order of the sensor's blocks; at(i) receives the raw
// index i and the image index that belong together.
template <typename Visit>
void ForEachPixel(const Geometry& g, Visit at) {
    size_t raw = 0;
    for (int32_t blockRow = 0; blockRow < g.blockRowNum; ++blockRow) {
        for (int32_t blockCol = 0; blockCol < g.blockColNum; ++blockCol) {
            for (int32_t row = 0; row < g.blockHeight; ++row) {
                for (int32_t col = 0; col < g.blockWidth; ++col) {
                    const int32_t image = (blockRow * g.blockHeight + row) * g.Width() +
                                          blockCol * g.blockWidth + col;
                    at(raw++, static_cast<size_t>(image));
                }
            }
        }
    }
}

// The frame's raw bytes; where the file has them in sensor order too, the two must agree.
std::vector<uint8_t> ReadPixels(const FngFile& file, size_t offset, const Geometry& geometry) {
    const auto size = static_cast<size_t>(geometry.Width() * geometry.Height());
    const uint8_t* const rows = &file.bytes[offset];
    std::vector<uint8_t> raw(size);
    ForEachPixel(geometry, [&](size_t rawIndex, size_t imageIndex) {
        raw[rawIndex] = rows[imageIndex];
        if (file.HasBlocks() && rows[size + rawIndex] != rows[imageIndex])
            file.Fail(offset + size + rawIndex,
                      fmt::format("block-ordered byte {}, expected {} as at byte {} of the image",
                                  rows[size + rawIndex], rows[imageIndex], offset + imageIndex));
    });
    return raw;
}

RecordedFrame ReadFrame(const FngFile& file, size_t offset, const Geometry& geometry) {
    RecordedFrame frame;
    frame.reg24 = ReadLe32(&file.bytes[offset]);
    frame.reg28 = ReadLe32(&file.bytes[offset + kReg28Offset]);
    if (!file.HasRegisters() && (frame.reg24 != 0 || frame.reg28 != 0))
        file.Fail(offset, "zone registers are set, expected 0 outside mode ds");
    frame.x16 = static_cast<int16_t>(file.U16(offset + kXOffset));
    frame.y16 = static_cast<int16_t>(file.U16(offset + kYOffset));
    if (file.U8(offset + kContactOffset) > 100)
        file.Fail(offset + kContactOffset, fmt::format("contact {}, expected 0 to 100 percent",
                                                       file.U8(offset + kContactOffset)));
    const auto presence = static_cast<int8_t>(file.U8(offset + kPresenceOffset));
    if (presence < -1 || presence > 1)
        file.Fail(offset + kPresenceOffset,
                  fmt::format("presence {}, expected -1, 0 or 1", presence));
    frame.presence = static_cast<Presence>(presence);
    file.Expect16(offset + kFrameReservedOffset, 0, "reserved field");
    frame.raw = ReadPixels(file, offset + kFrameHeadSize, geometry);
    return frame;
}

}  // namespace

Gesture ReadFng(const std::string& path) {
    FngFile file{path, ReadWholeFile(path)};
    CheckStart(file);
    Gesture gesture;
    gesture.id = IdOfFile(path);
    gesture.notes = "imported from " + std::filesystem::path(path).filename().string();
    ReadModeAndParams(file, gesture);
    CheckGeometry(file, gesture.geometry);
    ReadOutcome(file, gesture);
    const size_t count = CheckSize(file, gesture.geometry);
    const size_t frameSize = kFrameHeadSize + PixelBytes(file, gesture.geometry);
    gesture.frames.reserve(count);
    for (size_t i = 0; i < count; ++i)
        gesture.frames.push_back(ReadFrame(file, kHeaderSize + i * frameSize, gesture.geometry));
    return gesture;
}

}  // namespace host
