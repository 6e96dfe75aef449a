// Lines of text with one caret: the model behind every text control. Keys become the on_*
// operations in the edit box; the text tells its owner window of changes by events of dispatch
// type 0, sent synchronously from inside the operations.
#pragma once
#include "ui_geometry.h"
#include "ui_string.h"
#include <deque>
#include <type_traits>

namespace qorui {

class CFont;
class CWindow;
enum EEventType : int;

// Lines of text with one caret: the model behind every text control.
class CText {
public:
    struct SLine {
        CString *mp_string; // owned
        CFont *mp_font;     // not owned; null means the caller's default font
    };

    // Column and line. The line may stand one past the last line: the next inserted character
    // then opens a new line.
    struct SCaretPos {
        int m_char;
        int m_line;
    };

    CText();
    CText(char const *_p_text);
    CText(unsigned short const *_p_text);
    CText(string const &_text);
    CText(wstring const &_text);
    CText(CString const &_text);
    // Takes the lines only; the copy has the default settings.
    CText(CText const &_text);
    virtual ~CText();

    // clear(), the text with escapes, then a line break.
    CText const &operator=(char const *_p_text);
    CText const &operator=(unsigned short const *_p_text);
    CText const &operator=(string const &_text);
    CText const &operator=(wstring const &_text);
    CText const &operator=(CString const &_text);
    // clear(), then copies of the lines with their fonts; settings and caret stay.
    CText const &operator=(CText const &_text);

    // Reading.
    unsigned int get_num_strings() const { return static_cast<unsigned int>(m_strings.size()); }
    CString *get_string(unsigned int _idx);
    CString const *get_string(unsigned int _idx) const;
    CString *get_string();
    CString const *get_string() const;
    CString *get_caret_line_string();
    int get_caret_line_length();
    int get_caret_char() const { return m_caret_pos.m_char; }
    int get_caret_line() const { return m_caret_pos.m_line; }
    CFont *get_string_font(unsigned int _idx) const;

    // Settings.
    void set_string_font(unsigned int _idx, CFont *_p_font);
    void set_caret_line(int _n);
    void set_caret_char(int _n);
    bool get_editable() const { return m_editable; }
    void set_editable(bool _editable);
    bool get_multiline() const { return m_multiline; }
    void set_multiline(bool _multiline);
    EAlignment get_alignment() const { return m_alignment; }
    void set_alignment(EAlignment _alignment) { m_alignment = _alignment; }
    unsigned int get_max_strings() const { return m_max_strings; }
    void set_max_strings(unsigned int _n);
    void set_owner(CWindow *_p_owner) { mp_owner = _p_owner; }
    void clear();

    // Editing. Nothing changes in a text that isn't editable unless _force is set. Units 10 and 0
    // break the line; with _parse_escapes, a backslash directly followed by 'n' does too.
    void insert(unsigned short _ch, bool _force);
    void insert(char const *_p_text, bool _force, bool _parse_escapes); // each byte is one unit
    void insert(unsigned short const *_p_text, bool _force, bool _parse_escapes);
    void insert_str(char const *_p_text, bool _force);
    void insert_str(unsigned short const *_p_text, bool _force);

    void on_new_line();
    void on_back_space();
    void on_delete();
    void on_caret_up();
    void on_caret_down();
    void on_caret_left();
    void on_caret_right();
    void on_home();
    void on_end();
    void on_insert() {} // there is no overtype mode

private:
    template <class TUnit>
    void insert_units(TUnit const *_p_text, bool _force, bool _parse_escapes);
    template <class TSource>
    CText const &assign(TSource const &_text);

    void set_defaults();
    void append_empty_line();
    void delete_line(size_t _idx);
    bool is_caret_past_end() const { return static_cast<size_t>(m_caret_pos.m_line) >= m_strings.size(); }
    bool has_next_line() const { return static_cast<size_t>(m_caret_pos.m_line) + 1 < m_strings.size(); }
    void cut_caret_char();
    void trim();
    void notify(EEventType _event) const;
    void on_change() const;

    std::deque<SLine, qor_allocator<SLine>> m_strings;
    SCaretPos m_caret_pos;
    bool m_multiline;
    bool m_editable;
    EAlignment m_alignment;
    unsigned int m_max_strings;
    CWindow *mp_owner;
};

} // namespace qorui
