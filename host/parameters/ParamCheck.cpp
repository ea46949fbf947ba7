// The checks behind ParamCheck.h.
#include "parameters/ParamCheck.h"

#include <fmt/format.h>

#include <algorithm>
#include <array>

#include "common/Error.h"
#include "recording/Keys.h"

namespace host {

namespace {

constexpr int64_t kSideMax = 4096;  // pixels

// A side of the image: pixels of a block times number of blocks.
struct Side {
    const char* block;
    const char* count;
    const char* extent;
};

const std::array<Side, 2>& SidesOf(Mode mode) {
    static constexpr std::array<Side, 2> kHg = {{{"s_blockWidthHg", "s_blockColNumHg", "wide"},
                                                 {"s_blockHeightHg", "s_blockRowNumHg", "high"}}};
    static constexpr std::array<Side, 2> kFp = {{{"s_blockWidthFp", "s_blockColNumFp", "wide"},
                                                 {"s_blockHeightFp", "s_blockRowNumFp", "high"}}};
    return mode == Mode::Hg ? kHg : kFp;
}

const ParamSetting* Find(const std::vector<ParamSetting>& settings, const char* name) {
    const auto found = std::find_if(
        settings.begin(), settings.end(),
        [name](const ParamSetting& setting) { return setting.index == ParamIndex(name); });
    return found == settings.end() ? nullptr : &*found;
}

}  // namespace

void CheckMode(const std::vector<ParamSetting>& settings, const std::string& file, Mode mode) {
    const ParamSetting* const flag = Find(settings, "s_modeFlag");
    if (flag == nullptr)
        return;
    const Mode set = ModeOf(WithSettings(settings, DefaultParams()));
    if (set != mode)
        throw Error(file, flag->place,
                    fmt::format("s_modeFlag = {} is mode {}, expected a value of mode {}",
                                flag->value, ModeName(set), ModeName(mode)));
}

void CheckImage(const std::vector<ParamSetting>& settings, const std::string& file,
                const ParamBlock& params) {
    for (const Side& side : SidesOf(ModeOf(params))) {
        const int64_t block = ParamValue(params, side.block);
        const int64_t count = ParamValue(params, side.count);
        if (block >= 1 && count >= 1 && block * count <= kSideMax)
            continue;
        for (const char* name : {side.block, side.count}) {
            const ParamSetting* const setting = Find(settings, name);
            if (setting != nullptr)
                throw Error(file, setting->place,
                            fmt::format("{} = {} makes the image {} pixels {} ({} blocks of {}), "
                                        "expected 1 to {}",
                                        name, setting->value, block * count, side.extent, count,
                                        block, kSideMax));
        }
    }
}

std::string ImageSettings(const std::vector<ParamSetting>& settings, const std::string& file,
                          const ParamBlock& params) {
    std::string text;
    for (const Side& side : SidesOf(ModeOf(params))) {
        for (const char* name : {side.block, side.count}) {
            const ParamSetting* const setting = Find(settings, name);
            if (setting != nullptr)
                text += fmt::format("{}{} = {} at {}:{}", text.empty() ? "" : ", ", name,
                                    setting->value, file, setting->place);
        }
    }
    return text;
}

}  // namespace host
