// The command on a disk that is full after any number of bytes: it says so, all that was there
// stays, no gesture is stored in part, and with free space again the work goes on.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>

#include <algorithm>
#include <cstdio>
#include <filesystem>

#include "CommandSupport.h"
#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "StoreTestSupport.h"
#include "simulator/Corpus.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::CommandEnd;
using host_test::ExpectSameGesture;
using host_test::Joined;
using host_test::RunCommand;
using host_test::WriteBytes;
using ::testing::HasSubstr;
using ::testing::StartsWith;

namespace fs = std::filesystem;

using Words = std::vector<std::string>;

constexpr uint64_t kSeed = 5;
constexpr int kFormer = 2;
constexpr int kAdded = 3;

Words Synth(const std::string& path, size_t first, size_t count, bool append) {
    Words words = {"synth",   path,
                   "--seed",  std::to_string(kSeed),
                   "--first", std::to_string(first),
                   "--count", std::to_string(count)};
    if (append)
        words.push_back("--append");
    return words;
}

// The gestures of the seed from 0 on, each whole. Returns their number.
size_t WholeGestures(const std::string& path) {
    size_t count = 0;
    Store::OpenForReading(path).ForEach([&](const Gesture& gesture) {
        if (gesture.id.compare(0, 3, "sim") == 0)
            ExpectSameGesture(gesture,
                              host::SimulateCorpusGesture(kSeed, static_cast<int64_t>(count)));
        ++count;
    });
    return count;
}

class FullDisk : public ::testing::Test {
  protected:
    // Runs the command with limits on the size of a file, from less than a page up to where it
    // succeeds. former: gestures that are there before it. Returns in how many cases it failed.
    int TryAllLimits(const Words& words, size_t former, bool atOnce) {
        const std::string kept = m_directory + "/kept.db";
        if (former > 0) {
            EXPECT_EQ(RunCommand(Synth(kept, 0, former, false)).exitCode, 0);
        }
        constexpr rlim_t kStep = 12000;
        int failures = 0;
        for (rlim_t limit = 1000;; limit += kStep) {
            for (const char* suffix : {"", "-wal", "-shm", "-journal"})
                fs::remove(m_path + suffix);
            if (former > 0)
                fs::copy_file(kept, m_path);
            const CommandEnd end = RunCommand(words, "/dev/null", limit);
            SCOPED_TRACE(Joined(words) + " with files of " + std::to_string(limit) + " bytes");
            if (end.exitCode == 0)
                return failures;
            ++failures;
            CheckFailure(end, former, atOnce);
            if (HasFailure())
                return failures;
        }
    }

    void CheckFailure(const CommandEnd& end, size_t former, bool atOnce) const {
        EXPECT_EQ(end.signal, 0);
        EXPECT_EQ(end.exitCode, 3);
        EXPECT_THAT(end.err, StartsWith("fpnavi: " + m_path + ": cannot "));
        EXPECT_FALSE(fs::exists(m_path + "-new"));
        if (!fs::exists(m_path)) {
            EXPECT_EQ(former, 0U);
            return;
        }
        const size_t count = WholeGestures(m_path);
        EXPECT_GE(count, former);
        EXPECT_TRUE(!atOnce || count == former) << count;
        const host::Gesture more = host_test::SmallGesture("more");
        Store::OpenForAppending(m_path).Append(more);
        ExpectSameGesture(Store::OpenForReading(m_path).Read("more"), more);
    }

    const std::string m_directory = host_test::MemoryDirectory();
    const std::string m_path = m_directory + "/c.db";
};

TEST_F(FullDisk, OfSynth) {
    EXPECT_GT(TryAllLimits(Synth(m_path, 0, kAdded, false), 0, false), 5);
}

TEST_F(FullDisk, OfSynthThatAppends) {
    EXPECT_GT(TryAllLimits(Synth(m_path, kFormer, kAdded, true), kFormer, false), 5);
}

TEST_F(FullDisk, OfImport) {
    const std::string files = m_directory + "/files";
    fs::create_directory(files);
    for (const char* name : {"/a.fng", "/b.fng", "/c.fng", "/d.fng"})
        WriteBytes(files + name, host_test::FngBytes());
    EXPECT_GT(TryAllLimits({"import", m_path, files}, 0, true), 2);
    EXPECT_GT(TryAllLimits({"import", m_path, files}, kFormer, true), 2);
}

