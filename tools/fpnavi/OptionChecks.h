// What the options of the subcommands take: checks whose messages name what was given and what was
// expected. A value that fails one is a usage error.
#ifndef FPNAVI_TOOLS_OPTIONCHECKS_H
#define FPNAVI_TOOLS_OPTIONCHECKS_H

#include <CLI/CLI.hpp>
#include <cstdint>
#include <limits>
#include <string>
#include <string_view>
#include <vector>

namespace command {

// A decimal number without leading zeros, least to most.
CLI::Validator WholeNumber(uint64_t least = 0,
                           uint64_t most = std::numeric_limits<uint64_t>::max());

// A register of 32 bits, decimal as WholeNumber or hexadecimal with 0x.
CLI::Validator Register();

// Any text but the empty one; what says what is expected, as "a file".
CLI::Validator NotEmpty(const std::string& what);

// The id of a gesture: UTF-8, not empty.
CLI::Validator GestureId();

// One of the names, in any case; kind is what they are names of, as "key".
CLI::Validator OneOf(const std::string& kind, const std::vector<std::string_view>& names);

}  // namespace command

#endif  // FPNAVI_TOOLS_OPTIONCHECKS_H
