// The buffered file reader of the library's loaders. The engine lends the buffer; the reader keeps
// one window of the file in it and refills it from the stream when a read leaves that window.
#include "qorbase.h"

#include "qordebug.h"
#include "ui_debug.h"

#include <algorithm>
#include <cstring>

CCachedFileReader::CCachedFileReader(IFileReader *_p_fr, bool _owns_reader)
    : m_owns_reader(_owns_reader), mp_reader(_p_fr), mp_cache(nullptr), m_cache_start(0), m_cache_size(0),
      m_cache_filled(0), m_pos(0) {
    QOR_CHECK(_p_fr);
    if (!cache_create(&mp_cache, &m_cache_size)) {
        mp_cache = nullptr;
        m_cache_size = 0;
        qordebug::error("%s: failed to create cache", "CCachedFileReader::CCachedFileReader");
    }
}

// The stream is deleted through its own virtual destructor, so it goes back to the heap it came from.
CCachedFileReader::~CCachedFileReader() {
    if (m_owns_reader) delete mp_reader;
    if (mp_cache) cache_release(mp_cache);
}

bool CCachedFileReader::read(void *_p_dst, unsigned _count) {
    if (!mp_reader || m_pos >= mp_reader->m_size) return false;
    if (!QOR_CHECK(_p_dst || !_count)) return false;
    unsigned char *p_dst = static_cast<unsigned char *>(_p_dst);
    unsigned delivered = 0;
    for (;;) {
        bool const in_cache = m_pos >= m_cache_start && m_pos < m_cache_start + m_cache_filled;
        if (!in_cache && mp_cache) {
            mp_reader->seek(m_pos);
            m_cache_start = m_pos;
            m_cache_filled = mp_reader->read(m_cache_size, mp_cache);
        }
        unsigned const available =
            m_pos - m_cache_start < m_cache_filled ? m_cache_filled - (m_pos - m_cache_start) : 0;
        unsigned const copied = std::min(available, _count - delivered);
        if (copied == 0) return false;
        std::memcpy(p_dst + delivered, static_cast<unsigned char *>(mp_cache) + (m_pos - m_cache_start),
                    copied);
        m_pos += copied;
        delivered += copied;
        if (delivered == _count) return true;
        if (m_pos >= mp_reader->m_size) return false;
    }
}
