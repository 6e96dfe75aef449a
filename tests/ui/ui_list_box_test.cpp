// The list box driven through the desktop: its scroll bar, rows, marks and clips, the rows under the
// pointer and clicks, wheel and keys, columns, header and icons, and the layout keys.
#include "ui_list_box.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_value_bar.h"

#include <gtest/gtest.h>

#include <set>
#include <sstream>

using namespace qorui;

namespace {

typedef std::vector<std::string> events_t;

// A text of one line, as a layout gives it (a text made from a string ends with a line break).
CText line(char const *_p_text) {
    CText text;
    text.insert(_p_text, false, true);
    return text;
}

// A list of 200 by 108 at (20, 30) with a bar 16 wide and rows 20 high: the rows' area starts at
// (24, 34) and is 100 high. The marks are red 1 (selected) and 2 (checked), the header red 3.
class ListBoxTest : public ::testing::Test {
protected:
    ListBoxTest() {
        m_world.clock().advance_ms(150); // the desktop has faded in
        mp_list =
            m_world.place(&m_world.desktop(), new CListBox(&m_world.desktop(), "list"), 20, 30, 200, 108);
        mp_list->get_scroll_bar_vert()->set_w(16);
        mp_list->set_item_height(20);
        HUID const *const marks[] = {&MAT_NAME_SELECTION, &MAT_NAME_CHECKED, &MAT_NAME_LISTBOX_HEADER};
        for (unsigned char red = 1; red <= 3; ++red)
            mp_list->add_material(*marks[red - 1], m_world.colour(red, 0, 0));
    }
    // Rows of columns separated by '|', then a frame.
    void fill(std::vector<std::string> const &_rows, CMaterial *_p_icon = nullptr) {
        for (std::string const &columns : _rows) {
            qor_vector<CText> texts;
            for (size_t begin = 0, end = 0; end != std::string::npos; begin = end + 1) {
                end = columns.find('|', begin);
                texts.push_back(line(columns.substr(begin, end - begin).c_str()));
            }
            mp_list->get_items().add(new CItem(texts, _p_icon));
        }
        m_world.frame();
    }
    void refill(unsigned _count) {
        mp_list->get_items().remove_all();
        fill(std::vector<std::string>(_count, "row"));
    }
    // Makes the list the active window, for the wheel and keys, with a click on its left margin.
    void activate() { m_world.click_at(21, 100); }
    float position() { return mp_list->get_scroll_bar_vert()->get_position(); }
    CFont *font() { return m_world.desktop().get_font(FNT_NAME_DEFAULT); }
    // The last frame's quads in a colour whose red byte names it, joined by "; ".
    std::string quads_of_red(int _red) {
        std::string found;
        for (auto const &drawn : m_world.quads())
            if (drawn.m_colour.r == _red && drawn.m_colour.g == 0)
                found += (found.empty() ? "" : "; ") + qortest::rect_text(drawn.m_rect);
        return found;
    }
    // The tops of the glyphs of the last frame in a font: one per line drawn.
    std::set<int> line_tops(CFont *_p_font) {
        std::set<int> tops;
        for (CRectArea const &glyph : m_world.glyphs(_p_font))
            tops.insert(glyph.y);
        return tops;
    }
    void load(std::string const &_keys) {
        qortest::load_state(mp_list, "{ name = 'list', class_name = 'ListBox', " + _keys + " }");
    }

    qortest::CWorld m_world;
    CListBox *mp_list = nullptr;
};

} // namespace

TEST_F(ListBoxTest, TheScrollBarShowsExactlyWhenTheRowsOverflowTheViewWithTheirRange) {
    struct {
        char const *m_case;
        unsigned m_rows;
        int m_spacing;
        bool m_header;
        std::vector<float> m_bar; // max, small and large step; empty: hidden
    } const rows[] = {
        {"ten rows of 20 in a view of 100", 10, 0, false, {100, 20, 100}},
        {"rows exactly as high as the view", 5, 0, false, {}},
        {"the spacing counts", 6, 2, false, {32, 22, 32}}, // 6 * 22 = 132; a step is cut to the range
        {"the header takes 20 of the view", 5, 0, true, {20, 20, 20}},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        mp_list->show_columns(row.m_header);
        load("item_spacing = " + std::to_string(row.m_spacing));
        refill(row.m_rows);
        CScrollBar *p_bar = mp_list->get_scroll_bar_vert();
        EXPECT_EQ(row.m_bar.empty(), p_bar->is_hidden());
        EXPECT_EQ(row.m_bar.empty() ? 4 : 20, mp_list->get_right_margin());
        int const top = row.m_header ? 24 : 4;
        EXPECT_EQ(qortest::rect_text(CRectArea(184, top, 16, 104 - top)), qortest::place_text(p_bar));
        if (!row.m_bar.empty()) {
            EXPECT_EQ(row.m_bar, (std::vector<float>{p_bar->get_max(), p_bar->get_small_step(),
                                                     p_bar->get_large_step()}));
        }
    }
}

