// The hg vote: centroid verdicts and total centroid travel.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "vote/Voting.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

struct Point {
    int32_t x;
    int32_t y;
};

class HgVote : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        m_params.Set("s_modeFlag", 1);
    }
    // Votes over pairs with these verdicts, the centroid going from first to last.
    int32_t Vote(Point first, Point last, const std::vector<int32_t>& verdicts) {
        m_params.Apply();
        FpNaviClear();
        NaviVoteInfo_t* record = PrintNaviLog();
        record->calc_cnt = static_cast<int32_t>(verdicts.size());
        for (size_t i = 0; i < verdicts.size(); ++i)
            record->vkey_ct[i] = verdicts[i];
        record->xc[0] = first.x;
        record->yc[0] = first.y;
        record->xc[verdicts.size()] = last.x;
        record->yc[verdicts.size()] = last.y;
        return Voting_hg_mode();
    }
    Params m_params;
};

TEST_F(HgVote, EmptyRecordIsNoMove) {
    EXPECT_EQ(Vote({5, 5}, {5, 5}, {}), VKEY_NO_MOVE);
}

TEST_F(HgVote, NoMovingVerdictIsNoMove) {
    EXPECT_EQ(Vote({-20, 0}, {20, 0}, {VKEY_NO_MOVE, VKEY_NONE}), VKEY_NO_MOVE);
}

TEST_F(HgVote, TravelIsStoredInTheRecord) {
    Vote({-3, 10}, {9, 4}, {VKEY_RIGHT});
    EXPECT_EQ(PrintNaviLog()->dx_sum, 12);
    EXPECT_EQ(PrintNaviLog()->dy_sum, -6);
    Vote({1, 2}, {8, 2}, {});
    EXPECT_EQ(PrintNaviLog()->dx_sum, 0) << "an empty record travels from entry 0 to entry 0";
}

TEST_F(HgVote, DominantAxisNeedsAFifthMore) {
    EXPECT_EQ(Vote({1, 1}, {11, 10}, {VKEY_RIGHT}), VKEY_NO_MOVE);  // 1000 < 1080
    EXPECT_EQ(Vote({1, 1}, {13, 11}, {VKEY_RIGHT}), VKEY_RIGHT);    // 1200 >= 1200
    EXPECT_EQ(Vote({1, 1}, {11, 13}, {VKEY_UP}), VKEY_UP);
}

TEST_F(HgVote, EqualTravelIsRefused) {
    EXPECT_EQ(Vote({1, 1}, {21, 21}, {VKEY_RIGHT}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({1, 1}, {21, 21}, {VKEY_UP}), VKEY_NO_MOVE);
}

TEST_F(HgVote, NoTravelTakesTheVerticalBranchAndFailsTheTotal) {
    EXPECT_EQ(Vote({5, 5}, {5, 5}, {VKEY_UP}), VKEY_NO_MOVE);
    m_params.Set("s_totalMoveThreshold", 0);
    EXPECT_EQ(Vote({5, 5}, {5, 5}, {VKEY_UP}), VKEY_UP) << "the vertical branch";
    EXPECT_EQ(Vote({5, 5}, {5, 5}, {VKEY_RIGHT}), VKEY_NO_MOVE);
}

TEST_F(HgVote, TotalTravelMustReachTheThreshold) {
    EXPECT_EQ(Vote({1, 0}, {8, 0}, {VKEY_RIGHT}), VKEY_NO_MOVE);  // 7
    EXPECT_EQ(Vote({1, 0}, {9, 0}, {VKEY_RIGHT}), VKEY_RIGHT);    // 8
    EXPECT_EQ(Vote({0, 1}, {0, 8}, {VKEY_UP}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({0, 1}, {0, 9}, {VKEY_UP}), VKEY_UP);
}

TEST_F(HgVote, OneMovingVerdictIsEnoughByDefault) {
    EXPECT_EQ(Vote({5, 0}, {15, 0}, {VKEY_RIGHT}), VKEY_RIGHT);
    EXPECT_EQ(Vote({15, 0}, {5, 0}, {VKEY_LEFT}), VKEY_LEFT);
    EXPECT_EQ(Vote({0, 5}, {0, 15}, {VKEY_UP}), VKEY_UP);
    EXPECT_EQ(Vote({0, 15}, {0, 5}, {VKEY_DOWN}), VKEY_DOWN);
    EXPECT_EQ(Vote({5, 0}, {15, 0}, {VKEY_NO_MOVE, VKEY_NO_MOVE, VKEY_RIGHT}), VKEY_RIGHT);
}

TEST_F(HgVote, OppositeVerdictRefusesTheKey) {
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {VKEY_RIGHT, VKEY_RIGHT, VKEY_LEFT}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({0, 1}, {0, 13}, {VKEY_UP, VKEY_UP, VKEY_DOWN}), VKEY_NO_MOVE);
}

TEST_F(HgVote, CrossingTheCentreOverrulesTheCounts) {
    EXPECT_EQ(Vote({-3, 1}, {9, 2}, {VKEY_RIGHT, VKEY_RIGHT, VKEY_LEFT}), VKEY_RIGHT);
    EXPECT_EQ(Vote({9, 1}, {-3, 2}, {VKEY_RIGHT, VKEY_RIGHT, VKEY_LEFT}), VKEY_LEFT);
    EXPECT_EQ(Vote({1, -3}, {2, 9}, {VKEY_DOWN, VKEY_LEFT}), VKEY_UP);
    EXPECT_EQ(Vote({1, 9}, {2, -3}, {VKEY_UP}), VKEY_DOWN);
}

TEST_F(HgVote, StartAtTheCentreIsNoCrossing) {
    EXPECT_EQ(Vote({0, 0}, {12, 0}, {VKEY_RIGHT, VKEY_LEFT}), VKEY_NO_MOVE);
}

TEST_F(HgVote, DirectionMustOutnumberBothOfTheOtherAxis) {
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {VKEY_RIGHT, VKEY_UP}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {VKEY_RIGHT, VKEY_DOWN}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {VKEY_RIGHT, VKEY_RIGHT, VKEY_UP, VKEY_DOWN}), VKEY_RIGHT);
    EXPECT_EQ(Vote({0, 13}, {0, 1}, {VKEY_DOWN, VKEY_LEFT}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({0, 13}, {0, 1}, {VKEY_DOWN, VKEY_DOWN, VKEY_LEFT, VKEY_RIGHT}), VKEY_DOWN);
}

