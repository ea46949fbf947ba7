// Whole files into memory, with errors that say why.
#include "common/Files.h"

#include <fcntl.h>
#include <poll.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cerrno>
#include <cstring>

#include "common/Error.h"

namespace host {

namespace {

// A file that a reader holds in memory. A raw dump of this size has half a million frames.
constexpr size_t kFileSizeMax = size_t{1} << 30;

// A descriptor that is closed at its end.
struct OpenFile {
    explicit OpenFile(const std::string& path)
        // Without O_NONBLOCK, opening a pipe waits for a writer, which may never come.
        : descriptor(open(path.c_str(), O_RDONLY | O_NONBLOCK | O_CLOEXEC)) {}
    ~OpenFile() {
        if (descriptor >= 0)
            close(descriptor);
    }
    OpenFile(const OpenFile&) = delete;
    OpenFile& operator=(const OpenFile&) = delete;

    const int descriptor;
};

// True for a pipe. Devices may never end, so they are refused as everything else is.
bool CheckKind(int descriptor, const std::string& path) {
    struct stat status {};
    if (fstat(descriptor, &status) != 0)
        throw Error(path, "", std::string("cannot be read: ") + std::strerror(errno));
    if (S_ISDIR(status.st_mode))
        throw Error(path, "", "is a directory, expected a file");
    if (!S_ISREG(status.st_mode) && !S_ISFIFO(status.st_mode))
        throw Error(path, "", "is a device, expected a file");
    return S_ISFIFO(status.st_mode);
}

// The next bytes into part; 0 at the end. Waits for the writer of a pipe.
size_t ReadPart(int descriptor, std::vector<uint8_t>& part, const std::string& place,
                const std::string& path) {
    for (;;) {
        const ssize_t got = read(descriptor, part.data(), part.size());
        if (got >= 0)
            return static_cast<size_t>(got);
        pollfd waited = {descriptor, POLLIN, 0};
        const bool again = errno == EINTR || (errno == EAGAIN && poll(&waited, 1, -1) >= 0);
        if (!again && errno != EINTR)
            throw Error(path, place, std::string("cannot be read: ") + std::strerror(errno));
    }
}

}  // namespace

std::vector<uint8_t> ReadWholeFile(const std::string& path) {
    const OpenFile file(path);
    if (file.descriptor < 0)
        throw Error(path, "", std::string("cannot be opened: ") + std::strerror(errno));
    const bool isPipe = CheckKind(file.descriptor, path);
    std::vector<uint8_t> content;
    std::vector<uint8_t> part(64 * 1024);
    for (;;) {
        const std::string place = "byte " + std::to_string(content.size());
        const size_t got = ReadPart(file.descriptor, part, place, path);
        if (got == 0)
            break;
        if (content.size() + got > kFileSizeMax)
            throw Error(
                path, place,
                "the file goes on, expected at most " + std::to_string(kFileSizeMax) + " bytes");
        content.insert(content.end(), part.begin(),
                       part.begin() + static_cast<std::ptrdiff_t>(got));
    }
    if (isPipe && content.empty())
        throw Error(path, "", "is a pipe that nobody writes to, expected a file");
    return content;
}

}  // namespace host
