// The host's renderer in a window: SDL2's renderer (OpenGL where the system has it, SDL's own
// software one where it hasn't) draws the library's quads and lines as textured, vertex-coloured
// triangles, in batches that share a texture and a clip rectangle. Each texture is uploaded once,
// sampled at the nearest texel and blended by straight alpha, as the software renderer does, so
// the window shows what the golden images show. Batches of opaque vertices and texels are copied
// without blending, which gives the same pixels for less work.
#pragma once
#include "host_renderer.h"

#include <SDL.h>

#include <map>
#include <string>
#include <vector>

namespace qorhost {

class CSdlRenderer : public CHostRenderer {
public:
    // Draws with _p_renderer, which outlives this, on a screen of _w by _h pixels.
    CSdlRenderer(SDL_Renderer *_p_renderer, int _w, int _h);
    ~CSdlRenderer() override;
    CSdlRenderer(CSdlRenderer const &) = delete;
    CSdlRenderer &operator=(CSdlRenderer const &) = delete;

    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                   vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                   rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) override;
    void draw_line(vec2_t const &_from, rgba_t const &_c_from, vec2_t const &_to, rgba_t const &_c_to,
                   float _width) override;

    // SDL's name of the driver that draws: "opengl", "opengles2", "software", ...
    std::string get_driver() const;
    // Triangle batches handed to SDL so far.
    unsigned get_batches_drawn() const { return m_batches_drawn; }

protected:
    void clear(rgba_t const &_clear) override;
    // Draws what is batched and reads the screen back.
    SImage const &picture() override;
    // Draws what is batched and shows it.
    void show() override;

private:
    SDL_Vertex vertex(float _x, float _y, vec2_t const &_t, rgba_t const &_c) const;
    struct STexture {
        SDL_Texture *mp_texture; // null when SDL can't make it
        bool m_opaque;           // every texel's alpha is 255
    };

    // Readies the batch for triangles of _p_texture (null: the vertex colour alone) in the current
    // clip, _opaque when every vertex's alpha is 255; false when the clip is empty and nothing can
    // show.
    bool begin_batch(SImage const *_p_texture, bool _opaque);
    void add_quad(SDL_Vertex const (&_v)[4]);
    void flush();
    STexture const &uploaded(SImage const *_p_texture);

    SDL_Renderer *mp_renderer;
    std::map<SImage const *, STexture> m_textures; // uploaded once, by the picture they hold
    std::vector<SDL_Vertex> m_vertices;            // the batch
    std::vector<int> m_indices;
    SImage const *mp_batch_texture = nullptr;
    SClipRect m_batch_clip;
    bool m_batch_opaque = false;
    unsigned m_batches_drawn = 0;
    SImage m_picture; // read back for the frame sink
};

} // namespace qorhost
