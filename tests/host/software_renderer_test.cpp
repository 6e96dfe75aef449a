// The host's software renderer: exact pixels of coloured and textured quads in small frames, the
// shared-edge rule, alpha blending, the clip rectangle with push and pop, lines, materials with
// missing textures, and presented frames written as PNG files.
#include "host_test_support.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <string>
#include <vector>

using namespace qorhost;
using hosttest::CReportCapture;
using hosttest::CTempDir;

namespace {

rgba_t const k_clear(10, 20, 30, 255);
rgba_t const k_white(255, 255, 255, 255);

rgba_t pixel(CSoftwareRenderer const &_renderer, int _x, int _y) {
    uint8_t const *p = _renderer.get_frame().pixel(_x, _y);
    return rgba_t(p[0], p[1], p[2], p[3]);
}

// Frame pixels to device coordinates: (0, 0) is the top left corner of the frame.
vec2_t at(CSoftwareRenderer const &_renderer, float _x, float _y) {
    return vec2_t{_x / _renderer.get_frame().m_w * 2.0f - 1.0f, 1.0f - _y / _renderer.get_frame().m_h * 2.0f};
}

// A rectangle in frame pixels, corners clockwise from the top left as the library sends them, with
// the colours of the left and the right side.
void draw_rect(CSoftwareRenderer &_renderer, float _x0, float _y0, float _x1, float _y1, rgba_t const &_left,
               rgba_t const &_right, vec2_t _uv0 = {0, 0}, vec2_t _uv1 = {1, 1}) {
    _renderer.draw_quad(at(_renderer, _x0, _y0), _uv0, _left, at(_renderer, _x1, _y0), vec2_t{_uv1.x, _uv0.y},
                        _right, at(_renderer, _x1, _y1), _uv1, _right, at(_renderer, _x0, _y1),
                        vec2_t{_uv0.x, _uv1.y}, _left);
}

void draw_rect(CSoftwareRenderer &_renderer, float _x0, float _y0, float _x1, float _y1,
               rgba_t const &_colour) {
    draw_rect(_renderer, _x0, _y0, _x1, _y1, _colour, _colour);
}

bool inside(int _x, int _y, int _x0, int _y0, int _x1, int _y1) {
    return _x >= _x0 && _x < _x1 && _y >= _y0 && _y < _y1;
}

// Every pixel is _in inside the rectangle of pixels and _out outside it.
void expect_rect(CSoftwareRenderer const &_renderer, int _x0, int _y0, int _x1, int _y1, rgba_t const &_in,
                 rgba_t const &_out) {
    for (int y = 0; y < _renderer.get_frame().m_h; ++y)
        for (int x = 0; x < _renderer.get_frame().m_w; ++x)
            EXPECT_EQ(inside(x, y, _x0, _y0, _x1, _y1) ? _in : _out, pixel(_renderer, x, y))
                << x << ", " << y;
}

// A picture whose pixel (x, y) is (x * 60, y * 60, 100, 255).
SImage gradient_image(int _w, int _h) {
    SImage image;
    image.m_w = _w;
    image.m_h = _h;
    image.m_pixels.resize(static_cast<size_t>(_w) * _h * 4);
    for (int y = 0; y < _h; ++y)
        for (int x = 0; x < _w; ++x) {
            uint8_t *p = image.pixel(x, y);
            p[0] = static_cast<uint8_t>(x * 60), p[1] = static_cast<uint8_t>(y * 60), p[2] = 100, p[3] = 255;
        }
    return image;
}

class SoftwareRendererTest : public testing::Test {
protected:
    SoftwareRendererTest() : m_renderer(8, 8) { m_renderer.begin_frame(k_clear); }

    // A "ui_image" material of a picture written into the test's folder.
    int image_material(std::string const &_name, SImage const &_image) {
        EXPECT_TRUE(write_png(m_dir.file(_name), _image));
        m_renderer.set_texture_folders({m_dir.path()});
        return m_renderer.create_material("ui_image", _name.c_str(), nullptr, nullptr, nullptr, nullptr,
                                          false, false);
    }

    CTempDir m_dir;
    CReportCapture m_reports;
    CSoftwareRenderer m_renderer;
};

} // namespace

// ---------------------------------------------------------------------------------------------
// Quads
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, ColouredQuadFillsExactlyThePixelsItCovers) {
    draw_rect(m_renderer, 2, 2, 6, 6, rgba_t(200, 100, 50, 255));
    expect_rect(m_renderer, 2, 2, 6, 6, rgba_t(200, 100, 50, 255), k_clear);
}

