// The drop-down list driven through the desktop: where its list opens, choosing a row with its
// events, closing on every kind of click, the wheel, the chosen text and its font, and layouts.
#include "ui_drop_down_list.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_font.h"
#include "ui_list_box.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

typedef std::vector<std::string> events_t;

// The control at (40, 30), 120 by 20. Open, its list of rows 18 high (the default font's) with
// margins of 4 starts at (40, 50); row i covers y 54 + 18 i to 71 + 18 i.
class DropDownListTest : public ::testing::Test {
protected:
    DropDownListTest() {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_list = m_world.place(&m_world.desktop(), new CDropDownList(&m_world.desktop(), "choice"), 40, 30,
                                120, 20);
        m_world.place(&m_world.desktop(), new CButton(&m_world.desktop(), "other"), 200, 150, 50, 20);
    }
    // Rows of the lines given, as a layout gives a row's column (a text made from a string would
    // end with a line break, and so with an empty line more).
    void fill(std::vector<char const *> const &_rows) {
        for (char const *p_row : _rows) {
            CText text;
            text.insert(p_row, false, true);
            mp_list->get_items().add(new CItem(text, nullptr));
        }
    }
    // A click far enough from the last for no double click.
    void click_at(int _x, int _y) {
        m_world.clock().advance_ms(1000);
        m_world.click_at(_x, _y);
    }
    // Opens the list, or closes it if it is open.
    void click_control() { click_at(60, 40); }
    bool is_open() { return !mp_list->get_list_box()->is_hidden(); }
    std::string text() {
        CString const *p_line = mp_list->get_text().get_string();
        return p_line ? p_line->get_c() : "<none>";
    }
    // Where the list of _p_list stands on the desktop.
    static std::string list_rect(CDropDownList *_p_list) {
        CListBox *p_box = _p_list->get_list_box();
        return qortest::rect_text(
            CRectArea(p_box->get_global_pos().x, p_box->get_global_pos().y, p_box->get_w(), p_box->get_h()));
    }
    void load(std::string const &_keys) {
        qortest::load_state(mp_list, "{ name = 'choice', class_name = 'DropDownList', " + _keys + " }");
    }

    qortest::CWorld m_world;
    CDropDownList *mp_list = nullptr;
};

} // namespace

// The list is laid out at the click that opens it, so rows added since count; fitted to the rows
// it is as high as they are and the two margins. Each key is read only with its Lua type, numbers
// cut toward zero; a text is appended, and a text without lines writes no key.
TEST_F(DropDownListTest, AClickOpensTheListBelowTheControlWhereTheLayoutKeysPutIt) {
    struct {
        char const *m_keys;
        unsigned m_rows;
        char const *m_list;
    } const rows[] = {
        {"max_list_box_height = 0", 3, "40,50 120x62"},
        {"offset = 5, left_border_offset = -10, right_border_offset = 15", 3, "30,55 145x62"},
        {"offset = -2, left_border_offset = 6, right_border_offset = -6", 1, "46,48 108x26"},
        {"offset = 0, left_border_offset = 0, right_border_offset = 0", 0, "40,50 120x8"},
        {"max_list_box_height = 100", 2, "40,50 120x100"},
        {"max_list_box_height = 30.9", 5, "40,50 120x30"},
        {"offset = '9', left_border_offset = true, right_border_offset = {}, max_list_box_height = 'x'", 5,
         "40,50 120x30"},
        {"offset = -1.7, left_border_offset = 2.9, max_list_box_height = 0", 5, "42,49 118x98"},
    };
    qortest::CReportCapture capture;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_keys);
        mp_list->get_items().remove_all();
        fill(std::vector<char const *>(row.m_rows, "row"));
        load(row.m_keys);
        ASSERT_FALSE(is_open());
        click_control();
        EXPECT_TRUE(is_open());
        EXPECT_EQ(row.m_list, list_rect(mp_list));
        click_control();
        EXPECT_FALSE(is_open());
    }
    EXPECT_TRUE(qortest::saved_state(mp_list).GetByName("text").IsNil());
    for (auto const &text :
         {std::make_pair("text = 'a'", 2u), {"text = 7", 2u}, {"text = { 'a' }", 2u}, {"text = 'b'", 3u}}) {
        load(text.first);
        EXPECT_EQ(text.second, mp_list->get_text().get_num_strings()) << text.first;
    }
    EXPECT_TRUE(capture.reports().empty());
}

// The list box checks the row and tells of it, the control takes the row's text and tells its
// owner, and then the click's own callback closes the list; the closed list isn't closed again.
TEST_F(DropDownListTest, ChoosingARowShowsItsTextSendsChangedAndClosesTheList) {
    fill({"red", "green", "blue"});
    events_t events;
    qortest::log_events(mp_list, {EVENT_ACTIVATE, EVENT_DEACTIVATE, EVENT_CHANGED}, events);
    qortest::log_events(mp_list->get_list_box(), {EVENT_SHOW, EVENT_HIDE, EVENT_CHECKED, EVENT_CLICK},
                        events);
    click_control();
    click_at(60, 80); // row 1
    EXPECT_EQ((events_t{"EVENT_ACTIVATE", "EVENT_SHOW", "EVENT_CHANGED", "EVENT_CHECKED", "EVENT_HIDE",
                        "EVENT_CLICK"}),
              events);
    EXPECT_EQ("green", text());
    EXPECT_EQ(mp_list, m_world.desktop().get_active_window());
    events.clear();
    click_at(300, 220);
    EXPECT_EQ(events_t{"EVENT_DEACTIVATE"}, events);
}

