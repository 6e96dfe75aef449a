// The windowed host's sound: a mixer of PCM voices in the device's format, and the SDL2 audio
// device that pulls mixed samples from it on its own thread.
//
// A voice's WAV content (8 or 16 bits, any channels and rate) is converted once, when it is
// added, to signed 16-bit samples of the mixer's channels and rate. Mixing adds each playing
// voice's samples times its volume and its fade gain, rounds to the nearest and clips to 16 bits.
// Fades are linear: a fade in rises from 0 to 1 and a fade out falls from 1 to 0 over the given
// time, starting from the gain the voice has.
#pragma once
#include "sound_system.h"

#include <SDL.h>

#include <cstdint>
#include <map>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace qorhost {

class CSoundMixer : public ISoundOutput {
public:
    // The output format: interleaved signed 16-bit samples of _channels channels at _rate Hz.
    CSoundMixer(int _rate, int _channels);

    unsigned add_voice(unsigned char const *_p_wave, unsigned _size) override;
    void remove_voice(unsigned _voice) override;
    void start(unsigned _voice, float _fade_ms) override;
    void stop(unsigned _voice, float _fade_ms) override;
    void reset(unsigned _voice) override;
    void set_volume(unsigned _voice, float _volume) override;
    void set_looping(unsigned _voice, bool _looping) override;

    // Fills _frames frames of _p_out (frames times channels samples) with the playing voices.
    void mix(int16_t *_p_out, unsigned _frames);

    int get_rate() const { return m_rate; }
    int get_channels() const { return m_channels; }
    unsigned get_voices_count() const;
    unsigned get_playing_count() const;
    // The converted samples of a voice; empty for an unknown one.
    std::vector<int16_t> get_samples(unsigned _voice) const;

private:
    struct SVoice {
        std::vector<int16_t> m_samples; // interleaved, the mixer's format
        size_t m_frame = 0;             // the next frame to play
        float m_volume = 1.0f;
        float m_gain = 1.0f;      // the fade's
        float m_gain_step = 0.0f; // per frame; negative while fading out
        bool m_looping = false;
        bool m_playing = false;
    };

    bool convert(unsigned char const *_p_wave, unsigned _size, std::vector<int16_t> &_samples) const;
    SVoice *find(unsigned _voice);
    float gain_step(float _fade_ms) const;
    // Adds one voice into the sum; it stops at its end unless it loops, or when faded out.
    void mix_voice(SVoice &_voice, float *_p_sum, unsigned _frames) const;

    int m_rate;
    int m_channels;
    mutable std::mutex m_mutex; // the device's thread mixes while the host's changes voices
    std::map<unsigned, SVoice> m_voices;
    unsigned m_next_voice = 1;
    std::vector<float> m_sum;
};

// The default audio device, opened for 16-bit stereo at 44.1 kHz (SDL converts if the device
// differs), playing its mixer. Needs SDL's audio subsystem initialised.
class CAudioDevice {
public:
    CAudioDevice();
    ~CAudioDevice();
    CAudioDevice(CAudioDevice const &) = delete;
    CAudioDevice &operator=(CAudioDevice const &) = delete;

    // False, with SDL's reason in _error, when no device opens.
    bool open(std::string &_error);
    bool is_open() const { return m_device != 0; }
    // Shared with the sound system and its sources, which may outlive the device.
    std::shared_ptr<CSoundMixer> const &mixer() const { return mp_mixer; }

private:
    static void callback(void *_p_user, Uint8 *_p_stream, int _len);

    std::shared_ptr<CSoundMixer> mp_mixer;
    SDL_AudioDeviceID m_device = 0;
};

} // namespace qorhost
