// The user-interface service on the test host: what init does, in its order, and what shutdown
// takes back.
#include "ui.h"

#include "ui_desktop.h"
#include "ui_font.h"

#include "host.h"
#include "qor_level.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "engine_interfaces.h"
#include "ui_material.h"
#include "test_support.h"
#include "test_host.h"
#include "ui_time_profiler.h"

#include <gtest/gtest.h>

#include <cstdio>
#include <fstream>

using namespace qorui;

namespace {

// One host for the whole test program, shared with the other suites that drive the service.
using qortest::shared_host;

class ServiceTest : public ::testing::Test {
protected:
    void SetUp() override {
        qortest::use_host_data_folders();
        m_dir = qortest::make_temp_dir();
        use_gdf(
            "[ui]\ninit_plaque = ui_init_plaque.tga\n[ui_libraries]\ngameui_library = libgameui_demo.so\n");
        host().recorder().clear();
    }
    void TearDown() override {
        if (m_initialised) service().shutdown();
        qorbase::set_gdf_path(nullptr);
    }

    void use_gdf(std::string const &_text) {
        qortest::write_file(m_dir + "/qor.gdf", _text);
        qorbase::set_gdf_path((m_dir + "/qor.gdf").c_str());
    }
    void init(bool _hide_console = false) {
        service().init(_hide_console);
        m_initialised = true;
    }

    qorhost::CHost &host() { return shared_host(); }
    CUserInterface &service() { return *static_cast<CUserInterface *>(host().ui()); }

    std::string m_dir;
    bool m_initialised = false;
};

} // namespace

TEST_F(ServiceTest, InitDrawsThePlaqueStraightThroughTheRenderer) {
    init();
    std::vector<qorhost::SRenderCall> const &calls = host().recorder().calls();
    // The plaque first; then the desktop makes the materials of its two fonts and its pointer.
    EXPECT_EQ(
        "create_material begin_2d set_material draw_quad end_2d present destroy_material create_material "
        "create_material create_material",
        host().recorder().sequence());
    ASSERT_EQ(10u, calls.size());
    EXPECT_EQ("kursor.tga", calls[9].m_names[1]);
    EXPECT_EQ((std::vector<std::string>{"ui_image", "ui_init_plaque.tga", "", "", "", ""}), calls[0].m_names);
    int const material = calls[0].m_handle;
    EXPECT_EQ(material, calls[2].m_handle);
    EXPECT_EQ(material, calls[6].m_handle);

    // Full screen in device coordinates, each corner with its texture corner, opaque white.
    qorhost::SRenderCall const &quad = calls[3];
    float const expected[4][4] = {{-1, 1, 0, 0}, {-1, -1, 0, 1}, {1, -1, 1, 1}, {1, 1, 1, 0}};
    for (int i = 0; i < 4; ++i) {
        EXPECT_EQ(expected[i][0], quad.m_points[i].x) << "vertex " << i;
        EXPECT_EQ(expected[i][1], quad.m_points[i].y) << "vertex " << i;
        EXPECT_EQ(expected[i][2], quad.m_uvs[i].x) << "vertex " << i;
        EXPECT_EQ(expected[i][3], quad.m_uvs[i].y) << "vertex " << i;
        EXPECT_EQ(rgba_t(255, 255, 255, 255), quad.m_colours[i]) << "vertex " << i;
    }
}

TEST_F(ServiceTest, PlaqueNameDefaultsWithoutItsKeyAndWithoutItsSection) {
    use_gdf("[ui]\n[ui_libraries]\ngameui_library = libgameui_demo.so\n");
    init();
    EXPECT_EQ("ui_init_plaque.tga", host().recorder().calls()[0].m_names[1]);
    service().shutdown();
    m_initialised = false;

    use_gdf("[ui_libraries]\ngameui_library = libgameui_demo.so\n");
    host().recorder().clear();
    qortest::CReportCapture capture;
    init();
    EXPECT_EQ("ui_init_plaque.tga", host().recorder().calls()[0].m_names[1]);
    // Without the section both readers of "ui" report it, the plaque's and the cursor's.
    std::vector<std::string> const contracts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(2u, contracts.size());
    EXPECT_EQ(0u, contracts[0].find("Expression:   p_sect, \nFile: ")) << contracts[0];
    EXPECT_EQ(0u, contracts[1].find("Expression:   p_sect, \nFile: ")) << contracts[1];
}

