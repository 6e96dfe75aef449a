// Push buttons, check boxes, radio buttons and static texts driven by the pointer: caption, checker
// and label, clicks and radio groups, the missing font, text events and layout keys.
#include "ui_button.h"
#include "ui_static_text.h"

#include "engine_interfaces.h"
#include "log_manager.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

typedef std::vector<std::string> events_t;
enum : unsigned char { k_on = 1, k_off, k_highlight, k_body };

// A check box of 120 by 24 at (30, 40) with a material for each state, its red byte naming it.
class ButtonsTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_box = m_world.place(&m_world.desktop(), new CCheckBox(&m_world.desktop(), "box"), 30, 40, 120, 24);
        mp_box->m_text = CString("Sound");
        HUID const *const ids[] = {&MAT_NAME_CHECKER_ON, &MAT_NAME_CHECKER_OFF, &MAT_NAME_HIGHLIGHTED,
                                   &MAT_NAME_NORMAL};
        for (unsigned char red = k_on; red <= k_body; ++red)
            mp_box->add_material(*ids[red - 1], m_world.colour(red, 0, 0));
    }
    CFont *font() { return m_world.desktop().get_font(FNT_NAME_DEFAULT); }
    // The red bytes of a new frame's quads, glyphs left out.
    std::vector<int> frame_reds() {
        m_world.frame();
        std::vector<int> reds;
        int const glyph = font() ? font()->get_char_material('A')->get_material_handle() : -1;
        for (auto const &drawn : m_world.quads())
            if (drawn.m_handle != glyph) reds.push_back(drawn.m_colour.r);
        return reds;
    }
    // The first glyph of the last frame, as x and y.
    std::vector<int> first_glyph() {
        std::vector<CRectArea> const glyphs = m_world.glyphs(font());
        return glyphs.empty() ? std::vector<int>{} : std::vector<int>{glyphs[0].x, glyphs[0].y};
    }
    CButton *button(char const *_name, int _y, char const *_caption) {
        CButton *p_button =
            m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), _name), 40, _y, 81, 31);
        p_button->m_text = CString(_caption);
        return p_button;
    }

    qortest::CWorld m_world;
    CCheckBox *mp_box = nullptr;
};

} // namespace

// Centred in the client area, the caption sinks by a pixel while pressed under the pointer or
// checked: over, pressed over, pressed with the pointer gone, released, checked.
TEST_F(ButtonsTest, TheCaptionIsCentredInTheClientAreaAndSinksWhilePressedUnderThePointerOrChecked) {
    CButton *p_button = button("ok", 80, "OK");
    mp_box->m_text = CString();
    p_button->set_left_margin(4);
    p_button->set_top_margin(2);
    int const x = 40 + 77 / 2 - p_button->get_canvas().get_text_width(p_button->m_text, font(), -1) / 2 + 4;
    int const y = 80 + 29 / 2 - p_button->get_canvas().get_text_height(font()) / 2 + 2;
    int const sinks[] = {0, 1, 0, 0, 1};
    for (int i = 0; i < 5; ++i) {
        SCOPED_TRACE(i);
        if (i == 0 || i == 2) m_world.move_to(i ? 300 : 60, i ? 200 : 90);
        if (i == 1) m_world.press();
        if (i == 3) m_world.release();
        if (i == 4) p_button->set_checked(true);
        m_world.frame();
        EXPECT_EQ((std::vector<int>{x + sinks[i], y + sinks[i]}), first_glyph());
    }
}

// Without a font a button with a caption is logged, a check box draws no label quietly and a
// static text reports the broken contract. A button font given later, after the button has looked
// for one and found none, is taken at the next frame.
TEST_F(ButtonsTest, WithoutAFontOnlyAButtonWithACaptionIsLoggedAndAStaticTextReports) {
    qorhost::CLogManager &log = m_world.host().log();
    button("silent", 0, "");
    button("named", 120, "X");
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    unsigned const first = log.get_next_index();
    EXPECT_EQ((std::vector<int>{k_body, k_off}), frame_reds());
    ASSERT_EQ(first + 1, log.get_next_index());
    EXPECT_NE(std::string::npos, log.get_message_text(first).find("No font was found for button named"));
    m_world.desktop().make_static_text(CString("t"), CRectArea(0, 200, 10, 10), "label");
    qortest::CReportCapture capture;
    m_world.frame();
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_EQ(0u, capture.asserts()[0].find("Expression:   p_font, \n")) << capture.asserts()[0];

    CFont *p_button_font = get_fonts_factory().create("courier", &m_world.desktop());
    m_world.desktop().add_font(FNT_NAME_BUTTON, p_button_font);
    m_world.frame();
    EXPECT_EQ(1u, m_world.glyphs(p_button_font).size());
}

// The checker stands at the left edge, centred; the label half a checker width beyond it; both are
// clipped to the window, not to the body's visual deltas.
TEST_F(ButtonsTest, TheCheckerAndTheLabelStandByTheCheckerSize) {
    qortest::load_state(mp_box, "{ name = 'box', class_name = 'CheckBox', visual_delta_left = 2,"
                                " visual_delta_top = 2, visual_delta_right = 2, visual_delta_bottom = 2 }");
    int const label_y = 40 + 12 - mp_box->get_canvas().get_text_height(font()) / 2;
    events_t events;
    qortest::log_events(mp_box, {EVENT_RESIZED}, events);
    mp_box->set_checker_size(10, 7);
    m_world.frame();
    EXPECT_NE(std::string::npos, m_world.clips().find("28,38 124x28; 30,40 120x24")) << m_world.clips();
    EXPECT_EQ("30,49 10x7", qortest::rect_text(m_world.quads()[1].m_rect)); // 7 / 2 is 3
    EXPECT_EQ((std::vector<int>{30 + 5 + 10, label_y}), first_glyph());
    EXPECT_EQ(events_t{"EVENT_RESIZED"}, events);
}

