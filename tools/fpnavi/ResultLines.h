// What replay shows of a gesture's result, for the table, the trace and the JSON lines alike.
#ifndef FPNAVI_TOOLS_RESULTLINES_H
#define FPNAVI_TOOLS_RESULTLINES_H

#include <cstdint>
#include <map>
#include <string>

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
    int64_t Wrong() const;
    void Write(bool json) const;

  private:
    struct Counts {
        int64_t all = 0;
        int64_t right = 0;
        int64_t accepted = 0;
        int64_t wrong = 0;
    };
    // Mode and tier; the empty tier comes first and "all" of a mode is computed.
    std::map<std::pair<host::Mode, std::string>, Counts> m_counts;

    static void Count(const Counts& from, Counts* to);
    static void WriteLine(bool json, const class Table& table, const std::string& mode,
                          const std::string& tier, const Counts& counts);
};

}  // namespace command

#endif  // FPNAVI_TOOLS_RESULTLINES_H
