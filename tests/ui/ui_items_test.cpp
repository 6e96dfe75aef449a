// The row model of lists: the marks through every operation that changes the rows, sorting in
// both directions, the Lua form of "items" with bad tables, and the contracts on indices.
#include "ui_items.h"

#include "engine_interfaces.h"
#include "test_world.h"
#include "ui_material.h"

#include <gtest/gtest.h>

#include <functional>
#include <sstream>

using namespace qorui;

namespace {

// A row of columns separated by '|', each from UTF-8 (one unit a letter); an empty one may stand
// last.
CItem *row(std::string const &_columns) {
    qor_vector<CText> texts;
    for (size_t begin = 0, end = 0; end != std::string::npos; begin = end + 1) {
        end = _columns.find('|', begin);
        texts.push_back(CText(CString(_columns.substr(begin, end - begin).c_str())));
    }
    return new CItem(texts, nullptr);
}

// Rows separated by spaces.
void fill(CItems &_items, char const *_p_rows) {
    std::istringstream in(_p_rows);
    for (std::string columns; std::getline(in, columns, ' ');)
        _items.add(row(columns));
}

// The rows by the first lines of their columns ("a|b c", "+icon" behind a row with one, "-" for a
// column without lines), then the selected and the checked index.
std::string state(CItems const &_items) {
    std::string text;
    for (unsigned i = 0; i < _items.get_count(); ++i) {
        CItem const *p_item = _items.get(i);
        for (unsigned c = 0; c < p_item->get_strings_number(); ++c) {
            CString const *p_line = p_item->get_string(c).get_string();
            text += (c ? "|" : "") + std::string(p_line ? p_line->get_c() : "-");
        }
        text += p_item->get_icon() ? "+icon " : " ";
    }
    return text + "| " + std::to_string(_items.get_selected_idx()) + " " +
           std::to_string(_items.get_checked_idx());
}

// The expressions of the broken contracts, behind "Expression:   ".
std::vector<std::string> expressions(qortest::CReportCapture const &_capture) {
    std::vector<std::string> found;
    for (std::string const &text : _capture.texts(qordebug::REPORT_ASSERT))
        found.push_back(text.substr(14, text.find(", \nFile: ") - 14));
    return found;
}

std::string dumped(LuaPlus::LuaObject const &_table) {
    std::ostringstream out;
    _table.dump("items", out);
    return out.str();
}

} // namespace

