// The edit box and its caret driven through the desktop: keys and characters, the caret's place and
// blink, the text's shift, the vertical bar with overflow, automatic scrolling, and layouts.
#include "ui_edit_box.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

// The default font is 18 pixels high; 'a' is 9 pixels wide, 'b' 10, 'c' 8, 'd' 10. A box of 100
// by 40 in a dialog, margins left 4, right 5, top and bottom 2: a client area 36 pixels high, two
// lines. The click activates it.
class EditBoxTest : public ::testing::Test {
protected:
    void SetUp() override {
        mp_dialog =
            world.place(&world.desktop(), new CWindowVisual(&world.desktop(), "dialog"), 0, 0, 320, 240);
        mp_box = world.place(mp_dialog, new CEditBox(&world.desktop(), "edit"), 20, 20, 100, 40);
        mp_box->set_left_margin(4);
        mp_box->set_right_margin(5);
        mp_box->set_top_margin(2);
        mp_box->set_bottom_margin(2);
        world.click_at(110, 50);
    }
    // The lines joined by '|'.
    std::string text() {
        std::string joined;
        for (unsigned i = 0; i < mp_box->get_text().get_num_strings(); ++i)
            joined += (i ? "|" : "") + std::string(mp_box->get_text().get_string(i)->get_c());
        return joined;
    }
    point_t caret() { return mp_box->get_caret()->get_pos(); }
    // A vertical bar 16 pixels wide, as a layout would give it.
    CScrollBar *add_bar() {
        mp_box->set_scrollable_v(true);
        mp_box->get_scroll_bar_vert()->set_size(16, 10);
        return mp_box->get_scroll_bar_vert();
    }

    qortest::CWorld world;
    CWindowVisual *mp_dialog = nullptr;
    CEditBox *mp_box = nullptr;
};

} // namespace

// "ab", return, "cd", left: the caret stands between c and d, at line 1, column 1; then the key.
// The caret's right limit is 100 - 3 - 5 = 92: twelve a's, ending at 4 + 108, shift the text left.
TEST_F(EditBoxTest, KeysEditTheTextAndPlaceTheCaretWhichShiftsTheTextAtTheRight) {
    struct {
        unsigned m_key;
        char const *mp_text;
        int m_x, m_y;
    } const rows[] = {
        {8, "ab|d", 4, 20},    {13, "ab|c|d", 4, 38}, {35, "ab|cd", 22, 20}, {36, "ab|cd", 4, 20},
        {37, "ab|cd", 4, 20},  {38, "ab|cd", 13, 2},  {39, "ab|cd", 22, 20}, {40, "ab|cd", 12, 20},
        {45, "ab|cd", 12, 20}, {46, "ab|c", 12, 20},  {65, "ab|cd", 12, 20},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_key);
        mp_box->get_text().clear();
        world.type("ab");
        world.key(13);
        world.type("cd");
        world.key(37);
        world.key(row.m_key);
        EXPECT_EQ(row.mp_text, text());
        EXPECT_EQ((std::vector<int>{row.m_x, row.m_y}), (std::vector<int>{caret().x, caret().y}));
    }
    mp_box->get_text().clear();
    world.type("aaaaaaaaaaaa");
    EXPECT_EQ((std::vector<int>{92, -20}), (std::vector<int>{caret().x, mp_box->get_text_offset().x}));
    world.key(36);
    EXPECT_EQ((std::vector<int>{4, 0}), (std::vector<int>{caret().x, mp_box->get_text_offset().x}));
}

// Handled input stops at the box; the rest may go on to the dialog. Characters are the low 16 bits
// of the code. A read-only box consumes printable characters without inserting them and lets
// every key pass. The text is "x" and a line break, the caret on the empty line.
TEST_F(EditBoxTest, HandledInputGoesNoFurther) {
    struct {
        bool m_editable;
        EEventType m_type;
        int m_code;
        bool m_reaches_dialog;
        char const *mp_text;
    } const rows[] = {
        {true, EVENT_KEY_DOWN, 37, false, "x|"},   {true, EVENT_KEY_DOWN, 65, true, "x|"},
        {true, EVENT_CHAR, 0x10061, false, "x|a"}, {true, EVENT_CHAR, 9, true, "x|"},
        {true, EVENT_CHAR, 127, true, "x|"},       {false, EVENT_KEY_DOWN, 8, true, "x|"},
        {false, EVENT_CHAR, 'a', false, "x|"},
    };
    int reached = 0;
    for (EEventType type : {EVENT_KEY_DOWN, EVENT_CHAR})
        mp_dialog->register_callback(type, CEventCallback([&reached](CWndEvent const *) { ++reached; }));
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_code);
        mp_box->get_text().set_editable(true);
        mp_box->get_text() = "x";
        mp_box->get_text().set_editable(row.m_editable);
        reached = 0;
        CWndEvent event(row.m_type);
        event << row.m_code << 0;
        event.set_dispatch_type(CWndEvent::DISPATCH_PARENT);
        world.desktop().send_event(mp_box, &event, CWndEvent::DISPATCH_NONE);
        EXPECT_EQ(row.m_reaches_dialog ? 1 : 0, reached);
        EXPECT_EQ(row.mp_text, text());
    }
}

