// Writers killed at every single system call that changes a file, before it and halfway through a
// write: what Kills tries at random moments, without a gap.
#include <fcntl.h>
#include <gtest/gtest.h>
#include <sqlite3.h>
#include <sys/mman.h>

#include <cstdio>
#include <filesystem>
#include <functional>

#include "HostTestSupport.h"
#include "ProcessSupport.h"
#include "StoreTestSupport.h"
#include "store/Replacement.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::ExpectSameGesture;
using host_test::NumberIn;
using host_test::SmallGesture;
using host_test::StatusOf;

int s_callsLeft = 0;       // before the process kills itself
bool s_halfWrite = false;  // do half of the last one first, if it writes

[[noreturn]] void KillSelf() {
    raise(SIGKILL);
    _exit(1);
}

bool IsLastCall() {
    return s_callsLeft-- == 0;
}

int CountedOpen(const char* path, int flags, int mode) {
    if ((flags & O_CREAT) != 0 && IsLastCall())
        KillSelf();
    return open(path, flags, mode);
}

ssize_t CountedWrite(int file, const void* bytes, size_t size, off_t offset) {
    if (IsLastCall()) {
        if (s_halfWrite && pwrite(file, bytes, size / 2, offset) < 0)
            std::perror("pwrite");
        KillSelf();
    }
    return pwrite(file, bytes, size, offset);
}

int CountedTruncate(int file, off_t size) {
    if (IsLastCall())
        KillSelf();
    return ftruncate(file, size);
}

int CountedUnlink(const char* path) {
    if (IsLastCall())
        KillSelf();
    return unlink(path);
}

// Makes SQLite call the functions above.
void CountCalls() {
    sqlite3_vfs* const vfs = sqlite3_vfs_find(nullptr);
    const auto set = [vfs](const char* name, auto function) {
        vfs->xSetSystemCall(vfs, name, reinterpret_cast<sqlite3_syscall_ptr>(function));
    };
    set("open", CountedOpen);
    set("pwrite", CountedWrite);
    set("pwrite64", CountedWrite);
    set("ftruncate", CountedTruncate);
    set("unlink", CountedUnlink);
}

// Gestures in the store, each whole; -1: there is no store.
int WholeGestures(const std::string& path) {
    if (!std::filesystem::exists(path))
        return -1;
    int count = 0;
    int64_t frames = 0;
    Store::OpenForReading(path).ForEach([&](const Gesture& gesture) {
        ExpectSameGesture(gesture, SmallGesture("g" + std::to_string(count++), 2));
        frames += 2;
    });
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame"), frames);
    EXPECT_EQ(NumberIn(path,
                       "SELECT count(*) FROM pragma_integrity_check "
                       "WHERE integrity_check = 'ok'"),
              1);
    return count;
}

class KillAtEveryCall : public ::testing::Test {
  protected:
    // Runs write, from what prepare makes, once for each call at which it can be killed. write
    // tells by its argument how many gestures a caller could rely on at that time; check gets that
    // number.
    void Run(const std::function<void()>& prepare, const std::function<void(volatile int*)>& write,
             const std::function<void(int)>& check) {
        void* const shared =
            mmap(nullptr, sizeof(int), PROT_READ | PROT_WRITE, MAP_SHARED | MAP_ANONYMOUS, -1, 0);
        ASSERT_NE(shared, MAP_FAILED);
        auto* const reported = static_cast<volatile int*>(shared);
        int kills = 0;
        bool killed = true;
        for (int call = 0; killed && !HasFailure(); ++call) {
            for (const bool half : {false, true}) {
                std::filesystem::remove_all(m_directory);
                std::filesystem::create_directories(m_directory);
                prepare();
                *reported = -1;
                const pid_t child = host_test::InChild([&] {
                    s_callsLeft = call;
                    s_halfWrite = half;
                    CountCalls();
                    write(reported);
                    return 0;
                });
                const int status = StatusOf(child);
                killed = WIFSIGNALED(status);
                EXPECT_TRUE(killed || WEXITSTATUS(status) == 0);
                kills += killed ? 1 : 0;
                SCOPED_TRACE("call " + std::to_string(call) + (half ? ", half of it" : ""));
                check(*reported);
            }
        }
        munmap(shared, sizeof(int));
        std::printf("%d kills, each at another call\n", kills);
        EXPECT_GT(kills, 20);
    }

    // What every writer has to go on with.
    void GoOn(int count) const {
        Store store = count < 0 ? Store::Create(Path()) : Store::OpenForAppending(Path());
        store.Append(SmallGesture("g" + std::to_string(std::max(count, 0)), 2));
    }

    std::string Path() const { return m_directory + "/s.db"; }

  private:
    // A kill cannot tell memory from a disk, and each try flushes files.
    const std::string m_directory = host_test::MemoryDirectory();
};

void AppendTwo(Store store, int first, volatile int* reported) {
    *reported = first;
    for (int i = first; i < first + 2; ++i) {
        store.Append(SmallGesture("g" + std::to_string(i), 2));
        *reported = i + 1;
    }
}

void ReplaceByTwo(const std::string& path) {
    host::Replacement replacement(path, [](const Store&) {});
    for (const char* id : {"g0", "g1"})
        replacement.Content().Append(SmallGesture(id, 2));
    replacement.TakePlace();
}

TEST_F(KillAtEveryCall, OfAWriterOfANewStore) {
    Run([] {}, [&](volatile int* reported) { AppendTwo(Store::Create(Path()), 0, reported); },
        [&](int reported) {
            const int count = WholeGestures(Path());
            EXPECT_GE(count, reported);
            GoOn(count);
            EXPECT_EQ(WholeGestures(Path()), std::max(count, 0) + 1);
        });
}

TEST_F(KillAtEveryCall, OfAWriterThatAppends) {
    Run([&] { AppendTwo(Store::Create(Path()), 0, std::make_unique<int>().get()); },
        [&](volatile int* reported) { AppendTwo(Store::OpenForAppending(Path()), 2, reported); },
        [&](int reported) {
            const int count = WholeGestures(Path());
            EXPECT_GE(count, std::max(reported, 2));
            GoOn(count);
            EXPECT_EQ(WholeGestures(Path()), count + 1);
        });
}

TEST_F(KillAtEveryCall, OfABatch) {
    Run([&] { AppendTwo(Store::Create(Path()), 0, std::make_unique<int>().get()); },
        [&](volatile int* reported) {
            Store store = Store::OpenForAppending(Path());
            Store::Batch batch(store);
            store.Append(SmallGesture("g2", 2));
            store.Append(SmallGesture("g3", 2));
            batch.Commit();
            *reported = 4;
        },
        [&](int reported) {
            const int count = WholeGestures(Path());
            EXPECT_TRUE(count == 4 || (count == 2 && reported < 4)) << count;
            GoOn(count);
            EXPECT_EQ(WholeGestures(Path()), count + 1);
        });
}

TEST_F(KillAtEveryCall, OfAWriterThatReplaces) {
    Run([&] { Store::Create(Path()).Append(SmallGesture("former", 5)); },
        [&](volatile int* reported) {
            ReplaceByTwo(Path());
            *reported = 2;
        },
        [&](int reported) {
            if (reported < 0 && Store::OpenForReading(Path()).Contains("former")) {
                ExpectSameGesture(Store::OpenForReading(Path()).Read("former"),
                                  SmallGesture("former", 5));
                ReplaceByTwo(Path());
            }
            EXPECT_EQ(WholeGestures(Path()), 2);
            GoOn(2);
            EXPECT_EQ(WholeGestures(Path()), 3);
        });
}

}  // namespace
