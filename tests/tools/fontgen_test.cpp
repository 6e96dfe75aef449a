// The font generator, run as a program on a system font: its description file read back with the
// interface's own tokenizer by the charset reader's rules, its texture read back as the host reads
// textures, its answers to bad input, and the default fonts of the data folder.
#include "font_grid.h"
#include "image_io.h"
#include "test_common.h"
#include "tokenizer.h"

#include <gtest/gtest.h>
#include <lua.hpp>

#include <cmath>
#include <map>
#include <sys/wait.h>

namespace {

std::string const SANS = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";

struct SRun {
    int m_exit_code = -1;
    std::string m_out, m_err; // what it printed on stdout and stderr
};

// The generator run with output in _dir; arguments are single-quoted for the shell (none of the
// tests' arguments holds a quote).
SRun run_fontgen(std::string const &_dir, std::vector<std::string> const &_args) {
    std::string command = QORFONTGEN;
    for (std::string const &arg : _args)
        command += " '" + arg + "'";
    int const status = std::system((command + " >'" + _dir + "/out.txt' 2>'" + _dir + "/err.txt'").c_str());
    return SRun{WIFEXITED(status) ? WEXITSTATUS(status) : -1, qortest::read_file(_dir + "/out.txt"),
                qortest::read_file(_dir + "/err.txt")};
}

struct SChar {
    float m_x, m_y, m_w;
};

struct SCharset {
    int m_dimension = 16;
    float m_height = 0.0625f;
    std::map<unsigned short, SChar> m_chars;
};

// The charset reader's steps: "[common]", the pairs, "[chars]", then dimension * dimension entries
// by rows; a failure of a required token ends the reading and keeps what was read.
SCharset read_charset(std::string const &_text) {
    SCharset charset;
    float height = 0.0625f;
    try {
        qorui::CTokenizerRules rules(_text.data(), static_cast<unsigned>(_text.size()),
                                     qorui::default_separators());
        qorui::CTokenizer tokens(rules, 7, 0);
        tokens.expect("[common]");
        tokens.next();
        for (;;) {
            std::string const key = tokens.get_token().c_str();
            if (key != "font1" && key != "dimension" && key != "font_h") break;
            tokens.next();
            tokens.expect("=");
            tokens.next();
            if (key == "dimension") charset.m_dimension = tokens.as_int();
            if (key == "font_h") height = static_cast<float>(tokens.as_float());
            tokens.next();
        }
        charset.m_height = height / charset.m_dimension;
        tokens.expect("[chars]");
        float const dimension = static_cast<float>(charset.m_dimension);
        for (int row = 0; row < charset.m_dimension; ++row)
            for (int column = 0; column < charset.m_dimension; ++column) {
                tokens.next();
                auto const code = static_cast<unsigned short>(tokens.as_int());
                tokens.next();
                tokens.expect("=");
                tokens.next();
                charset.m_chars[code] = SChar{column / dimension, row / dimension,
                                              static_cast<float>(tokens.as_float()) / dimension};
            }
        tokens.next();
        ADD_FAILURE() << "a token follows the last entry: " << tokens.get_token().c_str();
    } catch (char const *) {
        // the end of the text, as after every complete file
    }
    return charset;
}

// A texture as the host reads it; of no size when it doesn't load.
qorhost::SImage read_texture(std::string const &_path) {
    qorhost::SImage texture;
    qorhost::load_image(_path, texture);
    return texture;
}

// The entry of a font in fonts.lua, run as the fonts factory runs it (after "charsets={}" and
// "fonts={}"): its charset's name, file type and file name, its material's template and texture,
// and its size.
std::vector<std::string> font_entry(std::string const &_fonts_lua, std::string const &_name) {
    lua_State *p_lua = luaL_newstate();
    std::string const query = "local f = fonts['" + _name +
                              "'] local c = charsets[f.charset_name] return "
                              "f.charset_name, c.file_type, c.file_name, f.material.material_template, "
                              "f.material.diffuse_texture, f.size";
    std::vector<std::string> fields;
    if (luaL_dostring(p_lua, "charsets={} fonts={}") || luaL_dofile(p_lua, _fonts_lua.c_str()) ||
        luaL_dostring(p_lua, query.c_str()))
        ADD_FAILURE() << lua_tostring(p_lua, -1);
    for (int i = 1; i <= lua_gettop(p_lua); ++i)
        fields.push_back(lua_isstring(p_lua, i) ? lua_tostring(p_lua, i) : "");
    lua_close(p_lua);
    return fields;
}

} // namespace

