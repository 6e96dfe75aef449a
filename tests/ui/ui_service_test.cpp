// The user-interface service on the test host: what init does, in its order, what shutdown takes
// back, the strings file it reads, the build-version page it draws, and the commands that export,
// import and dump.
#include "ui.h"

#include "engine_interfaces.h"
#include "qor_level.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "test_host.h"
#include "test_support.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_stats_page.h"
#include "ui_string.h"
#include "ui_time_profiler.h"

#include <gtest/gtest.h>

#include <cstdio>

using namespace qorui;

namespace {

typedef std::vector<std::string> lines_t;
char const k_commands[][17] = {"ui_export", "ui_import", "print_stats_page"};
char const k_library[] = "[ui_libraries]\ngameui_library = libgameui_demo.so\n";

class ServiceTest : public ::testing::Test {
protected:
    void SetUp() override {
        qortest::use_host_data_folders();
        use_gdf(std::string("[ui]\ninit_plaque = ui_init_plaque.tga\n") + k_library);
        host().recorder().clear();
    }
    void TearDown() override {
        shutdown();
        qorbase::set_gdf_path(nullptr);
    }
    void shutdown() {
        if (m_started) service().shutdown();
        m_started = false;
    }
    // A running service is shut down first, and what it writes back (the console's geometry) goes
    // to the old file before the new one is written.
    void use_gdf(std::string const &_text) {
        shutdown();
        qorbase::set_gdf_path(nullptr);
        qorbase::set_gdf_path(qortest::write_file(m_dir + "/qor.gdf", _text).c_str());
    }
    // A fresh start; the recorder holds init's calls alone.
    void init() {
        shutdown();
        host().recorder().clear();
        service().init(false);
        m_started = true;
    }
    bool has_commands() {
        bool all = true, none = true;
        for (char const *p_name : k_commands) {
            bool const has = host().commands().has_command(p_name);
            all = all && has, none = none && !has;
        }
        EXPECT_TRUE(all || none);
        return all;
    }

    qorhost::CHost &host() { return qortest::shared_host(); }
    CUserInterface &service() { return *static_cast<CUserInterface *>(host().ui()); }

    std::string m_dir = qortest::make_temp_dir();
    bool m_started = false;
};

} // namespace

// The plaque first, straight through the renderer; then the desktop makes the materials of its two
// fonts and its pointer, and the console those of its parts, and nothing is drawn. The plaque's
// picture itself is the host's first frame.
TEST_F(ServiceTest, InitDrawsThePlaqueStraightThroughTheRenderer) {
    init();
    std::vector<qorhost::SRenderCall> const &calls = host().recorder().calls();
    std::string const sequence = host().recorder().sequence();
    std::string const plaque_and_desktop =
        "create_material begin_2d set_material draw_quad end_2d present destroy_material create_material "
        "create_material create_material";
    EXPECT_EQ(0u, sequence.find(plaque_and_desktop)) << sequence;
    for (size_t i = 10; i < calls.size(); ++i)
        EXPECT_EQ("create_material", calls[i].m_op) << i;
    EXPECT_EQ((lines_t{"ui_image", "ui_init_plaque.tga", "", "", "", ""}), calls.at(0).m_names);
    EXPECT_EQ("kursor.tga", calls.at(9).m_names[1]);
    EXPECT_EQ(calls[0].m_handle, calls[6].m_handle);

    // Without the key the plaque is the default one; without the section both readers of "ui"
    // (the plaque's and the cursor's) report it.
    for (auto const &row :
         {std::make_pair("[ui]\n[ui_libraries]\n", 0u), std::make_pair("[ui_libraries]\n", 2u)}) {
        use_gdf(row.first);
        qortest::CReportCapture capture;
        init();
        EXPECT_EQ("ui_init_plaque.tga", calls.at(0).m_names[1]);
        EXPECT_EQ(row.second, capture.asserts().size()) << row.first;
        for (std::string const &text : capture.asserts())
            EXPECT_EQ(0u, text.find("Expression:   p_sect, \nFile: ")) << text;
        // Without the game library's name init reports it and goes on.
        ASSERT_EQ(1u, capture.errors().size());
        EXPECT_EQ(0u,
                  capture.errors()[0].find("GameUI library name is not specified.\nPlease, specify parameter "
                                           "'gameui_library' in '[ui_libraries]' section of GDF file"));
        EXPECT_TRUE(has_commands());
    }
}

