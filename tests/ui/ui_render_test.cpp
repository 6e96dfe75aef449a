// The render bridge of the test world's desktop (320 by 240 on the host's screen of 1024 by 768)
// against its recorder: device coordinates, clip areas, the nesting of 2D and 3D, the contracts.
#include "ui_render.h"

#include "test_world.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class CViewportCamera : public IRenderCamera {
public:
    void set_viewport(int _x, int _y, int _w, int _h) override { m_viewport = {_x, _y, _w, _h}; }
    std::vector<int> m_viewport;
};

void expect_point(float _x, float _y, vec2_t const &_p) {
    EXPECT_FLOAT_EQ(_x, _p.x);
    EXPECT_FLOAT_EQ(_y, _p.y);
}

} // namespace

TEST(Render, QuadsLinesAndClipsReachTheEngineInDeviceCoordinates) {
    qortest::CWorld world;
    IRender &render = *world.desktop().get_render();
    world.recorder().clear();
    rgba_t const c2(9, 10, 11, 12);
    render.draw_quad(point_t{0, 0}, point_t{320, 0}, point_t{320, 240}, point_t{80, 60}, vec2_t{0, 0},
                     vec2_t{1, 0}, vec2_t{1, 1}, vec2_t{0, 1}, rgba_t(), rgba_t(), c2, rgba_t());
    render.draw_line(point_t{160, 120}, point_t{0, 240}, rgba_t(), rgba_t());
    render.set_clip_area(80, 60, 160, 60); // the engine takes the lower left corner and the size
    ASSERT_EQ("draw_quad draw_line set_clip_rect", world.recorder().sequence());
    std::vector<qorhost::SRenderCall> const &calls = world.recorder().calls();
    expect_point(-1, 1, calls[0].m_points[0]);
    expect_point(1, -1, calls[0].m_points[2]);
    expect_point(-0.5f, 0.5f, calls[0].m_points[3]);
    expect_point(1, 0, calls[0].m_uvs[1]);
    EXPECT_EQ(c2, calls[0].m_colours[2]);
    expect_point(0, 0, calls[1].m_points[0]);
    expect_point(-1, -1, calls[1].m_points[1]);
    expect_point(-0.5f, 0, calls[2].m_points[0]);
    expect_point(1, 0.5f, calls[2].m_points[1]);
}

TEST(Render, FramesNestAndAViewSuspendsTheBatchAndScalesItsViewportToTheScreen) {
    qortest::CWorld world(320, 200); // another shape than the screen's
    IRender &render = *world.desktop().get_render();
    world.recorder().clear();
    CViewportCamera camera;
    render.begin_draw();
    render.begin_draw();
    render.render_view(10, 25, 100, 50, &camera);
    render.end_draw();
    render.end_draw();
    EXPECT_EQ("begin_2d begin_2d end_2d render_view finish_view begin_2d end_2d end_2d",
              world.recorder().sequence());
    EXPECT_EQ((std::vector<int>{32, 96, 320, 192}), camera.m_viewport);

    qortest::CReportCapture capture;
    render.end_draw(); // one end too many
    EXPECT_EQ(8u, world.recorder().calls().size());
    ASSERT_EQ(1u, capture.asserts().size());
    EXPECT_NE(std::string::npos, capture.asserts()[0].find("mp_render && m_in_draw_2d > 0"));
}

TEST(Render, WithoutARendererEveryCallIsAReportedNoOp) {
    qortest::CReportCapture capture;
    CRender render;
    render.init(nullptr);
    render.set_resolution(640, 480);
    render.begin_draw();
    EXPECT_EQ(-1,
              render.create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false));
    render.draw_line(point_t{0, 0}, point_t{1, 1}, rgba_t(), rgba_t());
    EXPECT_EQ(nullptr, render.get_avi_texture(0));
    std::vector<std::string> const asserts = capture.asserts();
    ASSERT_EQ(4u, asserts.size());
    EXPECT_NE(std::string::npos, asserts[0].find("_p_render"));
    EXPECT_NE(std::string::npos, asserts[1].find("mp_render"));
}
