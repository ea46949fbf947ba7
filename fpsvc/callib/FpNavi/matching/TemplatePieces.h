// Templates cut into pieces of at most 64 pixels and 16 columns, and the grey differences of a
// piece at neighbouring placements. Owns nothing.
//
// Requirement: the sum of the grey differences of a template at each of its placements.
//
// Observation: a strip is a copy of the searched frame as wide as a piece, its rows one behind the
// other without gaps. The pixels of every placement of the piece in it are consecutive bytes, as
// those of the packed piece are.
//
// Algorithm: cut the strips of a block of placements, one for each of its columns, then score all
// placements of the block. In one loop, loads of other widths would wait for the stores just before
// them. Four neighbouring placements are scored together and share the horizontal additions.
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

// A strip of w columns for a piece of h rows has (kBlockRows + h - 1) * w <= 15 * 16 + 64 bytes.
// The last store of sixteen bytes starts in it, and a patch of at most 64 bytes at 15 * w or
// before: 64 bytes more suffice for both.
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

// Writes the pixels of a piece of tplt in frame one behind the other to packed [out], kPiecePixels
// bytes, of which those behind the piece become 0.
void PackPiece(const LaidFrame& frame, const Template& tplt, const Piece& piece, uint8_t* packed);

// A block of placements: those of rows x columns corners from (i, j) on, at most kBlockRows x
// kBlockColumns.
struct PlacementBlock {
    int32_t i;
    int32_t j;
    int32_t rows;
    int32_t columns;
};

// Cuts the strips of a block for a piece to strips [out], kStripsBytes bytes of the caller's: one
// strip for each column of the block, kStripBytes apart. frame: the searched one, of which up to 15
// bytes behind the pixels are read.
void CutStrips(const LaidFrame& frame, const PlacementBlock& block, const Piece& piece,
               uint8_t* strips);

// Where the scores of a block go: the means of a template of one piece, or the sums of a piece to
// be added up. Arrays are the caller's.
struct ScoreTarget {
    uint8_t* means;  // of the block's first placement, in a table of tableColumns; or null
    uint32_t* sums;  // else: kBlockColumns for each row of the block
    bool first;      // the sums are set by this piece, not added to
    int32_t tableColumns;
    uint32_t reciprocal;  // of the template's pixels, for means
};

// 1 / pixels in units of 1/2^20, rounded up, for 1 <= pixels <= 64. Times a sum of as many greys,
// at most 64 * 255, it exceeds the quotient by less than 64 * 255 / 2^20 < 1 / 64 <= 1 / pixels:
// the truncated quotient is exact. The product is at most 255 * (2^20 + 64) < 2^32.
inline constexpr int32_t kReciprocalBits = 20;
uint32_t ReciprocalOf(int32_t pixels);

// Scores a piece at all placements of a block. packed [in]: of PackPiece; strips [in]: of CutStrips
// for this block and piece.
void ScorePiece(const PlacementBlock& block, const Piece& piece, const uint8_t* packed,
                const uint8_t* strips, const ScoreTarget& target);

}  // namespace fpnavi

#endif  // FPNAVI_TEMPLATEPIECES_H
