// Appending to a store.
#include <fmt/format.h>

#include <nlohmann/json.hpp>

#include "common/Error.h"
#include "recording/Keys.h"
#include "store/GestureChecksum.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

std::string JsonList(const std::vector<std::string>& texts, const std::string& file,
                     const std::string& place) {
    try {
        return nlohmann::json(texts).dump();
    } catch (const nlohmann::json::type_error&) {
        throw Error(file, place, "a tag is no UTF-8 text");
    }
}

int64_t StoreParams(const Database& database, const ParamBlock& params) {
    constexpr const char* kDoing = "store the parameters";
    const std::string text = ParamsToJson(params);
    Statement insert(database, "INSERT OR IGNORE INTO param_block (params) VALUES (?)", kDoing);
    insert.Bind(1, text);
    insert.Step();
    Statement find(database, "SELECT id FROM param_block WHERE params = ?", kDoing);
    find.Bind(1, text);
    if (!find.Step())
        database.Fail(kDoing);
    return find.Integer(0, INT64_MIN, INT64_MAX);
}

int64_t StoreGestureRow(const Database& database, const Gesture& gesture, int64_t paramBlock) {
    const std::string place = GesturePlace(gesture.id);
    std::vector<std::string> acceptedNames;
    for (const int32_t key : gesture.accepted)
        acceptedNames.push_back(KeyName(key));
    const std::string accepted = JsonList(acceptedNames, database.Path(), place);
    const std::string tags = JsonList(gesture.tags, database.Path(), place);
    const std::string mode = ModeName(gesture.mode);
    const std::string end = EndName(gesture.end);
    const std::string label = gesture.label ? KeyName(*gesture.label) : "";

    Statement insert(database,
                     "INSERT INTO gesture (id, param_block, mode, block_width, block_height, "
                     "block_col_num, block_row_num, frame_count, end, label, accepted, tier, tags, "
                     "library_version, notes, checksum) "
                     "VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)",
                     "store the gesture");
    insert.At(place);
    insert.Bind(1, gesture.id);
    insert.Bind(2, paramBlock);
    insert.Bind(3, mode);
    insert.Bind(4, gesture.geometry.blockWidth);
    insert.Bind(5, gesture.geometry.blockHeight);
    insert.Bind(6, gesture.geometry.blockColNum);
    insert.Bind(7, gesture.geometry.blockRowNum);
    insert.Bind(8, static_cast<int64_t>(gesture.frames.size()));
    insert.Bind(9, end);
    if (gesture.label)
        insert.Bind(10, label);
    else
        insert.BindNull(10);
    insert.Bind(11, accepted);
    insert.Bind(12, gesture.tier);
    insert.Bind(13, tags);
    insert.Bind(14, gesture.libraryVersion);
    insert.Bind(15, gesture.notes);
    insert.Bind(16, GestureChecksum(gesture));
    insert.Step();
    return sqlite3_last_insert_rowid(database.Handle());
}

void StoreFrames(const Database& database, const Gesture& gesture, int64_t gestureSeq) {
    Statement insert(database,
                     "INSERT INTO frame (gesture, frame_index, reg24, reg28, x16, y16, presence) "
                     "VALUES (?, ?, ?, ?, ?, ?, ?)",
                     "store the frames");
    insert.At(GesturePlace(gesture.id));
    int64_t index = 0;
    for (const RecordedFrame& frame : gesture.frames) {
        insert.Bind(1, gestureSeq);
        insert.Bind(2, index++);
        insert.Bind(3, frame.reg24);
        insert.Bind(4, frame.reg28);
        insert.BindOptional(5, frame.x16);
        insert.BindOptional(6, frame.y16);
        insert.BindOptional(7, frame.presence);
        insert.Step();
        insert.Reset();
    }
}

void StorePixels(const Database& database, const Gesture& gesture, int64_t gestureSeq) {
    std::vector<uint8_t> raw;
    for (const RecordedFrame& frame : gesture.frames)
        raw.insert(raw.end(), frame.raw.begin(), frame.raw.end());
    Statement insert(database, "INSERT INTO pixels (gesture, raw) VALUES (?, ?)",
                     "store the pixels");
    insert.At(GesturePlace(gesture.id));
    insert.Bind(1, gestureSeq);
    insert.BindBlob(2, raw);
    insert.Step();
}

}  // namespace

// The rollback journal keeps what was in the pages that a transaction changes; gestures go behind
// them, so that their pixels are written once. A write-ahead log would write them twice. EXTRA: a
// commit is on the disk when it returns, also the end of its journal.
void PrepareForAppending(Database& database) {
    database.Execute(
        "PRAGMA foreign_keys = ON; PRAGMA journal_mode = DELETE; PRAGMA synchronous = EXTRA",
        "set up the connection");
}

Store Store::OpenForAppending(const std::string& path) {
    auto database = OpenStoreFile(path, true);
    if (sqlite3_db_readonly(database->Handle(), "main") == 1)
        throw Error(path, "", "cannot be written");
    PrepareForAppending(*database);
    return Store(std::move(database), true);
}

Store::Batch::Batch(Store& store)
    : m_transaction(std::make_unique<Transaction>(*store.m_database, "store the gestures")) {}

Store::Batch::~Batch() = default;

void Store::Batch::Commit() {
    m_transaction->Commit();
}

void Store::Append(const Gesture& gesture) {
    if (!m_appending)
        throw Error(Path(), GesturePlace(gesture.id), "the store is open for reading only");
    CheckGesture(gesture, Path());
    Transaction transaction(*m_database, "store the gesture");
    if (Contains(gesture.id))
        throw Error(Path(), GesturePlace(gesture.id),
                    "is in the store already, expected an id that is not");
    const int64_t paramBlock = StoreParams(*m_database, gesture.params);
    const int64_t seq = StoreGestureRow(*m_database, gesture, paramBlock);
    StoreFrames(*m_database, gesture, seq);
    StorePixels(*m_database, gesture, seq);
    transaction.Commit();
}

}  // namespace host
