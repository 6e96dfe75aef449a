// The canvas against the recording renderer: positions, texture coordinates, colours and the
// order of the calls for rectangles, tiles, nine-patches, tagged text and texts of many lines.
#include "ui_canvas.h"

#include "canvas_owner.h"
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "recording_renderer.h"
#include "test_desktop.h"
#include "test_support.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"
#include "ui_string.h"
#include "ui_text.h"

#include <gtest/gtest.h>

#include <cmath>
#include <memory>

using namespace qorui;

namespace {

// A desktop of 400 by 300 device-mapped pixels; the owner stands at (100, 50), 200 by 100.
class CanvasTest : public ::testing::Test {
protected:
    void SetUp() override {
        {
            qortest::CReportCapture quiet; // no screen size in this process
            m_render.init(&m_recorder);
        }
        m_render.set_resolution(400, 300);
        m_desktop.mp_render = &m_render;
        mp_material.reset(m_desktop.create_material());
        mp_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
        // A font of a 4 by 4 grid (charsets live for the process, so the name is this test's own): 'a' is 0.5
        // cells wide, 'b' a whole cell; size 64 makes a cell 16 pixels, a line 16 high.
        std::string const dir = qortest::make_temp_dir();
        qorbase::set_category_root(8, dir.c_str());
        qortest::write_file(
            dir + "/grid.fnt",
            "[common] dimension = 4 font_h = 1 [chars] 32 = 0.25 97 = 0.5 98 = 1 60 = 1 62 = 1 "
            "47 = 1 99 = 1 111 = 1 108 = 1 114 = 1 49 = 1 50 = 1 51 = 1 52 = 1 53 = 1 120 = 1");
        lua_machine().DoString(
            "charsets = { canvas_grid = { file_type = 'nehe', file_name = 'grid.fnt' } }"
            "fonts = { grid = { charset_name = 'canvas_grid', size = 64,"
            " material = { material_template = 'ui_image', color = { r = 9, g = 8, b = 7, a = 6 } } } }");
        mp_font.reset(get_fonts_factory().create("grid", &m_desktop));
        m_recorder.clear();
    }

    // Device to desktop pixels, for readable expectations.
    static int px(float _device_x) { return static_cast<int>(std::lround((_device_x + 1.0f) * 200.0f)); }
    static int py(float _device_y) { return static_cast<int>(std::lround((1.0f - _device_y) * 150.0f)); }

    // "l,t r,b" of a recorded quad.
    std::string rect_of(qorhost::SRenderCall const &_quad) {
        return std::to_string(px(_quad.m_points[0].x)) + "," + std::to_string(py(_quad.m_points[0].y)) + " " +
               std::to_string(px(_quad.m_points[2].x)) + "," + std::to_string(py(_quad.m_points[2].y));
    }
    std::vector<qorhost::SRenderCall> quads() {
        std::vector<qorhost::SRenderCall> found;
        for (auto const &call : m_recorder.calls())
            if (call.m_op == "draw_quad") found.push_back(call);
        return found;
    }

    qorhost::CRecordingRenderer m_recorder;
    CRender m_render;
    qortest::CTestDesktop m_desktop;
    qortest::CCanvasOwner m_owner{&m_render, 100, 50, 200, 100};
    CCanvas m_canvas{&m_owner};
    std::unique_ptr<CMaterial> mp_material;
    std::unique_ptr<CFont> mp_font;
};

} // namespace

