// Moved pairs from .fng recordings of the default size.
#include <algorithm>
#include <cstdio>
#include <cstdlib>

#include "Peers.h"
#include "Reference.h"
#include "common/Error.h"
#include "importers/FngImport.h"
#include "parameters/ParamTable.h"

namespace bench {
namespace {

std::string Directory() {
    const char* const set = std::getenv("FPNAVI_REALDATA");
    return std::string(set != nullptr ? set : FPNAVI_REALDATA_DEFAULT) + "/gestures";
}

// The pairs of the fp gestures with the parameters that belong to the layout.
RecordedPairs PairsOfLayout(const std::vector<host::Gesture>& gestures, bool tiled, int32_t count) {
    RecordedPairs pairs = {tiled ? "recorded, tiled" : "recorded, window", {}};
    const host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, !tiled);
    std::copy(params.begin(), params.end(), pairs.set.params);
    reference::SetNaviParam(pairs.set.params);
    for (const host::Gesture& gesture : gestures) {
        if (gesture.params == params)
            AddPairsOf(gesture, PairKind::Moved,
                       count - static_cast<int32_t>(pairs.set.pairs.size()), &pairs.set);
    }
    reference::FpNaviClear();
    return pairs;
}

}  // namespace

std::vector<RecordedPairs> ReadRecordedPairs(int32_t count) {
    std::vector<RecordedPairs> all;
    try {
        const std::vector<host::Gesture> gestures = host::ImportFng(Directory());
        for (const bool tiled : {true, false}) {
            RecordedPairs pairs = PairsOfLayout(gestures, tiled, count);
            if (!pairs.set.pairs.empty())
                all.push_back(std::move(pairs));
        }
    } catch (const host::Error& error) {
        std::fprintf(stderr, "no recorded pairs: %s\n", error.what());
    }
    return all;
}

}  // namespace bench
