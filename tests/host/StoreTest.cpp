// The recording store: what goes in comes out, and which files it refuses.
#include <gmock/gmock.h>

#include <algorithm>
#include <stdexcept>
#include <utility>

#include "HostTestSupport.h"
#include "StoreTestSupport.h"
#include "importers/FngImport.h"
#include "recording/Redact.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::ErrorOf;
using host_test::ExpectSameGesture;
using host_test::NumberIn;
using host_test::SmallGesture;
using host_test::StoreOf;
using host_test::TestDirectory;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;

Gesture FullGesture() {
    Gesture gesture = SmallGesture("full \xC3\xBC 'quoted'", 2);
    gesture.mode = host::Mode::DoubleScan;
    gesture.params = host::ParamsForMode(gesture.mode, true);
    host::ParamValue(gesture.params, "s_totalMoveThresholdLongpressCt") = -7;
    gesture.end = host::GestureEnd::TimeOut;
    gesture.label = VKEY_NONE;
    gesture.accepted = {VKEY_NONE, VKEY_NO_MOVE};
    gesture.tier = "hard";
    gesture.tags = {"with \"quotes\"", "", "comma, space"};
    gesture.libraryVersion = "1.7.10";
    gesture.notes = "two\nlines";
    gesture.frames[0].reg24 = 0xFFFFFFFFU;
    gesture.frames[0].reg28 = 0x80000001U;
    gesture.frames[0].x16 = -32768;
    gesture.frames[0].y16 = 5;
    gesture.frames[0].presence = host::Presence::Sliver;
    gesture.frames[1].presence = host::Presence::Absent;
    return gesture;
}

TEST(Store, EveryFieldComesBack) {
    const std::string path = StoreOf({FullGesture()});
    ExpectSameGesture(Store::OpenForReading(path).Read(FullGesture().id), FullGesture());
}

TEST(Store, UnknownsStayUnknown) {
    const std::string path = StoreOf({SmallGesture("plain")});
    const Gesture gesture = Store::OpenForReading(path).Read("plain");
    EXPECT_FALSE(gesture.label.has_value());
    EXPECT_FALSE(gesture.frames[0].x16.has_value());
    EXPECT_FALSE(gesture.frames[0].presence.has_value());
}

TEST(Store, GestureWithoutFramesIsKept) {
    const std::string path = StoreOf({SmallGesture("none", 0)});
    EXPECT_TRUE(Store::OpenForReading(path).Read("none").frames.empty());
}

TEST(Store, IdsKeepTheOrderOfAppending) {
    const std::string path = StoreOf({SmallGesture("b"), SmallGesture("c"), SmallGesture("a")});
    const Store store = Store::OpenForReading(path);
    EXPECT_EQ(store.Count(), 3);
    EXPECT_THAT(store.Ids(), ElementsAre("b", "c", "a"));
    std::vector<std::string> visited;
    store.ForEach([&](const Gesture& gesture) { visited.push_back(gesture.id); });
    EXPECT_THAT(visited, ElementsAre("b", "c", "a"));
    EXPECT_TRUE(store.Contains("c"));
    EXPECT_FALSE(store.Contains("d"));
}

TEST(Store, VisitorMayReadTheStoreAndEndTheVisit) {
    const std::string path = StoreOf({SmallGesture("a", 1), SmallGesture("b", 2)});
    const Store store = Store::OpenForReading(path);
    size_t visits = 0;
    EXPECT_THROW(store.ForEach([&](const Gesture& gesture) {
        ++visits;
        EXPECT_EQ(store.Read("b").frames.size(), 2U);
        EXPECT_EQ(gesture.id, "a");
        throw std::runtime_error("enough");
    }),
                 std::runtime_error);
    EXPECT_EQ(visits, 1U);
    EXPECT_EQ(store.Count(), 2);
}

TEST(Store, EqualParametersAreStoredOnce) {
    const std::string path = StoreOf({SmallGesture("a"), SmallGesture("b"), FullGesture()});
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM param_block"), 2);
    EXPECT_EQ(NumberIn(path,
                       "SELECT count(*) FROM gesture JOIN param_block p ON p.id = param_block "
                       "WHERE json_extract(params, '$.s_gapWidth') = 32"),
              2);
}

