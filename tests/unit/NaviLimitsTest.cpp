// The rule for parameter blocks that no device has. SetNaviParam stores them all; the working calls
// answer -1.
#include <gtest/gtest.h>

#include <limits>
#include <vector>

#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr int32_t kMax = std::numeric_limits<int32_t>::max();

Params FpGeometry(int32_t blockWidth, int32_t blockHeight, int32_t columns, int32_t rows) {
    return Params()
        .Set("s_blockWidthFp", blockWidth)
        .Set("s_blockHeightFp", blockHeight)
        .Set("s_blockColNumFp", columns)
        .Set("s_blockRowNumFp", rows);
}

// Geometries that no call may work with.
std::vector<Params> BadImageGeometries() {
    return {FpGeometry(0, 2, 7, 18),     FpGeometry(8, 2, 0, 18),   FpGeometry(-8, 2, 7, 18),
            FpGeometry(-8, 2, -7, 18),   FpGeometry(8, -2, 7, -18), FpGeometry(4097, 1, 1, 1),
            FpGeometry(1, 1, 1, 4097),   FpGeometry(1, 241, 1, 17), FpGeometry(kMax, 1, kMax, 1),
            FpGeometry(1, kMax, 1, kMax)};
}

class NaviLimits : public NaviTest {
  protected:
    // Large enough for every image that a call could believe in.
    std::vector<uint8_t> m_image = std::vector<uint8_t>(1 << 16, 255);
};

TEST_F(NaviLimits, DefaultsAreUsableInBothGeometries) {
    for (const int32_t mode : {0, 1}) {
        Params().Set("s_modeFlag", mode).Apply();
        EXPECT_TRUE(ImageGeometryUsable());
        EXPECT_FALSE(ImageGeometryUnset());
        EXPECT_TRUE(HgDetectGeometryUsable());
        EXPECT_TRUE(GestureGeometryUsable());
        EXPECT_TRUE(PairWorkAcceptable());
    }
}

TEST_F(NaviLimits, ImageSidesMustLieIn1To4096) {
    for (const Params& params : BadImageGeometries()) {
        ASSERT_EQ(params.Apply(), 0) << "SetNaviParam stores anything";
        EXPECT_FALSE(ImageGeometryUsable());
        EXPECT_FALSE(GestureGeometryUsable());
    }
    FpGeometry(4096, 4096, 1, 1).Apply();
    EXPECT_TRUE(ImageGeometryUsable());
}

TEST_F(NaviLimits, OrientationCalcRefusesImpossibleImages) {
    for (const Params& params : BadImageGeometries()) {
        params.Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), -1);
        EXPECT_TRUE(IsEmpty(s_imageCurr));
    }
}

TEST_F(NaviLimits, FingerStatusRefusesImpossibleImagesAndLeavesTheGestureAlone) {
    if (s_doubleScanFlag == 1)
        GTEST_SKIP() << "the double scan of an earlier test decides, and looks at no image";
    for (const Params& params : BadImageGeometries()) {
        params.Apply();
        if (ImageGeometryUnset())
            continue;
        FingerBlkFake::Reset();
        EXPECT_EQ(vmk_fp_navigation_detect_finger_status(m_image.data()), -1);
        EXPECT_TRUE(FingerBlkFake::Calls().empty());
        EXPECT_EQ(Voting(0), -1) << "the gesture goes on";
    }
}

TEST_F(NaviLimits, CandidateNumberMustLieIn1To65536InTheFpModes) {
    for (const int32_t number : {0, -1, 65537, kMax}) {
        ASSERT_EQ(Params().Set("s_candidateNum", number).Apply(), 0);
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), -1) << number;

        Params().Set("s_candidateNum", number).Set("s_modeFlag", 1).Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), 0) << "hg has no search";
    }
    for (const int32_t number : {1, 65536}) {
        Params().Set("s_candidateNum", number).Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), 0) << number;
    }
}

