// The command run as a process: exit codes, what goes to stdout and stderr, and its files.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>
#include <map>
#include <nlohmann/json.hpp>
#include <sstream>

#include "GestureBuilder.h"
#include "HostTestSupport.h"
#include "store/Store.h"

namespace {

using host_test::GestureBuilder;
using host_test::WriteText;
using nlohmann::json;
using ::testing::Contains;
using ::testing::EndsWith;
using ::testing::HasSubstr;
using ::testing::IsEmpty;
using ::testing::Not;
using ::testing::StartsWith;

struct Outcome {
    int exitCode = -1;
    std::string out;
    std::string err;
};

class Command : public ::testing::Test {
  protected:
    void SetUp() override { m_folder = host_test::TestDirectory(); }
    void TearDown() override { std::filesystem::remove_all(m_folder); }

    std::string Path(const std::string& name) const { return m_folder + "/" + name; }

    // Runs fpnavi with arguments as a shell would split them, in the test's folder. Redirections
    // in arguments come after the test's own and so win.
    Outcome Run(const std::string& arguments) const {
        const std::string line =
            "cd '" + m_folder + "' && '" FPNAVI_COMMAND "' 1>out 2>err " + arguments;
        const int status = std::system(line.c_str());
        Outcome outcome;
        outcome.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
        outcome.out = Text("out");
        outcome.err = Text("err");
        return outcome;
    }

    std::string Text(const std::string& name) const {
        const std::vector<uint8_t> bytes = host_test::ReadBytes(Path(name));
        return std::string(bytes.begin(), bytes.end());
    }

    void WriteCorpus(const std::string& name, const std::vector<host::Gesture>& gestures) const {
        host::Store store = host::Store::Create(Path(name));
        for (const host::Gesture& gesture : gestures)
            store.Append(gesture);
    }

