// How a rectangle is painted: a colour, a rectangle in texture space, the names of the textures
// and of the engine's material template, and optionally the borders of a nine-patch. A material
// owns one handle of a material in the engine.
//
// A clone draws the same picture as its source but owns a handle of its own: when the source
// holds a handle, the clone asks the renderer for another one from the same names. So either can
// be destroyed first, and no renderer ever sees a handle released twice.
#pragma once
#include "qor_math.h"
#include "qor_memory.h"

namespace LuaPlus {
class LuaObject;
}

namespace qorui {

class IRender;
class CDesktop;

// The description of a material: colour, texture rectangle, texture names, nine-patch borders.
class CMaterialBase {
public:
    CMaterialBase();

protected:
    rgba_t m_color;
    float m_tex_x, m_tex_y;         // the picture's upper left corner; the whole texture is 0 to 1
    float m_tex_w, m_tex_h;         // the picture's size in texture space
    int m_tex_real_w, m_tex_real_h; // the whole texture in pixels; -1 when not given
    bool m_bordered;                // a nine-patch
    float m_border_left, m_border_right, m_border_top, m_border_bottom; // in texture space
    string m_material_preset;
    string m_material_template;
    string m_diffuse_texture, m_bump_texture, m_specular_texture, m_luminosity_texture, m_reflection_texture;
    bool m_precache_enable;
    bool m_load_textures_from_game_save;
};

// How a rectangle is painted, owning one handle of a material in the engine's renderer.
class CMaterial : public CPooled<CMaterial, 128>, public CMaterialBase {
public:
    virtual ~CMaterial();
    CMaterial(CMaterial const &) = default;
    CMaterial &operator=(CMaterial const &) = default;

    // Null names count as empty; then a handle is made.
    CMaterial *init(char const *_material_template, char const *_diffuse, char const *_bump,
                    char const *_specular, char const *_luminosity, char const *_reflection,
                    bool _precache_enable, bool _load_textures_from_game_save);
    // A new handle from the names and flags; one held before isn't released.
    CMaterial *init();
    // Gives the handle back; the description stays, so init() can make it again.
    void reset();
    // A copy for the caller with a handle of its own; never a nine-patch, no preset.
    CMaterial *clone() const;

    // A table in full, or a reference to a preset of the global ui_material_presets.
    void load_state(LuaPlus::LuaObject _lo_table);
    void save_state(LuaPlus::LuaObject _lo_table) const;

    int get_material_handle() const { return m_material_handle; }
    bool get_defered_init() const { return m_defered_init; }
    rgba_t const &get_color() const { return m_color; }
    void set_color(rgba_t const &_color) { m_color = _color; }
    float get_tex_x() const { return m_tex_x; }
    float get_tex_y() const { return m_tex_y; }
    float get_tex_w() const { return m_tex_w; }
    float get_tex_h() const { return m_tex_h; }
    void set_tex_w(float _w) { m_tex_w = _w; }
    void set_tex_h(float _h) { m_tex_h = _h; }
    int get_tex_real_w() const { return m_tex_real_w; }
    int get_tex_real_h() const { return m_tex_real_h; }
    bool get_bordered() const { return m_bordered; }
    float get_border_left() const { return m_border_left; }
    float get_border_right() const { return m_border_right; }
    float get_border_top() const { return m_border_top; }
    float get_border_bottom() const { return m_border_bottom; }

protected:
    // The desktop makes materials (and clone copies them); protected so that the desktop and
    // tests can build them over a bridge of their own.
    explicit CMaterial(IRender *_p_render);
    friend class CDesktop;

private:
    void read_keys(LuaPlus::LuaObject const &_lo_source);
    void write_keys(LuaPlus::LuaObject &_lo_target) const;

    int m_material_handle;
    bool m_defered_init;
    IRender *mp_render; // not owned
};

// A new "ui_color" material of the desktop in one colour: the built-in look of a control. The caller
// owns it; null without a desktop.
CMaterial *create_color_material(CDesktop *_p_desktop, rgba_t const &_color);
// A new material of the desktop that refers to the preset _preset of the global
// ui_material_presets (run "ui_material_presets.lua" into the library's Lua state first), so an
// export writes the preset back; a missing preset is reported as load_state reports it. The
// caller owns it; null without a desktop.
CMaterial *create_preset_material(CDesktop *_p_desktop, char const *_preset);

} // namespace qorui
