// qordebug: formats a report, hands it to the installed handler, writes it to stderr, and returns.
#include "qordebug.h"

#include <atomic>
#include <cstdarg>
#include <cstdio>

namespace qordebug {

namespace {

report_handler_t gp_handler = nullptr;
void *gp_user = nullptr;
bool g_echo = true;
std::atomic<unsigned> g_counts[3] = {}; // reports may come from any thread

char const *const k_prefixes[3] = {"[assert] ", "[warning] ", "[error] "};

void report(EReportKind _kind, char const *_format, va_list _args) {
    char text[4096];
    vsnprintf(text, sizeof(text), _format ? _format : "", _args);
    ++g_counts[_kind];
    if (gp_handler) gp_handler(_kind, text, gp_user);
    if (!gp_handler || g_echo) {
        fputs(k_prefixes[_kind], stderr);
        fputs(text, stderr);
        fputc('\n', stderr);
        fflush(stderr);
    }
}

} // namespace

void assert_func(char const *_format, ...) {
    va_list args;
    va_start(args, _format);
    report(REPORT_ASSERT, _format, args);
    va_end(args);
}

void warning(char const *_format, ...) {
    va_list args;
    va_start(args, _format);
    report(REPORT_WARNING, _format, args);
    va_end(args);
}

void error(char const *_format, ...) {
    va_list args;
    va_start(args, _format);
    report(REPORT_ERROR, _format, args);
    va_end(args);
}

void set_report_handler(report_handler_t _handler, void *_user, bool _echo, report_handler_t *_p_previous,
                        void **_p_previous_user) {
    if (_p_previous) *_p_previous = gp_handler;
    if (_p_previous_user) *_p_previous_user = gp_user;
    gp_handler = _handler;
    gp_user = _handler ? _user : nullptr;
    g_echo = _handler ? _echo : true;
}

unsigned report_count(EReportKind _kind) {
    return _kind >= REPORT_ASSERT && _kind <= REPORT_ERROR ? g_counts[_kind].load() : 0u;
}

} // namespace qordebug
