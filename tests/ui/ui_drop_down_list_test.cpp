// The drop-down list in the test world, driven through the desktop: the list opening below the
// control where its offsets put it, choosing a row with the events in order, closing on every kind
// of click, the wheel, the chosen text and its font, and the layout keys with bad values.
#include "ui_drop_down_list.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_font.h"
#include "ui_items.h"
#include "ui_list_box.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

// A text of the lines in _p_text, as a layout gives a row's column: a text made from a string
// would end with a line break, and so with an empty line more.
CText lines(char const *_p_text) {
    CText text;
    text.insert(_p_text, false, true);
    return text;
}

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

    void fill(std::initializer_list<char const *> _rows) {
        for (char const *p_row : _rows)
            mp_list->get_items().add(new CItem(lines(p_row), nullptr));
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
    // Where the list of _p_list stands on the desktop, as "x,y wxh".
    std::string list_rect(CDropDownList *_p_list = nullptr) {
        CListBox *p_box = (_p_list ? _p_list : mp_list)->get_list_box();
        point_t const pos = p_box->get_global_pos();
        return std::to_string(pos.x) + "," + std::to_string(pos.y) + " " + std::to_string(p_box->get_w()) +
               "x" + std::to_string(p_box->get_h());
    }
    // A layout of the control with _keys.
    LuaPlus::LuaObject layout(std::string const &_keys) {
        lua_machine().DoString(
            ("drop_down_probe = { name = 'choice', class_name = 'DropDownList', " + _keys + " }").c_str());
        return lua_machine().GetGlobals().GetByName("drop_down_probe");
    }

    qortest::CWorld m_world;
    CDropDownList *mp_list = nullptr;
};

} // namespace

// ---------------------------------------------------------------------------------------------
// Opening
// ---------------------------------------------------------------------------------------------

// The list is laid out at the click that opens it, so rows added since count; fitted to the rows
// it is as high as they are and the two margins.
TEST_F(DropDownListTest, AClickOpensTheListBelowTheControlFittedToItsRowsOrFixedHigh) {
    struct {
        int m_offset, m_left, m_right;
        char const *m_max_height; // the layout's value
        unsigned m_rows;
        char const *m_list;
    } const rows[] = {
        {0, 0, 0, "0", 3, "40,50 120x62"},    {5, -10, 15, "0", 3, "30,55 145x62"},
        {-2, 6, -6, "0", 1, "46,48 108x26"},  {0, 0, 0, "0", 0, "40,50 120x8"},
        {0, 0, 0, "100", 2, "40,50 120x100"}, {0, 0, 0, "30.9", 5, "40,50 120x30"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_list);
        mp_list->get_items().remove_all();
        for (unsigned i = 0; i < row.m_rows; ++i)
            fill({"row"});
        LuaPlus::LuaObject height = layout(std::string("max_list_box_height = ") + row.m_max_height);
        mp_list->load_state(height);
        mp_list->offset_list_box(row.m_offset);
        mp_list->offset_list_box_borders(row.m_left, row.m_right);
        ASSERT_FALSE(is_open());
        click_control();
        EXPECT_TRUE(is_open());
        EXPECT_EQ(row.m_list, list_rect());
        click_control();
        EXPECT_FALSE(is_open());
    }
}

// ---------------------------------------------------------------------------------------------
// Choosing and closing
// ---------------------------------------------------------------------------------------------

