// The hg finger test: a dark frame, or one dark quadrant.
#include <gtest/gtest.h>

#include <vector>

#include "Fixtures.h"
#include "presence/FingerStatus.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class HgDetect : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        m_params.Set("s_modeFlag", 1);
    }
    int32_t Detect(TestFrame& frame) {
        m_params.Apply();
        return NavFingerDetectHg(frame.Greys().data());
    }
    static int32_t BlkMeanMin(TestFrame& frame) {
        int32_t mean = -7;
        EXPECT_EQ(GetBlkMeanMin(frame.Greys().data(), &mean), 0);
        return mean;
    }
    Params m_params;
};

TEST_F(HgDetect, MeanAtTheThresholdIsAFinger) {
    m_params.Set("s_highSensitiveMode", 0);
    TestFrame at(40, 48, 180);
    TestFrame above(40, 48, 181);
    EXPECT_EQ(Detect(at), 1);
    EXPECT_EQ(Detect(above), 0);
}

TEST_F(HgDetect, MeanIsTruncated) {
    m_params.Set("s_highSensitiveMode", 0);
    TestFrame frame(40, 48, 181);
    frame.Grey(0, 0) = 180;  // 180.999
    EXPECT_EQ(Detect(frame), 1);
}

TEST_F(HgDetect, SumOfTheLargestWhiteFrameWraps) {
    // 2^24 pixels of 255 sum up to 2^32 - 2^24: the low 32 bits are -2^24, and the mean is -1.
    m_params.Set("s_imageWidthHg", 4096).Set("s_imageHeightHg", 4096);
    TestFrame frame(4096, 4096, 255);
    m_params.Set("s_highSensitiveMode", 0).Set("s_meanThreshold", -1);
    EXPECT_EQ(Detect(frame), 1);
    m_params.Set("s_meanThreshold", -2);
    EXPECT_EQ(Detect(frame), 0);
}

TEST_F(HgDetect, OneDarkQuadrantIsAFingerInTheSensitiveModeOnly) {
    // Quadrants of 20 x 24; the whole mean is (180 + 3 * 255) / 4 = 236.
    for (const int32_t row : {0, 24}) {
        for (const int32_t column : {0, 20}) {
            TestFrame frame(40, 48, 255);
            frame.Paint(row, column, 24, 20, 180);
            m_params.Set("s_highSensitiveMode", 1);
            EXPECT_EQ(Detect(frame), 1);
            m_params.Set("s_highSensitiveMode", 0);
            EXPECT_EQ(Detect(frame), 0);
            m_params.Set("s_highSensitiveMode", 2);
            EXPECT_EQ(Detect(frame), 0) << "exactly 1 switches it on";
        }
    }
}

TEST_F(HgDetect, QuadrantAboveTheThresholdIsNone) {
    TestFrame frame(40, 48, 255);
    frame.Paint(0, 0, 24, 20, 181);
    EXPECT_EQ(Detect(frame), 0);
}

TEST_F(HgDetect, WholeMeanUsesTheHgDetectionSize) {
    // Only the first 10 x 10 = 100 bytes: the first two rows and a half of the frame.
    m_params.Set("s_imageWidthHg", 10).Set("s_imageHeightHg", 10).Set("s_highSensitiveMode", 0);
    TestFrame frame(40, 48, 255);
    frame.Paint(0, 0, 2, 40, 0).Paint(2, 0, 1, 20, 0);
    EXPECT_EQ(Detect(frame), 1);
    frame.Paint(0, 0, 3, 40, 255).Paint(3, 0, 45, 40, 0);
    EXPECT_EQ(Detect(frame), 0);
}

TEST_F(HgDetect, ImageWithoutPixelsFails) {
    TestFrame frame(40, 48, 0);
    m_params.Set("s_imageWidthHg", 0);
    EXPECT_EQ(Detect(frame), -1);
    m_params.Set("s_imageWidthHg", -40);
    EXPECT_EQ(Detect(frame), -1);
}

TEST_F(HgDetect, QuadrantMeanIsTheLeastOfFour) {
    m_params.Apply();
    TestFrame frame(40, 48, 200);
    frame.Paint(0, 0, 24, 20, 90).Paint(0, 20, 24, 20, 80).Paint(24, 0, 24, 20, 70);
    EXPECT_EQ(BlkMeanMin(frame), 70);
    frame.Paint(24, 20, 24, 20, 60);
    EXPECT_EQ(BlkMeanMin(frame), 60);
}

TEST_F(HgDetect, OddLastRowAndColumnAreNeverRead) {
    // 5 x 3: quadrants of 2 x 1, the rest, column 4 and row 2, is black.
    m_params.Set("s_blockWidthHg", 5)
        .Set("s_blockColNumHg", 1)
        .Set("s_blockHeightHg", 3)
        .Set("s_blockRowNumHg", 1)
        .Apply();
    TestFrame frame(5, 3, 0);
    frame.Paint(0, 0, 2, 4, 200);
    EXPECT_EQ(BlkMeanMin(frame), 200);
}

TEST_F(HgDetect, ImageTooSmallForQuadrantsShowsNoFingerByThem) {
    m_params.Set("s_blockWidthHg", 1)
        .Set("s_blockColNumHg", 1)
        .Set("s_imageWidthHg", 1)
        .Set("s_meanThreshold", 180);
    TestFrame frame(1, 48, 255);
    frame.Paint(0, 0, 4, 1, 0);  // mean 255 * 44 / 48 = 233
    EXPECT_EQ(Detect(frame), 0);
    EXPECT_EQ(BlkMeanMin(frame), 256);
}

}  // namespace
