// The software renderer.
//
//   frame                    the RGBA frame and its clear
//   triangles                quads by the top-left rule, alpha blending, lines
//   rectangles               spans of axis-aligned quads in whole numbers, with the same bytes
#include "software_renderer.h"

#include "qordebug.h"

#include <algorithm>
#include <cmath>
#include <cstring>
#include <limits>

namespace qorhost {

namespace {

// Every pixel of a run set to one colour.
void fill_pixels(uint8_t *_p, size_t _count, uint8_t const (&_rgba)[4]) {
    uint32_t word;
    std::memcpy(&word, _rgba, 4);
    for (size_t i = 0; i < _count; ++i)
        std::memcpy(_p + i * 4, &word, 4);
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Frame
// ---------------------------------------------------------------------------------------------

CSoftwareRenderer::CSoftwareRenderer(int _w, int _h) : CHostRenderer(_w, _h) {
    m_frame.m_w = get_w();
    m_frame.m_h = get_h();
    m_frame.m_pixels.assign(static_cast<size_t>(m_frame.m_w) * m_frame.m_h * 4, 0);
    begin_frame(rgba_t(0, 0, 0, 255));
}

void CSoftwareRenderer::clear(rgba_t const &_clear) {
    uint8_t const clear[4] = {_clear.r, _clear.g, _clear.b, _clear.a};
    fill_pixels(m_frame.m_pixels.data(), m_frame.m_pixels.size() / 4, clear);
}

// ---------------------------------------------------------------------------------------------
// Triangles
// ---------------------------------------------------------------------------------------------

namespace {
// Positions snap to 1/256 of a pixel, so that the float noise of the device conversion can't put
// a pixel centre on a shared edge outside both triangles of a quad.
float snap(float _pixels) {
    return std::round(_pixels * 256.0f) / 256.0f;
}

// Rounds a value of 0 or more to the nearest whole number, halves up, as lround does: in double
// the float and the half add without rounding.
uint8_t round_to_byte(float _value) {
    return static_cast<uint8_t>(static_cast<double>(_value) + 0.5);
}

// A whole pixel position held to the clip's range _low to _high, taken in float first so that a
// position far off the frame doesn't overflow an int.
int in_clip(float _pixel, int _low, int _high) {
    return static_cast<int>(std::clamp(_pixel, static_cast<float>(_low), static_cast<float>(_high)));
}

// In double: with snapped positions the products are exact, so the fill rule decides every tie.
float edge(double _ax, double _ay, double _bx, double _by, double _px, double _py) {
    double const value = (_bx - _ax) * (_py - _ay) - (_by - _ay) * (_px - _ax);
    return value > 0.0   ? std::max(static_cast<float>(value), std::numeric_limits<float>::min())
           : value < 0.0 ? std::min(static_cast<float>(value), -std::numeric_limits<float>::min())
                         : 0.0f;
}
// Top-left rule for a triangle wound so that its area is positive (clockwise on screen, y down):
// a top edge is horizontal and runs right, a left edge runs up.
bool is_top_left(float _ax, float _ay, float _bx, float _by) {
    return (_ay == _by && _bx > _ax) || (_by < _ay);
}
} // namespace

CSoftwareRenderer::SVertex CSoftwareRenderer::to_vertex(vec2_t const &_p, vec2_t const &_t,
                                                        rgba_t const &_c) const {
    return SVertex{snap(pixel_x(_p.x)),
                   snap(pixel_y(_p.y)),
                   _t.x,
                   _t.y,
                   {float(_c.r), float(_c.g), float(_c.b), float(_c.a)}};
}

void CSoftwareRenderer::draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                                  vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                                  rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3,
                                  rgba_t const &_c3) {
    SVertex const v[4] = {to_vertex(_p0, _t0, _c0), to_vertex(_p1, _t1, _c1), to_vertex(_p2, _t2, _c2),
                          to_vertex(_p3, _t3, _c3)};
    SImage const *p_texture = current_texture();
    STriangle halves[2];
    bool const first = make_triangle(v[0], v[1], v[2], halves[0]);
    bool const second = make_triangle(v[0], v[2], v[3], halves[1]);
    if (first && second && fill_rect(v, halves, p_texture)) return;
    if (first) draw_triangle(halves[0], p_texture);
    if (second) draw_triangle(halves[1], p_texture);
}

// Wound so that the area is positive; false for a triangle of no area.
bool CSoftwareRenderer::make_triangle(SVertex const &_a, SVertex const &_b, SVertex const &_c,
                                      STriangle &_triangle) {
    SVertex const *p0 = &_a, *p1 = &_b, *p2 = &_c;
    float area = edge(p0->m_x, p0->m_y, p1->m_x, p1->m_y, p2->m_x, p2->m_y);
    if (area == 0.0f || std::isnan(area)) return false;
    if (area < 0.0f) {
        std::swap(p1, p2);
        area = -area;
    }
    _triangle.mp_v[0] = p0, _triangle.mp_v[1] = p1, _triangle.mp_v[2] = p2;
    _triangle.m_area = area;
    _triangle.m_top_left[0] = is_top_left(p1->m_x, p1->m_y, p2->m_x, p2->m_y);
    _triangle.m_top_left[1] = is_top_left(p2->m_x, p2->m_y, p0->m_x, p0->m_y);
    _triangle.m_top_left[2] = is_top_left(p0->m_x, p0->m_y, p1->m_x, p1->m_y);
    return true;
}

// Whether the centre of pixel (_x, _y) is the triangle's, with its edge functions in _w.
bool CSoftwareRenderer::covers(STriangle const &_triangle, int _x, int _y, float (&_w)[3]) {
    float const px = _x + 0.5f, py = _y + 0.5f;
    for (int i = 0; i < 3; ++i) {
        SVertex const &a = *_triangle.mp_v[(i + 1) % 3], &b = *_triangle.mp_v[(i + 2) % 3];
        _w[i] = edge(a.m_x, a.m_y, b.m_x, b.m_y, px, py);
        if (!(_w[i] > 0 || (_w[i] == 0 && _triangle.m_top_left[i]))) return false;
    }
    return true;
}

void CSoftwareRenderer::draw_triangle(STriangle const &_triangle, SImage const *_p_texture) {
    SVertex const *const *v = _triangle.mp_v;
    int const x0 = in_clip(std::floor(std::min({v[0]->m_x, v[1]->m_x, v[2]->m_x})), m_clip.m_x0, m_clip.m_x1);
    int const x1 = in_clip(std::ceil(std::max({v[0]->m_x, v[1]->m_x, v[2]->m_x})), m_clip.m_x0, m_clip.m_x1);
    int const y0 = in_clip(std::floor(std::min({v[0]->m_y, v[1]->m_y, v[2]->m_y})), m_clip.m_y0, m_clip.m_y1);
    int const y1 = in_clip(std::ceil(std::max({v[0]->m_y, v[1]->m_y, v[2]->m_y})), m_clip.m_y0, m_clip.m_y1);
    float w[3];
    for (int y = y0; y < y1; ++y)
        for (int x = x0; x < x1; ++x)
            if (covers(_triangle, x, y, w)) shade(x, y, _triangle, w, _p_texture);
}

// The vertices' colour and texture coordinates at the pixel by its edge functions, blended.
void CSoftwareRenderer::shade(int _x, int _y, STriangle const &_triangle, float const (&_w)[3],
                              SImage const *_p_texture) {
    SVertex const *const *v = _triangle.mp_v;
    float const b0 = _w[0] / _triangle.m_area, b1 = _w[1] / _triangle.m_area, b2 = _w[2] / _triangle.m_area;
    float rgba[4];
    for (int i = 0; i < 4; ++i)
        rgba[i] = b0 * v[0]->m_rgba[i] + b1 * v[1]->m_rgba[i] + b2 * v[2]->m_rgba[i];
    float const u = b0 * v[0]->m_u + b1 * v[1]->m_u + b2 * v[2]->m_u;
    float const t = b0 * v[0]->m_v + b1 * v[1]->m_v + b2 * v[2]->m_v;
    blend(m_frame.pixel(_x, _y), rgba, _p_texture, u, t);
}

// The colour is the texel times the vertex colour; it goes over the frame by its alpha.
void CSoftwareRenderer::blend(uint8_t *_p, float const *_rgba, SImage const *_p_texture, float _u, float _v) {
    float source[4] = {_rgba[0], _rgba[1], _rgba[2], _rgba[3]};
    if (_p_texture) {
        SImage const &texture = *_p_texture;
        int const tx = std::clamp(trunc_to_int(std::floor(_u * texture.m_w)), 0, texture.m_w - 1);
        int const ty = std::clamp(trunc_to_int(std::floor(_v * texture.m_h)), 0, texture.m_h - 1);
        uint8_t const *texel = texture.pixel(tx, ty);
        for (int i = 0; i < 4; ++i)
            source[i] = source[i] * texel[i] / 255.0f;
    }
    float const alpha = std::clamp(source[3], 0.0f, 255.0f) / 255.0f;
    for (int i = 0; i < 3; ++i)
        _p[i] = round_to_byte(std::clamp(source[i], 0.0f, 255.0f) * alpha + _p[i] * (1.0f - alpha));
    _p[3] = round_to_byte(alpha * 255.0f + _p[3] * (1.0f - alpha));
}

// A one-pixel line from centre to centre, its colour interpolated along it.
void CSoftwareRenderer::draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to,
                                  rgba_t const &_c_to, float) {
    SVertex const a = to_vertex(_from, vec2_t{0, 0}, _c_from);
    SVertex const b = to_vertex(_to, vec2_t{0, 0}, _c_to);
    float const ax = std::floor(a.m_x), ay = std::floor(a.m_y);
    float const bx = std::floor(b.m_x), by = std::floor(b.m_y);
    double const steps = std::max(std::fabs(bx - ax), std::fabs(by - ay));
    // Only the steps that come near the clip: a line from far outside costs what it shows.
    double t_lo = 0.0, t_hi = 1.0;
    auto keep_within = [&t_lo, &t_hi](double _from, double _to, int _low, int _high) {
        double const d = _to - _from;
        if (d == 0.0) {
            if (_from < _low - 1 || _from > _high + 1) t_hi = -1.0;
            return;
        }
        double const t0 = (_low - 1 - _from) / d, t1 = (_high + 1 - _from) / d;
        t_lo = std::max(t_lo, std::min(t0, t1));
        t_hi = std::min(t_hi, std::max(t0, t1));
    };
    keep_within(ax, bx, m_clip.m_x0, m_clip.m_x1);
    keep_within(ay, by, m_clip.m_y0, m_clip.m_y1);
    if (!(t_lo <= t_hi)) return;
    long long const first = static_cast<long long>(std::floor(t_lo * steps));
    long long const last = static_cast<long long>(std::ceil(t_hi * steps));
    for (long long i = first; i <= last; ++i) {
        // In double: far ends need more than a float's digits to land on the right pixel.
        double const t = steps > 0.0 ? static_cast<double>(i) / steps : 0.0;
        int const x = trunc_to_int(std::round(ax + (bx - ax) * t));
        int const y = trunc_to_int(std::round(ay + (by - ay) * t));
        if (x < m_clip.m_x0 || x >= m_clip.m_x1 || y < m_clip.m_y0 || y >= m_clip.m_y1) continue;
        float rgba[4];
        for (int c = 0; c < 4; ++c)
            rgba[c] = a.m_rgba[c] + (b.m_rgba[c] - a.m_rgba[c]) * static_cast<float>(t);
        blend(m_frame.pixel(x, y), rgba, nullptr, 0.0f, 0.0f);
    }
}

// ---------------------------------------------------------------------------------------------
// Rectangles
// ---------------------------------------------------------------------------------------------
//
// Nearly every quad of an interface is a rectangle on the pixel grid of one colour, its texture
// laid along the axes. Its two triangles then cover the pixel centres from its left and top edges
// up to, not including, its right and bottom edges, each once, and a texture column (row) depends
// on the pixel's column (row) alone. Such a quad is drawn by spans, with the texel of each column
// and row looked up once.
//
// The bytes stay those of the triangles: where the colour and the texel multiply to whole numbers
// over 255, the blend is done in whole numbers, rounded to the nearest. The float blend lies within
// a thousandth of the true value, and a whole number over 255 is never nearer than 1/510 to a half,
// so both round alike. A pixel whose product isn't whole, or whose texture coordinate lies so near
// a texel's edge that float noise might pick either texel, goes through the triangles' own path.

namespace {

// The texel of a coordinate at each pixel centre from _first on, or -1 where the coordinate lies
// within float noise of a texel's edge. The coordinate is _t_a at position _a and _t_b at _b.
void texels_along(double _a, double _t_a, double _b, double _t_b, int _first, int _count, int _texels,
                  std::vector<int> &_out) {
    double const scale = (_t_b - _t_a) / (_b - _a);
    double const noise = 1e-5 * _texels * std::max({1.0, std::fabs(_t_a), std::fabs(_t_b)});
    _out.resize(static_cast<size_t>(std::max(_count, 0)));
    for (int i = 0; i < _count; ++i) {
        double const texel = (_t_a + (_first + i + 0.5 - _a) * scale) * _texels;
        double const nearest = std::round(texel);
        _out[i] = std::fabs(texel - nearest) < noise
                      ? -1
                      : std::clamp(static_cast<int>(std::floor(texel)), 0, _texels - 1);
    }
}

// A source of whole channel values over the pixel by a whole alpha, rounded to the nearest.
void blend_whole(uint8_t *_p, int const (&_source)[4]) {
    int const alpha = _source[3], keep = 255 - alpha;
    if (alpha == 0) return;
    if (alpha == 255) {
        _p[0] = uint8_t(_source[0]), _p[1] = uint8_t(_source[1]), _p[2] = uint8_t(_source[2]), _p[3] = 255;
        return;
    }
    for (int i = 0; i < 3; ++i)
        _p[i] = static_cast<uint8_t>((_source[i] * alpha + _p[i] * keep + 127) / 255);
    _p[3] = static_cast<uint8_t>((255 * alpha + _p[3] * keep + 127) / 255);
}

// The colour times the texel in whole numbers; false when a channel's product isn't whole. White
// leaves the texel as it is.
bool tint_whole(int const (&_colour)[4], bool _white, uint8_t const *_texel, int (&_source)[4]) {
    if (_white) {
        std::copy(_texel, _texel + 4, _source);
        return true;
    }
    for (int i = 0; i < 4; ++i) {
        int const product = _colour[i] * _texel[i];
        if (product % 255) return false;
        _source[i] = product / 255;
    }
    return true;
}

} // namespace

// False, with nothing drawn, for a quad that isn't an axis-aligned rectangle of one colour with
// its texture along the axes.
bool CSoftwareRenderer::fill_rect(SVertex const (&_v)[4], STriangle const (&_halves)[2],
                                  SImage const *_p_texture) {
    // Corners in turn share x and y alternately, and with them the texture's u and v; whether the
    // first two share x tells which comes first.
    bool const textured = _p_texture != nullptr;
    int const across = _v[0].m_x == _v[1].m_x ? 1 : 0;
    for (int i = 0; i < 4; ++i) {
        SVertex const &a = _v[i], &b = _v[(i + 1) % 4];
        bool const shared = (i + across) % 2 == 1 ? a.m_x == b.m_x && (!textured || a.m_u == b.m_u)
                                                  : a.m_y == b.m_y && (!textured || a.m_v == b.m_v);
        if (!shared || !std::equal(a.m_rgba, a.m_rgba + 4, b.m_rgba)) return false;
    }
    SVertex const &left = _v[0].m_x < _v[2].m_x ? _v[0] : _v[2], &right = &left == &_v[0] ? _v[2] : _v[0];
    SVertex const &top = _v[0].m_y < _v[2].m_y ? _v[0] : _v[2], &bottom = &top == &_v[0] ? _v[2] : _v[0];
    // Pixel centres from the left and top edges up to the right and bottom ones.
    int const x0 = in_clip(std::ceil(left.m_x - 0.5f), m_clip.m_x0, m_clip.m_x1);
    int const x1 = in_clip(std::ceil(right.m_x - 0.5f), m_clip.m_x0, m_clip.m_x1);
    int const y0 = in_clip(std::ceil(top.m_y - 0.5f), m_clip.m_y0, m_clip.m_y1);
    int const y1 = in_clip(std::ceil(bottom.m_y - 0.5f), m_clip.m_y0, m_clip.m_y1);
    if (x0 >= x1 || y0 >= y1) return true;

    int const colour[4] = {int(_v[0].m_rgba[0]), int(_v[0].m_rgba[1]), int(_v[0].m_rgba[2]),
                           int(_v[0].m_rgba[3])};
    if (!textured) {
        fill_span_rows(x0, x1, y0, y1, colour);
        return true;
    }
    bool const white = colour[0] == 255 && colour[1] == 255 && colour[2] == 255 && colour[3] == 255;
    texels_along(left.m_x, left.m_u, right.m_x, right.m_u, x0, x1 - x0, _p_texture->m_w, m_columns);
    texels_along(top.m_y, top.m_v, bottom.m_y, bottom.m_v, y0, y1 - y0, _p_texture->m_h, m_rows);
    for (int y = y0; y < y1; ++y) {
        int const ty = m_rows[y - y0];
        uint8_t *p = m_frame.pixel(x0, y);
        for (int x = x0; x < x1; ++x, p += 4) {
            int const tx = m_columns[x - x0];
            int source[4];
            if (tx >= 0 && ty >= 0 && tint_whole(colour, white, _p_texture->pixel(tx, ty), source))
                blend_whole(p, source);
            else
                shade_in_halves(x, y, _halves, _p_texture);
        }
    }
    return true;
}

// Rows of one whole colour: copied where it is opaque, blended where it isn't, left where it is
// clear.
void CSoftwareRenderer::fill_span_rows(int _x0, int _x1, int _y0, int _y1, int const (&_colour)[4]) {
    if (_colour[3] == 0) return;
    for (int y = _y0; y < _y1; ++y) {
        uint8_t *p = m_frame.pixel(_x0, y);
        if (_colour[3] == 255) {
            uint8_t const rgba[4] = {uint8_t(_colour[0]), uint8_t(_colour[1]), uint8_t(_colour[2]), 255};
            fill_pixels(p, static_cast<size_t>(_x1 - _x0), rgba);
            continue;
        }
        for (int x = _x0; x < _x1; ++x, p += 4)
            blend_whole(p, _colour);
    }
}

// A pixel of a rectangle through whichever of its triangles has it.
void CSoftwareRenderer::shade_in_halves(int _x, int _y, STriangle const (&_halves)[2],
                                        SImage const *_p_texture) {
    float w[3];
    for (STriangle const &half : _halves)
        if (covers(half, _x, _y, w)) return shade(_x, _y, half, w, _p_texture);
}

} // namespace qorhost
