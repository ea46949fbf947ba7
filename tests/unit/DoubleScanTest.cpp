// The double-scan zone: registers to maps, measurement of a map, displacement of two maps.
#include <gtest/gtest.h>

#include <array>
#include <cstring>
#include <vector>

#include "Fixtures.h"
#include "motion/DoubleScan.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

using Zone = std::array<uint8_t, kZoneCells>;

Zone ZoneWith(const std::vector<size_t>& cells) {
    Zone zone{};
    for (const size_t cell : cells)
        zone.at(cell) = 1;
    return zone;
}

class DoubleScan : public NaviTest {
  protected:
    static void ExpectCurrent(const Zone& zone) {
        EXPECT_EQ(Bytes(DoubleScanZoneCurr, kZoneCells), Bytes(zone.data(), kZoneCells));
    }
    static void ExpectPrevious(const Zone& zone) {
        EXPECT_EQ(Bytes(DoubleScanZonePrev, kZoneCells), Bytes(zone.data(), kZoneCells));
    }
    static Zone Rows(size_t row) {
        Zone zone{};
        std::memset(&zone[row * 8], 1, 8);
        return zone;
    }
};

TEST_F(DoubleScan, TopBitOfReg28IsRowZeroColumnZero) {
    EXPECT_EQ(GetDoubleScanNaviBlock(0, 0x80000000U), 0);
    ExpectCurrent(ZoneWith({0}));
}

TEST_F(DoubleScan, LowestBitOfReg24IsRowSevenColumnSeven) {
    EXPECT_EQ(GetDoubleScanNaviBlock(1, 0), 0);
    ExpectCurrent(ZoneWith({63}));
}

TEST_F(DoubleScan, LowestByteOfReg28IsRowThree) {
    GetDoubleScanNaviBlock(0, 0x000000FFU);
    ExpectCurrent(Rows(3));
}

TEST_F(DoubleScan, HighestByteOfReg24IsRowFour) {
    GetDoubleScanNaviBlock(0xFF000000U, 0);
    ExpectCurrent(Rows(4));
}

TEST_F(DoubleScan, EveryBitHasOneCell) {
    for (size_t bit = 0; bit < 32; ++bit) {
        GetDoubleScanNaviBlock(0, 1U << bit);
        ExpectCurrent(ZoneWith({31 - bit}));
        GetDoubleScanNaviBlock(1U << bit, 0);
        ExpectCurrent(ZoneWith({63 - bit}));
    }
}

TEST_F(DoubleScan, SecondCallKeepsTheFirstMapAsThePreviousOne) {
    GetDoubleScanNaviBlock(0, 0x80000000U);
    ExpectPrevious(Zone{});
    GetDoubleScanNaviBlock(1, 0);
    ExpectPrevious(ZoneWith({0}));
    ExpectCurrent(ZoneWith({63}));
}

struct Measure {
    int32_t xc = -99;
    int32_t yc = -99;
    int32_t cvr = -99;
};

Measure MeasureOf(const Zone& zone) {
    Measure measure;
    EXPECT_EQ(DoubleScanGetCenterAndCoverage(zone.data(), &measure.xc, &measure.yc, &measure.cvr),
              0);
    return measure;
}

TEST_F(DoubleScan, AllOnesMeasureTheCentreAndFullCoverage) {
    Zone zone;
    zone.fill(1);
    const Measure measure = MeasureOf(zone);
    EXPECT_EQ(measure.xc, 0);  // 25600 / 512 - 50
    EXPECT_EQ(measure.yc, 0);
    EXPECT_EQ(measure.cvr, 100);
}

TEST_F(DoubleScan, CornerCellMeasuresTheTopLeft) {
    const Measure measure = MeasureOf(ZoneWith({0}));
    EXPECT_EQ(measure.xc, -44);  // 50 / 8 - 50 = 6 - 50
    EXPECT_EQ(measure.yc, 44);
    EXPECT_EQ(measure.cvr, 1);  // 100 / 64
}

TEST_F(DoubleScan, EmptyMapMeasuresZero) {
    const Measure measure = MeasureOf(Zone{});
    EXPECT_EQ(measure.xc, 0);
    EXPECT_EQ(measure.yc, 0);
    EXPECT_EQ(measure.cvr, 0);
}

TEST_F(DoubleScan, OnlyCellsOfExactlyOneAreMeasured) {
    Zone zone;
    zone.fill(2);
    zone[0] = 1;
    zone[5] = 255;
    const Measure measure = MeasureOf(zone);
    EXPECT_EQ(measure.xc, -44);
    EXPECT_EQ(measure.cvr, 1);
}

