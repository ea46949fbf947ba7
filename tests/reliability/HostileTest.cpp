// Hostile parameters: each value at its boundaries, and random blocks. A short gesture, tuning
// calls and the votes: nothing crashes, and the module equals the plain model. Blocks whose
// searches are too much for the model run in the module alone, in a process of their own.
//
// FPNAVI_HOSTILE_BLOCKS: random blocks of all modes together. FPNAVI_HOSTILE_SEED: other blocks.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "HostileBlocks.h"
#include "HostileRun.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::ParamBlock;
using host::SimRandom;

// Random blocks without FPNAVI_HOSTILE_BLOCKS. The sanitizers make both sides many times slower.
#if defined(__has_feature)
#if __has_feature(address_sanitizer)
#define FPNAVI_SLOW_BUILD 1
#endif
#endif
#if defined(FPNAVI_SLOW_BUILD)
constexpr int64_t kBlocks = 1000;
#else
constexpr int64_t kBlocks = 20000;
#endif

int64_t FromEnvironment(const char* name, int64_t otherwise) {
    const char* const text = std::getenv(name);
    return text != nullptr ? std::atoll(text) : otherwise;
}

// How many of the blocks came how far.
struct Shares {
    int64_t blocks = 0;
    int64_t alone = 0;
    int64_t slowestMs = 0;  // of those alone; printed, never judged
    int64_t centroid = 0;
    int64_t noMove = 0;
    int64_t match = 0;
    int64_t key = 0;

    void Add(const Reached& reached) {
        ++blocks;
        alone += reached.alone ? 1 : 0;
        slowestMs = std::max(slowestMs, reached.aloneMs);
        centroid += reached.centroid ? 1 : 0;
        noMove += reached.noMove ? 1 : 0;
        match += reached.match ? 1 : 0;
        key += reached.key ? 1 : 0;
    }
    int32_t Percent(int64_t part) const { return static_cast<int32_t>(100 * part / blocks); }
    void Print() const {
        std::printf(
            "%lld blocks: centroid and vote %d %%, no-move test %d %%, template match %d %%,"
            " a key %d %%; in the module alone %d %%, the slowest of them %lld ms\n",
            static_cast<long long>(blocks), Percent(centroid), Percent(noMove), Percent(match),
            Percent(key), Percent(alone), static_cast<long long>(slowestMs));
    }
    // A counted pair and a vote in at least half of them.
    void ExpectDeep(Mode mode) const {
        EXPECT_GE(Percent(centroid), 50);
        EXPECT_GE(Percent(key), 25);
        EXPECT_GE(Percent(match), mode == Mode::Hg ? 0 : 15);
    }
};

// The others' values: defaults, but fewer candidates, which is cheap for the model and still more
// than enough; once more with the switches the other way.
ParamBlock Others(Mode mode, bool switched) {
    ParamBlock params = host::ParamsForMode(mode, false);
    host::ParamValue(params, "s_candidateNum") = 10;
    if (switched) {
        host::ParamValue(params, "s_dimensionlessFlag") = 1;
        host::ParamValue(params, "s_multiBloclkFlag") = 0;
        host::ParamValue(params, "s_sensorBackFlag") = 1;
        host::ParamValue(params, "s_logShowFlag") = 1;
    }
    return params;
}

// Seeds of pictures that reach the deepest method of the mode.
std::vector<uint64_t> DeepSeeds(Mode mode, bool switched) {
    constexpr size_t kSeeds = 3;
    std::vector<uint64_t> seeds;
    for (uint64_t seed = 1; seed <= 300 && seeds.size() < kSeeds; ++seed) {
        Reached reached;
        if (RunHostile(Others(mode, switched), mode, seed, &reached) && reached.key &&
            (mode == Mode::Hg || reached.match))
            seeds.push_back(seed);
    }
    EXPECT_EQ(seeds.size(), kSeeds);
    return seeds;
}

// Parameter number i takes its boundary values.
void RunBoundaries(size_t i, Mode mode, bool switched, const std::vector<uint64_t>& seeds,
                   Shares* shares) {
    ParamBlock params = Others(mode, switched);
    for (const int32_t value : BoundaryValues(host::ParamsForMode(mode, false)[i])) {
        SCOPED_TRACE(std::string(host::ParamTable()[i].name) + " = " + std::to_string(value));
        params[i] = value;
        Reached reached;
        ASSERT_TRUE(RunHostile(params, mode, seeds[i % seeds.size()], &reached));
        shares->Add(reached);
    }
}

// The mode comes last: mode 2 leaves the double scan on.
void RunAllBoundaries(Mode mode) {
    const size_t modeIndex = host::ParamIndex("s_modeFlag").value();
    Shares shares;
    for (const bool switched : {false, true}) {
        const std::vector<uint64_t> seeds = DeepSeeds(mode, switched);
        ASSERT_FALSE(seeds.empty());
        for (size_t i = 0; i < FPNAVI_PARAM_NUM; ++i) {
            if (i != modeIndex) {
                ASSERT_NO_FATAL_FAILURE(RunBoundaries(i, mode, switched, seeds, &shares));
            }
        }
        if (switched) {
            ASSERT_NO_FATAL_FAILURE(RunBoundaries(modeIndex, mode, false, seeds, &shares));
            ASSERT_NO_FATAL_FAILURE(RunBoundaries(modeIndex, mode, true, seeds, &shares));
        }
    }
    shares.Print();
    shares.ExpectDeep(mode);
}

// A part of all random blocks, in percent.
void RunRandomBlocks(Mode mode, int64_t percent) {
    const int64_t count =
        std::max<int64_t>(FromEnvironment("FPNAVI_HOSTILE_BLOCKS", kBlocks) * percent / 100, 1);
    const auto seed = static_cast<uint64_t>(FromEnvironment("FPNAVI_HOSTILE_SEED", 1));
    Shares shares;
    for (int64_t i = 0; i < count; ++i) {
        SCOPED_TRACE("block " + std::to_string(i));
        SimRandom random(host::Mix64(seed * 4 + static_cast<uint64_t>(mode)) +
                         static_cast<uint64_t>(i));
        const ParamBlock params = RandomHostileBlock(random, mode);
        Reached reached;
        ASSERT_TRUE(RunHostile(params, mode, random.Next(), &reached));
        shares.Add(reached);
    }
    shares.Print();
    if (count >= 50)  // fewer tell nothing about shares
        shares.ExpectDeep(mode);
}

TEST(BoundaryValues, OfEachParameterInFpMode) {
    RunAllBoundaries(Mode::Fp);
}
TEST(RandomBlocks, InFpMode) {
    RunRandomBlocks(Mode::Fp, 50);
}
TEST(RandomBlocks, InHgMode) {
    RunRandomBlocks(Mode::Hg, 25);
}
TEST(BoundaryValues, OfEachParameterInHgMode) {
    RunAllBoundaries(Mode::Hg);
}
TEST(BoundaryValues, OfEachParameterWithDoubleScan) {
    RunAllBoundaries(Mode::DoubleScan);
}
TEST(RandomBlocks, WithDoubleScan) {
    RunRandomBlocks(Mode::DoubleScan, 25);
}

}  // namespace
}  // namespace fpnavi_test