// Rows 2 to 6 meet the view scrolled by 40; the marks reach 2 pixels beyond the rows' clip. Shrunk
// while scrolled, the list keeps its position with the bar hidden, and its rows stand above the view.
TEST_F(ListBoxTest, AScrolledListDrawsOnlyTheRowsInItsViewInsideTheirClip) {
    refill(10);
    activate();
    m_world.desktop().on_wheel_rotated(-1.0f);
    m_world.desktop().on_wheel_rotated(-1.0f);
    ASSERT_EQ(40.0f, position());
    m_world.frame();
    EXPECT_EQ((std::set<int>{34, 54, 74, 94, 114}), line_tops(font()));
    EXPECT_EQ(24, m_world.glyphs(font()).front().x);
    EXPECT_NE(std::string::npos, m_world.clips().find("20,30 200x108; 22,34 180x100; 24,34 176x100"))
        << m_world.clips();
    m_world.move_to(100, 39); // 5 below the rows' top, 45 into the rows: row 2
    EXPECT_EQ(2, mp_list->get_items().get_selected_idx());
    m_world.key(0x22); // page down to 100
    for (int i = 0; i < 7; ++i)
        mp_list->get_items().remove(0);
    m_world.frame();
    EXPECT_TRUE(mp_list->get_scroll_bar_vert()->is_hidden());
    EXPECT_EQ(100.0f, position());
    EXPECT_TRUE(line_tops(font()).empty());
}

// Each input steps the bar that the rows' overflow set up: a row, a view, or to an end. With the
// bar hidden nothing moves.
TEST_F(ListBoxTest, WheelAndKeysScrollByARowAViewOrToTheEnds) {
    // A wheel's rotation (below 10) or a key, and the position after it.
    std::pair<float, float> const steps[] = {{-1, 20},    {-2.5f, 40}, {1, 20},     {0, 20},
                                             {0x28, 40},  {0x26, 20},  {0x22, 100}, {0x21, 0},
                                             {0x23, 100}, {0x24, 0},   {0x41, 0}};
    for (unsigned rows : {10u, 3u}) {
        refill(rows);
        activate();
        for (auto const &step : steps) {
            SCOPED_TRACE(testing::Message() << rows << " rows, " << step.first);
            step.first < 10 ? m_world.desktop().on_wheel_rotated(step.first)
                            : m_world.key(unsigned(step.first));
            EXPECT_EQ(rows == 10 ? step.second : 0.0f, position());
        }
    }
}

// Three rows at 34, 54 and 74 on the desktop; below 94 the view is empty. On the spacing between
// rows, the row above is selected.
TEST_F(ListBoxTest, TheSelectedRowFollowsThePointerAndAClickChecksIt) {
    refill(3);
    events_t events;
    qortest::log_events(mp_list, {EVENT_HIGHLIGHTED, EVENT_CHECKED, EVENT_CLICK}, events);
    struct {
        char const *m_case;
        bool m_click;
        int m_x, m_y;
        int m_selected, m_checked;
        events_t m_events;
    } const steps[] = {
        {"onto row 0", false, 100, 40, 0, -1, {"EVENT_HIGHLIGHTED"}},
        {"within row 0", false, 100, 53, 0, -1, {}},
        {"onto row 2", false, 100, 75, 2, -1, {"EVENT_HIGHLIGHTED"}},
        {"a click", true, 100, 75, 2, 2, {"EVENT_CHECKED", "EVENT_CLICK"}},
        {"a click on the checked row", true, 100, 75, 2, 2, {"EVENT_CLICK"}},
        {"below the last row", false, 100, 120, 2, 2, {}},
        {"into the left margin", false, 22, 40, 2, 2, {}},
        {"into the right margin", false, 217, 40, 2, 2, {}},
        {"out of the list", false, 300, 40, -1, 2, {}},
        {"a click with no row under the pointer", true, 100, 120, -1, 2, {"EVENT_CLICK"}},
        {"a click on row 1", true, 100, 55, 1, 1, {"EVENT_HIGHLIGHTED", "EVENT_CHECKED", "EVENT_CLICK"}},
    };
    for (auto const &step : steps) {
        SCOPED_TRACE(step.m_case);
        events.clear();
        step.m_click ? m_world.click_at(step.m_x, step.m_y) : m_world.move_to(step.m_x, step.m_y);
        EXPECT_EQ(step.m_selected, mp_list->get_items().get_selected_idx());
        EXPECT_EQ(step.m_checked, mp_list->get_items().get_checked_idx());
        EXPECT_EQ(step.m_events, events);
    }
    load("item_spacing = 4");
    for (auto const &row :
         {std::make_pair(34 + 21, 0), std::make_pair(34 + 24, 1), std::make_pair(34 + 71, 2)}) {
        m_world.move_to(100, row.first);
        EXPECT_EQ(row.second, mp_list->get_items().get_selected_idx()) << "at " << row.first;
    }
}

