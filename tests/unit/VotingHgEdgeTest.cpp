// The hg vote on centroids that no frame has, and on verdicts behind the last pair.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "vote/Voting.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class HgVoteEdge : public NaviTest {};

TEST_F(HgVoteEdge, PlacesWhoseProductWrapsBelowZeroCountAsACrossing) {
    // 46341 * 46342 = 2147534622, just above 2^31. Nothing but the crossing says which way.
    Params().Set("s_modeFlag", 1).Set("s_totalMoveThreshold", 1).Apply();
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->calc_cnt = 1;
    record->vkey_ct[0] = VKEY_UP;
    record->xc[0] = 46341;
    record->xc[1] = 46342;
    EXPECT_EQ(Voting_hg_mode(), VKEY_RIGHT);
    record->xc[0] = 46342;
    record->xc[1] = 46341;
    EXPECT_EQ(Voting_hg_mode(), VKEY_LEFT);
}

TEST_F(HgVoteEdge, CrossingWithoutAWayGivesTheNegativeKeyOfTheVerticalAxis) {
    // 46341^2 = 2147488281 wraps too; neither axis is longer than the other.
    Params().Set("s_modeFlag", 1).Set("s_totalMoveThreshold", 0).Apply();
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->calc_cnt = 1;
    record->vkey_ct[0] = VKEY_UP;
    record->yc[0] = 46341;
    record->yc[1] = 46341;
    EXPECT_EQ(Voting_hg_mode(), VKEY_DOWN);
}

TEST_F(HgVoteEdge, VerdictBehindTheLastPairIsNotCounted) {
    Params().Set("s_modeFlag", 1).Set("s_totalMoveThreshold", 1).Set("s_moveCntEffThr", 1).Apply();
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->calc_cnt = 1;
    record->xc[1] = 30;
    record->vkey_ct[0] = VKEY_NO_MOVE;
    record->vkey_ct[1] = VKEY_RIGHT;
    EXPECT_EQ(Voting_hg_mode(), VKEY_NO_MOVE);
    record->vkey_ct[0] = VKEY_RIGHT;
    EXPECT_EQ(Voting_hg_mode(), VKEY_RIGHT);
}

}  // namespace
