// The hash itself, and that no output of a call stays out of it: a made-up side whose answers are
// changed one by one.
#include <gtest/gtest.h>

#include <set>

#include "HashedCalls.h"
#include "parameters/ParamTable.h"

namespace fpnavi_test {
namespace {

uint64_t HashOf(std::string_view bytes) {
    Digest digest;
    for (const char byte : bytes)
        digest.Byte(static_cast<uint8_t>(byte));
    return digest.Value();
}

// Values published with the hash.
TEST(Digest, IsFnv1a) {
    EXPECT_EQ(HashOf(""), 0xCBF29CE484222325ULL);
    EXPECT_EQ(HashOf("a"), 0xAF63DC4C8601EC8CULL);
    EXPECT_EQ(HashOf("foobar"), 0x85944171F73967E8ULL);
}

TEST(Digest, TakesTheLowestByteOfAnIntegerFirst) {
    Digest digest;
    digest.Unsigned(0x64636261U);
    EXPECT_EQ(digest.Value(), HashOf("abcd"));
}

TEST(Digest, TakesNegativeIntegersAsTwosComplement) {
    Digest digest;
    digest.Signed(-2);
    EXPECT_EQ(digest.Value(), HashOf("\xFE\xFF\xFF\xFF"));
}

TEST(Digest, TellsTextsByTheirLengths) {
    Digest one;
    one.Text("ab");
    one.Text("c");
    Digest other;
    other.Text("a");
    other.Text("bc");
    EXPECT_NE(one.Value(), other.Value());
}

TEST(Digest, TakesLettersAboveAsciiAsBytes) {
    Digest digest;
    digest.Text("\xE4");
    EXPECT_EQ(digest.Value(), HashOf(std::string_view("\x01\0\0\0\xE4", 5)));
}

// What the made-up side answers.
struct Answers {
    int32_t setParam = 0;
    int32_t block = 0;
    int32_t zones = 0;
    int32_t frame = 0;
    int32_t vote = 0;
    int32_t status = 0;
    int32_t tune = 0;
    std::array<int32_t, kRecordIntegers> record{};
    uint8_t lastPixel = 0;
    uint32_t dac = 0;
    std::string line;  // logged by the vote; empty for none
};

Answers s_answers;
std::vector<std::string>* s_lines = nullptr;

constexpr size_t kPixels = size_t{56} * 36;  // of the default parameters

const Side& MadeUpSide() {
    static const Side side = {
        [](const int32_t*) { return s_answers.setParam; },
        [] {},
        [] { return const_cast<const int32_t*>(s_answers.record.data()); },
        [](const uint8_t*, int32_t, int32_t, uint8_t* image) {
            image[kPixels - 1] = s_answers.lastPixel;
            return s_answers.block;
        },
        [](uint32_t, uint32_t) { return s_answers.zones; },
        [](const uint8_t*, const uint8_t*, int32_t) { return s_answers.frame; },
        [](int32_t) {
            if (!s_answers.line.empty())
                s_lines->push_back(s_answers.line);
            return s_answers.vote;
        },
        [](const uint8_t*) { return s_answers.status; },
        [](const uint8_t*, int32_t, int32_t, uint32_t* dac, const uint32_t*, const uint32_t*) {
            *dac = s_answers.dac;
            return s_answers.tune;
        },
        [](std::vector<std::string>* lines) { s_lines = lines; }};
    return side;
}

// The hash of one of each call under answers.
uint64_t HashOfCalls(const Answers& answers) {
    s_answers = answers;
    HashedCalls calls(MadeUpSide());
    calls.SetParam(host::DefaultParams());
    calls.Clear();
    calls.Zones(0, 0);
    calls.Block({}, 56);
    calls.Status();
    calls.Frame(0);
    calls.Vote(1);
    calls.Tune(0, 0);
    return calls.Hash();
}

TEST(HashedCalls, EveryResultCounts) {
    std::set<uint64_t> hashes = {HashOfCalls({})};
    for (int32_t Answers::*result :
         {&Answers::setParam, &Answers::block, &Answers::zones, &Answers::frame, &Answers::vote,
          &Answers::status, &Answers::tune}) {
        Answers answers;
        answers.*result = -1;
        EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second);
    }
}

TEST(HashedCalls, EveryIntegerOfTheRecordCounts) {
    std::set<uint64_t> hashes = {HashOfCalls({})};
    for (size_t i = 0; i < kRecordIntegers; ++i) {
        Answers answers;
        answers.record[i] = 1;
        EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second) << i;
    }
}

TEST(HashedCalls, ImageRegisterAndLogCount) {
    std::set<uint64_t> hashes = {HashOfCalls({})};
    Answers answers;
    answers.lastPixel = 1;
    EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second);
    answers = {};
    answers.dac = 0x80000000U;
    EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second);
    answers = {};
    answers.line = "4 TQCODE a line";
    EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second);
    answers.line = "4 TQCODE another line";
    EXPECT_TRUE(hashes.insert(HashOfCalls(answers)).second);
}

}  // namespace
}  // namespace fpnavi_test
