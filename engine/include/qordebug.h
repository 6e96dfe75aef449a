// qordebug: the engine's reports. assert_func for broken contracts, warning for bad data after
// which the caller goes on, error for critical failures. None of them aborts: each writes its text
// to stderr (and to the installed handler) and returns.
#pragma once

namespace qordebug {

// What a report is about, as the handler is told: a broken contract (assert_func), bad data
// (warning) or a critical failure (error).
enum EReportKind { REPORT_ASSERT = 0, REPORT_WARNING = 1, REPORT_ERROR = 2 };

// Receives the formatted text of every report. Tests install one to capture reports.
typedef void (*report_handler_t)(EReportKind _kind, char const *_text, void *_user);

// A broken contract: printf-style text, written to stderr and the handler. Returns.
void assert_func(char const *_format, ...) __attribute__((format(printf, 1, 2)));
// Bad data after which the caller goes on with a default or a null result.
void warning(char const *_format, ...) __attribute__((format(printf, 1, 2)));
// A critical failure; it doesn't abort either.
void error(char const *_format, ...) __attribute__((format(printf, 1, 2)));

// Installs a handler (null restores the default); returns the previous one through the out
// parameters when they are not null. With a handler installed, stderr is left quiet unless
// _echo is true.
void set_report_handler(report_handler_t _handler, void *_user, bool _echo = false,
                        report_handler_t *_p_previous = nullptr, void **_p_previous_user = nullptr);

// Counts of reports of each kind since process start, for checks that nothing was reported.
unsigned report_count(EReportKind _kind);

} // namespace qordebug
