// The fp vote: sums, scores, the none, no-move and movement tests, the choice, long press, and the
// vote-information lines. The double scan's share stands in DoubleScanModeTest.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "LogCapture.h"
#include "param/NaviParam.h"
#include "vote/Voting.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

// One pair of the record.
struct Pair {
    int32_t dxCt = 0;
    int32_t dyCt = 0;
    int32_t dxFp = 0;
    int32_t dyFp = 0;
    int32_t diff = 0;
    int32_t vkeyFp = VKEY_NONE;
};

Pair Both(int32_t dx, int32_t dy) {
    return {dx, dy, dx, dy, 0, VKEY_NONE};
}
Pair CtOnly(int32_t dx, int32_t dy) {
    return {dx, dy, 0, 0, 255, VKEY_NONE};
}
Pair FpOnly(int32_t dx, int32_t dy, int32_t diff = 0) {
    return {0, 0, dx, dy, diff, VKEY_NONE};
}
Pair Resting(int32_t dx = 0, int32_t dy = 0) {
    return {dx, dy, dx, dy, 0, VKEY_NO_MOVE};
}

class FpVote : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        if (s_doubleScanFlag == 1)
            GTEST_SKIP() << "the double scan of an earlier test replaces the centroid";
    }
    static void Record(const std::vector<Pair>& pairs) {
        FpNaviClear();
        NaviVoteInfo_t* record = PrintNaviLog();
        record->calc_cnt = static_cast<int32_t>(pairs.size());
        for (size_t i = 0; i < pairs.size(); ++i) {
            record->dx_ct[i] = pairs[i].dxCt;
            record->dy_ct[i] = pairs[i].dyCt;
            record->dx_fp[i] = pairs[i].dxFp;
            record->dy_fp[i] = pairs[i].dyFp;
            record->diff[i] = pairs[i].diff;
            record->vkey_fp[i] = pairs[i].vkeyFp;
        }
    }
    int32_t Vote(const std::vector<Pair>& pairs) {
        m_params.Apply();
        Record(pairs);
        return Voting_fp_mode();
    }
    Params m_params;
};

TEST_F(FpVote, EmptyRecordIsNoMove) {
    EXPECT_EQ(Vote({}), VKEY_NO_MOVE);
}

TEST_F(FpVote, ClearMovesGiveTheirKeys) {
    EXPECT_EQ(Vote({Both(0, 10)}), VKEY_UP);
    EXPECT_EQ(Vote({Both(0, -10)}), VKEY_DOWN);
    EXPECT_EQ(Vote({Both(10, 0)}), VKEY_RIGHT);
    EXPECT_EQ(Vote({Both(-10, 0)}), VKEY_LEFT);
}

TEST_F(FpVote, TinyCentroidTravelWithoutTrustedMatchesIsNone) {
    const std::vector<Pair> pairs = {{1, 0, 30, 0, 31, VKEY_NONE}, {1, 0, 30, 0, 40, VKEY_NONE}};
    EXPECT_EQ(Vote(pairs), VKEY_NONE);
    m_params.Set("s_open_vkey_none_navi", 0);
    EXPECT_EQ(Vote(pairs), VKEY_NO_MOVE) << "2 + 0 is not above 8";
}

