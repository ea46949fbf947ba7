// Frames whose presence is known, from recordings and from the simulated sensor.
#ifndef FPNAVI_TESTS_PRESENCEFRAMES_H
#define FPNAVI_TESTS_PRESENCEFRAMES_H

#include <cstdint>
#include <string>
#include <vector>

namespace presence {

constexpr int32_t kWidth = 56;  // frames of any other size do not count
constexpr int32_t kHeight = 36;

// A frame row by row, and whether a finger is on it. Slivers, where either answer is right, never
// get here.
struct KnownFrame {
    std::vector<uint8_t> picture;
    bool present = false;
};

// The frames of one group, and the fingers they are of.
struct FrameGroup {
    std::string name;
    std::string fingers;
    std::vector<KnownFrame> frames;
};

// All kWidth x kHeight frames of the recordings (.fng) in directory, parted by finger: the first
// group has the first, third, fifth ... of the fingers in alphabetical order, the second the rest.
// The finger of a recording is the source that index.csv beside it names. Throws host::Error for
// recordings that are missing or broken, or not in index.csv.
std::vector<FrameGroup> RecordedGroups(const std::string& directory);

// count empty and count touched frames of the simulated sensor.
FrameGroup SimulatedGroup(int32_t count);

}  // namespace presence

#endif  // FPNAVI_TESTS_PRESENCEFRAMES_H
