// Bad data that once crashed, hung or corrupted: numbers out of range in layouts, layouts that
// contain themselves, giant fonts and tiles, long texts, failed exports; and the places where the
// library's arithmetic and file handling were made exact.
#include "engine_interfaces.h"
#include "qorMemoryManager.h"
#include "qorbase.h"
#include "test_world.h"
#include "ui_canvas.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_string.h"
#include "ui_window_visual.h"

#include <gtest/gtest.h>

#include <sstream>
#include <type_traits>

using namespace qorui;

namespace {

class HardeningTest : public ::testing::Test {
protected:
    CWindowVisual *child(char const *_name, int _w = 100, int _h = 50) {
        return m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), _name), 5, 6, _w, _h);
    }
    static std::string dumped(LuaPlus::LuaObject const &_lo_table) {
        std::ostringstream text;
        _lo_table.dump("t", text);
        return text.str();
    }
    static unsigned depth(CWindow *_p_wnd) {
        unsigned levels = 0;
        for (; _p_wnd->get_children_count() > 0; _p_wnd = _p_wnd->get_child(0u))
            ++levels;
        return levels;
    }

    qortest::CWorld m_world;
};

} // namespace

// Each number out of range is one warning, and the window stays as it was in every field.
TEST_F(HardeningTest, NumbersOutOfRangeAreReportedAndLeaveTheWindowAsItWas) {
    struct {
        char const *mp_keys;
        size_t mn_warnings;
    } const rows[] = {
        {"pos = { 0/0, 1e10 }", 2},
        {"size = { -1e10, 1/0 }", 2},
        {"z_order = -1e12", 1},
        {"fade_in = 0/0, fade_out = 1e300, top_margin = -1/0", 3},
        {"movement = { pos = { 1e10, 0/0 }, size = { 1e300, -1e300 }, time = 1e10 }", 5},
        {"materials = { normal = { color = { r = 1e10, g = 0/0, b = -1e10, a = 1/0 }, pos = { 0/0, 0 } } }",
         5},
        {"events_sounds = { EVENT_CLICK = { file_names = { 'click.wav' }, volume = 0/0 } }", 1},
    };
    CWindowVisual *p_wnd = child("w");
    qortest::load_state(p_wnd, "{ name = 'w', class_name = 'WindowVisual', z_order = 3,"
                               " movement = { pos = { 1, 2 }, size = { 3, 4 }, time = 5 },"
                               " materials = { normal = { material_template = 'ui_color', color = { r = 1, g "
                               "= 2, b = 3, a = 4 } } } }");
    std::string const before = dumped(qortest::saved_state(p_wnd));
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_keys);
        qortest::CReportCapture capture;
        qortest::load_state(p_wnd,
                            std::string("{ name = 'w', class_name = 'WindowVisual', ") + row.mp_keys + " }");
        EXPECT_EQ(row.mn_warnings, capture.warnings().size());
        EXPECT_EQ(before, dumped(qortest::saved_state(p_wnd)));
    }
}

// A layout that contains itself, twice over, and one a thousand levels deep: the walk stops with
// one report at its depth limit, and what it loaded stays.
TEST_F(HardeningTest, LayoutsThatContainThemselvesOrNestTooDeepStopWithAReport) {
    struct {
        char const *mp_chunk;
    } const rows[] = {
        {"local w = { name = 'cycle', class_name = 'WindowVisual' }; w[1] = w; w[2] = w; hardening = w"},
        {"local w = { name = 'deep', class_name = 'Window' }; hardening = w;"
         " for i = 1, 1000 do local c = { name = 'deep', class_name = 'Window' }; w[1] = c; w = c end"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_chunk);
        CWindowVisual *p_root = new CWindowVisual(&m_world.desktop(), "");
        ASSERT_EQ(0, lua_machine().DoString(row.mp_chunk));
        LuaPlus::LuaObject layout = lua_machine().GetGlobals().GetByName("hardening");
        layout.SetString("name", "");
        layout.SetString("class_name", "WindowVisual");
        qortest::CReportCapture capture;
        p_root->load_state(layout);
        EXPECT_EQ(1u, capture.warnings().size());
        EXPECT_EQ(64u, depth(p_root));
        delete p_root;
    }
}

