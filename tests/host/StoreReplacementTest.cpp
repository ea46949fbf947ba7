// A store that takes the place of another one: what stays until then, and who can read the files.
#include <gmock/gmock.h>
#include <sys/stat.h>

#include <filesystem>

#include "HostTestSupport.h"
#include "StoreTestSupport.h"
#include "store/Replacement.h"
#include "store/Store.h"

namespace {

using host::Replacement;
using host::Store;
using host_test::ErrorOf;
using host_test::ReadBytes;
using host_test::SmallGesture;
using host_test::StoreOf;
using host_test::TestDirectory;
using host_test::WriteText;
using ::testing::ElementsAre;
using ::testing::IsEmpty;
using ::testing::StartsWith;

void Allow(const Store& former) {
    EXPECT_GE(former.Count(), 0);
}

mode_t ModeOf(const std::string& path) {
    struct stat status {};
    EXPECT_EQ(stat(path.c_str(), &status), 0) << path;
    return status.st_mode & 0777;
}

TEST(StoreReplacement, FormerStoreStaysUntilTheNewOneTakesItsPlace) {
    const std::string path = StoreOf({SmallGesture("a")});
    Replacement replacement(path, Allow);
    replacement.Content().Append(SmallGesture("b"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a"));
    Store store = replacement.TakePlace();
    store.Append(SmallGesture("c"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("b", "c"));
    EXPECT_FALSE(std::filesystem::exists(path + "-new"));
}

TEST(StoreReplacement, FormerStoreStaysWhenTheWorkIsGivenUp) {
    const std::string path = StoreOf({SmallGesture("a")});
    const std::vector<uint8_t> bytes = ReadBytes(path);
    Replacement(path, Allow).Content().Append(SmallGesture("b"));
    EXPECT_EQ(ReadBytes(path), bytes);
    EXPECT_FALSE(std::filesystem::exists(path + "-new"));
}

TEST(StoreReplacement, OfAnEmptyFileOrNothing) {
    const std::string path = TestDirectory() + "/s.db";
    EXPECT_THAT(Replacement(path, Allow).TakePlace().Ids(), IsEmpty());
    WriteText(path, "");
    EXPECT_THAT(Replacement(path, Allow).TakePlace().Ids(), IsEmpty());
}

TEST(StoreReplacement, OfAForeignFileIsRefused) {
    const std::string path = TestDirectory() + "/letter.txt";
    WriteText(path, "Dear reader");
    EXPECT_THAT(ErrorOf([&] { Replacement(path, Allow); }),
                StartsWith(path + ": will not be replaced"));
    EXPECT_EQ(ReadBytes(path).size(), 11U);
}

// What was appended meanwhile counts, too.
TEST(StoreReplacement, ChecksTheFormerStoreAgainAtTheEnd) {
    const std::string path = StoreOf({SmallGesture("a")});
    Replacement replacement(path, [](const Store& former) {
        if (former.Count() > 1)
            throw host::Error(former.Path(), "", "too many");
    });
    Store::OpenForAppending(path).Append(SmallGesture("b"));
    EXPECT_EQ(ErrorOf([&] { replacement.TakePlace(); }), path + ": too many");
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a", "b"));
}

TEST(StoreReplacement, IsRefusedWhileAnotherWrites) {
    const std::string path = StoreOf({SmallGesture("a")});
    Replacement replacement(path, Allow);
    Store writer = Store::OpenForAppending(path);
    Store::Batch batch(writer);
    writer.Append(SmallGesture("b"));
    EXPECT_THAT(ErrorOf([&] { replacement.TakePlace(); }),
                StartsWith(path + ": will not be replaced: another process is writing to it"));
    batch.Commit();
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a", "b"));
}

TEST(StoreReplacement, WriterOfTheFormerStoreIsTold) {
    const std::string path = StoreOf({SmallGesture("a")});
    Store writer = Store::OpenForAppending(path);
    Replacement(path, Allow).TakePlace();
    EXPECT_EQ(ErrorOf([&] { writer.Append(SmallGesture("b")); }),
              path +
                  ": cannot store the gesture (gesture 'b'): the file was moved, deleted or "
                  "replaced meanwhile");
}

TEST(StoreReplacement, IsMadeByOneAtATime) {
    const std::string path = StoreOf({SmallGesture("a")});
    const Replacement replacement(path, Allow);
    EXPECT_EQ(ErrorOf([&] { Replacement(path, Allow); }),
              path + ": cannot be created: another process is making it");
}

TEST(StorePermissions, NewStoreIsForItsOwnerAlone) {
    const std::string path = TestDirectory() + "/s.db";
    const mode_t former = umask(0);
    Store store = Store::Create(path);
    {
        const Store::Batch batch(store);
        store.Append(SmallGesture("a"));
        EXPECT_EQ(ModeOf(path + "-journal"), 0600U);
    }
    EXPECT_EQ(ModeOf(path), 0600U);
    const std::string other = TestDirectory() + "/s.db";
    WriteText(other + "-new", "left by a killed process");
    EXPECT_EQ(ModeOf(other + "-new"), 0666U);
    const Replacement replacement(other, Allow);
    EXPECT_EQ(ModeOf(other + "-new"), 0600U);
    umask(former);
}

TEST(StorePermissions, ReplacedStoreKeepsIts) {
    const std::string path = StoreOf({SmallGesture("a")});
    ASSERT_EQ(chmod(path.c_str(), 0640), 0);
    Replacement replacement(path, Allow);
    EXPECT_EQ(ModeOf(path + "-new"), 0600U);
    replacement.TakePlace();
    EXPECT_EQ(ModeOf(path), 0640U);
}

TEST(StoreTags, GesturesWithoutATagAreCounted) {
    host::Gesture tagged = SmallGesture("a");
    tagged.tags = {"other", "made"};
    host::Gesture similar = SmallGesture("b");
    similar.tags = {"made-up"};
    const std::string path = StoreOf({tagged, similar, SmallGesture("c")});
    EXPECT_EQ(Store::OpenForReading(path).CountWithoutTag("made"), 2);
    host_test::RunSql(path, "UPDATE gesture SET tags = 'no list' WHERE id = 'a'");
    EXPECT_EQ(Store::OpenForReading(path).CountWithoutTag("made"), 3);
}

}  // namespace
