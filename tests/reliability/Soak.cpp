// Millions of short gestures of all modes in one process: after each FpNaviClear as many frees as
// allocations, and never more of them alive than in the first gestures.
//
//   soak GESTURES
//
// fp and hg take turns; double scan joins them for the second half, because it stays on.
#include <unistd.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "FailingMalloc.h"
#include "SmallGesture.h"
#include "gesture/Gesture.h"

namespace {

using fpnavi_test::FailingMalloc;
using fpnavi_test::SmallGesture;
using host::Mode;

constexpr int32_t kSide = 8;            // pixels
constexpr int32_t kFrames = 3;          // with a finger; one without follows
constexpr int32_t kVariants = 8;        // of skin for each mode and layout
constexpr int64_t kFirstGestures = 64;  // of each half; they set the peak: each variant once
constexpr int64_t kWarm = 500;          // gestures before the first look at the memory in use

struct Tally {
    int64_t pairs = 0;
    int64_t keys = 0;
    int64_t allocations = 0;
    int32_t peak = 0;  // buffers alive after a call
};

// Kibibytes of memory in use by the process; 0 when the system does not tell.
long ResidentSize() {
    long total = 0;
    long resident = 0;
    std::FILE* const file = std::fopen("/proc/self/statm", "r");
    if (file != nullptr) {
        if (std::fscanf(file, "%ld %ld", &total, &resident) != 2)
            resident = 0;
        std::fclose(file);
    }
    return resident * (sysconf(_SC_PAGESIZE) / 1024);
}

std::vector<SmallGesture> MakeGestures(const std::vector<Mode>& modes) {
    std::vector<SmallGesture> gestures;
    for (uint64_t seed = 1; seed <= kVariants; ++seed) {
        for (const bool multi : {true, false}) {
            for (const Mode mode : modes) {
                gestures.push_back(
                    fpnavi_test::MakeSmallGesture({mode, multi, kSide, kSide}, kFrames, seed));
                gestures.back().frames.emplace_back(kSide * kSide, uint8_t{255});
            }
        }
    }
    return gestures;
}

// One gesture; false when frees and allocations differ after it.
bool Run(const SmallGesture& gesture, int64_t index, Tally* tally) {
    uint8_t image[kSide * kSide];
    ::SetNaviParam(gesture.params.data());
    FailingMalloc::Count();
    for (size_t frame = 0; frame < gesture.frames.size(); ++frame) {
        const auto step = static_cast<int32_t>((index + static_cast<int64_t>(frame)) % 3);
        const bool last = frame + 1 == gesture.frames.size();
        ::GetDoubleScanNaviBlock(0, last ? 0 : fpnavi_test::ZoneRows(step));
        ::GetNaviBlock(gesture.frames[frame].data(), kSide, 0, image);
        ::OrientationCalc(image, image, 0);
        tally->peak = std::max(tally->peak, FailingMalloc::Live());
    }
    tally->pairs += fpnavi::s_voteInfo.calc_cnt;
    ::vmk_fp_navigation_detect_finger_status(image);
    tally->keys += ::Voting(index % 2 == 0 ? 1 : 0) > VKEY_NONE ? 1 : 0;
    ::FpNaviClear();
    FailingMalloc::Off();
    tally->allocations += FailingMalloc::Allocations();
    return FailingMalloc::Allocations() == FailingMalloc::Frees() && FailingMalloc::Live() == 0;
}

// Gestures number from to to - 1, taking turns; false after a leak or a rising peak.
bool RunAll(const std::vector<SmallGesture>& gestures, int64_t from, int64_t to, Tally* tally) {
    int32_t flat = 0;
    for (int64_t i = from; i < to; ++i) {
        if (!Run(gestures[static_cast<size_t>(i) % gestures.size()], i, tally)) {
            std::printf("gesture %lld: allocations and frees differ\n", static_cast<long long>(i));
            return false;
        }
        if (i - from == kFirstGestures)
            flat = tally->peak;
        if (i - from > kFirstGestures && tally->peak > flat) {
            std::printf("gesture %lld: %d buffers alive, %d before\n", static_cast<long long>(i),
                        tally->peak, flat);
            return false;
        }
    }
    return true;
}

}  // namespace

int main(int argc, char** argv) {
    const long long count = argc == 2 ? std::atoll(argv[1]) : 0;
    if (count < 1000) {
        std::fprintf(stderr, "usage: soak GESTURES   (1000 or more)\n");
        return 2;
    }
    const std::vector<SmallGesture> single = MakeGestures({Mode::Fp, Mode::Hg});
    const std::vector<SmallGesture> all = MakeGestures({Mode::Fp, Mode::Hg, Mode::DoubleScan});
    Tally tally;
    const bool warm = RunAll(single, 0, kWarm, &tally);
    const long start = ResidentSize();
    const bool flat =
        warm && RunAll(single, kWarm, count / 2, &tally) && RunAll(all, count / 2, count, &tally);
    std::printf(
        "%lld gestures, %lld pairs, %lld keys, %lld allocations, all freed; at most %d "
        "buffers alive; resident %ld KiB after the first %lld, %ld KiB at the end\n",
        count, static_cast<long long>(tally.pairs), static_cast<long long>(tally.keys),
        static_cast<long long>(tally.allocations), tally.peak, start, static_cast<long long>(kWarm),
        ResidentSize());
    return flat && tally.pairs > count && tally.keys > count / 100 ? 0 : 1;
}
