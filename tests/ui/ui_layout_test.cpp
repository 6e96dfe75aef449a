// Layout tables of windows: save, load over existing windows, creation by the factory, import of
// files, and bad tables.
#include "ui_window.h"

#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "test_desktop.h"
#include "test_support.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace qorui;

namespace {

class LayoutTest : public ::testing::Test {
protected:
    void SetUp() override {
        mp_root = new CWindow(&m_desktop, "root");
        CWindow *p_panel = new CWindow(&m_desktop, "panel");
        mp_root->attach_child(p_panel);
        p_panel->set_pos(10, 20);
        p_panel->set_size(300, 200);
        p_panel->set_can_drag(true);
        p_panel->set_alignment(ALIGNMENT_CENTER);
        CWindow *p_ok = new CWindow(&m_desktop, "ok");
        p_panel->attach_child(p_ok);
        p_ok->set_size(80, 24);
        p_ok->set_is_modal(true);
        p_ok->set_auto_delete(true);
    }
    void TearDown() override { delete mp_root; }

    LuaPlus::LuaObject save(CWindow *_p_wnd) {
        LuaPlus::LuaObject table;
        table.AssignNewTable(&lua_machine());
        _p_wnd->save_state(table);
        return table;
    }

    static std::string dumped(LuaPlus::LuaObject const &_table) {
        std::ostringstream out;
        _table.dump("ui_windows_ini", out);
        return out.str();
    }

    qortest::CTestDesktop m_desktop;
    CWindow *mp_root = nullptr;
};

} // namespace

TEST_F(LayoutTest, SaveWritesTheKeysOfAWindowAndItsChildren) {
    LuaPlus::LuaObject const table = save(mp_root);
    EXPECT_STREQ("root", table.GetByName("name").GetString());
    EXPECT_STREQ("Window", table.GetByName("class_name").GetString());
    // A child goes behind everything the table holds: after the ten keys of a window, at 11.
    EXPECT_EQ(11, table.GetTableCount());
    LuaPlus::LuaObject const panel = table.GetByIndex(11);
    ASSERT_TRUE(panel.IsTable());
    EXPECT_STREQ("panel", panel.GetByName("name").GetString());
    EXPECT_STREQ("ALIGNMENT_CENTER", panel.GetByName("alignment").GetString());
    EXPECT_EQ(300, panel.GetByName("size").GetByIndex(1).GetInteger());
    EXPECT_TRUE(panel.GetByName("can_drag").GetBoolean());
    LuaPlus::LuaObject const ok = panel.GetByIndex(11);
    EXPECT_TRUE(ok.GetByName("is_modal").GetBoolean());
    EXPECT_TRUE(ok.GetByName("auto_delete").GetBoolean());
    EXPECT_FALSE(ok.GetByName("can_drag").GetBoolean());
}

TEST_F(LayoutTest, LoadingIntoAFreshTreeCreatesWhatIsMissingAndLoadingTwiceNothingMore) {
    LuaPlus::LuaObject table = save(mp_root);
    std::string const first = dumped(table);

    CWindow fresh(&m_desktop, "root");
    fresh.load_state(table);
    fresh.load_state(table);
    ASSERT_EQ(1u, fresh.get_children_count());
    CWindow *p_panel = fresh.get_child("panel", "Window", true);
    ASSERT_NE(nullptr, p_panel);
    EXPECT_EQ(1u, p_panel->get_children_count());
    EXPECT_TRUE(p_panel->is_can_drag());
    EXPECT_FALSE(p_panel->is_hidden());
    CWindow *p_ok = p_panel->get_child("ok", nullptr, true);
    ASSERT_NE(nullptr, p_ok);
    EXPECT_TRUE(p_ok->is_always_on_top());
    EXPECT_EQ(80, p_ok->get_w());
    EXPECT_EQ(first, dumped(save(&fresh)));
}

TEST_F(LayoutTest, AbsentAndWronglyTypedKeysLeaveValuesAlone) {
    lua_machine().DoString(
        "layout_probe = { name = 'root', class_name = 'Window', pos = 5, size = { 7.9, -3.7 },"
        " can_drag = 'yes', alignment = 'alignment_client', is_modal = 1 }");
    LuaPlus::LuaObject table = lua_machine().GetGlobals().GetByName("layout_probe");
    mp_root->set_pos(3, 4);
    mp_root->load_state(table);
    EXPECT_EQ(3, mp_root->get_pos().x);
    EXPECT_EQ(7, mp_root->get_w()); // truncated toward zero
    EXPECT_EQ(0, mp_root->get_h());
    EXPECT_FALSE(mp_root->is_can_drag());
    EXPECT_EQ(ALIGNMENT_NONE, mp_root->get_alignment());
    EXPECT_FALSE(mp_root->is_modal());
}