// Every click but one on another row closes the list without a new choice; a click elsewhere
// takes the activation from the control, and the list with it.
TEST_F(DropDownListTest, EveryClickClosesTheOpenListAndOnlyAnotherRowChangesTheChoice) {
    fill({"red", "green", "blue"});
    struct {
        char const *m_where;
        int m_x, m_y;
        char const *m_text;
        unsigned m_changes;
    } const rows[] = {
        {"another row", 60, 99, "blue", 1},      {"the list's top margin", 60, 51, "red", 0},
        {"the chosen row", 60, 63, "red", 0},    {"the control", 150, 45, "red", 0},
        {"another control", 210, 160, "red", 0}, {"the desktop", 300, 220, "red", 0},
    };
    events_t events;
    qortest::log_events(mp_list, {EVENT_CHANGED}, events);
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_where);
        mp_list->check(0);
        click_control();
        ASSERT_TRUE(is_open());
        events.clear();
        click_at(row.m_x, row.m_y);
        EXPECT_FALSE(is_open());
        EXPECT_EQ(row.m_text, text());
        EXPECT_EQ(row.m_changes, events.size());
    }
}

// Choosing by code is choosing by click without the list: the copy has every line of the row, and
// the chosen row again changes nothing, not even a text changed by a layout since; a row out of
// range is reported and leaves the choice.
TEST_F(DropDownListTest, CheckTakesTheRowsWholeTextOnceAndBadRowsLeaveTheChoice) {
    fill({"red", "two\nlines"});
    events_t events;
    qortest::log_events(mp_list, {EVENT_CHANGED}, events);
    mp_list->check(1);
    ASSERT_EQ(2u, mp_list->get_text().get_num_strings());
    EXPECT_EQ("lines", std::string(mp_list->get_text().get_string(1)->get_c()));
    load("text = 'more'");
    unsigned const loaded = mp_list->get_text().get_num_strings();
    EXPECT_LT(2u, loaded);
    mp_list->check(1);
    EXPECT_EQ(loaded, mp_list->get_text().get_num_strings());
    qortest::CReportCapture capture;
    mp_list->check(2);
    EXPECT_EQ(1, mp_list->get_items().get_checked_idx());
    EXPECT_EQ(events_t{"EVENT_CHANGED"}, events);
    EXPECT_EQ(1u, capture.asserts().size());
    EXPECT_FALSE(is_open());
}

// The wheel reaches the active control, which hands it to its open list; the list scrolls by a
// row. The text stands at the client area's corner, in the disabled font while the control is
// disabled and has one, else in the default font.
TEST_F(DropDownListTest, TheWheelScrollsTheOpenListOnlyAndTheTextTakesTheFontOfTheState) {
    fill(std::vector<char const *>(10, "row"));
    load("max_list_box_height = 100");
    CScrollBar *p_bar = mp_list->get_list_box()->get_scroll_bar_vert();
    for (float const position : {18.0f, 18.0f, 0.0f}) {
        click_control(); // opens, closes, opens
        m_world.frame();
        m_world.desktop().on_wheel_rotated(position ? -1.0f : 1.0f);
        EXPECT_EQ(position, p_bar->get_position());
    }
    click_control();
    mp_list->check(0);
    m_world.clock().advance_ms(150); // the list has faded out
    mp_list->set_left_margin(3);
    mp_list->set_top_margin(2);
    struct {
        bool m_disabled, m_disabled_font, m_in_disabled_font;
    } const rows[] = {{true, false, false}, {true, true, true}, {false, true, false}};
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "disabled " << row.m_disabled << ", font " << row.m_disabled_font);
        mp_list->set_disabled(row.m_disabled);
        mp_list->add_font(FNT_NAME_DISABLED, row.m_disabled_font
                                                 ? get_fonts_factory().create("courier", &m_world.desktop())
                                                 : nullptr);
        m_world.frame();
        std::vector<CRectArea> const glyphs =
            m_world.glyphs(mp_list->get_font(row.m_in_disabled_font ? FNT_NAME_DISABLED : FNT_NAME_DEFAULT));
        ASSERT_EQ(3u, glyphs.size());
        EXPECT_EQ((std::vector<int>{43, 32}), (std::vector<int>{glyphs[0].x, glyphs[0].y}));
    }
}

// The keys and the chosen text go through a layout into a control of the factory, which finds its
// list rather than making it again; the rows come back unchosen. The loaded line is followed by the
// empty line that the loading's line break leaves, with the caret.
TEST_F(DropDownListTest, TheKeysAndTheRowsOfTheChildGoThroughALayout) {
    fill({"red", "green"});
    mp_list->check(1);
    mp_list->offset_list_box(3);
    mp_list->offset_list_box_borders(-4, 5);
    load("max_list_box_height = 70");
    LuaPlus::LuaObject saved = qortest::saved_state(mp_list);
    qortest::CReportCapture capture;
    CDropDownList *p_copy = class_cast<CDropDownList>(
        get_windows_factory().Create(HUID("DropDownList"), &m_world.desktop(), "choice"));
    ASSERT_NE(nullptr, p_copy);
    m_world.desktop().attach_child(p_copy);
    p_copy->load_state(saved);
    p_copy->set_pos(40, 100);
    EXPECT_EQ(
        (std::vector<int>{1, 2, -1, 2, 1}),
        (std::vector<int>{(int)p_copy->get_children_count(), (int)p_copy->get_items().get_count(),
                          p_copy->get_items().get_checked_idx(), (int)p_copy->get_text().get_num_strings(),
                          p_copy->get_text().get_caret_line()}));
    EXPECT_EQ("green", std::string(p_copy->get_text().get_string(0)->get_c()));
    click_at(60, 110);
    EXPECT_EQ("36,123 129x70", list_rect(p_copy));
    EXPECT_TRUE(capture.reports().empty());
}
