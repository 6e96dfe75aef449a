// Push buttons, check boxes and radio buttons in the test world, driven by the pointer: where the
// caption, checker and label go in each state, the material chosen, the events of a click, radio
// groups, the missing font, and the layout keys.
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

typedef std::vector<std::string> events_t;
enum : unsigned char { k_on = 1, k_on_disabled, k_off, k_off_disabled, k_highlight, k_body };

// A check box of 120 by 24 at (30, 40) with a material for each state, its red byte naming it.
class ButtonsTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_box = m_world.place(&m_world.desktop(), new CCheckBox(&m_world.desktop(), "box"), 30, 40, 120, 24);
        mp_box->m_text = CString("Sound");
        HUID const *const ids[] = {&MAT_NAME_CHECKER_ON,  &MAT_NAME_CHECKER_ON_DISABLED,
                                   &MAT_NAME_CHECKER_OFF, &MAT_NAME_CHECKER_OFF_DISABLED,
                                   &MAT_NAME_HIGHLIGHTED, &MAT_NAME_NORMAL};
        for (unsigned char red = k_on; red <= k_body; ++red)
            mp_box->add_material(*ids[red - 1], m_world.colour(red, 0, 0));
    }
    void TearDown() override { engine_interfaces().set_server(nullptr); }

    CFont *font() { return m_world.desktop().get_font(FNT_NAME_DEFAULT); }
    // The red bytes of a new frame's quads, glyphs left out.
    std::vector<int> frame_reds() {
        m_world.frame();
        std::vector<int> reds;
        int const glyph = font() ? font()->get_char_material('A')->get_material_handle() : -1;
        for (auto const &drawn : m_world.drawn())
            if (drawn.m_op == "quad" && drawn.m_handle != glyph) reds.push_back(drawn.m_colour.r);
        return reds;
    }
    LuaPlus::LuaObject layout(std::string const &_table) {
        lua_machine().DoString(("probe = " + _table).c_str());
        return lua_machine().GetGlobals().GetByName("probe");
    }

    qorhost::CInterfaceServer m_server;
    qorhost::CLogManager m_log;
    qortest::CWorld m_world;
    CCheckBox *mp_box = nullptr;
};

} // namespace

TEST_F(ButtonsTest, TheCaptionIsCentredInTheClientAreaAndSinksWhilePressedUnderThePointerOrChecked) {
    CButton *p_button =
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "ok"), 40, 80, 81, 31);
    p_button->m_text = CString("OK");
    mp_box->m_text = CString();
    p_button->set_left_margin(4);
    p_button->set_top_margin(2);
    int const text_w = p_button->get_canvas().get_text_width(p_button->m_text, font(), -1);
    int const x = 40 + 77 / 2 - text_w / 2 + 4,
              y = 80 + 29 / 2 - p_button->get_canvas().get_text_height(font()) / 2 + 2;
    struct {
        char const *m_state;
        void (*m_act)(qortest::CWorld &, CButton *);
        int m_sink;
    } const rows[] = {
        {"pointer over", [](qortest::CWorld &_w, CButton *) { _w.move_to(60, 90); }, 0},
        {"pressed over", [](qortest::CWorld &_w, CButton *) { _w.press(); }, 1},
        {"pressed, pointer gone", [](qortest::CWorld &_w, CButton *) { _w.move_to(300, 200); }, 0},
        {"released away", [](qortest::CWorld &_w, CButton *) { _w.release(); }, 0},
        {"checked, pointer away", [](qortest::CWorld &, CButton *_p) { _p->set_checked(true); }, 1},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_state);
        row.m_act(m_world, p_button);
        m_world.frame();
        std::vector<CRectArea> const glyphs = m_world.glyphs(font());
        ASSERT_EQ(2u, glyphs.size());
        EXPECT_EQ(x + row.m_sink, glyphs[0].x);
        EXPECT_EQ(y + row.m_sink, glyphs[0].y);
    }
}

