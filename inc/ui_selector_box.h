// A selector box: one row of a list, shown between two square step buttons.
//
//   CSelectorBox   the selected row of its CItems (icon cell and column 0) between a left button
//                  that steps back and a right button that steps on; stepping stops at either end
//
// The box sends no event of its own when its row changes: an owner reads get_items(), or, to hear
// of each step, registers on EVENT_CLICK of a step button, behind the box's own callback.
#pragma once
#include "ui_items.h"
#include "ui_window_visual.h"

namespace qorui {

class CButton;

// One row of a CItems list between two step buttons that step back and on.
class CSelectorBox : public CWindowVisual {
public:
    // Makes the two buttons as children, dressed in the desktop's left and right button materials.
    CSelectorBox(CDesktop *_p_desktop, char const *_name);
    // The rows go with the box, the buttons with the window tree.
    virtual ~CSelectorBox();

    QOR_CLASS_ID(CSelectorBox, CWindowVisual, "SelectorBox")

    // Behind the visual window's keys: the rows under "items"; sizes and the selection aren't
    // saved.
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    // Rows come from the key "items" when it is a table, and then none is selected; without it the
    // rows and the selection stay.
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;

    // The rows. Callers fill and select them directly; the box draws what it finds.
    CItems &get_items() { return m_items; }

    // The row's height in pixels; 0 or less stands for the height of the default font.
    int get_item_height();
    // The row's height and the side of the icon's square, in pixels. Both are read at the next
    // draw: nothing else changes.
    // @{
    void set_item_height(int _height) { m_item_height = _height; }
    void set_item_icon_size(int _size) { m_item_icon_size = _size; }
    // @}

    // The step buttons, children of the box: back ("left button") and on ("right button").
    // @{
    CButton *get_left_button() { return mp_left_button; }
    CButton *get_right_button() { return mp_right_button; }
    // @}

protected:
    // Behind the visual window's: the selected row between the buttons, its icon in a square
    // cell at the left and column 0 behind it, in the default font; nothing without a selection.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Behind the visual window's: the buttons square, as high as the box, one at each end.
    virtual void on_event_resized(CWndEvent const *_p_event) override;

    // The step buttons' clicks: the previous or the next row, stopping at either end.
    // @{
    virtual void on_event_button_left_click(CWndEvent const *_p_event);
    virtual void on_event_button_right_click(CWndEvent const *_p_event);
    // @}

    // The room left of and right of the row: a button's width and the window's margin on that side.
    // @{
    int get_left_margin() const;
    int get_right_margin() const;
    // @}

    CItems m_items;           // the rows and the selection shown
    int m_item_height;        // pixels; 0 or less: the default font's height
    int m_item_icon_size;     // side of the icon, pixels
    CButton *mp_left_button;  // child "left button"
    CButton *mp_right_button; // child "right button"
};

} // namespace qorui
