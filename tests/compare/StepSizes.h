// Sizes of frames, bands, templates and placements for the comparison of single steps, often where
// a row needs another step of sixteen or another word of 64; and counts of what cases were drawn.
#ifndef TESTS_COMPARE_STEPSIZES_H
#define TESTS_COMPARE_STEPSIZES_H

#include <cstdint>
#include <initializer_list>
#include <string>
#include <utility>
#include <vector>

#include "simulator/Arithmetic.h"

namespace fpnavi_test {

// Either side of one step, one word and two words.
inline constexpr int32_t kEdges[] = {15, 16, 17, 63, 64, 65, 127, 128, 129};

struct FrameSize {
    int32_t width;
    int32_t height;

    size_t Pixels() const { return static_cast<size_t>(width) * static_cast<size_t>(height); }
};

// Every edge in both axes: 81 sizes.
std::vector<FrameSize> EdgeSizes();

int32_t RandomEdge(host::SimRandom& random);

// Sides of 1..70, often one of the edges, seldom up to 200; at most 20,000 pixels.
FrameSize RandomSize(host::SimRandom& random);

// A length of 0..most: an edge, half or all of it, or any.
int32_t RandomLength(host::SimRandom& random, int32_t most);

// Cases by class. A run in which a class had no case proves less than it seems to, and fails.
class CaseClasses {
  public:
    CaseClasses(std::string what, std::initializer_list<const char*> classes);

    // A number beyond the last class counts for the last.
    void Note(int32_t number);
    // Each class had a case. Keeps the numbers in the test's report.
    void ExpectAll() const;

  private:
    std::string m_what;
    std::vector<std::pair<std::string, int32_t>> m_classes;
};

// Frames by the words of a row: 1, 2, 3 and more.
class WordClasses : public CaseClasses {
  public:
    WordClasses() : CaseClasses("words", {"1", "2", "3"}) {}
    void NoteWidth(int32_t width) { Note((width - 1) / 64); }
};

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_STEPSIZES_H
