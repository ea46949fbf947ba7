// Frames, parameters and gain codes that _NAVI_Tune cannot measure with: it reads outside of
// nothing and steps on what the call before has found.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "LogCapture.h"
#include "TuneTestSupport.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

// A frame that cannot be measured leaves a mean of 0 and everything else of the measurement as it
// was; the step is taken on the former flags.
class UnusableFrame : public AfterARun {
  protected:
    void SetUp() override {
        AfterARun::SetUp();
        m_registers.dac = 220;
        m_registers.Tune(Flat(230));
        m_before = Measurement();
        m_registers.dac = 200;
    }
    static std::vector<uint32_t> Measurement() {
        std::vector<uint32_t> values = {_NAVI_top_mean,
                                        _NAVI_G20C,
                                        _NAVI_K_value,
                                        static_cast<uint32_t>(_NAVI_flag_recommend),
                                        static_cast<uint32_t>(_NAVI_flag_recommend_top),
                                        static_cast<uint32_t>(_NAVI_flag_effective),
                                        static_cast<uint32_t>(_NAVI_flag_non_linear)};
        values.insert(values.end(), _NAVI_img_histogram, _NAVI_img_histogram + 256);
        return values;
    }
    // The former frame was too bright, so the DC falls; a mean of 0 says 18000 / 374 = 48.
    void ExpectUnusable(int32_t lines, const std::vector<uint8_t>& frame = Flat(180)) {
        LogCapture log;
        EXPECT_EQ(m_registers.Tune(frame), 1) << "the second call of the run";
        EXPECT_EQ(_NAVI_mean, 0U);
        EXPECT_EQ(Measurement(), m_before);
        EXPECT_EQ(m_registers.dac, 152U);
        EXPECT_EQ(log.Lines().size(), static_cast<size_t>(lines));
    }

    Registers m_registers;
    std::vector<uint32_t> m_before;
};

TEST_F(UnusableFrame, WrongSizeIsLoggedAndSteppedOnTheFormerFlags) {
    Params().Set("s_blockWidthFp", 5).Set("s_blockHeightFp", 3).Apply();
    ASSERT_NE(s_imageWidth * s_imageHeight % 16, 0);
    ExpectUnusable(1);
}

TEST_F(UnusableFrame, WrongSizeIsLoggedWithABadGainCodeToo) {
    Params().Set("s_blockWidthFp", 5).Set("s_blockHeightFp", 3).Apply();
    ASSERT_NE(s_imageWidth * s_imageHeight % 16, 0);
    m_registers.gain2C = 0x00000808U;
    ExpectUnusable(1);
}

TEST_F(UnusableFrame, GainField0Above7) {
    m_registers.gain2C = 0x00000108U;
    ExpectUnusable(0);
}

TEST_F(UnusableFrame, GainField1Above7) {
    m_registers.gain2C = 0x00000F02U;
    ExpectUnusable(0);
}

TEST_F(UnusableFrame, GainField3Above7) {
    m_registers.gain20 = 0x00080700U;
    ExpectUnusable(0);
}

TEST_F(UnusableFrame, GainField2TakesNoPart) {
    m_registers.gain20 = 0x00020F00U;
    m_registers.Tune(Flat(180));
    EXPECT_EQ(_NAVI_mean, 180U);
    EXPECT_EQ(_NAVI_G20C, 0x2F12U);
}

TEST_F(UnusableFrame, ReferenceGainFieldsAbove7) {
    for (const int32_t code : {0x2718, 0x2792, 0xF712, -1}) {
        SetUp();
        Params().Set("_NAVI_GAIN_REF", code).Apply();
        ExpectUnusable(0);
    }
}

TEST_F(UnusableFrame, SelectionModeOutside0To3) {
    for (const int32_t rank :
         {-1, 4, std::numeric_limits<int32_t>::min(), std::numeric_limits<int32_t>::max()}) {
        SetUp();
        Params().Set("_NAVI_blk_selection_mode", rank).Apply();
        ExpectUnusable(0);
    }
}

TEST_F(UnusableFrame, WidthOrHeightBelow1) {
    for (const char* side : {"s_blockWidthFp", "s_blockHeightFp"}) {
        for (const int32_t pixels : {0, -16}) {
            SetUp();
            Params().Set(side, pixels).Apply();
            ExpectUnusable(0);
        }
    }
}

// Two factors below 0 make a side above 0. No buffer has that size: the frame here is one byte.
TEST_F(UnusableFrame, TwoNegativeBlockFactorsAreNoImage) {
    const std::vector<uint8_t> oneByte(1, 180);
    const auto expectUnusable = [&](const Params& params) {
        SetUp();
        params.Apply();
        ASSERT_EQ(s_imageWidth, 56);
        ASSERT_EQ(s_imageHeight, 36);
        ExpectUnusable(0, oneByte);
    };
    const Params width = Params().Set("s_blockWidthFp", -8).Set("s_blockColNumFp", -7);
    const Params height = Params().Set("s_blockHeightFp", -9).Set("s_blockRowNumFp", -4);
    expectUnusable(width);
    expectUnusable(height);
    expectUnusable(Params(width).Set("s_blockHeightFp", -9).Set("s_blockRowNumFp", -4));
}

TEST_F(UnusableFrame, WrongSizeOfNegativeBlockFactorsIsLogged) {
    Params().Set("s_blockWidthFp", -5).Set("s_blockColNumFp", -7).Set("s_blockHeightFp", 3).Apply();
    ASSERT_NE(s_imageWidth * s_imageHeight % 16, 0);
    ExpectUnusable(1, std::vector<uint8_t>(1, 180));
}

TEST_F(UnusableFrame, SideOfPositiveFactorsThatWrapsBelow1) {
    // 65536 * 32768 = 2^31, 65536 * 65536 = 2^32: -2^31 and 0 pixels.
    for (const int32_t count : {32768, 65536}) {
        SetUp();
        Params().Set("s_blockWidthFp", 65536).Set("s_blockColNumFp", count).Apply();
        ExpectUnusable(0);
        SetUp();
        Params().Set("s_blockHeightFp", 65536).Set("s_blockRowNumFp", count).Apply();
        ExpectUnusable(0);
    }
}

TEST_F(UnusableFrame, MorePixelsThan32BitsCount) {
    // 65536 * 65536 = 2^32 wraps to 0, a multiple of 16.
    Params()
        .Set("s_blockWidthFp", 65536)
        .Set("s_blockColNumFp", 1)
        .Set("s_blockHeightFp", 65536)
        .Set("s_blockRowNumFp", 1)
        .Apply();
    ExpectUnusable(0);
}

TEST_F(UnusableFrame, LowDcIsResetBeforeAnythingIsLookedAt) {
    Params().Set("_NAVI_blk_selection_mode", 9).Set("s_blockWidthFp", 0).Apply();
    m_registers.gain20 = 0xFFFFFFFFU;
    m_registers.dac = 5;
    EXPECT_EQ(m_registers.Tune(Flat(180)), 0);
    EXPECT_EQ(m_registers.dac, 191U);
    EXPECT_EQ(_NAVI_mean, 230U) << "no measurement was tried";
}

}  // namespace
