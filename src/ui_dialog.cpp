// Borders and dialogs: the border that resizes its parent by a drag, the dialog with its caption
// and its buttons, the list dialog and the message box, and their layout keys.
#include "ui_dialog.h"
#include "LuaTableIterator.h"
#include "qorscriptsystem.h"
#include "ui_button.h"
#include "ui_debug.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_list_box.h"
#include "ui_material.h"

#include <cstdio>

namespace qorui {

namespace {

CWindowRegistrar<CBorder> const s_border_registrar("Border");
CWindowRegistrar<CDialog> const s_dialog_registrar("Dialog");
CWindowRegistrar<CListDialog> const s_list_dialog_registrar("ListDialog");
CWindowRegistrar<CMessageBox> const s_message_box_registrar("MessageBox");

// The border types' names in layouts.
struct SBorderTypeName {
    EBorderType m_type;
    char const *m_name;
};
SBorderTypeName const k_border_type_names[] = {{BORDER_LEFT, "BORDER_LEFT"},
                                               {BORDER_RIGHT, "BORDER_RIGHT"},
                                               {BORDER_TOP, "BORDER_TOP"},
                                               {BORDER_BOTTOM, "BORDER_BOTTOM"},
                                               {BORDERS_ALL, "BORDERS_ALL"}};

// The edge flag that a grab at _along on a border _length long adds: the near end's within
// _corner pixels of the start, else the far end's within _corner pixels of the end, else none.
unsigned int corner_flag(int _along, int _length, int _corner, EBorderType _near, EBorderType _far) {
    if (_along <= _corner) return _near;
    if (_length - _along <= _corner) return _far;
    return 0;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Border
// ---------------------------------------------------------------------------------------------

CBorder::CBorder(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_border_type(BORDER_LEFT), m_drag_mode(0), m_drag_start{0, 0},
      m_border_size(8) {
    set_can_drag(true);
    add_material(MAT_NAME_NORMAL, nullptr);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CBorder::~CBorder() {}

// The callback stays in the parent's dispatcher for the parent's life: hence a border is never
// detached.
void CBorder::on_attached() {
    set_passive(true);
    if (!QOR_CHECK(mp_parent)) return;
    mp_parent->register_callback(EVENT_RESIZED, CEventCallback(this, &CBorder::on_event_parent_resized));
}

void CBorder::on_detached() {
    QOR_CHECK(!"CBorder::on_detached()");
}

void CBorder::set_border_size(int _size) {
    m_border_size = _size;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CBorder::on_event_parent_resized(CWndEvent const *) {
    if (!mp_parent) return;
    int const pw = mp_parent->get_w(), ph = mp_parent->get_h();
    switch (m_border_type) {
    case BORDER_LEFT:
        set_pos(0, 0);
        set_size(m_border_size, ph);
        break;
    case BORDER_RIGHT:
        set_pos(pw - m_border_size, 0);
        set_size(m_border_size, ph);
        break;
    case BORDER_TOP:
        set_pos(0, 0);
        set_size(pw, m_border_size);
        break;
    case BORDER_BOTTOM:
        set_pos(0, ph - m_border_size);
        set_size(pw, m_border_size);
        break;
    default:
        break;
    }
}

// The border's own edge, and a second one when the grab is near an end of the border.
void CBorder::on_event_drag_begin(CWndEvent const *_p_event) {
    CWindowVisual::on_event_drag_begin(_p_event);
    m_drag_mode = m_border_type;
    if (mp_desktop) m_drag_start = convert_to_local(mp_desktop->get_pointer_pos());
    int const corner = 2 * m_border_size;
    if (m_border_type == BORDER_TOP || m_border_type == BORDER_BOTTOM)
        m_drag_mode |= corner_flag(m_drag_start.x, get_w(), corner, BORDER_LEFT, BORDER_RIGHT);
    if (m_border_type == BORDER_LEFT || m_border_type == BORDER_RIGHT)
        m_drag_mode |= corner_flag(m_drag_start.y, get_h(), corner, BORDER_TOP, BORDER_BOTTOM);
}

// The parent takes the movement on the dragged edges; the border itself isn't moved by it, it
// follows the parent's new size. A left or top edge moves the parent by the size that it really
// took, so that its right or bottom edge stays where it was whatever its constraints refused.
void CBorder::on_event_drag(CWndEvent const *_p_event) {
    if (!mp_parent) return;
    _p_event->rewind();
    point_t const movement = _p_event->get<point_t>();
    CWindow &parent = *mp_parent;
    if (m_drag_mode & BORDER_LEFT) {
        int const old_w = parent.get_w();
        parent.set_size(old_w - movement.x, parent.get_h());
        parent.set_pos(parent.get_pos().x + old_w - parent.get_w(), parent.get_pos().y);
    }
    if (m_drag_mode & BORDER_RIGHT) parent.set_size(parent.get_w() + movement.x, parent.get_h());
    if (m_drag_mode & BORDER_TOP) {
        int const old_h = parent.get_h();
        parent.set_size(parent.get_w(), old_h - movement.y);
        parent.set_pos(parent.get_pos().x, parent.get_pos().y + old_h - parent.get_h());
    }
    if (m_drag_mode & BORDER_BOTTOM) parent.set_size(parent.get_w(), parent.get_h() + movement.y);
}

void CBorder::on_event_drag_end(CWndEvent const *_p_event) {
    CWindowVisual::on_event_drag_end(_p_event);
    m_drag_mode = 0;
}

// A type that is no single edge nor all of them writes no key.
void CBorder::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    _lo_table.SetNumber("border_size", m_border_size);
    for (auto const &entry : k_border_type_names)
        if (entry.m_type == m_border_type) _lo_table.SetString("type", entry.m_name);
}

void CBorder::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    int size = m_border_size;
    if (read_int(_lo_table, "border_size", size)) set_border_size(size);
    string name;
    if (read_string(_lo_table, "type", name))
        for (auto const &entry : k_border_type_names)
            if (name == entry.m_name) m_border_type = entry.m_type;
}

// ---------------------------------------------------------------------------------------------
// Dialog
// ---------------------------------------------------------------------------------------------

CDialog::CDialog(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_caption_alignment(ALIGNMENT_LEFT), m_buttons_horizontal(true),
      m_caption_h(24), m_button_w(128), m_button_h(32), m_buttons_interval(8), mp_default_button(nullptr) {
    set_can_drag(true);
    make_borders(8, BORDERS_ALL);
}

CDialog::~CDialog() {}

CButton *CDialog::add_button(CString const &_caption) {
    char name[128];
    std::snprintf(name, sizeof(name), "dialog button %d", static_cast<int>(m_buttons.size()));
    CButton *p_button = new CButton(mp_desktop, name);
    attach_child(p_button);
    m_buttons.push_back(p_button);
    p_button->set_size(m_button_w, m_button_h);
    p_button->m_text = _caption;
    struct {
        HUID const &m_id;
        rgba_t m_color;
    } const looks[] = {{MAT_NAME_NORMAL, rgba_t(52, 52, 52, 100)},
                       {MAT_NAME_HIGHLIGHTED, rgba_t(125, 125, 125, 200)},
                       {MAT_NAME_PUSHED, rgba_t(125, 125, 125, 120)},
                       {MAT_NAME_CHECKED, rgba_t(125, 125, 125, 120)}};
    for (auto const &look : looks)
        p_button->add_material(look.m_id, create_color_material(mp_desktop, look.m_color));
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    return p_button;
}

CButton *CDialog::get_button(unsigned int _idx) {
    return QOR_CHECK(_idx < m_buttons.size()) ? m_buttons[_idx] : nullptr;
}

void CDialog::set_default_button(CButton *_p_button) {
    if (QOR_CHECK(_p_button)) mp_default_button = _p_button;
}

void CDialog::on_default_button_click() {
    if (mp_default_button) send_event(mp_default_button, EVENT_CLICK, CWndEvent::DISPATCH_NONE);
}

// Every change of the layout is sent, also one to the same value.
template <class TValue>
void CDialog::relayout(TValue &_field, TValue _value) {
    _field = _value;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CDialog::set_caption_h(int _h) {
    relayout(m_caption_h, _h);
}

void CDialog::set_button_size(int _w, int _h) {
    m_button_w = _w;
    relayout(m_button_h, _h);
}

void CDialog::set_buttons_interval(int _interval) {
    relayout(m_buttons_interval, _interval);
}

void CDialog::set_caption_alignment(EAlignment _alignment) {
    relayout(m_caption_alignment, _alignment);
}

void CDialog::set_buttons_horizontal(bool _horizontal) {
    relayout(m_buttons_horizontal, _horizontal);
}

void CDialog::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    layout_buttons();
}

// The block of buttons is centred across the whole window and stands on the bottom margin; each
// half of the centring is truncated by itself.
void CDialog::layout_buttons() {
    int const n = static_cast<int>(m_buttons.size());
    int const w = get_w(), h = get_h();
    int const step_w = m_buttons_horizontal ? m_button_w + m_buttons_interval : 0;
    int const step_h = m_buttons_horizontal ? 0 : m_button_h + m_buttons_interval;
    int total = (step_w + step_h) * n;
    if (total > 0) total -= m_buttons_interval;
    int x = m_buttons_horizontal ? w / 2 - total / 2 : w / 2 - m_button_w / 2;
    int y = m_buttons_horizontal ? h - m_button_h - m_bottom_margin : h - m_bottom_margin - total;
    for (CButton *p_button : m_buttons) {
        p_button->set_size(m_button_w, m_button_h);
        p_button->set_pos(x, y);
        x += step_w;
        y += step_h;
    }
}

// The caption's y halves the sum of the client top and the strip's height, not the strip alone.
void CDialog::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    if (!QOR_CHECK(p_font)) return;
    point_t const client = get_client_pos();
    int const cw = get_client_w();
    int const y = (client.y + m_caption_h) / 2 - m_canvas.get_text_height(p_font) / 2;
    int const text_w = m_canvas.get_text_width(m_caption, p_font, -1);
    int x = client.x;
    if (m_caption_alignment == ALIGNMENT_RIGHT)
        x = client.x - text_w + cw;
    else if (m_caption_alignment == ALIGNMENT_CENTER)
        x = cw / 2 - text_w / 2 + client.x;
    m_canvas.text_out(x, y, m_caption, p_font);
}

// "can_drag" is among the window's own keys.
void CDialog::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    _lo_table.SetString("caption_alignment", g_alignment_names[m_caption_alignment]);
    _lo_table.SetNumber("caption_h", m_caption_h);
    _lo_table.SetBoolean("buttons_horizontal", m_buttons_horizontal);
    _lo_table.SetNumber("button_w", m_button_w);
    _lo_table.SetNumber("button_h", m_button_h);
    _lo_table.SetNumber("buttons_interval", m_buttons_interval);
    save_string(_lo_table, "caption", m_caption);
}

// Only the alignment lays the dialog out at once; for the others, the import of a layout sends
// EVENT_RESIZED at its end.
void CDialog::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    EAlignment alignment;
    if (read_alignment(_lo_table, "caption_alignment", alignment)) set_caption_alignment(alignment);
    read_int(_lo_table, "caption_h", m_caption_h);
    read_bool(_lo_table, "buttons_horizontal", m_buttons_horizontal);
    read_int(_lo_table, "button_w", m_button_w);
    read_int(_lo_table, "button_h", m_button_h);
    read_int(_lo_table, "buttons_interval", m_buttons_interval);
    load_string(_lo_table, "caption", m_caption);
}

// ---------------------------------------------------------------------------------------------
// List dialog
// ---------------------------------------------------------------------------------------------

CListDialog::CListDialog(CDesktop *_p_desktop, char const *_name)
    : CDialog(_p_desktop, _name), m_buttons_list_box_interval(8), mp_list_box(nullptr) {
    mp_list_box = new CListBox(mp_desktop, "list box");
    attach_child(mp_list_box);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

CListDialog::~CListDialog() {}

void CListDialog::set_buttons_list_box_interval(int _interval) {
    relayout(m_buttons_list_box_interval, _interval);
}

void CListDialog::on_event_resized(CWndEvent const *_p_event) {
    CDialog::on_event_resized(_p_event);
    if (!mp_list_box) return;
    mp_list_box->set_pos(m_left_margin, m_top_margin + m_caption_h);
    mp_list_box->set_size(get_w() - m_right_margin - m_left_margin, get_h() - m_buttons_list_box_interval -
                                                                        m_button_h - m_bottom_margin -
                                                                        m_top_margin - m_caption_h);
}

// ---------------------------------------------------------------------------------------------
// Message box
// ---------------------------------------------------------------------------------------------

CMessageBox::CMessageBox(CDesktop *_p_desktop, char const *_name) : CDialog(_p_desktop, _name) {
    set_is_modal(true);
}

CMessageBox::~CMessageBox() {}

// One extra pixel between the lines; the block's height counts the lines without it.
void CMessageBox::on_event_draw(CWndEvent const *_p_event) {
    CDialog::on_event_draw(_p_event);
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    CString const *p_first = m_message_text.get_num_strings() ? m_message_text.get_string(0u) : nullptr;
    if (!p_font || !p_first) return;
    point_t const client = get_client_pos();
    int const lines = static_cast<int>(m_message_text.get_num_strings());
    int const x = get_client_w() / 2 - m_canvas.get_text_width(*p_first, p_font, -1) / 2 + client.x;
    int const y = get_client_h() / 2 - (m_canvas.get_text_height(p_font) * lines) / 2 + client.y;
    m_canvas.text_out(x, y, 1, m_message_text, p_font);
}

void CMessageBox::save_state(LuaPlus::LuaObject &_lo_table) {
    CDialog::save_state(_lo_table);
    if (m_message_text.get_num_strings())
        save_string(_lo_table, "message_text", *m_message_text.get_string(0u));
}

// A key of another type leaves the message as it is.
void CMessageBox::load_state(LuaPlus::LuaObject &_lo_table) {
    CDialog::load_state(_lo_table);
    if (!_lo_table.GetByName("message_text").IsString()) return;
    CString text;
    load_string(_lo_table, "message_text", text);
    m_message_text = text;
}

} // namespace qorui
