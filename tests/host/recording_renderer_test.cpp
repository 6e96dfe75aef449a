// The recording renderer: every call in order with its arguments, handles of its own or of the
// renderer behind it, and each call handed on to that renderer.
#include "host_test_support.h"
#include "recording_renderer.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <vector>

using namespace qorhost;

namespace {

// A call as one line: its name, handle, names, then points, texture coordinates and colours.
std::string describe(SRenderCall const &_call) {
    std::ostringstream out;
    out << _call.m_op << " " << _call.m_handle;
    for (std::string const &name : _call.m_names)
        out << " '" << name << "'";
    for (std::vector<vec2_t> const *p_list : {&_call.m_points, &_call.m_uvs})
        for (vec2_t const &v : *p_list)
            out << " " << v.x << "," << v.y;
    for (rgba_t const &c : _call.m_colours)
        out << " #" << int(c.r) << "," << int(c.g) << "," << int(c.b) << "," << int(c.a);
    return out.str();
}

// A quad whose every argument differs from the others.
void draw_numbered_quad(IRenderQOR &_renderer) {
    _renderer.draw_quad(vec2_t{-1, 1}, vec2_t{0.0f, 0.1f}, rgba_t(1, 2, 3, 4), vec2_t{0.5f, 1},
                        vec2_t{0.2f, 0.3f}, rgba_t(5, 6, 7, 8), vec2_t{0.5f, -0.5f}, vec2_t{0.4f, 0.5f},
                        rgba_t(9, 10, 11, 12), vec2_t{-1, -0.5f}, vec2_t{0.6f, 0.7f}, rgba_t(13, 14, 15, 16));
}

class CCamera : public IRenderCamera {
public:
    void set_viewport(int, int, int, int) override {}
};

} // namespace

TEST(RecordingRenderer, RecordsEveryCallInOrderWithItsArguments) {
    CRecordingRenderer recorder;
    CCamera camera;
    EXPECT_EQ(0, recorder.create_material("ui_image", "a.tga", nullptr, "", "lum", nullptr, true, false));
    EXPECT_EQ(
        1, recorder.create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, false, false));
    recorder.begin_2d();
    recorder.set_material(1);
    draw_numbered_quad(recorder);
    recorder.set_clip_rect(vec2_t{-0.5f, -0.25f}, vec2_t{1.0f, 0.75f});
    recorder.push_clip_rect();
    recorder.draw_line(vec2_t{0.1f, 0.2f}, rgba_t(20, 21, 22, 23), vec2_t{0.3f, 0.4f}, rgba_t(24, 25, 26, 27),
                       2.5f);
    recorder.pop_clip_rect();
    recorder.end_2d();
    recorder.destroy_material(0);
    EXPECT_EQ(nullptr, recorder.get_avi_texture(7));
    recorder.render_view(&camera);
    recorder.finish_view();
    recorder.present();

    std::vector<std::string> described;
    for (SRenderCall const &call : recorder.calls())
        described.push_back(describe(call));
    EXPECT_EQ((std::vector<std::string>{
                  "create_material 0 'ui_image' 'a.tga' '' '' 'lum' ''",
                  "create_material 1 'ui_color' '' '' '' '' ''", "begin_2d -1", "set_material 1",
                  "draw_quad -1 -1,1 0.5,1 0.5,-0.5 -1,-0.5 0,0.1 0.2,0.3 0.4,0.5 0.6,0.7 #1,2,3,4 #5,6,7,8 "
                  "#9,10,11,12 #13,14,15,16",
                  "set_clip_rect -1 -0.5,-0.25 1,0.75", "push_clip_rect -1",
                  "draw_line -1 0.1,0.2 0.3,0.4 2.5,0 #20,21,22,23 #24,25,26,27", // the width as a coordinate
                  "pop_clip_rect -1", "end_2d -1", "destroy_material 0", "get_avi_texture 7",
                  "render_view -1", "finish_view -1", "present -1"}),
              described);
    recorder.clear();
    EXPECT_TRUE(recorder.calls().empty());
}

namespace {

// The calls of a short frame; the same on any renderer.
int draw_frame(IRenderQOR &_renderer) {
    CCamera camera;
    int const handle =
        _renderer.create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, false, false);
    _renderer.begin_2d();
    _renderer.set_material(handle);
    _renderer.set_clip_rect(vec2_t{-1, 0}, vec2_t{2, 1}); // the top half
    _renderer.push_clip_rect();
    _renderer.set_clip_rect(vec2_t{-1, -1}, vec2_t{1, 1});
    _renderer.pop_clip_rect();
    draw_numbered_quad(_renderer);
    _renderer.draw_line(vec2_t{-0.75f, 0.75f}, rgba_t(0, 255, 0, 255), vec2_t{0.75f, 0.75f},
                        rgba_t(0, 255, 0, 255), 1);
    _renderer.draw_line(vec2_t{-0.75f, -0.75f}, rgba_t(0, 255, 0, 255), vec2_t{0.75f, -0.75f},
                        rgba_t(0, 255, 0, 255), 1);
    _renderer.end_2d();
    _renderer.render_view(&camera);
    _renderer.finish_view();
    _renderer.present();
    _renderer.destroy_material(handle);
    return handle;
}

} // namespace

TEST(RecordingRenderer, HandsEveryCallOnToItsTarget) {
    CSoftwareRenderer target(4, 4), direct(4, 4);
    for (CSoftwareRenderer *p_renderer : {&target, &direct}) {
        p_renderer->begin_frame(rgba_t(0, 0, 0, 255));
        // The target's handles come first, so the recorder's own count would differ.
        p_renderer->create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, false, false);
        p_renderer->create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, false, false);
    }
    CRecordingRenderer recorder(&target);
    EXPECT_EQ(2, draw_frame(recorder));
    EXPECT_EQ(2, recorder.calls().front().m_handle);
    draw_frame(direct);

    // The target counts, clips and draws as it does without the recorder.
    for (CSoftwareRenderer *p_renderer : {&target, &direct}) {
        SClipRect const clip = p_renderer->get_clip();
        EXPECT_EQ((std::vector<unsigned>{1, 1, 1, 2, 0, 0, 4, 2}),
                  (std::vector<unsigned>{p_renderer->get_batches_begun(), p_renderer->get_views_rendered(),
                                         p_renderer->get_presented(), p_renderer->get_live_materials(),
                                         unsigned(clip.m_x0), unsigned(clip.m_y0), unsigned(clip.m_x1),
                                         unsigned(clip.m_y1)}));
    }
    EXPECT_EQ(direct.get_frame().m_pixels, target.get_frame().m_pixels);
}
