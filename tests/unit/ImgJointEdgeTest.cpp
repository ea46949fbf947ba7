// The smallest displacements that template matching can tell, and their keys.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "matching/MatchSearch.h"
#include "matching/PairMatch.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class ImgJointEdge : public NaviTest {
  protected:
    // The key of a finger that moved by dx to the right and dy upwards.
    static int32_t Key(int32_t dx, int32_t dy) {
        TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
        TestFrame curr(56, NoisePatch(100 + dy, 100 - dx, 36, 56), 1);
        EXPECT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        EXPECT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
        EXPECT_EQ(CalcImgJoint(), 0);
        const NaviVoteInfo_t* const record = PrintNaviLog();
        EXPECT_EQ(record->dx_fp[0], dx);
        EXPECT_EQ(record->dy_fp[0], dy);
        return record->vkey_fp[0];
    }
};

TEST_F(ImgJointEdge, OnePixelGivesItsDirectionWhereOneIsEnough) {
    Params().Set("s_multiBloclkFlag", 0).Set("s_singleMoveThreshold", 1).Apply();
    EXPECT_EQ(Key(1, 0), VKEY_RIGHT);
    EXPECT_EQ(Key(-1, 0), VKEY_LEFT);
    EXPECT_EQ(Key(0, 1), VKEY_UP);
    EXPECT_EQ(Key(0, -1), VKEY_DOWN);
}

TEST_F(ImgJointEdge, MoveOfAsManyPixelsAsTheSensorHasIsAHundredPercent) {
    Params params;
    params.Set("s_multiBloclkFlag", 0).Set("s_dimensionlessFlag", 1);
    params.Set("s_sensorWidth", 5).Set("s_sensorHeight", 4).Apply();
    TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
    TestFrame curr(56, NoisePatch(104, 95, 36, 56), 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
    ASSERT_EQ(CalcImgJoint(), 0);
    EXPECT_EQ(PrintNaviLog()->dx_fp[0], 100);
    EXPECT_EQ(PrintNaviLog()->dy_fp[0], 100);
}

TEST_F(ImgJointEdge, PlacementsOfTheGreatestDifferenceThatIsKeptAreCandidates) {
    // Black against 254 everywhere. The only candidate is the first placement, (8, 8), of template
    // 0, which is cut at (8, 23): 0 rows, -15 columns. 41 x 36 pixels overlap there.
    Params().Set("s_multiBloclkFlag", 0).Set("s_candidateNum", 1).Apply();
    TestFrame prev(56, 36, 254, 1);
    TestFrame curr(56, 36, 0, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
    ASSERT_EQ(CalcImgJoint(), 0);
    const NaviVoteInfo_t* const record = PrintNaviLog();
    EXPECT_EQ(record->dx_fp[0], 15);
    EXPECT_EQ(record->dy_fp[0], 0);
    EXPECT_EQ(record->diff[0], 254);
    EXPECT_EQ(record->vkey_fp[0], VKEY_NONE);
}

}  // namespace
