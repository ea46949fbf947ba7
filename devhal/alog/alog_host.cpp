// tq_log_printf for a host: lines go to stderr or to the sink that a test or tool has set.
#include "alog_host.h"

#include <cstdio>

#include "alog.h"

namespace alog {
namespace {

__attribute__((format(printf, 4, 0))) int WriteToStderr(void* /*context*/, int /*level*/,
                                                        const char* /*tag*/, const char* format,
                                                        std::va_list args) {
    return std::vfprintf(stderr, format, args);
}

Sink s_sink = WriteToStderr;
void* s_context = nullptr;

}  // namespace

void SetSink(Sink sink, void* context) {
    s_sink = sink != nullptr ? sink : WriteToStderr;
    s_context = sink != nullptr ? context : nullptr;
}

}  // namespace alog

extern "C" int tq_log_printf(int priority, const char* tag, const char* format, ...) {
    std::va_list args;
    va_start(args, format);
    const int written = alog::s_sink(alog::s_context, priority, tag, format, args);
    va_end(args);
    return written;
}
