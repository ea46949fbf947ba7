// Imports .fng recordings: gestures rendered over real fingerprints, with the key known. The format
// is told in docs/recordings.md.
#ifndef FPNAVI_HOST_FNGIMPORT_H
#define FPNAVI_HOST_FNGIMPORT_H

#include <functional>
#include <map>
#include <string>
#include <vector>

#include "recording/Recording.h"

namespace host {

// One row of the index.csv beside .fng files.
struct FngIndexRow {
    size_t line = 0;  // in the file, from 1
    std::string tier;
    Mode mode = Mode::Fp;
    bool tiled = false;
    std::string kind;  // "stroke:RIGHT"
    std::optional<int32_t> expect;
    std::vector<int32_t> accept;
    GestureEnd end = GestureEnd::Lift;
    std::string source;   // empty where the file has no such column
    std::string quality;  // likewise
    std::optional<size_t> frames;
};

// The rows by gesture id. The columns are found by their names in the first line; id, tier, mode,
// layout, kind, expect, accept and end must be there. Error at "file:line" for a malformed row.
std::map<std::string, FngIndexRow> ReadFngIndex(const std::string& path);

// One .fng file: frames, registers, positions, presence, the label of its header and the
// parameters of its mode and layout. The id is the file's name without .fng, which has to be UTF-8.
// Error at the byte offset for a file that deviates from the format in anything.
Gesture ReadFng(const std::string& path);

// The gesture of a .fng file with what its row of the index adds: accepted keys, tier, and as tags
// kind, source and quality. Error when the row contradicts the file.
void ApplyFngIndex(const FngIndexRow& row, const std::string& indexPath, Gesture& gesture);

// Gets each gesture with the file that it comes from.
using FngVisitor = std::function<void(Gesture&&, const std::string& file)>;

// Visits the gesture of a .fng file, or those of all .fng files (in any case) of a directory and of
// the directories below it, each in the order of names. An index.csv beside them is used for the
// files that it lists; other files have only their header's label. Error for a directory without
// .fng files, and for a row without a file in the index of a directory.
void ImportFng(const std::string& path, const FngVisitor& visit);

// The same, all in memory.
std::vector<Gesture> ImportFng(const std::string& path);

}  // namespace host

#endif  // FPNAVI_HOST_FNGIMPORT_H