TEST_F(ButtonsTest, WithoutAnyFontOnlyAButtonWithACaptionIsReported) {
    m_log.set_quiet(true);
    m_server.register_interface(&m_log);
    engine_interfaces().set_server(&m_server);
    m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "silent"), 0, 0, 20, 20);
    m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "named"), 0, 80, 20, 20)->m_text =
        CString("X");
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    unsigned const first = m_log.get_next_index();
    EXPECT_EQ((std::vector<int>{k_body, k_off}), frame_reds()); // the check box draws no label, quietly
    ASSERT_EQ(first + 1, m_log.get_next_index());
    EXPECT_NE(std::string::npos, m_log.get_message_text(first).find("No font was found for button named"));
}

// The body is never drawn highlighted: the highlight belongs to the checker.
TEST_F(ButtonsTest, TheCheckerFollowsCheckedDisabledAndHighlighted) {
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
        SCOPED_TRACE(testing::Message() << row.m_checked << row.m_disabled << row.m_pointer_over);
        m_world.move_to(300, 200);
        mp_box->set_checked(row.m_checked);
        mp_box->set_disabled(row.m_disabled);
        if (row.m_pointer_over) m_world.move_to(100, 50);
        EXPECT_EQ((std::vector<int>{k_body, row.m_checker}), frame_reds());
    }
}

// The checker stands at the left edge, centred; the label half a checker width beyond it; both are
// clipped to the window, not to the body's visual deltas.
TEST_F(ButtonsTest, TheCheckerAndTheLabelStandByTheCheckerSize) {
    LuaPlus::LuaObject deltas =
        layout("{ name = 'box', class_name = 'CheckBox', visual_delta_left = 2,"
               " visual_delta_top = 2, visual_delta_right = 2, visual_delta_bottom = 2 }");
    mp_box->load_state(deltas);
    struct {
        int m_w, m_h, m_checker_y, m_label_x;
    } const rows[] = {{16, 16, 40 + 12 - 8, 30 + 8 + 16}, {10, 7, 40 + 12 - 3, 30 + 5 + 10}}; // 7 / 2 is 3
    events_t events;
    qortest::log_events(mp_box, {EVENT_RESIZED}, events);
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_w);
        mp_box->set_checker_size(row.m_w, row.m_h);
        m_world.frame();
        EXPECT_NE(std::string::npos, m_world.clips().find("28,38 124x28; 30,40 120x24")) << m_world.clips();
        CRectArea checker;
        for (auto const &drawn : m_world.drawn())
            if (drawn.m_op == "quad" && drawn.m_colour.r == k_off) checker = drawn.m_rect;
        EXPECT_EQ((std::vector<int>{30, row.m_checker_y, row.m_w, row.m_h}),
                  (std::vector<int>{checker.x, checker.y, checker.w, checker.h}));
        std::vector<CRectArea> const glyphs = m_world.glyphs(font());
        ASSERT_EQ(5u, glyphs.size());
        EXPECT_EQ(row.m_label_x, glyphs[0].x);
        EXPECT_EQ(40 + 12 - mp_box->get_canvas().get_text_height(font()) / 2, glyphs[0].y);
    }
    EXPECT_EQ((events_t{"EVENT_RESIZED", "EVENT_RESIZED"}), events);
}