// Each row: the rows with their marks, one call, the rows and marks after it, and the contract
// that the call breaks, if any (a broken contract leaves the list as it was).
TEST(ItemsTest, MarksStayIndicesThroughEveryChangeOfTheRowsAndBadIndicesReport) {
    struct SCase {
        char const *mp_rows;
        int m_selected, m_checked;
        std::function<void(CItems &)> m_call;
        char const *mp_after, *mp_contract;
    } const cases[] = {
        {"a b c", 1, 2, [](CItems &i) { i.add(row("x")); }, "a b c x | 1 2", ""},
        {"a b c", 0, 2, [](CItems &i) { i.insert(row("x"), 0); }, "x a b c | 0 2", ""},
        {"a b c d e f", 2, 3, [](CItems &i) { i.remove(5); }, "a b c d e | -1 3", ""},
        {"a b c", -1, 2, [](CItems &i) { i.remove(0); }, "b c | -1 2", ""},
        {"a b c", 1, 2, [](CItems &i) { i.remove_all(); }, "| -1 -1", ""},
        {"a b c", 1, 2, [](CItems &i) { i.sort_by_column(0); }, "a b c | -1 -1", ""},
        {"a b c", 2, -1, [](CItems &i) { i.select_next(); }, "a b c | 2 -1", ""},
        {"a b c", -1, -1, [](CItems &i) { i.select_next(); }, "a b c | 0 -1", ""},
        {"a b c", -1, -1, [](CItems &i) { i.select_prev(); }, "a b c | 2 -1", ""},
        {"a b c", 1, -1, [](CItems &i) { i.select_prev(); }, "a b c | 0 -1", ""},
        {"", -1, -1, [](CItems &i) { i.select_next(); }, "| -1 -1", ""},
        {"a b c", 1, 2, [](CItems &i) { EXPECT_EQ(nullptr, i.get(3)); }, "a b c | 1 2",
         "_idx < m_items.size()"},
        {"a b c", 1, 2, [](CItems &i) { i.remove(3); }, "a b c | 1 2", "_idx < m_items.size()"},
        {"a b c", 1, 2, [](CItems &i) { i.insert(row("x"), 3); }, "a b c x | 1 2", "_idx < m_items.size()"},
        {"a b c", 1, 2, [](CItems &i) { EXPECT_EQ(~0u, i.add(nullptr)); }, "a b c | 1 2", "_p_item"},
        {"a b c", 1, 2, [](CItems &i) { i.select(3); }, "a b c | 1 2",
         "_idx >= 0 && _idx < (int)m_items.size()"},
        {"a b c", -1, 2, [](CItems &i) { EXPECT_EQ(nullptr, i.get_selected()); }, "a b c | -1 2",
         "is_selected()"},
        {"a b c", -1, 2,
         [](CItems &i) {
             i.remove(0);
             EXPECT_EQ(nullptr, i.get_checked());
         },
         "b c | -1 2", "m_checked_idx < (int)m_items.size()"},
        {"a b c", 1, 2, [](CItems &i) { EXPECT_EQ(0u, i.get(0)->get_string(1).get_num_strings()); },
         "a b c | 1 2", "m_strings.size() > _idx"},
    };
    for (size_t n = 0; n < sizeof cases / sizeof cases[0]; ++n) {
        SCOPED_TRACE("row " + std::to_string(n));
        CItems items;
        fill(items, cases[n].mp_rows);
        if (cases[n].m_selected >= 0) items.select(cases[n].m_selected);
        if (cases[n].m_checked >= 0) items.check(cases[n].m_checked);
        qortest::CReportCapture capture;
        cases[n].m_call(items);
        EXPECT_EQ(cases[n].mp_after, state(items));
        std::vector<std::string> const expected{cases[n].mp_contract};
        EXPECT_EQ(*cases[n].mp_contract ? expected : std::vector<std::string>{}, expressions(capture));
    }
}

TEST(ItemsTest, SortingComparesTheFirstLinesUnitByUnitAndKeepsTiesInOrder) {
    qortest::CReportCapture capture;
    CItems items;
    // Column 1: "abcdz" and "abcd" agree beyond the first four units; row 4 ties with row 0 on its
    // first line; U+00E9; U+D55C; U+1F600 as the surrogate pair 0xD83D 0xDE00.
    fill(items, "0|b 1|B 2| 3|abcdz 4|b\nzz 5|\xC3\xA9 6|<c>z 7|\xF0\x9F\x98\x80 8|\xED\x95\x9C 9|abcd");
    items.sort_by_column(1);
    EXPECT_EQ("2| 6|<c>z 1|B 9|abcd 3|abcdz 0|b 4|b 5|\xC3\xA9 8|\xED\x95\x9C 7|\xF0\x9F\x98\x80 | -1 -1",
              state(items));
    items.sort_by_column(1, SORT_DESCENDING);
    EXPECT_EQ("7|\xF0\x9F\x98\x80 8|\xED\x95\x9C 5|\xC3\xA9 0|b 4|b 3|abcdz 9|abcd 1|B 6|<c>z 2| | -1 -1",
              state(items));

    // More rows than a sort orders by plain insertion: an unstable sort would mix the ties.
    CItems ties;
    fill(ties, "a|y b|x c|y d|x e|y f|x g|y h|x i|y j|x k|y l|x m|y n|x o|y p|x q|y r|x s|y t|x");
    ties.sort_by_column(1, SORT_DESCENDING);
    EXPECT_EQ("a|y c|y e|y g|y i|y k|y m|y o|y q|y s|y b|x d|x f|x h|x j|x l|x n|x p|x r|x t|x | -1 -1",
              state(ties));
    EXPECT_TRUE(capture.reports().empty());

    // A row without the column, or without a line in it, reports and sorts as empty text.
    CItems short_rows;
    fill(short_rows, "a|z b");
    short_rows.add(new CItem(qor_vector<CText>(2), nullptr));
    short_rows.sort_by_column(1);
    EXPECT_EQ("b -|- a|z | -1 -1", state(short_rows));
    EXPECT_EQ((std::vector<std::string>{"m_strings.size() > _idx", "p_str1 && p_str2", "p_str1 && p_str2"}),
              expressions(capture));
}

