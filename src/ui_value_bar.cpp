// Value bars: the range and position with their invariant, the orientation and the derived bar size;
// the progress bar's fill; the scroll bar's three buttons, their layout for the position, steps,
// presses on the track and the drag of the scroller.
#include "ui_value_bar.h"
#include "qorscriptsystem.h"
#include "ui_button.h"
#include "ui_debug.h"
#include "ui_material.h"
#include "ui_desktop.h"

#include <algorithm>

namespace qorui {

namespace {

CWindowRegistrar<CValueBar> const s_value_bar_registrar("ValueBar");
CWindowRegistrar<CProgressBar> const s_progress_bar_registrar("ProgressBar");
CWindowRegistrar<CScrollBar> const s_scroll_bar_registrar("ScrollBar");

} // namespace

// ---------------------------------------------------------------------------------------------
// Value bar
// ---------------------------------------------------------------------------------------------

// The bar size set here lasts only until set_horizontal's resize, which takes it from the window's
// size: 0 until a layout or the owner sizes the bar.
CValueBar::CValueBar(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_min(0.0f), m_max(100.0f), m_position(0.0f), m_bar_size(16),
      m_horizontal(true) {
    set_horizontal(true);
    add_material(MAT_NAME_NORMAL, create_color_material(mp_desktop, rgba_t(52, 52, 52, 50)));
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CValueBar::~CValueBar() {}

// Written so that a NaN fails the comparisons and takes the bound: the invariant holds for any value.
void CValueBar::clamp_position() {
    if (!(m_position >= m_min)) m_position = m_min;
    if (!(m_position <= m_max)) m_position = m_max;
}

// A minimum above the maximum collapses the range to the maximum. No event, even if the position
// moved.
void CValueBar::set_min(float _min) {
    m_min = _min;
    if (!(m_min <= m_max)) m_min = m_max;
    clamp_position();
}

void CValueBar::set_max(float _max) {
    m_max = _max;
    if (!(m_max >= m_min)) m_max = m_min;
    clamp_position();
}

// Compared before clamping: repeating a value beyond the range sends the event each time.
void CValueBar::set_position(float _position) {
    if (_position == m_position) return;
    m_position = _position;
    clamp_position();
    send_event(this, EVENT_CHANGED, CWndEvent::DISPATCH_NONE);
}

// Not shifted by m_min: with a range of 50 to 150, the position 100 is already 1.
float CValueBar::get_position_normalized() const {
    float const range = m_max - m_min;
    if (!QOR_CHECK(range >= 0) || range <= 0) return 0.0f;
    return std::min(1.0f, std::max(0.0f, m_position / range));
}

// The window keeps its size along the bar: width and height aren't swapped, only the thickness is
// taken anew from the new orientation.
void CValueBar::set_horizontal(bool _horizontal) {
    m_horizontal = _horizontal;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    if (m_horizontal)
        set_size(get_w(), m_bar_size);
    else
        set_size(m_bar_size, get_h());
}

void CValueBar::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    m_bar_size = m_horizontal ? get_h() : get_w();
}

void CValueBar::on_event_changed(CWndEvent const *_p_event) {
    CWindowVisual::on_event_changed(_p_event);
}

void CValueBar::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    _lo_table.SetBoolean("is_horizontal", m_horizontal);
}

// Range and position aren't kept in layouts: they belong to what the bar shows.
void CValueBar::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    LuaPlus::LuaObject const horizontal = _lo_table.GetByName("is_horizontal");
    if (horizontal.IsBoolean()) set_horizontal(horizontal.GetBoolean());
}

// ---------------------------------------------------------------------------------------------
// Progress bar
// ---------------------------------------------------------------------------------------------

CProgressBar::CProgressBar(CDesktop *_p_desktop, char const *_name) : CValueBar(_p_desktop, _name) {
    add_material(MAT_NAME_PROGRESS, create_color_material(mp_desktop, rgba_t(252, 252, 252, 200)));
    set_passive(true);
}

CProgressBar::~CProgressBar() {}

// The fill always grows from the left, whatever the orientation; its height is the bar size less
// the margins.
void CProgressBar::on_event_draw(CWndEvent const *_p_event) {
    CValueBar::on_event_draw(_p_event);
    CMaterial *p_material = get_material(MAT_NAME_PROGRESS);
    if (!p_material) return;
    int const fill_w = static_cast<int>(static_cast<float>(get_w() - m_right_margin - m_left_margin) *
                                        get_position_normalized());
    m_canvas.draw_rect(m_left_margin, m_top_margin, fill_w, m_bar_size - m_bottom_margin - m_top_margin,
                       p_material);
}

// ---------------------------------------------------------------------------------------------
// Scroll bar: construction and state
// ---------------------------------------------------------------------------------------------

