// What a resting pair leaves in an entry of the record that is not empty.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"

namespace {

using namespace fpnavi_test;

class DriverEdge : public NaviTest {};

TEST_F(DriverEdge, RestingPairOverwritesTheMatchOfItsEntry) {
    Params().Apply();
    const std::vector<uint8_t> frame = NoisePatch(0, 0, 36, 56);
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    NaviVoteInfo_t* const record = PrintNaviLog();
    record->dx_fp[0] = 99;
    record->dy_fp[0] = 99;
    ASSERT_EQ(OrientationCalc(frame.data(), frame.data(), 0), 0);
    ASSERT_EQ(record->calc_cnt, 1);
    EXPECT_EQ(record->vkey_fp[0], VKEY_NO_MOVE);
    EXPECT_EQ(record->dx_fp[0], 0);
    EXPECT_EQ(record->dy_fp[0], 0);
}

}  // namespace
