// The table of the benchmarks: a line for each step, then one for each peer.
#ifndef BENCH_REPORT_H
#define BENCH_REPORT_H

#include <benchmark/benchmark.h>

#include <vector>

namespace bench {

// Names of the counters that each benchmark sets, medians in microseconds.
inline constexpr const char* kPlain = "plain_us";
inline constexpr const char* kShipped = "shipped_us";
inline constexpr const char* kRatio = "ratio";
inline constexpr const char* kPeer = "peer_us";

// Writes a Markdown table to stdout.
class TableReporter : public benchmark::BenchmarkReporter {
  public:
    bool ReportContext(const Context& context) override;
    void ReportRuns(const std::vector<Run>& runs) override;
};

}  // namespace bench

#endif  // BENCH_REPORT_H
