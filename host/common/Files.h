// Reading whole files and little-endian numbers, for the importers.
#ifndef FPNAVI_HOST_FILES_H
#define FPNAVI_HOST_FILES_H

#include <cstdint>
#include <string>
#include <vector>

namespace host {

// The content of a file of at most 1 GiB, or of a pipe that has a writer. Error for one that cannot
// be read, and for directories, devices and pipes without a writer, which are not waited for.
std::vector<uint8_t> ReadWholeFile(const std::string& path);

// Little-endian numbers at bytes; the caller has checked that they are there.
inline uint16_t ReadLe16(const uint8_t* bytes) {
    return static_cast<uint16_t>(bytes[0] | (bytes[1] << 8));
}

inline uint32_t ReadLe32(const uint8_t* bytes) {
    return ReadLe16(bytes) | (static_cast<uint32_t>(ReadLe16(bytes + 2)) << 16);
}

}  // namespace host

#endif  // FPNAVI_HOST_FILES_H
