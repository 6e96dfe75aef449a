// Stats pages.
//
//   construction     75 empty lines, not editable
//   printing         the colour tag, then the text, into one line
//   wide formatting  the printf subset of 16-bit formats
//   drawing          the sheet on a canvas, for the service
#include "ui_stats_page.h"

#include "ui_canvas.h"
#include "ui_debug.h"
#include "ui_logger.h"

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

void CStatsPage::draw(CCanvas *_p_canvas, CFont *_p_font) {
    if (!QOR_CHECK(_p_canvas)) return;
    _p_canvas->text_out(20, 20, 0, m_text, _p_font);
}

void CStatsPage::clear() {
    for (unsigned i = 0; i < m_text.get_num_strings(); ++i)
        m_text.get_string(i)->clear();
}

} // namespace qorui
