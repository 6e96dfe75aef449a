// Sound through SDL2: the mixer that converts WAV files to its rate and channels and mixes the
// playing voices with their volume, fades and looping, and the audio device that it feeds.
#include "sdl_audio.h"

#include <algorithm>
#include <cmath>
#include <cstring>

namespace qorhost {

namespace {
int const k_device_rate = 44100;
int const k_device_channels = 2;
Uint16 const k_device_buffer_frames = 1024;

int16_t clip(float _sample) {
    long const rounded = std::lround(_sample);
    return static_cast<int16_t>(std::min(std::max(rounded, -32768L), 32767L));
}
} // namespace

CSoundMixer::CSoundMixer(int _rate, int _channels) : m_rate(_rate), m_channels(_channels) {}

// SDL reads the WAV (PCM of 8 or 16 bits) and converts its samples to the mixer's format.
bool CSoundMixer::convert(unsigned char const *_p_wave, unsigned _size,
                          std::vector<int16_t> &_samples) const {
    SDL_RWops *p_rw = SDL_RWFromConstMem(_p_wave, static_cast<int>(_size));
    SDL_AudioSpec spec;
    Uint8 *p_buffer = nullptr;
    Uint32 length = 0;
    if (!p_rw || !SDL_LoadWAV_RW(p_rw, 1, &spec, &p_buffer, &length)) return false;
    SDL_AudioCVT cvt;
    int const needed = SDL_BuildAudioCVT(&cvt, spec.format, spec.channels, spec.freq, AUDIO_S16SYS,
                                         static_cast<Uint8>(m_channels), m_rate);
    if (needed < 0) {
        SDL_FreeWAV(p_buffer);
        return false;
    }
    std::vector<Uint8> work(static_cast<size_t>(length) * (needed ? cvt.len_mult : 1));
    if (length) memcpy(work.data(), p_buffer, length);
    SDL_FreeWAV(p_buffer);
    size_t converted = length;
    if (needed) {
        cvt.buf = work.data();
        cvt.len = static_cast<int>(length);
        if (SDL_ConvertAudio(&cvt) != 0) return false;
        converted = static_cast<size_t>(cvt.len_cvt);
    }
    size_t const frame_bytes = sizeof(int16_t) * static_cast<size_t>(m_channels);
    _samples.resize(converted / frame_bytes * m_channels);
    if (!_samples.empty()) memcpy(_samples.data(), work.data(), _samples.size() * sizeof(int16_t));
    return true;
}

unsigned CSoundMixer::add_voice(unsigned char const *_p_wave, unsigned _size) {
    SVoice voice;
    if (!_p_wave || !convert(_p_wave, _size, voice.m_samples)) return 0;
    std::lock_guard<std::mutex> lock(m_mutex);
    unsigned const id = m_next_voice++;
    m_voices[id] = std::move(voice);
    return id;
}

void CSoundMixer::remove_voice(unsigned _voice) {
    std::lock_guard<std::mutex> lock(m_mutex);
    m_voices.erase(_voice);
}

CSoundMixer::SVoice *CSoundMixer::find(unsigned _voice) {
    auto const it = m_voices.find(_voice);
    return it == m_voices.end() ? nullptr : &it->second;
}

// The gain's change per frame for a fade over _fade_ms; 0 for a fade shorter than a frame.
float CSoundMixer::gain_step(float _fade_ms) const {
    float const frames = _fade_ms * static_cast<float>(m_rate) / 1000.0f;
    return frames >= 1.0f ? 1.0f / frames : 0.0f;
}

void CSoundMixer::start(unsigned _voice, float _fade_ms) {
    std::lock_guard<std::mutex> lock(m_mutex);
    SVoice *p_voice = find(_voice);
    if (!p_voice) return;
    float const step = gain_step(_fade_ms);
    if (!p_voice->m_playing) {
        p_voice->m_frame = 0;
        p_voice->m_gain = step > 0.0f ? 0.0f : 1.0f;
    } else if (step == 0.0f) {
        p_voice->m_gain = 1.0f;
    }
    p_voice->m_gain_step = step;
    p_voice->m_playing = true;
}

void CSoundMixer::stop(unsigned _voice, float _fade_ms) {
    std::lock_guard<std::mutex> lock(m_mutex);
    SVoice *p_voice = find(_voice);
    if (!p_voice || !p_voice->m_playing) return;
    float const step = gain_step(_fade_ms);
    if (step > 0.0f)
        p_voice->m_gain_step = -step;
    else
        p_voice->m_playing = false;
}

void CSoundMixer::reset(unsigned _voice) {
    std::lock_guard<std::mutex> lock(m_mutex);
    if (SVoice *p_voice = find(_voice)) {
        p_voice->m_playing = false;
        p_voice->m_frame = 0;
    }
}

void CSoundMixer::set_volume(unsigned _voice, float _volume) {
    std::lock_guard<std::mutex> lock(m_mutex);
    if (SVoice *p_voice = find(_voice)) p_voice->m_volume = std::max(_volume, 0.0f);
}

void CSoundMixer::set_looping(unsigned _voice, bool _looping) {
    std::lock_guard<std::mutex> lock(m_mutex);
    if (SVoice *p_voice = find(_voice)) p_voice->m_looping = _looping;
}

void CSoundMixer::mix_voice(SVoice &_voice, float *_p_sum, unsigned _frames) const {
    size_t const channels = static_cast<size_t>(m_channels);
    size_t const frames_count = _voice.m_samples.size() / channels;
    if (frames_count == 0) _voice.m_playing = false;
    for (unsigned f = 0; f < _frames && _voice.m_playing; ++f) {
        float const factor = _voice.m_volume * _voice.m_gain;
        int16_t const *p_in = &_voice.m_samples[_voice.m_frame * channels];
        for (size_t c = 0; c < channels; ++c)
            _p_sum[f * channels + c] += static_cast<float>(p_in[c]) * factor;
        if (++_voice.m_frame == frames_count) {
            _voice.m_frame = 0;
            _voice.m_playing = _voice.m_looping;
        }
        _voice.m_gain += _voice.m_gain_step;
        if (_voice.m_gain_step > 0.0f && _voice.m_gain >= 1.0f) {
            _voice.m_gain = 1.0f;
            _voice.m_gain_step = 0.0f;
        } else if (_voice.m_gain_step < 0.0f && _voice.m_gain <= 0.0f) {
            _voice.m_gain = 0.0f;
            _voice.m_playing = false;
        }
    }
}

void CSoundMixer::mix(int16_t *_p_out, unsigned _frames) {
    std::lock_guard<std::mutex> lock(m_mutex);
    size_t const count = static_cast<size_t>(_frames) * m_channels;
    m_sum.assign(count, 0.0f);
    for (auto &entry : m_voices)
        if (entry.second.m_playing) mix_voice(entry.second, m_sum.data(), _frames);
    for (size_t i = 0; i < count; ++i)
        _p_out[i] = clip(m_sum[i]);
}

unsigned CSoundMixer::get_voices_count() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    return static_cast<unsigned>(m_voices.size());
}

