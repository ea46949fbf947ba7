// Template matching of a pair: verification of candidates, and the entry that the pair receives.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "matching/PairMatch.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

struct Match {
    int32_t dx;
    int32_t dy;
    int32_t diff;
    bool operator==(const Match& other) const {
        return dx == other.dx && dy == other.dy && diff == other.diff;
    }
};

std::ostream& operator<<(std::ostream& out, const Match& match) {
    return out << match.dx << ", " << match.dy << ", diff " << match.diff;
}

class FindMatchTest : public NaviTest {
  protected:
    // One contiguous window, and as many candidates as a test gives.
    static Params Plain(int32_t candidates) {
        return Params().Set("s_multiBloclkFlag", 0).Set("s_candidateNum", candidates);
    }
    static void Load(TestFrame& prev, TestFrame& curr) {
        ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
    }
    static Match Find(const std::vector<int32_t>& di, const std::vector<int32_t>& dj) {
        Match match{-99, -99, -99};
        EXPECT_EQ(FindMatch(di.data(), dj.data(), &match.dx, &match.dy, &match.diff), 0);
        return match;
    }
};

TEST_F(FindMatchTest, TooLittleOverlapScores255AndKeepsTheFirstCandidate) {
    Plain(2).Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    Load(prev, curr);
    EXPECT_EQ(Find({4, 0}, {-5, 0}), (Match{5, 4, 255}));
}

TEST_F(FindMatchTest, OverlapMustExceedTheLeastArea) {
    Plain(1).Set("s_overlapAreaMinFp", 200).Apply();
    TestFrame prev(56, 36, 10, 1);
    TestFrame curr(56, 36, 17);
    curr.Mark(0, 0, 10, 20);
    Load(prev, curr);
    EXPECT_EQ(Find({0}, {0}), (Match{0, 0, 255})) << "200 pixels";
    curr.Type(11, 0) = 1;
    Load(prev, curr);
    EXPECT_EQ(Find({0}, {0}), (Match{0, 0, 7})) << "201 pixels";
}

TEST_F(FindMatchTest, CandidateWithoutOneCommonPixelNeverCounts) {
    for (const int32_t least : {-1, 0}) {
        Plain(1).Set("s_overlapAreaMinFp", least).Apply();
        TestFrame prev(56, 36, 10);
        TestFrame curr(56, 36, 10);
        Load(prev, curr);
        EXPECT_EQ(Find({0}, {0}), (Match{0, 0, 255}));
    }
}

TEST_F(FindMatchTest, DisplacementBeyondTheFrameHasNoOverlap) {
    Plain(1).Set("s_overlapAreaMinFp", -1).Apply();
    TestFrame prev(56, 36, 10, 1);
    TestFrame curr(56, 36, 10, 1);
    Load(prev, curr);
    EXPECT_EQ(Find({36}, {0}).diff, 255);
    EXPECT_EQ(Find({-36}, {0}).diff, 255);
    EXPECT_EQ(Find({0}, {56}).diff, 255);
    EXPECT_EQ(Find({-100}, {-1000}).diff, 255) << "both negative extents do not make an area";
    EXPECT_EQ(Find({35}, {55}).diff, 0) << "one corner pixel";
    EXPECT_EQ(Find({-35}, {-55}).diff, 0);
}

TEST_F(FindMatchTest, OfEqualScoresTheEarlierCandidateStays) {
    Plain(3).Apply();
    TestFrame prev(56, 36, 10, 1);
    TestFrame curr(56, 36, 12, 1);
    Load(prev, curr);
    EXPECT_EQ(Find({0, 1, 0}, {1, 0, 0}), (Match{-1, 0, 2}));
}

TEST_F(FindMatchTest, BestCandidateWinsWhereverItStands) {
    Plain(3).Apply();
    // curr(r, c) = prev(r + 2, c - 3)
    TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
    TestFrame curr(56, NoisePatch(102, 97, 36, 56), 1);
    Load(prev, curr);
    EXPECT_EQ(Find({0, 2, 1}, {0, -3, 0}), (Match{3, 2, 0}));
}

TEST_F(FindMatchTest, MeanDifferenceIsTruncated) {
    Plain(1).Set("s_overlapAreaMinFp", 0).Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10, 1);
    prev.Mark(0, 0, 1, 2);
    prev.Grey(0, 0) = 15;
    Load(prev, curr);
    EXPECT_EQ(Find({0}, {0}), (Match{0, 0, 2}));  // 5 / 2
}

