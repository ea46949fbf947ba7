// The steps on one frame or pair of frames at every size where a row needs another step of sixteen
// or another word: 15, 16, 17, 63, 64, 65, 127, 128, 129 in both axes.
#include <gtest/gtest.h>

#include <algorithm>

#include "StepFrames.h"
#include "StepSizes.h"
#include "StepTestPair.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

// Calls compare(random, size) for each size, rounds times by default.
template <typename Compare>
void AtEveryEdge(uint64_t test, int64_t rounds, Compare compare) {
    const std::vector<FrameSize> sizes = EdgeSizes();
    const int64_t cases = StepCases(rounds * static_cast<int64_t>(sizes.size()));
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const FrameSize size = sizes[static_cast<size_t>(i) % sizes.size()];
        compare(random, size);
        ASSERT_FALSE(::testing::Test::HasFailure())
            << "case " << i << ", " << size.width << " x " << size.height;
    }
}

TEST(StepEdges, ThresholdIsTheSame) {
    AtEveryEdge(151, 8, [](SimRandom& random, FrameSize size) {
        TwinFrame twin{size, RandomGreys(random, size), FlatBytes(size, 0)};
        int32_t module[2] = {-1, -1};
        int32_t plain[2] = {-2, -2};
        ASSERT_EQ(fpnavi::CalcBiThr(twin.Module(), &module[0], &module[1]), 0);
        ASSERT_EQ(reference::CalcBiThr(twin.Plain(), &plain[0], &plain[1]), 0);
        ASSERT_EQ(module[0], plain[0]);
        ASSERT_EQ(module[1], plain[1]);
    });
}

// Few and many dark pixels.
TEST(StepEdges, FingerAreaIsTheSame) {
    AtEveryEdge(152, 24, [](SimRandom& random, FrameSize size) {
        std::vector<uint8_t> greys = RandomGreys(random, size);
        if (random.Chance(40)) {
            greys = FlatBytes(size, 200);
            for (int32_t n = random.Range(1, 6); n > 0; --n)
                greys[static_cast<size_t>(random.Below(static_cast<int32_t>(greys.size())))] = 0;
        }
        TwinFrame twin{size, greys, RandomTypes(random, size)};
        const int32_t thr = RandomThreshold(random, 0, 255);
        fpnavi::GetFingerRidge(twin.Module(), thr);
        reference::GetFingerRidge(twin.Plain(), thr);
        ASSERT_TRUE(twin.Same()) << "threshold " << thr;
    });
}

TEST(StepEdges, StretchedGreysAreTheSame) {
    AtEveryEdge(153, 24, [](SimRandom& random, FrameSize size) {
        SetStepParams({8, 8}, {{"s_cutOffPercent", random.Range(0, 30)}});
        const uint8_t scale = static_cast<uint8_t>(random.Chance(50) ? 255 : random.Below(256));
        TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::StretchRange(twin.Module(), scale), 0);
        ASSERT_EQ(reference::StretchRange(twin.Plain(), scale), 0);
        ASSERT_TRUE(twin.Same()) << "scale " << int32_t{scale};
    });
}

TEST(StepEdges, PreProcessedFramesAreTheSame) {
    AtEveryEdge(154, 12, [](SimRandom& random, FrameSize size) {
        SetStepParams(size, {{"s_cutOffPercent", random.Range(0, 12)}});
        TwinFrame twin{size, RandomGreys(random, size), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::ImgPreProcess(twin.Module()), 0);
        ASSERT_EQ(reference::ImgPreProcess(twin.Plain()), 0);
        ASSERT_TRUE(twin.Same());
    });
}

TEST(StepEdges, CentroidAndCoverageAreTheSame) {
    AtEveryEdge(155, 40, [](SimRandom& random, FrameSize size) {
        TwinFrame twin{size, FlatBytes(size, 0), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::GetCenterAndCoverage(twin.Module()), 0);
        ASSERT_EQ(reference::GetCenterAndCoverage(twin.Plain()), 0);
        ASSERT_TRUE(twin.Same());
    });
}

// Borders of every length up to more than half the side, edges among them.
TEST(StepEdges, NoMoveOutcomeIsTheSame) {
    AtEveryEdge(156, 24, [](SimRandom& random, FrameSize size) {
        const int32_t most = random.Chance(25) ? 0 : 1;  // half the side, or all of it
        SetStepParams(size, {{"s_smallMoveTolRow", random.Below(3)},
                             {"s_smallMoveTolCol", random.Below(3)},
                             {"s_boundWidth", RandomLength(random, size.width >> most)},
                             {"s_boundHeight", RandomLength(random, size.height >> most)},
                             {"s_diffThresholdTol", random.Range(0, 30)},
                             {"s_overlapAreaMinNoMove", random.Range(0, 60)}});
        PairBytes pair = RandomPair(random, size);
        if (random.Chance(30))
            pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
        TwinFrame prev{size, pair.prevGreys, pair.prevTypes};
        TwinFrame curr{size, pair.currGreys, pair.currTypes};
        NoMove(&prev, &curr);
    });
}

TEST(StepEdges, FullImagesAreTheSame) {
    ::NaviFrame_t module = {};
    reference::NaviFrame_t plain = {};
    AtEveryEdge(157, 12, [&](SimRandom& random, FrameSize size) {
        const int32_t boundWidth = RandomLength(random, size.width / 2);
        const int32_t boundHeight = RandomLength(random, size.height / 2);
        SetStepParams(size, {{"s_boundWidth", boundWidth},
                             {"s_boundHeight", boundHeight},
                             {"s_centerWidth", size.width - 2 * boundWidth},
                             {"s_centerHeight", size.height - 2 * boundHeight},
                             {"s_gapWidth", RandomLength(random, 20)},
                             {"s_gapHeight", RandomLength(random, 20)}});
        TwinFrame source{size, RandomGreys(random, size), RandomTypes(random, size)};
        ASSERT_EQ(fpnavi::GetFullImg(source.Module(), &module), 0);
        ASSERT_EQ(reference::GetFullImg(source.Plain(), &plain), 0);
        ASSERT_TRUE(source.Same());
        ASSERT_TRUE(SameFrame(module, plain));
    });
    fpnavi::ImgClear(&module);
    reference::ImgClear(&plain);
}

}  // namespace
}  // namespace fpnavi_test
