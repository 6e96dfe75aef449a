// Strings of 16-bit units: constructors and their contracts, UTF-8 conversions both ways, tags.
#include "ui_string.h"

#include "test_support.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

wstring units(std::u16string const &_text) {
    return wstring(_text.begin(), _text.end());
}

// The expressions of the contract reports, in order.
std::vector<std::string> contracts(qortest::CReportCapture const &_capture) {
    std::vector<std::string> expressions;
    for (std::string const &text : _capture.texts(qordebug::REPORT_ASSERT)) {
        std::string::size_type const start = text.find("Expression:   ") + 14;
        expressions.push_back(text.substr(start, text.find_first_of(",\n", start) - start));
    }
    return expressions;
}

} // namespace

TEST(String, NarrowConstructorsTakeSizeInUnits) {
    EXPECT_EQ(units(u"ab"), CString("abc", 2));
    EXPECT_EQ(units(u""), CString("abc", 0));
    EXPECT_EQ(units(u"abc"), CString("abc", -1));
    EXPECT_EQ(units(u"Пр"), CString("Привет", 2));
    EXPECT_EQ(units(u"abc"), CString(string("abc")));
}

TEST(String, WideConstructorsCheckTheirSizes) {
    qortest::CReportCapture capture;
    unsigned short const abc[] = {'a', 'b', 'c', 0};
    EXPECT_EQ(units(u"ab"), CString(abc, 2));
    EXPECT_EQ(units(u"abc"), CString(abc, -1));
    CString const source(abc);
    EXPECT_EQ(units(u"a"), CString(source, 1));
    EXPECT_EQ(units(u"abc"), CString(wstring(abc), 3));
    EXPECT_TRUE(capture.reports().empty());

    // Too long a size is reported, and the whole source is taken.
    EXPECT_EQ(units(u"abc"), CString(abc, 4));
    EXPECT_EQ(units(u"abc"), CString(wstring(abc), 4));
    EXPECT_EQ(units(u"abc"), CString(source, 9));
    EXPECT_EQ((std::vector<std::string>{"_size <= wcslen(_p_str)", "_size <= _str.length()",
                                        "_size <= _str.size()"}),
              contracts(capture));
}

TEST(String, NullSourcesAreReportedAndGiveAnEmptyString) {
    qortest::CReportCapture capture;
    EXPECT_TRUE(CString(static_cast<char const *>(nullptr)).empty());
    EXPECT_TRUE(CString(static_cast<unsigned short const *>(nullptr)).empty());
    wstring out = units(u"kept");
    CString::str2wcs(nullptr, out, -1);
    EXPECT_EQ(units(u"kept"), out);
    EXPECT_EQ((std::vector<std::string>{"_p_str", "_p_str", "_p_str"}), contracts(capture));
}

TEST(String, Str2wcsCutsAt511UnitsAndChecksItsSize) {
    qortest::CReportCapture capture;
    std::string const long_text(600, 'x');
    EXPECT_EQ(511u, CString(long_text.c_str(), -1).size());
    EXPECT_EQ(511u, CString(long_text.c_str(), 511).size());
    EXPECT_TRUE(capture.reports().empty());
    EXPECT_EQ(511u, CString(long_text.c_str(), 512).size());
    EXPECT_EQ((std::vector<std::string>{"_p_str && _size < n_max_len"}), contracts(capture));
}

TEST(String, Str2wcsReturnsOneSharedBuffer) {
    unsigned short const *p_first = CString::str2wcs("first");
    unsigned short const *p_second = CString::str2wcs("second");
    EXPECT_EQ(p_first, p_second);
    EXPECT_EQ(units(u"second"), wstring(p_first));
}

TEST(String, Utf8RoundTripsThroughSixteenBitUnits) {
    struct {
        char const *mp_utf8;
        std::u16string m_units;
    } const cases[] = {
        {"plain ASCII", u"plain ASCII"},
        {"caf\xC3\xA9 \xC3\xBF", u"caf\u00E9 \u00FF"},
        {"\xD0\x9F\xD1\x80\xD0\xB8\xD0\xB2\xD0\xB5\xD1\x82, \xD0\x81\xD1\x91", u"Привет, Ёё"},
        {"\xE2\x82\xAC", u"\u20AC"},
        {"g\xF0\x9F\x98\x80!", u"g\U0001F600!"}, // outside 16 bits: a surrogate pair
    };
    for (auto const &c : cases) {
        CString const text(c.mp_utf8);
        EXPECT_EQ(units(c.m_units), text) << c.mp_utf8;
        EXPECT_STREQ(c.mp_utf8, text.get_c());
    }
}

