// Static text in the test world: where each alignment puts the text and its clip, the text events,
// the missing font, and the layout keys with good and bad values.
#include "ui_static_text.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_font.h"

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
    }
    LuaPlus::LuaObject layout(char const *_keys) {
        lua_machine().DoString(
            (std::string("probe = { name = 'label', class_name = 'StaticText', ") + _keys + " }").c_str());
        return lua_machine().GetGlobals().GetByName("probe");
    }

    qortest::CWorld m_world;
    CStaticText *mp_text = nullptr;
};

} // namespace

// Every alignment but right and centre places the text as left does, always at the top margin;
// the clip is the window's own, then the text's measured box, empty for an empty text.
TEST_F(StaticTextTest, AlignmentPlacesTheTextAtTheTopMarginInsideItsMeasuredClip) {
    CFont *p_font = m_world.desktop().get_font(FNT_NAME_DEFAULT);
    int const w = mp_text->get_canvas().get_text_width(CString("Hi there"), p_font, -1);
    int const h = mp_text->get_canvas().get_text_height(p_font);
    int const left = 23, right = 20 + 100 - 7 - w, centre = 20 + (100 - 7 - 3 - w) / 2 + 3;
    struct {
        EAlignment m_alignment;
        char const *m_text;
        int m_x, m_w;
    } const rows[] = {{ALIGNMENT_LEFT, "Hi there", left, w},     {ALIGNMENT_RIGHT, "Hi there", right, w},
                      {ALIGNMENT_CENTER, "Hi there", centre, w}, {ALIGNMENT_TOP, "Hi there", left, w},
                      {ALIGNMENT_BOTTOM, "Hi there", left, w},   {ALIGNMENT_CLIENT, "Hi there", left, w},
                      {ALIGNMENT_NONE, "Hi there", left, w},     {ALIGNMENT_CENTER, "", 20 + 90 / 2 + 3, 0}};
    std::vector<std::string> events;
    qortest::log_events(mp_text, {EVENT_RESIZED}, events);
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << g_alignment_names[row.m_alignment] << " '" << row.m_text << "'");
        events.clear();
        mp_text->set_text_alignment(row.m_alignment);
        mp_text->set_text(CString(row.m_text));
        EXPECT_EQ(std::vector<std::string>{"EVENT_RESIZED"}, events);
        m_world.frame();
        std::string const clips = "20,30 100x20; " + std::to_string(row.m_x) + ",34 " +
                                  std::to_string(row.m_w) + "x" + std::to_string(h);
        EXPECT_NE(std::string::npos, m_world.clips().find(clips)) << m_world.clips();
        std::vector<CRectArea> const glyphs = m_world.glyphs(p_font);
        ASSERT_EQ(*row.m_text ? 8u : 0u, glyphs.size());
        if (glyphs.empty()) continue;
        EXPECT_EQ(row.m_x, glyphs.front().x);
        EXPECT_EQ(34, glyphs.front().y);
        EXPECT_EQ(row.m_x + w, glyphs.back().x + glyphs.back().w);
    }
}

TEST_F(StaticTextTest, WithoutADefaultFontTheDrawingReportsTheContract) {
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    qortest::CReportCapture capture;
    m_world.frame();
    auto const asserts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(1u, asserts.size());
    EXPECT_EQ(0u, asserts[0].find("Expression:   p_font, \n")) << asserts[0];
}

// A key that the strings file doesn't have is shown itself, through EVENT_SET_TEXT to the window
// itself.
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
    EXPECT_TRUE(capture.reports().empty());
}

TEST_F(StaticTextTest, TextAndAlignmentGoThroughALayoutAndValuesOfTheWrongKindAreLeftQuietly) {
    mp_text->set_text(CString("Hello"));
    mp_text->set_text_alignment(ALIGNMENT_CENTER);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    mp_text->save_state(saved);
    CStaticText *p_copy = m_world.desktop().make_static_text(CString(), CRectArea(0, 0, 10, 10), "label");
    p_copy->load_state(saved);
    EXPECT_EQ(CString("Hello"), p_copy->get_text());
    EXPECT_EQ(ALIGNMENT_CENTER, p_copy->get_text_alignment());
    qortest::CReportCapture capture;
    for (char const *row : {"text = 7, text_alignment = 'ALIGNMENT_MIDDLE'", "text = {}, text_alignment = 5",
                            "text = true, text_alignment = 'alignment_right'"}) {
        SCOPED_TRACE(row);
        LuaPlus::LuaObject bad = layout(row);
        p_copy->load_state(bad);
        EXPECT_EQ(CString("Hello"), p_copy->get_text());
        EXPECT_EQ(ALIGNMENT_CENTER, p_copy->get_text_alignment());
    }
    EXPECT_TRUE(capture.reports().empty());
}