TEST_F(ServiceTest, InitPutsListenersAndCommandsInPlaceAndShutdownTakesThemBack) {
    init();
    EXPECT_EQ(1u, host().input().get_pointer_listeners_count());
    EXPECT_EQ(1u, host().input().get_key_listeners_count());
    for (char const *name : {"ui_export", "ui_import", "print_stats_page"})
        EXPECT_TRUE(host().commands().has_command(name)) << name;

    service().shutdown();
    m_initialised = false;
    EXPECT_EQ(0u, host().input().get_pointer_listeners_count());
    EXPECT_EQ(0u, host().input().get_key_listeners_count());
    for (char const *name : {"ui_export", "ui_import", "print_stats_page"})
        EXPECT_FALSE(host().commands().has_command(name)) << name;
}

TEST_F(ServiceTest, InitSwitchesTheTimeProfilerOnThroughTheServer) {
    CTimeProfiler *p_profiler =
        static_cast<CTimeProfiler *>(host().server().query_interface(qor_uid::TIME_PROFILER, 1));
    ASSERT_NE(nullptr, p_profiler);
    p_profiler->disable();
    init();
    EXPECT_TRUE(p_profiler->is_enabled());
}

TEST_F(ServiceTest, InitReadsTheScreenSizeOnce) {
    host().vars().set_var("scr_resx", "1600");
    host().vars().set_var("scr_resy", "1200");
    init();
    host().vars().set_var("scr_resx", "640");
    EXPECT_EQ(1600, service().get_screen_w());
    EXPECT_EQ(1200, service().get_screen_h());
    host().vars().set_var("scr_resx", "1024");
    host().vars().set_var("scr_resy", "768");
}

TEST_F(ServiceTest, MissingGameLibraryIsReportedAndInitGoesOn) {
    use_gdf("[ui]\n[ui_libraries]\n");
    qortest::CReportCapture capture;
    init();
    std::vector<std::string> const errors = capture.texts(qordebug::REPORT_ERROR);
    ASSERT_EQ(1u, errors.size());
    EXPECT_EQ("GameUI library name is not specified.\nPlease, specify parameter 'gameui_library' in "
              "'[ui_libraries]' section of GDF file",
              errors[0]);
    EXPECT_TRUE(host().commands().has_command("ui_export")); // the later steps ran
}

TEST_F(ServiceTest, GameLibraryIsLoadedThroughTheServer) {
    host().commands().unregister_command("gameui_demo");
    init();
    EXPECT_TRUE(host().commands().has_command("gameui_demo"));
}

TEST_F(ServiceTest, RegisterInterfaceTwiceKeepsOneService) {
    IInterfaceBase *p_first = host().server().query_interface(qor_uid::USER_INTERFACE, 1);
    EXPECT_EQ(0, RegisterInterface(&host().server())); // already there
    EXPECT_EQ(p_first, host().server().query_interface(qor_uid::USER_INTERFACE, 1));
}