// Typing shows the caret for a full phase of 500 ms; blink time 0 toggles at every update. The
// caret is visible while the box is active, and a hidden caret goes on blinking.
TEST_F(EditBoxTest, CaretShowsWhileActiveAndBlinksOnTheClock) {
    CCaret *p_caret = mp_box->get_caret();
    EXPECT_FALSE(p_caret->is_hidden());
    world.type("a");
    for (auto const &phase : {std::make_pair(499, true), {1, false}, {499, false}, {1, true}}) {
        world.clock().advance_ms(phase.first);
        world.frame();
        EXPECT_EQ(phase.second, p_caret->is_checked()) << qorplatform::get_tick_count();
    }
    p_caret->set_blink_time(0);
    world.click_at(300, 200); // the dialog takes the activation
    EXPECT_TRUE(p_caret->is_hidden());
    for (bool checked : {false, true, false}) {
        world.frame();
        EXPECT_EQ(checked, p_caret->is_checked());
    }
}

// Two lines of 18 pixels fill a client area of 36 exactly; one pixel less overflows. A single-line
// text never shows the bar.
TEST_F(EditBoxTest, BarComesExactlyWhenTheLinesOverflow) {
    struct {
        int m_h;
        char const *mp_text;
        bool m_shown;
        float m_max;
    } const rows[] = {{40, "a", false, 0.0f}, {39, "a", true, 1.0f}, {40, "a\\nb", true, 18.0f}};
    CScrollBar *p_bar = add_bar();
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_h);
        mp_box->set_size(100, row.m_h);
        mp_box->get_text() = row.mp_text;
        EXPECT_EQ(!row.m_shown, p_bar->is_hidden());
        if (row.m_shown) {
            EXPECT_EQ((std::vector<float>{84, (float)row.m_h, row.m_max, row.m_max}),
                      (std::vector<float>{(float)p_bar->get_pos().x, (float)p_bar->get_h(), p_bar->get_max(),
                                          p_bar->get_position()}));
        }
    }
    mp_box->get_text().set_multiline(false);
    mp_box->set_size(100, 10);
    EXPECT_TRUE(p_bar->is_hidden());
}

// A scroll moves the bar by its small step, 1% of the range; a caret movement leaves it, and each
// change of the text takes it back to the end. Rolling text moves 0.1 pixel per millisecond of the
// frame; without a bar nothing rolls.
TEST_F(EditBoxTest, EachChangeScrollsToTheEndAndAutoScrollRollsByTheFramesTime) {
    qortest::load_state(mp_box,
                        "{ name = 'edit', class_name = 'EditBox', auto_scroll = true, scroll_speed = 0.1 }");
    qortest::CReportCapture reports;
    world.frame();
    world.clock().advance_ms(100);
    world.frame();
    EXPECT_TRUE(reports.reports().empty());
    qortest::load_state(mp_box, "{ name = 'edit', class_name = 'EditBox', auto_scroll = false }");
    CScrollBar *p_bar = add_bar();
    mp_box->get_text() = "a\\nb\\nc\\nd\\ne\\nf"; // 7 lines, 126 pixels: a range of 90
    mp_box->send_event(mp_box, EVENT_LINE_UP, CWndEvent::DISPATCH_NONE);
    EXPECT_FLOAT_EQ(89.1f, p_bar->get_position());
    world.key(38);
    EXPECT_FLOAT_EQ(89.1f, p_bar->get_position());
    EXPECT_EQ(2 + 5 * 18, caret().y);
    world.type("x");
    EXPECT_FLOAT_EQ(90.0f, p_bar->get_position());
    qortest::load_state(mp_box, "{ name = 'edit', class_name = 'EditBox', auto_scroll = true }");
    p_bar->set_position(0.0f);
    world.frame();
    world.clock().advance_ms(100);
    world.frame();
    EXPECT_FLOAT_EQ(10.0f, p_bar->get_position());
}

// A key without a local string shows itself. Layout keys of the wrong type or with unknown names
// leave the fields as they were; neither the text nor the bar flags are saved.
TEST_F(EditBoxTest, SetStrShowsTheKeyAndLayoutKeysLoadOnlyWithTheirTypes) {
    qortest::CReportCapture reports; // no service in this process
    CWndEvent event(EVENT_SET_STR);
    event << string("menu_title");
    mp_box->send_event(mp_box, &event, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ("menu_title|", text());
    EXPECT_EQ(20, caret().y);
    mp_box->get_text().clear();
    qortest::load_state(mp_box,
                        "{ name = 'edit', class_name = 'EditBox', text = { { string = 'hi' } },"
                        " text_alignment = 'ALIGNMENT_CENTER', auto_scroll = true, scroll_speed = 0.5,"
                        " is_scrollable_v = true }");
    qortest::load_state(
        mp_box, "{ name = 'edit', class_name = 'EditBox', text = 'no', text_alignment = 'CENTER',"
                " auto_scroll = 1, scroll_speed = 'x', is_scrollable_v = 'no', is_scrollable_h = true }");
    EXPECT_EQ("hi|", text());
    EXPECT_TRUE(mp_box->get_scrollable_v());
    EXPECT_TRUE(mp_box->get_scrollable_h());
    LuaPlus::LuaObject saved = qortest::saved_state(mp_box);
    EXPECT_STREQ("ALIGNMENT_CENTER", saved.GetByName("text_alignment").GetString());
    EXPECT_TRUE(saved.GetByName("auto_scroll").GetBoolean());
    EXPECT_EQ(0.5, saved.GetByName("scroll_speed").GetNumber());
    EXPECT_TRUE(saved.GetByName("text").IsNil());
    EXPECT_TRUE(saved.GetByName("is_scrollable_v").IsNil());
    qortest::load_state(mp_box, "{ name = 'edit', class_name = 'EditBox', is_scrollable_v = false }");
    EXPECT_FALSE(mp_box->get_scrollable_v());
}
