// Two frames laid out for comparison: what meets along an axis, the mask, and areas and sums of
// pairings against loops over single pixels.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdint>
#include <random>

#include "Fixtures.h"
#include "frame/FramePair.h"
#include "frame/NaviFrame.h"

namespace {

using namespace fpnavi;
using namespace fpnavi_test;

TEST(Meet, KeepsThePlacesWhoseCounterpartsLieInTheOther) {
    for (int32_t offset = -12; offset <= 12; ++offset) {
        const Span span = {2, 6};
        const Span other = {3, 8};
        const Span met = Meet(span, other, offset);
        for (int32_t place = -20; place < 20; ++place) {
            const bool meets = 2 <= place && place < 6 && 3 <= place + offset && place + offset < 8;
            EXPECT_EQ(met.first <= place && place < met.last, meets) << offset << ", " << place;
        }
    }
}

TEST(Meet, EmptySpansMeetNothing) {
    EXPECT_EQ(Meet({4, 4}, {0, 9}, 0).Length(), 0);
    EXPECT_EQ(Meet({0, 9}, {4, 4}, 0).Length(), 0);
    EXPECT_EQ((Span{5, 3}).Length(), 0);
}

TEST(Meeting, EmptySpansAreLeftOut) {
    Meeting meeting = {0, 0, 0, {}};
    meeting.Add({3, 3});
    meeting.Add({1, 4});
    meeting.Add({9, 7});
    meeting.Add({6, 7});
    EXPECT_EQ(meeting.count, 2);
    EXPECT_EQ(meeting.places, 4);
    EXPECT_EQ(meeting.spans[1].first, 6);
}

// A frame of noise whose classes are 0, 1, 2 and 255, most of them finger.
void Scatter(TestFrame& frame, std::mt19937& random) {
    constexpr uint8_t kTypes[] = {1, 1, 1, 1, 1, 0, 2, 255};
    for (int32_t row = 0; row < frame->height; ++row) {
        for (int32_t column = 0; column < frame->width; ++column) {
            frame.Grey(row, column) = static_cast<uint8_t>(random() & 255U);
            frame.Type(row, column) = kTypes[random() % 8];
        }
    }
}

TEST(LayOut, MaskAndAreaAreThoseOfClassOne) {
    std::mt19937 random(61);
    for (int32_t width = 1; width <= 70; ++width) {
        for (int32_t height = 1; height <= 3; ++height) {
            TestFrame frame(width, height);
            Scatter(frame, random);
            const std::vector<uint8_t> types = frame.Types();
            const LaidFrame laid = LayOut(*frame.Get());
            EXPECT_EQ(laid.grey, frame->pData);
            EXPECT_EQ(laid.width, width);
            EXPECT_EQ(laid.height, height);
            EXPECT_EQ(laid.area, std::count(types.begin(), types.end(), 1));
            for (size_t p = 0; p < types.size(); ++p)
                ASSERT_EQ(laid.mask[p], types[p] == 1 ? 255 : 0) << width << ", pixel " << p;
            EXPECT_EQ(frame.Types(), types);
        }
    }
}

TEST(LayOutPair, TemplatesAreCutFromTheFrameWithLessCoverage) {
    TestFrame prev(4, 4, 1, 1);
    TestFrame curr(4, 4, 2, 1);
    for (const int32_t more : {-1, 0, 1}) {
        prev->cvr = 50;
        curr->cvr = 50 + more;
        const FramePair pair = LayOutPair(*prev.Get(), *curr.Get());
        const bool fromPrev = more > 0;
        EXPECT_EQ(pair.Cut().grey, fromPrev ? prev->pData : curr->pData);
        EXPECT_EQ(pair.Searched().grey, fromPrev ? curr->pData : prev->pData);
    }
}

// Up to three spans of one axis that stay inside both frames at a random offset.
Meeting RandomMeeting(std::mt19937& random, int32_t side) {
    const auto below = [&random](int32_t count) {
        return static_cast<int32_t>(random() % static_cast<uint32_t>(count));
    };
    const int32_t offset = random() % 3 == 0 ? 0 : below(2 * side - 1) - (side - 1);
    Meeting meeting = {offset, 0, 0, {}};
    int32_t first = std::max(-offset, 0);
    const int32_t last = side - std::max(offset, 0);
    for (int32_t s = 1 + below(kBandMax); s > 0 && first < last; --s) {
        first += random() % 2 == 0 ? 0 : below(last - first);
        const int32_t end = s == 1 && random() % 2 == 0 ? last : first + below(last - first + 1);
        meeting.Add({first, end});
        first = end;
    }
    return meeting;
}

struct AreaAndSum {
    int32_t area = 0;
    int64_t sum = 0;
};

template <typename Visit>
void ForEachPlace(const Meeting& meeting, Visit visit) {
    for (int32_t s = 0; s < meeting.count; ++s) {
        for (int32_t place = meeting.spans[s].first; place < meeting.spans[s].last; ++place)
            visit(place);
    }
}

AreaAndSum PlainPairing(TestFrame& first, TestFrame& second, const Meeting& rows,
                        const Meeting& columns) {
    AreaAndSum result;
    ForEachPlace(rows, [&](int32_t r) {
        ForEachPlace(columns, [&](int32_t c) {
            const int32_t r2 = r + rows.offset;
            const int32_t c2 = c + columns.offset;
            if (first.Type(r, c) != 1 || second.Type(r2, c2) != 1)
                return;
            ++result.area;
            result.sum += std::abs(first.Grey(r, c) - second.Grey(r2, c2));
        });
    });
    return result;
}

constexpr int32_t kSides[] = {1, 2, 15, 16, 17, 33, 63, 64, 65, 100, 127, 128, 129, 193};

void ComparePairing(std::mt19937& random, int32_t width, int32_t height) {
    TestFrame first(width, height);
    TestFrame second(width, height);
    Scatter(first, random);
    Scatter(second, random);
    const LaidFrame laid1 = LayOut(*first.Get());
    const LaidFrame laid2 = LayOut(*second.Get());
    for (int32_t n = 0; n < 12; ++n) {
        const Meeting rows = RandomMeeting(random, height);
        const Meeting columns = RandomMeeting(random, width);
        if (columns.count == 0)
            continue;
        const AreaAndSum plain = PlainPairing(first, second, rows, columns);
        const Columns cut = CutColumns(columns);
        const Pairing pairing = {&rows, &cut};
        ASSERT_EQ(CommonArea(laid1, laid2, pairing), plain.area) << width << " x " << height;
        ASSERT_EQ(DifferenceSum(laid1, laid2, pairing, INT64_MAX), plain.sum);
        ASSERT_EQ(DifferenceSum(laid1, laid2, pairing, plain.sum + 1), plain.sum);
        for (const int64_t limit : {plain.sum, plain.sum - 1, plain.sum / 2, int64_t{1}}) {
            if (limit < 1 || limit > plain.sum)
                continue;
            const int64_t stopped = DifferenceSum(laid1, laid2, pairing, limit);
            ASSERT_GE(stopped, limit) << "of " << plain.sum;
            ASSERT_LE(stopped, plain.sum);
        }
    }
}

TEST(Pairing, AreaAndSumAreThoseOfSinglePixels) {
    std::mt19937 random(62);
    for (const int32_t width : kSides) {
        for (const int32_t height : kSides) {
            ComparePairing(random, width, height);
            ASSERT_FALSE(HasFailure());
        }
    }
}

// Each column by itself, and each end of a run of columns, of rows of three words.
TEST(Pairing, EveryRunOfColumns) {
    std::mt19937 random(63);
    constexpr int32_t kWidth = 140;
    TestFrame first(kWidth, 1);
    TestFrame second(kWidth, 1);
    Scatter(first, random);
    Scatter(second, random);
    const LaidFrame laid1 = LayOut(*first.Get());
    const LaidFrame laid2 = LayOut(*second.Get());
    const Meeting rows = {0, 1, 1, {{0, 1}}};
    for (int32_t from = 0; from < kWidth; ++from) {
        for (int32_t to = from + 1; to <= kWidth; ++to) {
            const Meeting columns = {0, to - from, 1, {{from, to}}};
            const AreaAndSum plain = PlainPairing(first, second, rows, columns);
            const Columns cut = CutColumns(columns);
            ASSERT_EQ(CommonArea(laid1, laid2, {&rows, &cut}), plain.area);
            ASSERT_EQ(DifferenceSum(laid1, laid2, {&rows, &cut}, INT64_MAX), plain.sum);
        }
    }
}

TEST(Pairing, RowsThatMeetNothingHaveNoAreaAndNoSum) {
    TestFrame frame(20, 5, 9, 1);
    const LaidFrame laid = LayOut(*frame.Get());
    const Meeting none = {0, 0, 0, {}};
    const Columns columns = CutColumns({0, 20, 1, {{0, 20}}});
    EXPECT_EQ(CommonArea(laid, laid, {&none, &columns}), 0);
    EXPECT_EQ(DifferenceSum(laid, laid, {&none, &columns}, 1), 0);
}

TEST(Pairing, ColumnsThatMeetNothingHaveNoAreaAndNoSum) {
    TestFrame black(20, 5, 0, 1);
    TestFrame white(20, 5, 255, 1);
    const LaidFrame laid1 = LayOut(*black.Get());
    const LaidFrame laid2 = LayOut(*white.Get());
    const Meeting rows = {0, 5, 1, {{0, 5}}};
    const Columns none = CutColumns({0, 0, 0, {}});
    EXPECT_EQ(CommonArea(laid1, laid2, {&rows, &none}), 0);
    EXPECT_EQ(DifferenceSum(laid1, laid2, {&rows, &none}, 1), 0);
}

// A limit of none is reached before anything is read.
TEST(Pairing, LimitOfZeroSumsUpNothing) {
    TestFrame black(20, 5, 0, 1);
    TestFrame white(20, 5, 255, 1);
    const LaidFrame laid1 = LayOut(*black.Get());
    const LaidFrame laid2 = LayOut(*white.Get());
    const Meeting rows = {0, 5, 1, {{0, 5}}};
    const Columns columns = CutColumns({0, 20, 1, {{0, 20}}});
    EXPECT_EQ(DifferenceSum(laid1, laid2, {&rows, &columns}, 0), 0);
}

TEST(AreComparable, NeedsPixelsAndEqualSizes) {
    TestFrame a(4, 3);
    TestFrame b(4, 3);
    TestFrame wider(5, 3);
    TestFrame higher(4, 4);
    const NaviFrame_t empty = {};
    EXPECT_TRUE(AreComparable(a.Get(), b.Get()));
    EXPECT_FALSE(AreComparable(a.Get(), wider.Get()));
    EXPECT_FALSE(AreComparable(a.Get(), higher.Get()));
    EXPECT_FALSE(AreComparable(a.Get(), &empty));
    EXPECT_FALSE(AreComparable(&empty, &empty));
    EXPECT_FALSE(AreComparable(nullptr, a.Get()));
    EXPECT_FALSE(AreComparable(a.Get(), nullptr));
}

}  // namespace