unsigned CSoundMixer::get_playing_count() const {
    std::lock_guard<std::mutex> lock(m_mutex);
    return static_cast<unsigned>(std::count_if(m_voices.begin(), m_voices.end(),
                                               [](auto const &_entry) { return _entry.second.m_playing; }));
}

std::vector<int16_t> CSoundMixer::get_samples(unsigned _voice) const {
    std::lock_guard<std::mutex> lock(m_mutex);
    auto const it = m_voices.find(_voice);
    return it == m_voices.end() ? std::vector<int16_t>() : it->second.m_samples;
}

CAudioDevice::CAudioDevice() : mp_mixer(std::make_shared<CSoundMixer>(k_device_rate, k_device_channels)) {}

CAudioDevice::~CAudioDevice() {
    if (m_device) SDL_CloseAudioDevice(m_device);
}

bool CAudioDevice::open(std::string &_error) {
    if (m_device) return true;
    SDL_AudioSpec wanted;
    SDL_zero(wanted);
    wanted.freq = k_device_rate;
    wanted.format = AUDIO_S16SYS;
    wanted.channels = k_device_channels;
    wanted.samples = k_device_buffer_frames;
    wanted.callback = callback;
    wanted.userdata = this;
    // No changes allowed: SDL converts from this format to whatever the device has.
    SDL_AudioSpec obtained;
    m_device = SDL_OpenAudioDevice(nullptr, 0, &wanted, &obtained, 0);
    if (!m_device) {
        _error = SDL_GetError();
        return false;
    }
    SDL_PauseAudioDevice(m_device, 0);
    return true;
}

void CAudioDevice::callback(void *_p_user, Uint8 *_p_stream, int _len) {
    CSoundMixer &mixer = *static_cast<CAudioDevice *>(_p_user)->mp_mixer;
    unsigned const frame_bytes = sizeof(int16_t) * static_cast<unsigned>(mixer.get_channels());
    mixer.mix(reinterpret_cast<int16_t *>(_p_stream), static_cast<unsigned>(_len) / frame_bytes);
}

} // namespace qorhost
