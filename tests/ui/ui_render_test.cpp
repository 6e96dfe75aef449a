// The render bridge against the host's recording renderer: device coordinates, clip areas, the
// nesting of 2D and 3D, and the contracts.
#include "ui_render.h"

#include "commands.h"
#include "engine_interfaces.h"
#include "interface_server.h"
#include "recording_renderer.h"
#include "test_support.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

class CViewportCamera : public IRenderCamera {
public:
    void set_viewport(int _x, int _y, int _w, int _h) override { m_x = _x, m_y = _y, m_w = _w, m_h = _h; }
    int m_x = -1, m_y = -1, m_w = -1, m_h = -1;
};

// A desktop of 1024 by 768 on a screen of 1600 by 1200.
class RenderTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_vars.set_var("scr_resx", "1600");
        m_vars.set_var("scr_resy", "1200");
        m_server.register_interface(&m_vars);
        engine_interfaces().set_server(&m_server);
        m_render.init(&m_recorder);
        m_render.set_resolution(1024, 768);
    }
    void TearDown() override { engine_interfaces().set_server(nullptr); }

    qorhost::CInterfaceServer m_server;
    qorhost::CVarManager m_vars;
    qorhost::CRecordingRenderer m_recorder;
    CRender m_render;
};

void expect_point(float _x, float _y, vec2_t const &_p) {
    EXPECT_FLOAT_EQ(_x, _p.x);
    EXPECT_FLOAT_EQ(_y, _p.y);
}

} // namespace

TEST_F(RenderTest, QuadsReachTheEngineInDeviceCoordinatesInTheirOrder) {
    vec2_t const t0{0, 0}, t1{1, 0}, t2{1, 1}, t3{0, 1};
    rgba_t const c0(1, 2, 3, 4), c1(5, 6, 7, 8), c2(9, 10, 11, 12), c3(13, 14, 15, 16);
    m_render.draw_quad(point_t{0, 0}, point_t{1024, 0}, point_t{1024, 768}, point_t{256, 192}, t0, t1, t2, t3,
                       c0, c1, c2, c3);
    ASSERT_EQ(1u, m_recorder.calls().size());
    qorhost::SRenderCall const &quad = m_recorder.calls()[0];
    ASSERT_EQ(4u, quad.m_points.size());
    expect_point(-1, 1, quad.m_points[0]);
    expect_point(1, 1, quad.m_points[1]);
    expect_point(1, -1, quad.m_points[2]);
    expect_point(-0.5f, 0.5f, quad.m_points[3]);
    expect_point(1, 0, quad.m_uvs[1]);
    EXPECT_EQ(c2, quad.m_colours[2]);
}

TEST_F(RenderTest, LinesHaveWidthOne) {
    m_render.draw_line(point_t{512, 384}, point_t{0, 768}, rgba_t(255, 0, 0, 255), rgba_t(0, 0, 255, 255));
    ASSERT_EQ("draw_line", m_recorder.sequence());
    expect_point(0, 0, m_recorder.calls()[0].m_points[0]);
    expect_point(-1, -1, m_recorder.calls()[0].m_points[1]);
}

TEST_F(RenderTest, AClipAreaGoesAsItsLowerLeftCornerAndSize) {
    m_render.set_clip_area(0, 0, 1024, 768);
    m_render.set_clip_area(256, 192, 512, 192);
    ASSERT_EQ(2u, m_recorder.calls().size());
    expect_point(-1, -1, m_recorder.calls()[0].m_points[0]);
    expect_point(2, 2, m_recorder.calls()[0].m_points[1]);
    expect_point(-0.5f, 0, m_recorder.calls()[1].m_points[0]);
    expect_point(1, 0.5f, m_recorder.calls()[1].m_points[1]);
}

TEST_F(RenderTest, NestedFramesReachTheEngineAtEveryLevel) {
    m_render.begin_draw();
    m_render.begin_draw();
    m_render.end_draw();
    m_render.end_draw();
    EXPECT_EQ("begin_2d begin_2d end_2d end_2d", m_recorder.sequence());
    qortest::CReportCapture capture;
    m_render.end_draw();
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos,
              capture.texts(qordebug::REPORT_ASSERT)[0].find("mp_render && m_in_draw_2d > 0"));
    EXPECT_EQ("begin_2d begin_2d end_2d end_2d", m_recorder.sequence());
}

TEST_F(RenderTest, AViewSuspendsTheTwoDimensionalBatchAndScalesItsViewport) {
    CViewportCamera camera;
    m_render.begin_draw();
    m_render.render_view(256, 192, 512, 384, &camera);
    m_render.end_draw();
    EXPECT_EQ("begin_2d end_2d render_view finish_view begin_2d end_2d", m_recorder.sequence());
    EXPECT_EQ(400, camera.m_x);
    EXPECT_EQ(300, camera.m_y);
    EXPECT_EQ(800, camera.m_w);
    EXPECT_EQ(600, camera.m_h);

    m_recorder.clear();
    m_render.render_view(0, 0, 10, 10, nullptr); // outside a frame, with no camera
    EXPECT_EQ("render_view finish_view", m_recorder.sequence());
}

TEST(RenderBridge, WithoutARendererEveryCallIsAReportedNoOp) {
    qortest::CReportCapture capture;
    CRender render;
    render.init(nullptr);
    render.set_resolution(640, 480);
    render.begin_draw();
    EXPECT_EQ(-1,
              render.create_material("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false));
    render.draw_line(point_t{0, 0}, point_t{1, 1}, rgba_t(), rgba_t());
    EXPECT_EQ(nullptr, render.get_avi_texture(0));
    std::vector<std::string> const asserts = capture.texts(qordebug::REPORT_ASSERT);
    ASSERT_EQ(4u, asserts.size());
    EXPECT_NE(std::string::npos, asserts[0].find("_p_render"));
    EXPECT_NE(std::string::npos, asserts[1].find("mp_render"));
}