TEST_F(CanvasTest, ARectangleIsOneQuadAtTheOwnersPlace) {
    m_canvas.draw_rect(10, 20, 30, 40, 0.25f, 0.5f, 0.125f, 0.25f, mp_material.get());
    ASSERT_EQ("set_material draw_quad", m_recorder.sequence());
    qorhost::SRenderCall const &quad = m_recorder.calls()[1];
    EXPECT_EQ("110,70 140,110", rect_of(quad));
    EXPECT_EQ(110, px(quad.m_points[1].x)); // lower left
    EXPECT_EQ(110, py(quad.m_points[1].y));
    EXPECT_FLOAT_EQ(0.25f, quad.m_uvs[0].x);
    EXPECT_FLOAT_EQ(0.75f, quad.m_uvs[1].y);
    EXPECT_FLOAT_EQ(0.375f, quad.m_uvs[2].x);
    EXPECT_FLOAT_EQ(0.5f, quad.m_uvs[3].y);

    m_recorder.clear();
    m_canvas.draw_rect(0, 0, 10, 10, nullptr);
    m_canvas.draw_line(0, 0, 1, 1, nullptr);
    EXPECT_EQ("", m_recorder.sequence());
}

TEST_F(CanvasTest, FadingScalesColourAndAlphaAndLeavesTheMaterialAlone) {
    m_owner.m_transparency = 0.5f;
    m_canvas.draw_line(0, 0, 10, 0, mp_material.get());
    EXPECT_EQ(rgba_t(127, 127, 127, 127), m_recorder.calls()[1].m_colours[0]);
    EXPECT_EQ(rgba_t(255, 255, 255, 255), mp_material->get_color());
    EXPECT_EQ(100, px(m_recorder.calls()[1].m_points[0].x));
}

TEST_F(CanvasTest, TilesRepeatFromTheCornerInsideAClip) {
    m_canvas.draw_tiled(10, 20, 40, 20, 0, 0, 0.5f, 0.5f, 32, 32, mp_material.get());
    EXPECT_EQ("set_clip_area push_clip_rect set_material draw_quad draw_quad draw_quad draw_quad draw_quad "
              "draw_quad "
              "pop_clip_rect",
              [&] {
                  std::string s = m_recorder.sequence();
                  return s.replace(0, std::string("set_clip_rect").size(), "set_clip_area");
              }());
    std::vector<qorhost::SRenderCall> const tiles = quads();
    ASSERT_EQ(6u, tiles.size()); // 16 by 16 tiles: 3 columns, 2 rows; desktop coordinates as given
    EXPECT_EQ("10,20 26,36", rect_of(tiles[0]));
    EXPECT_EQ("42,36 58,52", rect_of(tiles[5]));

    m_recorder.clear();
    m_canvas.draw_tiled(0, 0, 0, 10, 0, 0, 1, 1, 8, 8, mp_material.get());
    m_canvas.draw_tiled(0, 0, 10, 10, 0, 0, 0, 1, 8, 8, mp_material.get()); // a tile of width 0
    EXPECT_TRUE(quads().empty());
}

TEST_F(CanvasTest, ANinePatchDrawsCornersThenTiledEdgesAndCentre) {
    lua_machine().DoString(
        "nine = { tex_size = { 16, 16 }, bordered = true, border_left = 0.25, border_right = 0.25,"
        " border_top = 0.125, border_bottom = 0.125 }");
    mp_material->load_state(lua_machine().GetGlobals().GetByName("nine"));
    m_recorder.clear();
    m_canvas.draw_rect(0, 0, 24, 20, mp_material.get());
    std::vector<qorhost::SRenderCall> const pieces = quads();
    // Corners of 4 by 2 pixels; the edges and centre in tiles of their natural size.
    ASSERT_LE(4u, pieces.size());
    EXPECT_EQ("100,50 104,52", rect_of(pieces[0]));
    EXPECT_EQ("100,68 104,70", rect_of(pieces[1]));
    EXPECT_EQ("120,68 124,70", rect_of(pieces[2]));
    EXPECT_EQ("120,50 124,52", rect_of(pieces[3]));
    EXPECT_FLOAT_EQ(0.75f, pieces[2].m_uvs[0].x);
    EXPECT_FLOAT_EQ(0.875f, pieces[2].m_uvs[0].y);
    // Left edge: 4 by 16 pixels from (100, 52), its tile 4 by 12: two tiles.
    EXPECT_EQ("100,52 104,64", rect_of(pieces[4]));
    EXPECT_EQ("100,64 104,76", rect_of(pieces[5]));
    EXPECT_EQ(4u + 2 + 2 + 2 + 2 + 4, pieces.size()); // centre 16 by 16 in tiles of 8 by 12

    m_recorder.clear();
    qortest::CReportCapture capture;
    lua_machine().DoString("nine.tex_size = nil");
    CMaterial *p_untextured = m_desktop.create_material();
    p_untextured->load_state(lua_machine().GetGlobals().GetByName("nine"));
    m_canvas.draw_rect(0, 0, 24, 20, p_untextured);
    EXPECT_EQ((std::vector<std::string>{"tex_size must be set for bordered material"}),
              capture.texts(qordebug::REPORT_WARNING));
    EXPECT_TRUE(quads().empty());
    delete p_untextured;
}

