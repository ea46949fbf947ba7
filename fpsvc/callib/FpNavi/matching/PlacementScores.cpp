// Requirement: the mean grey difference of every valid template at each of its placements.
//
// Observation: templates of one size are placed at the same corners, so they can share the strips
// of the searched frame.
//
// Algorithm: for the wide templates, then for the tall ones, in blocks of 16 x 16 placements and
// piece by piece: cut the strips once, then score the piece of each template of that size. Means of
// a template of one piece are stored at once; sums of several pieces are added up before the
// division.
#include "matching/PlacementScores.h"

#include <algorithm>

#include "matching/TemplatePieces.h"

namespace fpnavi {
namespace {

constexpr int32_t kAlike = 4;  // templates of one size

// The wide templates, then the tall ones.
constexpr int32_t kGroups[kTpltMax / kAlike][kAlike] = {{0, 1, 4, 5}, {2, 3, 6, 7}};

// Divides sums of pixels greys by their number, at most 2^24. With the reciprocal in units of
// 1/2^56, rounded up, the product exceeds the quotient by less than 255 * 2^24 / 2^56 < 1 / 2^24 <=
// 1 / pixels: the truncated quotient is exact. The product is below 255 * 2^56 + 2^32 <
// 2^64.
struct MeanOf {
    explicit MeanOf(int32_t pixels)
        : reciprocal(((uint64_t{1} << 56) - 1) / static_cast<uint64_t>(pixels) + 1) {}
    uint8_t operator()(uint32_t sum) const { return static_cast<uint8_t>(sum * reciprocal >> 56); }
    uint64_t reciprocal;
};

int32_t CountOf(int64_t first, int64_t last) {
    return static_cast<int32_t>(last - first + 1);
}

// The table of template k, not yet in memory: diff is null.
PlacementTable PlanTable(const SearchParams& params, const TemplateSet& set, int32_t k) {
    const Placements where = PlacementsOf(params, set.tplts[k]);
    if (!set.valid[k] || where.Empty())
        return {0, 0, 0, 0, nullptr};
    return {static_cast<int32_t>(where.iFirst), static_cast<int32_t>(where.jFirst),
            CountOf(where.iFirst, where.iLast), CountOf(where.jFirst, where.jLast), nullptr};
}

// The placed templates of one size.
struct Alike {
    int32_t count;
    int32_t k[kAlike];
};

Alike CollectAlike(const PlacementTables& tables, const int32_t (&group)[kAlike]) {
    Alike alike = {0, {}};
    for (const int32_t k : group) {
        if (tables.of[k].rows > 0)
            alike.k[alike.count++] = k;
    }
    return alike;
}

void PackAll(const TemplateSet& set, const Alike& alike, const LaidFrame& cut, uint8_t* packed) {
    for (int32_t t = 0; t < alike.count; ++t) {
        const Template& tplt = set.tplts[alike.k[t]];
        ForEachPiece(tplt.width, tplt.height, [&](const Piece& piece) {
            PackPiece(cut, tplt, piece, packed);
            packed += kPiecePixels;
        });
    }
}

void StoreMeansOfSums(const PlacementBlock& block, const uint32_t* sums, const MeanOf& meanOf,
                      int32_t tableColumns, uint8_t* means) {
    for (int32_t row = 0; row < block.rows; ++row) {
        for (int32_t c = 0; c < block.columns; ++c)
            means[row * tableColumns + c] = meanOf(sums[row * kBlockColumns + c]);
    }
}

// The templates of one size at one block of placements.
struct BlockScorer {
    const TemplateSet& set;
    const PlacementTables& tables;
    const LaidFrame& searched;
    const SearchMemory& memory;
    Alike alike;
    int32_t pieces;  // of one template
    uint32_t reciprocal;
    MeanOf meanOf;

