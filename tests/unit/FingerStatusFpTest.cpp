// The finger test of the fp modes: texture, spread of block means, grey range of a block.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "presence/FingerStatus.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

// Blocks of the default 56 x 36 image: 4 x 4 of 14 x 9 pixels.
class FpDetect : public NaviTest {
  protected:
    int32_t Detect(TestFrame& frame) {
        m_params.Apply();
        m_image = frame.Greys();
        return NavFingerDetectFp(m_image.data());
    }
    static int32_t GreyRange(TestFrame& frame) {
        int32_t range = -7;
        EXPECT_EQ(GetGreyRange(frame.Greys().data(), &range), 0);
        return range;
    }
    static int32_t MeanDiff(TestFrame& frame) {
        int32_t spread = -7;
        EXPECT_EQ(GetBlkMeanDiff(frame.Greys().data(), &spread), 0);
        return spread;
    }
    static Params Image(int32_t width, int32_t height) {
        return Params()
            .Set("s_blockWidthFp", width)
            .Set("s_blockColNumFp", 1)
            .Set("s_blockHeightFp", height)
            .Set("s_blockRowNumFp", 1);
    }
    Params m_params;
    std::vector<uint8_t> m_image;  // of the last call, without room behind it
};

TEST_F(FpDetect, TextureTestGetsTheFrameItsSizeAndThePresets) {
    const std::vector<uint8_t> greys(2016, 240);
    m_params.Apply();
    NavFingerDetectFp(greys.data());
    ASSERT_EQ(FingerBlkFake::Calls().size(), 1U);
    const FingerBlkCall& call = FingerBlkFake::Calls()[0];
    EXPECT_EQ(call.image, greys.data());
    EXPECT_EQ(call.width, 56);
    EXPECT_EQ(call.height, 36);
    EXPECT_EQ(call.mode, 0);
    EXPECT_EQ(call.preset, (std::array<int32_t, 10>{0, 0, 0, 0, 0, 255, 255, 255, 255, 255}));
}

TEST_F(FpDetect, BrightFlatFrameWithoutTextureIsNoFinger) {
    TestFrame frame(56, 36, 240);
    EXPECT_EQ(Detect(frame), 0);
}

TEST_F(FpDetect, OneTexturedBlockIsAFinger) {
    TestFrame frame(56, 36, 240);
    for (int32_t block = 0; block < 5; ++block) {
        FingerBlkFake::SetAnswer([block](int32_t* results) { results[block] = 7; });
        EXPECT_EQ(Detect(frame), 1) << block;
        FingerBlkFake::SetAnswer([block](int32_t* results) { results[block] = 6; });
        EXPECT_EQ(Detect(frame), 0) << block;
    }
}

TEST_F(FpDetect, OneDarkBlockIsAFinger) {
    TestFrame frame(56, 36, 240);
    for (int32_t block = 5; block < 10; ++block) {
        FingerBlkFake::SetAnswer([block](int32_t* results) { results[block] = 39; });
        EXPECT_EQ(Detect(frame), 1) << block;
        FingerBlkFake::SetAnswer([block](int32_t* results) { results[block] = 40; });
        EXPECT_EQ(Detect(frame), 0) << block;
    }
}

TEST_F(FpDetect, TextureThresholdsAreParameters) {
    TestFrame frame(56, 36, 240);
    m_params.Set("s_fftResThreshold", 0);
    EXPECT_EQ(Detect(frame), 1) << "the preset 0 reaches it";
    m_params.Set("s_fftResThreshold", 1).Set("s_meanThresholdFp", 256);
    EXPECT_EQ(Detect(frame), 1) << "the preset 255 is below it";
}

TEST_F(FpDetect, NullFrameFails) {
    m_params.Apply();
    EXPECT_EQ(NavFingerDetectFp(nullptr), -1);
}

TEST_F(FpDetect, SpreadOfBlockMeansAtTheThresholdIsAFinger) {
    TestFrame at(56, 36, 200);
    at.Paint(9, 14, 9, 14, 150);
    EXPECT_EQ(Detect(at), 1);
    TestFrame below(56, 36, 200);
    below.Paint(9, 14, 9, 14, 151);
    EXPECT_EQ(Detect(below), 0);
    EXPECT_EQ(MeanDiff(at), 50);
    EXPECT_EQ(MeanDiff(below), 49);
}

TEST_F(FpDetect, BlockMeansAreTruncated) {
    m_params.Apply();
    TestFrame frame(56, 36, 200);
    frame.Grey(0, 0) = 199;  // mean 199.99
    EXPECT_EQ(MeanDiff(frame), 1);
}

