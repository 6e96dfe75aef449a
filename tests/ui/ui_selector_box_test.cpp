// The selector box in the test world, driven by the pointer: stepping with the buttons and its
// ends, the events an owner hears, the square buttons and their looks, where the row is drawn, and
// the rows' layout key with bad values.
#include "ui_selector_box.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_button.h"
#include "ui_material.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

// The box at (40, 50), 200 by 24: the left button covers x 40..63, the right one x 216..239.
class SelectorBoxTest : public ::testing::Test {
protected:
    SelectorBoxTest() {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_box =
            m_world.place(&m_world.desktop(), new CSelectorBox(&m_world.desktop(), "box"), 40, 50, 200, 24);
    }
    // Rows named "row 0", "row 1", ..., in place of those there were.
    void fill(unsigned _count) {
        mp_box->get_items().remove_all();
        for (unsigned i = 0; i < _count; ++i)
            mp_box->get_items().add(new CItem(CText(("row " + std::to_string(i)).c_str()), nullptr));
    }
    // A click on the left or right button, far enough from the last for no double click.
    void step(char _side) {
        m_world.clock().advance_ms(1000);
        m_world.click_at(_side == 'L' ? 50 : 230, 60);
    }

    qortest::CWorld m_world;
    CSelectorBox *mp_box = nullptr;
};

} // namespace

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

TEST_F(SelectorBoxTest, TheButtonsAreSquaresAsHighAsTheBoxAtItsEnds) {
    struct {
        int m_w, m_h;
        char const *m_left, *m_right;
    } const rows[] = {{90, 31, "0,0 31x31", "59,0 31x31"}, {20, 30, "0,0 30x30", "-10,0 30x30"}};
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_w);
        mp_box->set_size(row.m_w, row.m_h);
        EXPECT_EQ(row.m_left, qortest::place_text(mp_box->get_left_button()));
        EXPECT_EQ(row.m_right, qortest::place_text(mp_box->get_right_button()));
    }
}

// Each button wears clones of the desktop's arrows for its three pointer states; an arrow the
// desktop lacks leaves that state to the button's plain look.
TEST(SelectorBox, TheButtonsWearTheDesktopsArrowsByPointerState) {
    qortest::CWorld world;
    HUID const *arrows[] = {&MAT_NAME_BUTTON_LEFT, &MAT_NAME_BUTTON_LEFT_HIGHLIGHTED,
                            &MAT_NAME_BUTTON_LEFT_PUSHED, &MAT_NAME_BUTTON_RIGHT,
                            &MAT_NAME_BUTTON_RIGHT_HIGHLIGHTED};
    for (unsigned char n = 0; n < 5; ++n) // the right pushed arrow is left out
        world.desktop().add_material(*arrows[n], world.colour(n + 1, 0, 0));
    CSelectorBox *p_box = new CSelectorBox(&world.desktop(), "box");
    world.desktop().attach_child(p_box);
    EXPECT_NE(world.desktop().get_material(MAT_NAME_BUTTON_LEFT),
              p_box->get_left_button()->get_material(MAT_NAME_NORMAL));
    std::vector<int> reds;
    for (CButton *p_button : {p_box->get_left_button(), p_box->get_right_button()})
        for (HUID const *p_state : {&MAT_NAME_NORMAL, &MAT_NAME_HIGHLIGHTED, &MAT_NAME_PUSHED}) {
            CMaterial *p_material = p_button->get_material(*p_state);
            reds.push_back(p_material ? p_material->get_color().r : 0);
        }
    EXPECT_EQ((std::vector<int>{1, 2, 3, 4, 5, 0}), reds);
}

