// Takes the module's log lines while it lives: what was passed to tq_log_printf, value by value,
// and the text that it prints.
#ifndef TESTS_SUPPORT_LOGCAPTURE_H
#define TESTS_SUPPORT_LOGCAPTURE_H

#include <cstdarg>
#include <cstdint>
#include <string>
#include <vector>

namespace fpnavi_test {

struct LogLine {
    int priority = 0;
    std::string tag;
    std::string format;   // as passed, common prefix included
    std::string message;  // the format behind the common prefix
    std::string text;     // what is printed
    std::string function;
    int line = 0;
    int pid = 0;
    int tid = 0;
    std::vector<int32_t> values;  // behind the prefix: one for each %d, then the extra ones
};

class LogCapture {
  public:
    // extraValues: how many values are read behind those of the conversions, of messages that
    // contain extraOf; the module must really pass them.
    explicit LogCapture(std::string extraOf = "", int extraValues = 0);
    ~LogCapture();
    LogCapture(const LogCapture&) = delete;
    LogCapture& operator=(const LogCapture&) = delete;

    const std::vector<LogLine>& Lines() const { return m_lines; }
    // The common prefix of every format.
    static const char* Prefix();

  private:
    static int Sink(void* context, int priority, const char* tag, const char* format,
                    std::va_list args);

    std::vector<LogLine> m_lines;
    std::string m_extraOf;
    int m_extraValues;
};

}  // namespace fpnavi_test

#endif  // TESTS_SUPPORT_LOGCAPTURE_H