TEST_F(SoftwareRendererTest, WholeFrameQuadCoversEveryPixelWhicheverItsWinding) {
    rgba_t const colour(1, 2, 3, 255);
    // Counter-clockwise: bottom left, bottom right, top right, top left.
    m_renderer.draw_quad(vec2_t{-1, -1}, vec2_t{0, 1}, colour, vec2_t{1, -1}, vec2_t{1, 1}, colour,
                         vec2_t{1, 1}, vec2_t{1, 0}, colour, vec2_t{-1, 1}, vec2_t{0, 0}, colour);
    expect_rect(m_renderer, 0, 0, 8, 8, colour, k_clear);
}

TEST_F(SoftwareRendererTest, VertexColoursAreInterpolatedAtPixelCentres) {
    // Red and blue grow from the left edge: 20 and 10 per pixel, sampled at x + 0.5.
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(0, 7, 0, 255), rgba_t(160, 7, 80, 255));
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ(rgba_t(uint8_t(20 * x + 10), 7, uint8_t(10 * x + 5), 255), pixel(m_renderer, x, y))
                << x << ", " << y;
}

TEST_F(SoftwareRendererTest, PixelsOnSharedEdgesAndDiagonalsAreDrawnOnce) {
    // Half-transparent white over black gives 128 for a pixel drawn once, 192 for one drawn twice.
    // Four quads meet at the centre of pixel (4, 4); their edges and diagonals run through pixel
    // centres.
    m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    rgba_t const half(255, 255, 255, 128);
    draw_rect(m_renderer, 0, 0, 4.5f, 4.5f, half);
    draw_rect(m_renderer, 4.5f, 0, 8, 4.5f, half);
    draw_rect(m_renderer, 0, 4.5f, 4.5f, 8, half);
    draw_rect(m_renderer, 4.5f, 4.5f, 8, 8, half);
    expect_rect(m_renderer, 0, 0, 8, 8, rgba_t(128, 128, 128, 255), k_clear);
}

TEST_F(SoftwareRendererTest, DegenerateAndOffFrameQuadsDrawNothing) {
    rgba_t const red(255, 0, 0, 255);
    draw_rect(m_renderer, 3, 3, 3, 7, red);     // no width
    draw_rect(m_renderer, 20, 2, 30, 6, red);   // right of the frame
    draw_rect(m_renderer, -9, -9, -1, -1, red); // above and left of it
    float const nan = std::nanf("");
    m_renderer.draw_quad(vec2_t{nan, 0}, vec2_t{0, 0}, red, vec2_t{1, nan}, vec2_t{0, 0}, red, vec2_t{0, 0},
                         vec2_t{0, 0}, red, vec2_t{-1, -1}, vec2_t{0, 0}, red);
    expect_rect(m_renderer, 0, 0, 0, 0, red, k_clear);
}

// ---------------------------------------------------------------------------------------------
// Blending
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, ColourGoesOverTheFrameByItsAlpha) {
    m_renderer.begin_frame(rgba_t(0, 0, 200, 255));
    draw_rect(m_renderer, 0, 0, 2, 8, rgba_t(200, 100, 0, 64));  // a quarter
    draw_rect(m_renderer, 2, 0, 4, 8, rgba_t(200, 100, 0, 0));   // invisible
    draw_rect(m_renderer, 4, 0, 6, 8, rgba_t(200, 100, 0, 255)); // opaque
    draw_rect(m_renderer, 6, 0, 8, 8, rgba_t(200, 100, 0, 64));
    draw_rect(m_renderer, 6, 0, 8, 8, rgba_t(200, 100, 0, 64)); // twice over
    EXPECT_EQ(rgba_t(50, 25, 150, 255), pixel(m_renderer, 1, 3));
    EXPECT_EQ(rgba_t(0, 0, 200, 255), pixel(m_renderer, 3, 3));
    EXPECT_EQ(rgba_t(200, 100, 0, 255), pixel(m_renderer, 5, 3));
    EXPECT_EQ(rgba_t(88, 44, 112, 255), pixel(m_renderer, 7, 3));
}

