// What the tests of the tuning share: frames with given corners, one call of _NAVI_Tune, a
// snapshot of the tuning's state, and a fixture that starts each test after a completed run.
#ifndef TESTS_UNIT_TUNETESTSUPPORT_H
#define TESTS_UNIT_TUNETESTSUPPORT_H

#include <array>
#include <cstdint>
#include <vector>

#include "Fixtures.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "tuning/Tune.h"
#include "tuning/TuneRegisters.h"

namespace fpnavi_test {

// Register values of the reference gain code 0x2712: fields 2, 7 and 1, 2.
inline constexpr uint32_t kRefGain20 = 0x00020700U;
inline constexpr uint32_t kRefGain2C = 0x00000102U;

// A 56 x 36 frame: corner blocks of 14 x 9 pixels in these greys, any other grey between them.
struct Corners {
    uint8_t topLeft;
    uint8_t topRight;
    uint8_t bottomLeft;
    uint8_t bottomRight;
};

inline std::vector<uint8_t> CornerFrame(const Corners& corners, uint8_t between = 77) {
    return TestFrame(56, 36, between)
        .Paint(0, 0, 9, 14, corners.topLeft)
        .Paint(0, 42, 9, 14, corners.topRight)
        .Paint(27, 0, 9, 14, corners.bottomLeft)
        .Paint(27, 42, 9, 14, corners.bottomRight)
        .Greys();
}

// All corners in one grey: mean and top grey are that grey.
inline std::vector<uint8_t> Flat(uint8_t grey) {
    return CornerFrame({grey, grey, grey, grey});
}

// Corners whose 126 pixels hold `bright` of 255 and else grey.
inline std::vector<uint8_t> FlatWithBright(uint8_t grey, int32_t bright) {
    TestFrame frame(56, 36, grey);
    for (int32_t i = 0; i < bright; ++i) {
        for (const int32_t row : {0, 27}) {
            for (const int32_t column : {0, 42})
                frame.Grey(row + i / 14, column + i % 14) = 255;
        }
    }
    return frame.Greys();
}

// The sensor's registers as a test holds them.
struct Registers {
    uint32_t dac = 0;
    uint32_t gain20 = kRefGain20;
    uint32_t gain2C = kRefGain2C;

    int32_t Tune(const std::vector<uint8_t>& frame) {
        return _NAVI_Tune(frame.data(), 56, 36, &dac, &gain20, &gain2C);
    }
};

// Layout 0 of a DC value, byte by byte from the top: 255, 255 - DC, 255, 255 - DC.
inline uint32_t DifferenceRegister(uint32_t dc) {
    const uint32_t low = 255 - dc;
    return 0xFF000000U | (low << 16) | 0xFF00U | low;
}

// What the tuning carries from call to call, without s_tuneOkFlag.
inline std::vector<uint32_t> TuneState() {
    using namespace fpnavi;
    const auto u = [](int32_t value) { return static_cast<uint32_t>(value); };
    std::vector<uint32_t> state = {_NAVI_dc_mode,
                                   _NAVI_dc_residual,
                                   _NAVI_dc_pre,
                                   _NAVI_dc_current,
                                   _NAVI_mean,
                                   _NAVI_top_mean,
                                   _NAVI_G20C,
                                   _NAVI_K_value,
                                   _NAVI_delta_dc_val_top,
                                   _NAVI_delta_dc_val_mean,
                                   _NAVI_delta_dc_val,
                                   _NAVI_NoMoreProcess,
                                   u(_NAVI_delta_dc_orient),
                                   u(_NAVI_flag_recommend_top),
                                   u(_NAVI_flag_recommend),
                                   u(_NAVI_flag_recommend_pre),
                                   u(_NAVI_flag_effective),
                                   u(_NAVI_flag_non_linear),
                                   u(_NAVI_flag_param_reset),
                                   u(_NAVI_TimeOut),
                                   u(sImgSizeInfo.iHeight),
                                   u(sImgSizeInfo.iWidth)};
    state.insert(state.end(), _NAVI_img_histogram, _NAVI_img_histogram + 256);
    return state;
}

// Starts every test as after a run that ended with the mean in its band, DC 192 in the sensor and
// no history, whatever ran before in this process; the parameters are the defaults.
class AfterARun : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Settle();
        Params().Apply();
    }
    void TearDown() override {
        Params().Apply();
        NaviTest::TearDown();
    }
    // With a limit of 1 every measured call completes: the first ends a run that an earlier test
    // has left open, the second finds the reset pending.
    static void Settle() {
        Params().Set("_NAVI_TimeOut_threshold", 1).Apply();
        Registers registers;
        registers.dac = 192;
        registers.Tune(Flat(180));
        registers.Tune(Flat(180));
    }
};

// Holds before the first measurement of the process only; skipped after it. ctest runs each test
// in a process of its own.
class FreshTune : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        if (fpnavi::_NAVI_flag_effective != 3 || fpnavi::_NAVI_flag_recommend_pre != 3)
            GTEST_SKIP() << "the tuning has run in this process";
    }
};

}  // namespace fpnavi_test

#endif  // TESTS_UNIT_TUNETESTSUPPORT_H
