// The scanner of command arguments and font files, with the flags every caller passes.
#include "tokenizer.h"

#include <gtest/gtest.h>

#include <cstring>

using namespace qorui;

namespace {

typedef std::vector<std::string> tokens_t;
int const k_all_flags = 7;

// Every token until the scan throws; "!" first when the constructor itself threw.
tokens_t tokens_of(char const *_p_text, int _flags = k_all_flags) {
    tokens_t tokens;
    CTokenizerRules rules(_p_text, static_cast<unsigned>(std::strlen(_p_text)), default_separators());
    rules.m_terminators = {"="};
    try {
        CTokenizer tokenizer(rules, _flags, 0);
        for (;;) {
            tokens.push_back(tokenizer.get_token().c_str());
            tokenizer.next();
        }
    } catch (char const *p_failure) {
        EXPECT_STREQ("", p_failure);
        if (tokens.empty()) tokens.push_back("!");
    }
    return tokens;
}

} // namespace

TEST(Tokenizer, SeparatorsCommentsQuotesAndTerminatorsCutTokens) {
    struct {
        char const *mp_text;
        tokens_t m_tokens;
        int m_flags;
    } const rows[] = {
        {"a,b; c\t\x1a"
         "d",
         {"a", "b", "c", "d"},
         k_all_flags},
        {"ab\"c d\"", {"ab", "c d"}, k_all_flags},
        {"a // b\nc /* d */ e", {"a", "c", "e"}, k_all_flags},
        {"key=value", {"key", "=", "value"}, k_all_flags},
        {"\"\"\" b", {"\"", "b"}, k_all_flags},   // the byte behind the opening quote belongs to the token
        {"  \"a b\"", {"\"a", "b"}, k_all_flags}, // a first quote behind separators is plain
        {"\"a b\"", {"\"a", "b\""}, 3},           // without the quote flag quotes are ordinary bytes
        {"a // b", {"a", "//", "b"}, 4},          // without the comment flags comments are tokens
        // No token at all: the constructor throws.
        {" , ;\n\t", {"!"}, k_all_flags},
        {"/* nothing */ ", {"!"}, k_all_flags},
        {"\"abc", {"!"}, k_all_flags},
        // Behind a token separators and comments are passed at once, so an open block comment
        // throws while the token is read; an open quote throws at the next call.
        {"a /* open", {"!"}, k_all_flags},
        {"a \"open", {"a"}, k_all_flags},
    };
    for (auto const &row : rows)
        EXPECT_EQ(row.m_tokens, tokens_of(row.mp_text, row.m_flags)) << row.mp_text;
}

TEST(Tokenizer, TheEndThrowsAtTheNextCallAndLinesCountWhatWasPassed) {
    char const text[] = "a\n// comment\n/* two\nlines */ b\n  c 12.5 word XY";
    CTokenizerRules rules(text, sizeof text - 3, default_separators()); // the text needn't end with a zero
    CTokenizer tokenizer(rules, k_all_flags, 0);
    tokenizer.next();
    EXPECT_EQ("b", tokenizer.get_token());
    EXPECT_EQ(4u, tokenizer.get_line());   // behind three line feeds, standing at the next one
    EXPECT_EQ(3u, tokenizer.get_column()); // the line feed itself stands at column 0
    tokenizer.next();
    tokenizer.next();
    EXPECT_DOUBLE_EQ(12.5, tokenizer.as_float());
    EXPECT_EQ(12, tokenizer.as_int());
    tokenizer.next();
    EXPECT_THROW(tokenizer.expect("Word"), char const *);
    EXPECT_TRUE(tokenizer.is_eof());
    EXPECT_THROW(tokenizer.next(), char const *);
    CTokenizerRules skipped("abc def", 7, default_separators());
    EXPECT_EQ("c", CTokenizer(skipped, k_all_flags, 2).get_token());
}
