// The selector box in the test world, driven by the pointer: stepping with the buttons and its
// ends, the events an owner hears, the square buttons and their looks, where the row is drawn, and
// the rows' layout key with bad values.
#include "ui_selector_box.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "test_support.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <string>

using namespace qorui;

namespace {

class SelectorBoxTest : public ::testing::Test {
protected:
    // The box at (40, 50), 200 by 24: the left button covers x 40..63, the right one x 216..239.
    SelectorBoxTest() {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_box =
            m_world.place(&m_world.desktop(), new CSelectorBox(&m_world.desktop(), "box"), 40, 50, 200, 24);
    }

    // Rows named "row 0", "row 1", ...
    void fill(unsigned _count) {
        for (unsigned i = 0; i < _count; ++i)
            mp_box->get_items().add(new CItem(CText(("row " + std::to_string(i)).c_str()), nullptr));
    }
    // A click on the left or right button, far enough from the last for no double click.
    void step(char _side) {
        m_world.clock().advance_ms(1000);
        m_world.click_at(_side == 'L' ? 50 : 230, 60);
    }
    CFont *default_font() { return m_world.desktop().get_font(FNT_NAME_DEFAULT); }
    int font_h() { return mp_box->get_canvas().get_text_height(default_font()); }
    // The last frame's quad in a colour whose red byte names it.
    std::string quad_of_red(int _red) {
        for (auto const &drawn : m_world.quads())
            if (drawn.m_colour.r == _red) return qortest::rect_text(drawn.m_rect);
        return "none";
    }

    qortest::CWorld m_world;
    CSelectorBox *mp_box = nullptr;
};

} // namespace

// ---------------------------------------------------------------------------------------------
// Stepping
// ---------------------------------------------------------------------------------------------

TEST_F(SelectorBoxTest, TheButtonsStepThroughTheRowsAndStopAtEitherEnd) {
    struct {
        unsigned m_count;
        int m_start; // -1: nothing selected
        char const *m_clicks;
        int m_row;
    } const rows[] = {
        {3, -1, "R", 0},  {3, -1, "L", 2},   {3, 0, "RR", 2},      {3, 2, "R", 2},
        {3, 0, "L", 0},   {3, 1, "L", 0},    {3, 0, "RRRRL", 1},   {1, -1, "L", 0},
        {1, 0, "RLR", 0}, {0, -1, "RL", -1}, {5, 4, "LLLLLLR", 1},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message()
                     << row.m_count << " rows from " << row.m_start << ", " << row.m_clicks);
        mp_box->get_items().remove_all();
        fill(row.m_count);
        if (row.m_start >= 0) mp_box->get_items().select(row.m_start);
        for (char const *p_click = row.m_clicks; *p_click; ++p_click)
            step(*p_click);
        EXPECT_EQ(row.m_row, mp_box->get_items().get_selected_idx());
    }
}

// The box is the window a step activates; its owner hears the step on the button's click, after
// the box has taken it, and the box itself sends nothing about the row.
TEST_F(SelectorBoxTest, AnOwnerHearsTheStepOnTheButtonsClickWithTheNewRowAlreadySelected) {
    fill(3);
    std::vector<std::string> events;
    qortest::log_events(mp_box, {EVENT_ACTIVATE, EVENT_CHANGED}, events);
    qortest::log_events(mp_box->get_right_button(), {EVENT_POINTER_DOWN, EVENT_POINTER_UP, EVENT_CLICK},
                        events);
    int seen = -2;
    mp_box->get_right_button()->register_callback(
        EVENT_CLICK,
        CEventCallback([this, &seen](CWndEvent const *) { seen = mp_box->get_items().get_selected_idx(); }));
    step('R');
    step('R');
    EXPECT_EQ(
        (std::vector<std::string>{"EVENT_ACTIVATE", "EVENT_POINTER_DOWN", "EVENT_POINTER_UP", "EVENT_CLICK",
                                  "EVENT_POINTER_DOWN", "EVENT_POINTER_UP", "EVENT_CLICK"}),
        events);
    EXPECT_EQ(1, seen);
    EXPECT_EQ(mp_box, m_world.desktop().get_active_window());
}

// ---------------------------------------------------------------------------------------------
// Buttons
// ---------------------------------------------------------------------------------------------