    std::string m_folder;
};

std::vector<json> JsonLines(const std::string& text) {
    std::vector<json> lines;
    std::istringstream in(text);
    for (std::string line; std::getline(in, line);)
        lines.push_back(json::parse(line));
    return lines;
}

std::vector<json> OfKind(const std::string& kind, const std::vector<json>& lines) {
    std::vector<json> found;
    for (const json& line : lines) {
        EXPECT_EQ(line.at("schema"), 1);
        if (line.at("kind") == kind)
            found.push_back(line);
    }
    return found;
}

host::Gesture MovesRight(const std::string& id, int32_t label) {
    return GestureBuilder(host::Mode::Fp, id).Skin(0).Skin(6).Skin(12).Empty().Label(label).Get();
}

TEST_F(Command, SaysItsVersion) {
    const Outcome outcome = Run("--version");
    EXPECT_EQ(outcome.exitCode, 0);
    EXPECT_EQ(outcome.out, "fpnavi " FPNAVI_VERSION "\n");
}

TEST_F(Command, HelpShowsExamples) {
    for (const char* arguments : {"--help", "replay --help", "import --help", "synth --help"}) {
        const Outcome outcome = Run(arguments);
        EXPECT_EQ(outcome.exitCode, 0) << arguments;
        EXPECT_THAT(outcome.out, HasSubstr("Examples:")) << arguments;
    }
}

TEST_F(Command, ACommandLineWithoutSenseIsUsage) {
    for (const char* arguments :
         {"", "dance", "replay", "synth c.db", "synth c.db --count 0", "replay c.db --jobs 0",
          "import c.db", "import c.db --raw a.bin", "import c.db --mode hg",
          "import c.db --raw a.bin --mode hg --label SIDEWAYS", "params --mode xx",
          "replay c.db --gesture a --quiet"}) {
        const Outcome outcome = Run(arguments);
        EXPECT_EQ(outcome.exitCode, 2) << arguments;
        EXPECT_THAT(outcome.out, IsEmpty()) << arguments;
        EXPECT_THAT(outcome.err, Not(IsEmpty())) << arguments;
    }
    EXPECT_FALSE(std::filesystem::exists(Path("c.db")));
}

TEST_F(Command, SynthDoesNotOverwriteUnlessForced) {
    ASSERT_EQ(Run("synth c.db --count 3").exitCode, 0);
    const Outcome refused = Run("synth c.db --count 2");
    EXPECT_EQ(refused.exitCode, 3);
    EXPECT_THAT(refused.err, HasSubstr("c.db"));
    EXPECT_EQ(host::Store::OpenForReading(Path("c.db")).Count(), 3);
    EXPECT_EQ(Run("synth c.db --count 2 --force").exitCode, 0);
    EXPECT_EQ(host::Store::OpenForReading(Path("c.db")).Count(), 2);
}

TEST_F(Command, SynthAppendsWhatEqualSeedsWouldHaveWrittenAtOnce) {
    ASSERT_EQ(Run("synth whole.db --count 4 --seed 9").exitCode, 0);
    ASSERT_EQ(Run("synth parts.db --count 3 --seed 9").exitCode, 0);
    ASSERT_EQ(Run("synth parts.db --count 1 --seed 9 --first 3 --append").exitCode, 0);
    const host::Store whole = host::Store::OpenForReading(Path("whole.db"));
    const host::Store parts = host::Store::OpenForReading(Path("parts.db"));
    ASSERT_EQ(whole.Ids(), parts.Ids());
    const std::string last = whole.Ids().back();
    EXPECT_EQ(whole.Read(last).frames.at(0).raw, parts.Read(last).frames.at(0).raw);
    EXPECT_EQ(Run("synth parts.db --count 1 --seed 9 --append").exitCode, 3);  // the id is taken
}

TEST_F(Command, ReplayOfASmallCorpusAddsUp) {
    ASSERT_EQ(Run("synth c.db --count 12 --seed 3").exitCode, 0);
    const Outcome outcome = Run("replay c.db --json");
    const std::vector<json> lines = JsonLines(outcome.out);
    const std::vector<json> gestures = OfKind("gesture", lines);
    ASSERT_EQ(gestures.size(), 12U);
    EXPECT_EQ(gestures[4].at("id"), host::Store::OpenForReading(Path("c.db")).Ids()[4]);
    std::map<std::string, int> verdicts;
    for (const json& gesture : gestures)
        ++verdicts[gesture.at("verdict")];
    const json all = OfKind("summary", lines).back();
    EXPECT_EQ(all.at("mode"), "all");
    EXPECT_EQ(all.at("count"), 12);
    for (const char* verdict : {"right", "accepted", "wrong"})
        EXPECT_EQ(all.at(verdict), verdicts[verdict]);
    EXPECT_EQ(outcome.exitCode, verdicts["wrong"] > 0 ? 1 : 0);
    EXPECT_THAT(outcome.err, IsEmpty());
}

TEST_F(Command, ReplayIsTheSameWithAnyNumberOfProcesses) {
    ASSERT_EQ(Run("synth c.db --count 12 --seed 4").exitCode, 0);
    const std::string one = Run("replay c.db --jobs 1").out;
    EXPECT_EQ(one, Run("replay c.db --jobs 3").out);
    EXPECT_EQ(one, Run("replay c.db").out);
}

TEST_F(Command, ReplayExitsWithOneForWrongKeysOnly) {
    WriteCorpus("right.db", {MovesRight("a", VKEY_RIGHT)});
    WriteCorpus("wrong.db", {MovesRight("a", VKEY_RIGHT), MovesRight("b", VKEY_LEFT)});
    EXPECT_EQ(Run("replay right.db").exitCode, 0);
    const Outcome wrong = Run("replay wrong.db");
    EXPECT_EQ(wrong.exitCode, 1);
    EXPECT_THAT(wrong.out, HasSubstr("b   fp    LEFT     RIGHT        2  wrong\n"));
    EXPECT_THAT(wrong.out, HasSubstr("\nall   all           2        1         0        1\n"));
    EXPECT_EQ(Run("replay wrong.db --gesture b").exitCode, 1);
    EXPECT_EQ(Run("replay wrong.db --gesture a").exitCode, 0);
}

TEST_F(Command, QuietShowsTheSummaryOnly) {
    WriteCorpus("c.db", {MovesRight("gesture-a", VKEY_RIGHT)});
    const Outcome outcome = Run("replay c.db --quiet");
    EXPECT_THAT(outcome.out, StartsWith("mode  tier"));
    EXPECT_THAT(outcome.out, Not(HasSubstr("gesture-a")));
    EXPECT_EQ(OfKind("gesture", JsonLines(Run("replay c.db --quiet --json").out)).size(), 0U);
}

TEST_F(Command, ReplayTakesParametersByName) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    WriteText(Path("back.toml"), "s_sensorBackFlag = 1\n");
    const Outcome outcome = Run("replay c.db --params back.toml --json");
    EXPECT_EQ(OfKind("gesture", JsonLines(outcome.out)).at(0).at("key"), "LEFT");
    EXPECT_EQ(outcome.exitCode, 1);
    EXPECT_THAT(Run("replay c.db --params back.toml --gesture a").out, HasSubstr("vote: LEFT"));
}

TEST_F(Command, ParametersOfAnotherGeometryAreBadInput) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    WriteText(Path("wide.toml"), "s_blockColNumFp = 8\n");
    for (const char* more : {"", " --gesture a"}) {
        const Outcome outcome = Run(std::string("replay c.db --params wide.toml") + more);
        EXPECT_EQ(outcome.exitCode, 3);
        EXPECT_THAT(outcome.err, StartsWith("fpnavi: wide.toml:1:19: s_blockColNumFp = 8 "));
    }
}

