// The page control: a tabbed container. Each page is a plain visual window, each tab a button with
// the page's name, both children of the control; exactly one page is shown at a time and its tab
// stands checked.
//
//   pages           add_page, set_active_page, get_active_page
//   tab strip       orientation, alignment, intervals, the size of new tabs
//   listening       the control follows its pages' show, enable and disable events and its tabs'
//                   clicks, whoever sent them, so every way of showing a page is a switch
//   layout          tabs in a row above the pages, or in a column left of them
//   persistence     no keys of its own; pages and tabs that a layout makes are taken over
//
// A page and its tab share a name, and so a HUID: that is how an event from either is traced back
// to the index.
#pragma once
#include "ui_window_visual.h"

namespace qorui {

class CButton;

// Tabbed pages: one page shown at a time, its tab button checked.
class CPageControl : public CWindowVisual {
public:
    // Where the tabs stand.
    enum ETabsOrientation : int32_t {
        TABS_HORIZONTAL = 0, // tabs in a row above the pages
        TABS_VERTICAL = 1    // tabs in a column left of the pages
    };

    // No pages; horizontal tabs of 64 by 32 pixels, 8 pixels apart and 8 above the pages.
    CPageControl(CDesktop *_p_desktop, char const *_name);
    // Pages and tabs go with the window tree.
    virtual ~CPageControl();

    QOR_CLASS_ID(CPageControl, CWindowVisual, "PageControl")

    // The visual window's keys only; loading then takes over the pages and tabs that the layout
    // made, pairing each new tab with the first unknown page of its name.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}
    // A page or tab that leaves the control takes its partner out of the control's care.
    virtual void detach_child(CWindow *_p_child) override;

    // Pages
    // A new hidden page with its tab; the first page added, or the first after the active page was
    // disabled, becomes active.
    CWindowVisual *add_page(char const *_name);
    // Shows page _idx, hides the others and activates the page with its children. An index outside
    // the pages is reported and changes nothing.
    void set_active_page(int _idx);
    // Null while no page is shown.
    CWindowVisual *get_active_page();

    // Tab strip: each setter lays the control out anew.

    // A row of tabs above the pages, or a column left of them.
    void set_tabs_orientation(ETabsOrientation _orientation);
    // Only ALIGNMENT_BOTTOM of vertical tabs has an effect: the column stands at the bottom.
    void set_tabs_alignment(EAlignment _alignment);
    // The space between two tabs in pixels.
    void set_tabs_interval(int _interval);
    // The space between the tabs and the pages in pixels.
    void set_tabs_pages_interval(int _interval);
    // For tabs added later; the existing tabs keep their size, and the next layout places the
    // pages by the new size.
    void set_tab_size(int _w, int _h);

protected:
    // Behind the visual window's: the tabs in their row or column inside the margins, every page
    // on the room left beside them.
    virtual void on_event_resized(CWndEvent const *_p_event) override;

    // Callbacks on the tabs and pages; each finds its page by the event's receiver.

    // A click on a tab makes its page active.
    virtual void on_event_tab_click(CWndEvent const *_p_event);
    // A page was shown, by whomever: it becomes the active page, the others are hidden and their
    // tabs unchecked, its tab checked.
    virtual void on_event_page_show(CWndEvent const *_p_event);
    // A page was hidden: nothing.
    virtual void on_event_page_hide(CWndEvent const *_p_event);
    // A page was enabled: its tab is enabled; the page stays hidden until shown.
    virtual void on_event_page_enable(CWndEvent const *_p_event);
    // A page was disabled: its tab is disabled, and an active page is hidden with no other taking
    // its place.
    virtual void on_event_page_disable(CWndEvent const *_p_event);

    // The first page with that id; -1, reported, for none.
    int get_page_idx(HUID const &_id);
    // Every page but _keep is hidden and its tab unchecked, in index order.
    void _deactivate_pages(int _keep);

    qor_vector<CWindowVisual *> m_pages; // children, owned by the tree
    qor_vector<CButton *> m_tabs;        // children, owned by the tree; tab i belongs to page i
    int m_active_page_idx;               // -1 for none
    int m_tab_w;                         // pixels, for tabs added later
    int m_tab_h;                         // pixels
    int m_tabs_interval;                 // pixels between two tabs
    int m_tabs_pages_interval;           // pixels between the tabs and the pages
    ETabsOrientation m_tabs_orientation; // a row or a column of tabs
    EAlignment m_tabs_alignment;         // ALIGNMENT_BOTTOM puts a column at the bottom

private:
    void adopt(CWindowVisual *_p_page, CButton *_p_tab);
    void adopt_layout_children();
    CWindowVisual *find_unadopted_page(HUID const &_id);
    int page_idx_of_receiver(CWndEvent const *_p_event);
    CButton *tab_at(int _idx);
    template <class T>
    void store_and_lay_out(T &_setting, T _value);
    void place_tabs(int _x, int _y, bool _in_a_row);
    void place_pages(int _x, int _y, int _w, int _h);
};

} // namespace qorui
