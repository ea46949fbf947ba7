// Runs a fuzz target without the fuzzer: once for each file of the directories named, in the order
// of their names, and once for no bytes at all. A finding ends the process as it does there.
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <exception>
#include <filesystem>
#include <vector>

#include "common/Files.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size);

namespace {

namespace fs = std::filesystem;

std::vector<fs::path> FilesOf(const char* directory) {
    std::vector<fs::path> files;
    for (const fs::directory_entry& entry : fs::directory_iterator(directory))
        files.push_back(entry.path());
    std::sort(files.begin(), files.end());
    return files;
}

// The number of files run.
int Replay(const char* directory) {
    int count = 0;
    for (const fs::path& path : FilesOf(directory)) {
        std::printf("%s\n", path.c_str());
        std::fflush(stdout);
        const std::vector<uint8_t> bytes = host::ReadWholeFile(path.string());
        LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
        ++count;
    }
    return count;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        int count = 0;
        for (int i = 1; i < argc; ++i)
            count += Replay(argv[i]);
        if (count == 0) {
            std::fprintf(stderr, "usage: %s DIRECTORY..., with at least one input\n", argv[0]);
            return 2;
        }
        LLVMFuzzerTestOneInput(nullptr, 0);
        std::printf("%d inputs replayed\n", count);
        return 0;
    } catch (const std::exception& error) {
        std::fprintf(stderr, "not caught: %s\n", error.what());
        return 1;
    }
}
