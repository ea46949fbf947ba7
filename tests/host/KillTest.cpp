// The command killed at random moments spread over its whole run: no gesture is lost, none is half
// there, and the work can go on. FPNAVI_KILLS: kills in each test; FPNAVI_KILL_SEED: other moments.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <random>
#include <thread>

#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "ProcessSupport.h"
#include "StoreTestSupport.h"
#include "importers/FngImport.h"
#include "simulator/Corpus.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::ExpectSameGesture;
using host_test::NumberFromEnvironment;
using host_test::NumberIn;
using host_test::StatusOf;

using Clock = std::chrono::steady_clock;
using Seconds = std::chrono::duration<double>;
using Words = std::vector<std::string>;

constexpr uint64_t kSeed = 11;  // of the simulated gestures
constexpr size_t kFormer = 3;   // in the corpora that are appended to
// synth stores up to 256 at once; the long form makes more than that.
const size_t kSimulated = std::getenv("FPNAVI_KILLS") != nullptr ? 600 : 10;
constexpr int kImported = 40;

std::vector<Gesture> Simulated(size_t first, size_t count) {
    std::vector<Gesture> gestures;
    for (size_t i = first; i < first + count; ++i)
        gestures.push_back(host::SimulateCorpusGesture(kSeed, static_cast<int64_t>(i)));
    return gestures;
}

pid_t StartCommand(const Words& arguments) {
    Words words = {FPNAVI_COMMAND};
    words.insert(words.end(), arguments.begin(), arguments.end());
    return host_test::InChild([&] { return host_test::Exec(words, "/dev/null", "/dev/null"); });
}

