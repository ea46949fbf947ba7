// Importing raw dumps of frames and registers.
#include <gmock/gmock.h>

#include <limits>

#include "HostTestSupport.h"
#include "importers/RawImport.h"

namespace {

using host::Gesture;
using host_test::ErrorOf;
using host_test::TestDirectory;
using host_test::WriteBytes;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::StartsWith;

using Bytes = std::vector<uint8_t>;

constexpr size_t kPixels = 56 * 36;

host::RawRecording RawWith(size_t frameBytes) {
    host::RawRecording recording;
    recording.framesPath = TestDirectory() + "/dump.raw";
    Bytes bytes(frameBytes);
    for (size_t i = 0; i < bytes.size(); ++i)
        bytes[i] = static_cast<uint8_t>(i / kPixels + 1);
    WriteBytes(recording.framesPath, bytes);
    return recording;
}

TEST(RawImport, FramesAreCutInOrder) {
    host::RawRecording recording = RawWith(3 * kPixels);
    recording.label = VKEY_LEFT;
    recording.end = host::GestureEnd::TimeOut;
    const Gesture gesture = host::ImportRaw(recording);
    EXPECT_EQ(gesture.id, "dump");
    ASSERT_EQ(gesture.frames.size(), 3U);
    EXPECT_EQ(gesture.frames[2].raw, Bytes(kPixels, 3));
    EXPECT_EQ(gesture.label, VKEY_LEFT);
    EXPECT_THAT(gesture.accepted, ElementsAre(VKEY_LEFT));
    EXPECT_EQ(gesture.end, host::GestureEnd::TimeOut);
    EXPECT_FALSE(gesture.frames[0].presence.has_value());
}

TEST(RawImport, ModeChoosesTheGeometry) {
    host::RawRecording recording = RawWith(2 * 40 * 48);
    recording.mode = host::Mode::Hg;
    const Gesture gesture = host::ImportRaw(recording);
    EXPECT_EQ(gesture.frames.size(), 2U);
    EXPECT_EQ(host::ParamValue(gesture.params, "s_modeFlag"), 1);
}

TEST(RawImport, RemainderIsRefusedAndNamed) {
    const host::RawRecording recording = RawWith(2 * kPixels + 7);
    const std::string error = ErrorOf([&] { host::ImportRaw(recording); });
    EXPECT_THAT(error, StartsWith(recording.framesPath + ": byte 4032: "));
    EXPECT_THAT(error, HasSubstr("a remainder of 7 bytes after 2 frames"));
    EXPECT_THAT(error, HasSubstr("2016 bytes (56 x 36, mode fp)"));
}

TEST(RawImport, EmptyFileIsRefused) {
    const host::RawRecording recording = RawWith(0);
    EXPECT_THAT(ErrorOf([&] { host::ImportRaw(recording); }), HasSubstr("the file is empty"));
}

TEST(RawImport, RegistersAreReadLowRegisterFirst) {
    host::RawRecording recording = RawWith(2 * kPixels);
    recording.mode = host::Mode::DoubleScan;
    recording.registersPath = recording.framesPath + ".reg";
    WriteBytes(recording.registersPath, {1, 2, 3, 4, 5, 6, 7, 0x88, 9, 10, 11, 12, 13, 14, 15, 16});
    const Gesture gesture = host::ImportRaw(recording);
    EXPECT_EQ(gesture.frames[0].reg24, 0x04030201U);
    EXPECT_EQ(gesture.frames[0].reg28, 0x88070605U);
    EXPECT_EQ(gesture.frames[1].reg24, 0x0C0B0A09U);
}

TEST(RawImport, RegistersOfAnotherCountAreRefused) {
    host::RawRecording recording = RawWith(2 * kPixels);
    recording.mode = host::Mode::DoubleScan;
    recording.registersPath = recording.framesPath + ".reg";
    for (const size_t size : {0U, 8U, 15U, 17U, 24U}) {
        WriteBytes(recording.registersPath, Bytes(size));
        const std::string error = ErrorOf([&] { host::ImportRaw(recording); });
        EXPECT_THAT(error, StartsWith(recording.registersPath + ": byte "));
        EXPECT_THAT(error, HasSubstr(std::to_string(size) + " bytes, expected 16"));
    }
}

TEST(RawImport, RegistersBelongToDoubleScanAlone) {
    host::RawRecording recording = RawWith(kPixels);
    recording.registersPath = recording.framesPath;
    EXPECT_THAT(ErrorOf([&] { host::ImportRaw(recording); }), HasSubstr("mode ds only"));
    recording.registersPath.clear();
    recording.mode = host::Mode::DoubleScan;
    EXPECT_THAT(ErrorOf([&] { host::ImportRaw(recording); }),
                HasSubstr("mode ds without a file of registers"));
}

TEST(RawImport, GeometryThatMakesNoSenseIsRefused) {
    host::RawRecording recording = RawWith(kPixels);
    for (const int32_t width : {0, -8, 600, std::numeric_limits<int32_t>::max()}) {
        host::ParamValue(recording.params, "s_blockWidthFp") = width;
        EXPECT_THAT(ErrorOf([&] { host::ImportRaw(recording); }),
                    HasSubstr("expected image sides of 1 to 4096"));
    }
}

}  // namespace
