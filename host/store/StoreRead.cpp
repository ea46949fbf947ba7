// Reading a store: every value is checked, since the file may come from anywhere.
#include <fmt/format.h>

#include <limits>
#include <nlohmann/json.hpp>
#include <unordered_map>

#include "common/Error.h"
#include "recording/Keys.h"
#include "store/GestureChecksum.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

constexpr int64_t kInt32Min = std::numeric_limits<int32_t>::min();
constexpr int64_t kInt32Max = std::numeric_limits<int32_t>::max();
constexpr int64_t kUint32Max = std::numeric_limits<uint32_t>::max();

// The columns that GestureFromRow reads, in its order.
#define FPNAVI_GESTURE_COLUMNS                                                               \
    "SELECT g.seq, g.id, p.params, g.mode, g.block_width, g.block_height, g.block_col_num, " \
    "g.block_row_num, g.frame_count, g.end, g.label, g.accepted, g.tier, g.tags, "           \
    "g.library_version, g.notes, g.checksum "                                                \
    "FROM gesture g LEFT JOIN param_block p ON p.id = g.param_block "

constexpr const char* kReadOne = FPNAVI_GESTURE_COLUMNS "WHERE g.id = ?";
constexpr const char* kReadRow = FPNAVI_GESTURE_COLUMNS "WHERE g.seq = ?";
constexpr const char* kReadAll = FPNAVI_GESTURE_COLUMNS "ORDER BY g.seq";
#undef FPNAVI_GESTURE_COLUMNS

constexpr const char* kReadFrames =
    "SELECT frame_index, reg24, reg28, x16, y16, presence FROM frame WHERE gesture = ? "
    "ORDER BY frame_index";

constexpr const char* kReadPixels = "SELECT raw FROM pixels WHERE gesture = ?";

std::vector<std::string> TextList(const Statement& row, int column, const char* name) {
    const nlohmann::json list = nlohmann::json::parse(row.Text(column), nullptr, false);
    std::vector<std::string> texts;
    if (!list.is_array())
        row.FailRow(fmt::format("{} is no JSON list of texts", name));
    for (const nlohmann::json& entry : list) {
        if (!entry.is_string())
            row.FailRow(fmt::format("{} is no JSON list of texts", name));
        texts.push_back(entry.get<std::string>());
    }
    return texts;
}

int32_t KeyFrom(const Statement& row, const std::string& name) {
    const std::optional<int32_t> key = ParseKey(name);
    if (!key)
        row.FailRow(
            fmt::format("'{}' is no key, expected NONE, UP, DOWN, RIGHT, LEFT or NO_MOVE", name));
    return *key;
}

int32_t BlockSide(const Statement& row, int column) {
    return static_cast<int32_t>(row.Integer(column, 1, kMaxImageSide));
}

void ReadNames(const Statement& row, Gesture& gesture) {
    const std::string mode = row.Text(3);
    const std::optional<Mode> knownMode = ParseMode(mode);
    if (!knownMode)
        row.FailRow(fmt::format("mode '{}', expected fp, hg or ds", mode));
    gesture.mode = *knownMode;
    const std::string end = row.Text(9);
    const std::optional<GestureEnd> knownEnd = ParseEnd(end);
    if (!knownEnd)
        row.FailRow(fmt::format("end '{}', expected lift or timeout", end));
    gesture.end = *knownEnd;
    if (!row.IsNull(10))
        gesture.label = KeyFrom(row, row.Text(10));
    for (const std::string& name : TextList(row, 11, "accepted"))
        gesture.accepted.push_back(KeyFrom(row, name));
}

std::optional<int32_t> OptionalInteger(const Statement& row, int column, int64_t lowest,
                                       int64_t highest) {
    if (row.IsNull(column))
        return std::nullopt;
    return static_cast<int32_t>(row.Integer(column, lowest, highest));
}

RecordedFrame FrameFromRow(const Statement& row) {
    RecordedFrame frame;
    frame.reg24 = static_cast<uint32_t>(row.Integer(1, 0, kUint32Max));
    frame.reg28 = static_cast<uint32_t>(row.Integer(2, 0, kUint32Max));
    frame.x16 = OptionalInteger(row, 3, kInt32Min, kInt32Max);
    frame.y16 = OptionalInteger(row, 4, kInt32Min, kInt32Max);
    const std::optional<int32_t> presence = OptionalInteger(row, 5, -1, 1);
    if (presence)
        frame.presence = static_cast<Presence>(*presence);
    return frame;
}

// A statement that is not at its end keeps the file locked.
class ResetAtEnd {
  public:
    explicit ResetAtEnd(Statement& statement) : m_statement(statement) {}
    ~ResetAtEnd() { m_statement.Reset(); }
    ResetAtEnd(const ResetAtEnd&) = delete;
    ResetAtEnd& operator=(const ResetAtEnd&) = delete;

  private:
    Statement& m_statement;
};

void ReadFrames(Statement& row, int64_t seq, int64_t count, Gesture& gesture) {
    const ResetAtEnd reset(row);
    const std::string place = GesturePlace(gesture.id);
    row.Bind(1, seq);
    row.At(place);
    for (int64_t i = 0; row.Step(); ++i) {
        row.At(fmt::format("{}, frame {}", place, i));
        if (i >= count || row.Integer(0, 0, kInt32Max) != i) {
            row.At(place);
            row.FailRow(fmt::format("has a frame of index {}, expected 0 to {} without gaps",
                                    row.Integer(0, INT64_MIN, INT64_MAX), count - 1));
        }
        gesture.frames.push_back(FrameFromRow(row));
    }
    if (static_cast<int64_t>(gesture.frames.size()) != count) {
        row.At(place);
        row.FailRow(fmt::format("has {} frames, expected {}", gesture.frames.size(), count));
    }
}

