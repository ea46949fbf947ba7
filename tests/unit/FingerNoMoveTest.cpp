// The no-move test: the least mean grey difference of two frames over all small shifts.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "Fixtures.h"
#include "motion/FingerNoMove.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class FingerNoMoveTest : public NaviTest {
  protected:
    // A 56 x 36 window of the noise plane, all of it finger.
    static std::vector<uint8_t> Window(int32_t row, int32_t column) {
        return NoisePatch(100 + row, 100 + column, 36, 56);
    }
};

TEST_F(FingerNoMoveTest, IdenticalFramesRest) {
    Params().Apply();
    TestFrame prev(56, Window(0, 0), 1);
    TestFrame curr(56, Window(0, 0), 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveResting);
}

TEST_F(FingerNoMoveTest, IdenticalFramesHaveMoveForATolerantThresholdOfZero) {
    // The least difference, 0, is not below 0.
    Params().Set("s_diffThresholdTol", 0).Apply();
    TestFrame prev(56, Window(0, 0), 1);
    TestFrame curr(56, Window(0, 0), 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveMoved);
}

TEST_F(FingerNoMoveTest, ShiftByOneRowRests) {
    Params().Set("s_diffThresholdTol", 1).Apply();
    TestFrame prev(56, Window(0, 0), 1);
    TestFrame up(56, Window(1, 0), 1);
    TestFrame down(56, Window(-1, 0), 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), up.Get()), kNoMoveResting);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), down.Get()), kNoMoveResting);
}

TEST_F(FingerNoMoveTest, EveryShiftWithinTheTolerancesRestsAndTheNextDoesNot) {
    Params().Set("s_diffThresholdTol", 1).Set("s_smallMoveTolRow", 1).Apply();
    TestFrame prev(56, Window(0, 0), 1);
    for (int32_t row = -2; row <= 2; ++row) {
        for (int32_t column = -3; column <= 3; ++column) {
            TestFrame curr(56, Window(row, column), 1);
            const bool inside = row >= -1 && row <= 1 && column >= -2 && column <= 2;
            EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()),
                      inside ? kNoMoveResting : kNoMoveMoved)
                << row << ", " << column;
        }
    }
}

TEST_F(FingerNoMoveTest, LeastDifferenceAtTheThresholdIsAMove) {
    Params().Set("s_diffThresholdTol", 30).Apply();
    TestFrame prev(56, 36, 100, 1);
    TestFrame at(56, 36, 130, 1);
    TestFrame below(56, 36, 129, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), at.Get()), kNoMoveMoved);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), below.Get()), kNoMoveResting);
    EXPECT_EQ(fpnavi::FingerNoMove(at.Get(), prev.Get()), kNoMoveMoved);
}

TEST_F(FingerNoMoveTest, LargestDifferenceIsAMoveAndNotUndetermined) {
    Params().Apply();
    TestFrame prev(56, 36, 0, 1);
    TestFrame curr(56, 36, 255, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveMoved);
}

TEST_F(FingerNoMoveTest, TooFewCommonFingerPixelsAreUndetermined) {
    Params().Set("s_overlapAreaMinNoMove", 100).Apply();
    TestFrame prev(56, 36, 50);
    prev.Mark(12, 20, 9, 11);  // 99 pixels of the centre
    TestFrame curr(56, 36, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
    EXPECT_EQ(fpnavi::FingerNoMove(curr.Get(), prev.Get()), kNoMoveUndetermined);
}

TEST_F(FingerNoMoveTest, ExactlyTheLeastOverlapCounts) {
    Params().Set("s_overlapAreaMinNoMove", 100).Apply();
    TestFrame prev(56, 36, 50);
    prev.Mark(12, 20, 10, 10);
    TestFrame curr(56, 36, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveResting);
}

TEST_F(FingerNoMoveTest, OnlyClassOneIsFinger) {
    Params().Apply();
    TestFrame prev(56, 36, 50, 1);
    TestFrame gap(56, 36, 50, 255);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), gap.Get()), kNoMoveUndetermined);
}

TEST_F(FingerNoMoveTest, CornersAreNeverCompared) {
    Params().Apply();
    TestFrame prev(56, 36, 50);
    for (const int32_t row : {0, 28}) {
        for (const int32_t column : {0, 48})
            prev.Mark(row, column, 8, 8);
    }
    TestFrame curr(56, 36, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
}

TEST_F(FingerNoMoveTest, MeanIsTakenOverAllBlocksOfAShift) {
    // Bands differ by 255, the centre by 0. At the shift (2, 2) the bands compare 2 * 38 * 6 +
    // 2 * 6 * 18 = 672 pixels and the centre 38 * 18 = 684: 672 * 255 / 1356 = 126.4, the least of
    // all (without shift 960 * 255 / 1760 = 139).
    TestFrame prev(56, 36, 0, 1);
    TestFrame curr(56, 36, 255, 1);
    curr.Paint(8, 8, 20, 40, 0);
    Params().Set("s_diffThresholdTol", 126).Apply();
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveMoved);
    Params().Set("s_diffThresholdTol", 127).Apply();
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveResting);
}

TEST_F(FingerNoMoveTest, FramesOfDifferentSizesFail) {
    Params().Apply();
    TestFrame frame(56, 36, 50, 1);
    TestFrame wide(57, 36, 50, 1);
    TestFrame high(56, 37, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(frame.Get(), wide.Get()), kNoMoveFailed);
    EXPECT_EQ(fpnavi::FingerNoMove(frame.Get(), high.Get()), kNoMoveFailed);
}

