// What one gesture leaves for the next: nothing but xc_ds and yc_ds beyond what the next writes.
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include "Recorder.h"
#include "simulator/Corpus.h"
#include "simulator/Sensor.h"

namespace fpnavi_test {
namespace {

using host::Gesture;
using host::Mode;

// The outcome of the last of the gestures, replayed one after the other in a process of their own,
// whose module nobody has used before.
Outcome InFreshProcess(const std::vector<Gesture>& gestures) {
    int ends[2] = {-1, -1};
    EXPECT_EQ(pipe(ends), 0);
    const pid_t child = fork();
    if (child == 0) {
        Outcome outcome;
        for (const Gesture& gesture : gestures)
            outcome = Record(kModule, gesture);
        const bool written = write(ends[1], &outcome, sizeof outcome) == sizeof outcome;
        _exit(written ? 0 : 1);
    }
    close(ends[1]);
    Outcome outcome;
    size_t got = 0;
    while (got < sizeof outcome) {
        const ssize_t n =
            read(ends[0], reinterpret_cast<char*>(&outcome) + got, sizeof outcome - got);
        if (n <= 0)
            break;
        got += static_cast<size_t>(n);
    }
    close(ends[0]);
    int status = 1;
    waitpid(child, &status, 0);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(got, sizeof outcome);
    return outcome;
}

Gesture RandomGesture(uint64_t seed, Mode mode) {
    return host::Simulate(host::RandomPlan(seed, mode), "gesture-" + std::to_string(seed));
}

// Zeroes what a gesture may inherit: entries of xc_ds and yc_ds behind those that it wrote. A pair
// that was dropped in the end has written one entry more.
Outcome WithoutInherited(Outcome outcome) {
    const auto written = static_cast<size_t>(outcome.record[0]) + 1;
    for (const size_t start : {size_t{1003}, size_t{1103}})
        std::fill(outcome.record.begin() + static_cast<std::ptrdiff_t>(start + written),
                  outcome.record.begin() + static_cast<std::ptrdiff_t>(start + 100), 0);
    return outcome;
}

// Modes whose double-scan setting is the same as that of mode.
std::vector<Mode> ModesLike(Mode mode) {
    return mode == Mode::DoubleScan ? std::vector<Mode>{Mode::DoubleScan}
                                    : std::vector<Mode>{Mode::Fp, Mode::Hg};
}

void ExpectNothingInherited(Mode mode) {
    for (uint64_t seed = 1; seed <= 12; ++seed) {
        const Gesture gesture = RandomGesture(seed, mode);
        const Outcome alone = InFreshProcess({gesture});
        for (const Mode before : ModesLike(mode)) {
            const Outcome after = InFreshProcess({RandomGesture(seed + 100, before), gesture});
            EXPECT_EQ(WithoutInherited(after), WithoutInherited(alone)) << gesture.notes;
        }
    }
}

TEST(GestureAfterAnother, EqualsTheGestureAloneInFpMode) {
    ExpectNothingInherited(Mode::Fp);
}
TEST(GestureAfterAnother, EqualsTheGestureAloneInHgMode) {
    ExpectNothingInherited(Mode::Hg);
}
TEST(GestureAfterAnother, EqualsTheGestureAloneWithDoubleScan) {
    ExpectNothingInherited(Mode::DoubleScan);
}

TEST(GestureTwice, GivesTheSameRecord) {
    for (const Mode mode : {Mode::Fp, Mode::Hg, Mode::DoubleScan}) {
        for (uint64_t seed = 1; seed <= 8; ++seed) {
            const Gesture gesture = RandomGesture(seed, mode);
            EXPECT_EQ(InFreshProcess({gesture, gesture}), InFreshProcess({gesture}))
                << gesture.notes;
        }
    }
}

TEST(VoteTwice, GivesTheSameKeyAndRecord) {
    for (const Mode mode : {Mode::Fp, Mode::Hg, Mode::DoubleScan}) {
        for (uint64_t seed = 1; seed <= 8; ++seed) {
            const Outcome first = Record(kModule, RandomGesture(seed, mode));
            Outcome again;
            again.key = Voting(1);
            std::copy_n(kModule.record(), kRecordInts, again.record.begin());
            EXPECT_EQ(first, again);
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
