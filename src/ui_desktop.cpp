// The desktop.
//
//   construction and destruction
//   hit test and pointer input   the window under the pointer, press, click, double click, drag
//   keys and wheel               the active window, then the subscribers
//   activation                   the stack of active windows, hiding and deleting
//   frames                       deferred deletion, update, draw, the stats page's figures
//   layouts and helpers          export, grid rounding, window paths
#include "ui_desktop.h"
#include "engine_interfaces.h"
#include "qor_platform.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_interfaces.h"
#include "ui_material.h"
#include "ui_render.h"

#include <algorithm>
#include <cmath>
#include <ostream>
#include <streambuf>

namespace qorui {

namespace {

template <class T>
bool contains(qor_vector<T> const &_vector, T const &_value) {
    return std::find(_vector.begin(), _vector.end(), _value) != _vector.end();
}

template <class T>
void remove_all(qor_vector<T> &_vector, T const &_value) {
    _vector.erase(std::remove(_vector.begin(), _vector.end(), _value), _vector.end());
}

void send(CWindow *_p_from, CWindow *_p_to, EEventType _id) {
    _p_from->send_event(_p_to, _id, CWndEvent::DISPATCH_NONE);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Construction and destruction
// ---------------------------------------------------------------------------------------------

CDesktop::CDesktop(IRender *_p_render, int _w, int _h, char const *_name)
    : CWindowVisual(this, _name), m_pointer(this, "desktop pointer"), mp_render(nullptr),
      mp_pointed_window(nullptr), mp_dragged_window(nullptr), mp_pressed_window(nullptr), m_pointer_pos{0, 0},
      m_last_click_time(0), mp_last_clicked_window(nullptr), m_pointer_pressed(false), m_last_draw_ticks(0),
      m_frame_ms(0.0f) {
    if (QOR_CHECK(_p_render)) {
        mp_render = _p_render;
        mp_render->set_resolution(_w, _h);
    }
    mp_parent = nullptr;
    set_size(_w, _h);
    m_pointer.mp_parent = this;
    m_pointer_pos = vec2_t{static_cast<float>(_w / 2), static_cast<float>(_h / 2)};
}

// The tree goes while the desktop still stands, so that every window's last calls into it find
// it whole; the pointer and the desktop itself then stop talking to it.
CDesktop::~CDesktop() {
    m_delete_queue.clear();
    while (!m_children.empty())
        delete m_children.back();
    m_pointer.mp_desktop = nullptr;
    m_pointer.mp_parent = nullptr;
    mp_desktop = nullptr;
}

CMaterial *CDesktop::create_material() {
    if (!QOR_CHECK(mp_render)) return nullptr;
    return new CMaterial(mp_render);
}

// ---------------------------------------------------------------------------------------------
// Hit test and pointer input
// ---------------------------------------------------------------------------------------------

// The last report wins: the deepest descendant of the foremost window at that point.
CWindow *CDesktop::get_pointed_window(point_t const &_pos) {
    CWindow *p_active = get_active_window();
    if (p_active && p_active->is_pointer_capture()) return p_active;
    m_pointed_windows.clear();
    CWndEvent report(EVENT_REPORT_POINT_INSIDE);
    report << _pos;
    send_event(this, &report, CWndEvent::DISPATCH_CHILDREN);
    return m_pointed_windows.empty() ? nullptr : m_pointed_windows.back();
}

bool CDesktop::is_window_pointed(CWindow *_p_root, CWindow *_p_wnd) {
    for (CWindow *p_wnd = _p_wnd; p_wnd; p_wnd = p_wnd->get_parent())
        if (p_wnd == _p_root) return true;
    return false;
}

// A modal active window keeps out everything outside its subtree.
bool CDesktop::is_kept_out(CWindow *_p_pointed) {
    CWindow *p_active = get_active_window();
    return p_active && p_active->is_modal() && !is_window_pointed(p_active, _p_pointed);
}

void CDesktop::report_pointer_inside(CWindow *_p_wnd) {
    m_pointed_windows.push_back(_p_wnd);
}

// The true pointer position cut to whole pixels.
point_t CDesktop::pointer_pixel() const {
    return point_t{static_cast<int>(m_pointer_pos.x), static_cast<int>(m_pointer_pos.y)};
}

void CDesktop::on_pointer_move(vec2_t const &_delta) {
    float const max_x = static_cast<float>(get_w() - 1), max_y = static_cast<float>(get_h() - 1);
    m_pointer_pos.x = std::min(std::max(m_pointer_pos.x + _delta.x, 0.0f), max_x);
    m_pointer_pos.y = std::min(std::max(m_pointer_pos.y + _delta.y, 0.0f), max_y);
    point_t const old = m_pointer.get_pos();
    point_t const pos = pointer_pixel();
    point_t const movement{pos.x - old.x, pos.y - old.y};
    if (!m_pointer.is_disabled()) m_pointer.set_pos(pos.x, pos.y);
    if (mp_dragged_window) {
        CWndEvent drag(EVENT_DRAG);
        drag << movement;
        send_event(mp_dragged_window, &drag, CWndEvent::DISPATCH_NONE);
        return;
    }
    CWindow *p_pointed = get_pointed_window(pos);
    bool const allowed = !is_kept_out(p_pointed);
    if (p_pointed && allowed) {
        CWndEvent move(EVENT_POINTER_MOVE);
        move << _delta;
        send_event(p_pointed, &move, CWndEvent::DISPATCH_NONE);
        CWndEvent position(EVENT_POINTER_POS);
        position << pos;
        send_event(p_pointed, &position, CWndEvent::DISPATCH_NONE);
    }
    if (p_pointed != mp_pointed_window && allowed) {
        if (mp_pointed_window) send(this, mp_pointed_window, EVENT_POINTER_EXIT);
        if (p_pointed) send(this, p_pointed, EVENT_POINTER_ENTER);
    }
    mp_pointed_window = p_pointed;
    if (!allowed) return;
    if (m_pointer_pressed && p_pointed && p_pointed->is_can_drag() && !p_pointed->is_maximaized()) {
        mp_dragged_window = p_pointed;
        send(this, p_pointed, EVENT_DRAG_BEGIN);
    }
}

void CDesktop::on_pointer_down(unsigned int _button) {
    point_t const pos = pointer_pixel();
    CWindow *p_pointed = get_pointed_window(pos);
    mp_pointed_window = p_pointed;
    if (!p_pointed) return;
    mp_pressed_window = p_pointed;
    if (is_kept_out(p_pointed)) return;
    if (!m_pointer_pressed) {
        set_active_window(p_pointed);
        // The activation may have deleted or hidden windows; the pressed one is still the target.
        if (mp_pressed_window) {
            CWndEvent down(EVENT_POINTER_DOWN);
            down << static_cast<int>(_button);
            send_event(mp_pressed_window, &down, CWndEvent::DISPATCH_NONE);
        }
    }
    m_pointer_pressed = true;
}

void CDesktop::on_pointer_up(unsigned int _button) {
    point_t const pos = pointer_pixel();
    CWindow *p_pointed = get_pointed_window(pos);
    mp_pointed_window = p_pointed;
    if (!p_pointed || !m_pointer_pressed) return;
    if (mp_pressed_window) {
        CWndEvent up(EVENT_POINTER_UP);
        up << static_cast<int>(_button);
        send_event(mp_pressed_window, &up, CWndEvent::DISPATCH_NONE);
    }
    if (mp_dragged_window) {
        send(this, mp_dragged_window, EVENT_DRAG_END);
        mp_dragged_window = nullptr;
    }
    if (mp_pointed_window && mp_pointed_window == mp_pressed_window) {
        CWindow *p_clicked = mp_pointed_window;
        send(this, p_clicked, EVENT_CLICK);
        uint32_t const now = qorplatform::get_tick_count();
        // The click's handlers may have deleted the window; on_delete cleared the pointers then.
        if (p_clicked == mp_pointed_window && p_clicked == mp_last_clicked_window &&
            now - m_last_click_time < DOUBLE_CLICK_TIME)
            send(this, p_clicked, EVENT_DOUBLE_CLICK);
        m_last_click_time = now;
        mp_last_clicked_window = p_clicked == mp_pointed_window ? p_clicked : nullptr;
    }
    m_pointer_pressed = false;
}

// ---------------------------------------------------------------------------------------------
// Keys and wheel: the active window, then the subscribers
// ---------------------------------------------------------------------------------------------

void CDesktop::send_to_keyboard_receivers(CWndEvent &_event) {
    CWindow *p_active = get_active_window();
    if (p_active) send_event(p_active, &_event, CWndEvent::DISPATCH_NONE);
    // A copy: a receiver may subscribe or unsubscribe while it handles the event.
    qor_vector<CWindow *> const subscribers = m_input_subscribers;
    for (CWindow *p_wnd : subscribers) {
        if (!QOR_CHECK(p_wnd)) continue;
        if (p_wnd != p_active && contains(m_input_subscribers, p_wnd))
            send_event(p_wnd, &_event, CWndEvent::DISPATCH_NONE);
    }
}

void CDesktop::on_wheel_rotated(float _rotation) {
    CWndEvent event(EVENT_WHEEL_ROTATED);
    event << _rotation;
    send_to_keyboard_receivers(event);
}

void CDesktop::on_key_down(unsigned int _key, unsigned int _value) {
    CWndEvent event(EVENT_KEY_DOWN);
    event << static_cast<int>(_key) << static_cast<int>(_value);
    send_to_keyboard_receivers(event);
}

void CDesktop::on_key_up(unsigned int _key) {
    CWndEvent event(EVENT_KEY_UP);
    event << static_cast<int>(_key);
    send_to_keyboard_receivers(event);
}

void CDesktop::on_char(unsigned int _char) {
    CWndEvent event(EVENT_CHAR);
    event << static_cast<int>(_char);
    send_to_keyboard_receivers(event);
}

void CDesktop::input_subscribe(CWindow *_p_wnd, bool _subscribe) {
    if (_subscribe) {
        if (!contains(m_input_subscribers, _p_wnd)) m_input_subscribers.push_back(_p_wnd);
    } else {
        remove_all(m_input_subscribers, _p_wnd);
    }
}

// ---------------------------------------------------------------------------------------------
// Activation
// ---------------------------------------------------------------------------------------------

CWindow *CDesktop::get_active_window() {
    return m_active_windows.empty() ? nullptr : m_active_windows.back();
}

void CDesktop::set_active_window(CWindow *_p_wnd) {
    if (!_p_wnd) return;
    if (_p_wnd->is_hidden()) send(this, _p_wnd, EVENT_SHOW);
    while (_p_wnd && _p_wnd->is_passive())
        _p_wnd = _p_wnd->get_parent();
    if (!_p_wnd) return;
    CWindow *p_last = get_active_window();
    if (p_last) {
        if (p_last == _p_wnd) return;
        send(this, p_last, EVENT_DEACTIVATE);
    }
    for (CWindow *p_child = _p_wnd; p_child->get_parent(); p_child = p_child->get_parent())
        p_child->get_parent()->bring_to_front(p_child);
    m_active_windows.push_back(_p_wnd);
    send(this, _p_wnd, EVENT_ACTIVATE);
    if (m_active_windows.size() >= static_cast<size_t>(MAX_ACTIVE_WINDOWS_STACK_SIZE))
        m_active_windows.erase(m_active_windows.begin());
}

// The activation goes back to the window before, with no search.
void CDesktop::drop_active_window() {
    CWindow *p_last = get_active_window();
    if (!p_last) return;
    send(this, p_last, EVENT_DEACTIVATE);
    if (!m_active_windows.empty() && m_active_windows.back() == p_last) m_active_windows.pop_back();
    if (CWindow *p_now = get_active_window()) send(this, p_now, EVENT_ACTIVATE);
}

void CDesktop::on_hide(CWindow *_p_wnd) {
    if (!_p_wnd) return;
    if (_p_wnd == get_active_window()) {
        drop_active_window();
        return;
    }
    for (unsigned i = 0; i < _p_wnd->get_children_count(); ++i)
        on_hide(_p_wnd->get_child(i));
}

// Every reference to a window that is being destroyed goes, the deletion queue's included, so that
// a queued window deleted with its parent is never deleted again.
void CDesktop::on_delete(CWindow *_p_wnd) {
    if (mp_pointed_window == _p_wnd) mp_pointed_window = nullptr;
    if (mp_dragged_window == _p_wnd) mp_dragged_window = nullptr;
    if (mp_last_clicked_window == _p_wnd) mp_last_clicked_window = nullptr;
    if (mp_pressed_window == _p_wnd) mp_pressed_window = nullptr;
    remove_all(m_active_windows, _p_wnd);
    remove_all(m_exclusive_windows, _p_wnd);
    m_delete_queue.remove(_p_wnd);
}

void CDesktop::delete_window(CWindow *_p_wnd) {
    if (std::find(m_delete_queue.begin(), m_delete_queue.end(), _p_wnd) == m_delete_queue.end())
        m_delete_queue.push_back(_p_wnd);
}

void CDesktop::set_exclusive_render_window(CWindow *_p_wnd, bool _exclusive) {
    if (_exclusive) {
        if (!contains(m_exclusive_windows, _p_wnd)) m_exclusive_windows.push_back(_p_wnd);
    } else {
        remove_all(m_exclusive_windows, _p_wnd);
    }
}

// ---------------------------------------------------------------------------------------------
// Frames
// ---------------------------------------------------------------------------------------------

void CDesktop::update(int _value) {
    // Hidden and faded out: deleted with its subtree. A deletion can take other queued windows
    // with it (on_delete takes them out of the queue), so the walk starts again behind each.
    for (auto it = m_delete_queue.begin(); it != m_delete_queue.end();) {
        CWindow *p_wnd = *it;
        if (!QOR_CHECK(p_wnd)) {
            it = m_delete_queue.erase(it);
            continue;
        }
        CWindowVisual *p_visual = class_cast<CWindowVisual>(p_wnd);
        if (p_wnd->is_hidden() && (!p_visual || p_visual->get_transparency() == 0.0f)) {
            m_delete_queue.erase(it);
            delete p_wnd;
            it = m_delete_queue.begin();
        } else {
            ++it;
        }
    }
    CWndEvent event(EVENT_UPDATE);
    event << _value;
    send_event(this, &event, CWndEvent::DISPATCH_NONE);
    send_event(&m_pointer, &event, CWndEvent::DISPATCH_NONE);
    CWindow *p_active = get_active_window();
    if (p_active && p_active->is_hidden()) drop_active_window();
}

void CDesktop::draw() {
    if (!QOR_CHECK(mp_render) || m_is_hidden) return;
    int64_t const ticks = qorplatform::query_performance_counter();
    if (m_last_draw_ticks != 0)
        m_frame_ms = static_cast<float>(static_cast<double>(ticks - m_last_draw_ticks) * 1000.0 /
                                        static_cast<double>(qorplatform::query_performance_frequency()));
    m_last_draw_ticks = ticks;
    mp_render->begin_draw();
    if (m_exclusive_windows.empty()) {
        m_canvas.set_clip_area_all();
        send_event(this, EVENT_DRAW, CWndEvent::DISPATCH_CHILDREN);
    } else {
        qor_vector<CWindow *> const exclusive = m_exclusive_windows;
        for (CWindow *p_wnd : exclusive)
            if (p_wnd && !p_wnd->is_hidden()) send_event(p_wnd, EVENT_DRAW, CWndEvent::DISPATCH_NONE);
    }
    send_event(&m_pointer, EVENT_DRAW, CWndEvent::DISPATCH_CHILDREN);
    mp_render->end_draw();
}

void CDesktop::on_event_show(CWndEvent const *_p_event) {
    CWindowVisual::on_event_show(_p_event);
    send(this, &m_pointer, EVENT_SHOW);
}

void CDesktop::on_event_hide(CWndEvent const *_p_event) {
    CWindowVisual::on_event_hide(_p_event);
    send(this, &m_pointer, EVENT_HIDE);
}

void CDesktop::show_stats(IStatsPage *_p_page, unsigned int _line) {
    if (!QOR_CHECK(_p_page)) return;
    qor_vector<CWindow *> windows;
    get_children(windows);
    unsigned shown = 0;
    for (CWindow *p_wnd : windows) {
        CWindow *p_up = p_wnd;
        while (p_up && p_up != this && !p_up->is_hidden())
            p_up = p_up->get_parent();
        if (p_up == this) ++shown;
    }
    SRenderFigures const figures = mp_render ? mp_render->get_frame_figures() : SRenderFigures{0, 0, 0};
    _p_page->print(_line, "Windows: %u, shown %u", static_cast<unsigned>(windows.size()), shown);
    _p_page->print(_line + 1, "Materials set: %u, quads: %u, lines: %u", figures.m_materials_set,
                   figures.m_quads, figures.m_lines);
    _p_page->print(_line + 2, "Frame: %.1f ms", m_frame_ms);
}

point_t CDesktop::get_pointer_pos() {
    return m_pointer.get_pos();
}
void CDesktop::hide_pointer() {
    send(this, &m_pointer, EVENT_HIDE);
}
void CDesktop::show_pointer() {
    send(this, &m_pointer, EVENT_SHOW);
}

// ---------------------------------------------------------------------------------------------
// Layouts and helpers
// ---------------------------------------------------------------------------------------------

namespace {

// An output stream's buffer in a string of the library's heap. A standard string stream grows its
// buffer inside the C++ runtime, on the runtime's heap, and its string would then be freed here.
class CStringOut : public std::streambuf {
public:
    string const &text() const { return m_text; }

protected:
    int_type overflow(int_type _c) override {
        if (!traits_type::eq_int_type(_c, traits_type::eof())) m_text += traits_type::to_char_type(_c);
        return traits_type::not_eof(_c);
    }
    std::streamsize xsputn(char const *_p, std::streamsize _count) override {
        m_text.append(_p, static_cast<size_t>(_count));
        return _count;
    }

private:
    string m_text;
};

} // namespace

void CDesktop::export_layout(int _category, char const *_file) {
    LuaPlus::LuaState &lua = lua_machine();
    LuaPlus::LuaObject windows, presets;
    windows.AssignNewTable(&lua);
    presets.AssignNewTable(&lua);
    lua.GetGlobals().SetObject("ui_material_presets", presets);
    save_state(windows);
    IFileSystem *p_files = GetFileSystem();
    if (!p_files || !_file) return;
    CStringOut layout, presets_out;
    std::ostream layout_stream(&layout), presets_stream(&presets_out);
    lua.DoString("ui_windows_ini = nil", true);
    windows.dump("ui_windows_ini", layout_stream);
    lua.DoString("ui_material_presets = nil", true);
    presets.dump("ui_material_presets", presets_stream);
    string const &layout_text = layout.text(), &presets_text = presets_out.text();
    // Both files or neither: a layout that can't be written leaves the presets as they were.
    SFileToSave const files[] = {
        {_category, _file, layout_text.data(), static_cast<unsigned>(layout_text.size())},
        {qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua", presets_text.data(),
         static_cast<unsigned>(presets_text.size())},
    };
    p_files->save_files(files, 2);
}

namespace {

// The next line of the screen-pixel grid away from zero; a value on the grid stays.
float round_to_grid(float _v, float _step) {
    if (_step <= 0.0f) return _v;
    float whole;
    float const fraction = std::modf(_v / _step, &whole);
    if (fraction > 0.0f) return (whole + 1.0f) * _step;
    if (fraction < 0.0f) return (whole - 1.0f) * _step;
    return _v;
}

float service_scale(bool _width) {
    IUserInterface *p_ui = engine_interfaces().get_user_interface(false);
    return p_ui ? (_width ? p_ui->get_scale_w() : p_ui->get_scale_h()) : 1.0f;
}

} // namespace

float CDesktop::round_w(float _v) {
    return round_to_grid(_v, service_scale(true));
}
float CDesktop::round_h(float _v) {
    return round_to_grid(_v, service_scale(false));
}

char const *CDesktop::print_full_window_hierarchy(CWindow *_p_wnd) {
    static string s_path;
    s_path.clear();
    for (CWindow *p_wnd = _p_wnd; p_wnd; p_wnd = p_wnd->get_parent())
        s_path = p_wnd == _p_wnd ? string(p_wnd->get_name()) : string(p_wnd->get_name()) + "->" + s_path;
    return s_path.c_str();
}

} // namespace qorui
