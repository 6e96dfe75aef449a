// The canvas of a window on the test world: positions, texture coordinates, colours and the order
// of the recorded calls for rectangles, tiles, nine-patches, tagged text and texts of many lines;
// then pictures of the software renderer against checked-in goldens.
#include "ui_canvas.h"

#include "engine_interfaces.h"
#include "image_io.h"
#include "qorbase.h"
#include "test_world.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_string.h"
#include "ui_text.h"

#include <gtest/gtest.h>

#include <functional>
#include <memory>

using namespace qorui;
using qortest::rect_text;

namespace {

// A desktop of 400 by 300 with the owner at (100, 50), 200 by 100, and a font of a 4 by 4 grid:
// 'a' is 0.5 cells wide, the others a whole cell; size 64 makes a cell 16 pixels, a line 16 high.
class CanvasTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string const dir = qortest::make_temp_dir();
        qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, dir.c_str());
        qortest::write_file(dir + "/grid.fnt",
                            "[common] dimension = 4 font_h = 1 [chars] 32 = 0.25 97 = 0.5 98 = 1 "
                            "60 = 1 62 = 1 47 = 1 99 = 1 111 = 1 108 = 1 114 = 1 120 = 1");
        lua_machine().DoString(
            "charsets = { canvas_grid = { file_type = 'nehe', file_name = 'grid.fnt' } }"
            "fonts = { grid = { charset_name = 'canvas_grid', size = 64,"
            " material = { material_template = 'ui_color', color = { r = 9, g = 8, b = 7, a = 6 } } } }");
        mp_font.reset(get_fonts_factory().create("grid", &m_world.desktop()));
        m_world.recorder().clear();
    }
    // The recorded quads, for their texture coordinates.
    std::vector<qorhost::SRenderCall> quad_calls() {
        std::vector<qorhost::SRenderCall> found;
        for (auto const &call : m_world.recorder().calls())
            if (call.m_op == "draw_quad") found.push_back(call);
        return found;
    }
    std::vector<qortest::CWorld::SDrawn> text_quads(char const *_text) {
        m_world.recorder().clear();
        m_canvas.text_out(0, 0, CString(_text), mp_font.get());
        return m_world.quads();
    }

    qortest::CWorld m_world{400, 300};
    CWindowVisual *mp_owner =
        m_world.place(&m_world.desktop(), new CWindowVisual(&m_world.desktop(), "owner"), 100, 50, 200, 100);
    CCanvas &m_canvas = mp_owner->get_canvas();
    std::unique_ptr<CMaterial> mp_white{m_world.colour(255, 255, 255)};
    std::unique_ptr<CFont> mp_font;
};

} // namespace

