// The centroid method: measuring one frame, comparing two measured frames.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "motion/CenterMove.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class CenterAndCoverage : public NaviTest {};

TEST_F(CenterAndCoverage, FrameWithoutFingerMeasuresZero) {
    TestFrame frame(10, 10);
    frame->xc = frame->yc = frame->cvr = 9;
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, 0);
    EXPECT_EQ(frame->yc, 0);
    EXPECT_EQ(frame->cvr, 0);
}

TEST_F(CenterAndCoverage, SinglePixelInTheCorner) {
    TestFrame frame(10, 10);
    frame.Type(0, 0) = 1;
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, -45);  // 50 / 10 - 50
    EXPECT_EQ(frame->yc, 45);   // 50 - 50 / 10
    EXPECT_EQ(frame->cvr, 1);   // 100 / 100
}

TEST_F(CenterAndCoverage, RightAndUpArePositive) {
    TestFrame frame(10, 20);
    frame.Type(19, 9) = 1;
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, 45);   // 950 / 10 - 50
    EXPECT_EQ(frame->yc, -47);  // 50 - 1950 / 20 = 50 - 97
    EXPECT_EQ(frame->cvr, 0);   // 100 / 200
}

TEST_F(CenterAndCoverage, FullFrameIsCentredAndCovered) {
    TestFrame frame(56, 36, 0, 1);
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, 0);
    EXPECT_EQ(frame->yc, 0);
    EXPECT_EQ(frame->cvr, 100);
}

TEST_F(CenterAndCoverage, SumsOfLargeFramesDoNotOverflow) {
    // The sum of the columns alone is 1024^2 * 51200 > 2^32.
    TestFrame frame(1024, 1024, 0, 1);
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, 0);
    EXPECT_EQ(frame->yc, 0);
    EXPECT_EQ(frame->cvr, 100);
}

TEST_F(CenterAndCoverage, OnlyClassOneCounts) {
    TestFrame frame(10, 10, 0, 255);
    frame.Mark(5, 5, 2, 2, 2);
    frame.Type(0, 0) = 1;
    ASSERT_EQ(GetCenterAndCoverage(frame.Get()), 0);
    EXPECT_EQ(frame->xc, -45);
    EXPECT_EQ(frame->cvr, 1);
}

TEST_F(CenterAndCoverage, RefusesAFrameWithoutPixelsAndLeavesItAlone) {
    EXPECT_EQ(GetCenterAndCoverage(nullptr), -1);
    TestFrame frame(4, 4, 0, 1);
    frame->xc = frame->yc = frame->cvr = 9;
    const NaviFrame_t good = *frame.Get();
    for (int defect = 0; defect < 4; ++defect) {
        *frame.Get() = good;
        if (defect == 0)
            frame->pType = nullptr;
        if (defect == 1)
            frame->pData = nullptr;
        if (defect == 2)
            frame->width = 0;
        if (defect == 3)
            frame->height = -4;
        EXPECT_EQ(GetCenterAndCoverage(frame.Get()), -1) << defect;
        EXPECT_EQ(frame->xc, 9);
        EXPECT_EQ(frame->yc, 9);
        EXPECT_EQ(frame->cvr, 9);
    }
}

struct Move {
    int32_t dx;
    int32_t dy;
    int32_t vkey;
    bool operator==(const Move& other) const {
        return dx == other.dx && dy == other.dy && vkey == other.vkey;
    }
};

std::ostream& operator<<(std::ostream& out, const Move& move) {
    return out << move.dx << ", " << move.dy << ", key " << move.vkey;
}

class CenterMove : public NaviTest {
  protected:
    // In percent, so that dx and dy are the centroid difference.
    void SetUp() override {
        NaviTest::SetUp();
        m_params.Set("s_dimensionlessFlag", 1);
    }
    // Entry 3 after a pair whose centroid moves by dx, dy percent.
    Move PairMove(int32_t dx, int32_t dy, int32_t cvrPrev = 60, int32_t cvrCurr = 60) {
        m_params.Apply();
        NaviFrame_t prev{};
        NaviFrame_t curr{};
        prev.xc = -3;
        prev.yc = 4;
        prev.cvr = cvrPrev;
        curr.xc = -3 + dx;
        curr.yc = 4 + dy;
        curr.cvr = cvrCurr;
        m_record = NaviVoteInfo_t{};
        m_record.calc_cnt = 3;
        EXPECT_EQ(CalcCenterMove(&prev, &curr, &m_record), 0);
        return {m_record.dx_ct[3], m_record.dy_ct[3], m_record.vkey_ct[3]};
    }
    Params m_params;
    NaviVoteInfo_t m_record{};
};

TEST_F(CenterMove, HorizontalMoveAtTheThresholdIsRight) {
    EXPECT_EQ(PairMove(2, 0), (Move{2, 0, VKEY_RIGHT}));
    EXPECT_EQ(PairMove(-2, 0), (Move{-2, 0, VKEY_LEFT}));
}

TEST_F(CenterMove, VerticalMoveAtTheThresholdIsDown) {
    EXPECT_EQ(PairMove(0, -2), (Move{0, -2, VKEY_DOWN}));
    EXPECT_EQ(PairMove(0, 2), (Move{0, 2, VKEY_UP}));
}

