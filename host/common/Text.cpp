// Edit distances, and the byte ranges of UTF-8.
#include "common/Text.h"

#include <algorithm>
#include <cctype>
#include <cstddef>

namespace host {

namespace {

char Lower(char c) {
    return static_cast<char>(std::tolower(static_cast<unsigned char>(c)));
}

// Edits from a to b. Three rows of the table of distances between their beginnings are kept: that
// of the letter of a in work, and the two before.
size_t Edits(std::string_view a, std::string_view b) {
    std::vector<size_t> beforeLast(b.size() + 1);
    std::vector<size_t> last(b.size() + 1);
    std::vector<size_t> row(b.size() + 1);
    for (size_t j = 0; j <= b.size(); ++j)
        row[j] = j;
    for (size_t i = 1; i <= a.size(); ++i) {
        beforeLast.swap(last);
        last.swap(row);
        row[0] = i;
        for (size_t j = 1; j <= b.size(); ++j) {
            const size_t replaced = last[j - 1] + (Lower(a[i - 1]) == Lower(b[j - 1]) ? 0 : 1);
            row[j] = std::min({replaced, last[j] + 1, row[j - 1] + 1});
            if (i > 1 && j > 1 && Lower(a[i - 1]) == Lower(b[j - 2]) &&
                Lower(a[i - 2]) == Lower(b[j - 1]))
                row[j] = std::min(row[j], beforeLast[j - 2] + 1);
        }
    }
    return row[b.size()];
}

std::string ListOf(const std::vector<std::string_view>& names) {
    std::string list;
    for (size_t i = 0; i < names.size(); ++i) {
        if (i > 0)
            list += i + 1 == names.size() ? " or " : ", ";
        list += names[i];
    }
    return list;
}

struct ByteRange {
    unsigned char low;
    unsigned char high;
};

// Bytes that a sequence may begin with, and what its second byte may be. All further bytes
// are 80..BF.
struct Sequence {
    ByteRange lead;
    size_t length;
    ByteRange second;
};

constexpr Sequence kSequences[] = {
    {{0x00, 0x7F}, 1, {}},           {{0xC2, 0xDF}, 2, {0x80, 0xBF}},
    {{0xE0, 0xE0}, 3, {0xA0, 0xBF}}, {{0xE1, 0xEC}, 3, {0x80, 0xBF}},
    {{0xED, 0xED}, 3, {0x80, 0x9F}}, {{0xEE, 0xEF}, 3, {0x80, 0xBF}},
    {{0xF0, 0xF0}, 4, {0x90, 0xBF}}, {{0xF1, 0xF3}, 4, {0x80, 0xBF}},
    {{0xF4, 0xF4}, 4, {0x80, 0x8F}},
};

bool IsIn(ByteRange range, char c) {
    const auto byte = static_cast<unsigned char>(c);
    return byte >= range.low && byte <= range.high;
}

// Length of the sequence that text begins with; 0 when it is not well-formed.
size_t SequenceLength(std::string_view text) {
    for (const Sequence& sequence : kSequences) {
        if (!IsIn(sequence.lead, text[0]))
            continue;
        if (text.size() < sequence.length ||
            (sequence.length > 1 && !IsIn(sequence.second, text[1])))
            return 0;
        for (size_t i = 2; i < sequence.length; ++i) {
            if (!IsIn({0x80, 0xBF}, text[i]))
                return 0;
        }
        return sequence.length;
    }
    return 0;
}

}  // namespace

std::string NearestName(std::string_view name, const std::vector<std::string_view>& known) {
    std::string_view nearest;
    size_t fewest = std::max<size_t>(1, name.size() / 3) + 1;
    for (const std::string_view candidate : known) {
        const size_t edits = Edits(name, candidate);
        if (edits < fewest) {
            fewest = edits;
            nearest = candidate;
        }
    }
    return std::string(nearest);
}

std::string Suggestion(std::string_view name, const std::vector<std::string_view>& known,
                       const std::string& otherwise) {
    const std::string nearest = NearestName(name, known);
    return nearest.empty() ? "expected " + otherwise : "did you mean '" + nearest + "'?";
}

std::string Suggestion(std::string_view name, const std::vector<std::string_view>& known) {
    return Suggestion(name, known, ListOf(known));
}

bool EqualInAnyCase(std::string_view a, std::string_view b) {
    return std::equal(a.begin(), a.end(), b.begin(), b.end(),
                      [](char x, char y) { return Lower(x) == Lower(y); });
}

bool IsUtf8(std::string_view text) {
    while (!text.empty()) {
        const size_t length = SequenceLength(text);
        if (length == 0)
            return false;
        text.remove_prefix(length);
    }
    return true;
}

}  // namespace host
