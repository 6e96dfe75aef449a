// Pictures of the canvas from the host's software renderer, compared with checked-in images:
// nine-patches at three sizes, tiles cut by their clip, text in both default fonts with colour
// tags in Latin and Cyrillic, and a window faded to one half.
#include "ui_canvas.h"

#include "canvas_owner.h"
#include "image_io.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "engine_interfaces.h"
#include "software_renderer.h"
#include "test_desktop.h"
#include "test_support.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"
#include "ui_string.h"
#include "ui_text.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <memory>

using namespace qorui;

namespace {

int const k_w = 320;
int const k_h = 240;

// A 16 by 16 frame: a 4-pixel border shaded from light to dark blue with a light line at its
// outer edge, and a checked centre, so stretching or tiling shows at once.
qorhost::SImage frame_texture() {
    qorhost::SImage image;
    image.m_w = image.m_h = 16;
    image.m_pixels.resize(16 * 16 * 4);
    for (int y = 0; y < 16; ++y) {
        for (int x = 0; x < 16; ++x) {
            uint8_t *p = image.pixel(x, y);
            int const edge = std::min(std::min(x, 15 - x), std::min(y, 15 - y));
            if (edge == 0) {
                p[0] = 230, p[1] = 230, p[2] = 255;
            } else if (edge < 4) {
                p[0] = static_cast<uint8_t>(40 * (4 - edge)), p[1] = static_cast<uint8_t>(60 * (4 - edge)),
                p[2] = 200;
            } else {
                bool const dark = ((x / 2) + (y / 2)) % 2;
                p[0] = dark ? 60 : 200, p[1] = dark ? 60 : 180, p[2] = dark ? 60 : 90;
            }
            p[3] = 255;
        }
    }
    return image;
}

class CanvasGoldenTest : public ::testing::Test {
protected:
    void SetUp() override {
        m_dir = qortest::make_temp_dir();
        ASSERT_TRUE(qorhost::write_png(m_dir + "/frame.png", frame_texture()));
        m_renderer.set_texture_folders({m_dir, qortest::source_dir() + "/data/textures"});
        {
            qortest::CReportCapture quiet; // no screen size in this process
            m_render.init(&m_renderer);
        }
        m_render.set_resolution(k_w, k_h);
        m_desktop.mp_render = &m_render;
        qorbase::set_category_root(8, (qortest::source_dir() + "/data/fonts").c_str());
        qorbase::set_category_root(16, (qortest::source_dir() + "/data/ui").c_str());
        get_fonts_factory().init();
        mp_sans.reset(get_fonts_factory().create("arial_white", &m_desktop));
        mp_mono.reset(get_fonts_factory().create("courier", &m_desktop));
        ASSERT_TRUE(mp_sans && mp_mono);
        m_renderer.begin_frame(rgba_t(24, 28, 36, 255));
        m_render.begin_draw();
    }

    CMaterial *material(char const *_p_table) {
        lua_machine().DoString((std::string("golden_material = ") + _p_table).c_str());
        CMaterial *p_material = m_desktop.create_material();
        p_material->load_state(lua_machine().GetGlobals().GetByName("golden_material"));
        m_materials.emplace_back(p_material);
        return p_material;
    }

    CMaterial *nine_patch() {
        return material(
            "{ material_template = 'ui_image', diffuse_texture = 'frame.png', tex_size = { 16, 16 },"
            " bordered = true, border_left = 0.25, border_right = 0.25, border_top = 0.25,"
            " border_bottom = 0.25 }");
    }

    // Ends the frame and compares it with tests/golden/<name>.png; QOR_UPDATE_GOLDEN=1 writes it.
    void expect_golden(char const *_name) {
        m_render.end_draw();
        std::string const golden_path = qortest::source_dir() + "/tests/golden/" + _name + ".png";
        std::string const actual_path = m_dir + "/" + _name + ".png";
        ASSERT_TRUE(qorhost::write_png(actual_path, m_renderer.get_frame()));
        if (std::getenv("QOR_UPDATE_GOLDEN")) {
            ASSERT_TRUE(qorhost::write_png(golden_path, m_renderer.get_frame()));
        }
        qorhost::SImage golden;
        ASSERT_TRUE(qorhost::load_image(golden_path, golden)) << golden_path;
        std::string const diff = m_dir + "/" + _name + "_diff.png";
        EXPECT_EQ(0, qorhost::compare_images(m_renderer.get_frame(), golden, 2, diff))
            << "actual " << actual_path << ", diff " << diff;
    }

