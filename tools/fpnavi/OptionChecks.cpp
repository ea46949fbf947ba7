// The checks behind OptionChecks.h. CLI11 puts the option's name before the message.
#include "OptionChecks.h"

#include <fmt/core.h>

#include <algorithm>
#include <charconv>
#include <optional>

#include "common/Text.h"

namespace command {
namespace {

// The number that text is as a whole in that base; empty for anything else.
std::optional<uint64_t> NumberOf(std::string_view text, int base) {
    uint64_t value = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), value, base);
    if (text.empty() || error != std::errc() || end != text.data() + text.size())
        return std::nullopt;
    return value;
}

// Some programs read 010 as 8.
bool HasLeadingZero(std::string_view text) {
    return text.size() > 1 && text[0] == '0';
}

bool IsRegister(std::string_view text) {
    const bool isHex = text.substr(0, 2) == "0x" || text.substr(0, 2) == "0X";
    if (!isHex && HasLeadingZero(text))
        return false;
    const std::optional<uint64_t> value = isHex ? NumberOf(text.substr(2), 16) : NumberOf(text, 10);
    return value && *value <= std::numeric_limits<uint32_t>::max();
}

}  // namespace

CLI::Validator WholeNumber(uint64_t least, uint64_t most) {
    const auto check = [least, most](const std::string& text) -> std::string {
        const std::optional<uint64_t> value = NumberOf(text, 10);
        if (value && HasLeadingZero(text))
            return fmt::format("'{}', expected a whole number without leading zeros", text);
        if (!value || *value < least || *value > most)
            return fmt::format("'{}', expected a whole number from {} to {}", text, least, most);
        return {};
    };
    return CLI::Validator(check, fmt::format("{} to {}", least, most));
}

CLI::Validator Register() {
    const auto check = [](const std::string& text) {
        return IsRegister(text)
                   ? std::string()
                   : fmt::format("'{}', expected a register as 0x123456C0 or 191, 0 to 0xFFFFFFFF",
                                 text);
    };
    return CLI::Validator(check, "0 to 0xFFFFFFFF");
}

CLI::Validator NotEmpty(const std::string& what) {
    const auto check = [what](const std::string& text) {
        return text.empty() ? "the text is empty, expected " + what : std::string();
    };
    return CLI::Validator(check, "");
}

CLI::Validator GestureId() {
    const auto check = [](const std::string& text) -> std::string {
        if (text.empty())
            return "the text is empty, expected an id";
        return host::IsUtf8(text) ? "" : "the text is no UTF-8, expected an id that is";
    };
    return CLI::Validator(check, "");
}

CLI::Validator OneOf(const std::string& kind, const std::vector<std::string_view>& names) {
    const auto check = [kind, names](const std::string& text) {
        const bool known = std::any_of(names.begin(), names.end(), [&](std::string_view name) {
            return host::EqualInAnyCase(name, text);
        });
        return known
                   ? std::string()
                   : fmt::format("unknown {} '{}', {}", kind, text, host::Suggestion(text, names));
    };
    return CLI::Validator(check, "");
}

}  // namespace command
