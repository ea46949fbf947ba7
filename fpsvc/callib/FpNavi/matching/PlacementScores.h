// The mean grey differences of all placements of the templates. Owns nothing: the tables and all
// scratch lie in one block of memory that the caller allocates for a search.
#ifndef FPNAVI_PLACEMENTSCORES_H
#define FPNAVI_PLACEMENTSCORES_H

#include <cstdint>

#include "matching/DisplacementScore.h"
#include "matching/Templates.h"

namespace fpnavi {

// Mean grey differences of the placements of one template, row by row.
struct PlacementTable {
    int32_t k;       // the template
    int32_t iFirst;  // of the first placement
    int32_t jFirst;
    Displacement first;  // of the first placement
    int32_t rows;
    int32_t columns;
    uint8_t* diff;  // rows * columns
};

// Of the templates that are placed, in their order. The tables follow each other in memory.
struct PlacementTables {
    PlacementTable of[kTpltMax];
    int32_t count;       // templates
    int32_t placements;  // of all templates
};

// The memory of one search, cut from one block of bytes bytes. All is scratch: each part is written
// before it is read.
struct SearchMemory {
    uint32_t* keys;      // one for each candidate
    uint8_t* strips;     // of the searched frame
    uint32_t* sums;      // of a block's placements, for four templates
    MeetingSlot* slots;  // of the match, kMeetingSlots
    uint8_t* scores;     // all tables, and 16 bytes: a step of sixteen may read 15 of them
    size_t bytes;        // of all
};

// Cuts the memory of a search from block, the caller's, aligned to 16. With a null block only the
// member bytes of the result is of use: the size to allocate.
SearchMemory PlanMemory(const SearchParams& params, const TemplateSet& set, uint8_t* block);

// Scores all placements of the valid templates of set in pair.Searched(). The tables of the result
// lie in memory.scores; strips and sums of memory are overwritten.
PlacementTables ScorePlacements(const SearchParams& params, const TemplateSet& set,
                                const FramePair& pair, const SearchMemory& memory);

}  // namespace fpnavi

#endif  // FPNAVI_PLACEMENTSCORES_H
