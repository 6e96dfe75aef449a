// The host's software renderer: an RGBA frame of the screen's size that textured, vertex-coloured
// quads and lines are drawn into, with a clip rectangle and straight-alpha blending, and a frame
// sink that receives each presented frame (the host writes it as a PNG file).
//
// Device coordinates: (-1, 1) is the top left corner of the frame, (1, -1) the bottom right.
// Pixels are sampled at their centres; a pixel whose centre lies on a shared edge belongs to one
// triangle only (top-left rule). Textures are sampled at the nearest texel, so a picture drawn at
// its own size is copied exactly.
#pragma once
#include "image_io.h"
#include "qor_render.h"

#include <functional>
#include <map>
#include <memory>
#include <string>
#include <vector>

namespace qorhost {

struct SClipRect {
    int m_x0, m_y0, m_x1, m_y1; // pixels; right and bottom edges outside
};

class CSoftwareRenderer : public IRenderQOR {
public:
    typedef std::function<void(SImage const &_frame, unsigned _index)> frame_sink_t;

    CSoftwareRenderer(int _w, int _h);

    SInterfaceUID get_uid() const override { return qor_uid::RENDER; }
    int get_version() const override { return 1; }

    void render_view(IRenderCamera *_p_camera) override;
    void finish_view() override { ++m_views_finished; }
    void present() override;
    int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                        char const *_specular, char const *_luminosity, char const *_reflection, bool _precache_enable,
                        bool _load_textures_from_game_save) override;
    void destroy_material(int _handle) override;
    IAviTexture *get_avi_texture(int) override { return nullptr; }
    void begin_2d() override { ++m_batches_begun; }
    void end_2d() override { ++m_batches_ended; }
    void set_material(int _handle) override { m_material = _handle; }
    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1, vec2_t const &_t1,
                   rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2, rgba_t const &_c2, vec2_t const &_p3,
                   vec2_t const &_t3, rgba_t const &_c3) override;
    void set_clip_rect(vec2_t const &_position, vec2_t const &_size) override;
    void push_clip_rect() override;
    void pop_clip_rect() override;
    void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                   float _width) override;

    // The host's frame: clears to a colour and resets the clip to the whole frame.
    void begin_frame(rgba_t const &_clear);
    void set_frame_sink(frame_sink_t _sink) { m_sink = _sink; }
    // Folders searched for textures, in order.
    void set_texture_folders(std::vector<std::string> const &_folders) { m_texture_folders = _folders; }

    SImage const &get_frame() const { return m_frame; }
    SClipRect const &get_clip() const { return m_clip; }
    unsigned get_presented() const { return m_presented; }
    unsigned get_live_materials() const { return static_cast<unsigned>(m_materials.size()); }
    unsigned get_batches_begun() const { return m_batches_begun; }
    unsigned get_views_rendered() const { return m_views_rendered; }

private:
    struct SVertex {
        float m_x, m_y; // pixels
        float m_u, m_v;
        float m_rgba[4];
    };
    struct SMaterial {
        bool m_textured;
        std::shared_ptr<SImage> mp_texture;
    };

    SVertex to_vertex(vec2_t const &_p, vec2_t const &_t, rgba_t const &_c) const;
    void draw_triangle(SVertex const &_a, SVertex const &_b, SVertex const &_c, SMaterial const *_p_material);
    void blend(int _x, int _y, float const *_rgba, SMaterial const *_p_material, float _u, float _v);
    std::shared_ptr<SImage> texture(std::string const &_name);
    SMaterial const *current_material() const;
    SClipRect full_clip() const { return SClipRect{0, 0, m_frame.m_w, m_frame.m_h}; }

    SImage m_frame;
    SClipRect m_clip;
    std::vector<SClipRect> m_clip_stack;
    std::map<int, SMaterial> m_materials;
    std::map<std::string, std::shared_ptr<SImage>> m_textures;
    std::vector<std::string> m_texture_folders;
    int m_next_handle = 0;
    int m_material = -1;
    frame_sink_t m_sink;
    unsigned m_presented = 0;
    unsigned m_batches_begun = 0;
    unsigned m_batches_ended = 0;
    unsigned m_views_rendered = 0;
    unsigned m_views_finished = 0;
};

} // namespace qorhost