TEST_F(CanvasTest, TextIsOneQuadPerCharacterWithTagsInterpreted) {
    m_canvas.text_out(0, 0, CString("a<color 255 0 0 255>b</color>a"), mp_font.get());
    std::vector<qorhost::SRenderCall> const chars = quads();
    ASSERT_EQ(3u, chars.size());
    EXPECT_EQ("100,50 108,66", rect_of(chars[0])); // 'a' is 8 wide, every line 16 high
    EXPECT_EQ("108,50 124,66", rect_of(chars[1]));
    EXPECT_EQ("124,50 132,66", rect_of(chars[2]));
    EXPECT_EQ(rgba_t(9, 8, 7, 6), chars[0].m_colours[0]);
    EXPECT_EQ(rgba_t(255, 0, 0, 255), chars[1].m_colours[0]);
    EXPECT_EQ(rgba_t(9, 8, 7, 6), chars[2].m_colours[0]);
    EXPECT_EQ(rgba_t(9, 8, 7, 6), mp_font->get_char_material('a')->get_color()); // restored
    EXPECT_FLOAT_EQ(0.5f, chars[1].m_uvs[0].x); // the third cell of the first row
}

TEST_F(CanvasTest, TagEdgeCasesDrawWhatTheRulesSay) {
    struct {
        char const *mp_text;
        int m_quads;
        rgba_t m_last;
    } const cases[] = {
        {"<color 255 0 0>x", 1, rgba_t(9, 8, 7, 6)},                 // three numbers: the colour stays
        {"<color 300 0 0 255>x", 1, rgba_t(44, 0, 0, 255)},          // the low eight bits
        {"a</color>", 1, rgba_t(9, 8, 7, 6)},                        // consumed, nothing behind it
        {"<b>ab", 2, rgba_t(9, 8, 7, 6)},                            // unknown tags are swallowed
        {"a<", 2, rgba_t(9, 8, 7, 6)},                               // too near the end: a character
        {"a<b", 3, rgba_t(9, 8, 7, 6)},                              // no '>' behind it
        {"<color 1 2 3 4><color 5 6 7 8>x", 16, rgba_t(1, 2, 3, 4)}, // the second tag is text
        {"<color1 2 3 4>x", 1, rgba_t(1, 2, 3, 4)},                  // "color" needs no delimiter
        {"<colorful 1 2 3 4>x", 1, rgba_t(9, 8, 7, 6)},              // a colour tag whose numbers don't scan
        {"<Color 1 2 3 4>x", 1, rgba_t(9, 8, 7, 6)},                 // and is case-sensitive
    };
    for (auto const &c : cases) {
        m_recorder.clear();
        m_canvas.text_out(0, 0, CString(c.mp_text), mp_font.get());
        std::vector<qorhost::SRenderCall> const chars = quads();
        ASSERT_EQ(static_cast<size_t>(c.m_quads), chars.size()) << c.mp_text;
        EXPECT_EQ(c.m_last, chars.back().m_colours[0]) << c.mp_text;
    }
    m_recorder.clear();
    m_canvas.set_tags_enable(false);
    m_canvas.text_out(0, 0, CString("<b>"), mp_font.get());
    EXPECT_EQ(3u, quads().size());
}

