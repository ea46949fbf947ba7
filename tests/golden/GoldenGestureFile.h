// The flat form of golden gestures: a head each, and after it for each frame its two registers and
// width x height raw bytes. In the order of bytes of the machine: written and read in one run.
#ifndef TESTS_GOLDEN_GOLDENGESTUREFILE_H
#define TESTS_GOLDEN_GOLDENGESTUREFILE_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi_test {

struct GoldenGestureHead {
    int32_t params[FPNAVI_PARAM_NUM];
    int32_t record[sizeof(NaviVoteInfo_t) / sizeof(int32_t)];  // after the vote
    int32_t key;                                               // the vote
    int32_t doubleScan;                                        // 1: the registers are used
    int32_t width;                                             // of a frame, in pixels
    int32_t height;
    int32_t frames;
};

}  // namespace fpnavi_test

#endif  // TESTS_GOLDEN_GOLDENGESTUREFILE_H
