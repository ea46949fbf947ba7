// The recording store under foreign files, damaged files, killed writers and full disks.
#include <gmock/gmock.h>
#include <signal.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <utility>

#include "HostTestSupport.h"
#include "ProcessSupport.h"
#include "StoreTestSupport.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::ErrorOf;
using host_test::ExpectSameGesture;
using host_test::InChild;
using host_test::NumberIn;
using host_test::ReadBytes;
using host_test::RunSql;
using host_test::SmallGesture;
using host_test::StatusOf;
using host_test::StoreOf;
using host_test::TestDirectory;
using host_test::WriteBytes;
using host_test::WriteText;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;

std::string OpenError(const std::string& path) {
    const std::string forAppending = ErrorOf([&] { Store::OpenForAppending(path); });
    EXPECT_THAT(forAppending, StartsWith(path + ": "));
    return ErrorOf([&] { Store::OpenForReading(path); });
}

// What reading everything says.
std::string ReadError(const std::string& path) {
    return ErrorOf([&] { Store::OpenForReading(path).ForEach([](const Gesture&) {}); });
}

TEST(StoreOpen, FilesThatAreNoStoreAreNamedWithTheReason) {
    const std::string directory = TestDirectory();
    EXPECT_THAT(OpenError(directory + "/none.db"), HasSubstr("none.db: no such file"));
    EXPECT_THAT(OpenError(directory), HasSubstr("not a regular file"));
    const std::string path = directory + "/x.db";
    WriteText(path, "");
    EXPECT_THAT(OpenError(path), HasSubstr("x.db: the file is empty"));
    WriteText(path, "FNG1 and so on, but surely not a database of any kind");
    EXPECT_THAT(OpenError(path), HasSubstr("x.db: byte 0: not a SQLite file"));
}

TEST(StoreOpen, DatabaseOfAnotherProgramIsRefused) {
    const std::string path = TestDirectory() + "/other.db";
    RunSql(path, "CREATE TABLE gesture (id TEXT)");
    EXPECT_THAT(OpenError(path), HasSubstr("a SQLite database of another program"));
}

TEST(StoreOpen, OtherSchemaVersionsAreRefused) {
    const std::string path = StoreOf({SmallGesture("a")});
    RunSql(path, "PRAGMA user_version = 4");
    EXPECT_THAT(OpenError(path), HasSubstr("schema version 4, expected 3: written by a newer"));
    for (const char* version : {"0", "1", "2"}) {
        RunSql(path, std::string("PRAGMA user_version = ") + version);
        EXPECT_THAT(OpenError(path),
                    HasSubstr(std::string("schema version ") + version + ", expected 3"));
    }
}

TEST(StoreOpen, MissingTableIsRefused) {
    const std::string path = StoreOf({});
    RunSql(path, "DROP TABLE frame");
    EXPECT_THAT(OpenError(path), HasSubstr("no such table: frame"));
}

TEST(StoreOpen, TruncatedFileIsRefusedAtItsEnd) {
    const std::string path = StoreOf({SmallGesture("a", 20), SmallGesture("b", 20)});
    const std::vector<uint8_t> bytes = ReadBytes(path);
    for (const size_t length :
         {size_t{16}, size_t{40}, size_t{99}, size_t{100}, size_t{4095}, size_t{4096},
          bytes.size() / 2, bytes.size() - 4096, bytes.size() - 1}) {
        WriteBytes(path, {bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(length)});
        EXPECT_THAT(OpenError(path),
                    HasSubstr("byte " + std::to_string(length) + ": the file is truncated"));
    }
}

// Every damaged page either goes unnoticed (free or unused bytes) or is an Error; nothing else.
TEST(StoreDamage, OverwrittenPagesNeverGiveAnUnsoundGesture) {
    const std::string path = StoreOf({SmallGesture("a", 6), SmallGesture("b", 6)});
    const std::vector<uint8_t> sound = ReadBytes(path);
    size_t refused = 0;
    for (size_t page = 4096; page < sound.size(); page += 4096) {
        for (const uint8_t filling : {uint8_t{0}, uint8_t{0xFF}, uint8_t{0x0D}}) {
            std::vector<uint8_t> bytes = sound;
            const auto start = bytes.begin() + static_cast<std::ptrdiff_t>(page);
            std::fill(start, start + 100, filling);
            WriteBytes(path, bytes);
            try {
                Store::OpenForReading(path).ForEach([](const Gesture& gesture) {
                    for (const host::RecordedFrame& frame : gesture.frames)
                        EXPECT_EQ(frame.raw.size(), 2016U);
                });
            } catch (const host::Error& error) {
                EXPECT_THAT(error.what(), StartsWith(path + ": "));
                ++refused;
            }
        }
    }
    EXPECT_GT(refused, 0U);
}

