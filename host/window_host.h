// The host in an SDL2 window: each frame the window's events go to the host's input system and
// the host runs its frame, drawn by SDL's renderer (on the GPU where there is one) in place of the
// software renderer; the sound system plays through the audio device.
//
// Input as the library expects it: pointer movement as relative deltas in desktop pixels (the
// library's desktop is 1024 by 768, so the window's pixels are scaled to it), buttons 0 left,
// 1 right, 2 middle, wheel notches positive away from the user, keys as Windows virtual-key codes
// and typed text as character codes. The mouse is held in relative mode and the system's cursor
// hidden: the library draws its own pointer.
#pragma once
#include "qor_math.h"

#include <SDL.h>

#include <memory>
#include <string>
#include <vector>

namespace qorhost {

class CAudioDevice;
class CHost;
class CInputSystem;
class CSdlRenderer;

// The Windows virtual-key code of a key, 0 for a key without one. A key is taken by its meaning
// (_key); a punctuation key whose symbol has no code is taken by its place (_place) on a US
// keyboard, so the key left of 1 is the console key, 0xC0, on layouts with another symbol there.
unsigned virtual_key(SDL_Keycode _key, SDL_Scancode _place);

// The character codes of UTF-8 text; code points above the 16-bit range and broken sequences
// are left out.
std::vector<unsigned> utf8_characters(char const *_text);

// Delivers an input event to the input system, movement multiplied by _scale; false for an event
// that isn't input or has nothing to deliver. A key's extra value is 1 for a repeat of a held key.
bool deliver_input(SDL_Event const &_event, CInputSystem &_input, vec2_t const &_scale);

class CWindowHost {
public:
    explicit CWindowHost(CHost &_host);
    ~CWindowHost();
    CWindowHost(CWindowHost const &) = delete;
    CWindowHost &operator=(CWindowHost const &) = delete;

    // SDL's video, a window of the host's screen size and its renderer, which the host draws with
    // from now on; false, with SDL's reason in _error, when any fails. The log names SDL's driver.
    // Sound goes to the audio device when one opens, otherwise the sources stay silent and a
    // warning says why.
    bool open(std::string &_error);
    // Frames until the window is closed or, when _frames isn't 0, _frames of them, 60 a second
    // while they are drawn in time. Result the number presented.
    unsigned run(unsigned _frames);
    // The events, then a frame shown; false, with nothing shown, once the window is closed.
    bool step();

    unsigned get_presented() const { return m_presented; }
    bool is_closed() const { return m_closed; }
    bool has_audio() const;
    SDL_Window *window() const { return mp_window; }
    SDL_Renderer *renderer() const { return mp_renderer; }
    CSdlRenderer *screen() const { return mp_screen.get(); }

private:
    void open_audio();
    void poll_events();
    void close();

    CHost &m_host;
    bool m_video = false; // SDL's video subsystem was started here
    bool m_audio = false; // and its audio subsystem
    SDL_Window *mp_window = nullptr;
    SDL_Renderer *mp_renderer = nullptr;
    std::unique_ptr<CSdlRenderer> mp_screen; // the host's renderer while the window is open
    std::unique_ptr<CAudioDevice> mp_audio;
    vec2_t m_scale = {1.0f, 1.0f}; // window pixels to desktop pixels
    unsigned m_presented = 0;
    bool m_closed = false;
};

// qorhost --window: the host's run in a window. Result 0; 1 without a service, 3 when the window
// doesn't open.
int run_window(CHost &_host);

} // namespace qorhost
