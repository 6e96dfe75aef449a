// Materials over the render bridge and the host's recording renderer: handles, clones, and the
// layout tables with and without presets.
#include "ui_material.h"

#include "engine_interfaces.h"
#include "qorscriptsystem.h"
#include "recording_renderer.h"
#include "test_desktop.h"
#include "test_support.h"
#include "ui_render.h"

#include <gtest/gtest.h>

#include <sstream>

using namespace qorui;

namespace {

using qortest::CBridgeMaterial;

class MaterialTest : public ::testing::Test {
protected:
    void SetUp() override {
        qortest::CReportCapture quiet; // the bridge asks for the screen size, which may be absent here
        m_render.init(&m_recorder);
        m_recorder.clear();
        lua_machine().DoString("ui_material_presets = nil");
    }

    LuaPlus::LuaObject table(char const *_p_chunk) {
        lua_machine().DoString((std::string("material_probe = ") + _p_chunk).c_str());
        return lua_machine().GetGlobals().GetByName("material_probe");
    }

    static std::string dumped(LuaPlus::LuaObject const &_table) {
        std::ostringstream out;
        _table.dump("m", out);
        return out.str();
    }

    qorhost::CRecordingRenderer m_recorder;
    CRender m_render;
};

} // namespace

TEST_F(MaterialTest, InitMakesAHandleFromTheNamesAndResetGivesItBack) {
    CBridgeMaterial material(&m_render);
    EXPECT_EQ(-1, material.get_material_handle());
    material.reset(); // nothing to give back
    material.init("ui_image", "font.tga", nullptr, nullptr, nullptr, nullptr, true, false);
    ASSERT_EQ("create_material", m_recorder.sequence());
    EXPECT_EQ((std::vector<std::string>{"ui_image", "font.tga", "", "", "", ""}),
              m_recorder.calls()[0].m_names);
    int const handle = material.get_material_handle();
    EXPECT_NE(-1, handle);
    material.reset();
    EXPECT_EQ(-1, material.get_material_handle());
    material.init();
    EXPECT_EQ("create_material destroy_material create_material", m_recorder.sequence());
    EXPECT_EQ(handle, m_recorder.calls()[1].m_handle);
}

TEST_F(MaterialTest, AClonePaintsTheSamePictureWithAHandleOfItsOwn) {
    CBridgeMaterial source(&m_render);
    source.load_state(
        table("{ diffuse_texture = 'a.tga', material_template = 'ui_image', pos = { 0.25, 0.5 },"
              " bordered = true, border_left = 0.1, color = { r = 1, g = 2, b = 3, a = 4 } }"));
    CMaterial *p_clone = source.clone();
    EXPECT_NE(source.get_material_handle(), p_clone->get_material_handle());
    EXPECT_NE(-1, p_clone->get_material_handle());
    EXPECT_FLOAT_EQ(0.25f, p_clone->get_tex_x());
    EXPECT_EQ(rgba_t(1, 2, 3, 4), p_clone->get_color());
    EXPECT_FALSE(p_clone->get_bordered()); // a clone is never a nine-patch
    int const clone_handle = p_clone->get_material_handle();
    delete p_clone;
    ASSERT_EQ("destroy_material", m_recorder.calls().back().m_op);
    EXPECT_EQ(clone_handle, m_recorder.calls().back().m_handle);
}

TEST_F(MaterialTest, OnlyKeysOfTheRightTypeAreRead) {
    CBridgeMaterial material(&m_render);
    material.load_state(table("{ size = { 0.5, 0.5 } }"));
    EXPECT_FLOAT_EQ(0.5f, material.get_tex_w());
    EXPECT_EQ(rgba_t(255, 255, 255, 255), material.get_color());
    EXPECT_EQ("", m_recorder.calls().at(0).m_names.at(0)); // the template of the empty name

    material.load_state(table("{ bordered = false, border_left = 0.1, pos = 'x', tex_size = { 256.9, 128 },"
                              " precache_enable = 0 }"));
    EXPECT_FLOAT_EQ(0.0f, material.get_border_left());
    EXPECT_FLOAT_EQ(0.0f, material.get_tex_x());
    EXPECT_EQ(256, material.get_tex_real_w());
    EXPECT_EQ(128, material.get_tex_real_h());
}

