#include "matching/TileMatch.h"

#include <algorithm>

#include "frame/MaskedFrame.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr int32_t kBandMax = 3;                 // border, centre, border
constexpr int32_t kStepNum = 2 * kBandMax - 1;  // from a band to any other: -2 .. 2

// One axis of the frames: the places of its bands, and the gap between two of them.
struct Axis {
    uint64_t band[kBandMax];
    int32_t gap;
};

Axis s_rows;
Axis s_columns;

Axis CutAxis(int32_t side, int32_t bound, int32_t gap, bool multi) {
    if (!multi)
        return {{FirstBits(side), 0, 0}, 0};
    const Thirds thirds = CutThirds(side, bound);
    return {{thirds.first, thirds.centre, thirds.last}, gap};
}

// The places of the first frame that meet one of the second when the band there is step bands
// further on, and the offset to it within the frames.
struct AxisPairing {
    uint64_t places;
    int32_t offset;
};

AxisPairing PairAxis(const Axis& axis, int32_t offset, int32_t step) {
    uint64_t places = 0;
    for (int32_t b = std::max(0, -step); b < kBandMax - std::max(0, step); ++b)
        places |= axis.band[b] & ShiftBits(axis.band[b + step], offset);
    return {places, offset};
}

// What meets along one axis at a displacement, without the steps at which nothing does.
struct AxisMeeting {
    int32_t displacement;
    int32_t places;  // in all pairings
    int32_t count;
    AxisPairing pairings[kStepNum];
};

void AddStep(const Axis& axis, int32_t offset, int32_t step, AxisMeeting* meeting) {
    const AxisPairing pairing = PairAxis(axis, offset, step);
    if (pairing.places == 0)
        return;
    meeting->places += CountBits(pairing.places);
    meeting->pairings[meeting->count++] = pairing;
}

void MeetAlong(const Axis& axis, int32_t displacement, AxisMeeting* meeting) {
    meeting->displacement = displacement;
    meeting->places = 0;
    meeting->count = 0;
    AddStep(axis, displacement, 0, meeting);
    // A band further on lies behind the one before, so the offset to it is positive, and the other
    // way round; with each step a gap is taken off.
    for (int32_t step = 1; step < kBandMax && displacement - step * axis.gap > 0; ++step)
        AddStep(axis, displacement - step * axis.gap, step, meeting);
    for (int32_t step = -1; step > -kBandMax && displacement - step * axis.gap < 0; --step)
        AddStep(axis, displacement - step * axis.gap, step, meeting);
}

// All pairs of tiles that meet at a displacement. Neighbouring candidates often share the rows.
struct Meeting {
    AxisMeeting rows;
    AxisMeeting columns;
};

Meeting s_meeting;

void Meet(const Displacement& displacement) {
    if (displacement.di != s_meeting.rows.displacement)
        MeetAlong(s_rows, displacement.di, &s_meeting.rows);
    if (displacement.dj != s_meeting.columns.displacement)
        MeetAlong(s_columns, displacement.dj, &s_meeting.columns);
}

// Calls visit with each pairing of tiles until it returns false.
template <typename Visit>
void ForEachPairing(Visit visit) {
    for (int32_t r = 0; r < s_meeting.rows.count; ++r) {
        const AxisPairing& rows = s_meeting.rows.pairings[r];
        for (int32_t c = 0; c < s_meeting.columns.count; ++c) {
            const AxisPairing& columns = s_meeting.columns.pairings[c];
            if (!visit(Pairing{rows.places, columns.places, rows.offset, columns.offset}))
                return;
        }
    }
}

}  // namespace

void SetMatchFrames(const NaviFrame_t& first, const NaviFrame_t& second) {
    LayOut(first, &s_maskedFirst);
    LayOut(second, &s_maskedSecond);
    const bool multi = s_multiBloclkFlag == 1;
    s_rows = CutAxis(first.height, s_boundHeight, s_gapHeight, multi);
    s_columns = CutAxis(first.width, s_boundWidth, s_gapWidth, multi);
    MeetAlong(s_rows, 0, &s_meeting.rows);
    MeetAlong(s_columns, 0, &s_meeting.columns);
}

int32_t MatchAt(const Displacement& displacement, int32_t most) {
    Meet(displacement);
    // score <= most means sum < (most + 1) * area; the area is not above any of these.
    const int32_t mostArea = std::min({s_meeting.rows.places * s_meeting.columns.places,
                                       s_maskedFirst.area, s_maskedSecond.area});
    if (mostArea < 1)
        return kDiffWorst;
    const int64_t limit = (int64_t{most} + 1) * mostArea;
    int64_t sum = 0;
    ForEachPairing([&](const Pairing& pairing) {
        sum += DifferenceSum(s_maskedFirst, s_maskedSecond, pairing, limit - sum);
        return sum < limit;
    });
    if (sum >= limit)
        return most + 1;
    int32_t area = 0;
    ForEachPairing([&](const Pairing& pairing) {
        area += CommonArea(s_maskedFirst, s_maskedSecond, pairing);
        return true;
    });
    if (area < 1 || area <= s_overlapAreaMinFp)
        return kDiffWorst;
    return static_cast<int32_t>(sum / area);
}

}  // namespace fpnavi
