// The nine calls of the library, of the module or of the plain model, and where their log goes.
#ifndef TESTS_DIGEST_SIDE_H
#define TESTS_DIGEST_SIDE_H

#include <cstddef>
#include <cstdint>
#include <string>
#include <vector>

namespace fpnavi_test {

constexpr size_t kRecordIntegers = 1503;  // of the vote record

struct Side {
    int32_t (*setParam)(const int32_t* params);
    void (*clear)();
    const int32_t* (*record)();  // kRecordIntegers of them, in the record's order
    int32_t (*block)(const uint8_t* raw, int32_t width, int32_t height, uint8_t* image);
    int32_t (*zones)(uint32_t reg24, uint32_t reg28);
    int32_t (*frame)(const uint8_t* prev, const uint8_t* curr, int32_t timeOut);
    int32_t (*vote)(int32_t timeOut);
    int32_t (*status)(const uint8_t* image);
    int32_t (*tune)(const uint8_t* image, int32_t width, int32_t height, uint32_t* dac,
                    const uint32_t* gain20, const uint32_t* gain2C);
    // Each log line goes to lines from now on: priority, tag and text, process and thread as 0.
    void (*logTo)(std::vector<std::string>* lines);
};

const Side& ModuleSide();
// Both sides ask the same FingerBLKTest, this project's own.
const Side& ModelSide();

}  // namespace fpnavi_test

#endif  // TESTS_DIGEST_SIDE_H
