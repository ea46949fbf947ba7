// What the no-move test could get wrong: each case is made for one mistake and runs on frames
// either side of one step of sixteen, one word of 64 and two, in both axes.
#include <gtest/gtest.h>

#include <limits>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "motion/FingerNoMove.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

constexpr int32_t kNoLimit = std::numeric_limits<int32_t>::max();

class StepFingerNoMoveTrap : public ::testing::TestWithParam<FrameSize> {
  protected:
    static constexpr int32_t kBound = 2;

    static FrameSize Size() { return GetParam(); }
    // Pixels that are compared without a shift: all but the corners.
    static int32_t Compared() {
        return static_cast<int32_t>(Size().Pixels()) - 4 * kBound * kBound;
    }

    int32_t Outcome(ParamChanges changes, const std::vector<uint8_t>& prevGreys,
                    const std::vector<uint8_t>& currGreys, uint8_t type = 1) {
        host::ParamBlock params = m_params;
        for (const auto& [name, value] : changes)
            host::ParamValue(params, name) = value;
        SetStepParams(params);
        TwinFrame prev(Size(), prevGreys, FlatBytes(Size(), type));
        TwinFrame curr(Size(), currGreys, FlatBytes(Size(), 1));
        return NoMove(&prev, &curr);
    }

    void SetUp() override {
        m_params = host::ParamsForMode(host::Mode::Fp, false);
        SetTiles(m_params, Size(), kBound, 4);
        host::ParamValue(m_params, "s_downSampleFlag") = 0;
        host::ParamValue(m_params, "s_smallMoveTolRow") = 0;
        host::ParamValue(m_params, "s_smallMoveTolCol") = 0;
    }

    host::ParamBlock m_params;
};

// Unlike the match, the no-move test counts an area of exactly its minimum.
TEST_P(StepFingerNoMoveTrap, AreaOfExactlyTheMinimumCounts) {
    const std::vector<uint8_t> greys = FlatBytes(Size(), 80);
    EXPECT_EQ(Outcome({{"s_overlapAreaMinNoMove", Compared()}}, greys, greys),
              fpnavi::kNoMoveResting);
    EXPECT_EQ(Outcome({{"s_overlapAreaMinNoMove", Compared() + 1}}, greys, greys),
              fpnavi::kNoMoveUndetermined);
}

TEST_P(StepFingerNoMoveTrap, NoCountedShiftIsUndetermined) {
    const std::vector<uint8_t> greys = FlatBytes(Size(), 80);
    EXPECT_EQ(Outcome({{"s_overlapAreaMinNoMove", 0}}, greys, greys, 255),
              fpnavi::kNoMoveUndetermined);
    EXPECT_EQ(Outcome({{"s_smallMoveTolRow", -1}}, greys, greys), fpnavi::kNoMoveUndetermined);
    EXPECT_EQ(Outcome({{"s_overlapAreaMinNoMove", kNoLimit}}, greys, greys),
              fpnavi::kNoMoveUndetermined);
}

// The least difference starts at 256: a tolerance above it takes even no shift at all for rest.
TEST_P(StepFingerNoMoveTrap, ToleranceAboveTheStartValueRests) {
    const std::vector<uint8_t> greys = FlatBytes(Size(), 80);
    EXPECT_EQ(Outcome({{"s_diffThresholdTol", 256}}, greys, greys, 0), fpnavi::kNoMoveUndetermined);
    EXPECT_EQ(Outcome({{"s_diffThresholdTol", 257}}, greys, greys, 0), fpnavi::kNoMoveResting);
}

