// Small tables of names; an index is the value.
#include "recording/Keys.h"

#include <array>

#include "common/Text.h"

namespace host {

namespace {

constexpr std::array<std::string_view, 6> kKeyNames = {"NONE",  "UP",   "DOWN",
                                                       "RIGHT", "LEFT", "NO_MOVE"};
constexpr std::array<std::string_view, 3> kModeNames = {"fp", "hg", "ds"};
constexpr std::array<std::string_view, 2> kEndNames = {"lift", "timeout"};

template <size_t N>
std::optional<int32_t> Find(const std::array<std::string_view, N>& names, std::string_view name) {
    for (size_t i = 0; i < N; ++i) {
        if (EqualInAnyCase(names[i], name))
            return static_cast<int32_t>(i);
    }
    return std::nullopt;
}

template <size_t N>
std::string NameAt(const std::array<std::string_view, N>& names, int32_t value) {
    if (value < 0 || value >= static_cast<int32_t>(N))
        return std::to_string(value);
    return std::string(names[static_cast<size_t>(value)]);
}

template <size_t N>
std::vector<std::string_view> AllOf(const std::array<std::string_view, N>& names) {
    return {names.begin(), names.end()};
}

}  // namespace

std::string KeyName(int32_t key) {
    return NameAt(kKeyNames, key);
}

std::optional<int32_t> ParseKey(std::string_view name) {
    return Find(kKeyNames, name);
}

bool IsKey(int32_t key) {
    return key >= VKEY_NONE && key <= VKEY_NO_MOVE;
}

std::vector<std::string_view> KeyNames() {
    return AllOf(kKeyNames);
}

std::string ModeName(Mode mode) {
    return NameAt(kModeNames, static_cast<int32_t>(mode));
}

std::optional<Mode> ParseMode(std::string_view name) {
    const std::optional<int32_t> value = Find(kModeNames, name);
    return value ? std::optional<Mode>(static_cast<Mode>(*value)) : std::nullopt;
}

std::vector<std::string_view> ModeNames() {
    return AllOf(kModeNames);
}

std::string EndName(GestureEnd end) {
    return NameAt(kEndNames, static_cast<int32_t>(end));
}

std::optional<GestureEnd> ParseEnd(std::string_view name) {
    const std::optional<int32_t> value = Find(kEndNames, name);
    return value ? std::optional<GestureEnd>(static_cast<GestureEnd>(*value)) : std::nullopt;
}

std::vector<std::string_view> EndNames() {
    return AllOf(kEndNames);
}

}  // namespace host