TEST(StoreDamage, UnsoundRowsAreRefusedWithTheirPlace) {
    const std::pair<const char*, const char*> cases[] = {
        {"UPDATE pixels SET raw = x'00'", "has 1 bytes of pixels, expected 3 frames"},
        {"UPDATE pixels SET raw = zeroblob(4 * 2016)",
         "frame 0 has 2688 bytes, expected 2016 (56 x 36)"},
        {"UPDATE pixels SET raw = 'text'", "gesture 'a': raw has the wrong type, expected a blob"},
        {"DELETE FROM pixels", "gesture 'a': has no pixels"},
        {"UPDATE frame SET reg24 = -1", "frame 0: reg24 is -1, expected 0 to 4294967295"},
        {"UPDATE frame SET reg28 = 4294967296", "reg28 is 4294967296"},
        {"UPDATE frame SET presence = 2", "presence is 2, expected -1 to 1"},
        {"UPDATE frame SET x16 = 2147483648", "x16 is 2147483648"},
        {"UPDATE frame SET y16 = 1.5", "y16 has the wrong type"},
        {"DELETE FROM frame WHERE frame_index = 2", "has 2 frames, expected 3"},
        {"DELETE FROM frame WHERE frame_index = 1", "has a frame of index 2"},
        {"UPDATE gesture SET frame_count = 2", "has a frame of index 2"},
        {"UPDATE gesture SET frame_count = -1", "frame_count is -1"},
        {"UPDATE gesture SET id = ''", "the id is empty"},
        {"UPDATE gesture SET mode = 'xx'", "mode 'xx', expected fp, hg or ds"},
        {"UPDATE gesture SET mode = 'hg'", "mode hg, expected fp"},
        {"UPDATE gesture SET end = 'never'", "end 'never', expected lift or timeout"},
        {"UPDATE gesture SET label = 'OVER'", "'OVER' is no key"},
        {"UPDATE gesture SET label = 3", "'3' is no key"},
        {"UPDATE gesture SET accepted = '[1]'", "accepted is no JSON list of texts"},
        {"UPDATE gesture SET accepted = '[\"OVER\"]'", "'OVER' is no key"},
        {"UPDATE gesture SET tags = '{'", "tags is no JSON list of texts"},
        {"UPDATE gesture SET block_width = 4097", "block_width is 4097, expected 1 to 4096"},
        {"UPDATE gesture SET block_width = 4", "not the one that the parameters give"},
        {"UPDATE gesture SET param_block = 77", "params has the wrong type"},
        {"UPDATE param_block SET params = '{}'", "params is no JSON object of the 78 parameters"},
        {"UPDATE param_block SET params = json_set(params, '$.s_fpImp', 2147483648)",
         "params has no 32-bit integer for s_fpImp"},
        {"UPDATE param_block SET params = json_set(params, '$.s_fpImp', 1.5)",
         "params has no 32-bit integer for s_fpImp"},
        {"UPDATE param_block SET params = json_set(json_remove(params, '$.s_fpImp'), '$.x', 1)",
         "params has no 32-bit integer for s_fpImp"},
    };
    for (const auto& [sql, text] : cases) {
        const std::string path = StoreOf({SmallGesture("a")});
        RunSql(path, std::string("PRAGMA foreign_keys = OFF;") + sql);
        const std::string error = ReadError(path);
        EXPECT_THAT(error, StartsWith(path + ": gesture '")) << sql;
        EXPECT_THAT(error, HasSubstr(text)) << sql;
    }
}