// The row is clipped to the room between the buttons and margins; the icon is centred in a cell
// of the row's height at its left, and column 0 stands behind that cell with or without an icon.
TEST_F(SelectorBoxTest, TheRowStandsBehindASquareCellBetweenTheButtons) {
    CFont *p_font = m_world.desktop().get_font(FNT_NAME_DEFAULT);
    ASSERT_EQ(18, mp_box->get_canvas().get_text_height(p_font));
    struct {
        int m_item_height, m_icon_size;
        int m_selected; // 2 has the icon; -1: nothing is drawn
        char const *m_icon_rect;
        int m_text_y;
    } const rows[] = {
        {20, 16, -1, nullptr, 0}, // first, while nothing is selected
        // A fixed height of 20 with an icon of 16: half is 10, s is 8; the margins are 3 and 2.
        {20, 16, 2, "70,55 16x16", 50 + 10 - 9 + 3},
        {21, 9, 2, "74,59 9x9", 50 + 10 - 9 + 3}, // an odd icon: 9 / 2 is 4; 21 / 2 is 10
        {20, 16, 1, nullptr, 50 + 10 - 9 + 3},
        {-5, 16, 1, nullptr, 50 + 9 - 9 + 3}, // 0 and below: the font's height
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
        std::string icon = "none";
        for (auto const &quad : m_world.quads())
            if (quad.m_colour.r == 77) icon = qortest::rect_text(quad.m_rect);
        EXPECT_EQ(row.m_icon_rect ? row.m_icon_rect : "none", icon);
        std::vector<CRectArea> const glyphs = m_world.glyphs(p_font);
        ASSERT_EQ(row.m_selected < 0 ? 0u : row.m_selected == 2 ? 6u : 5u, glyphs.size());
        if (glyphs.empty()) continue;
        EXPECT_NE(std::string::npos, m_world.clips().find("68,53 142x19")) << m_world.clips();
        EXPECT_EQ(
            (std::vector<int>{40 + 24 + 4 + (row.m_item_height > 0 ? row.m_item_height : 18), row.m_text_y}),
            (std::vector<int>{glyphs[0].x, glyphs[0].y}));
    }
}

// The rows with their icons go through a layout under "items" into a box that the factory makes,
// which finds its buttons rather than making them again, and comes back with nothing selected. A
// value under "items" that isn't a table leaves the rows and the selection as they were; a table
// replaces the rows with what it holds.
TEST_F(SelectorBoxTest, TheRowsGoThroughALayoutUnderItemsAndBadItemsKeepTheRowsAndSelection) {
    fill(2);
    mp_box->get_items().add(new CItem(CText("iconic"), m_world.colour(77, 0, 0)));
    mp_box->get_items().select(1);
    LuaPlus::LuaObject saved = qortest::saved_state(mp_box);
    EXPECT_TRUE(saved.GetByName("item_height").IsNil());
    qortest::CReportCapture capture;
    CSelectorBox *p_copy = class_cast<CSelectorBox>(
        get_windows_factory().Create(HUID("SelectorBox"), &m_world.desktop(), "box"));
    ASSERT_NE(nullptr, p_copy);
    m_world.desktop().attach_child(p_copy);
    p_copy->load_state(saved);
    EXPECT_EQ((std::vector<int>{3, -1, 77, 2, 24}),
              (std::vector<int>{(int)p_copy->get_items().get_count(), p_copy->get_items().get_selected_idx(),
                                p_copy->get_items().get(2)->get_icon()->get_color().r,
                                (int)p_copy->get_children_count(), p_copy->get_right_button()->get_w()}));
    EXPECT_STREQ("row 1", p_copy->get_items().get(1)->get_string(0).get_string(0)->get_c());
    struct {
        char const *m_items;
        unsigned m_count;
        int m_selected;
    } const rows[] = {
        {"items = 5", 3, 1},
        {"items = 'row'", 3, 1},
        {"items = true", 3, 1},
        {"items = { item_0 = { column_0 = 'x' } }", 1, -1},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_items);
        fill(3);
        mp_box->get_items().select(1);
        qortest::load_state(mp_box,
                            std::string("{ name = 'box', class_name = 'SelectorBox', ") + row.m_items + " }");
        EXPECT_EQ(row.m_count, mp_box->get_items().get_count());
        EXPECT_EQ(row.m_selected, mp_box->get_items().get_selected_idx());
    }
    EXPECT_TRUE(capture.reports().empty());
}
