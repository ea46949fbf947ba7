// Requirement: is the least mean grey difference of all small shifts below the tolerance, is it
// not, or has no shift enough common finger area?
//
// Observation: the least difference is not needed. Rest is known with the first shift below the
// tolerance; a sum only grows, so a shift is not below once its sum reaches tolerance * area.
//
// Algorithm: shift 0 first, since a resting finger mostly matches there. The sum is compared with
// tolerance * an upper bound of the area; the area is counted only where the sum stays below.
#include "motion/FingerNoMove.h"

#include <algorithm>
#include <initializer_list>
#include <limits>

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kMeanNone = 256;  // least mean when no shift counts: above every mean

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
        return {};
    return {{0, bound}, {bound, side - bound}, {side - bound, side}};
}

// Places of bands that lie in the same band after the shift: place p of the previous frame meets
// p - shift of the current one.
Meeting StayIn(std::initializer_list<Span> bands, int32_t shift) {
    Meeting meeting = {-shift, 0, 0, {}};
    for (const Span& band : bands)
        meeting.Add(Meet(band, band, -shift));
    return meeting;
}

// The columns compared at one shift. Deliberate: a pixel of two borders that overlap counts twice,
// so the columns of the last one are then kept apart.
struct ShiftedColumns {
    Columns centre;
    Columns all;
    Columns apart;
};

ShiftedColumns ShiftColumns(const Bands& bands, int32_t dc) {
    const Columns centre = CutColumns(StayIn({bands.centre}, dc));
    if (bands.Overlap())
        return {centre, CutColumns(StayIn({bands.first}, dc)),
                CutColumns(StayIn({bands.last}, dc))};
    return {centre, CutColumns(StayIn({bands.first, bands.centre, bands.last}, dc)), {}};
}

// The test of one pair of frames.
class ShiftTest {
  public:
    ShiftTest(const FramePair& pair, const NoMoveLimits& limits)
        : m_pair(pair),
          m_limits(limits),
          m_rows(CutBands(pair.prev.height, limits.boundHeight)),
          m_columns(CutBands(pair.prev.width, limits.boundWidth)) {}

    // Some shift tested so far has enough common finger area.
    bool Counted() const { return m_counted; }

    // Tests the shifts within the limits, shift 0 first, until one is below the tolerance. Returns
    // whether one is.
    bool TestShifts() {
        if (m_limits.tolRow < 0 || m_limits.tolCol < 0)  // there is no shift to test
            return false;
        // Beyond the frame's sides no pixel meets another.
        const int32_t drMax = std::min(m_limits.tolRow, m_pair.prev.height);
        const int32_t dcMax = std::min(m_limits.tolCol, m_pair.prev.width);
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
    // Rows of the centre are compared in all columns, rows of the borders, which may overlap too,
    // in the columns of the centre. Corners are not compared.
    bool Test(int32_t dr, const ShiftedColumns& columns) {
        const Meeting centre = StayIn({m_rows.centre}, dr);
        const Meeting borders = StayIn({m_rows.first, m_rows.last}, dr);
        const Pairing regions[] = {
            {&centre, &columns.all}, {&centre, &columns.apart}, {&borders, &columns.centre}};
        // The common area is at most the pixels of the regions, and the smaller finger area of the
        // frames, twice that where bands overlap.
        int64_t pixels = 0;
        for (const Pairing& region : regions)
            pixels += int64_t{region.rows->places} * region.columns->meeting.places;
        const int64_t times = m_rows.Overlap() || m_columns.Overlap() ? 2 : 1;
        const int64_t most = std::min(pixels, times * std::min(m_pair.prev.area, m_pair.curr.area));
        // mean < tolerance implies sum < tolerance * area <= tolerance * most, so a sum that
        // reaches the latter is not below. A sum that may exceed 2^31 - 1 is taken in full, because
        // its mean is that of the wrapped sum.
        const bool mayWrap = most * kGreyMax > std::numeric_limits<int32_t>::max();
        const int64_t limit =
            mayWrap ? std::numeric_limits<int64_t>::max() : m_limits.diffTol * most;
        int64_t sum = 0;
        for (const Pairing& region : regions) {
            if (sum < limit)
                sum += DifferenceSum(m_pair.prev, m_pair.curr, region, limit - sum);
        }
        if (sum >= limit && m_counted)
            return false;
        int32_t area = 0;
        for (const Pairing& region : regions)
            area += CommonArea(m_pair.prev, m_pair.curr, region);
        if (area < 1 || area < m_limits.overlapAreaMin)
            return false;
        m_counted = true;
        return sum < limit && Wrap(sum) / area < m_limits.diffTol;
    }

    const FramePair& m_pair;
    const NoMoveLimits& m_limits;
    const Bands m_rows;
    const Bands m_columns;
    bool m_counted = false;
};

}  // namespace

NoMoveLimits CurrentNoMoveLimits() {
    return {s_boundWidth,      s_boundHeight,          s_smallMoveTolRow,
            s_smallMoveTolCol, s_overlapAreaMinNoMove, s_diffThresholdTol};
}

int32_t TestNoMove(const FramePair& pair, const NoMoveLimits& limits) {
    ShiftTest test(pair, limits);
    if (test.TestShifts() || (!test.Counted() && kMeanNone < limits.diffTol))
        return kNoMoveResting;
    return test.Counted() ? kNoMoveMoved : kNoMoveUndetermined;
}

int32_t FingerNoMove(const NaviFrame_t* img_prev, const NaviFrame_t* img_curr) {
    if (!AreComparable(img_prev, img_curr))
        return kNoMoveFailed;
    return TestNoMove(LayOutPair(*img_prev, *img_curr), CurrentNoMoveLimits());
}

}  // namespace fpnavi