// Space, A, B, I and Ë at 15 pixels: five characters in a grid of 4 by 4, in the last cells in code
// order, on a square texture whose side is the font's size; whole texels, letters inside their
// drawn rectangle, white, and the space and the spare cells blank.
TEST(Fontgen, ASmallFontIsLaidOutInItsGridAndDescribedForTheFactory) {
    std::string const dir = qortest::make_temp_dir();
    SRun const run = run_fontgen(
        dir, {"--font", SANS, "--size", "15", "--chars", "0x401,73,32, 65-66", "--out", dir + "/small"});
    ASSERT_EQ(0, run.m_exit_code) << run.m_err;
    EXPECT_EQ("", run.m_err);
    SCharset charset = read_charset(qortest::read_file(dir + "/small.fnt"));
    qorhost::SImage const texture = read_texture(dir + "/small.tga");
    int const side = texture.m_w, cell = side / 4;
    ASSERT_EQ(4, charset.m_dimension);
    ASSERT_GT(side, 0) << "the texture doesn't load";
    EXPECT_EQ(side, texture.m_h);
    EXPECT_EQ(0, side & (side - 1)) << side; // a power of two
    for (std::string const &line :
         std::vector<std::string>{"charsets[\"small\"] = { file_type = \"nehe\", file_name = \"small.fnt\" }",
                                  "size = " + std::to_string(side) + ",", "diffuse_texture = \"small.tga\","})
        EXPECT_NE(std::string::npos, run.m_out.find(line)) << run.m_out;
    int const line_px = static_cast<int>(charset.m_height * side);
    EXPECT_EQ(charset.m_height * side, line_px); // no rounding on the screen
    EXPECT_GE(line_px, 15);
    EXPECT_LT(line_px, cell);
    EXPECT_EQ(5u, charset.m_chars.size());
    EXPECT_LT(charset.m_chars[73].m_w, charset.m_chars[65].m_w) << "I is narrower than A";
    // Per cell of the grid, texels with coverage inside the rectangle the canvas draws of its
    // character and outside it; 16 cells, 5 characters: the first 11 cells are spare.
    int top_row = 0; // texels covered in the top row of the cells: the tallest glyph reaches it
    std::map<int, unsigned short> const code_of_cell = {{11, 32}, {12, 65}, {13, 66}, {14, 73}, {15, 0x401}};
    for (int index = 0; index < 16; ++index) {
        SCOPED_TRACE("cell " + std::to_string(index));
        auto const found = code_of_cell.find(index);
        int drawn_w = 0;
        if (found != code_of_cell.end()) {
            ASSERT_EQ(1u, charset.m_chars.count(found->second));
            SChar const &c = charset.m_chars[found->second];
            EXPECT_EQ((index % 4) * 0.25f, c.m_x);
            EXPECT_EQ((index / 4) * 0.25f, c.m_y);
            drawn_w = static_cast<int>(c.m_w * side);
            EXPECT_EQ(c.m_w * side, drawn_w);
            EXPECT_GT(drawn_w, 0);
            EXPECT_LT(drawn_w, cell);
        }
        int inside = 0, outside = 0, coloured = 0;
        for (int y = 0; y < cell; ++y)
            for (int x = 0; x < cell; ++x) {
                uint8_t const *p = texture.pixel((index % 4) * cell + x, (index / 4) * cell + y);
                coloured += p[0] != 255 || p[1] != 255 || p[2] != 255;
                if (p[3] != 0) ++(x < drawn_w && y < line_px ? inside : outside);
                top_row += y == 0 && p[3] != 0;
            }
        EXPECT_EQ(0, outside);
        EXPECT_EQ(0, coloured);
        EXPECT_EQ(drawn_w > 0 && found->second != 32, inside > 10) << inside;
    }
    EXPECT_GT(top_row, 0);
}

