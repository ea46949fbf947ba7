// Counts of pairs that a host wrote into the record: nothing is read or written beyond its arrays.
#include <gtest/gtest.h>

#include <cstring>
#include <limits>
#include <string>
#include <vector>

#include "Fixtures.h"
#include "LogCapture.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "matching/PairMatch.h"
#include "motion/CenterMove.h"
#include "motion/DoubleScan.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr int32_t kLeast = std::numeric_limits<int32_t>::min();
constexpr int32_t kMost = std::numeric_limits<int32_t>::max();

// Counts outside 0..99, and what they count as.
struct WrongCount {
    int32_t stored;
    int32_t counted;
};
constexpr WrongCount kWrongCounts[] = {{-1, 0},   {-100, 0},  {kLeast, 0}, {100, 99},
                                       {101, 99}, {1503, 99}, {kMost, 99}};

TEST(PairCount, CountsUpTo99AreTheirOwn) {
    NaviVoteInfo_t record = {};
    for (int32_t count = 0; count <= 99; ++count) {
        record.calc_cnt = count;
        EXPECT_EQ(PairCount(record), count);
    }
}

TEST(PairCount, NegativeCountsAreNoneAndLargerOnes99) {
    NaviVoteInfo_t record = {};
    for (const WrongCount& count : kWrongCounts) {
        record.calc_cnt = count.stored;
        EXPECT_EQ(PairCount(record), count.counted);
        EXPECT_EQ(record.calc_cnt, count.stored);
    }
}

class WrongPairCount : public NaviTest {
  protected:
    // 99 pairs to the right and a little up, by every method.
    void FillRecord() {
        FpNaviClear();
        for (int32_t i = 0; i < FPNAVI_VOTE_CAPACITY; ++i) {
            m_record->xc[i] = m_record->xc_ds[i] = i;
            m_record->yc[i] = m_record->yc_ds[i] = i / 4;
            m_record->dx_ct[i] = m_record->dx_ds[i] = m_record->dx_fp[i] = 8;
            m_record->dy_ct[i] = m_record->dy_ds[i] = m_record->dy_fp[i] = 1;
            m_record->vkey_ct[i] = m_record->vkey_fp[i] = VKEY_RIGHT;
        }
    }
    struct Vote {
        int32_t key;
        int32_t dxSum;
        std::vector<std::string> lines;

        bool operator==(const Vote& other) const {
            return key == other.key && dxSum == other.dxSum && lines == other.lines;
        }
    };
    // The vote over the full record with this count.
    Vote VoteWith(int32_t calc_cnt) {
        FillRecord();
        m_record->calc_cnt = calc_cnt;
        LogCapture log;
        Vote vote = {Voting(1), m_record->dx_sum, {}};
        EXPECT_EQ(m_record->calc_cnt, calc_cnt) << "the vote does not mend it";
        for (const LogLine& line : log.Lines())
            vote.lines.push_back(line.text);
        return vote;
    }
    void ExpectVotesOfTheCounted(const Params& params) {
        params.Apply();
        EXPECT_EQ(VoteWith(99).key, VKEY_RIGHT);
        EXPECT_EQ(VoteWith(0).key, VKEY_NO_MOVE);
        for (const WrongCount& count : kWrongCounts)
            EXPECT_TRUE(VoteWith(count.stored) == VoteWith(count.counted)) << count.stored;
    }

    NaviVoteInfo_t* const m_record = PrintNaviLog();
};

TEST_F(WrongPairCount, HgVoteTakesItForNoneOr99) {
    ExpectVotesOfTheCounted(Params().Set("s_modeFlag", 1).Set("s_logShowFlag", 1));
}

TEST_F(WrongPairCount, FpVoteAndItsLogLinesTakeItForNoneOr99) {
    ExpectVotesOfTheCounted(Params().Set("s_logShowFlag", 1));
}

// A black rectangle of 16 x 32 pixels in the 40 x 48 hg image, its left column given.
std::vector<uint8_t> HgImage(int32_t left) {
    return RectImage(40, 48, 8, left, 32, 16);
}

int32_t Feed(const std::vector<uint8_t>& image) {
    return OrientationCalc(image.data(), image.data(), 0);
}

TEST_F(WrongPairCount, DriverAddsNoPairAt99OrAbove) {
    Params().Set("s_modeFlag", 1).Apply();
    for (const int32_t count : {99, 100, 1503, kMost}) {
        FillRecord();
        ASSERT_EQ(Feed(HgImage(4)), 0);
        m_record->calc_cnt = count;
        const NaviVoteInfo_t before = *m_record;
        EXPECT_EQ(Feed(HgImage(12)), 0) << count;
        EXPECT_EQ(std::memcmp(m_record, &before, sizeof before), 0) << count;
    }
}

