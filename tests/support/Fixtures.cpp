// The shared fixture, the test frames and the fake FingerBLKTest.
#include "Fixtures.h"

#include <algorithm>
#include <utility>

#include "FailingMalloc.h"
#include "FingerDetect.h"
#include "frame/NaviFrame.h"

namespace fpnavi_test {
namespace {

std::vector<FingerBlkCall> s_blkCalls;
std::function<void(int32_t*)> s_blkAnswer;

constexpr uint8_t kJunk = 1;  // behind the pixels: finger, if anybody read it as a class

size_t Area(int32_t width, int32_t height) {
    return static_cast<size_t>(width) * static_cast<size_t>(height);
}

}  // namespace

void NaviTest::SetUp() {
    FailingMalloc::Off();
    FingerBlkFake::Reset();
    FpNaviClear();
}

void NaviTest::TearDown() {
    FailingMalloc::Off();
    FpNaviClear();
}

TestFrame::TestFrame(int32_t width, int32_t height, uint8_t grey, uint8_t type)
    : m_greys(static_cast<size_t>(fpnavi::FrameBytes(width, height)), kJunk),
      m_types(m_greys),
      m_frame{} {
    std::fill_n(m_greys.begin(), Area(width, height), grey);
    std::fill_n(m_types.begin(), Area(width, height), type);
    m_frame.width = width;
    m_frame.height = height;
    m_frame.pData = m_greys.data();
    m_frame.pType = m_types.data();
}

TestFrame::TestFrame(int32_t width, const std::vector<uint8_t>& greys, uint8_t type)
    : TestFrame(width, static_cast<int32_t>(greys.size()) / width, 0, type) {
    std::copy(greys.begin(), greys.end(), m_greys.begin());
}

std::vector<uint8_t> TestFrame::Pixels(const std::vector<uint8_t>& buffer) const {
    return Bytes(buffer.data(), m_frame.width * m_frame.height);
}

uint8_t& TestFrame::Grey(int32_t row, int32_t column) {
    return m_greys.at(Area(m_frame.width, row) + static_cast<size_t>(column));
}

uint8_t& TestFrame::Type(int32_t row, int32_t column) {
    return m_types.at(Area(m_frame.width, row) + static_cast<size_t>(column));
}

TestFrame& TestFrame::Mark(int32_t row, int32_t column, int32_t rows, int32_t columns,
                           uint8_t type) {
    for (int32_t r = row; r < row + rows; ++r) {
        for (int32_t c = column; c < column + columns; ++c)
            Type(r, c) = type;
    }
    return *this;
}

TestFrame& TestFrame::Paint(int32_t row, int32_t column, int32_t rows, int32_t columns,
                            uint8_t grey) {
    for (int32_t r = row; r < row + rows; ++r) {
        for (int32_t c = column; c < column + columns; ++c)
            Grey(r, c) = grey;
    }
    return *this;
}

uint8_t NoiseAt(int32_t row, int32_t column, uint32_t seed) {
    // A 64-bit finaliser: every bit of the place stirs every bit of the result.
    uint64_t mix = (static_cast<uint64_t>(static_cast<uint32_t>(row)) << 32) ^
                   static_cast<uint32_t>(column) ^ (static_cast<uint64_t>(seed) << 17);
    mix = (mix ^ (mix >> 30)) * 0xBF58476D1CE4E5B9ULL;
    mix = (mix ^ (mix >> 27)) * 0x94D049BB133111EBULL;
    return static_cast<uint8_t>(mix >> 56);
}

std::vector<uint8_t> NoisePatch(int32_t row, int32_t column, int32_t rows, int32_t columns) {
    std::vector<uint8_t> patch;
    for (int32_t r = row; r < row + rows; ++r) {
        for (int32_t c = column; c < column + columns; ++c)
            patch.push_back(NoiseAt(r, c));
    }
    return patch;
}

std::vector<uint8_t> RectImage(int32_t width, int32_t height, int32_t row, int32_t column,
                               int32_t rows, int32_t columns) {
    return TestFrame(width, height, 255).Paint(row, column, rows, columns, 0).Greys();
}

std::vector<uint8_t> Bytes(const uint8_t* data, int32_t size) {
    return {data, data + size};
}

bool IsEmpty(const NaviFrame_t& frame) {
    return frame.pData == nullptr && frame.pType == nullptr && frame.width == 0 &&
           frame.height == 0 && frame.cvr == 0 && frame.range == 0 && frame.xc == 0 &&
           frame.yc == 0;
}

const std::vector<FingerBlkCall>& FingerBlkFake::Calls() {
    return s_blkCalls;
}

void FingerBlkFake::SetAnswer(std::function<void(int32_t*)> answer) {
    s_blkAnswer = std::move(answer);
}

void FingerBlkFake::Reset() {
    s_blkCalls.clear();
    s_blkAnswer = nullptr;
}

}  // namespace fpnavi_test

extern "C" void FingerBLKTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                              int32_t mode) {
    fpnavi_test::FingerBlkCall call{image, width, height, {}, mode};
    std::copy(results, results + call.preset.size(), call.preset.begin());
    fpnavi_test::s_blkCalls.push_back(call);
    if (fpnavi_test::s_blkAnswer)
        fpnavi_test::s_blkAnswer(results);
}
