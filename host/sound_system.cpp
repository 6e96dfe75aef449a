#include "sound_system.h"

#include "qorMemoryManager.h"
#include "qorbase.h"
#include "qordebug.h"

#include <cstring>

namespace qorhost {

namespace {
uint32_t read_u32(unsigned char const *_p) {
    return _p[0] | (_p[1] << 8) | (_p[2] << 16) | (uint32_t(_p[3]) << 24);
}
uint16_t read_u16(unsigned char const *_p) {
    return static_cast<uint16_t>(_p[0] | (_p[1] << 8));
}
} // namespace

bool is_pcm_wave(unsigned char const *_p_data, unsigned _size) {
    if (!_p_data || _size < 12 || memcmp(_p_data, "RIFF", 4) != 0 || memcmp(_p_data + 8, "WAVE", 4) != 0)
        return false;
    bool has_format = false;
    bool has_data = false;
    for (unsigned pos = 12; pos + 8 <= _size;) {
        uint32_t const chunk_size = read_u32(_p_data + pos + 4);
        if (chunk_size > _size - pos - 8) return false;
        unsigned char const *p_chunk = _p_data + pos + 8;
        if (memcmp(_p_data + pos, "fmt ", 4) == 0) {
            if (chunk_size < 16) return false;
            uint16_t const format = read_u16(p_chunk);
            uint16_t const bits = read_u16(p_chunk + 14);
            has_format = format == 1 && (bits == 8 || bits == 16);
        } else if (memcmp(_p_data + pos, "data", 4) == 0) {
            has_data = true;
        }
        pos += 8 + chunk_size + (chunk_size & 1);
    }
    return has_format && has_data;
}

CSoundSource::CSoundSource(CSoundSystem *_p_system, std::string const &_file, int _group,
                           std::shared_ptr<ISoundOutput> const &_p_output, unsigned _voice)
    : mp_system(_p_system), m_file(_file), m_group(_group), m_state(SOUND_STATE_RESET), m_state_time(0.0f),
      m_option(0), m_volume(1.0f), m_looping(false), mp_output(_voice ? _p_output : nullptr),
      m_voice(_voice) {
    ++mp_system->m_live_sources;
}

CSoundSource::~CSoundSource() {
    if (m_voice) mp_output->remove_voice(m_voice);
    --mp_system->m_live_sources;
}

void CSoundSource::set_state(int _state, float _time) {
    m_state = _state;
    m_state_time = _time;
    if (_state == SOUND_STATE_START) ++mp_system->m_started;
    if (!m_voice) return;
    if (_state == SOUND_STATE_START)
        mp_output->start(m_voice, _time);
    else if (_state == SOUND_STATE_STOP)
        mp_output->stop(m_voice, _time);
    else if (_state == SOUND_STATE_RESET)
        mp_output->reset(m_voice);
}

void CSoundSource::set_volume(float _volume) {
    m_volume = _volume;
    if (m_voice) mp_output->set_volume(m_voice, _volume);
}

void CSoundSource::set_looping(bool _looping) {
    m_looping = _looping;
    if (m_voice) mp_output->set_looping(m_voice, _looping);
}

ISoundSource *CSoundSystem::create_sound(char const *_file, int _group, int) {
    void *p_content = nullptr;
    unsigned const size = GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, _file, &p_content, true);
    unsigned char const *p_wave = static_cast<unsigned char const *>(p_content);
    bool const valid = p_content && is_pcm_wave(p_wave, size);
    unsigned const voice = valid && mp_output ? mp_output->add_voice(p_wave, size) : 0;
    MMDeallocate(p_content);
    if (!valid) {
        qordebug::warning("Cannot create sound from '%s'", _file ? _file : "");
        return nullptr;
    }
    // A sound the output can't take is still a source; it is only silent.
    if (mp_output && !voice) qordebug::warning("Cannot play sound '%s'", _file);
    return new CSoundSource(this, _file, _group, mp_output, voice);
}

} // namespace qorhost
