// The engine's input system: pointer and key listeners. Key codes are Windows virtual-key codes
// (0xC0 is the console key); characters are code points of the 16-bit range.
#pragma once
#include "qor_interfaces.h"
#include "qor_math.h"

// Hears the pointer: movement, buttons and the wheel.
class IPointerListener {
public:
    // A button goes down or up: 0 left, 1 right, 2 middle.
    // @{
    virtual void on_button_down(unsigned /*_button*/) {}
    virtual void on_button_up(unsigned /*_button*/) {}
    // @}
    // A held button repeats; the library doesn't listen to it.
    virtual void on_button_repeat(int /*_button*/) {}
    // The pointer moved by _movement, relative, in screen pixels.
    virtual void on_pointer_move(vec2_t const & /*_movement*/) {}
    // The wheel turned by _rotation notches, positive away from the user.
    virtual void on_wheel(float /*_rotation*/) {}

protected:
    virtual ~IPointerListener() {}
};

// Hears the keyboard: keys as Windows virtual-key codes, and characters.
class IKeyListener {
public:
    // A key goes down: _key is its virtual-key code, _extra further data of the engine, passed on
    // with the key.
    virtual void on_key_down(unsigned /*_key*/, unsigned /*_extra*/) {}
    // The key goes up.
    virtual void on_key_up(unsigned /*_key*/) {}
    // A held key repeats; the library doesn't listen to it.
    virtual void on_key_repeat(int /*_key*/) {}
    // A typed character, as a 16-bit code point.
    virtual void on_char(unsigned /*_code*/) {}

protected:
    virtual ~IKeyListener() {}
};

// The engine's input: it calls the listeners added to it.
class IInputSystem : public IInterfaceBase {
public:
    // Adds or removes a listener; the caller keeps ownership and removes it before it goes.
    // @{
    virtual void add_pointer_listener(IPointerListener *_p_listener) = 0;
    virtual void remove_pointer_listener(IPointerListener *_p_listener) = 0;
    virtual void add_key_listener(IKeyListener *_p_listener) = 0;
    virtual void remove_key_listener(IKeyListener *_p_listener) = 0;
    // @}
};
