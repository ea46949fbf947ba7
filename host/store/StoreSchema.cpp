// The store's tables, the opening checks and the parameter block's text form.
#include "store/StoreSchema.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <limits>
#include <nlohmann/json.hpp>

#include "common/Error.h"
#include "parameters/ParamTable.h"
#include "store/NewFile.h"

namespace host {

namespace {

// Names instead of numbers wherever a person may look with a SQLite shell. A parameter block is
// stored once for all gestures that share it. The checksum is null where nobody has made one. The
// pixels of a gesture are one blob: SQLite fills the pages of a long one to the last byte, while
// rows of half a page leave much of each empty.
constexpr const char* kTables = R"(
CREATE TABLE param_block (
    id     INTEGER PRIMARY KEY,
    params TEXT NOT NULL UNIQUE
);
CREATE TABLE gesture (
    seq             INTEGER PRIMARY KEY,
    id              TEXT NOT NULL UNIQUE CHECK (id <> ''),
    param_block     INTEGER NOT NULL REFERENCES param_block (id),
    mode            TEXT NOT NULL CHECK (mode IN ('fp', 'hg', 'ds')),
    block_width     INTEGER NOT NULL CHECK (block_width >= 1),
    block_height    INTEGER NOT NULL CHECK (block_height >= 1),
    block_col_num   INTEGER NOT NULL CHECK (block_col_num >= 1),
    block_row_num   INTEGER NOT NULL CHECK (block_row_num >= 1),
    frame_count     INTEGER NOT NULL CHECK (frame_count >= 0),
    end             TEXT NOT NULL CHECK (end IN ('lift', 'timeout')),
    label           TEXT CHECK (label IN ('NONE', 'UP', 'DOWN', 'RIGHT', 'LEFT', 'NO_MOVE')),
    accepted        TEXT NOT NULL,
    tier            TEXT NOT NULL,
    tags            TEXT NOT NULL,
    library_version TEXT NOT NULL,
    notes           TEXT NOT NULL,
    checksum        INTEGER
);
CREATE TABLE frame (
    gesture     INTEGER NOT NULL REFERENCES gesture (seq) ON DELETE CASCADE,
    frame_index INTEGER NOT NULL CHECK (frame_index >= 0),
    reg24       INTEGER NOT NULL CHECK (reg24 BETWEEN 0 AND 4294967295),
    reg28       INTEGER NOT NULL CHECK (reg28 BETWEEN 0 AND 4294967295),
    x16         INTEGER,
    y16         INTEGER,
    presence    INTEGER CHECK (presence IN (-1, 0, 1)),
    PRIMARY KEY (gesture, frame_index)
) WITHOUT ROWID;
CREATE TABLE pixels (
    gesture INTEGER PRIMARY KEY REFERENCES gesture (seq) ON DELETE CASCADE,
    raw     BLOB NOT NULL CHECK (typeof(raw) = 'blob')
);
CREATE VIEW frame_raw AS
    SELECT id, gesture, frame_index,
           substr(raw, frame_index * length(raw) / frame_count + 1, length(raw) / frame_count)
               AS raw
    FROM gesture JOIN frame ON frame.gesture = seq JOIN pixels USING (gesture);
)";

// The start of every SQLite file; numbers are big-endian.
constexpr size_t kHeaderSize = 100;
constexpr char kMagic[] = "SQLite format 3";  // with its final zero byte
constexpr size_t kPageSizeOffset = 16;        // two bytes; 1 stands for 65536
constexpr size_t kChangeCounterOffset = 24;
constexpr size_t kPageCountOffset = 28;  // valid while the next equals the change counter
constexpr size_t kValidForOffset = 92;

uint32_t ReadBe32(const std::array<char, kHeaderSize>& header, size_t offset) {
    uint32_t value = 0;
    for (size_t i = 0; i < 4; ++i)
        value = (value << 8) | static_cast<uint8_t>(header[offset + i]);
    return value;
}

// The file's size in bytes as its header has it; 0 when the header does not know.
uint64_t SizeOfHeader(const std::array<char, kHeaderSize>& header) {
    if (ReadBe32(header, kChangeCounterOffset) != ReadBe32(header, kValidForOffset))
        return 0;
    uint64_t pageSize = ReadBe32(header, kPageSizeOffset) >> 16;
    pageSize = pageSize == 1 ? 65536 : pageSize;
    return pageSize * ReadBe32(header, kPageCountOffset);
}

// A file that was cut. Beside a journal of a killed writer the size says nothing: SQLite repairs
// it.
void CheckFileSize(const std::string& path, const std::array<char, kHeaderSize>& header) {
    std::error_code error;
    if (std::filesystem::exists(path + "-wal", error) ||
        std::filesystem::exists(path + "-journal", error))
        return;
    const uint64_t size = std::filesystem::file_size(path, error);
    const uint64_t expected = SizeOfHeader(header);
    if (!error && size < expected)
        throw Error(path, fmt::format("byte {}", size),
                    fmt::format("the file is truncated, expected {} bytes", expected));
}

// What is wrong with a file that cannot be a store, told before SQLite touches it.
void CheckFileStart(const std::string& path) {
    std::error_code error;
    const std::filesystem::file_status status = std::filesystem::status(path, error);
    if (!std::filesystem::exists(status))
        throw Error(path, "", "no such file, expected a recording store");
    if (!std::filesystem::is_regular_file(status))
        throw Error(path, "", "not a regular file, expected a recording store");
    std::ifstream file(path, std::ios::binary);
    if (!file)
        throw Error(path, "", std::string("cannot be opened: ") + std::strerror(errno));
    std::array<char, kHeaderSize> header{};
    file.read(header.data(), kHeaderSize);
    const auto got = static_cast<size_t>(file.gcount());
    if (got == 0)
        throw Error(path, "", "the file is empty, expected a recording store");
    if (std::memcmp(header.data(), kMagic, std::min(got, sizeof kMagic)) != 0)
        throw Error(path, "byte 0", "not a SQLite file, expected a recording store");
    if (got < kHeaderSize)
        throw Error(path, fmt::format("byte {}", got),
                    fmt::format("the file is truncated, expected a SQLite header of {} bytes",
                                kHeaderSize));
    CheckFileSize(path, header);
}

void CheckIdentity(const Database& database) {
    const int64_t application = database.Number("PRAGMA application_id", "read the application id");
    if (application != kStoreApplicationId)
        throw Error(database.Path(), "",
                    fmt::format("a SQLite database of another program (application id {:#x}, "
                                "expected {:#x} of a recording store)",
                                application, kStoreApplicationId));
    const int64_t version = database.Number("PRAGMA user_version", "read the schema version");
    if (version != kStoreSchemaVersion)
        throw Error(database.Path(), "",
                    fmt::format("schema version {}, expected {}{}", version, kStoreSchemaVersion,
                                version > kStoreSchemaVersion
                                    ? ": written by a newer version of this program"
                                    : ""));
    // Reading the schema shows missing tables and columns now rather than at the first gesture.
    constexpr const char* kDoing = "find the tables of a recording store";
    for (const char* sql :
         {"SELECT id, params FROM param_block",
          "SELECT seq, id, param_block, frame_count FROM gesture",
          "SELECT gesture, frame_index, reg24 FROM frame", "SELECT gesture, raw FROM pixels"})
        const Statement readable(database, sql, kDoing);
}

bool IsInt32(const nlohmann::json& value) {
    constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
    constexpr int64_t kMax = std::numeric_limits<int32_t>::max();
    if (value.is_number_unsigned())
        return value.get<uint64_t>() <= static_cast<uint64_t>(kMax);
    return value.is_number_integer() && value.get<int64_t>() >= kMin &&
           value.get<int64_t>() <= kMax;
}

}  // namespace

