#include "matching/TemplatePieces.h"

#include <algorithm>
#include <cstring>

namespace fpnavi {
namespace {

constexpr int32_t kSteps = kPiecePixels / kLanes;
constexpr int32_t kTogether = 4;  // neighbouring placements

// A piece as it is compared: full steps of sixteen pixels, and one step of what remains.
struct LoadedPiece {
    Bytes16 bytes[kSteps];
    Bytes16 rest;  // 255 for the pixels of the last step that belong to the piece
};

LoadedPiece LoadPiece(const uint8_t* packed, int32_t pixels) {
    LoadedPiece piece;
    for (int32_t step = 0; step < kSteps; ++step)
        piece.bytes[step] = Load16(packed + step * kLanes);
    piece.rest = FirstBytes(pixels % kLanes);
    return piece;
}

// Sum of the differences between a piece, kFullSteps full steps and one masked step if there are
// fewer than kSteps, and the placement at patch [in], which is read in steps of sixteen.
template <int32_t kFullSteps>
Sums PatchDifference(const uint8_t* patch, const LoadedPiece& piece) {
    Sums sums = NoSums();
    for (int32_t step = 0; step < kFullSteps; ++step)
        sums = AddDiffs(sums, Load16(patch + step * kLanes), piece.bytes[step]);
    if constexpr (kFullSteps < kSteps)
        sums = AddDiffs(sums, And16(Load16(patch + kFullSteps * kLanes), piece.rest),
                        piece.bytes[kFullSteps]);
    return sums;
}

template <int32_t kFullSteps>
[[gnu::always_inline]] inline Quads PatchDifferences(const uint8_t* patch,
                                                     const LoadedPiece& piece) {
    return Totals(PatchDifference<kFullSteps>(patch, piece),
                  PatchDifference<kFullSteps>(patch + kStripBytes, piece),
                  PatchDifference<kFullSteps>(patch + 2 * kStripBytes, piece),
                  PatchDifference<kFullSteps>(patch + 3 * kStripBytes, piece));
}

// Two ways to store the sums of four neighbouring placements; the last group of a row may have
// fewer. This one stores their means in the table.
struct MeanStore {
    uint8_t* means;
    int32_t tableColumns;
    uint32_t reciprocal;

    void StoreFour(int32_t row, int32_t column, const Quads& sums) const {
        StoreScaled(means + row * tableColumns + column, sums, reciprocal, kReciprocalBits);
    }
    void StoreSome(int32_t row, int32_t column, int32_t count, const Quads& sums) const {
        uint8_t four[kTogether];
        StoreScaled(four, sums, reciprocal, kReciprocalBits);
        std::memcpy(means + row * tableColumns + column, four, static_cast<size_t>(count));
    }
};

// This one adds the sums up over the pieces of a template.
struct SumStore {
    uint32_t* sums;
    bool first;

    void StoreFour(int32_t row, int32_t column, const Quads& quads) const {
        uint32_t four[kTogether];
        StoreQuads(four, quads);
        uint32_t* const at = sums + row * kBlockColumns + column;
        for (int32_t n = 0; n < kTogether; ++n)
            at[n] = first ? four[n] : at[n] + four[n];
    }
    void StoreSome(int32_t row, int32_t column, int32_t /*count*/, const Quads& quads) const {
        StoreFour(row, column, quads);
    }
};

// Arguments by value and a local copy of the piece: stores of bytes may alias anything that is
// reached by reference, which would then be loaded again for each placement.
template <int32_t kFullSteps, typename Store>
void ScoreRows(PlacementBlock block, int32_t stripWidth, const LoadedPiece& piece,
               const uint8_t* strips, Store store) {
    const LoadedPiece loaded = piece;
    for (int32_t row = 0; row < block.rows; ++row, strips += stripWidth) {
        const uint8_t* patch = strips;
        int32_t c = 0;
        for (; c + kTogether <= block.columns; c += kTogether, patch += kTogether * kStripBytes)
            store.StoreFour(row, c, PatchDifferences<kFullSteps>(patch, loaded));
        if (c < block.columns)
            store.StoreSome(row, c, block.columns - c, PatchDifferences<kFullSteps>(patch, loaded));
    }
}

template <int32_t kFullSteps>
void ScoreBlock(const PlacementBlock& block, const Piece& piece, const uint8_t* packed,
                const uint8_t* strips, const ScoreTarget& target) {
    const LoadedPiece loaded = LoadPiece(packed, piece.Pixels());
    if (target.means != nullptr)
        ScoreRows<kFullSteps>(block, piece.columns, loaded, strips,
                              MeanStore{target.means, target.tableColumns, target.reciprocal});
    else
        ScoreRows<kFullSteps>(block, piece.columns, loaded, strips,
                              SumStore{target.sums, target.first});
}

}  // namespace

int32_t PieceCount(const Template& tplt) {
    return ForEachPiece(tplt.width, tplt.height, [](const Piece&) {});
}

void PackPiece(const LaidFrame& frame, const Template& tplt, const Piece& piece, uint8_t* packed) {
    std::memset(packed, 0, kPiecePixels);
    for (int32_t r = 0; r < piece.rows; ++r)
        std::memcpy(packed + r * piece.columns,
                    frame.grey + (tplt.i0 + piece.row + r) * frame.width + tplt.j0 + piece.column,
                    static_cast<size_t>(piece.columns));
}

void CutStrips(const LaidFrame& frame, const PlacementBlock& block, const Piece& piece,
               uint8_t* strips) {
    const uint8_t* const corner =
        frame.grey + (block.i + piece.row) * frame.width + block.j + piece.column;
    const int32_t rows = block.rows + piece.rows - 1;
    for (int32_t c = 0; c < block.columns; ++c) {
        const uint8_t* from = corner + c;
        uint8_t* to = strips + c * kStripBytes;
        // Bytes beyond the end of a row are overwritten by the next row.
        int32_t r = 0;
        for (; r + 2 <= rows; r += 2, from += 2 * frame.width, to += 2 * piece.columns) {
            Store16(to, Load16(from));
            Store16(to + piece.columns, Load16(from + frame.width));
        }
        if (r < rows)
            Store16(to, Load16(from));
    }
}

uint32_t ReciprocalOf(int32_t pixels) {
    const uint32_t divisor = static_cast<uint32_t>(pixels);
    return ((1U << kReciprocalBits) + divisor - 1) / divisor;
}

void ScorePiece(const PlacementBlock& block, const Piece& piece, const uint8_t* packed,
                const uint8_t* strips, const ScoreTarget& target) {
    switch (piece.Pixels() / kLanes) {
        case 0:
            return ScoreBlock<0>(block, piece, packed, strips, target);
        case 1:
            return ScoreBlock<1>(block, piece, packed, strips, target);
        case 2:
            return ScoreBlock<2>(block, piece, packed, strips, target);
        case 3:
            return ScoreBlock<3>(block, piece, packed, strips, target);
        default:
            return ScoreBlock<4>(block, piece, packed, strips, target);
    }
}

}  // namespace fpnavi
