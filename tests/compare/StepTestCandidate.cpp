// The candidate search against the plain model: the heap, and the whole arrays of candidates in
// their order.
#include <gtest/gtest.h>

#include <algorithm>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "matching/CandidateHeap.h"
#include "matching/CandidateSearch.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

void CompareHeapify(std::vector<uint32_t> keys, int32_t len, int32_t i) {
    std::vector<uint32_t> plain = keys;
    ASSERT_EQ(fpnavi::MaxHeapify(keys.data(), len, i), reference::MaxHeapify(plain.data(), len, i));
    ASSERT_EQ(keys, plain) << "length " << len << ", from " << i;
}

// Keys of few values, so that equal parents and children are common.
TEST(StepMaxHeapify, RandomArraysComeOutTheSame) {
    const int64_t cases = StepCases(100000);
    for (int64_t n = 0; n < cases; ++n) {
        SimRandom random = StepRandom(301, n);
        std::vector<uint32_t> keys(static_cast<size_t>(random.Range(1, 200)));
        const int32_t values = random.Chance(50) ? random.Range(1, 6) : 1 << 30;
        for (uint32_t& key : keys)
            key = static_cast<uint32_t>(random.Below(values)) * 0x00FFFFFFU;
        const int32_t len = static_cast<int32_t>(keys.size()) - (random.Chance(20) ? 1 : 0);
        CompareHeapify(keys, len, random.Chance(50) ? 0 : random.Range(0, len + 1));
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << n;
    }
}

// All arrays of up to seven keys of three values, from each place.
TEST(StepMaxHeapify, AllSmallArraysComeOutTheSame) {
    for (int32_t len = 1; len <= 7; ++len) {
        int32_t arrays = 1;
        for (int32_t n = 0; n < len; ++n)
            arrays *= 3;
        for (int32_t array = 0; array < arrays; ++array) {
            std::vector<uint32_t> keys(static_cast<size_t>(len));
            int32_t rest = array;
            for (uint32_t& key : keys) {
                key = static_cast<uint32_t>(rest % 3);
                rest /= 3;
            }
            for (int32_t i = 0; i <= len; ++i)
                CompareHeapify(keys, len, i);
            ASSERT_FALSE(::testing::Test::HasFailure());
        }
    }
}

TEST(StepMaxHeapify, OfEqualChildrenTheLeftOneRises) {
    std::vector<uint32_t> keys = {1, 5, 5, 2, 2, 2, 2};
    std::vector<uint32_t> plain = keys;
    EXPECT_EQ(fpnavi::MaxHeapify(keys.data(), 7, 0), 0);
    EXPECT_EQ(reference::MaxHeapify(plain.data(), 7, 0), 0);
    EXPECT_EQ(keys, (std::vector<uint32_t>{5, 2, 5, 1, 2, 2, 2}));
    EXPECT_EQ(keys, plain);
}

void CompareCandidates(const char* what, int64_t i) {
    const Candidates module = ModuleCandidates();
    const Candidates plain = PlainCandidates();
    ASSERT_EQ(module.result, plain.result) << what << " " << i;
    ASSERT_EQ(module.di, plain.di) << what << " " << i;
    ASSERT_EQ(module.dj, plain.dj) << what << " " << i;
    ASSERT_TRUE(SameState()) << what << " " << i;
}

// test: number of the random sequence. Frames are drawn by draw(random, size).
template <typename DrawPair>
void CompareSearches(uint64_t test, int64_t cases, DrawPair draw) {
    int32_t found = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        SetStepParams(params);
        draw(random, SizeOf(params));
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        CompareCandidates("case", i);
        ASSERT_FALSE(::testing::Test::HasFailure());
        if (ModuleCandidates().result == 0)
            ++found;
    }
    EXPECT_GT(found, cases / 3) << "most parameters made no search";
}

TEST(StepFindCandidate, RandomClassMapsGiveTheSameArrays) {
    CompareSearches(311, StepCases(8000),
                    [](SimRandom& random, FrameSize size) { LoadPair(RandomPair(random, size)); });
}

TEST(StepFindCandidate, PreProcessedFramesGiveTheSameArrays) {
    CompareSearches(312, StepCases(6000), [](SimRandom& random, FrameSize size) {
        LoadPreProcessed(RandomPair(random, size));
    });
}

// Full class maps: every template is searched, with many equal differences.
TEST(StepFindCandidate, PeriodicFramesGiveTheSameArrays) {
    CompareSearches(313, StepCases(6000), [](SimRandom& random, FrameSize size) {
        const Pattern pattern = RandomPattern(random);
        const int32_t column = random.Below(9);
        const int32_t row = random.Below(9);
        LoadPair({RepeatPattern(pattern, size, 0, 0), FlatBytes(size, 1),
                  RepeatPattern(pattern, size, column, row), FlatBytes(size, 1)});
    });
}

// Every template of 1..20 x 1..20 pixels on one frame: pieces end at 64 pixels and 16 columns.
TEST(StepFindCandidate, EveryTemplateSizeGivesTheSameArrays) {
    const FrameSize size = {56, 50};
    SimRandom random = StepRandom(314, 0);
    for (int32_t width = 1; width <= 20; ++width) {
        for (int32_t height = 1; height <= 20; ++height) {
            SetStepParams(size, {{"s_boundWidth", 10},
                                 {"s_boundHeight", 10},
                                 {"s_centerWidth", 36},
                                 {"s_centerHeight", 30},
                                 {"s_multiBloclkFlag", 0},
                                 {"s_templateWidth", width},
                                 {"s_templateHeight", height},
                                 {"s_candidateNum", 1 + (width * height) % 40}});
            PairBytes pair = RandomPair(random, size);
            pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
            LoadPair(pair);
            CompareCandidates("template", width * 100 + height);
            ASSERT_FALSE(::testing::Test::HasFailure());
        }
    }
}

