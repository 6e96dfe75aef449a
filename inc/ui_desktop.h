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
    static int const MAX_ACTIVE_WINDOWS_STACK_SIZE = 32;
    static unsigned const DOUBLE_CLICK_TIME = 250; // ms

    // The desktop is its own desktop; _w by _h desktop pixels on the render bridge.
    CDesktop(IRender *_p_render, int _w, int _h, char const *_name);
    virtual ~CDesktop();

    QOR_CLASS_ID(CDesktop, CWindowVisual, "Desktop")

    // Called by the service
    void update(int _value);
    void draw();
    void on_pointer_move(vec2_t const &_delta);
    void on_pointer_down(unsigned int _button);
    void on_pointer_up(unsigned int _button);
    void on_wheel_rotated(float _rotation);
    void on_key_down(unsigned int _key, unsigned int _value);
    void on_key_up(unsigned int _key);
    void on_char(unsigned int _char);
    // The figures a developer watches, on the page's lines from _line on: the windows of the tree,
    // what the last frame sent to the engine, and the time between the last two frames.
    void show_stats(IStatsPage *_p_page, unsigned int _line);

    // Called by windows and game code
    CWindow *get_active_window();
    // Shows a hidden window, climbs past passive ones, brings the chain to the front.
    void set_active_window(CWindow *_p_wnd);
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
    void hide_pointer();
    void show_pointer();
    CPointer &get_pointer() { return m_pointer; }
    // The render bridge that the canvases of the tree draw through; null while there is none.
    IRender *get_render() { return mp_render; }
    // A new material over the render bridge, without a handle yet; the caller owns it.
    CMaterial *create_material();
    // The whole layout to _file of _category, and the presets to "ui_material_presets.lua".
    void export_layout(int _category, char const *_file);

    static float round_w(float _v);
    static float round_h(float _v);
    // "root->...->window", in one static string that the next call overwrites.
    static char const *print_full_window_hierarchy(CWindow *_p_wnd);

protected:
    virtual void on_event_show(CWndEvent const *_p_event) override;
    virtual void on_event_hide(CWndEvent const *_p_event) override;

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