TEST(String, InvalidUtf8BecomesReplacementCharacters) {
    struct {
        char const *mp_utf8;
        std::u16string m_units;
    } const cases[] = {
        {"a\xFF"
         "b",
         u"a\uFFFDb"}, // a byte that starts nothing
        {"a\x80"
         "b",
         u"a\uFFFDb"},         // a stray continuation byte
        {"a\xD0", u"a\uFFFD"}, // cut at the end
        {"a\xE2\x82"
         "b",
         u"a\uFFFDb"},                   // cut inside, the valid prefix goes as one
        {"\xC0\xAF", u"\uFFFD"},         // overlong
        {"\xED\xA0\x80", u"\uFFFD"},     // an encoded surrogate
        {"\xF4\x90\x80\x80", u"\uFFFD"}, // beyond U+10FFFF
    };
    for (auto const &c : cases)
        EXPECT_EQ(units(c.m_units), CString(c.mp_utf8)) << c.mp_utf8;

    // Unpaired surrogates have no UTF-8 form and leave as the replacement character.
    unsigned short const lonely[] = {'x', 0xD83D, 'y', 0xDE00, 0};
    EXPECT_STREQ("x\xEF\xBF\xBDy\xEF\xBF\xBD", CString(lonely).get_c());
}

TEST(String, APairIsNeverCutByTheSize) {
    EXPECT_EQ(units(u"g"), CString("g\xF0\x9F\x98\x80", 2));
    EXPECT_EQ(units(u"g\U0001F600"), CString("g\xF0\x9F\x98\x80", 3));
}

TEST(String, GetCServesShortStringsOnly) {
    qortest::CReportCapture capture;
    CString const short_enough(std::string(255, 'k').c_str());
    EXPECT_EQ(255u, std::string(short_enough.get_c()).size());
    EXPECT_TRUE(capture.reports().empty());
    CString const too_long(std::string(256, 'k').c_str());
    EXPECT_EQ(256u, std::string(too_long.get_c()).size()); // reported, and still converted whole
    EXPECT_EQ((std::vector<std::string>{"len < 256"}), contracts(capture));
}

TEST(String, InsertPlacesOneUnit) {
    CString text("ab");
    EXPECT_EQ(units(u"abx"), text.insert('x', -1));
    EXPECT_EQ(units(u"yabx"), text.insert('y', 0));
    EXPECT_EQ(units(u"yazbx"), text.insert('z', 2));
    qortest::CReportCapture capture;
    EXPECT_EQ(units(u"yazbx!"), text.insert('!', 99)); // past the end: reported, appended
    EXPECT_EQ((std::vector<std::string>{"_pos <= size()"}), contracts(capture));
}

TEST(String, RemoveTagsCountsBracketDepth) {
    struct {
        char const *mp_in;
        char const *mp_out;
    } const cases[] = {
        {"a<color 1 2 3 4>b</color>c", "abc"},
        {"<<x>>y", "y"},
        {"1 > 0", "1 "},
        {"a>b<c", "ac"},
        {"no tags", "no tags"},
        {"<unclosed", ""},
    };
    for (auto const &c : cases) {
        CString text(c.mp_in);
        text.get_c();
        text.remove_tags();
        EXPECT_STREQ(c.mp_out, text.get_c()) << c.mp_in;
    }
}

TEST(String, AssignmentCopiesUnits) {
    CString source("source");
    source.get_c();
    CString copy("other");
    copy = source;
    EXPECT_EQ(source, copy);
    EXPECT_STREQ("source", copy.get_c());
}

TEST(String, NewStringsComeFromThePool) {
    CString *p_first = new CString("one");
    delete p_first;
    CString *p_second = new CString("two");
    EXPECT_EQ(p_first, p_second); // the last given back is taken first
    delete p_second;
}
