// The frame-by-frame trace: which gate or test decided each pair, for gestures built to meet each.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "GestureBuilder.h"
#include "replay/Explain.h"

namespace {

using host::ExplainHere;
using host::Explanation;
using host::Mode;
using host::SettledBy;
using host_test::GestureBuilder;
using host_test::Rect;
using ::testing::ElementsAre;

std::vector<SettledBy> Settled(const Explanation& explanation) {
    std::vector<SettledBy> settled;
    for (const host::FrameTrace& trace : explanation.frames)
        settled.push_back(trace.settledBy);
    return settled;
}

TEST(Explain, SkinThatMovesFarIsSettledByTheTemplates) {
    const Explanation moved = ExplainHere(
        GestureBuilder(Mode::Fp).Empty().Skin(0).At(10, 10).Skin(6, 4).At(16, 6).Empty().Get());
    EXPECT_THAT(Settled(moved), ElementsAre(SettledBy::NoFinger, SettledBy::FirstFrame,
                                            SettledBy::TemplateMatch, SettledBy::NoFinger));
    const host::FrameTrace& pair = moved.frames[2];
    EXPECT_EQ(pair.pair, 0);
    ASSERT_TRUE(pair.fingerprint.has_value());
    EXPECT_EQ(pair.fingerprint->dx, 6);
    EXPECT_EQ(pair.fingerprint->dy, 4);
    EXPECT_EQ(pair.fingerprint->key, VKEY_RIGHT);
    EXPECT_LT(pair.fingerprint->difference.value_or(255), 30);
    ASSERT_TRUE(pair.truth.has_value());
    EXPECT_DOUBLE_EQ(pair.truth->dx, 6.0);
    EXPECT_DOUBLE_EQ(pair.truth->dy, 4.0);  // y16 fell: upwards
    EXPECT_FALSE(pair.doubleScan.has_value());
}

TEST(Explain, RestingSkinIsSettledByTheNoMoveTest) {
    const Explanation rest = ExplainHere(GestureBuilder(Mode::Fp).Skin(0).Skin(0).Get());
    EXPECT_THAT(Settled(rest), ElementsAre(SettledBy::FirstFrame, SettledBy::NoMoveTest));
    EXPECT_EQ(rest.frames[1].centroid->key, VKEY_NO_MOVE);
    EXPECT_EQ(rest.frames[1].fingerprint->key, VKEY_NO_MOVE);
    EXPECT_FALSE(rest.frames[1].fingerprint->difference.has_value());
}

TEST(Explain, PatchesApartLeaveTheNoMoveTestUndetermined) {
    // 20 x 20 of 2016 pixels are 19 percent; 30 columns apart they have no pixel in common.
    const Explanation apart = ExplainHere(
        GestureBuilder(Mode::Fp).Patch(Rect{8, 0, 20, 20}).Patch(Rect{8, 30, 20, 20}).Get());
    EXPECT_EQ(apart.frames[1].settledBy, SettledBy::NoMoveUndetermined);
    EXPECT_EQ(apart.frames[1].fingerprint->key, VKEY_NONE);
    EXPECT_EQ(apart.frames[1].pair, 0);
}

TEST(Explain, ASmallPatchIsBelowTheCoverageMinimum) {
    // 12 x 12 of 2016 pixels are 7 percent, less than 15.
    const Explanation small = ExplainHere(
        GestureBuilder(Mode::Fp).Patch(Rect{12, 20, 12, 12}).Patch(Rect{12, 20, 12, 12}).Get());
    EXPECT_EQ(small.frames[1].settledBy, SettledBy::CoverageMinimum);
    EXPECT_LE(small.frames[1].coverage.value_or(100), 7);
    EXPECT_FALSE(small.frames[1].pair.has_value());
    EXPECT_FALSE(small.frames[1].centroid.has_value());
    EXPECT_EQ(small.result.pairs, 0);
}

TEST(Explain, AMovedMiddlingPatchIsBelowTheTemplateMinimum) {
    // 24 x 30 of 2016 pixels are 35 percent: enough for a pair, not for the templates.
    const Explanation part = ExplainHere(
        GestureBuilder(Mode::Fp).Patch(Rect{6, 13, 24, 30}).Patch(Rect{6, 13, 24, 30}, 7).Get());
    EXPECT_EQ(part.frames[1].settledBy, SettledBy::TemplateCoverage);
    EXPECT_EQ(part.frames[1].pair, 0);
    EXPECT_FALSE(part.frames[1].fingerprint.has_value());
}

TEST(Explain, HgKnowsTheCentroidOnly) {
    // A patch of 20 columns moves by 10 of 40 columns: 25 percent, 10 pixels.
    const Explanation hg = ExplainHere(GestureBuilder(Mode::Hg)
                                           .Patch(Rect{4, 4, 40, 20})
                                           .Patch(Rect{4, 14, 40, 20})
                                           .Empty()
                                           .Label(VKEY_RIGHT)
                                           .Get());
    EXPECT_THAT(Settled(hg),
                ElementsAre(SettledBy::FirstFrame, SettledBy::CentroidOnly, SettledBy::NoFinger));
    EXPECT_NEAR(hg.frames[1].centroid->dx, 10, 1);
    EXPECT_EQ(hg.frames[1].centroid->key, VKEY_RIGHT);
    EXPECT_FALSE(hg.frames[1].fingerprint.has_value());
    EXPECT_EQ(hg.result.verdict, host::Verdict::Right);
}

TEST(Explain, AFailureLastsToTheEnd) {
    const Explanation failed = ExplainHere(
        GestureBuilder(Mode::Fp).Param("s_templateWidth", 0).Skin(0).Skin(6).Skin(6).Get());
    EXPECT_THAT(Settled(failed),
                ElementsAre(SettledBy::FirstFrame, SettledBy::Failed, SettledBy::Failed));
    EXPECT_FALSE(failed.frames[1].coverage.has_value());
}

TEST(Explain, TheHundredthPairFindsTheRecordFull) {
    GestureBuilder builder(Mode::Fp);
    for (int32_t i = 0; i < 102; ++i)
        builder.Skin(0);
    const Explanation full = ExplainHere(builder.Get());
    ASSERT_EQ(full.frames.size(), 102U);
    EXPECT_EQ(full.frames[99].settledBy, SettledBy::NoMoveTest);  // pair 98, the last that fits
    EXPECT_EQ(full.frames[100].settledBy, SettledBy::RecordFull);
    EXPECT_EQ(full.frames[101].settledBy, SettledBy::RecordFull);
    EXPECT_EQ(full.result.pairs, 99);
}

TEST(Explain, CoverageOfTheFirstFrameIsMeasuredToo) {
    const Explanation first = ExplainHere(GestureBuilder(Mode::Fp).Patch(Rect{0, 0, 18, 56}).Get());
    EXPECT_NEAR(first.frames[0].coverage.value_or(0), 50, 2);
    EXPECT_NEAR(first.frames[0].yc, 25, 2);  // the upper half
}

TEST(Explain, GivesTheSameResultAsThePlainReplay) {
    const host::Gesture gesture =
        GestureBuilder(Mode::Fp).Skin(0).Skin(-6).Skin(-12).Empty().Label(VKEY_LEFT).Get();
    const host::ReplayResult plain = host::ReplayHere(gesture);
    const host::ReplayResult traced = ExplainHere(gesture).result;
    EXPECT_EQ(plain.key, VKEY_LEFT);
    EXPECT_EQ(traced.key, plain.key);
    EXPECT_EQ(traced.pairs, plain.pairs);
}

// In a child: the double scan stays on for the life of a process. The map's left half has its
// centroid at -25 percent, the right half at +25, and each covers 50.
bool DoubleScanIsTraced() {
    const Explanation scan = ExplainHere(GestureBuilder(Mode::DoubleScan)
                                             .Skin(0)
                                             .Registers(0xF0F0F0F0, 0xF0F0F0F0)
                                             .Skin(6)
                                             .Registers(0x0F0F0F0F, 0x0F0F0F0F)
                                             .Get());
    const std::optional<host::DoubleScanMove>& move = scan.frames[1].doubleScan;
    return scan.frames[1].settledBy == SettledBy::TemplateMatch && move && move->dx == 50 &&
           move->dy == 0 && move->coverage == 50;
}

TEST(Explain, TheDoubleScanIsTraced) {
    const pid_t pid = fork();
    if (pid == 0)
        _exit(DoubleScanIsTraced() ? 0 : 1);
    int status = -1;
    ASSERT_EQ(waitpid(pid, &status, 0), pid);
    EXPECT_EQ(status, 0);
}

}  // namespace
