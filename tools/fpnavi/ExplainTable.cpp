// fpnavi replay --gesture: the trace of one gesture as a table or as JSON lines.
#include <fmt/core.h>

#include "Commands.h"
#include "Output.h"
#include "ResultLines.h"
#include "recording/Keys.h"

namespace command {
namespace {

constexpr const char* kNothing = "-";

const char* StatusName(int32_t status) {
    return status < 0 ? "error" : (status == 0 ? "absent" : "present");
}

// Columns that the gesture's mode has nothing for are left out.
std::vector<Column> Columns(host::Mode mode) {
    std::vector<Column> columns = {{"frame", 0, true}, {"finger", 7},      {"cvr", 3, true},
                                   {"xc", 4, true},    {"yc", 4, true},    {"pair", 0, true},
                                   {"dx_ct", 0, true}, {"dy_ct", 0, true}, {"vkey_ct", 7}};
    if (mode == host::Mode::DoubleScan)
        columns.insert(columns.end(),
                       {{"dx_ds", 0, true}, {"dy_ds", 0, true}, {"cvr_ds", 0, true}});
    if (mode != host::Mode::Hg)
        columns.insert(columns.end(),
                       {{"dx_fp", 0, true}, {"dy_fp", 0, true}, {"diff", 0, true}, {"vkey_fp", 7}});
    columns.insert(columns.end(), {{"true_dx", 0, true}, {"true_dy", 0, true}, {"settled by", 0}});
    return columns;
}

void AddFingerprint(const host::FrameTrace& trace, std::vector<Cell>* row) {
    if (!trace.fingerprint) {
        row->insert(row->end(), {kNothing, kNothing, kNothing, kNothing});
        return;
    }
    const host::FingerprintMove& move = *trace.fingerprint;
    row->insert(row->end(), {Cell(move.dx), Cell(move.dy),
                             move.difference ? Cell(*move.difference) : Cell(kNothing),
                             Cell(host::KeyName(move.key))});
}

std::vector<Cell> Row(const host::FrameTrace& trace, host::Mode mode) {
    std::vector<Cell> row = {Cell(static_cast<int64_t>(trace.frame)), StatusName(trace.status)};
    if (trace.coverage)
        row.insert(row.end(), {Cell(*trace.coverage), Cell(trace.xc), Cell(trace.yc)});
    else
        row.insert(row.end(), {kNothing, kNothing, kNothing});
    row.push_back(trace.pair ? Cell(*trace.pair) : Cell(kNothing));
    if (trace.centroid)
        row.insert(row.end(), {Cell(trace.centroid->dx), Cell(trace.centroid->dy),
                               Cell(host::KeyName(trace.centroid->key))});
    else
        row.insert(row.end(), {kNothing, kNothing, kNothing});
    if (mode == host::Mode::DoubleScan && trace.doubleScan)
        row.insert(row.end(), {Cell(trace.doubleScan->dx), Cell(trace.doubleScan->dy),
                               Cell(trace.doubleScan->coverage)});
    else if (mode == host::Mode::DoubleScan)
        row.insert(row.end(), {kNothing, kNothing, kNothing});
    if (mode != host::Mode::Hg)
        AddFingerprint(trace, &row);
    if (trace.truth)
        row.insert(row.end(), {Cell(fmt::format("{:.1f}", trace.truth->dx)),
                               Cell(fmt::format("{:.1f}", trace.truth->dy))});
    else
        row.insert(row.end(), {kNothing, kNothing});
    row.emplace_back(host::SettledByName(trace.settledBy));
    return row;
}

Json FrameJson(const host::Explanation& explanation, const host::FrameTrace& trace) {
    Json json = {{"id", explanation.result.id},
                 {"frame", trace.frame},
                 {"finger", StatusName(trace.status)},
                 {"settled_by", host::SettledByName(trace.settledBy)}};
    if (trace.pair)
        json["pair"] = *trace.pair;
    if (trace.coverage)
        json.update({{"cvr", *trace.coverage}, {"xc", trace.xc}, {"yc", trace.yc}});
    if (trace.centroid)
        json.update({{"dx_ct", trace.centroid->dx},
                     {"dy_ct", trace.centroid->dy},
                     {"vkey_ct", host::KeyName(trace.centroid->key)}});
    if (trace.doubleScan)
        json.update({{"dx_ds", trace.doubleScan->dx},
                     {"dy_ds", trace.doubleScan->dy},
                     {"cvr_ds", trace.doubleScan->coverage}});
    if (trace.fingerprint) {
        json.update({{"dx_fp", trace.fingerprint->dx},
                     {"dy_fp", trace.fingerprint->dy},
                     {"vkey_fp", host::KeyName(trace.fingerprint->key)}});
        if (trace.fingerprint->difference)
            json["diff"] = *trace.fingerprint->difference;
    }
    if (trace.truth)
        json.update({{"true_dx", trace.truth->dx}, {"true_dy", trace.truth->dy}});
    return json;
}

void WriteVote(const host::ReplayResult& result) {
    Write(fmt::format("\nvote: {} ({} pairs, time_out {}), label {}: {}\n", ShownKey(result.key),
                      result.pairs, result.voteTimeOut,
                      result.label ? host::KeyName(*result.label) : kNothing,
                      Coloured(VerdictColour(result.verdict), host::VerdictName(result.verdict))));
    for (const std::string& error : result.errors)
        Write(fmt::format("error: {}\n", Printable(error)));
}

}  // namespace

void WriteExplanation(const host::Explanation& explanation, bool json) {
    const host::ReplayResult& result = explanation.result;
    if (json) {
        for (const host::FrameTrace& trace : explanation.frames)
            WriteJson("frame", FrameJson(explanation, trace));
        WriteJson("vote", ResultJson(result));
        return;
    }
    Write(fmt::format("{}: mode {}, {} frames\n\n", Printable(result.id),
                      host::ModeName(result.mode), result.frameCount));
    const Table table(Columns(result.mode));
    table.Head();
    for (const host::FrameTrace& trace : explanation.frames)
        table.Row(Row(trace, result.mode));
    WriteVote(result);
}

}  // namespace command
