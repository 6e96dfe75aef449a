// The page control: pages and their tabs, the switch between pages from whatever source, the
// layout of the tab strip and the pages, and the pages and tabs that a layout makes.
#include "ui_page_control.h"
#include "ui_button.h"
#include "ui_debug.h"
#include "ui_material.h"

#include <algorithm>

namespace qorui {

namespace {

CWindowRegistrar<CPageControl> const s_registrar("PageControl");

// The built-in look of a tab, the colours of a dialog's buttons.
struct STabLook {
    HUID const &m_id;
    rgba_t m_color;
};

STabLook const k_tab_looks[] = {
    {MAT_NAME_NORMAL, rgba_t(52, 52, 52, 100)},
    {MAT_NAME_HIGHLIGHTED, rgba_t(125, 125, 125, 200)},
    {MAT_NAME_PUSHED, rgba_t(125, 125, 125, 120)},
    {MAT_NAME_CHECKED, rgba_t(125, 125, 125, 120)},
};

template <class T>
bool holds(qor_vector<T *> const &_windows, CWindow const *_p_wnd) {
    return std::find(_windows.begin(), _windows.end(), _p_wnd) != _windows.end();
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

CPageControl::CPageControl(CDesktop *_p_desktop, char const *_name)
    : CWindowVisual(_p_desktop, _name), m_active_page_idx(-1), m_tab_w(64), m_tab_h(32), m_tabs_interval(8),
      m_tabs_pages_interval(8), m_tabs_orientation(TABS_HORIZONTAL), m_tabs_alignment(ALIGNMENT_LEFT) {}

// The destructor stays in the library, so that a program that builds a page control can't lend it
// its own deletion.
CPageControl::~CPageControl() {}

// ---------------------------------------------------------------------------------------------
// Pages
// ---------------------------------------------------------------------------------------------

// The page is hidden and the control laid out before the first page becomes active, so that the
// first page shows through the same switch as every later one.
CWindowVisual *CPageControl::add_page(char const *_name) {
    CWindowVisual *p_page = new CWindowVisual(mp_desktop, _name);
    attach_child(p_page);
    CButton *p_tab = new CButton(mp_desktop, _name);
    attach_child(p_tab);
    p_tab->set_size(m_tab_w, m_tab_h);
    p_tab->m_text = CString(_name, -1);
    adopt(p_page, p_tab);
    send_event(p_page, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    if (m_active_page_idx == -1) set_active_page(0);
    return p_page;
}

// The pair joins the control: the page with its normal slot (empty unless it has a material
// there) and the control's callbacks, the tab with its click callback and the built-in look for
// every state that it has no material of.
void CPageControl::adopt(CWindowVisual *_p_page, CButton *_p_tab) {
    m_pages.push_back(_p_page);
    if (!_p_page->get_material(MAT_NAME_NORMAL)) _p_page->add_material(MAT_NAME_NORMAL, nullptr);
    _p_page->register_callback(EVENT_SHOW, CEventCallback(this, &CPageControl::on_event_page_show));
    _p_page->register_callback(EVENT_HIDE, CEventCallback(this, &CPageControl::on_event_page_hide));
    _p_page->register_callback(EVENT_ENABLE, CEventCallback(this, &CPageControl::on_event_page_enable));
    _p_page->register_callback(EVENT_DISABLE, CEventCallback(this, &CPageControl::on_event_page_disable));
    m_tabs.push_back(_p_tab);
    _p_tab->register_callback(EVENT_CLICK, CEventCallback(this, &CPageControl::on_event_tab_click));
    for (STabLook const &look : k_tab_looks)
        if (!_p_tab->get_material(look.m_id))
            _p_tab->add_material(look.m_id, create_color_material(mp_desktop, look.m_color));
}

// The page's show event does the rest of the switch, whoever sends it; then the page and
// everything in it are activated.
void CPageControl::set_active_page(int _idx) {
    if (!QOR_CHECK(m_pages.size() == m_tabs.size())) return;
    if (!QOR_CHECK(_idx >= 0 && _idx < (int)m_pages.size())) return;
    m_active_page_idx = _idx;
    send_event(m_pages[_idx], EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    send_event(m_pages[_idx], EVENT_ACTIVATE, CWndEvent::DISPATCH_CHILDREN);
}

CWindowVisual *CPageControl::get_active_page() {
    if (m_active_page_idx < 0) return nullptr;
    if (!QOR_CHECK(m_active_page_idx >= 0 && m_active_page_idx < (int)m_pages.size())) return nullptr;
    return m_pages[m_active_page_idx];
}

int CPageControl::get_page_idx(HUID const &_id) {
    int idx = -1;
    for (size_t i = 0; i < m_pages.size() && idx == -1; ++i)
        if (m_pages[i] && m_pages[i]->get_id() == _id) idx = static_cast<int>(i);
    QOR_CHECK(idx != -1);
    return idx;
}

// Hidden, not deactivated: the other pages keep whatever activation their windows had.
void CPageControl::_deactivate_pages(int _keep) {
    if (!QOR_CHECK(m_pages.size() == m_tabs.size())) return;
    for (int i = 0; i < (int)m_pages.size(); ++i) {
        if (i == _keep) continue;
        if (CButton *p_tab = tab_at(i)) p_tab->set_checked(false);
        send_event(m_pages[i], EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    }
}

// Tab _idx of a page index; null, reported, if the pairs are out of step or the entry is empty.
CButton *CPageControl::tab_at(int _idx) {
    if (!QOR_CHECK(m_pages.size() == m_tabs.size())) return nullptr;
    CButton *p_tab = m_tabs[_idx];
    QOR_CHECK(p_tab);
    return p_tab;
}

// A page or tab that goes (deleted, or detached to hang elsewhere) would leave a dangling entry:
// the pair is forgotten, and the partner, which has nothing left to switch, is hidden. The
// partner's callbacks stay registered and would report an unknown page if it were shown again.
void CPageControl::detach_child(CWindow *_p_child) {
    CWindowVisual::detach_child(_p_child);
    for (size_t i = 0; i < m_pages.size() && i < m_tabs.size(); ++i) {
        if (m_pages[i] != _p_child && m_tabs[i] != _p_child) continue;
        CWindow *p_partner = m_pages[i] == _p_child ? static_cast<CWindow *>(m_tabs[i]) : m_pages[i];
        m_pages.erase(m_pages.begin() + i);
        m_tabs.erase(m_tabs.begin() + i);
        int const idx = static_cast<int>(i);
        if (m_active_page_idx == idx)
            m_active_page_idx = -1;
        else if (m_active_page_idx > idx)
            --m_active_page_idx;
        if (p_partner) send_event(p_partner, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
        send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
        return;
    }
}

// ---------------------------------------------------------------------------------------------
// Tab strip settings
// ---------------------------------------------------------------------------------------------

// Every setting of the strip but the size of new tabs takes effect at once.
template <class T>
void CPageControl::store_and_lay_out(T &_setting, T _value) {
    _setting = _value;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
}

void CPageControl::set_tabs_orientation(ETabsOrientation _orientation) {
    store_and_lay_out(m_tabs_orientation, _orientation);
}

void CPageControl::set_tabs_alignment(EAlignment _alignment) {
    store_and_lay_out(m_tabs_alignment, _alignment);
}

void CPageControl::set_tabs_interval(int _interval) {
    store_and_lay_out(m_tabs_interval, _interval);
}

void CPageControl::set_tabs_pages_interval(int _interval) {
    store_and_lay_out(m_tabs_pages_interval, _interval);
}

void CPageControl::set_tab_size(int _w, int _h) {
    m_tab_w = _w;
    m_tab_h = _h;
}

// ---------------------------------------------------------------------------------------------
// Callbacks on the tabs and pages
// ---------------------------------------------------------------------------------------------

// The index of the page that the event's receiver, a page or its tab, belongs to; -1 for none.
int CPageControl::page_idx_of_receiver(CWndEvent const *_p_event) {
    if (!QOR_CHECK(_p_event && _p_event->get_receiver())) return -1;
    return get_page_idx(_p_event->get_receiver()->get_id());
}

void CPageControl::on_event_tab_click(CWndEvent const *_p_event) {
    int const idx = page_idx_of_receiver(_p_event);
    if (idx != -1) set_active_page(idx);
}

void CPageControl::on_event_page_show(CWndEvent const *_p_event) {
    int const idx = page_idx_of_receiver(_p_event);
    if (idx == -1) return;
    CButton *p_tab = tab_at(idx);
    if (!p_tab) return;
    m_active_page_idx = idx;
    _deactivate_pages(idx);
    p_tab->set_checked(true);
}

void CPageControl::on_event_page_hide(CWndEvent const *) {}

// The tab only: an enabled page stays hidden until it is shown or its tab is clicked.
void CPageControl::on_event_page_enable(CWndEvent const *_p_event) {
    int const idx = page_idx_of_receiver(_p_event);
    if (idx == -1) return;
    if (CButton *p_tab = tab_at(idx)) send_event(p_tab, EVENT_ENABLE, CWndEvent::DISPATCH_NONE);
}

// A disabled active page goes and no other takes its place.
void CPageControl::on_event_page_disable(CWndEvent const *_p_event) {
    int const idx = page_idx_of_receiver(_p_event);
    if (idx == -1) return;
    CButton *p_tab = tab_at(idx);
    if (!p_tab) return;
    if (idx == m_active_page_idx) {
        send_event(m_pages[idx], EVENT_HIDE, CWndEvent::DISPATCH_NONE);
        m_active_page_idx = -1;
    }
    send_event(p_tab, EVENT_DISABLE, CWndEvent::DISPATCH_NONE);
}

// ---------------------------------------------------------------------------------------------
// Layout
// ---------------------------------------------------------------------------------------------

// Horizontal tabs stand in a row at the top left of the client area, vertical tabs in a column at
// its left, at the top or, aligned to the bottom, ending at the bottom margin. The pages fill the
// rest, measured from the size given to new tabs, not from the tabs' own sizes.
void CPageControl::on_event_resized(CWndEvent const *_p_event) {
    CWindowVisual::on_event_resized(_p_event);
    int const w = get_w(), h = get_h(), n = (int)m_pages.size();
    if (m_tabs_orientation == TABS_HORIZONTAL) {
        place_tabs(m_left_margin, m_top_margin, true);
        int const page_y = m_top_margin + m_tab_h + m_tabs_pages_interval;
        place_pages(m_left_margin, page_y, w - m_left_margin - m_right_margin, h - m_bottom_margin - page_y);
    } else if (m_tabs_orientation == TABS_VERTICAL) {
        int const y = m_tabs_alignment == ALIGNMENT_BOTTOM
                          ? h - (m_tab_h + m_tabs_interval) * n - m_bottom_margin
                          : m_top_margin;
        place_tabs(m_left_margin, y, false);
        int const page_x = m_left_margin + m_tab_w + m_tabs_pages_interval;
        place_pages(page_x, m_top_margin, w - m_right_margin - page_x, h - m_top_margin - m_bottom_margin);
    }
}

// Each tab moves the next one on by its own width in a row, its own height in a column, and the
// interval.
void CPageControl::place_tabs(int _x, int _y, bool _in_a_row) {
    for (CButton *p_tab : m_tabs) {
        if (!QOR_CHECK(p_tab)) continue;
        p_tab->set_pos(_x, _y);
        if (_in_a_row)
            _x += p_tab->get_w() + m_tabs_interval;
        else
            _y += p_tab->get_h() + m_tabs_interval;
    }
}

void CPageControl::place_pages(int _x, int _y, int _w, int _h) {
    for (CWindowVisual *p_page : m_pages) {
        if (!QOR_CHECK(p_page)) continue;
        p_page->set_pos(_x, _y);
        p_page->set_size(_w, _h);
    }
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

// The control has no keys of its own: its pages and tabs are children that carry their own state,
// and the tab strip's settings belong to the code that makes the control.
void CPageControl::save_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::save_state(_lo_table);
}

void CPageControl::load_state(LuaPlus::LuaObject &_lo_table) {
    CWindowVisual::load_state(_lo_table);
    adopt_layout_children();
}

// A layout makes pages and tabs through the factory, as plain children, and add_page never runs
// for them: without this, a control loaded into an empty tree would know no pages, its tabs would
// switch nothing and every page would stay shown. So each button child that the control doesn't
// know yet is paired with the first unknown page of its name and taken over as add_page would
// have made the pair. The tabs give the order: they are passive and keep their place among the
// children, while a page moves to the front whenever something in it is activated. Then the
// control lays itself out and shows one page, the active one, or else the first, as add_page does.
void CPageControl::adopt_layout_children() {
    size_t const known = m_pages.size();
    for (unsigned int i = 0; i < get_children_count(); ++i) {
        CButton *p_tab = class_cast<CButton>(get_child(i));
        if (!p_tab || holds(m_tabs, p_tab)) continue;
        if (CWindowVisual *p_page = find_unadopted_page(p_tab->get_id())) adopt(p_page, p_tab);
    }
    if (m_pages.size() == known) return;
    send_event(this, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);
    if (m_active_page_idx == -1)
        set_active_page(0);
    else
        _deactivate_pages(m_active_page_idx);
}

// A page is a visual window of no class derived from it, as add_page makes them.
CWindowVisual *CPageControl::find_unadopted_page(HUID const &_id) {
    for (unsigned int i = 0; i < get_children_count(); ++i) {
        CWindowVisual *p_page = class_cast<CWindowVisual>(get_child(i));
        if (p_page && p_page->get_class_id() == p_page->CWindowVisual::get_class_id() &&
            p_page->get_id() == _id && !holds(m_pages, p_page))
            return p_page;
    }
    return nullptr;
}

} // namespace qorui
