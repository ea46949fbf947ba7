// SetNaviParam: the parameter block and the geometry derived from it. Mode 2 stands in
// DoubleScanModeTest, the defaults before the first call in BeforeSetNaviParamTest.
#include <gtest/gtest.h>

#include <array>
#include <limits>
#include <vector>

#include "Fixtures.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class NaviParam : public NaviTest {};

TEST_F(NaviParam, EveryEntryGoesToItsVariable) {
    std::array<int32_t, FPNAVI_PARAM_NUM> block{};
    for (int32_t i = 0; i < FPNAVI_PARAM_NUM; ++i)
        block[static_cast<size_t>(i)] = 1000 + i;
    ASSERT_EQ(SetNaviParam(block.data()), 0);
    for (size_t i = 0; i < block.size(); ++i)
        EXPECT_EQ(ParamTable()[i].Stored(), block[i]) << ParamTable()[i].name;
}

TEST_F(NaviParam, EveryEntryIsStoredUnchecked) {
    // No entry equals 1 or 2, so no flag is set and no halving happens.
    for (const int32_t value :
         {std::numeric_limits<int32_t>::min(), -1, 0, std::numeric_limits<int32_t>::max()}) {
        ASSERT_EQ(Params().SetAll(value).Apply(), 0) << value;
        EXPECT_EQ(StoredState(), std::vector<int32_t>(FPNAVI_PARAM_NUM, value));
    }
}

TEST_F(NaviParam, NullArrayFailsAndChangesNothing) {
    Params().Set("s_blockWidthFp", 16).Set("s_minDelta", 77).Apply();
    const std::vector<int32_t> stored = StoredState();
    const std::vector<int32_t> derived = DerivedState();
    EXPECT_EQ(SetNaviParam(nullptr), -1);
    EXPECT_EQ(StoredState(), stored);
    EXPECT_EQ(DerivedState(), derived);
}

TEST_F(NaviParam, ModeOneTakesTheHgGeometry) {
    ASSERT_EQ(Params().Set("s_modeFlag", 1).Apply(), 0);
    EXPECT_EQ(s_blockWidth, 8);
    EXPECT_EQ(s_blockHeight, 4);
    EXPECT_EQ(s_blockColNum, 5);
    EXPECT_EQ(s_blockRowNum, 12);
    EXPECT_EQ(s_imageWidth, 40);
    EXPECT_EQ(s_imageHeight, 48);
}

TEST_F(NaviParam, ModeZeroTakesTheFpGeometry) {
    ASSERT_EQ(Params().Set("s_modeFlag", 0).Apply(), 0);
    EXPECT_EQ(s_blockWidth, 8);
    EXPECT_EQ(s_blockHeight, 2);
    EXPECT_EQ(s_blockColNum, 7);
    EXPECT_EQ(s_blockRowNum, 18);
    EXPECT_EQ(s_imageWidth, 56);
    EXPECT_EQ(s_imageHeight, 36);
}

TEST_F(NaviParam, OtherModesBehaveAsModeZero) {
    for (const int32_t mode : {3, -1, 1000}) {
        const int32_t doubleScan = s_doubleScanFlag;
        ASSERT_EQ(Params().Set("s_modeFlag", mode).Apply(), 0);
        EXPECT_EQ(s_modeFlag, mode);
        EXPECT_EQ(s_imageWidth, 56);
        EXPECT_EQ(s_imageHeight, 36);
        EXPECT_EQ(s_doubleScanFlag, doubleScan) << "only mode 2 sets it";
    }
}

TEST_F(NaviParam, MultiBlockOneGivesTheNineTileImageAndEightTemplates) {
    ASSERT_EQ(Params().Set("s_multiBloclkFlag", 1).Apply(), 0);
    EXPECT_EQ(s_tpltNum, 8);
    EXPECT_EQ(s_fullImageWidth, 120);  // 40 + 2 * (32 + 8)
    EXPECT_EQ(s_fullImageHeight, 68);  // 20 + 2 * (16 + 8)
}