TEST_F(FpDetect, PixelsBeyondTheBlockGridAreNotRead) {
    // 7 x 6: blocks of 1 x 1; columns 4 to 6 and rows 4 and 5 are black.
    Image(7, 6).Apply();
    TestFrame frame(7, 6, 0);
    frame.Paint(0, 0, 4, 4, 90);
    EXPECT_EQ(MeanDiff(frame), 0);
}

TEST_F(FpDetect, GreyRangeAtTheThresholdIsAFinger) {
    // One block half 200 and half darker, 63 pixels each: the low crossing is found one grey below
    // the dark half. Its mean is 160, 40 below the others.
    TestFrame at(56, 36, 200);
    at.Paint(0, 0, 9, 7, 121);
    EXPECT_EQ(Detect(at), 1);  // 200 - 120
    EXPECT_EQ(GreyRange(at), 80);
    TestFrame below(56, 36, 200);
    below.Paint(0, 0, 9, 7, 122);
    EXPECT_EQ(Detect(below), 0);
    EXPECT_EQ(GreyRange(below), 79);
}

TEST_F(FpDetect, GreyRangeOfAFlatFrameIsOne) {
    // Low one below the grey, high at it.
    m_params.Apply();
    TestFrame frame(56, 36, 240);
    EXPECT_EQ(GreyRange(frame), 1);
}

TEST_F(FpDetect, BlackFrameHasNoGreyRange) {
    // Grey 0 is never accumulated: no crossing is found in any block.
    m_params.Apply();
    TestFrame frame(56, 36, 0);
    EXPECT_EQ(GreyRange(frame), 0);
}

TEST_F(FpDetect, ZerosDoNotCountAndAMissingCrossingKeepsTheEarlierBlocks) {
    // Blocks of 126, limits 378 and 12222. Block 0, flat 250: low 249, high 250. Block 1, 26 zeros
    // and 100 tens: low 9; 100 * 100 never reaches 12222, so high stays 250: 241.
    m_params.Apply();
    TestFrame frame(56, 36, 250);
    frame.Paint(0, 14, 9, 14, 10).Paint(0, 14, 2, 13, 0);
    EXPECT_EQ(GreyRange(frame), 241);
}

TEST_F(FpDetect, BlackBlockKeepsTheEarlierCrossings) {
    // Block 0 spans 10 (low 9) to 60; black block 1 repeats its 51; all others are flat.
    m_params.Apply();
    TestFrame frame(56, 36, 250);
    frame.Paint(0, 0, 9, 7, 10).Paint(0, 7, 9, 7, 60).Paint(0, 14, 9, 14, 0);
    EXPECT_EQ(GreyRange(frame), 51);
    // First of all, it finds the starting zeros.
    TestFrame first(56, 36, 250);
    first.Paint(0, 0, 9, 14, 0);
    EXPECT_EQ(GreyRange(first), 1);
}

TEST_F(FpDetect, LimitsOfABlockOf64) {
    // 192 and 6208: of {20, 30, 60 x 100, 180, 190} one pixel lies up to 29 and two up to 30: low
    // 29; 62 lie up to 179 and 63 up to 180: high 180.
    Image(32, 32).Apply();
    TestFrame frame(32, 32, 100);
    frame.Grey(0, 0) = 20;
    frame.Grey(0, 1) = 30;
    frame.Grey(7, 6) = 180;
    frame.Grey(7, 7) = 190;
    EXPECT_EQ(GreyRange(frame), 151);
}

TEST_F(FpDetect, GreyRangeOfNullPointersFailsAndStoresNothing) {
    m_params.Apply();
    TestFrame frame(56, 36, 240);
    int32_t range = -7;
    EXPECT_EQ(GetGreyRange(nullptr, &range), -1);
    EXPECT_EQ(range, -7);
    EXPECT_EQ(GetGreyRange(frame.Greys().data(), nullptr), -1);
}

TEST_F(FpDetect, ImageTooSmallForBlocksShowsNoFingerByThem) {
    for (const auto& [width, height] : {std::pair<int32_t, int32_t>{3, 36}, {56, 3}, {2, 2}}) {
        m_params = Image(width, height).Set("s_blkMeanDiffThreshold", 0);
        TestFrame frame(width, height, 10);
        frame.Grey(0, 0) = 250;
        EXPECT_EQ(Detect(frame), 0) << width << " x " << height;
        EXPECT_EQ(MeanDiff(frame), -1);
        EXPECT_EQ(GreyRange(frame), 0);
    }
}

}  // namespace