TEST(StepFindCandidate, EverySizeReadsNothingBehindTheLastPixel) {
    SimRandom random = StepRandom(315, 0);
    for (int32_t width = 8; width <= 70; ++width) {
        for (const int32_t height : {8, 15, 16, 17, 24, 63, 64, 65}) {
            const FrameSize size = {width, height};
            SetStepParams(size, {{"s_boundWidth", 2},
                                 {"s_boundHeight", 2},
                                 {"s_centerWidth", width - 4},
                                 {"s_centerHeight", height - 4},
                                 {"s_templateWidth", random.Range(1, 4)},
                                 {"s_templateHeight", random.Range(1, 2)},
                                 {"s_candidateNum", random.Range(1, 30)}});
            PairBytes pair = RandomPair(random, size);
            pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
            LoadPair(pair);
            ASSERT_EQ(ModuleCandidates().result, 0);
            CompareCandidates("width", width);
            ASSERT_FALSE(::testing::Test::HasFailure());
        }
    }
}

// A centre of columns x rows pixels, searched with a template of one pixel: as many placements.
void SearchCentre(int32_t columns, int32_t rows) {
    const FrameSize size = {columns + 4, rows + 4};
    SetStepParams(size, {{"s_boundWidth", 2},
                         {"s_boundHeight", 2},
                         {"s_centerWidth", columns},
                         {"s_centerHeight", rows},
                         {"s_templateWidth", 1},
                         {"s_templateHeight", 1},
                         {"s_candidateNum", 200}});
    SimRandom random = StepRandom(316, columns);
    PairBytes pair = RandomPair(random, size);
    pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
    LoadPair(pair);
    ASSERT_EQ(ModuleCandidates().result, 0);
    CompareCandidates("columns", columns);
}

TEST(StepFindCandidateTrap, PlacementsOf512And513GiveTheSameArrays) {
    SearchCentre(32, 16);
    SearchCentre(16, 32);
    SearchCentre(27, 19);
    SearchCentre(19, 27);
}

TEST(StepFindCandidateTrap, SidesOf64And65GiveTheSameArrays) {
    SearchCentre(60, 8);
    SearchCentre(61, 8);
    SearchCentre(8, 60);
    SearchCentre(8, 61);
}

void SearchWithTemplate(int32_t width, int32_t height) {
    const FrameSize size = {50, 48};
    SetStepParams(size, {{"s_boundWidth", 14},
                         {"s_boundHeight", 14},
                         {"s_centerWidth", 22},
                         {"s_centerHeight", 20},
                         {"s_multiBloclkFlag", 0},
                         {"s_templateWidth", width},
                         {"s_templateHeight", height}});
    SimRandom random = StepRandom(317, width);
    for (int32_t n = 0; n < 20; ++n) {
        PairBytes pair = RandomPair(random, size);
        pair.prevTypes = pair.currTypes = FlatBytes(size, 1);
        LoadPair(pair);
        ASSERT_EQ(ModuleCandidates().result, 0);
        CompareCandidates("template of width", width);
    }
}

TEST(StepFindCandidateTrap, TemplatesOf64And65PixelsGiveTheSameArrays) {
    SearchWithTemplate(8, 8);
    SearchWithTemplate(16, 4);
    SearchWithTemplate(13, 5);
    SearchWithTemplate(5, 13);
}

TEST(StepFindCandidateTrap, TemplatesOf16And17ColumnsGiveTheSameArrays) {
    SearchWithTemplate(16, 3);
    SearchWithTemplate(17, 3);
    SearchWithTemplate(3, 17);
}

// Both frames full of finger, black against white: every placement differs by 255, and the list
// keeps its sentinels, which stand for row 0, column 0 of template 0.
TEST(StepFindCandidateTrap, DifferenceOf255NeverReplacesASentinel) {
    for (const int32_t width : {40, 65}) {
        const FrameSize size = {width, 36};
        for (const int32_t brightest : {255, 254}) {
            SetStepParams(size, {{"s_boundWidth", 8},
                                 {"s_boundHeight", 8},
                                 {"s_centerWidth", width - 16},
                                 {"s_centerHeight", 20},
                                 {"s_templateWidth", 4},
                                 {"s_templateHeight", 4},
                                 {"s_candidateNum", 9}});
            LoadPair({FlatBytes(size, 0), FlatBytes(size, 1),
                      FlatBytes(size, static_cast<uint8_t>(brightest)), FlatBytes(size, 1)});
            CompareCandidates("width", width);
            const Candidates module = ModuleCandidates();
            // Template 0 lies at row 8 (the border) and column (width - 4) / 2 of the frame.
            const bool sentinels = std::all_of(module.di.begin(), module.di.end(),
                                               [](int32_t di) { return di == -8; }) &&
                                   std::all_of(module.dj.begin(), module.dj.end(),
                                               [=](int32_t dj) { return dj == -(width - 4) / 2; });
            EXPECT_EQ(sentinels, brightest == 255);
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
