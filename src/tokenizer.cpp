// The scanner of command arguments and font files: separators, comments, quoted tokens and
// terminators, with the end of the text thrown as a failure.
#include "tokenizer.h"
#include <algorithm>
#include <climits>
#include <cstdlib>
#include <cstring>

namespace qorui {

namespace {
char const *const gp_failure = "";

[[noreturn]] void fail() {
    throw gp_failure;
}
} // namespace

CTokenSet default_separators() {
    static CTokenSet const separators = [] {
        CTokenSet set;
        for (char const c : {' ', ',', ';', '\r', '\a', '\n', '\b', '\f', '\t', '\v', '\x1a'})
            set.insert(string(1, c));
        set.insert(string());
        return set;
    }();
    return separators;
}

CTokenizerRules::CTokenizerRules(char const *_p_text, unsigned _length, CTokenSet const &_separators)
    : m_separators(_separators), mp_text(_p_text), m_length(_length) {}

CTokenizer::CTokenizer(CTokenizerRules &_rules, int _flags, int _skip)
    : mp_rules(&_rules), m_pos(0), m_line(0), m_column(0), m_eof(_rules.m_length == 0), m_flags(_flags) {
    if (_skip > 0 && !m_eof) advance(static_cast<unsigned>(_skip));
    next();
}

void CTokenizer::advance(unsigned _n) {
    for (unsigned i = 0; i < _n; ++i) {
        ++m_pos;
        if (m_pos >= mp_rules->m_length) {
            m_eof = true;
            return;
        }
        if (current() == '\n') {
            ++m_line;
            m_column = 0;
        } else {
            ++m_column;
        }
    }
}

bool CTokenizer::at(char const *_p_s, size_t _length) const {
    if (_length == 0 || m_pos >= mp_rules->m_length || _length > mp_rules->m_length - m_pos) return false;
    return std::memcmp(mp_rules->mp_text + m_pos, _p_s, _length) == 0;
}

bool CTokenizer::at_any(CTokenSet const &_set, unsigned *_p_length) const {
    if (m_pos >= mp_rules->m_length) return false;
    char const first = current();
    for (string const &entry : _set) {
        if (!entry.empty() && entry[0] == first && at(entry.data(), entry.size())) {
            if (_p_length) *_p_length = static_cast<unsigned>(entry.size());
            return true;
        }
    }
    return false;
}

bool CTokenizer::skip_comment() {
    if (m_eof) return false;
    if ((m_flags & LINE_COMMENTS) && at("//", 2)) {
        advance(2);
        while (!m_eof && current() != '\n')
            advance(1);
        if (m_eof) return true;
        advance(1);
        return true;
    }
    if ((m_flags & BLOCK_COMMENTS) && at("/*", 2)) {
        advance(2);
        while (!at("*/", 2)) {
            if (m_eof) fail();
            advance(1);
        }
        advance(2);
        return true;
    }
    return false;
}

bool CTokenizer::skip_separators() {
    unsigned const start = m_pos;
    for (;;) {
        bool const comment = skip_comment();
        unsigned length = 0;
        bool const separator = !m_eof && at_any(mp_rules->m_separators, &length);
        if ((!separator && !comment) || m_eof) break;
        if (separator) advance(length);
    }
    return m_pos != start;
}

// The byte behind the opening quote always belongs to the token, so "" makes no empty token.
bool CTokenizer::read_quoted() {
    if (!(m_flags & QUOTED_TOKENS) || current() != '"') return false;
    advance(1);
    for (;;) {
        if (m_eof) fail();
        m_token += current();
        advance(1);
        if (m_eof) fail();
        if (current() == '"') {
            advance(1);
            skip_separators();
            return true;
        }
    }
}

void CTokenizer::read_plain() {
    for (;;) {
        m_token += current();
        advance(1);
        if (m_eof) return;
        if ((m_flags & QUOTED_TOKENS) && current() == '"') return; // the quote opens the next token
        if (mp_rules->m_terminators.count(m_token)) {
            skip_separators();
            return;
        }
        if (skip_separators()) return;
        if (at_any(mp_rules->m_terminators, nullptr) || m_eof) return;
    }
}

void CTokenizer::next() {
    if (m_eof) fail();
    m_token.clear();
    if (read_quoted()) return;
    skip_separators();
    if (m_pos >= mp_rules->m_length) {
        m_eof = true;
        fail();
    }
    if (m_eof) return;
    read_plain();
}

double CTokenizer::as_float() const {
    if (m_token.empty()) fail();
    return std::atof(m_token.c_str());
}

int CTokenizer::as_int() const {
    if (m_token.empty()) fail();
    // As atoi reads it, held at the ends of int's range.
    long const value = std::strtol(m_token.c_str(), nullptr, 10);
    return static_cast<int>(std::clamp<long>(value, INT_MIN, INT_MAX));
}

void CTokenizer::expect(string const &_text) const {
    if (m_token != _text) fail();
}

} // namespace qorui
