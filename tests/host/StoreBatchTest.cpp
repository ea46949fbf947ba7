// Gestures that go in together, and what creating a store finds of former ones.
#include <gmock/gmock.h>

#include <filesystem>

#include "HostTestSupport.h"
#include "ProcessSupport.h"
#include "StoreTestSupport.h"
#include "store/Replacement.h"
#include "store/Store.h"

namespace {

using host::Replacement;
using host::Store;
using host_test::ErrorOf;
using host_test::NumberIn;
using host_test::SmallGesture;
using host_test::StoreOf;
using host_test::TestDirectory;
using host_test::WriteText;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

TEST(StoreBatch, IsThereAfterItsCommit) {
    const std::string path = StoreOf({SmallGesture("a")});
    Store store = Store::OpenForAppending(path);
    Store::Batch batch(store);
    store.Append(SmallGesture("b"));
    store.Append(SmallGesture("c"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a"));
    batch.Commit();
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a", "b", "c"));
}

TEST(StoreBatch, LeavesNothingWithoutItsCommit) {
    const std::string path = StoreOf({SmallGesture("a")});
    Store store = Store::OpenForAppending(path);
    {
        Store::Batch batch(store);
        store.Append(SmallGesture("b"));
    }
    EXPECT_THAT(store.Ids(), ElementsAre("a"));
    store.Append(SmallGesture("c"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a", "c"));
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame"), 6);
}

// Only the gesture that failed is taken back, with the frames that it had already.
TEST(StoreBatch, KeepsTheOthersWhenOneFails) {
    const std::string path = StoreOf({});
    host_test::RunSql(path,
                      "CREATE TRIGGER full BEFORE INSERT ON frame WHEN new.frame_index = 2 "
                      "BEGIN SELECT raise(ABORT, 'no third frame'); END");
    Store store = Store::OpenForAppending(path);
    Store::Batch batch(store);
    store.Append(SmallGesture("a", 2));
    EXPECT_THAT(ErrorOf([&] { store.Append(SmallGesture("b", 3)); }), HasSubstr("no third frame"));
    EXPECT_THAT(ErrorOf([&] { store.Append(SmallGesture("a", 1)); }), HasSubstr("already"));
    store.Append(SmallGesture("c", 1));
    batch.Commit();
    EXPECT_THAT(store.Ids(), ElementsAre("a", "c"));
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame"), 3);
}

// The path of a store whose writer was killed within a transaction, so that its journal is there.
std::string KilledStore() {
    const std::string path = StoreOf({SmallGesture("a")});
    host_test::StatusOf(host_test::InChild([&] {
        Store store = Store::OpenForAppending(path);
        Store::Batch batch(store);
        for (int i = 0; i < 100; ++i)
            store.Append(SmallGesture("killed" + std::to_string(i), 20));
        return raise(SIGKILL);
    }));
    EXPECT_TRUE(std::filesystem::exists(path + "-journal"));
    return path;
}

TEST(StoreCreate, JournalOfADeletedStoreIsNotTakenForItsOwn) {
    const std::string path = KilledStore();
    std::filesystem::remove(path);
    EXPECT_THAT(Store::Create(path).Ids(), IsEmpty());
    EXPECT_THAT(Store::OpenForReading(path).Ids(), IsEmpty());
}

TEST(StoreCreate, StoreOfAKilledWriterIsReplaced) {
    const std::string path = KilledStore();
    Replacement replacement(path, [](const Store& former) { EXPECT_EQ(former.Count(), 1); });
    replacement.Content().Append(SmallGesture("new"));
    replacement.TakePlace();
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("new"));
}

TEST(StoreCreate, WhatAKilledCreatorLeftIsOverwritten) {
    const std::string path = TestDirectory() + "/s.db";
    WriteText(path + "-new", "half a store");
    Store::Create(path).Append(SmallGesture("a"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a"));
    EXPECT_FALSE(std::filesystem::exists(path + "-new"));
}

TEST(StoreCreate, OnlyOneOfManyCreatorsSucceeds) {
    const std::string path = TestDirectory() + "/s.db";
    std::vector<pid_t> children;
    children.reserve(8);
    for (int i = 0; i < 8; ++i)
        children.push_back(host_test::InChild([&] {
            try {
                Store::Create(path).Append(SmallGesture("g" + std::to_string(i)));
                return 0;
            } catch (const host::Error& error) {
                return std::string(error.what()) == path + ": cannot be created: the file exists"
                           ? 3
                           : 1;
            }
        }));
    int created = 0;
    for (const pid_t child : children) {
        const int status = host_test::StatusOf(child);
        EXPECT_TRUE(WEXITSTATUS(status) == 0 || WEXITSTATUS(status) == 3);
        created += WEXITSTATUS(status) == 0 ? 1 : 0;
    }
    EXPECT_EQ(created, 1);
    EXPECT_EQ(Store::OpenForReading(path).Count(), 1);
}

}  // namespace
