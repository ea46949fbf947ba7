// The import of .fng files: one, or all of a directory and of those below it.
#include <fmt/format.h>

#include <algorithm>
#include <filesystem>
#include <set>

#include "common/Error.h"
#include "common/Text.h"
#include "importers/FngImport.h"

namespace host {

namespace {

namespace fs = std::filesystem;

constexpr const char* kIndexName = "index.csv";
constexpr const char* kExtension = ".fng";

using Rows = std::map<std::string, FngIndexRow>;

// The .fng files of one directory, in the order of their names.
struct FngDirectory {
    std::string path;
    std::vector<std::string> files;
};

std::vector<fs::path> EntriesOf(const std::string& directory) {
    std::vector<fs::path> entries;
    std::error_code error;
    for (fs::directory_iterator entry(directory, error), end; !error && entry != end;
         entry.increment(error))
        entries.push_back(entry->path());
    if (error)
        throw Error(directory, "", "cannot be listed: " + error.message());
    std::sort(entries.begin(), entries.end());
    return entries;
}

// Adds the .fng files of the directory to found, and the directories in it to pending.
void Collect(const std::string& path, std::vector<std::string>* pending,
             std::vector<FngDirectory>* found) {
    FngDirectory directory = {path, {}};
    std::vector<std::string> below;
    for (const fs::path& entry : EntriesOf(path)) {
        std::error_code ignored;  // what cannot be looked at is told when it is read
        if (fs::is_directory(entry, ignored))
            below.push_back(entry.string());
        else if (EqualInAnyCase(entry.extension().string(), kExtension))
            directory.files.push_back(entry.string());
    }
    found->push_back(std::move(directory));
    pending->insert(pending->end(), below.rbegin(), below.rend());
}

// The directory and those below it, each before those below itself.
std::vector<FngDirectory> DirectoriesOf(const std::string& path) {
    std::set<fs::path> seen;  // without links
    std::vector<FngDirectory> found;
    std::vector<std::string> pending = {path};
    while (!pending.empty()) {
        const std::string next = pending.back();
        pending.pop_back();
        if (!seen.insert(fs::canonical(next)).second)
            throw Error(next, "", "is reached twice by links, expected each directory once");
        Collect(next, &pending, &found);
    }
    const bool empty = std::all_of(found.begin(), found.end(),
                                   [](const FngDirectory& d) { return d.files.empty(); });
    if (empty)
        throw Error(path, "", "has no .fng files, expected at least one");
    return found;
}

std::string IndexPathOf(const std::string& directory) {
    return (fs::path(directory) / kIndexName).string();
}

// The rows of the directory's index; none when there is no index.
Rows RowsOf(const std::string& directory) {
    const std::string path = IndexPathOf(directory);
    std::error_code ignored;
    // One that is there and cannot be read is an error, a link to nowhere too.
    return fs::exists(fs::symlink_status(path, ignored)) ? ReadFngIndex(path) : Rows();
}

// Each row of the index tells of a file: without it a gesture would be missing unnoticed.
void CheckRowsHaveFiles(const FngDirectory& directory, const Rows& rows) {
    std::set<std::string> ids;
    for (const std::string& file : directory.files)
        ids.insert(fs::path(file).stem().string());
    for (const auto& [id, row] : rows) {
        if (ids.count(id) == 0)
            throw Error(
                IndexPathOf(directory.path), std::to_string(row.line),
                fmt::format("'{0}' has no file, expected {0}{1} beside the index", id, kExtension));
    }
}

void VisitFiles(const FngDirectory& directory, const Rows& rows, const FngVisitor& visit) {
    for (const std::string& file : directory.files) {
        Gesture gesture = ReadFng(file);
        const auto row = rows.find(gesture.id);
        if (row != rows.end())
            ApplyFngIndex(row->second, IndexPathOf(directory.path), gesture);
        visit(std::move(gesture), file);
    }
}

}  // namespace

void ImportFng(const std::string& path, const FngVisitor& visit) {
    std::error_code ignored;  // ReadFng says what is wrong with a file
    if (!fs::is_directory(path, ignored)) {
        const std::string directory = fs::path(path).parent_path().string();
        VisitFiles({directory, {path}}, RowsOf(directory), visit);
        return;
    }
    for (const FngDirectory& directory : DirectoriesOf(path)) {
        const Rows rows = RowsOf(directory.path);
        CheckRowsHaveFiles(directory, rows);
        VisitFiles(directory, rows, visit);
    }
}

std::vector<Gesture> ImportFng(const std::string& path) {
    std::vector<Gesture> gestures;
    ImportFng(path, [&](Gesture&& gesture, const std::string&) {
        gestures.push_back(std::move(gesture));
    });
    return gestures;
}

}  // namespace host
