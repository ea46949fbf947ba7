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

host::RawRecording RawWithSettings(size_t frameBytes, const char* toml) {
    host::RawRecording recording = RawWith(frameBytes);
    recording.paramFile = "p.toml";
    recording.settings = host::ParseParamSettings(toml, recording.paramFile);
    return recording;
}

TEST(RawImport, SettingsOfAFileAreLaidOverTheParameters) {
    const Gesture gesture = host::ImportRaw(RawWithSettings(kPixels, "s_minDelta = 7\n"));
    EXPECT_EQ(host::ParamValue(gesture.params, "s_minDelta"), 7);
    EXPECT_EQ(host::ParamValue(gesture.params, "s_fpImp"), 80);
}

TEST(RawImport, ASettingOfAnotherModeIsRefusedAtItsPlace) {
    EXPECT_THAT(ErrorOf([&] { host::ImportRaw(RawWithSettings(kPixels, "\ns_modeFlag = 2\n")); }),
                StartsWith("p.toml:2:14: s_modeFlag = 2 is mode ds, expected a value of mode fp"));
    host::RawRecording hg = RawWithSettings(40 * 48, "s_modeFlag = 0\n");
    hg.mode = host::Mode::Hg;
    EXPECT_THAT(ErrorOf([&] { host::ImportRaw(hg); }),
                StartsWith("p.toml:1:14: s_modeFlag = 0 is mode fp, expected a value of mode hg"));
}

TEST(RawImport, AnyValueOfTheSameModeIsKept) {
    const Gesture gesture = host::ImportRaw(RawWithSettings(kPixels, "s_modeFlag = 5\n"));
    EXPECT_EQ(host::ParamValue(gesture.params, "s_modeFlag"), 5);
    EXPECT_EQ(gesture.mode, host::Mode::Fp);
}

TEST(RawImport, ASettingWithoutAUsableImageIsRefusedAtItsPlace) {
    EXPECT_THAT(
        ErrorOf([&] { host::ImportRaw(RawWithSettings(kPixels, "s_blockWidthFp = 600\n")); }),
        StartsWith("p.toml:1:18: s_blockWidthFp = 600 makes the image 4200 pixels wide"));
    EXPECT_THAT(
        ErrorOf([&] { host::ImportRaw(RawWithSettings(kPixels, "s_blockRowNumFp = -1\n")); }),
        StartsWith("p.toml:1:19: s_blockRowNumFp = -1 makes the image -2 pixels high (-1 blocks "
                   "of 2), expected 1 "
                   "to 4096"));
    // Two negative ones make a product that looks like an image.
    EXPECT_THAT(ErrorOf([&] {
                    host::ImportRaw(
                        RawWithSettings(kPixels, "s_blockRowNumFp = -18\ns_blockHeightFp = -2\n"));
                }),
                StartsWith("p.toml:2:19: s_blockHeightFp = -2 makes"));
}

TEST(RawImport, SettingsOfTheOtherModesImageDoNotMatter) {
    EXPECT_EQ(host::ImportRaw(RawWithSettings(kPixels, "s_blockWidthHg = 600\n")).frames.size(),
              1U);
}

TEST(RawImport, ARemainderNamesTheSettingsOfTheImage) {
    const std::string error = ErrorOf([&] {
        host::ImportRaw(RawWithSettings(kPixels, "s_minDelta = 3\ns_blockColNumFp = 8\n"));
    });
    EXPECT_THAT(error, HasSubstr("dump.raw: byte 0: a remainder of 2016 bytes after 0 frames"));
    EXPECT_THAT(error, HasSubstr("2304 bytes (64 x 36, mode fp; s_blockColNumFp = 8 at "
                                 "p.toml:2:19)"));
}

}  // namespace
