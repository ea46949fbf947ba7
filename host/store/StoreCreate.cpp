// Creating a store. It appears under its name with all its tables or not at all: they are made in a
// file beside it, which is then renamed.
#include <fmt/format.h>

#include "common/Error.h"
#include "store/NewFile.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

Store Store::Create(const std::string& path) {
    {
        const DirectoryLock lock(path);
        if (IsThere(path))
            FailCreating(path, "the file exists");
        NewFile file(path);
        try {
            MakeNew(file.Path());
        } catch (const Error& reason) {
            throw Error(path, "", fmt::format("cannot be created ({})", reason.what()));
        }
        file.TakeName();
    }
    return OpenForAppending(path);
}

Store Store::MakeNew(const std::string& path) {
    auto database = std::make_unique<Database>(path, SQLITE_OPEN_READWRITE);
    // Nothing is lost with an unfinished file: its journal is there for an Append that fails alone.
    database->Execute(
        "PRAGMA foreign_keys = ON; PRAGMA journal_mode = MEMORY; PRAGMA synchronous = OFF",
        "set up the connection");
    CreateSchema(*database);
    return Store(std::move(database), true);
}

}  // namespace host
