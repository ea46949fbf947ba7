// Compares two small frames at a displacement of their full images without building these: the
// nine tiles of one meet the tiles of the other, each pair of them at a displacement of its own.
// Owns how the tiles meet, for the frames and the displacement at hand.
#ifndef FPNAVI_TILEMATCH_H
#define FPNAVI_TILEMATCH_H

#include <cstdint>

#include "FpNavi.h"
#include "matching/Templates.h"

namespace fpnavi {

// Takes the two frames to compare, of one size that FitsWords, and that GetFullImg has taken when
// there are full images. A pixel (row, column) of the first will meet (row + di, column + dj) of
// the second, counted in the full images when there are such.
void SetMatchFrames(const NaviFrame_t& first, const NaviFrame_t& second);

inline constexpr int32_t kDiffWorst = 255;  // score of too little common finger area

// Mean grey difference over the finger area that both frames have in common at the displacement;
// kDiffWorst when there is too little. A result above most says only that the score is above it.
int32_t MatchAt(const Displacement& displacement, int32_t most);

}  // namespace fpnavi

#endif  // FPNAVI_TILEMATCH_H
