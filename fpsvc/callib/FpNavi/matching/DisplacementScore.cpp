#include "matching/DisplacementScore.h"

#include <algorithm>

namespace fpnavi {
namespace {

// Without gaps the bands are one.
TileAxis CutAxis(int32_t side, int32_t bound, int32_t center, int32_t gap, bool tiled) {
    if (!tiled)
        return {{{0, side}, {0, 0}, {0, 0}}, 1, 0, side};
    const bool fits = bound >= 0 && center >= 0 && gap >= 0 && side - bound - bound == center;
    if (!fits)
        return {{}, 0, 0, 0};
    if (gap == 0)
        return {{{0, side}, {0, 0}, {0, 0}}, 1, 0, side};
    return {
        {{0, bound}, {bound, side - bound}, {side - bound, side}}, kBandMax, gap, side + 2 * gap};
}

void AddStep(const TileAxis& axis, int32_t step, AxisMeetings* meetings) {
    Meeting& meeting = meetings->steps[meetings->count];
    meeting.offset = meetings->displacement - step * axis.gap;
    meeting.places = 0;
    meeting.count = 0;
    for (int32_t b = std::max(0, -step); b < axis.count - std::max(0, step); ++b)
        meeting.Add(Meet(axis.bands[b], axis.bands[b + step], meeting.offset));
    if (meeting.count == 0)
        return;
    meetings->places += meeting.places;
    ++meetings->count;
}

// Only offsets above 0 reach a band further on, and only those below 0 one before.
void MeetAlong(const TileAxis& axis, int32_t displacement, AxisMeetings* meetings) {
    meetings->displacement = displacement;
    meetings->places = 0;
    meetings->count = 0;
    if (displacement >= axis.fullSide || displacement <= -axis.fullSide)
        return;
    AddStep(axis, 0, meetings);
    for (int32_t step = 1; step < axis.count && displacement - step * axis.gap > 0; ++step)
        AddStep(axis, step, meetings);
    for (int32_t step = -1; step > -axis.count && displacement - step * axis.gap < 0; --step)
        AddStep(axis, step, meetings);
}

}  // namespace

DisplacementScore::DisplacementScore(const SearchParams& params, const FramePair& pair)
    : m_first(pair.Cut()),
      m_second(pair.Searched()),
      m_overlapAreaMin(params.overlapAreaMin),
      m_rowAxis(CutAxis(m_first.height, params.boundHeight, params.centerHeight, params.gapHeight,
                        params.tiled)),
      m_columnAxis(CutAxis(m_first.width, params.boundWidth, params.centerWidth, params.gapWidth,
                           params.tiled)) {
    MeetAlong(m_rowAxis, 0, &m_rows);
    MeetAlong(m_columnAxis, 0, &m_columns);
}

// Calls visit with each pairing of tiles until it returns false.
template <typename Visit>
void DisplacementScore::ForEachPairing(Visit visit) const {
    for (int32_t r = 0; r < m_rows.count; ++r) {
        for (int32_t c = 0; c < m_columns.count; ++c) {
            if (!visit(Pairing{&m_rows.steps[r], &m_columns.steps[c]}))
                return;
        }
    }
}

int32_t DisplacementScore::At(const Displacement& displacement, int32_t most) {
    if (displacement.di != m_rows.displacement)
        MeetAlong(m_rowAxis, displacement.di, &m_rows);
    if (displacement.dj != m_columns.displacement)
        MeetAlong(m_columnAxis, displacement.dj, &m_columns);
    // score <= most means sum < (most + 1) * area; the area is not above any of these.
    const int32_t mostArea =
        std::min({m_rows.places * m_columns.places, m_first.area, m_second.area});
    if (mostArea < 1 || mostArea <= m_overlapAreaMin)
        return kDiffWorst;
    const int64_t limit = (int64_t{most} + 1) * mostArea;
    int64_t sum = 0;
    ForEachPairing([&](const Pairing& pairing) {
        sum += DifferenceSum(m_first, m_second, pairing, limit - sum);
        return sum < limit;
    });
    if (sum >= limit)
        return most + 1;
    int32_t area = 0;
    ForEachPairing([&](const Pairing& pairing) {
        area += CommonArea(m_first, m_second, pairing);
        return true;
    });
    if (area < 1 || area <= m_overlapAreaMin)
        return kDiffWorst;
    return static_cast<int32_t>(sum / area);
}

}  // namespace fpnavi
