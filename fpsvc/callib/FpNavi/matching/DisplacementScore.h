// Compares two frames at a displacement of their full images without reading these: the nine tiles
// of one meet the tiles of the other, each pair of them at an offset of its own. Owns nothing.
//
// Requirement: the mean grey difference of two full images, one displaced against the other.
// Observation: a tile is displaced within the full image by a gap for each tile before it. So a
// pixel of band b of one axis that meets band b + step of the other frame lies there, within the
// frame, displacement - step * gap further on.
// Algorithm: along each axis, list the places that meet for each step; each pair of a step of the
// rows and a step of the columns is a pairing of the two frames.
#ifndef FPNAVI_DISPLACEMENTSCORE_H
#define FPNAVI_DISPLACEMENTSCORE_H

#include <cstdint>

#include "frame/FramePair.h"
#include "matching/Templates.h"

namespace fpnavi {

inline constexpr int32_t kDiffWorst = 255;  // score of too little common finger area

// One axis of the frames, cut into bands with a gap between two of them.
struct TileAxis {
    Span bands[kBandMax];
    int32_t count;  // bands; 0 when they do not make up the side
    int32_t gap;
    int32_t fullSide;  // of the full image
};

// What meets along the rows at a displacement, a meeting for each step at which anything does: a
// displacement leads to bands further on or to bands before, so that there are at most three steps.
struct RowMeetings {
    int32_t displacement;
    int32_t places;  // in all steps
    int32_t count;
    Meeting steps[kBandMax];
};

// The same along the columns. A slot holds what the last displacement that came to it needed.
struct ColumnMeetings {
    int32_t displacement;
    int32_t places;
    int32_t count;  // -1 in an empty slot
    Columns steps[kBandMax];
};

inline constexpr int32_t kColumnSlots = 32;  // of a search; candidates often share their columns

// Scores displacements of a pair of frames, one after the other.
class DisplacementScore {
  public:
    // slots [out]: count of them, a power of two, the caller's.
    DisplacementScore(const SearchParams& params, const FramePair& pair, ColumnMeetings* slots,
                      int32_t count);

    // Mean grey difference over the finger area that both frames have in common when pixel
    // (row, column) of pair.Cut() meets (row + di, column + dj) of pair.Searched(), counted in the
    // full images when there are such; kDiffWorst when there is too little. A result above most
    // says only that the score is above it.
    int32_t At(const Displacement& displacement, int32_t most);

  private:
    const ColumnMeetings& ColumnsAt(int32_t dj);

    const LaidFrame& m_first;
    const LaidFrame& m_second;
    const int32_t m_overlapAreaMin;
    const TileAxis m_rowAxis;
    const TileAxis m_columnAxis;
    RowMeetings m_rows;  // of the last displacement
    ColumnMeetings* const m_slots;
    const int32_t m_slotMask;
};

}  // namespace fpnavi

#endif  // FPNAVI_DISPLACEMENTSCORE_H
