// The host's sound system: sources are made from WAV files of the interface data (category 16)
// and checked. Headless they stay silent; a windowed host gives the system an output, a mixer
// on the audio device, that plays them.
#pragma once
#include "qor_sound.h"

#include <memory>
#include <string>

namespace qorhost {

class CSoundSystem;

// Where sources are heard. A voice is the sound of one source; 0 is no voice, and calls with a
// voice the output doesn't know do nothing.
class ISoundOutput {
public:
    virtual ~ISoundOutput() {}
    // A voice for the content of a PCM WAV file; 0 when it can't be played.
    virtual unsigned add_voice(unsigned char const *_p_wave, unsigned _size) = 0;
    virtual void remove_voice(unsigned _voice) = 0;
    // Plays from the start, or from where it is if still playing, fading in over _fade_ms.
    virtual void start(unsigned _voice, float _fade_ms) = 0;
    // Stops after fading out over _fade_ms; at once for 0.
    virtual void stop(unsigned _voice, float _fade_ms) = 0;
    // Silent at once, back at the start.
    virtual void reset(unsigned _voice) = 0;
    virtual void set_volume(unsigned _voice, float _volume) = 0;
    virtual void set_looping(unsigned _voice, bool _looping) = 0;
};

class CSoundSource : public ISoundSource {
public:
    // _voice: the source's voice on _p_output, 0 for none.
    CSoundSource(CSoundSystem *_p_system, std::string const &_file, int _group,
                 std::shared_ptr<ISoundOutput> const &_p_output, unsigned _voice);
    ~CSoundSource() override;

    void set_state(int _state, float _time) override;
    void set_option(int _option) override { m_option = _option; }
    void set_volume(float _volume) override;
    float get_volume(int) override { return m_volume; }
    void set_looping(bool _looping) override;
    bool is_looping() override { return m_looping; }

    int get_state() const { return m_state; }
    float get_state_time() const { return m_state_time; }
    int get_group() const { return m_group; }
    int get_option() const { return m_option; }
    std::string const &get_file() const { return m_file; }
    unsigned get_voice() const { return m_voice; }

private:
    CSoundSystem *mp_system;
    std::string m_file;
    int m_group;
    int m_state;        // 0 reset, 1 playing, 3 stopped
    float m_state_time; // the fade time of the last change, ms
    int m_option;
    float m_volume;
    bool m_looping;
    std::shared_ptr<ISoundOutput> mp_output; // the output the source was made with, kept while it lives
    unsigned m_voice;
};

class CSoundSystem : public ISoundSystem {
public:
    SInterfaceUID get_uid() const override { return qor_uid::SOUND_SYSTEM; }
    int get_version() const override { return 1; }

    // Null, with a warning, when the file is missing or isn't PCM WAV.
    ISoundSource *create_sound(char const *_file, int _group, int _flags) override;

    // The output that plays the sources made from now on; null for silence. A source keeps the
    // output it was made with.
    void set_output(std::shared_ptr<ISoundOutput> const &_p_output) { mp_output = _p_output; }
    std::shared_ptr<ISoundOutput> const &get_output() const { return mp_output; }

    unsigned get_live_sources() const { return m_live_sources; }
    unsigned get_started() const { return m_started; }

private:
    friend class CSoundSource;
    std::shared_ptr<ISoundOutput> mp_output;
    unsigned m_live_sources = 0;
    unsigned m_started = 0;
};

// True for a RIFF/WAVE with a PCM "fmt " chunk of 8 or 16 bits and a "data" chunk.
bool is_pcm_wave(unsigned char const *_p_data, unsigned _size);

} // namespace qorhost
