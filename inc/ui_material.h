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
    // White over the whole texture, size unknown, not bordered, no names; precache on.
    CMaterialBase();

protected:
    // Multiplied into the texture; the canvas fades it by the window's transparency.
    rgba_t m_color;
    // @{
    float m_tex_x, m_tex_y; // the picture's upper left corner; the whole texture is 0 to 1
    // @}
    // @{
    float m_tex_w, m_tex_h; // the picture's size in texture space
    // @}
    // @{
    int m_tex_real_w, m_tex_real_h; // the whole texture in pixels; -1 when not given
    // @}
    bool m_bordered; // a nine-patch
    // @{
    float m_border_left, m_border_right, m_border_top, m_border_bottom; // in texture space
    // @}
    // The preset the material was loaded from; empty for none.
    string m_material_preset;
    // The engine's material template.
    string m_material_template;
    // The names of the five textures; empty for none.
    // @{
    string m_diffuse_texture, m_bump_texture, m_specular_texture, m_luminosity_texture, m_reflection_texture;
    // @}
    // Passed to the renderer with the names.
    // @{
    bool m_precache_enable;
    bool m_load_textures_from_game_save;
    // @}
};

// How a rectangle is painted, owning one handle of a material in the engine's renderer.
class CMaterial : public CPooled<CMaterial, 128>, public CMaterialBase {
public:
    // Gives the handle back to the renderer.
    virtual ~CMaterial();
    // Copy every field, the handle too: use clone for a second material.
    // @{
    CMaterial(CMaterial const &) = default;
    CMaterial &operator=(CMaterial const &) = default;
    // @}

    // Stores the template, the five texture names and the flags, null names counting as empty,
    // then makes a handle. Result: the material itself.
    CMaterial *init(char const *_material_template, char const *_diffuse, char const *_bump,
                    char const *_specular, char const *_luminosity, char const *_reflection,
                    bool _precache_enable, bool _load_textures_from_game_save);
    // A new handle from the names and flags, and no longer deferred; one held before isn't
    // released. Result: the material itself.
    CMaterial *init();
    // Gives the handle back; the description stays, so init() can make it again.
    void reset();
    // A copy for the caller with a handle of its own; never a nine-patch, no preset.
    CMaterial *clone() const;

    // A table in full, or a reference to a preset of the global ui_material_presets (then the
    // table's other keys aren't read). Keys of the wrong type are passed over. Makes the handle
    // unless "defered_init" is set: then the window's next show makes it. A missing preset is
    // reported as an error.
    void load_state(LuaPlus::LuaObject _lo_table);
    // Writes the keys load_state reads (names, flags, "pos", "size", "tex_size" when known,
    // "color", the borders of a nine-patch); a material of a preset writes only the reference
    // and puts its values into the preset table.
    void save_state(LuaPlus::LuaObject _lo_table) const;

    // The engine's material; -1 while there is none.
    int get_material_handle() const { return m_material_handle; }
    // The handle waits for the window's first show.
    bool get_defered_init() const { return m_defered_init; }
    // The colour, multiplied into the texture.
    // @{
    rgba_t const &get_color() const { return m_color; }
    void set_color(rgba_t const &_color) { m_color = _color; }
    // @}
    // The picture's upper left corner and size in texture space (the whole texture is 0 to 1).
    // @{
    float get_tex_x() const { return m_tex_x; }
    float get_tex_y() const { return m_tex_y; }
    float get_tex_w() const { return m_tex_w; }
    float get_tex_h() const { return m_tex_h; }
    void set_tex_w(float _w) { m_tex_w = _w; }
    void set_tex_h(float _h) { m_tex_h = _h; }
    // @}
    // The whole texture's size in pixels; -1 when not given.
    // @{
    int get_tex_real_w() const { return m_tex_real_w; }
    int get_tex_real_h() const { return m_tex_real_h; }
    // @}
    // Whether the picture is a nine-patch.
    bool get_bordered() const { return m_bordered; }
    // The nine-patch's border widths in texture space.
    // @{
    float get_border_left() const { return m_border_left; }
    float get_border_right() const { return m_border_right; }
    float get_border_top() const { return m_border_top; }
    float get_border_bottom() const { return m_border_bottom; }
    // @}

protected:
    // The desktop makes materials (and clone copies them); protected so that the desktop and
    // tests can build them over a bridge of their own.
    // A material without a handle, drawing through _p_render.
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
