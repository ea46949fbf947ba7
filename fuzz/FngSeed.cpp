#include "FngSeed.h"

namespace fpnavi_fuzz {
namespace {

void Put8(std::string& bytes, int32_t value) {
    bytes += static_cast<char>(static_cast<uint8_t>(value));
}

void Put16(std::string& bytes, int32_t value) {
    Put8(bytes, value & 0xFF);
    Put8(bytes, value >> 8 & 0xFF);
}

void Put32(std::string& bytes, uint32_t value) {
    Put16(bytes, static_cast<int32_t>(value & 0xFFFFU));
    Put16(bytes, static_cast<int32_t>(value >> 16));
}

void PutHeader(std::string& bytes, const host::Gesture& gesture, bool tiled, bool blocks) {
    const host::Geometry& g = gesture.geometry;
    bytes += "FNG1";
    Put16(bytes, 1);
    Put16(bytes, (blocks ? 1 : 0) | (gesture.mode == host::Mode::DoubleScan ? 2 : 0));
    Put16(bytes, g.Width());
    Put16(bytes, g.Height());
    Put16(bytes, static_cast<int32_t>(gesture.frames.size()));
    Put8(bytes, static_cast<int32_t>(gesture.mode));
    Put8(bytes, tiled ? 1 : 0);
    Put16(bytes, g.blockWidth);
    Put16(bytes, g.blockHeight);
    Put16(bytes, g.blockColNum);
    Put16(bytes, g.blockRowNum);
    Put8(bytes, gesture.label.value_or(255));
    Put8(bytes, static_cast<int32_t>(gesture.end));
    bytes.append(6, '\0');
}

// The pixels row by row.
void PutRows(std::string& bytes, const std::vector<uint8_t>& raw, const host::Geometry& g) {
    const int32_t blockSize = g.blockWidth * g.blockHeight;
    for (int32_t row = 0; row < g.Height(); ++row) {
        for (int32_t column = 0; column < g.Width(); ++column) {
            const int32_t block = row / g.blockHeight * g.blockColNum + column / g.blockWidth;
            const int32_t inside = row % g.blockHeight * g.blockWidth + column % g.blockWidth;
            Put8(bytes, raw[static_cast<size_t>(block * blockSize + inside)]);
        }
    }
}

}  // namespace

std::string FngBytes(const host::Gesture& gesture, bool tiled, bool blocks) {
    std::string bytes;
    PutHeader(bytes, gesture, tiled, blocks);
    for (const host::RecordedFrame& frame : gesture.frames) {
        Put32(bytes, frame.reg24);
        Put32(bytes, frame.reg28);
        Put16(bytes, frame.x16.value_or(0));
        Put16(bytes, frame.y16.value_or(0));
        Put8(bytes, 50);
        Put8(bytes, static_cast<int32_t>(frame.presence.value_or(host::Presence::Sliver)));
        Put16(bytes, 0);
        PutRows(bytes, frame.raw, gesture.geometry);
        if (blocks)
            bytes.append(frame.raw.begin(), frame.raw.end());
    }
    return bytes;
}

}  // namespace fpnavi_fuzz
