// The software renderer.
//
//   materials and textures   ui_color, ui_image, textures by folder, the missing texture's checker
//   clip                     the clip rectangle and its stack
//   drawing                  quads by the top-left rule, alpha blending, lines
#include "software_renderer.h"

#include "qordebug.h"

#include <algorithm>
#include <limits>
#include <cmath>

namespace qorhost {

CSoftwareRenderer::CSoftwareRenderer(int _w, int _h) {
    m_frame.m_w = _w > 0 ? _w : 1;
    m_frame.m_h = _h > 0 ? _h : 1;
    m_frame.m_pixels.assign(static_cast<size_t>(m_frame.m_w) * m_frame.m_h * 4, 0);
    m_clip = full_clip();
    begin_frame(rgba_t(0, 0, 0, 255));
}

void CSoftwareRenderer::begin_frame(rgba_t const &_clear) {
    for (size_t i = 0; i < m_frame.m_pixels.size(); i += 4) {
        m_frame.m_pixels[i] = _clear.r;
        m_frame.m_pixels[i + 1] = _clear.g;
        m_frame.m_pixels[i + 2] = _clear.b;
        m_frame.m_pixels[i + 3] = _clear.a;
    }
    m_clip = full_clip();
    m_clip_stack.clear();
}

void CSoftwareRenderer::present() {
    if (m_sink) m_sink(m_frame, m_presented);
    ++m_presented;
}

// There is no 3D scene in this host: a view only counts.
void CSoftwareRenderer::render_view(IRenderCamera *) {
    ++m_views_rendered;
}

// ---------------------------------------------------------------------------------------------
// Materials and textures
// ---------------------------------------------------------------------------------------------

int CSoftwareRenderer::create_material(char const *_material_template, char const *_diffuse, char const *,
                                       char const *, char const *, char const *, bool, bool) {
    std::string const name = _material_template ? _material_template : "";
    SMaterial material = {false, nullptr};
    if (name == "ui_image") {
        material.m_textured = true;
        material.mp_texture = texture(_diffuse ? _diffuse : "");
    } else if (name != "ui_color") {
        qordebug::warning("Unknown material template '%s'; drawn as ui_color", name.c_str());
    }
    int const handle = m_next_handle++;
    m_materials[handle] = material;
    return handle;
}

void CSoftwareRenderer::destroy_material(int _handle) {
    m_materials.erase(_handle);
}

CSoftwareRenderer::SMaterial const *CSoftwareRenderer::current_material() const {
    auto found = m_materials.find(m_material);
    return found == m_materials.end() ? nullptr : &found->second;
}

// Textures are shared by name. A missing one is an 8 by 8 checker of magenta and black, so that
// it shows.
std::shared_ptr<SImage> CSoftwareRenderer::texture(std::string const &_name) {
    auto found = m_textures.find(_name);
    if (found != m_textures.end()) return found->second;
    auto p_image = std::make_shared<SImage>();
    bool loaded = false;
    for (std::string const &folder : m_texture_folders)
        if (!_name.empty() && load_image(folder + "/" + _name, *p_image)) {
            loaded = true;
            break;
        }
    if (!loaded && !_name.empty() && load_image(_name, *p_image)) loaded = true;
    if (!loaded) {
        qordebug::warning("Cannot load texture '%s'", _name.c_str());
        p_image->m_w = p_image->m_h = 8;
        p_image->m_pixels.resize(8 * 8 * 4);
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 8; ++x) {
                uint8_t *p = p_image->pixel(x, y);
                bool const lit = ((x / 4) + (y / 4)) % 2 == 0;
                p[0] = lit ? 255 : 0, p[1] = 0, p[2] = lit ? 255 : 0, p[3] = 255;
            }
    }
    m_textures[_name] = p_image;
    return p_image;
}

// ---------------------------------------------------------------------------------------------
// Clip
// ---------------------------------------------------------------------------------------------

