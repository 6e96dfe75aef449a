// The scanner of command arguments and font files, with the flags every caller passes.
#include "tokenizer.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <vector>

using namespace qorui;

namespace {

int const all_flags = 7;

// Every token until the scan throws; `*_p_thrown_at_start` says whether the constructor threw.
std::vector<std::string> tokens_of(char const *_p_text, int _flags = all_flags,
                                   bool *_p_thrown_at_start = nullptr) {
    std::vector<std::string> tokens;
    CTokenizerRules rules(_p_text, static_cast<unsigned>(std::strlen(_p_text)), default_separators());
    if (_p_thrown_at_start) *_p_thrown_at_start = false;
    try {
        CTokenizer tokenizer(rules, _flags, 0);
        for (;;) {
            tokens.push_back(tokenizer.get_token().c_str());
            tokenizer.next();
        }
    } catch (char const *p_failure) {
        EXPECT_STREQ("", p_failure);
        if (_p_thrown_at_start && tokens.empty()) *_p_thrown_at_start = true;
    }
    return tokens;
}

typedef std::vector<std::string> tokens_t;

} // namespace

TEST(Tokenizer, DefaultSeparatorsAreTheBlanksControlBytesAndTheEmptyString) {
    CTokenSet const separators = default_separators();
    EXPECT_EQ(12u, separators.size());
    for (char const *p : {"", " ", ",", ";", "\r", "\a", "\n", "\b", "\f", "\t", "\v", "\x1a"})
        EXPECT_EQ(1u, separators.count(p)) << int(p[0]);
    EXPECT_EQ(0u, separators.count("="));
}

TEST(Tokenizer, SeparatorsCommentsAndQuotesCutTokens) {
    EXPECT_EQ((tokens_t{"a", "b", "c"}), tokens_of("a,b; c"));
    EXPECT_EQ((tokens_t{"a b", "c"}), tokens_of("\"a b\" c"));
    EXPECT_EQ((tokens_t{"ab", "cd"}), tokens_of("ab\"cd\""));
    EXPECT_EQ((tokens_t{"a", "c"}), tokens_of("a // b\nc"));
    EXPECT_EQ((tokens_t{"a", "c"}), tokens_of("a /* b */ c"));
    EXPECT_EQ((tokens_t{"x=1"}), tokens_of("x=1"));
    EXPECT_EQ((tokens_t{"x", "=", "1"}), tokens_of("x = 1"));
    EXPECT_EQ((tokens_t{"a"}), tokens_of("a // only a comment behind"));
}

TEST(Tokenizer, QuotesFollowTheirOddRules) {
    // The byte behind the opening quote always belongs to the token.
    EXPECT_EQ((tokens_t{"\"", "b"}), tokens_of("\"\"\" b"));
    // A first token in quotes behind leading separators is read as a plain token.
    EXPECT_EQ((tokens_t{"\"a", "b"}), tokens_of("  \"a b\""));
    // Without the quote flag quotes are ordinary bytes.
    EXPECT_EQ((tokens_t{"\"a", "b\""}), tokens_of("\"a b\"", 3));
    // Without the comment flags comments are tokens.
    EXPECT_EQ((tokens_t{"a", "//", "b"}), tokens_of("a // b", 4));
}

TEST(Tokenizer, TheEndThrowsOnlyAtTheNextCall) {
    CTokenizerRules rules("one two", 7, default_separators());
    CTokenizer tokenizer(rules, all_flags, 0);
    EXPECT_EQ("one", tokenizer.get_token());
    EXPECT_FALSE(tokenizer.is_eof());
    tokenizer.next();
    EXPECT_EQ("two", tokenizer.get_token());
    EXPECT_TRUE(tokenizer.is_eof());
    EXPECT_THROW(tokenizer.next(), char const *);
}

TEST(Tokenizer, TextsWithoutATokenThrowFromTheConstructor) {
    for (char const *p_text : {"", " , ;\n\t", "// nothing", "/* nothing */ ", "\"\"", "\"abc"}) {
        bool thrown_at_start = false;
        EXPECT_TRUE(tokens_of(p_text, all_flags, &thrown_at_start).empty()) << p_text;
        EXPECT_TRUE(thrown_at_start) << p_text;
    }
    // Behind a token the separators and comments are passed at once, so an open block comment
    // throws while the token is read; an open quote throws at the next call.
    bool thrown_at_start = false;
    EXPECT_TRUE(tokens_of("a /* open", all_flags, &thrown_at_start).empty());
    EXPECT_TRUE(thrown_at_start);
    EXPECT_EQ((tokens_t{"a"}), tokens_of("a \"open"));
}

TEST(Tokenizer, TextNeedNotBeTerminated) {
    char const text[] = {'a', ' ', 'b', 'X', 'Y'};
    CTokenizerRules rules(text, 3, default_separators());
    CTokenizer tokenizer(rules, all_flags, 0);
    tokenizer.next();
    EXPECT_EQ("b", tokenizer.get_token());
    EXPECT_THROW(tokenizer.next(), char const *);
}

TEST(Tokenizer, LinesAndColumnsCountWhatWasPassed) {
    char const text[] = "a\n// comment\n/* two\nlines */ b\n  c";
    CTokenizerRules rules(text, sizeof text - 1, default_separators());
    CTokenizer tokenizer(rules, all_flags, 0);
    EXPECT_EQ(3u, tokenizer.get_line()); // already standing at "b", behind three line feeds
    tokenizer.next();
    EXPECT_EQ("b", tokenizer.get_token());
    EXPECT_EQ(4u, tokenizer.get_line());
    EXPECT_EQ(3u, tokenizer.get_column()); // the line feed itself stands at column 0
    tokenizer.next();
    EXPECT_EQ("c", tokenizer.get_token());
}

TEST(Tokenizer, SkipPassesLeadingBytes) {
    CTokenizerRules rules("abc def", 7, default_separators());
    CTokenizer tokenizer(rules, all_flags, 2);
    EXPECT_EQ("c", tokenizer.get_token());
}

TEST(Tokenizer, ConversionsAndExpectThrowOnWhatTheyCannotTake) {
    CTokenizerRules rules("12.5 -7 word \"x\"", 16, default_separators());
    CTokenizer tokenizer(rules, all_flags, 0);
    EXPECT_DOUBLE_EQ(12.5, tokenizer.as_float());
    EXPECT_EQ(12, tokenizer.as_int());
    tokenizer.next();
    EXPECT_EQ(-7, tokenizer.as_int());
    tokenizer.next();
    EXPECT_EQ(0, tokenizer.as_int()); // as atoi
    EXPECT_NO_THROW(tokenizer.expect("word"));
    EXPECT_THROW(tokenizer.expect("Word"), char const *);
    tokenizer.next();
    EXPECT_EQ("x", tokenizer.get_token());
}

TEST(Tokenizer, TerminatorsEndATokenWithoutSeparators) {
    CTokenSet separators = default_separators();
    CTokenizerRules rules("key=value", 9, separators);
    rules.m_terminators.insert("=");
    CTokenizer tokenizer(rules, all_flags, 0);
    EXPECT_EQ("key", tokenizer.get_token());
    tokenizer.next();
    EXPECT_EQ("=", tokenizer.get_token());
    tokenizer.next();
    EXPECT_EQ("value", tokenizer.get_token());
}
