// The selector box: its step buttons and their looks, stepping through the rows, the layout of the
// square buttons, the drawing of the selected row, and the rows' layout key "items".
#include "ui_selector_box.h"
#include "qorscriptsystem.h"
#include "ui_button.h"
#include "ui_debug.h"

namespace qorui {

namespace {

CWindowRegistrar<CSelectorBox> const s_selector_box_registrar("SelectorBox");

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

// The arrows' pictures are ordinary materials of the desktop's map, loaded with the rest of its
// materials: a game restyles every selector at once by giving its desktop other ones, and a
// desktop without them leaves the buttons in the plain look of a button.
CSelectorBox::CSelectorBox(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_item_height(-1), m_item_icon_size(16), mp_left_button(nullptr),
      mp_right_button(nullptr) {
    mp_left_button = new CButton(mp_desktop, "left button");
    attach_child(mp_left_button);
    mp_left_button->register_callback(EVENT_CLICK,
                                      CEventCallback(this, &CSelectorBox::on_event_button_left_click));
    mp_right_button = new CButton(mp_desktop, "right button");
    attach_child(mp_right_button);
    mp_right_button->register_callback(EVENT_CLICK,
                                       CEventCallback(this, &CSelectorBox::on_event_button_right_click));
    mp_left_button->dress_from_desktop(MAT_NAME_BUTTON_LEFT, MAT_NAME_BUTTON_LEFT_HIGHLIGHTED,
                                       MAT_NAME_BUTTON_LEFT_PUSHED);
    mp_right_button->dress_from_desktop(MAT_NAME_BUTTON_RIGHT, MAT_NAME_BUTTON_RIGHT_HIGHLIGHTED,
                                        MAT_NAME_BUTTON_RIGHT_PUSHED);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CSelectorBox::~CSelectorBox() {}

// ---------------------------------------------------------------------------------------------
// Rows and stepping
// ---------------------------------------------------------------------------------------------

int CSelectorBox::get_item_height() {
    if (m_item_height > 0) return m_item_height;
    return m_canvas.get_text_height(get_font(FNT_NAME_DEFAULT));
}

// Stepping stops at the ends, as the list's own stepping does: a player who holds to one side
// lands on the first or last row and stays there, rather than jumping to the other end.
void CSelectorBox::on_event_button_left_click(CWndEvent const *) {
    m_items.select_prev();
}

void CSelectorBox::on_event_button_right_click(CWndEvent const *) {
    m_items.select_next();
}

// ---------------------------------------------------------------------------------------------
// Layout
// ---------------------------------------------------------------------------------------------

int CSelectorBox::get_left_margin() const {
    return mp_left_button->get_w() + m_left_margin;
}

int CSelectorBox::get_right_margin() const {
    return mp_right_button->get_w() + m_right_margin;
}

// Square buttons as high as the box, one at each end.
void CSelectorBox::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    int const side = get_h();
    mp_left_button->set_size(side, side);
    mp_right_button->set_size(side, side);
    mp_left_button->set_pos(0, 0);
    mp_right_button->set_pos(get_w() - mp_right_button->get_w(), 0);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// The row stands in a cell of the row's height at the left of the room between the buttons, the
// icon centred in it, whether the row has one or not, and column 0 behind it, centred on the row.
// Every half is a division cut toward zero by itself.
void CSelectorBox::on_event_draw(CWndEvent const *_p_event) {
    CWindowVisual::on_event_draw(_p_event);
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    int const item_h = get_item_height();
    int const text_h = m_canvas.get_text_height(p_font);
    int const x0 = get_left_margin();
    m_canvas.set_clip_area(x0, m_top_margin, get_w() - get_right_margin() - x0,
                           get_h() - m_bottom_margin - m_top_margin);
    if (!m_items.is_selected()) return;
    CItem *p_item = m_items.get_selected();
    if (!QOR_CHECK_AS(p_item, "p_item")) return;
    int const half = item_h / 2;
    if (CMaterial *p_icon = p_item->get_icon()) {
        int const s = m_item_icon_size / 2;
        m_canvas.draw_rect(half - s + x0, m_top_margin - s + half, m_item_icon_size, m_item_icon_size,
                           p_icon);
    }
    m_canvas.text_out(x0 + item_h, half - text_h / 2 + m_top_margin, 0, p_item->get_string(0), p_font);
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

// The rows only: sizes belong to the code that fills the box, and the selection to the game.
void CSelectorBox::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    LuaPlus::LuaObject items;
    items.AssignNewTable(_lo_table.GetState());
    _lo_table.SetObject("items", items);
    m_items.save_state(items, this);
}

void CSelectorBox::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    LuaPlus::LuaObject items = _lo_table.GetByName("items");
    if (items.IsTable()) m_items.load_state(items, this);
}

} // namespace qorui
