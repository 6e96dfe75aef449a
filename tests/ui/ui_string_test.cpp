// Strings of 16-bit units: constructors and their contracts, UTF-8 conversions both ways, tags.
#include "ui_string.h"

#include "test_support.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

wstring units(std::u16string const &_text) {
    return wstring(_text.begin(), _text.end());
}

// The expressions of the contract reports, in order.
std::vector<std::string> contracts(qortest::CReportCapture const &_capture) {
    std::vector<std::string> expressions;
    for (std::string const &text : _capture.asserts()) {
        std::string::size_type const start = text.find("Expression:   ") + 14;
        expressions.push_back(text.substr(start, text.find_first_of(",\n", start) - start));
    }
    return expressions;
}

} // namespace

TEST(String, SizesAreInUnitsAndTooLongOnesReportAndTakeTheWholeSource) {
    qortest::CReportCapture capture;
    unsigned short const abc[] = {'a', 'b', 'c', 0};
    CString const source(abc);
    EXPECT_EQ(units(u"Пр"), CString("Привет", 2));
    EXPECT_EQ(units(u"g"), CString("g\xF0\x9F\x98\x80", 2)); // a pair is never cut
    EXPECT_EQ(units(u"a"), CString(source, 1));
    std::string const long_text(600, 'x'); // narrow text is cut at 511 units
    EXPECT_EQ(511u, CString(long_text.c_str(), 511).size());
    EXPECT_EQ(255u, std::string(CString(std::string(255, 'k').c_str()).get_c()).size());
    EXPECT_TRUE(capture.reports().empty());
    EXPECT_EQ(units(u"abc"), CString(abc, 4));
    EXPECT_EQ(units(u"abc"), CString(source, 9));
    EXPECT_TRUE(CString(static_cast<char const *>(nullptr)).empty());
    EXPECT_EQ(511u, CString(long_text.c_str(), 512).size());
    EXPECT_EQ(256u, std::string(CString(std::string(256, 'k').c_str()).get_c()).size()); // still whole
    EXPECT_EQ((std::vector<std::string>{"_size <= wcslen(_p_str)", "_size <= _str.size()", "_p_str",
                                        "_p_str && _size < n_max_len", "len < 256"}),
              contracts(capture));
}

TEST(String, Utf8RoundTripsAndInvalidBytesBecomeReplacementCharacters) {
    struct {
        char const *mp_utf8;
        std::u16string m_units;
        bool m_round_trip;
    } const rows[] = {
        {"caf\xC3\xA9 \xC3\xBF", u"caf\u00E9 \u00FF", true},
        {"Привет, Ёё \xE2\x82\xAC", u"Привет, Ёё \u20AC", true},
        {"g\xF0\x9F\x98\x80!", u"g\U0001F600!", true}, // outside 16 bits: a surrogate pair
        {"a\xFF\x80", u"a\uFFFD\uFFFD", false},        // a byte that starts nothing, a stray continuation
        {"a\xE2\x82"
         "b",
         u"a\uFFFDb", false},                   // cut inside: the valid prefix goes as one
        {"a\xD0", u"a\uFFFD", false},           // cut at the end
        {"\xC0\xAF", u"\uFFFD", false},         // overlong
        {"\xED\xA0\x80", u"\uFFFD", false},     // an encoded surrogate
        {"\xF4\x90\x80\x80", u"\uFFFD", false}, // beyond U+10FFFF
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_utf8);
        CString const text(row.mp_utf8);
        EXPECT_EQ(units(row.m_units), text);
        if (row.m_round_trip) {
            EXPECT_STREQ(row.mp_utf8, text.get_c());
        }
    }
    // Unpaired surrogates have no UTF-8 form and leave as the replacement character.
    unsigned short const lonely[] = {'x', 0xD83D, 'y', 0xDE00, 0};
    EXPECT_STREQ("x\xEF\xBF\xBDy\xEF\xBF\xBD", CString(lonely).get_c());
}

TEST(String, InsertRemoveTagsAndThePool) {
    CString text("ab");
    text.insert('y', 0);
    EXPECT_EQ(units(u"yazb"), text.insert('z', 2));
    qortest::CReportCapture capture;
    EXPECT_EQ(units(u"yazb!"), text.insert('!', 99)); // past the end: reported, appended
    EXPECT_EQ((std::vector<std::string>{"_pos <= size()"}), contracts(capture));
    // Tags by the depth of brackets.
    for (auto const &row :
         {std::make_pair("a<color 1 2 3 4>b</color>c", "abc"), std::make_pair("<<x>>y", "y"),
          std::make_pair("1 > 0", "1 "), std::make_pair("a>b<c", "ac"), std::make_pair("<unclosed", "")}) {
        CString tagged(row.first);
        tagged.get_c(); // the narrow form is made anew
        tagged.remove_tags();
        EXPECT_STREQ(row.second, tagged.get_c()) << row.first;
    }
    CString *p_first = new CString("one");
    delete p_first;
    CString *p_second = new CString("two");
    EXPECT_EQ(p_first, p_second); // the last given back is taken first
    delete p_second;
}
