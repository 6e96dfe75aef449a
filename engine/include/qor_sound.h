// The engine's sound system. Groups: 0 "music", 1 "world", 2 "ui", 3 "ui_music",
// 4 "effect_interaction", 5 "effect_shoot", 6 "effect_hit", 7 "effect_ai".
#pragma once
#include "qor_interfaces.h"

class ISoundSource {
public:
    // Releases the source.
    virtual ~ISoundSource() {}
    // 0 with time 0: reset; 1: start, fading in over _time ms; 3: stop, fading out over _time ms.
    virtual void set_state(int _state, float _time) = 0;
    virtual void set_option(int _option) = 0;
    virtual void set_volume(float _volume) = 0;
    virtual float get_volume(int _which) = 0;
    virtual void set_looping(bool _looping) = 0;
    virtual bool is_looping() = 0;
};

class ISoundSystem : public IInterfaceBase {
public:
    // A source playing the file (WAV); null when the file can't be loaded. The caller owns it.
    virtual ISoundSource *create_sound(char const *_file, int _group, int _flags) = 0;
};
