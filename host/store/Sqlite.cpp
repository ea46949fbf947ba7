// Owned SQLite handles with checked results.
#include "store/Sqlite.h"

#include <fmt/format.h>

#include <cstring>

#include "common/Error.h"

namespace host {

namespace {

// Several processes may append to one store; each waits this long for the others.
constexpr int kBusyTimeoutMs = 10000;

}  // namespace

Database::Database(const std::string& path, int flags) : m_path(path) {
    const int result = sqlite3_open_v2(path.c_str(), &m_handle, flags, nullptr);
    if (result != SQLITE_OK) {
        const std::string reason =
            m_handle != nullptr ? sqlite3_errmsg(m_handle) : sqlite3_errstr(result);
        sqlite3_close(m_handle);
        throw Error(path, "", "cannot open the store: " + reason);
    }
    sqlite3_extended_result_codes(m_handle, 1);
    sqlite3_busy_timeout(m_handle, kBusyTimeoutMs);
}

Database::~Database() {
    sqlite3_close(m_handle);
}

void Database::Execute(const char* sql, const char* doing) {
    if (sqlite3_exec(m_handle, sql, nullptr, nullptr, nullptr) != SQLITE_OK)
        Fail(doing);
}

int64_t Database::Number(const char* sql, const char* doing) const {
    Statement statement(*this, sql, doing);
    if (!statement.Step())
        throw Error(m_path, "", fmt::format("cannot {}: no answer, expected a number", doing));
    return statement.Integer(0, INT64_MIN, INT64_MAX);
}

void Database::Fail(const std::string& doing) const {
    std::string reason = sqlite3_errmsg(m_handle);
    if (sqlite3_extended_errcode(m_handle) == SQLITE_READONLY_DBMOVED)
        reason = "the file was moved, deleted or replaced meanwhile";
    const int primary = sqlite3_errcode(m_handle) & 0xFF;
    const int systemError = sqlite3_system_errno(m_handle);
    if ((primary == SQLITE_IOERR || primary == SQLITE_CANTOPEN) && systemError != 0)
        reason += fmt::format(" ({})", std::strerror(systemError));
    if (primary == SQLITE_CORRUPT)
        reason += ", expected a sound SQLite file";
    throw Error(m_path, "", fmt::format("cannot {}: {}", doing, reason));
}

Statement::Statement(const Database& database, const char* sql, const char* doing)
    : m_database(database), m_doing(doing) {
    if (sqlite3_prepare_v2(database.Handle(), sql, -1, &m_handle, nullptr) != SQLITE_OK)
        database.Fail(doing);
}

Statement::~Statement() {
    sqlite3_finalize(m_handle);
}

void Statement::CheckBound(int result) const {
    if (result != SQLITE_OK)
        m_database.Fail(m_doing);
}

void Statement::Bind(int parameter, int64_t value) {
    CheckBound(sqlite3_bind_int64(m_handle, parameter, value));
}

void Statement::Bind(int parameter, std::string_view text) {
    // A null pointer would bind NULL instead of an empty text.
    const char* const bytes = text.data() != nullptr ? text.data() : "";
    CheckBound(
        sqlite3_bind_text64(m_handle, parameter, bytes, text.size(), SQLITE_STATIC, SQLITE_UTF8));
}

void Statement::BindBlob(int parameter, const std::vector<uint8_t>& blob) {
    // A null pointer would bind NULL instead of an empty blob.
    const void* const bytes = blob.empty() ? static_cast<const void*>("") : blob.data();
    CheckBound(sqlite3_bind_blob64(m_handle, parameter, bytes, blob.size(), SQLITE_STATIC));
}

void Statement::BindNull(int parameter) {
    CheckBound(sqlite3_bind_null(m_handle, parameter));
}

bool Statement::Step() {
    const int result = sqlite3_step(m_handle);
    if (result != SQLITE_ROW && result != SQLITE_DONE)
        m_database.Fail(m_place.empty() ? m_doing : fmt::format("{} ({})", m_doing, m_place));
    return result == SQLITE_ROW;
}

void Statement::Reset() {
    sqlite3_reset(m_handle);
}

int64_t Statement::Integer(int column, int64_t lowest, int64_t highest) const {
    CheckType(column, SQLITE_INTEGER, "an integer");
    const int64_t value = sqlite3_column_int64(m_handle, column);
    if (value < lowest || value > highest)
        FailRow(fmt::format("{} is {}, expected {} to {}", sqlite3_column_name(m_handle, column),
                            value, lowest, highest));
    return value;
}

std::string Statement::Text(int column) const {
    CheckType(column, SQLITE_TEXT, "text");
    const auto* const bytes = sqlite3_column_text(m_handle, column);
    const auto size = static_cast<size_t>(sqlite3_column_bytes(m_handle, column));
    return std::string(reinterpret_cast<const char*>(bytes), size);
}

std::vector<uint8_t> Statement::Blob(int column) const {
    CheckType(column, SQLITE_BLOB, "a blob");
    const auto* const bytes = static_cast<const uint8_t*>(sqlite3_column_blob(m_handle, column));
    const int size = sqlite3_column_bytes(m_handle, column);
    return bytes == nullptr ? std::vector<uint8_t>() : std::vector<uint8_t>(bytes, bytes + size);
}

bool Statement::IsNull(int column) const {
    return sqlite3_column_type(m_handle, column) == SQLITE_NULL;
}

void Statement::CheckType(int column, int type, const char* expected) const {
    if (sqlite3_column_type(m_handle, column) != type)
        FailRow(fmt::format("{} has the wrong type, expected {}",
                            sqlite3_column_name(m_handle, column), expected));
}

void Statement::FailRow(const std::string& problem) const {
    throw Error(m_database.Path(), m_place, problem);
}

Transaction::Transaction(Database& database, const char* doing)
    : m_database(database),
      m_doing(doing),
      m_nested(sqlite3_get_autocommit(database.Handle()) == 0) {
    m_database.Execute(m_nested ? "SAVEPOINT nested" : "BEGIN IMMEDIATE", doing);
}

Transaction::~Transaction() {
    // Some failures (a full disk) have rolled back already; then there is nothing to end.
    if (m_open && sqlite3_get_autocommit(m_database.Handle()) == 0)
        sqlite3_exec(m_database.Handle(),
                     m_nested ? "ROLLBACK TO nested; RELEASE nested" : "ROLLBACK", nullptr, nullptr,
                     nullptr);
}

void Transaction::Commit() {
    m_database.Execute(m_nested ? "RELEASE nested" : "COMMIT", m_doing);
    m_open = false;
}

}  // namespace host