TEST_F(SoftwareRendererTest, BeginFrameClearsEveryPixelAndTheClip) {
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(9, 9, 9, 255));
    m_renderer.set_clip_rect(vec2_t{0, 0}, vec2_t{1, 1});
    m_renderer.push_clip_rect();
    m_renderer.begin_frame(rgba_t(1, 2, 3, 4));
    expect_rect(m_renderer, 0, 0, 8, 8, rgba_t(1, 2, 3, 4), k_clear);
    SClipRect const clip = m_renderer.get_clip();
    EXPECT_EQ(0, clip.m_x0);
    EXPECT_EQ(0, clip.m_y0);
    EXPECT_EQ(8, clip.m_x1);
    EXPECT_EQ(8, clip.m_y1);
    // The stack went with it: a pop now has nothing to pop.
    m_renderer.pop_clip_rect();
    EXPECT_EQ(1u, m_reports.warnings().size());
}

// ---------------------------------------------------------------------------------------------
// Materials and textures
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, TexturedQuadAtTheTexturesSizeCopiesItExactly) {
    m_renderer.set_material(image_material("picture.png", gradient_image(4, 4)));
    draw_rect(m_renderer, 2, 2, 6, 6, k_white, k_white);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x) {
            rgba_t const expected = inside(x, y, 2, 2, 6, 6)
                                        ? rgba_t(uint8_t((x - 2) * 60), uint8_t((y - 2) * 60), 100, 255)
                                        : k_clear;
            EXPECT_EQ(expected, pixel(m_renderer, x, y)) << x << ", " << y;
        }
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(SoftwareRendererTest, TextureIsSampledAtTheNearestTexelWhenScaled) {
    m_renderer.set_material(image_material("small.png", gradient_image(2, 2)));
    draw_rect(m_renderer, 0, 0, 8, 8, k_white, k_white);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ(rgba_t(uint8_t(x / 4 * 60), uint8_t(y / 4 * 60), 100, 255), pixel(m_renderer, x, y))
                << x << ", " << y;
}

TEST_F(SoftwareRendererTest, TexelIsTintedByTheVertexColourAndBlendedByItsAlpha) {
    SImage image;
    image.m_w = 2, image.m_h = 1;
    image.m_pixels = {100, 200, 255, 255, 200, 0, 0, 128};
    m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    m_renderer.set_material(image_material("tint.png", image));
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(128, 255, 0, 255), rgba_t(128, 255, 0, 255));
    EXPECT_EQ(rgba_t(50, 200, 0, 255), pixel(m_renderer, 1, 1));
    // Red 200 at alpha 128 over black.
    m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    draw_rect(m_renderer, 0, 0, 8, 8, k_white, k_white);
    EXPECT_EQ(rgba_t(100, 0, 0, 255), pixel(m_renderer, 6, 6));
}

TEST_F(SoftwareRendererTest, MissingTextureIsReportedOnceAndShowsAMagentaChecker) {
    int const first = m_renderer.create_material("ui_image", "nothere.tga", "", "", "", "", false, false);
    int const second = m_renderer.create_material("ui_image", "nothere.tga", "", "", "", "", false, false);
    EXPECT_NE(first, second);
    EXPECT_EQ(std::vector<std::string>{"Cannot load texture 'nothere.tga'"}, m_reports.warnings());

    m_renderer.set_material(second);
    draw_rect(m_renderer, 0, 0, 8, 8, k_white, k_white);
    rgba_t const magenta(255, 0, 255, 255), black(0, 0, 0, 255);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ((x < 4) == (y < 4) ? magenta : black, pixel(m_renderer, x, y)) << x << ", " << y;
}