// After a click the highlight picture stays off, so the new state shows under the pointer, until
// the pointer leaves and comes back. The box's own event comes before the owner's click.
TEST_F(ButtonsTest, AClickTogglesTheBoxAndHidesTheHighlightUntilThePointerComesBack) {
    events_t events;
    qortest::log_events(mp_box, {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);
    m_world.click_at(100, 50);
    EXPECT_TRUE(mp_box->is_checked());
    EXPECT_EQ(k_on, frame_reds()[1]);
    m_world.move_to(110, 52); // still inside: no new entry
    EXPECT_EQ(k_on, frame_reds()[1]);
    m_world.move_to(300, 200);
    m_world.click_at(100, 50);
    EXPECT_FALSE(mp_box->is_checked());
    EXPECT_EQ(k_off, frame_reds()[1]);
    m_world.move_to(300, 200);
    m_world.move_to(100, 50);
    EXPECT_EQ(k_highlight, frame_reds()[1]);
    EXPECT_EQ((events_t{"EVENT_CHECKED", "EVENT_CLICK", "EVENT_UNCHECKED", "EVENT_CLICK"}), events);
}

// A radio button derived from the class belongs to the group as well.
class CTestRadio : public CRadioButton {
public:
    using CRadioButton::CRadioButton;
};

// The group is every radio button of the parent; a click sends nothing of its own and doesn't hide
// the highlight picture.
TEST_F(ButtonsTest, AClickOnARadioButtonTurnsOffTheOtherRadioButtonsOfItsParentOnly) {
    CWindowVisual *p_group =
        m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), "g"), 0, 100, 200, 80);
    CRadioButton *p_a = m_world.place(p_group, new CRadioButton(&m_world.desktop(), "a"), 0, 0, 100, 20);
    CRadioButton *p_b = m_world.place(p_group, new CTestRadio(&m_world.desktop(), "b"), 0, 25, 100, 20);
    CRadioButton *p_c = m_world.place(p_group, new CRadioButton(&m_world.desktop(), "c"), 0, 50, 100, 20);
    CCheckBox *p_box = m_world.place(p_group, new CCheckBox(&m_world.desktop(), "box"), 100, 0, 100, 20);
    for (CCheckBox *p_on : std::initializer_list<CCheckBox *>{p_a, p_c, p_box, mp_box})
        p_on->set_checked(true);
    p_b->add_material(MAT_NAME_HIGHLIGHTED, m_world.colour(k_highlight, 0, 0));
    events_t events;
    qortest::log_events(p_b, {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);
    m_world.click_at(10, 130);
    m_world.click_at(10, 130);
    EXPECT_EQ((std::vector<bool>{false, true, false, true, true}),
              (std::vector<bool>{p_a->is_checked(), p_b->is_checked(), p_c->is_checked(), p_box->is_checked(),
                                 mp_box->is_checked()}));
    EXPECT_EQ((events_t{"EVENT_CLICK", "EVENT_CLICK"}), events);
    EXPECT_EQ((std::vector<int>{k_body, k_on, k_highlight}), frame_reds());
}

TEST_F(ButtonsTest, CaptionAndCheckerSizeGoThroughLayoutsOnlyWithTheRightKinds) {
    CButton *p_button = m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "b"), 0, 0, 10, 10);
    p_button->m_text = CString("Go");
    mp_box->set_checker_size(12, 9);
    LuaPlus::LuaObject button, box;
    button.AssignNewTable(&lua_machine());
    box.AssignNewTable(&lua_machine());
    p_button->save_state(button);
    mp_box->save_state(box);
    EXPECT_TRUE(box.GetByName("text").IsNil()); // the label belongs to the code
    p_button->m_text = CString();
    mp_box->set_checker_size(0, 0);
    p_button->load_state(button);
    mp_box->load_state(box);
    struct {
        char const *m_keys;
        char const *m_text;
        int m_w, m_h;
    } const rows[] = {
        {"", "Go", 12, 9},
        {"text = 7, checker_w = 12.5, checker_h = '30'", "Go", 12, 9},
        {"text = {}, checker_w = true, checker_h = {}", "Go", 12, 9},
        {"text = 'Stop', checker_w = -4, checker_h = 20", "Stop", -4, 20},
    };
    qortest::CReportCapture capture;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_keys);
        LuaPlus::LuaObject for_button =
            layout(std::string("{ name = 'b', class_name = 'Button', ") + row.m_keys + " }");
        LuaPlus::LuaObject for_box =
            layout(std::string("{ name = 'box', class_name = 'CheckBox', ") + row.m_keys + " }");
        p_button->load_state(for_button);
        mp_box->load_state(for_box);
        EXPECT_EQ(CString(row.m_text), p_button->m_text);
        EXPECT_EQ((std::vector<int>{row.m_w, row.m_h}),
                  (std::vector<int>{mp_box->get_checker_w(), mp_box->get_checker_h()}));
    }
    EXPECT_TRUE(capture.reports().empty());
}
