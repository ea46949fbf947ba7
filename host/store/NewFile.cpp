// New files, their locks and names.
#include "store/NewFile.h"

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/file.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>

#include "common/Error.h"

namespace host {

namespace {

constexpr const char* kNewSuffix = "-new";

std::string DirectoryOf(const std::string& path) {
    const std::string parent = std::filesystem::path(path).parent_path().string();
    return parent.empty() ? "." : parent;
}

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

std::string DirectoryProblem(const std::string& path) {
    const std::string directory = DirectoryOf(path);
    if (access(directory.c_str(), W_OK | X_OK) == 0)
        return "";
    switch (errno) {
        case EROFS:
            return fmt::format("its directory '{}' is on a read-only file system", directory);
        case EACCES:
            return fmt::format("no permission to write to its directory '{}'", directory);
        default:
            return fmt::format("its directory '{}': {}", directory, std::strerror(errno));
    }
}

std::string WritingProblem(const std::string& path) {
    if (access(path.c_str(), W_OK) == 0)
        return DirectoryProblem(path);  // where SQLite keeps its journal
    switch (errno) {
        case EROFS:
            return "the file is on a read-only file system";
        case EACCES:
            return "no permission to write to the file";
        default:
            return std::strerror(errno);
    }
}

void FailCreating(const std::string& path, const std::string& reason) {
    throw Error(path, "", "cannot be created: " + reason);
}

bool IsThere(const std::string& path) {
    std::error_code ignored;
    return std::filesystem::exists(std::filesystem::symlink_status(path, ignored));
}

DirectoryLock::DirectoryLock(const std::string& path)
    : m_directory(open(DirectoryOf(path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC)) {
    // Where it cannot be locked (some network file systems), creating goes on without.
    while (m_directory >= 0 && flock(m_directory, LOCK_EX) != 0 && errno == EINTR) {
    }
}

DirectoryLock::~DirectoryLock() {
    if (m_directory >= 0)
        close(m_directory);
}

NewFile::NewFile(const std::string& path) : m_path(path), m_newPath(path + kNewSuffix) {
    constexpr mode_t kOwnerOnly = 0600;
    m_file = open(m_newPath.c_str(), O_RDWR | O_CREAT | O_NOFOLLOW | O_CLOEXEC, kOwnerOnly);
    if (m_file < 0) {
        const int reason = errno;
        const std::string problem = DirectoryProblem(path);
        FailCreating(path, problem.empty() ? std::strerror(reason) : problem);
    }
    const bool taken = flock(m_file, LOCK_EX | LOCK_NB) != 0 && errno == EWOULDBLOCK;
    if (taken || fchmod(m_file, kOwnerOnly) != 0 || ftruncate(m_file, 0) != 0) {
        const std::string reason = taken ? "another process is making it" : std::strerror(errno);
        close(m_file);
        FailCreating(path, reason);
    }
    std::remove((m_newPath + "-journal").c_str());
}

NewFile::~NewFile() {
    if (!m_named)
        std::remove(m_newPath.c_str());
    close(m_file);
}

void NewFile::Sync() const {
    if (fsync(m_file) != 0)
        FailCreating(m_path, std::strerror(errno));
}

void NewFile::TakeName() {
    Sync();
    RemoveCompanions(m_path);
    if (RenameToFree(m_newPath, m_path) != 0)
        FailCreating(m_path, std::strerror(errno));
    Named();
}

void NewFile::Replace() {
    constexpr mode_t kPermissions = 0777;
    struct stat former {};
    if (stat(m_path.c_str(), &former) == 0 && fchmod(m_file, former.st_mode & kPermissions) != 0)
        FailCreating(m_path, std::strerror(errno));
    Sync();
    RemoveCompanions(m_path);
    if (std::rename(m_newPath.c_str(), m_path.c_str()) != 0)
        FailCreating(m_path, std::strerror(errno));
    Named();
}

// The name is on the disk, too, before anyone relies on it.
void NewFile::Named() {
    m_named = true;
    const int directory = open(DirectoryOf(m_path).c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    if (directory < 0)
        return;
    fsync(directory);
    close(directory);
}

}  // namespace host
