// A drop-down list: the text of the chosen row, and a list box that opens below it.
//
//   CDropDownList   closed, it shows its text; a click opens the list box "list_box" under it, and
//                   a click on a row chooses that row, shows its column 0 and closes the list. A
//                   click on the control again, or elsewhere, closes the list without a choice
//
// The choice is the list's checked row. The control sends itself EVENT_CHANGED when the choice
// changes, for its owner's callbacks; the rows are filled through get_items() and kept in layouts
// by the child "list_box".
#pragma once
#include "ui_text.h"
#include "ui_window_visual.h"

namespace qorui {

class CItems;
class CListBox;

// The text of the chosen row over a list box that opens below it; EVENT_CHANGED on a new choice.
class CDropDownList : public CWindowVisual {
public:
    // Closed, with the list passive, so that a press in the open list keeps the control active.
    CDropDownList(CDesktop *_p_desktop, char const *_name);
    // The list goes with the window tree.
    virtual ~CDropDownList();

    QOR_CLASS_ID(CDropDownList, CWindowVisual, "DropDownList")

    // Behind the visual window's keys: "text" (the first line), "offset", "left_border_offset",
    // "right_border_offset" and "max_list_box_height"; the rows are the child's.
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    // "text" is appended to the text there is, as a line of its own.
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;

    // Rows and choice

    // The rows of the list box; the checked row is the choice.
    CItems &get_items();
    // Chooses row _idx as a click on it would, without opening or closing the list: the text
    // becomes the row's column 0 and EVENT_CHANGED goes out. Choosing the chosen row does nothing.
    void check(unsigned int _idx);
    // What the closed control shows: the chosen row's column 0, or what a layout gave it.
    CText const &get_text() const { return m_text; }
    // What the closed control shows until a row is chosen; no event goes out.
    void set_text(CText const &_text) { m_text = _text; }
    // The list box, a child of the control.
    CListBox *get_list_box() { return mp_list_box; }

    // Placement of the open list, in pixels relative to the control: _offset below its lower
    // edge; the left edge at _left, the right edge _right beyond the control's right edge.
    // edge; the left edge at _left, the right edge _right beyond the control's right edge. Each
    // lays the control out again.
    // @{
    void offset_list_box(int _offset);
    void offset_list_box_borders(int _left, int _right);
    // @}

protected:
    // Behind the visual window's: the text at the client corner, in the disabled font when the
    // control is disabled and has one, else the default font.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Closes the list: a click elsewhere took the activation away.
    virtual void on_event_deactivate(CWndEvent const *_p_event) override;
    // Behind the visual window's: places the list below the control, as high as its rows or the
    // maximum height.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // Scrolls the open list; a closed one is left alone.
    virtual void on_event_wheel_rotated(CWndEvent const *_p_event) override;
    // Opens the list, laid out anew for its rows, or closes an open one without a choice.
    virtual void on_event_click(CWndEvent const *_p_event) override;

    // The list's own events, as its callbacks: a click in the list closes it (behind the list's
    // own handling, so a row is chosen already); a row checked becomes the choice.
    // @{
    virtual void on_event_list_box_click(CWndEvent const *_p_event);
    virtual void on_event_list_box_checked(CWndEvent const *_p_event);
    // @}

    CText m_text;              // what the closed control shows
    CListBox *mp_list_box;     // child "list_box"
    int m_max_list_box_height; // pixels; 0: as high as the rows
    int m_list_box_h;          // the open list's height as last laid out
    int m_offset;              // from the control's lower edge down to the list
    int m_left_border_offset;  // the list's left edge, from the control's left edge
    int m_right_border_offset; // the list's right edge, beyond the control's right edge

private:
    // The text becomes the checked row's column 0, and EVENT_CHANGED goes to the control.
    void show_checked_row();
    // Hides the list and forgets the row under the pointer.
    void close_list();
};

} // namespace qorui
