// The cheapest engine renderer that still takes every vertex: each quad's four vertices are
// copied into a buffer reserved once, as an engine fills its vertex buffer; nothing is rasterised.
#pragma once
#include "qor_render.h"

#include <vector>

class CVertexCopyRenderer : public IRenderQOR {
public:
    struct SVertex {
        vec2_t m_pos, m_tex;
        rgba_t m_color;
    };

    CVertexCopyRenderer() : m_vertices(1 << 18) {}

    SInterfaceUID get_uid() const override { return qor_uid::RENDER; }
    int get_version() const override { return 1; }
    void render_view(IRenderCamera *) override {}
    void finish_view() override {}
    void present() override {}
    int create_material(char const *, char const *, char const *, char const *, char const *, char const *,
                        bool, bool) override {
        return m_next_handle++;
    }
    void destroy_material(int) override {}
    IAviTexture *get_avi_texture(int) override { return nullptr; }
    void begin_2d() override {
        m_count = 0;
        m_materials_set = m_clips_set = 0;
    }
    void end_2d() override {}
    void set_material(int _handle) override {
        m_material = _handle;
        ++m_materials_set;
    }
    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                   vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                   rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) override {
        if (m_count + 4 > m_vertices.size()) return; // never grows inside a frame
        SVertex *p_vertex = &m_vertices[m_count];
        p_vertex[0] = SVertex{_p0, _t0, _c0};
        p_vertex[1] = SVertex{_p1, _t1, _c1};
        p_vertex[2] = SVertex{_p2, _t2, _c2};
        p_vertex[3] = SVertex{_p3, _t3, _c3};
        m_count += 4;
    }
    void set_clip_rect(vec2_t const &, vec2_t const &) override { ++m_clips_set; }
    void push_clip_rect() override {}
    void pop_clip_rect() override {}
    void draw_line(vec2_t const &, rgba_t const &, vec2_t const &, rgba_t const &, float) override {}

    // Of the frame since the last begin_2d.
    size_t quads() const { return m_count / 4; }
    size_t materials_set() const { return m_materials_set; }
    size_t clips_set() const { return m_clips_set; }

private:
    std::vector<SVertex> m_vertices; // sized once
    size_t m_count = 0;              // of the frame
    int m_next_handle = 1;
    int m_material = -1;
    size_t m_materials_set = 0;
    size_t m_clips_set = 0;
};
