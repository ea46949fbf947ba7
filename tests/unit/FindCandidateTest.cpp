// The candidate search: the bounded heap, the templates and their validity, the displacements.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "matching/CandidateSearch.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

TEST(MaxHeapify, RefusesNullAndEmptyArrays) {
    uint32_t one = 7;
    EXPECT_EQ(fpnavi::MaxHeapify(nullptr, 1, 0), -1);
    EXPECT_EQ(fpnavi::MaxHeapify(&one, 0, 0), -1);
    EXPECT_EQ(fpnavi::MaxHeapify(&one, -3, 0), -1);
    EXPECT_EQ(one, 7U);
}

TEST(MaxHeapify, LengthOneChangesNothing) {
    uint32_t one = 7;
    EXPECT_EQ(fpnavi::MaxHeapify(&one, 1, 0), 0);
    EXPECT_EQ(one, 7U);
}

TEST(MaxHeapify, IndexBeyondTheArrayIsFine) {
    std::vector<uint32_t> keys = {1, 9};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 2, 2), 0);
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 2, 100), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{1, 9}));
}

TEST(MaxHeapify, IndexBeforeTheArrayIsFine) {
    std::vector<uint32_t> keys = {1, 9};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 2, -1), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{1, 9}));
}

TEST(MaxHeapify, SinksAlongTheLargerChildren) {
    std::vector<uint32_t> keys = {1, 9, 8, 7, 6, 5, 4};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 7, 0), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{9, 7, 8, 1, 6, 5, 4}));
}

TEST(MaxHeapify, StartsAtTheGivenIndex) {
    std::vector<uint32_t> keys = {0, 1, 2, 5, 6};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 5, 1), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{0, 6, 2, 5, 1}));
}

TEST(MaxHeapify, ParentDoesNotYieldToAnEqual) {
    std::vector<uint32_t> keys = {5, 5, 5};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 3, 0), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{5, 5, 5}));
}

TEST(MaxHeapify, OfEqualChildrenTheLeftOneRises) {
    std::vector<uint32_t> keys = {1, 5, 5};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 3, 0), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{5, 1, 5}));
}

TEST(MaxHeapify, KeysAreUnsigned) {
    std::vector<uint32_t> keys = {1, 0x80000000U, 2};
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 3, 0), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{0x80000000U, 1, 2}));
}

using Displacements = std::vector<std::pair<int32_t, int32_t>>;  // rows, columns

class Candidates : public NaviTest {
  protected:
    static void Load(TestFrame& prev, TestFrame& curr) {
        ASSERT_EQ(ImgCopy(&s_imagePrev, prev.Get()), 0);
        ASSERT_EQ(ImgCopy(&s_imageCurr, curr.Get()), 0);
    }
    // All candidates, sorted: their order in the heap does not matter to a reader.
    static Displacements Find(TestFrame& prev, TestFrame& curr, int32_t expected = 0) {
        Load(prev, curr);
        const auto number = static_cast<size_t>(s_candidateNum);
        std::vector<int32_t> di(number);
        std::vector<int32_t> dj(number);
        EXPECT_EQ(fpnavi::FindCandidate(di.data(), dj.data()), expected);
        Displacements found;
        for (size_t i = 0; i < number; ++i)
            found.emplace_back(di[i], dj[i]);
        std::sort(found.begin(), found.end());
        return found;
    }
    // What a sentinel (template 0 at row 0, column 0) becomes with the default templates:
    // 0 + 16 - (8 + 16) rows, 0 + 32 - (23 + 32) columns.
    static constexpr std::pair<int32_t, int32_t> kSentinel = {-8, -23};
};

TEST_F(Candidates, NoValidTemplateLeavesSentinels) {
    Params().Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    EXPECT_EQ(Find(prev, curr), Displacements(100, kSentinel));
}

TEST_F(Candidates, TemplateHalfInsideTheFingerIsValid) {
    Params().Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(8, 23, 3, 10);  // 30 of the 60 pixels of template 0
    // All placements score 0, so the 100 lowest keys are rows 8, 9, 10 (31 columns from 8 to 38)
    // and seven of row 11.
    Displacements expected;
    for (int32_t di = 0; di < 3; ++di) {
        for (int32_t dj = -15; dj <= 15; ++dj)
            expected.emplace_back(di, dj);
    }
    for (int32_t dj = -15; dj <= -9; ++dj)
        expected.emplace_back(3, dj);
    EXPECT_EQ(Find(prev, curr), expected);
}

