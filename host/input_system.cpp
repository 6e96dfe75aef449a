// The host's input system: the lists of pointer and key listeners and the delivery of input to
// them, in the order they were added.
#include "input_system.h"

#include <algorithm>

namespace qorhost {

namespace {
template <class Listener>
void add_once(std::vector<Listener *> &_listeners, Listener *_p_listener) {
    if (_p_listener && std::find(_listeners.begin(), _listeners.end(), _p_listener) == _listeners.end())
        _listeners.push_back(_p_listener);
}
template <class Listener>
void remove_from(std::vector<Listener *> &_listeners, Listener *_p_listener) {
    _listeners.erase(std::remove(_listeners.begin(), _listeners.end(), _p_listener), _listeners.end());
}
} // namespace

void CInputSystem::add_pointer_listener(IPointerListener *_p_listener) { add_once(m_pointer_listeners, _p_listener); }
void CInputSystem::remove_pointer_listener(IPointerListener *_p_listener) {
    remove_from(m_pointer_listeners, _p_listener);
}
void CInputSystem::add_key_listener(IKeyListener *_p_listener) { add_once(m_key_listeners, _p_listener); }
void CInputSystem::remove_key_listener(IKeyListener *_p_listener) { remove_from(m_key_listeners, _p_listener); }

// Walks a copy, and skips listeners that left the live list on the way.
template <class Listener, class Call>
void CInputSystem::deliver(std::vector<Listener *> const &_listeners, Call _call) {
    std::vector<Listener *> const snapshot = _listeners;
    for (Listener *p_listener : snapshot)
        if (std::find(_listeners.begin(), _listeners.end(), p_listener) != _listeners.end()) _call(p_listener);
}

void CInputSystem::button_down(unsigned _button) {
    deliver(m_pointer_listeners, [&](IPointerListener *_p) { _p->on_button_down(_button); });
}
void CInputSystem::button_up(unsigned _button) {
    deliver(m_pointer_listeners, [&](IPointerListener *_p) { _p->on_button_up(_button); });
}
void CInputSystem::pointer_move(vec2_t const &_movement) {
    deliver(m_pointer_listeners, [&](IPointerListener *_p) { _p->on_pointer_move(_movement); });
}
void CInputSystem::wheel(float _rotation) {
    deliver(m_pointer_listeners, [&](IPointerListener *_p) { _p->on_wheel(_rotation); });
}
void CInputSystem::key_down(unsigned _key, unsigned _extra) {
    deliver(m_key_listeners, [&](IKeyListener *_p) { _p->on_key_down(_key, _extra); });
}
void CInputSystem::key_up(unsigned _key) {
    deliver(m_key_listeners, [&](IKeyListener *_p) { _p->on_key_up(_key); });
}
void CInputSystem::char_input(unsigned _code) {
    deliver(m_key_listeners, [&](IKeyListener *_p) { _p->on_char(_code); });
}

} // namespace qorhost
