// The grey differences of all placements of small templates, strip by strip. Owns the table that
// it fills anew with each call.
#ifndef FPNAVI_PLACEMENTDIFFS_H
#define FPNAVI_PLACEMENTDIFFS_H

#include <cstdint>

#include "matching/Templates.h"

namespace fpnavi {

inline constexpr int32_t kPlacementMax = 512;  // of one template; 465 by default

// Mean grey differences of the placements of one template, row by row. Behind the last one stand
// bytes of 255 up to a multiple of sixteen.
struct PlacementDiffs {
    int32_t iFirst;
    int32_t jFirst;
    int32_t rows;
    int32_t columns;
    uint8_t diff[kPlacementMax];

    int32_t Count() const { return rows * columns; }
};

// All valid templates of set have at most 64 pixels, 16 columns and kPlacementMax placements, and
// the frames fit words.
bool CanTabulate(const TemplateSet& set);

// Scores all placements of the valid templates of set, for which CanTabulate. Returns a table for
// each of the kTpltMax templates, an invalid one without rows; it holds until the next call.
const PlacementDiffs* TabulatePlacements(const TemplateSet& set);

}  // namespace fpnavi

#endif  // FPNAVI_PLACEMENTDIFFS_H
