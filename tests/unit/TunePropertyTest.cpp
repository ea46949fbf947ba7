// What holds of every tuning run: registers keep their form, the call limit is kept, and which
// sensors it ends for without a limit.
#include <gtest/gtest.h>
#include <rapidcheck/gtest.h>

#include <algorithm>
#include <array>
#include <functional>
#include <vector>

#include "TuneTestSupport.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

// Grey that a sensor shows at each DC, the same all over the frame.
using Response = std::array<uint8_t, 256>;

// Straight through grey 180 at DC centre, slope in hundredths of a grey per DC.
Response Straight(int32_t centre, int32_t slope) {
    Response response{};
    for (int32_t dc = 0; dc < 256; ++dc) {
        const int32_t grey = 180 + (dc - centre) * slope / 100;
        response[static_cast<size_t>(dc)] = static_cast<uint8_t>(std::clamp(grey, 0, 255));
    }
    return response;
}

Response Step(int32_t from) {
    Response response{};
    std::fill(response.begin() + from, response.end(), uint8_t{255});
    return response;
}

// Flat frames, built once.
const std::vector<uint8_t>& FlatOf(uint8_t grey) {
    static const std::array<std::vector<uint8_t>, 256> frames = [] {
        std::array<std::vector<uint8_t>, 256> all;
        for (size_t i = 0; i < all.size(); ++i)
            all[i] = Flat(static_cast<uint8_t>(i));
        return all;
    }();
    return frames[grey];
}

// Calls until the run is complete, layout 1; 0 when bound calls were not enough. A frame in the
// band comes first, so that the run begins without history.
int32_t CallsOfRun(const Response& response, uint32_t start, int32_t bound, uint32_t* end) {
    Registers registers;
    registers.dac = 192;
    registers.Tune(FlatOf(180));
    registers.dac = start;
    int32_t calls = 0;
    bool complete = false;
    while (!complete && calls < bound) {
        ++calls;
        complete = registers.Tune(FlatOf(response[registers.dac & 0xFF])) == 1;
    }
    *end = registers.dac & 0xFF;
    return complete ? calls : 0;
}

bool InBand(uint8_t grey) {
    return grey >= 140 && grey <= 220;
}

class TuneProperty : public AfterARun {};

RC_GTEST_FIXTURE_PROP(TuneProperty, UpperBitsOfLayout1AreKept, ()) {
    Params().Set("_NAVI_TimeOut_threshold", *rc::gen::inRange(0, 4)).Apply();
    Registers registers;
    registers.dac = *rc::gen::arbitrary<uint32_t>();
    const uint32_t upper = registers.dac & ~0xFFU;
    for (int32_t call = 0; call < 8; ++call) {
        registers.Tune(FlatOf(*rc::gen::arbitrary<uint8_t>()));
        RC_ASSERT((registers.dac & ~0xFFU) == upper);
        RC_ASSERT((registers.dac & 0xFFU) >= 128U);
        RC_ASSERT((registers.dac & 0xFFU) == _NAVI_dc_current);
    }
}

RC_GTEST_FIXTURE_PROP(TuneProperty, BothDifferencesOfLayout0AreTheDcFromAnyStart, ()) {
    Params().Set("iDCMode", 0).Set("_NAVI_TimeOut_threshold", *rc::gen::inRange(0, 4)).Apply();
    Registers registers;
    registers.dac = *rc::gen::arbitrary<uint32_t>();
    for (int32_t call = 0; call < 8; ++call) {
        registers.Tune(FlatOf(*rc::gen::arbitrary<uint8_t>()));
        RC_ASSERT(_NAVI_dc_current >= 128U && _NAVI_dc_current <= 255U);
        RC_ASSERT(registers.dac == DifferenceRegister(_NAVI_dc_current));
        const uint32_t dac = registers.dac;
        RC_ASSERT(((dac >> 8) & 0xFF) - (dac & 0xFF) == _NAVI_dc_current);
        RC_ASSERT((dac >> 24) - ((dac >> 16) & 0xFF) == _NAVI_dc_current);
    }
}

RC_GTEST_FIXTURE_PROP(TuneProperty, RunsEndWithinTheLimitOrTwoCalls, ()) {
    // At most one call of a run is a reset: it writes a DC that is not below the reference.
    const int32_t threshold = *rc::gen::inRange(1, 21);
    Params()
        .Set("_NAVI_TimeOut_threshold", threshold)
        .Set("_NAVI_DC_REF", *rc::gen::inRange(0, 256))
        .Set("iDCMode", *rc::gen::inRange(0, 2))
        .Apply();
    Registers registers;
    registers.dac = *rc::gen::arbitrary<uint32_t>();
    int32_t calls = 0;
    int32_t result = 0;
    while (result == 0 && calls < 30) {
        ++calls;
        result = registers.Tune(FlatOf(*rc::gen::arbitrary<uint8_t>()));
    }
    RC_ASSERT(result == 1);
    RC_ASSERT(calls <= std::max(threshold, 2));
}