TEST_F(ServiceTest, InitPutsEverythingInPlaceAndShutdownTakesItBack) {
    CTimeProfiler *p_profiler =
        static_cast<CTimeProfiler *>(host().server().query_interface(qor_uid::TIME_PROFILER, 1));
    p_profiler->disable();
    host().commands().unregister_command("gameui_demo");
    host().vars().set_var("scr_resx", "1600");
    init();
    host().vars().set_var("scr_resx", "1024"); // read once
    EXPECT_EQ(1600, service().get_screen_w());
    EXPECT_TRUE(p_profiler->is_enabled());
    EXPECT_TRUE(host().commands().has_command("gameui_demo")); // the game library, loaded through the server
    EXPECT_EQ(1u, host().input().get_pointer_listeners_count());
    EXPECT_EQ(1u, host().input().get_key_listeners_count());
    EXPECT_TRUE(has_commands());

    // The desktop: 1024 by 768 whatever the screen, its fonts, its pointer, the engine's input.
    CDesktop *p_desktop = service().get_desktop();
    ASSERT_NE(nullptr, p_desktop);
    EXPECT_EQ(1024, p_desktop->get_w());
    EXPECT_EQ(768, p_desktop->get_h());
    EXPECT_STREQ("courier", p_desktop->get_font(FNT_NAME_FIXED)->get_name());
    service().on_pointer_move(vec2_t{10, -20});
    EXPECT_EQ(522, p_desktop->get_pointer_pos().x);
    EXPECT_EQ(364, p_desktop->get_pointer_pos().y);
    service().update(16);
    IStatsPage *p_ui = service().get_stats_page("ui"); // made at the first update, filled while shown
    ASSERT_NE(nullptr, p_ui);
    p_ui->show(true);
    service().update(16);
    p_ui->show(false);
    EXPECT_EQ(0u, std::string(static_cast<CStatsPage *>(p_ui)->get_text().get_string(0)->get_c())
                      .find("<color 255 255 255 255>Windows: "));

    shutdown();
    EXPECT_EQ(0u, host().input().get_pointer_listeners_count());
    EXPECT_EQ(0u, host().input().get_key_listeners_count());
    EXPECT_FALSE(has_commands());
    host().recorder().clear();
    service().draw(); // no desktop: nothing reaches the renderer
    service().on_pointer_move(vec2_t{1, 1});
    EXPECT_TRUE(host().recorder().calls().empty());

    // A second registration keeps the one service.
    IInterfaceBase *p_first = host().server().query_interface(qor_uid::USER_INTERFACE, 1);
    EXPECT_EQ(0, RegisterInterface(&host().server()));
    EXPECT_EQ(p_first, host().server().query_interface(qor_uid::USER_INTERFACE, 1));
}

// ---------------------------------------------------------------------------------------------
// The commands
// ---------------------------------------------------------------------------------------------