// The checked mark over the selected one, both as wide as the rows' clip and 2 more on each side;
// the checked row in the checked font, unless checks aren't shown: then neither shows, though a
// click still checks. The body keeps its normal look under the pointer and while pressed.
TEST_F(ListBoxTest, TheMarksAndTheCheckedFontShowOnlyWhileChecksAreAllowed) {
    mp_list->add_font(FNT_NAME_CHECKED, get_fonts_factory().create("courier", &m_world.desktop()));
    mp_list->add_material(MAT_NAME_NORMAL, m_world.colour(5, 0, 0));
    mp_list->add_material(MAT_NAME_HIGHLIGHTED, m_world.colour(6, 0, 0));
    mp_list->add_material(MAT_NAME_PUSHED, m_world.colour(7, 0, 0));
    for (bool const allowed : {true, false}) {
        SCOPED_TRACE(allowed);
        load(allowed ? "allow_check_items = true" : "allow_check_items = false");
        refill(3);
        m_world.click_at(100, 35);
        m_world.move_to(100, 75);
        m_world.press(); // held through the frame
        m_world.frame();
        EXPECT_EQ(0, mp_list->get_items().get_checked_idx());
        EXPECT_EQ("20,30 200x108", quads_of_red(5) + quads_of_red(6) + quads_of_red(7));
        EXPECT_EQ("22,74 196x20", quads_of_red(1)); // the bar is hidden
        EXPECT_EQ(allowed ? "22,34 196x20" : "", quads_of_red(2));
        EXPECT_EQ(allowed ? std::set<int>{34} : std::set<int>{},
                  line_tops(mp_list->get_font(FNT_NAME_CHECKED)));
        EXPECT_EQ(allowed ? (std::set<int>{54, 74}) : (std::set<int>{34, 54, 74}), line_tops(font()));
        m_world.release();
    }
}

// Two columns of 50 and 60 with a gap of 4: the second starts at 24 + 54. A row draws as many texts
// as it has, up to the number of columns; an icon takes a cell of the row's height before them.
TEST_F(ListBoxTest, ColumnsHeaderAndIconsStandWhereTheirWidthsPutThem) {
    EXPECT_EQ(1u, mp_list->add_column());
    mp_list->set_column_w(0, 50);
    mp_list->set_column_w(1, 60);
    mp_list->set_column_title(0, CString("t"));
    mp_list->set_column_title(1, CString("u"));
    mp_list->show_columns(true);
    fill({"aa|bb|cc", "d"});
    fill({"e"}, m_world.colour(4, 0, 0)); // 16 square in a row 20 high: 2 in from each side
    std::vector<CRectArea> const glyphs = m_world.glyphs(font());
    std::vector<std::pair<int, int>> starts; // each glyph's x and y
    for (CRectArea const &glyph : glyphs)
        starts.emplace_back(glyph.x, glyph.y);
    int const a_w = glyphs[3].x - glyphs[2].x, b_w = glyphs[5].x - glyphs[4].x;
    EXPECT_EQ(
        (std::vector<std::pair<int, int>>{
            {24, 34}, {78, 34}, {24, 54}, {24 + a_w, 54}, {78, 54}, {78 + b_w, 54}, {24, 74}, {44, 94}}),
        starts);
    EXPECT_EQ("20,30 50x24; 74,30 60x24", quads_of_red(3));
    EXPECT_EQ("26,96 16x16", quads_of_red(4));
    mp_list->set_item_icon_size(30); // larger than the row: 5 out on each side
    m_world.frame();
    EXPECT_EQ("19,89 30x30", quads_of_red(4));
}