    uint8_t* MeansOf(const PlacementBlock& block, int32_t t) const;
    void Score(const PlacementBlock& block) const;
};

uint8_t* BlockScorer::MeansOf(const PlacementBlock& block, int32_t t) const {
    const PlacementTable& table = tables.of[alike.k[t]];
    return table.diff + (block.i - table.iFirst) * table.columns + block.j - table.jFirst;
}

void BlockScorer::Score(const PlacementBlock& block) const {
    constexpr int32_t kBlock = kBlockRows * kBlockColumns;
    const Template& tplt = set.tplts[alike.k[0]];
    const int32_t tableColumns = tables.of[alike.k[0]].columns;
    int32_t n = 0;
    ForEachPiece(tplt.width, tplt.height, [&](const Piece& piece) {
        CutStrips(searched, block, piece, memory.strips);
        for (int32_t t = 0; t < alike.count; ++t) {
            const ScoreTarget target = {pieces == 1 ? MeansOf(block, t) : nullptr,
                                        memory.sums + t * kBlock, n == 0, tableColumns, reciprocal};
            ScorePiece(block, piece, memory.packed + (t * pieces + n) * kPiecePixels, memory.strips,
                       target);
        }
        ++n;
    });
    for (int32_t t = 0; t < alike.count && pieces > 1; ++t)
        StoreMeansOfSums(block, memory.sums + t * kBlock, meanOf, tableColumns, MeansOf(block, t));
}

void ScoreGroup(const TemplateSet& set, const PlacementTables& tables, const Alike& alike,
                const FramePair& pair, const SearchMemory& memory) {
    PackAll(set, alike, pair.Cut(), memory.packed);
    const int32_t pieces = PieceCount(set.tplts[alike.k[0]]);
    const BlockScorer scorer = {set,
                                tables,
                                pair.Searched(),
                                memory,
                                alike,
                                pieces,
                                pieces == 1 ? ReciprocalOf(set.tpltSize) : 0,
                                MeanOf(set.tpltSize)};
    const PlacementTable& table = tables.of[alike.k[0]];
    for (int32_t row = 0; row < table.rows; row += kBlockRows) {
        for (int32_t c = 0; c < table.columns; c += kBlockColumns)
            scorer.Score({table.iFirst + row, table.jFirst + c,
                          std::min(kBlockRows, table.rows - row),
                          std::min(kBlockColumns, table.columns - c)});
    }
}

// bytes rounded up to a multiple of sixteen, the alignment of all parts of the memory.
size_t Padded(size_t bytes) {
    return (bytes + kLanes - 1) / kLanes * kLanes;
}

}  // namespace

int32_t PlacementTables::Count() const {
    int32_t count = 0;
    for (const PlacementTable& table : of)
        count += table.Count();
    return count;
}

SearchMemory PlanMemory(const SearchParams& params, const TemplateSet& set, uint8_t* block) {
    int32_t scores = 0;
    int32_t pieces = 0;  // most of any template
    for (int32_t k = 0; k < kTpltMax; ++k) {
        const PlacementTable table = PlanTable(params, set, k);
        scores += table.Count();
        if (table.rows > 0)
            pieces = std::max(pieces, PieceCount(set.tplts[k]));
    }
    SearchMemory memory = {};
    const auto take = [&memory, block](size_t bytes) {
        uint8_t* const taken = block == nullptr ? nullptr : block + memory.bytes;
        memory.bytes += Padded(bytes);
        return taken;
    };
    constexpr size_t kSums = size_t{kAlike} * kBlockRows * kBlockColumns * sizeof(uint32_t);
    memory.keys = reinterpret_cast<uint32_t*>(
        take(static_cast<size_t>(params.candidateNum) * sizeof(uint32_t)));
    memory.packed = take(static_cast<size_t>(pieces) * kAlike * kPiecePixels);
    memory.strips = take(kStripsBytes);
    memory.sums = reinterpret_cast<uint32_t*>(take(pieces > 1 ? kSums : 0));
    memory.columns = reinterpret_cast<ColumnMeetings*>(take(kColumnSlots * sizeof(ColumnMeetings)));
    memory.scores = take(static_cast<size_t>(scores) + kLanes);
    return memory;
}

PlacementTables ScorePlacements(const SearchParams& params, const TemplateSet& set,
                                const FramePair& pair, const SearchMemory& memory) {
    PlacementTables tables;
    uint8_t* scores = memory.scores;
    for (int32_t k = 0; k < kTpltMax; ++k) {
        tables.of[k] = PlanTable(params, set, k);
        tables.of[k].diff = scores;
        scores += tables.of[k].Count();
    }
    for (const auto& group : kGroups) {
        const Alike alike = CollectAlike(tables, group);
        if (alike.count > 0)
            ScoreGroup(set, tables, alike, pair, memory);
    }
    return tables;
}

}  // namespace fpnavi