// Gives each frame of the gesture an equal part of the pixels; CheckGesture looks at its size.
void ReadPixels(Statement& row, int64_t seq, Gesture& gesture) {
    const ResetAtEnd reset(row);
    row.Bind(1, seq);
    row.At(GesturePlace(gesture.id));
    if (!row.Step())
        row.FailRow("has no pixels, expected those of its frames");
    const std::vector<uint8_t> raw = row.Blob(0);
    const size_t count = gesture.frames.size();
    if (count == 0 ? !raw.empty() : raw.size() % count != 0)
        row.FailRow(fmt::format("has {} bytes of pixels, expected {} frames of equal size",
                                raw.size(), count));
    auto next = raw.begin();
    for (RecordedFrame& frame : gesture.frames) {
        const auto end = next + static_cast<std::ptrdiff_t>(raw.size() / count);
        frame.raw.assign(next, end);
        next = end;
    }
}

void CheckChecksum(const Statement& row, int column, const Gesture& gesture) {
    if (row.IsNull(column))
        return;
    const int64_t stored = row.Integer(column, 0, kUint32Max);
    const uint32_t computed = GestureChecksum(gesture);
    if (stored != computed)
        row.FailRow(
            fmt::format("its content has checksum {:#010x}, expected {:#010x} as stored: "
                        "damaged, or changed by another program",
                        computed, stored));
}

}  // namespace

// What reading one gesture after the other needs again: prepared statements, and the parameter
// blocks that were read, by their text.
class StoreReader {
  public:
    explicit StoreReader(const Database& database)
        : m_database(database),
          m_byId(database, kReadOne, "read the gesture"),
          m_bySeq(database, kReadRow, "read the gesture"),
          m_frames(database, kReadFrames, "read the frames"),
          m_pixels(database, kReadPixels, "read the pixels") {}

    template <typename Key>
    Gesture Read(const Key& key, const std::string& place) {
        Statement& row = ByKey(key);
        const ResetAtEnd reset(row);
        row.At(place);
        row.Bind(1, key);
        if (!row.Step())
            throw Error(m_database.Path(), place, "is not in the store, expected one of its ids");
        return FromRow(row);
    }

    void ReadAll(const std::function<void(const Gesture&)>& visit) {
        Statement row(m_database, kReadAll, "read the gestures");
        while (row.Step()) {
            visit(FromRow(row));
            row.At("");
        }
    }

  private:
    Statement& ByKey(const std::string& /*id*/) { return m_byId; }
    Statement& ByKey(int64_t /*seq*/) { return m_bySeq; }

    const ParamBlock& Params(const std::string& text, const std::string& place) {
        auto found = m_params.find(text);
        if (found == m_params.end()) {
            if (m_params.size() >= kParamsMax)
                m_params.clear();
            found = m_params.emplace(text, ParamsFromJson(text, m_database.Path(), place)).first;
        }
        return found->second;
    }

    Gesture FromRow(Statement& row) {
        Gesture gesture;
        row.At(fmt::format("gesture row {}", row.Integer(0, INT64_MIN, INT64_MAX)));
        gesture.id = row.Text(1);
        const std::string place = GesturePlace(gesture.id);
        row.At(place);
        gesture.params = Params(row.Text(2), place);
        ReadNames(row, gesture);
        gesture.geometry = {BlockSide(row, 4), BlockSide(row, 5), BlockSide(row, 6),
                            BlockSide(row, 7)};
        gesture.tier = row.Text(12);
        gesture.tags = TextList(row, 13, "tags");
        gesture.libraryVersion = row.Text(14);
        gesture.notes = row.Text(15);
        const int64_t seq = row.Integer(0, INT64_MIN, INT64_MAX);
        ReadFrames(m_frames, seq, row.Integer(8, 0, kInt32Max), gesture);
        ReadPixels(m_pixels, seq, gesture);
        CheckGesture(gesture, m_database.Path());
        CheckChecksum(row, 16, gesture);
        return gesture;
    }

    static constexpr size_t kParamsMax = 256;  // some 3 KB each

    const Database& m_database;
    Statement m_byId;
    Statement m_bySeq;
    Statement m_frames;
    Statement m_pixels;
    std::unordered_map<std::string, ParamBlock> m_params;
};

Store::Store(std::unique_ptr<Database> database, bool appending)
    : m_database(std::move(database)), m_appending(appending) {}

Store::Store(Store&& other) noexcept = default;

Store& Store::operator=(Store&& other) noexcept {
    if (this != &other) {
        m_reader.reset();  // its statements end before their connection
        m_database = std::move(other.m_database);
        m_reader = std::move(other.m_reader);
        m_appending = other.m_appending;
    }
    return *this;
}

Store::~Store() = default;

Store Store::OpenForReading(const std::string& path) {
    return Store(OpenStoreFile(path, false), false);
}

const std::string& Store::Path() const {
    return m_database->Path();
}

StoreReader& Store::Reader() const {
    if (m_reader == nullptr)
        m_reader = std::make_unique<StoreReader>(*m_database);
    return *m_reader;
}

Gesture Store::Read(const std::string& id) const {
    return Reader().Read(id, GesturePlace(id));
}

Gesture Store::ReadRow(int64_t seq) const {
    return Reader().Read(seq, fmt::format("gesture row {}", seq));
}

void Store::ForEach(const std::function<void(const Gesture&)>& visit) const {
    Extent();
    Reader().ReadAll(visit);
}

}  // namespace host
