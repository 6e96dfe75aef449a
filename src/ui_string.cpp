// Strings of 16-bit units: construction from narrow UTF-8 and wide text with their contracts,
// the conversion back to UTF-8, insertion, and the removal of tags.
#include "ui_string.h"
#include "ui_debug.h"

namespace qorui {

namespace {

unsigned const n_replacement = 0xFFFD;

bool is_continuation(unsigned char _byte) {
    return (_byte & 0xC0) == 0x80;
}

// One code point from UTF-8 at _p; the bytes taken go to *_p_length. A malformed sequence gives the
// replacement character and takes its valid prefix, at least one byte, so nothing is read twice.
unsigned decode_utf8(unsigned char const *_p, unsigned *_p_length) {
    unsigned char const lead = _p[0];
    *_p_length = 1;
    if (lead < 0x80) return lead;
    unsigned count, code_point, minimum;
    if ((lead & 0xE0) == 0xC0) {
        count = 1, code_point = lead & 0x1F, minimum = 0x80;
    } else if ((lead & 0xF0) == 0xE0) {
        count = 2, code_point = lead & 0x0F, minimum = 0x800;
    } else if ((lead & 0xF8) == 0xF0) {
        count = 3, code_point = lead & 0x07, minimum = 0x10000;
    } else {
        return n_replacement;
    }
    for (unsigned i = 1; i <= count; ++i) {
        if (!is_continuation(_p[i])) { // a terminating zero stops here too
            *_p_length = i;
            return n_replacement;
        }
        code_point = (code_point << 6) | (_p[i] & 0x3F);
    }
    *_p_length = count + 1;
    bool const surrogate = code_point >= 0xD800 && code_point <= 0xDFFF;
    if (code_point < minimum || code_point > 0x10FFFF || surrogate) return n_replacement;
    return code_point;
}

void append_utf8(string &_out, unsigned _code_point) {
    if (_code_point < 0x80) {
        _out += static_cast<char>(_code_point);
        return;
    }
    unsigned const count = _code_point < 0x800 ? 1 : _code_point < 0x10000 ? 2 : 3;
    static unsigned char const leads[] = {0, 0xC0, 0xE0, 0xF0};
    _out += static_cast<char>(leads[count] | (_code_point >> (6 * count)));
    for (unsigned i = count; i-- > 0;)
        _out += static_cast<char>(0x80 | ((_code_point >> (6 * i)) & 0x3F));
}

bool is_high_surrogate(unsigned _unit) {
    return _unit >= 0xD800 && _unit <= 0xDBFF;
}
bool is_low_surrogate(unsigned _unit) {
    return _unit >= 0xDC00 && _unit <= 0xDFFF;
}

// _count units as UTF-8; a surrogate pair becomes one character.
void encode_utf8(unsigned short const *_units, size_t _count, string &_out) {
    _out.clear();
    for (size_t i = 0; i < _count; ++i) {
        unsigned const unit = _units[i];
        if (is_high_surrogate(unit) && i + 1 < _count && is_low_surrogate(_units[i + 1])) {
            append_utf8(_out, 0x10000 + ((unit - 0xD800) << 10) + (_units[i + 1] - 0xDC00));
            ++i;
        } else if (is_high_surrogate(unit) || is_low_surrogate(unit)) {
            append_utf8(_out, n_replacement);
        } else {
            append_utf8(_out, unit);
        }
    }
}

} // namespace

size_t wcslen(unsigned short const *_p_str) {
    size_t length = 0;
    while (_p_str[length])
        ++length;
    return length;
}

unsigned short const *CString::str2wcs(char const *_p_str, int _size) {
    static unsigned short buffer[n_max_len];
    QOR_CHECK(_p_str);
    if (_size < 0)
        _size = n_max_len - 1;
    else if (!QOR_CHECK(_p_str && _size < n_max_len))
        _size = n_max_len - 1;
    auto const *p = reinterpret_cast<unsigned char const *>(_p_str ? _p_str : "");
    int units = 0;
    while (*p && units < _size) {
        unsigned length;
        unsigned const code_point = decode_utf8(p, &length);
        if (code_point >= 0x10000) {
            if (units + 2 > _size) break; // a pair is never cut in half
            buffer[units++] = static_cast<unsigned short>(0xD800 + ((code_point - 0x10000) >> 10));
            buffer[units++] = static_cast<unsigned short>(0xDC00 + ((code_point - 0x10000) & 0x3FF));
        } else {
            buffer[units++] = static_cast<unsigned short>(code_point);
        }
        p += length;
    }
    buffer[units] = 0;
    return buffer;
}

void CString::str2wcs(char const *_p_str, wstring &_out, int _size) {
    if (!QOR_CHECK(_p_str)) return;
    _out = str2wcs(_p_str, _size);
}

// A reference is never null here, so the contracts on the address of a source hold by
// construction; the contracts on sizes remain.
CString::CString(char const *_p_str, int _size) {
    if (QOR_CHECK(_p_str)) assign(str2wcs(_p_str, _size));
}

CString::CString(string const &_str, int _size) {
    assign(str2wcs(_str.c_str(), _size));
}

CString::CString(unsigned short const *_p_str, int _size) {
    if (!QOR_CHECK(_p_str)) return;
    size_t const length = wcslen(_p_str);
    if (_size < 0 || !QOR_CHECK_AS(static_cast<size_t>(_size) <= length, "_size <= wcslen(_p_str)"))
        assign(_p_str, length);
    else
        assign(_p_str, static_cast<size_t>(_size));
}

CString::CString(wstring const &_str, int _size) {
    if (_size < 0 || !QOR_CHECK_AS(static_cast<size_t>(_size) <= _str.length(), "_size <= _str.length()"))
        assign(_str);
    else
        assign(_str, 0, static_cast<size_t>(_size));
}

CString::CString(CString const &_str, int _size) : CPooled<CString, 1024>(), wstring() {
    if (_size < 0 || !QOR_CHECK_AS(static_cast<size_t>(_size) <= _str.size(), "_size <= _str.size()"))
        assign(_str);
    else
        assign(_str, 0, static_cast<size_t>(_size));
}

CString &CString::operator=(CString const &_str) {
    wstring::operator=(_str);
    m_str_c = _str.m_str_c;
    return *this;
}

string const &CString::get_str_c() const {
    size_t const len = length();
    QOR_CHECK(len < 256);
    return get_narrow();
}

string const &CString::get_narrow() const {
    encode_utf8(data(), length(), m_str_c);
    return m_str_c;
}

CString &CString::insert(unsigned short _ch, int _pos) {
    if (_pos < 0 || !QOR_CHECK_AS(static_cast<size_t>(_pos) <= size(), "_pos <= size()"))
        push_back(_ch);
    else
        wstring::insert(begin() + _pos, _ch);
    return *this;
}

void CString::remove_tags() {
    wstring kept;
    int depth = 0;
    for (unsigned short const unit : *this) {
        if (unit == '<')
            ++depth;
        else if (unit == '>')
            --depth;
        else if (depth == 0)
            kept.push_back(unit);
    }
    wstring::operator=(kept);
    m_str_c.clear();
}

} // namespace qorui
