// The text buffer: lines of CString with their fonts, a caret that may stand one line past the
// end, editing, trimming to the line limit, and the events the owner window gets.
//
//   reading              lines, fonts and the caret's line
//   settings             caret, editability, line mode, the limit, clearing
//   editing              insertion, breaks, deletion, caret movement
//   lines and the owner  appending, deleting and trimming lines; events to the owner
#include "ui_text.h"
#include "ui_debug.h"
#include "ui_window.h"

namespace qorui {

CText::CText() {
    set_defaults();
}
CText::CText(char const *_p_text) : CText() {
    assign(_p_text);
}
CText::CText(unsigned short const *_p_text) : CText() {
    assign(_p_text);
}
CText::CText(string const &_text) : CText() {
    assign(_text.c_str());
}
CText::CText(wstring const &_text) : CText() {
    assign(_text.c_str());
}
CText::CText(CString const &_text) : CText() {
    assign(_text.c_str());
}
CText::CText(CText const &_text) : CText() {
    *this = _text;
}

CText::~CText() {
    for (SLine const &line : m_strings)
        delete line.mp_string;
}

void CText::set_defaults() {
    m_caret_pos.m_char = 0;
    m_caret_pos.m_line = 0;
    m_multiline = true;
    m_editable = true;
    m_alignment = ALIGNMENT_LEFT;
    m_max_strings = 1024;
    mp_owner = nullptr;
}

CText const &CText::operator=(char const *_p_text) {
    return assign(_p_text);
}
CText const &CText::operator=(unsigned short const *_p_text) {
    return assign(_p_text);
}
CText const &CText::operator=(string const &_text) {
    return assign(_text.c_str());
}
CText const &CText::operator=(wstring const &_text) {
    return assign(_text.c_str());
}
CText const &CText::operator=(CString const &_text) {
    return assign(_text.c_str());
}

template <class TSource>
CText const &CText::assign(TSource const &_text) {
    clear();
    insert(_text, false, true);
    insert(10, false);
    return *this;
}

CText const &CText::operator=(CText const &_text) {
    if (&_text == this) return *this;
    clear();
    for (SLine const &line : _text.m_strings) {
        m_strings.push_back(SLine{new CString(*line.mp_string), line.mp_font});
        on_change();
    }
    return *this;
}

// ---------------------------------------------------------------------------------------------
// Reading
// ---------------------------------------------------------------------------------------------

CString *CText::get_string(unsigned int _idx) {
    return const_cast<CString *>(static_cast<CText const *>(this)->get_string(_idx));
}

CString const *CText::get_string(unsigned int _idx) const {
    if (!QOR_CHECK(_idx < m_strings.size())) return nullptr;
    return m_strings[_idx].mp_string;
}

CString *CText::get_string() {
    return m_strings.empty() ? nullptr : m_strings.front().mp_string;
}
CString const *CText::get_string() const {
    return m_strings.empty() ? nullptr : m_strings.front().mp_string;
}

CString *CText::get_caret_line_string() {
    if (m_caret_pos.m_line < 0 || is_caret_past_end()) return nullptr;
    return m_strings[m_caret_pos.m_line].mp_string;
}

int CText::get_caret_line_length() {
    CString const *p_str = get_caret_line_string();
    return p_str ? static_cast<int>(p_str->length()) : 0;
}

CFont *CText::get_string_font(unsigned int _idx) const {
    if (!QOR_CHECK(_idx < m_strings.size())) return nullptr;
    return m_strings[_idx].mp_font;
}

// ---------------------------------------------------------------------------------------------
// Settings
// ---------------------------------------------------------------------------------------------

void CText::set_string_font(unsigned int _idx, CFont *_p_font) {
    if (QOR_CHECK(_idx < m_strings.size())) m_strings[_idx].mp_font = _p_font;
}

void CText::set_caret_line(int _n) {
    unsigned const count = get_num_strings();
    m_caret_pos.m_line = static_cast<unsigned>(_n) < count ? _n : static_cast<int>(count);
    notify(EVENT_RESIZED);
}

void CText::set_caret_char(int _n) {
    int const length = get_caret_line_length();
    m_caret_pos.m_char = _n < length ? _n : length;
    notify(EVENT_RESIZED);
}

void CText::set_editable(bool _editable) {
    m_editable = _editable;
    on_change();
}

void CText::set_multiline(bool _multiline) {
    m_multiline = _multiline;
    while (!m_multiline && m_strings.size() > 1)
        delete_line(m_strings.size() - 1);
    m_caret_pos.m_char = 0;
    m_caret_pos.m_line = 0;
}

void CText::set_max_strings(unsigned int _n) {
    m_max_strings = _n;
    trim();
}

// The owner sees the text shrink line by line; the caret is reset at the end.
void CText::clear() {
    while (!m_strings.empty()) {
        delete_line(m_strings.size() - 1);
        on_change();
    }
    on_change();
    m_caret_pos.m_char = 0;
    m_caret_pos.m_line = 0;
}

// ---------------------------------------------------------------------------------------------
// Editing
// ---------------------------------------------------------------------------------------------

void CText::insert(unsigned short _ch, bool _force) {
    if (!m_editable && !_force) return;
    if (is_caret_past_end()) {
        append_empty_line();
        on_change();
    }
    CString *p_str = get_caret_line_string();
    if (!QOR_CHECK(p_str != NULL)) return;
    if (m_caret_pos.m_char >= static_cast<int>(p_str->length()))
        m_caret_pos.m_char = static_cast<int>(p_str->length());
    if (_ch == 10 || _ch == 0) {
        on_new_line();
    } else {
        p_str->insert(_ch, m_caret_pos.m_char == static_cast<int>(p_str->length()) ? -1 : m_caret_pos.m_char);
        ++m_caret_pos.m_char;
        on_change();
    }
    trim();
}

template <class TUnit>
void CText::insert_units(TUnit const *_p_text, bool _force, bool _parse_escapes) {
    if (!QOR_CHECK(_p_text)) return;
    for (TUnit const *p = _p_text; *p; ++p) {
        if (_parse_escapes && p[0] == '\\' && p[1] == 'n') {
            insert(10, _force);
            ++p;
        } else {
            // Bytes stay units: a narrow byte becomes the unit of the same value, 0 to 255.
            insert(static_cast<unsigned short>(static_cast<std::make_unsigned_t<TUnit>>(*p)), _force);
        }
    }
    trim();
}

void CText::insert(char const *_p_text, bool _force, bool _parse_escapes) {
    insert_units(_p_text, _force, _parse_escapes);
}

void CText::insert(unsigned short const *_p_text, bool _force, bool _parse_escapes) {
    insert_units(_p_text, _force, _parse_escapes);
}

void CText::insert_str(char const *_p_text, bool _force) {
    insert(_p_text, _force, true);
    insert(10, _force);
}

void CText::insert_str(unsigned short const *_p_text, bool _force) {
    insert(_p_text, _force, true);
    insert(10, _force);
}

// The caret one past the last line (a line break in an empty text) gets its missing line first,
// as insert does, so a second break or a back space there has a line to work on.
void CText::on_new_line() {
    if (!m_multiline) return;
    if (m_strings.empty()) {
        QOR_CHECK(m_caret_pos.m_line == 0);
        append_empty_line();
        m_caret_pos.m_line = 0;
    } else {
        if (is_caret_past_end()) append_empty_line();
        CString *p_str = get_caret_line_string();
        if (!QOR_CHECK_AS(p_str != NULL && static_cast<size_t>(m_caret_pos.m_char) <= p_str->size(),
                          "p_str != NULL && m_caret_pos.m_char <= p_str->size()")) {
            if (!p_str) return;
            m_caret_pos.m_char = static_cast<int>(p_str->size());
        }
        CString *p_tail = new CString(p_str->substr(static_cast<size_t>(m_caret_pos.m_char)));
        p_str->erase(static_cast<size_t>(m_caret_pos.m_char));
        QOR_CHECK(static_cast<size_t>(m_caret_pos.m_line) < m_strings.size());
        m_strings.insert(m_strings.begin() + m_caret_pos.m_line + 1, SLine{p_tail, nullptr});
    }
    ++m_caret_pos.m_line;
    m_caret_pos.m_char = 0;
    on_change();
}

void CText::on_back_space() {
    if (m_caret_pos.m_char > 0) {
        CString *p_str = get_caret_line_string();
        if (!QOR_CHECK_AS(p_str && static_cast<size_t>(m_caret_pos.m_char) <= p_str->length(),
                          "p_str && m_caret_pos.m_char <= p_str->length()"))
            return;
        --m_caret_pos.m_char;
        p_str->erase(static_cast<size_t>(m_caret_pos.m_char), 1);
        return;
    }
    if (m_caret_pos.m_line <= 0) return;
    if (is_caret_past_end()) append_empty_line();
    size_t const line = static_cast<size_t>(m_caret_pos.m_line);
    CString *p_old = m_strings[line].mp_string;
    m_strings.erase(m_strings.begin() + line);
    --m_caret_pos.m_line;
    CString *p_up_str = get_caret_line_string();
    if (QOR_CHECK(p_up_str)) {
        m_caret_pos.m_char = static_cast<int>(p_up_str->length());
        p_up_str->append(*p_old);
    }
    delete p_old;
}

void CText::on_delete() {
    CString *p_str = get_caret_line_string();
    if (!p_str) return;
    if (m_caret_pos.m_char < static_cast<int>(p_str->length())) {
        p_str->erase(static_cast<size_t>(m_caret_pos.m_char), 1);
    } else if (m_multiline && has_next_line()) {
        size_t const next = static_cast<size_t>(m_caret_pos.m_line) + 1;
        CString *p_down_str = m_strings[next].mp_string;
        m_strings.erase(m_strings.begin() + next);
        if (QOR_CHECK(p_down_str)) p_str->append(*p_down_str);
        delete p_down_str;
    }
}

void CText::on_caret_left() {
    if (m_caret_pos.m_char != 0) {
        --m_caret_pos.m_char;
    } else if (m_multiline && m_caret_pos.m_line > 0) {
        --m_caret_pos.m_line;
        on_end();
    }
}

void CText::on_caret_right() {
    if (m_caret_pos.m_char + 1 <= get_caret_line_length()) {
        ++m_caret_pos.m_char;
    } else if (m_multiline && has_next_line()) {
        ++m_caret_pos.m_line;
        m_caret_pos.m_char = 0;
    }
}

void CText::on_caret_up() {
    if (!m_multiline || m_caret_pos.m_line <= 0) return;
    --m_caret_pos.m_line;
    cut_caret_char();
}

void CText::on_caret_down() {
    if (!m_multiline || !has_next_line()) return;
    ++m_caret_pos.m_line;
    cut_caret_char();
}

void CText::on_home() {
    m_caret_pos.m_char = 0;
}
void CText::on_end() {
    m_caret_pos.m_char = get_caret_line_length();
}

// The column isn't remembered: past a short line the caret keeps the short column.
void CText::cut_caret_char() {
    if (!QOR_CHECK(get_caret_line_string())) return;
    if (m_caret_pos.m_char > get_caret_line_length()) on_end();
}

// ---------------------------------------------------------------------------------------------
// Lines and the owner
// ---------------------------------------------------------------------------------------------

void CText::append_empty_line() {
    m_strings.push_back(SLine{new CString(), nullptr});
}

void CText::delete_line(size_t _idx) {
    delete m_strings[_idx].mp_string;
    m_strings.erase(m_strings.begin() + static_cast<std::ptrdiff_t>(_idx));
}

// The oldest lines go; the caret follows its text.
void CText::trim() {
    while (m_strings.size() > m_max_strings) {
        delete_line(0);
        on_change();
        if (m_caret_pos.m_line > 0) {
            --m_caret_pos.m_line;
        } else {
            m_caret_pos.m_char = 0;
            m_caret_pos.m_line = 0;
        }
    }
}

void CText::notify(EEventType _event) const {
    if (mp_owner) mp_owner->send_event(mp_owner, _event, CWndEvent::DISPATCH_NONE);
}

void CText::on_change() const {
    notify(EVENT_CHANGED);
}

} // namespace qorui
