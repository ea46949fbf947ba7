// The navigation frame: initialisation from an image, release, copy, and failing allocations.
#include <gtest/gtest.h>

#include <vector>

#include "FailingMalloc.h"
#include "Fixtures.h"
#include "frame/NaviFrame.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

constexpr int32_t kWidth = 56;  // of the default fp image
constexpr int32_t kHeight = 36;

class NaviFrame : public NaviTest {
  protected:
    void SetUp() override {
        NaviTest::SetUp();
        Params().Apply();
        m_image = NoisePatch(0, 0, kHeight, kWidth);
    }
    void TearDown() override {
        ImgClear(&m_frame);
        ImgClear(&m_copy);
        NaviTest::TearDown();
    }
    int32_t InitWhole() { return ImgInit(&m_frame, 0, kHeight, 0, kWidth, m_image.data()); }
    // A filled frame whose measures and classes are all non-zero.
    void FillAndMark() {
        ASSERT_EQ(InitWhole(), 0);
        for (int32_t i = 0; i < kWidth * kHeight; ++i)
            m_frame.pType[i] = 1;
        m_frame.cvr = 60;
        m_frame.range = 70;
        m_frame.xc = -8;
        m_frame.yc = 9;
    }

    std::vector<uint8_t> m_image;
    NaviFrame_t m_frame{};
    NaviFrame_t m_copy{};
};

TEST_F(NaviFrame, InitOfTheWholeImageIsTheImageByteForByte) {
    ASSERT_EQ(InitWhole(), 0);
    EXPECT_EQ(m_frame.width, 56);
    EXPECT_EQ(m_frame.height, 36);
    EXPECT_EQ(Bytes(m_frame.pData, kWidth * kHeight), m_image);
    EXPECT_EQ(Bytes(m_frame.pType, kWidth * kHeight), std::vector<uint8_t>(2016, 0));
    EXPECT_TRUE(HasPixels(&m_frame));
}

TEST_F(NaviFrame, InitOfAWindowTakesItsRowsAndColumns) {
    ASSERT_EQ(ImgInit(&m_frame, 3, 6, 10, 14, m_image.data()), 0);
    EXPECT_EQ(m_frame.width, 4);
    EXPECT_EQ(m_frame.height, 3);
    EXPECT_EQ(Bytes(m_frame.pData, 12), NoisePatch(3, 10, 3, 4));
}

TEST_F(NaviFrame, InitWithNullDataLeavesAFilledFrameUntouched) {
    FillAndMark();
    const NaviFrame_t before = m_frame;
    FailingMalloc::Count();
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, 0, kWidth, nullptr), -1);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Frees(), 0) << "the old buffers are not even freed";
    EXPECT_EQ(m_frame.pData, before.pData);
    EXPECT_EQ(m_frame.pType, before.pType);
    EXPECT_EQ(m_frame.cvr, 60);
    EXPECT_EQ(Bytes(m_frame.pData, kWidth * kHeight), m_image);
}

TEST_F(NaviFrame, InitRejectsANullFrame) {
    EXPECT_EQ(ImgInit(nullptr, 0, kHeight, 0, kWidth, m_image.data()), -1);
}

TEST_F(NaviFrame, InitRejectsEmptyWindowsAndWindowsBeyondTheImage) {
    const uint8_t* data = m_image.data();
    EXPECT_EQ(ImgInit(&m_frame, 5, 5, 0, kWidth, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 6, 5, 0, kWidth, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, 7, 7, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, 8, 7, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight + 1, 0, kWidth, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, 0, kWidth + 1, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, kHeight + 1, kHeight + 2, 0, kWidth, data), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, kWidth + 1, kWidth + 2, data), -1);
    EXPECT_TRUE(IsEmpty(m_frame));
}

TEST_F(NaviFrame, InitRejectsNegativeStarts) {
    EXPECT_EQ(ImgInit(&m_frame, -1, kHeight, 0, kWidth, m_image.data()), -1);
    EXPECT_EQ(ImgInit(&m_frame, 0, kHeight, -1, kWidth, m_image.data()), -1);
    EXPECT_TRUE(IsEmpty(m_frame));
}

TEST_F(NaviFrame, InitOverAFilledFrameFreesTheOldBuffersAndStartsClean) {
    FillAndMark();
    const uint8_t* oldData = m_frame.pData;
    const uint8_t* oldType = m_frame.pType;
    FailingMalloc::Count();
    ASSERT_EQ(InitWhole(), 0);
    FailingMalloc::Off();
    EXPECT_TRUE(FailingMalloc::WasFreed(oldData));
    EXPECT_TRUE(FailingMalloc::WasFreed(oldType));
    EXPECT_EQ(FailingMalloc::Allocations(), 2);
    EXPECT_EQ(Bytes(m_frame.pType, kWidth * kHeight), std::vector<uint8_t>(2016, 0));
    EXPECT_EQ(m_frame.cvr, 0);
    EXPECT_EQ(m_frame.range, 0);
    EXPECT_EQ(m_frame.xc, 0);
    EXPECT_EQ(m_frame.yc, 0);
}

TEST_F(NaviFrame, InitWithAFailedAllocationKeepsTheSizesButNoBuffer) {
    for (const int nth : {1, 2}) {
        ImgClear(&m_frame);
        FillAndMark();
        FailingMalloc::FailNth(nth);
        EXPECT_EQ(ImgInit(&m_frame, 0, 4, 0, 5, m_image.data()), -1);
        FailingMalloc::Off();
        EXPECT_EQ(FailingMalloc::Failures(), 1);
        EXPECT_EQ(FailingMalloc::Live(), 0) << "the one that succeeded is freed";
        EXPECT_EQ(m_frame.pData, nullptr);
        EXPECT_EQ(m_frame.pType, nullptr);
        EXPECT_EQ(m_frame.width, kWidth) << "the old sizes stay";
        EXPECT_EQ(m_frame.height, kHeight);
        EXPECT_FALSE(HasPixels(&m_frame));
    }
}

