// The file in which a new store is made, beside the name that it gets when it is complete. Used by
// the store alone.
#ifndef FPNAVI_HOST_NEWFILE_H
#define FPNAVI_HOST_NEWFILE_H

#include <sys/types.h>

#include <string>

namespace host {

// Why a file can not be made in the directory of path, or path itself not be written; empty when it
// can.
std::string DirectoryProblem(const std::string& path);
std::string WritingProblem(const std::string& path);

// Throws Error "cannot be created: <reason>".
[[noreturn]] void FailCreating(const std::string& path, const std::string& reason);

// Whether there is anything of that name, also a link to nowhere.
bool IsThere(const std::string& path);

// Whoever gives stores their names in a directory waits for the others; ends with the process at
// the latest.
class DirectoryLock {
  public:
    explicit DirectoryLock(const std::string& path);
    ~DirectoryLock();
    DirectoryLock(const DirectoryLock&) = delete;
    DirectoryLock& operator=(const DirectoryLock&) = delete;

  private:
    int m_directory = -1;
};

// An empty file called path with -new at its end, for its owner alone to read (0600). One that a
// killed process has left is overwritten; one that another process is making is an Error. Deleted
// at the end unless it got the name path.
class NewFile {
  public:
    explicit NewFile(const std::string& path);  // under the DirectoryLock
    ~NewFile();
    NewFile(const NewFile&) = delete;
    NewFile& operator=(const NewFile&) = delete;

    const std::string& Path() const { return m_newPath; }

    // Waits until the disk has it, and renames it to path. TakeName: Error when there is a file of
    // that name. Replace: what is there is replaced, which keeps its permissions.
    void TakeName();
    void Replace();

  private:
    void Sync() const;
    void Named();

    std::string m_path;
    std::string m_newPath;
    int m_file = -1;
    bool m_named = false;
};

}  // namespace host

#endif  // FPNAVI_HOST_NEWFILE_H
