// Replays a gesture through one of the two implementations and keeps what its record holds then.
#ifndef TESTS_GOLDEN_RECORDER_H
#define TESTS_GOLDEN_RECORDER_H

#include <array>
#include <cstdint>
#include <string>
#include <vector>

#include "recording/Recording.h"

namespace fpnavi_test {

constexpr size_t kRecordInts = sizeof(NaviVoteInfo_t) / sizeof(int32_t);

struct Outcome {
    int32_t key = -1;
    std::array<int32_t, kRecordInts> record{};

    bool operator==(const Outcome& other) const {
        return key == other.key && record == other.record;
    }
};

// The calls of one implementation.
struct Implementation {
    int32_t (*setParam)(const int32_t*);
    void (*clear)();
    int32_t (*zones)(uint32_t, uint32_t);
    int32_t (*block)(const uint8_t*, int32_t, int32_t, uint8_t*);
    int32_t (*status)(const uint8_t*);
    int32_t (*frame)(const uint8_t*, const uint8_t*, int32_t);
    int32_t (*vote)(int32_t);
    const int32_t* (*record)();
};

extern const Implementation kModule;
extern const Implementation kReference;

// The gesture as a host replays it: the vote comes when the finger leaves, or at the end.
Outcome Record(const Implementation& implementation, const host::Gesture& gesture);

// One line: id, key, pairs, then for each array of the record its entries up to the last pair.
std::string OutcomeLine(const std::string& id, const Outcome& outcome);

// The gestures whose records are kept: eight of each mode, in all kinds of motion.
std::vector<host::Gesture> GoldenGestures(host::Mode mode);

}  // namespace fpnavi_test

#endif  // TESTS_GOLDEN_RECORDER_H