void CreateSchema(Database& database) {
    constexpr const char* kDoing = "create the tables";
    Transaction transaction(database, kDoing);
    database.Execute(kTables, kDoing);
    database.Execute(fmt::format("PRAGMA application_id = {}; PRAGMA user_version = {}",
                                 kStoreApplicationId, kStoreSchemaVersion)
                         .c_str(),
                     kDoing);
    transaction.Commit();
}

std::unique_ptr<Database> OpenStoreFile(const std::string& path, bool forAppending) {
    CheckFileStart(path);
    const std::string problem = forAppending ? WritingProblem(path) : "";
    if (!problem.empty())
        throw Error(path, "", "cannot be written: " + problem);
    std::error_code ignored;
    if (!forAppending && std::filesystem::exists(path + "-journal", ignored)) {
        // A writer is at work or was killed; only a connection that may write can take back what it
        // left.
        Database(path, SQLITE_OPEN_READWRITE)
            .Number("PRAGMA schema_version", "take back what a killed writer left in its -journal");
    }
    auto database = std::make_unique<Database>(
        path, forAppending ? SQLITE_OPEN_READWRITE : SQLITE_OPEN_READONLY);
    CheckIdentity(*database);
    return database;
}

std::string ParamsToJson(const ParamBlock& params) {
    nlohmann::ordered_json object;
    for (size_t i = 0; i < params.size(); ++i)
        object[ParamTable()[i].name] = params[i];
    return object.dump();
}

ParamBlock ParamsFromJson(const std::string& text, const std::string& file,
                          const std::string& place) {
    const nlohmann::json object = nlohmann::json::parse(text, nullptr, false);
    if (!object.is_object() || object.size() != FPNAVI_PARAM_NUM)
        throw Error(file, place,
                    fmt::format("params is no JSON object of the {} parameters", FPNAVI_PARAM_NUM));
    ParamBlock params{};
    for (size_t i = 0; i < params.size(); ++i) {
        const char* const name = ParamTable()[i].name;
        const auto found = object.find(name);
        if (found == object.end() || !IsInt32(*found))
            throw Error(file, place, fmt::format("params has no 32-bit integer for {}", name));
        params[i] = found->get<int32_t>();
    }
    return params;
}

std::string GesturePlace(const std::string& id) {
    return fmt::format("gesture '{}'", id);
}

}  // namespace host