TEST_F(DoubleScan, MeasureRefusesNullPointersAndWritesNothing) {
    const Zone zone = ZoneWith({0});
    int32_t x = 7;
    int32_t y = 7;
    int32_t cvr = 7;
    EXPECT_EQ(DoubleScanGetCenterAndCoverage(nullptr, &x, &y, &cvr), -1);
    EXPECT_EQ(DoubleScanGetCenterAndCoverage(zone.data(), nullptr, &y, &cvr), -1);
    EXPECT_EQ(DoubleScanGetCenterAndCoverage(zone.data(), &x, nullptr, &cvr), -1);
    EXPECT_EQ(DoubleScanGetCenterAndCoverage(zone.data(), &x, &y, nullptr), -1);
    EXPECT_EQ(x, 7);
    EXPECT_EQ(y, 7);
    EXPECT_EQ(cvr, 7);
}

class DoubleScanMove : public NaviTest {
  protected:
    NaviVoteInfo_t m_record{};
};

TEST_F(DoubleScanMove, IdenticalMapsDoNotMove) {
    const Zone zone = ZoneWith({9, 10, 17});
    m_record.calc_cnt = 4;
    ASSERT_EQ(CalcDoubleScanMove(zone.data(), zone.data(), &m_record), 0);
    EXPECT_EQ(m_record.dx_ds[4], 0);
    EXPECT_EQ(m_record.dy_ds[4], 0);
    EXPECT_EQ(m_record.xc_ds[4], m_record.xc_ds[5]);
    EXPECT_EQ(m_record.yc_ds[4], m_record.yc_ds[5]);
    EXPECT_EQ(m_record.cvr_ds[4], m_record.cvr_ds[5]);
    EXPECT_EQ(m_record.cvr_ds[4], 4);  // 300 / 64
    EXPECT_EQ(m_record.calc_cnt, 4) << "the driver counts";
}

TEST_F(DoubleScanMove, LeftCornerToRightCornerIs87Percent) {
    ASSERT_EQ(CalcDoubleScanMove(ZoneWith({0}).data(), ZoneWith({7}).data(), &m_record), 0);
    EXPECT_EQ(m_record.xc_ds[0], -44);
    EXPECT_EQ(m_record.xc_ds[1], 43);  // 750 / 8 - 50 = 93 - 50
    EXPECT_EQ(m_record.dx_ds[0], 87);
    EXPECT_EQ(m_record.dy_ds[0], 0);
    EXPECT_EQ(m_record.yc_ds[0], 44);
    EXPECT_EQ(m_record.yc_ds[1], 44);
}

TEST_F(DoubleScanMove, UpwardsIsPositive) {
    // Row 7, column 0 to row 0, column 0: yc 50 - 93 = -43 to 44.
    ASSERT_EQ(CalcDoubleScanMove(ZoneWith({56}).data(), ZoneWith({0}).data(), &m_record), 0);
    EXPECT_EQ(m_record.dy_ds[0], 87);
    EXPECT_EQ(m_record.dx_ds[0], 0);
}

TEST_F(DoubleScanMove, FirstPairComparesWithTheEmptyMapAfterOneRegisterCall) {
    GetDoubleScanNaviBlock(0, 0x80000000U);
    ASSERT_EQ(CalcDoubleScanMove(DoubleScanZonePrev, DoubleScanZoneCurr, &m_record), 0);
    EXPECT_EQ(m_record.xc_ds[0], 0);
    EXPECT_EQ(m_record.yc_ds[0], 0);
    EXPECT_EQ(m_record.cvr_ds[0], 0);
    EXPECT_EQ(m_record.dx_ds[0], -44);
    EXPECT_EQ(m_record.dy_ds[0], 44);
}

TEST_F(DoubleScanMove, DisplacementStaysInMapPercent) {
    for (const int32_t flag : {0, 1}) {
        Params().Set("s_dimensionlessFlag", flag).Set("s_DoubleScanCvrThreshold", 99).Apply();
        ASSERT_EQ(CalcDoubleScanMove(ZoneWith({0}).data(), ZoneWith({7}).data(), &m_record), 0);
        EXPECT_EQ(m_record.dx_ds[0], 87);
    }
}

TEST_F(DoubleScanMove, NullMapFailsAndWritesNothing) {
    std::memset(static_cast<void*>(&m_record), 0x22, sizeof(m_record));
    m_record.calc_cnt = 0;
    const NaviVoteInfo_t before = m_record;
    const Zone zone = ZoneWith({0});
    EXPECT_EQ(CalcDoubleScanMove(nullptr, zone.data(), &m_record), -1);
    EXPECT_EQ(CalcDoubleScanMove(zone.data(), nullptr, &m_record), -1);
    EXPECT_EQ(std::memcmp(&m_record, &before, sizeof(before)), 0);
}

}  // namespace
