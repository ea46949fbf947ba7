// A thin layer over SQLite for the store: owned handles, and every failure as an Error that names
// the file and what was tried. Only the store's own files include it.
#ifndef FPNAVI_HOST_SQLITE_H
#define FPNAVI_HOST_SQLITE_H

#include <sqlite3.h>

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace host {

// One open connection.
class Database {
  public:
    // flags: SQLITE_OPEN_...; the file must exist unless they say otherwise.
    Database(const std::string& path, int flags);
    ~Database();
    Database(const Database&) = delete;
    Database& operator=(const Database&) = delete;

    const std::string& Path() const { return m_path; }
    sqlite3* Handle() const { return m_handle; }

    // Runs statements that give no rows; doing: "create the tables".
    void Execute(const char* sql, const char* doing);

    // The number that a pragma or a one-value query gives.
    int64_t Number(const char* sql, const char* doing) const;

    // Throws what SQLite reports last: "cannot <doing>: <reason>".
    [[noreturn]] void Fail(const std::string& doing) const;

  private:
    std::string m_path;
    sqlite3* m_handle = nullptr;
};

// One prepared statement. Columns are counted from 0, parameters from 1. Column readers check the
// type: a value of another type is a corrupt row and an Error at the place given by At.
class Statement {
  public:
    Statement(const Database& database, const char* sql, const char* doing);
    ~Statement();
    Statement(const Statement&) = delete;
    Statement& operator=(const Statement&) = delete;

    void Bind(int parameter, int64_t value);
    void Bind(int parameter, std::string_view text);  // text must live until Step or Reset
    void BindBlob(int parameter, const std::vector<uint8_t>& blob);
    void BindNull(int parameter);
    template <typename T>
    void BindOptional(int parameter, const std::optional<T>& value) {
        if (value)
            Bind(parameter, static_cast<int64_t>(*value));
        else
            BindNull(parameter);
    }

    // True when there is a row to read.
    bool Step();
    // Makes the statement ready for other parameters.
    void Reset();

    // What the rows to come belong to, for errors: "gesture 'a', frame 3".
    void At(const std::string& place) { m_place = place; }

    // The integer in column, which must lie in lowest..highest.
    int64_t Integer(int column, int64_t lowest, int64_t highest) const;
    std::string Text(int column) const;
    std::vector<uint8_t> Blob(int column) const;
    bool IsNull(int column) const;

    // Error at the place for a row that cannot be right.
    [[noreturn]] void FailRow(const std::string& problem) const;

  private:
    void CheckType(int column, int type, const char* expected) const;
    void CheckBound(int result) const;

    const Database& m_database;
    const char* m_doing;
    std::string m_place;
    sqlite3_stmt* m_handle = nullptr;
};

// BEGIN IMMEDIATE; rolled back unless committed. Within another transaction of the connection it is
// a part of that one, which can be taken back alone.
class Transaction {
  public:
    Transaction(Database& database, const char* doing);
    ~Transaction();
    Transaction(const Transaction&) = delete;
    Transaction& operator=(const Transaction&) = delete;

    void Commit();

  private:
    Database& m_database;
    const char* m_doing;
    bool m_nested;
    bool m_open = true;
};

}  // namespace host

#endif  // FPNAVI_HOST_SQLITE_H
