// The host's software renderer in frames of 8 by 8: exact pixels of coloured and textured quads,
// the shared-edge rule, alpha blending, the clip rectangle with push and pop, lines, materials with
// missing textures, and presented frames; and rectangles filled by spans against their triangles.
#include "host_test_support.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <map>

using namespace qorhost;

namespace {

rgba_t const k_clear(10, 20, 30, 255);
rgba_t const k_white(255, 255, 255, 255);

class SoftwareRendererTest : public testing::Test {
protected:
    SoftwareRendererTest() : m_renderer(8, 8) { m_renderer.begin_frame(k_clear); }

    rgba_t pixel(int _x, int _y) const {
        uint8_t const *p = m_renderer.get_frame().pixel(_x, _y);
        return rgba_t(p[0], p[1], p[2], p[3]);
    }
    // Frame pixels to device coordinates: (0, 0) is the top left corner of the frame.
    static vec2_t at(float _x, float _y) { return vec2_t{_x / 4 - 1, 1 - _y / 4}; }
    // A rectangle in frame pixels, corners clockwise from the top left as the library sends them,
    // with the colours of the left and the right side.
    void rect(float _x0, float _y0, float _x1, float _y1, rgba_t const &_left, rgba_t const &_right) {
        m_renderer.draw_quad(at(_x0, _y0), vec2_t{0, 0}, _left, at(_x1, _y0), vec2_t{1, 0}, _right,
                             at(_x1, _y1), vec2_t{1, 1}, _right, at(_x0, _y1), vec2_t{0, 1}, _left);
    }
    void rect(float _x0, float _y0, float _x1, float _y1, rgba_t const &_colour) {
        rect(_x0, _y0, _x1, _y1, _colour, _colour);
    }
    // The frame as rows of characters, each pixel the legend's character of its colour ('.' the
    // clear colour, '?' anything else).
    std::vector<std::string> picture(std::map<char, rgba_t> _legend) const {
        _legend['.'] = k_clear;
        std::vector<std::string> rows(8, std::string(8, '?'));
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 8; ++x)
                for (auto const &entry : _legend)
                    if (entry.second == pixel(x, y)) rows[y][x] = entry.first;
        return rows;
    }
    // A "ui_image" material of a picture written into the test's folder.
    int image_material(std::string const &_name, SImage const &_image) {
        EXPECT_TRUE(write_png(m_dir.file(_name), _image));
        m_renderer.set_texture_folders({m_dir.path()});
        return m_renderer.create_material("ui_image", _name.c_str(), nullptr, nullptr, nullptr, nullptr,
                                          false, false);
    }
    // A picture whose pixel (x, y) is (x * 60, y * 60, 100, 255).
    static SImage gradient(int _w, int _h) {
        SImage image;
        image.m_w = _w, image.m_h = _h;
        for (int y = 0; y < _h; ++y)
            for (int x = 0; x < _w; ++x)
                image.m_pixels.insert(image.m_pixels.end(), {uint8_t(x * 60), uint8_t(y * 60), 100, 255});
        return image;
    }

    hosttest::CTempDir m_dir;
    hosttest::CReportCapture m_reports;
    CSoftwareRenderer m_renderer;
};

typedef std::vector<std::string> rows_t;

} // namespace

