// Materials: the engine's material handle over the render bridge, the texture's part and size,
// the nine-patch borders, clones, and their layout tables with and without presets.
#include "ui_material.h"
#include "LuaTableIterator.h"
#include "engine_interfaces.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "ui_render.h"
#include "ui_window.h"
#include "ui_desktop.h"

namespace qorui {

namespace {

char const *const k_presets = "ui_material_presets";

void write_name(LuaPlus::LuaObject &_lo_table, char const *_key, string const &_name) {
    if (!_name.empty()) _lo_table.SetString(_key, _name.c_str());
}

} // namespace

CMaterialBase::CMaterialBase()
    : m_color(255, 255, 255, 255), m_tex_x(0), m_tex_y(0), m_tex_w(1), m_tex_h(1), m_tex_real_w(-1),
      m_tex_real_h(-1), m_bordered(false), m_border_left(0), m_border_right(0), m_border_top(0),
      m_border_bottom(0), m_precache_enable(true), m_load_textures_from_game_save(false) {}

CMaterial::CMaterial(IRender *_p_render)
    : m_material_handle(-1), m_defered_init(false), mp_render(_p_render) {}

CMaterial::~CMaterial() {
    if (QOR_CHECK(mp_render) && m_material_handle != -1) mp_render->destroy_material(m_material_handle);
}

CMaterial *CMaterial::init(char const *_material_template, char const *_diffuse, char const *_bump,
                           char const *_specular, char const *_luminosity, char const *_reflection,
                           bool _precache_enable, bool _load_textures_from_game_save) {
    m_material_template = _material_template ? _material_template : "";
    m_diffuse_texture = _diffuse ? _diffuse : "";
    m_bump_texture = _bump ? _bump : "";
    m_specular_texture = _specular ? _specular : "";
    m_luminosity_texture = _luminosity ? _luminosity : "";
    m_reflection_texture = _reflection ? _reflection : "";
    m_precache_enable = _precache_enable;
    m_load_textures_from_game_save = _load_textures_from_game_save;
    return init();
}

CMaterial *CMaterial::init() {
    if (!QOR_CHECK(mp_render)) return this;
    m_material_handle = mp_render->create_material(m_material_template.c_str(), m_diffuse_texture.c_str(),
                                                   m_bump_texture.c_str(), m_specular_texture.c_str(),
                                                   m_luminosity_texture.c_str(), m_reflection_texture.c_str(),
                                                   m_precache_enable, m_load_textures_from_game_save);
    m_defered_init = false;
    return this;
}

void CMaterial::reset() {
    if (m_material_handle == -1) return;
    if (mp_render) mp_render->destroy_material(m_material_handle);
    m_material_handle = -1;
}

CMaterial *CMaterial::clone() const {
    CMaterial *p_clone = new CMaterial(mp_render);
    p_clone->m_color = m_color;
    p_clone->m_tex_x = m_tex_x;
    p_clone->m_tex_y = m_tex_y;
    p_clone->m_tex_w = m_tex_w;
    p_clone->m_tex_h = m_tex_h;
    p_clone->m_tex_real_w = m_tex_real_w;
    p_clone->m_tex_real_h = m_tex_real_h;
    p_clone->m_material_template = m_material_template;
    p_clone->m_diffuse_texture = m_diffuse_texture;
    p_clone->m_bump_texture = m_bump_texture;
    p_clone->m_specular_texture = m_specular_texture;
    p_clone->m_luminosity_texture = m_luminosity_texture;
    p_clone->m_reflection_texture = m_reflection_texture;
    p_clone->m_precache_enable = m_precache_enable;
    p_clone->m_load_textures_from_game_save = m_load_textures_from_game_save;
    if (m_material_handle != -1) p_clone->init();
    return p_clone;
}

CMaterial *create_color_material(CDesktop *_p_desktop, rgba_t const &_color) {
    CMaterial *p_material = _p_desktop ? _p_desktop->create_material() : nullptr;
    if (!p_material) return nullptr;
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(_color);
    return p_material;
}

CMaterial *create_preset_material(CDesktop *_p_desktop, char const *_preset) {
    CMaterial *p_material = _p_desktop ? _p_desktop->create_material() : nullptr;
    if (!p_material || !_preset) return p_material;
    LuaPlus::LuaObject table;
    table.AssignNewTable(&lua_machine());
    table.SetString("material_preset", _preset);
    p_material->load_state(table);
    return p_material;
}

// ---------------------------------------------------------------------------------------------
// Persistence
// ---------------------------------------------------------------------------------------------

void CMaterial::load_state(LuaPlus::LuaObject _lo_table) {
    QOR_CHECK(mp_render);
    if (!QOR_CHECK_AS(_lo_table.IsTable(), "_lo_table.IsTable()")) return;
    LuaPlus::LuaObject const preset = _lo_table.GetByName("material_preset");
    if (!preset.IsString()) {
        read_keys(_lo_table);
    } else {
        m_material_preset = preset.GetString();
        LuaPlus::LuaObject const presets = lua_machine().GetGlobals().GetByName(k_presets);
        LuaPlus::LuaObject const source = presets.IsTable() ? presets.GetByName(preset.GetString()) : presets;
        if (!presets.IsTable())
            qordebug::error("UI: Material presets table '%s' not found", k_presets);
        else if (!source.IsTable())
            qordebug::error("UI: Preset '%s' is not a table", preset.GetString());
        else
            read_keys(source);
    }
    if (!m_defered_init) init();
}

// Each key only with its own Lua type; the borders only of a nine-patch.
void CMaterial::read_keys(LuaPlus::LuaObject const &_lo_source) {
    read_string(_lo_source, "material_template", m_material_template);
    read_string(_lo_source, "diffuse_texture", m_diffuse_texture);
    read_string(_lo_source, "bump_texture", m_bump_texture);
    read_string(_lo_source, "specular_texture", m_specular_texture);
    read_string(_lo_source, "luminosity_texture", m_luminosity_texture);
    read_string(_lo_source, "reflection_texture", m_reflection_texture);
    read_bool(_lo_source, "precache_enable", m_precache_enable);
    read_bool(_lo_source, "load_textures_from_game_save", m_load_textures_from_game_save);
    read_pair(_lo_source, "pos", m_tex_x, m_tex_y);
    read_pair(_lo_source, "size", m_tex_w, m_tex_h);
    read_pair(_lo_source, "tex_size", m_tex_real_w, m_tex_real_h);
    LuaPlus::LuaObject const color = _lo_source.GetByName("color");
    if (color.IsTable()) {
        // Each channel the low eight bits of its number truncated; a channel that isn't a number
        // gives 0, one out of range stays.
        unsigned char rgba_t::*const channels[] = {&rgba_t::r, &rgba_t::g, &rgba_t::b, &rgba_t::a};
        char const *const names[] = {"r", "g", "b", "a"};
        for (int i = 0; i < 4; ++i) {
            int channel = 0;
            if (!color.GetByName(names[i]).IsNumber() || read_int(color, names[i], channel))
                m_color.*channels[i] = static_cast<unsigned char>(channel);
        }
    }
    read_bool(_lo_source, "bordered", m_bordered);
    if (m_bordered) {
        read_float(_lo_source, "border_left", m_border_left);
        read_float(_lo_source, "border_right", m_border_right);
        read_float(_lo_source, "border_top", m_border_top);
        read_float(_lo_source, "border_bottom", m_border_bottom);
    }
    read_bool(_lo_source, "defered_init", m_defered_init);
}

// A preset material leaves only its reference in the table given; its values replace the
// preset's entry in ui_material_presets.
void CMaterial::save_state(LuaPlus::LuaObject _lo_table) const {
    if (m_material_preset.empty()) {
        write_keys(_lo_table);
        return;
    }
    _lo_table.SetString("material_preset", m_material_preset.c_str());
    LuaPlus::LuaObject presets = lua_machine().GetGlobals().GetByName(k_presets);
    if (!presets.IsTable()) {
        presets.AssignNewTable(&lua_machine());
        lua_machine().GetGlobals().SetObject(k_presets, presets);
    }
    LuaPlus::LuaObject entry;
    entry.AssignNewTable(&lua_machine());
    presets.SetObject(m_material_preset.c_str(), entry);
    write_keys(entry);
}

void CMaterial::write_keys(LuaPlus::LuaObject &_lo_target) const {
    write_name(_lo_target, "material_template", m_material_template);
    write_name(_lo_target, "diffuse_texture", m_diffuse_texture);
    write_name(_lo_target, "bump_texture", m_bump_texture);
    write_name(_lo_target, "specular_texture", m_specular_texture);
    write_name(_lo_target, "luminosity_texture", m_luminosity_texture);
    write_name(_lo_target, "reflection_texture", m_reflection_texture);
    _lo_target.SetBoolean("precache_enable", m_precache_enable);
    _lo_target.SetBoolean("load_textures_from_game_save", m_load_textures_from_game_save);
    write_pair(_lo_target, "pos", m_tex_x, m_tex_y);
    write_pair(_lo_target, "size", m_tex_w, m_tex_h);
    if (m_tex_real_w != -1 && m_tex_real_h != -1)
        write_pair(_lo_target, "tex_size", m_tex_real_w, m_tex_real_h);
    LuaPlus::LuaObject color;
    color.AssignNewTable(_lo_target.GetState());
    color.SetNumber("r", m_color.r);
    color.SetNumber("g", m_color.g);
    color.SetNumber("b", m_color.b);
    color.SetNumber("a", m_color.a);
    _lo_target.SetObject("color", color);
    if (!m_bordered) return;
    _lo_target.SetBoolean("bordered", true);
    _lo_target.SetNumber("border_left", m_border_left);
    _lo_target.SetNumber("border_right", m_border_right);
    _lo_target.SetNumber("border_top", m_border_top);
    _lo_target.SetNumber("border_bottom", m_border_bottom);
}

} // namespace qorui
