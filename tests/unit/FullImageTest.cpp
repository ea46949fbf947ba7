// GetFullImg: the nine tiles of a frame spread apart by the sensor's gaps.
#include <gtest/gtest.h>

#include <algorithm>
#include <utility>
#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "frame/NaviFrame.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

class FullImage : public NaviTest {
  protected:
    void TearDown() override {
        ImgClear(&m_full);
        NaviTest::TearDown();
    }
    uint8_t GreyAt(int32_t row, int32_t column) const {
        return m_full.pData[row * m_full.width + column];
    }
    uint8_t TypeAt(int32_t row, int32_t column) const {
        return m_full.pType[row * m_full.width + column];
    }
    NaviFrame_t m_full{};
};

TEST_F(FullImage, DefaultTilesLandAtTheirGapDistances) {
    Params().Apply();
    TestFrame source(56, NoisePatch(0, 0, 36, 56), 1);
    source.Grey(0, 8) = 101;
    source.Type(0, 8) = 11;
    source.Grey(8, 0) = 102;
    source.Type(8, 0) = 12;
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    EXPECT_EQ(m_full.width, 120);
    EXPECT_EQ(m_full.height, 68);
    EXPECT_EQ(GreyAt(0, 40), 101);  // 8 + 32
    EXPECT_EQ(TypeAt(0, 40), 11);
    EXPECT_EQ(GreyAt(24, 0), 102);  // 8 + 16
    EXPECT_EQ(TypeAt(24, 0), 12);
    for (int32_t column = 8; column < 40; ++column) {
        EXPECT_EQ(TypeAt(0, column), 255);
        EXPECT_EQ(GreyAt(0, column), 0);
    }
}

// Where a source column or row lies in the default full image.
int32_t FullColumn(int32_t column) {
    return column + (column < 8 ? 0 : (column < 48 ? 32 : 64));
}

int32_t FullRow(int32_t row) {
    return row + (row < 8 ? 0 : (row < 28 ? 16 : 32));
}

TEST_F(FullImage, EveryPixelOfTheDefaultLayoutIsATileOrAGapPixel) {
    Params().Apply();
    TestFrame source(56, NoisePatch(0, 0, 36, 56), 1);
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    TestFrame expected(120, 68, 0, 255);
    for (int32_t row = 0; row < 36; ++row) {
        for (int32_t column = 0; column < 56; ++column) {
            expected.Grey(FullRow(row), FullColumn(column)) = source.Grey(row, column);
            expected.Type(FullRow(row), FullColumn(column)) = 1;
        }
    }
    EXPECT_EQ(Bytes(m_full.pData, 120 * 68), expected.Greys());
    EXPECT_EQ(Bytes(m_full.pType, 120 * 68), expected.Types());
}

TEST_F(FullImage, WithoutGapsItIsTheSource) {
    Params().Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    TestFrame source(56, NoisePatch(0, 0, 36, 56), 1);
    source.Type(20, 20) = 0;
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    EXPECT_EQ(m_full.width, 56);
    EXPECT_EQ(m_full.height, 36);
    EXPECT_EQ(Bytes(m_full.pData, 2016), source.Greys());
    EXPECT_EQ(Bytes(m_full.pType, 2016), source.Types());
}

TEST_F(FullImage, WithoutGapsOnlyASource255IsA255) {
    Params().Set("s_gapWidth", 0).Set("s_gapHeight", 0).Apply();
    TestFrame source(56, 36, 3, 1);
    source.Type(5, 6) = 255;
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    EXPECT_EQ(Bytes(m_full.pType, 2016), source.Types());
}

TEST_F(FullImage, SourceOfTheWrongSizeLeavesTheDestinationUnchanged) {
    Params().Apply();
    TestFrame good(56, 36, 9, 1);
    ASSERT_EQ(GetFullImg(good.Get(), &m_full), 0);
    const NaviFrame_t before = m_full;
    TestFrame hg(40, 48, 1, 1);
    TestFrame wide(57, 36, 1, 1);
    TestFrame high(56, 37, 1, 1);
    FailingMalloc::Count();
    EXPECT_EQ(GetFullImg(hg.Get(), &m_full), -1);
    EXPECT_EQ(GetFullImg(wide.Get(), &m_full), -1);
    EXPECT_EQ(GetFullImg(high.Get(), &m_full), -1);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Frees(), 0);
    EXPECT_EQ(m_full.pData, before.pData);
    EXPECT_EQ(m_full.pType, before.pType);
    EXPECT_EQ(m_full.width, 120);
    EXPECT_EQ(m_full.height, 68);
}

