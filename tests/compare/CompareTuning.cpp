// Random calibrations through the module and the reference model: equal call by call.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <vector>

#include "CompareRun.h"
#include "RandomGesture.h"
#include "Twin.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::SimRandom;

host::ParamBlock RandomTuneParams(SimRandom& random) {
    const Mode mode = random.Chance(5) ? Mode::Hg : Mode::Fp;
    host::ParamBlock params =
        random.Chance(60) ? VariedParams(random, mode) : HostileParams(random, mode);
    host::ParamValue(params, "iDCMode") = random.Chance(90) ? random.Below(2) : 2;
    if (random.Chance(20))
        host::ParamValue(params, "_NAVI_blk_selection_mode") = random.Range(-1, 4);
    if (random.Chance(30))
        host::ParamValue(params, "_NAVI_TimeOut_threshold") = random.Range(-1, 6);
    return params;
}

// Calls of one run: frames about one grey level, now and then another DC or a cleared gesture.
void RunCalls(SimRandom& random, Twin* twin) {
    const uint32_t gainMask = random.Chance(90) ? 0x00070707U : 0xFFFFFFFFU;
    const uint32_t gain20 = static_cast<uint32_t>(random.Next()) & gainMask;
    const uint32_t gain2C = static_cast<uint32_t>(random.Next()) & gainMask;
    const int32_t base = random.Range(0, 255);
    const int32_t spread = random.Chance(40) ? 2 : random.Range(1, 100);
    for (int32_t call = 0; call < random.Range(1, 8); ++call) {
        std::vector<uint8_t> image(size_t{1} << 20);
        const int32_t level = base + random.Range(-60, 60);
        std::generate_n(image.begin(), 4096, [&] {
            return static_cast<uint8_t>(std::clamp(level + random.Range(-spread, spread), 0, 255));
        });
        twin->Tune(image, gain20, gain2C);
        if (random.Chance(10))
            twin->SetDac(static_cast<uint32_t>(random.Next()));
        if (random.Chance(10))
            twin->Clear();
    }
}

// Tuning runs with gestures between them.
TEST(CompareTuning, RunsOfAllModes) {
    Twin& twin = Twin::Get();
    const int64_t count = Gestures(5);
    for (int64_t i = 0; i < count; ++i) {
        SimRandom random(SeedOf(51, i));
        const host::ParamBlock params = RandomTuneParams(random);
        twin.SetParam(&params);
        if (!Twin::ImageFits())
            continue;
        twin.SetDac(static_cast<uint32_t>(random.Next()));
        RunCalls(random, &twin);
        ASSERT_FALSE(twin.Difference()) << *twin.Difference() << " of run " << i;
    }
}

// Block sizes and counts of either sign whose products are those of a small image. The frame is no
// larger than the sides say.
TEST(CompareTuning, BlockFactorsOfAnySign) {
    Twin& twin = Twin::Get();
    for (uint32_t signs = 0; signs < 16; ++signs) {
        for (const int32_t height : {9, 5}) {  // 5 * 4 * 56 divides by 16, 5 * 3 * 56 does not
            for (const int32_t rows : {4, 3}) {
                host::ParamBlock params = host::ParamsForMode(Mode::Fp, false);
                const auto set = [&](const char* name, int32_t value, uint32_t sign) {
                    host::ParamValue(params, name) = (signs >> sign & 1U) != 0 ? -value : value;
                };
                set("s_blockWidthFp", 8, 0);
                set("s_blockColNumFp", 7, 1);
                set("s_blockHeightFp", height, 2);
                set("s_blockRowNumFp", rows, 3);
                twin.SetParam(&params);
                const bool image = signs == 0;
                const std::vector<uint8_t> frame(image ? 8 * 7 * 9 * 4 : 1, 230);
                twin.SetDac(200);
                twin.Tune(frame, 0x00020700U, 0x00000102U);
                twin.Tune(frame, 0x00020700U, 0x00000102U);
                ASSERT_FALSE(twin.Difference()) << *twin.Difference() << ", signs " << signs;
            }
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
