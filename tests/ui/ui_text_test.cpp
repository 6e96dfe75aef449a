// The text buffer: lines, the caret and its one-past-the-end state, editing, trimming, escapes,
// and the events that the owner gets from each operation.
#include "ui_text.h"

#include "test_desktop.h"
#include "test_support.h"
#include "ui_window.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorui;

namespace {

// The lines as UTF-8, for readable comparisons.
std::vector<std::string> lines_of(CText const &_text) {
    std::vector<std::string> lines;
    for (unsigned i = 0; i < _text.get_num_strings(); ++i)
        lines.push_back(_text.get_string(i)->get_c());
    return lines;
}

typedef std::vector<std::string> lines_t;

// An owner window that counts the events its text sends it.
class TextTest : public ::testing::Test {
protected:
    TextTest() : m_owner(&m_desktop, "owner") {
        m_owner.register_callback(EVENT_CHANGED, CEventCallback([this](CWndEvent const *p_event) {
                                      ++m_changed;
                                      EXPECT_EQ(&m_owner, p_event->get_activator());
                                      EXPECT_EQ(CWndEvent::DISPATCH_NONE, p_event->get_dispatch_type());
                                  }));
        m_owner.register_callback(EVENT_RESIZED, CEventCallback([this](CWndEvent const *) { ++m_resized; }));
        m_text.set_owner(&m_owner);
    }

    void type(char const *_p_keys) { m_text.insert(_p_keys, false, false); }
    void reset_counts() { m_changed = m_resized = 0; }
    void expect_caret(int _line, int _char) {
        EXPECT_EQ(_line, m_text.get_caret_line());
        EXPECT_EQ(_char, m_text.get_caret_char());
    }

    qortest::CTestDesktop m_desktop;
    CWindow m_owner;
    CText m_text;
    int m_changed = 0;
    int m_resized = 0;
};

} // namespace

TEST_F(TextTest, ANewTextHasNoLinesAndTheFirstCharacterMakesOne) {
    EXPECT_EQ(0u, m_text.get_num_strings());
    EXPECT_EQ(nullptr, m_text.get_string());
    EXPECT_EQ(nullptr, m_text.get_caret_line_string());
    m_text.insert('x', false);
    EXPECT_EQ((lines_t{"x"}), lines_of(m_text));
    expect_caret(0, 1);
    EXPECT_EQ(2, m_changed); // the new line, then the character
}

TEST_F(TextTest, ABreakInAnEmptyTextLeavesTheCaretPastTheEnd) {
    m_text.on_new_line();
    EXPECT_EQ(1u, m_text.get_num_strings());
    expect_caret(1, 0);
    EXPECT_EQ(nullptr, m_text.get_caret_line_string());
    EXPECT_EQ(0, m_text.get_caret_line_length());
    m_text.on_delete(); // nothing there
    m_text.insert('y', false);
    EXPECT_EQ((lines_t{"", "y"}), lines_of(m_text));
    expect_caret(1, 1);
}