// All rows are as high as the tallest; a text made from a string has a second, empty line.
TEST_F(ListBoxTest, TheRowsHeightFollowsTheTallestRowWhateverChangesTheRows) {
    int const font_h = mp_list->get_canvas().get_text_height(font());
    ASSERT_GT(font_h, 0);
    mp_list->set_item_height(0);
    EXPECT_EQ(font_h, mp_list->get_item_height()); // no rows: one line
    CItems &items = mp_list->get_items();
    items.add(new CItem(line("a"), nullptr));
    EXPECT_EQ(font_h, mp_list->get_item_height());
    items.insert(new CItem(line("1\\n2\\n3"), nullptr), 0);
    EXPECT_EQ(3 * font_h, mp_list->get_item_height());
    items.remove(0);
    items.add(new CItem(CText("b"), nullptr)); // as many rows as before
    EXPECT_EQ(2 * font_h, mp_list->get_item_height());
    load("items = { item_0 = { column_0 = 'c' } }");
    EXPECT_EQ(font_h, mp_list->get_item_height());
}

// A list that the factory makes, its bar hidden, loads the keys and rows that another saved and
// saves the same; then keys of another type and an "items" that isn't a table change nothing.
TEST_F(ListBoxTest, TheLayoutKeysAndTheRowsGoThroughATableIntoAListOfTheFactory) {
    load("show_columns = true, columns_h = 18.9, columns_dw = -3.7, custom_item_height = 22,"
         " item_icon_size = 12, allow_check_items = false, item_spacing = 3");
    mp_list->get_items().add(new CItem(line("x"), m_world.colour(9, 8, 7)));
    fill({"y|z"});
    auto saved = [](CListBox *_p_list) {
        LuaPlus::LuaObject table = qortest::saved_state(_p_list);
        std::ostringstream keys;
        for (char const *key : {"show_columns", "columns_h", "columns_dw", "custom_item_height",
                                "item_icon_size", "allow_check_items", "item_spacing", "items"})
            table.GetByName(key).dump(key, keys);
        return std::make_pair(table, keys.str());
    };
    auto original = saved(mp_list);
    EXPECT_EQ("show_columns = true\ncolumns_h = 18\ncolumns_dw = -3\ncustom_item_height = 22\n"
              "item_icon_size = 12\nallow_check_items = false\nitem_spacing = 3\n",
              original.second.substr(0, original.second.find("\nitems = ") + 1));
    for (char const *row : {"column_0 = \"x\"", "r = 9", "column_0 = \"y\"", "column_1 = \"z\""})
        EXPECT_NE(std::string::npos, original.second.find(row)) << row;
    CListBox *p_copy =
        class_cast<CListBox>(get_windows_factory().Create(HUID("ListBox"), &m_world.desktop(), "list"));
    ASSERT_NE(nullptr, p_copy);
    EXPECT_EQ(p_copy->get_scroll_bar_vert(), p_copy->get_child("scroll bar vert", "ScrollBar", true));
    EXPECT_TRUE(p_copy->get_scroll_bar_vert()->is_hidden());
    EXPECT_EQ(4, p_copy->get_left_margin());
    p_copy->load_state(original.first);
    EXPECT_EQ(original.second, saved(p_copy).second);
    qortest::CReportCapture capture;
    qortest::load_state(p_copy, "{ name = 'list', class_name = 'ListBox', items = 5, show_columns = 1,"
                                " columns_h = '9', custom_item_height = true, item_spacing = {} }");
    EXPECT_EQ(original.second, saved(p_copy).second);
    EXPECT_TRUE(capture.reports().empty());
    delete p_copy;
}

// Columns out of range and rows of no height (no font, no custom height) break contracts; the
// pointer then selects nothing.
TEST_F(ListBoxTest, ContractsReportAndStepAside) {
    qortest::CReportCapture capture;
    mp_list->set_column_w(1, 50);
    mp_list->set_column_title(1, CString("x"));
    m_world.desktop().add_font(FNT_NAME_DEFAULT, nullptr);
    mp_list->set_item_height(-1);
    refill(3);
    m_world.move_to(100, 40);
    EXPECT_EQ(-1, mp_list->get_items().get_selected_idx());
    std::vector<std::string> expressions;
    for (std::string const &text : capture.asserts())
        expressions.push_back(text.substr(14, text.find(", \nFile: ") - 14));
    EXPECT_EQ((std::vector<std::string>{"_idx < m_columns.size()", "_idx < m_columns.size()",
                                        "get_item_height() > 0"}),
              expressions);
}
