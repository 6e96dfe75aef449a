// The host's log manager: named loggers with prefixes, messages kept in order as 16-bit text with
// their level and printed as UTF-8 to stdout unless quiet, and visits of a range of them.
#include "log_manager.h"

#include <cstdio>

namespace qorhost {

// ---------------------------------------------------------------------------------------------
// UTF-8 and UTF-16
// ---------------------------------------------------------------------------------------------

namespace {
void append_utf8(std::string &_out, char32_t _c) {
    if (_c < 0x80) {
        _out += static_cast<char>(_c);
    } else if (_c < 0x800) {
        _out += static_cast<char>(0xC0 | (_c >> 6));
        _out += static_cast<char>(0x80 | (_c & 0x3F));
    } else if (_c < 0x10000) {
        _out += static_cast<char>(0xE0 | (_c >> 12));
        _out += static_cast<char>(0x80 | ((_c >> 6) & 0x3F));
        _out += static_cast<char>(0x80 | (_c & 0x3F));
    } else {
        _out += static_cast<char>(0xF0 | (_c >> 18));
        _out += static_cast<char>(0x80 | ((_c >> 12) & 0x3F));
        _out += static_cast<char>(0x80 | ((_c >> 6) & 0x3F));
        _out += static_cast<char>(0x80 | (_c & 0x3F));
    }
}
} // namespace

std::string utf16_to_utf8(std::u16string const &_text) {
    std::string out;
    for (size_t i = 0; i < _text.size(); ++i) {
        char32_t c = _text[i];
        if (c >= 0xD800 && c < 0xDC00 && i + 1 < _text.size() && _text[i + 1] >= 0xDC00 &&
            _text[i + 1] < 0xE000) {
            c = 0x10000 + ((c - 0xD800) << 10) + (_text[i + 1] - 0xDC00);
            ++i;
        } else if (c >= 0xD800 && c < 0xE000) {
            c = 0xFFFD;
        }
        append_utf8(out, c);
    }
    return out;
}

std::u16string utf8_to_utf16(char const *_text) {
    std::u16string out;
    unsigned char const *p = reinterpret_cast<unsigned char const *>(_text ? _text : "");
    while (*p) {
        unsigned const lead = *p;
        int const extra = lead < 0x80         ? 0
                          : (lead >> 5) == 6  ? 1
                          : (lead >> 4) == 14 ? 2
                          : (lead >> 3) == 30 ? 3
                                              : -1;
        char32_t c = extra == 0   ? lead
                     : extra == 1 ? (lead & 0x1F)
                     : extra == 2 ? (lead & 0x0F)
                                  : (lead & 0x07);
        bool valid = extra >= 0;
        for (int i = 1; valid && i <= extra; ++i) {
            if ((p[i] & 0xC0) != 0x80)
                valid = false;
            else
                c = (c << 6) | (p[i] & 0x3F);
        }
        if (!valid || c > 0x10FFFF) { // beyond the last plane nothing is a character
            out += u'\xFFFD';
            ++p;
            continue;
        }
        p += extra + 1;
        if (c >= 0x10000) {
            c -= 0x10000;
            out += static_cast<char16_t>(0xD800 + (c >> 10));
            out += static_cast<char16_t>(0xDC00 + (c & 0x3FF));
        } else {
            out += static_cast<char16_t>(c);
        }
    }
    return out;
}

// ---------------------------------------------------------------------------------------------
// Loggers
// ---------------------------------------------------------------------------------------------

CHostLogger::CHostLogger(CLogManager *_p_manager, char const *_name, char const *_prefix)
    : mp_manager(_p_manager), m_name(_name ? _name : ""), m_prefix(_prefix ? _prefix : ""), m_active(true) {}

void CHostLogger::write(unsigned short const *_text, int _level) {
    if (!m_active || !_text) return;
    std::u16string text;
    for (unsigned short const *p = _text; *p; ++p)
        text += static_cast<char16_t>(*p);
    mp_manager->add_message(*this, text, _level);
}

void CHostLogger::write(char const *_text, int _level) {
    if (!m_active || !_text) return;
    mp_manager->add_message(*this, utf8_to_utf16(_text), _level);
}

// ---------------------------------------------------------------------------------------------
// The manager
// ---------------------------------------------------------------------------------------------

CLogManager::CLogManager() : m_next_index(0), m_quiet(false) {}

ILogger *CLogManager::create_logger(char const *_name, char const *_prefix) {
    if (ILogger *p_existing = find_logger(_name)) return p_existing;
    m_loggers.push_back(std::make_unique<CHostLogger>(this, _name, _prefix));
    return m_loggers.back().get();
}

ILogger *CLogManager::find_logger(char const *_name) {
    if (!_name) return nullptr;
    for (auto &p_logger : m_loggers)
        if (p_logger->get_name() == std::string(_name)) return p_logger.get();
    return nullptr;
}

void CLogManager::add_message(CHostLogger const &_logger, std::u16string const &_text, int _level) {
    if (!m_quiet) {
        std::string const text = utf16_to_utf8(_text);
        printf("%s%s%s", _logger.get_prefix().c_str(), text.c_str(),
               !text.empty() && text.back() == '\n' ? "" : "\n");
        fflush(stdout);
    }
    m_messages.push_back(SMessage{_text, _level, m_next_index++});
    if (m_messages.size() > MAX_MESSAGES) m_messages.pop_front();
}

void CLogManager::get_messages(ILogMessageVisitor &_visitor, unsigned _first, int _count) {
    std::vector<unsigned short> units;
    int visited = 0;
    for (SMessage const &message : m_messages) {
        if (message.m_index < _first) continue;
        if (_count >= 0 && visited >= _count) break;
        units.assign(message.m_text.begin(), message.m_text.end());
        units.push_back(0);
        _visitor.on_message(
            SLogMessage{units.data(), static_cast<uint32_t>(message.m_level), message.m_index});
        ++visited;
    }
}

std::string CLogManager::get_message_text(unsigned _index) const {
    for (SMessage const &message : m_messages)
        if (message.m_index == _index) return utf16_to_utf8(message.m_text);
    return std::string();
}

} // namespace qorhost
