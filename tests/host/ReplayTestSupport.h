// Gestures whose key is known, and results by their ids: what the tests of the replay share.
#ifndef FPNAVI_HOST_TEST_REPLAYTESTSUPPORT_H
#define FPNAVI_HOST_TEST_REPLAYTESTSUPPORT_H

#include <string>
#include <vector>

#include "GestureBuilder.h"
#include "replay/Replay.h"

namespace host_test {

inline host::Gesture Right(const std::string& id) {
    return GestureBuilder(host::Mode::Fp, id)
        .Skin(0)
        .Skin(6)
        .Skin(12)
        .Empty()
        .Label(VKEY_RIGHT)
        .Get();
}

// The map's left half, then its right half, then nothing.
inline host::Gesture DoubleScan(const std::string& id) {
    return GestureBuilder(host::Mode::DoubleScan, id)
        .Skin(0)
        .Registers(0xF0F0F0F0, 0xF0F0F0F0)
        .Skin(6)
        .Registers(0x0F0F0F0F, 0x0F0F0F0F)
        .Empty()
        .Label(VKEY_RIGHT)
        .Get();
}

inline host::Gesture Resting(const std::string& id) {
    return GestureBuilder(host::Mode::Fp, id).Skin(0).Skin(0).Empty().Label(VKEY_NO_MOVE).Get();
}

inline std::vector<std::string> Ids(const std::vector<host::ReplayResult>& results) {
    std::vector<std::string> ids;
    ids.reserve(results.size());
    for (const host::ReplayResult& result : results)
        ids.push_back(result.id);
    return ids;
}

}  // namespace host_test

#endif  // FPNAVI_HOST_TEST_REPLAYTESTSUPPORT_H
