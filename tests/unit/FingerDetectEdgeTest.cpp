// The texture test to the last digit, on dark frames: below a window mean of 16 greys the library's
// reciprocal of 81 rounds every mean down to 1/16 grey level as a division does.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdint>
#include <random>
#include <vector>

#include "FingerDetect.h"

namespace {

struct DarkFrame {
    int32_t width;
    int32_t height;
    std::vector<uint8_t> grey;

    int32_t At(int32_t x, int32_t y) const { return grey[static_cast<size_t>(y * width + x)]; }
};

// Blur minus mean at a pixel whose window fits, in 1/16 grey level.
int64_t Passed(const DarkFrame& frame, int32_t x, int32_t y) {
    constexpr std::array<int32_t, 3> kWeights = {1, 2, 1};
    int32_t blur = 0;
    int32_t sum = 0;
    for (int32_t dy = -4; dy <= 4; ++dy) {
        for (int32_t dx = -4; dx <= 4; ++dx) {
            sum += frame.At(x + dx, y + dy);
            if (dx >= -1 && dx <= 1 && dy >= -1 && dy <= 1)
                blur += kWeights[static_cast<size_t>(dx + 1)] *
                        kWeights[static_cast<size_t>(dy + 1)] * frame.At(x + dx, y + dy);
        }
    }
    return blur - 16 * sum / 81;
}

// An eighth of the root of the mean energy of the pixels of a block whose window fits.
int32_t Response(const DarkFrame& frame, int32_t left, int32_t top, int32_t right, int32_t bottom) {
    int64_t energy = 0;
    int64_t count = 0;
    for (int32_t y = std::max(top, 4); y < std::min(bottom, frame.height - 4); ++y) {
        for (int32_t x = std::max(left, 4); x < std::min(right, frame.width - 4); ++x) {
            energy += Passed(frame, x, y) * Passed(frame, x, y);
            ++count;
        }
    }
    int32_t root = 0;
    while (int64_t{root + 1} * (root + 1) <= energy / count)
        ++root;
    return root / 8;
}

TEST(FingerBlkEdge, ResponsesOfDarkFramesAreExact) {
    std::mt19937 random(3);
    for (int32_t round = 0; round < 150; ++round) {
        DarkFrame frame = {32 + 4 * (round % 8), 16 + 4 * (round % 5), {}};
        const uint32_t brightest = 2 + static_cast<uint32_t>(round) % 15;
        for (int32_t p = 0; p < frame.width * frame.height; ++p)
            frame.grey.push_back(static_cast<uint8_t>(random() % (brightest + 1)));
        std::array<int32_t, 10> results{};
        FingerBLKTest(frame.grey.data(), frame.width, frame.height, results.data(), 0);
        const int32_t w = frame.width;
        const int32_t h = frame.height;
        EXPECT_EQ(results[0], Response(frame, w / 4, h / 4, w * 3 / 4, h * 3 / 4)) << round;
        EXPECT_EQ(results[1], Response(frame, 0, 0, w / 2, h / 2)) << round;
        EXPECT_EQ(results[2], Response(frame, w / 2, 0, w, h / 2)) << round;
        EXPECT_EQ(results[3], Response(frame, 0, h / 2, w / 2, h)) << round;
        EXPECT_EQ(results[4], Response(frame, w / 2, h / 2, w, h)) << round;
    }
}

}  // namespace
