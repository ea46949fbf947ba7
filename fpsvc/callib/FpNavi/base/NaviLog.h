// The module's log lines: the common prefix and the one macro that writes a line. Owns nothing.
#ifndef FPNAVI_NAVILOG_H
#define FPNAVI_NAVILOG_H

#include <unistd.h>

#include "alog.h"

// Writes one line at debug priority: the name of the function and the line number that the reader
// of the log is to see, then message, a string literal, and the values behind it. The line numbers
// are part of the output, so that logs of different builds compare; they do not follow the source.
#define NAVI_LOG(function, line, message, ...)                                                     \
    tq_log_printf(TQ_LOG_DEBUG, "TQCODE", "%-15s:%04d:pid=%d:ctid=%d => " message, function, line, \
                  static_cast<int>(getpid()), static_cast<int>(gettid()), ##__VA_ARGS__)

#endif  // FPNAVI_NAVILOG_H