TEST_F(FindMatchTest, SignFollowsTheFrameOfMoreCoverage) {
    Plain(1).Apply();
    TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
    TestFrame curr(56, NoisePatch(102, 97, 36, 56), 1);
    // From the current frame (tie, or it covers less) its content lies at (+2, -3) in the previous
    // one; from the previous frame the other way round. Both are a move to the right and up.
    prev->cvr = curr->cvr = 60;
    Load(prev, curr);
    EXPECT_EQ(Find({2}, {-3}), (Match{3, 2, 0}));
    prev->cvr = 61;
    Load(prev, curr);
    EXPECT_EQ(Find({2}, {-3}), (Match{3, 2, 0}));
    prev->cvr = 59;
    Load(prev, curr);
    EXPECT_EQ(Find({-2}, {3}), (Match{3, 2, 0}));
}

TEST_F(FindMatchTest, GapPixelsNeverCount) {
    Params().Set("s_candidateNum", 1).Set("s_overlapAreaMinFp", 0).Apply();
    TestFrame frame(56, 36, 100, 1);
    Load(frame, frame);
    ASSERT_EQ(GetFullImg(&s_imagePrev, &s_fullImagePrev), 0);
    ASSERT_EQ(GetFullImg(&s_imageCurr, &s_fullImageCurr), 0);
    // Gaps are grey 0 and tiles 100: any gap pixel in the mean would show. Shifted by a gap, 4 rows
    // and 8 columns of tiles still meet tiles.
    EXPECT_EQ(Find({0}, {0}), (Match{0, 0, 0}));
    EXPECT_EQ(Find({16}, {32}), (Match{-32, 16, 0}));
}

TEST_F(FindMatchTest, ArraysStayTheCallers) {
    Plain(2).Apply();
    TestFrame frame(56, 36, 10, 1);
    Load(frame, frame);
    const std::vector<int32_t> di = {1, 2};
    FailingMalloc::Count();
    Match match{};
    const int32_t result = FindMatch(di.data(), di.data(), &match.dx, &match.dy, &match.diff);
    FailingMalloc::Off();
    EXPECT_EQ(result, 0);
    EXPECT_EQ(FailingMalloc::Frees(), 0);
    EXPECT_EQ(di, (std::vector<int32_t>{1, 2}));
}

struct Entry {
    int32_t dx;
    int32_t dy;
    int32_t diff;
    int32_t vkey;
    bool operator==(const Entry& other) const {
        return dx == other.dx && dy == other.dy && diff == other.diff && vkey == other.vkey;
    }
};

std::ostream& operator<<(std::ostream& out, const Entry& entry) {
    return out << entry.dx << ", " << entry.dy << ", diff " << entry.diff << ", key " << entry.vkey;
}

// The world as a sensor with the default gaps sees it: each pixel of the 56 x 36 frame stands for
// one of a 120 x 68 field.
std::vector<uint8_t> TiledWindow(int32_t row, int32_t column) {
    std::vector<uint8_t> greys;
    for (int32_t r = 0; r < 36; ++r) {
        for (int32_t c = 0; c < 56; ++c) {
            const int32_t gapRows = r < 8 ? 0 : (r < 28 ? 16 : 32);
            const int32_t gapColumns = c < 8 ? 0 : (c < 48 ? 32 : 64);
            greys.push_back(NoiseAt(row + r + gapRows, column + c + gapColumns));
        }
    }
    return greys;
}

class ImgJoint : public NaviTest {
  protected:
    static Params Plain() { return Params().Set("s_multiBloclkFlag", 0); }
    // The entry of a pair whose finger moved by dx to the right and dy upwards.
    static Entry Joint(const Params& params, int32_t dx, int32_t dy, int32_t cvrPrev = 60,
                       int32_t cvrCurr = 60) {
        params.Apply();
        const bool plain = s_multiBloclkFlag != 1;
        // A move to the right and up takes the window over the finger to the left and down.
        TestFrame prev(56, plain ? NoisePatch(100, 100, 36, 56) : TiledWindow(100, 100), 1);
        TestFrame curr(
            56, plain ? NoisePatch(100 + dy, 100 - dx, 36, 56) : TiledWindow(100 + dy, 100 - dx),
            1);
        prev->cvr = cvrPrev;
        curr->cvr = cvrCurr;
        EXPECT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        EXPECT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
        NaviVoteInfo_t* record = PrintNaviLog();
        record->calc_cnt = 2;
        EXPECT_EQ(CalcImgJoint(), 0);
        EXPECT_EQ(record->calc_cnt, 2) << "the driver counts";
        return {record->dx_fp[2], record->dy_fp[2], record->diff[2], record->vkey_fp[2]};
    }
};