TEST_F(ServiceTest, InitMakesTheDesktopAndFramesDrawIt) {
    init();
    CDesktop *p_desktop = service().get_desktop();
    ASSERT_NE(nullptr, p_desktop);
    EXPECT_EQ(1024, p_desktop->get_w());
    EXPECT_EQ(768, p_desktop->get_h());
    EXPECT_FALSE(p_desktop->is_hidden());
    ASSERT_NE(nullptr, p_desktop->get_font(FNT_NAME_DEFAULT));
    EXPECT_STREQ("arial_white", p_desktop->get_font(FNT_NAME_DEFAULT)->get_name());
    EXPECT_STREQ("courier", p_desktop->get_font(FNT_NAME_FIXED)->get_name());
    EXPECT_EQ(32, p_desktop->get_pointer().get_w());
    EXPECT_EQ(1024.0f / 1024, service().get_scale_w());
    EEventType id = EVENT_DRAW;
    EXPECT_TRUE(CWndEvent::get_id_by_name("EVENT_HIGHLIGHTED", id));
    EXPECT_EQ(EVENT_HIGHLIGHTED, id);

    // Input reaches the desktop: the pointer moves from the centre.
    service().on_pointer_move(vec2_t{10, -20});
    EXPECT_EQ(522, p_desktop->get_pointer_pos().x);
    EXPECT_EQ(364, p_desktop->get_pointer_pos().y);

    host().recorder().clear();
    service().update(16);
    service().draw();
    std::string const sequence = host().recorder().sequence();
    EXPECT_EQ(0u, sequence.find("begin_2d")) << sequence;
    EXPECT_NE(std::string::npos, sequence.find("draw_quad")) << sequence; // the pointer at least

    service().shutdown();
    m_initialised = false;
    EXPECT_EQ(nullptr, service().get_desktop());
    host().recorder().clear();
    service().draw(); // no desktop: nothing reaches the renderer
    service().on_pointer_move(vec2_t{1, 1});
    EXPECT_TRUE(host().recorder().calls().empty());
    EXPECT_EQ(1.0f, service().get_scale_w());
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
        m_ui_root = qorbase::get_category_root(16);
        init();
        m_layouts = qortest::make_temp_dir();
        qorbase::set_category_root(16, m_layouts.c_str());
    }
    void TearDown() override {
        qorbase::set_category_root(16, m_ui_root.c_str());
        ServiceTest::TearDown();
    }
    void run(char const *_p_line) { host().commands().run_line(_p_line); }
    // A fresh desktop, made with the interface data of the data folder.
    void reinit() {
        service().shutdown();
        qorbase::set_category_root(16, m_ui_root.c_str());
        init();
        qorbase::set_category_root(16, m_layouts.c_str());
    }
    std::string log_since(unsigned _first) {
        std::string text;
        for (unsigned i = _first; i < host().log().get_next_index(); ++i)
            text += host().log().get_message_text(i) + "\n";
        return text;
    }

    std::string m_ui_root;
    std::string m_layouts;
};

} // namespace

TEST_F(ServiceCommandsTest, ExportAndImportWithoutAFileNameExplainTheirUse) {
    qortest::CReportCapture capture;
    run("ui_export");
    run("ui_import   ");
    EXPECT_EQ((std::vector<std::string>{"Use of command 'ui_export':\nui_export [filename]",
                                        "Use of command 'ui_import':\nui_import [filename]"}),
              capture.texts(qordebug::REPORT_WARNING));
    EXPECT_FALSE(std::ifstream(m_layouts + "/ui_material_presets.lua").good()); // nothing written
}

