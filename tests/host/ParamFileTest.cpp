// Parameter table and parameter files.
#include <gmock/gmock.h>

#include <limits>
#include <set>

#include "HostTestSupport.h"
#include "parameters/ParamFile.h"
#include "recording/Keys.h"

namespace {

using host::DefaultParams;
using host::ParamBlock;
using host::ParamIndex;
using host::ParamValue;
using host::ParseParams;
using host_test::ErrorOf;
using ::testing::HasSubstr;
using ::testing::StartsWith;

std::string ParseError(const std::string& text) {
    return ErrorOf([&] { ParseParams(text, "p.toml"); });
}

TEST(ParamTable, NamesAreUniqueAndFoundAtTheirIndex) {
    std::set<std::string> names;
    for (size_t i = 0; i < host::ParamTable().size(); ++i) {
        const host::ParamInfo& info = host::ParamTable()[i];
        EXPECT_TRUE(names.insert(info.name).second) << info.name;
        EXPECT_EQ(ParamIndex(info.name), i);
        EXPECT_FALSE(std::string(info.meaning).empty()) << info.name;
    }
}

TEST(ParamTable, OrderHasItsLandmarks) {
    EXPECT_EQ(ParamIndex("s_sensorBackFlag"), 0U);
    EXPECT_EQ(ParamIndex("s_modeFlag"), 14U);
    EXPECT_EQ(ParamIndex("_NAVI_range_recommend.RANGE_LOW"), 22U);
    EXPECT_EQ(ParamIndex("s_gapHeight"), 43U);
    EXPECT_EQ(ParamIndex("s_multiBloclkFlag"), 58U);
    EXPECT_EQ(ParamIndex("s_logShowFlag"), 77U);
    EXPECT_FALSE(ParamIndex("s_multiBlockFlag").has_value());
}

TEST(ParamTable, DefaultGeometriesAreThoseOfTheTwoSensors) {
    const host::Geometry fp = host::GeometryOf(DefaultParams());
    EXPECT_EQ(fp.Width(), 56);
    EXPECT_EQ(fp.Height(), 36);
    const host::Geometry hg = host::GeometryOf(host::ParamsForMode(host::Mode::Hg, true));
    EXPECT_EQ(hg.Width(), 40);
    EXPECT_EQ(hg.Height(), 48);
}

TEST(ParamTable, PlainLayoutHasNoGaps) {
    const ParamBlock plain = host::ParamsForMode(host::Mode::DoubleScan, true);
    EXPECT_EQ(ParamValue(plain, "s_modeFlag"), 2);
    EXPECT_EQ(ParamValue(plain, "s_gapWidth"), 0);
    EXPECT_EQ(ParamValue(plain, "s_gapHeight"), 0);
    const ParamBlock tiled = host::ParamsForMode(host::Mode::DoubleScan, false);
    EXPECT_EQ(ParamValue(tiled, "s_gapWidth"), 32);
    EXPECT_EQ(ParamValue(tiled, "s_gapHeight"), 16);
}

TEST(Keys, NamesAndValuesAreInverse) {
    for (int32_t key = VKEY_NONE; key <= VKEY_NO_MOVE; ++key)
        EXPECT_EQ(host::ParseKey(host::KeyName(key)), key);
    EXPECT_EQ(host::ParseKey("no_move"), VKEY_NO_MOVE);
    EXPECT_EQ(host::KeyName(VKEY_RIGHT), "RIGHT");
    EXPECT_FALSE(host::ParseKey("SIDEWAYS").has_value());
    EXPECT_FALSE(host::ParseKey("").has_value());
    EXPECT_EQ(host::KeyName(-1), "-1");
    EXPECT_EQ(host::KeyName(6), "6");
}

TEST(Keys, ModesAndEndsHaveNames) {
    EXPECT_EQ(host::ParseMode("ds"), host::Mode::DoubleScan);
    EXPECT_EQ(host::ModeName(host::Mode::Hg), "hg");
    EXPECT_FALSE(host::ParseMode("xy").has_value());
    EXPECT_EQ(host::ParseEnd("timeout"), host::GestureEnd::TimeOut);
    EXPECT_EQ(host::EndName(host::GestureEnd::Lift), "lift");
}

TEST(ParamTable, UnknownModeFlagActsAsFp) {
    ParamBlock params = DefaultParams();
    ParamValue(params, "s_modeFlag") = 3;
    EXPECT_EQ(host::ModeOf(params), host::Mode::Fp);
}

// No source of the module reads them; tests/docs looks there.
TEST(ParamTable, FiveAreStoredAndNeverRead) {
    std::set<std::string> names;
    for (size_t i = 0; i < host::ParamTable().size(); ++i) {
        if (!host::IsRead(i))
            names.insert(host::ParamTable()[i].name);
    }
    EXPECT_EQ(names, (std::set<std::string>{"_NAVI_TOP_REF", "_NAVI_range_effective.RANGE_LOW",
                                            "_NAVI_range_effective.RANGE_HIGH", "s_fftFreqLow",
                                            "s_fftFreqHigh"}));
}

TEST(ParamFile, SettingsHaveThePlaceOfTheirValue) {
    const std::vector<host::ParamSetting> settings =
        host::ParseParamSettings("# one\n  s_minDelta = 5\n", "p.toml");
    ASSERT_EQ(settings.size(), 1U);
    EXPECT_EQ(settings[0].index, ParamIndex("s_minDelta"));
    EXPECT_EQ(settings[0].value, 5);
    EXPECT_EQ(settings[0].place, "2:16");
}

TEST(ParamFile, EmptyTextKeepsTheDefaults) {
    EXPECT_EQ(ParseParams("", "p.toml"), DefaultParams());
}

TEST(ParamFile, NamedValuesReplaceAndOthersKeepTheBase) {
    ParamBlock base = DefaultParams();
    ParamValue(base, "s_fpImp") = 70;
    const ParamBlock params = ParseParams("s_minDelta = 5\n", "p.toml", base);
    EXPECT_EQ(ParamValue(params, "s_minDelta"), 5);
    EXPECT_EQ(ParamValue(params, "s_fpImp"), 70);
    EXPECT_EQ(ParamValue(params, "s_ctImp"), 20);
}

TEST(ParamFile, BandsAreReadFromDottedKeysTablesAndInlineTables) {
    for (const char* text :
         {"_NAVI_range_mean.RANGE_LOW = 141\n_NAVI_range_mean.RANGE_HIGH = 221\n",
          "[_NAVI_range_mean]\nRANGE_LOW = 141\nRANGE_HIGH = 221\n",
          "_NAVI_range_mean = { RANGE_LOW = 141, RANGE_HIGH = 221 }\n"}) {
        const ParamBlock params = ParseParams(text, "p.toml");
        EXPECT_EQ(ParamValue(params, "_NAVI_range_mean.RANGE_LOW"), 141) << text;
        EXPECT_EQ(ParamValue(params, "_NAVI_range_mean.RANGE_HIGH"), 221) << text;
    }
}

TEST(ParamFile, SettingsAreWhatTheFileNamesWithTheirPlaces) {
    const std::vector<host::ParamSetting> settings = host::ParseParamSettings(
        "s_minDelta = 0\n[_NAVI_range_mean]\n  RANGE_HIGH = -7\n", "p.toml");
    ASSERT_EQ(settings.size(), 2U);
    for (const host::ParamSetting& setting : settings) {
        const bool delta = setting.index == host::ParamIndex("s_minDelta");
        EXPECT_TRUE(delta || setting.index == host::ParamIndex("_NAVI_range_mean.RANGE_HIGH"));
        EXPECT_EQ(setting.value, delta ? 0 : -7);
        EXPECT_EQ(setting.place, delta ? "1:14" : "3:16");
    }
    EXPECT_TRUE(host::ParseParamSettings("# none\n", "p.toml").empty());
}

TEST(ParamFile, HalfABandKeepsTheOtherHalf) {
    const ParamBlock params = ParseParams("_NAVI_range_mean.RANGE_LOW = 141\n", "p.toml");
    EXPECT_EQ(ParamValue(params, "_NAVI_range_mean.RANGE_HIGH"), 220);
}

TEST(ParamFile, ExtremesOf32BitsAreTaken) {
    const ParamBlock params =
        ParseParams("s_fpImp = 2147483647\ns_ctImp = -2147483648\n", "p.toml");
    EXPECT_EQ(ParamValue(params, "s_fpImp"), std::numeric_limits<int32_t>::max());
    EXPECT_EQ(ParamValue(params, "s_ctImp"), std::numeric_limits<int32_t>::min());
}

TEST(ParamFile, UnknownNameIsRefusedWithItsPosition) {
    const std::string error = ParseError("s_minDelta = 4\n  s_minDelay = 4\n");
    EXPECT_THAT(error, StartsWith("p.toml:2:3: "));
    EXPECT_THAT(error, HasSubstr("unknown parameter s_minDelay, did you mean 's_minDelta'?"));
}

TEST(ParamFile, ANameThatIsNearToNoneSaysWhereTheNamesAre) {
    EXPECT_THAT(
        ParseError("sensitivity = 4\n"),
        HasSubstr("unknown parameter sensitivity, expected a name that fpnavi params lists"));
}

TEST(ParamFile, ABandIsSuggestedToo) {
    EXPECT_THAT(ParseError("_NAVI_range_meen.RANGE_LOW = 4\n"),
                HasSubstr("did you mean '_NAVI_range_mean.RANGE_LOW'?"));
    EXPECT_THAT(ParseError("_NAVI_range_mean.RANGE_LOV = 4\n"),
                HasSubstr("did you mean '_NAVI_range_mean.RANGE_LOW'?"));
}

TEST(ParamFile, UnknownHalfOfABandIsRefused) {
    const std::string error = ParseError("_NAVI_range_mean.RANGE_MID = 4\n");
    EXPECT_THAT(error, StartsWith("p.toml:1:"));
    EXPECT_THAT(error, HasSubstr("_NAVI_range_mean.RANGE_MID"));
    EXPECT_THAT(error, HasSubstr("RANGE_LOW"));
}

TEST(ParamFile, QuotedDottedNameIsNoSecondSpelling) {
    EXPECT_THAT(ParseError("\"_NAVI_range_mean.RANGE_LOW\" = 4\n"), HasSubstr("unknown"));
}

TEST(ParamFile, ABandWithoutHalvesIsRefused) {
    const std::string error = ParseError("_NAVI_range_mean = 4\n");
    EXPECT_THAT(error, StartsWith("p.toml:1:20: "));
    EXPECT_THAT(error, HasSubstr("RANGE_LOW"));
}

TEST(ParamFile, OtherTypesAreRefusedWithTheirPosition) {
    for (const char* value : {"4.0", "\"4\"", "true", "[4]", "{ a = 4 }", "1979-05-27"}) {
        const std::string error = ParseError(std::string("s_minDelta = ") + value + "\n");
        EXPECT_THAT(error, StartsWith("p.toml:1:14: ")) << value;
        EXPECT_THAT(error, HasSubstr("expected an integer")) << value;
    }
}

TEST(ParamFile, ValuesBeyond32BitsAreRefused) {
    for (const char* value : {"2147483648", "-2147483649", "9223372036854775807"}) {
        const std::string error = ParseError(std::string("\ns_minDelta = ") + value + "\n");
        EXPECT_THAT(error, StartsWith("p.toml:2:14: ")) << value;
        EXPECT_THAT(error, HasSubstr("out of range")) << value;
    }
}

TEST(ParamFile, BrokenTomlIsRefusedWithItsPosition) {
    EXPECT_THAT(ParseError("s_minDelta = 4\ns_fpImp = = 3\n"), StartsWith("p.toml:2:"));
    EXPECT_THAT(ParseError("s_minDelta = 4\ns_minDelta = 5\n"), StartsWith("p.toml:2:"));
    EXPECT_THAT(ParseError("s_minDelta"), StartsWith("p.toml:1:"));
}

TEST(ParamFile, WrittenTextIsReadAgain) {
    ParamBlock params{};
    for (size_t i = 0; i < params.size(); ++i)
        params[i] = static_cast<int32_t>(i * 1000) - 30000;
    EXPECT_EQ(ParseParams(host::ParamFileText(params), "p.toml"), params);
    EXPECT_EQ(ParseParams(host::ParamFileText(DefaultParams()), "p.toml"), DefaultParams());
}

TEST(ParamFile, WrittenTextTellsWhatDiffersFromTheDefault) {
    ParamBlock params = DefaultParams();
    ParamValue(params, "s_minDelta") = 5;
    const std::string text = host::ParamFileText(params);
    EXPECT_THAT(text, HasSubstr("\ns_minDelta = 5  # default 4\n"));
    EXPECT_THAT(text, HasSubstr("\ns_fpImp = 80\n"));
}

TEST(ParamFile, FileIsReadAndNamedInErrors) {
    const std::string path = host_test::TestDirectory() + "/my.toml";
    host_test::WriteText(path, "s_minDelta = 6\n");
    EXPECT_EQ(ParamValue(host::ReadParamFile(path), "s_minDelta"), 6);
    host_test::WriteText(path, "s_minDelta = x\n");
    EXPECT_THAT(ErrorOf([&] { host::ReadParamFile(path); }), StartsWith(path + ":1:"));
}

TEST(ParamFile, MissingFileAndDirectoryAreRefused) {
    const std::string directory = host_test::TestDirectory();
    EXPECT_THAT(ErrorOf([&] { host::ReadParamFile(directory + "/none.toml"); }),
                StartsWith(directory + "/none.toml: cannot be opened"));
    EXPECT_THAT(ErrorOf([&] { host::ReadParamFile(directory); }), HasSubstr("is a directory"));
}

}  // namespace