// frame_raw cuts the pixels for whoever reads a store without this program.
TEST(Store, PlainSqlShowsTheFrames) {
    const std::string path = StoreOf({SmallGesture("a"), SmallGesture("none", 0)});
    EXPECT_EQ(NumberIn(path, "SELECT count(*) FROM frame_raw WHERE id = 'a'"), 3);
    EXPECT_EQ(NumberIn(path, "SELECT sum(length(raw)) FROM frame_raw"), 3 * 2016);
    // Pixel k of frame i is (7 k + 31 i) mod 256: for k = 2 and i = 1 it is 45, 2D in hexadecimal.
    EXPECT_EQ(NumberIn(path,
                       "SELECT hex(substr(raw, 3, 1)) = '2D' FROM frame_raw "
                       "WHERE id = 'a' AND frame_index = 1"),
              1);
}

// 18 frames of 2016 bytes with registers and positions, as a gesture of double scan has them.
TEST(Store, TakesATenthMoreThanThePixels) {
    constexpr int kGestures = 200;
    const std::string path = TestDirectory() + "/s.db";
    {
        Store store = Store::Create(path);
        Store::Batch batch(store);
        Gesture gesture = FullGesture();
        gesture.frames.resize(18, gesture.frames.front());
        gesture.tags = {"simulated", "kind:stroke", "tiled", "wet"};
        gesture.notes = std::string(100, 'n');
        for (int i = 0; i < kGestures; ++i) {
            gesture.id = "sim-1-" + std::to_string(1000000 + i);
            store.Append(gesture);
        }
        batch.Commit();
    }
    const auto size = static_cast<double>(std::filesystem::file_size(path));
    EXPECT_LE(size, 1.1 * kGestures * 18 * 2016);
}

TEST(Store, ClosedStoreIsOneFile) {
    const std::string path = StoreOf({SmallGesture("a")});
    for (const char* suffix : {"-wal", "-shm", "-journal"})
        EXPECT_FALSE(std::filesystem::exists(path + suffix)) << suffix;
}

TEST(Store, AppendingGoesOnWhereItEnded) {
    const std::string path = StoreOf({SmallGesture("a")});
    Store::OpenForAppending(path).Append(SmallGesture("b"));
    EXPECT_THAT(Store::OpenForReading(path).Ids(), ElementsAre("a", "b"));
}

TEST(Store, ReaderSeesWhatAWriterHasAppendedMeanwhile) {
    const std::string path = StoreOf({SmallGesture("a")});
    const Store reader = Store::OpenForReading(path);
    Store writer = Store::OpenForAppending(path);
    writer.Append(SmallGesture("b"));
    EXPECT_EQ(reader.Count(), 2);
    ExpectSameGesture(reader.Read("b"), SmallGesture("b"));
}

TEST(Store, TwoWritersShareAFile) {
    const std::string path = StoreOf({});
    Store first = Store::OpenForAppending(path);
    Store second = Store::OpenForAppending(path);
    first.Append(SmallGesture("a"));
    second.Append(SmallGesture("b"));
    first.Append(SmallGesture("c"));
    EXPECT_THAT(second.Ids(), ElementsAre("a", "b", "c"));
}

TEST(Store, MovedStoreGoesOn) {
    const std::string path = StoreOf({});
    Store store = Store::OpenForReading(path);
    Store writer = Store::OpenForAppending(path);
    store = std::move(writer);
    store.Append(SmallGesture("a"));
    EXPECT_EQ(store.Count(), 1);
}

TEST(Store, TakenIdIsRefusedAndNothingChanges) {
    const std::string path = StoreOf({SmallGesture("a", 1)});
    Store store = Store::OpenForAppending(path);
    EXPECT_THAT(ErrorOf([&] { store.Append(SmallGesture("a", 3)); }),
                StartsWith(path + ": gesture 'a': is in the store already"));
    EXPECT_EQ(store.Count(), 1);
    EXPECT_EQ(store.Read("a").frames.size(), 1U);
}

TEST(Store, UnknownIdIsRefused) {
    const std::string path = StoreOf({SmallGesture("a")});
    const Store store = Store::OpenForReading(path);
    EXPECT_THAT(ErrorOf([&] { store.Read("b"); }),
                StartsWith(path + ": gesture 'b': is not in the store"));
}

TEST(Store, ReaderDoesNotAppend) {
    const std::string path = StoreOf({});
    Store store = Store::OpenForReading(path);
    EXPECT_THAT(ErrorOf([&] { store.Append(SmallGesture("a")); }), HasSubstr("reading only"));
}

