// The texture test of the finger-detect library: what its responses and means are, which blocks
// they belong to, and what it leaves alone. Where a number is expected, it is derived beside it.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cmath>
#include <cstdint>
#include <random>
#include <vector>

#include "FingerDetect.h"

namespace {

constexpr int32_t kThreshold = 7;  // the default of s_fftResThreshold
constexpr int32_t kWidth = 56;
constexpr int32_t kHeight = 36;
constexpr int32_t kUnset = -777;

using Results = std::array<int32_t, 10>;

struct Frame {
    int32_t width, height;
    std::vector<uint8_t> grey;

    explicit Frame(uint8_t fill, int32_t w = kWidth, int32_t h = kHeight)
        : width(w), height(h), grey(static_cast<size_t>(w) * static_cast<size_t>(h), fill) {}
    uint8_t& At(int32_t x, int32_t y) { return grey[static_cast<size_t>(y * width + x)]; }
    int32_t Get(int32_t x, int32_t y) const { return grey[static_cast<size_t>(y * width + x)]; }
    void Set(int32_t x, int32_t y, int32_t value) {
        At(x, y) = static_cast<uint8_t>(std::clamp(value, 0, 255));
    }
    void Fill(int32_t left, int32_t top, int32_t right, int32_t bottom, int32_t value) {
        for (int32_t y = top; y < bottom; y++) {
            for (int32_t x = left; x < right; x++)
                Set(x, y, value);
        }
    }
    Results Measure() const {
        Results results;
        results.fill(kUnset);
        FingerBLKTest(grey.data(), width, height, results.data(), 0);
        return results;
    }
};

// 100 * sin(2 pi i / 32).
constexpr std::array<int32_t, 32> kSine = {0,   20,  38,   56,  71,  83,  92,  98,  100, 98,  92,
                                           83,  71,  56,   38,  20,  0,   -20, -38, -56, -71, -83,
                                           -92, -98, -100, -98, -92, -83, -71, -56, -38, -20};

// Unit vectors across the ridges, in 1/1000: every 22.5 degrees of the half circle.
struct Direction {
    int32_t x, y;
};
constexpr std::array<Direction, 8> kDirections = {{{1000, 0},
                                                   {924, 383},
                                                   {707, 707},
                                                   {383, 924},
                                                   {0, 1000},
                                                   {-383, 924},
                                                   {-707, 707},
                                                   {-924, 383}}};

int32_t Ridge(int32_t x, int32_t y, int32_t period, Direction across, int32_t amplitude) {
    const int32_t position = x * across.x + y * across.y + 1000 * period * 100;  // never negative
    return amplitude * kSine[static_cast<size_t>(position * 32 / (1000 * period) % 32)] / 100;
}

Frame Ridges(int32_t period, Direction across, int32_t amplitude, int32_t ground = 128) {
    Frame frame(0);
    for (int32_t y = 0; y < kHeight; y++) {
        for (int32_t x = 0; x < kWidth; x++)
            frame.Set(x, y, ground + Ridge(x, y, period, across, amplitude));
    }
    return frame;
}

int32_t Weakest(const Results& r) {
    return *std::min_element(r.begin(), r.begin() + 5);
}
int32_t Strongest(const Results& r) {
    return *std::max_element(r.begin(), r.begin() + 5);
}

// About normal with standard deviation tenths / 10: twelve uniform numbers of n levels have the
// variance n * n - 1.
int32_t Noise(std::mt19937& random, int32_t tenths) {
    int32_t sum = 0;
    for (int32_t i = 0; i < 12; i++)
        sum += static_cast<int32_t>(random() % static_cast<uint32_t>(tenths));
    return (sum - 6 * (tenths - 1)) / 10;
}

// The definition, in floating point and without the strips and cells of the library.
double PlainResponse(const Frame& frame, int32_t left, int32_t top, int32_t right, int32_t bottom) {
    double energy = 0;
    int32_t count = 0;
    for (int32_t y = std::max(top, 4); y < std::min(bottom, frame.height - 4); y++) {
        for (int32_t x = std::max(left, 4); x < std::min(right, frame.width - 4); x++) {
            double passed = 0;
            for (int32_t dy = -4; dy <= 4; dy++) {
                for (int32_t dx = -4; dx <= 4; dx++) {
                    const double blur =
                        std::max(0, 2 - std::abs(dx)) * std::max(0, 2 - std::abs(dy));
                    passed += frame.Get(x + dx, y + dy) * (blur / 16 - 1.0 / 81);
                }
            }
            energy += passed * passed;
            count++;
        }
    }
    return 2 * std::sqrt(energy / count);
}

TEST(FingerBlkTest, FlatFrameHasNoTextureAndItsOwnMean) {
    for (int32_t grey = 0; grey <= 255; grey++) {
        const Results results = Frame(static_cast<uint8_t>(grey)).Measure();
        for (size_t block = 0; block < 5; block++) {
            EXPECT_EQ(results[block], 0);
            EXPECT_EQ(results[5 + block], grey);
        }
    }
}

TEST(FingerBlkTest, LinearGradientIsNoTexture) {
    Frame frame(0);
    for (int32_t y = 0; y < kHeight; y++) {
        for (int32_t x = 0; x < kWidth; x++)
            frame.Set(x, y, 10 + 2 * x + 3 * y);
    }
    EXPECT_EQ(Strongest(frame.Measure()), 0);
}

TEST(FingerBlkTest, RidgesOfSkinPassInEveryDirection) {
    for (int32_t period = 5; period <= 11; period++) {
        for (const Direction across : kDirections)
            EXPECT_GE(Weakest(Ridges(period, across, 30).Measure()), 2 * kThreshold)
                << "period " << period << " across " << across.x << ", " << across.y;
    }
}

TEST(FingerBlkTest, OtherPeriodsRespondLess) {
    for (const Direction across : kDirections) {
        int32_t weakestInBand = 1 << 30;
        for (int32_t period = 5; period <= 11; period++)
            weakestInBand = std::min(weakestInBand, Weakest(Ridges(period, across, 100).Measure()));
        for (const int32_t period : {2, 24, 40})
            EXPECT_LT(2 * Strongest(Ridges(period, across, 100).Measure()), weakestInBand)
                << "period " << period << " across " << across.x << ", " << across.y;
    }
}

// Across columns the window mean of a 9 px period is 0 and the blur passes (1 + cos 40 deg) / 2 =
// 0.883, so the response in half grey levels is 2 * 0.883 * amplitude / sqrt 2 = 1.249 * amplitude.
// 252 columns make the blocks (122 filtered columns, 126 in the centre) nearly whole periods.
TEST(FingerBlkTest, ResponseIsTwiceTheRootMeanSquareOfTheRidges) {
    for (const int32_t amplitude : {40, 80, 120}) {
        Frame frame(0, 252, 36);
        for (int32_t y = 0; y < frame.height; y++) {
            for (int32_t x = 0; x < frame.width; x++)
                frame.Set(x, y, 128 + Ridge(x, y, 9, {1000, 0}, amplitude));
        }
        const Results results = frame.Measure();
        for (size_t block = 0; block < 5; block++)
            EXPECT_NEAR(results[block], 1.249 * amplitude, 1 + 0.03 * amplitude);
    }
}

TEST(FingerBlkTest, ResponseGrowsWithAmplitude) {
    for (const Direction across : kDirections) {
        int32_t last = 0;
        for (int32_t amplitude = 10; amplitude <= 120; amplitude += 10) {
            const int32_t now = Weakest(Ridges(8, across, amplitude).Measure());
            EXPECT_GT(now, last);
            last = now;
        }
    }
}

TEST(FingerBlkTest, SaturatedRidgesStillPass) {
    for (const int32_t ground : {0, 255}) {  // one half of each wave is cut off
        EXPECT_GE(Weakest(Ridges(9, {707, 707}, 60, ground).Measure()), 2 * kThreshold);
    }
}

TEST(FingerBlkTest, NoiseAndFixedPatternStayBelow) {
    std::mt19937 random(1);
    for (int32_t round = 0; round < 200; round++) {
        std::array<int32_t, kWidth> column;
        std::array<int32_t, kHeight> row;
        std::array<int32_t, 7 * 18> block;  // sensor blocks of 8 x 2 pixels
        const auto pattern = [&random] { return static_cast<int32_t>(random() % 7) - 3; };
        std::generate(column.begin(), column.end(), pattern);
        std::generate(row.begin(), row.end(), pattern);
        std::generate(block.begin(), block.end(), pattern);
        const int32_t ground = 200 + static_cast<int32_t>(random() % 56);  // also cut at 255
        Frame frame(0);
        for (int32_t y = 0; y < kHeight; y++) {
            for (int32_t x = 0; x < kWidth; x++)
                frame.Set(x, y,
                          ground - x / 4 + column[static_cast<size_t>(x)] +
                              row[static_cast<size_t>(y)] +
                              block[static_cast<size_t>(y / 2 * 7 + x / 8)] + Noise(random, 36));
        }
        EXPECT_LT(Strongest(frame.Measure()), kThreshold);
    }
}

// One pixel 81 below the ground makes, in 1/16 grey level: 308 at its place, 146 at 4 neighbours,
// 65 at 4 corners, 16 at the 72 others of its window: 215460 squared and summed. The upper left
// quarter has 24 x 14 pixels whose window fits: root of 215460 / 336 = 25.3, a response of 3. The
// centre sees 5 pixels of 16: nothing.
TEST(FingerBlkTest, SinglePixelHasTheResponseOfTheDefinition) {
    Frame frame(200);
    frame.Set(10, 9, 200 - 81);
    const Results results = frame.Measure();
    EXPECT_EQ(results, (Results{0, 3, 0, 0, 0, 200, 199, 200, 200, 200}));
}

TEST(FingerBlkTest, TextureNearACornerRaisesThatQuarterAlone) {
    struct Corner {
        int32_t x, y;
        size_t block;
    };
    // 10 x 14 pixels of ridges; the window carries them 4 pixels further, to the edge of the
    // centre block (columns 14 to 41, rows 9 to 26) and of the quarter (28 x 18).
    for (const Corner corner : {Corner{0, 0, 1}, {46, 0, 2}, {0, 22, 3}, {46, 22, 4}}) {
        Frame frame(200);
        for (int32_t y = corner.y; y < corner.y + 14; y++) {
            for (int32_t x = corner.x; x < corner.x + 10; x++)
                frame.Set(x, y, 200 + Ridge(x, y, 8, {707, 707}, 55));
        }
        const Results results = frame.Measure();
        for (size_t block = 0; block < 5; block++) {
            if (block == corner.block) {
                EXPECT_GE(results[block], kThreshold) << "block " << block;
            } else {
                EXPECT_EQ(results[block], 0) << "block " << block;
                EXPECT_EQ(results[5 + block], 200) << "block " << block;
            }
        }
    }
}

TEST(FingerBlkTest, TextureInTheMiddleRaisesAllAndTheCentreMost) {
    Frame frame(200);
    for (int32_t y = 10; y < 26; y++) {
        for (int32_t x = 18; x < 38; x++)
            frame.Set(x, y, 200 + Ridge(x, y, 8, {707, 707}, 55));
    }
    const Results results = frame.Measure();
    EXPECT_GE(Weakest(results), kThreshold);
    EXPECT_EQ(Strongest(results), results[0]);
}

TEST(FingerBlkTest, MeansTellWhereTheBlocksLie) {
    // A block of 40 on 200 shares a quarter of its area with the centre (or the centre with each
    // quarter): 200 - 160 / 4 = 160 there.
    struct Place {
        int32_t left, top;
        std::array<int32_t, 5> means;
    };
    for (const Place& place :
         {Place{14, 9, {40, 160, 160, 160, 160}}, Place{0, 0, {160, 40, 200, 200, 200}},
          Place{28, 0, {160, 200, 40, 200, 200}}, Place{0, 18, {160, 200, 200, 40, 200}},
          Place{28, 18, {160, 200, 200, 200, 40}}}) {
        Frame frame(200);
        frame.Fill(place.left, place.top, place.left + 28, place.top + 18, 40);
        const Results results = frame.Measure();
        for (size_t block = 0; block < 5; block++)
            EXPECT_EQ(results[5 + block], place.means[block]) << "block " << block;
    }
}

TEST(FingerBlkTest, EveryPixelCountsInExactlyOneQuarter) {
    // Quarters of 17 x 19 have at most 9 x 10 pixels: one of 255 raises a mean of 0 to at least 2.
    for (int32_t y = 0; y < 19; y++) {
        for (int32_t x = 0; x < 17; x++) {
            Frame frame(0, 17, 19);
            frame.Set(x, y, 255);
            const Results results = frame.Measure();
            EXPECT_EQ(std::count(results.begin() + 6, results.end(), 0), 3) << x << ", " << y;
        }
    }
}

TEST(FingerBlkTest, EqualsThePlainDefinitionAtAnySize) {
    std::mt19937 random(2);
    for (int32_t round = 0; round < 60; round++) {
        const int32_t w = 16 + static_cast<int32_t>(random() % 150);
        const int32_t h = 16 + static_cast<int32_t>(random() % 60);
        Frame frame(0, w, h);
        const int32_t amplitude = static_cast<int32_t>(random() % 128);
        const Direction across = kDirections[random() % kDirections.size()];
        for (int32_t y = 0; y < h; y++) {
            for (int32_t x = 0; x < w; x++)
                frame.Set(x, y, 128 + Ridge(x, y, 7, across, amplitude) + Noise(random, 50));
        }
        const Results results = frame.Measure();
        const int32_t x1 = w / 4;
        const int32_t x2 = w / 2;
        const int32_t x3 = w * 3 / 4;
        const int32_t y1 = h / 4;
        const int32_t y2 = h / 2;
        const int32_t y3 = h * 3 / 4;
        const std::array<double, 5> plain = {
            PlainResponse(frame, x1, y1, x3, y3), PlainResponse(frame, 0, 0, x2, y2),
            PlainResponse(frame, x2, 0, w, y2), PlainResponse(frame, 0, y2, x2, h),
            PlainResponse(frame, x2, y2, w, h)};
        for (size_t block = 0; block < 5; block++) {
            // Rounded down, from values rounded to 1/16 grey level: an eighth of a unit.
            EXPECT_GE(results[block], std::floor(plain[block] - 0.125)) << w << " x " << h;
            EXPECT_LE(results[block], plain[block] + 0.25) << w << " x " << h;
        }
    }
}

TEST(FingerBlkTest, LargestContrastDoesNotOverflow) {
    Frame frame(0, 4096, 4096);
    for (int32_t y = 0; y < frame.height; y++) {
        for (int32_t x = 0; x < frame.width; x++)
            frame.At(x, y) = (x / 4 + y / 4) % 2 == 0 ? 255 : 0;
    }
    const Results results = frame.Measure();
    for (size_t block = 0; block < 5; block++) {
        EXPECT_EQ(results[5 + block], 127);  // half of the pixels are 255
        EXPECT_GT(results[block], 127);      // well over half of 127.5 grey levels passes
        EXPECT_LE(results[block], 2 * 255);
    }
}

TEST(FingerBlkTest, WhatCannotBeMeasuredIsLeftAlone) {
    const std::vector<uint8_t> grey(64 * 64, 100);
    for (const auto& [w, h] : std::vector<std::pair<int32_t, int32_t>>{{0, 0},
                                                                       {0, 36},
                                                                       {56, 0},
                                                                       {-1, 36},
                                                                       {56, -1},
                                                                       {-56, -36},
                                                                       {1, 1},
                                                                       {15, 36},
                                                                       {56, 15},
                                                                       {INT32_MIN, INT32_MIN},
                                                                       {INT32_MAX, INT32_MAX},
                                                                       {32769, 16},
                                                                       {16, 32769}}) {
        Results results;
        results.fill(kUnset);
        FingerBLKTest(grey.data(), w, h, results.data(), 0);
        EXPECT_EQ(std::count(results.begin(), results.end(), kUnset), 10) << w << " x " << h;
    }
    Results results;
    results.fill(kUnset);
    FingerBLKTest(nullptr, kWidth, kHeight, results.data(), 0);
    EXPECT_EQ(std::count(results.begin(), results.end(), kUnset), 10);
    FingerBLKTest(grey.data(), kWidth, kHeight, nullptr, 0);
}

TEST(FingerBlkTest, SmallestFrameIsMeasuredWhole) {
    const Results results = Frame(99, 16, 16).Measure();
    EXPECT_EQ(results, (Results{0, 0, 0, 0, 0, 99, 99, 99, 99, 99}));
}

TEST(FingerBlkTest, WritesTheTenResultsAndNothingElse) {
    std::array<int32_t, 30> guarded;
    guarded.fill(kUnset);
    Frame frame = Ridges(9, {707, 707}, 60);
    const Frame before = frame;
    FingerBLKTest(frame.grey.data(), kWidth, kHeight, guarded.data() + 10, 0);
    EXPECT_EQ(std::count(guarded.begin(), guarded.begin() + 10, kUnset), 10);
    EXPECT_EQ(std::count(guarded.begin() + 10, guarded.begin() + 20, kUnset), 0);
    EXPECT_EQ(std::count(guarded.begin() + 20, guarded.end(), kUnset), 10);
    EXPECT_EQ(frame.grey, before.grey);
}

}  // namespace