TEST_F(ServiceCommandsTest, AnExportedLayoutImportsBackToTheSameTree) {
    CDesktop *p_desktop = service().get_desktop();
    CWindowVisual *p_panel = new CWindowVisual(p_desktop, "panel");
    p_desktop->attach_child(p_panel);
    p_panel->set_pos(30, 40);
    p_panel->set_size(200, 100);
    p_panel->set_can_drag(true);
    CMaterial *p_material = p_desktop->create_material();
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(rgba_t(10, 20, 30, 40));
    p_panel->add_material(MAT_NAME_NORMAL, p_material);
    run("ui_export \"my layout.lua\" ignored");
    std::string const first = qortest::read_file(m_layouts + "/my layout.lua");
    EXPECT_NE(std::string::npos, first.find("ui_windows_ini = {")) << first;
    EXPECT_NE(std::string::npos,
              qortest::read_file(m_layouts + "/ui_material_presets.lua").find("ui_material_presets"));
    EXPECT_TRUE(lua_machine().GetGlobals().GetByName("ui_windows_ini").IsNil());
    EXPECT_TRUE(lua_machine().GetGlobals().GetByName("ui_material_presets").IsNil());

    // A fresh desktop takes the layout back: the panel is made again with its keys.
    reinit();
    qortest::CReportCapture capture; // the default background's texture isn't in the test's folders
    run("ui_import \"my layout.lua\"");
    CWindow *p_loaded = service().get_desktop()->get_child("panel", "WindowVisual", true);
    ASSERT_NE(nullptr, p_loaded);
    EXPECT_EQ(30, p_loaded->get_pos().x);
    EXPECT_TRUE(p_loaded->is_can_drag());
    CMaterial *p_loaded_material = static_cast<CWindowVisual *>(p_loaded)->get_material(MAT_NAME_NORMAL);
    ASSERT_NE(nullptr, p_loaded_material);
    EXPECT_EQ(rgba_t(10, 20, 30, 40), p_loaded_material->get_color());
    EXPECT_FALSE(lua_machine().GetGlobals().GetByName("ui_windows_ini").IsNil());
    EXPECT_NE(nullptr, service().get_desktop()->get_material(MAT_NAME_NORMAL)); // the background

    // Export, import into a fresh desktop, export again: the two files are the same, byte for byte.
    run("ui_export second.lua");
    reinit();
    run("ui_import second.lua");
    run("ui_export third.lua");
    EXPECT_EQ(qortest::read_file(m_layouts + "/second.lua"), qortest::read_file(m_layouts + "/third.lua"));
}

TEST_F(ServiceCommandsTest, TheStatsPageInViewIsDumpedToTheLowestFreeFile) {
    unsigned const first = host().log().get_next_index();
    run("print_stats_page");
    EXPECT_NE(std::string::npos, log_since(first).find("No current stats page"));

    IStatsPage *p_page = service().create_stats_page("dump");
    p_page->clear();
    p_page->print(0, "first");
    p_page->set_color(0, 1, 0, 1);
    p_page->print(3, "x");
    p_page->show(true);
    unsigned const second = host().log().get_next_index();
    run("print_stats_page");
    run("print_stats_page");
    p_page->show(false);
    std::string const out = host().options().m_out;
    std::string level_name;
    {
        SLevelDescription description = {nullptr, nullptr, nullptr, nullptr};
        host().level().get_description(description);
        level_name = description.mp_name ? description.mp_name : "";
    }
    std::string const file0 = out + "/stats_dump_" + level_name + "_0000.txt";
    EXPECT_EQ("first\n\n\nx\n", qortest::read_file(file0));
    EXPECT_EQ("first\n\n\nx\n", qortest::read_file(out + "/stats_dump_" + level_name + "_0001.txt"));
    std::string const log = log_since(second);
    EXPECT_NE(std::string::npos, log.find("Stats page: 'dump'"));
    EXPECT_NE(std::string::npos, log.find("Out file: 'stats_dump_" + level_name + "_0000.txt'"));
    EXPECT_EQ(std::string::npos, log.find("<color"));

    // A deleted 0000 is used again.
    std::remove(file0.c_str());
    p_page->show(true);
    run("print_stats_page");
    p_page->show(false);
    EXPECT_EQ("first\n\n\nx\n", qortest::read_file(file0));
}

TEST_F(ServiceCommandsTest, ADumpTakesTheNumberBehindTheTakenOnes) {
    SLevelDescription description = {nullptr, nullptr, nullptr, nullptr};
    host().level().get_description(description);
    std::string const stem =
        host().options().m_out + "/stats_full_" + (description.mp_name ? description.mp_name : "");
    for (int i = 0; i <= 5; ++i)
        qortest::write_file(stem + "_000" + std::to_string(i) + ".txt", "kept\n");
    IStatsPage *p_page = service().create_stats_page("full");
    p_page->print(1, "line");
    p_page->show(true);
    run("print_stats_page");
    p_page->show(false);
    EXPECT_EQ("\nline\n", qortest::read_file(stem + "_0006.txt"));
    EXPECT_EQ("kept\n", qortest::read_file(stem + "_0005.txt"));
}
