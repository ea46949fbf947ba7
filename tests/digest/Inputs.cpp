// The groups, their shares and their order.
#include "Inputs.h"

#include <algorithm>

#include "simulator/Arithmetic.h"

namespace fpnavi_test {
namespace {

using host::Mode;

struct Group {
    const char* name;
    void (*run)(HashedCalls& calls, Mode mode, uint64_t seed);
    Mode mode;
    int32_t share;  // of all gestures, in percent
};

constexpr Group kGroups[] = {
    {"simulated fp", RunSimulated, Mode::Fp, 12},
    {"simulated hg", RunSimulated, Mode::Hg, 8},
    {"varied fp", RunVaried, Mode::Fp, 10},
    {"varied hg", RunVaried, Mode::Hg, 7},
    {"other geometry fp", RunOtherGeometry, Mode::Fp, 14},
    {"other geometry hg", RunOtherGeometry, Mode::Hg, 5},
    {"hostile fp", RunHostile, Mode::Fp, 6},
    {"hostile hg", RunHostile, Mode::Hg, 4},
    {"front end", CalibrateFrontEnd, Mode::Fp, 25},
    {"random calibration fp", CalibrateAtRandom, Mode::Fp, 23},
    {"random calibration hg", CalibrateAtRandom, Mode::Hg, 2},
    {"simulated double scan", RunSimulated, Mode::DoubleScan, 10},
    {"varied double scan", RunVaried, Mode::DoubleScan, 8},
    {"other geometry double scan", RunOtherGeometry, Mode::DoubleScan, 6},
    {"hostile double scan", RunHostile, Mode::DoubleScan, 4},
    {"varied fp, double scan still on", RunVaried, Mode::Fp, 3},
    {"varied hg, double scan still on", RunVaried, Mode::Hg, 3},
};

}  // namespace

void RunAll(HashedCalls& calls, int64_t gestures, const Progress& progress) {
    uint64_t number = 0;
    for (const Group& group : kGroups) {
        const uint64_t seed = host::Mix64(++number);
        const int64_t count = std::max<int64_t>(gestures * group.share / 100, 1);
        for (int64_t i = 0; i < count; ++i) {
            group.run(calls, group.mode, seed + static_cast<uint64_t>(i));
            progress(group.name, i);
        }
    }
}

}  // namespace fpnavi_test
