// Works through N pairs of a file and nothing else, for counting instructions: what "pairs" takes
// more than "firsts" are N calls of OrientationCalc on a second frame.
//
//   pair_driver plain|shipped pairs|firsts N FILE
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "FramePairs.h"
#include "Sides.h"

namespace {

template <class Side>
int32_t Work(const bench::PairSet& set, size_t count, bool withSecond) {
    int32_t failed = 0;
    Side::SetNaviParam(set.params);
    for (size_t i = 0; i < count; ++i) {
        const bench::FramePair& pair = set.pairs[i % set.pairs.size()];
        Side::FpNaviClear();
        Side::TakeRegisters(pair.first.reg24, pair.first.reg28);
        failed += Side::OrientationCalc(pair.first.image.data()) != 0 ? 1 : 0;
        if (!withSecond)
            continue;
        Side::TakeRegisters(pair.second.reg24, pair.second.reg28);
        failed += Side::OrientationCalc(pair.second.image.data()) != 0 ? 1 : 0;
    }
    Side::FpNaviClear();
    return failed;
}

}  // namespace

int main(int argc, char** argv) {
    bench::PairSet set;
    if (argc != 5) {
        std::fputs("usage: pair_driver plain|shipped pairs|firsts N FILE\n", stderr);
        return 2;
    }
    if (!bench::ReadPairs(argv[4], &set) || set.pairs.empty()) {
        std::fprintf(stderr, "pair_driver: %s is no file of pairs\n", argv[4]);
        return 3;
    }
    const bool plain = std::strcmp(argv[1], "plain") == 0;
    const bool withSecond = std::strcmp(argv[2], "pairs") == 0;
    const size_t count = static_cast<size_t>(std::atoi(argv[3]));
    const int32_t failed = plain ? Work<bench::Plain>(set, count, withSecond)
                                 : Work<bench::Shipped>(set, count, withSecond);
    return failed != 0 ? 1 : 0;
}