// The list box checks the row and tells of it, the control takes the row's text and tells its
// owner, and then the click's own callback closes the list.
TEST_F(DropDownListTest, ChoosingARowShowsItsTextSendsChangedAndClosesTheList) {
    fill({"red", "green", "blue"});
    std::vector<std::string> events;
    qortest::log_events(mp_list, {EVENT_ACTIVATE, EVENT_DEACTIVATE, EVENT_CHANGED}, events);
    qortest::log_events(mp_list->get_list_box(), {EVENT_SHOW, EVENT_HIDE, EVENT_CHECKED, EVENT_CLICK},
                        events);
    click_control();
    click_at(60, 80); // row 1
    EXPECT_EQ((std::vector<std::string>{"EVENT_ACTIVATE", "EVENT_SHOW", "EVENT_CHANGED", "EVENT_CHECKED",
                                        "EVENT_HIDE", "EVENT_CLICK"}),
              events);
    EXPECT_EQ("green", text());
    EXPECT_EQ(1, mp_list->get_items().get_checked_idx());
    EXPECT_EQ(mp_list, m_world.desktop().get_active_window());
    events.clear();
    click_at(300, 220); // the closed list isn't closed again
    EXPECT_EQ(std::vector<std::string>{"EVENT_DEACTIVATE"}, events);
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
    std::vector<std::string> events;
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
// the chosen row again changes nothing, not even a text changed by a layout since.
TEST_F(DropDownListTest, CheckTakesTheRowsWholeTextOnceAndBadRowsLeaveTheChoice) {
    fill({"red"});
    mp_list->get_items().add(new CItem(lines("two\nlines"), nullptr));
    std::vector<std::string> events;
    qortest::log_events(mp_list, {EVENT_CHANGED}, events);
    mp_list->check(1);
    EXPECT_EQ(std::vector<std::string>{"EVENT_CHANGED"}, events);
    ASSERT_EQ(2u, mp_list->get_text().get_num_strings());
    EXPECT_EQ("lines", std::string(mp_list->get_text().get_string(1)->get_c()));
    LuaPlus::LuaObject more = layout("text = 'more'");
    mp_list->load_state(more);
    unsigned const loaded = mp_list->get_text().get_num_strings();
    EXPECT_LT(2u, loaded);
    mp_list->check(1);
    EXPECT_EQ(1u, events.size());
    EXPECT_EQ(loaded, mp_list->get_text().get_num_strings());
    qortest::CReportCapture capture;
    mp_list->check(2);
    EXPECT_EQ(1, mp_list->get_items().get_checked_idx());
    EXPECT_EQ(1u, events.size());
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_FALSE(is_open());
}

// The wheel reaches the active control, which hands it to its open list; the list scrolls by a row.
TEST_F(DropDownListTest, TheWheelScrollsTheOpenListOnly) {
    for (int i = 0; i < 10; ++i)
        fill({"row"});
    LuaPlus::LuaObject height = layout("max_list_box_height = 100");
    mp_list->load_state(height);
    CScrollBar *p_bar = mp_list->get_list_box()->get_scroll_bar_vert();
    click_control();
    m_world.frame();
    m_world.desktop().on_wheel_rotated(-1.0f);
    EXPECT_EQ(18.0f, p_bar->get_position());
    click_control();
    m_world.desktop().on_wheel_rotated(-1.0f);
    EXPECT_EQ(18.0f, p_bar->get_position());
    click_control();
    m_world.desktop().on_wheel_rotated(1.0f);
    EXPECT_EQ(0.0f, p_bar->get_position());
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// The text stands at the client area's corner, in the disabled font while the control is disabled
// and has one, else in the default font.
TEST_F(DropDownListTest, TheTextStandsInTheClientAreaInTheFontOfTheState) {
    fill({"red"});
    mp_list->check(0);
    m_world.clock().advance_ms(150); // the list, hidden at its making, has faded out
    m_world.frame();
    mp_list->set_left_margin(3);
    mp_list->set_top_margin(2);
    struct {
        bool m_disabled, m_disabled_font, m_in_disabled_font;
    } const rows[] = {
        {false, false, false},
        {true, false, false},
        {true, true, true},
        {false, true, false},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message() << "disabled " << row.m_disabled << ", font " << row.m_disabled_font);
        mp_list->set_disabled(row.m_disabled);
        mp_list->add_font(FNT_NAME_DISABLED, row.m_disabled_font
                                                 ? get_fonts_factory().create("courier", &m_world.desktop())
                                                 : nullptr);
        m_world.frame();
        CFont *p_font = mp_list->get_font(row.m_in_disabled_font ? FNT_NAME_DISABLED : FNT_NAME_DEFAULT);
        std::vector<CRectArea> const glyphs = m_world.glyphs(p_font);
        ASSERT_EQ(3u, glyphs.size());
        EXPECT_EQ(43, glyphs[0].x);
        EXPECT_EQ(32, glyphs[0].y);
    }
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

TEST_F(DropDownListTest, TheKeysAndTheRowsOfTheChildGoThroughALayout) {
    fill({"red", "green"});
    mp_list->check(1);
    mp_list->offset_list_box(3);
    mp_list->offset_list_box_borders(-4, 5);
    LuaPlus::LuaObject fixed = layout("max_list_box_height = 70");
    mp_list->load_state(fixed);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    mp_list->save_state(saved);
    EXPECT_STREQ("green", saved.GetByName("text").GetString());

    qortest::CReportCapture capture;
    CDropDownList *p_copy = class_cast<CDropDownList>(
        get_windows_factory().Create(HUID("DropDownList"), &m_world.desktop(), "choice"));
    ASSERT_NE(nullptr, p_copy);
    m_world.desktop().attach_child(p_copy);
    p_copy->load_state(saved);
    p_copy->set_pos(40, 100);
    EXPECT_EQ(1u, p_copy->get_children_count()); // the list was found, not made again
    EXPECT_EQ(2u, p_copy->get_items().get_count());
    EXPECT_EQ(-1, p_copy->get_items().get_checked_idx());
    // The loaded line, then the empty line that the loading's line break leaves, with the caret.
    ASSERT_EQ(2u, p_copy->get_text().get_num_strings());
    EXPECT_EQ("green", std::string(p_copy->get_text().get_string(0)->get_c()));
    EXPECT_EQ(1, p_copy->get_text().get_caret_line());
    click_at(60, 110);
    EXPECT_EQ("36,123 129x70", list_rect(p_copy));
    EXPECT_TRUE(capture.reports().empty());
}

// Each key is read only with its Lua type, and numbers are cut toward zero; a text without lines
// writes no key.
TEST_F(DropDownListTest, BadLayoutKeysLeaveWhatWasLoadedBefore) {
    struct {
        char const *m_keys;
        char const *m_list; // where the list opens
        unsigned m_lines;
    } const rows[] = {
        {"offset = 4, left_border_offset = 2, right_border_offset = 6, max_list_box_height = 40",
         "42,54 124x40", 2},
        {"offset = '9', left_border_offset = true, right_border_offset = {}, max_list_box_height = 'x'",
         "42,54 124x40", 2},
        {"offset = -1.7, left_border_offset = 2.9, text = 7", "42,49 124x40", 2},
        {"text = { 'a' }, max_list_box_height = 0", "42,49 124x8", 2},
        {"text = 'b'", "42,49 124x8", 3},
    };
    LuaPlus::LuaObject empty;
    empty.AssignNewTable(&lua_machine());
    mp_list->save_state(empty);
    EXPECT_TRUE(empty.GetByName("text").IsNil());
    LuaPlus::LuaObject first = layout("text = 'a'");
    mp_list->load_state(first);
    qortest::CReportCapture capture;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_keys);
        LuaPlus::LuaObject keys = layout(row.m_keys);
        mp_list->load_state(keys);
        click_control();
        EXPECT_EQ(row.m_list, list_rect());
        click_control();
        EXPECT_EQ(row.m_lines, mp_list->get_text().get_num_strings());
    }
    EXPECT_TRUE(capture.reports().empty());
}
