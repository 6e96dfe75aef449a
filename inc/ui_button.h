// Buttons: windows that a click acts on, each with one string.
//
//   CButton        a push button; its caption stands centred over the material of its state and
//                  sinks by one pixel while it is pressed under the pointer or checked
//   CCheckBox      a checker picture with a label beside it; a click toggles the checked state
//   CRadioButton   a check box whose group is every radio button among its parent's children
//
// The pointer states (highlighted, pushed) and the checked state are those of the visual window;
// a click is EVENT_CLICK from the desktop, on which owners register their callbacks.
#pragma once
#include "ui_string.h"
#include "ui_window_visual.h"

namespace qorui {

// A push button: its caption centred over the material of its state; a click is EVENT_CLICK.
class CButton : public CWindowVisual {
public:
    // Passive: a press on the button activates the window that holds it.
    CButton(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CButton();

    QOR_CLASS_ID(CButton, CWindowVisual, "Button")

    // Behind the visual window's keys: "text", the caption (a local string key where there is one).
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // The part of a control that wears the desktop's look for it: a clone of each of the desktop's
    // materials _normal, _highlighted and _pushed becomes the button's own normal, highlighted and
    // pushed material, so the desktop's can change or go. One the desktop lacks is left out.
    void dress_from_desktop(HUID const &_normal, HUID const &_highlighted, HUID const &_pushed);

    // The caption; owners assign it directly.
    CString m_text;

protected:
    // Behind the visual window's: the caption centred, in the font of the state, one pixel lower
    // while pressed under the pointer or checked.
    virtual void on_event_draw(CWndEvent const *_p_event) override;

private:
    CFont *choose_font();
};

// A checker picture with a label beside it; a click toggles the checked state.
class CCheckBox : public CWindowVisual {
public:
    // A 16 by 16 checker; not passive, so a check box can be the active window.
    CCheckBox(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CCheckBox();

    QOR_CLASS_ID(CCheckBox, CWindowVisual, "CheckBox")

    // Behind the visual window's keys: "checker_w" and "checker_h" (loaded only when integers).
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // The size of the checker picture in pixels; setting it lays out again.
    // @{
    void set_checker_size(int _w, int _h);
    int get_checker_w() const { return m_checker_w; }
    int get_checker_h() const { return m_checker_h; }
    // @}

    // The label, drawn right of the checker; owners assign it directly, and layouts don't keep it.
    CString m_text;

protected:
    // The body never highlighted; the checker picture of the checked and disabled state (or the
    // highlighted material under the pointer) centred at the left; the label right of it in the
    // default font.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // Behind the visual window's: the highlight shows again.
    virtual void on_event_pointer_enter(CWndEvent const *_p_event) override;
    // Toggles the checked state and sends EVENT_CHECKED or EVENT_UNCHECKED to the box itself.
    virtual void on_event_click(CWndEvent const *_p_event) override;

    // The checker picture's size in pixels.
    // @{
    int m_checker_w;
    int m_checker_h;
    // @}
    // Set by a click, cleared when the pointer comes in again: while set, the highlight picture
    // stays off, so the new state shows at once under the pointer.
    bool m_just_clicked;

private:
    CMaterial *choose_checker_material();
};

// A check box whose group is every radio button among its parent's children.
class CRadioButton : public CCheckBox {
public:
    // A check box: 16 by 16 checker, not passive.
    CRadioButton(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CRadioButton();

    QOR_CLASS_ID(CRadioButton, CCheckBox, "RadioButton")

protected:
    // Turns this button on and every other radio button of the same parent off; sends nothing.
    virtual void on_event_click(CWndEvent const *_p_event) override;
};

} // namespace qorui
