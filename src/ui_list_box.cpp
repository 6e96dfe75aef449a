// The list box: construction and setters, the height of the rows, the scroll bar that follows the
// rows' overflow, the marks under the pointer and the click, wheel and keys, drawing of the header,
// the marks and the visible rows, and the layout keys.
#include "ui_list_box.h"
#include "LuaTableIterator.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_value_bar.h"

#include <algorithm>

namespace qorui {

namespace {

CWindowRegistrar<CListBox> const s_registrar("ListBox");

// The platform's virtual keys that scroll the list.
int const k_vk_page_up = 0x21;
int const k_vk_page_down = 0x22;
int const k_vk_end = 0x23;
int const k_vk_home = 0x24;
int const k_vk_up = 0x26;
int const k_vk_down = 0x28;

// Divisions that round toward negative and positive infinity; _b is above 0.
int floor_div(int _a, int _b) {
    return _a / _b - (_a % _b < 0 ? 1 : 0);
}
int ceil_div(int _a, int _b) {
    return _a / _b + (_a % _b > 0 ? 1 : 0);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction and state
// ---------------------------------------------------------------------------------------------

// The bar's size of 16 lasts only until its set_horizontal takes the size anew from the window, 0
// by 0 for a bar just made: the bar is as wide as a layout or the owner makes it, and keeps that
// width through every layout of the list.
CListBox::CListBox(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_show_columns(false), m_columns_h(20), m_columns_dw(4),
      m_custom_item_height(-1), m_item_icon_size(16), m_item_spacing(0), m_allow_check_items(true),
      m_columns(1, SColumn{CString(), 0}), mp_scroll_bar_vert(nullptr), m_max_lines(1),
      m_max_lines_revision(m_items.get_revision() - 1) {
    m_top_margin = m_bottom_margin = m_left_margin = m_right_margin = 4;
    mp_scroll_bar_vert = new CScrollBar(mp_desktop, "scroll bar vert");
    attach_child(mp_scroll_bar_vert);
    mp_scroll_bar_vert->set_bar_size(16);
    mp_scroll_bar_vert->set_horizontal(false);
    send_event(mp_scroll_bar_vert, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

// Destructors stay in the library, so that a program that builds these windows can't lend them
// its own deletion.
CListBox::~CListBox() {}

// Every change of the layout is sent, also one to the same value.
template <class TValue>
void CListBox::relayout(TValue &_field, TValue _value) {
    _field = _value;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

unsigned int CListBox::add_column() {
    m_columns.push_back(SColumn{CString(), 0});
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    return static_cast<unsigned int>(m_columns.size()) - 1;
}

void CListBox::set_column_w(unsigned int _idx, int _w) {
    if (QOR_CHECK(_idx < m_columns.size())) relayout(m_columns[_idx].m_w, _w);
}

void CListBox::set_column_title(unsigned int _idx, CString const &_title) {
    if (QOR_CHECK(_idx < m_columns.size())) m_columns[_idx].m_title = _title;
}

void CListBox::set_item_height(int _h) {
    relayout(m_custom_item_height, _h);
}

void CListBox::set_item_icon_size(int _size) {
    relayout(m_item_icon_size, _size);
}

void CListBox::set_columns_h(int _h) {
    relayout(m_columns_h, _h);
}

void CListBox::show_columns(bool _show) {
    relayout(m_show_columns, _show);
}

int CListBox::get_right_margin() const {
    return m_right_margin + (mp_scroll_bar_vert->is_hidden() ? 0 : mp_scroll_bar_vert->get_w());
}

// ---------------------------------------------------------------------------------------------
// Rows and the scroll bar
// ---------------------------------------------------------------------------------------------

// Every row is as high as the tallest, so that a row's place follows from its index alone.
int CListBox::get_item_height() {
    if (m_custom_item_height > 0) return m_custom_item_height;
    return get_max_lines() * m_canvas.get_text_height(get_font(FNT_NAME_DEFAULT));
}

// The walk over all texts runs again only after the rows have changed, not at every call: the
// height is asked for several times a frame, and a frame mustn't cost more for more rows.
int CListBox::get_max_lines() {
    if (m_max_lines_revision == m_items.get_revision()) return m_max_lines;
    m_max_lines = 1;
    for (unsigned int i = 0; i < m_items.get_count(); ++i) {
        CItem const *p_item = m_items.get(i);
        for (unsigned int c = 0; c < p_item->get_strings_number(); ++c)
            m_max_lines = std::max(m_max_lines, static_cast<int>(p_item->get_string(c).get_num_strings()));
    }
    m_max_lines_revision = m_items.get_revision();
    return m_max_lines;
}

// The bar's position is cut toward zero: rows scroll by whole pixels.
int CListBox::get_scroll() const {
    return static_cast<int>(mp_scroll_bar_vert->get_position());
}

// The position stays when the bar hides: a list that shrank while scrolled keeps its offset until a
// later range moves it.
void CListBox::check_scroll_bars() {
    int const pitch = get_row_pitch();
    int const total = static_cast<int>(m_items.get_count()) * pitch;
    int const view = get_h() - m_bottom_margin - m_top_margin - get_header_h();
    if (view < 1 || total <= view) {
        if (!mp_scroll_bar_vert->is_hidden())
            send_event(mp_scroll_bar_vert, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
        return;
    }
    mp_scroll_bar_vert->set_max(static_cast<float>(total - view));
    mp_scroll_bar_vert->set_small_step(static_cast<float>(pitch));
    mp_scroll_bar_vert->set_large_step(static_cast<float>(view));
    if (mp_scroll_bar_vert->is_hidden()) send_event(mp_scroll_bar_vert, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
}

void CListBox::on_event_update(CWndEvent const *_p_event) {
    CWindowVisual::on_event_update(_p_event);
    check_scroll_bars();
}

// The bar stands at the window's right edge beside the rows, not inside the right margin.
void CListBox::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    check_scroll_bars();
    int const bar_w = mp_scroll_bar_vert->get_w();
    mp_scroll_bar_vert->set_size(bar_w, get_h() - get_header_h() - m_bottom_margin - m_top_margin);
    mp_scroll_bar_vert->set_pos(get_w() - bar_w, get_rows_top());
}

// ---------------------------------------------------------------------------------------------
// Input
// ---------------------------------------------------------------------------------------------

// Only over the rows' area does the selection follow the pointer; on the spacing between rows the
// row above counts, and below the last row the old selection stays. A spacing so negative that rows
// don't advance leaves no row under the pointer.
void CListBox::on_event_pointer_pos(CWndEvent const *_p_event) {
    CWindowVisual::on_event_pointer_pos(_p_event);
    _p_event->rewind();
    point_t global{0, 0};
    *_p_event >> global;
    point_t const local = convert_to_local(global);
    int const y0 = get_rows_top();
    if (local.x < m_left_margin || local.x >= get_w() - get_right_margin() || local.y < y0 ||
        local.y >= get_h() - m_bottom_margin)
        return;
    if (!QOR_CHECK(get_item_height() > 0)) return;
    int const pitch = get_row_pitch();
    if (pitch <= 0) return;
    int const idx = (local.y - y0 + get_scroll()) / pitch;
    if (!QOR_CHECK(idx >= 0)) return;
    if (idx >= static_cast<int>(m_items.get_count()) || idx == m_items.get_selected_idx()) return;
    m_items.select(idx);
    send_event(this, EVENT_HIGHLIGHTED, CWndEvent::DISPATCH_NONE);
}

void CListBox::on_event_pointer_exit(CWndEvent const *_p_event) {
    CWindowVisual::on_event_pointer_exit(_p_event);
    m_items.deselect();
}

// Clicking the checked row again does nothing.
void CListBox::on_event_click(CWndEvent const *_p_event) {
    CWindowVisual::on_event_click(_p_event);
    int const selected = m_items.get_selected_idx();
    if (selected < 0 || selected == m_items.get_checked_idx()) return;
    m_items.check(selected);
    send_event(this, EVENT_CHECKED, CWndEvent::DISPATCH_NONE);
}

void CListBox::send_scroll_step(EEventType _id, int _direction) {
    CWndEvent step(_id);
    step << _direction;
    send_event(mp_scroll_bar_vert, &step, CWndEvent::DISPATCH_NONE);
}

// A turn away from the user scrolls down by a row; a hidden bar, with nothing to scroll, takes no
// step.
void CListBox::on_event_wheel_rotated(CWndEvent const *_p_event) {
    CWindowVisual::on_event_wheel_rotated(_p_event);
    _p_event->rewind();
    float delta = 0.0f;
    *_p_event >> delta;
    send_scroll_step(EVENT_SCROLL_SMALL_STEP, delta > 0.0f ? -1 : (delta < 0.0f ? 1 : 0));
}

// The keys scroll the view as the wheel and the bar do: a row with the arrows, a view with the
// page keys, to either end with Home and End. They don't move the selection: that is the row under
// the pointer, and the pointer would take it back at its next movement. Keys that scroll go no
// further; a list whose rows all fit takes them as well, and nothing moves.
void CListBox::on_event_key_down(CWndEvent const *_p_event) {
    CWindowVisual::on_event_key_down(_p_event);
    _p_event->rewind();
    int key = 0;
    *_p_event >> key;
    CScrollBar *p_bar = mp_scroll_bar_vert;
    switch (key) {
    case k_vk_up:
    case k_vk_down:
        send_scroll_step(EVENT_SCROLL_SMALL_STEP, key == k_vk_up ? -1 : 1);
        break;
    case k_vk_page_up:
    case k_vk_page_down:
        send_scroll_step(EVENT_SCROLL_LARGE_STEP, key == k_vk_page_up ? -1 : 1);
        break;
    case k_vk_home:
    case k_vk_end:
        if (!p_bar->is_hidden()) p_bar->set_position(key == k_vk_home ? p_bar->get_min() : p_bar->get_max());
        break;
    default:
        return;
    }
    _p_event->set_dispatch_type(CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

struct CListBox::SRowSpan {
    unsigned int m_first, m_end;
};

// Header, marks, rows: the checked mark is drawn over the selected one, the rows over both.
void CListBox::on_event_draw(CWndEvent const *_p_event) {
    draw_body(_p_event);
    int const scroll = get_scroll(), item_h = get_item_height();
    CFont *p_font = get_font(FNT_NAME_DEFAULT);
    draw_header(p_font);
    int const y0 = get_rows_top();
    draw_marks(y0, item_h, scroll);
    draw_rows(y0, item_h, scroll, p_font);
}

// The body keeps its normal look (or its disabled one) under the pointer and while pressed: the
// row under the pointer is what shows where the pointer is, and a whole list lighting up would say
// nothing more. The window's checked material is the mark of the checked row, never the body's.
void CListBox::draw_body(CWndEvent const *_p_event) {
    bool const highlighted = m_is_highlighted, pushed = m_is_pushed, checked = m_is_checked;
    m_is_highlighted = m_is_pushed = m_is_checked = false;
    CWindowVisual::on_event_draw(_p_event);
    m_is_highlighted = highlighted;
    m_is_pushed = pushed;
    m_is_checked = checked;
}

// Each title's cell reaches back over the gap before its column, up to the window's top edge.
void CListBox::draw_header(CFont *_p_font) {
    if (!m_show_columns) return;
    CMaterial *p_material = get_material(MAT_NAME_LISTBOX_HEADER);
    int x = m_left_margin;
    for (SColumn const &column : m_columns) {
        m_canvas.draw_rect(x - m_columns_dw, 0, column.m_w, m_columns_h + m_top_margin, p_material);
        m_canvas.text_out(x, m_top_margin, column.m_title, _p_font);
        x += column.m_w + m_columns_dw;
    }
}

// The marks reach 2 pixels beyond the rows' text on both sides.
void CListBox::draw_marks(int _y0, int _item_h, int _scroll) {
    int const w = get_w() - get_right_margin() - m_left_margin + 4;
    m_canvas.set_clip_area(m_left_margin - 2, _y0, w, get_h() - m_bottom_margin - _y0);
    m_canvas.push_clip_area();
    draw_mark(m_items.get_selected_idx(), _y0, w, _item_h, _scroll, get_material(MAT_NAME_SELECTION));
    if (m_allow_check_items)
        draw_mark(m_items.get_checked_idx(), _y0, w, _item_h, _scroll, get_material(MAT_NAME_CHECKED));
    m_canvas.pop_clip_area();
}

// A mark on an index past the rows names no row (it is left behind by removals) and isn't drawn.
void CListBox::draw_mark(int _idx, int _y0, int _w, int _item_h, int _scroll, CMaterial *_p_material) {
    if (_idx < 0 || _idx >= static_cast<int>(m_items.get_count())) return;
    m_canvas.draw_rect(m_left_margin - 2, _idx * get_row_pitch() - _scroll + _y0, _w, _item_h, _p_material);
}

// The checked row is drawn in the checked font while checks are shown. Where no such font is found
// the row keeps the font of the row before it, which is the default font: only one row is checked.
void CListBox::draw_rows(int _y0, int _item_h, int _scroll, CFont *_p_font) {
    m_canvas.set_clip_area(m_left_margin, _y0, get_w() - get_right_margin() - m_left_margin,
                           get_h() - m_bottom_margin - _y0);
    CFont *p_checked_font = m_allow_check_items ? get_font(FNT_NAME_CHECKED) : nullptr;
    if (!p_checked_font) p_checked_font = _p_font;
    int const pitch = _item_h + m_item_spacing, checked = m_items.get_checked_idx();
    SRowSpan const span = get_visible_rows(_y0, _item_h, _scroll, _p_font, p_checked_font);
    for (unsigned int i = span.m_first; i < span.m_end; ++i) {
        CItem const *p_item = m_items.get(i);
        if (!QOR_CHECK(p_item)) continue;
        bool const is_checked = m_allow_check_items && static_cast<int>(i) == checked;
        draw_row(*p_item, _y0 - _scroll + static_cast<int>(i) * pitch, _item_h,
                 is_checked ? p_checked_font : _p_font);
    }
}

// Rows outside the view would give nothing but quads that the clip cuts away, so only the rows that
// can reach the view are visited and a frame costs the same for any number of rows. A row's drawing
// may reach beyond its pitch: an icon larger than the row stands out above and below it, and the
// lines of a row lower than its text hang into the rows below. The span takes both in. Rows that
// don't advance downward (a spacing that eats the row) are all visited.
CListBox::SRowSpan CListBox::get_visible_rows(int _y0, int _item_h, int _scroll, CFont *_p_font,
                                              CFont *_p_checked_font) {
    unsigned int const count = m_items.get_count();
    int const pitch = _item_h + m_item_spacing;
    if (pitch <= 0) return SRowSpan{0, count};
    int const icon_top = _item_h / 2 - m_item_icon_size / 2;
    int const line_h = std::max(m_canvas.get_text_height(_p_font), m_canvas.get_text_height(_p_checked_font));
    int const above = std::max(0, -icon_top);
    int const below = std::max({_item_h, get_max_lines() * line_h, icon_top + m_item_icon_size});
    int const view_h = get_h() - m_bottom_margin - _y0;
    // Row i reaches from i * pitch - scroll - above to i * pitch - scroll + below, the view from 0
    // to view_h, both relative to the rows' top.
    int const first = std::max(0, floor_div(_scroll - below, pitch) + 1);
    int const end = std::max(first, ceil_div(_scroll + view_h + above, pitch));
    return SRowSpan{std::min(count, static_cast<unsigned int>(first)),
                    std::min(count, static_cast<unsigned int>(end))};
}

// An icon takes a square cell of the row's height at its left, centred in it; the columns follow,
// each text starting at its column and cut only by the rows' clip. The line spacing of -3 pulls the
// lines of a multi-line text together.
void CListBox::draw_row(CItem const &_item, int _y, int _item_h, CFont *_p_font) {
    int x = m_left_margin;
    if (CMaterial *p_icon = _item.get_icon()) {
        int const d = _item_h / 2 - m_item_icon_size / 2;
        m_canvas.draw_rect(d + m_left_margin, d + _y, m_item_icon_size, m_item_icon_size, p_icon);
        x += _item_h;
    }
    if (!_p_font) return; // a window without fonts draws no text, and says nothing about it
    unsigned int const columns =
        std::min(static_cast<unsigned int>(m_columns.size()), _item.get_strings_number());
    for (unsigned int j = 0; j < columns; ++j) {
        m_canvas.text_out(x, _y, -3, _item.get_string(j), _p_font);
        x += m_columns[j].m_w + m_columns_dw;
    }
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

// The rows go through this window, so their texts are kept as local strings' keys and their icons
// are made by its desktop. Columns, titles and widths belong to code and aren't kept.
void CListBox::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
    LuaPlus::LuaObject items;
    items.AssignNewTable(_lo_table.GetState());
    m_items.save_state(items, this);
    _lo_table.SetObject("items", items);
    _lo_table.SetBoolean("show_columns", m_show_columns);
    _lo_table.SetNumber("columns_h", m_columns_h);
    _lo_table.SetNumber("columns_dw", m_columns_dw);
    _lo_table.SetNumber("custom_item_height", m_custom_item_height);
    _lo_table.SetNumber("item_icon_size", m_item_icon_size);
    _lo_table.SetBoolean("allow_check_items", m_allow_check_items);
    _lo_table.SetNumber("item_spacing", m_item_spacing);
}

// "items" that isn't a table leaves the rows as they are; a table replaces them all, and the marks
// with them. The new look takes effect at once: the list lays itself out again.
void CListBox::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    LuaPlus::LuaObject items = _lo_table.GetByName("items");
    if (items.IsTable()) m_items.load_state(items, this);
    read_bool(_lo_table, "show_columns", m_show_columns);
    read_int(_lo_table, "columns_h", m_columns_h);
    read_int(_lo_table, "columns_dw", m_columns_dw);
    read_int(_lo_table, "custom_item_height", m_custom_item_height);
    read_int(_lo_table, "item_icon_size", m_item_icon_size);
    read_bool(_lo_table, "allow_check_items", m_allow_check_items);
    read_int(_lo_table, "item_spacing", m_item_spacing);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

} // namespace qorui
