// The drawing surface of a visual window. It works in pixels relative to its window: it adds the
// window's position on the desktop, fades colours by the window's transparency, knows plain,
// tiled and nine-patch materials, and draws text one character quad at a time with the inline
// colour tags "<color r g b a>" and "</color>". Nothing is retained or cached.
#pragma once
#include "qor_render.h"
#include "ui_geometry.h"

namespace qorui {

class CMaterial;
class CFont;
class CString;
class CText;
class IRender;

// What a canvas needs of the window that owns it.
class ICanvasOwner {
public:
    // The window's position on the desktop.
    virtual point_t const &get_canvas_origin() const = 0;
    // The opacity every colour is multiplied by, 0 to 1; 1 or more: opaque.
    virtual float get_transparency() const = 0;
    // The window's size in pixels.
    // @{
    virtual int get_canvas_w() const = 0;
    virtual int get_canvas_h() const = 0;
    // @}
    // The desktop's render bridge; null while there is none.
    virtual IRender *get_canvas_render() const = 0;

protected:
    // Not deleted through this interface.
    ~ICanvasOwner() {}
};

// Draws for one visual window, in pixels relative to it: rectangles of materials, lines and text.
class CCanvas {
public:
    // Draws for _p_owner, which it doesn't own; tags are interpreted.
    explicit CCanvas(ICanvasOwner *_p_owner);
    // Nothing to release.
    virtual ~CCanvas() {}

    // Whether text_out interprets the colour tags; true by default.
    // @{
    bool get_tags_enable() const { return m_tags_enable; }
    void set_tags_enable(bool _enable) { m_tags_enable = _enable; }
    // @}

    // Makes the rectangle, relative to the owner, the clip of all drawing that follows.
    void set_clip_area(int _x, int _y, int _w, int _h);
    // Clips to the owner's whole region.
    void set_clip_area_all();
    // Saves the clip state; pop_clip_area restores it.
    // @{
    void push_clip_area();
    void pop_clip_area();
    // @}
    // Desktop pixels: the owner's position isn't added.
    void render_view(int _x, int _y, int _w, int _h, IRenderCamera *_p_camera);

    // A line in the material's colour (faded); nothing for a null material.
    void draw_line(int _x0, int _y0, int _x1, int _y1, CMaterial *_p_material);
    // The material's whole picture: stretched, or as a nine-patch when it is bordered (which needs
    // the real texture size; without it a warning and nothing drawn). Nothing for a null material.
    void draw_rect(int _x, int _y, int _w, int _h, CMaterial *_p_material);
    // A rectangle of the texture (coordinates 0 to 1) stretched over the rectangle.
    void draw_rect(int _x, int _y, int _w, int _h, float _tex_x, float _tex_y, float _tex_w, float _tex_h,
                   CMaterial *_p_material);
    // Desktop pixels: tiles of the texture's natural size (_tex_w * _tex_real_w by
    // _tex_h * _tex_real_h), cut by a clip at the area's edge. Nothing for an empty area.
    void draw_tiled(int _x, int _y, int _w, int _h, float _tex_x, float _tex_y, float _tex_w, float _tex_h,
                    float _tex_real_w, float _tex_real_h, CMaterial *_p_material);

    // One line of text at (_x, _y), a quad per character in the font's material, colour tags
    // applied; no wrapping or clipping. Nothing for a null font.
    void text_out(int _x, int _y, CString const &_string, CFont *_p_font);
    // Every line from the first that is visible, in its own font where it has one, _spacing extra
    // pixels between lines; stops at the first line below the owner.
    void text_out(int _x, int _y, int _spacing, CText const &_text, CFont *_p_font);

    // The height of a line in the font, in pixels; 0 for a null font. The string doesn't matter.
    // @{
    int get_text_height(CFont *_p_font);
    int get_text_height(CString const &_string, CFont *_p_font);
    // @}
    // The advance of one character in pixels; 0 for a null font or a character it lacks.
    int get_char_width(unsigned short _ch, CFont *_p_font);
    // The width of the first _count characters in pixels; 0 for a null font. Tags count like
    // other characters. _count -1 (or beyond the string) measures all.
    int get_text_width(CString const &_string, CFont *_p_font, int _count);

private:
    IRender *get_render() const;
    void fade_color(rgba_t &_color) const;
    bool prepare(CMaterial const *_p_material, IRender *&_p_render, rgba_t &_color) const;
    point_t origin() const;
    // One quad, corners upper left, lower left, lower right, upper right, in desktop pixels.
    void quad(IRender *_p_render, int _l, int _t, int _r, int _b, float _u0, float _v0, float _u1, float _v1,
              rgba_t const &_color);
    void draw_nine_patch(IRender *_p_render, int _l, int _t, int _r, int _b, CMaterial *_p_material,
                         rgba_t const &_color);
    // Reads the tag at _i, if there is one; result the index of the character behind it.
    size_t read_tag(CString const &_string, size_t _i, rgba_t const &_base, rgba_t &_current) const;

    ICanvasOwner *mp_owner; // not owned
    bool m_tags_enable;
};

} // namespace qorui
