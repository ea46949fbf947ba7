// The tables of the benchmarks: a line for each step, size or peer.
#ifndef BENCH_REPORT_H
#define BENCH_REPORT_H

#include <benchmark/benchmark.h>

#include <vector>

namespace bench {

// Names of the counters that the benchmarks set; times are medians in microseconds.
inline constexpr const char* kPlain = "plain_us";
inline constexpr const char* kShipped = "shipped_us";
inline constexpr const char* kRatio = "ratio";          // plain by shipped, or peer by shipped
inline constexpr const char* kPerUnit = "ns_per_unit";  // of the shipped version
inline constexpr const char* kTimesDefault = "times_default";
inline constexpr const char* kPeer = "peer_us";
inline constexpr const char* kPeerRight = "peer_right";        // percent of the pairs
inline constexpr const char* kShippedRight = "shipped_right";  // percent of the pairs

struct Column {
    const char* title;
    const char* counter;
    const char* format;  // of the number
};

// The columns of one table. A benchmark's name fills the labels: "56x38 tiled: pair, moved" two.
struct TableFormat {
    std::vector<const char*> labels;
    std::vector<Column> columns;
};

// Writes a Markdown table to stdout.
class TableReporter : public benchmark::BenchmarkReporter {
  public:
    explicit TableReporter(const TableFormat& format) : m_format(format) {}
    bool ReportContext(const Context& context) override;
    void ReportRuns(const std::vector<Run>& runs) override;

  private:
    const TableFormat& m_format;
};

}  // namespace bench

#endif  // BENCH_REPORT_H