TEST_F(SoftwareRendererTest, QuadsFillThePixelsWhoseCentresTheyCoverAndNothingTwice) {
    rgba_t const red(200, 0, 0, 255), nan_colour(1, 1, 1, 255);
    rect(2, 2, 6, 6, red);
    rect(3, 3, 3, 7, red);     // no width
    rect(20, 2, 30, 6, red);   // right of the frame
    rect(-9, -9, -1, -1, red); // above and left of it
    float const nan = std::nanf("");
    m_renderer.draw_quad(vec2_t{nan, 0}, vec2_t{0, 0}, nan_colour, vec2_t{1, nan}, vec2_t{0, 0}, nan_colour,
                         vec2_t{0, 0}, vec2_t{0, 0}, nan_colour, vec2_t{-1, -1}, vec2_t{0, 0}, nan_colour);
    EXPECT_EQ((rows_t{"........", "........", "..####..", "..####..", "..####..", "..####..", "........",
                      "........"}),
              picture({{'#', red}}));

    // Counter-clockwise, the whole frame: bottom left, bottom right, top right, top left.
    m_renderer.draw_quad(vec2_t{-1, -1}, vec2_t{0, 1}, red, vec2_t{1, -1}, vec2_t{1, 1}, red, vec2_t{1, 1},
                         vec2_t{1, 0}, red, vec2_t{-1, 1}, vec2_t{0, 0}, red);
    EXPECT_EQ(rows_t(8, "########"), picture({{'#', red}}));

    // Half-transparent white over black: 128 for a pixel drawn once, 192 for one drawn twice. Four
    // quads meet at the centre of pixel (4, 4); their edges and diagonals run through pixel centres.
    m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    rgba_t const half(255, 255, 255, 128);
    for (float x : {0.0f, 4.5f})
        for (float y : {0.0f, 4.5f})
            rect(x, y, x + 4.5f > 8 ? 8 : x + 4.5f, y + 4.5f > 8 ? 8 : y + 4.5f, half);
    EXPECT_EQ(rows_t(8, "########"), picture({{'#', rgba_t(128, 128, 128, 255)}}));
}

TEST_F(SoftwareRendererTest, ColoursAreInterpolatedAtPixelCentresAndBlendedByTheirAlpha) {
    // Red and blue grow from the left edge: 20 and 10 per pixel, sampled at x + 0.5.
    rect(0, 0, 8, 8, rgba_t(0, 7, 0, 255), rgba_t(160, 7, 80, 255));
    for (int x = 0; x < 8; ++x)
        EXPECT_EQ(rgba_t(uint8_t(20 * x + 10), 7, uint8_t(10 * x + 5), 255), pixel(x, 5)) << x;
    m_renderer.begin_frame(rgba_t(0, 0, 200, 255));
    rect(0, 0, 2, 8, rgba_t(200, 100, 0, 64)); // a quarter
    rect(2, 0, 4, 8, rgba_t(200, 100, 0, 0));  // invisible
    rect(6, 0, 8, 8, rgba_t(200, 100, 0, 64));
    rect(6, 0, 8, 8, rgba_t(200, 100, 0, 64)); // twice over
    EXPECT_EQ(rgba_t(50, 25, 150, 255), pixel(1, 3));
    EXPECT_EQ(rgba_t(0, 0, 200, 255), pixel(3, 3));
    EXPECT_EQ(rgba_t(88, 44, 112, 255), pixel(7, 3));
}

TEST_F(SoftwareRendererTest, TexturesAreCopiedAtTheirSizeSampledNearestAndTinted) {
    m_renderer.set_material(image_material("picture.png", gradient(4, 4)));
    rect(2, 2, 6, 6, k_white);
    for (int i = 0; i < 4; ++i)
        EXPECT_EQ(rgba_t(uint8_t(i * 60), uint8_t(i * 60), 100, 255), pixel(2 + i, 2 + i)) << i;
    EXPECT_EQ(k_clear, pixel(1, 1));
    m_renderer.set_material(image_material("small.png", gradient(2, 2)));
    rect(0, 0, 8, 8, k_white); // each texel four pixels wide
    EXPECT_EQ(rgba_t(0, 60, 100, 255), pixel(3, 4));
    EXPECT_EQ(rgba_t(60, 0, 100, 255), pixel(4, 3));

    SImage tint;
    tint.m_w = 2, tint.m_h = 1;
    tint.m_pixels = {100, 200, 255, 255, 200, 0, 0, 128};
    m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    m_renderer.set_material(image_material("tint.png", tint));
    rect(0, 0, 8, 8, rgba_t(128, 255, 0, 255));
    EXPECT_EQ(rgba_t(50, 200, 0, 255), pixel(1, 1)); // tinted by the vertex colour
    EXPECT_EQ(rgba_t(50, 0, 0, 255), pixel(6, 6));   // red 100 at alpha 128 over black
    EXPECT_TRUE(m_reports.reports().empty());
}

