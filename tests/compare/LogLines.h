// The module's log as lines that can be compared: those of the plain model, and of any process.
#ifndef TESTS_COMPARE_LOGLINES_H
#define TESTS_COMPARE_LOGLINES_H

#include <cstdarg>
#include <cstdio>
#include <string>
#include <vector>

#include "alog_host.h"

namespace fpnavi_test {

// The line with process and thread as 0; they stand in every line.
inline std::string WithoutIds(std::string line) {
    const size_t from = line.find("pid=");
    const size_t to = line.find(" => ", from);
    if (from != std::string::npos && to != std::string::npos)
        line.replace(from, to - from, "pid=0:ctid=0");
    return line;
}

// A sink of the log; context: the vector that gets "priority tag text".
__attribute__((format(printf, 4, 0))) inline int TakeLine(void* context, int priority,
                                                          const char* tag, const char* format,
                                                          std::va_list args) {
    char text[2048];
    const int length = std::vsnprintf(text, sizeof text, format, args);
    static_cast<std::vector<std::string>*>(context)->push_back(std::to_string(priority) + " " +
                                                               tag + " " + WithoutIds(text));
    return length;
}

// From now on the module's lines go to the end of lines, which must outlive the logging.
inline void LogTo(std::vector<std::string>* lines) {
    alog::SetSink(TakeLine, lines);
}

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_LOGLINES_H
