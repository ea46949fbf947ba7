// Writes a file of frame pairs for pair_driver and heap_peak.
//
//   pair_frames moved|still|hg|ds COUNT FILE
#include <cstdio>
#include <cstdlib>
#include <string>

#include "FramePairs.h"

namespace {

bool ParseKind(const std::string& name, bench::PairKind* kind) {
    const char* const names[] = {"moved", "still", "hg", "ds"};
    for (int32_t i = 0; i < 4; ++i) {
        if (name == names[i]) {
            *kind = static_cast<bench::PairKind>(i);
            return true;
        }
    }
    return false;
}

}  // namespace

int main(int argc, char** argv) {
    bench::PairKind kind = bench::PairKind::Moved;
    if (argc != 4 || !ParseKind(argv[1], &kind) || std::atoi(argv[2]) < 1) {
        std::fputs("usage: pair_frames moved|still|hg|ds COUNT FILE\n", stderr);
        return 2;
    }
    if (!bench::WritePairs(argv[3], bench::MakePairs(kind, std::atoi(argv[2])))) {
        std::fprintf(stderr, "pair_frames: cannot write %s\n", argv[3]);
        return 3;
    }
    return 0;
}
