// Requirement: is the least mean grey difference of all small shifts below the tolerance, is it
// not, or has no shift enough common finger area?
//
// Observation: the least difference itself is not needed. Rest is known with the first shift below
// the tolerance; and a sum of differences only grows, so a shift is not below as soon as its sum
// reaches tolerance * area.
//
// Algorithm: shift 0 first, since a resting finger mostly matches there. The sum is compared with
// tolerance * an upper bound of the area; the area is counted only for shifts whose sum stays
// below.
#include "motion/FingerNoMove.h"

#include <algorithm>
#include <limits>

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = 256;  // least mean when no shift counts: above every mean
constexpr int32_t kRegionMax = 4;   // pairings of one shift

// One axis of the frame: border, centre, border. Borders of more than half the side overlap and
// leave no centre. A border that is negative or longer than the side leaves all three empty.
struct Bands {
    Span first;
    Span centre;
    Span last;

    bool Overlap() const { return last.first < first.last; }
};

Bands CutBands(int32_t side, int32_t bound) {
    if (bound < 0 || bound > side)
        return {{0, 0}, {0, 0}, {0, 0}};
    return {{0, bound}, {bound, side - bound}, {side - bound, side}};
}

// Places of the bands a, b and c that lie in the same band after the shift: place p of the previous
// frame meets p - shift of the current one.
Meeting StayIn(int32_t shift, const Span& a = {0, 0}, const Span& b = {0, 0},
               const Span& c = {0, 0}) {
    Meeting meeting = {-shift, 0, 0, {}};
    for (const Span& band : {a, b, c})
        meeting.Add(Meet(band, band, -shift));
    return meeting;
}

// What is compared at one shift: five regions, the centre and four border bands without the
// corners. Rows of the centre are compared in all columns, rows of the borders in the columns of
// the centre. Deliberate: bands that overlap are kept apart, so that a pixel of both counts twice.
struct ShiftedRows {
    Meeting centre;
    Meeting borders[2];
};

struct ShiftedColumns {
    Columns centre;
    Columns all[2];
};

ShiftedRows ShiftRows(const Bands& bands, int32_t dr) {
    if (bands.Overlap())
        return {StayIn(dr, bands.centre), {StayIn(dr, bands.first), StayIn(dr, bands.last)}};
    return {StayIn(dr, bands.centre), {StayIn(dr, bands.first, bands.last), StayIn(dr)}};
}

ShiftedColumns ShiftColumns(const Bands& bands, int32_t dc) {
    const Columns centre = CutColumns(StayIn(dc, bands.centre));
    if (bands.Overlap())
        return {centre, {CutColumns(StayIn(dc, bands.first)), CutColumns(StayIn(dc, bands.last))}};
    return {
        centre,
        {CutColumns(StayIn(dc, bands.first, bands.centre, bands.last)), CutColumns(StayIn(dc))}};
}

struct Regions {
    int32_t count;
    Pairing pairings[kRegionMax];

    void Add(const Meeting& rows, const Columns& columns) {
        if (rows.count > 0 && !columns.Empty())
            pairings[count++] = {&rows, &columns};
    }
};

Regions PairRegions(const ShiftedRows& rows, const ShiftedColumns& columns) {
    Regions regions;
    regions.count = 0;
    regions.Add(rows.centre, columns.all[0]);
    regions.Add(rows.centre, columns.all[1]);
    regions.Add(rows.borders[0], columns.centre);
    regions.Add(rows.borders[1], columns.centre);
    return regions;
}

constexpr int32_t kAreaUnknown = -1;

// The test of one pair of frames.
class ShiftTest {
  public:
    ShiftTest(const LaidFrame& prev, const LaidFrame& curr, const NoMoveLimits& limits)
        : m_prev(prev),
          m_curr(curr),
          m_limits(limits),
          m_rows(CutBands(prev.height, limits.boundHeight)),
          m_columns(CutBands(prev.width, limits.boundWidth)) {}

    // Some shift tested so far has enough common finger area.
    bool Counted() const { return m_counted; }

