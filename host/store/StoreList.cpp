// Listing a store: what is in it, its frames not read.
#include <fmt/format.h>

#include "common/Error.h"
#include "recording/Keys.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

// All in one statement, so that no other process can append between its numbers.
constexpr const char* kExtent =
    "SELECT (SELECT count(*) FROM gesture NOT INDEXED), count(*), "
    "ifnull(max(length(CAST(id AS BLOB))), 0) FROM gesture INDEXED BY sqlite_autoindex_gesture_1";

constexpr const char* kHeads =
    "SELECT seq, id, mode, label, tier, frame_count FROM gesture WHERE seq > ? "
    "ORDER BY seq LIMIT ?";

constexpr const char* kParams =
    "SELECT p.params, min(g.id) FROM gesture g JOIN param_block p ON p.id = g.param_block "
    "GROUP BY p.id ORDER BY min(g.seq)";

// Empty for what is no text.
std::string TextIn(const Statement& row, int column) {
    try {
        return row.Text(column);
    } catch (const Error&) {
        return "";
    }
}

int32_t FrameCountIn(const Statement& row, int column) {
    try {
        return static_cast<int32_t>(row.Integer(column, 0, INT32_MAX));
    } catch (const Error&) {
        return 0;
    }
}

GestureHead HeadFromRow(const Statement& row) {
    GestureHead head;
    head.seq = row.Integer(0, INT64_MIN, INT64_MAX);
    head.id = TextIn(row, 1);
    if (head.id.empty())
        head.id = fmt::format("row {}", head.seq);
    head.mode = ParseMode(TextIn(row, 2));
    if (!row.IsNull(3))
        head.label = ParseKey(TextIn(row, 3));
    head.tier = TextIn(row, 4);
    head.frameCount = FrameCountIn(row, 5);
    return head;
}

}  // namespace

int64_t Store::Count() const {
    return m_database->Number("SELECT count(*) FROM gesture", "count the gestures");
}

// A damaged page can take rows with it; the index of the ids then still has them.
StoreExtent Store::Extent() const {
    Statement row(*m_database, kExtent, "count the gestures");
    row.Step();
    const int64_t rows = row.Integer(0, 0, INT64_MAX);
    const int64_t ids = row.Integer(1, 0, INT64_MAX);
    if (rows != ids)
        throw Error(
            Path(), "table gesture",
            fmt::format("{} rows, expected {} as its index has: the file is damaged", rows, ids));
    return {rows, row.Integer(2, 0, INT64_MAX)};
}

int64_t Store::CountWithoutTag(const std::string& tag) const {
    Statement row(*m_database,
                  "SELECT count(*) FROM gesture WHERE NOT json_valid(tags) OR "
                  "NOT EXISTS (SELECT 1 FROM json_each(tags) WHERE value = ?)",
                  "count the gestures by their tags");
    row.Bind(1, tag);
    row.Step();
    return row.Integer(0, 0, INT64_MAX);
}

std::vector<std::string> Store::Ids() const {
    Extent();
    Statement row(*m_database, "SELECT id FROM gesture ORDER BY seq", "list the gestures");
    std::vector<std::string> ids;
    while (row.Step())
        ids.push_back(row.Text(0));
    return ids;
}

std::vector<GestureHead> Store::Heads(int64_t after, int64_t limit) const {
    Statement row(*m_database, kHeads, "list the gestures");
    row.Bind(1, after);
    row.Bind(2, limit);
    std::vector<GestureHead> heads;
    while (row.Step())
        heads.push_back(HeadFromRow(row));
    return heads;
}

void Store::ForEachParams(
    const std::function<void(const ParamBlock&, const std::string&)>& visit) const {
    Statement row(*m_database, kParams, "read the parameters");
    while (row.Step()) {
        ParamBlock params{};
        try {
            params = ParamsFromJson(row.Text(0), Path(), "");
        } catch (const Error&) {
            continue;
        }
        visit(params, TextIn(row, 1));
    }
}

bool Store::Contains(const std::string& id) const {
    Statement row(*m_database, "SELECT 1 FROM gesture WHERE id = ?", "look for a gesture");
    row.Bind(1, id);
    return row.Step();
}

}  // namespace host
