// The vote record and FpNaviClear, which starts the next gesture.
#include <gtest/gtest.h>

#include <cstring>
#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "motion/DoubleScan.h"
#include "param/NaviParam.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr size_t kRecordInts = sizeof(NaviVoteInfo_t) / sizeof(int32_t);

// The record as 1503 integers.
std::vector<int32_t> RecordInts() {
    std::vector<int32_t> ints(kRecordInts);
    std::memcpy(ints.data(), PrintNaviLog(), sizeof(NaviVoteInfo_t));
    return ints;
}

void FillRecord(int32_t value) {
    const std::vector<int32_t> ints(kRecordInts, value);
    std::memcpy(static_cast<void*>(PrintNaviLog()), ints.data(), sizeof(NaviVoteInfo_t));
}

class GestureClear : public NaviTest {};

TEST_F(GestureClear, FieldsLieInTheirOrder) {
    NaviVoteInfo_t* record = PrintNaviLog();
    const auto* base = reinterpret_cast<const int32_t*>(record);
    EXPECT_EQ(&record->calc_cnt - base, 0);
    EXPECT_EQ(record->xc - base, 1);
    EXPECT_EQ(record->yc - base, 101);
    EXPECT_EQ(record->cvr - base, 201);
    EXPECT_EQ(record->dx_ct - base, 301);
    EXPECT_EQ(record->dy_ct - base, 401);
    EXPECT_EQ(record->dx_fp - base, 501);
    EXPECT_EQ(record->dy_fp - base, 601);
    EXPECT_EQ(record->diff - base, 701);
    EXPECT_EQ(record->vkey_fp - base, 801);
    EXPECT_EQ(record->vkey_ct - base, 901);
    EXPECT_EQ(&record->dx_sum - base, 1001);
    EXPECT_EQ(&record->dy_sum - base, 1002);
    EXPECT_EQ(record->xc_ds - base, 1003);
    EXPECT_EQ(record->yc_ds - base, 1103);
    EXPECT_EQ(record->cvr_ds - base, 1203);
    EXPECT_EQ(record->dx_ds - base, 1303);
    EXPECT_EQ(record->dy_ds - base, 1403);
    EXPECT_EQ(kRecordInts, 1503U);
}

TEST_F(GestureClear, RecordIsAlwaysAtTheSameAddress) {
    const NaviVoteInfo_t* before = PrintNaviLog();
    FpNaviClear();
    EXPECT_EQ(PrintNaviLog(), before);
    EXPECT_EQ(PrintNaviLog(), &s_voteInfo);
}

TEST_F(GestureClear, ZeroesTheWholeRecordButForTheDoubleScanCentroids) {
    FillRecord(7);
    FpNaviClear();
    const std::vector<int32_t> ints = RecordInts();
    for (size_t i = 0; i < kRecordInts; ++i) {
        const bool kept = i >= 1003 && i < 1203;  // xc_ds and yc_ds
        EXPECT_EQ(ints[i], kept ? 7 : 0) << i;
    }
    FillRecord(0);
}

TEST_F(GestureClear, DoubleScanGestureLeavesItsCentroidsAlone) {
    GetDoubleScanNaviBlock(0, 0x80000000U);  // row 0, column 0: (-44, 44), 1 percent
    ASSERT_EQ(CalcDoubleScanMove(DoubleScanZonePrev, DoubleScanZoneCurr, PrintNaviLog()), 0);
    ASSERT_EQ(PrintNaviLog()->xc_ds[1], -44);
    ASSERT_EQ(PrintNaviLog()->dx_ds[0], -44);
    ASSERT_EQ(PrintNaviLog()->cvr_ds[1], 1);
    FpNaviClear();
    EXPECT_EQ(PrintNaviLog()->xc_ds[1], -44);
    EXPECT_EQ(PrintNaviLog()->yc_ds[1], 44);
    EXPECT_EQ(PrintNaviLog()->dx_ds[0], 0);
    EXPECT_EQ(PrintNaviLog()->dy_ds[0], 0);
    EXPECT_EQ(PrintNaviLog()->cvr_ds[1], 0);
    FillRecord(0);
}

