// Parameter files by way of toml++.
#include "parameters/ParamFile.h"

#include <fmt/format.h>
#include <toml++/toml.h>

#include <limits>
#include <sstream>

#include "common/Error.h"
#include "common/Files.h"
#include "common/Text.h"

namespace host {

namespace {

Error ErrorAt(const std::string& file, const toml::source_position& position,
              const std::string& problem) {
    return Error(file, fmt::format("{}:{}", position.line, position.column), problem);
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

int32_t IntegerOf(const toml::node& node, const std::string& name, const std::string& file) {
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
    return static_cast<int32_t>(integer->get());
}

std::vector<std::string_view> AllNames() {
    std::vector<std::string_view> names;
    for (const ParamInfo& info : ParamTable())
        names.emplace_back(info.name);
    return names;
}

Error UnknownName(const std::string& file, const toml::source_position& position,
                  const std::string& name) {
    return ErrorAt(file, position,
                   fmt::format("unknown parameter {}, {}", name,
                               Suggestion(name, AllNames(), "a name that fpnavi params lists")));
}

ParamSetting SettingOf(const toml::key& key, const toml::node& node, const std::string& name,
                       const std::string& file) {
    const std::optional<size_t> index = ParamIndex(name);
    if (!index)
        throw UnknownName(file, key.source().begin, name);
    const toml::source_position& at = node.source().begin;
    return {*index, IntegerOf(node, name, file), fmt::format("{}:{}", at.line, at.column)};
}

void ReadBand(const toml::table& band, const std::string& bandName, const std::string& file,
              std::vector<ParamSetting>* settings) {
    for (const auto& [key, node] : band)
        settings->push_back(SettingOf(key, node, fmt::format("{}.{}", bandName, key.str()), file));
}

void ReadTable(const toml::table& table, const std::string& file,
               std::vector<ParamSetting>* settings) {
    for (const auto& [key, node] : table) {
        const std::string name(key.str());
        const toml::table* const band = node.as_table();
        if (IsBand(name) && band == nullptr)
            throw ErrorAt(file, node.source().begin,
                          fmt::format("{} is of type {}, expected {}.RANGE_LOW and "
                                      "{}.RANGE_HIGH",
                                      name, TypeText(node.type()), name, name));
        // A table under the name of a number is a value of the wrong type.
        if (band != nullptr && !ParamIndex(name))
            ReadBand(*band, name, file, settings);
        // A quoted key with a dot would be a second spelling of a band's half.
        else if (name.find('.') != std::string::npos)
            throw UnknownName(file, key.source().begin, '"' + name + '"');
        else
            settings->push_back(SettingOf(key, node, name, file));
    }
}

std::string TextOf(const std::string& path) {
    const std::vector<uint8_t> content = ReadWholeFile(path);
    return {content.begin(), content.end()};
}

}  // namespace

std::vector<ParamSetting> ParseParamSettings(std::string_view text, const std::string& fileName) {
    std::vector<ParamSetting> settings;
    try {
        ReadTable(toml::parse(text, fileName), fileName, &settings);
    } catch (const toml::parse_error& error) {
        throw ErrorAt(
            fileName, error.source().begin,
            fmt::format("{}, expected TOML lines such as s_minDelta = 4", error.description()));
    }
    return settings;
}

std::vector<ParamSetting> ReadParamSettings(const std::string& path) {
    return ParseParamSettings(TextOf(path), path);
}

ParamBlock WithSettings(const std::vector<ParamSetting>& settings, ParamBlock params) {
    for (const ParamSetting& setting : settings)
        params[setting.index] = setting.value;
    return params;
}

ParamBlock ParseParams(std::string_view text, const std::string& fileName, const ParamBlock& base) {
    return WithSettings(ParseParamSettings(text, fileName), base);
}

ParamBlock ReadParamFile(const std::string& path, const ParamBlock& base) {
    return WithSettings(ReadParamSettings(path), base);
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
