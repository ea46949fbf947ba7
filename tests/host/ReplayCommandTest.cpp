// fpnavi replay run as a process: verdicts, exit codes, damaged gestures, parameters.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <nlohmann/json.hpp>
#include <sstream>

#include "CommandSupport.h"
#include "GestureBuilder.h"
#include "StoreTestSupport.h"

namespace {

using host_test::CommandEnd;
using host_test::GestureBuilder;
using host_test::RunSql;
using host_test::StoreOf;
using nlohmann::json;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::StartsWith;

struct Outcome {
    int exitCode = -1;
    std::string out;
    std::string err;
};

Outcome Replay(const std::string& corpus, std::vector<std::string> more = {}) {
    const std::string out = host_test::TestDirectory() + "/out";
    more.insert(more.begin(), {"replay", corpus});
    const CommandEnd end = host_test::RunCommand(more, out);
    const std::vector<uint8_t> bytes = host_test::ReadBytes(out);
    return {end.exitCode, std::string(bytes.begin(), bytes.end()), end.err};
}

// The lines of a kind that --json gives.
std::vector<json> LinesOf(const std::string& kind, const Outcome& outcome) {
    std::vector<json> found;
    std::istringstream in(outcome.out);
    for (std::string line; std::getline(in, line);) {
        const json parsed = json::parse(line);
        EXPECT_EQ(parsed.at("schema"), 1);
        if (parsed.at("kind") == kind)
            found.push_back(parsed);
    }
    return found;
}

GestureBuilder Moves(const std::string& id) {
    return GestureBuilder(host::Mode::Fp, id).Skin(0).Skin(6).Skin(12).Empty();
}

host::Gesture Unlabelled(const std::string& id) {
    return Moves(id).Get();
}

host::Gesture Labelled(const std::string& id, int32_t label) {
    return Moves(id).Label(label).Get();
}

// Without a template area its first match fails.
host::Gesture Failing(const std::string& id) {
    return Moves(id).Param("s_templateWidth", 0).Label(VKEY_RIGHT).Get();
}

TEST(ReplayCommand, AGestureWithoutLabelIsUnknownAndFine) {
    const std::string corpus = StoreOf({Unlabelled("a"), Labelled("b", VKEY_RIGHT)});
    const Outcome outcome = Replay(corpus);
    EXPECT_EQ(outcome.exitCode, 0);
    EXPECT_THAT(outcome.out, HasSubstr("a   fp    -        RIGHT        2  unknown\n"));
    EXPECT_THAT(outcome.out, HasSubstr("accepted    wrong  unknown\n"));
    EXPECT_THAT(outcome.out,
                HasSubstr("\nall   all           2        1         0        0        1\n"));
    EXPECT_EQ(Replay(corpus, {"--gesture", "a"}).exitCode, 0);
    const json summary = LinesOf("summary", Replay(corpus, {"--json"})).back();
    EXPECT_EQ(summary.at("unknown"), 1);
    EXPECT_EQ(summary.at("wrong"), 0);
}

TEST(ReplayCommand, ALabelThatWasChangedDoesNotAcceptTheOldOne) {
    const std::string corpus = StoreOf({Labelled("a", VKEY_RIGHT)});
    RunSql(corpus, "UPDATE gesture SET label = 'UP', checksum = NULL");
    EXPECT_EQ(Replay(corpus).exitCode, 1);
}

TEST(ReplayCommand, TheSummaryCountsFailedCalls) {
    const std::string corpus = StoreOf({Failing("a"), Labelled("b", VKEY_LEFT)});
    const Outcome outcome = Replay(corpus, {"--quiet"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_THAT(outcome.out, HasSubstr("wrong   failed\n"));
    EXPECT_THAT(outcome.out,
                HasSubstr("\nall   all           2        0         0        2        1\n"));
    EXPECT_EQ(LinesOf("summary", Replay(corpus, {"--json"})).back().at("failed"), 1);
}

TEST(ReplayCommand, ColumnsOfNothingAreLeftOut) {
    const Outcome outcome = Replay(StoreOf({Labelled("b", VKEY_RIGHT)}), {"--quiet"});
    EXPECT_THAT(outcome.out, StartsWith("mode  tier      count    right  accepted    wrong\n"));
}

// Gestures a to d, of which b and d have a changed frame.
std::string DamagedCorpus() {
    const std::string corpus = StoreOf({Labelled("a", VKEY_RIGHT), Labelled("b", VKEY_RIGHT),
                                        Labelled("c", VKEY_LEFT), Labelled("d", VKEY_RIGHT)});
    RunSql(corpus, "UPDATE frame SET reg24 = 1 WHERE gesture IN (2, 4) AND frame_index = 0");
    return corpus;
}

TEST(ReplayCommand, ADamagedGestureDoesNotEndTheOthers) {
    const std::string corpus = DamagedCorpus();
    const Outcome outcome = Replay(corpus, {"--json"});
    EXPECT_EQ(outcome.exitCode, 3);
    const std::vector<json> gestures = LinesOf("gesture", outcome);
    ASSERT_EQ(gestures.size(), 4U);
    EXPECT_EQ(gestures[0].at("verdict"), "right");
    EXPECT_EQ(gestures[1].at("verdict"), "unreadable");
    EXPECT_EQ(gestures[1].at("key"), nullptr);
    EXPECT_EQ(gestures[1].at("label"), "RIGHT");
    EXPECT_THAT(gestures[1].at("errors").at(0).get<std::string>(),
                StartsWith(corpus + ": gesture 'b': its content has checksum "));
    EXPECT_EQ(gestures[2].at("verdict"), "wrong");
    EXPECT_EQ(gestures[3].at("verdict"), "unreadable");
    const json summary = LinesOf("summary", outcome).back();
    EXPECT_EQ(summary.at("count"), 4);
    EXPECT_EQ(summary.at("unreadable"), 2);
    EXPECT_EQ(summary.at("wrong"), 1);
    EXPECT_THAT(outcome.err, StartsWith("fpnavi: " + corpus + ": gesture 'b': its content has "));
    EXPECT_THAT(outcome.err, HasSubstr("(the first of 2 such gestures)\n"));
}

TEST(ReplayCommand, QuietTellsOfDamagedGestures) {
    const Outcome outcome = Replay(DamagedCorpus(), {"--quiet"});
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_THAT(outcome.out, HasSubstr("wrong  unreadable\n"));
    EXPECT_THAT(outcome.out,
                HasSubstr("\nall   all           4        1         0        1           2\n"));
    EXPECT_THAT(outcome.err, HasSubstr("gesture 'b'"));
}

TEST(ReplayCommand, FailFastEndsAtTheFirstDamagedGesture) {
    const std::string corpus = DamagedCorpus();
    const Outcome outcome = Replay(corpus, {"--fail-fast", "--json"});
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_EQ(LinesOf("gesture", outcome).size(), 1U);
    EXPECT_THAT(LinesOf("summary", outcome), IsEmpty());
    EXPECT_THAT(outcome.err, StartsWith("fpnavi: " + corpus + ": gesture 'b': its content has "));
}

TEST(ReplayCommand, FailFastIsNotForWrongKeys) {
    const std::string corpus = StoreOf({Labelled("a", VKEY_LEFT), Labelled("b", VKEY_RIGHT)});
    const Outcome outcome = Replay(corpus, {"--fail-fast", "--json"});
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_EQ(LinesOf("gesture", outcome).size(), 2U);
}

TEST(ReplayCommand, ParametersThatDoNotGoWithTheRecordingsAreNamedBeforeAnyOutput) {
    const std::string corpus =
        StoreOf({Labelled("a", VKEY_RIGHT), GestureBuilder(host::Mode::Hg, "h").Skin(0).Get()});
    const std::string params = host_test::TestDirectory() + "/p.toml";
    host_test::WriteText(params, "s_minDelta = 4\ns_blockRowNumHg = 9\n");
    for (const std::vector<std::string>& more :
         std::vector<std::vector<std::string>>{{}, {"--json"}, {"--gesture", "h"}}) {
        std::vector<std::string> words = {"--params", params};
        words.insert(words.end(), more.begin(), more.end());
        const Outcome outcome = Replay(corpus, words);
        EXPECT_EQ(outcome.exitCode, 3);
        EXPECT_THAT(outcome.out, IsEmpty());
        EXPECT_THAT(outcome.err, StartsWith("fpnavi: " + params +
                                            ":2:19: s_blockRowNumHg = 9 changes the "
                                            "geometry of gesture 'h', expected "));
    }
}

TEST(ReplayCommand, HelpNamesTheExitCodes) {
    const std::string out = host_test::TestDirectory() + "/out";
    EXPECT_EQ(host_test::RunCommand({"replay", "--help"}, out).exitCode, 0);
    const std::vector<uint8_t> bytes = host_test::ReadBytes(out);
    const std::string text(bytes.begin(), bytes.end());
    EXPECT_THAT(text, HasSubstr("Exit codes: 0 fine"));
    EXPECT_THAT(text, HasSubstr("--fail-fast"));
}

}  // namespace
