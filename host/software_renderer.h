// The host's software renderer: an RGBA frame of the screen's size that textured, vertex-coloured
// quads and lines are drawn into, with the clip rectangle and straight-alpha blending; the host
// writes each presented frame as a PNG file. It is the reference that golden images are made
// with: the same calls give the same bytes.
//
// Pixels are sampled at their centres; a pixel whose centre lies on a shared edge belongs to one
// triangle only (top-left rule). Textures are sampled at the nearest texel, so a picture drawn at
// its own size is copied exactly. Axis-aligned rectangles, nearly all that an interface draws, are
// filled by spans in whole numbers, with the bytes that their triangles give.
#pragma once
#include "host_renderer.h"

#include <vector>

namespace qorhost {

class CSoftwareRenderer : public CHostRenderer {
public:
    CSoftwareRenderer(int _w, int _h);

    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                   vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                   rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) override;
    void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                   float _width) override;

    SImage const &get_frame() const { return m_frame; }

protected:
    void clear(rgba_t const &_clear) override;
    SImage const &picture() override { return m_frame; }
    void show() override {}

private:
    struct SVertex {
        float m_x, m_y; // pixels
        float m_u, m_v;
        float m_rgba[4];
    };
    struct STriangle {
        SVertex const *mp_v[3]; // wound so that the area is positive
        float m_area;
        bool m_top_left[3]; // of the edge opposite each vertex
    };

    SVertex to_vertex(vec2_t const &_p, vec2_t const &_t, rgba_t const &_c) const;
    static bool make_triangle(SVertex const &_a, SVertex const &_b, SVertex const &_c, STriangle &_triangle);
    static bool covers(STriangle const &_triangle, int _x, int _y, float (&_w)[3]);
    void draw_triangle(STriangle const &_triangle, SImage const *_p_texture);
    void shade(int _x, int _y, STriangle const &_triangle, float const (&_w)[3], SImage const *_p_texture);
    static void blend(uint8_t *_p, float const *_rgba, SImage const *_p_texture, float _u, float _v);
    bool fill_rect(SVertex const (&_v)[4], STriangle const (&_halves)[2], SImage const *_p_texture);
    void fill_span_rows(int _x0, int _x1, int _y0, int _y1, int const (&_colour)[4]);
    void shade_in_halves(int _x, int _y, STriangle const (&_halves)[2], SImage const *_p_texture);

    SImage m_frame;
    std::vector<int> m_columns, m_rows; // a rectangle's texels by pixel column and row; -1 where unsure
};

} // namespace qorhost
