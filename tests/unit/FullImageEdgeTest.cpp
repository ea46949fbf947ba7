// GetFullImg with tiles and gaps of less than no pixel.
#include <gtest/gtest.h>

#include "Fixtures.h"
#include "frame/NaviFrame.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class FullImageEdge : public NaviTest {
  protected:
    // The result for a frame of 56 x 36 pixels, in which the tiles have to add up.
    static int32_t Build(Params params) {
        params.Apply();
        TestFrame source(56, 36, 100, 1);
        NaviFrame_t full{};
        const int32_t result = GetFullImg(source.Get(), &full);
        EXPECT_EQ(full.pData != nullptr, result == 0);
        ImgClear(&full);
        return result;
    }
};

TEST_F(FullImageEdge, TilesAndGapsOfMinusOnePixelAreRefused) {
    // 58 - 2 and 38 - 2 pixels add up to the frame's sides.
    EXPECT_EQ(Build(Params().Set("s_boundWidth", -1).Set("s_centerWidth", 58)), -1);
    EXPECT_EQ(Build(Params().Set("s_boundHeight", -1).Set("s_centerHeight", 38)), -1);
    EXPECT_EQ(Build(Params().Set("s_gapWidth", -1)), -1);
    EXPECT_EQ(Build(Params().Set("s_gapHeight", -1)), -1);
}

TEST_F(FullImageEdge, TilesAndGapsOfNoPixelAreTaken) {
    EXPECT_EQ(Build(Params().Set("s_boundWidth", 0).Set("s_centerWidth", 56)), 0);
    EXPECT_EQ(Build(Params().Set("s_boundHeight", 0).Set("s_centerHeight", 36)), 0);
    EXPECT_EQ(Build(Params().Set("s_boundWidth", 28).Set("s_centerWidth", 0)), 0);
    EXPECT_EQ(Build(Params().Set("s_boundHeight", 18).Set("s_centerHeight", 0)), 0);
    EXPECT_EQ(Build(Params().Set("s_gapWidth", 0)), 0);
    EXPECT_EQ(Build(Params().Set("s_gapHeight", 0)), 0);
}

}  // namespace
