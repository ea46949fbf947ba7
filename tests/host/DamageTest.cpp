// Files cut at every length and with one bit flipped in every byte: each is refused with its place,
// or the damage lies where any value may stand and a sound gesture comes out. FPNAVI_DAMAGE_STEP=1
// tries every length and byte; by default large files are sampled.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <sqlite3.h>

#include <cstdio>
#include <filesystem>
#include <functional>
#include <regex>

#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "ProcessSupport.h"
#include "StoreTestSupport.h"
#include "importers/FngImport.h"
#include "importers/RawImport.h"
#include "parameters/ParamFile.h"
#include "store/Store.h"

namespace {

using host::Gesture;
using host::Store;
using host_test::Bytes;
using host_test::ExpectSameGesture;
using host_test::MemoryDirectory;
using host_test::NumberFromEnvironment;
using host_test::ReadBytes;
using host_test::WriteBytes;
using host_test::WriteText;
using ::testing::StartsWith;

// What reading a damaged file must keep to. read throws host::Error or returns.
struct Reader {
    std::string kind;
    std::string path;
    std::string place;  // regular expression of what an error says after the file's name
    std::function<void()> read;
    size_t sampling = 1;  // of the short form: each so manieth byte
};

struct Tally {
    size_t tried = 0;
    size_t refused = 0;
};

void Try(const Reader& reader, const Bytes& bytes, const std::string& what, Tally* tally) {
    SCOPED_TRACE(reader.kind + ", " + what);
    WriteBytes(reader.path, bytes);
    ++tally->tried;
    try {
        reader.read();
    } catch (const host::Error& error) {
        ++tally->refused;
        EXPECT_THAT(error.what(), StartsWith(reader.path + ":"));
        const std::string text = std::string(error.what()).substr(reader.path.size() + 1);
        EXPECT_TRUE(std::regex_search(text, std::regex("^" + reader.place))) << error.what();
    }
}

// Puts the sound file back, which must be read.
void Report(const Reader& reader, const char* what, const Bytes& sound, const Tally& tally) {
    WriteBytes(reader.path, sound);
    reader.read();
    std::printf("%s, %s: %zu tried, %zu refused with file and place, %zu sound\n",
                reader.kind.c_str(), what, tally.tried, tally.refused, tally.tried - tally.refused);
}

size_t Step(const Reader& reader) {
    return NumberFromEnvironment("FPNAVI_DAMAGE_STEP", reader.sampling);
}

// Tries the file at reader.path, sound so far, at its lengths.
Tally Cut(const Reader& reader) {
    const Bytes sound = ReadBytes(reader.path);
    Tally tally;
    for (size_t length = 0; length < sound.size(); length += Step(reader)) {
        const auto end = sound.begin() + static_cast<std::ptrdiff_t>(length);
        Try(reader, Bytes(sound.begin(), end), "cut at " + std::to_string(length), &tally);
    }
    Report(reader, "cut", sound, tally);
    return tally;
}

// Tries it with one bit flipped: each of the eight in small files, one in turn in large ones.
Tally Flip(const Reader& reader) {
    const Bytes sound = ReadBytes(reader.path);
    const size_t step = Step(reader);
    Tally tally;
    Bytes damaged = sound;
    for (size_t at = 0; at < sound.size(); at += step) {
        for (size_t bit = 0; bit < 8; ++bit) {
            if (reader.sampling > 1 && bit != (at + at / 7) % 8)
                continue;
            damaged[at] = static_cast<uint8_t>(sound[at] ^ (1U << bit));
            Try(reader, damaged, "byte " + std::to_string(at) + ", bit " + std::to_string(bit),
                &tally);
        }
        damaged[at] = sound[at];
    }
    Report(reader, "flipped", sound, tally);
    return tally;
}

// A gesture of a sensor of 4 x 4 pixels: what a store holds, in few bytes.
Gesture TinyGesture(const std::string& id) {
    Gesture gesture;
    gesture.id = id;
    gesture.params = host::ParamsForMode(host::Mode::Fp, true);
    for (const char* side :
         {"s_blockWidthFp", "s_blockHeightFp", "s_blockColNumFp", "s_blockRowNumFp"})
        host::ParamValue(gesture.params, side) = 2;
    gesture.geometry = host::GeometryOf(gesture.params);
    gesture.label = VKEY_LEFT;
    gesture.accepted = {VKEY_LEFT, VKEY_NONE};
    gesture.tags = {"tiny"};
    gesture.notes = "a note";
    for (int i = 0; i < 3; ++i) {
        host::RecordedFrame frame;
        frame.raw.assign(16, static_cast<uint8_t>(100 + i));
        frame.presence = host::Presence::Present;
        frame.x16 = frame.y16 = -16 * i;
        gesture.frames.push_back(frame);
    }
    return gesture;
}

std::vector<Gesture> TinyGestures() {
    return {TinyGesture("a"), TinyGesture("b"), TinyGesture("c")};
}

// Small pages, so that a small file has all kinds of them.
std::string TinyStore() {
    const std::string path = MemoryDirectory() + "/s.db";
    {
        Store store = Store::Create(path);
        for (const Gesture& gesture : TinyGestures())
            store.Append(gesture);
    }
    host_test::RunSql(path, "PRAGMA page_size = 512; VACUUM");
    return path;
}

// Equal but for what people say of a gesture, which the checksum leaves out.
void ExpectSameRecording(const Gesture& got, const Gesture& expected) {
    Gesture same = expected;
    same.label = got.label;
    same.accepted = got.accepted;
    same.tier = got.tier;
    same.tags = got.tags;
    same.notes = got.notes;
    ExpectSameGesture(got, same);
}

// All gestures by each way of reading, as they were recorded or an error.
void ReadTinyStore(const std::string& path) {
    const std::vector<Gesture> expected = TinyGestures();
    const Store store = Store::OpenForReading(path);
    size_t count = 0;
    store.ForEach([&](const Gesture& gesture) {
        ASSERT_LT(count, expected.size());
        ExpectSameRecording(gesture, expected[count++]);
    });
    EXPECT_EQ(count, expected.size());
    const std::vector<std::string> ids = store.Ids();
    ASSERT_EQ(ids.size(), expected.size());
    ExpectSameRecording(store.Read(ids.back()), expected.back());
}

// SQLite names no place in its file; the store adds what it was reading.
constexpr const char* kStorePlace = " (byte [0-9]+|gesture |table |cannot |.*expected )";

TEST(Damage, OfAStoreIsAlwaysToldOrHarmless) {
    const std::string path = TinyStore();
    const Reader reader = {"store", path, kStorePlace, [&] { ReadTinyStore(path); }, 9};
    const Tally cut = Cut(reader);
    EXPECT_EQ(cut.refused, cut.tried);
    const Tally flipped = Flip(reader);
    EXPECT_GT(flipped.refused, flipped.tried / 4);
}

// A writer that is killed within a transaction, when a part of it is in the file already.
std::string KilledInATransaction() {
    const std::string path = TinyStore();
    const pid_t child = host_test::InChild([&] {
        Store store = Store::OpenForAppending(path);
        Store::Batch batch(store);
        // More than the pages that SQLite keeps in memory.
        for (int i = 0; i < 3000; ++i)
            store.Append(TinyGesture("more" + std::to_string(i)));
        return raise(SIGKILL);
    });
    host_test::StatusOf(child);
    EXPECT_GT(std::filesystem::file_size(path + "-journal"), 0U);
    return path;
}

TEST(Damage, OfTheJournalOfAKilledWriterIsToldOrHarmless) {
    const std::string path = KilledInATransaction();
    const Bytes main = ReadBytes(path);
    const auto read = [&] {
        WriteBytes(path, main);
        const Store store = Store::OpenForReading(path);
        for (const Gesture& gesture : TinyGestures())
            ExpectSameRecording(store.Read(gesture.id), gesture);
    };
    const Reader reader = {"journal of a killed writer", path + "-journal", "", read, 7};
    const Tally cut = Cut(reader);
    const Tally flipped = Flip(reader);
    EXPECT_GT(cut.tried + flipped.tried, cut.refused + flipped.refused);
}

TEST(Damage, OfAnFngFileIsToldWithItsByteOrGivesASoundGesture) {
    const std::string path = MemoryDirectory() + "/g.fng";
    WriteBytes(path, host_test::FngBytes());
    const Reader reader = {
        ".fng", path, " byte [0-9]+: ", [&] { host::CheckGesture(host::ReadFng(path), path); }, 7};
    const Tally cut = Cut(reader);
    EXPECT_EQ(cut.refused, cut.tried);
    // Both orders of the pixels must agree, so that all but the fields of free value are refused.
    const Tally flipped = Flip(reader);
    EXPECT_GT(flipped.refused, flipped.tried * 99 / 100);
}

TEST(Damage, OfAnIndexIsToldWithItsLineOrGivesASoundGesture) {
    const std::string directory = MemoryDirectory();
    WriteBytes(directory + "/g.fng", host_test::FngBytes());
    const std::string path = directory + "/index.csv";
    WriteText(path,
              "id,tier,mode,layout,kind,expect,accept,end,source,quality,frames\n"
              "g,hard,fp,tiled,stroke:UP,UP,UP NO_MOVE,lift,sim,good,2\n");
    const auto read = [&] {
        for (const Gesture& gesture : host::ImportFng(directory))
            host::CheckGesture(gesture, path);
    };
    const Reader reader = {"index.csv", path, "[0-9]+: ", read};
    const Tally cut = Cut(reader);
    EXPECT_GT(cut.refused, cut.tried * 3 / 4);
    const Tally flipped = Flip(reader);
    EXPECT_GT(flipped.refused, flipped.tried / 2);
}

TEST(Damage, OfARawDumpIsToldWithItsByteOrGivesASoundGesture) {
    host::RawRecording recording;
    recording.framesPath = MemoryDirectory() + "/dump.bin";
    WriteBytes(recording.framesPath, Bytes(2 * 2016, 77));
    const auto read = [&] { host::CheckGesture(host::ImportRaw(recording), recording.framesPath); };
    const Reader reader = {"raw dump", recording.framesPath, " (byte [0-9]+: |the file is empty)",
                           read, 7};
    const Tally cut = Cut(reader);
    EXPECT_GT(cut.refused, cut.tried - 2);  // all but a cut after the first frame
    EXPECT_EQ(Flip(reader).refused, 0U);    // a pixel may have any value
}

TEST(Damage, OfRegistersIsToldWithItsByteOrGivesASoundGesture) {
    host::RawRecording recording;
    recording.mode = host::Mode::DoubleScan;
    recording.framesPath = MemoryDirectory() + "/dump.bin";
    recording.registersPath = recording.framesPath + ".reg";
    WriteBytes(recording.framesPath, Bytes(2 * 2016, 77));
    WriteBytes(recording.registersPath, Bytes(16, 5));
    const auto read = [&] { host::CheckGesture(host::ImportRaw(recording), recording.framesPath); };
    const Reader reader = {"registers", recording.registersPath, " byte [0-9]+: ", read};
    const Tally cut = Cut(reader);
    EXPECT_EQ(cut.refused, cut.tried);
    EXPECT_EQ(Flip(reader).refused, 0U);
}

TEST(Damage, OfAParameterFileIsToldWithItsLineOrGivesParameters) {
    const std::string path = MemoryDirectory() + "/p.toml";
    WriteText(path,
              "# a device\ns_minDelta = 5\n\"s_fpImp\" = 0x10\n"
              "[_NAVI_range_mean]\nRANGE_LOW = 140\nRANGE_HIGH = 1_60\n");
    const auto read = [&] { host::ReadParamFile(path, host::DefaultParams()); };
    const Reader reader = {"parameter file", path, "[0-9]+:[0-9]+: .*(expected |did you mean )",
                           read};
    const Tally cut = Cut(reader);
    EXPECT_GT(cut.refused, cut.tried / 3);
    const Tally flipped = Flip(reader);
    EXPECT_GT(flipped.refused, flipped.tried / 2);
}

}  // namespace
