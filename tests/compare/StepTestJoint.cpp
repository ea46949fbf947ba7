// Template matching as a whole against the plain model: the record's entries, the full images, the
// failures.
#include <gtest/gtest.h>

#include "FailingMalloc.h"
#include "StepFrames.h"
#include "StepTestPair.h"
#include "matching/PairMatch.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

// Runs CalcImgJoint of both on the pair that draw(random, size) loads, case by case.
template <typename DrawPair>
void CompareJoints(uint64_t test, int64_t cases, DrawPair draw) {
    int64_t joined = 0;
    SearchClasses classes;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(test, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        SetStepParams(params);
        draw(random, SizeOf(params));
        const JointOutcome outcome = CalcJoint();
        ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i;
        ASSERT_EQ(outcome.module, outcome.plain) << "case " << i;
        ASSERT_TRUE(SameState()) << "case " << i;
        if (outcome.module != 0)
            continue;
        ++joined;
        classes.Note(params);
    }
    classes.ExpectAll();
    EXPECT_GT(joined, cases / 4) << "most parameters allowed no search";
    EXPECT_LT(joined, cases) << "nothing failed";
}

TEST(StepCalcImgJoint, RandomClassMapsGiveTheSameRecord) {
    CompareJoints(501, StepCases(6000),
                  [](SimRandom& random, FrameSize size) { LoadPair(RandomPair(random, size)); });
}

TEST(StepCalcImgJoint, PreProcessedFramesGiveTheSameRecord) {
    CompareJoints(502, StepCases(5000), [](SimRandom& random, FrameSize size) {
        LoadPreProcessed(RandomPair(random, size));
    });
}

TEST(StepCalcImgJoint, PeriodicFramesGiveTheSameRecord) {
    CompareJoints(503, StepCases(5000), [](SimRandom& random, FrameSize size) {
        const Pattern pattern = RandomPattern(random);
        const int32_t column = random.Below(9);
        const int32_t row = random.Below(9);
        LoadPair({RepeatPattern(pattern, size, 0, 0), RandomTypes(random, size),
                  RepeatPattern(pattern, size, column, row), RandomTypes(random, size)});
    });
}

// The device's own geometry, and the same without gaps and in one block.
TEST(StepCalcImgJoint, DefaultGeometryGivesTheSameRecord) {
    const int64_t cases = StepCases(2500);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(504, i);
        host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, random.Chance(30));
        ParamValue(params, "s_multiBloclkFlag") = random.Chance(70) ? 1 : 0;
        SetStepParams(params);
        LoadPreProcessed(RandomPair(random, SizeOf(params)));
        const JointOutcome outcome = CalcJoint();
        ASSERT_EQ(outcome.module, 0);
        ASSERT_EQ(outcome.plain, 0);
        ASSERT_TRUE(SameState()) << "case " << i;
    }
}

// One allocation fails, alone or with all that follow: the same failures, the same frames left.
TEST(StepCalcImgJoint, FailedAllocationsLeaveTheSameState) {
    const int64_t cases = StepCases(4000);
    int64_t failures = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(505, i);
        SetStepParams(RandomSearchParams(random, {random.Range(20, 70), random.Range(20, 66)}));
        LoadPair(RandomPair(random, {fpnavi::s_imageWidth, fpnavi::s_imageHeight}));
        const int32_t number = random.Range(1, 9);
        const bool forGood = random.Chance(50);
        if (forGood)
            FailingMalloc::FailFrom(number);
        else
            FailingMalloc::FailNth(number);
        const int32_t module = fpnavi::CalcImgJoint();
        FailingMalloc::Off();
        reference::s_allocationCount = 1;
        reference::s_failAllocation = forGood ? -1 : number;
        reference::s_failAllocationsFrom = forGood ? number : -1;
        const int32_t plain = reference::CalcImgJoint();
        reference::s_failAllocation = -1;
        reference::s_failAllocationsFrom = -1;
        failures += module != 0 ? 1 : 0;
        ASSERT_EQ(module, plain) << "case " << i << ", allocation " << number;
        ASSERT_TRUE(SameState()) << "case " << i << ", allocation " << number;
    }
    EXPECT_GT(failures, 0);
}

}  // namespace
}  // namespace fpnavi_test
