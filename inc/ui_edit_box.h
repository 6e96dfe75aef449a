// The edit box and its caret.
//
//   CCaret     the blinking rectangle: its checked flag is the visible phase, toggled by the tick
//              count; every movement shows it at once and starts a full phase
//   CEditBox   shows and edits a CText: keys and characters become calls of the text, the caret
//              follows the text's caret, the text is shifted left when the caret would leave the
//              box, a vertical scroll bar comes when the lines are taller than the box, and the
//              text may roll by itself
//
// All editing is the text's; the box only translates input and places the caret and the text.
// The box scrolls by EVENT_LINE_UP, EVENT_LINE_DOWN, EVENT_PAGE_UP and EVENT_PAGE_DOWN, which move
// a visible vertical bar by one small or large step; the bar's position is in pixels.
#pragma once
#include "ui_text.h"
#include "ui_window_visual.h"

namespace qorui {

class CScrollBar;

// The blinking caret of an edit box; its checked flag is the visible phase.
class CCaret : public CWindowVisual {
public:
    // Passive; no material in the hidden phase, a translucent grey rectangle in the visible one.
    CCaret(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CCaret() {}

    QOR_CLASS_ID(CCaret, CWindowVisual, "Caret")

    // The length of one phase in milliseconds (500 by default); 0 toggles at every update.
    // @{
    void set_blink_time(unsigned int _ms) { m_blink_time = _ms; }
    unsigned int get_blink_time() const { return m_blink_time; }
    // @}

protected:
    // Behind the visual window's: toggles the phase when a full phase has passed.
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // The caret moved: visible at once, and a full phase starts.
    virtual void on_event_changed(CWndEvent const *_p_event) override;

    unsigned m_last_blink; // tick of the last change of phase, ms
    unsigned m_blink_time; // ms
};

// Shows and edits a CText with a caret, scrolling the text to keep the caret inside.
class CEditBox : public CWindowVisual {
public:
    // An empty, multi-line, editable text, a hidden caret of 3 by 14 pixels ("caret"), no scroll
    // bars, no rolling.
    CEditBox(CDesktop *_p_desktop, char const *_name);
    // The caret and the bars go with the window tree.
    virtual ~CEditBox() {}

    QOR_CLASS_ID(CEditBox, CWindowVisual, "EditBox")

    // Behind the visual window's keys: "text_alignment", "auto_scroll" and "scroll_speed".
    // Loading also reads "text" (lines, as load_text reads them), "is_scrollable_v" and
    // "is_scrollable_h"; keys of the wrong type change nothing.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // Text and caret. The text tells the box of each change, so the box follows edits by program.

    // The content; the box is its owner.
    // @{
    CText &get_text() { return m_text; }
    CText const &get_text() const { return m_text; }
    // @}
    // The caret, a child of the box.
    CCaret *get_caret() { return mp_caret; }
    // Shows or hides the caret window; activation does the same for an editable text.
    void show_caret(bool _show);
    // Where the text stands relative to the left and top margins: x is negative while the text is
    // pushed to the left so that the caret stays inside the box.
    point_t get_text_offset() const { return m_text_offset; }

    // Scroll bars: made or destroyed here. The vertical one is shown only while the lines are
    // taller than the client area, at the right edge with the width it was given; the horizontal
    // one stays hidden.

    // Makes ("scroll bar vert", 16 pixels wide, or "scroll bar horz") or destroys the bar;
    // making one that exists does nothing.
    // @{
    void set_scrollable_v(bool _scrollable);
    void set_scrollable_h(bool _scrollable);
    // @}
    // Whether the bar exists.
    // @{
    bool get_scrollable_v() const { return mp_scroll_bar_vert != nullptr; }
    bool get_scrollable_h() const { return mp_scroll_bar_horz != nullptr; }
    // @}
    // The vertical bar; null when there is none. Its position is in pixels.
    CScrollBar *get_scroll_bar_vert() { return mp_scroll_bar_vert; }

protected:
    // Behind the visual window's: with auto scroll, the text rolls down by the speed times the
    // time since the last update (needs the vertical bar).
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // Behind the visual window's: the lines in the default font, shifted by the text offset and
    // the bar's position, clipped to the width left of a shown bar.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Shows the caret when the text is editable, hides it otherwise.
    virtual void on_event_activate(CWndEvent const *_p_event) override;
    // Hides the caret.
    virtual void on_event_deactivate(CWndEvent const *_p_event) override;
    // Behind the visual window's: shows the vertical bar at the right edge while the lines are
    // taller than the client area, with the hidden height as its range; places the caret.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // The text changed: places the caret (or hides it in a text that isn't editable), lays out
    // again and scrolls a shown bar to the end.
    virtual void on_event_changed(CWndEvent const *_p_event) override;
    // Replaces the content with the wide string of the event.
    virtual void on_event_set_text(CWndEvent const *_p_event) override;
    // The narrow string as a local string key, else as it stands, sent on as EVENT_SET_TEXT.
    virtual void on_event_set_str(CWndEvent const *_p_event) override;
    // In an editable text, backspace, return, end, home, the arrows, insert and delete edit the
    // text and go no further; other keys pass on.
    virtual void on_event_key_down(CWndEvent const *_p_event) override;
    // A printable character (low 16 bits) is inserted if the text is editable, and goes no
    // further; others pass on.
    virtual void on_event_char(CWndEvent const *_p_event) override;

    // One small (line) or large (page) step up or down of a visible vertical bar; the event
    // isn't read.
    // @{
    virtual void on_event_line_up(CWndEvent const *_p_event);
    virtual void on_event_line_down(CWndEvent const *_p_event);
    virtual void on_event_page_up(CWndEvent const *_p_event);
    virtual void on_event_page_down(CWndEvent const *_p_event);
    // @}

    // Content
    CText m_text;     // owned by the box: its changes arrive as EVENT_CHANGED
    CCaret *mp_caret; // child "caret"
    // Scrolling
    CScrollBar *mp_scroll_bar_vert; // child "scroll bar vert", or null
    CScrollBar *mp_scroll_bar_horz; // child "scroll bar horz", or null
    // Layout
    int m_line_interval;   // extra pixels between lines
    point_t m_text_offset; // from the left and top margins; y stays 0
    // Rolling by itself
    bool m_auto_scroll;     // roll the text by itself
    float m_scroll_speed;   // pixels per millisecond
    unsigned m_last_update; // tick of the last step, 0 before the first

private:
    // Places the caret at the text's caret and shifts the text so that the caret stays inside the
    // box; the shift is worked out anew from zero each time.
    void set_real_caret_pos();
    // Shows and places the vertical bar while the lines are taller than the client area, hides it
    // otherwise; its range is the height that doesn't fit.
    void layout_scroll_bar_vert();
    // The vertical bar while it is shown, else null.
    CScrollBar *get_shown_scroll_bar_vert();
    void set_scrollable(CScrollBar *&_p_bar, char const *_name, bool _scrollable);
    // One step of the shown vertical bar: _step is EVENT_SCROLL_SMALL_STEP or _LARGE_STEP.
    void scroll(EEventType _step, int _direction);
    int get_line_h();
};

} // namespace qorui