TEST_F(NaviFrame, ClearFreesBothBuffersAndZeroesTheRecord) {
    FillAndMark();
    const uint8_t* oldData = m_frame.pData;
    const uint8_t* oldType = m_frame.pType;
    FailingMalloc::Count();
    ImgClear(&m_frame);
    FailingMalloc::Off();
    EXPECT_TRUE(FailingMalloc::WasFreed(oldData));
    EXPECT_TRUE(FailingMalloc::WasFreed(oldType));
    EXPECT_TRUE(IsEmpty(m_frame));
}

TEST_F(NaviFrame, ClearOfNullOrTwiceDoesNothing) {
    FillAndMark();
    ImgClear(&m_frame);
    FailingMalloc::Count();
    ImgClear(&m_frame);
    ImgClear(nullptr);
    FailingMalloc::Off();
    EXPECT_EQ(FailingMalloc::Frees(), 0);
    EXPECT_TRUE(IsEmpty(m_frame));
}

TEST_F(NaviFrame, CopyTakesBuffersAndMeasures) {
    FillAndMark();
    ASSERT_EQ(ImgCopy(&m_copy, &m_frame), 0);
    EXPECT_EQ(m_copy.width, kWidth);
    EXPECT_EQ(m_copy.height, kHeight);
    EXPECT_EQ(Bytes(m_copy.pData, kWidth * kHeight), m_image);
    EXPECT_EQ(Bytes(m_copy.pType, kWidth * kHeight), std::vector<uint8_t>(2016, 1));
    EXPECT_EQ(m_copy.cvr, 60);
    EXPECT_EQ(m_copy.range, 70);
    EXPECT_EQ(m_copy.xc, -8);
    EXPECT_EQ(m_copy.yc, 9);
}

TEST_F(NaviFrame, CopySharesNoBufferWithItsSource) {
    FillAndMark();
    ASSERT_EQ(ImgCopy(&m_copy, &m_frame), 0);
    EXPECT_NE(m_copy.pData, m_frame.pData);
    EXPECT_NE(m_copy.pType, m_frame.pType);
    ImgClear(&m_frame);
    EXPECT_EQ(Bytes(m_copy.pData, kWidth * kHeight), m_image);
    EXPECT_EQ(m_copy.cvr, 60);
}

TEST_F(NaviFrame, CopyOverAFilledFrameFreesItsBuffers) {
    FillAndMark();
    ASSERT_EQ(ImgCopy(&m_copy, &m_frame), 0);
    const uint8_t* oldData = m_copy.pData;
    FailingMalloc::Count();
    ASSERT_EQ(ImgCopy(&m_copy, &m_frame), 0);
    FailingMalloc::Off();
    EXPECT_TRUE(FailingMalloc::WasFreed(oldData));
    EXPECT_EQ(FailingMalloc::Allocations(), 2);
    EXPECT_EQ(FailingMalloc::Frees(), 2);
}

TEST_F(NaviFrame, CopyToNowhereFails) {
    FillAndMark();
    EXPECT_EQ(ImgCopy(nullptr, &m_frame), -1);
    EXPECT_EQ(Bytes(m_frame.pData, kWidth * kHeight), m_image);
}

TEST_F(NaviFrame, CopyFromAnEmptySourceLeavesTheDestinationAsItWas) {
    FillAndMark();
    const NaviFrame_t empty{};
    const uint8_t* oldData = m_frame.pData;
    EXPECT_EQ(ImgCopy(&m_frame, &empty), -1);
    EXPECT_EQ(m_frame.pData, oldData);
    EXPECT_EQ(m_frame.width, kWidth);
    EXPECT_EQ(m_frame.cvr, 60);
    EXPECT_EQ(Bytes(m_frame.pData, kWidth * kHeight), m_image);
}

TEST_F(NaviFrame, CopyRejectsASourceWithoutABufferOrASize) {
    TestFrame source(4, 3, 1, 1);
    const NaviFrame_t good = *source.Get();
    for (int32_t defect = 0; defect < 4; ++defect) {
        *source.Get() = good;
        if (defect == 0)
            source->pData = nullptr;
        if (defect == 1)
            source->pType = nullptr;
        if (defect == 2)
            source->width = 0;
        if (defect == 3)
            source->height = -3;
        EXPECT_EQ(ImgCopy(&m_copy, source.Get()), -1) << defect;
        EXPECT_TRUE(IsEmpty(m_copy));
    }
}

TEST_F(NaviFrame, CopyWithAFailedAllocationHasTheNewSizesButNoBuffer) {
    TestFrame source(4, 3, 1, 1);
    for (const int nth : {1, 2}) {
        ImgClear(&m_frame);
        FillAndMark();
        FailingMalloc::FailNth(nth);
        EXPECT_EQ(ImgCopy(&m_frame, source.Get()), -1);
        FailingMalloc::Off();
        EXPECT_EQ(FailingMalloc::Live(), 0);
        EXPECT_EQ(m_frame.pData, nullptr);
        EXPECT_EQ(m_frame.pType, nullptr);
        EXPECT_EQ(m_frame.width, 4);
        EXPECT_EQ(m_frame.height, 3);
    }
}

}  // namespace
