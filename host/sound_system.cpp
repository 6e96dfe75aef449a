#include "sound_system.h"

#include "qorMemoryManager.h"
#include "qorbase.h"
#include "qordebug.h"

#include <cstring>

namespace qorhost {

namespace {
uint32_t read_u32(unsigned char const *_p) { return _p[0] | (_p[1] << 8) | (_p[2] << 16) | (uint32_t(_p[3]) << 24); }
uint16_t read_u16(unsigned char const *_p) { return static_cast<uint16_t>(_p[0] | (_p[1] << 8)); }
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

CSoundSource::CSoundSource(CSoundSystem *_p_system, std::string const &_file, int _group)
    : mp_system(_p_system), m_file(_file), m_group(_group), m_state(0), m_state_time(0.0f), m_option(0),
      m_volume(1.0f), m_looping(false) {
    ++mp_system->m_live_sources;
}

CSoundSource::~CSoundSource() { --mp_system->m_live_sources; }

void CSoundSource::set_state(int _state, float _time) {
    m_state = _state;
    m_state_time = _time;
    if (_state == 1) ++mp_system->m_started;
}

ISoundSource *CSoundSystem::create_sound(char const *_file, int _group, int) {
    void *p_content = nullptr;
    unsigned const size = GetFileSystem()->load_file(qorbase::FILE_CATEGORY_UI, _file, &p_content, true);
    bool const valid = p_content && is_pcm_wave(static_cast<unsigned char const *>(p_content), size);
    MMDeallocate(p_content);
    if (!valid) {
        qordebug::warning("Cannot create sound from '%s'", _file ? _file : "");
        return nullptr;
    }
    return new CSoundSource(this, _file, _group);
}

} // namespace qorhost
