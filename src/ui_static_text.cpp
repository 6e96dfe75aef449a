// Static text: construction, the text events, drawing inside the measured box of the text, and
// the layout keys "text" and "text_alignment".
#include "ui_static_text.h"
#include "LuaTableIterator.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_text.h"

namespace qorui {

namespace {

CWindowRegistrar<CStaticText> const s_registrar("StaticText");

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction and state
// ---------------------------------------------------------------------------------------------

CStaticText::CStaticText(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_text_alignment(ALIGNMENT_LEFT) {
    add_material(MAT_NAME_NORMAL, nullptr);
    set_passive(true);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CStaticText::~CStaticText() {}

void CStaticText::set_text_alignment(EAlignment _alignment) {
    m_text_alignment = _alignment;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Text events
// ---------------------------------------------------------------------------------------------

void CStaticText::on_event_set_text(CWndEvent const *_p_event) {
    CWindowVisual::on_event_set_text(_p_event);
    _p_event->rewind();
    wstring text;
    *_p_event >> text;
    m_text = CString(text, -1);
}

// The local string of the key, else the key's own text, goes on as EVENT_SET_TEXT to this window,
// so that the set-text handler of a derived class does the work.
void CStaticText::on_event_set_str(CWndEvent const *_p_event) {
    CWindowVisual::on_event_set_str(_p_event);
    forward_set_str(_p_event);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// Always at the top margin. Right alignment measures from the full width of the window; the clip
// is the text's measured box, so nothing of it reaches outside.
void CStaticText::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    if (!QOR_CHECK(p_font)) return;
    int x = m_left_margin;
    int const y = m_top_margin;
    int const text_w = m_canvas.get_text_width(m_text, p_font, -1);
    int const text_h = m_canvas.get_text_height(m_text, p_font);
    if (m_text_alignment == ALIGNMENT_RIGHT)
        x = get_w() - m_right_margin - text_w;
    else if (m_text_alignment == ALIGNMENT_CENTER)
        x = (get_w() - m_right_margin - m_left_margin - text_w) / 2 + m_left_margin;
    m_canvas.set_clip_area(x, y, text_w, text_h);
    m_canvas.text_out(x, y, 0, CText(m_text), p_font);
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

void CStaticText::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    save_string(_lo_table, "text", m_text);
    _lo_table.SetString("text_alignment", g_alignment_names[m_text_alignment]);
}

// An alignment goes through the virtual setter only for one of the seven names.
void CStaticText::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    load_string(_lo_table, "text", m_text);
    EAlignment alignment;
    if (read_alignment(_lo_table, "text_alignment", alignment)) set_text_alignment(alignment);
}

} // namespace qorui
