// A renderer that records every call with its arguments, for tests, and hands each call on to
// another renderer when it has one.
#pragma once
#include "qor_render.h"

#include <string>
#include <vector>

namespace qorhost {

struct SRenderCall {
    std::string m_op;               // the operation's name, e.g. "draw_quad"
    int m_handle = -1;              // material handle of create, destroy and set
    std::vector<std::string> m_names; // create_material: template and the five texture names ("" for null)
    std::vector<vec2_t> m_points;   // positions, in call order (clip: position, size)
    std::vector<vec2_t> m_uvs;      // texture coordinates
    std::vector<rgba_t> m_colours;  // vertex colours
};

class CRecordingRenderer : public IRenderQOR {
public:
    explicit CRecordingRenderer(IRenderQOR *_p_target = nullptr) : mp_target(_p_target) {}

    SInterfaceUID get_uid() const override { return qor_uid::RENDER; }
    int get_version() const override { return 1; }

    void render_view(IRenderCamera *_p_camera) override;
    void finish_view() override;
    void present() override;
    int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                        char const *_specular, char const *_luminosity, char const *_reflection, bool _precache_enable,
                        bool _load_textures_from_game_save) override;
    void destroy_material(int _handle) override;
    IAviTexture *get_avi_texture(int _id) override;
    void begin_2d() override;
    void end_2d() override;
    void set_material(int _handle) override;
    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1, vec2_t const &_t1,
                   rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2, rgba_t const &_c2, vec2_t const &_p3,
                   vec2_t const &_t3, rgba_t const &_c3) override;
    void set_clip_rect(vec2_t const &_position, vec2_t const &_size) override;
    void push_clip_rect() override;
    void pop_clip_rect() override;
    void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                   float _width) override;

    std::vector<SRenderCall> const &calls() const { return m_calls; }
    void clear() { m_calls.clear(); }
    // The operations' names in order, joined by blanks: a quick view of a call sequence.
    std::string sequence() const;

private:
    SRenderCall &record(char const *_op);

    IRenderQOR *mp_target;
    std::vector<SRenderCall> m_calls;
    int m_next_handle = 0;
};

} // namespace qorhost
