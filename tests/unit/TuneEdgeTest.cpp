// One call of _NAVI_Tune on the thinnest and on the longest images that can be measured.
#include <gtest/gtest.h>

#include <vector>

#include "TuneTestSupport.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class TuneEdge : public AfterARun {};

TEST_F(TuneEdge, ImagesOfOneRowOrOneColumnAreMeasured) {
    // Of 16 x 1 pixels the lower corners have 4, the upper ones none; their sum is divided by a
    // sixteenth of the image, 1 pixel. The two brightest corners have a mean of 40.
    const std::vector<uint8_t> frame(16, 10);
    Params params;
    params.Set("_NAVI_blk_selection_mode", 3);
    params.Set("s_blockColNumFp", 1).Set("s_blockRowNumFp", 1);
    params.Set("s_blockWidthFp", 16).Set("s_blockHeightFp", 1).Apply();
    Registers registers;
    registers.dac = 200;
    registers.Tune(frame);
    EXPECT_EQ(_NAVI_mean, 40U);
    params.Set("s_blockWidthFp", 1).Set("s_blockHeightFp", 16).Apply();
    registers.dac = 200;
    registers.Tune(std::vector<uint8_t>(16, 11));
    EXPECT_EQ(_NAVI_mean, 44U);
}

TEST_F(TuneEdge, SidesAbove4096AreMeasured) {
    // 8192 x 4 pixels: corner blocks of 2048 x 1.
    Params params;
    params.Set("s_blockColNumFp", 2).Set("s_blockRowNumFp", 2);
    params.Set("s_blockWidthFp", 4096).Set("s_blockHeightFp", 2).Apply();
    Registers registers;
    registers.dac = 200;
    registers.Tune(std::vector<uint8_t>(8192 * 4, 170));
    EXPECT_EQ(_NAVI_mean, 170U);
    EXPECT_EQ(_NAVI_img_histogram[170], 2048U);
    params.Set("s_blockWidthFp", 2).Set("s_blockHeightFp", 4096).Apply();
    registers.dac = 200;
    registers.Tune(std::vector<uint8_t>(4 * 8192, 171));
    EXPECT_EQ(_NAVI_mean, 171U);
    EXPECT_EQ(_NAVI_img_histogram[171], 2048U);
}

}  // namespace
