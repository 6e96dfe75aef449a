// The text buffer: lines, the caret and its one-past-the-end state, editing, trimming, escapes,
// copies, and the events that the owner window gets from each operation.
#include "ui_text.h"

#include "test_world.h"
#include "ui_window.h"

#include <gtest/gtest.h>

#include <utility>

using namespace qorui;

namespace {

typedef std::vector<std::string> lines_t;

// The lines as UTF-8, then the caret as "line,char".
lines_t lines_of(CText const &_text) {
    lines_t lines;
    for (unsigned i = 0; i < _text.get_num_strings(); ++i)
        lines.push_back(_text.get_string(i)->get_c());
    lines.push_back(std::to_string(_text.get_caret_line()) + "," + std::to_string(_text.get_caret_char()));
    return lines;
}

// A text owned by a window of the world that counts the changed and resized events it gets.
class TextTest : public ::testing::Test {
protected:
    TextTest() {
        mp_owner->register_callback(EVENT_CHANGED, CEventCallback([this](CWndEvent const *p_event) {
                                        ++m_changed;
                                        EXPECT_EQ(mp_owner, p_event->get_activator());
                                    }));
        mp_owner->register_callback(EVENT_RESIZED,
                                    CEventCallback([this](CWndEvent const *) { ++m_resized; }));
        m_text.set_owner(mp_owner);
    }
    void type(char const *_p_keys) { m_text.insert(_p_keys, false, false); }
    int changes() { return std::exchange(m_changed, 0); }

    qortest::CWorld m_world;
    CWindow *mp_owner =
        m_world.place(&m_world.desktop(), new CWindow(&m_world.desktop(), "owner"), 0, 0, 1, 1);
    CText m_text;
    int m_changed = 0;
    int m_resized = 0;
};

} // namespace

