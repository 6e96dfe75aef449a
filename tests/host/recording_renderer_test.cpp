// The recording renderer: every call in order with its arguments, handles of its own or of the
// renderer behind it, and each call handed on to that renderer.
#include "host_test_support.h"
#include "recording_renderer.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using namespace qorhost;

namespace {

void expect_vec2(vec2_t const &_expected, vec2_t const &_actual) {
    EXPECT_FLOAT_EQ(_expected.x, _actual.x);
    EXPECT_FLOAT_EQ(_expected.y, _actual.y);
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

    EXPECT_EQ(
        "create_material create_material begin_2d set_material draw_quad set_clip_rect push_clip_rect "
        "draw_line pop_clip_rect end_2d destroy_material get_avi_texture render_view finish_view present",
        recorder.sequence());
    std::vector<SRenderCall> const &calls = recorder.calls();
    ASSERT_EQ(15u, calls.size());
    EXPECT_EQ((std::vector<std::string>{"ui_image", "a.tga", "", "", "lum", ""}), calls[0].m_names);
    EXPECT_EQ(0, calls[0].m_handle);
    EXPECT_EQ((std::vector<std::string>{"ui_color", "", "", "", "", ""}), calls[1].m_names);
    EXPECT_EQ(1, calls[1].m_handle);
    EXPECT_EQ(1, calls[3].m_handle);

    SRenderCall const &quad = calls[4];
    ASSERT_EQ(4u, quad.m_points.size());
    ASSERT_EQ(4u, quad.m_uvs.size());
    ASSERT_EQ(4u, quad.m_colours.size());
    vec2_t const points[] = {{-1, 1}, {0.5f, 1}, {0.5f, -0.5f}, {-1, -0.5f}};
    for (int i = 0; i < 4; ++i) {
        expect_vec2(points[i], quad.m_points[i]);
        expect_vec2(vec2_t{0.2f * i, 0.2f * i + 0.1f}, quad.m_uvs[i]);
        uint8_t const base = static_cast<uint8_t>(4 * i + 1);
        EXPECT_EQ(rgba_t(base, base + 1, base + 2, base + 3), quad.m_colours[i]);
    }

    ASSERT_EQ(2u, calls[5].m_points.size());
    expect_vec2(vec2_t{-0.5f, -0.25f}, calls[5].m_points[0]);
    expect_vec2(vec2_t{1.0f, 0.75f}, calls[5].m_points[1]);

    SRenderCall const &line = calls[7];
    ASSERT_EQ(2u, line.m_points.size());
    expect_vec2(vec2_t{0.1f, 0.2f}, line.m_points[0]);
    expect_vec2(vec2_t{0.3f, 0.4f}, line.m_points[1]);
    EXPECT_EQ((std::vector<rgba_t>{rgba_t(20, 21, 22, 23), rgba_t(24, 25, 26, 27)}), line.m_colours);
    ASSERT_EQ(1u, line.m_uvs.size());
    EXPECT_FLOAT_EQ(2.5f, line.m_uvs[0].x); // the width

    EXPECT_EQ(0, calls[10].m_handle);
    EXPECT_EQ(7, calls[11].m_handle);
    for (int i : {2, 6, 8, 9, 12, 13, 14})
        EXPECT_EQ(-1, calls[i].m_handle) << calls[i].m_op;

    recorder.clear();
    EXPECT_TRUE(recorder.calls().empty());
    EXPECT_EQ("", recorder.sequence());
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

    EXPECT_EQ(1u, target.get_batches_begun());
    EXPECT_EQ(1u, target.get_views_rendered());
    EXPECT_EQ(1u, target.get_presented());
    EXPECT_EQ(2u, target.get_live_materials());
    SClipRect const clip = target.get_clip();
    EXPECT_EQ(0, clip.m_x0);
    EXPECT_EQ(0, clip.m_y0);
    EXPECT_EQ(4, clip.m_x1);
    EXPECT_EQ(2, clip.m_y1);
    // The top line was drawn, the bottom one clipped away; the frame is what the calls draw
    // without the recorder.
    uint8_t const *p = target.get_frame().pixel(3, 0);
    EXPECT_EQ(rgba_t(0, 255, 0, 255), rgba_t(p[0], p[1], p[2], p[3]));
    p = target.get_frame().pixel(1, 3);
    EXPECT_EQ(rgba_t(0, 0, 0, 255), rgba_t(p[0], p[1], p[2], p[3]));
    EXPECT_EQ(direct.get_frame().m_pixels, target.get_frame().m_pixels);
}