// The buttons get the bar size of the moment, 0 for a bar built by code: a layout or the owner
// sizes them. The up and down materials serve horizontal bars as well.
CScrollBar::CScrollBar(CDesktop *_p_desktop, char const *_name)
    : CValueBar(_p_desktop, _name), m_small_step(10.0f), m_large_step(50.0f), mp_button_min(nullptr),
      mp_button_max(nullptr), mp_button_scroller(nullptr), m_drag_offset{0, 0} {
    mp_button_min = add_button("button min", MAT_NAME_BUTTON_UP, MAT_NAME_BUTTON_UP_HIGHLIGHTED,
                               MAT_NAME_BUTTON_UP_PUSHED);
    mp_button_min->register_callback(EVENT_CLICK,
                                     CEventCallback(this, &CScrollBar::on_event_button_min_click));
    mp_button_max = add_button("button max", MAT_NAME_BUTTON_DOWN, MAT_NAME_BUTTON_DOWN_HIGHLIGHTED,
                               MAT_NAME_BUTTON_DOWN_PUSHED);
    mp_button_max->register_callback(EVENT_CLICK,
                                     CEventCallback(this, &CScrollBar::on_event_button_max_click));
    mp_button_scroller = add_button("button scroller", MAT_NAME_BUTTON_SCROLLER,
                                    MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED, MAT_NAME_BUTTON_SCROLLER_PUSHED);
    mp_button_scroller->register_callback(
        EVENT_DRAG_BEGIN, CEventCallback(this, &CScrollBar::on_event_button_scroller_drag_begin));
    mp_button_scroller->register_callback(EVENT_DRAG,
                                          CEventCallback(this, &CScrollBar::on_event_button_scroller_drag));
    mp_button_scroller->register_callback(EVENT_DRAG_END,
                                          CEventCallback(this, &CScrollBar::on_event_pointer_up));
    mp_button_scroller->set_can_drag(true);
    register_callback(EVENT_SCROLL_SMALL_STEP, CEventCallback(this, &CScrollBar::on_event_scroll_small_step));
    register_callback(EVENT_SCROLL_LARGE_STEP, CEventCallback(this, &CScrollBar::on_event_scroll_large_step));
    set_passive(true);
}

CScrollBar::~CScrollBar() {}

CButton *CScrollBar::add_button(char const *_name, HUID const &_normal, HUID const &_highlighted,
                                HUID const &_pushed) {
    CButton *p_button = new CButton(mp_desktop, _name);
    attach_child(p_button);
    p_button->set_size(m_bar_size, m_bar_size);
    p_button->dress_from_desktop(_normal, _highlighted, _pushed);
    return p_button;
}

// The steps follow the range: 1% and 10% of it. The scroller moves at the next change or resize.
void CScrollBar::set_min(float _min) {
    CValueBar::set_min(_min);
    set_small_step((m_max - m_min) * 0.01f);
    set_large_step((m_max - m_min) * 0.1f);
}

void CScrollBar::set_max(float _max) {
    CValueBar::set_max(_max);
    set_small_step((m_max - m_min) * 0.01f);
    set_large_step((m_max - m_min) * 0.1f);
}

void CScrollBar::set_small_step(float _val) {
    store_step(m_small_step, _val);
}

void CScrollBar::set_large_step(float _val) {
    store_step(m_large_step, _val);
}

void CScrollBar::store_step(float &_step, float _val) {
    if (!QOR_CHECK(_val >= 0)) return;
    _step = std::min(_val, m_max - m_min);
}

// The buttons and the range are saved by their own rules: the buttons as children under their
// names, the range and steps not at all.
void CScrollBar::save_state(LuaPlus::LuaObject &_lo_table) {
    CValueBar::save_state(_lo_table);
}

void CScrollBar::load_state(LuaPlus::LuaObject &_lo_table) {
    CValueBar::load_state(_lo_table);
}

// ---------------------------------------------------------------------------------------------
// Scroll bar: layout
// ---------------------------------------------------------------------------------------------

void CScrollBar::on_event_resized(CWndEvent const *_p_event) {
    CValueBar::on_event_resized(_p_event);
    mp_button_min->set_pos(0, 0);
    if (m_horizontal)
        mp_button_max->set_pos(get_w() - m_bar_size, 0);
    else
        mp_button_max->set_pos(0, get_h() - m_bar_size);
    set_scroller_for_position();
}

int CScrollBar::get_track_length() const {
    int track = length_of(this) - length_of(mp_button_scroller);
    if (!mp_button_max->is_hidden()) track -= length_of(mp_button_max);
    if (!mp_button_min->is_hidden()) track -= length_of(mp_button_min);
    return track;
}

// A hidden end button gives its room to the track; the scroller is centred across the bar. A
// vertical bar too short for its buttons keeps the scroller behind the min button, a horizontal one
// lets it run back over the min button.
void CScrollBar::set_scroller_for_position() {
    mp_button_min->set_pos(0, 0);
    if (m_horizontal)
        mp_button_max->set_pos(get_w() - mp_button_max->get_w(), 0);
    else
        mp_button_max->set_pos(0, get_h() - mp_button_max->get_h());
    int track = get_track_length();
    if (!m_horizontal && track < 0) track = 0;
    float const range = m_max - m_min;
    int offset = range > 0 ? static_cast<int>((m_position - m_min) / range * static_cast<float>(track)) : 0;
    if (!mp_button_min->is_hidden()) offset += length_of(mp_button_min);
    if (m_horizontal)
        mp_button_scroller->set_pos(offset, (m_bar_size - mp_button_scroller->get_h()) / 2);
    else
        mp_button_scroller->set_pos((m_bar_size - mp_button_scroller->get_w()) / 2, offset);
}