TEST_F(Candidates, TemplateLessThanHalfInsideTheFingerIsNot) {
    Params().Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(8, 23, 3, 10);
    curr.Type(8, 23) = 0;  // 29 of 60: 48 percent
    EXPECT_EQ(Find(prev, curr), Displacements(100, kSentinel));
}

TEST_F(Candidates, ExactlyFortyNinePercentIsNotEnough) {
    // Templates of 10 x 10: one percent a pixel. Template 0 starts at (8, 23), its first placement
    // at (8, 8) is 15 columns further left.
    Params()
        .Set("s_templateHeight", 10)
        .Set("s_multiBloclkFlag", 0)
        .Set("s_candidateNum", 1)
        .Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(8, 23, 4, 10).Mark(12, 23, 1, 9);
    EXPECT_EQ(Find(prev, curr), Displacements{kSentinel});
    curr.Type(12, 32) = 1;
    EXPECT_EQ(Find(prev, curr), (Displacements{{0, -15}}));
}

TEST_F(Candidates, OnlyClassOneMakesATemplateValid) {
    Params().Apply();
    TestFrame prev(56, 36, 10, 1);
    TestFrame curr(56, 36, 10, 255);
    EXPECT_EQ(Find(prev, curr), Displacements(100, kSentinel));
}

struct Template {
    int32_t row, column, rows, columns;  // rectangle in the frame
    int32_t di, dj;                      // displacement of its placement at row 8, column 8
};

TEST_F(Candidates, EveryTemplateHasItsPlaceAndItsGap) {
    // Frame 56 x 36, bounds 8, centre 40 x 20, gaps 32 and 16, template 10 x 6. The first placement
    // is row 8, column 8; it becomes 8 + 16 - (top + di) and 8 + 32 - (left + dj).
    const std::vector<Template> templates = {
        {8, 23, 6, 10, 0, -15},     // 24 - (8 + 16), 40 - (23 + 32)
        {22, 23, 6, 10, -14, -15},  // 24 - (22 + 16)
        {13, 42, 10, 6, -5, -34},   // 24 - (13 + 16), 40 - (42 + 32)
        {13, 8, 10, 6, -5, 0},      // 40 - (8 + 32)
        {2, 23, 6, 10, 22, -15},    // 24 - (2 + 0)
        {28, 23, 6, 10, -36, -15},  // 24 - (28 + 32)
        {13, 48, 10, 6, -5, -72},   // 40 - (48 + 64)
        {13, 2, 10, 6, -5, 38}};    // 40 - (2 + 0)
    Params().Set("s_candidateNum", 1).Apply();
    for (const Template& tplt : templates) {
        TestFrame prev(56, 36, 10);
        TestFrame curr(56, 36, 10);
        curr.Mark(tplt.row, tplt.column, tplt.rows, tplt.columns);
        EXPECT_EQ(Find(prev, curr), (Displacements{{tplt.di, tplt.dj}}))
            << tplt.row << ", " << tplt.column;
    }
}

TEST_F(Candidates, OuterTemplatesAreUsedInTheMultiBlockLayoutOnly) {
    Params().Set("s_candidateNum", 1).Set("s_multiBloclkFlag", 0).Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(2, 23, 6, 10).Mark(28, 23, 6, 10).Mark(13, 48, 10, 6).Mark(13, 2, 10, 6);
    EXPECT_EQ(Find(prev, curr), Displacements{kSentinel});
}

TEST_F(Candidates, DifferenceOf255IsNeverTaken) {
    // Keys 0xFF08...: not below the sentinel.
    Params().Set("s_candidateNum", 3).Apply();
    TestFrame prev(56, 36, 255, 1);
    TestFrame curr(56, 36, 0, 1);
    EXPECT_EQ(Find(prev, curr), Displacements(3, kSentinel));
    TestFrame nearly(56, 36, 254, 1);
    EXPECT_NE(Find(nearly, curr), Displacements(3, kSentinel));
}

TEST_F(Candidates, KeyEqualToTheHeapRootIsDiscarded) {
    // Without bounds template 0 at row 0, column 0 with difference 255 has the sentinel's key, and
    // every later placement a larger one. Template 0 starts at (0, 23).
    Params()
        .Set("s_boundWidth", 0)
        .Set("s_boundHeight", 0)
        .Set("s_multiBloclkFlag", 0)
        .Set("s_candidateNum", 2)
        .Apply();
    TestFrame prev(56, 36, 255, 1);
    TestFrame curr(56, 36, 0);
    curr.Mark(0, 23, 6, 10);
    EXPECT_EQ(Find(prev, curr), Displacements(2, {0, -23}));
}