// After a click the highlight picture stays off, so the new state shows under the pointer, until
// the pointer leaves and comes back. The box's own event comes before the owner's click.
TEST_F(ButtonsTest, AClickTogglesTheBoxAndHidesTheHighlightUntilThePointerComesBack) {
    events_t events;
    qortest::log_events(mp_box, {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);
    struct {
        int m_x;
        bool m_click, m_checked;
        int m_checker;
    } const steps[] = {{100, true, true, k_on},    {110, false, true, k_on},
                       {300, false, true, k_on},   {100, true, false, k_off},
                       {300, false, false, k_off}, {100, false, false, k_highlight}};
    for (auto const &step : steps) {
        SCOPED_TRACE(testing::Message() << step.m_x << (step.m_click ? " click" : " move"));
        step.m_click ? m_world.click_at(step.m_x, 50) : m_world.move_to(step.m_x, 50);
        EXPECT_EQ(step.m_checked, mp_box->is_checked());
        EXPECT_EQ(step.m_checker, frame_reds()[1]);
    }
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
    CCheckBox *const boxes[] = {
        new CRadioButton(&m_world.desktop(), "a"), new CTestRadio(&m_world.desktop(), "b"),
        new CRadioButton(&m_world.desktop(), "c"), new CCheckBox(&m_world.desktop(), "d")};
    for (int i = 0; i < 4; ++i)
        m_world.place(p_group, boxes[i], 0, i * 25, 100, 20)->set_checked(i != 1);
    boxes[1]->add_material(MAT_NAME_HIGHLIGHTED, m_world.colour(k_highlight, 0, 0));
    mp_box->set_checked(true);
    events_t events;
    qortest::log_events(boxes[1], {EVENT_CLICK, EVENT_CHECKED, EVENT_UNCHECKED}, events);
    m_world.click_at(10, 130);
    m_world.click_at(10, 130);
    EXPECT_EQ((std::vector<bool>{false, true, false, true, true}),
              (std::vector<bool>{boxes[0]->is_checked(), boxes[1]->is_checked(), boxes[2]->is_checked(),
                                 boxes[3]->is_checked(), mp_box->is_checked()}));
    EXPECT_EQ((events_t{"EVENT_CLICK", "EVENT_CLICK"}), events);
    EXPECT_EQ((std::vector<int>{k_body, k_on, k_highlight}), frame_reds());
}

// A key without a local string shows itself, through EVENT_SET_TEXT to the static text. Where each
// alignment puts the text is in the controls' golden.
TEST_F(ButtonsTest, SetStrGoesOnAsSetTextWithTheKeyWhenNoLocalStringIsFound) {
    CStaticText *p_text = m_world.desktop().make_static_text(CString(), CRectArea(0, 0, 10, 10), "label");
    events_t events;
    qortest::log_events(p_text, {EVENT_SET_STR, EVENT_SET_TEXT}, events);
    CWndEvent set_str(EVENT_SET_STR);
    set_str << string("NO_SUCH_KEY");
    p_text->send_event(p_text, &set_str, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((events_t{"EVENT_SET_TEXT", "EVENT_SET_STR"}), events); // nested, then the owner's
    EXPECT_EQ(CString("NO_SUCH_KEY"), p_text->get_text());
}

// A button's caption, a box's checker size (not its label) and a text with its alignment go through
// layouts; values of the wrong kind are passed over quietly.
TEST_F(ButtonsTest, LayoutsCarryCaptionCheckerSizeTextAndAlignmentOnlyWithTheRightKinds) {
    CButton *p_button = button("b", 80, "Go");
    CStaticText *p_text = m_world.desktop().make_static_text(CString("Go"), CRectArea(0, 0, 10, 10), "label");
    std::pair<CWindow *, char const *> const windows[] = {
        {p_button, "name = 'b', class_name = 'Button', "},
        {mp_box, "name = 'box', class_name = 'CheckBox', "},
        {p_text, "name = 'label', class_name = 'StaticText', "}};
    char const *const rows[] = {
        "text = 'Stop', checker_w = -4, checker_h = 20, text_alignment = 'ALIGNMENT_RIGHT'",
        "text = 7, checker_w = 12.5, checker_h = '30', text_alignment = 'ALIGNMENT_MIDDLE'",
        "text = {}, checker_w = true, checker_h = {}, text_alignment = 5",
        "text = true, text_alignment = 'alignment_right'", "text = 'x', checker_w = 1, checker_h = 1"};
    LuaPlus::LuaObject saved[3];
    qortest::CReportCapture capture;
    for (char const *row : rows) {
        SCOPED_TRACE(row);
        for (auto const &window : windows)
            qortest::load_state(window.first, std::string("{ ") + window.second + row + " }");
        if (row == rows[4]) // back through the layouts saved after the first row
            for (int i = 0; i < 3; ++i)
                windows[i].first->load_state(saved[i]);
        else if (row == rows[0])
            for (int i = 0; i < 3; ++i)
                saved[i] = qortest::saved_state(windows[i].first);
        EXPECT_EQ((std::vector<std::string>{"Stop", "Stop", "-4 20 ALIGNMENT_RIGHT"}),
                  (std::vector<std::string>{p_button->m_text.get_c(), p_text->get_text().get_c(),
                                            std::to_string(mp_box->get_checker_w()) + " " +
                                                std::to_string(mp_box->get_checker_h()) + " " +
                                                g_alignment_names[p_text->get_text_alignment()]}));
    }
    EXPECT_TRUE(saved[1].GetByName("text").IsNil()); // the label belongs to the code
    EXPECT_TRUE(capture.reports().empty());
}
