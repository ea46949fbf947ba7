// The tuning's measurement: corner blocks, their order, the top grey.
#include <gtest/gtest.h>
#include <unistd.h>

#include <algorithm>
#include <array>
#include <numeric>
#include <vector>

#include "LogCapture.h"
#include "TuneTestSupport.h"
#include "tuning/TuneMeasure.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

using Counters = std::array<uint32_t, 256>;

Counters Histogram() {
    Counters counters{};
    std::copy(_NAVI_img_histogram, _NAVI_img_histogram + 256, counters.begin());
    return counters;
}

uint32_t Total(const Counters& counters) {
    return std::accumulate(counters.begin(), counters.end(), 0U);
}

class ImgHistogram : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Params().Apply();
    }
    void TearDown() override { Params().Apply(); }
};

TEST_F(ImgHistogram, Blocks14By9Of56By36Hold126Pixels) {
    // The corner greys reach exactly to the blocks' edges; a pixel of the 77 between them or of
    // another corner would show in the histogram.
    ASSERT_EQ(_NAVI_ImgHistogram(CornerFrame({100, 110, 120, 130}).data(), 36, 56), 0);
    EXPECT_EQ(_NAVI_mean, 100U);
    EXPECT_EQ(Histogram()[100], 126U);
    EXPECT_EQ(Total(Histogram()), 126U);
}

TEST_F(ImgHistogram, EachCornerIsMeasuredWhenItIsTheDarkest) {
    const Corners cases[] = {{9, 99, 99, 99}, {99, 9, 99, 99}, {99, 99, 9, 99}, {99, 99, 99, 9}};
    for (const Corners& corners : cases) {
        ASSERT_EQ(_NAVI_ImgHistogram(CornerFrame(corners).data(), 36, 56), 0);
        EXPECT_EQ(_NAVI_mean, 9U);
        EXPECT_EQ(Histogram()[9], 126U);
    }
}

TEST_F(ImgHistogram, SelectionModeIsTheRankFromTheDarkest) {
    const std::vector<uint8_t> frame = CornerFrame({120, 110, 130, 100});
    const uint32_t expected[] = {100, 110, 120, 130};
    for (int32_t rank = 0; rank < 4; ++rank) {
        Params().Set("_NAVI_blk_selection_mode", rank).Apply();
        ASSERT_EQ(_NAVI_ImgHistogram(frame.data(), 36, 56), 0);
        EXPECT_EQ(_NAVI_mean, expected[rank]);
        EXPECT_EQ(Histogram()[expected[rank]], 126U);
    }
}

TEST_F(ImgHistogram, SelectionMode3MeasuresTheBrightestCorner) {
    Params().Set("_NAVI_blk_selection_mode", 3).Apply();
    ASSERT_EQ(_NAVI_ImgHistogram(CornerFrame({10, 250, 20, 30}).data(), 36, 56), 0);
    EXPECT_EQ(_NAVI_mean, 250U);
}

TEST_F(ImgHistogram, MeanTruncates) {
    // Top left: 125 pixels of 100 and one of 225 sum to 12725; 12725 / 126 = 100.99.
    TestFrame frame(56, 36, 200);
    frame.Paint(0, 0, 9, 14, 100).Grey(0, 0) = 225;
    ASSERT_EQ(_NAVI_ImgHistogram(frame.Greys().data(), 36, 56), 0);
    EXPECT_EQ(_NAVI_mean, 100U);
    EXPECT_EQ(Histogram()[100], 125U);
    EXPECT_EQ(Histogram()[225], 1U);
}

TEST_F(ImgHistogram, OfTwoEqualMeansTheBlockListedFirstHasTheLowerRank) {
    // Top left and top right have the mean 90 each: all 90; half 80, half 100 (63 + 63 pixels).
    TestFrame frame(56, 36, 200);
    frame.Paint(0, 0, 9, 14, 90).Paint(0, 42, 9, 7, 80).Paint(0, 49, 9, 7, 100);
    ASSERT_EQ(_NAVI_ImgHistogram(frame.Greys().data(), 36, 56), 0);
    EXPECT_EQ(_NAVI_mean, 90U);
    EXPECT_EQ(Histogram()[90], 126U) << "rank 0 is the top left";
    Params().Set("_NAVI_blk_selection_mode", 1).Apply();
    ASSERT_EQ(_NAVI_ImgHistogram(frame.Greys().data(), 36, 56), 0);
    EXPECT_EQ(_NAVI_mean, 90U);
    EXPECT_EQ(Histogram()[80], 63U) << "rank 1 is the top right";
    EXPECT_EQ(Histogram()[100], 63U);
}