TEST_F(Candidates, ColumnRangeEndsAtTheBoundHeight) {
    // Bounds 4 wide, 8 high, templates 10 x 4: rows 8..20 + 8 - 4 = 24, columns 4..8 + 40 - 10 =
    // 38 (with the bound width it would end at 34). Template 0 starts at (8, 23).
    Params()
        .Set("s_boundWidth", 4)
        .Set("s_templateHeight", 4)
        .Set("s_multiBloclkFlag", 0)
        .Set("s_candidateNum", 17 * 35)
        .Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(8, 23, 4, 10);
    Displacements expected;
    for (int32_t row = 8; row <= 24; ++row) {
        for (int32_t column = 4; column <= 38; ++column)
            expected.emplace_back(row - 8, column - 23);
    }
    EXPECT_EQ(Find(prev, curr), expected);
}

TEST_F(Candidates, FewerPlacementsThanRoomLeaveSentinels) {
    Params().Set("s_multiBloclkFlag", 0).Set("s_candidateNum", 470).Apply();
    TestFrame prev(56, 36, 10);
    TestFrame curr(56, 36, 10);
    curr.Mark(8, 23, 6, 10);
    // 15 rows x 31 columns = 465 placements
    const Displacements found = Find(prev, curr);
    EXPECT_EQ(std::count(found.begin(), found.end(), kSentinel), 5);
}

TEST_F(Candidates, TemplatesComeFromTheFrameOfLessCoverage) {
    Params().Set("s_candidateNum", 1).Apply();
    TestFrame unmarked(56, 36, 10);
    TestFrame marked(56, 36, 10);
    marked.Mark(8, 23, 6, 10);
    const Displacements fromMarked = {{0, -15}};
    const Displacements fromUnmarked = {kSentinel};

    unmarked->cvr = marked->cvr = 60;
    EXPECT_EQ(Find(unmarked, marked), fromMarked) << "a tie takes the current frame";
    EXPECT_EQ(Find(marked, unmarked), fromUnmarked) << "a tie takes the current frame";
    marked->cvr = 61;
    EXPECT_EQ(Find(unmarked, marked), fromUnmarked) << "the current frame covers more";
    EXPECT_EQ(Find(marked, unmarked), fromUnmarked) << "the previous frame covers more";
    marked->cvr = 59;
    EXPECT_EQ(Find(unmarked, marked), fromMarked);
    EXPECT_EQ(Find(marked, unmarked), fromMarked);
}

TEST_F(Candidates, BestPlacementIsTheTrueDisplacement) {
    // The current frame's template content lies 2 rows lower and 3 columns further left in the
    // previous frame.
    Params().Set("s_candidateNum", 1).Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    TestFrame prev(56, NoisePatch(98, 103, 36, 56), 1);
    TestFrame curr(56, NoisePatch(100, 100, 36, 56), 1);
    EXPECT_EQ(Find(prev, curr), (Displacements{{2, -3}}));
}

TEST_F(Candidates, TemplateWithoutAreaFails) {
    TestFrame frame(56, 36, 10, 1);
    for (const int32_t width : {0, -10}) {
        Params().Set("s_templateWidth", width).Apply();
        Find(frame, frame, -1);
    }
}

TEST_F(Candidates, TemplatesWithoutPixelsAreNotValid) {
    // Two negative sides, -2 x -3 = 6 pixels, and one, 3 * -1431655765 = -2^32 + 1, which wraps to
    // 1. A sentinel becomes 0 + 16 - (8 + 16) rows, 0 + 32 - ((56 - width) / 2 + 32) columns.
    TestFrame frame(56, 36, 10, 1);
    Params().Set("s_templateWidth", -2).Set("s_templateHeight", -3).Apply();
    EXPECT_EQ(Find(frame, frame), Displacements(100, {-8, -29}));
    Params().Set("s_templateWidth", 3).Set("s_templateHeight", -1431655765).Apply();
    EXPECT_EQ(Find(frame, frame), Displacements(100, {-8, -26}));
    // -2 * 2147483647 = -2^32 + 2, which wraps to 2: its rows, all empty, are not gone through.
    Params().Set("s_templateWidth", -2).Set("s_templateHeight", 2147483647).Apply();
    EXPECT_EQ(Find(frame, frame), Displacements(100, {-8, -29}));
}

