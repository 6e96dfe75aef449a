// The library's client of the engine's log manager. Two live for the process: "UILogger" with the
// prefix "UI" for the library's own lines, and "ConsoleLogger" with ">" for the console's echo.
// Levels: 0 message, 1 warning, 2 error.
#pragma once
#include "qor_memory.h"

#include <cstdarg>

class ILogger;
class ILogManager;

namespace qorui {

// A named client of the engine's log manager, found again when the manager changes.
class CLogger {
public:
    // The prefix is cut to four characters, followed by a colon and blanks to six. A silent
    // logger's engine logger is switched off.
    CLogger(char const *_name, char const *_prefix, bool _silent);

    // A printf-style line at level 0 (message), 1 (warning) or 2 (error), narrow (cut at 511 bytes)
    // or 16-bit (cut at 511 units, formatted by format_units); a null format writes nothing.
    // @{
    void log_message(char const *_format, ...) __attribute__((format(printf, 2, 3)));
    void log_message(unsigned short const *_format, ...);
    void log_warning(char const *_format, ...) __attribute__((format(printf, 2, 3)));
    void log_warning(unsigned short const *_format, ...);
    void log_error(char const *_format, ...) __attribute__((format(printf, 2, 3)));
    void log_error(unsigned short const *_format, ...);
    // @}

    // The six characters that the engine's logger puts in front of each line.
    char const *get_prefix() const { return m_prefix.c_str(); }

private:
    // The engine's logger, found or made at the first write; null without a log manager.
    ILogger *attach();
    void write(int _level, char const *_format, va_list _args);
    void write(int _level, unsigned short const *_format, va_list _args);

    string m_name;
    string m_prefix;
    bool m_silent;
    ILogger *mp_logger;
    ILogManager *mp_manager; // the manager mp_logger came from
};

// "UILogger" (prefix "UI"), the library's own lines, and "ConsoleLogger" (prefix ">"), the
// console's echo of commands; each built at its first use.
// @{
CLogger &ui_logger();
CLogger &console_logger();
// @}

// The printf family for 16-bit text: "%s" takes 16-bit text, "%S" narrow text (UTF-8), "%c" one
// unit; numeric conversions are those of the C library. Writes at most _size - 1 units and a
// terminator; result the count written.
size_t format_units(unsigned short *_p_out, size_t _size, unsigned short const *_format, va_list _args);

} // namespace qorui