TEST_F(WrongPairCount, DriverContinuesAt0FromANegativeCount) {
    Params().Set("s_modeFlag", 1).Apply();
    for (const int32_t count : {-1, -2, -1000, kLeast}) {
        FpNaviClear();
        ASSERT_EQ(Feed(HgImage(4)), 0);
        m_record->calc_cnt = count;
        ASSERT_EQ(Feed(HgImage(12)), 0);
        EXPECT_EQ(m_record->calc_cnt, 1) << count;
        EXPECT_EQ(m_record->xc[0], -20);  // 100 * (4 + 8) / 40 - 50
        EXPECT_EQ(m_record->xc[1], 0);
        EXPECT_EQ(m_record->vkey_ct[0], VKEY_RIGHT);
        ASSERT_EQ(Feed(HgImage(20)), 0);
        EXPECT_EQ(m_record->calc_cnt, 2) << count;
        EXPECT_EQ(m_record->xc[2], 20);
    }
}

TEST_F(WrongPairCount, PairThatIsNotCountedLeavesIt) {
    Params().Set("s_modeFlag", 1).Apply();
    const std::vector<uint8_t> white(40 * 48, 255);
    ASSERT_EQ(Feed(HgImage(4)), 0);
    m_record->calc_cnt = -7;
    ASSERT_EQ(Feed(white), 0) << "covers too little";
    EXPECT_EQ(m_record->calc_cnt, -7);
}

TEST_F(WrongPairCount, FpPairContinuesAt0FromANegativeCount) {
    Params().Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    ASSERT_EQ(Feed(NoisePatch(100, 100, 36, 56)), 0);
    ASSERT_EQ(Feed(NoisePatch(100, 96, 36, 56)), 0);
    const NaviVoteInfo_t expected = *m_record;
    ASSERT_EQ(expected.calc_cnt, 1);
    ASSERT_EQ(expected.dx_fp[0], 4);
    for (const int32_t count : {-1, kLeast}) {
        FpNaviClear();
        ASSERT_EQ(Feed(NoisePatch(100, 100, 36, 56)), 0);
        m_record->calc_cnt = count;
        ASSERT_EQ(Feed(NoisePatch(100, 96, 36, 56)), 0);
        EXPECT_EQ(std::memcmp(m_record, &expected, sizeof expected), 0) << count;
    }
}

// The methods alone, which the driver calls below 99 pairs only.
TEST_F(WrongPairCount, CentroidMethodWritesTheEntryOfTheCounted) {
    Params().Set("s_dimensionlessFlag", 1).Apply();
    NaviFrame_t prev = {};
    NaviFrame_t curr = {};
    curr.xc = 30;
    for (const WrongCount& count : kWrongCounts) {
        NaviVoteInfo_t record = {};
        record.calc_cnt = count.stored;
        ASSERT_EQ(CalcCenterMove(&prev, &curr, &record), 0);
        EXPECT_EQ(record.dx_ct[count.counted], 30) << count.stored;
        EXPECT_EQ(record.vkey_ct[count.counted], VKEY_RIGHT) << count.stored;
        EXPECT_EQ(record.calc_cnt, count.stored);
    }
}

TEST_F(WrongPairCount, TemplateMatchingWritesTheEntryOfTheCounted) {
    Params().Set("s_multiBloclkFlag", 0).Apply();
    for (const WrongCount& count : kWrongCounts) {
        TestFrame prev(56, NoisePatch(100, 100, 36, 56), 1);
        TestFrame curr(56, NoisePatch(100, 96, 36, 56), 1);
        prev->cvr = curr->cvr = 60;
        ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
        m_record->calc_cnt = count.stored;
        ASSERT_EQ(CalcImgJoint(), 0);
        EXPECT_EQ(m_record->dx_fp[count.counted], 4) << count.stored;
        EXPECT_EQ(m_record->calc_cnt, count.stored);
        FpNaviClear();
    }
}

TEST_F(WrongPairCount, DoubleScanMethodWritesEntry0OrNothing) {
    uint8_t prev[kZoneCells] = {1};
    uint8_t curr[kZoneCells] = {};
    curr[7] = 1;
    for (const WrongCount& count : kWrongCounts) {
        NaviVoteInfo_t record = {};
        record.calc_cnt = count.stored;
        const NaviVoteInfo_t before = record;
        if (count.counted == 0) {
            EXPECT_EQ(CalcDoubleScanMove(prev, curr, &record), 0);
            EXPECT_EQ(record.dx_ds[0], 87) << count.stored;
            EXPECT_EQ(record.calc_cnt, count.stored);
        } else {
            EXPECT_EQ(CalcDoubleScanMove(prev, curr, &record), -1);
            EXPECT_EQ(std::memcmp(&record, &before, sizeof record), 0) << count.stored;
        }
    }
}

}  // namespace