TEST_F(ImgHistogram, WidthThatIsNoMultipleOf4DividesByASixteenthOfTheImage) {
    // 50 x 8: a sixteenth is 25. Left blocks: 50 / 4 = 12 columns x 2 rows, 24 * 200 / 25 = 192.
    // Right blocks: from column 150 / 4 = 37, 13 columns x 2 rows, 26 * 100 / 25 = 104.
    TestFrame frame(50, 8, 7);
    frame.Paint(0, 0, 2, 12, 200).Paint(6, 0, 2, 12, 200);
    frame.Paint(0, 37, 2, 13, 100).Paint(6, 37, 2, 13, 100);
    ASSERT_EQ(_NAVI_ImgHistogram(frame.Greys().data(), 8, 50), 0);
    EXPECT_EQ(_NAVI_mean, 104U);
    EXPECT_EQ(Histogram()[100], 26U);
    Params().Set("_NAVI_blk_selection_mode", 3).Apply();
    ASSERT_EQ(_NAVI_ImgHistogram(frame.Greys().data(), 8, 50), 0);
    EXPECT_EQ(_NAVI_mean, 192U);
    EXPECT_EQ(Histogram()[200], 24U);
    EXPECT_EQ(Total(Histogram()), 24U);
}

TEST_F(ImgHistogram, WrongSizeIsLoggedOnceWhateverTheLogFlagSays) {
    const std::vector<uint8_t> frame(100, 50);
    for (const int32_t flag : {0, 1}) {
        Params().Set("s_logShowFlag", flag).Apply();
        LogCapture log;
        EXPECT_EQ(_NAVI_ImgHistogram(frame.data(), 10, 10), -1);
        ASSERT_EQ(log.Lines().size(), 1U);
        const LogLine& line = log.Lines()[0];
        EXPECT_EQ(line.priority, 4);
        EXPECT_EQ(line.tag, "TQCODE");
        EXPECT_EQ(line.format,
                  "%-15s:%04d:pid=%d:ctid=%d => error! size cannot be divided by 16!\n");
        EXPECT_EQ(line.function, "_NAVI_ImgHistogram");
        EXPECT_EQ(line.line, 1590);
        EXPECT_EQ(line.pid, getpid());
        EXPECT_EQ(line.tid, gettid());
    }
}

TEST_F(ImgHistogram, WrongSizeZeroesTheMeanAndKeepsTheHistogram) {
    ASSERT_EQ(_NAVI_ImgHistogram(Flat(180).data(), 36, 56), 0);
    const Counters before = Histogram();
    LogCapture log;
    EXPECT_EQ(_NAVI_ImgHistogram(Flat(90).data(), 35, 55), -1);
    EXPECT_EQ(_NAVI_mean, 0U);
    EXPECT_EQ(Histogram(), before);
}

TEST_F(ImgHistogram, EveryFillStartsFromZero) {
    ASSERT_EQ(_NAVI_ImgHistogram(Flat(180).data(), 36, 56), 0);
    ASSERT_EQ(_NAVI_ImgHistogram(Flat(90).data(), 36, 56), 0);
    EXPECT_EQ(Histogram()[180], 0U);
    EXPECT_EQ(Histogram()[90], 126U);
}

// The sort as its steps say: for len = n down to 1 the last of the greatest among the first len
// changes places with position len - 1.
void SortBySteps(std::array<int32_t, 4>* values, std::array<int32_t, 4>* tags) {
    for (size_t len = 4; len >= 1; --len) {
        size_t greatest = 0;
        for (size_t i = 1; i < len; ++i) {
            if ((*values)[i] >= (*values)[greatest])
                greatest = i;
        }
        std::swap((*values)[greatest], (*values)[len - 1]);
        std::swap((*tags)[greatest], (*tags)[len - 1]);
    }
}

using Four = std::array<int32_t, 4>;

TEST(SortIndex, SwapsTheMaximumWithTheEnd) {
    // The first 100 goes behind the 90s by a swap, which turns them round.
    Four values = {100, 90, 90, 100};
    Four tags = {0, 1, 2, 3};
    _NAVI_SortIndex(values.data(), tags.data(), 4);
    EXPECT_EQ(values, (Four{90, 90, 100, 100}));
    EXPECT_EQ(tags, (Four{2, 1, 0, 3}));
}