TEST_F(TextTest, ASecondBreakOrABackSpacePastTheEndHasItsLineFirst) {
    qortest::CReportCapture capture;
    m_text.on_new_line();
    m_text.on_new_line();
    EXPECT_EQ((lines_t{"", "", ""}), lines_of(m_text));
    expect_caret(2, 0);

    CText other;
    other.on_new_line();
    other.on_back_space();
    EXPECT_EQ((lines_t{""}), lines_of(other));
    EXPECT_EQ(0, other.get_caret_line());
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(TextTest, EditingCountsItsEvents) {
    type("ab");
    EXPECT_EQ(3, m_changed);
    reset_counts();
    m_text.insert(10, false); // a break is one change
    EXPECT_EQ(1, m_changed);
    type("cd");
    EXPECT_EQ((lines_t{"ab", "cd"}), lines_of(m_text));
    reset_counts();
    // Deleting, moving and joining send nothing.
    m_text.on_back_space();
    m_text.on_caret_left();
    m_text.on_home();
    m_text.on_back_space();
    m_text.on_caret_right();
    m_text.on_delete();
    m_text.on_end();
    m_text.on_insert();
    EXPECT_EQ(0, m_changed);
    EXPECT_EQ(0, m_resized);
    EXPECT_EQ((lines_t{"abc"}), lines_of(m_text));

    // The two caret setters tell the owner by a resized event, the others by changed.
    m_text.set_caret_line(7);
    m_text.set_caret_char(1);
    EXPECT_EQ(2, m_resized);
    m_text.set_editable(true);
    EXPECT_EQ(1, m_changed);
}

TEST_F(TextTest, BackSpaceAtTheStartOfALineJoinsItToTheOneAbove) {
    type("ab\ncd");
    m_text.set_caret_line(1);
    m_text.on_home();
    m_text.on_back_space();
    EXPECT_EQ((lines_t{"abcd"}), lines_of(m_text));
    expect_caret(0, 2);

    m_text.set_caret_char(0);
    m_text.on_back_space(); // column 0 of line 0
    EXPECT_EQ((lines_t{"abcd"}), lines_of(m_text));
}

TEST_F(TextTest, DeleteAtTheEndOfALineJoinsTheNextOne) {
    type("ab\ncd");
    m_text.set_caret_line(0);
    m_text.set_caret_char(2);
    m_text.on_delete();
    EXPECT_EQ((lines_t{"abcd"}), lines_of(m_text));
    expect_caret(0, 2);
    m_text.on_end();
    m_text.on_delete(); // the end of the last line
    EXPECT_EQ((lines_t{"abcd"}), lines_of(m_text));
    m_text.on_home();
    m_text.on_delete();
    EXPECT_EQ((lines_t{"bcd"}), lines_of(m_text));
}

TEST_F(TextTest, ABreakInsideALineSplitsItAndKeepsTheFontAbove) {
    type("hello");
    CFont *p_font = reinterpret_cast<CFont *>(0x1000); // never dereferenced by the text
    m_text.set_string_font(0, p_font);
    m_text.set_caret_char(2);
    m_text.on_new_line();
    EXPECT_EQ((lines_t{"he", "llo"}), lines_of(m_text));
    EXPECT_EQ(p_font, m_text.get_string_font(0));
    EXPECT_EQ(nullptr, m_text.get_string_font(1));
    expect_caret(1, 0);
}

TEST_F(TextTest, TheCaretMovesAcrossLinesOnlyInMultilineTexts) {
    type("abc\nx\nlonger");
    expect_caret(2, 6);
    m_text.on_caret_up();
    expect_caret(1, 1); // cut to the short line
    m_text.on_caret_down();
    expect_caret(2, 1); // the column isn't remembered
    m_text.on_end();
    m_text.on_caret_right();
    expect_caret(2, 6); // the end of the last line stays
    m_text.set_caret_line(0);
    m_text.on_end();
    m_text.on_caret_right();
    expect_caret(1, 0);
    m_text.on_caret_left();
    expect_caret(0, 3);

    CText single;
    single.set_multiline(false);
    single.insert("ab\ncd", false, false);
    EXPECT_EQ((lines_t{"abcd"}), lines_of(single)); // breaks are ignored
    single.on_home();
    single.on_caret_left();
    single.on_caret_up();
    single.on_caret_down();
    EXPECT_EQ(0, single.get_caret_line());
    EXPECT_EQ(0, single.get_caret_char());
}

TEST_F(TextTest, TrimmingDropsTheOldestLinesAndTheCaretFollows) {
    m_text.set_max_strings(2);
    type("one\ntwo");
    expect_caret(1, 3);
    reset_counts();
    m_text.insert(10, false);
    EXPECT_EQ((lines_t{"two", ""}), lines_of(m_text));
    expect_caret(1, 0);
    EXPECT_EQ(2, m_changed); // the break, the trimmed line

    m_text.set_caret_line(0);
    m_text.set_caret_char(2);
    m_text.set_max_strings(1); // the caret's own line goes: it returns to 0, 0
    EXPECT_EQ((lines_t{""}), lines_of(m_text));
    expect_caret(0, 0);
}

TEST_F(TextTest, EscapesBreakLinesOnlyWhenParsed) {
    m_text.insert("a\\nb", false, true);
    EXPECT_EQ((lines_t{"a", "b"}), lines_of(m_text));
    CText raw;
    raw.insert("a\\nb\nc", false, false);
    EXPECT_EQ((lines_t{"a\\nb", "c"}), lines_of(raw)); // a real line feed always breaks
    unsigned short const wide[] = {'x', '\\', 'n', 'y', 0};
    CText from_wide;
    from_wide.insert(wide, false, true);
    EXPECT_EQ((lines_t{"x", "y"}), lines_of(from_wide));
}

TEST_F(TextTest, NarrowBytesStayUnits) {
    m_text.insert("\xD0\x9F", false, false); // two bytes, two units
    ASSERT_EQ(1u, m_text.get_num_strings());
    EXPECT_EQ(2u, m_text.get_string(0)->size());
    EXPECT_EQ(0xD0, m_text.get_string(0)->at(0));
}

TEST_F(TextTest, ANotEditableTextTakesOnlyForcedInput) {
    m_text.set_editable(false);
    m_text.insert('x', false);
    EXPECT_EQ(0u, m_text.get_num_strings());
    m_text.insert('x', true);
    EXPECT_EQ((lines_t{"x"}), lines_of(m_text));
    m_text = "assigned"; // assignment isn't forced: it only clears
    EXPECT_EQ(0u, m_text.get_num_strings());
}

TEST_F(TextTest, AssignmentClearsInsertsAndBreaks) {
    m_text = "abc";
    EXPECT_EQ((lines_t{"abc", ""}), lines_of(m_text));
    expect_caret(1, 0);

    CText single;
    single.set_multiline(false);
    single = string("abc");
    EXPECT_EQ((lines_t{"abc"}), lines_of(single));
    EXPECT_EQ(3, single.get_caret_char());

    CText const from_cstring(CString("x\\ny"));
    EXPECT_EQ((lines_t{"x", "y", ""}), lines_of(from_cstring));
}

TEST_F(TextTest, ClearTellsTheOwnerOfEachLine) {
    type("1\n2\n3");
    reset_counts();
    m_text.clear();
    EXPECT_EQ(4, m_changed); // three lines, and once more at the end
    EXPECT_EQ(0u, m_text.get_num_strings());
    expect_caret(0, 0);
}

TEST_F(TextTest, CopiesTakeLinesAndFontsButNotSettings) {
    m_text.set_max_strings(5);
    m_text.set_multiline(true);
    type("a\nb");
    m_text.set_string_font(1, reinterpret_cast<CFont *>(0x2000));
    CText copy(m_text);
    EXPECT_EQ((lines_t{"a", "b"}), lines_of(copy));
    EXPECT_EQ(m_text.get_string_font(1), copy.get_string_font(1));
    EXPECT_EQ(1024u, copy.get_max_strings());
    EXPECT_EQ(0, copy.get_caret_line());
    EXPECT_NE(m_text.get_string(0), copy.get_string(0)); // lines of its own

    CText target;
    target.set_editable(false);
    target = m_text;
    EXPECT_EQ((lines_t{"a", "b"}), lines_of(target));
    EXPECT_FALSE(target.get_editable());
    target = target;
    EXPECT_EQ(2u, target.get_num_strings());
}

TEST_F(TextTest, SetMultilineFalseKeepsTheFirstLine) {
    type("1\n2\n3");
    m_text.set_multiline(false);
    EXPECT_EQ((lines_t{"1"}), lines_of(m_text));
    expect_caret(0, 0);
    m_text.on_end();
    m_text.set_multiline(true);
    expect_caret(0, 0);
}

TEST_F(TextTest, OutOfRangeIndicesAreReportedAndHarmless) {
    qortest::CReportCapture capture;
    EXPECT_EQ(nullptr, m_text.get_string(3u));
    EXPECT_EQ(nullptr, m_text.get_string_font(0));
    m_text.set_string_font(9, nullptr);
    EXPECT_EQ(3u, capture.texts(qordebug::REPORT_ASSERT).size());
}