TEST_F(SelectorBoxTest, TheButtonsAreSquaresAsHighAsTheBoxAtItsEnds) {
    struct {
        int m_w, m_h;
        char const *m_left, *m_right;
    } const rows[] = {
        {200, 24, "0,0 24x24", "176,0 24x24"},
        {90, 31, "0,0 31x31", "59,0 31x31"},
        {20, 30, "0,0 30x30", "-10,0 30x30"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_w);
        mp_box->set_size(row.m_w, row.m_h);
        EXPECT_EQ(row.m_left, qortest::place_text(mp_box->get_left_button()));
        EXPECT_EQ(row.m_right, qortest::place_text(mp_box->get_right_button()));
    }
}

// Each button wears clones of the desktop's arrows in its three pointer states; an arrow the
// desktop lacks leaves that state to the button's plain look.
TEST(SelectorBox, TheButtonsWearTheDesktopsArrowsByPointerState) {
    qortest::CWorld world;
    world.clock().advance_ms(150);
    HUID const *arrows[] = {
        &MAT_NAME_BUTTON_LEFT,  &MAT_NAME_BUTTON_LEFT_HIGHLIGHTED,  &MAT_NAME_BUTTON_LEFT_PUSHED,
        &MAT_NAME_BUTTON_RIGHT, &MAT_NAME_BUTTON_RIGHT_HIGHLIGHTED, &MAT_NAME_BUTTON_RIGHT_PUSHED};
    for (unsigned char n = 0; n < 5; ++n) // the right pushed arrow is left out
        world.desktop().add_material(*arrows[n], world.colour(n + 1, 0, 0));
    CSelectorBox *p_box =
        world.place(&world.desktop(), new CSelectorBox(&world.desktop(), "box"), 40, 50, 200, 24);
    EXPECT_NE(world.desktop().get_material(MAT_NAME_BUTTON_LEFT),
              p_box->get_left_button()->get_material(MAT_NAME_NORMAL));
    EXPECT_EQ(nullptr, p_box->get_right_button()->get_material(MAT_NAME_PUSHED));
    struct {
        char const *m_state;
        void (*m_act)(qortest::CWorld &);
        std::vector<int> m_reds; // left button, then right button
    } const rows[] = {
        {"pointer away", [](qortest::CWorld &_w) { _w.move_to(300, 200); }, {1, 4}},
        {"over the left", [](qortest::CWorld &_w) { _w.move_to(50, 60); }, {2, 4}},
        {"pressed on the left", [](qortest::CWorld &_w) { _w.press(); }, {3, 4}},
        {"over the right",
         [](qortest::CWorld &_w) {
             _w.release();
             _w.move_to(230, 60);
         },
         {1, 5}},
        {"pressed on the right", [](qortest::CWorld &_w) { _w.press(); }, {1, 4}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_state);
        row.m_act(world);
        world.frame();
        std::vector<int> reds;
        for (auto const &drawn : world.quads())
            reds.push_back(drawn.m_colour.r);
        EXPECT_EQ(row.m_reds, reds);
    }
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

// The row is clipped to the room between the buttons and margins; the icon is centred in a cell
// of the row's height at its left, and column 0 stands behind that cell with or without an icon.
TEST_F(SelectorBoxTest, TheRowStandsBehindASquareCellBetweenTheButtons) {
    ASSERT_EQ(18, font_h());
    struct {
        int m_item_height, m_icon_size;
        int m_selected; // 2 has the icon; -1: nothing is drawn
        char const *m_icon_rect;
        int m_text_y;
    } const rows[] = {
        {20, 16, -1, "none", 0}, // first, while nothing is selected
        // A fixed height of 20 with an icon of 16: half is 10, s is 8; the margins are 3 and 2.
        {20, 16, 2, "70,55 16x16", 50 + 10 - 9 + 3},
        // An odd icon: 9 / 2 is 4; 21 / 2 is 10.
        {21, 9, 2, "74,59 9x9", 50 + 10 - 9 + 3},
        {20, 16, 1, "none", 50 + 10 - 9 + 3},
        // 0 and below: the font's height.
        {0, 16, 1, "none", 50 + 9 - 9 + 3},
        {-5, 16, 1, "none", 50 + 9 - 9 + 3},
    };
    fill(2);
    mp_box->get_items().add(new CItem(CText("iconic"), m_world.colour(77, 0, 0)));
    mp_box->set_left_margin(4);
    mp_box->set_right_margin(6);
    mp_box->set_top_margin(3);
    mp_box->set_bottom_margin(2);
    for (auto const &row : rows) {
        SCOPED_TRACE(testing::Message()
                     << row.m_item_height << " " << row.m_icon_size << " " << row.m_selected);
        mp_box->set_item_height(row.m_item_height);
        mp_box->set_item_icon_size(row.m_icon_size);
        if (row.m_selected >= 0) mp_box->get_items().select(row.m_selected);
        m_world.frame();
        int const item_h = row.m_item_height > 0 ? row.m_item_height : 18;
        EXPECT_EQ(row.m_icon_rect, quad_of_red(77));
        std::vector<CRectArea> const glyphs = m_world.glyphs(default_font());
        ASSERT_EQ(row.m_selected < 0 ? 0u : row.m_selected == 2 ? 6u : 5u, glyphs.size());
        if (glyphs.empty()) continue;
        EXPECT_NE(std::string::npos, m_world.clips().find("68,53 142x19")) << m_world.clips();
        EXPECT_EQ(40 + 24 + 4 + item_h, glyphs[0].x);
        EXPECT_EQ(row.m_text_y, glyphs[0].y);
    }
}

// ---------------------------------------------------------------------------------------------
// Layouts
// ---------------------------------------------------------------------------------------------

TEST_F(SelectorBoxTest, TheRowsGoThroughALayoutUnderItemsAndComeBackWithNothingSelected) {
    fill(2);
    mp_box->get_items().add(new CItem(CText("iconic"), m_world.colour(77, 0, 0)));
    mp_box->get_items().select(1);
    LuaPlus::LuaObject saved = qortest::saved_state(mp_box);
    LuaPlus::LuaObject items = saved.GetByName("items");
    ASSERT_TRUE(items.IsTable());
    EXPECT_STREQ("row 1", items.GetByName("item_1").GetByName("column_0").GetString());
    EXPECT_EQ(77, items.GetByName("item_2").GetByName("icon").GetByName("color").GetByName("r").GetInteger());
    EXPECT_TRUE(saved.GetByName("item_height").IsNil());

    qortest::CReportCapture capture;
    CWindow *p_made = get_windows_factory().Create(HUID("SelectorBox"), &m_world.desktop(), "box");
    CSelectorBox *p_copy = class_cast<CSelectorBox>(p_made);
    ASSERT_NE(nullptr, p_copy);
    m_world.desktop().attach_child(p_copy);
    p_copy->load_state(saved);
    EXPECT_EQ(3u, p_copy->get_items().get_count());
    EXPECT_EQ(-1, p_copy->get_items().get_selected_idx());
    EXPECT_EQ(77, p_copy->get_items().get(2)->get_icon()->get_color().r);
    EXPECT_EQ(2u, p_copy->get_children_count()); // the buttons were found, not made again
    EXPECT_EQ(24, p_copy->get_right_button()->get_w());
    EXPECT_TRUE(capture.reports().empty());
}

// A value under "items" that isn't a table leaves the rows and the selection as they were; a table
// replaces the rows with what it holds.
TEST_F(SelectorBoxTest, ALayoutWithBadItemsKeepsTheRowsAndSelection) {
    struct {
        char const *m_items;
        unsigned m_count;
        int m_selected;
    } const rows[] = {
        {"items = 5", 3, 1},
        {"items = 'row'", 3, 1},
        {"items = true", 3, 1},
        {"", 3, 1},
        {"items = { item_0 = 7 }", 0, -1},
        {"items = { item_0 = { column_0 = 'x' }, item_2 = { column_0 = 'z' } }", 1, -1},
    };
    qortest::CReportCapture capture;
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_items);
        mp_box->get_items().remove_all();
        fill(3);
        mp_box->get_items().select(1);
        qortest::load_state(mp_box,
                            std::string("{ name = 'box', class_name = 'SelectorBox', ") + row.m_items + " }");
        EXPECT_EQ(row.m_count, mp_box->get_items().get_count());
        EXPECT_EQ(row.m_selected, mp_box->get_items().get_selected_idx());
    }
    EXPECT_TRUE(capture.reports().empty());
}
