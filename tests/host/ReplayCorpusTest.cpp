// A store replayed: its order, damaged rows, parameters laid over the recorded ones.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "ReplayTestSupport.h"
#include "StoreTestSupport.h"
#include "replay/ReplayCorpus.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Mode;
using host::ReplayResult;
using host::Verdict;
using host_test::DoubleScan;
using host_test::Ids;
using host_test::Resting;
using host_test::Right;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

class ReplayCorpus : public ::testing::Test {
  protected:
    void SetUp() override {
        m_folder = host_test::TestDirectory();
        m_replay.path = m_folder + "/corpus.db";
    }

    void Store(const std::vector<Gesture>& gestures) const {
        host::Store store = host::Store::Create(m_replay.path);
        for (const Gesture& gesture : gestures)
            store.Append(gesture);
    }

    std::string Write(const std::string& name, const std::string& text) const {
        host_test::WriteText(m_folder + "/" + name, text);
        return m_folder + "/" + name;
    }

    std::vector<ReplayResult> Results() const {
        std::vector<ReplayResult> results;
        host::ReplayCorpus(
            m_replay, [](const host::StoreExtent&) {},
            [&](size_t, const ReplayResult& result) { results.push_back(result); });
        return results;
    }

    std::string m_folder;
    host::CorpusReplay m_replay;
};

TEST_F(ReplayCorpus, ReplaysAStoreInItsOrderWithOverrides) {
    Store({DoubleScan("z"), Right("y"), Resting("x")});
    EXPECT_THAT(Ids(Results()), ElementsAre("z", "y", "x"));
    EXPECT_EQ(Results()[1].key, VKEY_RIGHT);
    m_replay.overrides = host::ReadOverrides(Write("back.toml", "s_sensorBackFlag = 1\n"));
    EXPECT_EQ(Results()[1].key, VKEY_LEFT);
}

TEST_F(ReplayCorpus, SaysWhatThereIsBeforeTheFirstResult) {
    Store({Right("first"), Right("b")});
    std::vector<int64_t> calls;
    host::ReplayCorpus(
        m_replay,
        [&](const host::StoreExtent& extent) {
            calls.insert(calls.end(), {extent.count, extent.longestId});
        },
        [&](size_t, const ReplayResult&) { calls.push_back(0); });
    EXPECT_THAT(calls, ElementsAre(2, 5, 0, 0));
}

TEST_F(ReplayCorpus, ReplaysWhatWasThereAtTheStart) {
    Store({Right("a")});
    std::vector<ReplayResult> results;
    host::ReplayCorpus(
        m_replay,
        [&](const host::StoreExtent&) {
            host::Store::OpenForAppending(m_replay.path).Append(Right("b"));
        },
        [&](size_t, const ReplayResult& result) { results.push_back(result); });
    EXPECT_THAT(Ids(results), ElementsAre("a"));
}

TEST_F(ReplayCorpus, ADamagedModeMakesOneGestureUnreadable) {
    Store({Right("a"), Right("b")});
    host_test::RunSql(m_replay.path, "UPDATE gesture SET mode = 'fq' WHERE id = 'a'");
    const std::vector<ReplayResult> results = Results();
    ASSERT_THAT(Ids(results), ElementsAre("a", "b"));
    EXPECT_EQ(results[0].verdict, Verdict::Unreadable);
    EXPECT_THAT(results[0].errors, ElementsAre(HasSubstr("mode 'fq', expected fp, hg or ds")));
    EXPECT_EQ(results[1].verdict, Verdict::Right);
}

TEST_F(ReplayCorpus, AnIdThatIsNoTextMakesOneGestureUnreadable) {
    Store({Right("a"), Right("b")});
    host_test::RunSql(m_replay.path, "UPDATE gesture SET id = x'41' WHERE id = 'a'");
    const std::vector<ReplayResult> results = Results();
    ASSERT_THAT(Ids(results), ElementsAre("row 1", "b"));
    EXPECT_EQ(results[0].verdict, Verdict::Unreadable);
    EXPECT_EQ(results[1].verdict, Verdict::Right);
}

TEST_F(ReplayCorpus, OverridesAreWhatTheFileNamesAndNoMore) {
    const host::ParamOverrides overrides = host::ReadOverrides(Write(
        "some.toml", "s_minDelta = 0\ns_sensorBackFlag = 1\n_NAVI_range_mean.RANGE_LOW = 7\n"));
    host::ParamBlock params = host::DefaultParams();
    host::ParamBlock expected = params;
    host::ApplyOverrides(overrides, &params);
    host::ParamValue(expected, "s_minDelta") = 0;
    host::ParamValue(expected, "s_sensorBackFlag") = 1;
    host::ParamValue(expected, "_NAVI_range_mean.RANGE_LOW") = 7;
    EXPECT_EQ(params, expected);
    EXPECT_EQ(overrides.settings.size(), 3U);
}

// The error of overrides with this text for a gesture of a mode.
std::string RefusalOf(const std::string& text, Mode mode) {
    const host::ParamOverrides overrides = {"o.toml", host::ParseParamSettings(text, "o.toml")};
    return host_test::ErrorOf(
        [&] { host::CheckOverrides(overrides, host::ParamsForMode(mode, true), "g"); });
}

TEST(ParamOverrides, ThatChangeModeOrGeometryAreNamedWithTheirPlace) {
    EXPECT_EQ(RefusalOf("s_minDelta = 5\n s_blockColNumFp = 8\n", Mode::Fp),
              "o.toml:2:20: s_blockColNumFp = 8 changes the geometry of gesture 'g', expected 7 as "
              "recorded");
    EXPECT_EQ(RefusalOf("s_modeFlag = 1\n", Mode::DoubleScan),
              "o.toml:1:14: s_modeFlag = 1 changes the mode from ds to hg of gesture 'g', expected "
              "2 as recorded");
    EXPECT_EQ(RefusalOf("s_imageHeightHg = 2000000000\n", Mode::Hg).find("o.toml:1:19: "), 0U);
    EXPECT_THAT(RefusalOf("s_imageHeightHg = 49\n", Mode::Hg),
                HasSubstr("s_imageHeightHg = 49 does not go with gesture 'g': "));
}

TEST(ParamOverrides, OfOtherModesAndOfEqualValuesAreNoConflict) {
    const host::ParamOverrides overrides = {
        "o.toml", host::ParseParamSettings(
                      "s_blockColNumHg = 8\ns_imageHeightHg = 4000\ns_modeFlag = 0\n", "o.toml")};
    host::CheckOverrides(overrides, host::ParamsForMode(Mode::Fp, true), "g");
}

}  // namespace