namespace {

// Layouts and presets go to a folder of the test's own, not to the data folder.
class ServiceCommandsTest : public ServiceTest {
protected:
    void SetUp() override {
        ServiceTest::SetUp();
        reinit();
    }
    void run(char const *_p_line) { host().commands().run_line(_p_line); }
    // A fresh desktop, made with the interface data of the data folder.
    void reinit() {
        qortest::use_host_data_folders();
        init();
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_layouts.c_str());
    }
    std::string log_since(unsigned _first) {
        std::string text;
        for (unsigned i = _first; i < host().log().get_next_index(); ++i)
            text += host().log().get_message_text(i) + "\n";
        return text;
    }
    // "<output folder>/stats_<page>_<level>_<_number>.txt"
    std::string dump_path(IStatsPage *_p_page, char const *_number) {
        SLevelDescription description = {nullptr, nullptr, nullptr, nullptr};
        host().level().get_description(description);
        return host().options().m_out + "/stats_" + _p_page->get_name() + "_" +
               (description.mp_name ? description.mp_name : "") + "_" + _number + ".txt";
    }
    // The page dumped while in view; the text of the file with that number.
    std::string dump(IStatsPage *_p_page, char const *_number) {
        _p_page->show(true);
        run("print_stats_page");
        _p_page->show(false);
        return qortest::read_file(dump_path(_p_page, _number));
    }

    std::string m_layouts = qortest::make_temp_dir();
};

} // namespace

TEST_F(ServiceCommandsTest, AnExportedLayoutImportsBackToTheSameTree) {
    qortest::CReportCapture capture;
    run("ui_export");
    run("ui_import   ");
    EXPECT_EQ((lines_t{"Use of command 'ui_export':\nui_export [filename]",
                       "Use of command 'ui_import':\nui_import [filename]"}),
              capture.warnings());
    EXPECT_EQ("", qortest::read_file(m_layouts + "/ui_material_presets.lua")); // nothing written

    CDesktop *p_desktop = service().get_desktop();
    CWindowVisual *p_panel = new CWindowVisual(p_desktop, "panel");
    p_desktop->attach_child(p_panel);
    p_panel->set_pos(30, 40);
    p_panel->set_can_drag(true);
    CMaterial *p_material = p_desktop->create_material();
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(rgba_t(10, 20, 30, 40));
    p_panel->add_material(MAT_NAME_NORMAL, p_material);
    run("ui_export \"my layout.lua\" ignored");
    EXPECT_TRUE(lua_machine().GetGlobals().GetByName("ui_windows_ini").IsNil());

    // A fresh desktop takes the layout back: the panel is made again with its keys, and the
    // desktop gets its background.
    reinit();
    run("ui_import \"my layout.lua\"");
    CWindowVisual *p_loaded =
        static_cast<CWindowVisual *>(service().get_desktop()->get_child("panel", "WindowVisual", true));
    ASSERT_NE(nullptr, p_loaded);
    EXPECT_EQ(30, p_loaded->get_pos().x);
    EXPECT_TRUE(p_loaded->is_can_drag());
    EXPECT_EQ(rgba_t(10, 20, 30, 40), p_loaded->get_material(MAT_NAME_NORMAL)->get_color());
    EXPECT_NE(nullptr, service().get_desktop()->get_material(MAT_NAME_NORMAL));
}

TEST_F(ServiceCommandsTest, TheStatsPageInViewIsDumpedToTheLowestFreeFile) {
    unsigned const first = host().log().get_next_index();
    run("print_stats_page");
    EXPECT_NE(std::string::npos, log_since(first).find("No current stats page"));

    IStatsPage *p_page = service().create_stats_page("dump");
    p_page->print(0, "first");
    p_page->set_color(0, 1, 0, 1);
    p_page->print(3, "x");
    unsigned const second = host().log().get_next_index();
    EXPECT_EQ("first\n\n\nx\n", dump(p_page, "0000")); // without the colour tags
    EXPECT_NE(std::string::npos, log_since(second).find("Out file: 'stats_dump_"));

    // The lowest free number: a deleted one is used again, taken ones are passed over.
    qortest::write_file(dump_path(p_page, "0001"), "kept\n");
    std::remove(dump_path(p_page, "0000").c_str());
    EXPECT_EQ("first\n\n\nx\n", dump(p_page, "0000"));
    EXPECT_EQ("first\n\n\nx\n", dump(p_page, "0002"));
    EXPECT_EQ("kept\n", qortest::read_file(dump_path(p_page, "0001")));
}