TEST_F(CanvasTest, ARectangleIsOneQuadAtTheOwnersPlaceAndFadesWithIt) {
    m_canvas.draw_rect(10, 20, 30, 40, 0.25f, 0.5f, 0.125f, 0.25f, mp_white.get());
    m_canvas.draw_rect(0, 0, 10, 10, nullptr);
    ASSERT_EQ("set_material draw_quad", m_world.recorder().sequence());
    EXPECT_EQ("110,70 30x40", rect_text(m_world.quads()[0].m_rect));
    qorhost::SRenderCall const &quad = m_world.recorder().calls()[1];
    EXPECT_FLOAT_EQ(0.75f, quad.m_uvs[1].y); // lower left
    EXPECT_FLOAT_EQ(0.375f, quad.m_uvs[2].x);
    // Half faded: colour and alpha scale, the material stays.
    mp_owner->send_event(mp_owner, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    m_world.clock().advance_ms(75);
    mp_owner->send_event(mp_owner, EVENT_DRAW, CWndEvent::DISPATCH_NONE);
    m_world.recorder().clear();
    m_canvas.draw_line(0, 0, 10, 0, mp_white.get());
    EXPECT_EQ(rgba_t(127, 127, 127, 127), m_world.recorder().calls()[1].m_colours[0]);
    EXPECT_EQ(rgba_t(255, 255, 255, 255), mp_white->get_color());
}

TEST_F(CanvasTest, TilesAndNinePatchesRepeatFromTheCornerInsideAClip) {
    m_canvas.draw_tiled(10, 20, 40, 20, 0, 0, 0.5f, 0.5f, 32, 32, mp_white.get());
    m_canvas.draw_tiled(0, 0, 10, 10, 0, 0, 0, 1, 8, 8, mp_white.get()); // a tile of width 0
    EXPECT_EQ("set_clip_rect push_clip_rect set_material draw_quad draw_quad draw_quad draw_quad draw_quad "
              "draw_quad pop_clip_rect set_clip_rect push_clip_rect set_material pop_clip_rect",
              m_world.recorder().sequence());
    std::vector<qortest::CWorld::SDrawn> pieces = m_world.quads(); // tiles of 16: 3 columns, 2 rows
    EXPECT_EQ("10,20 16x16", rect_text(pieces[0].m_rect));
    EXPECT_EQ("42,36 16x16", rect_text(pieces[5].m_rect));

    mp_white->load_state(
        qortest::lua_table("{ tex_size = { 16, 16 }, bordered = true, border_left = 0.25,"
                           " border_right = 0.25, border_top = 0.125, border_bottom = 0.125 }"));
    m_world.recorder().clear();
    m_canvas.draw_rect(0, 0, 24, 20, mp_white.get());
    pieces = m_world.quads();
    // Corners of 4 by 2; the left edge of 4 by 16 in tiles of 4 by 12; the centre 16 by 16 in 8 by 12.
    ASSERT_EQ(4u + 2 + 2 + 2 + 2 + 4, pieces.size());
    std::string corners;
    for (int i : {0, 1, 2, 5})
        corners += rect_text(pieces[i].m_rect) + "; ";
    EXPECT_EQ("100,50 4x2; 100,68 4x2; 120,68 4x2; 100,64 4x12; ", corners);
    EXPECT_FLOAT_EQ(0.875f, quad_calls()[2].m_uvs[0].y); // the third corner's

    qortest::CReportCapture capture;
    std::unique_ptr<CMaterial> p_untextured(m_world.desktop().create_material());
    p_untextured->load_state(qortest::lua_table("{ material_template = 'ui_color', bordered = true,"
                                                " border_left = 0.25 }"));
    m_world.recorder().clear();
    m_canvas.draw_rect(0, 0, 24, 20, p_untextured.get());
    EXPECT_EQ((std::vector<std::string>{"tex_size must be set for bordered material"}), capture.warnings());
    EXPECT_TRUE(m_world.quads().empty());
}

TEST_F(CanvasTest, TextIsOneQuadPerCharacterOfWholePixelsWithTagsInterpreted) {
    auto chars = text_quads("a<color 255 0 0 255>b</color>a");
    ASSERT_EQ(3u, chars.size());
    EXPECT_EQ("100,50 8x16", rect_text(chars[0].m_rect)); // 'a' is 8 wide, every line 16 high
    EXPECT_EQ("108,50 16x16", rect_text(chars[1].m_rect));
    EXPECT_EQ(rgba_t(255, 0, 0, 255), chars[1].m_colour);
    EXPECT_EQ(rgba_t(9, 8, 7, 6), chars[2].m_colour);
    EXPECT_EQ(rgba_t(9, 8, 7, 6), mp_font->get_char_material('a')->get_color()); // restored
    EXPECT_FLOAT_EQ(0.5f, quad_calls()[1].m_uvs[0].x);                           // 'b': the third cell
    // The numbers of a colour tag are read up to the end of the string, past any blanks, as the
    // standard scan of unsigned numbers reads them.
    struct {
        std::string m_text;
        size_t m_quads;
        rgba_t m_last;
    } const rows[] = {
        {"<color 255 0 0>x", 1, rgba_t(9, 8, 7, 6)},                 // three numbers: the colour stays
        {"<color 300 0 0 255>x", 1, rgba_t(44, 0, 0, 255)},          // the low eight bits
        {"a</color>", 1, rgba_t(9, 8, 7, 6)},                        // consumed, nothing behind it
        {"<b>ab", 2, rgba_t(9, 8, 7, 6)},                            // unknown tags are swallowed
        {"a<", 2, rgba_t(9, 8, 7, 6)},                               // too near the end: a character
        {"a<b", 3, rgba_t(9, 8, 7, 6)},                              // no '>' behind it
        {"<color 1 2 3 4><color 5 6 7 8>x", 16, rgba_t(1, 2, 3, 4)}, // the second tag is text
        {"<color1 2 3 4>x", 1, rgba_t(1, 2, 3, 4)},                  // "color" needs no delimiter
        {"<Color 1 2 3 4>x", 1, rgba_t(9, 8, 7, 6)},                 // and is case-sensitive
        {"<color" + std::string(300, '\t') + "+0000000000000255 1 2 3>x", 1, rgba_t(255, 1, 2, 3)},
        {"<color -1 99999999999999999999999 -99999999999999999999999 260>x", 1, rgba_t(255, 255, 255, 4)},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_text);
        chars = text_quads(row.m_text.c_str());
        ASSERT_EQ(row.m_quads, chars.size());
        EXPECT_EQ(row.m_last, chars.back().m_colour);
    }
    m_canvas.set_tags_enable(false);
    EXPECT_EQ(3u, text_quads("<b>").size());
    EXPECT_EQ(4, m_canvas.get_char_width(0x416, mp_font.get())); // missing: the lowest code, ' ', 4 wide
    CString const ab("ab");
    EXPECT_EQ(24, m_canvas.get_text_width(ab, mp_font.get(), 3));
    EXPECT_EQ(8, m_canvas.get_text_width(ab, mp_font.get(), 1));
}

