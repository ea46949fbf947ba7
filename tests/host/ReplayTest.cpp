// The replay loop's rules: which frames the module gets, when the vote comes, how a key is judged.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "GestureBuilder.h"
#include "common/Error.h"
#include "replay/Replay.h"

namespace {

using host::Mode;
using host::ReplayHere;
using host::ReplayResult;
using host::Verdict;
using host_test::GestureBuilder;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::vector<int32_t> Statuses(const ReplayResult& result) {
    std::vector<int32_t> statuses;
    for (const host::FrameCalls& calls : result.calls)
        statuses.push_back(calls.status);
    return statuses;
}

TEST(Replay, AbsentFramesBeforeThePresentOnesDoNotEndTheGesture) {
    const ReplayResult result =
        ReplayHere(GestureBuilder(Mode::Fp).Empty().Empty().Skin(0).Skin(6).Skin(12).Empty().Get());
    EXPECT_THAT(Statuses(result), ElementsAre(0, 0, 1, 1, 1, 0));
    EXPECT_EQ(result.pairs, 2);
    EXPECT_EQ(result.key, VKEY_RIGHT);
    EXPECT_THAT(result.errors, IsEmpty());
}

TEST(Replay, VotesAtTheFirstAbsentFrameAfterAPresentOne) {
    const ReplayResult result =
        ReplayHere(GestureBuilder(Mode::Fp).Skin(0).Skin(6).Empty().Skin(0).Skin(-9).Get());
    EXPECT_EQ(result.calls.size(), 3U);
    EXPECT_EQ(result.voteTimeOut, 0);
    EXPECT_EQ(result.pairs, 1);
    EXPECT_EQ(result.frameCount, 5);
}

TEST(Replay, VotesWithTimeOutAtTheEndWhenTheFingerNeverLeft) {
    for (const auto end : {host::GestureEnd::TimeOut, host::GestureEnd::Lift}) {
        host::Gesture gesture = GestureBuilder(Mode::Fp).Skin(0).Skin(6).Skin(12).Get();
        gesture.end = end;
        const ReplayResult result = ReplayHere(gesture);
        EXPECT_EQ(result.voteTimeOut, 1);
        EXPECT_EQ(result.pairs, 2);
        EXPECT_EQ(result.key, VKEY_RIGHT);
    }
}

TEST(Replay, AGestureWithoutFingerIsNoMove) {
    const ReplayResult result = ReplayHere(GestureBuilder(Mode::Fp).Empty().Empty().Get());
    EXPECT_EQ(result.voteTimeOut, 1);
    EXPECT_EQ(result.pairs, 0);
    EXPECT_EQ(result.key, VKEY_NO_MOVE);
}

TEST(Replay, AGestureWithoutFramesIsNoMove) {
    const ReplayResult result = ReplayHere(GestureBuilder(Mode::Hg).Get());
    EXPECT_THAT(result.calls, IsEmpty());
    EXPECT_EQ(result.key, VKEY_NO_MOVE);
}

TEST(Replay, StartsEachGestureAfresh) {
    const host::Gesture up = GestureBuilder(Mode::Fp).Skin(0).Skin(0, 6).Skin(0, 12).Empty().Get();
    const ReplayResult first = ReplayHere(up);
    ReplayHere(GestureBuilder(Mode::Fp).Skin(0).Skin(6).Get());
    const ReplayResult second = ReplayHere(up);
    EXPECT_EQ(first.key, VKEY_UP);
    EXPECT_EQ(second.key, VKEY_UP);
    EXPECT_EQ(second.pairs, first.pairs);
}

TEST(Replay, AFailedCallIsReportedAndTheGestureWrong) {
    // Templates without area cannot be matched; the failure lasts until the gesture's end.
    const ReplayResult result = ReplayHere(GestureBuilder(Mode::Fp)
                                               .Param("s_templateWidth", 0)
                                               .Skin(0)
                                               .Skin(6)
                                               .Skin(12)
                                               .Empty()
                                               .Label(VKEY_NO_MOVE)
                                               .Get());
    EXPECT_THAT(result.errors, ElementsAre("frame 1: OrientationCalc returned -1",
                                           "frame 2: OrientationCalc returned -1"));
    EXPECT_EQ(result.key, VKEY_NO_MOVE);  // an empty record
    EXPECT_EQ(result.verdict, Verdict::Wrong);
}

TEST(Replay, AnAbandonedVoteIsReported) {
    // The centroid of a still pair of patches does not move, and s_minDelta 0 lets it be scored.
    const ReplayResult result = ReplayHere(GestureBuilder(Mode::Fp)
                                               .Param("s_minDelta", 0)
                                               .Param("s_overlapAreaMinNoMove", 100000)
                                               .Skin(0)
                                               .Skin(0)
                                               .Get());
    EXPECT_EQ(result.key, -1);
    EXPECT_THAT(result.errors, ElementsAre("Voting returned -1"));
}

std::string RefusalOf(const host::Gesture& gesture) {
    try {
        ReplayHere(gesture);
    } catch (const host::Error& error) {
        return error.what();
    }
    return "";
}

TEST(Replay, RefusesFramesOfAnotherSize) {
    host::Gesture gesture = GestureBuilder(Mode::Fp, "short").Skin(0).Get();
    gesture.frames[0].raw.pop_back();
    EXPECT_THAT(RefusalOf(gesture), HasSubstr("short"));
}

TEST(Replay, RefusesParametersOfAnotherGeometry) {
    EXPECT_THAT(
        RefusalOf(GestureBuilder(Mode::Fp, "wide").Skin(0).Param("s_blockWidthFp", 9).Get()),
        HasSubstr("wide"));
}

TEST(Replay, RefusesParametersOfAnotherMode) {
    EXPECT_THAT(RefusalOf(GestureBuilder(Mode::Fp, "odd").Skin(0).Param("s_modeFlag", 2).Get()),
                HasSubstr("odd"));
}

TEST(Replay, RefusesAFingerTestBeyondTheFrame) {
    EXPECT_THAT(RefusalOf(GestureBuilder(Mode::Hg).Skin(0).Param("s_imageHeightHg", 49).Get()),
                HasSubstr("1960 pixels, but a frame has 1920"));
}

TEST(Replay, HooksSeeEachFrameInOrder) {
    std::vector<size_t> before;
    std::vector<size_t> after;
    host::ReplayHooks hooks;
    hooks.beforeOrientation = [&](size_t frame) { before.push_back(frame); };
    hooks.afterFrame = [&](size_t frame, const host::FrameCalls&) { after.push_back(frame); };
    ReplayHere(GestureBuilder(Mode::Fp).Empty().Skin(0).Empty().Get(), hooks);
    EXPECT_THAT(before, ElementsAre(0, 1, 2));
    EXPECT_THAT(after, ElementsAre(0, 1, 2));
}

TEST(JudgeKey, TheLabelIsRight) {
    EXPECT_EQ(host::JudgeKey(VKEY_UP, VKEY_UP, {}), Verdict::Right);
    EXPECT_EQ(host::JudgeKey(VKEY_NONE, VKEY_NONE, {VKEY_UP}), Verdict::Right);
}

TEST(JudgeKey, AnAcceptedKeyIsNoError) {
    EXPECT_EQ(host::JudgeKey(VKEY_NO_MOVE, VKEY_UP, {VKEY_UP, VKEY_NO_MOVE}), Verdict::Accepted);
}

TEST(JudgeKey, AnyOtherKeyIsWrong) {
    EXPECT_EQ(host::JudgeKey(VKEY_DOWN, VKEY_UP, {VKEY_UP, VKEY_NO_MOVE}), Verdict::Wrong);
    EXPECT_EQ(host::JudgeKey(-1, VKEY_UP, {VKEY_UP}), Verdict::Wrong);
}

TEST(JudgeKey, WithoutALabelAKeyIsAcceptedOrWrong) {
    EXPECT_EQ(host::JudgeKey(VKEY_UP, std::nullopt, {VKEY_UP, VKEY_RIGHT}), Verdict::Accepted);
    EXPECT_EQ(host::JudgeKey(VKEY_DOWN, std::nullopt, {VKEY_UP, VKEY_RIGHT}), Verdict::Wrong);
}

TEST(JudgeKey, WithoutALabelAndAcceptedKeysNothingIsKnown) {
    EXPECT_EQ(host::JudgeKey(VKEY_DOWN, std::nullopt, {}), Verdict::Unknown);
    EXPECT_EQ(host::JudgeKey(VKEY_NO_MOVE, std::nullopt, {}), Verdict::Unknown);
}

TEST(JudgeKey, AnAcceptedListOfAnotherLabelDoesNotCount) {
    EXPECT_EQ(host::JudgeKey(VKEY_UP, VKEY_DOWN, {VKEY_UP}), Verdict::Wrong);
    EXPECT_EQ(host::JudgeKey(VKEY_NO_MOVE, VKEY_DOWN, {VKEY_UP, VKEY_NO_MOVE}), Verdict::Wrong);
    EXPECT_EQ(host::JudgeKey(VKEY_DOWN, VKEY_DOWN, {VKEY_UP}), Verdict::Right);
    EXPECT_EQ(host::JudgeKey(VKEY_UP, VKEY_DOWN, {}), Verdict::Wrong);
}

TEST(Replay, AFailedCallIsWrongWithoutALabelToo) {
    const ReplayResult result = ReplayHere(
        GestureBuilder(Mode::Fp).Param("s_templateWidth", 0).Skin(0).Skin(6).Empty().Get());
    EXPECT_EQ(result.verdict, Verdict::Wrong);
}

TEST(Replay, WithoutALabelTheVerdictIsUnknown) {
    EXPECT_EQ(ReplayHere(GestureBuilder(Mode::Fp).Skin(0).Skin(6).Empty().Get()).verdict,
              Verdict::Unknown);
}

}  // namespace