TEST_F(FullImage, NullPointersAndSourcesWithoutBuffersFail) {
    Params().Apply();
    TestFrame source(56, 36, 9, 1);
    EXPECT_EQ(GetFullImg(nullptr, &m_full), -1);
    EXPECT_EQ(GetFullImg(source.Get(), nullptr), -1);
    const NaviFrame_t good = *source.Get();
    source->pData = nullptr;
    EXPECT_EQ(GetFullImg(source.Get(), &m_full), -1);
    *source.Get() = good;
    source->pType = nullptr;
    EXPECT_EQ(GetFullImg(source.Get(), &m_full), -1);
    EXPECT_TRUE(IsEmpty(m_full));
}

TEST_F(FullImage, SecondCallFreesTheFirstResult) {
    Params().Apply();
    TestFrame source(56, 36, 9, 1);
    FailingMalloc::Count();
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    const uint8_t* firstData = m_full.pData;
    const uint8_t* firstType = m_full.pType;
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    EXPECT_TRUE(FailingMalloc::WasFreed(firstData));
    EXPECT_TRUE(FailingMalloc::WasFreed(firstType));
    EXPECT_EQ(FailingMalloc::Live(), 2);
    ImgClear(&m_full);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Live(), 0) << "nothing leaks";
}

TEST_F(FullImage, FailedAllocationLeavesTheNewSizesWithoutBuffers) {
    Params().Apply();
    TestFrame source(56, 36, 9, 1);
    TestFrame old(4, 3, 1, 1);
    for (const int nth : {1, 2}) {
        ASSERT_EQ(ImgCopy(&m_full, old.Get()), 0);
        const uint8_t* oldData = m_full.pData;
        FailingMalloc::FailNth(nth);
        EXPECT_EQ(GetFullImg(source.Get(), &m_full), -1);
        FailingMalloc::Off();
        EXPECT_TRUE(FailingMalloc::WasFreed(oldData));
        EXPECT_EQ(FailingMalloc::Live(), 0);
        EXPECT_EQ(m_full.pData, nullptr);
        EXPECT_EQ(m_full.pType, nullptr);
        EXPECT_EQ(m_full.width, 120);
        EXPECT_EQ(m_full.height, 68);
    }
}

TEST_F(FullImage, MeasuresOfTheDestinationAreKept) {
    Params().Apply();
    TestFrame source(56, 36, 9, 1);
    source->cvr = 80;
    source->range = 81;
    m_full.cvr = 10;
    m_full.range = 11;
    m_full.xc = 12;
    m_full.yc = 13;
    ASSERT_EQ(GetFullImg(source.Get(), &m_full), 0);
    EXPECT_EQ(m_full.cvr, 10);
    EXPECT_EQ(m_full.range, 11);
    EXPECT_EQ(m_full.xc, 12);
    EXPECT_EQ(m_full.yc, 13);
}

TEST_F(FullImage, NegativeTileOrGapSizesFail) {
    TestFrame source(56, 36, 9, 1);
    // Each keeps the source's size right, 56 = Cw + 2 * Bw and 36 = Ch + 2 * Bh, or cannot matter.
    const std::vector<Params> bad = {Params().Set("s_gapWidth", -1),
                                     Params().Set("s_gapHeight", -1),
                                     Params().Set("s_boundWidth", -8).Set("s_centerWidth", 72),
                                     Params().Set("s_boundHeight", -8).Set("s_centerHeight", 52),
                                     Params().Set("s_boundWidth", 30).Set("s_centerWidth", -4),
                                     Params().Set("s_boundHeight", 20).Set("s_centerHeight", -4)};
    for (const Params& params : bad) {
        params.Apply();
        EXPECT_EQ(GetFullImg(source.Get(), &m_full), -1);
        EXPECT_TRUE(IsEmpty(m_full));
    }
}

TEST_F(FullImage, SidesOfMoreThan4096PixelsFail) {
    // The full width is 56 + 2 * gap, the full height 36 + 2 * gap.
    TestFrame source(56, 36, 9, 1);
    for (const auto& [gap, largest] : {std::pair<const char*, int32_t>{"s_gapWidth", 2020},
                                       std::pair<const char*, int32_t>{"s_gapHeight", 2030}}) {
        Params().Set(gap, largest + 1).Apply();
        EXPECT_EQ(GetFullImg(source.Get(), &m_full), -1) << gap;
        EXPECT_TRUE(IsEmpty(m_full)) << gap;
        Params().Set(gap, largest).Apply();
        EXPECT_EQ(GetFullImg(source.Get(), &m_full), 0) << gap;
        EXPECT_EQ(std::max(m_full.width, m_full.height), 4096) << gap;
        ImgClear(&m_full);
    }
}

}  // namespace