TEST_F(SoftwareRendererTest, TexturesAreLookedForInTheFoldersInOrder) {
    SImage red = gradient_image(1, 1), green = gradient_image(1, 1);
    red.m_pixels = {255, 0, 0, 255};
    green.m_pixels = {0, 255, 0, 255};
    ASSERT_TRUE(write_png(m_dir.write("first/shared.png", {}), red));
    ASSERT_TRUE(write_png(m_dir.write("second/shared.png", {}), green));
    ASSERT_TRUE(write_png(m_dir.write("second/own.png", {}), green));
    m_renderer.set_texture_folders({m_dir.file("first"), m_dir.file("second")});

    m_renderer.set_material(m_renderer.create_material("ui_image", "shared.png", 0, 0, 0, 0, false, false));
    draw_rect(m_renderer, 0, 0, 4, 8, k_white, k_white);
    m_renderer.set_material(m_renderer.create_material("ui_image", "own.png", 0, 0, 0, 0, false, false));
    draw_rect(m_renderer, 4, 0, 8, 8, k_white, k_white);
    // A path outside the folders is taken as it is.
    std::string const direct = m_dir.file("second/own.png");
    m_renderer.set_material(m_renderer.create_material("ui_image", direct.c_str(), 0, 0, 0, 0, false, false));
    draw_rect(m_renderer, 0, 6, 8, 8, k_white, k_white);

    EXPECT_EQ(rgba_t(255, 0, 0, 255), pixel(m_renderer, 1, 1));
    EXPECT_EQ(rgba_t(0, 255, 0, 255), pixel(m_renderer, 5, 1));
    EXPECT_EQ(rgba_t(0, 255, 0, 255), pixel(m_renderer, 1, 7));
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(SoftwareRendererTest, ColourAndUnknownMaterialsDrawTheVertexColour) {
    rgba_t const colour(7, 8, 9, 255);
    m_renderer.set_material(m_renderer.create_material("ui_color", nullptr, 0, 0, 0, 0, false, false));
    draw_rect(m_renderer, 0, 0, 2, 8, colour);
    m_renderer.set_material(m_renderer.create_material("ui_glow", "x.tga", 0, 0, 0, 0, false, false));
    draw_rect(m_renderer, 2, 0, 4, 8, colour);
    // A destroyed material is no material.
    int const image = image_material("picture.png", gradient_image(4, 4));
    m_renderer.destroy_material(image);
    m_renderer.set_material(image);
    draw_rect(m_renderer, 4, 0, 6, 8, colour);

    EXPECT_EQ(std::vector<std::string>{"Unknown material template 'ui_glow'; drawn as ui_color"},
              m_reports.warnings());
    expect_rect(m_renderer, 0, 0, 6, 8, colour, k_clear);
    EXPECT_EQ(2u, m_renderer.get_live_materials());
}

// ---------------------------------------------------------------------------------------------
// Clip
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, ClipRectangleIsGivenByItsLowerLeftCornerAndSize) {
    m_renderer.set_clip_rect(vec2_t{-0.5f, -0.75f}, vec2_t{1.0f, 1.0f});
    SClipRect const clip = m_renderer.get_clip();
    EXPECT_EQ(2, clip.m_x0);
    EXPECT_EQ(3, clip.m_y0);
    EXPECT_EQ(6, clip.m_x1);
    EXPECT_EQ(7, clip.m_y1);
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(1, 1, 1, 255));
    expect_rect(m_renderer, 2, 3, 6, 7, rgba_t(1, 1, 1, 255), k_clear);
}

TEST_F(SoftwareRendererTest, PushAndPopRestoreTheClip) {
    rgba_t const a(1, 0, 0, 255), b(0, 2, 0, 255);
    m_renderer.set_clip_rect(vec2_t{-1, -1}, vec2_t{1, 2}); // the left half
    m_renderer.push_clip_rect();
    m_renderer.set_clip_rect(vec2_t{0.5f, 0.5f}, vec2_t{0.5f, 0.5f}); // the top right corner
    draw_rect(m_renderer, 0, 0, 8, 8, b);
    m_renderer.pop_clip_rect();
    draw_rect(m_renderer, 0, 0, 8, 8, a);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ(x < 4                      ? a
                      : inside(x, y, 6, 0, 8, 2) ? b
                                                 : k_clear,
                      pixel(m_renderer, x, y))
                << x << ", " << y;
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(SoftwareRendererTest, PopWithoutPushIsReportedAndClipsToTheWholeFrame) {
    m_renderer.set_clip_rect(vec2_t{0, 0}, vec2_t{0.25f, 0.25f});
    m_renderer.pop_clip_rect();
    EXPECT_EQ(std::vector<std::string>{"pop_clip_rect without a push; the clip is the whole frame again"},
              m_reports.warnings());
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(5, 5, 5, 255));
    expect_rect(m_renderer, 0, 0, 8, 8, rgba_t(5, 5, 5, 255), k_clear);
}

TEST_F(SoftwareRendererTest, ClipIsLimitedToTheFrameAndMayBeEmpty) {
    m_renderer.set_clip_rect(vec2_t{-3, -3}, vec2_t{10, 10});
    SClipRect clip = m_renderer.get_clip();
    EXPECT_EQ(0, clip.m_x0);
    EXPECT_EQ(0, clip.m_y0);
    EXPECT_EQ(8, clip.m_x1);
    EXPECT_EQ(8, clip.m_y1);

    m_renderer.set_clip_rect(vec2_t{0.5f, 0.5f}, vec2_t{-1, -1});
    clip = m_renderer.get_clip();
    EXPECT_EQ(clip.m_x0, clip.m_x1);
    EXPECT_EQ(clip.m_y0, clip.m_y1);
    draw_rect(m_renderer, 0, 0, 8, 8, rgba_t(5, 5, 5, 255));
    m_renderer.draw_line(at(m_renderer, 0, 0), k_white, at(m_renderer, 8, 8), k_white, 1);
    expect_rect(m_renderer, 0, 0, 0, 0, k_white, k_clear);
}

