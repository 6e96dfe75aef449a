// Materials over the test world's bridge and recorder: handles, clones, and the layout tables with
// and without presets.
#include "ui_material.h"

#include "engine_interfaces.h"
#include "test_world.h"

#include <gtest/gtest.h>

#include <memory>
#include <sstream>

using namespace qorui;
using qortest::lua_table;

namespace {

class MaterialTest : public ::testing::Test {
protected:
    void SetUp() override {
        lua_machine().DoString("ui_material_presets = nil");
        m_world.recorder().clear();
    }
    std::unique_ptr<CMaterial> make(char const *_table = nullptr) {
        std::unique_ptr<CMaterial> p_material(m_world.desktop().create_material());
        if (_table) p_material->load_state(lua_table(_table));
        return p_material;
    }
    static std::string saved(CMaterial const &_material) {
        LuaPlus::LuaObject table = qortest::new_table();
        _material.save_state(table);
        std::ostringstream out;
        table.dump("m", out);
        return out.str();
    }

    qortest::CWorld m_world;
    qortest::CReportCapture m_capture; // textures that the renderer can't find
};

} // namespace

TEST_F(MaterialTest, InitMakesAHandleFromTheNamesResetGivesItBackAndAClonePaintsTheSame) {
    std::unique_ptr<CMaterial> material = make();
    material->reset(); // nothing to give back
    material->init("ui_image", "font.tga", nullptr, nullptr, nullptr, nullptr, true, false);
    std::vector<qorhost::SRenderCall> const &calls = m_world.recorder().calls();
    EXPECT_EQ((std::vector<std::string>{"ui_image", "font.tga", "", "", "", ""}), calls[0].m_names);
    int const handle = material->get_material_handle();
    material->reset();
    material->init();
    EXPECT_EQ("create_material destroy_material create_material", m_world.recorder().sequence());
    EXPECT_EQ(handle, calls[1].m_handle);

    std::unique_ptr<CMaterial> source =
        make("{ diffuse_texture = 'a.tga', material_template = 'ui_image', pos = { 0.25, 0.5 },"
             " bordered = true, border_left = 0.1, color = { r = 1, g = 2, b = 3, a = 4 } }");
    std::unique_ptr<CMaterial> clone(source->clone());
    EXPECT_NE(source->get_material_handle(), clone->get_material_handle());
    EXPECT_EQ("a.tga", calls.back().m_names[1]);
    EXPECT_FLOAT_EQ(0.25f, clone->get_tex_x());
    EXPECT_EQ(rgba_t(1, 2, 3, 4), clone->get_color());
    EXPECT_FALSE(clone->get_bordered()); // a clone is never a nine-patch
    int const clone_handle = clone->get_material_handle();
    clone.reset();
    EXPECT_EQ("destroy_material", calls.back().m_op);
    EXPECT_EQ(clone_handle, calls.back().m_handle);
}

// Only keys of the right type are read, borders only of a nine-patch; deferred ones wait for init.
TEST_F(MaterialTest, OnlyKeysOfTheRightTypeAreReadAndANinePatchComesBackTheSame) {
    std::unique_ptr<CMaterial> material =
        make("{ material_template = 'ui_color', bordered = false, border_left = 0.1,"
             " pos = 'x', size = { 0.5, 0.5 }, tex_size = { 256.9, 128 }, defered_init = true }");
    EXPECT_FLOAT_EQ(0.5f, material->get_tex_w());
    EXPECT_FLOAT_EQ(0.0f, material->get_border_left());
    EXPECT_FLOAT_EQ(0.0f, material->get_tex_x());
    EXPECT_EQ(256, material->get_tex_real_w());
    EXPECT_EQ("", m_world.recorder().sequence());
    material->init();
    EXPECT_FALSE(material->get_defered_init());

    std::unique_ptr<CMaterial> source =
        make("{ material_template = 'ui_image', diffuse_texture = 'frame.tga',"
             " tex_size = { 256, 128 }, bordered = true, border_left = 0.25,"
             " border_right = 0.25, border_top = 0.125, border_bottom = 0.125 }");
    std::unique_ptr<CMaterial> copy = make(saved(*source).substr(4).c_str());
    EXPECT_EQ(saved(*source), saved(*copy));
    EXPECT_FLOAT_EQ(0.125f, copy->get_border_bottom());
}

TEST_F(MaterialTest, APresetReferenceIgnoresTheLocalKeysAndIsSavedIntoThePreset) {
    lua_machine().DoString("ui_material_presets = { button = { material_template = 'ui_color',"
                           " color = { r = 10, g = 20, b = 30, a = 40 } } }");
    std::unique_ptr<CMaterial> material =
        make("{ material_preset = 'button', color = { r = 1, g = 1, b = 1, a = 1 },"
             " defered_init = true }");
    EXPECT_EQ(rgba_t(10, 20, 30, 40), material->get_color());
    EXPECT_NE(-1, material->get_material_handle());
    material->set_color(rgba_t(50, 60, 70, 80));
    EXPECT_EQ("m = {\n    material_preset = \"button\",\n}\n", saved(*material));
    LuaPlus::LuaObject const preset =
        lua_machine().GetGlobals().GetByName("ui_material_presets").GetByName("button");
    EXPECT_EQ(50, preset.GetByName("color").GetByName("r").GetInteger());

    // Missing presets are reported, and the material stays as it was.
    m_capture.clear();
    lua_machine().DoString("ui_material_presets = nil");
    material->load_state(lua_table("{ material_preset = 'button', size = { 0.5, 0.5 } }"));
    lua_machine().DoString("ui_material_presets = { button = 5 }");
    material->load_state(lua_table("{ material_preset = 'button' }"));
    material->load_state(lua_table("5"));
    EXPECT_EQ((std::vector<std::string>{"UI: Material presets table 'ui_material_presets' not found",
                                        "UI: Preset 'button' is not a table"}),
              m_capture.errors());
    EXPECT_EQ(1u, m_capture.asserts().size());
    EXPECT_FLOAT_EQ(1.0f, material->get_tex_w());
}