TEST_F(CanvasTest, MeasuringCountsWholePixelsPerCharacter) {
    EXPECT_EQ(16, m_canvas.get_text_height(mp_font.get()));
    EXPECT_EQ(0, m_canvas.get_text_height(nullptr));
    EXPECT_EQ(8, m_canvas.get_char_width('a', mp_font.get()));
    EXPECT_EQ(4, m_canvas.get_char_width(0x416, mp_font.get())); // missing: the lowest code, ' ', 4 wide
    CString const ab("ab");
    EXPECT_EQ(24, m_canvas.get_text_width(ab, mp_font.get(), -1));
    EXPECT_EQ(24, m_canvas.get_text_width(ab, mp_font.get(), 3));
    EXPECT_EQ(8, m_canvas.get_text_width(ab, mp_font.get(), 1));
    EXPECT_EQ(0, m_canvas.get_text_width(ab, nullptr, -1));
}

TEST_F(CanvasTest, ATextDrawsTheVisibleLinesAndCentres) {
    CText text("<color 1 2 3 4>a\\nb\\nab\\nb\\nb\\nb\\nb\\nb\\nb");
    text.set_alignment(ALIGNMENT_CENTER);
    m_canvas.text_out(0, -21, 4, text, mp_font.get());
    // Lines of 20 pixels from -21: the first ends above the owner and is skipped, the second
    // reaches into it and is drawn, and the last drawn starts at 99, the one at 119 is below.
    std::vector<qorhost::SRenderCall> const chars = quads();
    ASSERT_EQ(7u, chars.size());
    EXPECT_EQ("192,49 208,65", rect_of(chars[0]));        // "b" centred: (200 - 16) / 2 = 92
    EXPECT_EQ(rgba_t(9, 8, 7, 6), chars[0].m_colours[0]); // a colour doesn't carry to the next line
    EXPECT_EQ("188,69 196,85", rect_of(chars[1]));        // "ab": (200 - 24) / 2 = 88
    EXPECT_EQ("192,149 208,165", rect_of(chars[6]));

    qortest::CReportCapture capture;
    m_canvas.text_out(0, 0, 0, text, nullptr);
    EXPECT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size()); // "string_h > 0"
}

TEST(CanvasBridge, AnOwnerWithoutABridgeIsAContractFailure) {
    qortest::CReportCapture capture;
    qortest::CCanvasOwner owner(nullptr, 0, 0, 10, 10);
    CCanvas canvas(&owner);
    canvas.set_clip_area_all();
    ASSERT_EQ(1u, capture.texts(qordebug::REPORT_ASSERT).size());
    EXPECT_NE(std::string::npos, capture.texts(qordebug::REPORT_ASSERT)[0].find(
                                     "mp_owner && mp_owner->mp_desktop && mp_owner->mp_desktop->mp_render"));
}

TEST_F(CanvasTest, ALineWithAFontOfItsOwnUsesItsHeight) {
    lua_machine().DoString("fonts.big = { charset_name = 'canvas_grid', size = 128, material = {} }");
    std::unique_ptr<CFont> big(get_fonts_factory().create("big", &m_desktop));
    CText text(CString("a\\nb\\na"));
    text.set_string_font(1, big.get());
    m_recorder.clear();
    m_canvas.text_out(0, 0, 0, text, mp_font.get());
    std::vector<qorhost::SRenderCall> const chars = quads();
    ASSERT_EQ(3u, chars.size());
    EXPECT_EQ("100,50 108,66", rect_of(chars[0]));
    EXPECT_EQ("100,66 132,98", rect_of(chars[1])); // 'b' of the big font: 32 by 32
    EXPECT_EQ("100,98 108,114", rect_of(chars[2]));
}