TEST_F(FullDisk, OfAnImportedDump) {
    const std::string dump = m_directory + "/dump.bin";
    WriteBytes(dump, host_test::Bytes(10 * 2016, 9));
    const Words words = {"import", m_path, "--raw", dump, "--mode", "fp"};
    EXPECT_GT(TryAllLimits(words, kFormer, true), 2);
}

// A file system of 16 MB of its own, where this process may have one.
bool EnterSmallFileSystem(const std::string& directory) {
    return (unshare(CLONE_NEWNS) == 0 || unshare(CLONE_NEWUSER | CLONE_NEWNS) == 0) &&
           mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           mount("fpnavi", directory.c_str(), "tmpfs", 0, "size=16m") == 0;
}

TEST_F(FullDisk, OfARealFileSystem) {
    constexpr int kNotAllowed = 77;
    constexpr size_t kTooMany = 600;  // of 36 kB
    const pid_t child = host_test::InChild([&] {
        const std::string directory = host_test::MemoryDirectory();
        const std::string path = directory + "/c.db";
        if (!EnterSmallFileSystem(directory))
            return kNotAllowed;
        const CommandEnd end = RunCommand(Synth(path, 0, kTooMany, false));
        EXPECT_EQ(end.exitCode, 3);
        EXPECT_THAT(end.err, StartsWith("fpnavi: " + path + ": cannot store the "));
        EXPECT_THAT(end.err, HasSubstr("full"));
        const size_t count = WholeGestures(path);
        EXPECT_GT(count, 0U);
        EXPECT_LT(count, kTooMany);
        EXPECT_THAT(end.err, HasSubstr(path + ": " + std::to_string(count) + " of 600 gestures "));
        // A corpus that is to be replaced stays, also when there is no room for the new one.
        Words force = Synth(path, 0, kTooMany, false);
        force.push_back("--force");
        const CommandEnd forced = RunCommand(force);
        EXPECT_EQ(forced.exitCode, 3);
        EXPECT_THAT(forced.err, HasSubstr("full"));
        EXPECT_FALSE(fs::exists(path + "-new"));
        EXPECT_EQ(WholeGestures(path), count);
        WriteBytes(directory + "/filling", host_test::Bytes(16000000));
        const CommandEnd none = RunCommand(Synth(directory + "/d.db", 0, 1, false));
        EXPECT_EQ(none.exitCode, 3);
        EXPECT_THAT(none.err, StartsWith("fpnavi: " + directory + "/d.db: cannot be created"));
        EXPECT_FALSE(fs::exists(directory + "/d.db"));
        return HasFailure() ? 1 : 0;
    });
    const int status = host_test::StatusOf(child);
    ASSERT_TRUE(WIFEXITED(status));
    if (WEXITSTATUS(status) == kNotAllowed)
        GTEST_SKIP() << "this process may not mount a file system";
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

// What cannot be written to stdout is an error too; the corpus is written nevertheless.
TEST_F(FullDisk, OfStdout) {
    ASSERT_EQ(RunCommand(Synth(m_path, 0, kFormer, false)).exitCode, 0);
    const std::string fng = m_directory + "/g.fng";
    WriteBytes(fng, host_test::FngBytes());
    const std::string id = Store::OpenForReading(m_path).Ids().front();
    const Words lines[] = {
        {"params"},
        {"params", "--json"},
        {"replay", m_path},
        {"replay", m_path, "--json"},
        {"replay", m_path, "--quiet"},
        {"replay", m_path, "--gesture", id},
        {"replay", m_path, "--gesture", id, "--json"},
        {"tune"},
        {"tune", "--json"},
        Synth(m_path, kFormer, 1, true),
        {"synth", m_directory + "/new.db", "--count", "1", "--json"},
        {"import", m_path, fng},
        {"--help"},
        {"replay", "--help"},
        {"--version"},
    };
    for (const Words& words : lines) {
        const CommandEnd end = RunCommand(words, "/dev/full");
        EXPECT_EQ(end.exitCode, 3) << Joined(words);
        EXPECT_THAT(end.err, StartsWith("fpnavi: stdout: not everything could be written: "))
            << Joined(words);
    }
    EXPECT_EQ(WholeGestures(m_path), kFormer + 2U);
    EXPECT_EQ(Store::OpenForReading(m_directory + "/new.db").Count(), 1);
}

}  // namespace
