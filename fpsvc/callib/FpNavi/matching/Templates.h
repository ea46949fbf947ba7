// The templates of the candidate search: where they are cut and where they are placed. Owns
// nothing.
#ifndef FPNAVI_TEMPLATES_H
#define FPNAVI_TEMPLATES_H

#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

inline constexpr int32_t kTpltMax = 8;

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

// The templates of one search and the frames that it goes through.
struct TemplateSet {
    Template tplts[kTpltMax];
    bool valid[kTpltMax];         // at least half of it is finger
    const NaviFrame_t* cut;       // the frame with less finger gives the templates
    const NaviFrame_t* searched;  // the other one has room to find them
    int32_t tpltSize;             // pixels of each
};

// Cuts the templates from s_imageCurr or s_imagePrev. Returns false when the template has no area,
// a frame no pixels, or a template or a placement of a valid one would leave the frame or its key.
bool CutTemplates(TemplateSet* set);

Placements PlacementsOf(const Template& tplt);

// Key of a placement: difference, row, column, template, from the top byte down. Smaller is better.
inline constexpr uint32_t kKeySentinel = 0xFF000000U;  // worse than every placement that counts

inline uint32_t MakeKey(int32_t diff, int32_t i, int32_t j, int32_t k) {
    return static_cast<uint32_t>(diff) << 24 | static_cast<uint32_t>(i) << 16 |
           static_cast<uint32_t>(j) << 8 | static_cast<uint32_t>(k);
}

// The displacement of the key's placement.
Displacement DisplacementOf(const Template (&tplts)[kTpltMax], uint32_t key);

}  // namespace fpnavi

#endif  // FPNAVI_TEMPLATES_H