TEST_F(CanvasTest, ATextDrawsTheVisibleLinesCentredInTheirOwnFonts) {
    CText text("<color 1 2 3 4>a\\nb\\nab\\nb\\nb\\nb\\nb\\nb\\nb");
    text.set_alignment(ALIGNMENT_CENTER);
    m_canvas.text_out(0, -21, 4, text, mp_font.get());
    // Lines of 20 pixels from -21: the first ends above the owner and is skipped, the second
    // reaches into it, and the last drawn starts at 99; the one at 119 is below.
    auto chars = m_world.quads();
    ASSERT_EQ(7u, chars.size());
    EXPECT_EQ("192,49 16x16", rect_text(chars[0].m_rect)); // "b" centred: (200 - 16) / 2 = 92
    EXPECT_EQ(rgba_t(9, 8, 7, 6), chars[0].m_colour);      // a colour doesn't carry to the next line
    EXPECT_EQ("188,69 8x16", rect_text(chars[1].m_rect));  // "ab": (200 - 24) / 2 = 88
    EXPECT_EQ("192,149 16x16", rect_text(chars[6].m_rect));

    lua_machine().DoString("fonts.big = { charset_name = 'canvas_grid', size = 128, material = { "
                           "material_template = 'ui_color' } }");
    std::unique_ptr<CFont> big(get_fonts_factory().create("big", &m_world.desktop()));
    CText mixed(CString("a\\nb\\na"));
    mixed.set_string_font(1, big.get());
    m_world.recorder().clear();
    m_canvas.text_out(0, 0, 0, mixed, mp_font.get());
    chars = m_world.quads();
    ASSERT_EQ(3u, chars.size());
    EXPECT_EQ("100,66 32x32", rect_text(chars[1].m_rect)); // 'b' of the big font
    EXPECT_EQ("100,98 8x16", rect_text(chars[2].m_rect));
}

// ---------------------------------------------------------------------------------------------
// Pictures
// ---------------------------------------------------------------------------------------------

namespace {

// A 16 by 16 frame: a 4-pixel border shaded from light to dark blue with a light line at its
// outer edge, and a checked centre, so stretching or tiling shows at once.
qorhost::SImage frame_texture() {
    qorhost::SImage image;
    image.m_w = image.m_h = 16;
    image.m_pixels.resize(16 * 16 * 4);
    for (int y = 0; y < 16; ++y)
        for (int x = 0; x < 16; ++x) {
            uint8_t *p = image.pixel(x, y);
            int const edge = std::min(std::min(x, 15 - x), std::min(y, 15 - y));
            bool const dark = ((x / 2) + (y / 2)) % 2;
            uint8_t const shade = static_cast<uint8_t>(4 - edge);
            uint8_t const rgb[3][3] = {
                {230, 230, 255},
                {static_cast<uint8_t>(40 * shade), static_cast<uint8_t>(60 * shade), 200},
                {uint8_t(dark ? 60 : 200), uint8_t(dark ? 60 : 180), uint8_t(dark ? 60 : 90)}};
            uint8_t const *p_rgb = rgb[edge == 0 ? 0 : edge < 4 ? 1 : 2];
            p[0] = p_rgb[0], p[1] = p_rgb[1], p[2] = p_rgb[2], p[3] = 255;
        }
    return image;
}

// Windows of the world that draw through their canvas in the frame's draw.
class CanvasPictureTest : public ::testing::Test {
protected:
    void SetUp() override {
        std::string const dir = qortest::make_temp_dir();
        ASSERT_TRUE(qorhost::write_png(dir + "/frame.png", frame_texture()));
        m_world.renderer().set_texture_folders({dir, qortest::source_dir() + "/data/textures"});
        m_world.clock().advance_ms(150); // the desktop has faded in
    }
    CMaterial *material(char const *_table) {
        CMaterial *p_material = m_world.desktop().create_material();
        p_material->load_state(qortest::lua_table(_table));
        m_materials.emplace_back(p_material);
        return p_material;
    }
    CMaterial *nine_patch() {
        return material(
            "{ material_template = 'ui_image', diffuse_texture = 'frame.png', tex_size = { 16, 16 },"
            " bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25,"
            " border_bottom = 0.25 }");
    }
    // A window whose draw runs _draw on its canvas, from a clip of the whole frame.
    CWindowVisual *drawing(int _x, int _y, int _w, int _h, std::function<void(CCanvas &)> _draw) {
        CWindowVisual *p_wnd = m_world.place(
            &m_world.desktop(), new CWindowVisual(&m_world.desktop(), "drawing"), _x, _y, _w, _h);
        p_wnd->register_callback(EVENT_DRAW, CEventCallback([this, p_wnd, _draw](CWndEvent const *) {
                                     m_world.desktop().get_canvas().set_clip_area_all();
                                     _draw(p_wnd->get_canvas());
                                 }));
        return p_wnd;
    }
    CFont *font(HUID const &_id) { return m_world.desktop().get_font(_id); }