TEST_F(MaterialTest, DeferredMaterialsGetNoHandleYet) {
    CBridgeMaterial material(&m_render);
    material.load_state(table("{ material_template = 'ui_color', defered_init = true }"));
    EXPECT_TRUE(material.get_defered_init());
    EXPECT_EQ(-1, material.get_material_handle());
    EXPECT_EQ("", m_recorder.sequence());
    material.init();
    EXPECT_FALSE(material.get_defered_init());
}

TEST_F(MaterialTest, APresetReferenceIgnoresTheLocalKeys) {
    lua_machine().DoString("ui_material_presets = { button = { material_template = 'ui_color',"
                           " color = { r = 10, g = 20, b = 30, a = 40 } } }");
    CBridgeMaterial material(&m_render);
    material.load_state(table("{ material_preset = 'button', color = { r = 1, g = 1, b = 1, a = 1 },"
                              " defered_init = true }"));
    EXPECT_EQ(rgba_t(10, 20, 30, 40), material.get_color());
    EXPECT_NE(-1, material.get_material_handle());

    // Saving leaves the reference in the table and the values in the preset.
    material.set_color(rgba_t(50, 60, 70, 80));
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    material.save_state(saved);
    EXPECT_EQ("m = {\n    material_preset = \"button\",\n}\n", dumped(saved));
    LuaPlus::LuaObject const preset =
        lua_machine().GetGlobals().GetByName("ui_material_presets").GetByName("button");
    EXPECT_EQ(50, preset.GetByName("color").GetByName("r").GetInteger());
    EXPECT_TRUE(preset.GetByName("precache_enable").GetBoolean());
}

TEST_F(MaterialTest, MissingPresetsAreReportedAndTheMaterialStaysAsItWas) {
    qortest::CReportCapture capture;
    CBridgeMaterial material(&m_render);
    material.load_state(table("{ material_preset = 'button', size = { 0.5, 0.5 } }"));
    lua_machine().DoString("ui_material_presets = { button = 5 }");
    material.load_state(table("{ material_preset = 'button' }"));
    EXPECT_EQ((std::vector<std::string>{"UI: Material presets table 'ui_material_presets' not found",
                                        "UI: Preset 'button' is not a table"}),
              capture.texts(qordebug::REPORT_ERROR));
    EXPECT_FLOAT_EQ(1.0f, material.get_tex_w());

    material.load_state(table("5"));
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
}

TEST_F(MaterialTest, SavingWritesTheDefaultsAndOmitsWhatIsUnset) {
    CBridgeMaterial material(&m_render);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&lua_machine());
    material.save_state(saved);
    EXPECT_EQ(
        "m = {\n"
        "    color = {\n        a = 255,\n        b = 255,\n        g = 255,\n        r = 255,\n    },\n"
        "    load_textures_from_game_save = false,\n"
        "    pos = {\n        [1] = 0,\n        [2] = 0,\n    },\n"
        "    precache_enable = true,\n"
        "    size = {\n        [1] = 1,\n        [2] = 1,\n    },\n"
        "}\n",
        dumped(saved));

    // A round trip of a nine-patch with a texture size.
    CBridgeMaterial source(&m_render);
    source.load_state(
        table("{ material_template = 'ui_image', diffuse_texture = 'frame.tga', tex_size = { 256, 128 },"
              " bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.125,"
              " border_bottom = 0.125 }"));
    LuaPlus::LuaObject first;
    first.AssignNewTable(&lua_machine());
    source.save_state(first);
    CBridgeMaterial copy(&m_render);
    copy.load_state(first);
    LuaPlus::LuaObject second;
    second.AssignNewTable(&lua_machine());
    copy.save_state(second);
    EXPECT_EQ(dumped(first), dumped(second));
    EXPECT_FLOAT_EQ(0.125f, copy.get_border_bottom());
    EXPECT_EQ(256, copy.get_tex_real_w());
}
