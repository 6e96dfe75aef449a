// The host against bad input: input scripts whose numbers or files lie outside what a step can
// take, and drawings far outside the frame or with coordinates that aren't numbers.
#include "input_script.h"
#include "software_renderer.h"

#include <gtest/gtest.h>

#include <cmath>
#include <limits>

using qorhost::CInputScript;

TEST(HostHardening, InputScriptNumbersAndFilesOutOfRangeMakeTheLineBad) {
    struct {
        char const *mp_line;
        char const *mp_error; // null: the line is good
    } const rows[] = {
        {"wait -1", "'-1' is out of range for 'wait'"},
        {"wait 1e9", "'1e9' is out of range for 'wait'"},
        {"wait 1.5", "'1.5' is out of range for 'wait'"},
        {"wait 100000", nullptr},
        {"wait 86400000ms", nullptr},
        {"wait 90000000ms", "'90000000' is out of range for 'wait'"},
        {"press -1", "'-1' is out of range for 'press'"},
        {"release 16", "'16' is out of range for 'release'"},
        {"char 1e10", "'1e10' is out of range for 'char'"},
        {"char 0xFFFF", nullptr},
        {"key_down 0xC0 0x10000", "'0x10000' is out of range for 'key_down'"},
        {"move nan 0", "'nan' is out of range for 'move'"},
        {"wheel -inf", "'-inf' is out of range for 'wheel'"},
        {"screenshot ../../x.png", "'../../x.png' lies outside the output folder"},
        {"screenshot shots/../../x.png", "'shots/../../x.png' lies outside the output folder"},
        {"screenshot /tmp/x.png", "'/tmp/x.png' lies outside the output folder"},
        {"screenshot shots/..x.png", nullptr},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_line);
        CInputScript script;
        std::string error;
        EXPECT_EQ(row.mp_error == nullptr, script.parse(row.mp_line, "test.script", error));
        EXPECT_EQ(row.mp_error ? std::string("test.script:1: ") + row.mp_error : std::string(), error);
    }
}

// A line from far outside the frame draws its visible part at once; a quad of infinite size and
// texture coordinates that aren't numbers covers the frame.
TEST(HostHardening, DrawingsFarOutsideOrNotNumbersStayInsideTheFrame) {
    qorhost::CSoftwareRenderer renderer(8, 8);
    rgba_t const clear(10, 20, 30, 255), white(255, 255, 255, 255);
    renderer.begin_frame(clear);
    renderer.draw_line(vec2_t{-4e8f, 0.375f}, white, vec2_t{4e8f, 0.375f}, white, 1.0f); // row 2
    for (int x = 0; x < 8; ++x) {
        EXPECT_EQ(white, rgba_t(renderer.get_frame().pixel(x, 2)[0], renderer.get_frame().pixel(x, 2)[1],
                                renderer.get_frame().pixel(x, 2)[2], renderer.get_frame().pixel(x, 2)[3]))
            << x;
    }
    float const nan = std::numeric_limits<float>::quiet_NaN();
    renderer.set_material(renderer.create_material("ui_image", "missing.tga", nullptr, nullptr, nullptr,
                                                   nullptr, false, false));
    for (float const far : {1e30f, 1e6f}) {
        renderer.draw_quad(vec2_t{-far, far}, vec2_t{nan, nan}, white, vec2_t{-far, -far}, vec2_t{nan, 1},
                           white, vec2_t{far, -far}, vec2_t{1, nan}, white, vec2_t{far, far},
                           vec2_t{far, -far}, white);
    }
    EXPECT_NE(clear.b, renderer.get_frame().pixel(0, 7)[2]); // covered by the last quad
}
