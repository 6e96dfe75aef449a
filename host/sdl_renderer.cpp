// The renderer in a window: SDL2's geometry in batches by texture and clip.
//
//   frame      clear, the picture read back, present
//   drawing    quads and lines as vertex-coloured triangles
//   batches    the vertices that share a texture, a clip and whether they blend, drawn at once
#include "sdl_renderer.h"

#include "qordebug.h"

#include <cmath>

namespace qorhost {

// ---------------------------------------------------------------------------------------------
// Frame
// ---------------------------------------------------------------------------------------------

CSdlRenderer::CSdlRenderer(SDL_Renderer *_p_renderer, int _w, int _h)
    : CHostRenderer(_w, _h), mp_renderer(_p_renderer), m_batch_clip(m_clip) {
    m_vertices.reserve(4096);
    m_indices.reserve(6144);
}

CSdlRenderer::~CSdlRenderer() {
    for (auto const &entry : m_textures)
        if (entry.second.mp_texture) SDL_DestroyTexture(entry.second.mp_texture);
}

std::string CSdlRenderer::get_driver() const {
    SDL_RendererInfo info;
    return SDL_GetRendererInfo(mp_renderer, &info) == 0 && info.name ? info.name : "";
}

void CSdlRenderer::clear(rgba_t const &_clear) {
    m_vertices.clear();
    m_indices.clear();
    SDL_RenderSetClipRect(mp_renderer, nullptr);
    SDL_SetRenderDrawColor(mp_renderer, _clear.r, _clear.g, _clear.b, _clear.a);
    SDL_RenderClear(mp_renderer);
}

SImage const &CSdlRenderer::picture() {
    flush();
    m_picture.m_w = get_w();
    m_picture.m_h = get_h();
    m_picture.m_pixels.resize(static_cast<size_t>(get_w()) * get_h() * 4);
    SDL_RenderSetClipRect(mp_renderer, nullptr);
    if (SDL_RenderReadPixels(mp_renderer, nullptr, SDL_PIXELFORMAT_RGBA32, m_picture.m_pixels.data(),
                             get_w() * 4))
        qordebug::warning("The window's picture can't be read: %s", SDL_GetError());
    return m_picture;
}

void CSdlRenderer::show() {
    flush();
    SDL_RenderPresent(mp_renderer);
}

// ---------------------------------------------------------------------------------------------
// Drawing
// ---------------------------------------------------------------------------------------------

SDL_Vertex CSdlRenderer::vertex(float _x, float _y, vec2_t const &_t, rgba_t const &_c) const {
    return SDL_Vertex{{_x, _y}, {_c.r, _c.g, _c.b, _c.a}, {_t.x, _t.y}};
}

void CSdlRenderer::draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                             vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                             rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) {
    bool const opaque = _c0.a == 255 && _c1.a == 255 && _c2.a == 255 && _c3.a == 255;
    if (!begin_batch(current_texture(), opaque)) return;
    add_quad(
        {vertex(pixel_x(_p0.x), pixel_y(_p0.y), _t0, _c0), vertex(pixel_x(_p1.x), pixel_y(_p1.y), _t1, _c1),
         vertex(pixel_x(_p2.x), pixel_y(_p2.y), _t2, _c2), vertex(pixel_x(_p3.x), pixel_y(_p3.y), _t3, _c3)});
}

// A one-pixel line from centre to centre: a quad one pixel wide, half a pixel longer at each end,
// its colour interpolated along it.
void CSdlRenderer::draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to,
                             rgba_t const &_c_to, float) {
    if (!begin_batch(nullptr, _c_from.a == 255 && _c_to.a == 255)) return;
    float const ax = std::floor(pixel_x(_from.x)) + 0.5f, ay = std::floor(pixel_y(_from.y)) + 0.5f;
    float const bx = std::floor(pixel_x(_to.x)) + 0.5f, by = std::floor(pixel_y(_to.y)) + 0.5f;
    float const length = std::hypot(bx - ax, by - ay);
    // Along the line and across it, half a pixel each; a point is a pixel-sized square.
    float const dx = length > 0.0f ? (bx - ax) / length * 0.5f : 0.5f;
    float const dy = length > 0.0f ? (by - ay) / length * 0.5f : 0.0f;
    vec2_t const none = {0.0f, 0.0f};
    add_quad(
        {vertex(ax - dx + dy, ay - dy - dx, none, _c_from), vertex(bx + dx + dy, by + dy - dx, none, _c_to),
         vertex(bx + dx - dy, by + dy + dx, none, _c_to), vertex(ax - dx - dy, ay - dy + dx, none, _c_from)});
}