// The sum stops at tolerance times area. A mean of exactly the tolerance is a move; one grey level
// less in a single pixel brings the mean down to the next lower whole number.
TEST_P(StepFingerNoMoveTrap, EarlyStopIsExactAtTheTolerance) {
    const std::vector<uint8_t> black = FlatBytes(Size(), 0);
    for (const int32_t difference : {1, 7, 100, 255}) {
        std::vector<uint8_t> greys = FlatBytes(Size(), static_cast<uint8_t>(difference));
        const ParamChanges exact = {{"s_diffThresholdTol", difference},
                                    {"s_overlapAreaMinNoMove", 1}};
        EXPECT_EQ(Outcome(exact, black, greys), fpnavi::kNoMoveMoved) << difference;
        EXPECT_EQ(Outcome({{"s_diffThresholdTol", difference + 1}}, black, greys),
                  fpnavi::kNoMoveResting)
            << difference;
        // In the last row that is compared, behind the place of every early stop.
        greys[greys.size() - static_cast<size_t>(kBound) - 1] -= 1;
        EXPECT_EQ(Outcome(exact, black, greys), fpnavi::kNoMoveResting) << difference;
    }
}

// Pixels that are finger in one frame only count for nothing, whatever their greys.
TEST_P(StepFingerNoMoveTrap, OnlyClassOneIsCompared) {
    const std::vector<uint8_t> black = FlatBytes(Size(), 0);
    const std::vector<uint8_t> white = FlatBytes(Size(), 255);
    for (const int32_t other : {0, 2, 254, 255})
        EXPECT_EQ(
            Outcome({{"s_overlapAreaMinNoMove", 0}}, black, white, static_cast<uint8_t>(other)),
            fpnavi::kNoMoveUndetermined)
            << other;
    EXPECT_EQ(Outcome({{"s_overlapAreaMinNoMove", 0}}, black, white), fpnavi::kNoMoveMoved);
}

// Noise that moves by 9 rows or 9 columns equals itself at no other shift. Tolerances beyond the
// frame's sides add shifts at which no pixel meets another.
TEST_P(StepFingerNoMoveTrap, RestAtTheFarthestShiftIsFound) {
    constexpr int32_t kShift = 9;
    SimRandom random = StepRandom(221, 0);
    const FrameSize large = {Size().width + kShift, Size().height + kShift};
    std::vector<uint8_t> noise = FlatBytes(large, 0);
    for (uint8_t& grey : noise)
        grey = static_cast<uint8_t>(random.Below(256));
    const auto cut = [&](int32_t row, int32_t column) {
        std::vector<uint8_t> greys;
        for (int32_t r = row; r < row + Size().height; ++r) {
            const auto start = noise.begin() + r * large.width + column;
            greys.insert(greys.end(), start, start + Size().width);
        }
        return greys;
    };
    const std::vector<uint8_t> first = cut(0, 0);
    for (const bool rows : {false, true}) {
        const std::vector<uint8_t> moved = rows ? cut(kShift, 0) : cut(0, kShift);
        const char* const tolerance = rows ? "s_smallMoveTolRow" : "s_smallMoveTolCol";
        for (const int32_t reach : {kShift - 1, kShift, 80}) {
            const ParamChanges changes = {{tolerance, reach},
                                          {"s_boundWidth", 0},
                                          {"s_boundHeight", 0},
                                          {"s_overlapAreaMinNoMove", 100},
                                          {"s_diffThresholdTol", 1}};
            const int32_t expected = reach < kShift ? fpnavi::kNoMoveMoved : fpnavi::kNoMoveResting;
            EXPECT_EQ(Outcome(changes, first, moved), expected) << tolerance << " " << reach;
            EXPECT_EQ(Outcome(changes, moved, first), expected) << tolerance << " " << reach;
        }
    }
}

std::vector<FrameSize> LongSizes(bool wide) {
    std::vector<FrameSize> sizes;
    for (const int32_t side : kEdges)
        sizes.push_back(wide ? FrameSize{side, 20} : FrameSize{20, side});
    return sizes;
}

INSTANTIATE_TEST_SUITE_P(Widths, StepFingerNoMoveTrap, ::testing::ValuesIn(LongSizes(true)));
INSTANTIATE_TEST_SUITE_P(Heights, StepFingerNoMoveTrap, ::testing::ValuesIn(LongSizes(false)));

}  // namespace
}  // namespace fpnavi_test