    qortest::CWorld m_world;
    std::vector<std::unique_ptr<CMaterial>> m_materials;
};

} // namespace

TEST_F(CanvasPictureTest, NinePatchesAtThreeSizesAndTilesCutByTheirClip) {
    CMaterial *p_frame = nine_patch();
    CMaterial *p_tile = material("{ material_template = 'ui_image', diffuse_texture = 'frame.png' }");
    CMaterial *p_line =
        material("{ material_template = 'ui_color', color = { r = 255, g = 200, b = 0, a = 255 } }");
    drawing(0, 0, 320, 240, [&](CCanvas &_canvas) {
        // Each draw sets its clip first, as windows do: tiles leave their own clip behind.
        for (auto const &box : {std::vector<int>{10, 10, 8, 8}, {30, 10, 40, 30}, {90, 10, 150, 90}}) {
            _canvas.set_clip_area_all();
            _canvas.draw_rect(box[0], box[1], box[2], box[3], p_frame); // the first smaller than its borders
        }
        // The checked centre as tiles of 8 by 8 over 70 by 45: the last column and row are cut.
        _canvas.draw_tiled(10, 120, 70, 45, 0.25f, 0.25f, 0.5f, 0.5f, 16, 16, p_tile);
        _canvas.set_clip_area_all();
        _canvas.draw_line(9, 119, 80, 119, p_line);
        _canvas.draw_line(80, 119, 80, 165, p_line);
    });
    m_world.frame();
    m_world.expect_golden("canvas_nine_patch_tiles");
}

TEST_F(CanvasPictureTest, TextInBothFontsWithColourTagsAndAFadedWindow) {
    drawing(8, 8, 300, 120, [&](CCanvas &_canvas) {
        CFont *p_sans = font(FNT_NAME_DEFAULT), *p_mono = font(FNT_NAME_FIXED);
        _canvas.text_out(0, 0,
                         CString("Sans: <color 255 96 96 255>red</color>, plain, <color 96 255 96 255>green"),
                         p_sans);
        _canvas.text_out(0, 22, CString("Привет, мир! Ёлка Й"), p_sans);
        _canvas.text_out(0, 48, CString("Mono: <color 255 200 0 255>0123456789</color> iiiWWW"), p_mono);
        _canvas.text_out(0, 68, CString("Моно: шрифт"), p_mono);
    });
    // Half faded: the frame and the text darken and go half transparent alike.
    CMaterial *p_frame = nine_patch();
    CWindowVisual *p_faded = drawing(160, 130, 150, 100, [&](CCanvas &_canvas) {
        _canvas.draw_rect(0, 0, 150, 100, p_frame);
        _canvas.set_clip_area_all();
        CText text(CString("Faded\\nПоловина")); // a CText takes narrow bytes as units: through a CString
        text.set_alignment(ALIGNMENT_CENTER);
        _canvas.text_out(0, 30, 2, text, font(FNT_NAME_DEFAULT));
    });
    p_faded->send_event(p_faded, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    m_world.clock().advance_ms(75);
    m_world.frame();
    m_world.expect_golden("canvas_text_fonts_faded");
}
