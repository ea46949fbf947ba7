// The smallest displacements that template matching can tell, and their keys; frames and tiles that
// it refuses.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
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

class ImgJointFrames : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Params().Set("s_multiBloclkFlag", 0).Set("s_candidateNum", 1).Apply();
    }
    // The match and its verification refuse the pair, and write nothing.
    static void ExpectRefused() {
        int32_t found[3] = {-99, -99, -99};
        const int32_t zero = 0;
        EXPECT_EQ(FindMatch(&zero, &zero, &found[0], &found[1], &found[2]), -1);
        for (const int32_t value : found)
            EXPECT_EQ(value, -99);
        NaviVoteInfo_t* const record = PrintNaviLog();
        record->diff[0] = 99;
        EXPECT_EQ(CalcImgJoint(), -1);
        EXPECT_EQ(record->diff[0], 99);
    }
};

TEST_F(ImgJointFrames, OneFrameAloneIsRefused) {
    TestFrame frame(56, 36, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    ExpectRefused();
    ImgClear(&s_imagePrev);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    ExpectRefused();
}

TEST_F(ImgJointFrames, FramesOfDifferentSizesAreRefused) {
    TestFrame frame(56, 36, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    TestFrame wider(57, 36, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imageCurr, wider.Get()), 0);
    ExpectRefused();
    TestFrame higher(56, 37, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imageCurr, higher.Get()), 0);
    ExpectRefused();
}

// Equal frames, so that every pixel that is compared gives 0. Each defect leaves the other
// conditions of an axis true; full images have sides of at most 4096.
TEST_F(ImgJointFrames, TilesThatDoNotMakeUpASideMeetNowhere) {
    struct Tiles {
        int32_t bound, center, gap, score;
    };
    const std::vector<Tiles> wide = {
        {8, 40, 32, 0},    {0, 56, 0, 0},      {28, 0, 1, 0},         {-1, 58, 32, 255},
        {29, -2, 32, 255}, {8, 40, -1, 255},   {8, 39, 32, 255},      {8, 41, 0, 255},
        {8, 40, 2020, 0},  {8, 40, 2021, 255}, {8, 40, 1 << 30, 255}, {INT32_MAX, 40, 32, 255}};
    const std::vector<Tiles> high = {
        {8, 20, 16, 0},    {0, 36, 0, 0},      {18, 0, 1, 0},         {-1, 38, 16, 255},
        {19, -2, 16, 255}, {8, 20, -1, 255},   {8, 19, 16, 255},      {8, 21, 0, 255},
        {8, 20, 2030, 0},  {8, 20, 2031, 255}, {8, 20, 1 << 30, 255}, {INT32_MAX, 20, 16, 255}};
    TestFrame frame(56, 36, 10, 1);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    for (const Tiles& w : wide) {
        for (const Tiles& h : high) {
            Params params;
            params.Set("s_candidateNum", 1).Set("s_overlapAreaMinFp", 0);
            params.Set("s_boundWidth", w.bound).Set("s_centerWidth", w.center);
            params.Set("s_boundHeight", h.bound).Set("s_centerHeight", h.center);
            params.Set("s_gapWidth", w.gap).Set("s_gapHeight", h.gap).Apply();
            const int32_t zero = 0;
            int32_t dx = -99;
            int32_t dy = -99;
            int32_t score = -99;
            EXPECT_EQ(FindMatch(&zero, &zero, &dx, &dy, &score), 0);
            EXPECT_EQ(score, std::max(w.score, h.score))
                << w.bound << ", " << w.center << ", " << w.gap << " and " << h.bound << ", "
                << h.center << ", " << h.gap;
        }
    }
}

}  // namespace
