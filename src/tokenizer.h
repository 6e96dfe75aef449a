// A small scanner over a block of text in memory: tokens between separator strings, with `//` and
// `/*` comments and quoted tokens. Every failure is thrown as a `char const *` pointing at an empty
// text; the catcher knows its own context (a command prints its usage, a font reader stops).
// Internal to the library.
#pragma once
#include "qor_memory.h"
#include <set>

namespace qorui {

typedef std::set<string, std::less<string>, qor_small_allocator<string>> CTokenSet;

// Space, comma, semicolon and the control bytes 7 to 13 and 26, each as a one-byte string, and the
// empty string, which never matches.
CTokenSet default_separators();

class CTokenizerRules {
public:
    // `_p_text` needn't be terminated and must outlive every scan over it.
    CTokenizerRules(char const *_p_text, unsigned _length, CTokenSet const &_separators);
    virtual ~CTokenizerRules() {}

    CTokenSet m_separators;
    CTokenSet m_terminators; // ends a token; empty in every use in the library
    char const *mp_text;
    unsigned m_length;
};

class CTokenizer {
public:
    enum EFlags { LINE_COMMENTS = 1, BLOCK_COMMENTS = 2, QUOTED_TOKENS = 4 };

    // Reads the first token, so construction throws on a text without one.
    CTokenizer(CTokenizerRules &_rules, int _flags, int _skip);

    void next();
    string const &get_token() const { return m_token; }
    bool is_eof() const { return m_eof; }
    unsigned get_line() const { return m_line; }
    unsigned get_column() const { return m_column; }

    // As atof and atoi; both throw on an empty token.
    double as_float() const;
    int as_int() const;
    void expect(string const &_text) const;

private:
    void advance(unsigned _n);
    bool at(char const *_p_s, size_t _length) const;
    bool at_any(CTokenSet const &_set, unsigned *_p_length) const;
    char current() const { return mp_rules->mp_text[m_pos]; }
    bool skip_comment();
    bool skip_separators();
    bool read_quoted();
    void read_plain();

    CTokenizerRules *mp_rules;
    unsigned m_pos;
    unsigned m_line;
    unsigned m_column;
    string m_token;
    bool m_eof;
    int m_flags;
};

} // namespace qorui
