// Parameter files by way of toml++.
#include "parameters/ParamFile.h"

#include <fmt/format.h>
#include <toml++/toml.h>

#include <limits>
#include <sstream>

#include "common/Error.h"
#include "common/Files.h"

namespace host {

namespace {

using Settings = std::vector<ParamSetting>;

std::string PlaceText(const toml::source_position& position) {
    return fmt::format("{}:{}", position.line, position.column);
}

Error ErrorAt(const std::string& file, const toml::source_position& position,
              const std::string& problem) {
    return Error(file, PlaceText(position), problem);
}

std::string TypeText(toml::node_type type) {
    std::ostringstream text;
    text << type;
    return text.str();
}

// True when some parameter is called name.something.
bool IsBand(std::string_view name) {
    return ParamIndex(std::string(name) + ".RANGE_LOW").has_value();
}

ParamSetting SettingOf(size_t index, const toml::node& node, const std::string& name,
                       const std::string& file) {
    const toml::value<int64_t>* const integer = node.as_integer();
    if (integer == nullptr)
        throw ErrorAt(
            file, node.source().begin,
            fmt::format("{} is of type {}, expected an integer", name, TypeText(node.type())));
    constexpr int64_t kMin = std::numeric_limits<int32_t>::min();
    constexpr int64_t kMax = std::numeric_limits<int32_t>::max();
    if (integer->get() < kMin || integer->get() > kMax)
        throw ErrorAt(file, node.source().begin,
                      fmt::format("{} = {} is out of range, expected {} to {}", name,
                                  integer->get(), kMin, kMax));
    return {index, static_cast<int32_t>(integer->get()), PlaceText(node.source().begin)};
}

void ReadBand(const toml::table& band, const std::string& bandName, const std::string& file,
              Settings& settings) {
    for (const auto& [key, node] : band) {
        const std::string name = fmt::format("{}.{}", bandName, key.str());
        const std::optional<size_t> index = ParamIndex(name);
        if (!index)
            throw ErrorAt(file, key.source().begin,
                          fmt::format("unknown parameter {}, expected {}.RANGE_LOW or "
                                      "{}.RANGE_HIGH",
                                      name, bandName, bandName));
        settings.push_back(SettingOf(*index, node, name, file));
    }
}

void ReadTable(const toml::table& table, const std::string& file, Settings& settings) {
    for (const auto& [key, node] : table) {
        const std::string name(key.str());
        if (IsBand(name)) {
            const toml::table* const band = node.as_table();
            if (band == nullptr)
                throw ErrorAt(file, node.source().begin,
                              fmt::format("{} is of type {}, expected {}.RANGE_LOW and "
                                          "{}.RANGE_HIGH",
                                          name, TypeText(node.type()), name, name));
            ReadBand(*band, name, file, settings);
            continue;
        }
        // A quoted key with a dot would be a second spelling of a band's half.
        const std::optional<size_t> index = ParamIndex(name);
        if (!index || name.find('.') != std::string::npos)
            throw ErrorAt(file, key.source().begin,
                          fmt::format("unknown parameter {}, expected a name of the parameter "
                                      "block",
                                      name));
        settings.push_back(SettingOf(*index, node, name, file));
    }
}

ParamBlock Applied(const Settings& settings, ParamBlock params) {
    for (const ParamSetting& setting : settings)
        params[setting.index] = setting.value;
    return params;
}

}  // namespace

std::vector<ParamSetting> ParseParamSettings(std::string_view text, const std::string& fileName) {
    Settings settings;
    try {
        ReadTable(toml::parse(text, fileName), fileName, settings);
    } catch (const toml::parse_error& error) {
        throw ErrorAt(
            fileName, error.source().begin,
            fmt::format("{}, expected TOML lines such as s_minDelta = 4", error.description()));
    }
    return settings;
}

std::vector<ParamSetting> ReadParamSettings(const std::string& path) {
    const std::vector<uint8_t> content = ReadWholeFile(path);
    return ParseParamSettings(
        std::string_view(reinterpret_cast<const char*>(content.data()), content.size()), path);
}

ParamBlock ParseParams(std::string_view text, const std::string& fileName, const ParamBlock& base) {
    return Applied(ParseParamSettings(text, fileName), base);
}

ParamBlock ReadParamFile(const std::string& path, const ParamBlock& base) {
    return Applied(ReadParamSettings(path), base);
}

std::string ParamFileText(const ParamBlock& params) {
    std::string text = "# Parameters of the finger navigation, in the order of the block.\n";
    for (size_t i = 0; i < params.size(); ++i) {
        const ParamInfo& info = ParamTable()[i];
        text += fmt::format("{} = {}", info.name, params[i]);
        if (params[i] != info.defaultValue)
            text += fmt::format("  # default {}", info.defaultValue);
        text += '\n';
    }
    return text;
}

}  // namespace host