// A statement that fails halfway through the frames takes the whole gesture back.
TEST(StoreDamage, AbortedAppendLeavesNothing) {
    const std::string path = StoreOf({SmallGesture("a")});
    RunSql(path,
           "CREATE TRIGGER full BEFORE INSERT ON frame WHEN new.frame_index = 2 "
           "BEGIN SELECT raise(ABORT, 'no third frame'); END");
    Store store = Store::OpenForAppending(path);
    EXPECT_THAT(ErrorOf([&] { store.Append(SmallGesture("b", 3)); }),
                StartsWith(path + ": cannot store the frames (gesture 'b'): no third frame"));
    EXPECT_THAT(store.Ids(), ElementsAre("a"));
    store.Append(SmallGesture("c", 2));
    EXPECT_THAT(store.Ids(), ElementsAre("a", "c"));
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame"), 3 + 2);
}

// The ids g0, g1, ... without gaps, each complete. Returns their number.
size_t ExpectWholeGestures(const std::string& path) {
    size_t count = 0;
    Store::OpenForReading(path).ForEach([&](const Gesture& gesture) {
        ExpectSameGesture(gesture, SmallGesture("g" + std::to_string(count++), 20));
    });
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame"), static_cast<int64_t>(20 * count));
    return count;
}

TEST(StoreDamage, KilledWriterLeavesWholeGesturesAndAllThatWasReported) {
    const std::string path = StoreOf({});
    int channel[2] = {};
    ASSERT_EQ(pipe(channel), 0);
    const pid_t child = InChild([&] {
        Store store = Store::OpenForAppending(path);
        for (int i = 0;; ++i) {
            store.Append(SmallGesture("g" + std::to_string(i), 20));
            const char done = 1;
            if (write(channel[1], &done, 1) != 1)
                return 1;
        }
    });
    ASSERT_GT(child, 0);
    close(channel[1]);
    constexpr size_t kReported = 5;
    for (size_t i = 0; i < kReported; ++i) {
        char done = 0;
        ASSERT_EQ(read(channel[0], &done, 1), 1);
    }
    kill(child, SIGKILL);
    const int status = StatusOf(child);
    close(channel[0]);
    EXPECT_TRUE(WIFSIGNALED(status));
    EXPECT_GE(ExpectWholeGestures(path), kReported);
    Store::OpenForAppending(path).Append(SmallGesture("afterwards"));
    EXPECT_FALSE(std::filesystem::exists(path + "-journal"));
}

TEST(StoreDamage, ProcessesThatAppendAtOnceLoseNothing) {
    const std::string path = StoreOf({});
    constexpr int kEach = 15;
    std::vector<pid_t> children;
    for (const char* name : {"a", "b", "c"}) {
        children.push_back(InChild([&] {
            try {
                // Opening and closing for each makes the processes meet in that, too.
                for (int i = 0; i < kEach; ++i)
                    Store::OpenForAppending(path).Append(SmallGesture(name + std::to_string(i)));
            } catch (const host::Error& error) {
                std::fprintf(stderr, "%s\n", error.what());
                return 1;
            }
            return 0;
        }));
    }
    for (const pid_t child : children)
        EXPECT_EQ(StatusOf(child), 0);
    EXPECT_EQ(Store::OpenForReading(path).Count(), 3 * kEach);
}

// A file size limit stands for a full disk.
TEST(StoreDamage, FullDiskIsAnErrorAndLeavesWholeGestures) {
    const std::string path = StoreOf({});
    constexpr int kRefused = 42;
    const pid_t child = InChild([&] {
        signal(SIGXFSZ, SIG_IGN);
        const rlimit limit = {300000, 300000};
        setrlimit(RLIMIT_FSIZE, &limit);
        Store store = Store::OpenForAppending(path);
        try {
            for (int i = 0; i < 100; ++i)
                store.Append(SmallGesture("g" + std::to_string(i), 20));
        } catch (const host::Error& error) {
            return error.File() == path ? kRefused : 1;
        }
        return 0;
    });
    ASSERT_GT(child, 0);
    const int status = StatusOf(child);
    ASSERT_TRUE(WIFEXITED(status));
    EXPECT_EQ(WEXITSTATUS(status), kRefused);
    EXPECT_GT(ExpectWholeGestures(path), 0U);
}

}  // namespace
