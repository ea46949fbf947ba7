// Names that were meant, and text that is UTF-8.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "common/Text.h"
#include "recording/Keys.h"

namespace {

using host::IsUtf8;
using host::NearestName;

const std::vector<std::string_view> kNames = {"UP", "DOWN", "LEFT", "NO_MOVE"};

TEST(NearestName, OneEditInAnyCaseIsFound) {
    EXPECT_EQ(NearestName("LEFTT", kNames), "LEFT");
    EXPECT_EQ(NearestName("lft", kNames), "LEFT");
    EXPECT_EQ(NearestName("LOFT", kNames), "LEFT");
    EXPECT_EQ(NearestName("LETF", kNames), "LEFT");  // neighbours exchanged
    EXPECT_EQ(NearestName("nomove", kNames), "NO_MOVE");
}

TEST(NearestName, AThirdOfTheLettersMayDiffer) {
    const std::vector<std::string_view> names = {"abcdef"};
    EXPECT_EQ(NearestName("abcdxy", names), "abcdef");
    EXPECT_EQ(NearestName("abcxyz", names), "");
}

TEST(NearestName, NothingIsNearToAnotherWord) {
    EXPECT_EQ(NearestName("LINKS", kNames), "");
    EXPECT_EQ(NearestName("", kNames), "");
    EXPECT_EQ(NearestName("LEFT", {}), "");
}

TEST(NearestName, TheNearestOfSeveralIsTaken) {
    EXPECT_EQ(NearestName("s_gapWidht", {"s_gapHeight", "s_gapWidth"}), "s_gapWidth");
}

TEST(Suggestion, IsANearNameOrTheWholeList) {
    EXPECT_EQ(host::Suggestion("LETF", kNames), "did you mean 'LEFT'?");
    EXPECT_EQ(host::Suggestion("LINKS", host::KeyNames()),
              "expected NONE, UP, DOWN, RIGHT, LEFT or NO_MOVE");
}

TEST(Utf8, WellFormedTextIsTaken) {
    for (const char* text : {"", "plain", "\xC3\xA4", "\xE2\x82\xAC", "\xF0\x9F\x91\x86",
                             "\xEE\x80\x80", "\xED\x9F\xBF", "\xF4\x8F\xBF\xBF"})
        EXPECT_TRUE(IsUtf8(text)) << text;
}

TEST(Utf8, AnyOtherByteSequenceIsRefused) {
    for (const char* text :
         {"\xFF", "a\xE4z", "\x80", "\xC3", "\xC0\xAF", "\xC1\xBF", "\xE0\x9F\xBF", "\xED\xA0\x80",
          "\xF0\x8F\xBF\xBF", "\xF4\x90\x80\x80", "\xF5\x80\x80\x80", "\xE2\x82", "\xE2\x28\xA1"})
        EXPECT_FALSE(IsUtf8(text));
}

}  // namespace
