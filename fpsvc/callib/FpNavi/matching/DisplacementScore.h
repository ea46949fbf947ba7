// Compares two frames at a displacement of their full images without reading the full images: the
// nine tiles of one frame meet those of the other, each pair of tiles at its own offset. Owns
// nothing.
//
// Requirement: the mean grey difference of two full images, one displaced against the other.
//
// Observation: on one axis a full image has a gap between two bands. Place p of band b that meets
// band b + step of the other frame meets p + offset there, in coordinates of the frame without
// gaps: offset = displacement - step * gap.
//
// Algorithm: along each axis, list the places that meet for each step. Each step of the rows with
// each step of the columns is one pairing of the two frames.
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

// What meets along one axis at a displacement: one step for each distance of bands at which any
// place does. Distances have the sign of the displacement, so there are at most three: 0, 1, 2 or
// 0, -1, -2.
template <typename Step>
struct Meetings {
    int32_t displacement;
    int32_t places;  // in all steps, at most the side: a place meets one band only
    int32_t count;   // -1: not made yet
    Step steps[kBandMax];
};

// The meetings of both axes that are kept for the next displacement: candidates often share their
// rows or columns.
struct MeetingSlot {
    Meetings<Meeting> rows;
    Meetings<Columns> columns;
};

inline constexpr int32_t kMeetingSlots = 32;  // of a search

// Scores displacements of a pair of frames, one after the other.
class DisplacementScore {
  public:
    // slots [out]: count of them, a power of two, the caller's; used by all calls of At.
    DisplacementScore(const SearchParams& params, const FramePair& pair, MeetingSlot* slots,
                      int32_t count);

    // Mean grey difference over the finger area that both frames have in common when pixel
    // (row, column) of pair.Cut() meets (row + di, column + dj) of pair.Searched(), in coordinates
    // of the full images when the frames are tiled; kDiffWorst when there is too little common
    // area. A result above most says only that the score is above most.
    int32_t At(const Displacement& displacement, int32_t most);

  private:
    const LaidFrame& m_first;
    const LaidFrame& m_second;
    const int32_t m_overlapAreaMin;
    const TileAxis m_rowAxis;
    const TileAxis m_columnAxis;
    MeetingSlot* const m_slots;
    const int32_t m_slotMask;
};

}  // namespace fpnavi

#endif  // FPNAVI_DISPLACEMENTSCORE_H