// ---------------------------------------------------------------------------------------------
// Strings and the build-version page
// ---------------------------------------------------------------------------------------------

namespace {

// The interface data in the test's own folder, with the fonts of the data folder.
class ServiceStringsTest : public ServiceTest {
protected:
    void SetUp() override {
        ServiceTest::SetUp();
        qortest::write_file(m_dir + "/fonts.lua",
                            qortest::read_file(qortest::source_dir() + "/data/ui/fonts.lua"));
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
    }
    // Init with "strings_filename = _name" (none for null) and a strings file of those bytes.
    void init_strings(char const *_name, std::string const &_bytes = "") {
        qortest::write_file(m_dir + "/test.lang", _bytes);
        use_gdf("[ui]\n" + (_name ? std::string("strings_filename = ") + _name + "\n" : "") + k_library);
        init();
    }
    std::string text(char const *_key) { return CString(service().get_local_string(_key)).get_c(); }
    std::string key(char const *_text) {
        char const *p_key = service().get_local_key(CString(_text).c_str());
        return p_key ? p_key : "(null)";
    }
};

} // namespace

TEST_F(ServiceStringsTest, TheTableIsLookedUpBothWaysKeptWhenAFileCannotBeOpenedAndRussianByDefault) {
    init_strings("test.lang", "B_SECOND \"same\"\nA_FIRST \"same\"\nOTHER \"Other\"\n");
    EXPECT_EQ("Other", text("OTHER"));
    EXPECT_EQ("OTHER", key("Other"));
    EXPECT_EQ("A_FIRST", key("same")); // in key order, not file order
    EXPECT_EQ("(null)", key("other")); // exact: no folding of case

    qortest::CReportCapture capture;
    init_strings("missing.lang");
    EXPECT_EQ((lines_t{"Cannot open 'missing.lang'.\nPlease specify a valid file name as a value for "
                       "'strings_filename' parameter in GDF"}),
              capture.warnings());
    EXPECT_EQ("Other", text("OTHER"));
    EXPECT_NE(nullptr, service().get_desktop()); // init went on
    // Without a name, the Russian file of the data.
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (qortest::source_dir() + "/data/ui").c_str());
    init_strings(nullptr);
    EXPECT_EQ("\xD0\x9E\xD0\x9A", text("DEMO_OK"));
    EXPECT_EQ(1u, capture.warnings().size());
}

// Shown, the page follows the desktop's frame in a 2D batch of its own: its two lines in the fixed
// font, whose size is given back. Where it stands shows in the host's picture of it.
TEST_F(ServiceStringsTest, TheBuildVersionPageIsDrawnAfterTheDesktopWhenShown) {
    init_strings("test.lang");
    service().draw(); // the page is made at the first drawn frame
    CStatsPage *p_page = static_cast<CStatsPage *>(service().get_stats_page("build_version"));
    ASSERT_NE(nullptr, p_page);
    EXPECT_FALSE(p_page->is_show());
    host().recorder().clear();
    service().draw();
    size_t const desktop_calls = host().recorder().calls().size();
    CFont *p_font = service().get_desktop()->get_font(FNT_NAME_FIXED);
    p_font->set_size(64); // the data gives it the page's own size
    p_page->show(true);
    host().recorder().clear();
    service().draw();
    p_page->show(false);
    std::vector<qorhost::SRenderCall> const &calls = host().recorder().calls();
    ASSERT_GT(calls.size(), desktop_calls);
    EXPECT_EQ("begin_2d", calls[desktop_calls].m_op);
    size_t quads = 0;
    for (size_t i = desktop_calls; i < calls.size(); ++i)
        quads += calls[i].m_op == "draw_quad";
    EXPECT_EQ(std::string("qorui 1.0 (demo build)203").size(), quads);
    EXPECT_EQ(64.0f, p_font->get_size());
}