TEST_F(SoftwareRendererTest, TexturesAreLookedForInTheFoldersInOrderAndAMissingOneShows) {
    SImage red = gradient(1, 1), green = gradient(1, 1);
    red.m_pixels = {255, 0, 0, 255};
    green.m_pixels = {0, 255, 0, 255};
    ASSERT_TRUE(write_png(m_dir.write("first/shared.png", {}), red));
    ASSERT_TRUE(write_png(m_dir.write("second/shared.png", {}), green));
    ASSERT_TRUE(write_png(m_dir.write("second/own.png", {}), green));
    m_renderer.set_texture_folders({m_dir.file("first"), m_dir.file("second")});
    std::string const direct = m_dir.file("second/own.png"); // a path outside the folders is taken as it is
    int const handles[] = {m_renderer.create_material("ui_image", "shared.png", 0, 0, 0, 0, false, false),
                           m_renderer.create_material("ui_image", "own.png", 0, 0, 0, 0, false, false),
                           m_renderer.create_material("ui_image", direct.c_str(), 0, 0, 0, 0, false, false),
                           m_renderer.create_material("ui_image", "nothere.tga", 0, 0, 0, 0, false, false),
                           m_renderer.create_material("ui_image", "nothere.tga", 0, 0, 0, 0, false, false)};
    for (int i = 0; i < 4; ++i) {
        m_renderer.set_material(handles[i]);
        rect(0, i * 2.0f, 8, i * 2.0f + 2, k_white);
    }
    // A missing texture is reported once and drawn as a checker of magenta and black (its 8 rows
    // in 2 here).
    EXPECT_EQ((rows_t{"RRRRRRRR", "RRRRRRRR", "GGGGGGGG", "GGGGGGGG", "GGGGGGGG", "GGGGGGGG", "MMMM####",
                      "####MMMM"}),
              picture({{'R', rgba_t(255, 0, 0, 255)},
                       {'G', rgba_t(0, 255, 0, 255)},
                       {'M', rgba_t(255, 0, 255, 255)},
                       {'#', rgba_t(0, 0, 0, 255)}}));
    EXPECT_EQ((std::vector<std::string>{"Cannot load texture 'nothere.tga'"}), m_reports.warnings());

    // Corners far outside and texture coordinates that aren't numbers still cover the frame.
    m_renderer.begin_frame(k_clear);
    float const nan = std::nanf("");
    for (float const far : {1e30f, 1e6f})
        m_renderer.draw_quad(vec2_t{-far, far}, vec2_t{nan, nan}, k_white, vec2_t{-far, -far}, vec2_t{nan, 1},
                             k_white, vec2_t{far, -far}, vec2_t{1, nan}, k_white, vec2_t{far, far},
                             vec2_t{far, -far}, k_white);
    EXPECT_NE(k_clear, pixel(0, 7));
}

TEST_F(SoftwareRendererTest, ColourUnknownAndDestroyedMaterialsDrawTheVertexColour) {
    rgba_t const colour(7, 8, 9, 255);
    m_renderer.set_material(m_renderer.create_material("ui_color", nullptr, 0, 0, 0, 0, false, false));
    rect(0, 0, 2, 8, colour);
    m_renderer.set_material(m_renderer.create_material("ui_glow", "x.tga", 0, 0, 0, 0, false, false));
    rect(2, 0, 4, 8, colour);
    int const image = image_material("picture.png", gradient(4, 4));
    m_renderer.destroy_material(image);
    m_renderer.set_material(image);
    rect(4, 0, 6, 8, colour);
    EXPECT_EQ(rows_t(8, "######.."), picture({{'#', colour}}));
    EXPECT_EQ((std::vector<std::string>{"Unknown material template 'ui_glow'; drawn as ui_color"}),
              m_reports.warnings());
    EXPECT_EQ(2u, m_renderer.get_live_materials());
}

