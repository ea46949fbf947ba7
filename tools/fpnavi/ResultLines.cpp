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

void Summary::Add(const host::ReplayResult& result) {
    Counts one{1, 0, 0, 0};
    (result.verdict == host::Verdict::Right      ? one.right
     : result.verdict == host::Verdict::Accepted ? one.accepted
                                                 : one.wrong) = 1;
    Count(one, &m_counts[{result.mode, result.tier}]);
}

void Summary::Count(const Counts& from, Counts* to) {
    to->all += from.all;
    to->right += from.right;
    to->accepted += from.accepted;
    to->wrong += from.wrong;
}

int64_t Summary::Wrong() const {
    int64_t wrong = 0;
    for (const auto& entry : m_counts)
        wrong += entry.second.wrong;
    return wrong;
}

void Summary::WriteLine(bool json, const Table& table, const std::string& mode,
                        const std::string& tier, const Counts& counts) {
    if (json) {
        WriteJson("summary", {{"mode", mode},
                              {"tier", tier},
                              {"count", counts.all},
                              {"right", counts.right},
                              {"accepted", counts.accepted},
                              {"wrong", counts.wrong}});
        return;
    }
    table.Row({mode, tier, Cell(counts.all), Cell(counts.right), Cell(counts.accepted),
               Cell(std::to_string(counts.wrong), counts.wrong > 0 ? Colour::Red : Colour::None)});
}

void Summary::Write(bool json) const {
    const Table table({{"mode", 4},
                       {"tier", 6},
                       {"count", 7, true},
                       {"right", 7, true},
                       {"accepted", 8, true},
                       {"wrong", 7, true}});
    if (!json)
        table.Head();
    std::map<host::Mode, Counts> modes;
    Counts all;
    for (const auto& [group, counts] : m_counts) {
        Count(counts, &modes[group.first]);
        Count(counts, &all);
    }
    for (const auto& [mode, counts] : modes) {
        for (const auto& [group, part] : m_counts) {
            if (group.first == mode && !group.second.empty())
                WriteLine(json, table, host::ModeName(mode), group.second, part);
        }
        WriteLine(json, table, host::ModeName(mode), "all", counts);
    }
    WriteLine(json, table, "all", "all", all);
}

}  // namespace command
