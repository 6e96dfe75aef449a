// One world for the library's tests: a desktop on the host's software renderer behind a recorder,
// the default fonts, the test's clock and the test host's engine interfaces; input through the
// desktop, frames, golden pictures, readable records of events and Lua tables from text.
#pragma once
#include "host.h"
#include "qor_platform.h"
#include "qorscriptsystem.h"
#include "recording_renderer.h"
#include "software_renderer.h"
#include "test_support.h"
#include "ui_desktop.h"
#include "ui_render.h"

#include <string>
#include <vector>

namespace qortest {

class CWorld {
public:
    // A desktop of _w by _h pixels, shown, with "arial_white" as its default and "courier" as its
    // fixed font; the pointer stands at the centre; the clock at 10 s.
    explicit CWorld(int _w = 320, int _h = 240);
    ~CWorld();
    CWorld(CWorld const &) = delete;
    CWorld &operator=(CWorld const &) = delete;

    qorui::CDesktop &desktop() { return *mp_desktop; }
    qorplatform::CManualClock &clock() { return m_clock; }
    qorhost::CSoftwareRenderer &renderer() { return m_renderer; }
    // Every call of the desktop's bridge, in order; clear it before the calls a test looks at.
    qorhost::CRecordingRenderer &recorder() { return m_recorder; }
    // The engine's side: the test host whose server the library's engine interfaces use.
    qorhost::CHost &host();

    // A "ui_color" material of the desktop, owned by the caller.
    qorui::CMaterial *colour(unsigned char _r, unsigned char _g, unsigned char _b, unsigned char _a = 255);
    // _p_wnd attached to _p_parent and placed there.
    template <class TWindow>
    TWindow *place(qorui::CWindow *_p_parent, TWindow *_p_wnd, int _x, int _y, int _w, int _h) {
        _p_parent->attach_child(_p_wnd);
        _p_wnd->set_pos(_x, _y);
        _p_wnd->set_size(_w, _h);
        return _p_wnd;
    }

    // Input, as the engine gives it to the service.
    void move_to(int _x, int _y); // the pointer's hot spot to a desktop pixel
    void press(unsigned _button = 0);
    void release(unsigned _button = 0);
    void click_at(int _x, int _y); // move, press, release
    void key(unsigned _vk);        // down and up
    void type(char const *_ascii); // one character event per byte

    // One frame: update, then draw into a frame cleared to a dark grey.
    void frame();

    // What the last frame drew, in desktop pixels and in order: clip areas ("clip") and quads
    // ("quad"), each quad with the handle of the material set for it and its first corner's colour.
    struct SDrawn {
        std::string m_op;
        qorui::CRectArea m_rect;
        int m_handle;
        rgba_t m_colour;
    };
    std::vector<SDrawn> drawn() const;
    // Only the quads of the last frame.
    std::vector<SDrawn> quads() const;
    // The clip areas of the last frame as "x,y wxh", in order, joined by "; ".
    std::string clips() const;
    // The quads of the last frame in the font's material: the characters it drew, in order.
    std::vector<qorui::CRectArea> glyphs(qorui::CFont *_p_font) const;
    // The last frame against tests/golden/<_name>.png.
    void expect_golden(char const *_name);

private:
    qorplatform::CManualClock m_clock{10000};
    qorhost::CSoftwareRenderer m_renderer;
    qorhost::CRecordingRenderer m_recorder{&m_renderer};
    qorui::CRender m_render;
    qorui::CDesktop *mp_desktop = nullptr;
    float m_x, m_y; // where the desktop has the pointer, fractions included
};

// _actual against tests/golden/<_name>.png with a tolerance of 2 per channel; a difference image
// and the actual picture are kept in a temporary folder named in the failure. With
// QOR_UPDATE_GOLDEN=1 in the environment the golden is written instead (look at it before checking
// it in).
void expect_golden(qorhost::SImage const &_actual, std::string const &_name);

// A rectangle as "x,y wxh", and a window's place in its parent the same way.
std::string rect_text(qorui::CRectArea const &_r);
std::string place_text(qorui::CWindow const *_p_wnd);

// The name of an event type as the source writes it ("EVENT_CLICK"), so that failures read.
std::string event_name(qorui::EEventType _id);
// From now on, the name of each of the events that reaches _p_wnd goes to _log, behind the window's
// own handlers; _log must outlive the window.
void log_events(qorui::CWindow *_p_wnd, std::initializer_list<qorui::EEventType> _ids,
                std::vector<std::string> &_log);

// Records "window:EVENT_NAME" for each of the watched events that a window takes, in order.
class CEventLog {
public:
    void watch(qorui::CWindow *_p_wnd, std::vector<qorui::EEventType> const &_ids);
    // What was recorded since the last take.
    std::vector<std::string> take();

private:
    std::vector<std::string> m_lines;
};

// A Lua table written in Lua ("{ name = 'w', size = { 10, 20 } }") in the library's Lua state.
LuaPlus::LuaObject lua_table(std::string const &_chunk);
// A new empty table of the library's Lua state.
LuaPlus::LuaObject new_table();
// A window's layout: loaded from a table written in Lua, and saved to a new table.
void load_state(qorui::CWindow *_p_wnd, std::string const &_chunk);
LuaPlus::LuaObject saved_state(qorui::CWindow *_p_wnd);

} // namespace qortest
