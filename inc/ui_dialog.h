// Dialogs: movable, resizable windows with a caption and a row or column of buttons at their foot.
//
//   CBorder        an invisible strip along one edge of its parent; dragging it resizes the
//                  parent, and a grab near one of its ends acts on two edges, as a corner
//   CDialog        caption, buttons that it makes and lays out itself, and a border on each edge
//   CListDialog    a dialog with a list box between the caption and the buttons
//   CMessageBox    a modal dialog with a text centred in it
//
// A dialog reports nothing of its buttons: the owner registers its callbacks for EVENT_CLICK on
// the buttons that add_button gave back.
#pragma once
#include "qor_memory.h"
#include "ui_string.h"
#include "ui_text.h"
#include "ui_window_visual.h"

namespace qorui {

class CButton;
class CListBox;

// Bit flags: one names the edge of a border, several make up what a drag moves.
enum EBorderType : int {
    BORDER_LEFT = 1,   // "BORDER_LEFT" in layouts
    BORDER_RIGHT = 2,  // "BORDER_RIGHT"
    BORDER_TOP = 4,    // "BORDER_TOP"
    BORDER_BOTTOM = 8, // "BORDER_BOTTOM"
    BORDERS_ALL = 15   // "BORDERS_ALL": every edge
};

// An invisible strip along one edge of its parent; dragging it resizes the parent.
class CBorder : public CWindowVisual {
public:
    // A left border 8 pixels thick that can be dragged; its normal material slot is empty, so it
    // draws nothing unless a layout gives it a material.
    CBorder(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CBorder();

    QOR_CLASS_ID(CBorder, CWindowVisual, "Border")

    // Passive, and follows its parent's edge from then on. A border must have a parent, and
    // stays with it: it is destroyed with the parent, never detached from it.
    // @{
    virtual void on_attached() override;
    virtual void on_detached() override;
    // @}

    // Behind the visual window's keys: "border_size" and "type" (the edge's name).
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // The thickness in pixels; setting it places the border again.
    // @{
    void set_border_size(int _size);
    int get_border_size() const { return m_border_size; }
    // @}
    // The edge the border lies along; setting it moves nothing until the parent's next resize.
    // @{
    void set_border_type(EBorderType _type) { m_border_type = _type; }
    EBorderType get_border_type() const { return m_border_type; }
    // @}
    // The edges that the running drag moves; 0 when there is no drag.
    unsigned int get_drag_mode() const { return m_drag_mode; }

protected:
    // Chooses the edges the drag moves: the border's own, and the crossing edge as well when the
    // grab is within twice the thickness of one of the border's ends.
    virtual void on_event_drag_begin(CWndEvent const *_p_event) override;
    // Resizes the parent by the movement on the chosen edges; a left or top edge moves the parent
    // so that the opposite edge stays. The border itself isn't moved.
    virtual void on_event_drag(CWndEvent const *_p_event) override;
    // Ends the drag.
    virtual void on_event_drag_end(CWndEvent const *_p_event) override;
    // The parent's EVENT_RESIZED: the border lies along its edge again. A border of any other
    // type than one edge (BORDERS_ALL too) stays as it is.
    virtual void on_event_parent_resized(CWndEvent const *_p_event);

    EBorderType m_border_type; // the edge
    unsigned int m_drag_mode;  // the edges the running drag moves; 0 when there is none
    point_t m_drag_start;      // where the pointer took hold, in the border's coordinates
    int m_border_size;         // pixels
};

// A movable, resizable window with a caption and a row or column of buttons at its foot.
class CDialog : public CWindowVisual {
public:
    // Can be dragged by its background, and has a border of 8 pixels on each edge.
    CDialog(CDesktop *_p_desktop, char const *_name);
    // The buttons go with the window tree.
    virtual ~CDialog();

    QOR_CLASS_ID(CDialog, CWindowVisual, "Dialog")

    // Behind the visual window's keys: "caption_alignment", "caption_h", "buttons_horizontal",
    // "button_w", "button_h", "buttons_interval" and "caption"; loading also reads "can_drag".
    // The buttons are children with their own state.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // A new button behind the others, in the dialog's button look, laid out with them at once.
    // The dialog owns it through the window tree.
    CButton *add_button(CString const &_caption);
    // The buttons in order of adding.
    unsigned int get_buttons_count() const { return static_cast<unsigned int>(m_buttons.size()); }
    // The button at _idx; null, with a report, when out of range.
    CButton *get_button(unsigned int _idx);

