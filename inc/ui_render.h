// The render bridge: the one place that talks to the engine's renderer. Above it everything is in
// whole pixels of the desktop's resolution; the bridge turns them into device coordinates, (-1, 1)
// top left to (1, -1) bottom right, and forwards material, clip and drawing calls.
#pragma once
#include "qor_render.h"
#include "ui_geometry.h"

namespace qorui {

// What one frame sent to the engine, from its outermost begin_draw to its end_draw.
struct SRenderFigures {
    unsigned m_materials_set; // one for each drawing of the canvas, one for each text that shows a character
    // Quads and lines drawn.
    // @{
    unsigned m_quads;
    unsigned m_lines;
    // @}
};

// A rectangle of desktop pixels by its edges: left and top inside, right and bottom outside.
struct SPixelRect {
    // The edges, in desktop pixels.
    // @{
    int m_l, m_t, m_r, m_b;
    // @}
};

// What windows draw through: materials, clip rectangles, quads and lines in desktop pixels.
class IRender {
public:
    // Deleted by its owner; the library's one bridge lives to process end.
    virtual ~IRender() {}
    // The desktop's size in pixels, which the whole device area stands for.
    virtual void set_resolution(int _w, int _h) = 0;
    // The desktop's size in pixels as last set; nothing outside it is ever seen.
    virtual point_t get_resolution() const = 0;
    // Open and close a frame's 2D drawing; they nest, and each end_draw needs its begin_draw.
    // @{
    virtual void begin_draw() = 0;
    virtual void end_draw() = 0;
    // @}
    // A material from a template ("ui_color", "ui_image") and five texture names (empty or null
    // for none); the result is the renderer's handle, -1 never being a valid one.
    virtual int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                                char const *_specular, char const *_luminosity, char const *_reflection,
                                bool _precache_enable, bool _load_textures_from_game_save) = 0;
    // Releases a handle of create_material.
    virtual void destroy_material(int _handle) = 0;
    // Makes the material current for the quads and lines that follow.
    virtual void set_material(int _handle) = 0;
    // Makes the rectangle, in desktop pixels, the clip of all drawing that follows, at once.
    virtual void set_clip_area(int _x, int _y, int _w, int _h) = 0;
    // Saves the clip state; pop_clip_area restores what the matching push saved.
    // @{
    virtual void push_clip_area() = 0;
    virtual void pop_clip_area() = 0;
    // @}
    // One quad in desktop pixels: corners p0 to p3 (upper left, lower left, lower right, upper
    // right, as the canvas passes them), each with a texture coordinate and a colour.
    virtual void draw_quad(point_t const &_p0, point_t const &_p1, point_t const &_p2, point_t const &_p3,
                           vec2_t const &_t0, vec2_t const &_t1, vec2_t const &_t2, vec2_t const &_t3,
                           rgba_t const &_c0, rgba_t const &_c1, rgba_t const &_c2, rgba_t const &_c3) = 0;
    // One line of width 1 in desktop pixels, its colour running from _c_from to _c_to.
    virtual void draw_line(point_t const &_from, point_t const &_to, rgba_t const &_c_from,
                           rgba_t const &_c_to) = 0;
    // A 3D view in the middle of a 2D frame: the 2D batch closes round it and opens again. The
    // rectangle is in desktop pixels; the camera's viewport gets it in screen pixels. A null
    // camera keeps its viewport.
    virtual void render_view(int _x, int _y, int _w, int _h, IRenderCamera *_p_camera) = 0;
    // The engine's video texture of that number, handed through; null without a renderer.
    virtual IAviTexture *get_avi_texture(int _id) = 0;
    // The figures of the last frame that ended.
    virtual SRenderFigures get_frame_figures() const = 0;
    // Where anything drawn now can still be seen, within the desktop: the clip area in force, or
    // a rectangle round the areas that the engine may have in force. Drawing wholly outside it
    // can be left out.
    virtual SPixelRect get_visible_area() const = 0;
};

// The render bridge to the engine's IRenderQOR: desktop pixels to device coordinates.
class CRender : public IRender {
public:
    // All zero: no renderer, no resolution.
    CRender();

    void set_resolution(int _w, int _h) override;
    point_t get_resolution() const override { return point_t{m_res_w, m_res_h}; }
    // begin_2d at every level of nesting, not only the outermost.
    void begin_draw() override;
    void end_draw() override;
    int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                        char const *_specular, char const *_luminosity, char const *_reflection,
                        bool _precache_enable, bool _load_textures_from_game_save) override;
    void destroy_material(int _handle) override;
    void set_material(int _handle) override;
    void set_clip_area(int _x, int _y, int _w, int _h) override;
    void push_clip_area() override;
    void pop_clip_area() override;
    void draw_quad(point_t const &_p0, point_t const &_p1, point_t const &_p2, point_t const &_p3,
                   vec2_t const &_t0, vec2_t const &_t1, vec2_t const &_t2, vec2_t const &_t3,
                   rgba_t const &_c0, rgba_t const &_c1, rgba_t const &_c2, rgba_t const &_c3) override;
    void draw_line(point_t const &_from, point_t const &_to, rgba_t const &_c_from,
                   rgba_t const &_c_to) override;
    void render_view(int _x, int _y, int _w, int _h, IRenderCamera *_p_camera) override;
    IAviTexture *get_avi_texture(int _id) override;
    SRenderFigures get_frame_figures() const override { return m_last_frame; }
    SPixelRect get_visible_area() const override { return m_visible; }

    // Attaches the engine's renderer and reads the real screen size from "scr_resx", "scr_resy".
    virtual void init(IRenderQOR *_p_render);

private:
    virtual void begin_draw_3d();
    virtual void end_draw_3d();

    vec2_t to_device(point_t const &_p) const;
    bool has_render() const;
    SPixelRect desktop_area() const { return SPixelRect{0, 0, m_res_w, m_res_h}; }

    IRenderQOR *mp_render; // not owned
    int m_in_draw_2d;
    int m_in_draw_3d;
    int m_res_w;
    int m_res_h;
    float m_scale_x; // 2 / m_res_w
    float m_scale_y; // 2 / m_res_h
    // The same in double, by which pixels become device coordinates without a division each.
    // @{
    double m_step_x;
    double m_step_y;
    // @}
    int m_scr_w;
    int m_scr_h;
    SRenderFigures m_frame;      // counted since the outermost begin_draw
    SRenderFigures m_last_frame; // the last frame that ended

    // What the engine's clip may be, as far as the bridge can tell. A pop restores either the area
    // set before its push or the one in force before that (the engine decides), so the visible
    // area behind a pop is the rectangle round both.
    struct SSavedClip {
        SPixelRect m_visible, m_before;
    };
    static int const k_saved_clips = 16; // deeper pushes restore the whole desktop
    SPixelRect m_visible;                // within the desktop
    SPixelRect m_visible_before;         // in force before the last set_clip_area
    SSavedClip m_saved[k_saved_clips];
    int m_pushes;
};

} // namespace qorui
