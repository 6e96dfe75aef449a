// The engine's renderer as the UI library sees it: materials, a 2D batch of textured,
// vertex-coloured quads and lines in device coordinates ((-1, 1) top left, (1, -1) bottom right),
// a clip rectangle with push and pop, and 3D views.
#pragma once
#include "qor_interfaces.h"
#include "qor_math.h"

// A video texture of the engine; the library only hands it on.
class IAviTexture {
public:
    // Released by its owner, the engine.
    virtual ~IAviTexture() {}
};

// A view of the 3D scene.
class IRenderCamera {
public:
    // Released by whoever made the camera.
    virtual ~IRenderCamera() {}
    // Where the camera stands and where it looks; the library doesn't call these.
    // @{
    virtual void set_position(vec2_t const &) {}
    virtual void set_direction(vec2_t const &) {}
    // @}
    // Real screen pixels.
    virtual void set_viewport(int _x, int _y, int _w, int _h) = 0;
};

// The engine's renderer: materials, 2D quads and lines in device coordinates, clip rectangles.
class IRenderQOR : public IInterfaceBase {
public:
    // Renders the 3D scene seen by the camera into the camera's viewport; the camera may be null.
    // finish_view follows each view.
    virtual void render_view(IRenderCamera *_p_camera) = 0;
    // Closes the 3D pass that render_view opened.
    virtual void finish_view() = 0;
    // Shows the frame just drawn.
    virtual void present() = 0;
    // Material from a template ("ui_color", "ui_image") and five texture names ("" or null for
    // none). Result a handle; -1 is never valid.
    virtual int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                                char const *_specular, char const *_luminosity, char const *_reflection,
                                bool _precache_enable, bool _load_textures_from_game_save) = 0;
    // Releases the handle.
    virtual void destroy_material(int _handle) = 0;
    // The video texture of that number; the engine owns it.
    virtual IAviTexture *get_avi_texture(int _id) = 0;
    // Opens and closes a batch of 2D drawing.
    // @{
    virtual void begin_2d() = 0;
    virtual void end_2d() = 0;
    // @}
    // Makes the material current for the quads and lines that follow.
    virtual void set_material(int _handle) = 0;
    // One textured, vertex-coloured quad in device coordinates: four vertices, each a position, a
    // texture coordinate (0 to 1) and a colour.
    virtual void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                           vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                           rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) = 0;
    // Position is the lower left corner in device coordinates, size in device units.
    virtual void set_clip_rect(vec2_t const &_position, vec2_t const &_size) = 0;
    // Saves the clip state; pop_clip_rect restores what the matching push saved.
    // @{
    virtual void push_clip_rect() = 0;
    virtual void pop_clip_rect() = 0;
    // @}
    // One line in device coordinates, its colour running from _c_from to _c_to; _width in pixels.
    virtual void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                           float _width) = 0;
};
