// The fuzzer's bytes as a file in memory, for readers that want a path.
#ifndef FUZZ_INPUTFILE_H
#define FUZZ_INPUTFILE_H

#include <cstddef>
#include <cstdint>
#include <string>

namespace fpnavi_fuzz {

// One file for the whole run, rewritten for each input, in a directory of its own below /dev/shm
// (below the directory for temporary files where there is none).
class InputFile {
  public:
    // name: what errors and ids show, "input.fng".
    explicit InputFile(const std::string& name);
    ~InputFile();
    InputFile(const InputFile&) = delete;
    InputFile& operator=(const InputFile&) = delete;

    // Replaces the content and removes what a reader has left beside the file.
    void Write(const uint8_t* data, size_t size);

    const std::string& Path() const { return m_path; }

  private:
    void RemoveOthers();

    std::string m_directory;
    std::string m_path;
};

// Ends the process, for the fuzzer to keep the input, unless holds.
void Require(bool holds, const char* what);

}  // namespace fpnavi_fuzz

#endif  // FUZZ_INPUTFILE_H
