// Importing .fng files: their fields, and every way in which they can be wrong.
#include <gmock/gmock.h>

#include <algorithm>

#include "FngTestSupport.h"
#include "HostTestSupport.h"
#include "importers/FngImport.h"

namespace {

using host::Gesture;
using host_test::Bytes;
using host_test::ErrorOf;
using host_test::FngBytes;
using host_test::kFrame;
using host_test::kFrameHead;
using host_test::kHeader;
using host_test::kPixels;
using host_test::PixelAt;
using host_test::Put16;
using host_test::TestDirectory;
using host_test::WriteBytes;
using ::testing::Contains;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

Gesture ReadBytesAsFng(const Bytes& bytes) {
    const std::string path = TestDirectory() + "/g.fng";
    WriteBytes(path, bytes);
    return host::ReadFng(path);
}

std::string FngError(const Bytes& bytes) {
    return ErrorOf([&] { ReadBytesAsFng(bytes); });
}

TEST(Fng, FieldsOfTheHeaderArrive) {
    const Gesture gesture = ReadBytesAsFng(FngBytes());
    EXPECT_EQ(gesture.id, "g");
    EXPECT_EQ(gesture.mode, host::Mode::Fp);
    EXPECT_EQ(gesture.end, host::GestureEnd::Lift);
    EXPECT_EQ(gesture.label, VKEY_UP);
    EXPECT_THAT(gesture.accepted, ElementsAre(VKEY_UP));
    EXPECT_EQ(gesture.tier, "");
    EXPECT_THAT(gesture.tags, ElementsAre("tiled"));
    EXPECT_EQ(gesture.params, host::ParamsForMode(host::Mode::Fp, false));
    EXPECT_EQ(gesture.geometry.Width(), 56);
}

TEST(Fng, FramesArriveInSensorOrder) {
    const Gesture gesture = ReadBytesAsFng(FngBytes());
    ASSERT_EQ(gesture.frames.size(), 2U);
    const Bytes& raw = gesture.frames[1].raw;
    ASSERT_EQ(raw.size(), kPixels);
    EXPECT_EQ(raw[0], PixelAt(1, 0, 0));
    EXPECT_EQ(raw[8], PixelAt(1, 1, 0));    // second row of block 0
    EXPECT_EQ(raw[16], PixelAt(1, 0, 8));   // block 1
    EXPECT_EQ(raw[112], PixelAt(1, 2, 0));  // block 7 opens the second row of blocks
    EXPECT_EQ(raw[kPixels - 1], PixelAt(1, 35, 55));
}

TEST(Fng, PositionsAndPresenceAreSigned) {
    const Gesture gesture = ReadBytesAsFng(FngBytes());
    EXPECT_EQ(gesture.frames[0].x16, -20);
    EXPECT_EQ(gesture.frames[1].x16, -19);
    EXPECT_EQ(gesture.frames[0].y16, 300);
    EXPECT_EQ(gesture.frames[0].presence, host::Presence::Sliver);
    EXPECT_EQ(gesture.frames[1].presence, host::Presence::Present);
}

TEST(Fng, RowOrderedFileWithoutBlocksGivesTheSameRawBytes) {
    const Bytes full = FngBytes();
    Bytes rowsOnly(full.begin(), full.begin() + kHeader);
    Put16(rowsOnly, 6, 0);
    for (size_t i = 0; i < 2; ++i) {
        const auto start = full.begin() + static_cast<std::ptrdiff_t>(kHeader + i * kFrame);
        rowsOnly.insert(rowsOnly.end(), start, start + kFrameHead + kPixels);
    }
    EXPECT_EQ(ReadBytesAsFng(rowsOnly).frames[1].raw, ReadBytesAsFng(full).frames[1].raw);
}

TEST(Fng, PlainLayoutGivesParametersWithoutGaps) {
    Bytes bytes = FngBytes();
    bytes[15] = 0;
    const Gesture gesture = ReadBytesAsFng(bytes);
    EXPECT_EQ(host::ParamValue(gesture.params, "s_gapWidth"), 0);
    EXPECT_THAT(gesture.tags, ElementsAre("plain"));
}

TEST(Fng, RegistersArriveInDoubleScanMode) {
    Bytes bytes = FngBytes();
    Put16(bytes, 6, 3);
    bytes[14] = 2;
    bytes[kHeader] = 0x11;
    bytes[kHeader + 3] = 0x80;
    bytes[kHeader + 4] = 0x22;
    const Gesture gesture = ReadBytesAsFng(bytes);
    EXPECT_EQ(gesture.mode, host::Mode::DoubleScan);
    EXPECT_EQ(gesture.frames[0].reg24, 0x80000011U);
    EXPECT_EQ(gesture.frames[0].reg28, 0x22U);
}

TEST(Fng, NoLabelGivesNoAcceptedKey) {
    Bytes bytes = FngBytes();
    bytes[24] = 255;
    const Gesture gesture = ReadBytesAsFng(bytes);
    EXPECT_FALSE(gesture.label.has_value());
    EXPECT_TRUE(gesture.accepted.empty());
}

// Every length but the whole one is refused at the byte where the file ends.
TEST(Fng, TruncationIsRefusedAtEveryBoundary) {
    const Bytes bytes = FngBytes();
    std::vector<size_t> lengths;
    for (size_t i = 0; i <= kHeader + kFrameHead; ++i)
        lengths.push_back(i);
    for (const size_t length : {kHeader + kFrameHead + kPixels, kHeader + kFrame - 1,
                                kHeader + kFrame, kHeader + kFrame + 1, bytes.size() - 1})
        lengths.push_back(length);
    for (const size_t length : lengths) {
        const Bytes part(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(length));
        EXPECT_THAT(FngError(part),
                    HasSubstr("g.fng: byte " + std::to_string(length) + ": the file is truncated"));
    }
}

TEST(Fng, BytesAfterTheLastFrameAreRefused) {
    Bytes bytes = FngBytes();
    const std::string end = std::to_string(bytes.size());
    bytes.resize(bytes.size() + 3);
    EXPECT_THAT(FngError(bytes), HasSubstr("byte " + end + ": 3 bytes after the last frame"));
}

// Each header byte that is wrong is refused at its field's offset.
TEST(Fng, WrongHeaderFieldsAreRefusedAtTheirOffset) {
    struct Case {
        size_t offset;
        int value;
        size_t field;
        const char* text;
    };
    const Case cases[] = {
        {0, 'X', 0, "FNG1"},         {3, '2', 0, "FNG1"},        {4, 2, 4, "expected 1"},
        {6, 5, 6, "flags"},          {6, 3, 6, "mode ds"},       {8, 57, 8, "expected 56"},
        {10, 35, 10, "expected 36"}, {12, 0, 12, "0 frames"},    {14, 3, 14, "mode 3"},
        {15, 2, 15, "layout 2"},     {16, 4, 16, "expected 8"},  {18, 4, 18, "expected 2"},
        {20, 14, 20, "expected 7"},  {22, 9, 22, "expected 18"}, {24, 6, 24, "key 6"},
        {25, 2, 25, "end 2"},        {26, 1, 26, "reserved"},    {31, 1, 31, "reserved"},
    };
    for (const Case& c : cases) {
        Bytes bytes = FngBytes();
        bytes[c.offset] = static_cast<uint8_t>(c.value);
        const std::string error = FngError(bytes);
        EXPECT_THAT(error, HasSubstr("g.fng: byte " + std::to_string(c.field) + ": "));
        EXPECT_THAT(error, HasSubstr(c.text));
    }
}

TEST(Fng, WrongFrameFieldsAreRefusedAtTheirOffset) {
    struct Case {
        size_t offset;
        int value;
        const char* text;
    };
    const size_t second = kHeader + kFrame;
    const Case cases[] = {
        {second + 0, 1, "registers"},
        {second + 12, 101, "contact 101"},
        {second + 13, 2, "presence 2"},
        {second + 13, 254, "presence -2"},
        {second + 14, 1, "reserved"},
        {second + kFrameHead + kPixels, 200, "block-ordered"},
        {kHeader + 2 * kFrame - 1, 1, "block-ordered"},
    };
    for (const Case& c : cases) {
        Bytes bytes = FngBytes();
        bytes[c.offset] = static_cast<uint8_t>(c.value);
        const std::string error = FngError(bytes);
        EXPECT_THAT(error, HasSubstr("byte " + std::to_string(c.offset) + ": "));
        EXPECT_THAT(error, HasSubstr(c.text));
    }
}

TEST(RealRecordings, AllAreImported) {
    const std::string directory = host_test::RealDataDirectory();
    if (directory.empty())
        GTEST_SKIP() << "no real recordings: set FPNAVI_REALDATA to their directory";
    const std::vector<Gesture> gestures = host::ImportFng(directory + "/gestures");
    EXPECT_EQ(gestures.size(), 44U);
    for (const Gesture& gesture : gestures) {
        EXPECT_FALSE(gesture.tier.empty()) << gesture.id;
        EXPECT_FALSE(gesture.accepted.empty()) << gesture.id;
        EXPECT_GE(gesture.frames.size(), 3U) << gesture.id;
        if (gesture.end == host::GestureEnd::Lift) {
            EXPECT_EQ(gesture.frames.back().presence, host::Presence::Absent) << gesture.id;
        }
    }
    const auto first = std::find_if(gestures.begin(), gestures.end(),
                                    [](const Gesture& g) { return g.id == "s_fp_tiled_000"; });
    ASSERT_NE(first, gestures.end());
    EXPECT_EQ(first->label, VKEY_RIGHT);
    EXPECT_EQ(first->frames.size(), 17U);
    EXPECT_THAT(first->tags, Contains("source:card_f09"));
    EXPECT_GT(*first->frames.back().x16 - *first->frames.front().x16, 0);
}

}  // namespace
