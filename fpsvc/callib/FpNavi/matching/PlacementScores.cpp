// Requirement: the mean grey difference of every valid template at each of its placements.
//
// Observation: templates of one size are placed at the same corners. A strip is a copy of the
// searched frame, as wide as the template, its rows one behind the other: the pixels of a placement
// in it are consecutive bytes, as those of a packed template are.
//
// Algorithm: for the wide templates, then for the tall ones, in blocks of 16 x 16 placements: cut
// the strips of the block, one for each of its columns, then score the templates of that size at
// all placements of the block. In one loop, loads of other widths would wait for the stores just
// before them. Four neighbouring placements are scored together and share the horizontal additions.
// Templates of more than 64 pixels or 16 columns are cut into pieces, whose sums are added up.
#include "matching/PlacementScores.h"

#include <algorithm>
#include <cstring>

#include "base/NaviSimd.h"

namespace fpnavi {
namespace {

constexpr int32_t kPiecePixels = 64;
constexpr int32_t kPieceWidth = kLanes;
constexpr int32_t kSteps = kPiecePixels / kLanes;
constexpr int32_t kBlockRows = 16;     // placements that are scored together
constexpr int32_t kBlockColumns = 16;  // likewise
constexpr int32_t kBlockSums = kBlockRows * kBlockColumns;
constexpr int32_t kTogether = 4;  // neighbouring placements

// A strip of w columns for a piece of h rows has (kBlockRows + h - 1) * w <= 15 * 16 + 64 bytes.
// The last store of sixteen bytes starts in it, and a patch of at most 64 bytes at 15 * w or
// before: 64 bytes more suffice for both.
constexpr int32_t kStripBytes = 15 * kPieceWidth + 2 * kPiecePixels;

constexpr int32_t kAlike = 4;  // templates of one size
constexpr int32_t kTall = 2;   // bit of a tall template's number

// Templates of one size that are placed, and what they are scored with.
struct Group {
    const TemplateSet& set;
    const FramePair& pair;
    const SearchMemory& memory;
    int32_t count;
    const PlacementTable* tables[kAlike];

    const Template& At(int32_t t) const { return set.tplts[tables[t]->k]; }
};

// A block of placements, or a piece of a template: rows x columns from row, column on.
struct Rectangle {
    int32_t row;
    int32_t column;
    int32_t rows;
    int32_t columns;