// A name too long for an identifier is reported as bad data, like any other that can't be used.
TEST_F(HardeningTest, AChildWithoutAUsableNameOrClassMakesNothing) {
    std::string const long_name(120, 'n');
    struct {
        std::string m_child;
        size_t mn_warnings;
    } const rows[] = {
        {"{ class_name = 'WindowVisual' }", 0},
        {"{ name = 'x' }", 0},
        {"{ name = 1, class_name = 'Window' }", 0},
        {"{ name = '" + long_name + "', class_name = 'Window' }", 1},
        {"{ name = 'x', class_name = '" + long_name + "' }", 1},
        {"{ name = 'x', class_name = 'WindowVisual', materials = { " + long_name + " = { color = {} } } }",
         1},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_child);
        CWindowVisual *p_wnd = child("parent");
        qortest::CReportCapture capture;
        qortest::load_state(p_wnd, "{ name = 'parent', class_name = 'WindowVisual', " + row.m_child + " }");
        EXPECT_EQ(row.mn_warnings, capture.warnings().size());
        EXPECT_TRUE(capture.asserts().empty());
        size_t const made = row.m_child.find("materials") != std::string::npos ? 1u : 0u;
        ASSERT_EQ(made, p_wnd->get_children_count());
        delete p_wnd;
    }
}

// A charset whose cells can't be laid out is bad data: reported, and the font has no characters.
TEST_F(HardeningTest, ACharsetWithoutCellsIsReported) {
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, dir.c_str());
    qortest::write_file(dir + "/cellless.fnt", "[common]\ndimension = 0\nfont_h = 16\n[chars]\n65 = 8\n");
    ASSERT_EQ(0,
              lua_machine().DoString("charsets.cellless = { file_type = 'nehe', file_name = 'cellless.fnt' };"
                                     " fonts.cellless = { charset_name = 'cellless', material = { "
                                     "material_template = 'ui_color' } }"));
    qortest::CReportCapture capture;
    CFont *p_font = get_fonts_factory().create("cellless", &m_world.desktop());
    ASSERT_NE(nullptr, p_font);
    EXPECT_EQ(nullptr, p_font->get_char_description('A'));
    EXPECT_EQ((std::vector<std::string>{"Cannot load the charset 'cellless'\nbad 'dimension' record 0"}),
              capture.warnings());
    EXPECT_TRUE(capture.asserts().empty());
    delete p_font;
}

// Each step is origin + t * (destination - origin) / T in floats: from 20 to 320 in 300 ms.
TEST_F(HardeningTest, AMovementStepMultipliesBeforeItDivides) {
    CWindowVisual *p_wnd = child("slider", 10, 10);
    qortest::load_state(p_wnd, "{ name = 'slider', class_name = 'WindowVisual',"
                               " movement = { pos = { 320, 6 }, size = { 10, 10 }, time = 300 } }");
    for (unsigned t : {89u, 98u, 159u, 177u, 300u}) {
        SCOPED_TRACE(t);
        p_wnd->set_pos(20, 6);
        p_wnd->send_event(p_wnd, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
        m_world.clock().advance_ms(t);
        p_wnd->send_event(p_wnd, EVENT_UPDATE, CWndEvent::DISPATCH_NONE);
        EXPECT_EQ(static_cast<int>(20 + t), p_wnd->get_pos().x);
    }
}

// A font of the greatest size that data may give: the pen never wraps, the frame completes.
TEST_F(HardeningTest, AGiantFontKeepsItsPenOnTheLine) {
    CWindowVisual *p_wnd = child("text", 300, 40);
    CFont *p_font = get_fonts_factory().create("arial_white", &m_world.desktop());
    ASSERT_NE(nullptr, p_font);
    p_font->set_size(16777216.0f);
    m_world.recorder().clear();
    p_wnd->get_canvas().text_out(-100, 0, CString(std::string(300, 'W').c_str()), p_font);
    int left = -200;
    for (auto const &drawn : m_world.drawn()) {
        EXPECT_LE(left, drawn.m_rect.x);
        left = drawn.m_rect.x;
    }
    ASSERT_EQ(1u, m_world.drawn().size()); // the first character covers the screen, the rest lie beyond
    EXPECT_EQ(300 * m_world.drawn()[0].m_rect.w,
              p_wnd->get_canvas().get_text_width(CString(std::string(300, 'W').c_str()), p_font, -1));
    m_world.frame();
    delete p_font;
}

// A tiny tile over a huge area draws only the tiles that the screen shows.
TEST_F(HardeningTest, TilesStopAtTheScreen) {
    CWindowVisual *p_wnd = child("tiles");
    CMaterial *p_material = m_world.colour(9, 9, 9);
    struct {
        int m_x, m_y, m_w, m_h;
        size_t mn_quads;
    } const rows[] = {
        {-3, -1, 100000000, 100000000, 161u * 121u}, // the tiles at the edges partly shown
        {300, 230, 100000000, 100000000, 10u * 5u},
        {400, 0, 100, 100, 0u},
        {0, 0, 4, 3, 2u * 2u},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_x);
        m_world.recorder().clear();
        p_wnd->get_canvas().draw_tiled(row.m_x, row.m_y, row.m_w, row.m_h, 0, 0, 1, 1, 2, 2, p_material);
        size_t quads = 0;
        for (auto const &call : m_world.recorder().calls())
            quads += call.m_op == "draw_quad";
        EXPECT_EQ(row.mn_quads, quads);
    }
    delete p_material;
}