    std::string m_dir;
    qorhost::CSoftwareRenderer m_renderer{k_w, k_h};
    CRender m_render;
    qortest::CTestDesktop m_desktop;
    std::unique_ptr<CFont> mp_sans, mp_mono;
    std::vector<std::unique_ptr<CMaterial>> m_materials;
};

} // namespace

TEST_F(CanvasGoldenTest, NinePatchesAtThreeSizesAndTilesCutByTheirClip) {
    qortest::CCanvasOwner owner(&m_render, 0, 0, k_w, k_h);
    CCanvas canvas(&owner);
    CMaterial *p_frame = nine_patch();
    // Each draw sets its clip first, as windows do: tiles leave their own clip behind.
    canvas.set_clip_area_all();
    canvas.draw_rect(10, 10, 8, 8, p_frame); // smaller than its borders: the corners overlap
    canvas.set_clip_area_all();
    canvas.draw_rect(30, 10, 40, 30, p_frame);
    canvas.set_clip_area_all();
    canvas.draw_rect(90, 10, 150, 90, p_frame);
    // The checked centre of the texture as tiles of 8 by 8 over 70 by 45 pixels: the last
    // column and row stick out and are cut at the area's edge.
    CMaterial *p_tile = material("{ material_template = 'ui_image', diffuse_texture = 'frame.png' }");
    canvas.draw_tiled(10, 120, 70, 45, 0.25f, 0.25f, 0.5f, 0.5f, 16, 16, p_tile);
    canvas.set_clip_area_all();
    CMaterial *p_line =
        material("{ material_template = 'ui_color', color = { r = 255, g = 200, b = 0, a = 255 } }");
    canvas.draw_line(9, 119, 80, 119, p_line);
    canvas.draw_line(80, 119, 80, 165, p_line);
    expect_golden("canvas_nine_patch_tiles");
}

TEST_F(CanvasGoldenTest, TextInBothFontsWithColourTagsAndAFadedWindow) {
    qortest::CCanvasOwner owner(&m_render, 8, 8, 300, 120);
    CCanvas canvas(&owner);
    canvas.text_out(0, 0,
                    CString("Sans: <color 255 96 96 255>red</color>, plain, <color 96 255 96 255>green"),
                    mp_sans.get());
    canvas.text_out(0, 22,
                    CString("\xD0\x9F\xD1\x80\xD0\xB8\xD0\xB2\xD0\xB5\xD1\x82, \xD0\xBC\xD0\xB8\xD1\x80! "
                            "\xD0\x81\xD0\xBB\xD0\xBA\xD0\xB0 \xD0\x99"),
                    mp_sans.get());
    canvas.text_out(0, 48, CString("Mono: <color 255 200 0 255>0123456789</color> iiiWWW"), mp_mono.get());
    canvas.text_out(0, 68,
                    CString("\xD0\x9C\xD0\xBE\xD0\xBD\xD0\xBE: \xD1\x88\xD1\x80\xD0\xB8\xD1\x84\xD1\x82"),
                    mp_mono.get());

    // A window at transparency 0.5: its frame and text darken and go half transparent alike.
    qortest::CCanvasOwner faded(&m_render, 160, 130, 150, 100);
    faded.m_transparency = 0.5f;
    CCanvas faded_canvas(&faded);
    faded_canvas.set_clip_area_all();
    faded_canvas.draw_rect(0, 0, 150, 100, nine_patch());
    faded_canvas.set_clip_area_all();
    // Through a CString: a CText takes narrow bytes as units, UTF-8 decoding is the string's.
    CText text(CString("Faded\\n\xD0\x9F\xD0\xBE\xD0\xBB\xD0\xBE\xD0\xB2\xD0\xB8\xD0\xBD\xD0\xB0"));
    text.set_alignment(ALIGNMENT_CENTER);
    faded_canvas.text_out(0, 30, 2, text, mp_sans.get());
    expect_golden("canvas_text_fonts_faded");
}
