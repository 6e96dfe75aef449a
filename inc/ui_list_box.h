// The list box: the rows of a CItems list in columns, under an optional header, with optional
// icons and a vertical scroll bar that shows itself when the rows overflow the view.
//
//   marks     the selected row is the row under the pointer, the checked row the last clicked one;
//             both are the indices of the model, got through get_items()
//   events    EVENT_HIGHLIGHTED when the row under the pointer changes, EVENT_CHECKED when a click
//             checks a row; both go to the list box itself, for its owner's callbacks
//   input     the wheel and the keys Up, Down, Page Up, Page Down, Home and End scroll the view
//   layout    "items" (the rows' Lua form) and the look of the rows; titles and widths of the
//             columns are set up by code
//
// Rows added through get_items() show from the next update on. Per frame the list costs what its
// visible rows cost, whatever their number.
#pragma once
#include "ui_items.h"
#include "ui_string.h"
#include "ui_window_visual.h"

namespace qorui {

class CScrollBar;

// Rows of a CItems list in columns under an optional header, with a scroll bar when they overflow.
class CListBox : public CWindowVisual {
public:
    // Margins of 4, one column without title or width, and a hidden vertical scroll bar as the child
    // "scroll bar vert". The bar is as wide as a layout or the owner makes it.
    CListBox(CDesktop *_p_desktop, char const *_name);
    // The rows go with the list; the bar goes with the window tree.
    virtual ~CListBox();

    QOR_CLASS_ID(CListBox, CWindowVisual, "ListBox")

    // Behind the visual window's keys: "items", "show_columns", "columns_h", "columns_dw",
    // "custom_item_height", "item_icon_size", "allow_check_items" and "item_spacing". Columns
    // and marks aren't saved.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // Rows

    // The rows and their marks: selected is the row under the pointer, checked the last clicked.
    CItems &get_items() { return m_items; }
    // The height of every row: the custom height if it is above 0, else the lines of the tallest
    // column text of all rows (at least one) in the default font.
    int get_item_height();
    // The custom row height in pixels; 0 or less: from the content. Lays out again.
    void set_item_height(int _h);
    // The side of the icons' squares in pixels (16 by default). Lays out again.
    void set_item_icon_size(int _size);

    // Columns and header. A column has no width until one is set; the header is hidden until shown.

    // Appends a column without title or width and lays out again; result its index.
    unsigned int add_column();
    // The width of column _idx in pixels, which must exist; lays out again.
    void set_column_w(unsigned int _idx, int _w);
    // The header title of column _idx, which must exist. Sends nothing: a title changes no
    // layout.
    void set_column_title(unsigned int _idx, CString const &_title);
    // The header's height below the top margin in pixels (20 by default). Lays out again.
    void set_columns_h(int _h);
    // Shows or hides the header. Lays out again.
    void show_columns(bool _show);

    // The right margin, with the scroll bar's width added while the bar is shown.
    int get_right_margin() const;
    // The vertical scroll bar, a child of the list; its position is in pixels.
    CScrollBar *get_scroll_bar_vert() { return mp_scroll_bar_vert; }

protected:
    // Behind the visual window's: shows the bar when the rows overflow the view, hides it when
    // they don't.
    virtual void on_event_update(CWndEvent const *_p_event) override;
    // Behind the visual window's: the header, the selected and checked marks
    // (MAT_NAME_SELECTION, MAT_NAME_CHECKED), then the visible rows with their icons, the
    // checked row in FNT_NAME_CHECKED where the list has it.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Behind the visual window's: the bar's range, and the bar at the right edge below the header.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // Selects the row under the pointer and sends EVENT_HIGHLIGHTED to the list when it changed.
    virtual void on_event_pointer_pos(CWndEvent const *_p_event) override;
    // Selects nothing.
    virtual void on_event_pointer_exit(CWndEvent const *_p_event) override;
    // One row up (wheel away from the user) or down.
    virtual void on_event_wheel_rotated(CWndEvent const *_p_event) override;
    // Checks the selected row and sends EVENT_CHECKED to the list; the checked row again does
    // nothing.
    virtual void on_event_click(CWndEvent const *_p_event) override;
    // Up and Down scroll one row, Page Up and Page Down one view, Home and End to the ends; those
    // keys go no further, others pass on.
    virtual void on_event_key_down(CWndEvent const *_p_event) override;

private:
    struct SColumn {
        CString m_title;
        int m_w; // pixels
    };
    // The rows that the view shows, from m_first up to m_end, and what drawing them needs.
    struct SRowSpan;

    // Layout
    // Stores a value that the layout depends on and lays the list out again.
    template <class TValue>
    void relayout(TValue &_field, TValue _value);
    int get_header_h() const { return m_show_columns ? m_columns_h : 0; }
    int get_rows_top() const { return m_top_margin + get_header_h(); }
    int get_row_pitch() { return get_item_height() + m_item_spacing; }
    int get_scroll() const;
    int get_max_lines();
    // Shows the bar with the range of the rows that don't fit, or hides it when they all do.
    void check_scroll_bars();
    void send_scroll_step(EEventType _id, int _direction);

    // Drawing
    void draw_body(CWndEvent const *_p_event);
    void draw_header(CFont *_p_font);
    void draw_marks(int _y0, int _item_h, int _scroll);
    void draw_mark(int _idx, int _y0, int _w, int _item_h, int _scroll, CMaterial *_p_material);
    void draw_rows(int _y0, int _item_h, int _scroll, CFont *_p_font);
    SRowSpan get_visible_rows(int _y0, int _item_h, int _scroll, CFont *_p_font, CFont *_p_checked_font);
    void draw_row(CItem const &_item, int _y, int _item_h, CFont *_p_font);

    // Look of the rows, saved in layouts
    bool m_show_columns;
    int m_columns_h;          // header height below the top margin, pixels
    int m_columns_dw;         // gap between columns, pixels
    int m_custom_item_height; // row height in pixels; 0 or less: from the content
    int m_item_icon_size;     // side of the icons' squares, pixels
    int m_item_spacing;       // gap between rows, pixels
    bool m_allow_check_items; // the checked row is drawn as such

    // Rows and columns
    CItems m_items;
    qor_vector<SColumn> m_columns;
    CScrollBar *mp_scroll_bar_vert; // child "scroll bar vert"

    // The lines of the tallest row, as last worked out, and the revision of the rows it holds for.
    int m_max_lines;
    unsigned int m_max_lines_revision;
};

} // namespace qorui