TEST_F(HgVote, VerdictsAgainstTheTravelStillChooseTheirDirection) {
    // The counts name the key, the travel only its axis.
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {VKEY_LEFT}), VKEY_LEFT);
    EXPECT_EQ(Vote({0, 1}, {0, 13}, {VKEY_DOWN}), VKEY_DOWN);
}

TEST_F(HgVote, CountRuleBelowTheSufficientCount) {
    m_params.Set("s_moveCntEffThr", 5).Set("s_moveCntMinThr", 2);
    const int32_t r = VKEY_RIGHT;
    const int32_t n = VKEY_NO_MOVE;
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {r, r, r, n, n}), VKEY_RIGHT);       // 2 < 3 and 3 > 2
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {r, r, n}), VKEY_NO_MOVE);           // 2 is not > 2
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {r, r, r, n, n, n}), VKEY_NO_MOVE);  // 3 is not < 3
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {r, r, r, r, r, n, n, n, n, n, n}), VKEY_RIGHT);  // 5 >= 5
}

TEST_F(HgVote, CountRuleHoldsForBothSensesOfAnAxis) {
    m_params.Set("s_moveCntEffThr", 5).Set("s_moveCntMinThr", 2);
    const int32_t l = VKEY_LEFT;
    const int32_t d = VKEY_DOWN;
    EXPECT_EQ(Vote({13, 0}, {1, 0}, {l, l, l}), VKEY_LEFT);
    EXPECT_EQ(Vote({13, 0}, {1, 0}, {l, l}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({0, 13}, {0, 1}, {d, d, d}), VKEY_DOWN);
    EXPECT_EQ(Vote({0, 13}, {0, 1}, {d, d}), VKEY_NO_MOVE);
}

TEST_F(HgVote, UndecidedVerdictsAreNotCounted) {
    m_params.Set("s_moveCntEffThr", 5);
    const int32_t r = VKEY_RIGHT;
    EXPECT_EQ(Vote({1, 0}, {13, 0}, {r, r, r, VKEY_NONE, VKEY_NONE, VKEY_NONE, 77}), VKEY_RIGHT);
}

RC_GTEST_FIXTURE_PROP(HgVote, NeverNoneNorMinusOneAndTwiceTheSame, ()) {
    const auto percent = rc::gen::inRange(-50, 51);
    const auto verdicts = *rc::gen::resize(
        20, rc::gen::container<std::vector<int32_t>>(rc::gen::inRange<int32_t>(0, 6)));
    m_params.Set("s_moveCntEffThr", *rc::gen::inRange(0, 5));
    const Point first = {*percent, *percent};
    const Point last = {*percent, *percent};
    const int32_t key = Vote(first, last, verdicts);
    RC_ASSERT(key >= VKEY_UP && key <= VKEY_NO_MOVE);
    RC_ASSERT(Voting_hg_mode() == key);
}

TEST_F(HgVote, NumbersThatAreNoKeysAreNotCounted) {
    for (const int32_t number : {-1, 6}) {
        EXPECT_EQ(Vote({1, 1}, {21, 1}, {number}), VKEY_NO_MOVE) << number;
        EXPECT_EQ(Vote({1, 1}, {21, 1}, {VKEY_RIGHT, number, number}), VKEY_RIGHT) << number;
    }
}

}  // namespace
