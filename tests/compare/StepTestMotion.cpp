// Centroid, coverage and the no-move test against the plain model.
#include <gtest/gtest.h>

#include <algorithm>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

TEST(StepGetCenterAndCoverage, RandomClassMapsGiveTheSame) {
    const int64_t cases = StepCases(70000);
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(201, i);
        const FrameSize size = RandomSize(random);
        words.NoteWidth(size.width);
        TwinFrame twin{size, FlatBytes(size, 0), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::GetCenterAndCoverage(twin.Module()),
                  reference::GetCenterAndCoverage(twin.Plain()));
        ASSERT_TRUE(twin.Same()) << "case " << i << ", " << size.width << " x " << size.height;
    }
    words.ExpectAll();
}

TEST(StepGetCenterAndCoverage, EverySizeStaysInItsRoom) {
    SimRandom random = StepRandom(202, 0);
    for (int32_t width = 1; width <= 70; ++width) {
        for (int32_t height = 1; height <= 70; ++height) {
            const FrameSize size = {width, height};
            TwinFrame twin{size, FlatBytes(size, 0), RandomTypes(random, size)};
            ASSERT_EQ(fpnavi::GetCenterAndCoverage(twin.Module()), 0);
            ASSERT_EQ(reference::GetCenterAndCoverage(twin.Plain()), 0);
            ASSERT_TRUE(twin.Same()) << width << " x " << height;
        }
    }
}

TEST(StepGetCenterAndCoverage, LongestRowsAndColumnsGiveTheSame) {
    SimRandom random = StepRandom(203, 0);
    for (const FrameSize size : {FrameSize{4096, 1}, FrameSize{1, 4096}, FrameSize{2048, 1024}}) {
        for (int32_t n = 0; n < 6; ++n) {
            TwinFrame twin{size, FlatBytes(size, 0),
                           n == 0 ? FlatBytes(size, 1) : RandomTypes(random, size)};
            ASSERT_EQ(fpnavi::GetCenterAndCoverage(twin.Module()), 0);
            ASSERT_EQ(reference::GetCenterAndCoverage(twin.Plain()), 0);
            ASSERT_TRUE(twin.Same()) << size.width << " x " << size.height << ", map " << n;
        }
    }
}

// Tolerances, borders and thresholds around those of a device, and at the boundaries.
void SetNoMoveParams(SimRandom& random, FrameSize size) {
    const bool far = random.Chance(30) && size.Pixels() < 150;
    const int32_t reach = far ? 80 : 3;
    const int32_t bound = RandomLength(random, std::min(size.width, size.height) / 2);
    const bool oddBounds = random.Chance(20);
    SetStepParams(size,
                  {{"s_smallMoveTolRow", random.Chance(4) ? -1 : random.Range(0, reach)},
                   {"s_smallMoveTolCol", random.Chance(4) ? -1 : random.Range(0, reach)},
                   {"s_boundWidth", oddBounds ? random.Range(-2, size.width + 2) : bound},
                   {"s_boundHeight", oddBounds ? random.Range(-2, size.height + 2) : bound},
                   {"s_diffThresholdTol", RandomThreshold(random, 0, random.Chance(50) ? 6 : 60)},
                   {"s_overlapAreaMinNoMove",
                    RandomThreshold(random, -1,
                                    random.Chance(50) ? 30 : static_cast<int32_t>(size.Pixels()))},
                   {"s_downSampleFlag", random.Chance(10) ? 1 : 0}});
}

// test: number of the random sequence. Each outcome must come out.
void CompareNoMove(uint64_t test, int64_t cases, bool preProcessed) {
    int64_t outcomes[3] = {};
    WordClasses words;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const FrameSize size = random.Chance(60)
                                   ? FrameSize{random.Range(1, 24), random.Range(1, 24)}
                                   : RandomSize(random);
        words.NoteWidth(size.width);
        SetNoMoveParams(random, size);
        PairBytes pair = RandomPair(random, size);
        if (preProcessed)
            pair.currTypes = pair.prevTypes = FlatBytes(size, 1);
        TwinFrame prev(size, pair.prevGreys, pair.prevTypes);
        TwinFrame curr(size, pair.currGreys, pair.currTypes);
        const int32_t outcome = NoMove(&prev, &curr);
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
        ASSERT_GE(outcome, 0);
        ++outcomes[outcome];
    }
    for (const int64_t count : outcomes)
        EXPECT_GT(count, 0);
    words.ExpectAll();
}

