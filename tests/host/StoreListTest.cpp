// Lists of a store: heads in parts, its extent, its parameter blocks; and readings one after the
// other, which keep statements and parameters.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include "StoreTestSupport.h"
#include "recording/Keys.h"

namespace {

using host::Gesture;
using host::GestureHead;
using host::Store;
using host_test::ErrorOf;
using host_test::ExpectSameGesture;
using host_test::RunSql;
using host_test::SmallGesture;
using host_test::StoreOf;
using ::testing::ElementsAre;
using ::testing::HasSubstr;
using ::testing::IsEmpty;

std::vector<std::string> IdsOf(const std::vector<GestureHead>& heads) {
    std::vector<std::string> ids;
    ids.reserve(heads.size());
    for (const GestureHead& head : heads)
        ids.push_back(head.id);
    return ids;
}

TEST(StoreList, HeadsComeInPartsInTheOrderOfAppending) {
    const Store store =
        Store::OpenForReading(StoreOf({SmallGesture("c"), SmallGesture("a"), SmallGesture("b")}));
    const std::vector<GestureHead> first = store.Heads(INT64_MIN, 2);
    EXPECT_THAT(IdsOf(first), ElementsAre("c", "a"));
    const std::vector<GestureHead> rest = store.Heads(first.back().seq, 2);
    EXPECT_THAT(IdsOf(rest), ElementsAre("b"));
    EXPECT_THAT(store.Heads(rest.back().seq, 2), IsEmpty());
}

TEST(StoreList, AHeadSaysWhatIsKnownWithoutTheFrames) {
    Gesture gesture = SmallGesture("g", 4);
    gesture.label = VKEY_LEFT;
    gesture.tier = "hard";
    const Store store = Store::OpenForReading(StoreOf({gesture}));
    const GestureHead head = store.Heads(INT64_MIN, 1).at(0);
    EXPECT_EQ(head.id, "g");
    EXPECT_EQ(head.mode, host::Mode::Fp);
    EXPECT_EQ(head.label, VKEY_LEFT);
    EXPECT_EQ(head.tier, "hard");
    EXPECT_EQ(head.frameCount, 4);
    ExpectSameGesture(store.ReadRow(head.seq), store.Read("g"));
}

TEST(StoreList, WhatIsNotSoundInARowIsEmptyInItsHead) {
    const std::string path = StoreOf({SmallGesture("a")});
    RunSql(path,
           "UPDATE gesture SET id = x'41', mode = 7, label = 'OVER', tier = x'42', "
           "frame_count = -1");
    const GestureHead head = Store::OpenForReading(path).Heads(INT64_MIN, 1).at(0);
    EXPECT_EQ(head.id, "row 1");
    EXPECT_EQ(head.mode, std::nullopt);
    EXPECT_EQ(head.label, std::nullopt);
    EXPECT_EQ(head.tier, "");
    EXPECT_EQ(head.frameCount, 0);
}

TEST(StoreList, ARowThatIsNotThereIsNamed) {
    const std::string path = StoreOf({SmallGesture("a")});
    EXPECT_EQ(ErrorOf([&] { Store::OpenForReading(path).ReadRow(5); }),
              path + ": gesture row 5: is not in the store, expected one of its ids");
}

TEST(StoreList, ExtentCountsGesturesAndTheBytesOfTheLongestId) {
    const host::StoreExtent extent =
        Store::OpenForReading(StoreOf({SmallGesture("abc"), SmallGesture("\xC3\xBC\xC3\xBC")}))
            .Extent();
    EXPECT_EQ(extent.count, 2);
    EXPECT_EQ(extent.longestId, 4);
    EXPECT_EQ(Store::OpenForReading(StoreOf({})).Extent().longestId, 0);
}

TEST(StoreList, EachParameterBlockIsVisitedOnceWithOneOfItsGestures) {
    Gesture other = SmallGesture("b");
    host::ParamValue(other.params, "s_minDelta") = 9;
    Gesture damaged = SmallGesture("d");
    host::ParamValue(damaged.params, "s_minDelta") = 8;
    const std::string path = StoreOf({SmallGesture("a"), other, SmallGesture("c"), damaged});
    RunSql(path,
           "UPDATE param_block SET params = '{}' WHERE id = (SELECT param_block FROM gesture "
           "WHERE id = 'd')");
    std::vector<std::string> visits;
    Store::OpenForReading(path).ForEachParams(
        [&](const host::ParamBlock& params, const std::string& id) {
            visits.push_back(id + std::to_string(host::ParamValue(params, "s_minDelta")));
        });
    EXPECT_THAT(visits, ElementsAre("a4", "b9"));
}

TEST(StoreRead, ParametersOfTheGestureBeforeAreNotTakenForThoseOfTheNext) {
    Gesture other = SmallGesture("b");
    host::ParamValue(other.params, "s_minDelta") = 9;
    const Store store =
        Store::OpenForReading(StoreOf({SmallGesture("a"), other, SmallGesture("c")}));
    ExpectSameGesture(store.Read("a"), SmallGesture("a"));
    ExpectSameGesture(store.Read("b"), other);
    ExpectSameGesture(store.Read("c"), SmallGesture("c"));
}

// A statement that a failed reading left at a row would keep the file from a writer.
TEST(StoreRead, AGestureThatCannotBeReadLeavesTheStoreUsable) {
    const std::string path = StoreOf({SmallGesture("a"), SmallGesture("b")});
    RunSql(path, "UPDATE frame SET reg24 = 1 WHERE gesture = 1 AND frame_index = 1");
    const Store store = Store::OpenForReading(path);
    EXPECT_THAT(ErrorOf([&] { store.Read("a"); }), HasSubstr("gesture 'a': its content"));
    RunSql(path, "UPDATE gesture SET notes = 'x', checksum = NULL WHERE id = 'b'");
    EXPECT_EQ(store.Read("b").notes, "x");
    ErrorOf([&] { store.Read("a"); });
}

}  // namespace
