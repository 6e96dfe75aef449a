// The library's loggers: named loggers of the engine's log manager, with a prefix, narrow and wide
// formatting and three levels.
#include "ui_logger.h"
#include "engine_interfaces.h"
#include "qor_log.h"
#include "ui_string.h"

#include <cstdarg>
#include <cstdio>
#include <cstring>

namespace qorui {

CLogger &ui_logger() {
    static CLogger s_logger("UILogger", "UI", false);
    return s_logger;
}

CLogger &console_logger() {
    static CLogger s_logger("ConsoleLogger", ">", false);
    return s_logger;
}

CLogger::CLogger(char const *_name, char const *_prefix, bool _silent)
    : m_name(_name ? _name : ""), m_silent(_silent), mp_logger(nullptr), mp_manager(nullptr) {
    m_prefix = string(_prefix ? _prefix : "").substr(0, 4) + ":";
    m_prefix.resize(6, ' ');
}

// The engine's logger is found (or made) at the first write, and again when the engine's log
// manager has changed since, so a withdrawn manager's logger is never written to.
ILogger *CLogger::attach() {
    ILogManager *p_manager = engine_interfaces().get_log_manager(false);
    if (p_manager != mp_manager) {
        mp_manager = p_manager;
        mp_logger = nullptr;
    }
    if (mp_logger || !p_manager) return mp_logger;
    mp_logger = p_manager->find_logger(m_name.c_str());
    if (!mp_logger) mp_logger = p_manager->create_logger(m_name.c_str(), m_prefix.c_str());
    if (mp_logger) mp_logger->set_active(!m_silent);
    return mp_logger;
}

void CLogger::write(int _level, char const *_format, va_list _args) {
    if (!_format) return;
    char buffer[512];
    std::vsnprintf(buffer, sizeof buffer, _format, _args);
    if (ILogger *p_logger = attach()) p_logger->write(buffer, _level);
}

void CLogger::write(int _level, unsigned short const *_format, va_list _args) {
    if (!_format) return;
    unsigned short buffer[512];
    format_units(buffer, 512, _format, _args);
    if (ILogger *p_logger = attach()) p_logger->write(buffer, _level);
}

#define QOR_LOGGER_WRITE(_operation, _text_type, _level)                                                     \
    void CLogger::_operation(_text_type _format, ...) {                                                      \
        va_list args;                                                                                        \
        va_start(args, _format);                                                                             \
        write(_level, _format, args);                                                                        \
        va_end(args);                                                                                        \
    }

QOR_LOGGER_WRITE(log_message, char const *, 0)
QOR_LOGGER_WRITE(log_message, unsigned short const *, 0)
QOR_LOGGER_WRITE(log_warning, char const *, 1)
QOR_LOGGER_WRITE(log_warning, unsigned short const *, 1)
QOR_LOGGER_WRITE(log_error, char const *, 2)
QOR_LOGGER_WRITE(log_error, unsigned short const *, 2)
#undef QOR_LOGGER_WRITE

size_t format_units(unsigned short *_p_out, size_t _size, unsigned short const *_format, va_list _args) {
    size_t length = 0;
    auto put = [&](unsigned short _unit) {
        if (length + 1 < _size) _p_out[length++] = _unit;
    };
    for (unsigned short const *p = _format; *p; ++p) {
        if (*p != '%') {
            put(*p);
            continue;
        }
        // One conversion: copy its flags, width, precision and length to a narrow spec.
        char spec[32] = "%";
        size_t spec_length = 1;
        ++p;
        while (*p && spec_length + 2 < sizeof(spec) &&
               strchr("-+ #0123456789.hlLjzt", static_cast<char>(*p)) && *p < 128)
            spec[spec_length++] = static_cast<char>(*p++);
        if (!*p) break;
        unsigned short const conversion = *p;
        if (conversion == '%') {
            put('%');
        } else if (conversion == 's') {
            for (unsigned short const *s = va_arg(_args, unsigned short const *); s && *s; ++s)
                put(*s);
        } else if (conversion == 'S') {
            char const *s = va_arg(_args, char const *);
            for (unsigned short const *u = s ? CString::str2wcs(s, -1) : nullptr; u && *u; ++u)
                put(*u);
        } else if (conversion == 'c') {
            put(static_cast<unsigned short>(va_arg(_args, int)));
        } else if (conversion < 128) {
            spec[spec_length++] = static_cast<char>(conversion);
            spec[spec_length] = '\0';
            char text[128];
            bool const is_float = strchr("fFeEgGaA", static_cast<char>(conversion)) != nullptr;
            bool const is_long =
                strstr(spec, "l") || strstr(spec, "z") || strstr(spec, "j") || strstr(spec, "t");
            if (is_float)
                snprintf(text, sizeof(text), spec, va_arg(_args, double));
            else if (conversion == 'p')
                snprintf(text, sizeof(text), spec, va_arg(_args, void *));
            else if (is_long)
                snprintf(text, sizeof(text), spec, va_arg(_args, long));
            else
                snprintf(text, sizeof(text), spec, va_arg(_args, int));
            for (char const *c = text; *c; ++c)
                put(static_cast<unsigned char>(*c));
        }
    }
    if (_size) _p_out[length] = 0;
    return length;
}

} // namespace qorui
