// What the command writes: data on stdout, as text tables or as JSON lines, progress on stderr and
// only when that is a terminal. A full disk or a closed stdout is noticed at the end.
#ifndef FPNAVI_TOOLS_OUTPUT_H
#define FPNAVI_TOOLS_OUTPUT_H

#include <cstdint>
#include <nlohmann/json.hpp>
#include <string>
#include <vector>

namespace command {

// Keeps the order of its members, so that lines are easy to read too.
using Json = nlohmann::ordered_json;

enum class Colour { None, Green, Yellow, Red, Bold };

// Version of the members of the JSON lines; it grows when one is renamed, removed or changes its
// meaning, not when one is added.
inline constexpr int32_t kJsonSchema = 1;

// Makes sure that descriptors 0 to 2 are taken, so that nothing that is opened later becomes
// stdout or stderr by accident. Writing to one that was closed still fails. Call it first.
void GuardStandardStreams();

// Writes to stdout. After a failed write the rest is dropped.
void Write(const std::string& text);

// One line: {"schema":1,"kind":kind, members...}. Bytes that are not UTF-8 are replaced.
void WriteJson(const char* kind, const Json& members);

// Flushes stdout. Returns false, with a message on stderr, when not everything could be written.
bool FinishOutput();

// Progress between the lines of a table would be in the way.
bool StdoutIsTerminal();

// text in colour, as it is when stdout is no terminal or NO_COLOR is set.
std::string Coloured(Colour colour, const std::string& text);

// text with control characters replaced, so that one line stays one line.
std::string Printable(const std::string& text);

// "fpnavi: message" on stderr.
void WriteError(const std::string& message);

// "fpnavi: warning: message" on stderr.
void WriteWarning(const std::string& message);

// A column of a text table. A cell wider than its column moves those after it to the right.
struct Column {
    std::string title;
    size_t width = 0;  // at least; the title's width if that is more
    bool right = false;
};

struct Cell {
    Cell(std::string cellText, Colour cellColour = Colour::None)
        : text(std::move(cellText)), colour(cellColour) {}
    Cell(const char* cellText) : text(cellText) {}
    Cell(int64_t number) : text(std::to_string(number)) {}

    std::string text;
    Colour colour = Colour::None;
};

// Writes a table line by line; nothing is kept.
class Table {
  public:
    explicit Table(std::vector<Column> columns);
    void Head() const;
    void Row(const std::vector<Cell>& cells) const;

  private:
    std::vector<Column> m_columns;
};

// The text as a word of a shell's command line.
std::string ShellWord(const std::string& text);

// A counter on stderr, rewritten in place; silent when that is no terminal or show is false.
class Progress {
  public:
    Progress(std::string what, int64_t total, bool show);
    ~Progress();
    Progress(const Progress&) = delete;
    Progress& operator=(const Progress&) = delete;
    void Step();

  private:
    std::string m_what;
    int64_t m_total;
    int64_t m_done = 0;
    bool m_show;
};

}  // namespace command

#endif  // FPNAVI_TOOLS_OUTPUT_H
