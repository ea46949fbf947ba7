#include "Report.h"

#include <cstdio>
#include <string>

namespace bench {
namespace {

std::string Number(const benchmark::UserCounters& counters, const char* name, const char* format) {
    const auto found = counters.find(name);
    if (found == counters.end())
        return "";
    char text[32];
    std::snprintf(text, sizeof text, format, found->second.value);
    return text;
}

// Without what the library appends for manual timing: "fill/iterations:9/manual_time".
std::string PlainName(const std::string& name) {
    return name.substr(0, name.find('/'));
}

}  // namespace

bool TableReporter::ReportContext(const Context&) {
    std::printf("| %-20s | %9s | %10s | %6s |\n", "step", "plain us", "shipped us", "ratio");
    std::printf("|%s|%s|%s|%s|\n", "----------------------",
                "----------:", "-----------:", "-------:");
    return true;
}

void TableReporter::ReportRuns(const std::vector<Run>& runs) {
    for (const Run& run : runs) {
        const std::string name = PlainName(run.benchmark_name());
        if (run.error_occurred) {
            std::fprintf(stderr, "%s: %s\n", name.c_str(), run.error_message.c_str());
            continue;
        }
        const std::string peer = Number(run.counters, kPeer, "%.2f");
        const std::string time = peer.empty() ? Number(run.counters, kShipped, "%.2f") : peer;
        std::printf("| %-20s | %9s | %10s | %6s |\n", name.c_str(),
                    Number(run.counters, kPlain, "%.2f").c_str(), time.c_str(),
                    Number(run.counters, kRatio, "%.1f").c_str());
    }
    std::fflush(stdout);
}

}  // namespace bench
