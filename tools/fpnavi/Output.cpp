#include "Output.h"

#include <fcntl.h>
#include <fmt/core.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace command {
namespace {

int s_writeError = 0;  // errno of the first failed write to stdout

bool ColoursWanted() {
    static const bool wanted = [] {
        const char* noColor = std::getenv("NO_COLOR");
        return StdoutIsTerminal() && (noColor == nullptr || *noColor == '\0');
    }();
    return wanted;
}

const char* Sequence(Colour colour) {
    switch (colour) {
        case Colour::Green:
            return "\x1b[32m";
        case Colour::Yellow:
            return "\x1b[33m";
        case Colour::Red:
            return "\x1b[31m";
        case Colour::Bold:
            return "\x1b[1m";
        default:
            return "";
    }
}

void NoteWriteError() {
    if (s_writeError == 0)
        s_writeError = errno != 0 ? errno : EIO;
}

}  // namespace

void GuardStandardStreams() {
    for (int fd = STDIN_FILENO; fd <= STDERR_FILENO; ++fd) {
        if (fcntl(fd, F_GETFD) < 0 && errno == EBADF) {
            // The lowest free descriptor is fd. Read-only, so that writing to it is an error.
            if (open("/dev/null", O_RDONLY) < 0)
                std::abort();
        }
    }
}

void Write(const std::string& text) {
    if (s_writeError != 0)
        return;
    errno = 0;
    if (std::fwrite(text.data(), 1, text.size(), stdout) != text.size())
        NoteWriteError();
}

void WriteJson(const char* kind, const Json& members) {
    Json line = {{"schema", kJsonSchema}, {"kind", kind}};
    line.update(members);
    Write(line.dump(-1, ' ', false, Json::error_handler_t::replace) + "\n");
}

bool FinishOutput() {
    errno = 0;
    if (std::fflush(stdout) != 0 || std::ferror(stdout) != 0)
        NoteWriteError();
    if (s_writeError == 0)
        return true;
    WriteError(
        fmt::format("stdout: not everything could be written: {}", std::strerror(s_writeError)));
    return false;
}

bool StdoutIsTerminal() {
    return isatty(STDOUT_FILENO) == 1;
}

std::string Coloured(Colour colour, const std::string& text) {
    if (colour == Colour::None || !ColoursWanted())
        return text;
    return fmt::format("{}{}\x1b[0m", Sequence(colour), text);
}

std::string Printable(const std::string& text) {
    std::string out = text;
    for (char& c : out) {
        if (static_cast<unsigned char>(c) < 0x20 || c == 0x7f)
            c = '?';
    }
    return out;
}

std::string ShellWord(const std::string& text) {
    constexpr const char* kPlain =
        "abcdefghijklmnopqrstuvwxyzABCDEFGHIJKLMNOPQRSTUVWXYZ0123456789/._-+,:@%=";
    if (!text.empty() && text.find_first_not_of(kPlain) == std::string::npos)
        return text;
    std::string quoted = "'";
    for (const char c : text)
        quoted += c == '\'' ? std::string("'\\''") : std::string(1, c);
    return quoted + "'";
}

void WriteError(const std::string& message) {
    std::fflush(stdout);
    fmt::print(stderr, "fpnavi: {}\n", message);
}

void WriteWarning(const std::string& message) {
    WriteError("warning: " + message);
}

Table::Table(std::vector<Column> columns) : m_columns(std::move(columns)) {
    for (Column& column : m_columns)
        column.width = std::max(column.width, column.title.size());
}

void Table::Head() const {
    std::vector<Cell> titles;
    for (const Column& column : m_columns)
        titles.emplace_back(column.title, Colour::Bold);
    Row(titles);
}

void Table::Row(const std::vector<Cell>& cells) const {
    std::string line;
    for (size_t i = 0; i < cells.size() && i < m_columns.size(); ++i) {
        const Column& column = m_columns[i];
        const std::string text = Printable(cells[i].text);
        const std::string fill(column.width > text.size() ? column.width - text.size() : 0, ' ');
        const std::string shown = Coloured(cells[i].colour, text);
        line += i > 0 ? "  " : "";
        line += column.right ? fill + shown : shown + fill;
    }
    line.erase(line.find_last_not_of(' ') + 1);
    Write(line + "\n");
}

Progress::Progress(std::string what, int64_t total, bool show)
    : m_what(std::move(what)), m_total(total), m_show(show && isatty(STDERR_FILENO) == 1) {}

Progress::~Progress() {
    if (m_show && m_done > 0)
        fmt::print(stderr, "\r\x1b[K");
}

void Progress::Step() {
    ++m_done;
    // Terminals are slow; a hundred steps are enough to see that it goes on.
    if (m_show && (m_done == m_total || m_done % (m_total / 100 + 1) == 0))
        fmt::print(stderr, "\r{} {}/{}", m_what, m_done, m_total);
}

}  // namespace command
