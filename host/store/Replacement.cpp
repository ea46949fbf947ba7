#include "store/Replacement.h"

#include <filesystem>
#include <optional>
#include <utility>

#include "common/Error.h"
#include "store/NewFile.h"
#include "store/StoreSchema.h"

namespace host {

namespace {

bool IsEmptyFile(const std::string& path) {
    std::error_code error;
    return std::filesystem::is_regular_file(path, error) &&
           std::filesystem::file_size(path, error) == 0 && !error;
}

// The store that is about to be replaced; none where nothing is lost.
std::optional<Store> OpenFormer(const std::string& path) {
    if (!IsThere(path) || IsEmptyFile(path))
        return std::nullopt;
    try {
        return Store::OpenForAppending(path);
    } catch (const Error& reason) {
        throw Error(path, "",
                    std::string("will not be replaced, only a recording store that can be written "
                                "is (") +
                        reason.what() + ")");
    }
}

// Keeps all others from writing to the former store while it lives.
class WritersOut {
  public:
    explicit WritersOut(const std::string& path) : m_database(path, SQLITE_OPEN_READWRITE) {
        sqlite3_busy_timeout(m_database.Handle(), 0);
        const int result =
            sqlite3_exec(m_database.Handle(), "BEGIN IMMEDIATE", nullptr, nullptr, nullptr);
        if ((result & 0xFF) == SQLITE_BUSY)
            throw Error(path, "", "will not be replaced: another process is writing to it");
        if (result != SQLITE_OK)
            m_database.Fail("lock the store that is to be replaced");
    }

  private:
    Database m_database;
};

}  // namespace

Replacement::Replacement(std::string path, Check check)
    : m_path(std::move(path)), m_check(std::move(check)) {
    const DirectoryLock lock(m_path);
    if (const std::optional<Store> former = OpenFormer(m_path))
        m_check(*former);
    m_file = std::make_unique<NewFile>(m_path);
    m_store = std::make_unique<Store>(Store::MakeNew(m_file->Path()));
}

Replacement::~Replacement() = default;

Store Replacement::TakePlace() {
    m_store.reset();
    {
        const DirectoryLock lock(m_path);
        // Opened before the lock is taken: opening reads the file's start by a descriptor of its
        // own, and closing any descriptor of a file ends all locks that this process has on it.
        const std::optional<Store> former = OpenFormer(m_path);
        std::optional<WritersOut> writersOut;
        if (former) {
            writersOut.emplace(m_path);
            m_check(*former);
        }
        m_file->Replace();
    }
    m_file.reset();
    return Store::OpenForAppending(m_path);
}

}  // namespace host
