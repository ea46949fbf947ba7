// The index.csv beside .fng files.
#include <fmt/format.h>

#include <algorithm>
#include <charconv>
#include <string_view>

#include "common/Error.h"
#include "common/Files.h"
#include "common/Text.h"
#include "importers/FngImport.h"
#include "recording/Keys.h"

namespace host {

namespace {

// The file has no quoted fields: names and numbers only.
std::vector<std::string> Split(std::string_view text, char separator) {
    std::vector<std::string> parts;
    size_t start = 0;
    for (size_t end = text.find(separator); end != std::string_view::npos;
         end = text.find(separator, start)) {
        parts.emplace_back(text.substr(start, end - start));
        start = end + 1;
    }
    parts.emplace_back(text.substr(start));
    return parts;
}

// One line cut into fields that are found by column name.
class CsvLine {
  public:
    CsvLine(const std::string& path, size_t line, const std::vector<std::string>& columns,
            const std::string& text)
        : m_path(path), m_line(line), m_columns(columns), m_fields(Split(text, ',')) {
        if (m_fields.size() != columns.size())
            Fail(fmt::format("{} fields, expected {} as in line 1", m_fields.size(),
                             columns.size()));
    }

    std::string Optional(std::string_view column) const {
        const auto found = std::find(m_columns.begin(), m_columns.end(), column);
        return found == m_columns.end() ? ""
                                        : m_fields[static_cast<size_t>(found - m_columns.begin())];
    }

    std::string Required(std::string_view column) const {
        std::string field = Optional(column);
        if (field.empty())
            Fail(fmt::format("{} is empty, expected a value", column));
        return field;
    }

    [[noreturn]] void Fail(const std::string& problem) const {
        throw Error(m_path, std::to_string(m_line), problem);
    }

  private:
    const std::string& m_path;
    size_t m_line;
    const std::vector<std::string>& m_columns;
    std::vector<std::string> m_fields;
};

int32_t KeyOf(const CsvLine& line, const std::string& name, const char* column) {
    const std::optional<int32_t> key = ParseKey(name);
    if (!key)
        line.Fail(fmt::format("{} '{}', {}", column, name, Suggestion(name, KeyNames())));
    return *key;
}

void ReadKeys(const CsvLine& line, FngIndexRow& row) {
    const std::string expect = line.Optional("expect");
    if (!expect.empty())
        row.expect = KeyOf(line, expect, "expect");
    for (const std::string& name : Split(line.Required("accept"), ' '))
        row.accept.push_back(KeyOf(line, name, "accept"));
    if (row.expect &&
        std::find(row.accept.begin(), row.accept.end(), *row.expect) == row.accept.end())
        line.Fail(fmt::format("accept has no {}, expected it to hold the expect key", expect));
}

size_t CountOf(const CsvLine& line, const std::string& text) {
    size_t count = 0;
    const auto result = std::from_chars(text.data(), text.data() + text.size(), count);
    if (result.ec != std::errc() || result.ptr != text.data() + text.size())
        line.Fail(fmt::format("frames '{}', expected a count", text));
    return count;
}

FngIndexRow RowOf(const CsvLine& line) {
    FngIndexRow row;
    row.tier = line.Required("tier");
    if (row.tier != "core" && row.tier != "hard")
        line.Fail(fmt::format("tier '{}', expected core or hard", row.tier));
    const std::string mode = line.Required("mode");
    const std::optional<Mode> knownMode = ParseMode(mode);
    if (!knownMode)
        line.Fail(fmt::format("mode '{}', expected fp, hg or ds", mode));
    row.mode = *knownMode;
    const std::string layout = line.Required("layout");
    if (layout != "plain" && layout != "tiled")
        line.Fail(fmt::format("layout '{}', expected plain or tiled", layout));
    row.tiled = layout == "tiled";
    row.kind = line.Required("kind");
    ReadKeys(line, row);
    const std::string end = line.Required("end");
    const std::optional<GestureEnd> knownEnd = ParseEnd(end);
    if (!knownEnd)
        line.Fail(fmt::format("end '{}', expected lift or timeout", end));
    row.end = *knownEnd;
    row.source = line.Optional("source");
    row.quality = line.Optional("quality");
    const std::string frames = line.Optional("frames");
    if (!frames.empty())
        row.frames = CountOf(line, frames);
    return row;
}

std::vector<std::string> LinesOf(const std::string& path) {
    const std::vector<uint8_t> bytes = ReadWholeFile(path);
    std::vector<std::string> lines =
        Split(std::string_view(reinterpret_cast<const char*>(bytes.data()), bytes.size()), '\n');
    if (lines.back().empty())
        lines.pop_back();
    for (std::string& line : lines) {
        if (!line.empty() && line.back() == '\r')
            line.pop_back();
    }
    return lines;
}

}  // namespace

std::map<std::string, FngIndexRow> ReadFngIndex(const std::string& path) {
    const std::vector<std::string> lines = LinesOf(path);
    const std::vector<std::string> columns =
        Split(lines.empty() ? std::string_view() : std::string_view(lines[0]), ',');
    for (const char* name : {"id", "tier", "mode", "layout", "kind", "expect", "accept", "end"}) {
        if (std::count(columns.begin(), columns.end(), name) != 1)
            throw Error(path, "1", fmt::format("expected one column {}", name));
    }
    std::map<std::string, FngIndexRow> rows;
    for (size_t i = 1; i < lines.size(); ++i) {
        const CsvLine line(path, i + 1, columns, lines[i]);
        const std::string id = line.Required("id");
        FngIndexRow row = RowOf(line);
        row.line = i + 1;
        const auto [former, isNew] = rows.emplace(id, std::move(row));
        if (!isNew)
            line.Fail(fmt::format("id '{}' is in line {} already, expected it once", id,
                                  former->second.line));
    }
    return rows;
}

void ApplyFngIndex(const FngIndexRow& row, const std::string& indexPath, Gesture& gesture) {
    const auto check = [&](bool same, const char* column) {
        if (!same)
            throw Error(indexPath, std::to_string(row.line),
                        fmt::format("{} of '{}' differs from the header of its .fng file", column,
                                    gesture.id));
    };
    check(row.mode == gesture.mode, "mode");
    const char* const layout = row.tiled ? "tiled" : "plain";
    check(std::find(gesture.tags.begin(), gesture.tags.end(), layout) != gesture.tags.end(),
          "layout");
    check(row.expect == gesture.label, "expect");
    check(row.end == gesture.end, "end");
    check(!row.frames || *row.frames == gesture.frames.size(), "frames");
    gesture.accepted = row.accept;
    gesture.tier = row.tier;
    gesture.tags.push_back(row.kind);
    if (!row.source.empty())
        gesture.tags.push_back("source:" + row.source);
    if (!row.quality.empty())
        gesture.tags.push_back("quality:" + row.quality);
}

}  // namespace host
