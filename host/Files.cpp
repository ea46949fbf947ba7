// Whole files into memory, with errors that say why.
#include "Files.h"

#include <cerrno>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <memory>

#include "Error.h"

namespace host {

std::vector<uint8_t> ReadWholeFile(const std::string& path) {
    std::error_code ignored;
    if (std::filesystem::is_directory(path, ignored)) {
        throw Error(path, "", "is a directory, expected a file");
    }
    const std::unique_ptr<std::FILE, int (*)(std::FILE*)> file(std::fopen(path.c_str(), "rb"),
                                                               &std::fclose);
    if (file == nullptr) {
        throw Error(path, "", std::string("cannot be opened: ") + std::strerror(errno));
    }
    std::vector<uint8_t> content;
    std::vector<uint8_t> part(64 * 1024);
    size_t got = 0;
    while ((got = std::fread(part.data(), 1, part.size(), file.get())) > 0) {
        content.insert(content.end(), part.begin(),
                       part.begin() + static_cast<std::ptrdiff_t>(got));
    }
    if (std::ferror(file.get()) != 0) {
        throw Error(path, "byte " + std::to_string(content.size()),
                    std::string("cannot be read: ") + std::strerror(errno));
    }
    return content;
}

}  // namespace host