TEST_F(GestureClear, ZeroesTheDoubleScanMaps) {
    GetDoubleScanNaviBlock(0xFFFFFFFFU, 0xFFFFFFFFU);
    GetDoubleScanNaviBlock(0xFFFFFFFFU, 0xFFFFFFFFU);
    FpNaviClear();
    EXPECT_EQ(Bytes(DoubleScanZonePrev, 64), std::vector<uint8_t>(64, 0));
    EXPECT_EQ(Bytes(DoubleScanZoneCurr, 64), std::vector<uint8_t>(64, 0));
}

TEST_F(GestureClear, ReleasesAllFourFrames) {
    Params().Apply();
    TestFrame source(56, 36, 9, 1);
    for (NaviFrame_t* frame : {&s_imageCurr, &s_imagePrev, &s_fullImageCurr, &s_fullImagePrev})
        ASSERT_EQ(ImgCopy(frame, source.Get()), 0);
    FailingMalloc::Count();
    FpNaviClear();
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Frees(), 8) << "two buffers of each frame";
    for (const NaviFrame_t* frame :
         {&s_imageCurr, &s_imagePrev, &s_fullImageCurr, &s_fullImagePrev})
        EXPECT_TRUE(IsEmpty(*frame));
}

TEST_F(GestureClear, TwiceInARowLeavesEverythingEmpty) {
    FpNaviClear();
    FailingMalloc::Count();
    FpNaviClear();
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Frees(), 0);
    EXPECT_EQ(PrintNaviLog()->calc_cnt, 0);
    for (const NaviFrame_t* frame :
         {&s_imageCurr, &s_imagePrev, &s_fullImageCurr, &s_fullImagePrev})
        EXPECT_TRUE(IsEmpty(*frame));
}

TEST_F(GestureClear, ZeroesTheFrameCounterAndTheFlags) {
    Params().Set("s_modeFlag", 1).Apply();
    const std::vector<uint8_t> white(1920, 255);
    ASSERT_EQ(OrientationCalc(white.data(), white.data(), 0), 0);
    ASSERT_EQ(s_frameNum, 1);
    if (s_doubleScanFlag == 0) {
        ASSERT_EQ(vmk_fp_navigation_detect_finger_status(white.data()), 0);
        ASSERT_EQ(s_lastFrameFlag, 1);
    }
    FpNaviClear();
    EXPECT_EQ(s_frameNum, 0);
    EXPECT_EQ(s_lastFrameFlag, 0);
    EXPECT_EQ(s_tuneOkFlag, 0);
}

TEST_F(GestureClear, KeepsAllParametersAndTheDerivedGeometry) {
    Params().Set("s_modeFlag", 1).Set("s_minDelta", 31).Apply();
    const std::vector<int32_t> stored = StoredState();
    const std::vector<int32_t> derived = DerivedState();
    FpNaviClear();
    EXPECT_EQ(StoredState(), stored);
    EXPECT_EQ(DerivedState(), derived);
}

TEST_F(GestureClear, VoteInfoClearWorksOnAnyRecord) {
    NaviVoteInfo_t record;
    std::memset(static_cast<void*>(&record), 0x11, sizeof(record));
    VoteInfoClear(&record);
    EXPECT_EQ(record.calc_cnt, 0);
    EXPECT_EQ(record.dy_ds[99], 0);
    EXPECT_EQ(record.cvr_ds[99], 0);
    EXPECT_EQ(record.vkey_ct[99], 0);
    EXPECT_EQ(record.dx_sum, 0);
    EXPECT_EQ(record.xc_ds[99], 0x11111111);
    EXPECT_EQ(record.yc_ds[0], 0x11111111);
}

}  // namespace
