// The fp vote just at its limits, with displacements whose lengths lie between two integers.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "param/NaviParam.h"
#include "vote/Voting.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class FpVoteEdge : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        if (s_doubleScanFlag == 1)
            GTEST_SKIP() << "the double scan of an earlier test replaces the centroid";
    }
    // One pair of which only the centroid moved; its match is too bad to count.
    static void RecordCentroid(int32_t dx, int32_t dy) {
        FpNaviClear();
        NaviVoteInfo_t* const record = PrintNaviLog();
        record->calc_cnt = 1;
        record->dx_ct[0] = dx;
        record->dy_ct[0] = dy;
        record->diff[0] = 255;
    }
};

TEST_F(FpVoteEdge, LengthJustBelowTheLeastMoveScoresNothing) {
    Params().Set("s_minDelta", 129).Apply();
    // 128^2 + 16^2 = 16640; 129^2 = 16641. In hundredths 12899 is below 12900.
    RecordCentroid(128, 16);
    EXPECT_EQ(Voting_fp_mode(), VKEY_NONE) << "four scores of 0";
    RecordCentroid(129, 0);
    EXPECT_EQ(Voting_fp_mode(), VKEY_RIGHT);
}

TEST_F(FpVoteEdge, MatchWhoseLengthWrapsToZeroFailsTheVote) {
    // 10000 * 16384^2 = 625 * 2^32: nothing is left of it in 32 bits.
    Params().Set("s_minDelta", 0).Apply();
    RecordCentroid(1, 0);
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->diff[0] = 0;
    record->dx_fp[0] = 16384;
    EXPECT_EQ(Voting_fp_mode(), -1);
    record->dx_fp[0] = 16385;
    EXPECT_EQ(Voting_fp_mode(), VKEY_RIGHT);
}

TEST_F(FpVoteEdge, MovesOfOnePixelScoreForTheirDirection) {
    Params().Set("s_minDelta", 1).Apply();
    struct Move {
        int32_t dx;
        int32_t dy;
        int32_t key;
    };
    // Ten pairs make a way of 10, more than the 8 that a key takes.
    for (const Move& move :
         {Move{0, 1, VKEY_UP}, {0, -1, VKEY_DOWN}, {1, 0, VKEY_RIGHT}, {-1, 0, VKEY_LEFT}}) {
        FpNaviClear();
        NaviVoteInfo_t* const record = PrintNaviLog();
        record->calc_cnt = 10;
        for (int32_t i = 0; i < 10; ++i) {
            record->dx_fp[i] = move.dx;
            record->dy_fp[i] = move.dy;
        }
        EXPECT_EQ(Voting_fp_mode(), move.key);
    }
}

}  // namespace
