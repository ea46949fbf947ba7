// What replay shows of a gesture's result, for the table, the trace and the JSON lines alike.
#ifndef FPNAVI_TOOLS_RESULTLINES_H
#define FPNAVI_TOOLS_RESULTLINES_H

#include <array>
#include <cstdint>
#include <map>
#include <string>
#include <vector>

#include "Output.h"
#include "replay/Replay.h"

namespace command {

Colour VerdictColour(host::Verdict verdict);

// The key's name; "-" for -1, when there was no vote.
std::string ShownKey(int32_t key);

Json ResultJson(const host::ReplayResult& result);

// Counts verdicts by mode, and within each mode by tier.
class Summary {
  public:
    void Add(const host::ReplayResult& result);
    int64_t Count(host::Verdict verdict) const;
    // Columns for verdicts that a corpus need not have are left out of the table when all are 0.
    void Write(bool json) const;

  private:
    struct Counts {
        int64_t all = 0;
        std::array<int64_t, host::kVerdictCount> verdicts{};
        int64_t failed = 0;  // of the wrong ones: a call failed, or a crash

        void Add(const Counts& other);
        int64_t Of(host::Verdict verdict) const { return verdicts[static_cast<size_t>(verdict)]; }
    };
    // Mode and tier; the empty tier comes first and "all" of a mode is computed.
    std::map<std::pair<host::Mode, std::string>, Counts> m_counts;

    Counts All() const;
    static void WriteJsonLine(const std::string& mode, const std::string& tier,
                              const Counts& counts);
    static std::vector<Column> Columns(const Counts& all);
    static std::vector<Cell> Row(const std::string& mode, const std::string& tier,
                                 const Counts& counts, const Counts& all);
};

}  // namespace command

#endif  // FPNAVI_TOOLS_RESULTLINES_H