int ExitCodeOf(const Words& arguments) {
    const int status = StatusOf(StartCommand(arguments));
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

// Runs the command; how long it took.
Seconds RunTime(const Words& arguments) {
    const Clock::time_point start = Clock::now();
    EXPECT_EQ(ExitCodeOf(arguments), 0);
    return Clock::now() - start;
}

// One command whose run is cut short again and again, each time from the same start.
struct Scenario {
    std::string name;
    Words arguments;                   // of the whole run, on the corpus at path
    std::vector<Gesture> former = {};  // in the corpus before it; without any there is no corpus
    std::vector<Gesture> added = {};   // by the whole run
    bool atOnce = false;               // all of them in one step
    bool replaces = false;             // the former ones give way to them
    // What finishes the work when so many of added are there.
    std::function<Words(size_t)> rest = {};
};

class Kills : public ::testing::Test {
  protected:
    void Run(const Scenario& scenario);

    // The long form works on a disk, whose flushes take most of the time.
    const std::string m_directory = std::getenv("FPNAVI_KILLS") != nullptr
                                        ? host_test::TestDirectory()
                                        : host_test::MemoryDirectory();
    const std::string m_path = m_directory + "/corpus.db";

  private:
    void Prepare(const Scenario& scenario) const;
    Seconds UsualRunTime(const Scenario& scenario) const;
    bool KilledAfter(const Scenario& scenario, Seconds moment, bool watched);
    void CheckAndFinish(const Scenario& scenario);
    size_t CheckContent(const Scenario& scenario) const;
    std::string State(const Scenario& scenario, size_t count) const;

    size_t m_seen = 0;  // gestures that another process read before the kill
    size_t m_nothing = 0;
    size_t m_partly = 0;
    size_t m_whole = 0;
};

void Kills::Prepare(const Scenario& scenario) const {
    for (const char* suffix : {"", "-wal", "-shm", "-journal"})
        std::filesystem::remove(m_path + suffix);
    if (!scenario.former.empty())
        std::filesystem::copy_file(m_directory + "/former.db", m_path);
}

// The middle one of three.
Seconds Kills::UsualRunTime(const Scenario& scenario) const {
    std::vector<Seconds> times;
    for (int i = 0; i < 3; ++i) {
        Prepare(scenario);
        times.push_back(RunTime(scenario.arguments));
    }
    std::sort(times.begin(), times.end());
    return times[1];
}

// False when the command had ended before the moment came.
bool Kills::KilledAfter(const Scenario& scenario, Seconds moment, bool watched) {
    const Clock::time_point start = Clock::now();
    const pid_t child = StartCommand(scenario.arguments);
    std::this_thread::sleep_until(start + std::chrono::duration_cast<Clock::duration>(moment));
    m_seen = 0;
    if (watched && std::filesystem::exists(m_path))
        m_seen = static_cast<size_t>(Store::OpenForReading(m_path).Count());
    kill(child, SIGKILL);
    return WIFSIGNALED(StatusOf(child));
}

// Every gesture whole and as the whole run writes it, in its order. Returns how many of added.
size_t Kills::CheckContent(const Scenario& scenario) const {
    std::vector<Gesture> expected = scenario.former;
    const Store store = Store::OpenForReading(m_path);
    const std::vector<std::string> ids = store.Ids();
    const bool replaced = scenario.replaces && ids.front() == scenario.added.front().id;
    if (replaced)
        expected.clear();
    const size_t former = expected.size();
    expected.insert(expected.end(), scenario.added.begin(), scenario.added.end());
    EXPECT_GE(ids.size(), former);
    EXPECT_LE(ids.size(), expected.size());
    EXPECT_GE(ids.size(), m_seen);
    size_t count = 0;
    size_t frames = 0;
    store.ForEach([&](const Gesture& gesture) {
        ASSERT_LT(count, expected.size());
        ExpectSameGesture(gesture, expected[count++]);
        frames += gesture.frames.size();
    });
    EXPECT_EQ(count, ids.size());
    EXPECT_EQ(NumberIn(m_path, "SELECT count(*) FROM frame"), static_cast<int64_t>(frames));
    EXPECT_EQ(NumberIn(m_path,
                       "SELECT count(*) FROM pragma_integrity_check "
                       "WHERE integrity_check = 'ok'"),
              1);
    return count - former;
}

void Kills::CheckAndFinish(const Scenario& scenario) {
    size_t count = 0;
    if (std::filesystem::exists(m_path)) {
        count = CheckContent(scenario);
        const int replayed = ExitCodeOf({"replay", m_path, "--quiet"});
        EXPECT_TRUE(replayed == 0 || replayed == 1) << "exit code " << replayed;
    } else {
        EXPECT_TRUE(scenario.former.empty());
        EXPECT_EQ(m_seen, 0U);
    }
    const size_t all = scenario.added.size();
    EXPECT_TRUE(!scenario.atOnce || count == 0 || count == all);
    ++(count == 0 ? m_nothing : count == all ? m_whole : m_partly);
    if (count < all) {
        EXPECT_EQ(ExitCodeOf(scenario.rest(count)), 0);
    }
    m_seen = 0;
    EXPECT_EQ(CheckContent(scenario), all);
}

void Kills::Run(const Scenario& scenario) {
    if (!scenario.former.empty()) {
        Store former = Store::Create(m_directory + "/former.db");
        for (const Gesture& gesture : scenario.former)
            former.Append(gesture);
    }
    const Seconds runTime = UsualRunTime(scenario);
    const uint64_t wanted = NumberFromEnvironment("FPNAVI_KILLS", 3);
    std::mt19937_64 random(NumberFromEnvironment("FPNAVI_KILL_SEED", 1));
    uint64_t kills = 0;
    double haste = 1;
    // A run may be quicker than the ones that were measured; then its kill comes too late.
    for (uint64_t tries = 0; kills < wanted && tries < 20 * wanted; ++tries) {
        const double fraction = std::uniform_real_distribution<double>(0, 1)(random);
        const double moment =
            haste * (static_cast<double>(kills) + fraction) / static_cast<double>(wanted);
        Prepare(scenario);
        if (!KilledAfter(scenario, runTime * moment, kills % 2 == 1)) {
            haste *= 0.98;
            continue;
        }
        haste = 1;
        ++kills;
        CheckAndFinish(scenario);
        ASSERT_FALSE(HasFailure()) << "kill " << kills << " at " << moment << " of the run";
    }
    std::printf("%s: %llu kills: nothing of it there %zu times, a part %zu, all %zu\n",
                scenario.name.c_str(), static_cast<unsigned long long>(kills), m_nothing, m_partly,
                m_whole);
    EXPECT_GT(kills, 0U);
}

// synth with more options, on top of so many gestures of its seed.
Words Synth(const std::string& path, size_t first, size_t count, const Words& more) {
    Words words = {"synth",   path,
                   "--seed",  std::to_string(kSeed),
                   "--first", std::to_string(first),
                   "--count", std::to_string(count)};
    words.insert(words.end(), more.begin(), more.end());
    return words;
}

TEST_F(Kills, OfSynth) {
    Scenario scenario{"synth of a new corpus", Synth(m_path, 0, kSimulated, {})};
    scenario.added = Simulated(0, kSimulated);
    scenario.rest = [&](size_t done) {
        return std::filesystem::exists(m_path)
                   ? Synth(m_path, done, kSimulated - done, {"--append"})
                   : scenario.arguments;
    };
    Run(scenario);
}

TEST_F(Kills, OfSynthThatAppends) {
    Scenario scenario{"synth --append", Synth(m_path, kFormer, kSimulated, {"--append"})};
    scenario.former = Simulated(0, kFormer);
    scenario.added = Simulated(kFormer, kSimulated);
    scenario.rest = [&](size_t done) {
        return Synth(m_path, kFormer + done, kSimulated - done, {"--append"});
    };
    Run(scenario);
}

TEST_F(Kills, OfSynthThatReplaces) {
    Scenario scenario{"synth --force", Synth(m_path, 100, kSimulated, {"--force"})};
    scenario.former = Simulated(0, kFormer);
    scenario.added = Simulated(100, kSimulated);
    scenario.replaces = true;
    scenario.atOnce = true;
    scenario.rest = [&](size_t) { return scenario.arguments; };
    Run(scenario);
}

// .fng files, read back as the importer reads them.
std::vector<Gesture> MakeFngFiles(const std::string& directory, int count) {
    std::filesystem::create_directories(directory);
    for (int i = 0; i < count; ++i) {
        host_test::Bytes bytes = host_test::FngBytes();
        host_test::Put16(bytes, host_test::kHeader + 8, i);  // x of the first frame
        host_test::WriteBytes(directory + "/g" + std::to_string(1000 + i) + ".fng", bytes);
    }
    return host::ImportFng(directory);
}

TEST_F(Kills, OfImport) {
    const std::string files = m_directory + "/files";
    Scenario scenario{"import into a new corpus", {"import", m_path, files}};
    scenario.added = MakeFngFiles(files, kImported);
    scenario.atOnce = true;
    scenario.rest = [&](size_t) { return scenario.arguments; };
    Run(scenario);
}

TEST_F(Kills, OfImportThatAppends) {
    const std::string files = m_directory + "/files";
    Scenario scenario{"import that appends", {"import", m_path, files}};
    scenario.former = Simulated(0, kFormer);
    scenario.added = MakeFngFiles(files, kImported);
    scenario.atOnce = true;
    scenario.rest = [&](size_t) { return scenario.arguments; };
    Run(scenario);
}

}  // namespace
