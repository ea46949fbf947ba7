// Parameters of the candidate search and the match: tiles, gaps, templates, often at the edges, and
// cheap enough for the plain model.
#ifndef TESTS_COMPARE_STEPSEARCHPARAMS_H
#define TESTS_COMPARE_STEPSEARCHPARAMS_H

#include <cstdint>

#include "StepSizes.h"
#include "parameters/ParamTable.h"

namespace fpnavi_test {

// Tiles, gaps, templates and thresholds for an image of size: fitting ones for the most part.
host::ParamBlock RandomSearchParams(host::SimRandom& random, FrameSize size);

// The same without the thresholds: tiles, gaps, templates and the number of candidates. most: byte
// comparisons of the search and of the match, each, that the plain model may take.
void DrawSearch(host::SimRandom& random, FrameSize size, double most, host::ParamBlock& params);

// Tiles of the whole image: borders of bound, gaps of gap, the centre between them.
void SetTiles(host::ParamBlock& params, FrameSize size, int32_t bound, int32_t gap);

// Searches by what decides how they are done.
class SearchClasses {
  public:
    void Note(const host::ParamBlock& params);
    void ExpectAll() const;

  private:
    WordClasses m_words;
    CaseClasses m_pieces{"pieces", {"1", "2"}};
    CaseClasses m_blocks{"blocks", {"1", "2"}};  // of 16 x 16 placements
    CaseClasses m_tiled{"layout", {"plain", "one_band", "bands"}};
};

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_STEPSEARCHPARAMS_H
