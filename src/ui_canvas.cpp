// The canvas of a visual window.
//
//   lines and rectangles   plain, tiled and nine-patch materials, faded by the window
//   text                   one quad per character, colour tags, texts of many lines, measuring
#include "ui_canvas.h"
#include "qordebug.h"
#include "ui_debug.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"
#include "ui_string.h"
#include "ui_text.h"

#include <algorithm>
#include <climits>
#include <cmath>

namespace qorui {

namespace {

// Pixels farther out than this are on no screen: sizes and pens from data are held within it, so
// that the sums of positions stay inside int.
float const k_far_pixels = 268435456.0f; // 2^28

// A size or position in float to pixels, cut toward zero and held within k_far_pixels.
int to_pixels(float _v) {
    return trunc_to_int(std::clamp(_v, -k_far_pixels, k_far_pixels));
}

// The range [_first, _last) of the tiles of size _tile from _start that meet the visible span
// [_from, _to), of _count tiles in all.
void visible_tiles(int _start, int _tile, int _count, int _from, int _to, int &_first, int &_last) {
    long long const from = std::max<long long>(_from - static_cast<long long>(_start), 0);
    long long const to =
        std::min<long long>(_to - static_cast<long long>(_start), static_cast<long long>(_count) * _tile);
    _first = static_cast<int>(from / _tile);
    _last = to > from ? static_cast<int>((to + _tile - 1) / _tile) : _first;
}

// A character's width in pixels at a font size: 0 for a charset without characters.
int char_width(CCharset const &_charset, unsigned short _ch, float _size) {
    CCharset::SChar const *p_char = _charset.get_char_description(_ch);
    return p_char ? to_pixels(p_char->w * _size) : 0;
}

// Whether a quad of those edges, in any order, has a part inside the area.
bool meets(SPixelRect const &_area, int _l, int _t, int _r, int _b) {
    return std::max(_l, _r) > _area.m_l && std::min(_l, _r) < _area.m_r && std::max(_t, _b) > _area.m_t &&
           std::min(_t, _b) < _area.m_b;
}

bool is_scan_space(unsigned short _c) {
    return _c == ' ' || (_c >= '\t' && _c <= '\r');
}

// One number of "%u" from _k on, as the standard scan reads it: blanks, a sign, decimal digits; a
// minus negates the value, and one too large for unsigned long is its greatest value, whatever the
// sign. The low bits land in _value. False when no digit stands there.
bool scan_unsigned(CString const &_string, size_t &_k, unsigned &_value) {
    size_t const length = _string.length();
    while (_k < length && is_scan_space(_string[_k]))
        ++_k;
    bool const negative = _k < length && _string[_k] == '-';
    if (_k < length && (_string[_k] == '-' || _string[_k] == '+')) ++_k;
    size_t const first_digit = _k;
    unsigned long value = 0;
    bool too_large = false;
    unsigned long const limit = static_cast<unsigned long>(-1);
    for (; _k < length && _string[_k] >= '0' && _string[_k] <= '9'; ++_k) {
        unsigned const digit = _string[_k] - '0';
        too_large = too_large || value > (limit - digit) / 10;
        value = value * 10 + digit;
    }
    if (_k == first_digit) return false;
    _value = static_cast<unsigned>(too_large ? limit : negative ? 0 - value : value);
    return true;
}

} // namespace

CCanvas::CCanvas(ICanvasOwner *_p_owner) : mp_owner(_p_owner), m_tags_enable(true) {}

IRender *CCanvas::get_render() const {
    IRender *p_render = mp_owner ? mp_owner->get_canvas_render() : nullptr;
    QOR_CHECK_AS(p_render, "mp_owner && mp_owner->mp_desktop && mp_owner->mp_desktop->mp_render");
    return p_render;
}

point_t CCanvas::origin() const {
    return mp_owner ? mp_owner->get_canvas_origin() : point_t{0, 0};
}

// Colour and alpha alike: a window fading out darkens while it goes transparent.
void CCanvas::fade_color(rgba_t &_color) const {
    if (!QOR_CHECK(mp_owner)) return;
    float const f = mp_owner->get_transparency();
    if (f >= 1.0f) return;
    _color = _color * f;
}

void CCanvas::set_clip_area(int _x, int _y, int _w, int _h) {
    point_t const o = origin();
    if (IRender *p_render = get_render()) p_render->set_clip_area(_x + o.x, _y + o.y, _w, _h);
}

void CCanvas::set_clip_area_all() {
    if (mp_owner) set_clip_area(0, 0, mp_owner->get_canvas_w(), mp_owner->get_canvas_h());
}

void CCanvas::push_clip_area() {
    if (IRender *p_render = get_render()) p_render->push_clip_area();
}

void CCanvas::pop_clip_area() {
    if (IRender *p_render = get_render()) p_render->pop_clip_area();
}

void CCanvas::render_view(int _x, int _y, int _w, int _h, IRenderCamera *_p_camera) {
    if (IRender *p_render = get_render()) p_render->render_view(_x, _y, _w, _h, _p_camera);
}

// ---------------------------------------------------------------------------------------------
// Lines and rectangles
// ---------------------------------------------------------------------------------------------

// What every drawing starts with: a material (none draws nothing), the bridge, the faded copy of
// the material's colour.
bool CCanvas::prepare(CMaterial const *_p_material, IRender *&_p_render, rgba_t &_color) const {
    if (!_p_material) return false;
    _p_render = get_render();
    if (!_p_render) return false;
    _color = _p_material->get_color();
    fade_color(_color);
    return true;
}

void CCanvas::draw_line(int _x0, int _y0, int _x1, int _y1, CMaterial *_p_material) {
    IRender *p_render;
    rgba_t color;
    if (!prepare(_p_material, p_render, color)) return;
    point_t const o = origin();
    p_render->set_material(_p_material->get_material_handle());
    p_render->draw_line(point_t{_x0 + o.x, _y0 + o.y}, point_t{_x1 + o.x, _y1 + o.y}, color, color);
}

void CCanvas::quad(IRender *_p_render, int _l, int _t, int _r, int _b, float _u0, float _v0, float _u1,
                   float _v1, rgba_t const &_color) {
    _p_render->draw_quad(point_t{_l, _t}, point_t{_l, _b}, point_t{_r, _b}, point_t{_r, _t}, vec2_t{_u0, _v0},
                         vec2_t{_u0, _v1}, vec2_t{_u1, _v1}, vec2_t{_u1, _v0}, _color, _color, _color,
                         _color);
}

void CCanvas::draw_rect(int _x, int _y, int _w, int _h, float _tex_x, float _tex_y, float _tex_w,
                        float _tex_h, CMaterial *_p_material) {
    IRender *p_render;
    rgba_t color;
    if (!prepare(_p_material, p_render, color)) return;
    point_t const o = origin();
    int const l = _x + o.x, t = _y + o.y;
    p_render->set_material(_p_material->get_material_handle());
    quad(p_render, l, t, l + _w, t + _h, _tex_x, _tex_y, _tex_x + _tex_w, _tex_y + _tex_h, color);
}

void CCanvas::draw_rect(int _x, int _y, int _w, int _h, CMaterial *_p_material) {
    IRender *p_render;
    rgba_t color;
    if (!prepare(_p_material, p_render, color)) return;
    p_render->set_material(_p_material->get_material_handle());
    point_t const o = origin();
    int const l = _x + o.x, t = _y + o.y, r = l + _w, b = t + _h;
    CMaterial const &m = *_p_material;
    if (!m.get_bordered()) {
        quad(p_render, l, t, r, b, m.get_tex_x(), m.get_tex_y(), m.get_tex_x() + m.get_tex_w(),
             m.get_tex_y() + m.get_tex_h(), color);
    } else if (m.get_tex_real_w() == -1 || m.get_tex_real_h() == -1) {
        qordebug::warning("tex_size must be set for bordered material");
    } else {
        draw_nine_patch(p_render, l, t, r, b, _p_material, color);
    }
}

// Corners at their natural size; edges and centre tiled so they repeat rather than stretch.
void CCanvas::draw_nine_patch(IRender *_p_render, int _l, int _t, int _r, int _b, CMaterial *_p_material,
                              rgba_t const &_color) {
    CMaterial const &m = *_p_material;
    float const rw = static_cast<float>(m.get_tex_real_w()), rh = static_cast<float>(m.get_tex_real_h());
    float const u = m.get_tex_x(), v = m.get_tex_y(), tw = m.get_tex_w(), th = m.get_tex_h();
    float const bl = m.get_border_left(), br = m.get_border_right(), bt = m.get_border_top(),
                bb = m.get_border_bottom();
    int const x1 = _l + to_pixels(bl * rw), x2 = _r - to_pixels(br * rw);
    int const y1 = _t + to_pixels(bt * rh), y2 = _b - to_pixels(bb * rh);
    float const u1 = u + bl, u2 = u + tw - br, u3 = u + tw;
    float const v1 = v + bt, v2 = v + th - bb, v3 = v + th;

    quad(_p_render, _l, _t, x1, y1, u, v, u1, v1, _color);
    quad(_p_render, _l, y2, x1, _b, u, v2, u1, v3, _color);
    quad(_p_render, x2, y2, _r, _b, u2, v2, u3, v3, _color);
    quad(_p_render, x2, _t, _r, y1, u2, v, u3, v1, _color);

    struct {
        int l, t, r, b;
        float u0, v0, u1, v1;
    } const tiled[] = {
        {_l, y1, x1, y2, u, v1, u1, v2},  // left edge
        {x2, y1, _r, y2, u2, v1, u3, v2}, // right edge
        {x1, _t, x2, y1, u1, v, u2, v1},  // top edge
        {x1, y2, x2, _b, u1, v2, u2, v3}, // bottom edge
        {x1, y1, x2, y2, u1, v1, u2, v2}, // centre
    };
    for (auto const &piece : tiled)
        draw_tiled(piece.l, piece.t, piece.r - piece.l, piece.b - piece.t, piece.u0, piece.v0,
                   piece.u1 - piece.u0, piece.v1 - piece.v0, rw, rh, _p_material);
}

void CCanvas::draw_tiled(int _x, int _y, int _w, int _h, float _tex_x, float _tex_y, float _tex_w,
                         float _tex_h, float _tex_real_w, float _tex_real_h, CMaterial *_p_material) {
    IRender *p_render;
    rgba_t color;
    if (_w < 1 || _h < 1 || !prepare(_p_material, p_render, color)) return;
    int const tile_w = to_pixels(_tex_w * _tex_real_w);
    int const tile_h = to_pixels(_tex_h * _tex_real_h);
    // A tile size of 0 (or less) draws no tile.
    int const columns = tile_w > 0 ? static_cast<int>(std::ceil(static_cast<double>(_w) / tile_w)) : 0;
    int const rows = tile_h > 0 ? static_cast<int>(std::ceil(static_cast<double>(_h) / tile_h)) : 0;
    p_render->set_clip_area(_x, _y, _w, _h);
    p_render->push_clip_area();
    p_render->set_material(_p_material->get_material_handle());
    // Only the tiles that the clip lets through to the desktop: a tiny tile over a large area
    // costs no more than the screen has pixels.
    point_t const screen = p_render->get_resolution();
    int first_column = 0, last_column = 0, first_row = 0, last_row = 0;
    if (columns > 0 && rows > 0) {
        visible_tiles(_x, tile_w, columns, 0, screen.x, first_column, last_column);
        visible_tiles(_y, tile_h, rows, 0, screen.y, first_row, last_row);
    }
    for (int row = first_row; row < last_row; ++row) {
        int const t = _y + row * tile_h;
        for (int column = first_column; column < last_column; ++column) {
            int const l = _x + column * tile_w;
            quad(p_render, l, t, l + tile_w, t + tile_h, _tex_x, _tex_y, _tex_x + _tex_w, _tex_y + _tex_h,
                 color);
        }
    }
    p_render->pop_clip_area();
}

// ---------------------------------------------------------------------------------------------
// Text
// ---------------------------------------------------------------------------------------------

// A "<color r g b a>" sets the colour (the low eight bits of each number; a tag with fewer than
// four numbers changes nothing), a "</color>" restores the base; a tag of another name is
// swallowed.
size_t CCanvas::read_tag(CString const &_string, size_t _i, rgba_t const &_base, rgba_t &_current) const {
    size_t const length = _string.length();
    size_t const close = _string.find('>', _i + 1);
    size_t j = _i + 1;
    bool const closing = _string[j] == '/';
    if (closing) ++j;
    static unsigned short const color[] = {'c', 'o', 'l', 'o', 'r'};
    if (j + 5 <= length && std::equal(color, color + 5, _string.begin() + j)) {
        if (closing) {
            _current = _base;
        } else {
            // The numbers behind the word, up to the end of the string.
            size_t k = j + 5;
            unsigned rgba[4];
            int read = 0;
            while (read < 4 && scan_unsigned(_string, k, rgba[read]))
                ++read;
            if (read == 4)
                _current = rgba_t(static_cast<unsigned char>(rgba[0]), static_cast<unsigned char>(rgba[1]),
                                  static_cast<unsigned char>(rgba[2]), static_cast<unsigned char>(rgba[3]));
        }
    }
    return close + 1;
}

// One quad per character, all of the font's material: one set_material before the first quad that
// can be seen. Characters wholly outside the visible area are only measured; once the pen has
// passed its right edge, and no character of the charset moves the pen back, the line is done.
void CCanvas::text_out(int _x, int _y, CString const &_string, CFont *_p_font) {
    if (!_p_font || _string.empty()) return;
    CMaterial *p_material = _p_font->get_char_material(_string[0]);
    CCharset const *p_charset = _p_font->get_charset();
    IRender *p_render = get_render();
    if (!p_material || !QOR_CHECK_AS(p_charset, "mp_charset") || !p_render) return;
    float const size = _p_font->get_size();
    float const height = p_charset->get_height();
    point_t const o = origin();
    int const t = _y + o.y, b = t + to_pixels(size * height);
    SPixelRect const visible = p_render->get_visible_area();
    if (!meets(visible, visible.m_l, t, visible.m_r, b)) return; // the line's rows can't be seen
    bool const pen_only_grows = p_charset->has_no_negative_width() && size >= 0.0f;
    rgba_t const base = p_material->get_color();
    rgba_t current = base, faded = base;
    fade_color(faded);
    bool material_set = false;
    int x_cur = _x;
    size_t const length = _string.length();
    for (size_t i = 0; i < length; ++i) {
        if (m_tags_enable && _string[i] == '<' && i + 2 < length &&
            _string.find('>', i + 1) != wstring::npos) {
            i = read_tag(_string, i, base, current);
            faded = current;
            fade_color(faded);
            if (i >= length) break;
        }
        CCharset::SChar const *p_char = p_charset->get_char_description(_string[i]);
        if (!p_char) continue;
        int const l = x_cur + o.x, r = l + to_pixels(p_char->w * size);
        if (meets(visible, l, t, r, b)) {
            if (!material_set) p_render->set_material(p_material->get_material_handle());
            material_set = true;
            quad(p_render, l, t, r, b, p_char->x, p_char->y, p_char->x + p_char->w, p_char->y + height,
                 faded);
        } else if (pen_only_grows && l >= visible.m_r) {
            break;
        }
        x_cur = to_pixels(static_cast<float>(x_cur) + p_char->w * size);
    }
}

void CCanvas::text_out(int _x, int _y, int _spacing, CText const &_text, CFont *_p_font) {
    int y_cur = _y;
    int const owner_w = mp_owner ? mp_owner->get_canvas_w() : 0;
    int const owner_h = mp_owner ? mp_owner->get_canvas_h() : 0;
    for (unsigned line = 0; line < _text.get_num_strings() && y_cur <= owner_h; ++line) {
        CFont *p_font = _text.get_string_font(line) ? _text.get_string_font(line) : _p_font;
        int const string_h = get_text_height(p_font) + _spacing;
        if (!QOR_CHECK(string_h > 0)) return;
        if (y_cur >= 0 || y_cur + string_h >= 0) {
            CString const &string = *_text.get_string(line);
            int x_cur = _x;
            if (_text.get_alignment() == ALIGNMENT_CENTER)
                x_cur = _x + (owner_w - get_text_width(string, p_font, -1)) / 2;
            text_out(x_cur, y_cur, string, p_font);
        }
        y_cur += string_h;
    }
}

int CCanvas::get_text_height(CFont *_p_font) {
    return _p_font ? to_pixels(_p_font->get_size() * _p_font->get_height()) : 0;
}

int CCanvas::get_text_height(CString const &, CFont *_p_font) {
    return get_text_height(_p_font);
}

int CCanvas::get_char_width(unsigned short _ch, CFont *_p_font) {
    CCharset const *p_charset = _p_font ? _p_font->get_charset() : nullptr;
    if (_p_font && !QOR_CHECK_AS(p_charset, "mp_charset")) return 0;
    return p_charset ? char_width(*p_charset, _ch, _p_font->get_size()) : 0;
}

int CCanvas::get_text_width(CString const &_string, CFont *_p_font, int _count) {
    if (!_p_font) return 0;
    CCharset const *p_charset = _p_font->get_charset();
    if (!QOR_CHECK_AS(p_charset, "mp_charset")) return 0;
    float const size = _p_font->get_size();
    size_t const count = _count >= 0 && _string.length() >= static_cast<size_t>(_count)
                             ? static_cast<size_t>(_count)
                             : _string.length();
    long long width = 0; // each character within k_far_pixels: no overflow here
    for (size_t i = 0; i < count; ++i)
        width += char_width(*p_charset, _string[i], size);
    return static_cast<int>(std::clamp<long long>(width, INT_MIN, INT_MAX));
}

} // namespace qorui
