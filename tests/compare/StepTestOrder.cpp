// No result depends on what was done before: not on the calls made, nor on what lies in the space
// behind a frame's pixels.
#include <gtest/gtest.h>

#include <optional>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "driver/OrientationCalc.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "gesture/Gesture.h"
#include "matching/PairMatch.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

void FillRooms(int32_t value) {
    FillRoom(&fpnavi::s_imagePrev, value);
    FillRoom(&fpnavi::s_imageCurr, value);
}

// The calls by name for one pair of frames, each against the plain model.
class Calls {
  public:
    static constexpr int32_t kCount = 7;

    // FindMatch gets random displacements where the two frames can be compared.
    Calls(SimRandom& random, bool matchable) : m_matchable(matchable) {
        for (int32_t n = 0; n < fpnavi::s_candidateNum; ++n) {
            m_di.push_back(random.Range(-8, 8));
            m_dj.push_back(random.Range(-8, 8));
        }
    }

    void Make(int32_t call) {
        switch (call) {
            case 0:
                return Keep(&m_candidates, ModuleCandidates(), PlainCandidates());
            case 1:
                if (m_matchable)
                    Keep(&m_match, ModuleMatch(m_di, m_dj), PlainMatch(m_di, m_dj));
                return;
            case 2: {
                const JointOutcome outcome = CalcJoint();
                return Keep(&m_joint, outcome.module, outcome.plain);
            }
            case 3:
                return Keep(&m_noMove, NoMoveOfPair());
            case 4:
                EXPECT_EQ(fpnavi::GetCenterAndCoverage(&fpnavi::s_imageCurr), 0);
                EXPECT_EQ(reference::GetCenterAndCoverage(&reference::s_imageCurr), 0);
                return;
            case 5:
                EXPECT_EQ(fpnavi::OrntCalcProcess(), reference::OrntCalcProcess());
                return;
            default:
                return FillRooms(kRandomJunk);
        }
    }

  private:
    template <typename Result>
    void Keep(std::optional<Result>* kept, const Result& result) {
        Keep(kept, result, result);
    }
    // Equal on both sides, and equal to what the first such call gave.
    template <typename Result>
    void Keep(std::optional<Result>* kept, const Result& module, const Result& plain) {
        EXPECT_TRUE(module == plain);
        if (!*kept)
            *kept = module;
        EXPECT_TRUE(module == **kept) << "another result than the first time";
    }

    bool m_matchable;
    std::vector<int32_t> m_di;
    std::vector<int32_t> m_dj;
    std::optional<Candidates> m_candidates;
    std::optional<MatchResult> m_match;
    std::optional<int32_t> m_joint;
    std::optional<int32_t> m_noMove;
};

void ClearRecords() {
    fpnavi::VoteInfoClear(&fpnavi::s_voteInfo);
    reference::VoteInfoClear(&reference::s_voteInfo);
}

host::ParamBlock OrderParams(SimRandom& random) {
    host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
    ParamValue(params, "s_coverageMinEff") = random.Chance(50) ? 0 : 15;
    ParamValue(params, "s_coverageMinFp") = random.Chance(50) ? 0 : 40;
    ParamValue(params, "s_diffThresholdTol") = random.Range(0, 12);
    ParamValue(params, "s_overlapAreaMinNoMove") = random.Range(0, 40);
    ParamValue(params, "s_smallMoveTolRow") = random.Below(3);
    ParamValue(params, "s_smallMoveTolCol") = random.Below(3);
    return params;
}

// Any of the calls in any order, repeated: each gives what it gave alone, and what the plain model
// gives.
TEST(StepCallOrder, AnyOrderOfCallsGivesTheSameResults) {
    const int64_t cases = StepCases(2500);
    int32_t matchable = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(701, i);
        const host::ParamBlock params = OrderParams(random);
        const bool built = LoadMatchPair(params, RandomPair(random, SizeOf(params)));
        matchable += built ? 1 : 0;
        ClearRecords();
        Calls calls(random, built);
        for (int32_t n = 0; n < 12; ++n) {
            const int32_t call = random.Below(Calls::kCount);
            calls.Make(call);
            ASSERT_TRUE(SameState()) << "case " << i << ", call " << call;
            ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i << ", call " << call;
        }
    }
    EXPECT_GT(matchable, cases / 2);
}

// The same frames with other bytes behind their pixels: 1 and 255 would be finger.
TEST(StepRoom, JunkBehindThePixelsChangesNothing) {
    const int64_t cases = StepCases(1200);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(711, i);
        const host::ParamBlock params = OrderParams(random);
        SetStepParams(params);
        const PairBytes pair = RandomPair(random, SizeOf(params));
        Calls calls(random, ParamValue(params, "s_multiBloclkFlag") != 1);
        for (const int32_t junk : {0, 1, 255, kRandomJunk}) {
            SetRoomJunk(junk);
            LoadPreProcessed(pair);
            FillRooms(junk);
            ClearRecords();
            for (int32_t call = 0; call < Calls::kCount - 1; ++call) {
                calls.Make(call);
                FillRooms(junk);
                ASSERT_TRUE(SameState()) << "case " << i << ", junk " << junk << ", call " << call;
            }
            ASSERT_FALSE(::testing::Test::HasFailure()) << "case " << i << ", junk " << junk;
        }
        SetRoomJunk(kRandomJunk);
    }
}

// Junk behind the pixels that the steps on one frame read and write.
TEST(StepRoom, JunkBehindThePixelsOfAFrameChangesNothing) {
    const int64_t cases = StepCases(4000);
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(712, i);
        const FrameSize size = RandomSize(random);
        SetStepParams(size, {{"s_cutOffPercent", random.Range(0, 12)}});
        const std::vector<uint8_t> greys = RandomGreys(random, size);
        for (const int32_t junk : {0, 1, 255, kRandomJunk}) {
            TwinFrame twin(size, greys, FlatBytes(size, 0));
            FillRoom(twin.Module(), junk);
            ASSERT_EQ(fpnavi::ImgPreProcess(twin.Module()), 0);
            ASSERT_EQ(reference::ImgPreProcess(twin.Plain()), 0);
            FillRoom(twin.Module(), junk);
            ASSERT_EQ(fpnavi::GetCenterAndCoverage(twin.Module()), 0);
            ASSERT_EQ(reference::GetCenterAndCoverage(twin.Plain()), 0);
            ASSERT_TRUE(twin.Same()) << "case " << i << ", junk " << junk;
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
