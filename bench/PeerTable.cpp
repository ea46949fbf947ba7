// The table of peers: each in turn with the module's moved pair, on simulated and recorded frames.
#include <algorithm>
#include <cmath>
#include <cstdlib>

#include "Peers.h"
#include "Tables.h"

namespace bench {
namespace {

const Step& ModulePair() {
    for (const Comparison& comparison : Comparisons()) {
        if (comparison.whole && comparison.kind == PairKind::Moved)
            return comparison.shipped;
    }
    std::abort();  // the list has it
}

// The module's displacement, whose y counts upwards.
Shift ModuleShift(const FramePair& pair) {
    ModulePair().prepare(pair);
    ModulePair().run(pair);
    const NaviVoteInfo_t& record = *PrintNaviLog();
    return {static_cast<double>(record.dx_fp[0]), static_cast<double>(-record.dy_fp[0])};
}

// Percent of the pairs in which shiftOf is at most a pixel off on either axis.
double RightPercent(const PairSet& set, Shift (*shiftOf)(const FramePair& pair)) {
    size_t right = 0;
    for (const FramePair& pair : set.pairs) {
        const Shift shift = shiftOf(pair);
        const double off =
            std::max(std::abs(shift.x - pair.truth.x), std::abs(shift.y - pair.truth.y));
        right += off <= 1 ? 1 : 0;
    }
    return 100 * static_cast<double>(right) / static_cast<double>(set.pairs.size());
}

void ComparePeer(benchmark::State& state, const PairSet& set, const Peer& peer) {
    if (!BothAgree(state, PairKind::Moved, set))
        return;
    const TimedCall timedPeer = [&](size_t i) {
        return TimeOf([&] { benchmark::DoNotOptimize(peer.run(set.pairs[i])); });
    };
    const TimedCall timedModule = [&](size_t i) { return TimeStep(ModulePair(), set.pairs[i]); };
    const std::vector<Times> times = Measure(state, {timedPeer, timedModule}, set.pairs.size());
    state.counters[kPeer] = times[0].MedianMicroseconds();
    state.counters[kShipped] = times[1].MedianMicroseconds();
    state.counters[kRatio] = times[0].MedianMicroseconds() / times[1].MedianMicroseconds();
    state.counters[kPeerRight] = RightPercent(set, peer.run);
    state.counters[kShippedRight] = RightPercent(set, ModuleShift);
}

void AddPeersOn(const std::string& label, const PairSet& set, const Options& options) {
    static std::vector<Peer> peers;
    if (peers.empty()) {
        peers = OpenCvPeers();
        peers.push_back({"block matching", MatchBlocks});
    }
    for (const Peer& peer : peers)
        AddRow(label + ": " + peer.name, options,
               [&](benchmark::State& state) { ComparePeer(state, set, peer); });
}

void AddPeers(const Options& options) {
    AddPeersOn("simulated, tiled", PairsOf(PairKind::Moved, options.pairs, kDefaultFp), options);
    static const std::vector<RecordedPairs> recorded = ReadRecordedPairs(options.pairs);
    for (const RecordedPairs& pairs : recorded)
        AddPeersOn(pairs.label, pairs.set, options);
}

}  // namespace

const Table kPeerTable = {"--peers",
                          {{"moved pairs", "peer"},
                           {{"peer us", kPeer, "%.2f"},
                            {"shipped us", kShipped, "%.2f"},
                            {"ratio", kRatio, "%.2f"},
                            {"peer right", kPeerRight, "%.0f %%"},
                            {"ours right", kShippedRight, "%.0f %%"}}},
                          AddPeers};

}  // namespace bench
