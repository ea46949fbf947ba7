// A .fng recording built byte by byte, for the tests of its importer.
#ifndef FPNAVI_TESTS_HOST_FNGTESTSUPPORT_H
#define FPNAVI_TESTS_HOST_FNGTESTSUPPORT_H

#include <algorithm>
#include <cstdint>
#include <vector>

#include "FpNavi.h"

namespace host_test {

using Bytes = std::vector<uint8_t>;

inline constexpr size_t kWidth = 56;
inline constexpr size_t kHeight = 36;
inline constexpr size_t kPixels = kWidth * kHeight;
inline constexpr size_t kHeader = 32;
inline constexpr size_t kFrameHead = 16;
inline constexpr size_t kFrame = kFrameHead + 2 * kPixels;

inline void Put16(Bytes& bytes, size_t offset, int value) {
    bytes[offset] = static_cast<uint8_t>(value & 255);
    bytes[offset + 1] = static_cast<uint8_t>((value >> 8) & 255);
}

// A pixel that tells its place and frame.
inline uint8_t PixelAt(size_t frame, size_t row, size_t col) {
    return static_cast<uint8_t>(row * 5 + col * 3 + frame);
}

inline void PutFrame(Bytes& bytes, size_t frame) {
    const size_t start = kHeader + frame * kFrame;
    Put16(bytes, start + 8, -20 + static_cast<int>(frame));  // x, in 1/16 pixel
    Put16(bytes, start + 10, 300);                           // y
    bytes[start + 12] = 40;                                  // contact
    bytes[start + 13] = frame == 0 ? 255 : 1;                // presence: a sliver, then a finger
    uint8_t* const rows = &bytes[start + kFrameHead];
    uint8_t* blocks = rows + kPixels;
    for (size_t i = 0; i < kPixels; ++i)
        rows[i] = PixelAt(frame, i / kWidth, i % kWidth);
    for (size_t block = 0; block < 126; ++block) {
        for (size_t k = 0; k < 16; ++k)
            *blocks++ = PixelAt(frame, block / 7 * 2 + k / 8, block % 7 * 8 + k % 8);
    }
}

// A tiled fp recording of 2 frames, label UP, ended by a lift.
inline Bytes FngBytes() {
    Bytes bytes(kHeader + 2 * kFrame);
    const char magic[] = "FNG1";
    std::copy(magic, magic + 4, bytes.begin());
    Put16(bytes, 4, 1);   // version
    Put16(bytes, 6, 1);   // flags: block-ordered bytes follow
    Put16(bytes, 8, 56);  // width, height, frames
    Put16(bytes, 10, 36);
    Put16(bytes, 12, 2);
    bytes[15] = 1;        // tiled
    Put16(bytes, 16, 8);  // block width, height, per row, rows
    Put16(bytes, 18, 2);
    Put16(bytes, 20, 7);
    Put16(bytes, 22, 18);
    bytes[24] = VKEY_UP;
    PutFrame(bytes, 0);
    PutFrame(bytes, 1);
    return bytes;
}

}  // namespace host_test

#endif  // FPNAVI_TESTS_HOST_FNGTESTSUPPORT_H
