// The fp vote just at its limits, with displacements whose lengths lie between two integers.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "NaviParam.h"
#include "VotingFp.h"

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

}  // namespace
