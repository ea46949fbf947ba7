// Templates cut into pieces of at most 64 pixels and 16 columns, and the grey differences of a
// piece at neighbouring placements. Owns nothing.
//
// Requirement: the sum of the grey differences of a template at each of its placements.
// Observation: a strip is as wide as a piece and runs down one column of the searched frame; its
// rows follow each other without gaps. So the pixels of every placement in it are consecutive
// bytes, as those of the piece are.
// Algorithm: the strips of sixteen columns of placements are cut first, and scored then: a store
// that is read back at once in other steps would have to reach memory first. Four neighbouring
// placements are summed up in turn, which shares the last steps of their sums.
#ifndef FPNAVI_TEMPLATEPIECES_H
#define FPNAVI_TEMPLATEPIECES_H

#include <cstdint>

#include "base/NaviSimd.h"
#include "matching/Templates.h"

namespace fpnavi {

inline constexpr int32_t kPiecePixels = 64;
inline constexpr int32_t kPieceWidth = kLanes;
inline constexpr int32_t kBlockRows = 16;     // placements that are scored together
inline constexpr int32_t kBlockColumns = 16;  // likewise

// A strip of w columns for a piece of h rows has (kBlockRows + h - 1) * w <= 15 * 16 + 64 bytes. A
// store of sixteen bytes starts in it; so does a patch, of 64 bytes.
inline constexpr int32_t kStripBytes = 15 * kPieceWidth + 2 * kPiecePixels;
inline constexpr int32_t kStripsBytes = kBlockColumns * kStripBytes;

// A rectangle of a template, from its row and column on.
struct Piece {
    int32_t row;
    int32_t column;
    int32_t rows;
    int32_t columns;

    int32_t Pixels() const { return rows * columns; }
};

// Calls visit(piece) for all pieces of a template of width x height pixels, and returns their
// number.
template <typename Visit>
int32_t ForEachPiece(int32_t width, int32_t height, Visit visit) {
    int32_t count = 0;
    for (int32_t column = 0; column < width; column += kPieceWidth) {
        const int32_t columns = std::min(kPieceWidth, width - column);
        const int32_t most = kPiecePixels / columns;
        for (int32_t row = 0; row < height; row += most, ++count)
            visit(Piece{row, column, std::min(most, height - row), columns});
    }
    return count;
}

// Number of pieces of a template.
int32_t PieceCount(const Template& tplt);

// Writes the pixels of a piece of tplt one behind the other, filled up with zeroes to kPiecePixels
// bytes.
void PackPiece(const LaidFrame& frame, const Template& tplt, const Piece& piece, uint8_t* packed);

// A block of placements: those of rows x columns corners from (i, j) on, at most kBlockRows x
// kBlockColumns.
struct PlacementBlock {
    int32_t i;
    int32_t j;
    int32_t rows;
    int32_t columns;
};

// Cuts the strips of a block for a piece, kStripBytes apart.
void CutStrips(const LaidFrame& frame, const PlacementBlock& block, const Piece& piece,
               uint8_t* strips);

// Means of one template's placements, or the sums of a piece to be added up.
struct ScoreTarget {
    uint8_t* means;  // of the block's first placement, in a table of tableColumns; or null
    uint32_t* sums;  // else: kBlockColumns for each row of the block
    bool first;      // the sums are set by this piece, not added to
    int32_t tableColumns;
    uint32_t reciprocal;  // of the template's pixels, for means
};

// 1 / pixels in 1/2^20, rounded up, for 1 <= pixels <= 64: times a sum of as many greys it is too
// large by less than 64 * 255 / 2^20 < 1 / 64, so that no quotient is.
inline constexpr int32_t kReciprocalBits = 20;
uint32_t ReciprocalOf(int32_t pixels);

// Scores a piece, packed, at all placements of a block.
void ScorePiece(const PlacementBlock& block, const Piece& piece, const uint8_t* packed,
                const uint8_t* strips, const ScoreTarget& target);

}  // namespace fpnavi

#endif  // FPNAVI_TEMPLATEPIECES_H
