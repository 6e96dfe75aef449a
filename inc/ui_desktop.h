// The root of the window tree and the only door between the engine's input and the windows. It
// owns the on-screen pointer, finds the window under it by a broadcast, tells press from click,
// double click and drag, keeps the stack of active windows, enforces modality, and deletes windows
// that asked for it once they are hidden and faded out.
#pragma once
#include "ui_pointer.h"

#include <list>

namespace qorui {

class IStatsPage;

// The root of the window tree: the engine's input, the pointer, activation, modality and materials.
class CDesktop : public CWindowVisual {
public:
    // The stack of active windows drops its oldest entry when it reaches this size.
    static int const MAX_ACTIVE_WINDOWS_STACK_SIZE = 32;
    // A second click on the same window within this time is also a double click.
    static unsigned const DOUBLE_CLICK_TIME = 250; // ms

    // The desktop is its own desktop; _w by _h desktop pixels on the render bridge.
    CDesktop(IRender *_p_render, int _w, int _h, char const *_name);
    // Deletes the whole tree; the pointer goes with the desktop.
    virtual ~CDesktop();

    QOR_CLASS_ID(CDesktop, CWindowVisual, "Desktop")

    // Called by the service

    // One frame of logic: deletes the queued windows that are hidden and faded out, sends
    // EVENT_UPDATE (with _value) through the tree and to the pointer, and drops a hidden active
    // window.
    void update(int _value);
    // One frame of drawing between the bridge's begin_draw and end_draw: the tree back to front
    // (or only the exclusive windows), then the pointer. Nothing while the desktop is hidden.
    void draw();
    // Moves the pointer by _delta desktop pixels, kept on the desktop. During a drag only the
    // dragged window hears of it (EVENT_DRAG); otherwise the pointed window gets pointer move,
    // pointer pos, exit and enter, and a press in progress starts a drag on a draggable window.
    void on_pointer_move(vec2_t const &_delta);
    // A button went down: the pointed window becomes active and gets EVENT_POINTER_DOWN, unless
    // a modal window keeps it out or a press is already in progress.
    void on_pointer_down(unsigned int _button);
    // A button went up: EVENT_POINTER_UP to the pressed window, the end of a drag, and
    // EVENT_CLICK (and EVENT_DOUBLE_CLICK within DOUBLE_CLICK_TIME) when the pointer is still
    // over the pressed window.
    void on_pointer_up(unsigned int _button);
    // Wheel, keys and characters go to the active window, then to every subscriber: a float
    // rotation, a key code with the engine's second value, a key code, a character code.
    // @{
    void on_wheel_rotated(float _rotation);
    void on_key_down(unsigned int _key, unsigned int _value);
    void on_key_up(unsigned int _key);
    void on_char(unsigned int _char);
    // @}
    // The figures a developer watches, on the page's lines from _line on: the windows of the tree,
    // what the last frame sent to the engine, and the time between the last two frames.
    void show_stats(IStatsPage *_p_page, unsigned int _line);

    // Called by windows and game code

    // The last entry of the stack of active windows; null when it is empty.
    CWindow *get_active_window();
    // Shows a hidden window, climbs past passive ones, brings the chain to the front.
    // Deactivates the old active window and activates the new one (nothing when it is the same).
    void set_active_window(CWindow *_p_wnd);
    // Adds (true) or removes a window that draw draws instead of the whole tree; while any is
    // set, the desktop and all other windows stay undrawn.
    void set_exclusive_render_window(CWindow *_p_wnd, bool _exclusive);
    // Keyboard and wheel events to a window whether it is active or not.
    void input_subscribe(CWindow *_p_wnd, bool _subscribe);
    // The hit test: a window under the point reports itself; the last report wins.
    void report_pointer_inside(CWindow *_p_wnd);
    // A window is about to be hidden: if it or a descendant is the active window, activation moves.
    void on_hide(CWindow *_p_wnd);
    // A window is being destroyed: every reference to it goes.
    void on_delete(CWindow *_p_wnd);
    // Deleted by a later update, once hidden and faded out; never twice.
    void delete_window(CWindow *_p_wnd);
    // The pointer's hot spot in desktop pixels.
    point_t get_pointer_pos();
    // Hides or shows the pointer window.
    // @{
    void hide_pointer();
    void show_pointer();
    // @}
    // The pointer window: a member of the desktop, not a child.
    CPointer &get_pointer() { return m_pointer; }
    // The render bridge that the canvases of the tree draw through; null while there is none.
    IRender *get_render() { return mp_render; }
    // A new material over the render bridge, without a handle yet; the caller owns it.
    CMaterial *create_material();
    // The whole layout to _file of _category, and the presets to "ui_material_presets.lua".
    void export_layout(int _category, char const *_file);

    // A desktop coordinate moved away from zero to the next whole screen pixel (the service's
    // scale); a value on the grid stays.
    // @{
    static float round_w(float _v);
    static float round_h(float _v);
    // @}
    // "root->...->window", in one static string that the next call overwrites.
    static char const *print_full_window_hierarchy(CWindow *_p_wnd);

protected:
    // The visual window's, then the same to the pointer.
    // @{
    virtual void on_event_show(CWndEvent const *_p_event) override;
    virtual void on_event_hide(CWndEvent const *_p_event) override;
    // @}

private:
    CWindow *get_pointed_window(point_t const &_pos);
    point_t pointer_pixel() const;
    bool is_window_pointed(CWindow *_p_root, CWindow *_p_wnd);
    void drop_active_window();
    bool is_kept_out(CWindow *_p_pointed);
    void send_to_keyboard_receivers(CWndEvent &_event);
    void forget_deleted(CWindow *_p_wnd);

    CPointer m_pointer;
    IRender *mp_render; // not owned
    CWindow *mp_pointed_window;
    CWindow *mp_dragged_window;
    CWindow *mp_pressed_window;
    qor_vector<CWindow *> m_exclusive_windows;
    vec2_t m_pointer_pos;
    qor_vector<CWindow *> m_pointed_windows;
    unsigned m_last_click_time;
    CWindow *mp_last_clicked_window;
    qor_vector<CWindow *> m_active_windows;
    qor_vector<CWindow *> m_input_subscribers;
    std::list<CWindow *, qor_allocator<CWindow *>> m_delete_queue;
    bool m_pointer_pressed;
    int64_t m_last_draw_ticks; // the performance counter at the last draw; 0 before the first
    float m_frame_ms;          // between the last two draws
};

} // namespace qorui
