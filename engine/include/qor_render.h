// The engine's renderer as the UI library sees it: materials, a 2D batch of textured,
// vertex-coloured quads and lines in device coordinates ((-1, 1) top left, (1, -1) bottom right),
// a clip rectangle with push and pop, and 3D views.
#pragma once
#include "qor_interfaces.h"
#include "qor_math.h"

class IAviTexture {
public:
    virtual ~IAviTexture() {}
};

// A view of the 3D scene.
class IRenderCamera {
public:
    virtual ~IRenderCamera() {}
    virtual void set_position(vec2_t const &) {}
    virtual void set_direction(vec2_t const &) {}
    // Real screen pixels.
    virtual void set_viewport(int _x, int _y, int _w, int _h) = 0;
};

// The engine's renderer: materials, 2D quads and lines in device coordinates, clip rectangles.
class IRenderQOR : public IInterfaceBase {
public:
    virtual void render_view(IRenderCamera *_p_camera) = 0;
    virtual void finish_view() = 0;
    // Shows the frame just drawn.
    virtual void present() = 0;
    // Material from a template ("ui_color", "ui_image") and five texture names ("" or null for
    // none). Result a handle; -1 is never valid.
    virtual int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                                char const *_specular, char const *_luminosity, char const *_reflection,
                                bool _precache_enable, bool _load_textures_from_game_save) = 0;
    virtual void destroy_material(int _handle) = 0;
    virtual IAviTexture *get_avi_texture(int _id) = 0;
    virtual void begin_2d() = 0;
    virtual void end_2d() = 0;
    virtual void set_material(int _handle) = 0;
    virtual void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                           vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                           rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) = 0;
    // Position is the lower left corner in device coordinates, size in device units.
    virtual void set_clip_rect(vec2_t const &_position, vec2_t const &_size) = 0;
    virtual void push_clip_rect() = 0;
    virtual void pop_clip_rect() = 0;
    virtual void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                           float _width) = 0;
};
