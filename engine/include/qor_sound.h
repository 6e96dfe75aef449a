// The engine's sound system: sources made from files, in groups, with their states and options.
#pragma once
#include "qor_interfaces.h"

// The groups of sounds: "music", "world", "ui", "ui_music", "effect_interaction",
// "effect_shoot", "effect_hit", "effect_ai".
enum ESoundGroup : int {
    SOUND_GROUP_MUSIC = 0,
    SOUND_GROUP_WORLD = 1,
    SOUND_GROUP_UI = 2,
    SOUND_GROUP_UI_MUSIC = 3,
    SOUND_GROUP_EFFECT_INTERACTION = 4,
    SOUND_GROUP_EFFECT_SHOOT = 5,
    SOUND_GROUP_EFFECT_HIT = 6,
    SOUND_GROUP_EFFECT_AI = 7
};

// The states of ISoundSource::set_state: reset (with time 0, before each start), start fading in
// over the time, stop fading out over the time.
enum ESoundState : int { SOUND_STATE_RESET = 0, SOUND_STATE_START = 1, SOUND_STATE_STOP = 3 };

// What the interface passes: the flags of create_sound, the option each source is given once
// right after creation, and the argument of get_volume.
// @{
int const SOUND_FLAGS_INTERFACE = 2;
int const SOUND_OPTION_INTERFACE = 1;
int const SOUND_VOLUME_OWN = 1;
// @}

// One playing sound, owned by whoever made it.
class ISoundSource {
public:
    // Releases the source.
    virtual ~ISoundSource() {}
    // One of ESoundState; _time in ms.
    virtual void set_state(int _state, float _time) = 0;
    // Called once with SOUND_OPTION_INTERFACE right after creation.
    virtual void set_option(int _option) = 0;
    // The volume; 1.0 is the file as recorded.
    virtual void set_volume(float _volume) = 0;
    // The volume that set_volume gave; _which is SOUND_VOLUME_OWN.
    virtual float get_volume(int _which) = 0;
    // Whether the sound starts again from the beginning when it ends.
    // @{
    virtual void set_looping(bool _looping) = 0;
    virtual bool is_looping() = 0;
    // @}
};

// The engine's sound: sources made from WAV files, in groups.
class ISoundSystem : public IInterfaceBase {
public:
    // A source playing the file (WAV); null when the file can't be loaded. The caller owns it.
    virtual ISoundSource *create_sound(char const *_file, int _group, int _flags) = 0;
};