TEST_F(LayoutTest, ATableForAnotherWindowIsAContractFailure) {
    qortest::CReportCapture capture;
    LuaPlus::LuaObject table = save(mp_root);
    CWindow other(&m_desktop, "other");
    other.load_state(table);
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos, capture.texts(qordebug::REPORT_ASSERT)[0].find(
                                     "strcmp(_lo_table.GetByName(\"name\").GetString(), get_name()) == 0"));
}

TEST_F(LayoutTest, UnknownClassesAndNamesThatDifferInClassAreHandledByTheFactory) {
    lua_machine().DoString(
        "layout_probe = { name = 'root', class_name = 'Window',"
        " { name = 'ghost', class_name = 'NoSuchClass', { name = 'inner', class_name = 'Window' } },"
        " { name = 'console', class_name = 'Console' },"
        " { name = 'panel', class_name = 'WINDOW' } }"); // hashes fold case
    LuaPlus::LuaObject table = lua_machine().GetGlobals().GetByName("layout_probe");
    qortest::CReportCapture capture;
    mp_root->load_state(table);
    EXPECT_EQ(nullptr, mp_root->get_child("ghost", nullptr, false));
    EXPECT_EQ(nullptr, mp_root->get_child("inner", nullptr, false));
    EXPECT_EQ(nullptr, mp_root->get_child("console", nullptr, false));
    // "WINDOW" isn't the class name "Window": the panel isn't found and a second one is made, by
    // the same hash, whose own load then finds the class name differing.
    EXPECT_EQ(2u, mp_root->get_children_count());
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
}

TEST(WindowsFactory, CreatesOnlyRegisteredClassesAndTheLastRegistrationWins) {
    qortest::CTestDesktop desktop;
    EXPECT_EQ(nullptr, get_windows_factory().Create(HUID("NeverRegistered"), &desktop, "x"));
    CWindow *p_window = get_windows_factory().Create(HUID("Window"), &desktop, "made");
    ASSERT_NE(nullptr, p_window);
    EXPECT_STREQ("made", p_window->get_name());
    EXPECT_EQ(nullptr, p_window->get_parent());
    delete p_window;

    static int s_made = 0;
    window_creator_t const counting = [](IWindowDesktop *p_desktop, char const *p_name) -> CWindow * {
        ++s_made;
        return new CWindow(p_desktop, p_name);
    };
    get_windows_factory().Register(HUID("TestCounted"), nullptr);
    get_windows_factory().Register(HUID("testcounted"), counting);
    delete get_windows_factory().Create(HUID("TESTCOUNTED"), &desktop, "y");
    EXPECT_EQ(1, s_made);
}

TEST_F(LayoutTest, ImportRunsThePresetsAndTheLayoutFromTheUiFolder) {
    std::string const dir = qortest::make_temp_dir();
    qorbase::set_category_root(16, dir.c_str());
    qortest::write_file(dir + "/layout.lua",
                        "ui_windows_ini = { name = 'root', class_name = 'Window',"
                        " size = { 640, 480 },"
                        " { name = 'panel', class_name = 'Window', alignment = 'ALIGNMENT_CLIENT' } }");
    qortest::CReportCapture capture;
    mp_root->import(0, "layout.lua");
    // Without a presets file the import says so and goes on.
    EXPECT_EQ((std::vector<std::string>{"UI: File 'ui_material_presets.lua' not found"}),
              capture.texts(qordebug::REPORT_ERROR));
    CWindow *p_panel = mp_root->get_child("panel", nullptr, true);
    ASSERT_NE(nullptr, p_panel);
    EXPECT_EQ(640, p_panel->get_w());
    EXPECT_EQ(0, p_panel->get_pos().x);

    // A layout that fails or sets nothing changes nothing.
    qortest::write_file(dir + "/ui_material_presets.lua", "ui_material_presets = {}");
    qortest::write_file(dir + "/broken.lua", "ui_windows_ini = { name = ");
    capture.clear();
    mp_root->import(0, "broken.lua");
    mp_root->import(0, "missing.lua");
    EXPECT_TRUE(capture.texts(qordebug::REPORT_ERROR).empty());
    EXPECT_EQ(640, mp_root->get_w());
    EXPECT_TRUE(lua_machine().GetGlobals().GetByName("ui_windows_ini").IsNil());
}
