// Command lines that make no sense: code 2, nothing on stdout, and a message that says what is
// wrong and what was expected.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>

#include "CommandSupport.h"

namespace {

using host_test::CommandEnd;
using host_test::Joined;
using host_test::ReadBytes;
using host_test::RunCommand;
using ::testing::HasSubstr;

using Words = std::vector<std::string>;

struct Case {
    Words words;
    const char* message;
};

class Usage : public ::testing::Test {
  protected:
    void SetUp() override { m_folder = host_test::TestDirectory(); }

    // Runs the command; % stands for the test's folder.
    void Check(const Case& c) const {
        Words words;
        for (const std::string& word : c.words)
            words.push_back(!word.empty() && word[0] == '%' ? m_folder + word.substr(1) : word);
        const CommandEnd end = RunCommand(words, m_folder + "/out");
        EXPECT_EQ(end.exitCode, 2) << Joined(words);
        EXPECT_THAT(end.err, HasSubstr(c.message)) << Joined(words);
        EXPECT_TRUE(ReadBytes(m_folder + "/out").empty()) << Joined(words);
        EXPECT_FALSE(std::filesystem::exists(m_folder + "/c.db")) << Joined(words);
    }

    std::string m_folder;
};

TEST_F(Usage, NumbersAreWholeDecimalAndInTheirRange) {
    const Case cases[] = {
        {{"tune", "--seed", "-1"}, "--seed: '-1', expected a whole number from 0 to 1844674407370"},
        {{"tune", "--seed", "99999999999999999999"}, "--seed: '99999999999999999999', expected"},
        {{"tune", "--seed", "18446744073709551616"}, "to 18446744073709551615"},
        {{"tune", "--seed", "010"}, "--seed: '010', expected a whole number without leading zeros"},
        {{"tune", "--seed", "0x10"}, "--seed: '0x10', expected a whole number from 0"},
        {{"tune", "--seed", "1.5"}, "--seed: '1.5', expected a whole number from 0"},
        {{"tune", "--seed", ""}, "--seed: '', expected a whole number from 0"},
        {{"tune", "--calls", "010"}, "--calls: '010', expected"},
        {{"tune", "--calls", "1000001"}, "--calls: '1000001', expected a whole number from 1 to"},
        {{"tune", "--layout", "-1"}, "--layout: '-1', expected a whole number from 0 to 1"},
        {{"synth", "%/c.db", "--count", "1", "--seed", "-1"}, "--seed: '-1', expected"},
        {{"synth", "%/c.db", "--count", "010"}, "--count: '010', expected"},
        {{"synth", "%/c.db", "--count", "-3"}, "--count: '-3', expected a whole number from 1 to"},
        {{"synth", "%/c.db", "--count", "1", "--first", "-1"}, "--first: '-1', expected"},
        {{"replay", "%/c.db", "--jobs", "08"}, "--jobs: '08', expected"},
    };
    for (const Case& c : cases)
        Check(c);
}

TEST_F(Usage, RegistersMayBeHexadecimal) {
    const Case cases[] = {
        {{"tune", "--start", "-1"}, "--start: '-1', expected a register"},
        {{"tune", "--start", "010"}, "--start: '010', expected a register"},
        {{"tune", "--start", "0x"}, "--start: '0x', expected a register"},
        {{"tune", "--start", "0x100000000"}, "as 0x123456C0 or 191, 0 to 0xFFFFFFFF"},
        {{"tune", "--gain20", "4294967296"}, "--gain20: '4294967296', expected a register"},
        {{"tune", "--gain2c", "12345G"}, "--gain2c: '12345G', expected a register"},
    };
    for (const Case& c : cases)
        Check(c);
    const std::string hex = m_folder + "/hex";
    const std::string decimal = m_folder + "/decimal";
    RunCommand({"tune", "--seed", "2", "--start", "0xC0"}, hex);
    RunCommand({"tune", "--seed", "2", "--start", "192"}, decimal);
    EXPECT_FALSE(ReadBytes(hex).empty());
    EXPECT_EQ(ReadBytes(hex), ReadBytes(decimal));
}

TEST_F(Usage, AnEmptyWordIsNoName) {
    const Case cases[] = {
        {{"replay", "%/c.db", "--gesture", ""}, "--gesture: the text is empty, expected an id"},
        {{"replay", "%/c.db", "--params", ""}, "--params: the text is empty, expected a file"},
        {{"tune", "--params", ""}, "--params: the text is empty, expected a file"},
        {{"tune", "--raw", ""}, "--raw: the text is empty, expected a file"},
        {{"params", "--params", ""}, "--params: the text is empty, expected a file"},
        {{"import", "%/c.db", "--raw", "a.bin", "--mode", "fp", "--id", ""},
         "--id: the text is empty, expected an id"},
        {{"import", "%/c.db", "--raw", "", "--mode", "fp"}, "--raw: the text is empty"},
        {{"import", "%/c.db", ""}, "PATH: the text is empty"},
    };
    for (const Case& c : cases)
        Check(c);
}

TEST_F(Usage, AnUnknownSubcommandIsNamedWithTheNearestOrAll) {
    const char* const all =
        "unknown subcommand 'dance', expected synth, import, replay, params or "
        "tune";
    const Case cases[] = {
        {{"dance"}, all},
        {{"dance", "--help"}, all},
        {{"--help", "dance"}, all},
        {{"dance", "replay"}, all},
        {{"reply"}, "unknown subcommand 'reply', did you mean 'replay'?"},
        {{"param", "--help"}, "unknown subcommand 'param', did you mean 'params'?"},
    };
    for (const Case& c : cases)
        Check(c);
}

TEST_F(Usage, AnUnknownNameIsNamedWithTheNearestOrAll) {
    const Words import = {"import", "%/c.db", "--raw", "a.bin"};
    const auto with = [&](Words more) {
        Words words = import;
        words.insert(words.end(), more.begin(), more.end());
        return words;
    };
    const Case cases[] = {
        {with({"--mode", "fp", "--label", "LINKS"}),
         "--label: unknown key 'LINKS', expected NONE, UP, DOWN, RIGHT, LEFT or NO_MOVE"},
        {with({"--mode", "fp", "--label", "LETF"}),
         "--label: unknown key 'LETF', did you mean 'LEFT'?"},
        {with({"--mode", "fp", "--label", ""}), "--label: unknown key '', expected NONE"},
        {with({"--mode", "turbo"}), "--mode: unknown mode 'turbo', expected fp, hg or ds"},
        {with({"--mode", "fp", "--end", "timout"}),
         "--end: unknown end 'timout', did you mean 'timeout'?"},
        {{"params", "--mode", "xyz"}, "--mode: unknown mode 'xyz', expected fp, hg or ds"},
    };
    for (const Case& c : cases)
        Check(c);
}

TEST_F(Usage, AnIdIsUtf8) {
    Check({{"import", "%/c.db", "--raw", "a.bin", "--mode", "fp", "--id", "a\xFFz"},
           "--id: the text is no UTF-8"});
}

}  // namespace
