// The checksum of a gesture: what it covers, what it does not, and what a store tells with it.
#include <gmock/gmock.h>

#include "HostTestSupport.h"
#include "StoreTestSupport.h"
#include "store/GestureChecksum.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::GestureChecksum;
using host::Store;
using host_test::ErrorOf;
using host_test::ExpectSameGesture;
using host_test::NumberIn;
using host_test::RunSql;
using host_test::SmallGesture;
using host_test::StoreOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

Gesture GestureOfAllFields() {
    Gesture gesture;
    gesture.id = "a";
    gesture.frames.resize(1);
    gesture.frames[0].raw = {1, 2, 3};
    gesture.frames[0].reg24 = 7;
    gesture.frames[0].reg28 = 8;
    gesture.frames[0].x16 = -1;
    gesture.frames[0].presence = host::Presence::Sliver;
    gesture.end = host::GestureEnd::TimeOut;
    gesture.label = 2;
    gesture.accepted = {2, 0};
    gesture.tier = "core";
    gesture.tags = {"t"};
    gesture.libraryVersion = "1";
    gesture.notes = "n";
    return gesture;
}

// The values are those of Python's zlib.crc32 over the fields as the header describes them: numbers
// of eight bytes, lowest first, and lengths before texts and lists.
TEST(GestureChecksum, IsTheCrc32OfTheFields) {
    Gesture empty;
    empty.id = "a";
    EXPECT_EQ(GestureChecksum(empty), 0x06416834U);
    EXPECT_EQ(GestureChecksum(GestureOfAllFields()), 0x63A858D4U);
}

TEST(GestureChecksum, ChangesWithEveryFieldThatWasRecorded) {
    const auto change = [](void (*field)(Gesture&)) {
        Gesture gesture = GestureOfAllFields();
        field(gesture);
        EXPECT_NE(GestureChecksum(gesture), GestureChecksum(GestureOfAllFields()));
    };
    change([](Gesture& g) { g.id = "b"; });
    change([](Gesture& g) { g.params[77] = 1; });
    change([](Gesture& g) { g.frames[0].raw[2] ^= 0x80; });
    change([](Gesture& g) { g.frames[0].reg24 = 6; });
    change([](Gesture& g) { g.frames[0].reg28 ^= 0x80000000U; });
    change([](Gesture& g) { g.frames[0].x16.reset(); });
    change([](Gesture& g) { g.frames[0].y16 = 0; });
    change([](Gesture& g) { g.frames[0].presence = host::Presence::Absent; });
    change([](Gesture& g) { g.frames.push_back(g.frames[0]); });
    change([](Gesture& g) { g.end = host::GestureEnd::Lift; });
    change([](Gesture& g) { g.libraryVersion = ""; });
}

TEST(GestureChecksum, DoesNotCoverWhatPeopleSay) {
    Gesture gesture = GestureOfAllFields();
    gesture.label.reset();
    gesture.accepted = {1, 5};
    gesture.tier = "hard";
    gesture.tags = {};
    gesture.notes = "another";
    EXPECT_EQ(GestureChecksum(gesture), GestureChecksum(GestureOfAllFields()));
}

TEST(StoreChecksum, TellsTheGestureThatWasChanged) {
    for (const char* sql :
         {"UPDATE pixels SET raw = zeroblob(3 * 2016) WHERE gesture = 2",
          "UPDATE frame SET reg24 = 1 WHERE gesture = 2 AND frame_index = 1",
          "UPDATE gesture SET end = 'timeout' WHERE seq = 2",
          "UPDATE gesture SET checksum = (checksum + 1) & 4294967295 WHERE seq = 2"}) {
        const std::string path = StoreOf({SmallGesture("a"), SmallGesture("b")});
        RunSql(path, sql);
        const Store store = Store::OpenForReading(path);
        ExpectSameGesture(store.Read("a"), SmallGesture("a"));
        EXPECT_THAT(ErrorOf([&] { store.Read("b"); }),
                    StartsWith(path + ": gesture 'b': its content has checksum 0x"))
            << sql;
        EXPECT_THAT(ErrorOf([&] { store.ForEach([](const Gesture&) {}); }),
                    HasSubstr("gesture 'b': its content has checksum"));
    }
}

TEST(StoreChecksum, LeavesLabelsToPlainSql) {
    const std::string path = StoreOf({SmallGesture("a"), SmallGesture("b")});
    RunSql(path,
           "UPDATE gesture SET label = 'UP', accepted = '[\"UP\",\"NONE\"]', tier = 'hard', "
           "tags = '[\"wet\"]', notes = 'by hand' WHERE id = 'a'");
    Gesture expected = SmallGesture("a");
    expected.label = VKEY_UP;
    expected.accepted = {VKEY_UP, VKEY_NONE};
    expected.tier = "hard";
    expected.tags = {"wet"};
    expected.notes = "by hand";
    ExpectSameGesture(Store::OpenForReading(path).Read("a"), expected);
}

TEST(StoreChecksum, IsNotAskedForWhereThereIsNone) {
    const std::string path = StoreOf({SmallGesture("a")});
    RunSql(path, "UPDATE gesture SET end = 'timeout', checksum = NULL");
    EXPECT_EQ(Store::OpenForReading(path).Read("a").end, host::GestureEnd::TimeOut);
}

TEST(StoreChecksum, OfAnotherKindIsRefused) {
    const std::string path = StoreOf({SmallGesture("a")});
    RunSql(path, "UPDATE gesture SET checksum = 'sum'");
    EXPECT_THAT(ErrorOf([&] { Store::OpenForReading(path).Read("a"); }),
                HasSubstr("gesture 'a': checksum has the wrong type, expected an integer"));
    RunSql(path, "UPDATE gesture SET checksum = -1");
    EXPECT_THAT(ErrorOf([&] { Store::OpenForReading(path).Read("a"); }),
                HasSubstr("checksum is -1, expected 0 to 4294967295"));
}

// A page that says it has one row less takes the last gesture with it.
TEST(StoreDamage, RowThatIsMissingIsTold) {
    const std::string path = StoreOf({SmallGesture("a", 1), SmallGesture("b", 1)});
    const int64_t page =
        NumberIn(path, "SELECT rootpage FROM sqlite_schema WHERE name = 'gesture'");
    std::vector<uint8_t> bytes = host_test::ReadBytes(path);
    const auto cellCount = static_cast<size_t>((page - 1) * 4096 + 4);  // the low byte
    ASSERT_EQ(bytes.at(cellCount), 2);
    bytes[cellCount] = 1;
    host_test::WriteBytes(path, bytes);
    const Store store = Store::OpenForReading(path);
    const std::string expected =
        path + ": table gesture: 1 rows, expected 2 as its index has: the file is damaged";
    EXPECT_EQ(ErrorOf([&] { store.Ids(); }), expected);
    EXPECT_EQ(ErrorOf([&] { store.ForEach([](const Gesture&) {}); }), expected);
}

}  // namespace
