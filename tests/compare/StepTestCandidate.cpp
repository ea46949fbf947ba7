// The candidate search against the plain model: the heap, and the whole arrays of candidates in
// their order.
#include <gtest/gtest.h>

#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "matching/CandidateSearch.h"

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

// test: number of the random sequence. Frames are drawn by draw(random, size).
template <typename DrawPair>
void CompareSearches(uint64_t test, int64_t cases, DrawPair draw) {
    int32_t found = 0;
    SearchClasses classes;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        SetStepParams(params);
        draw(random, SizeOf(params));
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        const int32_t result = CompareCandidates();
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        if (result != 0)
            continue;
        ++found;
        classes.Note(params);
    }
    EXPECT_GT(found, cases / 4) << "most parameters made no search";
    classes.ExpectAll();
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

}  // namespace
}  // namespace fpnavi_test
