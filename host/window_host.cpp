// The host in an SDL2 window: keys as Windows virtual-key codes, text as character codes, SDL's
// events delivered as the library's input, and frames shown in the window on the real clock.
#include "window_host.h"

#include "host.h"
#include "sdl_audio.h"
#include "sdl_renderer.h"

#include "qordebug.h"

#include <cstdio>
#include <utility>

namespace qorhost {

namespace {

// The library's desktop, whatever the screen's size.
float const k_desktop_w = 1024.0f;
float const k_desktop_h = 768.0f;
unsigned const k_frames_per_second = 60;

struct SKeyCode {
    int m_sdl; // SDL_Keycode or SDL_Scancode
    unsigned m_vk;
};

// Keys that aren't letters, digits or function keys, by meaning.
SKeyCode const k_keys[] = {
    {SDLK_BACKSPACE, 0x08},   {SDLK_TAB, 0x09},       {SDLK_RETURN, 0x0D},       {SDLK_KP_ENTER, 0x0D},
    {SDLK_LSHIFT, 0x10},      {SDLK_RSHIFT, 0x10},    {SDLK_LCTRL, 0x11},        {SDLK_RCTRL, 0x11},
    {SDLK_LALT, 0x12},        {SDLK_RALT, 0x12},      {SDLK_PAUSE, 0x13},        {SDLK_CAPSLOCK, 0x14},
    {SDLK_ESCAPE, 0x1B},      {SDLK_SPACE, 0x20},     {SDLK_PAGEUP, 0x21},       {SDLK_PAGEDOWN, 0x22},
    {SDLK_END, 0x23},         {SDLK_HOME, 0x24},      {SDLK_LEFT, 0x25},         {SDLK_UP, 0x26},
    {SDLK_RIGHT, 0x27},       {SDLK_DOWN, 0x28},      {SDLK_PRINTSCREEN, 0x2C},  {SDLK_INSERT, 0x2D},
    {SDLK_DELETE, 0x2E},      {SDLK_LGUI, 0x5B},      {SDLK_RGUI, 0x5C},         {SDLK_APPLICATION, 0x5D},
    {SDLK_KP_0, 0x60},        {SDLK_KP_1, 0x61},      {SDLK_KP_2, 0x62},         {SDLK_KP_3, 0x63},
    {SDLK_KP_4, 0x64},        {SDLK_KP_5, 0x65},      {SDLK_KP_6, 0x66},         {SDLK_KP_7, 0x67},
    {SDLK_KP_8, 0x68},        {SDLK_KP_9, 0x69},      {SDLK_KP_MULTIPLY, 0x6A},  {SDLK_KP_PLUS, 0x6B},
    {SDLK_KP_MINUS, 0x6D},    {SDLK_KP_PERIOD, 0x6E}, {SDLK_KP_DIVIDE, 0x6F},    {SDLK_NUMLOCKCLEAR, 0x90},
    {SDLK_SCROLLLOCK, 0x91},  {SDLK_SEMICOLON, 0xBA}, {SDLK_EQUALS, 0xBB},       {SDLK_COMMA, 0xBC},
    {SDLK_MINUS, 0xBD},       {SDLK_PERIOD, 0xBE},    {SDLK_SLASH, 0xBF},        {SDLK_BACKQUOTE, 0xC0},
    {SDLK_LEFTBRACKET, 0xDB}, {SDLK_BACKSLASH, 0xDC}, {SDLK_RIGHTBRACKET, 0xDD}, {SDLK_QUOTE, 0xDE},
};

// The punctuation keys by their place on a US keyboard.
SKeyCode const k_places[] = {
    {SDL_SCANCODE_SEMICOLON, 0xBA},    {SDL_SCANCODE_EQUALS, 0xBB},      {SDL_SCANCODE_COMMA, 0xBC},
    {SDL_SCANCODE_MINUS, 0xBD},        {SDL_SCANCODE_PERIOD, 0xBE},      {SDL_SCANCODE_SLASH, 0xBF},
    {SDL_SCANCODE_GRAVE, 0xC0},        {SDL_SCANCODE_LEFTBRACKET, 0xDB}, {SDL_SCANCODE_BACKSLASH, 0xDC},
    {SDL_SCANCODE_RIGHTBRACKET, 0xDD}, {SDL_SCANCODE_APOSTROPHE, 0xDE},  {SDL_SCANCODE_NONUSBACKSLASH, 0xE2},
};

template <size_t N>
unsigned look_up(SKeyCode const (&_table)[N], int _code) {
    for (SKeyCode const &entry : _table)
        if (entry.m_sdl == _code) return entry.m_vk;
    return 0;
}

// The code point of the sequence at _p_text, moving past it; 0xFFFFFFFF for a broken sequence,
// after which the next byte is read afresh.
unsigned next_code_point(unsigned char const *&_p_text) {
    unsigned char const lead = *_p_text++;
    int follow = lead < 0x80             ? 0
                 : (lead & 0xE0) == 0xC0 ? 1
                 : (lead & 0xF0) == 0xE0 ? 2
                 : (lead & 0xF8) == 0xF0 ? 3
                                         : -1;
    if (follow < 0) return 0xFFFFFFFFu;
    unsigned code = follow == 0 ? lead : lead & (0x3Fu >> follow);
    for (; follow > 0; --follow) {
        if ((*_p_text & 0xC0) != 0x80) return 0xFFFFFFFFu;
        code = (code << 6) | (*_p_text++ & 0x3Fu);
    }
    return code;
}

// SDL's buttons are 1 left, 2 middle, 3 right, then the side buttons; the library's 0 left,
// 1 right, 2 middle.
unsigned library_button(Uint8 _button) {
    switch (_button) {
    case SDL_BUTTON_LEFT:
        return 0;
    case SDL_BUTTON_RIGHT:
        return 1;
    case SDL_BUTTON_MIDDLE:
        return 2;
    default:
        return _button - 1u;
    }
}

void deliver_key(SDL_KeyboardEvent const &_key, bool _down, CInputSystem &_input, bool &_delivered) {
    unsigned const vk = virtual_key(_key.keysym.sym, _key.keysym.scancode);
    if (!vk) return;
    if (_down)
        _input.key_down(vk, _key.repeat ? 1u : 0u);
    else
        _input.key_up(vk);
    _delivered = true;
}

} // namespace

unsigned virtual_key(SDL_Keycode _key, SDL_Scancode _place) {
    if (_key >= SDLK_a && _key <= SDLK_z) return 'A' + static_cast<unsigned>(_key - SDLK_a);
    if (_key >= SDLK_0 && _key <= SDLK_9) return '0' + static_cast<unsigned>(_key - SDLK_0);
    if (_key >= SDLK_F1 && _key <= SDLK_F12) return 0x70 + static_cast<unsigned>(_key - SDLK_F1);
    if (_key >= SDLK_F13 && _key <= SDLK_F24) return 0x7C + static_cast<unsigned>(_key - SDLK_F13);
    if (unsigned const vk = look_up(k_keys, _key)) return vk;
    return look_up(k_places, _place);
}

std::vector<unsigned> utf8_characters(char const *_text) {
    std::vector<unsigned> characters;
    unsigned char const *p_text = reinterpret_cast<unsigned char const *>(_text ? _text : "");
    while (*p_text) {
        unsigned const code = next_code_point(p_text);
        if (code <= 0xFFFF) characters.push_back(code);
    }
    return characters;
}

bool deliver_input(SDL_Event const &_event, CInputSystem &_input, vec2_t const &_scale) {
    bool delivered = false;
    switch (_event.type) {
    case SDL_MOUSEMOTION:
        if (_event.motion.xrel == 0 && _event.motion.yrel == 0) break;
        _input.pointer_move(vec2_t{_event.motion.xrel * _scale.x, _event.motion.yrel * _scale.y});
        delivered = true;
        break;
    case SDL_MOUSEBUTTONDOWN:
    case SDL_MOUSEBUTTONUP: {
        unsigned const button = library_button(_event.button.button);
        if (_event.type == SDL_MOUSEBUTTONDOWN)
            _input.button_down(button);
        else
            _input.button_up(button);
        delivered = true;
        break;
    }
    case SDL_MOUSEWHEEL: {
        float const sign = _event.wheel.direction == SDL_MOUSEWHEEL_FLIPPED ? -1.0f : 1.0f;
        if (_event.wheel.preciseY == 0.0f) break;
        _input.wheel(sign * _event.wheel.preciseY);
        delivered = true;
        break;
    }
    case SDL_KEYDOWN:
    case SDL_KEYUP:
        deliver_key(_event.key, _event.type == SDL_KEYDOWN, _input, delivered);
        break;
    case SDL_TEXTINPUT:
        for (unsigned code : utf8_characters(_event.text.text)) {
            _input.char_input(code);
            delivered = true;
        }
        break;
    default:
        break;
    }
    return delivered;
}

CWindowHost::CWindowHost(CHost &_host) : m_host(_host) {}

CWindowHost::~CWindowHost() {
    close();
}

bool CWindowHost::open(std::string &_error) {
    if (mp_window) return true;
    if (SDL_InitSubSystem(SDL_INIT_VIDEO) != 0) {
        _error = SDL_GetError();
        return false;
    }
    m_video = true;
    SHostOptions const &options = m_host.options();
    mp_window = SDL_CreateWindow("qorhost", SDL_WINDOWPOS_CENTERED, SDL_WINDOWPOS_CENTERED, options.m_w,
                                 options.m_h, 0);
    if (mp_window) mp_renderer = SDL_CreateRenderer(mp_window, -1, SDL_RENDERER_PRESENTVSYNC);
    // Without an accelerated renderer, SDL's own draws into the window's surface.
    if (mp_window && !mp_renderer) mp_renderer = SDL_CreateRenderer(mp_window, -1, SDL_RENDERER_SOFTWARE);
    if (!mp_renderer) {
        _error = SDL_GetError();
        close();
        return false;
    }
    mp_screen = std::make_unique<CSdlRenderer>(mp_renderer, options.m_w, options.m_h);
    m_host.use_renderer(*mp_screen);
    std::string const driver = "Window renderer: " + mp_screen->get_driver();
    m_host.log().create_logger("Window", "")->write(driver.c_str(), 0);
    m_scale =
        vec2_t{k_desktop_w / static_cast<float>(options.m_w), k_desktop_h / static_cast<float>(options.m_h)};
    // Relative mode hides the cursor and keeps the mouse in the window, so every movement arrives;
    // where it isn't supported the cursor is hidden over the window.
    if (SDL_SetRelativeMouseMode(SDL_TRUE) != 0) SDL_ShowCursor(SDL_DISABLE);
    SDL_StartTextInput();
    open_audio();
    return true;
}

void CWindowHost::open_audio() {
    if (SDL_InitSubSystem(SDL_INIT_AUDIO) != 0) {
        qordebug::warning("No sound: %s", SDL_GetError());
        return;
    }
    m_audio = true;
    mp_audio = std::make_unique<CAudioDevice>();
    std::string error;
    if (!mp_audio->open(error)) {
        qordebug::warning("No sound: %s", error.c_str());
        mp_audio.reset();
        return;
    }
    m_host.sound().set_output(mp_audio->mixer());
}

bool CWindowHost::has_audio() const {
    return mp_audio && mp_audio->is_open();
}

// The sources that still live keep the mixer; only the device goes.
void CWindowHost::close() {
    if (mp_audio) m_host.sound().set_output(nullptr);
    mp_audio.reset();
    if (m_audio) SDL_QuitSubSystem(SDL_INIT_AUDIO);
    m_audio = false;
    // The host draws headless again before the renderer goes.
    if (mp_screen) m_host.use_renderer(m_host.renderer());
    mp_screen.reset();
    if (mp_renderer) SDL_DestroyRenderer(mp_renderer);
    if (mp_window) SDL_DestroyWindow(mp_window);
    mp_renderer = nullptr;
    mp_window = nullptr;
    if (m_video) SDL_QuitSubSystem(SDL_INIT_VIDEO);
    m_video = false;
}

void CWindowHost::poll_events() {
    SDL_Event event;
    while (SDL_PollEvent(&event)) {
        bool const closing = event.type == SDL_QUIT ||
                             (event.type == SDL_WINDOWEVENT && event.window.event == SDL_WINDOWEVENT_CLOSE);
        if (closing)
            m_closed = true;
        else
            deliver_input(event, m_host.input(), m_scale);
    }
}

bool CWindowHost::step() {
    if (!mp_window || m_closed) return false;
    poll_events();
    if (m_closed) return false;
    m_host.frame(); // the renderer shows it
    ++m_presented;
    return true;
}

// Frames are due at a steady rate; a frame that comes early waits for its time, and a run that
// falls behind by more than a frame starts its count again rather than rushing to catch up.
unsigned CWindowHost::run(unsigned _frames) {
    unsigned const first = m_presented;
    Uint64 const period = SDL_GetPerformanceFrequency() / k_frames_per_second;
    Uint64 due = SDL_GetPerformanceCounter();
    while (_frames == 0 || m_presented - first < _frames) {
        if (!step()) break;
        due += period;
        Uint64 const now = SDL_GetPerformanceCounter();
        if (now < due)
            SDL_Delay(static_cast<Uint32>((due - now) * 1000 / SDL_GetPerformanceFrequency()));
        else if (now - due > period)
            due = now;
    }
    return m_presented - first;
}

int run_window(CHost &_host) {
    CWindowHost window(_host);
    std::string error;
    if (!window.open(error)) {
        fprintf(stderr, "qorhost: the window doesn't open: %s\n", error.c_str());
        return 3;
    }
    if (!_host.start()) return 1;
    window.run(_host.options().m_frames);
    _host.finish();
    return 0;
}

} // namespace qorhost
