#include "ResultLines.h"

#include <fmt/core.h>

#include "recording/Keys.h"

namespace command {

Colour VerdictColour(host::Verdict verdict) {
    switch (verdict) {
        case host::Verdict::Right:
            return Colour::Green;
        case host::Verdict::Accepted:
            return Colour::Yellow;
        case host::Verdict::Unknown:
            return Colour::None;
        default:
            return Colour::Red;
    }
}

std::string ShownKey(int32_t key) {
    return key < 0 ? "-" : host::KeyName(key);
}

Json ResultJson(const host::ReplayResult& result) {
    Json json = {{"id", result.id}, {"mode", host::ModeName(result.mode)}};
    if (!result.tier.empty())
        json["tier"] = result.tier;
    json["label"] = result.label ? Json(host::KeyName(*result.label)) : Json(nullptr);
    json["key"] = result.key < 0 ? Json(nullptr) : Json(host::KeyName(result.key));
    json["frames"] = result.frameCount;
    json["pairs"] = result.pairs;
    json["time_out"] = result.voteTimeOut;
    json["verdict"] = host::VerdictName(result.verdict);
    if (!result.errors.empty())
        json["errors"] = result.errors;
    return json;
}

void Summary::Counts::Add(const Counts& other) {
    all += other.all;
    for (size_t i = 0; i < verdicts.size(); ++i)
        verdicts[i] += other.verdicts[i];
    failed += other.failed;
}

void Summary::Add(const host::ReplayResult& result) {
    Counts& counts = m_counts[{result.mode, result.tier}];
    ++counts.all;
    ++counts.verdicts[static_cast<size_t>(result.verdict)];
    if (result.verdict == host::Verdict::Wrong && !result.errors.empty())
        ++counts.failed;
}

int64_t Summary::Count(host::Verdict verdict) const {
    return All().Of(verdict);
}

Summary::Counts Summary::All() const {
    Counts all;
    for (const auto& entry : m_counts)
        all.Add(entry.second);
    return all;
}

void Summary::WriteJsonLine(const std::string& mode, const std::string& tier,
                            const Counts& counts) {
    WriteJson("summary", {{"mode", mode},
                          {"tier", tier},
                          {"count", counts.all},
                          {"right", counts.Of(host::Verdict::Right)},
                          {"accepted", counts.Of(host::Verdict::Accepted)},
                          {"wrong", counts.Of(host::Verdict::Wrong)},
                          {"failed", counts.failed},
                          {"unknown", counts.Of(host::Verdict::Unknown)},
                          {"unreadable", counts.Of(host::Verdict::Unreadable)}});
}

std::vector<Column> Summary::Columns(const Counts& all) {
    std::vector<Column> columns = {{"mode", 4},        {"tier", 6},           {"count", 7, true},
                                   {"right", 7, true}, {"accepted", 8, true}, {"wrong", 7, true}};
    if (all.failed > 0)
        columns.push_back({"failed", 7, true});
    if (all.Of(host::Verdict::Unknown) > 0)
        columns.push_back({"unknown", 7, true});
    if (all.Of(host::Verdict::Unreadable) > 0)
        columns.push_back({"unreadable", 10, true});
    return columns;
}

std::vector<Cell> Summary::Row(const std::string& mode, const std::string& tier,
                               const Counts& counts, const Counts& all) {
    const auto red = [](int64_t count) {
        return Cell(std::to_string(count), count > 0 ? Colour::Red : Colour::None);
    };
    std::vector<Cell> row = {mode,
                             tier,
                             Cell(counts.all),
                             Cell(counts.Of(host::Verdict::Right)),
                             Cell(counts.Of(host::Verdict::Accepted)),
                             red(counts.Of(host::Verdict::Wrong))};
    if (all.failed > 0)
        row.push_back(red(counts.failed));
    if (all.Of(host::Verdict::Unknown) > 0)
        row.emplace_back(counts.Of(host::Verdict::Unknown));
    if (all.Of(host::Verdict::Unreadable) > 0)
        row.push_back(red(counts.Of(host::Verdict::Unreadable)));
    return row;
}

void Summary::Write(bool json) const {
    const Counts all = All();
    const Table table(Columns(all));
    const auto line = [&](const std::string& mode, const std::string& tier, const Counts& counts) {
        if (json)
            WriteJsonLine(mode, tier, counts);
        else
            table.Row(Row(mode, tier, counts, all));
    };
    if (!json)
        table.Head();
    std::map<host::Mode, Counts> modes;
    for (const auto& [group, counts] : m_counts)
        modes[group.first].Add(counts);
    for (const auto& [mode, counts] : modes) {
        for (const auto& [group, part] : m_counts) {
            if (group.first == mode && !group.second.empty())
                line(host::ModeName(mode), group.second, part);
        }
        line(host::ModeName(mode), "all", counts);
    }
    line("all", "all", all);
}

}  // namespace command
