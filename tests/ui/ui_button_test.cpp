// Push buttons, check boxes and radio buttons in the test world, driven by the pointer: where the
// caption, checker and label go in each state, which font and material are chosen, the order of
// the events of a click, radio groups, and the layout keys.
#include "ui_button.h"

#include "engine_interfaces.h"
#include "interface_server.h"
#include "log_manager.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class ButtonsTest : public ::testing::Test {
protected:
    ButtonsTest() { m_world.clock().advance_ms(150); } // the desktop has faded in
    void TearDown() override { engine_interfaces().set_server(nullptr); }

    // A material of the world in a colour whose red byte names it.
    void add_colour(CWindowVisual *_p_wnd, HUID const &_id, unsigned char _red) {
        _p_wnd->add_material(_id, m_world.colour(_red, 0, 0));
    }
    // The red bytes of the last frame's quads, glyphs left out.
    std::vector<int> reds() {
        std::vector<int> found;
        int const glyph = default_font() ? default_font()->get_char_material('A')->get_material_handle() : -1;
        for (auto const &drawn : m_world.drawn())
            if (drawn.m_op == "quad" && drawn.m_handle != glyph) found.push_back(drawn.m_colour.r);
        return found;
    }
    CRectArea quad_of_red(int _red) {
        for (auto const &drawn : m_world.drawn())
            if (drawn.m_op == "quad" && drawn.m_colour.r == _red) return drawn.m_rect;
        return CRectArea(-1, -1, -1, -1);
    }
    CFont *default_font() { return m_world.desktop().get_font(FNT_NAME_DEFAULT); }
    CFont *courier() { return m_world.desktop().get_font(FNT_NAME_FIXED); }
    LuaPlus::LuaObject table(std::string const &_chunk) {
        lua_machine().DoString(("button_probe = " + _chunk).c_str());
        return lua_machine().GetGlobals().GetByName("button_probe");
    }

    // For the tests that read the log: an engine with a log manager.
    void use_log() {
        m_log.set_quiet(true);
        m_server.register_interface(&m_log);
        engine_interfaces().set_server(&m_server);
    }

    qorhost::CInterfaceServer m_server;
    qorhost::CLogManager m_log;
    qortest::CWorld m_world;
};

} // namespace

// ---------------------------------------------------------------------------------------------
// Push button
// ---------------------------------------------------------------------------------------------

TEST_F(ButtonsTest, TheCaptionIsCentredInTheClientAreaAndSinksWhilePressedUnderThePointerOrChecked) {
    CButton *p_button =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "ok"), 40, 50, 81, 31);
    p_button->m_text = CString("OK");
    p_button->set_left_margin(4);
    p_button->set_top_margin(2);
    int const text_w = p_button->get_canvas().get_text_width(p_button->m_text, default_font(), -1);
    int const font_h = p_button->get_canvas().get_text_height(default_font());
    // The client area is 77 by 29 at (4, 2); each half is truncated by itself.
    int const x = 40 + 77 / 2 - text_w / 2 + 4, y = 50 + 29 / 2 - font_h / 2 + 2;
    struct {
        char const *m_state;
        void (*m_act)(qortest::CWorld &, CButton *);
        int m_sink;
    } const rows[] = {
        {"pointer away", [](qortest::CWorld &_w, CButton *) { _w.move_to(300, 200); }, 0},
        {"pointer over", [](qortest::CWorld &_w, CButton *) { _w.move_to(60, 60); }, 0},
        {"pressed over", [](qortest::CWorld &_w, CButton *) { _w.press(); }, 1},
        {"pressed, pointer gone", [](qortest::CWorld &_w, CButton *) { _w.move_to(300, 200); }, 0},
        {"released away", [](qortest::CWorld &_w, CButton *) { _w.release(); }, 0},
        {"checked, pointer away", [](qortest::CWorld &, CButton *_p) { _p->set_checked(true); }, 1},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_state);
        row.m_act(m_world, p_button);
        m_world.frame();
        std::vector<CRectArea> const glyphs = m_world.glyphs(default_font());
        ASSERT_EQ(2u, glyphs.size());
        EXPECT_EQ(x + row.m_sink, glyphs[0].x);
        EXPECT_EQ(y + row.m_sink, glyphs[0].y);
    }
}