TEST_F(CenterMove, DiagonalMoveHasNoVerdict) {
    EXPECT_EQ(PairMove(5, 5), (Move{5, 5, VKEY_NONE}));
    EXPECT_EQ(PairMove(-5, 5), (Move{-5, 5, VKEY_NONE}));
    EXPECT_EQ(PairMove(11, 10), (Move{11, 10, VKEY_NONE}));  // 1100 < 1200
}

TEST_F(CenterMove, DominanceByExactlyAFifthSuffices) {
    EXPECT_EQ(PairMove(6, 5), (Move{6, 5, VKEY_RIGHT}));  // 600 >= 600
    EXPECT_EQ(PairMove(-6, 5), (Move{-6, 5, VKEY_LEFT}));
    EXPECT_EQ(PairMove(5, 6), (Move{5, 6, VKEY_UP}));
    EXPECT_EQ(PairMove(5, -6), (Move{5, -6, VKEY_DOWN}));
}

TEST_F(CenterMove, SmallMoveUnderFullCoverageAbstains) {
    EXPECT_EQ(PairMove(1, 1, 95, 95), (Move{1, 1, VKEY_NONE}));
    EXPECT_EQ(PairMove(1, 1, 90, 90), (Move{1, 1, VKEY_NONE}));
}

TEST_F(CenterMove, SmallMoveWithOneLowerCoverageIsNoMove) {
    EXPECT_EQ(PairMove(1, 1, 95, 89), (Move{1, 1, VKEY_NO_MOVE}));
    EXPECT_EQ(PairMove(1, 1, 89, 95), (Move{1, 1, VKEY_NO_MOVE}));
}

TEST_F(CenterMove, PixelsAreScaledBeforeTheyAreTruncatedTowardZero) {
    m_params.Set("s_dimensionlessFlag", 0);
    // 56 x 36: -9 * 56 / 100 = -5.04, 3 * 36 / 100 = 1.08
    EXPECT_EQ(PairMove(-9, 3), (Move{-5, 1, VKEY_LEFT}));
    // -5 * 36 / 100 = -1.8 is small: -1
    EXPECT_EQ(PairMove(0, -5), (Move{0, -1, VKEY_NO_MOVE}));
    // 6 * 36 / 100 = 2.16
    EXPECT_EQ(PairMove(0, 6), (Move{0, 2, VKEY_UP}));
}

TEST_F(CenterMove, OnlyDimensionlessFlagZeroScales) {
    m_params.Set("s_dimensionlessFlag", 2);
    EXPECT_EQ(PairMove(10, 0), (Move{10, 0, VKEY_RIGHT}));
}

TEST_F(CenterMove, CoverageChangeNeverOverridesInFpMode) {
    EXPECT_EQ(PairMove(2, 0, 10, 90), (Move{2, 0, VKEY_RIGHT}));
    EXPECT_EQ(PairMove(0, -2, 90, 10), (Move{0, -2, VKEY_DOWN}));
}

TEST_F(CenterMove, HgCoverageChangeBeyondTheLimitIsADeformation) {
    m_params.Set("s_modeFlag", 1);
    EXPECT_EQ(PairMove(4, 0, 40, 56), (Move{0, 0, VKEY_NO_MOVE}));   // 16 / 4 = 4 > 3
    EXPECT_EQ(PairMove(4, 0, 56, 40), (Move{0, 0, VKEY_NO_MOVE}));   // |-4|
    EXPECT_EQ(PairMove(-4, 1, 40, 56), (Move{0, 0, VKEY_NO_MOVE}));  // |-4|
    EXPECT_EQ(PairMove(0, 4, 40, 56), (Move{0, 0, VKEY_NO_MOVE}));
    EXPECT_EQ(PairMove(1, -4, 40, 56), (Move{0, 0, VKEY_NO_MOVE}));
}

TEST_F(CenterMove, HgCoverageChangeAtTheLimitIsNone) {
    m_params.Set("s_modeFlag", 1);
    EXPECT_EQ(PairMove(4, 0, 40, 52), (Move{4, 0, VKEY_RIGHT}));   // 12 / 4 = 3
    EXPECT_EQ(PairMove(4, 0, 40, 55), (Move{4, 0, VKEY_RIGHT}));   // 15 / 4 = 3, truncated
    EXPECT_EQ(PairMove(0, -4, 40, 55), (Move{0, -4, VKEY_DOWN}));  // -3
    EXPECT_EQ(PairMove(0, 4, 40, 55), (Move{0, 4, VKEY_UP}));
}

TEST_F(CenterMove, HgDiagonalIsNotTestedForDeformation) {
    m_params.Set("s_modeFlag", 1);
    EXPECT_EQ(PairMove(5, 5, 10, 90), (Move{5, 5, VKEY_NONE}));
}

TEST_F(CenterMove, ZeroDisplacementIsNoDeformation) {
    // A threshold below 1 lets a pair without displacement reach the quotient.
    for (const int32_t threshold : {0, -1}) {
        m_params.Set("s_modeFlag", 1).Set("s_singleMoveThreshold", threshold);
        EXPECT_EQ(PairMove(0, 0, 10, 90), (Move{0, 0, VKEY_LEFT}));
    }
}

TEST_F(CenterMove, CentroidsOfTheRecordAreLeftToTheDriver) {
    PairMove(6, 0);
    EXPECT_EQ(m_record.xc[3], 0);
    EXPECT_EQ(m_record.xc[4], 0);
    EXPECT_EQ(m_record.cvr[3], 0);
    EXPECT_EQ(m_record.calc_cnt, 3);
}

}  // namespace
