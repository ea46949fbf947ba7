#include "Report.h"

#include <cstdio>
#include <string>

namespace bench {
namespace {

constexpr int kLabelWidth = 22;   // characters
constexpr int kNumberWidth = 11;  // characters
constexpr const char* kLabelEnd = ": ";

std::string Number(const benchmark::UserCounters& counters, const Column& column) {
    const auto found = counters.find(column.counter);
    if (found == counters.end())
        return "";
    char text[32];
    std::snprintf(text, sizeof text, column.format, found->second.value);
    return text;
}

// Without what the library appends for manual timing: "fill/iterations:9/manual_time".
std::string PlainName(const std::string& name) {
    return name.substr(0, name.find('/'));
}

void PrintLabels(std::string name, size_t count) {
    for (size_t i = 0; i < count; ++i) {
        const size_t end = i + 1 < count ? name.find(kLabelEnd) : std::string::npos;
        std::printf("| %-*s ", kLabelWidth, name.substr(0, end).c_str());
        name = end == std::string::npos ? "" : name.substr(end + 2);
    }
}

}  // namespace

bool TableReporter::ReportContext(const Context&) {
    for (const char* const label : m_format.labels)
        std::printf("| %-*s ", kLabelWidth, label);
    for (const Column& column : m_format.columns)
        std::printf("| %*s ", kNumberWidth, column.title);
    std::printf("|\n");
    for (size_t i = 0; i < m_format.labels.size(); ++i)
        std::printf("|%s", std::string(kLabelWidth + 2, '-').c_str());
    for (size_t i = 0; i < m_format.columns.size(); ++i)
        std::printf("|%s:", std::string(kNumberWidth + 1, '-').c_str());
    std::printf("|\n");
    return true;
}

void TableReporter::ReportRuns(const std::vector<Run>& runs) {
    for (const Run& run : runs) {
        const std::string name = PlainName(run.benchmark_name());
        if (run.error_occurred) {
            std::fprintf(stderr, "%s: %s\n", name.c_str(), run.error_message.c_str());
            continue;
        }
        PrintLabels(name, m_format.labels.size());
        for (const Column& column : m_format.columns)
            std::printf("| %*s ", kNumberWidth, Number(run.counters, column).c_str());
        std::printf("|\n");
    }
    std::fflush(stdout);
}

}  // namespace bench
