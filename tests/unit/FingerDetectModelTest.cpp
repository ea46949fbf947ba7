// The texture test against the plain model, to the last digit, at every size near its limits and
// near multiples of what it works on at a time: 8 columns, 128 rows of energies, 257 rows of greys.
#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <memory>
#include <random>

#include "FingerDetect.h"
#include "RefTexture.h"

namespace {

using Results = std::array<int32_t, 10>;

constexpr uint32_t kKinds = 5;

// One grey of a frame of that kind: any; black and white; bright and noisy; dark; white.
uint8_t GreyOf(uint32_t kind, std::mt19937& random) {
    const uint32_t bits = static_cast<uint32_t>(random()) >> 8;
    switch (kind) {
        case 0:
            return static_cast<uint8_t>(bits & 255);
        case 1:
            return (bits & 1) != 0 ? 255 : 0;
        case 2:
            return static_cast<uint8_t>(225 + bits % 31);
        case 3:
            return static_cast<uint8_t>(bits % 7);
        default:
            return 255;
    }
}

// The frame ends where its memory does, so that the address sanitizer sees a read behind it.
void ExpectTheModelsResults(int32_t width, int32_t height, uint32_t kind, std::mt19937& random) {
    const size_t pixels = static_cast<size_t>(width) * static_cast<size_t>(height);
    const std::unique_ptr<uint8_t[]> greys(new uint8_t[pixels]);
    for (size_t p = 0; p < pixels; ++p)
        greys[p] = GreyOf(kind, random);
    Results module;
    Results model;
    module.fill(-777);
    model.fill(-777);
    FingerBLKTest(greys.get(), width, height, module.data(), 0);
    reference::TextureTest(greys.get(), width, height, model.data(), 0);
    ASSERT_EQ(module, model) << width << " x " << height << ", kind " << kind;
}

TEST(FingerBlkModel, EverySizeFrom1To80GivesTheSame) {
    std::mt19937 random(11);
    for (int32_t height = 1; height <= 80; ++height) {
        for (int32_t width = 1; width <= 80; ++width) {
            const uint32_t kind = static_cast<uint32_t>(width + 3 * height) % kKinds;
            ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(width, height, kind, random));
        }
    }
}

TEST(FingerBlkModel, ManyFramesOfTheUsualSizesGiveTheSame) {
    std::mt19937 random(12);
    for (uint32_t round = 0; round < 200; ++round) {
        ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(56, 36, round % kKinds, random));
        ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(40, 48, round % kKinds, random));
    }
}

TEST(FingerBlkModel, EdgeSizesGiveTheSame) {
    std::mt19937 random(13);
    for (const int32_t width : {15, 16, 17, 23, 24, 25, 63, 64, 65, 127, 128, 129}) {
        for (const int32_t height : {15, 16, 17, 63, 64, 65, 127, 128, 129}) {
            for (uint32_t kind = 0; kind < kKinds; ++kind)
                ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(width, height, kind, random));
        }
    }
}

// A cell of 128 rows sums up its energies in one go, one of 129 in two; likewise 257 and 258 rows
// of greys.
TEST(FingerBlkModel, CellsOfManyRowsGiveTheSame) {
    std::mt19937 random(14);
    for (const int32_t height : {511, 512, 513, 516, 1024, 1028, 1032, 1036}) {
        for (uint32_t kind = 0; kind < kKinds; ++kind)
            ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(18, height, kind, random));
    }
}

TEST(FingerBlkModel, LargeFramesGiveTheSame) {
    std::mt19937 random(15);
    ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(300, 257, 0, random));
    ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(511, 333, 1, random));
    ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(640, 480, 2, random));
    ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(32768, 16, 1, random));
    ASSERT_NO_FATAL_FAILURE(ExpectTheModelsResults(16, 32768, 1, random));
}

// White stripes of three columns pass with 4080 - 27 * 4080 / 81 = 2720 in the whole of their
// middle column. Cells of 325 rows: 325 * 2720^2 > 2^31, so that no cell can be summed up in one
// go.
TEST(FingerBlkModel, StrongStripesGiveTheSame) {
    const int32_t width = 90;
    const int32_t height = 1300;
    const std::unique_ptr<uint8_t[]> greys(new uint8_t[width * height]);
    for (int32_t p = 0; p < width * height; ++p)
        greys[static_cast<size_t>(p)] = p % width % 9 < 3 ? 255 : 0;
    Results module{};
    Results model{};
    FingerBLKTest(greys.get(), width, height, module.data(), 0);
    reference::TextureTest(greys.get(), width, height, model.data(), 0);
    EXPECT_EQ(module, model);
}

}  // namespace
