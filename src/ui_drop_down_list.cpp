// The drop-down list: its list box and the callbacks on it, choosing a row, opening and closing
// the list, its placement under the control, the drawing of the chosen text, and the layout keys.
#include "ui_drop_down_list.h"
#include "LuaTableIterator.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_items.h"
#include "ui_list_box.h"

namespace qorui {

namespace {

CWindowRegistrar<CDropDownList> const s_drop_down_list_registrar("DropDownList");

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

// The list hangs from the control but lies outside it, below; being passive, a press in it
// activates the control, which so stays active while a row is chosen.
CDropDownList::CDropDownList(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), mp_list_box(nullptr), m_max_list_box_height(0), m_list_box_h(0),
      m_offset(0), m_left_border_offset(0), m_right_border_offset(0) {
    mp_list_box = new CListBox(mp_desktop, "list_box");
    attach_child(mp_list_box);
    mp_list_box->set_passive(true);
    mp_list_box->register_callback(EVENT_CLICK,
                                   CEventCallback(this, &CDropDownList::on_event_list_box_click));
    mp_list_box->register_callback(EVENT_CHECKED,
                                   CEventCallback(this, &CDropDownList::on_event_list_box_checked));
    send_event(mp_list_box, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CDropDownList::~CDropDownList() {}

// ---------------------------------------------------------------------------------------------
// Rows and choice
// ---------------------------------------------------------------------------------------------

CItems &CDropDownList::get_items() {
    // Stands in for the rows of a control without its list: what a caller puts there is kept out
    // of sight until the process ends.
    static CItems s_no_rows;
    if (!QOR_CHECK_AS(mp_list_box, "mp_list_box")) return s_no_rows;
    return mp_list_box->get_items();
}

// A row out of range breaks the list's contract and leaves the choice as it was.
void CDropDownList::check(unsigned int _idx) {
    CItems &items = get_items();
    if (static_cast<int>(_idx) == items.get_checked_idx()) return;
    items.check(static_cast<int>(_idx));
    if (static_cast<int>(_idx) == items.get_checked_idx()) show_checked_row();
}

// The copy takes the row's lines with their fonts, and no more: a multi-line row shows all its
// lines.
void CDropDownList::show_checked_row() {
    CItems &items = get_items();
    if (!items.is_checked()) return;
    CItem *p_item = items.get_checked();
    if (!QOR_CHECK_AS(p_item, "p_item")) return;
    m_text = p_item->get_string(0);
    send_event(this, EVENT_CHANGED, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Opening and closing
// ---------------------------------------------------------------------------------------------

// The list is laid out anew before it opens, so that it fits the rows it has now.
void CDropDownList::on_event_click(CWndEvent const *_p_event) {
    CWindowVisual::on_event_click(_p_event);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    if (mp_list_box->is_hidden())
        send_event(mp_list_box, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    else
        close_list();
}

// A click in the open list closes it, on a row or not. It comes behind the list's own handling of
// the click, so a row has already been chosen.
void CDropDownList::on_event_list_box_click(CWndEvent const *) {
    close_list();
}

void CDropDownList::on_event_list_box_checked(CWndEvent const *) {
    show_checked_row();
}

// A click anywhere outside the control and its list takes the activation away, and with it the
// list.
void CDropDownList::on_event_deactivate(CWndEvent const *_p_event) {
    CWindowVisual::on_event_deactivate(_p_event);
    close_list();
}

// The row under the pointer goes with the list: a hidden list hears no more of the pointer, and a
// row left selected there would be chosen by the next click in the list's margin, wherever the
// pointer had left it. A closed list takes no hide, so closing it again tells no one.
void CDropDownList::close_list() {
    send_event(mp_list_box, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    mp_list_box->get_items().deselect();
}

// The open list scrolls by the wheel while the control is the active window; a closed one is
// left alone.
void CDropDownList::on_event_wheel_rotated(CWndEvent const *_p_event) {
    CWindowVisual::on_event_wheel_rotated(_p_event);
    if (mp_list_box->is_hidden()) return;
    _p_event->rewind();
    send_event(mp_list_box, _p_event, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Layout
// ---------------------------------------------------------------------------------------------

void CDropDownList::offset_list_box(int _offset) {
    m_offset = _offset;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CDropDownList::offset_list_box_borders(int _left, int _right) {
    m_left_border_offset = _left;
    m_right_border_offset = _right;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

// Fitted to the rows, the list is as high as its rows and its margins, without the spacing between
// rows: a list with spacing shows its scroll bar for the little that is missing.
void CDropDownList::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    m_list_box_h = m_max_list_box_height;
    if (m_list_box_h == 0)
        m_list_box_h =
            static_cast<int>(mp_list_box->get_items().get_count()) * mp_list_box->get_item_height() +
            mp_list_box->get_top_margin() + mp_list_box->get_bottom_margin();
    mp_list_box->set_pos(m_left_border_offset, get_h() + m_offset);
    mp_list_box->set_size(get_w() + m_right_border_offset - m_left_border_offset, m_list_box_h);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// A disabled control without a font of its own for that state shows its text in the default
// font: the text stays readable, and the disabled look is the body's material.
void CDropDownList::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    CFont *p_font = m_is_disabled ? get_font(FNT_NAME_DISABLED) : nullptr;
    if (!p_font) p_font = get_font(FNT_NAME_DEFAULT);
    if (!p_font) return;
    point_t const client = get_client_pos();
    m_canvas.text_out(client.x, client.y, 0, m_text, p_font);
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

void CDropDownList::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    if (CString const *p_line = m_text.get_string()) save_string(_lo_table, "text", *p_line);
    _lo_table.SetNumber("offset", m_offset);
    _lo_table.SetNumber("left_border_offset", m_left_border_offset);
    _lo_table.SetNumber("right_border_offset", m_right_border_offset);
    _lo_table.SetNumber("max_list_box_height", m_max_list_box_height);
}

// The text goes through the local strings and is appended, ending with a line break: the loaded
// line is followed by an empty one, on which the caret stands.
void CDropDownList::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    if (_lo_table.GetByName("text").IsString()) {
        CString text;
        load_string(_lo_table, "text", text);
        m_text.insert_str(text.c_str(), false);
    }
    read_int(_lo_table, "offset", m_offset);
    read_int(_lo_table, "left_border_offset", m_left_border_offset);
    read_int(_lo_table, "right_border_offset", m_right_border_offset);
    read_int(_lo_table, "max_list_box_height", m_max_list_box_height);
}

} // namespace qorui
