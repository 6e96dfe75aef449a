// Controls that show a float value inside a range.
//
//   CValueBar      the range, the position kept inside it, the orientation and the bar's thickness
//   CProgressBar   a value bar that fills a rectangle from the left as the position grows
//   CScrollBar     a value bar with a step button at each end and a scroller dragged between them
//
// An owner learns of every change of the position through EVENT_CHANGED on the bar, and may send
// the bar EVENT_SCROLL_SMALL_STEP or EVENT_SCROLL_LARGE_STEP (an int, -1 or +1) to move it.
#pragma once
#include "ui_window_visual.h"

namespace qorui {

class CButton;

// A float position kept inside a range, horizontal or vertical; EVENT_CHANGED on each change.
class CValueBar : public CWindowVisual {
public:
    // Range 0 to 100 at 0, horizontal, with a grey "ui_color" body as its normal material.
    CValueBar(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CValueBar();

    QOR_CLASS_ID(CValueBar, CWindowVisual, "ValueBar")

    // Behind the visual window's keys: "is_horizontal". Range and position aren't saved.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}

    // Range and position: m_min <= m_position <= m_max after every setter. Only set_position sends
    // EVENT_CHANGED, and only for a value that differs from the stored one before clamping.
    // An end of the range; one that passes the other end collapses the range onto that end.
    // @{
    virtual void set_min(float _min);
    virtual void set_max(float _max);
    // @}
    // Stores the position, clamped to the range.
    virtual void set_position(float _position);
    // The range and the position.
    // @{
    float get_min() const { return m_min; }
    float get_max() const { return m_max; }
    float get_position() const { return m_position; }
    // @}
    // The position over the width of the range, not shifted by m_min, cut to 0..1.
    float get_position_normalized() const;

    // Orientation and thickness: the bar size is the height of a horizontal bar and the width of a
    // vertical one, taken anew at every resize.

    // The orientation. Setting it keeps the window's size and takes the bar size anew from it.
    // @{
    void set_horizontal(bool _horizontal);
    bool get_horizontal() const { return m_horizontal; }
    // @}
    // The bar's thickness in pixels; setting it stores the value until the next resize.
    // @{
    int get_bar_size() const { return m_bar_size; }
    void set_bar_size(int _size) { m_bar_size = _size; }
    // @}

protected:
    // Behind the visual window's: the bar size becomes the height, or the width when vertical.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // The position changed; nothing of its own here.
    virtual void on_event_changed(CWndEvent const *_p_event) override;

    // Clamps the position to m_min, then to m_max.
    void clamp_position();

    float m_min;       // lower end of the range
    float m_max;       // upper end of the range
    float m_position;  // m_min <= m_position <= m_max
    int m_bar_size;    // thickness in pixels
    bool m_horizontal; // orientation
};

// A value bar that fills its rectangle from the left as the position grows.
class CProgressBar : public CValueBar {
public:
    // A value bar with a light "ui_color" MAT_NAME_PROGRESS for the filled part; passive.
    CProgressBar(CDesktop *_p_desktop, char const *_name);
    // Nothing of its own to release.
    virtual ~CProgressBar();

    QOR_CLASS_ID(CProgressBar, CValueBar, "ProgressBar")

protected:
    // Behind the visual window's drawing: MAT_NAME_PROGRESS from the top left margin corner,
    // as wide as the normalised position of the client width, bar size less the margins high;
    // left to right whatever the orientation.
    virtual void on_event_draw(CWndEvent const *_p_event) override;
};

// A value bar with a step button at each end and a scroller dragged between them.
class CScrollBar : public CValueBar {
public:
    // A passive value bar with steps of 10 and 50 and its three buttons, each with clones of the
    // desktop's button materials where the desktop has them. The buttons get the bar size, 0
    // until the bar has a size.
    CScrollBar(CDesktop *_p_desktop, char const *_name);
    // The buttons go with the window tree.
    virtual ~CScrollBar();

    QOR_CLASS_ID(CScrollBar, CValueBar, "ScrollBar")

