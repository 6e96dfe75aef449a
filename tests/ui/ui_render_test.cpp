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

} // namespace

// The engine takes a clip's lower left corner and its size; a view suspends the batch and scales
// its viewport to the screen.
TEST(Render, FiguresReachTheEngineInDeviceCoordinatesAndFramesNest) {
    qortest::CWorld world(320, 200); // another shape than the screen's
    IRender &render = *world.desktop().get_render();
    world.recorder().clear();
    CViewportCamera camera;
    render.begin_draw();
    render.begin_draw();
    render.draw_quad(point_t{0, 0}, point_t{320, 0}, point_t{320, 200}, point_t{80, 50}, vec2_t{0, 0},
                     vec2_t{1, 0}, vec2_t{1, 1}, vec2_t{0, 1}, rgba_t(), rgba_t(), rgba_t(9, 10, 11, 12),
                     rgba_t());
    render.set_clip_area(80, 50, 160, 50);
    render.render_view(10, 25, 100, 50, &camera);
    render.end_draw();
    render.end_draw();
    EXPECT_EQ(
        "begin_2d begin_2d draw_quad set_clip_rect end_2d render_view finish_view begin_2d end_2d end_2d",
        world.recorder().sequence());
    std::vector<qorhost::SRenderCall> const &calls = world.recorder().calls();
    std::vector<float> const expected = {-1, 1, 1, -1, -0.5f, 0.5f, 1, 0, -0.5f, 0, 1, 0.5f};
    std::vector<float> const found = {calls[2].m_points[0].x, calls[2].m_points[0].y, calls[2].m_points[2].x,
                                      calls[2].m_points[2].y, calls[2].m_points[3].x, calls[2].m_points[3].y,
                                      calls[2].m_uvs[1].x,    calls[2].m_uvs[1].y,    calls[3].m_points[0].x,
                                      calls[3].m_points[0].y, calls[3].m_points[1].x, calls[3].m_points[1].y};
    EXPECT_EQ(expected, found);
    EXPECT_EQ(rgba_t(9, 10, 11, 12), calls[2].m_colours[2]);
    EXPECT_EQ((std::vector<int>{32, 96, 320, 192}), camera.m_viewport);
    qortest::CReportCapture capture;
    render.end_draw(); // one end too many
    EXPECT_EQ(10u, calls.size());
    ASSERT_EQ(1u, capture.asserts().size());
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
    EXPECT_EQ(4u, capture.asserts().size());
}
