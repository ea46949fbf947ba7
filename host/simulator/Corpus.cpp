// The mixture of a corpus.
#include "simulator/Corpus.h"

#include "simulator/Arithmetic.h"
#include "simulator/Sensor.h"

namespace host {
namespace {

constexpr size_t kIndexDigits = 7;

}  // namespace

SimPlan CorpusPlan(uint64_t seed, int64_t index) {
    const uint64_t gestureSeed = Mix64(Mix64(seed) + static_cast<uint64_t>(index));
    SimRandom random(gestureSeed);
    const int32_t share = random.Below(100);
    if (share < 55) {
        return RandomPlan(gestureSeed, Mode::Fp);  // plain in 18 of 100 cases
    }
    return RandomPlan(gestureSeed, share < 80 ? Mode::Hg : Mode::DoubleScan);
}

Gesture SimulateCorpusGesture(uint64_t seed, int64_t index) {
    std::string digits = std::to_string(index);
    if (digits.size() < kIndexDigits)
        digits.insert(0, kIndexDigits - digits.size(), '0');
    return Simulate(CorpusPlan(seed, index), "sim-" + std::to_string(seed) + "-" + digits);
}

}  // namespace host
