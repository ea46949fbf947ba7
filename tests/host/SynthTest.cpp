// fpnavi synth: what it replaces, what it keeps when it is cut short, and what it says then.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <filesystem>

#include "CommandSupport.h"
#include "HostTestSupport.h"
#include "StoreTestSupport.h"
#include "simulator/Corpus.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::CommandEnd;
using host_test::ExpectSameGesture;
using host_test::RunCommand;
using host_test::SmallGesture;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::SizeIs;
using ::testing::StartsWith;

namespace fs = std::filesystem;

using Words = std::vector<std::string>;

class Synth : public ::testing::Test {
  protected:
    CommandEnd Run(const Words& more) const {
        Words words = {"synth", m_path};
        words.insert(words.end(), more.begin(), more.end());
        return RunCommand(words);
    }

    std::vector<std::string> Ids() const { return Store::OpenForReading(m_path).Ids(); }

    // Starts a run that would take minutes, sends the signal as soon as ready, and returns its end.
    template <typename Ready>
    CommandEnd Interrupt(const Words& more, int signal, Ready ready) const {
        const std::string err = m_directory + "/err";
        Words words = {FPNAVI_COMMAND, "synth", m_path, "--count", "1000000", "--seed", "9"};
        words.insert(words.end(), more.begin(), more.end());
        const pid_t child =
            host_test::InChild([&] { return host_test::Exec(words, "/dev/null", err); });
        while (!ready())
            usleep(1000);
        kill(child, signal);
        const int status = host_test::StatusOf(child);
        CommandEnd end;
        end.signal = WIFSIGNALED(status) ? WTERMSIG(status) : 0;
        const std::vector<uint8_t> bytes = host_test::ReadBytes(err);
        end.err.assign(bytes.begin(), bytes.end());
        return end;
    }

    const std::string m_directory = host_test::MemoryDirectory();
    const std::string m_path = m_directory + "/c.db";
};

TEST_F(Synth, GesturesAreTheSameWithAnyNumberOfJobs) {
    for (const char* jobs : {"1", "3", "40"}) {
        fs::remove(m_path);
        ASSERT_EQ(Run({"--count", "30", "--seed", "5", "--first", "7", "--jobs", jobs}).exitCode,
                  0);
        int64_t index = 7;
        Store::OpenForReading(m_path).ForEach([&](const Gesture& gesture) {
            ExpectSameGesture(gesture, host::SimulateCorpusGesture(5, index++));
        });
        EXPECT_EQ(index, 37) << jobs;
    }
}

TEST_F(Synth, ExistingCorpusIsKeptAndBothWaysOnAreNamed) {
    ASSERT_EQ(Run({"--count", "2"}).exitCode, 0);
    const CommandEnd end = Run({"--count", "3"});
    EXPECT_EQ(end.exitCode, 3);
    EXPECT_EQ(end.err, "fpnavi: " + m_path +
                           ": is there already; --force replaces it, --append adds to it\n");
    EXPECT_THAT(Ids(), SizeIs(2));
}

TEST_F(Synth, RecordingsAreReplacedOnDemandOnly) {
    ASSERT_EQ(Run({"--count", "2"}).exitCode, 0);
    Store::OpenForAppending(m_path).Append(SmallGesture("recorded"));
    const CommandEnd end = Run({"--count", "3", "--force"});
    EXPECT_EQ(end.exitCode, 3);
    EXPECT_EQ(end.err, "fpnavi: " + m_path +
                           ": will not be replaced: holds 1 gestures that are not simulated; "
                           "--discard-recordings gives them up\n");
    EXPECT_THAT(Ids(), ElementsAre("sim-1-0000000", "sim-1-0000001", "recorded"));
    EXPECT_EQ(Run({"--count", "1", "--force", "--discard-recordings"}).exitCode, 0);
    EXPECT_THAT(Ids(), ElementsAre("sim-1-0000000"));
    EXPECT_EQ(Run({"--count", "1", "--discard-recordings"}).exitCode, 2);
}

