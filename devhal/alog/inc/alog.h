/* The service's logging interface: one formatted log call in the manner of the Android log.
 *
 * The navigation module only declares and calls tq_log_printf; whoever links the module brings the
 * definition. The host's own definition (library fpnavi::alog) writes each line to stderr. */
#ifndef DEVHAL_ALOG_INC_ALOG_H
#define DEVHAL_ALOG_INC_ALOG_H

#ifdef __cplusplus
extern "C" {
#endif

/* Priority of a log line. The navigation module writes with TQ_LOG_DEBUG only. */
typedef enum tq_LogPriority {
    TQ_LOG_SILENT = 0,
    TQ_LOG_UNKNOWN = 1,
    TQ_LOG_DEFAULT = 2,
    TQ_LOG_VERBOSE = 3,
    TQ_LOG_DEBUG = 4,
    TQ_LOG_INFO = 5,
    TQ_LOG_WARN = 6,
    TQ_LOG_ERROR = 7,
    TQ_LOG_FATAL = 8,
    TQ_LOG_MAX = 9
} tq_LogPriority;

#if defined(__GNUC__)
#define TQ_LOG_PRINTF_FORMAT __attribute__((format(printf, 3, 4)))
#else
#define TQ_LOG_PRINTF_FORMAT
#endif

/* Writes one formatted line to the service's log.
 *
 * priority: a tq_LogPriority. tag: NUL-terminated name of the writer. format: a printf format and
 * its values behind it. All three belong to the caller; nothing is kept after the call.
 * Returns the number of bytes of the formatted message, negative when it could not be written. */
int tq_log_printf(int priority, const char* tag, const char* format, ...) TQ_LOG_PRINTF_FORMAT;

#ifdef __cplusplus
}
#endif

#endif /* DEVHAL_ALOG_INC_ALOG_H */