// The pushed font is asked for after the checked one and replaces it even when there is none.
TEST_F(ButtonsTest, ThePushedFontOverridesTheCheckedOneEvenWhenItIsMissing) {
    CButton *p_button =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "b"), 40, 50, 80, 30);
    p_button->m_text = CString("B");
    p_button->add_font(FNT_NAME_BUTTON_CHECKED, get_fonts_factory().create("courier", &m_world.desktop()));
    CFont *p_checked_font = p_button->get_font(FNT_NAME_BUTTON_CHECKED);
    p_button->set_checked(true);
    m_world.frame();
    EXPECT_EQ(1u, m_world.glyphs(p_checked_font).size());
    m_world.move_to(60, 60);
    m_world.press();
    m_world.frame();
    EXPECT_EQ(0u, m_world.glyphs(p_checked_font).size());
    EXPECT_EQ(1u, m_world.glyphs(default_font()).size());
}

TEST_F(ButtonsTest, WithoutAnyFontOnlyAButtonWithACaptionIsReported) {
    use_log();
    CButton *p_silent =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "silent"), 0, 0, 50, 20);
    CButton *p_named =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "named"), 0, 30, 50, 20);
    add_colour(p_silent, MAT_NAME_NORMAL, 7);
    p_named->m_text = CString("X");
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    unsigned const first = m_log.get_next_index();
    m_world.frame();
    ASSERT_EQ(first + 1, m_log.get_next_index());
    EXPECT_NE(std::string::npos, m_log.get_message_text(first).find("No font was found for button named"));
    EXPECT_EQ(std::vector<int>{7}, reds()); // the bodies are drawn all the same
}

// ---------------------------------------------------------------------------------------------
// Check box
// ---------------------------------------------------------------------------------------------

namespace {

enum : unsigned char { k_on = 1, k_on_disabled, k_off, k_off_disabled, k_highlight, k_body };

class CheckBoxTest : public ButtonsTest {
protected:
    void SetUp() override {
        mp_box = m_world.place(&m_world.desktop(), new CCheckBox(&m_world.desktop(), "box"), 30, 40, 120, 24);
        mp_box->m_text = CString("Sound");
        add_colour(mp_box, MAT_NAME_CHECKER_ON, k_on);
        add_colour(mp_box, MAT_NAME_CHECKER_ON_DISABLED, k_on_disabled);
        add_colour(mp_box, MAT_NAME_CHECKER_OFF, k_off);
        add_colour(mp_box, MAT_NAME_CHECKER_OFF_DISABLED, k_off_disabled);
        add_colour(mp_box, MAT_NAME_HIGHLIGHTED, k_highlight);
        add_colour(mp_box, MAT_NAME_NORMAL, k_body);
    }
    // The body, then the checker.
    std::vector<int> drawn_frame() {
        m_world.frame();
        return reds();
    }

    CCheckBox *mp_box = nullptr;
};

} // namespace

TEST_F(CheckBoxTest, TheCheckerFollowsCheckedDisabledAndHighlightedWhileTheBodyIsNeverHighlighted) {
    struct {
        bool m_checked, m_disabled, m_pointer_over;
        int m_checker;
    } const rows[] = {
        {false, false, false, k_off},         {true, false, false, k_on},
        {false, true, false, k_off_disabled}, {true, true, false, k_on_disabled},
        {false, false, true, k_highlight},    {true, false, true, k_highlight},
        {true, true, true, k_on_disabled},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "checked " << row.m_checked << ", disabled " << row.m_disabled
                                        << ", pointer over " << row.m_pointer_over);
        m_world.move_to(300, 200);
        mp_box->set_checked(row.m_checked);
        mp_box->set_disabled(row.m_disabled);
        if (row.m_pointer_over) m_world.move_to(100, 50);
        EXPECT_EQ((std::vector<int>{k_body, row.m_checker}), drawn_frame());
    }
}