// Position is the lower left corner in device coordinates, size in device units.
void CSoftwareRenderer::set_clip_rect(vec2_t const &_position, vec2_t const &_size) {
    float const w = static_cast<float>(m_frame.m_w);
    float const h = static_cast<float>(m_frame.m_h);
    SClipRect clip;
    clip.m_x0 = trunc_to_int(std::round((_position.x + 1.0f) * 0.5f * w));
    clip.m_x1 = trunc_to_int(std::round((_position.x + _size.x + 1.0f) * 0.5f * w));
    clip.m_y0 = trunc_to_int(std::round((1.0f - (_position.y + _size.y)) * 0.5f * h));
    clip.m_y1 = trunc_to_int(std::round((1.0f - _position.y) * 0.5f * h));
    clip.m_x0 = std::clamp(clip.m_x0, 0, m_frame.m_w);
    clip.m_x1 = std::clamp(clip.m_x1, clip.m_x0, m_frame.m_w);
    clip.m_y0 = std::clamp(clip.m_y0, 0, m_frame.m_h);
    clip.m_y1 = std::clamp(clip.m_y1, clip.m_y0, m_frame.m_h);
    m_clip = clip;
}

void CSoftwareRenderer::push_clip_rect() {
    m_clip_stack.push_back(m_clip);
}

void CSoftwareRenderer::pop_clip_rect() {
    if (m_clip_stack.empty()) {
        qordebug::warning("pop_clip_rect without a push; the clip is the whole frame again");
        m_clip = full_clip();
        return;
    }
    m_clip = m_clip_stack.back();
    m_clip_stack.pop_back();
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

namespace {
// Positions snap to 1/256 of a pixel, so that the float noise of the device conversion can't put
// a pixel centre on a shared edge outside both triangles of a quad.
float snap(float _pixels) {
    return std::round(_pixels * 256.0f) / 256.0f;
}
} // namespace

CSoftwareRenderer::SVertex CSoftwareRenderer::to_vertex(vec2_t const &_p, vec2_t const &_t,
                                                        rgba_t const &_c) const {
    return SVertex{snap((_p.x + 1.0f) * 0.5f * m_frame.m_w),
                   snap((1.0f - _p.y) * 0.5f * m_frame.m_h),
                   _t.x,
                   _t.y,
                   {float(_c.r), float(_c.g), float(_c.b), float(_c.a)}};
}

void CSoftwareRenderer::draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                                  vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                                  rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3,
                                  rgba_t const &_c3) {
    SVertex const v0 = to_vertex(_p0, _t0, _c0);
    SVertex const v1 = to_vertex(_p1, _t1, _c1);
    SVertex const v2 = to_vertex(_p2, _t2, _c2);
    SVertex const v3 = to_vertex(_p3, _t3, _c3);
    SMaterial const *p_material = current_material();
    draw_triangle(v0, v1, v2, p_material);
    draw_triangle(v0, v2, v3, p_material);
}