    // The default button, which on_default_button_click clicks; the dialog calls that itself
    // nowhere: the owner decides which key means it.
    // A null button breaks the contract.
    void set_default_button(CButton *_p_button);
    // The default button; null until one is set.
    CButton *get_default_button() { return mp_default_button; }
    // Sends the default button EVENT_CLICK; nothing without one.
    void on_default_button_click();

    // Drawing only: a caption changes no layout.
    // @{
    void set_caption(CString const &_caption) { m_caption = _caption; }
    CString const &get_caption() const { return m_caption; }
    // @}

    // Layout: each setter lays the dialog out again.

    // The height of the caption strip in pixels (24 by default).
    void set_caption_h(int _h);
    // The size of every button in pixels (128 by 32 by default).
    void set_button_size(int _w, int _h);
    // The space between two buttons in pixels (8 by default).
    void set_buttons_interval(int _interval);
    // Where the caption stands across the client area: left, centred or right.
    void set_caption_alignment(EAlignment _alignment);
    // Buttons side by side (the default), or one above the other.
    void set_buttons_horizontal(bool _horizontal);
    // The values of the setters above.
    // @{
    int get_caption_h() const { return m_caption_h; }
    int get_button_w() const { return m_button_w; }
    int get_button_h() const { return m_button_h; }
    int get_buttons_interval() const { return m_buttons_interval; }
    EAlignment get_caption_alignment() const { return m_caption_alignment; }
    bool get_buttons_horizontal() const { return m_buttons_horizontal; }
    // @}

protected:
    // Behind the visual window's drawing: the caption in the default font, in the middle of the
    // caption strip.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
    // The buttons at the foot, centred across the dialog: side by side, or one above the other.
    virtual void on_event_resized(CWndEvent const *_p_event) override;

    CString m_caption;               // drawn in the caption strip
    EAlignment m_caption_alignment;  // horizontal place of the caption in the client area
    bool m_buttons_horizontal;       // side by side, else one above the other
    int m_caption_h;                 // height of the caption strip, pixels
    int m_button_w;                  // size of each button, pixels
    int m_button_h;                  // pixels
    int m_buttons_interval;          // pixels between two buttons
    qor_vector<CButton *> m_buttons; // in order of adding; owned by the window tree
    CButton *mp_default_button;      // null for none

    // Stores a value that the layout depends on and lays the dialog out again.
    template <class TValue>
    void relayout(TValue &_field, TValue _value);

private:
    void layout_buttons();
};

// A dialog with a list box between the caption and the buttons.
class CListDialog : public CDialog {
public:
    // A list box, the child "list box", fills the room between the caption and the buttons.
    CListDialog(CDesktop *_p_desktop, char const *_name);
    // The list box goes with the window tree.
    virtual ~CListDialog();

    QOR_CLASS_ID(CListDialog, CDialog, "ListDialog")

    // The space between the list box and the buttons in pixels (8 by default); setting it lays
    // the dialog out again.
    // @{
    void set_buttons_list_box_interval(int _interval);
    int get_buttons_list_box_interval() const { return m_buttons_list_box_interval; }
    // @}
    // The list box; the window tree owns it.
    CListBox *get_list_box() { return mp_list_box; }

protected:
    // The list box's room leaves one row of buttons below it, also when they stand in a column.
    virtual void on_event_resized(CWndEvent const *_p_event) override;

    int m_buttons_list_box_interval; // pixels between the list box and the buttons
    CListBox *mp_list_box;           // child "list box"; owned by the window tree
};

// A modal dialog with a text centred in it.
class CMessageBox : public CDialog {
public:
    // Modal, and so always on top, from the start.
    CMessageBox(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CMessageBox();

    QOR_CLASS_ID(CMessageBox, CDialog, "MessageBox")

    // Behind the dialog's keys: "message_text". Layouts keep the message's first line only.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // The message; setting it assigns the string to the text, line breaks included.
    // @{
    void set_message_text(CString const &_text) { m_message_text = _text; }
    CText const &get_message_text() const { return m_message_text; }
    // @}

protected:
    // The message centred in the client area as a block, by the width of its first line; how each
    // line stands in the block is the alignment of the text.
    virtual void on_event_draw(CWndEvent const *_p_event) override;

    CText m_message_text; // the message
};

} // namespace qorui
