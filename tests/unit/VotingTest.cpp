// The dispatcher: when a vote is due, which rule votes, what orientation and direction control make
// of the result, and the final line.
#include <gtest/gtest.h>
#include <unistd.h>

#include <cstring>
#include <vector>

#include "Fixtures.h"
#include "LogCapture.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class VotingEntry : public NaviTest {
  protected:
    static Params Hg() { return Params().Set("s_modeFlag", 1); }
    // A record that the hg vote answers with this key.
    static void HgRecord(int32_t key) {
        FpNaviClear();
        NaviVoteInfo_t* record = PrintNaviLog();
        record->calc_cnt = 1;
        record->vkey_ct[0] = key;
        const int32_t travel = key == VKEY_LEFT || key == VKEY_DOWN ? -10 : 10;
        int32_t* axis = key == VKEY_LEFT || key == VKEY_RIGHT ? record->xc : record->yc;
        axis[0] = 15;
        axis[1] = 15 + travel;
    }
    // The final key of an hg gesture of this key.
    static int32_t FinalKey(const Params& params, int32_t key) {
        params.Apply();
        HgRecord(key);
        return Voting(1);
    }
};

TEST_F(VotingEntry, NotDueBeforeTheFingerHasLeft) {
    Hg().Set("s_logShowFlag", 1).Apply();
    HgRecord(VKEY_RIGHT);
    LogCapture log;
    for (const int32_t timeOut : {0, 2, -1})
        EXPECT_EQ(Voting(timeOut), -1) << timeOut;
    EXPECT_TRUE(log.Lines().empty());
    EXPECT_EQ(PrintNaviLog()->dx_sum, 0) << "nothing is written";
}

TEST_F(VotingEntry, TimeOutVotesAtAnyTime) {
    EXPECT_EQ(FinalKey(Hg(), VKEY_RIGHT), VKEY_RIGHT);
    EXPECT_EQ(FinalKey(Hg(), VKEY_LEFT), VKEY_LEFT);
    EXPECT_EQ(FinalKey(Hg(), VKEY_UP), VKEY_UP);
    EXPECT_EQ(FinalKey(Hg(), VKEY_DOWN), VKEY_DOWN);
}

TEST_F(VotingEntry, LiftVotesWithoutTimeOut) {
    if (s_doubleScanFlag == 1)
        GTEST_SKIP() << "the double scan of an earlier test decides about the finger";
    Hg().Apply();
    HgRecord(VKEY_UP);
    const std::vector<uint8_t> white(1920, 255);
    ASSERT_EQ(vmk_fp_navigation_detect_finger_status(white.data()), 0);
    EXPECT_EQ(Voting(0), VKEY_UP);
}

TEST_F(VotingEntry, ModeOneAloneTakesTheHgRule) {
    // The fp rule sees no displacement in this record.
    EXPECT_EQ(FinalKey(Params().Set("s_modeFlag", 0), VKEY_UP), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(Params().Set("s_modeFlag", 3), VKEY_UP), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(Hg(), VKEY_UP), VKEY_UP);
}

TEST_F(VotingEntry, BackMountedSensorExchangesLeftAndRight) {
    const Params params = Hg().Set("s_sensorBackFlag", 1);
    EXPECT_EQ(FinalKey(params, VKEY_RIGHT), VKEY_LEFT);
    EXPECT_EQ(FinalKey(params, VKEY_LEFT), VKEY_RIGHT);
    EXPECT_EQ(FinalKey(params, VKEY_UP), VKEY_UP);
    EXPECT_EQ(FinalKey(params, VKEY_DOWN), VKEY_DOWN);
    EXPECT_EQ(FinalKey(params, VKEY_NO_MOVE), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(Hg().Set("s_sensorBackFlag", 2), VKEY_RIGHT), VKEY_RIGHT);
}

TEST_F(VotingEntry, DirectionControlZeroAnswersNoMoveAlways) {
    const Params params = Hg().Set("s_directionControlFlag", 0);
    for (const int32_t key : {VKEY_UP, VKEY_DOWN, VKEY_RIGHT, VKEY_LEFT, VKEY_NO_MOVE})
        EXPECT_EQ(FinalKey(params, key), VKEY_NO_MOVE);
}

TEST_F(VotingEntry, DirectionControlZeroMapsEvenAnAbandonedVote) {
    // A motionless pair with a least delta of 0 abandons the fp vote.
    Params params = Params().Set("s_minDelta", 0);
    params.Apply();
    PrintNaviLog()->calc_cnt = 1;
    EXPECT_EQ(Voting(1), -1);
    params.Set("s_directionControlFlag", 0).Apply();
    EXPECT_EQ(Voting(1), VKEY_NO_MOVE);
    for (const int32_t flag : {1, 2, 3}) {
        params.Set("s_directionControlFlag", flag).Apply();
        EXPECT_EQ(Voting(1), -1) << flag;
    }
}