// The model behind the grid: code lists sorted without repeats, bad ones refused with their item;
// drawn widths that hold a glyph left of its pen (the widest in a fixed-width face); cells that
// hold the widest glyph and the tallest line with a spare pixel; too large a texture refused.
TEST(Fontgen, CodeListsAndTheGridPlan) {
    EXPECT_EQ((std::vector<unsigned short>{32, 33, 34, 63, 0x401}),
              qorfontgen::parse_code_list("0x401,32-34, 33,0X3f"));
    EXPECT_EQ((std::vector<unsigned short>{65535}), qorfontgen::parse_code_list("65535"));
    auto const error_of = [](auto _call) -> std::string {
        try {
            _call();
        } catch (qorfontgen::CFontgenError const &error) {
            return error.what();
        }
        return "accepted";
    };
    struct {
        char const *mp_list, *mp_message;
    } const rows[] = {
        {"200-100", "bad range '200-100': its first code is above its last"},
        {"65536", "character code '65536' is above 65535 (0xFFFF)"},
        {"32-x", "bad character code 'x' in '32-x'"},
        {"-5", "bad character code '' in '-5'"},
        {"32,,33", "empty item in the character list '32,,33'"},
        {"", "empty item in the character list ''"},
    };
    for (auto const &row : rows)
        EXPECT_EQ(row.mp_message, error_of([&] { qorfontgen::parse_code_list(row.mp_list); })) << row.mp_list;

    auto const glyph = [](int _left, int _top, int _width, int _rows, int _advance) {
        qorfontgen::SGlyph glyph;
        glyph.m_left = _left, glyph.m_top = _top, glyph.m_width = _width, glyph.m_rows = _rows;
        glyph.m_advance = _advance;
        return glyph;
    };
    // A glyph left of the pen moves right into the cell: -1 + 11 columns need 11.
    std::vector<qorfontgen::SGlyph> glyphs = {glyph(-1, 10, 11, 10, 9), glyph(1, 5, 3, 5, 6),
                                              glyph(0, 10, 9, 10, 8)};
    qorfontgen::fit_drawn_widths(glyphs, false);
    EXPECT_EQ(11, glyphs[0].m_drawn_width);
    EXPECT_EQ(6, glyphs[1].m_drawn_width);
    qorfontgen::fit_drawn_widths(glyphs, true); // fixed width: the widest
    EXPECT_EQ(11, glyphs[2].m_drawn_width);

    std::vector<qorfontgen::SGlyph> five(5, glyph(0, 15, 4, 18, 5)); // 3 rows below the baseline
    five[0].m_drawn_width = 15;
    // Above: max(ascender 14, top 15) = 15; below: max(descender 4, 18 - 15) = 4; line 19, and
    // one spare pixel makes 20: cells of 32. Five glyphs need a 4 by 4 grid: 128 pixels.
    qorfontgen::SGrid const grid = qorfontgen::plan_grid(five, 14, -4);
    EXPECT_EQ((std::vector<int>{15, 19, 4, 32, 128}),
              (std::vector<int>{grid.m_baseline, grid.m_line_height, grid.m_dimension, grid.m_cell,
                                grid.m_texture}));
    // A line of 16 takes cells of 32 for its spare pixel; a line of 15 fits cells of 16.
    EXPECT_EQ(32, qorfontgen::plan_grid({glyph(0, 12, 4, 16, 5)}, 12, -4).m_cell);
    EXPECT_EQ(16, qorfontgen::plan_grid({glyph(0, 12, 4, 15, 5)}, 12, -3).m_cell);
    // A side given is cut into the fewest cells that hold the glyphs: 161 glyphs need 13 by 13
    // cells or more, and 15 cells of 20 are the first to divide 300 pixels.
    std::vector<qorfontgen::SGlyph> const many(161, glyph(0, 13, 4, 17, 9)); // cells of 18 needed
    qorfontgen::SGrid const given = qorfontgen::plan_grid(many, 13, -4, 300);
    EXPECT_EQ((std::vector<int>{15, 20, 300}),
              (std::vector<int>{given.m_dimension, given.m_cell, given.m_texture}));
    EXPECT_EQ(16, qorfontgen::plan_grid(many, 13, -4, 288).m_dimension); // cells of exactly 18
    EXPECT_EQ("no grid of cells of 18 pixels or more fills a texture of 200 pixels with 161 characters: ask "
              "for another texture side",
              error_of([&] { qorfontgen::plan_grid(many, 13, -4, 200); }));
    // 65536 glyphs need 256 cells per side; cells of 32 make 8192 pixels.
    EXPECT_EQ(
        "the texture would be 8192 pixels wide, more than 4096: ask for fewer characters or a smaller size",
        error_of([&] { qorfontgen::plan_grid(std::vector<qorfontgen::SGlyph>(65536, five[1]), 15, -3); }));
}