TEST_F(SoftwareRendererTest, TheClipIsALowerLeftCornerAndASizeInsideTheFrameAndStacks) {
    rgba_t const a(1, 0, 0, 255), b(0, 2, 0, 255);
    m_renderer.set_clip_rect(vec2_t{-3, -3}, vec2_t{10, 10}); // limited to the frame
    EXPECT_EQ(8, m_renderer.get_clip().m_x1);
    m_renderer.set_clip_rect(vec2_t{-1, -1}, vec2_t{1, 2}); // the left half
    m_renderer.push_clip_rect();
    m_renderer.set_clip_rect(vec2_t{0.5f, 0.5f}, vec2_t{0.5f, 0.5f}); // the top right corner
    rect(0, 0, 8, 8, b);
    m_renderer.pop_clip_rect();
    rect(0, 0, 8, 8, a);
    m_renderer.set_clip_rect(vec2_t{0.5f, 0.5f}, vec2_t{-1, -1}); // empty
    rect(0, 0, 8, 8, k_white);
    m_renderer.draw_line(at(0, 0), k_white, at(8, 8), k_white, 1);
    EXPECT_EQ((rows_t{"aaaa..bb", "aaaa..bb", "aaaa....", "aaaa....", "aaaa....", "aaaa....", "aaaa....",
                      "aaaa...."}),
              picture({{'a', a}, {'b', b}}));
    EXPECT_TRUE(m_reports.reports().empty());

    // A pop without a push is reported and clips to the whole frame; a new frame empties the stack.
    m_renderer.pop_clip_rect();
    rect(0, 0, 8, 8, k_white);
    EXPECT_EQ(rows_t(8, "########"), picture({{'#', k_white}}));
    m_renderer.set_clip_rect(vec2_t{0, 0}, vec2_t{1, 1});
    m_renderer.push_clip_rect();
    m_renderer.begin_frame(k_clear);
    EXPECT_EQ(0, m_renderer.get_clip().m_x0);
    m_renderer.pop_clip_rect();
    EXPECT_EQ((std::vector<std::string>{"pop_clip_rect without a push; the clip is the whole frame again",
                                        "pop_clip_rect without a push; the clip is the whole frame again"}),
              m_reports.warnings());
}

TEST_F(SoftwareRendererTest, LinesRunFromCentreToCentreOnePixelPerStepInsideTheClip) {
    m_renderer.draw_line(at(0.5f, 2.5f), rgba_t(0, 0, 0, 255), at(7.5f, 2.5f), rgba_t(70, 0, 0, 255), 1.0f);
    for (int x = 0; x < 8; ++x)
        EXPECT_EQ(rgba_t(uint8_t(10 * x), 0, 0, 255), pixel(x, 2)) << x; // the colour interpolated
    m_renderer.begin_frame(k_clear);
    m_renderer.draw_line(at(0.5f, 0.5f), k_white, at(7.5f, 7.5f), k_white, 1.0f);
    m_renderer.draw_line(at(7.5f, 0.5f), k_white, at(7.5f, 4.5f), k_white, 1.0f);
    m_renderer.set_clip_rect(vec2_t{-0.5f, -1}, vec2_t{1, 2});                     // columns 2 to 5
    m_renderer.draw_line(at(-4e8f, 6.5f), k_white, at(4e8f, 6.5f), k_white, 3.0f); // from far outside
    EXPECT_EQ((rows_t{"#......#", ".#.....#", "..#....#", "...#...#", "....#..#", ".....#..", "..#####.",
                      ".......#"}),
              picture({{'#', k_white}}));
}

TEST_F(SoftwareRendererTest, PresentedFramesReachTheSinkInOrder) {
    std::vector<SImage> presented;
    m_renderer.set_frame_sink([&](SImage const &_frame, unsigned _index) {
        EXPECT_EQ(presented.size(), _index);
        presented.push_back(_frame);
    });
    rect(1, 1, 7, 7, rgba_t(255, 128, 64, 200));
    m_renderer.present();
    m_renderer.begin_frame(rgba_t(0, 0, 0, 0));
    m_renderer.present();
    ASSERT_EQ(2u, m_renderer.get_presented());
    EXPECT_NE(presented[0].m_pixels, presented[1].m_pixels);
    EXPECT_EQ(presented[1].m_pixels, m_renderer.get_frame().m_pixels);
}