TEST_F(CheckBoxTest, TheCheckerStandsAtTheLeftCentredAndTheLabelHalfACheckerBeyondIt) {
    int const font_h = mp_box->get_canvas().get_text_height(default_font());
    struct {
        int m_w, m_h;
        CRectArea m_checker;
        int m_label_x;
    } const rows[] = {
        {16, 16, CRectArea(30, 40 + 12 - 8, 16, 16), 30 + 8 + 16},
        {10, 7, CRectArea(30, 40 + 12 - 3, 10, 7), 30 + 5 + 10}, // 7 / 2 is 3
    };
    std::vector<std::string> events;
    qortest::log_events(mp_box, {EVENT_RESIZED}, events);
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_w);
        events.clear();
        mp_box->set_checker_size(row.m_w, row.m_h);
        EXPECT_EQ(std::vector<std::string>{"EVENT_RESIZED"}, events);
        m_world.frame();
        CRectArea const checker = quad_of_red(k_off);
        EXPECT_EQ(row.m_checker.x, checker.x);
        EXPECT_EQ(row.m_checker.y, checker.y);
        EXPECT_EQ(row.m_checker.w, checker.w);
        EXPECT_EQ(row.m_checker.h, checker.h);
        std::vector<CRectArea> const glyphs = m_world.glyphs(default_font());
        ASSERT_EQ(5u, glyphs.size());
        EXPECT_EQ(row.m_label_x, glyphs[0].x);
        EXPECT_EQ(40 + 12 - font_h / 2, glyphs[0].y);
    }
    // Checker and label are clipped to the whole window, not to the body's visual deltas.
    LuaPlus::LuaObject deltas =
        table("{ name = 'box', class_name = 'CheckBox', visual_delta_left = 2,"
              " visual_delta_top = 2, visual_delta_right = 2, visual_delta_bottom = 2 }");
    mp_box->load_state(deltas);
    m_world.frame();
    EXPECT_NE(std::string::npos, m_world.clips().find("28,38 124x28; 30,40 120x24")) << m_world.clips();
}

