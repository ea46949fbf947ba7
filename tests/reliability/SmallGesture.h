// Gestures of a few small frames that reach every method: noise that moves by two pixels a frame.
#ifndef TESTS_RELIABILITY_SMALLGESTURE_H
#define TESTS_RELIABILITY_SMALLGESTURE_H

#include <cstdint>
#include <vector>

#include "parameters/ParamTable.h"
#include "recording/Recording.h"

namespace fpnavi_test {

// Sizes in pixels. The image is cut into 4 x 4 blocks and, with gaps, into nine tiles.
struct SmallSensor {
    host::Mode mode;
    bool multi;  // s_multiBloclkFlag
    int32_t width;
    int32_t height;
};

struct SmallGesture {
    host::Mode mode;
    int32_t width;
    host::ParamBlock params;
    std::vector<std::vector<uint8_t>> frames;  // raw, in block order
};

// width and height are multiples of 4, from 8 on. Few candidates, small overlaps, no log lines.
host::ParamBlock SmallParams(const SmallSensor& sensor);

// frameNum frames of a finger that covers the sensor. seed draws the skin.
SmallGesture MakeSmallGesture(const SmallSensor& sensor, int32_t frameNum, uint64_t seed);

// Registers of the double scan for a frame: a band of set rows that moves with index.
uint32_t ZoneRows(int32_t index);

}  // namespace fpnavi_test

#endif  // TESTS_RELIABILITY_SMALLGESTURE_H
