// What the tests of recordings share: fresh file names, small gestures, errors by their text.
#ifndef FPNAVI_TESTS_HOST_HOSTTESTSUPPORT_H
#define FPNAVI_TESTS_HOST_HOSTTESTSUPPORT_H

#include <gtest/gtest.h>
#include <unistd.h>

#include <cstdint>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>
#include <vector>

#include "common/Error.h"
#include "parameters/ParamTable.h"
#include "recording/Recording.h"

namespace host_test {

// A directory of this process, deleted when it ends.
class ProcessDirectory {
  public:
    explicit ProcessDirectory(const std::string& parent)
        : m_path(std::filesystem::path(parent) / ("fpnavi-" + std::to_string(::getpid()))) {
        std::filesystem::create_directories(m_path);
    }
    ~ProcessDirectory() {
        std::error_code ignored;
        std::filesystem::remove_all(m_path, ignored);
    }
    ProcessDirectory(const ProcessDirectory&) = delete;
    ProcessDirectory& operator=(const ProcessDirectory&) = delete;

    const std::filesystem::path& Path() const { return m_path; }

  private:
    std::filesystem::path m_path;
};

// A fresh directory of the running test.
inline std::string TestDirectory() {
    static const ProcessDirectory root(::testing::TempDir());
    static int counter = 0;
    const std::filesystem::path directory = root.Path() / std::to_string(counter++);
    std::filesystem::create_directories(directory);
    return directory.string();
}

// One in memory where there is such a file system: for thousands of small files, or of flushes.
inline std::string MemoryDirectory() {
    const char* const memory = "/dev/shm";
    static const ProcessDirectory root(::access(memory, W_OK) == 0 ? memory : ::testing::TempDir());
    static int counter = 0;
    const std::filesystem::path directory = root.Path() / ("m" + std::to_string(counter++));
    std::filesystem::create_directories(directory);
    return directory.string();
}

inline std::vector<uint8_t> ReadBytes(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    return std::vector<uint8_t>(std::istreambuf_iterator<char>(file), {});
}

inline void WriteBytes(const std::string& path, const std::vector<uint8_t>& bytes) {
    std::ofstream file(path, std::ios::binary);
    file.write(reinterpret_cast<const char*>(bytes.data()),
               static_cast<std::streamsize>(bytes.size()));
}

inline void WriteText(const std::string& path, const std::string& text) {
    WriteBytes(path, std::vector<uint8_t>(text.begin(), text.end()));
}

// The text of the host::Error that action throws; fails the test when it throws none.
template <typename Action>
std::string ErrorOf(Action action) {
    try {
        action();
    } catch (const host::Error& error) {
        return error.what();
    }
    ADD_FAILURE() << "expected a host::Error";
    return "";
}

// An fp gesture whose bytes differ from frame to frame.
inline host::Gesture SmallGesture(const std::string& id, size_t frameCount = 3) {
    host::Gesture gesture;
    gesture.id = id;
    gesture.params = host::ParamsForMode(host::Mode::Fp, false);
    gesture.mode = host::Mode::Fp;
    gesture.geometry = host::GeometryOf(gesture.params);
    for (size_t i = 0; i < frameCount; ++i) {
        host::RecordedFrame frame;
        frame.raw.resize(56 * 36);
        for (size_t k = 0; k < frame.raw.size(); ++k)
            frame.raw[k] = static_cast<uint8_t>(k * 7 + i * 31);
        gesture.frames.push_back(frame);
    }
    return gesture;
}

// The directory of the real recordings; empty when this machine has none.
inline std::string RealDataDirectory() {
    const char* const fromEnvironment = std::getenv("FPNAVI_REALDATA");
    std::string directory = fromEnvironment != nullptr ? fromEnvironment : "";
#ifdef FPNAVI_REALDATA_DEFAULT
    if (directory.empty())
        directory = FPNAVI_REALDATA_DEFAULT;
#endif
    if (directory.empty() || !std::filesystem::exists(directory + "/gestures/index.csv"))
        return "";
    return directory;
}

}  // namespace host_test

#endif  // FPNAVI_TESTS_HOST_HOSTTESTSUPPORT_H
