// Push buttons, check boxes and radio buttons: construction, the click behaviour of the check box
// and the radio group, drawing of captions, checkers and labels, and their layout keys.
#include "ui_button.h"
#include "LuaTableIterator.h"
#include "qorscriptsystem.h"
#include "ui_logger.h"
#include "ui_material.h"
#include "ui_desktop.h"

namespace qorui {

namespace {

CWindowRegistrar<CButton> const s_button_registrar("Button");
CWindowRegistrar<CCheckBox> const s_check_box_registrar("CheckBox");
CWindowRegistrar<CRadioButton> const s_radio_button_registrar("RadioButton");

} // namespace

// ---------------------------------------------------------------------------------------------
// Push button
// ---------------------------------------------------------------------------------------------

CButton::CButton(CDesktop *_p_desktop, char const *_name) : CWindowVisual(_p_desktop, _name) {
    set_passive(true);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CButton::~CButton() {}

void CButton::dress_from_desktop(HUID const &_normal, HUID const &_highlighted, HUID const &_pushed) {
    if (!mp_desktop) return;
    struct {
        HUID const &m_own;
        HUID const &m_desktops;
    } const looks[] = {
        {MAT_NAME_NORMAL, _normal}, {MAT_NAME_HIGHLIGHTED, _highlighted}, {MAT_NAME_PUSHED, _pushed}};
    for (auto const &look : looks)
        if (CMaterial *p_material = mp_desktop->get_material(look.m_desktops))
            add_material(look.m_own, p_material->clone());
}

// The pushed font wins over the checked one even when the window has no pushed font; the plain
// button font and then the default font stand in for a missing one.
CFont *CButton::choose_font() {
    CFont *p_font = nullptr;
    if (m_is_checked) p_font = get_font(FNT_NAME_BUTTON_CHECKED);
    if (m_is_pushed) p_font = get_font(FNT_NAME_BUTTON_PUSHED);
    if (!p_font) p_font = get_font(FNT_NAME_BUTTON);
    if (!p_font) p_font = get_font(FNT_NAME_DEFAULT);
    return p_font;
}

// The caption centred in the client area, each half truncated by itself; it sinks by a pixel
// while the button is pressed under the pointer, and while it is checked.
void CButton::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    if (m_text.empty()) return;
    CFont *p_font = choose_font();
    if (!p_font) {
        ui_logger().log_warning("No font was found for button %s", get_name());
        return;
    }
    point_t const client = get_client_pos();
    int const text_w = m_canvas.get_text_width(m_text, p_font, -1);
    int const font_h = m_canvas.get_text_height(p_font);
    int x = get_client_w() / 2 - text_w / 2 + client.x;
    int y = get_client_h() / 2 - font_h / 2 + client.y;
    if ((m_is_pushed && m_is_highlighted) || m_is_checked) {
        ++x;
        ++y;
    }
    m_canvas.text_out(x, y, m_text, p_font);
}

void CButton::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    save_string(_lo_table, "text", m_text);
}

void CButton::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    load_string(_lo_table, "text", m_text);
}

// ---------------------------------------------------------------------------------------------
// Check box
// ---------------------------------------------------------------------------------------------

CCheckBox::CCheckBox(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_checker_w(16), m_checker_h(16), m_just_clicked(false) {}

CCheckBox::~CCheckBox() {}

void CCheckBox::set_checker_size(int _w, int _h) {
    m_checker_w = _w;
    m_checker_h = _h;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CCheckBox::on_event_click(CWndEvent const *_p_event) {
    CWindow::on_event_click(_p_event);
    m_is_checked = !m_is_checked;
    m_just_clicked = true;
    send_event(this, m_is_checked ? EVENT_CHECKED : EVENT_UNCHECKED, CWndEvent::DISPATCH_NONE);
}

void CCheckBox::on_event_pointer_enter(CWndEvent const *_p_event) {
    CWindowVisual::on_event_pointer_enter(_p_event);
    m_just_clicked = false;
}

// By the checked and disabled states; the highlight picture, where the window has one, stands in
// while the pointer is over an enabled box that wasn't just clicked.
CMaterial *CCheckBox::choose_checker_material() {
    CMaterial *p_material =
        m_is_checked ? get_material(m_is_disabled ? MAT_NAME_CHECKER_ON_DISABLED : MAT_NAME_CHECKER_ON)
                     : get_material(m_is_disabled ? MAT_NAME_CHECKER_OFF_DISABLED : MAT_NAME_CHECKER_OFF);
    if (!m_is_disabled && m_is_highlighted && !m_just_clicked)
        if (CMaterial *p_highlighted = get_material(MAT_NAME_HIGHLIGHTED)) p_material = p_highlighted;
    return p_material;
}

// The body is never drawn highlighted: the highlight belongs to the checker. The checker stands at
// the left edge, centred vertically; the label starts half a checker width right of it.
void CCheckBox::on_event_draw(CWndEvent const *_p_event) {
    bool const highlighted = m_is_highlighted;
    m_is_highlighted = false;
    CWindowVisual::on_event_draw(_p_event);
    m_is_highlighted = highlighted;

    int const w = get_w(), h = get_h();
    m_canvas.set_clip_area(0, 0, w, h);
    if (CMaterial *p_material = choose_checker_material())
        m_canvas.draw_rect(0, h / 2 - m_checker_h / 2, m_checker_w, m_checker_h, p_material);
    if (CFont *p_font = get_font(FNT_NAME_DEFAULT))
        m_canvas.text_out(m_checker_w / 2 + m_checker_w, h / 2 - m_canvas.get_text_height(p_font) / 2, m_text,
                          p_font);
}

// The label isn't a layout key: the code that builds a box names it, as a dialog names the captions
// of its buttons; a layout that wants text beside a box places a static text there.
void CCheckBox::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    _lo_table.SetNumber("checker_w", m_checker_w);
    _lo_table.SetNumber("checker_h", m_checker_h);
}

void CCheckBox::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    read_integer(_lo_table, "checker_w", m_checker_w);
    read_integer(_lo_table, "checker_h", m_checker_h);
}

// ---------------------------------------------------------------------------------------------
// Radio button
// ---------------------------------------------------------------------------------------------

CRadioButton::CRadioButton(CDesktop *_p_desktop, char const *_name) : CCheckBox(_p_desktop, _name) {}

CRadioButton::~CRadioButton() {}

// The group is read at the moment of the click: every radio button under the same parent, derived
// classes included; check boxes and other windows are left alone. A button that is on stays on.
void CRadioButton::on_event_click(CWndEvent const *) {
    if (CWindow *p_parent = get_parent())
        for (unsigned int i = 0; i < p_parent->get_children_count(); ++i)
            if (CRadioButton *p_member = class_cast<CRadioButton>(p_parent->get_child(i)))
                p_member->set_checked(false);
    set_checked(true);
}

} // namespace qorui
