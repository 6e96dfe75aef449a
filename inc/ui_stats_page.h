// A stats page: a named sheet of 75 numbered lines that any module prints to by line number, in
// the colour it set before. Reprinting a line overwrites it, so figures refresh in place.
#pragma once
#include "qor_math.h"
#include "qor_memory.h"
#include "ui_interfaces.h"
#include "ui_text.h"

namespace qorui {

class CCanvas;
class CFont;
class CUserInterface;

// A named sheet of 75 numbered lines that any module prints to by line number.
class CStatsPage : public IStatsPage {
public:
    enum { MAX_STRINGS = 75 }; // lines of a page, and the bound on a line number

    // The service deletes its pages at process end.
    virtual ~CStatsPage() {}

    // Each argument is cut to 0 .. 1 and times 255: 1 or more gives 255, 0 or less gives 0.
    void set_color(int _r, int _g, int _b, int _a) override;
    // Line numbers of 75 or more are ignored.
    void print(unsigned int _line, char const *_format, ...) override __attribute__((format(printf, 3, 4)));
    // Line numbers of 75 or more break a contract.
    void print(unsigned int _line, unsigned short const *_format, ...) override;
    char const *get_name() override { return m_name.c_str(); }
    void show(bool _show) override { m_show = _show; }
    bool is_show() override { return m_show; }
    // Empties every line; the 75 lines stay.
    void clear() override;

    // The 75 lines, each beginning with its colour tag.
    CText const &get_text() const { return m_text; }

private:
    friend class CUserInterface;
    CStatsPage(CUserInterface *_p_user_interface, char const *_name);
    // Puts the caret at the line's start and hands out the line; null (and a contract report) if
    // the line is missing.
    CString *line_for_print(unsigned int _line);
    // The sheet at (20, 20) of the canvas, no extra space between lines.
    void draw(CCanvas *_p_canvas, CFont *_p_font);

    string m_name;
    CText m_text;                      // the sheet; not editable, no owner
    CUserInterface *mp_user_interface; // the service that made the page; kept, not read
    bool m_show;
    rgba_t m_color; // colour of the next prints
};

} // namespace qorui