// ---------------------------------------------------------------------------------------------
// Lines
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, HorizontalLineRunsFromCentreToCentreWithItsColourInterpolated) {
    m_renderer.draw_line(at(m_renderer, 0.5f, 2.5f), rgba_t(0, 0, 0, 255), at(m_renderer, 7.5f, 2.5f),
                         rgba_t(70, 0, 0, 255), 1.0f);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x)
            EXPECT_EQ(y == 2 ? rgba_t(uint8_t(10 * x), 0, 0, 255) : k_clear, pixel(m_renderer, x, y))
                << x << ", " << y;
}

TEST_F(SoftwareRendererTest, DiagonalAndVerticalLinesSetOnePixelPerStep) {
    m_renderer.draw_line(at(m_renderer, 0.5f, 0.5f), k_white, at(m_renderer, 7.5f, 7.5f), k_white, 1.0f);
    m_renderer.draw_line(at(m_renderer, 7.5f, 0.5f), rgba_t(9, 9, 9, 255), at(m_renderer, 7.5f, 5.5f),
                         rgba_t(9, 9, 9, 255), 1.0f);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x) {
            rgba_t const expected = x == y ? k_white : x == 7 && y <= 5 ? rgba_t(9, 9, 9, 255) : k_clear;
            EXPECT_EQ(expected, pixel(m_renderer, x, y)) << x << ", " << y;
        }
}

TEST_F(SoftwareRendererTest, LinesStayInsideTheClipAndTheFrame) {
    m_renderer.draw_line(at(m_renderer, 3.5f, 3.5f), k_white, at(m_renderer, 3.5f, 3.5f), k_white, 1.0f);
    m_renderer.set_clip_rect(vec2_t{-0.5f, -1}, vec2_t{1, 2}); // columns 2 to 5
    // From far left of the frame to far right of it, through row 6.
    m_renderer.draw_line(at(m_renderer, -40.5f, 6.5f), k_white, at(m_renderer, 60.5f, 6.5f), k_white, 3.0f);
    for (int y = 0; y < 8; ++y)
        for (int x = 0; x < 8; ++x) {
            bool const lit = (x == 3 && y == 3) || (y == 6 && x >= 2 && x < 6);
            EXPECT_EQ(lit ? k_white : k_clear, pixel(m_renderer, x, y)) << x << ", " << y;
        }
}

// ---------------------------------------------------------------------------------------------
// Frames
// ---------------------------------------------------------------------------------------------

TEST_F(SoftwareRendererTest, PresentedFramesReachTheSinkAndReadBackIdenticallyAsPng) {
    std::vector<SImage> presented;
    m_renderer.set_frame_sink([&](SImage const &_frame, unsigned _index) {
        EXPECT_EQ(presented.size(), _index);
        presented.push_back(_frame);
        EXPECT_TRUE(write_png(m_dir.file("frame_" + std::to_string(_index) + ".png"), _frame));
    });
    draw_rect(m_renderer, 1, 1, 7, 7, rgba_t(0, 0, 0, 255), rgba_t(255, 128, 64, 200));
    m_renderer.present();
    m_renderer.begin_frame(rgba_t(0, 0, 0, 0));
    m_renderer.draw_line(at(m_renderer, 0, 0), rgba_t(1, 2, 3, 4), at(m_renderer, 8, 8), rgba_t(5, 6, 7, 8),
                         1);
    m_renderer.present();

    ASSERT_EQ(2u, presented.size());
    EXPECT_EQ(2u, m_renderer.get_presented());
    EXPECT_NE(presented[0].m_pixels, presented[1].m_pixels);
    for (unsigned i = 0; i < presented.size(); ++i) {
        SImage read;
        ASSERT_TRUE(load_image(m_dir.file("frame_" + std::to_string(i) + ".png"), read));
        EXPECT_EQ(8, read.m_w);
        EXPECT_EQ(8, read.m_h);
        EXPECT_EQ(presented[i].m_pixels, read.m_pixels) << "frame " << i;
    }
    EXPECT_EQ(presented[1].m_pixels, m_renderer.get_frame().m_pixels);
}