TEST_F(ImgJoint, TrueDisplacementIsFoundInAllFourDirections) {
    EXPECT_EQ(Joint(Plain(), 4, 1), (Entry{4, 1, 0, VKEY_RIGHT}));
    EXPECT_EQ(Joint(Plain(), -4, 1), (Entry{-4, 1, 0, VKEY_LEFT}));
    EXPECT_EQ(Joint(Plain(), 1, 4), (Entry{1, 4, 0, VKEY_UP}));
    EXPECT_EQ(Joint(Plain(), 1, -4), (Entry{1, -4, 0, VKEY_DOWN}));
}

TEST_F(ImgJoint, TrueDisplacementIsFoundAcrossTheTilesOfTheMultiBlockLayout) {
    EXPECT_EQ(Joint(Params(), 5, 0), (Entry{5, 0, 0, VKEY_RIGHT}));
    EXPECT_EQ(Joint(Params(), -5, 2), (Entry{-5, 2, 0, VKEY_LEFT}));
    EXPECT_EQ(Joint(Params(), 0, 6), (Entry{0, 6, 0, VKEY_UP}));
    EXPECT_EQ(Joint(Params(), 2, -6), (Entry{2, -6, 0, VKEY_DOWN}));
}

TEST_F(ImgJoint, MovesOfMoreThanTheGapAreFoundByTheOuterTemplates) {
    // Template 4 (rows 2 to 7) found in the centre: 16 gap rows and more.
    EXPECT_EQ(Joint(Params(), 0, 25), (Entry{0, 25, 0, VKEY_UP}));
    EXPECT_EQ(Joint(Params(), 0, -25), (Entry{0, -25, 0, VKEY_DOWN}));
}

TEST_F(ImgJoint, CoverageOfTheFramesDecidesTheOrderOfTheFullImagesToo) {
    // The full images carry no coverage of their own; a wrong order would reverse the candidates.
    EXPECT_EQ(Joint(Params(), 5, 1, 50, 60), (Entry{5, 1, 0, VKEY_RIGHT}));
    EXPECT_EQ(Joint(Params(), 5, 1, 60, 50), (Entry{5, 1, 0, VKEY_RIGHT}));
    EXPECT_EQ(Joint(Plain(), 5, 1, 50, 60), (Entry{5, 1, 0, VKEY_RIGHT}));
    EXPECT_EQ(Joint(Plain(), 5, 1, 60, 50), (Entry{5, 1, 0, VKEY_RIGHT}));
}

TEST_F(ImgJoint, TieOfTheComponentsIsVertical) {
    EXPECT_EQ(Joint(Plain(), 3, -3), (Entry{3, -3, 0, VKEY_DOWN}));
    EXPECT_EQ(Joint(Plain(), -3, 3), (Entry{-3, 3, 0, VKEY_UP}));
}

TEST_F(ImgJoint, SmallDisplacementIsNoMove) {
    EXPECT_EQ(Joint(Plain(), 1, 1), (Entry{1, 1, 0, VKEY_NO_MOVE}));
    EXPECT_EQ(Joint(Plain(), 0, 0), (Entry{0, 0, 0, VKEY_NO_MOVE}));
    EXPECT_EQ(Joint(Plain(), 2, 1), (Entry{2, 1, 0, VKEY_RIGHT}));
}

TEST_F(ImgJoint, DimensionlessDisplacementIsPercentOfTheSensorButTheVerdictIsOnPixels) {
    Params params = Plain().Set("s_dimensionlessFlag", 1);
    // 300 / 80 = 3, -300 / 200 = -1; on percent it would be RIGHT.
    EXPECT_EQ(Joint(params, 3, -3), (Entry{3, -1, 0, VKEY_DOWN}));
    // 100 / 80 = 1, 400 / 200 = 2
    EXPECT_EQ(Joint(params, 1, 4), (Entry{1, 2, 0, VKEY_UP}));
}

