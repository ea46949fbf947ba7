// Single frames for judging presence tests: the empty sensor, and the sensor with skin on it.
//
// Frames have the fp size of 56 x 36 pixels and come row by row (not in block order).
#ifndef FPNAVI_HOST_PRESENCE_H
#define FPNAVI_HOST_PRESENCE_H

#include <cstdint>
#include <vector>

namespace host {

constexpr int32_t kPresenceWidth = 56;
constexpr int32_t kPresenceHeight = 36;

// An untouched sensor: background, offset, fixed pattern, noise and a slight gradient.
std::vector<uint8_t> SimulateEmptyFrame(uint64_t seed);

// A sensor with a finger on it: one window of nine tiles, or a contiguous one where plain is set;
// at least a fifth of the frame is in contact. A few fingers are wet or dry.
std::vector<uint8_t> SimulateTouchedFrame(uint64_t seed, bool plain);

}  // namespace host

#endif  // FPNAVI_HOST_PRESENCE_H
