// How many gestures a comparison takes, which ones, and what they were.
//
// FPNAVI_COMPARE_GESTURES sets the number of gestures of all tests together (default 10,000),
// FPNAVI_COMPARE_SEED another seed.
#ifndef TESTS_COMPARE_COMPARERUN_H
#define TESTS_COMPARE_COMPARERUN_H

#include <cstdint>
#include <map>
#include <string>

#include "parameters/ParamTable.h"

namespace fpnavi_test {

// A test's part of all gestures, in percent; at least 1.
int64_t Gestures(int64_t percent);

// The seed of gesture index of a test.
uint64_t SeedOf(uint64_t test, int64_t index);

// Gestures by class: the sensor and its words, templates, layout, and what came of them.
class GestureCounts {
  public:
    // A gesture under params has ended: its record is read.
    void Note(const host::ParamBlock& params);
    void Note(const std::string& what) { ++m_counts[what]; }
    // Keeps the numbers in the test's report, with the calls of the twin.
    void Record() const;

  private:
    void NoteSensor(const host::ParamBlock& params);
    void NoteRecord();

    std::map<std::string, int32_t> m_counts;
};

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_COMPARERUN_H