TEST_F(FpVote, NoneNeedsLessThanItsThresholdAndMoreThanNothing) {
    EXPECT_EQ(Vote({CtOnly(2, 0)}), VKEY_NONE);
    EXPECT_EQ(Vote({CtOnly(3, 0)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({CtOnly(0, 0)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({{2, 0, 1, 0, 0, VKEY_NONE}}), VKEY_NO_MOVE) << "a trusted match travelled";
}

TEST_F(FpVote, TinyCentroidTravelWithARestingPairIsNoMove) {
    EXPECT_EQ(Vote({CtOnly(2, 0), Resting()}), VKEY_NO_MOVE);
}

TEST_F(FpVote, MoveWhoseSharesWrapToNothingAbandonsTheVote) {
    // (2^28 - 1)^2 + 1 = 2 - 2^29, times 10000 is 20000, both modulo 2^32: a length of 141. The
    // components add up to 10000 * 2^28 = 625 * 2^32, which is 0.
    m_params.Set("s_minDelta", 1);
    EXPECT_EQ(Vote({FpOnly((1 << 28) - 1, 1)}), -1);
}

TEST_F(FpVote, NotMovedLimitsAreInclusive) {
    EXPECT_EQ(Vote({{10, 0, 9, 0, 0, VKEY_NONE}, Resting()}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({{10, 0, 10, 0, 0, VKEY_NONE}, Resting()}), VKEY_RIGHT);
    EXPECT_EQ(Vote({{11, 0, 9, 0, 0, VKEY_NONE}, Resting()}), VKEY_RIGHT);
}

TEST_F(FpVote, NotMovedTestNeedsARestingPair) {
    EXPECT_EQ(Vote({{10, 0, 9, 0, 0, VKEY_NONE}}), VKEY_RIGHT);
}

TEST_F(FpVote, SumOfTheDistancesMustExceedTheTotalThreshold) {
    EXPECT_EQ(Vote({CtOnly(8, 0)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({CtOnly(9, 0)}), VKEY_RIGHT);
    EXPECT_EQ(Vote({Both(4, 0)}), VKEY_NO_MOVE);  // 4 + 4
    EXPECT_EQ(Vote({Both(5, 0)}), VKEY_RIGHT);
}

TEST_F(FpVote, VerticalControlNeedsTwoPairsThatDoNotRest) {
    const std::vector<Pair> pairs = {Resting(), Both(0, 20)};
    EXPECT_EQ(Vote(pairs), VKEY_UP);
    m_params.Set("s_directionControlFlag", 1);
    EXPECT_EQ(Vote(pairs), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({Both(0, 20)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({Resting(), Both(0, 10), Both(0, 10)}), VKEY_UP);
}

TEST_F(FpVote, TieOfUpAndRightIsRight) {
    // 50 percent each by the match, 80 / 100 of it: up 40, right 40. 10 * sqrt(2) = 14 > 8.
    EXPECT_EQ(Vote({FpOnly(10, 10)}), VKEY_RIGHT);
}

TEST_F(FpVote, LaterKeysWinTies) {
    EXPECT_EQ(Vote({FpOnly(10, -10)}), VKEY_RIGHT) << "right over down";
    EXPECT_EQ(Vote({FpOnly(-10, 10)}), VKEY_LEFT) << "left over up";
    // Up 100, down 100: the sums leave 0 and 20 - 5 = 15 upwards.
    EXPECT_EQ(Vote({FpOnly(0, 20), FpOnly(0, -5)}), VKEY_DOWN) << "down over up";
    EXPECT_EQ(Vote({FpOnly(20, 0), FpOnly(-5, 0)}), VKEY_LEFT) << "left over right";
}

TEST_F(FpVote, FourScoresOfZeroAreNoneOrLeft) {
    // Lengths of 3 score nothing; the sums, 9 and 9, exceed 8.
    const std::vector<Pair> pairs = {Both(3, 0), Both(3, 0), Both(3, 0)};
    EXPECT_EQ(Vote(pairs), VKEY_NONE);
    m_params.Set("s_open_vkey_none_navi", 0);
    EXPECT_EQ(Vote(pairs), VKEY_LEFT);
}

TEST_F(FpVote, DiagonalPairGivesFiftyToEachOfItsDirections) {
    // Opposite diagonals make all four scores equal; the sums, 15 and 15, exceed 8.
    const std::vector<Pair> pairs = {Both(20, 20), Both(-5, -5)};
    EXPECT_EQ(Vote(pairs), VKEY_NONE);
    m_params.Set("s_open_vkey_none_navi", 0);
    EXPECT_EQ(Vote(pairs), VKEY_LEFT);
    // Up 50 + 50 + 100, right 50 + 50; then up 50 + 100, right 50 + 50, down 50.
    EXPECT_EQ(Vote({FpOnly(10, 10), FpOnly(10, 10), FpOnly(0, 10)}), VKEY_UP);
    EXPECT_EQ(Vote({FpOnly(10, 10), FpOnly(10, -10), FpOnly(0, 10)}), VKEY_UP);
}

TEST_F(FpVote, SharesAreTruncatedPercentages) {
    // (4, 2): 33 up, 66 right. Three of them give up 99, right 198. One pair straight up brings up
    // to 199; untruncated shares, 100 and 200, would tie and go to the right.
    m_params.Set("s_fpImp", 100).Set("s_ctImp", 0);
    EXPECT_EQ(Vote({FpOnly(4, 2), FpOnly(4, 2), FpOnly(4, 2), FpOnly(0, 10)}), VKEY_UP);
}

TEST_F(FpVote, RestingPairAddsToTheSumsButNotToTheScores) {
    // Sums 20 and 20 pass every test; the scores are all 0. With scores it would be RIGHT, without
    // sums NO_MOVE.
    EXPECT_EQ(Vote({Resting(20, 0), Both(0, 0)}), VKEY_NONE);
    EXPECT_EQ(Vote({Resting(0, 20), Both(0, 0)}), VKEY_NONE) << "vertical alike";
}

TEST_F(FpVote, LeastDeltaIsInclusive) {
    m_params.Set("s_totalMoveThreshold", 0);
    EXPECT_EQ(Vote({CtOnly(4, 0)}), VKEY_RIGHT);
    EXPECT_EQ(Vote({CtOnly(0, 0), FpOnly(0, 4)}), VKEY_UP);
    EXPECT_EQ(Vote({CtOnly(3, 2)}), VKEY_NONE) << "sqrt(13) = 3.6: no score";
}

TEST_F(FpVote, MatchCountsUpToTheStrictThreshold) {
    EXPECT_EQ(Vote({FpOnly(20, 0, 30)}), VKEY_RIGHT);
    EXPECT_EQ(Vote({FpOnly(20, 0, 31)}), VKEY_NO_MOVE);
}

TEST_F(FpVote, WeightsMixTheMethods) {
    const std::vector<Pair> pairs = {{20, 0, 0, 20, 0, VKEY_NONE}};
    EXPECT_EQ(Vote(pairs), VKEY_UP) << "match 80, centroid 20";
    m_params.Set("s_fpImp", 20).Set("s_ctImp", 80);
    EXPECT_EQ(Vote(pairs), VKEY_RIGHT);
    m_params.Set("s_fpImp", 50).Set("s_ctImp", 50);
    EXPECT_EQ(Vote(pairs), VKEY_RIGHT) << "a tie";
}

TEST_F(FpVote, MotionlessPairAbandonsTheVoteUnderALeastDeltaOfZero) {
    for (const int32_t delta : {0, -3}) {
        m_params.Set("s_minDelta", delta);
        EXPECT_EQ(Vote({Both(0, 0)}), -1);
        EXPECT_EQ(Vote({Both(9, 0), CtOnly(0, 0)}), -1) << "a later pair, the centroid";
        EXPECT_EQ(Vote({CtOnly(9, 0)}), VKEY_RIGHT) << "an untrusted match is not scored";
        EXPECT_EQ(Vote({{9, 0, 0, 0, 0, VKEY_NONE}}), -1) << "the match";
        EXPECT_EQ(Vote({Both(12, 0), Resting()}), VKEY_RIGHT) << "a resting pair is not scored";
    }
}

TEST_F(FpVote, LongPressTurnsAKeyIntoNoMoveWhileTheFingerIsDown) {
    m_params.Set("s_totalMoveThresholdLongpressCt", 21).Set("s_totalMoveThresholdLongpressFp", 21);
    EXPECT_EQ(Vote({Both(0, 20)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({{0, 21, 0, 20, 0, VKEY_NONE}}), VKEY_UP) << "both must be below";
    EXPECT_EQ(Vote({{0, 20, 0, 21, 0, VKEY_NONE}}), VKEY_UP);
}

TEST_F(FpVote, LongPressDoesNotApplyOnceTheFingerHasLeft) {
    m_params.Set("s_totalMoveThresholdLongpressCt", 99).Set("s_totalMoveThresholdLongpressFp", 99);
    m_params.Apply();
    Record({Both(0, 20)});
    const std::vector<uint8_t> white(2016, 255);
    ASSERT_EQ(vmk_fp_navigation_detect_finger_status(white.data()), 0);
    EXPECT_EQ(Voting_fp_mode(), VKEY_UP);
}

TEST_F(FpVote, LongPressTurnsTheNoneOfEqualScoresIntoNoMoveButNotTheNoneOfTinyTravel) {
    m_params.Set("s_totalMoveThresholdLongpressCt", 99).Set("s_totalMoveThresholdLongpressFp", 99);
    EXPECT_EQ(Vote({Both(3, 0), Both(3, 0), Both(3, 0)}), VKEY_NO_MOVE);
    EXPECT_EQ(Vote({CtOnly(2, 0)}), VKEY_NONE);
}

TEST_F(FpVote, DefaultLongPressNeverFires) {
    EXPECT_EQ(Vote({Both(0, 5)}), VKEY_UP);
}

TEST_F(FpVote, WritesNothing) {
    Vote({Both(3, 7), Resting(), FpOnly(4, 4)});
    EXPECT_EQ(PrintNaviLog()->dx_sum, 0);
    EXPECT_EQ(PrintNaviLog()->dy_sum, 0);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 3);
    EXPECT_EQ(PrintNaviLog()->vkey_ct[0], 0);
}

RC_GTEST_FIXTURE_PROP(FpVote, AnyRecordGivesTheSameKeyOrMinusOneTwice, ()) {
    const auto pixels = rc::gen::inRange<int32_t>(-100, 101);
    const auto count = *rc::gen::inRange<size_t>(0, 20);
    std::vector<Pair> pairs;
    for (size_t i = 0; i < count; ++i)
        pairs.push_back({*pixels, *pixels, *pixels, *pixels, *rc::gen::inRange(0, 60),
                         *rc::gen::inRange<int32_t>(0, 6)});
    m_params.Set("s_minDelta", *rc::gen::inRange(-1, 6));
    const int32_t key = Vote(pairs);
    RC_ASSERT(key >= -1 && key <= VKEY_NO_MOVE);
    RC_ASSERT(Voting_fp_mode() == key);
}

TEST_F(FpVote, ExtremeEntriesOverflowNothing) {
    const int32_t most = INT32_MAX;
    const int32_t least = INT32_MIN;
    for (const int32_t x : {most, least, 46341, -46341, 463}) {
        for (const int32_t y : {most, least, 1}) {
            const int32_t key = Vote({Both(x, y), Both(y, x), CtOnly(x, x)});
            EXPECT_GE(key, -1);
            EXPECT_LE(key, VKEY_NO_MOVE);
        }
    }
}

// The block of lines: line number, message, and how many values stand behind its conversions.
struct Expected {
    int line;
    const char* message;
    std::vector<int32_t> values;
};

class FpVoteLog : public FpVote {
  protected:
    // Entries of an array that starts at base, 0 to 10.
    static std::vector<int32_t> Eleven(int32_t base) {
        std::vector<int32_t> values;
        values.reserve(11);
        for (int32_t k = 0; k < 11; ++k)
            values.push_back(base + k);
        return values;
    }
    static std::vector<int32_t> ElevenPairs(int32_t baseX, int32_t baseY) {
        std::vector<int32_t> values;
        values.reserve(11);
        for (int32_t k = 0; k < 11; ++k) {
            values.push_back(baseX + k);
            values.push_back(baseY + k);
        }
        return values;
    }
    // Every array entry k is its base + k, so each value tells where it comes from.
    static void NumberedRecord() {
        NaviVoteInfo_t* record = PrintNaviLog();
        for (int32_t k = 0; k < FPNAVI_VOTE_CAPACITY; ++k) {
            record->xc[k] = 1000 + k;
            record->yc[k] = 2000 + k;
            record->vkey_ct[k] = 3000 + k;
            record->dx_ct[k] = 4000 + k;
            record->dy_ct[k] = 5000 + k;
            record->xc_ds[k] = 6000 + k;
            record->yc_ds[k] = 7000 + k;
            record->dx_ds[k] = 8000 + k;
            record->dy_ds[k] = 9000 + k;
            record->vkey_fp[k] = 10000 + k;
            record->dx_fp[k] = 11000 + k;
            record->dy_fp[k] = 12000 + k;
            record->diff[k] = 13000 + k;
        }
        record->calc_cnt = 2;
    }
};

TEST_F(FpVoteLog, BlockShowsElevenEntriesWhateverTheCount) {
    const std::vector<Expected> block = {
        {508, "##################### Vote information ########################\n", {}},
        {510, "calculate count = %d\n", {2}},
        {512,
         "Initial and final centroid position are (%d, %d) and (%d, %d).\n",
         {1000, 2000, 1002, 2002}},
        {516, "Centroid method result array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
         Eleven(3000)},
        {521,
         "Centroid results (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) "
         "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d)}\n",
         ElevenPairs(4000, 5000)},
        {523,
         "Initial and final centroid position of hardware navigation are (%d, %d) and (%d, %d).\n",
         {6000, 7000, 6002, 7002}},
        {528,
         "Centroid results of hardware navigation (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) "
         "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d)}\n",
         ElevenPairs(8000, 9000)},
        {532, "Fingerprint match result array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
         Eleven(10000)},
        {537,
         "Fingerprint results (dx, dy) array are:\n {(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) "
         "(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) }\n",
         ElevenPairs(11000, 12000)},
        {541, "Fingerprint diff array are:\n %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n",
         Eleven(13000)}};

    m_params.Set("s_logShowFlag", 1).Apply();
    NumberedRecord();
    // The arrays of single values pass an eleventh value that no conversion prints.
    LogCapture log(" %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n", 1);
    Voting_fp_mode();
    ASSERT_EQ(log.Lines().size(), block.size());
    for (size_t i = 0; i < block.size(); ++i) {
        const LogLine& line = log.Lines()[i];
        EXPECT_EQ(line.line, block[i].line);
        EXPECT_EQ(line.message, block[i].message);
        EXPECT_EQ(line.values, block[i].values) << line.line;
        EXPECT_EQ(line.function, "Voting_fp_mode");
        EXPECT_EQ(line.priority, 4);
        EXPECT_EQ(line.tag, "TQCODE");
    }
}

TEST_F(FpVoteLog, EleventhSingleValueIsNotPrinted) {
    m_params.Set("s_logShowFlag", 1).Apply();
    NumberedRecord();
    LogCapture log;
    Voting_fp_mode();
    ASSERT_EQ(log.Lines().size(), 10U);
    EXPECT_NE(log.Lines()[9].text.find("13008, 13009\n"), std::string::npos);
    EXPECT_EQ(log.Lines()[9].text.find("13010"), std::string::npos);
}

TEST_F(FpVoteLog, BlockComesBeforeTheFinalValueOfVoting) {
    m_params.Set("s_logShowFlag", 1).Apply();
    LogCapture log;
    Voting(1);
    ASSERT_EQ(log.Lines().size(), 11U);
    EXPECT_EQ(log.Lines().front().line, 508);
    EXPECT_EQ(log.Lines().back().line, 498);
}

}  // namespace
