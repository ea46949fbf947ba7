// Frames for the comparison of single steps: ridge-like and hostile greys, class maps with other
// bytes than 0 and 1. Everything follows from a seed.
#ifndef TESTS_COMPARE_STEPFRAMES_H
#define TESTS_COMPARE_STEPFRAMES_H

#include <gtest/gtest.h>

#include <cstdint>
#include <vector>

#include "FpNavi.h"
#include "Reference.h"
#include "StepSizes.h"
#include "simulator/Arithmetic.h"

namespace fpnavi_test {

// Cases of a test that has count of them by default; FPNAVI_COMPARE_GESTURES scales the number as
// it does the gestures (10,000 is the default). Never below 200.
int64_t StepCases(int64_t count);

// The random numbers of one case; FPNAVI_COMPARE_SEED gives others.
host::SimRandom StepRandom(uint64_t test, int64_t index);

// Mostly low..high, else a boundary of the type or of grey levels.
int32_t RandomThreshold(host::SimRandom& random, int32_t low, int32_t high);

std::vector<uint8_t> FlatBytes(FrameSize size, uint8_t value);

// Ridges in a finger's outline, noise, steps, gradients, single pixels, flat and extreme frames.
std::vector<uint8_t> RandomGreys(host::SimRandom& random, FrameSize size);

// A tile of columns x rows random greys, repeated from (column, row) of it on.
struct Pattern {
    int32_t columns;
    int32_t rows;
    std::vector<uint8_t> greys;
};
Pattern RandomPattern(host::SimRandom& random);
std::vector<uint8_t> RepeatPattern(const Pattern& pattern, FrameSize size, int32_t column,
                                   int32_t row);

// What could be the next frame: the same, shifted, brighter, noisy, or another one.
std::vector<uint8_t> NextGreys(host::SimRandom& random, const std::vector<uint8_t>& greys,
                               FrameSize size);

// Class maps: full, empty, outlines, noise; also with the classes 2 and 255.
std::vector<uint8_t> RandomTypes(host::SimRandom& random, FrameSize size);

// Fills the space behind the pixels of both buffers: with value, or, below 0, with random bytes.
constexpr int32_t kRandomJunk = -1;
void FillRoom(::NaviFrame_t* img, int32_t value);

// The same frame for both sides, each with heap buffers of exactly the bytes that its steps may
// touch; the space behind the module's pixels is full of junk. Measures start as numbers that no
// step leaves there by chance.
class TwinFrame {
  public:
    TwinFrame(FrameSize size, const std::vector<uint8_t>& greys, const std::vector<uint8_t>& types);
    TwinFrame(const TwinFrame&) = delete;
    TwinFrame& operator=(const TwinFrame&) = delete;

    ::NaviFrame_t* Module() { return &m_module; }
    reference::NaviFrame_t* Plain() { return &m_plain; }
    // All pixels of both buffers and all measures are equal.
    ::testing::AssertionResult Same() const;

  private:
    std::vector<uint8_t> m_greys;
    std::vector<uint8_t> m_types;
    std::vector<uint8_t> m_greysPlain;
    std::vector<uint8_t> m_typesPlain;
    ::NaviFrame_t m_module = {};
    reference::NaviFrame_t m_plain = {};
};

::testing::AssertionResult SameFrame(const ::NaviFrame_t& module,
                                     const reference::NaviFrame_t& plain);

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_STEPFRAMES_H
