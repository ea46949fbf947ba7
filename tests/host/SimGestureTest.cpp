// Simulated gestures as recordings: the same bytes everywhere, answers that agree with the motion.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cstdlib>
#include <set>
#include <string>
#include <vector>

#include "parameters/ParamTable.h"
#include "replay/ReplayProcess.h"
#include "simulator/Corpus.h"

namespace host {
namespace {

constexpr uint64_t kSeed = 20;
constexpr int64_t kCorpusCount = 80;

// FNV-1a over everything of a gesture that a replay or a judge reads.
class Fnv {
  public:
    void Byte(uint8_t byte) { m_hash = (m_hash ^ byte) * 0x100000001B3ULL; }

    void Word(int64_t word) {
        auto bits = static_cast<uint64_t>(word);
        for (int32_t i = 0; i < 8; ++i) {
            Byte(static_cast<uint8_t>(bits & 255));
            bits >>= 8;
        }
    }

    uint64_t Hash() const { return m_hash; }

  private:
    uint64_t m_hash = 0xCBF29CE484222325ULL;
};

uint64_t HashOf(const Gesture& gesture) {
    Fnv fnv;
    for (const RecordedFrame& frame : gesture.frames) {
        for (const uint8_t byte : frame.raw)
            fnv.Byte(byte);
        fnv.Word(frame.reg24);
        fnv.Word(frame.reg28);
        fnv.Word(frame.x16.value());
        fnv.Word(frame.y16.value());
        fnv.Word(static_cast<int64_t>(frame.presence.value()));
    }
    fnv.Word(gesture.label.value_or(-1));
    for (const int32_t key : gesture.accepted)
        fnv.Word(key);
    return fnv.Hash();
}

// First and last frame with the finger plainly there.
struct Span {
    const RecordedFrame* first = nullptr;
    const RecordedFrame* last = nullptr;
};

Span PresentSpan(const Gesture& gesture) {
    Span span;
    for (const RecordedFrame& frame : gesture.frames) {
        if (frame.presence == Presence::Present) {
            span.first = span.first == nullptr ? &frame : span.first;
            span.last = &frame;
        }
    }
    return span;
}

int32_t TravelX16(const Span& span) {
    return *span.last->x16 - *span.first->x16;
}

int32_t TravelY16(const Span& span) {
    return *span.last->y16 - *span.first->y16;
}

bool IsDirection(int32_t key) {
    return key >= VKEY_UP && key <= VKEY_LEFT;
}

class SimCorpus : public testing::Test {
  protected:
    static std::vector<Gesture> Gestures() {
        std::vector<Gesture> gestures;
        for (int64_t i = 0; i < kCorpusCount; ++i)
            gestures.push_back(SimulateCorpusGesture(kSeed, i));
        return gestures;
    }
};

TEST_F(SimCorpus, SameBytesEverywhere) {
    // Gestures of each mode, rendered alike by gcc and clang, with and without optimisation and
    // with either sign of char: a difference here is a difference between machines.
    EXPECT_EQ(HashOf(SimulateCorpusGesture(1, 8)), 0x931B1E6D44BDFFB7ULL);
    EXPECT_EQ(HashOf(SimulateCorpusGesture(1, 18)), 0xADDCEA79D872F312ULL);
    EXPECT_EQ(HashOf(SimulateCorpusGesture(1, 19)), 0xF6046D6BA888008BULL);
    EXPECT_EQ(HashOf(SimulateCorpusGesture(1, 1000000)), 0xC3E9DEC35F8EE2F6ULL);
}

TEST_F(SimCorpus, IndicesAreIndependent) {
    const uint64_t fresh = HashOf(SimulateCorpusGesture(kSeed, 5));
    SimulateCorpusGesture(kSeed, 4);
    EXPECT_EQ(HashOf(SimulateCorpusGesture(kSeed, 5)), fresh);
    EXPECT_NE(HashOf(SimulateCorpusGesture(kSeed, 6)), fresh);
    EXPECT_NE(HashOf(SimulateCorpusGesture(kSeed + 1, 5)), fresh);
    EXPECT_EQ(SimulateCorpusGesture(kSeed, 5).id, "sim-20-0000005");
}

TEST_F(SimCorpus, FramesSuitTheGeometry) {
    for (const Gesture& gesture : Gestures()) {
        EXPECT_EQ(ParamValue(gesture.params, "s_modeFlag"), static_cast<int32_t>(gesture.mode));
        EXPECT_TRUE(gesture.geometry == GeometryOf(gesture.params)) << gesture.id;
        EXPECT_LE(gesture.frames.size(), 90U) << gesture.id;
        for (const RecordedFrame& frame : gesture.frames)
            ASSERT_EQ(frame.raw.size(), gesture.mode == Mode::Hg ? 40U * 48U : 56U * 36U);
    }
}

TEST_F(SimCorpus, RegistersOnlyWithDoubleScan) {
    for (const Gesture& gesture : Gestures()) {
        uint32_t bits = 0;
        for (const RecordedFrame& frame : gesture.frames)
            bits |= frame.reg24 | frame.reg28;
        EXPECT_EQ(bits != 0, gesture.mode == Mode::DoubleScan) << gesture.id;
    }
}

TEST_F(SimCorpus, PresenceFollowsTheEnd) {
    for (const Gesture& gesture : Gestures()) {
        ASSERT_NE(PresentSpan(gesture).first, nullptr) << gesture.id;
        const Presence last = gesture.frames.back().presence.value();
        EXPECT_EQ(last == Presence::Absent, gesture.end == GestureEnd::Lift) << gesture.id;
    }
}

TEST_F(SimCorpus, TrueTravelAgreesWithTheLabel) {
    for (const Gesture& gesture : Gestures()) {
        const Span span = PresentSpan(gesture);
        const int32_t x16 = TravelX16(span);
        const int32_t y16 = TravelY16(span);
        switch (gesture.label.value_or(VKEY_NONE)) {
            case VKEY_UP:
                EXPECT_LT(y16, -2 * std::abs(x16)) << gesture.id;
                break;
            case VKEY_DOWN:
                EXPECT_GT(y16, 2 * std::abs(x16)) << gesture.id;
                break;
            case VKEY_RIGHT:
                EXPECT_GT(x16, 2 * std::abs(y16)) << gesture.id;
                break;
            case VKEY_LEFT:
                EXPECT_LT(x16, -2 * std::abs(y16)) << gesture.id;
                break;
            case VKEY_NO_MOVE:
                EXPECT_LE(std::max(std::abs(x16), std::abs(y16)), 8) << gesture.id;
                break;
            default:
                break;
        }
    }
}

TEST_F(SimCorpus, AcceptedKeysAreFair) {
    for (const Gesture& gesture : Gestures()) {
        const std::set<int32_t> accepted(gesture.accepted.begin(), gesture.accepted.end());
        EXPECT_EQ(accepted.size(), gesture.accepted.size()) << gesture.id;
        if (gesture.label) {
            EXPECT_EQ(accepted.count(*gesture.label), 1U) << gesture.id;
        }
        const auto directions = std::count_if(accepted.begin(), accepted.end(), IsDirection);
        const std::string& kind = gesture.tags.at(1);
        const bool two = kind.rfind("diag:", 0) == 0 || kind.rfind("reversal:", 0) == 0;
        const bool still = gesture.label == VKEY_NO_MOVE;
        EXPECT_EQ(directions, two ? 2 : (still ? 0 : 1)) << gesture.id << " " << kind;
        EXPECT_EQ(two, kind.find('_') != std::string::npos) << kind;
    }
}

TEST_F(SimCorpus, CoreGesturesDemandTheirKey) {
    for (const Gesture& gesture : Gestures()) {
        ASSERT_THAT(gesture.tier, testing::AnyOf("core", "hard"));
        if (gesture.tier == "core") {
            ASSERT_TRUE(gesture.label.has_value()) << gesture.id;
            EXPECT_EQ(gesture.accepted.front(), *gesture.label) << gesture.id;
            if (IsDirection(*gesture.label)) {
                EXPECT_EQ(gesture.accepted.size(), 1U) << gesture.id;
            }
        }
    }
}

TEST_F(SimCorpus, TheModuleGivesTheAnswers) {
    for (const ReplayResult& result : ReplayAll(Gestures(), 1)) {
        EXPECT_NE(result.verdict, Verdict::Wrong) << result.id << " gave " << result.key;
        EXPECT_TRUE(result.errors.empty()) << result.id;
        if (result.tier == "core") {
            EXPECT_EQ(result.key, result.label) << result.id;
        }
    }
}

TEST(SimPlan, MixtureHoldsEveryKindAndMode) {
    std::set<SimKind> kinds;
    std::array<int32_t, 3> modes{};
    for (int64_t i = 0; i < 2000; ++i) {
        const SimPlan plan = CorpusPlan(3, i);
        kinds.insert(plan.kind);
        ++modes[static_cast<size_t>(plan.mode)];
    }
    EXPECT_EQ(kinds.size(), 11U);
    EXPECT_NEAR(modes[0], 1100, 80);  // 55 %, three and a half deviations
    EXPECT_NEAR(modes[1], 500, 70);
    EXPECT_NEAR(modes[2], 400, 65);
}

}  // namespace
}  // namespace host
