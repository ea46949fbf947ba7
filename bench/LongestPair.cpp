// How long the longest frame pairs take that the limits of a pair's work accept: the no-move test
// and the match, each with parameters just below the limit and frames that stop neither early.
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <initializer_list>
#include <string_view>
#include <utility>
#include <vector>

#include "FpNavi.h"
#include "parameters/ParamTable.h"

namespace {

using Changes = std::initializer_list<std::pair<std::string_view, int32_t>>;

constexpr int32_t kRounds = 5;

void SetParams(int32_t side, Changes changes) {
    host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    for (const std::string_view name : {"s_blockWidthFp", "s_blockHeightFp"})
        host::ParamValue(params, name) = side;
    for (const std::string_view name : {"s_blockColNumFp", "s_blockRowNumFp"})
        host::ParamValue(params, name) = 1;
    host::ParamValue(params, "s_multiBloclkFlag") = 0;
    for (const auto& [name, value] : changes)
        host::ParamValue(params, name) = value;
    SetNaviParam(params.data());
}

// Black and white, by the bits of an endless sequence.
std::vector<uint8_t> Checks(int32_t side, uint64_t seed) {
    std::vector<uint8_t> image(static_cast<size_t>(side) * static_cast<size_t>(side));
    for (uint8_t& pixel : image) {
        seed ^= seed << 13;
        seed ^= seed >> 7;
        seed ^= seed << 17;
        pixel = static_cast<uint8_t>(seed % 2 * 100);
    }
    return image;
}

void Time(const char* what, int32_t side) {
    const std::vector<uint8_t> first = Checks(side, 1);
    const std::vector<uint8_t> second = Checks(side, 2);
    double least = 1e9;
    int32_t result = 0;
    for (int32_t n = 0; n < kRounds; ++n) {
        FpNaviClear();
        OrientationCalc(first.data(), first.data(), 0);
        const auto start = std::chrono::steady_clock::now();
        result = OrientationCalc(second.data(), second.data(), 0);
        const std::chrono::duration<double, std::milli> time =
            std::chrono::steady_clock::now() - start;
        least = time.count() < least ? time.count() : least;
    }
    std::printf("%s: %.1f ms%s\n", what, least, result == 0 ? "" : ", refused");
}

}  // namespace

int main() {
    // 225 shifts of 2^20 pixels, none with enough common area, so that each is summed up in full.
    SetParams(1024, {{"s_smallMoveTolRow", 7},
                     {"s_smallMoveTolCol", 7},
                     {"s_candidateNum", 1},
                     {"s_centerWidth", 0},
                     {"s_centerHeight", 0},
                     {"s_overlapAreaMinNoMove", INT32_MAX},
                     {"s_diffThresholdTol", 255}});
    Time("no-move test, 1024 x 1024 pixels, 225 shifts", 1024);
    SetParams(256, {{"s_smallMoveTolRow", 0},
                    {"s_smallMoveTolCol", 0},
                    {"s_candidateNum", 4000},
                    {"s_centerWidth", 140},
                    {"s_centerHeight", 140},
                    {"s_templateWidth", 2},
                    {"s_templateHeight", 2},
                    {"s_diffThresholdTol", 1}});
    Time("match, 256 x 256 pixels, 4000 candidates", 256);
    return 0;
}
