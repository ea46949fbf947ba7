#include "matching/DisplacementScore.h"

#include <algorithm>

#include "param/NaviLimits.h"

namespace fpnavi {
namespace {

// Cuts an axis into bands: one without tiles or without gaps, none when they do not make up the
// side.
TileAxis CutAxis(int32_t side, int32_t bound, int32_t center, int32_t gap, bool tiled) {
    const int64_t fullSide = tiled ? side + 2 * int64_t{gap} : side;
    if (tiled && (bound < 0 || center < 0 || gap < 0 || fullSide > kSideMax ||
                  side - 2 * int64_t{bound} != center))
        return {{}, 0, 0, 0};
    if (!tiled || gap == 0)
        return {{{0, side}, {0, 0}, {0, 0}}, 1, 0, side};
    return {{{0, bound}, {bound, side - bound}, {side - bound, side}},
            kBandMax,
            gap,
            static_cast<int32_t>(fullSide)};
}

Meeting MeetStep(const TileAxis& axis, int32_t displacement, int32_t step) {
    Meeting meeting = {displacement - step * axis.gap, 0, 0, {}};
    for (int32_t b = std::max(0, -step); b < axis.count - std::max(0, step); ++b)
        meeting.Add(Meet(axis.bands[b], axis.bands[b + step], meeting.offset));
    return meeting;
}

Meeting AsItIs(const Meeting& meeting) {
    return meeting;
}

// Makes meetings [out] those of displacement, unless they are already; make(meeting) makes a step.
// Step n needs an offset > 0 to reach a later band, step -n an offset < 0 to reach an earlier one:
// |displacement| > n * gap.
template <typename Step, typename Make>
void MeetAt(const TileAxis& axis, int32_t displacement, Make make, Meetings<Step>* meetings) {
    if (meetings->count >= 0 && meetings->displacement == displacement)
        return;
    meetings->displacement = displacement;
    meetings->places = 0;
    meetings->count = 0;
    if (displacement >= axis.fullSide || displacement <= -axis.fullSide)
        return;
    const int32_t direction = displacement < 0 ? -1 : 1;
    const int32_t distance = displacement * direction;
    for (int32_t n = 0; n < axis.count && (n == 0 || distance > n * axis.gap); ++n) {
        const Meeting meeting = MeetStep(axis, displacement, n * direction);
        if (meeting.count == 0)
            continue;
        meetings->places += meeting.places;
        meetings->steps[meetings->count++] = make(meeting);
    }
}

// Calls visit with each pairing of tiles until it returns false.
template <typename Visit>
void ForEachPairing(const Meetings<Meeting>& rows, const Meetings<Columns>& columns, Visit visit) {
    for (int32_t r = 0; r < rows.count; ++r) {
        for (int32_t c = 0; c < columns.count; ++c) {
            if (!visit(Pairing{&rows.steps[r], &columns.steps[c]}))
                return;
        }
    }
}

}  // namespace

DisplacementScore::DisplacementScore(const SearchParams& params, const FramePair& pair,
                                     MeetingSlot* slots, int32_t count)
    : m_first(pair.Cut()),
      m_second(pair.Searched()),
      m_overlapAreaMin(params.overlapAreaMin),
      m_rowAxis(CutAxis(m_first.height, params.boundHeight, params.centerHeight, params.gapHeight,
                        params.tiled)),
      m_columnAxis(CutAxis(m_first.width, params.boundWidth, params.centerWidth, params.gapWidth,
                           params.tiled)),
      m_slots(slots),
      m_slotMask(count - 1) {
    for (int32_t n = 0; n < count; ++n)
        slots[n].rows.count = slots[n].columns.count = -1;
}

int32_t DisplacementScore::At(const Displacement& displacement, int32_t most) {
    Meetings<Meeting>& rows = m_slots[displacement.di & m_slotMask].rows;
    Meetings<Columns>& columns = m_slots[displacement.dj & m_slotMask].columns;
    MeetAt(m_rowAxis, displacement.di, AsItIs, &rows);
    MeetAt(m_columnAxis, displacement.dj, CutColumns, &columns);
    // score <= most means sum < (most + 1) * area; the area is at most each of these. places *
    // places <= 2^24.
    const int32_t mostArea = std::min({rows.places * columns.places, m_first.area, m_second.area});
    if (mostArea < 1 || mostArea <= m_overlapAreaMin)
        return kDiffWorst;
    const int64_t limit = (int64_t{most} + 1) * mostArea;
    int64_t sum = 0;
    ForEachPairing(rows, columns, [&](const Pairing& pairing) {
        sum += DifferenceSum(m_first, m_second, pairing, limit - sum);
        return sum < limit;
    });
    if (sum >= limit)
        return most + 1;
    int32_t area = 0;
    ForEachPairing(rows, columns, [&](const Pairing& pairing) {
        area += CommonArea(m_first, m_second, pairing);
        return true;
    });
    if (area < 1 || area <= m_overlapAreaMin)
        return kDiffWorst;
    return static_cast<int32_t>(sum / area);
}

}  // namespace fpnavi