TEST_F(VotingEntry, DirectionControlOneLetsVerticalKeysPass) {
    const Params params = Hg().Set("s_directionControlFlag", 1);
    EXPECT_EQ(FinalKey(params, VKEY_UP), VKEY_UP);
    EXPECT_EQ(FinalKey(params, VKEY_DOWN), VKEY_DOWN);
    EXPECT_EQ(FinalKey(params, VKEY_RIGHT), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(params, VKEY_LEFT), VKEY_NO_MOVE);
}

TEST_F(VotingEntry, DirectionControlTwoLetsHorizontalKeysPass) {
    const Params params = Hg().Set("s_directionControlFlag", 2);
    EXPECT_EQ(FinalKey(params, VKEY_UP), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(params, VKEY_DOWN), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(params, VKEY_RIGHT), VKEY_RIGHT);
    EXPECT_EQ(FinalKey(params, VKEY_LEFT), VKEY_LEFT);
    EXPECT_EQ(
        FinalKey(Hg().Set("s_directionControlFlag", 2).Set("s_sensorBackFlag", 1), VKEY_RIGHT),
        VKEY_LEFT);
}

TEST_F(VotingEntry, OtherDirectionControlsLetAllPass) {
    for (const int32_t flag : {3, 4, -1}) {
        const Params params = Hg().Set("s_directionControlFlag", flag);
        EXPECT_EQ(FinalKey(params, VKEY_UP), VKEY_UP);
        EXPECT_EQ(FinalKey(params, VKEY_LEFT), VKEY_LEFT);
    }
}

TEST_F(VotingEntry, HorizontalStrokeOnTheBackUnderVerticalControlIsNoMove) {
    const Params params = Hg().Set("s_sensorBackFlag", 1).Set("s_directionControlFlag", 1);
    EXPECT_EQ(FinalKey(params, VKEY_RIGHT), VKEY_NO_MOVE);
    EXPECT_EQ(FinalKey(params, VKEY_LEFT), VKEY_NO_MOVE);
}

TEST_F(VotingEntry, FinalValueIsLogged) {
    Hg().Set("s_logShowFlag", 1).Set("s_sensorBackFlag", 1).Apply();
    HgRecord(VKEY_RIGHT);
    LogCapture log;
    ASSERT_EQ(Voting(1), VKEY_LEFT);
    ASSERT_EQ(log.Lines().size(), 1U) << "the hg rule writes no block";
    const LogLine& line = log.Lines()[0];
    EXPECT_EQ(line.format,
              "%-15s:%04d:pid=%d:ctid=%d => TQCODE -- TARQEN_FP_NAVI -- Voting - FINAL VKEY VALUE "
              "= %d!!\n");
    EXPECT_EQ(line.function, "Voting");
    EXPECT_EQ(line.line, 498);
    EXPECT_EQ(line.priority, 4);
    EXPECT_EQ(line.tag, "TQCODE");
    EXPECT_EQ(line.pid, getpid());
    EXPECT_EQ(line.tid, gettid());
    EXPECT_EQ(line.values, std::vector<int32_t>{VKEY_LEFT});
}

TEST_F(VotingEntry, AbandonedVoteIsLoggedAsMinusOne) {
    Params().Set("s_minDelta", 0).Set("s_logShowFlag", 1).Apply();
    PrintNaviLog()->calc_cnt = 1;
    LogCapture log;
    ASSERT_EQ(Voting(1), -1);
    EXPECT_EQ(log.Lines().back().line, 498);
    EXPECT_EQ(log.Lines().back().values, std::vector<int32_t>{-1});
}

TEST_F(VotingEntry, SecondCallVotesAgainOverTheSameRecord) {
    Hg().Apply();
    HgRecord(VKEY_DOWN);
    ASSERT_EQ(Voting(1), VKEY_DOWN);
    const NaviVoteInfo_t after = *PrintNaviLog();
    EXPECT_EQ(after.calc_cnt, 1);
    EXPECT_EQ(Voting(1), VKEY_DOWN);
    EXPECT_EQ(std::memcmp(PrintNaviLog(), &after, sizeof(after)), 0);
    EXPECT_EQ(Voting(0), -1) << "voting changes no flag";
}

TEST_F(VotingEntry, FullRecordVotes) {
    Hg().Apply();
    NaviVoteInfo_t* record = PrintNaviLog();
    record->calc_cnt = 99;
    for (int32_t& verdict : record->vkey_ct)
        verdict = VKEY_RIGHT;
    record->xc[0] = 1;
    record->xc[99] = 40;
    EXPECT_EQ(Voting(1), VKEY_RIGHT);
    EXPECT_EQ(record->dx_sum, 39);
}

}  // namespace
