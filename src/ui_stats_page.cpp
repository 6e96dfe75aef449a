// Stats pages.
//
//   construction     75 empty lines, not editable
//   printing         the colour tag, then the text, into one line
//   wide formatting  the printf subset of 16-bit formats
#include "ui_stats_page.h"

#include "ui_debug.h"

#include <cstdarg>
#include <cstdio>
#include <cstring>

namespace qorui {

namespace {

size_t const k_buffer_size = 200; // a line's buffer: tag and text, terminated

// Cuts a colour argument to 0 .. 1, times 255, as the colour type does for its float parts.
unsigned char colour_byte(int _value) {
    float const cut = _value < 0 ? 0.0f : (_value > 1 ? 1.0f : static_cast<float>(_value));
    return static_cast<unsigned char>(cut * 255.0f);
}

// The printf family for 16-bit text, as far as pages need it: "%s" takes 16-bit text, "%S"
// narrow text (UTF-8), "%c" one unit; the numeric conversions are those of the C library. Writes
// at most _size - 1 units and a terminator; result the count written.
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

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

CStatsPage::CStatsPage(CUserInterface *_p_user_interface, char const *_name)
    : m_name(_name ? _name : ""), m_text(), mp_user_interface(_p_user_interface), m_show(false),
      m_color(255, 255, 255, 255) {
    m_text.set_editable(false);
    m_text.set_max_strings(MAX_STRINGS);
    for (int i = 0; i < MAX_STRINGS; ++i)
        m_text.insert_str("", true); // forced: not editable
}

void CStatsPage::set_color(int _r, int _g, int _b, int _a) {
    m_color = rgba_t(colour_byte(_r), colour_byte(_g), colour_byte(_b), colour_byte(_a));
}

// ---------------------------------------------------------------------------------------------
// Printing
// ---------------------------------------------------------------------------------------------

CString *CStatsPage::line_for_print(unsigned int _line) {
    m_text.set_caret_line(static_cast<int>(_line));
    m_text.set_caret_char(0);
    CString *p_str = m_text.get_caret_line_string();
    if (!QOR_CHECK(p_str)) return nullptr;
    return p_str;
}

void CStatsPage::print(unsigned int _line, char const *_format, ...) {
    if (!_format || _line >= MAX_STRINGS) return;
    char buffer[k_buffer_size];
    int const tag =
        snprintf(buffer, sizeof(buffer), "<color %u %u %u %u>", m_color.r, m_color.g, m_color.b, m_color.a);
    va_list args;
    va_start(args, _format);
    vsnprintf(buffer + tag, sizeof(buffer) - tag, _format, args);
    va_end(args);

    if (CString *p_str = line_for_print(_line)) *p_str = CString(buffer, -1);
}

void CStatsPage::print(unsigned int _string_num, unsigned short const *_format, ...) {
    if (!QOR_CHECK(_string_num < MAX_STRINGS)) return;
    if (!_format) return;
    unsigned short buffer[k_buffer_size];
    char tag[48];
    int const tag_length =
        snprintf(tag, sizeof(tag), "<color %u %u %u %u>", m_color.r, m_color.g, m_color.b, m_color.a);
    for (int i = 0; i < tag_length; ++i)
        buffer[i] = static_cast<unsigned char>(tag[i]);
    va_list args;
    va_start(args, _format);
    format_units(buffer + tag_length, k_buffer_size - tag_length, _format, args);
    va_end(args);

    if (CString *p_str = line_for_print(_string_num)) *p_str = CString(buffer, -1);
}

void CStatsPage::clear() {
    for (unsigned i = 0; i < m_text.get_num_strings(); ++i)
        m_text.get_string(i)->clear();
}

} // namespace qorui
