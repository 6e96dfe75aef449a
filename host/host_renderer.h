// What the host's renderers share: materials of the "ui_color" and "ui_image" templates, with
// textures shared by name from the texture folders (a missing one shows as a checker); the clip
// rectangle in pixels with its stack; the frame's begin and present, with a sink that receives
// each presented frame; and counts of the calls that only count here (views, batches).
//
// Device coordinates: (-1, 1) is the top left corner of the screen, (1, -1) the bottom right.
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

    bool operator==(SClipRect const &_other) const {
        return m_x0 == _other.m_x0 && m_y0 == _other.m_y0 && m_x1 == _other.m_x1 && m_y1 == _other.m_y1;
    }
    bool operator!=(SClipRect const &_other) const { return !(*this == _other); }
};

class CHostRenderer : public IRenderQOR {
public:
    typedef std::function<void(SImage const &_frame, unsigned _index)> frame_sink_t;

    CHostRenderer(int _w, int _h);

    SInterfaceUID get_uid() const override { return qor_uid::RENDER; }
    int get_version() const override { return 1; }

    void render_view(IRenderCamera *_p_camera) override;
    void finish_view() override { ++m_views_finished; }
    void present() override;
    int create_material(char const *_material_template, char const *_diffuse, char const *_bump,
                        char const *_specular, char const *_luminosity, char const *_reflection,
                        bool _precache_enable, bool _load_textures_from_game_save) override;
    void destroy_material(int _handle) override;
    IAviTexture *get_avi_texture(int) override { return nullptr; }
    void begin_2d() override { ++m_batches_begun; }
    void end_2d() override { ++m_batches_ended; }
    void set_material(int _handle) override { m_material = _handle; }
    void set_clip_rect(vec2_t const &_position, vec2_t const &_size) override;
    void push_clip_rect() override;
    void pop_clip_rect() override;

    // The host's frame: clears to a colour and resets the clip to the whole screen.
    void begin_frame(rgba_t const &_clear);
    // Receives each presented frame with its index, before it is shown.
    void set_frame_sink(frame_sink_t _sink) { m_sink = _sink; }
    // Folders searched for textures, in order.
    void set_texture_folders(std::vector<std::string> const &_folders) { m_texture_folders = _folders; }
    std::vector<std::string> const &get_texture_folders() const { return m_texture_folders; }

    int get_w() const { return m_w; }
    int get_h() const { return m_h; }
    SClipRect const &get_clip() const { return m_clip; }
    unsigned get_presented() const { return m_presented; }
    unsigned get_live_materials() const { return static_cast<unsigned>(m_materials.size()); }
    unsigned get_batches_begun() const { return m_batches_begun; }
    unsigned get_views_rendered() const { return m_views_rendered; }

protected:
    // The screen in one colour.
    virtual void clear(rgba_t const &_clear) = 0;
    // The frame drawn so far, for the frame sink.
    virtual SImage const &picture() = 0;
    // Shows the frame drawn.
    virtual void show() = 0;

    // The texture that the current material samples; null for one that draws the vertex colour.
    SImage const *current_texture() const;
    // A position in device coordinates in pixels.
    float pixel_x(float _device_x) const { return (_device_x + 1.0f) * 0.5f * m_w; }
    float pixel_y(float _device_y) const { return (1.0f - _device_y) * 0.5f * m_h; }

    SClipRect m_clip;

private:
    struct SMaterial {
        bool m_textured;
        std::shared_ptr<SImage> mp_texture;
    };

    std::shared_ptr<SImage> texture(std::string const &_name);
    SClipRect full_clip() const { return SClipRect{0, 0, m_w, m_h}; }

    int m_w, m_h;
    frame_sink_t m_sink;
    std::vector<SClipRect> m_clip_stack;
    std::map<int, SMaterial> m_materials;
    std::map<std::string, std::shared_ptr<SImage>> m_textures;
    std::vector<std::string> m_texture_folders;
    int m_next_handle = 0;
    int m_material = -1;
    unsigned m_presented = 0;
    unsigned m_batches_begun = 0;
    unsigned m_batches_ended = 0;
    unsigned m_views_rendered = 0;
    unsigned m_views_finished = 0;
};

} // namespace qorhost
