// The window's renderer on SDL's offscreen video driver, which draws with OpenGL where the system
// has it (Mesa's software OpenGL through EGL as a rule, no display needed): the same calls as the
// software renderer give the same picture, read back through the frame sink, opaque batches copied
// without blending; quads of one texture and clip go to SDL in one batch, and an empty clip draws
// nothing.
#ifdef QORHOST_WITH_SDL2
#include "host_test_support.h"
#include "sdl_renderer.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <memory>

using namespace qorhost;

namespace {

int const k_w = 64, k_h = 48;

class SdlRendererTest : public testing::Test {
protected:
    SdlRendererTest() {
        setenv("SDL_VIDEODRIVER", "offscreen", 1);
        EXPECT_EQ(0, SDL_InitSubSystem(SDL_INIT_VIDEO)) << SDL_GetError();
        mp_window = SDL_CreateWindow("test", 0, 0, k_w, k_h, 0);
        mp_sdl = mp_window ? SDL_CreateRenderer(mp_window, -1, 0) : nullptr;
        EXPECT_NE(nullptr, mp_sdl) << SDL_GetError();
        if (mp_sdl) mp_screen = std::make_unique<CSdlRenderer>(mp_sdl, k_w, k_h);
        SImage picture; // 8 by 8 texels: red across, green down, half transparent on the right
        picture.m_w = picture.m_h = 8;
        for (int y = 0; y < 8; ++y)
            for (int x = 0; x < 8; ++x)
                picture.m_pixels.insert(picture.m_pixels.end(),
                                        {uint8_t(x * 32), uint8_t(y * 32), 90, uint8_t(x < 4 ? 255 : 128)});
        EXPECT_TRUE(write_png(m_dir.file("picture.png"), picture));
        SImage solid = picture; // opaque
        for (size_t i = 3; i < solid.m_pixels.size(); i += 4)
            solid.m_pixels[i] = 255;
        EXPECT_TRUE(write_png(m_dir.file("solid.png"), solid));
    }
    ~SdlRendererTest() override {
        mp_screen.reset();
        if (mp_sdl) SDL_DestroyRenderer(mp_sdl);
        if (mp_window) SDL_DestroyWindow(mp_window);
        SDL_QuitSubSystem(SDL_INIT_VIDEO);
    }

    // Pixels to device coordinates.
    static vec2_t at(float _x, float _y) { return vec2_t{_x / (k_w / 2) - 1, 1 - _y / (k_h / 2)}; }
    // A rectangle in pixels, corners clockwise from the top left as the library sends them.
    static void rect(CHostRenderer &_renderer, float _x0, float _y0, float _x1, float _y1,
                     rgba_t const &_colour) {
        _renderer.draw_quad(at(_x0, _y0), vec2_t{0, 0}, _colour, at(_x1, _y0), vec2_t{1, 0}, _colour,
                            at(_x1, _y1), vec2_t{1, 1}, _colour, at(_x0, _y1), vec2_t{0, 1}, _colour);
    }
    // A scene of what an interface draws: opaque and translucent colour, a picture at its own size
    // and at twice it, tinted, and clipped to a corner; an opaque picture; a line of two colours.
    void draw_scene(CHostRenderer &_renderer) {
        _renderer.set_texture_folders({m_dir.path()});
        int const colour = _renderer.create_material("ui_color", nullptr, 0, 0, 0, 0, false, false);
        int const image = _renderer.create_material("ui_image", "picture.png", 0, 0, 0, 0, false, false);
        int const solid = _renderer.create_material("ui_image", "solid.png", 0, 0, 0, 0, false, false);
        _renderer.begin_frame(rgba_t(10, 20, 30, 255));
        _renderer.set_material(colour);
        rect(_renderer, 2, 2, 40, 30, rgba_t(60, 70, 120, 255));
        rect(_renderer, 20, 10, 60, 44, rgba_t(250, 200, 0, 100));
        _renderer.set_material(image);
        rect(_renderer, 4, 4, 12, 12, rgba_t(255, 255, 255, 255));
        rect(_renderer, 14, 4, 30, 20, rgba_t(255, 128, 255, 255));
        _renderer.push_clip_rect();
        _renderer.set_clip_rect(vec2_t{0.25f, -1.0f}, vec2_t{0.5f, 0.5f}); // x 40 to 56, y 36 to 48
        rect(_renderer, 36, 30, 60, 46, rgba_t(255, 255, 255, 200)); // three pixels a texel across, two down
        _renderer.pop_clip_rect();
        _renderer.set_material(solid);
        rect(_renderer, 42, 2, 58, 18, rgba_t(200, 255, 100, 255));
        _renderer.draw_line(at(2.5f, 40.5f), rgba_t(0, 0, 0, 255), at(30.5f, 40.5f), rgba_t(56, 0, 0, 255),
                            1);
    }
    SImage presented(CHostRenderer &_renderer) {
        SImage frame;
        _renderer.set_frame_sink([&](SImage const &_frame, unsigned) { frame = _frame; });
        _renderer.present();
        return frame;
    }

    hosttest::CTempDir m_dir;
    SDL_Window *mp_window = nullptr;
    SDL_Renderer *mp_sdl = nullptr;
    std::unique_ptr<CSdlRenderer> mp_screen;
};

} // namespace

TEST_F(SdlRendererTest, TheWindowShowsWhatTheSoftwareRendererDraws) {
    ASSERT_TRUE(mp_screen);
    if (mp_screen->get_driver() == "software") GTEST_SKIP() << "no OpenGL for SDL's offscreen driver here";
    CSoftwareRenderer reference(k_w, k_h);
    draw_scene(reference);
    draw_scene(*mp_screen);
    SImage const shown = presented(*mp_screen);
    EXPECT_EQ(0, compare_images(shown, reference.get_frame(), 2, "/tmp/qorui_sdl_renderer_diff.png"));
    EXPECT_EQ(1u, mp_screen->get_presented());
}

TEST_F(SdlRendererTest, QuadsOfOneTextureAndClipAreOneBatchAndAnEmptyClipDrawsNothing) {
    ASSERT_TRUE(mp_screen);
    draw_scene(*mp_screen);
    // Opaque colour, translucent colour, the picture, the picture clipped, the opaque picture (not
    // blended), the line.
    mp_screen->present();
    EXPECT_EQ(6u, mp_screen->get_batches_drawn());
    mp_screen->begin_frame(rgba_t(1, 2, 3, 255));
    mp_screen->set_clip_rect(vec2_t{0, 0}, vec2_t{0, 0});
    rect(*mp_screen, 0, 0, k_w, k_h, rgba_t(255, 255, 255, 255));
    mp_screen->draw_line(vec2_t{-1, 1}, rgba_t(255, 255, 255, 255), vec2_t{1, -1}, rgba_t(255, 255, 255, 255),
                         1);
    CSoftwareRenderer cleared(k_w, k_h);
    cleared.begin_frame(rgba_t(1, 2, 3, 255));
    EXPECT_EQ(0, compare_images(presented(*mp_screen), cleared.get_frame(), 0));
    EXPECT_EQ(6u, mp_screen->get_batches_drawn());
}
#endif
