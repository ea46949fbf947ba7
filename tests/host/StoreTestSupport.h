// Stores for tests, and a way past the store into its SQLite file.
#ifndef FPNAVI_TESTS_HOST_STORETESTSUPPORT_H
#define FPNAVI_TESTS_HOST_STORETESTSUPPORT_H

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <string>
#include <vector>

#include "HostTestSupport.h"
#include "store/Store.h"

namespace host_test {

// The path of a new, closed store with these gestures.
inline std::string StoreOf(const std::vector<host::Gesture>& gestures) {
    const std::string path = TestDirectory() + "/s.db";
    host::Store store = host::Store::Create(path);
    for (const host::Gesture& gesture : gestures)
        store.Append(gesture);
    return path;
}

// Runs statements on any SQLite file, the tables' checks off.
inline void RunSql(const std::string& path, const std::string& sql) {
    sqlite3* database = nullptr;
    ASSERT_EQ(sqlite3_open(path.c_str(), &database), SQLITE_OK);
    const std::string all = "PRAGMA ignore_check_constraints = ON;" + sql;
    EXPECT_EQ(sqlite3_exec(database, all.c_str(), nullptr, nullptr, nullptr), SQLITE_OK)
        << sqlite3_errmsg(database);
    sqlite3_close(database);
}

// The number that a query gives.
inline int64_t NumberIn(const std::string& path, const std::string& sql) {
    sqlite3* database = nullptr;
    sqlite3_stmt* statement = nullptr;
    EXPECT_EQ(sqlite3_open(path.c_str(), &database), SQLITE_OK);
    EXPECT_EQ(sqlite3_prepare_v2(database, sql.c_str(), -1, &statement, nullptr), SQLITE_OK);
    EXPECT_EQ(sqlite3_step(statement), SQLITE_ROW);
    const int64_t number = sqlite3_column_int64(statement, 0);
    sqlite3_finalize(statement);
    sqlite3_close(database);
    return number;
}

inline void ExpectSameGesture(const host::Gesture& got, const host::Gesture& expected) {
    EXPECT_EQ(got.id, expected.id);
    EXPECT_EQ(got.params, expected.params);
    EXPECT_EQ(got.mode, expected.mode);
    EXPECT_TRUE(got.geometry == expected.geometry);
    EXPECT_EQ(got.end, expected.end);
    EXPECT_EQ(got.label, expected.label);
    EXPECT_EQ(got.accepted, expected.accepted);
    EXPECT_EQ(got.tier, expected.tier);
    EXPECT_EQ(got.tags, expected.tags);
    EXPECT_EQ(got.libraryVersion, expected.libraryVersion);
    EXPECT_EQ(got.notes, expected.notes);
    ASSERT_EQ(got.frames.size(), expected.frames.size());
    for (size_t i = 0; i < got.frames.size(); ++i) {
        EXPECT_TRUE(got.frames[i].raw == expected.frames[i].raw) << "frame " << i;
        EXPECT_EQ(got.frames[i].reg24, expected.frames[i].reg24);
        EXPECT_EQ(got.frames[i].reg28, expected.frames[i].reg28);
        EXPECT_EQ(got.frames[i].x16, expected.frames[i].x16);
        EXPECT_EQ(got.frames[i].y16, expected.frames[i].y16);
        EXPECT_EQ(got.frames[i].presence, expected.frames[i].presence);
    }
}

}  // namespace host_test

#endif  // FPNAVI_TESTS_HOST_STORETESTSUPPORT_H
