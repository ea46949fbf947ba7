// The no-move test where its bands are odd: borders of half the side, of more, of all of it and
// beyond, none and negative ones; and frames so large that sums wrap.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "motion/FingerNoMove.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

// A frame whose columns matter, or the same turned, whose rows do.
struct Turned {
    bool rows;

    FrameSize Size(int32_t side, int32_t other) const {
        return rows ? FrameSize{other, side} : FrameSize{side, other};
    }
    // Greys of side places along the axis, each the same across it.
    std::vector<uint8_t> Greys(const std::vector<uint8_t>& along, int32_t other) const {
        const int32_t side = static_cast<int32_t>(along.size());
        std::vector<uint8_t> greys;
        greys.reserve(along.size() * static_cast<size_t>(other));
        for (int32_t p = 0; p < side * other; ++p)
            greys.push_back(along[static_cast<size_t>(rows ? p / other : p % side)]);
        return greys;
    }
};

// Whole frames without a shift, under borders of bound along the axis and none across it.
int32_t Outcome(const Turned& turned, const std::vector<uint8_t>& along, int32_t other,
                int32_t bound, int32_t areaMin, int32_t tolerance) {
    const FrameSize size = turned.Size(static_cast<int32_t>(along.size()), other);
    SetStepParams(size, {{"s_smallMoveTolRow", 0},
                         {"s_smallMoveTolCol", 0},
                         {"s_boundWidth", turned.rows ? 0 : bound},
                         {"s_boundHeight", turned.rows ? bound : 0},
                         {"s_overlapAreaMinNoMove", areaMin},
                         {"s_diffThresholdTol", tolerance},
                         {"s_downSampleFlag", 0}});
    TwinFrame prev(size, FlatBytes(size, 0), FlatBytes(size, 1));
    TwinFrame curr(size, turned.Greys(along, other), FlatBytes(size, 1));
    return NoMove(&prev, &curr);
}

class StepNoMoveBands : public ::testing::TestWithParam<bool> {
  protected:
    static constexpr int32_t kOther = 6;
    const Turned m_turned = {GetParam()};

    // area places are compared, and differ by sum in all, in each of the lines across.
    void ExpectAreaAndSum(const std::vector<uint8_t>& along, int32_t bound, int32_t area,
                          int32_t sum) {
        const int32_t mean = sum / area;
        const auto outcome = [&](int32_t areaMin, int32_t tolerance) {
            return Outcome(m_turned, along, kOther, bound, areaMin, tolerance);
        };
        EXPECT_EQ(outcome(area * kOther, mean + 1), fpnavi::kNoMoveResting) << bound;
        EXPECT_EQ(outcome(area * kOther, mean), fpnavi::kNoMoveMoved) << bound;
        EXPECT_EQ(outcome(area * kOther + 1, mean + 1), fpnavi::kNoMoveUndetermined) << bound;
        ASSERT_FALSE(HasFailure()) << along.size() << " places, border " << bound;
    }
};

// Borders of b of s pixels overlap in 2b - s places, which are compared twice. These differ by 90,
// the others by 30.
TEST_P(StepNoMoveBands, PlacesOfBothBordersCountTwice) {
    for (const int32_t side : {2, 3, 10, 15, 16, 17, 63, 64, 65, 127, 128, 129}) {
        for (const int32_t bound : {side / 2 + 1, side / 2 + 2, side - side / 4, side - 1, side}) {
            if (2 * bound <= side || bound > side)
                continue;
            std::vector<uint8_t> along(static_cast<size_t>(side), 30);
            std::fill(along.begin() + (side - bound), along.begin() + bound, uint8_t{90});
            const int32_t twice = 2 * bound - side;
            ExpectAreaAndSum(along, bound, 2 * bound, 2 * twice * 90 + (side - twice) * 30);
        }
    }
}

// No centre is left, and nothing is compared twice; one place less on each side makes no
// difference.
TEST_P(StepNoMoveBands, BordersOfHalfTheSideCountOnce) {
    for (const int32_t side : {2, 10, 16, 64, 126, 128, 130}) {
        std::vector<uint8_t> along(static_cast<size_t>(side), 30);
        along.front() = along.back() = 7;
        along[static_cast<size_t>(side) / 2] = 90;
        int32_t sum = 0;
        for (const uint8_t grey : along)
            sum += grey;
        for (const int32_t bound : {0, 1, side / 2 - 1, side / 2})
            ExpectAreaAndSum(along, bound, side, sum);
    }
}

TEST_P(StepNoMoveBands, BordersBeyondTheSideOrNegativeCompareNothing) {
    for (const int32_t side : {1, 2, 16, 17, 64, 65, 129}) {
        const std::vector<uint8_t> along(static_cast<size_t>(side), 0);
        for (const int32_t bound : {side + 1, side + 2, 2 * side, 4096, -1, -2, -side, -4096})
            EXPECT_EQ(Outcome(m_turned, along, kOther, bound, 0, 256), fpnavi::kNoMoveUndetermined)
                << side << ", border " << bound;
    }
}

