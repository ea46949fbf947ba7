// What the unit tests share: a fixture that leaves the module cleared, frames that a test builds,
// deterministic textures, and the fake of the finger-detect module.
#ifndef TESTS_SUPPORT_FIXTURES_H
#define TESTS_SUPPORT_FIXTURES_H

#include <gtest/gtest.h>

#include <array>
#include <cstdint>
#include <functional>
#include <vector>

#include "FpNavi.h"
#include "Params.h"

namespace fpnavi_test {

// Clears the gesture, the fake and the failing allocations before and after each test. Parameters
// stay from test to test: each test that reads any applies its own block.
class NaviTest : public ::testing::Test {
  protected:
    void SetUp() override;
    void TearDown() override;
};

// A frame over buffers of the test's own, with the space behind the pixels that navigation frames
// have, filled with junk; never give it to a function that frees buffers.
class TestFrame {
  public:
    TestFrame(int32_t width, int32_t height, uint8_t grey = 0, uint8_t type = 0);
    TestFrame(int32_t width, const std::vector<uint8_t>& greys, uint8_t type = 0);
    TestFrame(const TestFrame&) = delete;
    TestFrame& operator=(const TestFrame&) = delete;

    uint8_t& Grey(int32_t row, int32_t column);
    uint8_t& Type(int32_t row, int32_t column);
    // Sets the class of rows x columns pixels from row, column on.
    TestFrame& Mark(int32_t row, int32_t column, int32_t rows, int32_t columns, uint8_t type = 1);
    // Sets the grey of that rectangle.
    TestFrame& Paint(int32_t row, int32_t column, int32_t rows, int32_t columns, uint8_t grey);

    NaviFrame_t* Get() { return &m_frame; }
    NaviFrame_t* operator->() { return &m_frame; }
    std::vector<uint8_t> Greys() const { return Pixels(m_greys); }
    std::vector<uint8_t> Types() const { return Pixels(m_types); }

  private:
    std::vector<uint8_t> Pixels(const std::vector<uint8_t>& buffer) const;

    std::vector<uint8_t> m_greys;
    std::vector<uint8_t> m_types;
    NaviFrame_t m_frame;
};

// Grey noise without structure, a fixed function of the place: 0..255.
uint8_t NoiseAt(int32_t row, int32_t column, uint32_t seed = 1);
// rows x columns of it, from row, column of an endless plane on.
std::vector<uint8_t> NoisePatch(int32_t row, int32_t column, int32_t rows, int32_t columns);

// White (255) image with a black (0) rectangle.
std::vector<uint8_t> RectImage(int32_t width, int32_t height, int32_t row, int32_t column,
                               int32_t rows, int32_t columns);

std::vector<uint8_t> Bytes(const uint8_t* data, int32_t size);
bool IsEmpty(const NaviFrame_t& frame);

// The finger-detect module as the tests define it.
struct FingerBlkCall {
    const uint8_t* image;
    int32_t width;
    int32_t height;
    std::array<int32_t, 10> preset;  // the results as the module handed them over
    int32_t mode;
};

class FingerBlkFake {
  public:
    static const std::vector<FingerBlkCall>& Calls();
    // answer writes into the ten results; without one they stay as they are.
    static void SetAnswer(std::function<void(int32_t* results)> answer);
    static void Reset();
};

}  // namespace fpnavi_test

#endif  // TESTS_SUPPORT_FIXTURES_H
