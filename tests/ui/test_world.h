// One world for the library's tests: a desktop of its own on the host's software renderer, with
// the default fonts of the data folder and a clock that the test holds. Input goes through the
// desktop as the engine's would (pointer moves, presses, keys, characters), frames are update and
// draw, the calls of the last frame are recorded on their way to the renderer, and a frame is
// compared with a checked-in golden picture.
#pragma once
#include "qor_platform.h"
#include "recording_renderer.h"
#include "software_renderer.h"
#include "ui_desktop.h"
#include "ui_render.h"

#include <initializer_list>
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
    // The clip areas of the last frame as "x,y wxh", in order, joined by "; ".
    std::string clips() const;
    // The quads of the last frame in the font's material: the characters it drew, in order.
    std::vector<qorui::CRectArea> glyphs(qorui::CFont *_p_font) const;
    // The last frame against tests/golden/<_name>.png.
    void expect_golden(char const *_name);

private:
    qorplatform::CManualClock m_clock{10000};
    qorhost::CSoftwareRenderer m_renderer;
    qorhost::CRecordingRenderer m_recorder{&m_renderer}; // the calls of the last frame
    qorui::CRender m_render;
    qorui::CDesktop *mp_desktop = nullptr;
    float m_x, m_y; // where the desktop has the pointer, fractions included
};

// The enumerator's name of an event, "EVENT_CLICK"; the number for a gap.
std::string event_name(qorui::EEventType _id);
// From now on, the name of each of the events that reaches _p_wnd goes to _log, behind the window's
// own handlers; _log must outlive the window.
void log_events(qorui::CWindow *_p_wnd, std::initializer_list<qorui::EEventType> _ids,
                std::vector<std::string> &_log);

// _actual against tests/golden/<_name>.png with a tolerance of 2 per channel; a difference image
// and the actual picture are kept in a temporary folder named in the failure. With
// QOR_UPDATE_GOLDEN=1 in the environment the golden is written instead (look at it before checking
// it in).
void expect_golden(qorhost::SImage const &_actual, std::string const &_name);

} // namespace qortest
