// The host's sound system, headless: sources are made from WAV files of the interface data
// (category 16), checked, and kept silent. A windowed host would play them.
#pragma once
#include "qor_sound.h"

#include <string>

namespace qorhost {

class CSoundSystem;

class CSoundSource : public ISoundSource {
public:
    CSoundSource(CSoundSystem *_p_system, std::string const &_file, int _group);
    ~CSoundSource() override;

    void set_state(int _state, float _time) override;
    void set_option(int _option) override { m_option = _option; }
    void set_volume(float _volume) override { m_volume = _volume; }
    float get_volume(int) override { return m_volume; }
    void set_looping(bool _looping) override { m_looping = _looping; }
    bool is_looping() override { return m_looping; }

    int get_state() const { return m_state; }
    float get_state_time() const { return m_state_time; }
    int get_group() const { return m_group; }
    int get_option() const { return m_option; }
    std::string const &get_file() const { return m_file; }

private:
    CSoundSystem *mp_system;
    std::string m_file;
    int m_group;
    int m_state;       // 0 reset, 1 playing, 3 stopped
    float m_state_time; // the fade time of the last change, ms
    int m_option;
    float m_volume;
    bool m_looping;
};

class CSoundSystem : public ISoundSystem {
public:
    SInterfaceUID get_uid() const override { return qor_uid::SOUND_SYSTEM; }
    int get_version() const override { return 1; }

    // Null, with a warning, when the file is missing or isn't PCM WAV.
    ISoundSource *create_sound(char const *_file, int _group, int _flags) override;

    unsigned get_live_sources() const { return m_live_sources; }
    unsigned get_started() const { return m_started; }

private:
    friend class CSoundSource;
    unsigned m_live_sources = 0;
    unsigned m_started = 0;
};

// True for a RIFF/WAVE with a PCM "fmt " chunk of 8 or 16 bits and a "data" chunk.
bool is_pcm_wave(unsigned char const *_p_data, unsigned _size);

} // namespace qorhost