TEST(SortIndex, EqualValuesInAscendingPlacesKeepTheirOrder) {
    Four values = {90, 90, 100, 100};
    Four tags = {0, 1, 2, 3};
    _NAVI_SortIndex(values.data(), tags.data(), 4);
    EXPECT_EQ(tags, (Four{0, 1, 2, 3}));
    values = {7, 7, 7, 7};
    _NAVI_SortIndex(values.data(), tags.data(), 4);
    EXPECT_EQ(tags, (Four{0, 1, 2, 3}));
}

TEST(SortIndex, SortsAsItsStepsSayForAllPatternsOfFourMeans) {
    for (int32_t pattern = 0; pattern < 256; ++pattern) {
        Four values = {pattern % 4 * 60, pattern / 4 % 4 * 60, pattern / 16 % 4 * 60,
                       pattern / 64 * 60};
        Four tags = {0, 1, 2, 3};
        Four expectedValues = values;
        Four expectedTags = tags;
        SortBySteps(&expectedValues, &expectedTags);
        _NAVI_SortIndex(values.data(), tags.data(), 4);
        EXPECT_EQ(values, expectedValues) << pattern;
        EXPECT_EQ(tags, expectedTags) << pattern;
        EXPECT_TRUE(std::is_sorted(values.begin(), values.end()));
    }
}

TEST(SortIndex, SortsNothingAndOne) {
    int32_t value = 5;
    int32_t tag = 8;
    _NAVI_SortIndex(&value, &tag, 0);
    _NAVI_SortIndex(&value, &tag, 1);
    EXPECT_EQ(value, 5);
    EXPECT_EQ(tag, 8);
}

TEST(CalcTop, DefaultsTakeThe13thTo18thBrightestOf126) {
    // 126 * 10 / 100 = 12, 126 * 15 / 100 = 18.
    Counters counters{};
    counters[250] = 12;
    counters[200] = 6;
    counters[40] = 108;
    EXPECT_EQ(_NAVI_CalcTop(10, 15, counters.data()), 200);
}

TEST(CalcTop, LevelsAreSplitAtTheRanks) {
    // The 12 brightest: 10 * 255 + 2 * 220 = 2990. The 18 brightest: 2550 + 5 * 220 + 3 * 190 =
    // 4220. (4220 - 2990) / 6 = 205.
    Counters counters{};
    counters[255] = 10;
    counters[220] = 5;
    counters[190] = 50;
    counters[0] = 61;
    EXPECT_EQ(_NAVI_CalcTop(10, 15, counters.data()), 205);
}

TEST(CalcTop, MeanTruncates) {
    // Ranks 13 to 18: 5 * 100 + 1 * 99 = 599; 599 / 6 = 99.
    Counters counters{};
    counters[100] = 17;
    counters[99] = 109;
    EXPECT_EQ(_NAVI_CalcTop(10, 15, counters.data()), 99);
}

TEST(CalcTop, FewerThan7PixelsHaveNoTop) {
    for (uint32_t count = 0; count < 7; ++count) {
        Counters counters{};
        counters[100] = count;  // 6 * 15 / 100 = 0, as 6 * 10 / 100
        EXPECT_EQ(_NAVI_CalcTop(10, 15, counters.data()), -1) << count;
    }
}

TEST(CalcTop, SevenPixelsHaveTheirBrightest) {
    Counters counters{};
    counters[100] = 6;
    counters[140] = 1;  // ranks 0 and 7 * 15 / 100 = 1
    EXPECT_EQ(_NAVI_CalcTop(10, 15, counters.data()), 140);
}

TEST(CalcTop, EqualPercentagesHaveNoTop) {
    Counters counters{};
    counters[100] = 126;
    EXPECT_EQ(_NAVI_CalcTop(15, 15, counters.data()), -1);
    EXPECT_EQ(_NAVI_CalcTop(0, 0, counters.data()), -1);
}

TEST(CalcTop, PercentagesInTheOtherOrderGiveTheSameMean) {
    Counters counters{};
    counters[250] = 12;
    counters[200] = 6;
    counters[40] = 108;
    EXPECT_EQ(_NAVI_CalcTop(15, 10, counters.data()), 200);  // -1200 / -6
}

TEST(CalcTop, RankBehindTheLastPixelTakesAllThereAre) {
    // Ranks 12 and 252: (126 - 12) * 100 / (252 - 12) = 11400 / 240 = 47.
    Counters counters{};
    counters[100] = 126;
    EXPECT_EQ(_NAVI_CalcTop(10, 200, counters.data()), 47);
}

TEST(CalcTop, WholeImageIsItsMean) {
    Counters counters{};
    counters[0] = 26;
    counters[255] = 100;
    EXPECT_EQ(_NAVI_CalcTop(0, 100, counters.data()), 202);  // 25500 / 126
}

}  // namespace
