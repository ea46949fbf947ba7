// The host's side of the log: where the lines of tq_log_printf go.
#ifndef DEVHAL_ALOG_ALOG_HOST_H
#define DEVHAL_ALOG_ALOG_HOST_H

#include <cstdarg>

namespace alog {

// Receives each line unformatted, so that a test can count the values behind the format.
// priority, tag, format: as given to tq_log_printf; args: the values, valid during the call only.
// context: what was given to SetSink. Returns what tq_log_printf is to return.
using Sink = int (*)(void* context, int priority, const char* tag, const char* format,
                     std::va_list args);

// Sends the lines to sink from now on; a null sink restores stderr. context stays the caller's.
void SetSink(Sink sink, void* context);

}  // namespace alog

#endif  // DEVHAL_ALOG_ALOG_HOST_H
