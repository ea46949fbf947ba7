// The names that people write for keys, modes and ends, and their values.
#ifndef FPNAVI_HOST_KEYS_H
#define FPNAVI_HOST_KEYS_H

#include <optional>
#include <string>
#include <string_view>
#include <vector>

#include "recording/Recording.h"

namespace host {

// NONE, UP, DOWN, RIGHT, LEFT, NO_MOVE for 0 to 5; the number itself for anything else.
std::string KeyName(int32_t key);

// The value of a key name in any case; empty for an unknown name.
std::optional<int32_t> ParseKey(std::string_view name);

// All names, in the order of their values.
std::vector<std::string_view> KeyNames();

// True for the six values of NaviVkey_t.
bool IsKey(int32_t key);

// fp, hg, ds.
std::string ModeName(Mode mode);
std::optional<Mode> ParseMode(std::string_view name);
std::vector<std::string_view> ModeNames();

// lift, timeout.
std::string EndName(GestureEnd end);
std::optional<GestureEnd> ParseEnd(std::string_view name);
std::vector<std::string_view> EndNames();

}  // namespace host

#endif  // FPNAVI_HOST_KEYS_H
