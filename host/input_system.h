// The host's input system: lists of pointer and key listeners, and the host's own calls that
// deliver input to them in the order they were added.
#pragma once
#include "qor_input.h"

#include <vector>

namespace qorhost {

class CInputSystem : public IInputSystem {
public:
    SInterfaceUID get_uid() const override { return qor_uid::INPUT_SYSTEM; }
    int get_version() const override { return 1; }

    void add_pointer_listener(IPointerListener *_p_listener) override;
    void remove_pointer_listener(IPointerListener *_p_listener) override;
    void add_key_listener(IKeyListener *_p_listener) override;
    void remove_key_listener(IKeyListener *_p_listener) override;

    // Delivery. A listener removed during delivery hears nothing more.
    void button_down(unsigned _button);
    void button_up(unsigned _button);
    void pointer_move(vec2_t const &_movement);
    void wheel(float _rotation);
    void key_down(unsigned _key, unsigned _extra);
    void key_up(unsigned _key);
    void char_input(unsigned _code);

    unsigned get_pointer_listeners_count() const { return static_cast<unsigned>(m_pointer_listeners.size()); }
    unsigned get_key_listeners_count() const { return static_cast<unsigned>(m_key_listeners.size()); }

private:
    template <class Listener, class Call>
    void deliver(std::vector<Listener *> const &_listeners, Call _call);

    std::vector<IPointerListener *> m_pointer_listeners;
    std::vector<IKeyListener *> m_key_listeners;
};

} // namespace qorhost