INSTANTIATE_TEST_SUITE_P(Axes, StepNoMoveBands, ::testing::Bool());

// Corners are in no band: with both borders above half the side nothing else is left.
TEST(StepNoMoveBothBands, BordersAboveHalfInBothAxesCompareNothing) {
    const FrameSize size = {20, 12};
    for (const int32_t boundHeight : {7, 12}) {
        for (const int32_t boundWidth : {11, 20}) {
            SetStepParams(size, {{"s_boundWidth", boundWidth},
                                 {"s_boundHeight", boundHeight},
                                 {"s_overlapAreaMinNoMove", 0},
                                 {"s_diffThresholdTol", 256}});
            TwinFrame prev(size, FlatBytes(size, 9), FlatBytes(size, 1));
            TwinFrame curr(size, FlatBytes(size, 9), FlatBytes(size, 1));
            EXPECT_EQ(NoMove(&prev, &curr), fpnavi::kNoMoveUndetermined);
        }
    }
}

// All borders of small frames, at every shift by up to one pixel.
TEST(StepNoMoveBothBands, EveryBorderOfSmallFramesGivesTheSameOutcome) {
    int64_t outcomes[3] = {};
    for (const FrameSize size :
         {FrameSize{5, 6}, {6, 5}, {1, 4}, {4, 1}, {8, 3}, {17, 2}, {2, 17}}) {
        for (int32_t boundWidth = -2; boundWidth <= size.width + 2; ++boundWidth) {
            for (int32_t boundHeight = -2; boundHeight <= size.height + 2; ++boundHeight) {
                SimRandom random = StepRandom(231, boundWidth * 100 + boundHeight);
                SetStepParams(size, {{"s_smallMoveTolRow", 1},
                                     {"s_smallMoveTolCol", 1},
                                     {"s_boundWidth", boundWidth},
                                     {"s_boundHeight", boundHeight},
                                     {"s_overlapAreaMinNoMove", random.Range(0, 12)},
                                     {"s_diffThresholdTol", random.Range(0, 60)}});
                const PairBytes pair = RandomPair(random, size);
                TwinFrame prev(size, pair.prevGreys, pair.prevTypes);
                TwinFrame curr(size, pair.currGreys, pair.currTypes);
                ++outcomes[NoMove(&prev, &curr)];
                ASSERT_FALSE(::testing::Test::HasFailure())
                    << size.width << " x " << size.height << ", " << boundWidth << ", "
                    << boundHeight;
            }
        }
    }
    for (const int64_t count : outcomes)
        EXPECT_GT(count, 0);
}

// Black against white of 4096 x 2056 pixels sums up to 2147450880, just below 2^31; another row
// makes it 2148495360, which as 32 bits is negative, and below every tolerance.
TEST(StepNoMoveLargeFrames, SumsWrapAt32Bits) {
    for (const int32_t height : {2056, 2057}) {
        const FrameSize size = {4096, height};
        SetStepParams(size, {{"s_smallMoveTolRow", 0},
                             {"s_smallMoveTolCol", 0},
                             {"s_boundWidth", 0},
                             {"s_boundHeight", 0},
                             {"s_overlapAreaMinNoMove", 1},
                             {"s_diffThresholdTol", 1}});
        TwinFrame prev(size, FlatBytes(size, 0), FlatBytes(size, 1));
        TwinFrame curr(size, FlatBytes(size, 255), FlatBytes(size, 1));
        EXPECT_EQ(NoMove(&prev, &curr),
                  height == 2056 ? fpnavi::kNoMoveMoved : fpnavi::kNoMoveResting);
    }
}

// A frame that could wrap does not with half of it finger: 4096 * 1100 * 255 < 2^31.
TEST(StepNoMoveLargeFrames, SumsThatCouldWrapAreTakenInFull) {
    const FrameSize size = {4096, 2200};
    SetStepParams(size, {{"s_smallMoveTolRow", 0},
                         {"s_smallMoveTolCol", 0},
                         {"s_boundWidth", 5},
                         {"s_boundHeight", 7},
                         {"s_overlapAreaMinNoMove", 1},
                         {"s_diffThresholdTol", 255}});
    std::vector<uint8_t> types = FlatBytes(size, 1);
    TwinFrame prev(size, FlatBytes(size, 0), types);
    std::fill(types.begin() + static_cast<ptrdiff_t>(types.size() / 2), types.end(), uint8_t{2});
    TwinFrame curr(size, FlatBytes(size, 255), types);
    EXPECT_EQ(NoMove(&prev, &curr), fpnavi::kNoMoveMoved);
}

}  // namespace
}  // namespace fpnavi_test