TEST_F(NaviLimits, FullImageSidesMustLieIn1To4096WhereFullImagesAreBuilt) {
    // 4097 = 3 + 2 * (2047 + 0); 0 = -80 + 2 * (32 + 8)
    const std::vector<Params> bad = {
        Params().Set("s_centerWidth", 3).Set("s_gapWidth", 2039),
        Params().Set("s_centerWidth", -80), Params().Set("s_centerHeight", -48),
        Params().Set("s_gapHeight", 5000), Params().Set("s_centerWidth", kMax)};
    for (Params params : bad) {
        ASSERT_EQ(params.Apply(), 0);
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), -1);

        params.Set("s_multiBloclkFlag", 0).Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), 0) << "none is built";

        params.Set("s_multiBloclkFlag", 1).Set("s_modeFlag", 1).Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_image.data(), m_image.data(), 0), 0) << "none in hg mode";
    }
}

TEST_F(NaviLimits, HgFingerTestNeedsItsOwnSidesIn1To4096) {
    for (const int32_t width : {0, -1, 4097}) {
        Params().Set("s_modeFlag", 1).Set("s_imageWidthHg", width).Apply();
        EXPECT_FALSE(HgDetectGeometryUsable()) << width;
    }
    Params().Set("s_modeFlag", 1).Set("s_imageWidthHg", -40).Set("s_imageHeightHg", -48).Apply();
    EXPECT_FALSE(HgDetectGeometryUsable()) << "the product, 1920, looks like an image";
}

class PairWork : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        m_first = NoisePatch(0, 0, 36, 56);
        m_second = NoisePatch(500, 500, 36, 56);
    }
    // The result of the second frame of a gesture of unrelated frames.
    int32_t SecondFrame(const Params& params) {
        params.Apply();
        FpNaviClear();
        EXPECT_EQ(OrientationCalc(m_first.data(), m_first.data(), 0), 0);
        return OrientationCalc(m_first.data(), m_second.data(), 0);
    }
    std::vector<uint8_t> m_first;
    std::vector<uint8_t> m_second;
};

TEST_F(PairWork, DefaultsAreFarBelowTheLimit) {
    EXPECT_EQ(SecondFrame(Params()), 0);
}

TEST_F(PairWork, EndlessNoMoveSearchFailsThePair) {
    // (2 * 10000 + 1)^2 shifts of 2016 pixels
    Params params;
    params.Set("s_smallMoveTolRow", 10000).Set("s_smallMoveTolCol", 10000);
    EXPECT_EQ(SecondFrame(params), -1);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 0);
}

TEST_F(PairWork, EndlessMatchRefinementFailsThePair) {
    // 65536 candidates on a full image of 120 x 68 pixels: 5.3e8 > 2^28
    EXPECT_EQ(SecondFrame(Params().Set("s_candidateNum", 65536)), -1);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 0);
}

TEST_F(PairWork, WithoutFullImagesTheImageIsWhatIsMatched) {
    // 65536 candidates on 56 x 36 pixels: 1.3e8 < 2^28
    Params().Set("s_candidateNum", 65536).Set("s_multiBloclkFlag", 0).Apply();
    EXPECT_TRUE(PairWorkAcceptable());
    Params().Set("s_candidateNum", 65536).Apply();
    EXPECT_FALSE(PairWorkAcceptable());
}

TEST_F(PairWork, ExtremeTolerancesDoNotOverflowTheEstimate) {
    Params params;
    params.Set("s_smallMoveTolRow", kMax).Set("s_smallMoveTolCol", kMax);
    params.Set("s_templateWidth", kMax).Set("s_templateHeight", kMax);
    EXPECT_EQ(SecondFrame(params), -1);
}

TEST_F(PairWork, HgModeSearchesNothing) {
    Params params;
    params.Set("s_smallMoveTolRow", 10000).Set("s_smallMoveTolCol", 10000).Set("s_modeFlag", 1);
    EXPECT_EQ(SecondFrame(params), 0);
}

}  // namespace
