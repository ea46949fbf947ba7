#include "Expected.h"

#include <array>
#include <cinttypes>
#include <cstdio>
#include <fstream>

namespace fpnavi_test {

std::string ExpectedLine(const std::string& set, const Counts& counts, uint64_t hash) {
    std::array<char, 256> text{};
    std::snprintf(text.data(), text.size(),
                  "%s gestures %" PRId64 " pairs %" PRId64 " calibrations %" PRId64
                  " log-lines %" PRId64 " hash %016" PRIx64,
                  set.c_str(), counts.gestures, counts.pairs, counts.calibrations, counts.logLines,
                  hash);
    return text.data();
}

std::optional<std::string> ReadExpected(const std::string& path, const std::string& set) {
    std::ifstream file(path);
    for (std::string line; std::getline(file, line);) {
        if (line.rfind(set + " ", 0) == 0)
            return line;
    }
    return std::nullopt;
}

}  // namespace fpnavi_test
