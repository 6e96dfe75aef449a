// What the host's renderers share.
//
//   frame                    begin, present, views
//   materials and textures   ui_color, ui_image, textures by folder, the missing texture's checker
//   clip                     the clip rectangle and its stack
#include "host_renderer.h"

#include "qordebug.h"

#include <algorithm>
#include <cmath>

namespace qorhost {

// ---------------------------------------------------------------------------------------------
// Frame
// ---------------------------------------------------------------------------------------------

CHostRenderer::CHostRenderer(int _w, int _h) : m_w(_w > 0 ? _w : 1), m_h(_h > 0 ? _h : 1) {
    m_clip = full_clip();
}

void CHostRenderer::begin_frame(rgba_t const &_clear) {
    m_clip = full_clip();
    m_clip_stack.clear();
    clear(_clear);
}

void CHostRenderer::present() {
    if (m_sink) m_sink(picture(), m_presented);
    show();
    ++m_presented;
}

// There is no 3D scene in this host: a view only counts.
void CHostRenderer::render_view(IRenderCamera *) {
    ++m_views_rendered;
}

// ---------------------------------------------------------------------------------------------
// Materials and textures
// ---------------------------------------------------------------------------------------------

int CHostRenderer::create_material(char const *_material_template, char const *_diffuse, char const *,
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

void CHostRenderer::destroy_material(int _handle) {
    m_materials.erase(_handle);
}

// Textures are shared by name. A missing one is an 8 by 8 checker of magenta and black, so that
// it shows.
std::shared_ptr<SImage> CHostRenderer::texture(std::string const &_name) {
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
void CHostRenderer::set_clip_rect(vec2_t const &_position, vec2_t const &_size) {
    SClipRect clip;
    clip.m_x0 = trunc_to_int(std::round(pixel_x(_position.x)));
    clip.m_x1 = trunc_to_int(std::round(pixel_x(_position.x + _size.x)));
    clip.m_y0 = trunc_to_int(std::round(pixel_y(_position.y + _size.y)));
    clip.m_y1 = trunc_to_int(std::round(pixel_y(_position.y)));
    clip.m_x0 = std::clamp(clip.m_x0, 0, m_w);
    clip.m_x1 = std::clamp(clip.m_x1, clip.m_x0, m_w);
    clip.m_y0 = std::clamp(clip.m_y0, 0, m_h);
    clip.m_y1 = std::clamp(clip.m_y1, clip.m_y0, m_h);
    m_clip = clip;
}

void CHostRenderer::push_clip_rect() {
    m_clip_stack.push_back(m_clip);
}

void CHostRenderer::pop_clip_rect() {
    if (m_clip_stack.empty()) {
        qordebug::warning("pop_clip_rect without a push; the clip is the whole frame again");
        m_clip = full_clip();
        return;
    }
    m_clip = m_clip_stack.back();
    m_clip_stack.pop_back();
}

// The current material's texture; null for one that draws the vertex colour, and for none.
SImage const *CHostRenderer::current_texture() const {
    auto found = m_materials.find(m_material);
    if (found == m_materials.end() || !found->second.m_textured) return nullptr;
    return found->second.mp_texture.get();
}

} // namespace qorhost