TEST(Store, UnsoundGesturesAreRefused) {
    const std::pair<const char*, void (*)(Gesture&)> cases[] = {
        {"the id is empty", [](Gesture& g) { g.id.clear(); }},
        {"mode hg, expected fp", [](Gesture& g) { g.mode = host::Mode::Hg; }},
        {"not the one that the parameters give", [](Gesture& g) { g.geometry.blockWidth = 16; }},
        {"image sides",
         [](Gesture& g) {
             host::ParamValue(g.params, "s_blockWidthFp") = g.geometry.blockWidth = 0;
         }},
        {"image sides",
         [](Gesture& g) {
             host::ParamValue(g.params, "s_blockRowNumFp") = g.geometry.blockRowNum = 2049;
         }},
        {"unknown end", [](Gesture& g) { g.end = static_cast<host::GestureEnd>(2); }},
        {"label 6", [](Gesture& g) { g.label = 6; }},
        {"label -1", [](Gesture& g) { g.label = -1; }},
        {"accepted key 9",
         [](Gesture& g) {
             g.accepted = {VKEY_UP, 9};
         }},
        {"frame 1 has 2015 bytes", [](Gesture& g) { g.frames[1].raw.pop_back(); }},
        {"frame 2 has 0 bytes", [](Gesture& g) { g.frames[2].raw.clear(); }},
        {"frame 0 has presence 2",
         [](Gesture& g) { g.frames[0].presence = static_cast<host::Presence>(2); }},
        {"no UTF-8", [](Gesture& g) { g.tags = {"\xFF"}; }},
    };
    const std::string path = StoreOf({});
    Store store = Store::OpenForAppending(path);
    for (const auto& [text, spoil] : cases) {
        Gesture gesture = SmallGesture("a");
        spoil(gesture);
        const std::string error = ErrorOf([&] { store.Append(gesture); });
        EXPECT_THAT(error, StartsWith(path + ": gesture '"));
        EXPECT_THAT(error, HasSubstr(text));
        EXPECT_EQ(store.Count(), 0);
    }
}

TEST(StoreCreate, ExistingFileIsRefused) {
    const std::string path = StoreOf({SmallGesture("a")});
    EXPECT_THAT(ErrorOf([&] { Store::Create(path); }), StartsWith(path + ": cannot be created"));
    EXPECT_EQ(Store::OpenForReading(path).Count(), 1);
}

TEST(StoreCreate, MissingDirectoryIsNamed) {
    const std::string path = TestDirectory() + "/none/s.db";
    EXPECT_THAT(ErrorOf([&] { Store::Create(path); }), StartsWith(path + ": cannot be created"));
}

TEST(Redact, FramesBecomeTheirMeanAndTheRestStays) {
    Gesture gesture = FullGesture();
    std::fill(gesture.frames[1].raw.begin(), gesture.frames[1].raw.end(), uint8_t{10});
    gesture.frames[1].raw[0] = 210;  // 2015 x 10 + 210 = 20360, and 20360 / 2016 = 10
    Gesture expected = gesture;
    host::Redact(gesture);
    EXPECT_EQ(gesture.frames[1].raw, std::vector<uint8_t>(56 * 36, 10));
    for (size_t i = 0; i < 2; ++i) {
        const std::vector<uint8_t>& raw = gesture.frames[i].raw;
        EXPECT_EQ(std::count(raw.begin(), raw.end(), raw[0]), 56 * 36);
        expected.frames[i].raw = raw;
    }
    expected.tags.emplace_back("redacted");
    ExpectSameGesture(gesture, expected);
    host::Redact(gesture);
    EXPECT_EQ(gesture.tags.size(), expected.tags.size());
}

TEST(RealRecordings, ComeBackFromAStore) {
    const std::string directory = host_test::RealDataDirectory();
    if (directory.empty())
        GTEST_SKIP() << "no real recordings: set FPNAVI_REALDATA to their directory";
    const std::vector<Gesture> gestures = host::ImportFng(directory + "/gestures");
    const std::string path = StoreOf(gestures);
    size_t index = 0;
    Store::OpenForReading(path).ForEach([&](const Gesture& gesture) {
        ASSERT_LT(index, gestures.size());
        ExpectSameGesture(gesture, gestures[index++]);
    });
    EXPECT_EQ(index, gestures.size());
}

}  // namespace
