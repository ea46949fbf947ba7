// What people type: the name that they may have meant, and whether text is UTF-8.
#ifndef FPNAVI_HOST_TEXT_H
#define FPNAVI_HOST_TEXT_H

#include <string>
#include <string_view>
#include <vector>

namespace host {

bool EqualInAnyCase(std::string_view a, std::string_view b);

// The known name that takes the fewest edits to come from name: a letter inserted, removed,
// replaced, or exchanged with its neighbour; the case of letters does not count. The first of
// several. Empty when the fewest edits are more than a third of name's letters (one edit is always
// allowed).
std::string NearestName(std::string_view name, const std::vector<std::string_view>& known);

// How the message about an unknown name ends: "did you mean 'LEFT'?" with the nearest name, else
// "expected " and otherwise.
std::string Suggestion(std::string_view name, const std::vector<std::string_view>& known,
                       const std::string& otherwise);

// The same; otherwise is the list of the known names: "UP, DOWN or LEFT".
std::string Suggestion(std::string_view name, const std::vector<std::string_view>& known);

// Well-formed UTF-8: no overlong forms, no surrogates, nothing above U+10FFFF.
bool IsUtf8(std::string_view text);

}  // namespace host

#endif  // FPNAVI_HOST_TEXT_H