TEST(ItemsTest, TheLuaFormKeepsFirstLinesIconsAndEmptyColumnsButNoMarks) {
    qortest::CWorld world;
    CItems items;
    items.add(new CItem(CText("Sword"), world.colour(10, 20, 30)));
    fill(items, "Shield\nof\noak|\xC3\x89p\xC3\xA9\x65 |3");
    items.select(1);
    items.check(2);

    LuaPlus::LuaObject saved = qortest::new_table();
    items.save_state(saved, &world.desktop());
    saved.GetByName("item_0").SetNil("icon");
    std::string const text = dumped(saved);
    EXPECT_EQ("items = {\n    item_0 = {\n        column_0 = \"Sword\",\n    },\n"
              "    item_1 = {\n        column_0 = \"Shield\",\n        column_1 = "
              "\"\xC3\x89p\xC3\xA9\x65\",\n    },\n"
              "    item_2 = {\n        column_0 = \"\",\n        column_1 = \"3\",\n    },\n}\n",
              text);

    // Loading replaces the rows and clears the marks; saving again gives the same table.
    items.save_state(saved, &world.desktop());
    CItems loaded;
    fill(loaded, "old");
    loaded.check(0);
    loaded.load_state(saved, &world.desktop());
    EXPECT_EQ("Sword+icon Shield|\xC3\x89p\xC3\xA9\x65 |3 | -1 -1", state(loaded));
    EXPECT_EQ(rgba_t(10, 20, 30, 255), loaded.get(0)->get_icon()->get_color());
    LuaPlus::LuaObject again = qortest::new_table();
    loaded.save_state(again, &world.desktop());
    again.GetByName("item_0").SetNil("icon");
    EXPECT_EQ(text, dumped(again));
}

// A value that isn't a table breaks a contract and leaves the rows loaded before; anything else
// replaces them with what it holds up to the first missing or unreadable number.
TEST(ItemsTest, BadItemsTablesLoadWhatIsReadableAndReportOnlyWhatTheyMust) {
    struct SCase {
        char const *mp_table;
        char const *mp_after;
        std::vector<std::string> m_errors, m_contracts;
    } const cases[] = {
        {"5", "old | -1 -1", {}, {"_lo_table.IsTable()"}},
        {"{ item_0 = { column_0 = 'a' }, item_2 = { column_0 = 'c' } }", "a | -1 -1", {}, {}},
        {"{ item_0 = 'a', item_1 = { column_0 = 'b' } }", "| -1 -1", {}, {}},
        {"{ item_0 = { column_0 = 'a', column_1 = 5, column_2 = 'c' } }", "a | -1 -1", {}, {}},
        {"{ item_0 = { column_0 = 'a', column_1 = 'b' }, item_1 = { column_1 = 'c' } }",
         "a|b  | -1 -1",
         {},
         {}},
        {"{ item_0 = { icon = { material_preset = 'missing' }, column_0 = 'a' } }",
         "a+icon | -1 -1",
         {"UI: Material presets table 'ui_material_presets' not found"},
         {}},
    };
    qortest::CWorld world;
    lua_machine().DoString("ui_material_presets = nil");
    for (SCase const &c : cases) {
        SCOPED_TRACE(c.mp_table);
        CItems items;
        fill(items, "old");
        LuaPlus::LuaObject table = qortest::lua_table(c.mp_table);
        qortest::CReportCapture capture;
        items.load_state(table, &world.desktop());
        EXPECT_EQ(c.mp_after, state(items));
        EXPECT_EQ(c.m_errors, capture.texts(qordebug::REPORT_ERROR));
        EXPECT_EQ(c.m_contracts, expressions(capture));
    }
}