    int32_t Size() const { return rows * columns; }
};

// A piece as it is compared: full steps of sixteen pixels, and one step of what remains.
struct PackedPiece {
    Bytes16 bytes[kSteps];
    Bytes16 rest;  // 255 for the pixels of the last step that belong to the piece
};

PackedPiece PackPiece(const LaidFrame& frame, const Template& tplt, const Rectangle& piece) {
    uint8_t pixels[kPiecePixels] = {};
    const uint8_t* row = frame.grey + (tplt.i0 + piece.row) * frame.width + tplt.j0 + piece.column;
    for (int32_t p = 0; p < piece.Size(); p += piece.columns, row += frame.width)
        std::memcpy(pixels + p, row, static_cast<size_t>(piece.columns));
    PackedPiece packed;
    for (int32_t step = 0; step < kSteps; ++step)
        packed.bytes[step] = Load16(pixels + step * kLanes);
    packed.rest = FirstBytes(piece.Size() % kLanes);
    return packed;
}

// Cuts the strips of a block for a piece to strips [out], one for each column, kStripBytes apart.
// Up to 15 bytes behind the pixels of frame are read.
void CutStrips(const LaidFrame& frame, const Rectangle& block, const Rectangle& piece,
               uint8_t* strips) {
    const uint8_t* const corner =
        frame.grey + (block.row + piece.row) * frame.width + block.column + piece.column;
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

// Sum of the differences between a piece, kFullSteps full steps and one masked step if there are
// fewer than kSteps, and the placement at patch [in], which is read in steps of sixteen.
template <int32_t kFullSteps>
Sums Difference(const uint8_t* patch, const PackedPiece& piece) {
    Sums sums = NoSums();
    for (int32_t step = 0; step < kFullSteps; ++step)
        sums = AddDiffs(sums, Load16(patch + step * kLanes), piece.bytes[step]);
    if constexpr (kFullSteps < kSteps)
        sums = AddDiffs(sums, And16(Load16(patch + kFullSteps * kLanes), piece.rest),
                        piece.bytes[kFullSteps]);
    return sums;
}

template <int32_t kFullSteps>
[[gnu::always_inline]] inline Quads Differences(const uint8_t* patch, const PackedPiece& piece) {
    return Totals(Difference<kFullSteps>(patch, piece),
                  Difference<kFullSteps>(patch + kStripBytes, piece),
                  Difference<kFullSteps>(patch + 2 * kStripBytes, piece),
                  Difference<kFullSteps>(patch + 3 * kStripBytes, piece));
}

// Stores the means of a template of one piece, at most 64 pixels. 1 / pixels is in units of 1/2^20,
// rounded up: times a sum of at most 64 * 255 it exceeds the quotient by less than
// 64 * 255 / 2^20 < 1 / 64 <= 1 / pixels, so that the truncated quotient is exact. The product is
// at most 255 * (2^20 + 64) < 2^32.
struct MeanStore {
    static constexpr int32_t kBits = 20;
    uint8_t* means;  // of the block's first placement, in a table of tableColumns
    int32_t tableColumns;
    uint32_t reciprocal;

    void operator()(int32_t row, int32_t column, int32_t count, const Quads& sums) const {
        uint8_t four[kTogether];
        StoreScaled(four, sums, reciprocal, kBits);
        std::memcpy(means + row * tableColumns + column, four, static_cast<size_t>(count));
    }
};

// Adds to the sums of a block, kBlockColumns for each row. Those behind its columns are undefined.
struct SumStore {
    uint32_t* sums;

    void operator()(int32_t row, int32_t column, int32_t /*count*/, const Quads& quads) const {
        uint32_t four[kTogether];
        StoreQuads(four, quads);
        for (int32_t n = 0; n < kTogether; ++n)
            sums[row * kBlockColumns + column + n] += four[n];
    }
};

// Stores the sums of a piece at all placements of a block. Arguments by value, and a local copy of
// the piece: stores of bytes may alias anything that is reached by reference, which would then be
// loaded again for each placement.
template <int32_t kFullSteps, typename Store>
void ScoreRows(Rectangle block, int32_t stripWidth, const PackedPiece& packed,
               const uint8_t* strips, Store store) {
    const PackedPiece piece = packed;
    for (int32_t row = 0; row < block.rows; ++row, strips += stripWidth) {
        const uint8_t* patch = strips;
        int32_t c = 0;
        for (; c + kTogether <= block.columns; c += kTogether, patch += kTogether * kStripBytes)
            store(row, c, kTogether, Differences<kFullSteps>(patch, piece));
        if (c < block.columns)
            store(row, c, block.columns - c, Differences<kFullSteps>(patch, piece));
    }
}

template <typename Store>
void ScorePiece(const Group& group, int32_t t, const Rectangle& block, const Rectangle& piece,
                Store store) {
    using Rows = void (*)(Rectangle, int32_t, const PackedPiece&, const uint8_t*, Store);
    constexpr Rows kRows[kSteps + 1] = {ScoreRows<0, Store>, ScoreRows<1, Store>,
                                        ScoreRows<2, Store>, ScoreRows<3, Store>,
                                        ScoreRows<4, Store>};
    const PackedPiece packed = PackPiece(group.pair.Cut(), group.At(t), piece);
    kRows[piece.Size() / kLanes](block, piece.columns, packed, group.memory.strips, store);
}

// Where template t of the group has the mean of the block's first placement.
uint8_t* MeansOf(const Group& group, int32_t t, const Rectangle& block) {
    const PlacementTable& table = *group.tables[t];
    return table.diff + (block.row - table.iFirst) * table.columns + block.column - table.jFirst;
}

void ScorePieces(const Group& group, const Rectangle& block) {
    const Template& alike = group.At(0);
    const int32_t tableColumns = group.tables[0]->columns;
    uint32_t* const sums = group.memory.sums;
    std::fill_n(sums, group.count * kBlockSums, 0U);
    for (int32_t column = 0; column < alike.width; column += kPieceWidth) {
        const int32_t columns = std::min(kPieceWidth, alike.width - column);
        const int32_t most = kPiecePixels / columns;
        for (int32_t row = 0; row < alike.height; row += most) {
            const Rectangle piece = {row, column, std::min(most, alike.height - row), columns};
            CutStrips(group.pair.Searched(), block, piece, group.memory.strips);
            for (int32_t t = 0; t < group.count; ++t)
                ScorePiece(group, t, block, piece, SumStore{sums + t * kBlockSums});
        }
    }
    // With 1 / pixels in units of 1/2^56, rounded up, the product exceeds the quotient by less than
    // 255 * 2^24 / 2^56 < 1 / 2^24 <= 1 / pixels: the truncated quotient is exact. The product is
    // below 255 * 2^56 + 2^32 < 2^64.
    const uint64_t pixels = static_cast<uint64_t>(group.set.tpltSize);
    const uint64_t reciprocal = ((uint64_t{1} << 56) - 1) / pixels + 1;
    for (int32_t t = 0; t < group.count; ++t) {
        const uint32_t* of = sums + t * kBlockSums;
        uint8_t* means = MeansOf(group, t, block);
        for (int32_t row = 0; row < block.rows; ++row, of += kBlockColumns, means += tableColumns) {
            for (int32_t c = 0; c < block.columns; ++c)
                means[c] = static_cast<uint8_t>(of[c] * reciprocal >> 56);
        }
    }
}

void ScoreBlock(const Group& group, const Rectangle& block) {
    const Template& alike = group.At(0);
    const Rectangle piece = {0, 0, alike.height, alike.width};
    if (alike.width > kPieceWidth || piece.Size() > kPiecePixels)
        return ScorePieces(group, block);
    CutStrips(group.pair.Searched(), block, piece, group.memory.strips);
    const uint32_t pixels = static_cast<uint32_t>(group.set.tpltSize);
    const uint32_t reciprocal = ((1U << MeanStore::kBits) - 1) / pixels + 1;
    const int32_t tableColumns = group.tables[0]->columns;
    for (int32_t t = 0; t < group.count; ++t)
        ScorePiece(group, t, block, piece,
                   MeanStore{MeansOf(group, t, block), tableColumns, reciprocal});
}

void ScoreGroup(const Group& group) {
    const PlacementTable& table = *group.tables[0];
    for (int32_t row = 0; row < table.rows; row += kBlockRows) {
        for (int32_t c = 0; c < table.columns; c += kBlockColumns)
            ScoreBlock(group, {table.iFirst + row, table.jFirst + c,
                               std::min(kBlockRows, table.rows - row),
                               std::min(kBlockColumns, table.columns - c)});
    }
}

// The tables, which are to lie at diff [out]; null when only their sizes are wanted.
PlacementTables PlanTables(const SearchParams& params, const TemplateSet& set, uint8_t* diff) {
    PlacementTables tables;
    tables.count = tables.placements = 0;
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const Placements where = PlacementsOf(params, set.tplts[k]);
        if (!set.valid[k] || where.Empty())
            continue;
        const int32_t i = static_cast<int32_t>(where.iFirst);
        const int32_t j = static_cast<int32_t>(where.jFirst);
        const int32_t rows = static_cast<int32_t>(where.iLast - where.iFirst + 1);
        const int32_t columns = static_cast<int32_t>(where.jLast - where.jFirst + 1);
        const Displacement first = DisplacementOf(set, MakeKey(0, i, j, k));
        tables.of[tables.count++] = {k, i, j, first, rows, columns, diff};
        tables.placements += rows * columns;
        if (diff != nullptr)
            diff += rows * columns;
    }
    return tables;
}

}  // namespace

SearchMemory PlanMemory(const SearchParams& params, const TemplateSet& set, uint8_t* block) {
    const int32_t placements = PlanTables(params, set, nullptr).placements;
    SearchMemory memory = {};
    // Each part starts at a multiple of sixteen.
    const auto take = [&memory, block](size_t bytes) -> void* {
        uint8_t* const taken = block == nullptr ? nullptr : block + memory.bytes;
        memory.bytes += (bytes + kLanes - 1) / kLanes * kLanes;
        return taken;
    };
    memory.keys = static_cast<uint32_t*>(
        take(static_cast<size_t>(params.candidateNum) * sizeof *memory.keys));
    memory.strips = static_cast<uint8_t*>(take(kBlockColumns * kStripBytes));
    memory.sums = static_cast<uint32_t*>(take(sizeof(uint32_t[kAlike * kBlockSums])));
    memory.slots = static_cast<MeetingSlot*>(take(sizeof(MeetingSlot[kMeetingSlots])));
    memory.scores = static_cast<uint8_t*>(take(static_cast<size_t>(placements) + kLanes));
    return memory;
}

PlacementTables ScorePlacements(const SearchParams& params, const TemplateSet& set,
                                const FramePair& pair, const SearchMemory& memory) {
    const PlacementTables tables = PlanTables(params, set, memory.scores);
    for (const int32_t tall : {0, kTall}) {
        Group group = {set, pair, memory, 0, {}};
        for (int32_t t = 0; t < tables.count; ++t) {
            if ((tables.of[t].k & kTall) == tall)
                group.tables[group.count++] = &tables.of[t];
        }
        if (group.count > 0)
            ScoreGroup(group);
    }
    return tables;
}

}  // namespace fpnavi
