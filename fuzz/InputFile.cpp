#include "InputFile.h"

#include <unistd.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <system_error>

namespace fpnavi_fuzz {
namespace {

namespace fs = std::filesystem;

std::string MakeDirectory() {
    std::error_code error;
    const fs::path memory = "/dev/shm";
    const fs::path base = fs::is_directory(memory, error) && ::access(memory.c_str(), W_OK) == 0
                              ? memory
                              : fs::temp_directory_path();
    std::string name = (base / "fpnavi-fuzz-XXXXXX").string();
    Require(::mkdtemp(name.data()) != nullptr, "a directory for the input file");
    return name;
}

}  // namespace

InputFile::InputFile(const std::string& name)
    : m_directory(MakeDirectory()), m_path((fs::path(m_directory) / name).string()) {}

InputFile::~InputFile() {
    std::error_code error;
    fs::remove_all(m_directory, error);
}

void InputFile::RemoveOthers() {
    std::error_code error;
    for (const fs::directory_entry& entry : fs::directory_iterator(m_directory)) {
        if (entry.path() != m_path)
            fs::remove(entry.path(), error);
    }
}

void InputFile::Write(const uint8_t* data, size_t size) {
    RemoveOthers();
    std::ofstream file(m_path, std::ios::binary | std::ios::trunc);
    if (size > 0)
        file.write(reinterpret_cast<const char*>(data), static_cast<std::streamsize>(size));
    file.close();
    Require(file.good(), "the input file is written");
}

void Require(bool holds, const char* what) {
    if (!holds) {
        std::fprintf(stderr, "not so: %s\n", what);
        std::abort();
    }
}

}  // namespace fpnavi_fuzz
