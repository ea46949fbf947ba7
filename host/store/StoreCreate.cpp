// Creating a store. It appears under its name with all its tables or not at all: they are made in a
// file beside it, which is then renamed. So a kill leaves no file that is not a store yet, and a
// store that is replaced stays until the new one takes its place.
#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>

#include "common/Error.h"
#include "store/Store.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

// The file that becomes the store. One that a killed process has left is overwritten.
constexpr const char* kNewSuffix = "-new";

[[noreturn]] void FailCreating(const std::string& path, int reason) {
    throw Error(path, "", std::string("cannot be created: ") + std::strerror(reason));
}

// Whoever creates stores in a directory waits for the others; ends with the process at the latest.
class DirectoryLock {
  public:
    explicit DirectoryLock(const std::string& path) {
        const std::filesystem::path parent = std::filesystem::path(path).parent_path();
        m_directory =
            open(parent.empty() ? "." : parent.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
        // Where it cannot be locked (some network file systems), creating goes on without.
        while (m_directory >= 0 && flock(m_directory, LOCK_EX) != 0 && errno == EINTR) {
        }
    }
    ~DirectoryLock() {
        if (m_directory >= 0)
            close(m_directory);
    }
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;

  private:
    int m_directory = -1;
};

void RemoveFile(const std::string& path) {
    std::error_code error;
    std::filesystem::remove(path, error);
    if (error)
        throw Error(path, "", "cannot be deleted: " + error.message());
}

// What SQLite keeps beside a store: it would take it for the new store's.
void RemoveCompanions(const std::string& path) {
    for (const char* suffix : {"-wal", "-shm", "-journal"})
        RemoveFile(path + suffix);
}

// Also a link to nowhere.
bool IsThere(const std::string& path) {
    std::error_code ignored;
    return std::filesystem::exists(std::filesystem::symlink_status(path, ignored));
}

bool IsEmptyFile(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_regular_file(path, error) &&
           std::filesystem::file_size(path, error) == 0 && !error;
}

// Folds the log of a store that is about to be replaced, so that it stays whole until then.
void PrepareFormer(const std::string& path) {
    if (!IsThere(path) || IsEmptyFile(path))
        return;
    try {
        OpenStoreFile(path, false);
    } catch (const Error& reason) {
        throw Error(
            path, "",
            std::string("will not be replaced, only a recording store is (") + reason.what() + ")");
    }
    const Database former(path, SQLITE_OPEN_READWRITE);
    sqlite3_busy_timeout(former.Handle(), 0);
    const int result =
        sqlite3_exec(former.Handle(), "PRAGMA journal_mode = DELETE", nullptr, nullptr, nullptr);
    if ((result & 0xFF) == SQLITE_BUSY)
        throw Error(path, "", "will not be replaced: another process has it open");
}

// An empty store in one file. Its errors name path, the file that it is to become.
void MakeTables(const std::string& newPath, const std::string& path) {
    RemoveFile(newPath);
    std::FILE* const file = std::fopen(newPath.c_str(), "wbx");
    if (file == nullptr)
        FailCreating(path, errno);
    std::fclose(file);
    try {
        Database database(newPath, SQLITE_OPEN_READWRITE);
        // Nothing is lost with an unfinished file, so no journal has to guard it.
        database.Execute("PRAGMA journal_mode = OFF; PRAGMA synchronous = FULL",
                         "set up the connection");
        CreateSchema(database);
    } catch (const Error& reason) {
        std::remove(newPath.c_str());
        throw Error(path, "", fmt::format("cannot be created ({})", reason.what()));
    }
}

// Unlike rename, an error when there is a file of that name.
int RenameToFree(const std::string& from, const std::string& to) {
#ifdef RENAME_NOREPLACE
    if (renameat2(AT_FDCWD, from.c_str(), AT_FDCWD, to.c_str(), RENAME_NOREPLACE) == 0)
        return 0;
    if (errno != EINVAL && errno != ENOSYS)
        return -1;
#endif
    // A file system that knows no such renaming; the directory's lock keeps other creators out.
    if (access(to.c_str(), F_OK) == 0) {
        errno = EEXIST;
        return -1;
    }
    return std::rename(from.c_str(), to.c_str());
}

}  // namespace

Store Store::Create(const std::string& path, IfExists ifExists) {
    {
        const DirectoryLock lock(path);
        if (ifExists == IfExists::Replace)
            PrepareFormer(path);
        else if (IsThere(path))
            FailCreating(path, EEXIST);
        const std::string newPath = path + kNewSuffix;
        MakeTables(newPath, path);
        RemoveCompanions(path);
        const int result = ifExists == IfExists::Replace
                               ? std::rename(newPath.c_str(), path.c_str())
                               : RenameToFree(newPath, path);
        if (result != 0) {
            const int reason = errno;
            std::remove(newPath.c_str());
            FailCreating(path, reason);
        }
    }
    auto database = std::make_unique<Database>(path, SQLITE_OPEN_READWRITE);
    PrepareForAppending(*database);
    return Store(std::move(database), true);
}

}  // namespace host