// Bad input ends with code 1, a message and no file; codes without a glyph are left out with a
// warning unless none is left.
TEST(Fontgen, BadInputEndsWithCodeOneAndWritesNothing) {
    std::string const dir = qortest::make_temp_dir(), out = dir + "/bad";
    std::string const missing = dir + "/missing.ttf",
                      text = qortest::write_file(dir + "/text.ttf", "no font\n");
    auto run = [&](std::string const &_font, std::string const &_size, std::string const &_chars) {
        return run_fontgen(dir, {"--font", _font, "--size", _size, "--chars", _chars, "--out", out});
    };
    std::string const no_glyph = "qorfontgen: warning: '" + SANS + "' has no glyph for 0xFFFF; left out\n";
    struct {
        SRun m_run;
        std::string m_err;
    } const rows[] = {
        {run(missing, "15", "32-126"), "qorfontgen: cannot open the font file '" + missing + "'\n"},
        {run(text, "15", "32-126"), "qorfontgen: '" + text + "' is no font that FreeType can read\n"},
        {run(SANS, "15", "126-32"), "qorfontgen: bad range '126-32': its first code is above its last\n"},
        {run(SANS, "0", "32"), "qorfontgen: bad size '0': give 4 to 256 pixels\n"},
        {run_fontgen(dir, {"--font", SANS, "--size", "15", "--chars", "32", "--out", out, "--texture", "8"}),
         "qorfontgen: bad texture side '8': give 16 to 4096 pixels\n"},
        {run_fontgen(dir, {"--font", SANS, "--size", "15", "--chars", "32"}),
         "qorfontgen: option '--out' is missing\n"},
        {run(SANS, "15", "0xFFFF"),
         no_glyph + "qorfontgen: '" + SANS + "' has none of the characters asked for\n"},
    };
    for (auto const &row : rows) {
        EXPECT_EQ(1, row.m_run.m_exit_code) << row.m_err;
        EXPECT_EQ(row.m_err, row.m_run.m_err);
    }
    EXPECT_EQ(0u, run_fontgen(dir, {}).m_err.rfind("usage: qorfontgen", 0));
    EXPECT_EQ("", qortest::read_file(out + ".fnt") + qortest::read_file(out + ".tga"));

    SRun const some = run(SANS, "15", "65,0xFFFF"); // U+FFFF is no character: no font has it
    EXPECT_EQ(0, some.m_exit_code);
    EXPECT_EQ(no_glyph, some.m_err);
    EXPECT_EQ(1u, read_charset(qortest::read_file(out + ".fnt")).m_chars.size());
}

// 95 of ASCII, 64 of the alphabet, Ë and ë, at one texel a pixel and a line of 15 to 24 pixels;
// courier of one width.
TEST(Fontgen, TheDefaultFontsHaveAsciiAndCyrillicAtOneTexelPerPixel) {
    std::string const data = std::string(QOR_SOURCE_DIR) + "/data";
    for (char const *p_name : {"arial_white", "courier"}) {
        SCOPED_TRACE(p_name);
        std::vector<std::string> const entry = font_entry(data + "/ui/fonts.lua", p_name);
        ASSERT_EQ(6u, entry.size());
        EXPECT_EQ((std::vector<std::string>{p_name, "nehe", "ui_image"}),
                  (std::vector<std::string>{entry[0], entry[1], entry[3]}));
        SCharset const charset = read_charset(qortest::read_file(data + "/fonts/" + entry[2]));
        int const size = std::stoi(entry[5]), line = static_cast<int>(charset.m_height * size);
        EXPECT_EQ(161u, charset.m_chars.size());
        EXPECT_EQ(2u, charset.m_chars.count(0x401) + charset.m_chars.count(0x451));
        EXPECT_EQ(32, charset.m_chars.begin()->first) << "a missing character is drawn as a space";
        EXPECT_EQ(size, read_texture(data + "/textures/" + entry[4]).m_w);
        EXPECT_TRUE(line >= 15 && line <= 24) << line;
        if (entry[0] != "courier") continue;
        EXPECT_EQ(300, size); // the size the build-version page draws the fixed font at
        for (auto const &c : charset.m_chars)
            EXPECT_EQ(charset.m_chars.begin()->second.m_w, c.second.m_w) << c.first;
    }
}
