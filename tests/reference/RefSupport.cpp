// The model's surroundings: allocation with a failure switch, the log sink, the replaceable
// texture test and the size rule that several functions apply before they touch an image.

#include <cstdio>
#include <cstdlib>

#include "RefInternal.h"
#include "Reference.h"

namespace reference {

namespace {

void LeaveResults(const uint8_t* /*image*/, int32_t /*width*/, int32_t /*height*/,
                  int32_t* /*results*/, int32_t /*mode*/) {}

}  // namespace

void (*FingerBLKTest)(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                      int32_t mode) = LeaveResults;
std::vector<std::string>* s_logSink = nullptr;
int64_t s_allocationCount = 0;
int64_t s_failAllocation = -1;
int64_t s_failAllocationsFrom = -1;

void ResetTestHooks() {
    FingerBLKTest = LeaveResults;
    s_logSink = nullptr;
    s_allocationCount = 0;
    s_failAllocation = -1;
    s_failAllocationsFrom = -1;
}

void* Allocate(int64_t bytes) {
    const int64_t number = s_allocationCount++;
    const bool failsOnce = s_failAllocation >= 0 && number == s_failAllocation;
    const bool failsForGood = s_failAllocationsFrom >= 0 && number >= s_failAllocationsFrom;
    if (failsOnce || failsForGood || bytes < 1)
        return nullptr;
    return std::malloc(static_cast<size_t>(bytes));
}

std::string FormatValues(const char* format, const std::vector<int32_t>& values) {
    std::string text;
    size_t next = 0;
    for (const char* p = format; *p != '\0'; ++p) {
        if (p[0] == '%' && p[1] == 'd' && next < values.size()) {
            text += std::to_string(values[next]);
            ++next;
            ++p;
        } else {
            text += *p;
        }
    }
    return text;
}

void LogLine(const char* function, int32_t line, const std::string& message) {
    if (s_logSink == nullptr)
        return;
    char prefix[128];
    std::snprintf(prefix, sizeof prefix, "%-15s:%04d:pid=%d:ctid=%d => ", function, line, 0, 0);
    s_logSink->push_back("4 TQCODE " + std::string(prefix) + message);
}

bool IsSide(int64_t side) {
    return side >= 1 && side <= kMaxSide;
}

bool IsUsableImage() {
    return s_blockWidth >= 1 && s_blockHeight >= 1 && s_blockColNum >= 1 && s_blockRowNum >= 1 &&
           IsSide(int64_t{s_blockWidth} * s_blockColNum) &&
           IsSide(int64_t{s_blockHeight} * s_blockRowNum);
}

}  // namespace reference