TEST_F(ImgJoint, DimensionlessWithoutASensorSizeStoresPixels) {
    for (const char* side : {"s_sensorWidth", "s_sensorHeight"}) {
        for (const int32_t size : {0, -1}) {
            Params params = Plain().Set("s_dimensionlessFlag", 1).Set(side, size);
            EXPECT_EQ(Joint(params, 3, -4), (Entry{3, -4, 0, VKEY_DOWN}));
        }
    }
}

TEST_F(ImgJoint, ScoreAboveTheStrictThresholdVotesForNothingButIsKept) {
    EXPECT_EQ(Joint(Plain().Set("s_diffThresholdStr", -1), 4, 0), (Entry{4, 0, 0, VKEY_NONE}));
    EXPECT_EQ(Joint(Plain().Set("s_diffThresholdStr", 0), 4, 0), (Entry{4, 0, 0, VKEY_RIGHT}));
}

TEST_F(ImgJoint, TooLittleCommonFingerGives255AndNoVerdict) {
    // Every candidate is a sentinel: template 0 (8, 23) at (0, 0).
    Plain().Set("s_diffThresholdStr", 254).Apply();
    TestFrame frame(56, 36, 10);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    ASSERT_EQ(CalcImgJoint(), 0);
    EXPECT_EQ(PrintNaviLog()->diff[0], 255);
    EXPECT_EQ(PrintNaviLog()->dx_fp[0], 23);
    EXPECT_EQ(PrintNaviLog()->dy_fp[0], -8);
    EXPECT_EQ(PrintNaviLog()->vkey_fp[0], VKEY_NONE);
}

class ImgJointFailure : public NaviTest {
  protected:
    static void Load() {
        TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
        TestFrame curr(56, NoisePatch(104, 100, 36, 56), 1);
        ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
    }
    static void ExpectNothingWritten() {
        const NaviVoteInfo_t* record = PrintNaviLog();
        EXPECT_EQ(record->dx_fp[0], 0);
        EXPECT_EQ(record->dy_fp[0], 0);
        EXPECT_EQ(record->diff[0], 0);
        EXPECT_EQ(record->vkey_fp[0], 0);
    }
};

TEST_F(ImgJointFailure, EveryFailingAllocationFailsThePairAndLeaksNothing) {
    Params().Apply();
    int failed = 0;
    for (int nth = 1;; ++nth) {
        FpNaviClear();
        Load();
        FailingMalloc::FailNth(nth);
        const int32_t result = CalcImgJoint();
        FailingMalloc::Off();
        if (FailingMalloc::Failures() == 0) {
            EXPECT_EQ(result, 0);
            break;
        }
        ++failed;
        EXPECT_EQ(result, -1) << nth;
        ExpectNothingWritten();
        // What is left belongs to the full images.
        int owned = 0;
        for (const NaviFrame_t* frame : {&s_fullImagePrev, &s_fullImageCurr})
            owned += (frame->pData != nullptr ? 1 : 0) + (frame->pType != nullptr ? 1 : 0);
        EXPECT_EQ(FailingMalloc::Live(), owned) << nth;
    }
    EXPECT_GE(failed, 7) << "two candidate arrays, the list, two buffers of two full images";
}

TEST_F(ImgJointFailure, WorkingArraysAreFreed) {
    Params().Apply();
    Load();
    FailingMalloc::Count();
    ASSERT_EQ(CalcImgJoint(), 0);
    EXPECT_EQ(FailingMalloc::Live(), 4) << "the buffers of the two full images";
    ASSERT_EQ(CalcImgJoint(), 0);
    EXPECT_EQ(FailingMalloc::Live(), 4) << "the first ones were freed";
    FpNaviClear();
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Live(), 0);
}

TEST_F(ImgJointFailure, NoRoomForCandidatesFailsThePair) {
    Params().Apply();
    Load();
    Params().Set("s_candidateNum", 0).Apply();
    EXPECT_EQ(CalcImgJoint(), -1);
    ExpectNothingWritten();
}

TEST_F(ImgJointFailure, FailedCandidateSearchFailsThePair) {
    Params().Set("s_templateWidth", 0).Apply();
    Load();
    EXPECT_EQ(CalcImgJoint(), -1);
    ExpectNothingWritten();
}

TEST_F(ImgJointFailure, TilesThatDoNotMakeTheFrameFailThePair) {
    Params().Set("s_centerWidth", 39).Apply();  // 39 + 2 * 8 is not 56
    Load();
    FailingMalloc::Count();
    EXPECT_EQ(CalcImgJoint(), -1);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Live(), 0);
    ExpectNothingWritten();
}

}  // namespace
