// The edit box and its caret: the caret's blink, the box's construction and scroll bars, the
// translation of keys and characters into calls of the text, the placement of the caret and of
// the text, the vertical bar's layout, automatic scrolling, drawing and the layout keys.
#include "ui_edit_box.h"
#include "LuaTableIterator.h"
#include "qor_platform.h"
#include "qorscriptsystem.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_value_bar.h"

#include <cwctype>

namespace qorui {

namespace {

CWindowRegistrar<CEditBox> const s_registrar("EditBox");

// Virtual keys of the platform, as the desktop passes them on.
enum EKey : int {
    KEY_BACK = 8,
    KEY_RETURN = 13,
    KEY_END = 35,
    KEY_HOME = 36,
    KEY_LEFT = 37,
    KEY_UP = 38,
    KEY_RIGHT = 39,
    KEY_DOWN = 40,
    KEY_INSERT = 45,
    KEY_DELETE = 46,
};

struct SKeyAction {
    EKey m_key;
    void (CText::*m_action)();
};

SKeyAction const k_key_actions[] = {
    {KEY_BACK, &CText::on_back_space},   {KEY_RETURN, &CText::on_new_line}, {KEY_END, &CText::on_end},
    {KEY_HOME, &CText::on_home},         {KEY_LEFT, &CText::on_caret_left}, {KEY_UP, &CText::on_caret_up},
    {KEY_RIGHT, &CText::on_caret_right}, {KEY_DOWN, &CText::on_caret_down}, {KEY_INSERT, &CText::on_insert},
    {KEY_DELETE, &CText::on_delete},
};

int const k_caret_w = 3;
int const k_caret_h = 14;
int const k_scroll_bar_size = 16;

} // namespace

// ---------------------------------------------------------------------------------------------
// Caret
// ---------------------------------------------------------------------------------------------

// The checked flag is the visible phase, so the state drawing of the visual window paints the
// rectangle then and nothing otherwise.
CCaret::CCaret(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_last_blink(0), m_blink_time(500) {
    add_material(MAT_NAME_NORMAL, nullptr);
    add_material(MAT_NAME_CHECKED, create_color_material(_p_desktop, rgba_t(120, 120, 120, 150)));
    set_passive(true);
}

// Updates reach a hidden caret too: it goes on blinking and simply isn't drawn. The subtraction
// is unsigned, so the tick's wrap does no harm.
void CCaret::on_event_update(CWndEvent const *_p_event) {
    CWindowVisual::on_event_update(_p_event);
    uint32_t const tick = qorplatform::get_tick_count();
    if (tick - m_last_blink < m_blink_time) return;
    m_is_checked = !m_is_checked;
    m_last_blink = tick;
}

// Each movement shows the caret at once for a full phase: it doesn't blink while one types.
void CCaret::on_event_changed(CWndEvent const *_p_event) {
    CWindowVisual::on_event_changed(_p_event);
    m_is_checked = true;
    m_last_blink = qorplatform::get_tick_count();
}

// ---------------------------------------------------------------------------------------------
// Construction and scroll bars
// ---------------------------------------------------------------------------------------------

CEditBox::CEditBox(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), mp_caret(nullptr), mp_scroll_bar_vert(nullptr),
      mp_scroll_bar_horz(nullptr), m_line_interval(0), m_text_offset{0, 0}, m_auto_scroll(false),
      m_scroll_speed(0.0f), m_last_update(0) {
    mp_caret = new CCaret(_p_desktop, "caret");
    attach_child(mp_caret);
    mp_caret->set_size(k_caret_w, k_caret_h);
    send_event(mp_caret, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    set_real_caret_pos();
    m_text.set_owner(this);

    register_callback(EVENT_LINE_UP, CEventCallback(this, &CEditBox::on_event_line_up));
    register_callback(EVENT_LINE_DOWN, CEventCallback(this, &CEditBox::on_event_line_down));
    register_callback(EVENT_PAGE_UP, CEventCallback(this, &CEditBox::on_event_page_up));
    register_callback(EVENT_PAGE_DOWN, CEventCallback(this, &CEditBox::on_event_page_down));
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

// A bar made here has width 0 until a layout or the owner sizes it: the vertical one takes its
// width from its size when it turns vertical.
void CEditBox::set_scrollable(CScrollBar *&_p_bar, char const *_name, bool _scrollable) {
    if (!_scrollable) {
        delete _p_bar;
        _p_bar = nullptr;
        return;
    }
    if (_p_bar) return;
    _p_bar = new CScrollBar(mp_desktop, _name);
    attach_child(_p_bar);
    if (&_p_bar == &mp_scroll_bar_vert) {
        _p_bar->set_bar_size(k_scroll_bar_size);
        _p_bar->set_horizontal(false);
    }
    send_event(_p_bar, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
}

void CEditBox::set_scrollable_v(bool _scrollable) {
    set_scrollable(mp_scroll_bar_vert, "scroll bar vert", _scrollable);
}

void CEditBox::set_scrollable_h(bool _scrollable) {
    set_scrollable(mp_scroll_bar_horz, "scroll bar horz", _scrollable);
}

CScrollBar *CEditBox::get_shown_scroll_bar_vert() {
    return mp_scroll_bar_vert && !mp_scroll_bar_vert->is_hidden() ? mp_scroll_bar_vert : nullptr;
}

void CEditBox::show_caret(bool _show) {
    send_event(mp_caret, _show ? EVENT_SHOW : EVENT_HIDE, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Input and text events
// ---------------------------------------------------------------------------------------------

// The caret is visible only while the box is active and editable.
void CEditBox::on_event_activate(CWndEvent const *_p_event) {
    CWindowVisual::on_event_activate(_p_event);
    show_caret(m_text.get_editable());
}

void CEditBox::on_event_deactivate(CWndEvent const *_p_event) {
    CWindowVisual::on_event_deactivate(_p_event);
    show_caret(false);
}

// A handled key goes no further; any other key, and every key of a text that isn't editable,
// keeps its dispatch type.
void CEditBox::on_event_key_down(CWndEvent const *_p_event) {
    CWindowVisual::on_event_key_down(_p_event);
    if (!m_text.get_editable()) return;
    _p_event->rewind();
    int key = 0;
    *_p_event >> key;
    for (SKeyAction const &entry : k_key_actions) {
        if (entry.m_key != key) continue;
        (m_text.*entry.m_action)();
        set_real_caret_pos();
        _p_event->set_dispatch_type(CWndEvent::DISPATCH_NONE);
        return;
    }
}

// A printable character is consumed even when the text isn't editable and ignores it.
void CEditBox::on_event_char(CWndEvent const *_p_event) {
    CWindowVisual::on_event_char(_p_event);
    _p_event->rewind();
    int code = 0;
    *_p_event >> code;
    unsigned short const ch = static_cast<unsigned short>(code & 0xFFFF);
    if (!std::iswprint(ch)) return;
    m_text.insert(ch, false);
    set_real_caret_pos();
    _p_event->set_dispatch_type(CWndEvent::DISPATCH_NONE);
}

void CEditBox::on_event_set_text(CWndEvent const *_p_event) {
    CWindowVisual::on_event_set_text(_p_event);
    _p_event->rewind();
    wstring text;
    *_p_event >> text;
    m_text = text;
    set_real_caret_pos();
}

void CEditBox::on_event_set_str(CWndEvent const *_p_event) {
    CWindowVisual::on_event_set_str(_p_event);
    forward_set_str(_p_event);
}

// Each change of the text, by the user or by program: place the caret, count the lines anew and
// scroll a shown bar to the end, so that new text comes into view.
void CEditBox::on_event_changed(CWndEvent const *_p_event) {
    CWindowVisual::on_event_changed(_p_event);
    if (m_text.get_editable())
        set_real_caret_pos();
    else
        show_caret(false);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    if (CScrollBar *p_bar = get_shown_scroll_bar_vert()) p_bar->set_position(p_bar->get_max());
}

// ---------------------------------------------------------------------------------------------
// Scrolling
// ---------------------------------------------------------------------------------------------

void CEditBox::scroll(EEventType _step, int _direction) {
    CScrollBar *p_bar = get_shown_scroll_bar_vert();
    if (!p_bar) return;
    CWndEvent step(_step);
    step << _direction;
    send_event(p_bar, &step, CWndEvent::DISPATCH_NONE);
}

void CEditBox::on_event_line_up(CWndEvent const *) {
    scroll(EVENT_SCROLL_SMALL_STEP, -1);
}
void CEditBox::on_event_line_down(CWndEvent const *) {
    scroll(EVENT_SCROLL_SMALL_STEP, +1);
}
void CEditBox::on_event_page_up(CWndEvent const *) {
    scroll(EVENT_SCROLL_LARGE_STEP, -1);
}
void CEditBox::on_event_page_down(CWndEvent const *) {
    scroll(EVENT_SCROLL_LARGE_STEP, +1);
}

// Rolling text: the bar's small step becomes the distance of this frame, and one line step moves
// it. Without a vertical bar nothing rolls, as with a hidden one.
void CEditBox::on_event_update(CWndEvent const *_p_event) {
    CWindowVisual::on_event_update(_p_event);
    if (!m_auto_scroll || m_is_hidden) return;
    uint32_t const tick = qorplatform::get_tick_count();
    if (m_last_update != 0 && mp_scroll_bar_vert) {
        mp_scroll_bar_vert->set_small_step(static_cast<float>(tick - m_last_update) * m_scroll_speed);
        on_event_line_down(nullptr);
    }
    m_last_update = tick;
}

// ---------------------------------------------------------------------------------------------
// Layout
// ---------------------------------------------------------------------------------------------

// Without a font yet, as in the constructor before the box is attached, everything measures 0.
int CEditBox::get_line_h() {
    return m_canvas.get_text_height(get_font(FNT_NAME_DEFAULT)) + m_line_interval;
}

void CEditBox::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    if (mp_scroll_bar_vert) layout_scroll_bar_vert();
    set_real_caret_pos();
}

// Exactly filled is no overflow; a single-line text never shows the bar. The bar keeps whatever
// width it has; its range is set through the bar's virtuals, so its steps follow the range.
void CEditBox::layout_scroll_bar_vert() {
    CScrollBar *p_bar = mp_scroll_bar_vert;
    int const client_h = get_h() - m_bottom_margin - m_top_margin;
    int const total = get_line_h() * static_cast<int>(m_text.get_num_strings());
    if (total > client_h && m_text.get_multiline()) {
        if (p_bar->is_hidden()) send_event(p_bar, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
        int const bar_w = p_bar->get_w();
        p_bar->set_pos(get_w() - bar_w, 0);
        p_bar->set_size(bar_w, get_h());
        p_bar->set_max(static_cast<float>(total - client_h));
        p_bar->set_min(0.0f);
    } else if (!p_bar->is_hidden()) {
        send_event(p_bar, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    }
}

// The caret's y follows its line only: the scroll position plays no part in it. The caret stays
// inside the box at the right, w - caret_w - right margin with w the full width, and the text is
// shifted left by what the caret would stand beyond that.
void CEditBox::set_real_caret_pos() {
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    int const font_h = m_canvas.get_text_height(p_font);
    int text_w = 0;
    if (CString const *p_line = m_text.get_caret_line_string())
        text_w = m_canvas.get_text_width(*p_line, p_font, m_text.get_caret_char());
    m_text_offset = point_t{0, 0};
    int x = m_left_margin + text_w;
    int const y = m_top_margin + (font_h + m_line_interval) * m_text.get_caret_line();
    int const right = get_w() - mp_caret->get_w() - m_right_margin;
    if (x > right) {
        m_text_offset.x = right - x;
        x = right;
    }
    mp_caret->set_pos(x, y);
    send_event(mp_caret, EVENT_CHANGED, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// The clip spans the full height, so lines may run through the top and bottom margins; the bar's
// position is a number of pixels. A hidden bar scrolls nothing: the text stands at its start.
void CEditBox::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    CScrollBar *p_bar = get_shown_scroll_bar_vert();
    int const bar_w = p_bar ? p_bar->get_w() : 0;
    float const scroll = p_bar ? p_bar->get_position() : 0.0f;
    m_canvas.set_clip_area(m_left_margin, 0, get_w() - bar_w - m_right_margin - m_left_margin, get_h());
    m_canvas.text_out(m_text_offset.x + m_left_margin,
                      m_text_offset.y + m_top_margin + static_cast<int>(-scroll), m_line_interval, m_text,
                      get_font(FNT_NAME_DEFAULT));
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

// Neither the text nor the bar flags are saved; the bars themselves are saved as children.
void CEditBox::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    _lo_table.SetString("text_alignment", g_alignment_names[m_text.get_alignment()]);
    _lo_table.SetBoolean("auto_scroll", m_auto_scroll);
    _lo_table.SetNumber("scroll_speed", m_scroll_speed);
}

// The children, a bar among them, are loaded before the bar keys are looked at.
void CEditBox::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    load_text(_lo_table, "text", m_text);
    EAlignment alignment;
    if (read_alignment(_lo_table, "text_alignment", alignment)) m_text.set_alignment(alignment);
    read_bool(_lo_table, "auto_scroll", m_auto_scroll);
    read_float(_lo_table, "scroll_speed", m_scroll_speed);
    bool scrollable = false;
    if (read_bool(_lo_table, "is_scrollable_v", scrollable)) set_scrollable_v(scrollable);
    if (read_bool(_lo_table, "is_scrollable_h", scrollable)) set_scrollable_h(scrollable);
}

} // namespace qorui