    // Tests the shifts within the limits, shift 0 first, until one is below the tolerance. Returns
    // whether one is.
    bool TestShifts() {
        if (m_limits.tolRow < 0 || m_limits.tolCol < 0)  // there is no shift to test
            return false;
        // Beyond the frame's sides no pixel meets another.
        const int32_t drMax = std::min(m_limits.tolRow, m_prev.height);
        const int32_t dcMax = std::min(m_limits.tolCol, m_prev.width);
        if (Test(0, ShiftColumns(m_columns, 0)))
            return true;
        for (int32_t dc = -dcMax; dc <= dcMax; ++dc) {
            const ShiftedColumns columns = ShiftColumns(m_columns, dc);
            for (int32_t dr = -drMax; dr <= drMax; ++dr) {
                if ((dr != 0 || dc != 0) && Test(dr, columns))
                    return true;
            }
        }
        return false;
    }

  private:
    bool Test(int32_t dr, const ShiftedColumns& columns) {
        const ShiftedRows rows = ShiftRows(m_rows, dr);
        const Regions regions = PairRegions(rows, columns);
        const int32_t area = m_counted ? kAreaUnknown : Area(regions);
        m_counted = m_counted || AreaCounts(area);
        return IsBelowTolerance(regions, area);
    }

    bool AreaCounts(int32_t area) const { return area >= 1 && area >= m_limits.overlapAreaMin; }

    int32_t Area(const Regions& regions) const {
        int32_t area = 0;
        for (int32_t i = 0; i < regions.count; ++i)
            area += CommonArea(m_prev, m_curr, regions.pairings[i]);
        return area;
    }

    // An upper bound of Area: the pixels of the regions, or the smaller finger area of the frames,
    // twice that where bands overlap.
    int64_t MostArea(const Regions& regions) const {
        int64_t pixels = 0;
        for (int32_t i = 0; i < regions.count; ++i)
            pixels += int64_t{regions.pairings[i].rows->places} *
                      regions.pairings[i].columns->meeting.places;
        const int64_t times = m_rows.Overlap() || m_columns.Overlap() ? 2 : 1;
        return std::min(pixels, times * std::min(m_prev.area, m_curr.area));
    }

    int64_t Sum(const Regions& regions, int64_t limit) const {
        int64_t sum = 0;
        for (int32_t i = 0; i < regions.count && sum < limit; ++i)
            sum += DifferenceSum(m_prev, m_curr, regions.pairings[i], limit - sum);
        return sum;
    }

    bool IsBelowTolerance(const Regions& regions, int32_t area) const;

    const LaidFrame& m_prev;
    const LaidFrame& m_curr;
    const NoMoveLimits& m_limits;
    const Bands m_rows;
    const Bands m_columns;
    bool m_counted = false;
};

// mean < tolerance implies sum < tolerance * area <= tolerance * MostArea, so a sum that reaches
// the latter is not below. A sum that may exceed 2^31 - 1 is taken in full, because its mean is
// that of the wrapped sum. area: Area(regions), or kAreaUnknown.
bool ShiftTest::IsBelowTolerance(const Regions& regions, int32_t area) const {
    const int64_t most = MostArea(regions);
    const bool mayWrap = most * kGreyMax > std::numeric_limits<int32_t>::max();
    const int64_t limit =
        mayWrap ? std::numeric_limits<int64_t>::max() : int64_t{m_limits.diffTol} * most;
    const int64_t sum = Sum(regions, limit);
    if (sum >= limit)
        return false;
    if (area == kAreaUnknown)
        area = Area(regions);
    return AreaCounts(area) && Wrap(sum) / area < m_limits.diffTol;
}

}  // namespace

NoMoveLimits CurrentNoMoveLimits() {
    return {s_boundWidth,      s_boundHeight,          s_smallMoveTolRow,
            s_smallMoveTolCol, s_overlapAreaMinNoMove, s_diffThresholdTol};
}

int32_t TestNoMove(const LaidFrame& prev, const LaidFrame& curr, const NoMoveLimits& limits) {
    ShiftTest test(prev, curr, limits);
    if (test.TestShifts())
        return kNoMoveResting;
    if (!test.Counted() && kMeanNone < limits.diffTol)
        return kNoMoveResting;
    return test.Counted() ? kNoMoveMoved : kNoMoveUndetermined;
}

int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    if (!AreComparable(img_prev, img_curr))
        return kNoMoveFailed;
    return TestNoMove(LayOut(*img_prev), LayOut(*img_curr), CurrentNoMoveLimits());
}

}  // namespace fpnavi
