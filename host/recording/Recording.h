// A recorded gesture: everything that is needed to replay it and to judge the key it gives.
//
// Frames are pictures of a fingerprint: biometric data. Store and share them accordingly.
#ifndef FPNAVI_HOST_RECORDING_H
#define FPNAVI_HOST_RECORDING_H

#include <array>
#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "FpNavi.h"

namespace host {

// The parameter block of SetNaviParam.
using ParamBlock = std::array<int32_t, FPNAVI_PARAM_NUM>;

// Operating mode of the recording, numbered as s_modeFlag.
enum class Mode : int32_t { Fp = 0, Hg = 1, DoubleScan = 2 };

// How a recording ends: the finger leaves and an empty frame follows, or the host's time-out
// expires with the finger down.
enum class GestureEnd : int32_t { Lift = 0, TimeOut = 1 };

// The raw sensor data is a grid of blocks; all in pixels or counts, all at least 1.
struct Geometry {
    int32_t blockWidth = 0;
    int32_t blockHeight = 0;
    int32_t blockColNum = 0;
    int32_t blockRowNum = 0;

    int32_t Width() const { return blockWidth * blockColNum; }
    int32_t Height() const { return blockHeight * blockRowNum; }
    bool operator==(const Geometry& other) const {
        return blockWidth == other.blockWidth && blockHeight == other.blockHeight &&
               blockColNum == other.blockColNum && blockRowNum == other.blockRowNum;
    }
};

// What is known of a frame without running any program.
enum class Presence : int32_t { Absent = 0, Present = 1, Sliver = -1 };  // Sliver: either is right

struct RecordedFrame {
    std::vector<uint8_t> raw;  // Width x Height bytes in sensor (block) order
    uint32_t reg24 = 0;        // double-scan registers; 0 in the other modes
    uint32_t reg28 = 0;
    // True finger position in 1/16 pixel, x to the right, y downwards, any origin; if known.
    std::optional<int32_t> x16;
    std::optional<int32_t> y16;
    std::optional<Presence> presence;
};

struct Gesture {
    std::string id;  // unique in a store
    ParamBlock params{};
    Mode mode = Mode::Fp;  // equals s_modeFlag of params
    Geometry geometry;     // equals the geometry that params give
    std::vector<RecordedFrame> frames;
    GestureEnd end = GestureEnd::Lift;
    std::optional<int32_t> label;   // the true key (NaviVkey_t); empty: no single right key
    std::vector<int32_t> accepted;  // keys that are no error
    std::string tier;               // "core", "hard" or empty
    std::vector<std::string> tags;
    std::string libraryVersion;  // of the library that recorded it
    std::string notes;
};

}  // namespace host

#endif  // FPNAVI_HOST_RECORDING_H