// Rectangles are filled by spans; the same rectangles drawn as two quads of one triangle each go
// the triangles' way. Both give the same bytes for rectangles of fractional edges, colours opaque
// and translucent, pictures at their size, stretched and shrunk by odd ratios, tinted and faded.
TEST(SoftwareRendererRects, SpansGiveTheBytesOfTheTriangles) {
    hosttest::CTempDir dir;
    SImage picture; // texels of every kind of alpha and colour
    picture.m_w = 13, picture.m_h = 7;
    for (int i = 0; i < 13 * 7; ++i)
        picture.m_pixels.insert(picture.m_pixels.end(),
                                {uint8_t(i * 37), uint8_t(255 - i * 11), uint8_t(i % 3 * 127),
                                 uint8_t(i % 4 == 0   ? 255
                                         : i % 4 == 1 ? 0
                                                      : i * 29)});
    ASSERT_TRUE(write_png(dir.file("picture.png"), picture));
    CSoftwareRenderer spans(96, 64), triangles(96, 64);
    int materials[2] = {};
    for (CSoftwareRenderer *p_renderer : {&spans, &triangles}) {
        p_renderer->set_texture_folders({dir.path()});
        p_renderer->begin_frame(rgba_t(40, 90, 200, 255));
        materials[0] = p_renderer->create_material("ui_color", nullptr, 0, 0, 0, 0, false, false);
        materials[1] = p_renderer->create_material("ui_image", "picture.png", 0, 0, 0, 0, false, false);
    }
    unsigned seed = 12345;
    auto next = [&seed](unsigned _range) {
        seed = seed * 1103515245u + 12345u;
        return (seed >> 16) % _range;
    };
    for (int i = 0; i < 300; ++i) {
        // Edges on 1/8 pixels, sides up to 40 pixels; the picture's part from eighths of it.
        float const x0 = next(640) / 8.0f - 4, y0 = next(440) / 8.0f - 4;
        float const x1 = x0 + next(320) / 8.0f + 0.125f, y1 = y0 + next(320) / 8.0f + 0.125f;
        float const u0 = next(9) / 8.0f, v0 = next(9) / 8.0f, u1 = next(9) / 8.0f, v1 = next(9) / 8.0f;
        uint8_t const levels[] = {0, 255, 128, 77};
        rgba_t const colour(levels[next(4)], uint8_t(next(256)), levels[next(4)], levels[next(4)]);
        auto at = [](float _x, float _y) { return vec2_t{_x / 48 - 1, 1 - _y / 32}; };
        vec2_t const p[4] = {at(x0, y0), at(x1, y0), at(x1, y1), at(x0, y1)};
        vec2_t const t[4] = {{u0, v0}, {u1, v0}, {u1, v1}, {u0, v1}};
        int const material = materials[next(2)];
        spans.set_material(material);
        triangles.set_material(material);
        int const first = static_cast<int>(next(4)), turn = next(2) ? 1 : 3; // any corner first, either way
        auto c = [&](int _k) { return (first + turn * _k) % 4; };
        spans.draw_quad(p[c(0)], t[c(0)], colour, p[c(1)], t[c(1)], colour, p[c(2)], t[c(2)], colour, p[c(3)],
                        t[c(3)], colour);
        triangles.draw_quad(p[c(0)], t[c(0)], colour, p[c(1)], t[c(1)], colour, p[c(2)], t[c(2)], colour,
                            p[c(2)], t[c(2)], colour);
        triangles.draw_quad(p[c(0)], t[c(0)], colour, p[c(2)], t[c(2)], colour, p[c(3)], t[c(3)], colour,
                            p[c(3)], t[c(3)], colour);
        if (spans.get_frame().m_pixels != triangles.get_frame().m_pixels) {
            ADD_FAILURE() << "rectangle " << i << ": " << x0 << ", " << y0 << " to " << x1 << ", " << y1;
            break;
        }
    }
}
