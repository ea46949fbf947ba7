// The templates of the candidate search: where they are cut and where they are placed. Owns
// nothing.
#ifndef FPNAVI_TEMPLATES_H
#define FPNAVI_TEMPLATES_H

#include <cstdint>

#include "frame/FramePair.h"

namespace fpnavi {

inline constexpr int32_t kTpltMax = 8;

// What the candidate search and the match read of the parameters, in pixels.
struct SearchParams {
    int32_t imageWidth;
    int32_t imageHeight;
    int32_t boundWidth;  // tiles of a frame: border, centre, border
    int32_t boundHeight;
    int32_t centerWidth;
    int32_t centerHeight;
    int32_t gapWidth;  // unread sensor pixels between two tiles
    int32_t gapHeight;
    bool tiled;           // the gaps count
    int32_t tpltNum;      // templates in use
    int32_t tpltWidthUD;  // of the wide templates
    int32_t tpltHeightUD;
    int32_t tpltWidthLR;  // of the tall ones
    int32_t tpltHeightLR;
    int32_t tpltSize;        // divisor of a placement's sum; below 1 there is no search
    int32_t candidateNum;    // candidates kept
    int32_t overlapAreaMin;  // a match needs more pixels that are finger in both frames
};

SearchParams CurrentSearchParams();

// A rectangle cut out of the template frame, and what turns a placement into a displacement.
struct Template {
    int32_t width;
    int32_t height;
    int32_t i0;  // top row in the frame
    int32_t j0;  // left column
    int32_t di;  // gap rows between the template's tile and the top of the full image
    int32_t dj;  // gap columns likewise
};

// The rows and columns that a template's top-left corner takes in the searched frame, inclusive.
struct Placements {
    int64_t iFirst;
    int64_t iLast;
    int64_t jFirst;
    int64_t jLast;

    bool Empty() const { return iLast < iFirst || jLast < jFirst; }
};

// A displacement of the frames that are compared: rows downwards, columns to the right.
struct Displacement {
    int32_t di;
    int32_t dj;

    bool operator==(const Displacement& other) const { return di == other.di && dj == other.dj; }
};

struct TemplateSet {
    Template tplts[kTpltMax];
    bool valid[kTpltMax];  // at least half of the template is finger
    int32_t gapHeight;
    int32_t gapWidth;
    int32_t tpltSize;
};

// Fills set [out] with the templates of pair.Cut(). Returns false when the template has no area,
// the frames are not of the image's size, a template does not lie in the frame, or a placement of a
// valid one does not lie in the frame or has a row or column above 255, which its key cannot hold.
bool CutTemplates(const SearchParams& params, const FramePair& pair, TemplateSet* set);

// Where tplt is placed: such that it lies in the centre region of the searched frame. With unequal
// borders that region is shifted.
Placements PlacementsOf(const SearchParams& params, const Template& tplt);

// Key of a placement: difference, row, column and template, each 0..255, from the top byte down.
// Smaller is better.
inline constexpr uint32_t kKeySentinel = 0xFF000000U;  // worse than every placement that counts
inline constexpr int32_t kDiffKept = 254;  // the worst difference that is better than a sentinel

inline uint32_t MakeKey(int32_t diff, int32_t i, int32_t j, int32_t k) {
    return static_cast<uint32_t>(diff) << 24 | static_cast<uint32_t>(i) << 16 |
           static_cast<uint32_t>(j) << 8 | static_cast<uint32_t>(k);
}

// The displacement of the key's placement.
Displacement DisplacementOf(const TemplateSet& set, uint32_t key);

}  // namespace fpnavi

#endif  // FPNAVI_TEMPLATES_H