TEST_F(FingerNoMoveTest, FramesWithoutPixelsFail) {
    Params().Apply();
    TestFrame frame(56, 36, 50, 1);
    for (int defect = 0; defect < 2; ++defect) {
        TestFrame bad(56, 36, 50, 1);
        if (defect == 0)
            bad->pData = nullptr;
        else
            bad->pType = nullptr;
        EXPECT_EQ(fpnavi::FingerNoMove(frame.Get(), bad.Get()), kNoMoveFailed);
        EXPECT_EQ(fpnavi::FingerNoMove(bad.Get(), frame.Get()), kNoMoveFailed);
    }
    TestFrame flatA(56, 36, 50, 1);
    TestFrame flatB(56, 36, 50, 1);
    flatA->height = flatB->height = 0;
    EXPECT_EQ(fpnavi::FingerNoMove(flatA.Get(), flatB.Get()), kNoMoveFailed);
}

TEST_F(FingerNoMoveTest, VanishingBandsAreSkipped) {
    // 56 = 2 * 28 and 36 = 2 * 18: no centre, no bands but their corners.
    Params().Set("s_boundWidth", 28).Set("s_boundHeight", 18).Apply();
    TestFrame prev(56, 36, 50, 1);
    TestFrame curr(56, 36, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
    Params().Set("s_boundWidth", 30).Set("s_boundHeight", 20).Apply();
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
}

TEST_F(FingerNoMoveTest, WithoutBandsTheCentreIsTheWholeFrame) {
    Params()
        .Set("s_boundWidth", 0)
        .Set("s_boundHeight", 0)
        .Set("s_overlapAreaMinNoMove", 2016)
        .Apply();
    TestFrame prev(56, 36, 50, 1);
    TestFrame curr(56, 36, 50, 1);
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveResting);
}

TEST_F(FingerNoMoveTest, ShiftWithoutOneCommonPixelNeverCounts) {
    for (const int32_t least : {0, -1}) {
        Params().Set("s_overlapAreaMinNoMove", least).Apply();
        TestFrame prev(56, 36, 50);
        TestFrame curr(56, 36, 50);
        EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
    }
}

TEST_F(FingerNoMoveTest, NegativeTolerancesTryNoShift) {
    for (const char* const name : {"s_smallMoveTolRow", "s_smallMoveTolCol"}) {
        for (const int32_t tolerance : {-1, std::numeric_limits<int32_t>::min()}) {
            Params().Set(name, tolerance).Apply();
            TestFrame prev(56, 36, 50, 1);
            TestFrame curr(56, 36, 50, 1);
            EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveUndetermined);
        }
    }
}

TEST_F(FingerNoMoveTest, AnyBoundSizeStaysInsideTheFrame) {
    constexpr int32_t kMax = std::numeric_limits<int32_t>::max();
    TestFrame prev(56, 36, 50, 1);
    TestFrame curr(56, 36, 50, 1);
    for (const int32_t width : {-kMax - 1, -100, -1, 0, 1, 56, 57, 1000, kMax}) {
        for (const int32_t height : {-kMax - 1, -100, -1, 0, 1, 36, 37, 1000, kMax}) {
            Params().Set("s_boundWidth", width).Set("s_boundHeight", height).Apply();
            const int32_t outcome = fpnavi::FingerNoMove(prev.Get(), curr.Get());
            EXPECT_TRUE(outcome >= kNoMoveFailed && outcome <= kNoMoveUndetermined)
                << width << ", " << height;
        }
    }
}

// Equal frames, of which one common pixel would be enough for rest.
TEST_F(FingerNoMoveTest, BandsThatDoNotLieInTheFrameCompareNothing) {
    TestFrame prev(56, 36, 50, 1);
    TestFrame curr(56, 36, 50, 1);
    for (const int32_t width : {-1, 0, 8, 56, 57}) {
        for (const int32_t height : {-1, 0, 8, 36, 37}) {
            Params()
                .Set("s_boundWidth", width)
                .Set("s_boundHeight", height)
                .Set("s_overlapAreaMinNoMove", 1)
                .Apply();
            // Borders of a whole side leave no centre to meet the borders of the other axis.
            const bool columns = width == 0 || width == 8;
            const bool rows = height == 0 || height == 8;
            const bool some = (columns && (rows || height == 36)) || (rows && width == 56);
            EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()),
                      some ? kNoMoveResting : kNoMoveUndetermined)
                << width << ", " << height;
        }
    }
}

// 255 * 8421504 = 2^31 - 128 is the largest sum of black against white that 32 bits hold. With one
// pixel more it wraps to a negative one, whose mean is below every tolerance.
TEST_F(FingerNoMoveTest, SumAbove31BitsWrapsToRest) {
    Params()
        .Set("s_boundWidth", 0)
        .Set("s_boundHeight", 0)
        .Set("s_smallMoveTolRow", 0)
        .Set("s_smallMoveTolCol", 0)
        .Set("s_diffThresholdTol", 0)
        .Apply();
    TestFrame prev(4096, 2057, 0, 1);
    TestFrame curr(4096, 2057, 255);
    curr.Mark(0, 0, 2056, 4096).Mark(2056, 0, 1, 128);  // 8421376 + 128 pixels
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveMoved);
    curr.Type(2056, 128) = 1;
    EXPECT_EQ(fpnavi::FingerNoMove(prev.Get(), curr.Get()), kNoMoveResting);
}

}  // namespace
