// The module's calls, and its log lines as they are printed.
#include <cstdarg>
#include <cstdio>

#include "FpNavi.h"
#include "Side.h"
#include "alog_host.h"

namespace fpnavi_test {
namespace {

static_assert(sizeof(NaviVoteInfo_t) == kRecordIntegers * sizeof(int32_t));

const int32_t* Record() {
    return reinterpret_cast<const int32_t*>(::PrintNaviLog());
}

// The ids of the running process stand in every line.
std::string WithoutIds(std::string line) {
    const size_t from = line.find("pid=");
    const size_t to = line.find(" => ", from);
    if (from != std::string::npos && to != std::string::npos)
        line.replace(from, to - from, "pid=0:ctid=0");
    return line;
}

__attribute__((format(printf, 4, 0))) int TakeLine(void* context, int priority, const char* tag,
                                                   const char* format, std::va_list args) {
    char text[2048];
    const int length = std::vsnprintf(text, sizeof text, format, args);
    static_cast<std::vector<std::string>*>(context)->push_back(std::to_string(priority) + " " +
                                                               tag + " " + WithoutIds(text));
    return length;
}

void LogTo(std::vector<std::string>* lines) {
    alog::SetSink(TakeLine, lines);
}

}  // namespace

const Side& ModuleSide() {
    static const Side side = {::SetNaviParam,
                              ::FpNaviClear,
                              Record,
                              ::GetNaviBlock,
                              ::GetDoubleScanNaviBlock,
                              ::OrientationCalc,
                              ::Voting,
                              ::vmk_fp_navigation_detect_finger_status,
                              ::_NAVI_Tune,
                              LogTo};
    return side;
}

}  // namespace fpnavi_test