TEST_F(NaviParam, MultiBlockOtherwiseGivesTheCentreTileAndFourTemplates) {
    for (const int32_t flag : {0, 2, -1}) {
        ASSERT_EQ(Params().Set("s_multiBloclkFlag", flag).Apply(), 0);
        EXPECT_EQ(s_tpltNum, 4);
        EXPECT_EQ(s_fullImageWidth, 40);
        EXPECT_EQ(s_fullImageHeight, 20);
    }
}

TEST_F(NaviParam, LeftRightTemplateIsTheUpDownOneTurned) {
    ASSERT_EQ(Params().Apply(), 0);
    EXPECT_EQ(s_tpltWidthUD, 10);
    EXPECT_EQ(s_tpltHeightUD, 6);
    EXPECT_EQ(s_tpltWidthLR, 6);
    EXPECT_EQ(s_tpltHeightLR, 10);
}

TEST_F(NaviParam, DownSamplingHalvesTowardZero) {
    Params params;
    params.Set("s_downSampleFlag", 1).Set("s_sensorHeight", 201).Set("s_smallMoveTolRow", 3);
    ASSERT_EQ(params.Apply(), 0);
    EXPECT_EQ(s_sensorHeight, 100);
    EXPECT_EQ(s_smallMoveTolRow, 1);
    EXPECT_EQ(s_smallMoveTolCol, 2) << "columns are not halved";
    EXPECT_EQ(s_sensorWidth, 80);

    params.Set("s_smallMoveTolRow", -3);
    ASSERT_EQ(params.Apply(), 0);
    EXPECT_EQ(s_smallMoveTolRow, -1);
}

TEST_F(NaviParam, DownSamplingNeedsFlagOne) {
    ASSERT_EQ(Params().Set("s_downSampleFlag", 2).Set("s_smallMoveTolRow", 3).Apply(), 0);
    EXPECT_EQ(s_sensorHeight, 200);
    EXPECT_EQ(s_smallMoveTolRow, 3);
}

TEST_F(NaviParam, RepeatedCallsDoNotHalveTwice) {
    const Params params = Params().Set("s_downSampleFlag", 1).Set("s_smallMoveTolRow", 8);
    params.Apply();
    params.Apply();
    EXPECT_EQ(s_sensorHeight, 100);
    EXPECT_EQ(s_smallMoveTolRow, 4);
}

TEST_F(NaviParam, TwoIdenticalCallsLeaveIdenticalState) {
    const Params params = Params().Set("s_downSampleFlag", 1).Set("s_modeFlag", 1);
    params.Apply();
    const std::vector<int32_t> stored = StoredState();
    const std::vector<int32_t> derived = DerivedState();
    params.Apply();
    EXPECT_EQ(StoredState(), stored);
    EXPECT_EQ(DerivedState(), derived);
}

TEST_F(NaviParam, DerivedSizesAreThirtyTwoBitProducts) {
    constexpr int32_t kMax = std::numeric_limits<int32_t>::max();
    // (2^31 - 1)^2 = 2^62 - 2^32 + 1, low 32 bits 1
    ASSERT_EQ(Params().Set("s_blockWidthFp", kMax).Set("s_blockColNumFp", kMax).Apply(), 0);
    EXPECT_EQ(s_imageWidth, 1);
    // 2^31 - 1 + 2 * (32 + 8) = 2^31 + 79, as signed -2^31 + 79
    ASSERT_EQ(Params().Set("s_centerWidth", kMax).Apply(), 0);
    EXPECT_EQ(s_fullImageWidth, std::numeric_limits<int32_t>::min() + 79);
}

TEST_F(NaviParam, CallerMayReuseTheBlock) {
    std::array<int32_t, FPNAVI_PARAM_NUM> block = Params().Values();
    ASSERT_EQ(SetNaviParam(block.data()), 0);
    block.fill(0);
    EXPECT_EQ(s_candidateNum, 100);
}

}  // namespace