namespace {
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

void CSoftwareRenderer::draw_triangle(SVertex const &_a, SVertex const &_b, SVertex const &_c,
                                      SMaterial const *_p_material) {
    SVertex const *p0 = &_a, *p1 = &_b, *p2 = &_c;
    float area = edge(p0->m_x, p0->m_y, p1->m_x, p1->m_y, p2->m_x, p2->m_y);
    if (area == 0.0f) return;
    if (area < 0.0f) {
        std::swap(p1, p2);
        area = -area;
    }
    int const x0 = std::max(m_clip.m_x0, trunc_to_int(std::floor(std::min({p0->m_x, p1->m_x, p2->m_x}))));
    int const x1 = std::min(m_clip.m_x1, trunc_to_int(std::ceil(std::max({p0->m_x, p1->m_x, p2->m_x}))));
    int const y0 = std::max(m_clip.m_y0, trunc_to_int(std::floor(std::min({p0->m_y, p1->m_y, p2->m_y}))));
    int const y1 = std::min(m_clip.m_y1, trunc_to_int(std::ceil(std::max({p0->m_y, p1->m_y, p2->m_y}))));
    bool const top_left0 = is_top_left(p1->m_x, p1->m_y, p2->m_x, p2->m_y);
    bool const top_left1 = is_top_left(p2->m_x, p2->m_y, p0->m_x, p0->m_y);
    bool const top_left2 = is_top_left(p0->m_x, p0->m_y, p1->m_x, p1->m_y);

    for (int y = y0; y < y1; ++y) {
        float const py = y + 0.5f;
        for (int x = x0; x < x1; ++x) {
            float const px = x + 0.5f;
            float const w0 = edge(p1->m_x, p1->m_y, p2->m_x, p2->m_y, px, py);
            float const w1 = edge(p2->m_x, p2->m_y, p0->m_x, p0->m_y, px, py);
            float const w2 = edge(p0->m_x, p0->m_y, p1->m_x, p1->m_y, px, py);
            bool const inside = (w0 > 0 || (w0 == 0 && top_left0)) && (w1 > 0 || (w1 == 0 && top_left1)) &&
                                (w2 > 0 || (w2 == 0 && top_left2));
            if (!inside) continue;
            float const b0 = w0 / area, b1 = w1 / area, b2 = w2 / area;
            float rgba[4];
            for (int i = 0; i < 4; ++i)
                rgba[i] = b0 * p0->m_rgba[i] + b1 * p1->m_rgba[i] + b2 * p2->m_rgba[i];
            float const u = b0 * p0->m_u + b1 * p1->m_u + b2 * p2->m_u;
            float const v = b0 * p0->m_v + b1 * p1->m_v + b2 * p2->m_v;
            blend(x, y, rgba, _p_material, u, v);
        }
    }
}

// The colour is the texel times the vertex colour; it goes over the frame by its alpha.
void CSoftwareRenderer::blend(int _x, int _y, float const *_rgba, SMaterial const *_p_material, float _u,
                              float _v) {
    float source[4] = {_rgba[0], _rgba[1], _rgba[2], _rgba[3]};
    if (_p_material && _p_material->m_textured && _p_material->mp_texture) {
        SImage const &texture = *_p_material->mp_texture;
        int const tx = std::clamp(trunc_to_int(std::floor(_u * texture.m_w)), 0, texture.m_w - 1);
        int const ty = std::clamp(trunc_to_int(std::floor(_v * texture.m_h)), 0, texture.m_h - 1);
        uint8_t const *texel = texture.pixel(tx, ty);
        for (int i = 0; i < 4; ++i)
            source[i] = source[i] * texel[i] / 255.0f;
    }
    uint8_t *p = m_frame.pixel(_x, _y);
    float const alpha = std::clamp(source[3], 0.0f, 255.0f) / 255.0f;
    for (int i = 0; i < 3; ++i) {
        float const value = std::clamp(source[i], 0.0f, 255.0f) * alpha + p[i] * (1.0f - alpha);
        p[i] = static_cast<uint8_t>(std::lround(value));
    }
    p[3] = static_cast<uint8_t>(std::lround(alpha * 255.0f + p[3] * (1.0f - alpha)));
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
    SMaterial const ui_color = {false, nullptr};
    for (long long i = first; i <= last; ++i) {
        // In double: far ends need more than a float's digits to land on the right pixel.
        double const t = steps > 0.0 ? static_cast<double>(i) / steps : 0.0;
        int const x = trunc_to_int(std::round(ax + (bx - ax) * t));
        int const y = trunc_to_int(std::round(ay + (by - ay) * t));
        if (x < m_clip.m_x0 || x >= m_clip.m_x1 || y < m_clip.m_y0 || y >= m_clip.m_y1) continue;
        float rgba[4];
        for (int c = 0; c < 4; ++c)
            rgba[c] = a.m_rgba[c] + (b.m_rgba[c] - a.m_rgba[c]) * static_cast<float>(t);
        blend(x, y, rgba, &ui_color, 0.0f, 0.0f);
    }
}

} // namespace qorhost