TEST_F(Command, AnUnknownParameterIsNamedWithItsPlace) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    WriteText(Path("typo.toml"), "s_minDelta = 4\n\n  s_minDelat = 5\n");
    for (const char* arguments : {"replay c.db --params typo.toml", "params --params typo.toml"}) {
        const Outcome outcome = Run(arguments);
        EXPECT_EQ(outcome.exitCode, 3);
        EXPECT_THAT(outcome.err, StartsWith("fpnavi: typo.toml:3:3: "));
        EXPECT_THAT(outcome.err, HasSubstr("s_minDelat"));
        EXPECT_THAT(outcome.out, IsEmpty());
    }
}

TEST_F(Command, ParametersThatContradictTheDumpAreBadInputAndNothingIsPrinted) {
    WriteText(Path("dump.bin"), std::string(56 * 36, 'x'));
    WriteText(Path("ds.toml"), "s_fftFreqLow = 1\ns_modeFlag = 2\n");
    WriteText(Path("wide.toml"), "s_blockColNumFp = 600\n");
    const Outcome mode = Run("import c.db --raw dump.bin --mode fp --params ds.toml");
    EXPECT_EQ(mode.exitCode, 3);
    EXPECT_THAT(mode.err, StartsWith("fpnavi: ds.toml:2:14: s_modeFlag = 2 is mode ds"));
    EXPECT_THAT(mode.out, IsEmpty());
    for (const char* arguments :
         {"import c.db --raw dump.bin --mode fp --params wide.toml", "tune --params wide.toml",
          "tune --params wide.toml --raw dump.bin"}) {
        const Outcome size = Run(arguments);
        EXPECT_EQ(size.exitCode, 3) << arguments;
        EXPECT_THAT(size.err, StartsWith("fpnavi: wide.toml:1:19: s_blockColNumFp = 600 makes"))
            << arguments;
        EXPECT_THAT(size.out, IsEmpty()) << arguments;
    }
    EXPECT_FALSE(std::filesystem::exists(Path("c.db")));
}

TEST_F(Command, AParameterThatNothingReadsGivesAWarning) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    WriteText(Path("dump.bin"), std::string(56 * 36, 'x'));
    WriteText(Path("unread.toml"), "s_minDelta = 4\n_NAVI_TOP_REF = 1\ns_fftFreqLow = 2\n");
    for (const char* arguments :
         {"replay c.db --params unread.toml", "replay c.db --gesture a --params unread.toml",
          "params --params unread.toml", "tune --seed 2 --params unread.toml",
          "import new.db --raw dump.bin --mode fp --params unread.toml"}) {
        const Outcome outcome = Run(arguments);
        EXPECT_EQ(outcome.exitCode, 0) << arguments;
        EXPECT_EQ(outcome.err,
                  "fpnavi: warning: unread.toml:2:17: _NAVI_TOP_REF is stored and never read: it "
                  "changes nothing\n"
                  "fpnavi: warning: unread.toml:3:16: s_fftFreqLow is stored and never read: it "
                  "changes nothing\n")
            << arguments;
    }
}

TEST_F(Command, AnUnknownGestureIsBadInput) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    const Outcome outcome = Run("replay c.db --gesture nobody");
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_EQ(outcome.err, "fpnavi: c.db: no gesture 'nobody'; expected one of its 1 ids\n");
}

TEST_F(Command, AFileThatIsNoCorpusIsBadInput) {
    WriteText(Path("note.txt"), "not a corpus, but long enough to be read as one, perhaps\n");
    for (const char* arguments :
         {"replay note.txt", "replay missing.db", "replay .", "import note.txt missing.fng",
          "synth note.txt --count 1 --force", "synth missing/c.db --count 1"}) {
        const Outcome outcome = Run(arguments);
        EXPECT_EQ(outcome.exitCode, 3) << arguments;
        EXPECT_THAT(outcome.err, StartsWith("fpnavi: ")) << arguments;
        EXPECT_THAT(outcome.out, IsEmpty()) << arguments;
    }
    EXPECT_THAT(Text("note.txt"), StartsWith("not a corpus"));
}