TEST_F(Synth, InterruptedKeepsWhatIsStoredAndSaysHowToGoOn) {
    const CommandEnd end = Interrupt({"--first", "100", "--jobs", "2"}, SIGTERM, [&] {
        return fs::exists(m_path) && Store::OpenForReading(m_path).Count() > 0;
    });
    EXPECT_EQ(end.signal, SIGTERM);
    const size_t kept = Ids().size();
    EXPECT_EQ(end.err, "fpnavi: interrupted\nfpnavi: " + m_path + ": " + std::to_string(kept) +
                           " of 1000000 gestures are stored; to go on: fpnavi synth " + m_path +
                           " --count " + std::to_string(1000000 - kept) + " --seed 9 --first " +
                           std::to_string(100 + kept) + " --append --jobs 2\n");
    EXPECT_FALSE(fs::exists(m_path + "-journal"));
}

TEST_F(Synth, InterruptedForceLeavesTheFormerCorpus) {
    ASSERT_EQ(Run({"--count", "2"}).exitCode, 0);
    const std::vector<uint8_t> former = host_test::ReadBytes(m_path);
    const CommandEnd end = Interrupt({"--force"}, SIGINT, [&] {
        std::error_code error;
        const auto size = fs::file_size(m_path + "-new", error);
        return !error && size > 1000000;
    });
    EXPECT_EQ(end.signal, SIGINT);
    EXPECT_EQ(end.err, "fpnavi: interrupted\nfpnavi: " + m_path +
                           " is as it was; to begin again: fpnavi synth " + m_path +
                           " --count 1000000 --seed 9 --first 0 --force\n");
    EXPECT_TRUE(host_test::ReadBytes(m_path) == former);
    EXPECT_FALSE(fs::exists(m_path + "-new"));
}

// The superuser may write everywhere, so another user tries.
TEST_F(Synth, PlacesThatMayNotBeWrittenAreNamed) {
    ASSERT_EQ(Run({"--count", "1"}).exitCode, 0);
    const auto errorOf = [&](const Words& more) {
        std::string text;
        const pid_t child = host_test::InChild([&] {
            constexpr uid_t kNobody = 65534;
            if (getuid() == 0 && setuid(kNobody) != 0)
                return 1;
            const std::string err = m_directory + "/open/err";
            Words words = {FPNAVI_COMMAND, "synth", m_path, "--count", "1"};
            words.insert(words.end(), more.begin(), more.end());
            return host_test::Exec(words, "/dev/null", err);
        });
        EXPECT_EQ(WEXITSTATUS(host_test::StatusOf(child)), 3);
        const std::vector<uint8_t> bytes = host_test::ReadBytes(m_directory + "/open/err");
        return std::string(bytes.begin(), bytes.end());
    };
    fs::create_directory(m_directory + "/open");
    fs::permissions(m_directory + "/open", fs::perms::all);
    fs::permissions(m_directory, fs::perms(0555));
    fs::permissions(m_path, fs::perms(0666));
    const std::string directory = "no permission to write to its directory '" + m_directory + "'";
    EXPECT_THAT(errorOf({"--append"}),
                StartsWith("fpnavi: " + m_path + ": cannot be written: " + directory));
    EXPECT_THAT(errorOf({"--force"}), HasSubstr(directory));
    fs::permissions(m_path, fs::perms(0444));
    EXPECT_THAT(errorOf({"--append"}), StartsWith("fpnavi: " + m_path +
                                                  ": cannot be written: no permission to write to "
                                                  "the file"));
    fs::permissions(m_directory, fs::perms(0755));
    fs::remove(m_path);
    fs::permissions(m_directory, fs::perms(0555));
    EXPECT_THAT(errorOf({}), StartsWith("fpnavi: " + m_path + ": cannot be created: " + directory));
    fs::permissions(m_directory, fs::perms(0755));
}

}  // namespace