TEST(StepFingerNoMove, RandomClassMapsGiveTheSameOutcome) {
    CompareNoMove(211, StepCases(30000), false);
}

TEST(StepFingerNoMove, WholeFramesGiveTheSameOutcome) {
    CompareNoMove(212, StepCases(20000), true);
}

// The tolerance is the pair's own difference, or one beside it: an early stop that is one too early
// or too late changes the outcome.
TEST(StepFingerNoMove, TolerancesAtTheVeryDifferenceGiveTheSameOutcome) {
    const int64_t cases = StepCases(30000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(213, i);
        FrameSize size = {random.Range(1, 12), random.Range(1, 12)};
        if (random.Chance(20))
            (random.Chance(50) ? size.width : size.height) = RandomEdge(random);
        const int32_t difference = random.Range(0, 255);
        const std::vector<uint8_t> prevGreys = FlatBytes(size, 0);
        std::vector<uint8_t> currGreys = FlatBytes(size, static_cast<uint8_t>(difference));
        for (int32_t n = random.Below(3); n > 0; --n) {
            uint8_t& grey =
                currGreys[static_cast<size_t>(random.Below(static_cast<int32_t>(size.Pixels())))];
            grey = static_cast<uint8_t>(std::clamp(grey + random.Range(-1, 1), 0, 255));
        }
        const int32_t bound = random.Range(0, std::min(size.width, size.height) / 2);
        SetStepParams(size, {{"s_smallMoveTolRow", random.Below(3)},
                             {"s_smallMoveTolCol", random.Below(3)},
                             {"s_boundWidth", bound},
                             {"s_boundHeight", bound},
                             {"s_diffThresholdTol", difference + random.Range(-1, 2)},
                             {"s_overlapAreaMinNoMove", random.Range(-1, 4)}});
        TwinFrame prev(size, prevGreys, FlatBytes(size, 1));
        TwinFrame curr{size, currGreys, RandomTypes(random, size)};
        NoMove(&prev, &curr);
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
}

TEST(StepFingerNoMove, EverySizeStaysInItsRoom) {
    SimRandom random = StepRandom(214, 0);
    for (int32_t width = 1; width <= 70; ++width) {
        for (const int32_t height : {1, 2, 15, 16, 17, 63, 64, 65}) {
            const FrameSize size = {width, height};
            SetStepParams(size, {{"s_boundWidth", width / 4},
                                 {"s_boundHeight", height / 4},
                                 {"s_diffThresholdTol", random.Range(1, 40)},
                                 {"s_overlapAreaMinNoMove", 1}});
            const PairBytes pair = RandomPair(random, size);
            TwinFrame prev(size, pair.prevGreys, pair.prevTypes);
            TwinFrame curr(size, pair.currGreys, pair.currTypes);
            NoMove(&prev, &curr);
            ASSERT_FALSE(::testing::Test::HasFailure()) << width << " x " << height;
        }
    }
}

TEST(StepFingerNoMove, DifferentSizesFailAlike) {
    SetStepParams(FrameSize{8, 8});
    for (const FrameSize size : {FrameSize{7, 8}, FrameSize{8, 7}, FrameSize{65, 8}}) {
        TwinFrame prev({8, 8}, FlatBytes({8, 8}, 0), FlatBytes({8, 8}, 1));
        TwinFrame curr(size, FlatBytes(size, 0), FlatBytes(size, 1));
        EXPECT_EQ(NoMove(&prev, &curr), fpnavi::kNoMoveFailed);
        EXPECT_EQ(NoMove(&curr, &prev), fpnavi::kNoMoveFailed);
    }
}

}  // namespace
}  // namespace fpnavi_test