TEST_F(Command, ExplainsAGestureFrameByFrame) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    const Outcome table = Run("replay c.db --gesture a");
    EXPECT_THAT(table.out, HasSubstr("template match\n"));
    EXPECT_THAT(table.out, EndsWith("vote: RIGHT (2 pairs, time_out 0), label RIGHT: right\n"));
    const std::vector<json> lines = JsonLines(Run("replay c.db --gesture a --json").out);
    const std::vector<json> frames = OfKind("frame", lines);
    ASSERT_EQ(frames.size(), 4U);
    EXPECT_EQ(frames[0].at("settled_by"), "first frame");
    EXPECT_EQ(frames[1].at("dx_fp"), 6);
    EXPECT_EQ(frames[1].at("vkey_fp"), "RIGHT");
    EXPECT_EQ(frames[3].at("finger"), "absent");
    EXPECT_EQ(OfKind("vote", lines).at(0).at("key"), "RIGHT");
}

TEST_F(Command, ParamsListsAllWithTheirDefaults) {
    const std::vector<json> params = OfKind("param", JsonLines(Run("params --json").out));
    ASSERT_EQ(params.size(), 78U);
    EXPECT_EQ(params[69].at("name"), "s_minDelta");
    EXPECT_EQ(params[69].at("index"), 69);
    EXPECT_EQ(params[69].at("value"), 4);
    EXPECT_EQ(params[69].at("default"), 4);
    EXPECT_THAT(Run("params").out, HasSubstr("s_multiBloclkFlag"));
}

TEST_F(Command, ParamsFollowsModeAndFile) {
    WriteText(Path("own.toml"), "s_minDelta = 5\n");
    const std::vector<json> params =
        OfKind("param", JsonLines(Run("params --mode hg --params own.toml --json").out));
    EXPECT_EQ(params.at(14).at("value"), 1);  // s_modeFlag
    EXPECT_EQ(params.at(14).at("default"), 0);
    EXPECT_EQ(params.at(69).at("value"), 5);
}

TEST_F(Command, ImportsARawDump) {
    std::string dump;
    for (const host::RecordedFrame& frame : MovesRight("a", VKEY_RIGHT).frames)
        dump.append(frame.raw.begin(), frame.raw.end());
    WriteText(Path("dump.bin"), dump);
    WriteText(Path("plain.toml"), "s_gapWidth = 0\ns_gapHeight = 0\n");
    const Outcome outcome =
        Run("import c.db --raw dump.bin --mode fp --params plain.toml --label right --id tuesday");
    EXPECT_EQ(outcome.exitCode, 0);
    EXPECT_EQ(outcome.out, "c.db: 1 gestures with 4 frames imported, 1 in all\n");
    const Outcome replay = Run("replay c.db --json");
    EXPECT_EQ(replay.exitCode, 0);
    EXPECT_EQ(OfKind("gesture", JsonLines(replay.out)).at(0).at("id"), "tuesday");
}

TEST_F(Command, ARawDumpWithARemainderIsBadInput) {
    WriteText(Path("dump.bin"), std::string(56 * 36 + 5, 'x'));
    const Outcome outcome = Run("import c.db --raw dump.bin --mode fp");
    EXPECT_EQ(outcome.exitCode, 3);
    EXPECT_THAT(outcome.err, StartsWith("fpnavi: dump.bin: byte 2016: "));
    EXPECT_THAT(outcome.err, HasSubstr("remainder of 5 bytes"));
    EXPECT_FALSE(std::filesystem::exists(Path("c.db")));
}

TEST_F(Command, ImportsRealRecordingsOnce) {
    const std::string data = host_test::RealDataDirectory();
    if (data.empty())
        GTEST_SKIP() << "no real recordings on this machine";
    const std::string import =
        "import c.db '" + std::filesystem::absolute(data).string() + "/gestures'";
    const Outcome first = Run(import);
    EXPECT_EQ(first.exitCode, 0) << first.err;
    const int64_t count = host::Store::OpenForReading(Path("c.db")).Count();
    EXPECT_GT(count, 0);
    EXPECT_EQ(Run(import).exitCode, 3);  // the ids are taken
    EXPECT_EQ(host::Store::OpenForReading(Path("c.db")).Count(), count);
}

TEST_F(Command, AFullDiskOrAClosedStdoutIsNoticed) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_RIGHT)});
    for (const char* stdoutIs : {" 1>/dev/full", " 1>&-"}) {
        for (const char* arguments : {"params", "replay c.db", "replay c.db --gesture a"}) {
            const Outcome outcome = Run(std::string(arguments) + stdoutIs);
            EXPECT_EQ(outcome.exitCode, 3) << arguments << stdoutIs;
            EXPECT_THAT(outcome.err, HasSubstr("stdout")) << arguments << stdoutIs;
        }
    }
    EXPECT_EQ(host::Store::OpenForReading(Path("c.db")).Count(), 1);
}

TEST_F(Command, WritesNoColoursToAFile) {
    WriteCorpus("c.db", {MovesRight("a", VKEY_LEFT)});
    EXPECT_THAT(Run("replay c.db").out, Not(Contains('\x1b')));
}

}  // namespace