TEST_F(Candidates, NowhereToWriteFails) {
    Params().Apply();
    TestFrame frame(56, 36, 10, 1);
    Load(frame, frame);
    std::vector<int32_t> entries(100, 7);
    EXPECT_EQ(fpnavi::FindCandidate(nullptr, entries.data()), -1);
    EXPECT_EQ(fpnavi::FindCandidate(entries.data(), nullptr), -1);
    Params().Set("s_candidateNum", 0).Apply();
    EXPECT_EQ(fpnavi::FindCandidate(entries.data(), entries.data()), -1);
    EXPECT_EQ(entries, std::vector<int32_t>(100, 7));
}

TEST_F(Candidates, FrameWithoutPixelsFails) {
    Params().Apply();
    TestFrame frame(56, 36, 10, 1);
    std::vector<int32_t> di(100);
    std::vector<int32_t> dj(100);
    ASSERT_EQ(ImgCopy(&s_imageCurr, frame.Get()), 0);
    EXPECT_EQ(fpnavi::FindCandidate(di.data(), dj.data()), -1) << "no previous frame";
    ImgClear(&s_imageCurr);
    ASSERT_EQ(ImgCopy(&s_imagePrev, frame.Get()), 0);
    EXPECT_EQ(fpnavi::FindCandidate(di.data(), dj.data()), -1) << "no current frame";
}

TEST_F(Candidates, TemplatesAndPlacementsOutsideTheFrameFail) {
    TestFrame frame(56, 36, 10, 1);
    const std::vector<Params> bad = {
        Params().Set("s_templateHeight", 9),  // template 4 starts at row 8 - 9
        Params().Set("s_templateWidth", 57).Set("s_multiBloclkFlag", 0),
        Params().Set("s_boundHeight", -1),  // placements from row -1
        Params().Set("s_boundWidth", 60),
        Params().Set("s_centerHeight", 29),  // placements end at row 37
        Params().Set("s_centerWidth", 49)};  // placements end at column 57
    for (const Params& params : bad) {
        params.Apply();
        Find(frame, frame, -1);
    }
}

TEST_F(Candidates, ColumnsBeyondTheKeyFail) {
    // A 304 x 36 image: placements up to column 8 + 288 - 10 = 286 do not fit 8 bits.
    Params().Set("s_blockColNumFp", 38).Set("s_centerWidth", 288).Apply();
    TestFrame frame(304, 36, 10, 1);
    Find(frame, frame, -1);
}

TEST_F(Candidates, RowsBeyondTheKeyFail) {
    Params().Set("s_blockRowNumFp", 150).Set("s_centerHeight", 284).Apply();
    TestFrame frame(56, 300, 10, 1);
    Find(frame, frame, -1);
}

TEST_F(Candidates, LastColumnOfTheKeyWorks) {
    // 273 x 36 with blocks of 39: centre 257, placements up to column 8 + 257 - 10 = 255.
    Params().Set("s_blockWidthFp", 39).Set("s_centerWidth", 257).Set("s_candidateNum", 1).Apply();
    TestFrame prev(273, 36, 200, 1);
    TestFrame curr(273, 36, 10);
    curr.Mark(8, 131, 6, 10);  // template 0 at (273 - 10) / 2
    prev.Paint(22, 255, 6, 10, 10);
    EXPECT_EQ(Find(prev, curr), (Displacements{{14, 124}}));  // 22 - 8, 255 - 131
}

TEST_F(Candidates, FailedAllocationFails) {
    Params().Apply();
    TestFrame frame(56, 36, 10, 1);
    Load(frame, frame);
    std::vector<int32_t> di(100);
    std::vector<int32_t> dj(100);
    FailingMalloc::FailFrom(1);
    const int32_t result = fpnavi::FindCandidate(di.data(), dj.data());
    FailingMalloc::Off();
    EXPECT_EQ(result, -1);
    EXPECT_EQ(FailingMalloc::Failures(), 1);
}

TEST_F(Candidates, CandidateListIsFreed) {
    Params().Apply();
    TestFrame frame(56, 36, 10, 1);
    Load(frame, frame);
    std::vector<int32_t> di(100);
    std::vector<int32_t> dj(100);
    FailingMalloc::Count();
    EXPECT_EQ(fpnavi::FindCandidate(di.data(), dj.data()), 0);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Live(), 0);
}

}  // namespace
