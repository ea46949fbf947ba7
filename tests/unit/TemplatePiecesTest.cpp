// Templates cut into pieces, and a piece at the placements of a block, against single pixels.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <random>
#include <vector>

#include "Fixtures.h"
#include "frame/FramePair.h"
#include "matching/TemplatePieces.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

TEST(ForEachPiece, EachPixelBelongsToOnePiece) {
    for (int32_t width = 1; width <= 70; ++width) {
        for (int32_t height = 1; height <= 70; ++height) {
            std::vector<int32_t> times(static_cast<size_t>(width * height), 0);
            int32_t seen = 0;
            const int32_t count = ForEachPiece(width, height, [&](const Piece& piece) {
                ++seen;
                EXPECT_GE(piece.Pixels(), 1);
                EXPECT_LE(piece.Pixels(), kPiecePixels);
                EXPECT_LE(piece.columns, kPieceWidth);
                for (int32_t r = piece.row; r < piece.row + piece.rows; ++r) {
                    for (int32_t c = piece.column; c < piece.column + piece.columns; ++c)
                        ++times.at(static_cast<size_t>(r * width + c));
                }
            });
            ASSERT_EQ(count, seen);
            ASSERT_EQ(PieceCount({width, height, 0, 0, 0, 0}), count);
            ASSERT_EQ(count == 1, width <= 16 && width * height <= 64) << width << " x " << height;
            ASSERT_TRUE(std::all_of(times.begin(), times.end(), [](int32_t n) { return n == 1; }))
                << width << " x " << height;
        }
    }
}

TEST(ForEachPiece, EmptyTemplatesHaveNone) {
    EXPECT_EQ(PieceCount({0, 5, 0, 0, 0, 0}), 0);
    EXPECT_EQ(PieceCount({5, 0, 0, 0, 0, 0}), 0);
}

// Every sum that a template of so many pixels can have.
TEST(ReciprocalOf, EveryQuotientIsTruncated) {
    for (int32_t pixels = 1; pixels <= kPiecePixels; ++pixels) {
        const uint32_t reciprocal = ReciprocalOf(pixels);
        for (uint32_t sum = 0; sum <= 255U * static_cast<uint32_t>(pixels); ++sum)
            ASSERT_EQ(sum * reciprocal >> kReciprocalBits, sum / static_cast<uint32_t>(pixels))
                << sum << " / " << pixels;
    }
}

LaidFrame Laid(TestFrame& frame) {
    return {frame->pData, frame->pType, frame->width, frame->height, 0};
}

TEST(PackPiece, RowsFollowEachOtherAndZeroesFillTheRest) {
    TestFrame frame(40, NoisePatch(0, 0, 30, 40));
    const Template tplt = {20, 10, 7, 11, 0, 0};
    ForEachPiece(tplt.width, tplt.height, [&](const Piece& piece) {
        std::vector<uint8_t> packed(kPiecePixels, 99);
        PackPiece(Laid(frame), tplt, piece, packed.data());
        std::vector<uint8_t> expected(kPiecePixels, 0);
        for (int32_t r = 0; r < piece.rows; ++r) {
            for (int32_t c = 0; c < piece.columns; ++c)
                expected[static_cast<size_t>(r * piece.columns + c)] =
                    frame.Grey(7 + piece.row + r, 11 + piece.column + c);
        }
        EXPECT_EQ(packed, expected) << piece.row << ", " << piece.column;
    });
}

int32_t PlainSum(TestFrame& cut, TestFrame& searched, const Template& tplt, const Piece& piece,
                 int32_t i, int32_t j) {
    int32_t sum = 0;
    for (int32_t r = piece.row; r < piece.row + piece.rows; ++r) {
        for (int32_t c = piece.column; c < piece.column + piece.columns; ++c)
            sum += std::abs(cut.Grey(tplt.i0 + r, tplt.j0 + c) - searched.Grey(i + r, j + c));
    }
    return sum;
}

// One piece at one block that ends with the frame, so that strips reach into the space behind it.
struct BlockTest {
    PlacementBlock block;
    Piece piece;
    TestFrame cut;
    TestFrame searched;
    Template tplt;
    std::vector<uint8_t> packed = std::vector<uint8_t>(kPiecePixels);
    std::vector<uint8_t> strips = std::vector<uint8_t>(kStripsBytes, 0xA5);

    BlockTest(const PlacementBlock& ofBlock, const Piece& ofPiece)
        : block(ofBlock),
          piece(ofPiece),
          cut(piece.columns, NoisePatch(500, 0, piece.rows, piece.columns)),
          searched(Width(), NoisePatch(0, 0, block.i + block.rows + piece.rows - 1, Width())),
          tplt{piece.columns, piece.rows, 0, 0, 0, 0} {
        PackPiece(Laid(cut), tplt, piece, packed.data());
        CutStrips(Laid(searched), block, piece, strips.data());
    }
    int32_t Width() const { return block.j + block.columns + piece.columns - 1; }
    int32_t SumAt(int32_t row, int32_t column) {
        return PlainSum(cut, searched, tplt, piece, block.i + row, block.j + column);
    }
};

// The means go to a table of more columns than the block, whose other bytes stay.
void CompareMeans(BlockTest& test, int32_t tableColumns) {
    const int32_t pixels = test.piece.Pixels();
    std::vector<uint8_t> means(static_cast<size_t>(kBlockRows * tableColumns), 201);
    std::vector<uint8_t> expected = means;
    for (int32_t row = 0; row < test.block.rows; ++row) {
        for (int32_t column = 0; column < test.block.columns; ++column)
            expected[static_cast<size_t>(row * tableColumns + column)] =
                static_cast<uint8_t>(test.SumAt(row, column) / pixels);
    }
    ScorePiece(test.block, test.piece, test.packed.data(), test.strips.data(),
               {means.data(), nullptr, true, tableColumns, ReciprocalOf(pixels)});
    ASSERT_EQ(means, expected);
}

// The sums are set by the first piece and added to by the others.
void CompareSums(BlockTest& test) {
    std::vector<uint32_t> sums(size_t{kBlockRows} * kBlockColumns, 7);
    for (const bool first : {true, false}) {
        ScorePiece(test.block, test.piece, test.packed.data(), test.strips.data(),
                   {nullptr, sums.data(), first, 0, 0});
        for (int32_t row = 0; row < test.block.rows; ++row) {
            for (int32_t column = 0; column < test.block.columns; ++column)
                ASSERT_EQ(sums[static_cast<size_t>(row * kBlockColumns + column)],
                          static_cast<uint32_t>(test.SumAt(row, column)) * (first ? 1 : 2));
        }
    }
}

TEST(ScorePiece, EveryPieceSize) {
    for (int32_t columns = 1; columns <= kPieceWidth; ++columns) {
        for (int32_t rows = 1; rows <= kPiecePixels / columns; ++rows) {
            BlockTest test({2, 3, 16, 16}, {0, 0, rows, columns});
            CompareMeans(test, 16);
            CompareSums(test);
            ASSERT_FALSE(HasFailure()) << columns << " x " << rows << " pixels";
        }
    }
}

TEST(ScorePiece, EveryBlockSize) {
    for (int32_t rows = 1; rows <= kBlockRows; ++rows) {
        for (int32_t columns = 1; columns <= kBlockColumns; ++columns) {
            BlockTest test({1, 0, rows, columns}, {0, 0, 5, 12});
            CompareMeans(test, columns + 3);
            CompareSums(test);
            ASSERT_FALSE(HasFailure()) << columns << " x " << rows << " placements";
        }
    }
}

}  // namespace