// A break or a back space past the end has its line first.
TEST_F(TextTest, TheFirstCharacterOrBreakMakesALineAndTheCaretMayStandPastTheEnd) {
    m_text.insert('x', false);
    EXPECT_EQ((lines_t{"x", "0,1"}), lines_of(m_text));
    EXPECT_EQ(2, changes()); // the new line, then the character
    qortest::CReportCapture capture;
    CText empty, twice, back;
    empty.on_new_line();
    EXPECT_EQ(nullptr, empty.get_caret_line_string()); // past the end
    empty.on_delete();                                 // nothing there
    empty.insert('y', false);
    EXPECT_EQ((lines_t{"", "y", "1,1"}), lines_of(empty));
    twice.on_new_line();
    twice.on_new_line();
    EXPECT_EQ((lines_t{"", "", "", "2,0"}), lines_of(twice));
    back.on_new_line();
    back.on_back_space();
    EXPECT_EQ((lines_t{"", "0,0"}), lines_of(back));
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(TextTest, EditingJoinsAndSplitsLinesAndOnlyInsertionsAreChanges) {
    type("ab\ncd");
    EXPECT_EQ(6, changes());                           // a line, two characters, a break, two characters
    CFont *p_font = reinterpret_cast<CFont *>(0x1000); // never dereferenced by the text
    m_text.set_string_font(0, p_font);
    m_text.on_back_space();
    m_text.on_caret_left();
    m_text.on_home();
    m_text.on_back_space(); // at the start of a line: joined to the one above
    EXPECT_EQ((lines_t{"abc", "0,2"}), lines_of(m_text));
    m_text.on_delete();
    m_text.on_end();
    m_text.on_delete(); // the end of the last line
    m_text.on_home();
    m_text.on_back_space(); // column 0 of line 0
    EXPECT_EQ(0, changes());
    m_text.set_caret_char(1);
    m_text.on_new_line(); // splits, and the font stays above
    EXPECT_EQ((lines_t{"a", "b", "1,0"}), lines_of(m_text));
    EXPECT_EQ(p_font, m_text.get_string_font(0));
    EXPECT_EQ(nullptr, m_text.get_string_font(1));
    m_text.set_caret_line(0);
    m_text.on_end();
    m_text.on_delete(); // at the end of a line: the next one joins
    EXPECT_EQ((lines_t{"ab", "0,1"}), lines_of(m_text));
    EXPECT_EQ(2, m_resized); // the two caret setters tell the owner by a resized event
}

TEST_F(TextTest, TheCaretMovesAcrossLinesOnlyInMultilineTexts) {
    type("abc\nx\nlonger");
    struct {
        void (CText::*mp_move)();
        char const *mp_caret;
    } const steps[] = {
        {&CText::on_caret_up, "1,1"},    // cut to the short line
        {&CText::on_caret_down, "2,1"},  // the column isn't remembered
        {&CText::on_end, "2,6"},         //
        {&CText::on_caret_right, "2,6"}, // the end of the last line stays
        {&CText::on_caret_up, "1,1"},    //
        {&CText::on_caret_right, "2,0"}, // over the line's end
        {&CText::on_caret_left, "1,1"},  // and back
    };
    for (auto const &step : steps) {
        (m_text.*step.mp_move)();
        EXPECT_EQ(step.mp_caret, lines_of(m_text).back());
    }
    CText single;
    single.set_multiline(false);
    single.insert("ab\ncd", false, false);
    single.on_home();
    for (auto move : {&CText::on_caret_left, &CText::on_caret_up, &CText::on_caret_down})
        (single.*move)();
    EXPECT_EQ((lines_t{"abcd", "0,0"}), lines_of(single)); // breaks are ignored
    m_text.set_multiline(false);                           // keeps the first line
    EXPECT_EQ((lines_t{"abc", "0,0"}), lines_of(m_text));
}

TEST_F(TextTest, TrimmingDropsTheOldestLinesAndTheCaretFollows) {
    m_text.set_max_strings(2);
    type("one\ntwo");
    changes();
    m_text.insert(10, false);
    EXPECT_EQ((lines_t{"two", "", "1,0"}), lines_of(m_text));
    EXPECT_EQ(2, changes()); // the break, the trimmed line
    m_text.set_caret_line(0);
    m_text.set_caret_char(2);
    m_text.set_max_strings(1); // the caret's own line goes: it returns to 0, 0
    EXPECT_EQ((lines_t{"", "0,0"}), lines_of(m_text));
}

TEST_F(TextTest, InsertionTakesEscapesUnitsAndForcedInputAndCopiesTakeLinesButNotSettings) {
    m_text.insert("a\\nb", false, true);
    EXPECT_EQ((lines_t{"a", "b", "1,1"}), lines_of(m_text));
    CText raw;
    raw.insert("a\\nb\nc", false, false);
    EXPECT_EQ((lines_t{"a\\nb", "c", "1,1"}), lines_of(raw)); // a real line feed always breaks
    unsigned short const wide[] = {'x', '\\', 'n', 'y', 0};
    EXPECT_EQ((lines_t{"x", "y", "", "2,0"}), lines_of(CText(wide)));
    CText locked;
    locked.set_editable(false);
    locked.insert('x', false);
    EXPECT_EQ(0u, locked.get_num_strings());
    locked.insert('x', true);
    EXPECT_EQ(1u, locked.get_num_strings());
    locked = "assigned"; // assignment isn't forced: it only clears
    EXPECT_EQ(0u, locked.get_num_strings());
    m_text = "abc";
    EXPECT_EQ((lines_t{"abc", "", "1,0"}), lines_of(m_text));
    changes();
    m_text.clear();
    EXPECT_EQ(3, changes()); // two lines, and once more at the end

    m_text.set_max_strings(5);
    type("a\nb");
    m_text.set_string_font(1, reinterpret_cast<CFont *>(0x2000));
    CText copy(m_text);
    EXPECT_EQ((lines_t{"a", "b", "0,0"}), lines_of(copy));
    EXPECT_EQ(m_text.get_string_font(1), copy.get_string_font(1));
    EXPECT_EQ(1024u, copy.get_max_strings());
    EXPECT_NE(m_text.get_string(0), copy.get_string(0)); // lines of its own
    locked = m_text;
    EXPECT_FALSE(locked.get_editable());
    locked = locked;
    EXPECT_EQ(2u, locked.get_num_strings());
    qortest::CReportCapture capture;
    EXPECT_EQ(nullptr, locked.get_string(3u));
    locked.set_string_font(9, nullptr);
    EXPECT_EQ(2u, capture.asserts().size());
}