// ---------------------------------------------------------------------------------------------
// Batches
// ---------------------------------------------------------------------------------------------

bool CSdlRenderer::begin_batch(SImage const *_p_texture, bool _opaque) {
    if (m_clip.m_x0 >= m_clip.m_x1 || m_clip.m_y0 >= m_clip.m_y1) return false;
    bool const opaque = _opaque && (!_p_texture || uploaded(_p_texture).m_opaque);
    if (_p_texture != mp_batch_texture || m_clip != m_batch_clip || opaque != m_batch_opaque) flush();
    mp_batch_texture = _p_texture;
    m_batch_clip = m_clip;
    m_batch_opaque = opaque;
    return true;
}

void CSdlRenderer::add_quad(SDL_Vertex const (&_v)[4]) {
    int const first = static_cast<int>(m_vertices.size());
    m_vertices.insert(m_vertices.end(), _v, _v + 4);
    for (int corner : {0, 1, 2, 0, 2, 3})
        m_indices.push_back(first + corner);
}

void CSdlRenderer::flush() {
    if (m_indices.empty()) return;
    SDL_Rect const clip = {m_batch_clip.m_x0, m_batch_clip.m_y0, m_batch_clip.m_x1 - m_batch_clip.m_x0,
                           m_batch_clip.m_y1 - m_batch_clip.m_y0};
    SDL_RenderSetClipRect(mp_renderer, &clip);
    SDL_BlendMode const blend = m_batch_opaque ? SDL_BLENDMODE_NONE : SDL_BLENDMODE_BLEND;
    SDL_Texture *p_texture = mp_batch_texture ? uploaded(mp_batch_texture).mp_texture : nullptr;
    if (p_texture)
        SDL_SetTextureBlendMode(p_texture, blend);
    else
        SDL_SetRenderDrawBlendMode(mp_renderer, blend);
    if (SDL_RenderGeometry(mp_renderer, p_texture, m_vertices.data(), static_cast<int>(m_vertices.size()),
                           m_indices.data(), static_cast<int>(m_indices.size())) != 0)
        qordebug::warning("The window's renderer can't draw: %s", SDL_GetError());
    ++m_batches_drawn;
    m_vertices.clear();
    m_indices.clear();
}

// A texture the first time it is drawn, kept for the renderer's life as the picture is. One that
// SDL can't make is reported once; its quads then show their vertex colour.
CSdlRenderer::STexture const &CSdlRenderer::uploaded(SImage const *_p_texture) {
    auto found = m_textures.find(_p_texture);
    if (found != m_textures.end()) return found->second;
    STexture texture = {SDL_CreateTexture(mp_renderer, SDL_PIXELFORMAT_RGBA32, SDL_TEXTUREACCESS_STATIC,
                                          _p_texture->m_w, _p_texture->m_h),
                        true};
    if (texture.mp_texture) {
        SDL_UpdateTexture(texture.mp_texture, nullptr, _p_texture->m_pixels.data(), _p_texture->m_w * 4);
        SDL_SetTextureScaleMode(texture.mp_texture, SDL_ScaleModeNearest);
    } else {
        qordebug::warning("The window's renderer can't make a texture: %s", SDL_GetError());
    }
    for (size_t i = 3; i < _p_texture->m_pixels.size() && texture.m_opaque; i += 4)
        texture.m_opaque = _p_texture->m_pixels[i] == 255;
    return m_textures[_p_texture] = texture;
}

} // namespace qorhost
