// Static text in the test world: where each alignment puts the text and its clip, the text events,
// the missing font, and the layout keys with good and bad values.
#include "ui_static_text.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

// A text of 100 by 20 at (20, 30) with margins left 3, right 7 and top 4.
class StaticTextTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_text =
            m_world.place(&m_world.desktop(), new CStaticText(&m_world.desktop(), "label"), 20, 30, 100, 20);
        mp_text->set_left_margin(3);
        mp_text->set_right_margin(7);
        mp_text->set_top_margin(4);
        mp_font = m_world.desktop().get_font(FNT_NAME_DEFAULT);
    }

    // The window's own clip, then the text's.
    std::string clips_of_text(int _x, int _w) {
        return "20,30 100x20; " + std::to_string(_x) + ",34 " + std::to_string(_w) + "x" +
               std::to_string(mp_text->get_canvas().get_text_height(mp_font));
    }
    LuaPlus::LuaObject table(std::string const &_chunk) {
        lua_machine().DoString(("static_text_probe = " + _chunk).c_str());
        return lua_machine().GetGlobals().GetByName("static_text_probe");
    }

    qortest::CWorld m_world;
    CStaticText *mp_text = nullptr;
    CFont *mp_font = nullptr;
};

} // namespace

TEST_F(StaticTextTest, AlignmentPlacesTheTextAtTheTopMarginInsideItsMeasuredClip) {
    mp_text->set_text(CString("Hi there"));
    int const text_w = mp_text->get_canvas().get_text_width(mp_text->get_text(), mp_font, -1);
    int const left = 20 + 3, right = 20 + 100 - 7 - text_w, centre = 20 + (100 - 7 - 3 - text_w) / 2 + 3;
    struct {
        EAlignment m_alignment;
        int m_x;
    } const rows[] = {{ALIGNMENT_LEFT, left},  {ALIGNMENT_RIGHT, right}, {ALIGNMENT_CENTER, centre},
                      {ALIGNMENT_TOP, left},   {ALIGNMENT_BOTTOM, left}, {ALIGNMENT_NONE, left},
                      {ALIGNMENT_CLIENT, left}};
    ASSERT_NE(left, centre);
    std::vector<std::string> events;
    qortest::log_events(mp_text, {EVENT_RESIZED}, events);
    for (auto const &row : rows) {
        SCOPED_TRACE(g_alignment_names[row.m_alignment]);
        events.clear();
        mp_text->set_text_alignment(row.m_alignment);
        EXPECT_EQ(std::vector<std::string>{"EVENT_RESIZED"}, events);
        m_world.frame();
        EXPECT_NE(std::string::npos, m_world.clips().find(clips_of_text(row.m_x, text_w))) << m_world.clips();
        std::vector<CRectArea> const glyphs = m_world.glyphs(mp_font);
        ASSERT_FALSE(glyphs.empty());
        EXPECT_EQ(row.m_x, glyphs.front().x);
        EXPECT_EQ(30 + 4, glyphs.front().y);
        EXPECT_EQ(row.m_x + text_w, glyphs.back().x + glyphs.back().w);
    }
}

TEST_F(StaticTextTest, AnEmptyTextStillClipsToABoxOfNoWidth) {
    m_world.frame();
    EXPECT_NE(std::string::npos, m_world.clips().find(clips_of_text(23, 0))) << m_world.clips();
    EXPECT_TRUE(m_world.glyphs(mp_font).empty());
}

TEST_F(StaticTextTest, WithoutADefaultFontTheDrawingReportsTheContract) {
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    qortest::CReportCapture capture;
    m_world.frame();
    auto const asserts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(1u, asserts.size());
    EXPECT_EQ(0u, asserts[0].find("Expression:   p_font, \n")) << asserts[0];
}

// Without the service the key can't be looked up: that is the binding's critical error, and the
// key itself is shown.
TEST_F(StaticTextTest, SetStrGoesOnAsSetTextWithTheKeyWhenNoLocalStringIsFound) {
    std::vector<std::string> events;
    qortest::log_events(mp_text, {EVENT_SET_STR, EVENT_SET_TEXT, EVENT_RESIZED}, events);
    qortest::CReportCapture capture;
    CWndEvent set_str(EVENT_SET_STR);
    set_str << string("NO_SUCH_KEY");
    mp_text->send_event(mp_text, &set_str, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ((std::vector<std::string>{"EVENT_SET_TEXT", "EVENT_SET_STR"}),
              events); // nested, then the owner's
    EXPECT_EQ(CString("NO_SUCH_KEY"), mp_text->get_text());
    EXPECT_EQ((std::vector<std::string>{"Can't get interface \"IUserInterface\" version 1. Critical Error."}),
              capture.texts(qordebug::REPORT_ERROR));

    CWndEvent set_text(EVENT_SET_TEXT);
    set_text << static_cast<wstring const &>(CString("<color 1 2 3 4>x</color>"));
    mp_text->send_event(mp_text, &set_text, CWndEvent::DISPATCH_NONE);
    EXPECT_EQ(CString("<color 1 2 3 4>x</color>"), mp_text->get_text());
}

TEST_F(StaticTextTest, TextAndAlignmentGoThroughALayoutAndBack) {
    mp_text->set_text(CString("Hello"));
    mp_text->set_text_alignment(ALIGNMENT_CENTER);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    mp_text->save_state(saved);
    EXPECT_STREQ("Hello", saved.GetByName("text").GetString());
    EXPECT_STREQ("ALIGNMENT_CENTER", saved.GetByName("text_alignment").GetString());

    CStaticText copy(&m_world.desktop(), "label");
    copy.load_state(saved);
    EXPECT_EQ(CString("Hello"), copy.get_text());
    EXPECT_EQ(ALIGNMENT_CENTER, copy.get_text_alignment());
}

TEST_F(StaticTextTest, LayoutValuesOfTheWrongKindLeaveTextAndAlignmentQuietly) {
    mp_text->set_text(CString("kept"));
    mp_text->set_text_alignment(ALIGNMENT_RIGHT);
    char const *const rows[] = {
        "text = 7, text_alignment = 'ALIGNMENT_MIDDLE'",
        "text = {}, text_alignment = 5",
        "text = true, text_alignment = 'alignment_center'",
    };
    qortest::CReportCapture capture;
    for (char const *row : rows) {
        SCOPED_TRACE(row);
        LuaPlus::LuaObject layout =
            table(std::string("{ name = 'label', class_name = 'StaticText', ") + row + " }");
        mp_text->load_state(layout);
        EXPECT_EQ(CString("kept"), mp_text->get_text());
        EXPECT_EQ(ALIGNMENT_RIGHT, mp_text->get_text_alignment());
    }
    EXPECT_TRUE(capture.reports().empty());
}

TEST(StaticTextChild, AWindowMakesItAttachedPlacedAndShowingTheText) {
    qortest::CWorld world;
    CStaticText *p_text =
        world.desktop().make_static_text(CString("made"), CRectArea(5, 6, 70, 18), "made text");
    EXPECT_EQ(&world.desktop(), p_text->get_parent());
    EXPECT_STREQ("made text", p_text->get_name());
    EXPECT_EQ(5, p_text->get_pos().x);
    EXPECT_EQ(6, p_text->get_pos().y);
    EXPECT_EQ(70, p_text->get_w());
    EXPECT_EQ(18, p_text->get_h());
    EXPECT_EQ(CString("made"), p_text->get_text());
    EXPECT_TRUE(p_text->is_passive());
}