    // The value bar's keys only; the buttons are saved as children.
    // @{
    virtual void save_state(LuaPlus::LuaObject &_lo_table) override;
    virtual void load_state(LuaPlus::LuaObject &_lo_table) override;
    // @}
    // The steps become 1% and 10% of the new range.
    // @{
    virtual void set_min(float _min) override;
    virtual void set_max(float _max) override;
    // @}

    // The amounts of an end button's click (small) and of a press on the track (large). Not
    // negative (a broken contract), and cut to the range.
    // @{
    void set_small_step(float _val);
    void set_large_step(float _val);
    float get_small_step() const { return m_small_step; }
    float get_large_step() const { return m_large_step; }
    // @}

    // The child buttons: towards the minimum, towards the maximum, and the scroller between
    // them. The window tree owns them.
    // @{
    CButton *get_button_min() { return mp_button_min; }
    CButton *get_button_max() { return mp_button_max; }
    CButton *get_button_scroller() { return mp_button_scroller; }
    // @}
    // The end buttons at the ends, the scroller where the position puts it on the track.
    void set_scroller_for_position();

protected:
    // The window's, then the same event to the three buttons.
    // @{
    virtual void on_event_enable(CWndEvent const *_p_event) override;
    virtual void on_event_disable(CWndEvent const *_p_event) override;
    // @}
    // Behind the value bar's: the end buttons to the ends, the scroller to the position.
    virtual void on_event_resized(CWndEvent const *_p_event) override;
    // Behind the value bar's: the scroller follows the position.
    virtual void on_event_changed(CWndEvent const *_p_event) override;
    // Stops the bar's sounds; also the end of a drag of the scroller.
    virtual void on_event_pointer_up(CWndEvent const *_p_event) override;
    // Behind the visual window's: a large step towards the press, -1 before the scroller and +1
    // from it on.
    virtual void on_event_pointer_down(CWndEvent const *_p_event) override;

    // A click on an end button: a small step of -1 (min) or +1 (max) to the bar itself.
    // @{
    virtual void on_event_button_min_click(CWndEvent const *_p_event);
    virtual void on_event_button_max_click(CWndEvent const *_p_event);
    // @}
    // The scroller's drag begins: keeps where the pointer took hold of it.
    virtual void on_event_button_scroller_drag_begin(CWndEvent const *_p_event);
    // The scroller's drag: the position moves by the movement over the track's length times the
    // range, counted only while the pointer is on the side it moves towards.
    virtual void on_event_button_scroller_drag(CWndEvent const *_p_event);
    // EVENT_SCROLL_SMALL_STEP and EVENT_SCROLL_LARGE_STEP: the position moves by the event's
    // direction (-1 or +1) times the step, and the scroller follows.
    // @{
    virtual void on_event_scroll_small_step(CWndEvent const *_p_event);
    virtual void on_event_scroll_large_step(CWndEvent const *_p_event);
    // @}

private:
    // A button over the whole bar size, with the look of three desktop materials where it has them.
    CButton *add_button(char const *_name, HUID const &_normal, HUID const &_highlighted,
                        HUID const &_pushed);
    // A step event with its direction, to the bar itself.
    void send_step(EEventType _id, int _direction);
    // Moves the position by the event's direction times _step.
    void step(CWndEvent const *_p_event, float _step);
    // Not negative; cut to the range.
    void store_step(float &_step, float _val);
    // The room the scroller moves in: the bar's length less the scroller and every shown end
    // button. Negative when the bar is too short.
    int get_track_length() const;
    // The pointer's hot spot in _p_wnd's own coordinates.
    point_t get_pointer_pos_in(CWindow const *_p_wnd) const;
    // Along the bar: x and widths when horizontal, y and heights when vertical.
    int along(point_t const &_point) const { return m_horizontal ? _point.x : _point.y; }
    int length_of(CWindow const *_p_wnd) const { return m_horizontal ? _p_wnd->get_w() : _p_wnd->get_h(); }

protected:
    float m_small_step;          // an end button's step
    float m_large_step;          // a press on the track's step
    CButton *mp_button_min;      // child "button min", towards m_min
    CButton *mp_button_max;      // child "button max", towards m_max
    CButton *mp_button_scroller; // child "button scroller", the thumb
    point_t m_drag_offset;       // where the pointer took hold of the scroller, in its coordinates
};

} // namespace qorui