// The scroller follows every change of the position, from whatever source.
void CScrollBar::on_event_changed(CWndEvent const *_p_event) {
    CValueBar::on_event_changed(_p_event);
    set_scroller_for_position();
}

// ---------------------------------------------------------------------------------------------
// Scroll bar: input
// ---------------------------------------------------------------------------------------------

// The buttons don't hang on the bar's enabled state by themselves: they are told.
void CScrollBar::on_event_enable(CWndEvent const *_p_event) {
    CValueBar::on_event_enable(_p_event);
    for (CButton *p_button : {mp_button_min, mp_button_max, mp_button_scroller})
        send_event(p_button, EVENT_ENABLE, CWndEvent::DISPATCH_NONE);
}

void CScrollBar::on_event_disable(CWndEvent const *_p_event) {
    CValueBar::on_event_disable(_p_event);
    for (CButton *p_button : {mp_button_min, mp_button_max, mp_button_scroller})
        send_event(p_button, EVENT_DISABLE, CWndEvent::DISPATCH_NONE);
}

point_t CScrollBar::get_pointer_pos_in(CWindow const *_p_wnd) const {
    if (!QOR_CHECK(mp_desktop)) return point_t{0, 0};
    return _p_wnd->convert_to_local(mp_desktop->get_pointer_pos());
}

void CScrollBar::send_step(EEventType _id, int _direction) {
    CWndEvent event(_id);
    event << _direction;
    send_event(this, &event, CWndEvent::DISPATCH_NONE);
}

// A press on the track is one large step towards the pointer; a press level with the scroller's
// position counts towards the maximum.
void CScrollBar::on_event_pointer_down(CWndEvent const *_p_event) {
    CValueBar::on_event_pointer_down(_p_event);
    bool const before = along(get_pointer_pos_in(this)) < along(mp_button_scroller->get_pos());
    send_step(EVENT_SCROLL_LARGE_STEP, before ? -1 : 1);
}

// Also the end of a drag of the scroller. The bar clears its own pushed state as well: otherwise a
// press on the track would leave it pushed, and a pushed material of the bar would show whenever
// the pointer came over it again.
void CScrollBar::on_event_pointer_up(CWndEvent const *_p_event) {
    CValueBar::on_event_pointer_up(_p_event);
    stop_all_sounds();
}

// One click, one step: a button held down doesn't repeat.
void CScrollBar::on_event_button_min_click(CWndEvent const *) {
    send_step(EVENT_SCROLL_SMALL_STEP, -1);
}

void CScrollBar::on_event_button_max_click(CWndEvent const *) {
    send_step(EVENT_SCROLL_SMALL_STEP, 1);
}

void CScrollBar::step(CWndEvent const *_p_event, float _step) {
    _p_event->rewind();
    int direction = 0;
    *_p_event >> direction;
    set_position(m_position + static_cast<float>(direction) * _step);
    set_scroller_for_position();
}

void CScrollBar::on_event_scroll_small_step(CWndEvent const *_p_event) {
    step(_p_event, m_small_step);
}

void CScrollBar::on_event_scroll_large_step(CWndEvent const *_p_event) {
    step(_p_event, m_large_step);
}

void CScrollBar::on_event_button_scroller_drag_begin(CWndEvent const *) {
    m_drag_offset = get_pointer_pos_in(mp_button_scroller);
}

// The movement counts only while the pointer stands on the side it moves to, measured from where
// it took hold of the scroller: a pointer that ran past the end of the track has no effect on its
// way back until it reaches the grab point again. One pixel of movement is the range over the track.
//
// The scroller's own drag handler has run before this one and moved it by the movement. The grab
// point belongs to the scroller where the layout put it, so that movement is taken off again:
// measured from the moved scroller, a pointer that holds the scroller where it took hold of it
// would stand exactly on the grab point after every step, and no movement towards the minimum
// would ever count.
void CScrollBar::on_event_button_scroller_drag(CWndEvent const *_p_event) {
    _p_event->rewind();
    point_t movement{0, 0};
    *_p_event >> movement;
    int const moved = along(movement);
    int const pointer = along(get_pointer_pos_in(this));
    int const grab = along(mp_button_scroller->get_pos()) - moved + along(m_drag_offset);
    float delta = 0.0f;
    if ((moved > 0 && pointer >= grab) || (moved < 0 && pointer < grab)) {
        int const track = get_track_length();
        if (track > 0) delta = static_cast<float>(moved) * (m_max - m_min) / static_cast<float>(track);
    }
    set_position(m_position + delta);
    set_scroller_for_position();
}

} // namespace qorui