// A row's text of any length goes back whole into a saved layout, as does a caption, without the
// contract that keys and commands keep to.
TEST_F(HardeningTest, ALongTextOfALayoutIsSavedWhole) {
    CWindow *p_box = get_windows_factory().Create(HUID("ListBox"), &m_world.desktop(), "box");
    ASSERT_TRUE(p_box);
    m_world.desktop().attach_child(p_box);
    qortest::CReportCapture capture;
    qortest::load_state(p_box, "{ name = 'box', class_name = 'ListBox', items = { item_0 = { column_0 = "
                               "string.rep('\\208\\175', 300) } } }");
    LuaPlus::LuaObject const saved = qortest::saved_state(p_box);
    LuaPlus::LuaObject const text = saved.GetByName("items").GetByName("item_0").GetByName("column_0");
    ASSERT_TRUE(text.IsString());
    EXPECT_EQ(600u, std::string(text.GetString()).size());
    EXPECT_EQ("\xD0\xAF\xD0\xAF", std::string(text.GetString()).substr(596));
    EXPECT_TRUE(capture.reports().empty());
}

// A layout that can't be written leaves both files as they were; a good export replaces both.
TEST_F(HardeningTest, AnExportReplacesBothFilesOrNeither) {
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, dir.c_str());
    qortest::write_file(dir + "/ui_material_presets.lua", "old presets");
    qortest::write_file(dir + "/blocked", "a file where a folder should be");
    {
        qortest::CReportCapture capture;
        m_world.desktop().export_layout(qorbase::FILE_CATEGORY_UI, "blocked/layout.lua");
        EXPECT_FALSE(capture.warnings().empty());
    }
    EXPECT_EQ("old presets", qortest::read_file(dir + "/ui_material_presets.lua"));
    m_world.desktop().export_layout(qorbase::FILE_CATEGORY_UI, "layout.lua");
    EXPECT_EQ(0u, qortest::read_file(dir + "/ui_material_presets.lua").find("ui_material_presets = "));
    EXPECT_EQ(0u, qortest::read_file(dir + "/layout.lua").find("ui_windows_ini = "));
    EXPECT_EQ(3u,
              std::distance(std::filesystem::directory_iterator(dir), std::filesystem::directory_iterator()));
}

// A game's window class, made by its own code's new and written against the desktop itself; the
// factory folds the case of class names, and the last registration wins.
namespace {
CWindow *create_game_window(CDesktop *_p_desktop, char const *_name) {
    return new CWindowVisual(_p_desktop, _name);
}
} // namespace

TEST_F(HardeningTest, AGameMakesWindowsOnTheLibrarysHeapAndSeesTheDesktop) {
    static_assert(std::is_same<decltype(std::declval<CWindow &>().get_desktop()), CDesktop *>::value,
                  "get_desktop gives the desktop");
    get_windows_factory().Register(HUID("GameWindow"), nullptr);
    get_windows_factory().Register(HUID("gamewindow"), &create_game_window);
    EXPECT_EQ(nullptr, get_windows_factory().Create(HUID("NeverRegistered"), &m_world.desktop(), "x"));
    CWindow *p_wnd = get_windows_factory().Create(HUID("GAMEWINDOW"), &m_world.desktop(), "game");
    ASSERT_NE(nullptr, p_wnd);
    EXPECT_EQ(1, MMGetMemoryBlockStatus(p_wnd));
    m_world.desktop().attach_child(p_wnd);
    p_wnd->get_desktop()->set_active_window(p_wnd);
    EXPECT_EQ(p_wnd, m_world.desktop().get_active_window());
}
