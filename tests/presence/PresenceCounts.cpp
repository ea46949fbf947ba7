// presence_counts [DIRECTORY]: how many frames with and without a finger are told right, by the
// texture test alone and by the whole fp detector, at the default thresholds.
//
// DIRECTORY holds recordings (.fng) and index.csv; without it, gestures in the directory that
// FPNAVI_REALDATA names, or in the one that the build names (FPNAVI_REALDATA_DEFAULT). Exit code 0;
// 1 when a count is below 99.5 %; 3 when a recording cannot be read or there is none.
#include <fmt/core.h>

#include <algorithm>
#include <cstdint>
#include <cstdlib>
#include <exception>
#include <string>
#include <vector>

#include "FingerDetect.h"
#include "FpNavi.h"
#include "PresenceFrames.h"
#include "param/NaviParam.h"
#include "parameters/ParamTable.h"
#include "presence/FingerStatus.h"

namespace {

constexpr int32_t kSimulatedFrames = 10000;  // of each sort
constexpr int32_t kBlocks = 5;

// Frames told right, of all of a sort.
struct Count {
    int64_t right = 0;
    int64_t total = 0;

    bool Enough() const { return right * 1000 >= total * 995; }
    std::string Text() const {
        const double percent =
            total == 0 ? 100.0 : 100.0 * static_cast<double>(right) / static_cast<double>(total);
        return fmt::format("{}/{} ({:.2f} %)", right, total, percent);
    }
};

struct Counts {
    Count present, absent;

    void Add(bool isPresent, bool answer) {
        Count& count = isPresent ? present : absent;
        count.total++;
        count.right += answer == isPresent ? 1 : 0;
    }
    bool Enough() const { return present.Enough() && absent.Enough(); }
};

// The texture test as the fp detector uses it: any of the five blocks is enough.
struct TextureAnswer {
    bool finger;
    int32_t strongest;  // response of any block
};

TextureAnswer TextureTest(const std::vector<uint8_t>& picture) {
    int32_t results[2 * kBlocks] = {0, 0, 0, 0, 0, 255, 255, 255, 255, 255};
    FingerBLKTest(picture.data(), presence::kWidth, presence::kHeight, results, 0);
    const int32_t strongest = *std::max_element(results, results + kBlocks);
    const int32_t darkest = *std::min_element(results + kBlocks, results + 2 * kBlocks);
    return {strongest >= fpnavi::s_fftResThreshold || darkest < fpnavi::s_meanThresholdFp,
            strongest};
}

// Prints the row of a group; true when all of its counts are high enough.
bool Judge(const presence::FrameGroup& group) {
    Counts texture;
    Counts detector;
    int32_t weakestPresent = INT32_MAX;
    int32_t strongestAbsent = 0;
    for (const presence::KnownFrame& frame : group.frames) {
        const TextureAnswer answer = TextureTest(frame.picture);
        texture.Add(frame.present, answer.finger);
        detector.Add(frame.present, fpnavi::NavFingerDetectFp(frame.picture.data()) == 1);
        if (frame.present)
            weakestPresent = std::min(weakestPresent, answer.strongest);
        else
            strongestAbsent = std::max(strongestAbsent, answer.strongest);
    }
    fmt::print("{:<16} | {:>22} {:>22} | {:>22} {:>22} | {:>7} {:>7}\n", group.name,
               texture.present.Text(), texture.absent.Text(), detector.present.Text(),
               detector.absent.Text(), weakestPresent, strongestAbsent);
    return texture.Enough() && detector.Enough();
}

std::string DirectoryOf(int argc, char** argv) {
    if (argc > 1)
        return argv[1];
    const char* realData = std::getenv("FPNAVI_REALDATA");
    return std::string(realData != nullptr ? realData : FPNAVI_REALDATA_DEFAULT) + "/gestures";
}

int Run(const std::string& directory) {
    host::ParamBlock params = host::DefaultParams();
    SetNaviParam(params.data());
    std::vector<presence::FrameGroup> groups = presence::RecordedGroups(directory);
    for (const presence::FrameGroup& group : groups)
        fmt::print("{}: {}\n", group.name, group.fingers);
    groups.push_back(presence::SimulatedGroup(kSimulatedFrames));

    fmt::print("\n{:<16} | {:>45} | {:>45} | {:>15}\n", "frames told right", "texture test alone",
               "whole detector", "response");
    fmt::print("{:<16} | {:>22} {:>22} | {:>22} {:>22} | {:>7} {:>7}\n", "", "present", "absent",
               "present", "absent", "present", "absent");
    bool enough = true;
    for (const presence::FrameGroup& group : groups)
        enough = Judge(group) && enough;
    fmt::print(
        "\nresponse: the strongest block of the weakest touched and of the strongest empty "
        "frame; threshold {}\n",
        fpnavi::s_fftResThreshold);
    return enough ? 0 : 1;
}

}  // namespace

int main(int argc, char** argv) {
    try {
        return Run(DirectoryOf(argc, argv));
    } catch (const std::exception& error) {
        fmt::print(stderr, "presence_counts: {}\n", error.what());
        return 3;
    }
}
