// The sink behind LogCapture: reads the values off the argument list and formats a copy of it.
#include "LogCapture.h"

#include <array>
#include <cstdio>
#include <utility>

#include "alog_host.h"

namespace fpnavi_test {
namespace {

constexpr size_t kTextRoom = 2048;  // longest printed line

int CountIntConversions(const std::string& message) {
    int count = 0;
    for (size_t at = message.find("%d"); at != std::string::npos; at = message.find("%d", at + 2))
        ++count;
    return count;
}

__attribute__((format(printf, 1, 0))) std::string Print(const char* format, std::va_list args) {
    std::array<char, kTextRoom> text{};
    std::vsnprintf(text.data(), text.size(), format, args);
    return text.data();
}

}  // namespace

LogCapture::LogCapture(std::string extraOf, int extraValues)
    : m_extraOf(std::move(extraOf)), m_extraValues(extraValues) {
    alog::SetSink(Sink, this);
}

LogCapture::~LogCapture() {
    alog::SetSink(nullptr, nullptr);
}

const char* LogCapture::Prefix() {
    return "%-15s:%04d:pid=%d:ctid=%d => ";
}

int LogCapture::Sink(void* context, int priority, const char* tag, const char* format,
                     std::va_list args) {
    auto* self = static_cast<LogCapture*>(context);
    LogLine line;
    line.priority = priority;
    line.tag = tag;
    line.format = format;
    std::va_list copy;
    va_copy(copy, args);
    line.text = Print(format, copy);
    va_end(copy);

    const std::string prefix = Prefix();
    if (line.format.compare(0, prefix.size(), prefix) == 0) {
        line.message = line.format.substr(prefix.size());
        int number = CountIntConversions(line.message);
        if (!self->m_extraOf.empty() && line.message.find(self->m_extraOf) != std::string::npos)
            number += self->m_extraValues;
        va_copy(copy, args);
        line.function = va_arg(copy, const char*);
        line.line = va_arg(copy, int);
        line.pid = va_arg(copy, int);
        line.tid = va_arg(copy, int);
        for (int i = 0; i < number; ++i)
            line.values.push_back(va_arg(copy, int));
        va_end(copy);
    }
    self->m_lines.push_back(line);
    return static_cast<int>(self->m_lines.back().text.size());
}

}  // namespace fpnavi_test
