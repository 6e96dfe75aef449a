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
    // One line and its font.
    struct SLine {
        CString *mp_string; // owned
        CFont *mp_font;     // not owned; null means the caller's default font
    };

    // Column and line. The line may stand one past the last line: the next inserted character
    // then opens a new line.
    struct SCaretPos {
        int m_char; // column, 0 to the line's length
        int m_line; // index of the line
    };

    // No lines; multi-line, editable, aligned left, at most 1024 lines, no owner.
    CText();
    // The defaults, then as the assignment of that type.
    // @{
    CText(char const *_p_text);
    CText(unsigned short const *_p_text);
    CText(string const &_text);
    CText(wstring const &_text);
    CText(CString const &_text);
    // @}
    // Takes the lines only; the copy has the default settings.
    CText(CText const &_text);
    // Deletes the lines without telling the owner.
    virtual ~CText();

    // clear(), the text with escapes, then a line break: a multi-line text gets an empty last
    // line with the caret on it. A text that isn't editable is only cleared.
    // @{
    CText const &operator=(char const *_p_text);
    CText const &operator=(unsigned short const *_p_text);
    CText const &operator=(string const &_text);
    CText const &operator=(wstring const &_text);
    CText const &operator=(CString const &_text);
    // @}
    // clear(), then copies of the lines with their fonts; settings and caret stay.
    CText const &operator=(CText const &_text);

    // Reading.

    // The number of lines.
    unsigned int get_num_strings() const { return static_cast<unsigned int>(m_strings.size()); }
    // The line at _idx, which must exist (a report and null otherwise); the text owns it.
    // @{
    CString *get_string(unsigned int _idx);
    CString const *get_string(unsigned int _idx) const;
    // @}
    // The first line, null when there are no lines.
    // @{
    CString *get_string();
    CString const *get_string() const;
    // @}
    // The caret's line, null when the caret stands past the last line.
    CString *get_caret_line_string();
    // The length of the caret's line in units; 0 when there is no such line.
    int get_caret_line_length();
    // The caret's column and line.
    // @{
    int get_caret_char() const { return m_caret_pos.m_char; }
    int get_caret_line() const { return m_caret_pos.m_line; }
    // @}
    // The font of line _idx, which must exist; null for the caller's default font.
    CFont *get_string_font(unsigned int _idx) const;

    // Settings.

    // Gives line _idx, which must exist, a font; the text doesn't own it.
    void set_string_font(unsigned int _idx, CFont *_p_font);
    // Puts the caret on line _n, at most one past the last line, and tells the owner
    // (EVENT_RESIZED).
    void set_caret_line(int _n);
    // Puts the caret at column _n (not negative), at most the line's length, and tells the owner
    // (EVENT_RESIZED).
    void set_caret_char(int _n);
    // Whether editing without _force changes the text; setting it sends EVENT_CHANGED.
    // @{
    bool get_editable() const { return m_editable; }
    void set_editable(bool _editable);
    // @}
    // Whether the text keeps line breaks. Clearing it cuts the text to its first line; either
    // way the caret goes to line 0, column 0.
    // @{
    bool get_multiline() const { return m_multiline; }
    void set_multiline(bool _multiline);
    // @}
    // How the canvas places the lines: centred for ALIGNMENT_CENTER, else at the left.
    // @{
    EAlignment get_alignment() const { return m_alignment; }
    void set_alignment(EAlignment _alignment) { m_alignment = _alignment; }
    // @}
    // The most lines kept; beyond it the oldest lines go, and the caret follows its line.
    // @{
    unsigned int get_max_strings() const { return m_max_strings; }
    void set_max_strings(unsigned int _n);
    // @}
    // The window told of changes by events of dispatch type 0; not owned, null for none.
    void set_owner(CWindow *_p_owner) { mp_owner = _p_owner; }
    // Deletes every line, last first, with EVENT_CHANGED after each and once more; the caret goes
    // to 0, 0.
    void clear();

    // Editing. Nothing changes in a text that isn't editable unless _force is set. Units 10 and 0
    // break the line; with _parse_escapes, a backslash directly followed by 'n' does too.

    // One unit at the caret (10 and 0 break the line), then the oldest lines beyond the maximum
    // go. A caret past the last line opens a new line first.
    void insert(unsigned short _ch, bool _force);
    // Each unit of the terminated text as above; a char is one unit of its byte value.
    // @{
    void insert(char const *_p_text, bool _force, bool _parse_escapes);
    void insert(unsigned short const *_p_text, bool _force, bool _parse_escapes);
    // @}
    // The text with escapes, then a line break.
    // @{
    void insert_str(char const *_p_text, bool _force);
    void insert_str(unsigned short const *_p_text, bool _force);
    // @}

    // Splits the caret's line at the caret and moves to the start of the new line; nothing in a
    // single-line text.
    void on_new_line();
    // Erases the unit before the caret, or joins the line to the one above at column 0. Sends no
    // event.
    void on_back_space();
    // Erases the unit at the caret, or joins the next line at the line's end. Sends no event.
    void on_delete();
    // The caret one line up or down, its column cut to the new line's length; nothing in a
    // single-line text.
    // @{
    void on_caret_up();
    void on_caret_down();
    // @}
    // The caret one unit left or right, over line ends in a multi-line text.
    // @{
    void on_caret_left();
    void on_caret_right();
    // @}
    // The caret to the start or the end of its line.
    // @{
    void on_home();
    void on_end();
    // @}
    // Nothing: there is no overtype mode.
    void on_insert() {}

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