class TuneWithoutLimit : public AfterARun {
  protected:
    void SetUp() override {
        AfterARun::SetUp();
        Params().Set("_NAVI_TimeOut_threshold", 0).Apply();
    }
};

// A step of |180 - mean| / 3.74 cannot cross the band [140, 220] when the grey rises by no more
// than 3.74 per DC. So the mean stays on its side until it is in the band; outside the band each
// step is at least 100 * 41 / 374 = 10. The 128 values of the DC take 13 such steps, and one call
// more finds the limit: 14.
RC_GTEST_FIXTURE_PROP(TuneWithoutLimit, EndsWhenTheGreyRisesByNoMoreThanTheGainFactor, ()) {
    Response response{};
    int32_t grey = *rc::gen::inRange(-200, 256);
    for (uint8_t& level : response) {
        level = static_cast<uint8_t>(std::clamp(grey, 0, 255));
        grey += *rc::gen::inRange(0, 4);
    }
    uint32_t end = 0;
    const auto start = static_cast<uint32_t>(*rc::gen::inRange(128, 256));
    const int32_t calls = CallsOfRun(response, start, 200, &end);
    RC_ASSERT(calls > 0 && calls <= 14);
    RC_ASSERT(InBand(response[end]) || (end == 255 && response[end] < 140) ||
              (end == 128 && response[end] > 220));
}

// A sensor that answers the wrong way is driven to a limit and stays there.
RC_GTEST_FIXTURE_PROP(TuneWithoutLimit, EndsWhenTheGreyFallsWithTheDc, ()) {
    Response response{};
    int32_t grey = *rc::gen::inRange(0, 456);
    for (uint8_t& level : response) {
        level = static_cast<uint8_t>(std::clamp(grey, 0, 255));
        grey -= *rc::gen::inRange(0, 12);
    }
    uint32_t end = 0;
    const auto start = static_cast<uint32_t>(*rc::gen::inRange(128, 256));
    const int32_t calls = CallsOfRun(response, start, 200, &end);
    RC_ASSERT(calls > 0 && calls <= 14);
    RC_ASSERT(InBand(response[end]) || end == 255 || end == 128);
}

// Twice the gain factor is the end of what is safe: a step then lands as far beyond 180 as the
// mean was before it, or less.
TEST_F(TuneWithoutLimit, EndsForEveryStraightResponseUpToTwiceTheGainFactor) {
    for (int32_t slope = 1; slope <= 748; slope += 9) {
        for (int32_t centre = 100; centre <= 280; centre += 7) {
            const Response response = Straight(centre, slope);
            for (uint32_t start = 128; start <= 255; start += 5) {
                uint32_t end = 0;
                ASSERT_GT(CallsOfRun(response, start, 200, &end), 0)
                    << slope << " " << centre << " " << start;
            }
        }
    }
}

// 100 * 50 / 374 = 13 steps either way: from 130 at DC 167 up to 230 at DC 180 and back, over a
// band that lies between them.
TEST_F(TuneWithoutLimit, GoesRoundForEverWhenAStepCrossesTheBand) {
    const Response response = Straight(174, 770);  // 180 - 53 at 167, 180 + 46 at 180
    Response round = response;
    round[167] = 130;
    round[180] = 230;
    ASSERT_TRUE(std::is_sorted(round.begin(), round.end()));
    ASSERT_TRUE(std::any_of(round.begin(), round.end(), InBand));
    Registers registers;
    registers.dac = 180;
    for (int32_t lap = 0; lap < 500; ++lap) {
        ASSERT_EQ(registers.Tune(FlatOf(round[registers.dac])), 0);
        ASSERT_EQ(registers.dac, 167U);
        ASSERT_EQ(registers.Tune(FlatOf(round[registers.dac])), 0);
        ASSERT_EQ(registers.dac, 180U);
    }
    EXPECT_EQ(_NAVI_TimeOut, 1000);
}

// A comparator: black below DC 165, white from there on. Steps of 48 up (18000 / 374) and 20 down
// (7500 / 374), then, while the image flips, halves: (178 + 158) / 2, (158 + 168) / 2,
// (168 + 163) / 2, (163 + 165) / 2, and from 164 back to its neighbour for ever.
TEST_F(TuneWithoutLimit, GoesToAndFroOverABareStep) {
    const Response response = Step(165);
    Registers registers;
    registers.dac = 150;
    for (const uint32_t dc : {150U, 198U, 178U, 158U, 168U, 163U, 165U, 164U}) {
        ASSERT_EQ(registers.dac, dc);
        ASSERT_EQ(registers.Tune(FlatOf(response[dc])), 0);
    }
    for (int32_t lap = 0; lap < 500; ++lap) {
        ASSERT_EQ(registers.dac, 165U);
        ASSERT_EQ(registers.Tune(FlatOf(response[165])), 0);
        ASSERT_EQ(registers.dac, 164U);
        ASSERT_EQ(registers.Tune(FlatOf(response[164])), 0);
    }
    EXPECT_EQ(_NAVI_TimeOut, 1008);
}

}  // namespace