// After a click the highlight picture stays off, so the new state shows under the pointer, until
// the pointer leaves and comes back.
TEST_F(CheckBoxTest, AClickTogglesSendsItsEventFirstAndHidesTheHighlightUntilThePointerComesBack) {
    std::vector<std::string> events;
    qortest::log_events(mp_box, {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);
    m_world.move_to(100, 50);
    EXPECT_EQ(k_highlight, drawn_frame()[1]);
    m_world.click_at(100, 50);
    EXPECT_TRUE(mp_box->is_checked());
    EXPECT_EQ((std::vector<std::string>{"EVENT_CHECKED", "EVENT_CLICK"}), events);
    EXPECT_EQ(k_on, drawn_frame()[1]);
    m_world.move_to(110, 52); // still inside: no new entry
    EXPECT_EQ(k_on, drawn_frame()[1]);
    m_world.move_to(300, 200);
    m_world.move_to(100, 50);
    EXPECT_EQ(k_highlight, drawn_frame()[1]);
    events.clear();
    m_world.click_at(100, 50);
    EXPECT_FALSE(mp_box->is_checked());
    EXPECT_EQ((std::vector<std::string>{"EVENT_UNCHECKED", "EVENT_CLICK"}), events);
    EXPECT_EQ(k_off, drawn_frame()[1]);
}

TEST_F(CheckBoxTest, AMissingCheckerOrFontLeavesOnlyThatPartOut) {
    mp_box->add_material(MAT_NAME_CHECKER_OFF, nullptr);
    EXPECT_EQ(std::vector<int>{k_body}, drawn_frame());
    EXPECT_EQ(5u, m_world.glyphs(default_font()).size());
    qortest::CReportCapture capture;
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    mp_box->set_checked(true);
    EXPECT_EQ((std::vector<int>{k_body, k_on}), drawn_frame());
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(CheckBoxTest, CheckerSizeGoesThroughALayoutOnlyAsWholeNumbers) {
    mp_box->set_checker_size(12, 9);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    mp_box->save_state(saved);
    EXPECT_EQ(12, saved.GetByName("checker_w").GetInteger());
    EXPECT_EQ(9, saved.GetByName("checker_h").GetInteger());
    EXPECT_TRUE(saved.GetByName("text").IsNil()); // the label isn't kept
    struct {
        char const *m_keys;
        int m_w, m_h;
    } const rows[] = {
        {"checker_w = 20, checker_h = 18", 20, 18},
        {"checker_w = 12.5, checker_h = '30'", 20, 18},
        {"checker_w = true, checker_h = {}", 20, 18},
        {"checker_w = -4", -4, 18},
    };
    qortest::CReportCapture capture;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_keys);
        LuaPlus::LuaObject layout =
            table(std::string("{ name = 'box', class_name = 'CheckBox', ") + row.m_keys + " }");
        mp_box->load_state(layout);
        EXPECT_EQ(row.m_w, mp_box->get_checker_w());
        EXPECT_EQ(row.m_h, mp_box->get_checker_h());
    }
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(ButtonsTest, ACaptionGoesThroughALayoutOnlyAsAString) {
    CButton button(&m_world.desktop(), "b");
    button.m_text = CString("Go");
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    button.save_state(saved);
    EXPECT_STREQ("Go", saved.GetByName("text").GetString());
    CButton copy(&m_world.desktop(), "b");
    copy.load_state(saved);
    EXPECT_EQ(CString("Go"), copy.m_text);
    for (char const *row : {"text = 7", "text = {}", "text = false"}) {
        SCOPED_TRACE(row);
        LuaPlus::LuaObject layout = table(std::string("{ name = 'b', class_name = 'Button', ") + row + " }");
        copy.load_state(layout);
        EXPECT_EQ(CString("Go"), copy.m_text);
    }
}

// ---------------------------------------------------------------------------------------------
// Radio button
// ---------------------------------------------------------------------------------------------

// A radio button derived from the class belongs to the group as well.
class CTestRadio : public CRadioButton {
public:
    using CRadioButton::CRadioButton;
};

TEST_F(ButtonsTest, AClickOnARadioButtonTurnsOffTheOtherRadioButtonsOfItsParentOnly) {
    CWindowVisual *p_group =
        m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), "group"), 0, 0, 200, 100);
    CWindowVisual *p_other =
        m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), "other"), 0, 120, 200, 30);
    CRadioButton *p_a = m_world.place(p_group, new CRadioButton(&m_world.desktop(), "a"), 0, 0, 100, 20);
    CRadioButton *p_b = m_world.place(p_group, new CTestRadio(&m_world.desktop(), "b"), 0, 25, 100, 20);
    CRadioButton *p_c = m_world.place(p_group, new CRadioButton(&m_world.desktop(), "c"), 0, 50, 100, 20);
    CCheckBox *p_box = m_world.place(p_group, new CCheckBox(&m_world.desktop(), "box"), 0, 75, 100, 20);
    CRadioButton *p_elsewhere =
        m_world.place(p_other, new CRadioButton(&m_world.desktop(), "e"), 0, 0, 100, 20);
    for (CCheckBox *p_on : std::initializer_list<CCheckBox *>{p_a, p_c, p_box, p_elsewhere})
        p_on->set_checked(true);
    std::vector<std::string> events;
    qortest::log_events(p_b, {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);

    m_world.click_at(10, 30);
    EXPECT_FALSE(p_a->is_checked());
    EXPECT_TRUE(p_b->is_checked());
    EXPECT_FALSE(p_c->is_checked());
    EXPECT_TRUE(p_box->is_checked());
    EXPECT_TRUE(p_elsewhere->is_checked());
    m_world.click_at(10, 30);
    EXPECT_TRUE(p_b->is_checked()); // a radio button that is on stays on
    EXPECT_EQ((std::vector<std::string>{"EVENT_CLICK", "EVENT_CLICK"}), events);
}

// A radio button's click doesn't hide the highlight picture: the owner sees its own state.
TEST_F(ButtonsTest, ARadioButtonKeepsItsHighlightAfterAClick) {
    CRadioButton *p_radio =
        m_world.place(&m_world.desktop(), new CRadioButton(&m_world.desktop(), "r"), 10, 10, 100, 20);
    add_colour(p_radio, MAT_NAME_CHECKER_ON, k_on);
    add_colour(p_radio, MAT_NAME_HIGHLIGHTED, k_highlight);
    m_world.click_at(20, 20);
    ASSERT_TRUE(p_radio->is_checked());
    m_world.frame();
    EXPECT_EQ(std::vector<int>{k_highlight}, reds());
}

TEST(RadioButton, WithoutAParentItOnlyTurnsOn) {
    qortest::CWorld world;
    CRadioButton radio(&world.desktop(), "alone");
    radio.send_event(&radio, EVENT_CLICK, CWndEvent::DISPATCH_NONE);
    EXPECT_TRUE(radio.is_checked());
}
