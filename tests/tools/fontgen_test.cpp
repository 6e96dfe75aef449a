// The font generator, run as a program on a system font: its description file read back with the
// interface's own tokenizer by the charset reader's rules, its texture read back as the host reads
// textures, its answers to bad input, and the default fonts of the data folder.
#include "font_grid.h"
#include "test_common.h"
#include "tokenizer.h"

#include <gtest/gtest.h>
#include <lua.hpp>

#pragma GCC diagnostic push
#pragma GCC diagnostic ignored "-Wunused-function"
#pragma GCC diagnostic ignored "-Wmissing-field-initializers"
#define STB_IMAGE_STATIC
#define STB_IMAGE_IMPLEMENTATION
#define STBI_ONLY_TGA
#include <stb/stb_image.h>
#pragma GCC diagnostic pop

#include <cmath>
#include <map>
#include <sys/wait.h>

namespace {

std::string const SANS = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";

struct SRun {
    int m_exit_code = -1;
    std::string m_out; // what it printed on stdout
    std::string m_err; // and on stderr
};

// The generator run with output in _dir; arguments are single-quoted for the shell (none of the
// tests' arguments holds a quote).
SRun run_fontgen(std::string const &_dir, std::vector<std::string> const &_args) {
    std::string command = QORFONTGEN;
    for (std::string const &arg : _args)
        command += " '" + arg + "'";
    command += " >'" + _dir + "/stdout.txt' 2>'" + _dir + "/stderr.txt'";
    int const status = std::system(command.c_str());
    SRun run;
    run.m_exit_code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    run.m_out = qortest::read_file(_dir + "/stdout.txt");
    run.m_err = qortest::read_file(_dir + "/stderr.txt");
    return run;
}

struct SChar {
    float m_x, m_y, m_w;
};

struct SCharset {
    int m_dimension = 16;
    float m_height = 0.0625f;
    std::map<unsigned short, SChar> m_chars;
};

qorui::string lone(char const *_p_text) {
    return qorui::string(_p_text);
}

// The charset reader's steps: "[common]", the pairs, "[chars]", then dimension * dimension entries
// by rows; a failure of a required token ends the reading and keeps what was read.
SCharset read_charset(std::string const &_text) {
    SCharset charset;
    float height = 0.0625f;
    try {
        qorui::CTokenizerRules rules(_text.data(), static_cast<unsigned>(_text.size()),
                                     qorui::default_separators());
        qorui::CTokenizer tokens(rules, 7, 0);
        tokens.expect(lone("[common]"));
        tokens.next();
        for (;;) {
            qorui::string const key = tokens.get_token();
            if (key != lone("font1") && key != lone("dimension") && key != lone("font_h")) break;
            tokens.next();
            tokens.expect(lone("="));
            tokens.next();
            if (key == lone("dimension")) charset.m_dimension = tokens.as_int();
            if (key == lone("font_h")) height = static_cast<float>(tokens.as_float());
            tokens.next();
        }
        charset.m_height = height / charset.m_dimension;
        tokens.expect(lone("[chars]"));
        for (int row = 0; row < charset.m_dimension; ++row)
            for (int column = 0; column < charset.m_dimension; ++column) {
                tokens.next();
                auto const code = static_cast<unsigned short>(tokens.as_int());
                tokens.next();
                tokens.expect(lone("="));
                tokens.next();
                float const dimension = static_cast<float>(charset.m_dimension);
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

struct STexture {
    int m_w = 0, m_h = 0;
    std::vector<unsigned char> m_rgba;

    unsigned char const *texel(int _x, int _y) const {
        return &m_rgba[(static_cast<size_t>(_y) * m_w + _x) * 4];
    }
};

STexture read_texture(std::string const &_path) {
    STexture texture;
    int channels = 0;
    unsigned char *p_data = stbi_load(_path.c_str(), &texture.m_w, &texture.m_h, &channels, 4);
    if (!p_data) return texture;
    texture.m_rgba.assign(p_data, p_data + static_cast<size_t>(texture.m_w) * texture.m_h * 4);
    stbi_image_free(p_data);
    return texture;
}

// Texels of a cell, in pixels of the texture; inside: those that the canvas draws of the character,
// the rectangle from (x, y) of its width and the charset's height.
struct SCellCoverage {
    int m_inside = 0;        // texels with any coverage inside
    int m_outside = 0;       // and outside the drawn rectangle
    bool m_all_white = true; // every texel of the cell has the colour white
};

SCellCoverage cell_coverage(STexture const &_texture, SCharset const &_charset, SChar const &_char) {
    int const side = _texture.m_w, cell = side / _charset.m_dimension;
    int const x0 = static_cast<int>(_char.m_x * side), y0 = static_cast<int>(_char.m_y * side);
    int const drawn_w = static_cast<int>(_char.m_w * side),
              drawn_h = static_cast<int>(_charset.m_height * side);
    SCellCoverage coverage;
    for (int y = 0; y < cell; ++y)
        for (int x = 0; x < cell; ++x) {
            unsigned char const *p_texel = _texture.texel(x0 + x, y0 + y);
            coverage.m_all_white =
                coverage.m_all_white && p_texel[0] == 255 && p_texel[1] == 255 && p_texel[2] == 255;
            if (p_texel[3] == 0) continue;
            (x < drawn_w && y < drawn_h ? coverage.m_inside : coverage.m_outside) += 1;
        }
    return coverage;
}

// fonts.lua run as the fonts factory runs it: after "charsets={}" and "fonts={}".
struct SFontEntry {
    std::string m_file_type, m_file_name, m_charset_name, m_template, m_texture;
    double m_size = 0;
};

std::string string_field(lua_State *_p_lua, int _table, char const *_p_key) {
    lua_getfield(_p_lua, _table, _p_key);
    std::string const value = lua_isstring(_p_lua, -1) ? lua_tostring(_p_lua, -1) : "";
    lua_pop(_p_lua, 1);
    return value;
}

SFontEntry read_font_entry(std::string const &_fonts_lua, char const *_p_name) {
    SFontEntry entry;
    lua_State *p_lua = luaL_newstate();
    if (luaL_dostring(p_lua, "charsets={} fonts={}") != 0 || luaL_dofile(p_lua, _fonts_lua.c_str()) != 0) {
        ADD_FAILURE() << "fonts.lua doesn't run: " << lua_tostring(p_lua, -1);
        lua_close(p_lua);
        return entry;
    }
    lua_getglobal(p_lua, "fonts");
    lua_getfield(p_lua, -1, _p_name);
    if (lua_istable(p_lua, -1)) {
        entry.m_charset_name = string_field(p_lua, -1, "charset_name");
        lua_getfield(p_lua, -1, "size");
        entry.m_size = lua_tonumber(p_lua, -1);
        lua_getfield(p_lua, -2, "material");
        if (lua_istable(p_lua, -1)) {
            entry.m_template = string_field(p_lua, -1, "material_template");
            entry.m_texture = string_field(p_lua, -1, "diffuse_texture");
        }
    }
    lua_getglobal(p_lua, "charsets");
    lua_getfield(p_lua, -1, entry.m_charset_name.c_str());
    if (lua_istable(p_lua, -1)) {
        entry.m_file_type = string_field(p_lua, -1, "file_type");
        entry.m_file_name = string_field(p_lua, -1, "file_name");
    }
    lua_close(p_lua);
    return entry;
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
    STexture const texture = read_texture(dir + "/small.tga");
    ASSERT_EQ(4, charset.m_dimension);
    ASSERT_GT(texture.m_w, 0) << "the texture doesn't load";
    EXPECT_EQ(texture.m_w, texture.m_h);
    EXPECT_EQ(0, texture.m_w & (texture.m_w - 1)) << texture.m_w; // a power of two
    EXPECT_NE(std::string::npos,
              run.m_out.find("charsets[\"small\"] = { file_type = \"nehe\", file_name = \"small.fnt\" }"))
        << run.m_out;
    EXPECT_NE(std::string::npos, run.m_out.find("size = " + std::to_string(texture.m_w) + ","));
    EXPECT_NE(std::string::npos, run.m_out.find("diffuse_texture = \"small.tga\","));

    float const side = static_cast<float>(texture.m_w), cell = 0.25f;
    EXPECT_EQ(charset.m_height * side, std::trunc(charset.m_height * side)); // no rounding on the screen
    EXPECT_GE(charset.m_height * side, 15.0f);
    EXPECT_LT(charset.m_height, cell);
    int index = 11; // 16 cells, 5 characters: the first 11 cells are spare
    for (unsigned short code : {32, 65, 66, 73, 0x401}) {
        SCOPED_TRACE("code " + std::to_string(code));
        ASSERT_EQ(1u, charset.m_chars.count(code));
        SChar const &c = charset.m_chars[code];
        EXPECT_EQ((index % 4) * cell, c.m_x);
        EXPECT_EQ((index / 4) * cell, c.m_y);
        ++index;
        EXPECT_GT(c.m_w, 0.0f);
        EXPECT_LT(c.m_w, cell);
        EXPECT_EQ(c.m_w * side, std::trunc(c.m_w * side));
        SCellCoverage const coverage = cell_coverage(texture, charset, c);
        EXPECT_EQ(0, coverage.m_outside);
        EXPECT_TRUE(coverage.m_all_white);
        if (code == 32)
            EXPECT_EQ(0, coverage.m_inside);
        else
            EXPECT_GT(coverage.m_inside, 10);
    }
    EXPECT_EQ(5u, charset.m_chars.size());
    EXPECT_LT(charset.m_chars[73].m_w, charset.m_chars[65].m_w) << "I is narrower than A";
    int const cell_px = texture.m_w / 4;
    int covered = 0;
    for (int y = 0; y < texture.m_h; ++y)
        for (int x = 0; x < texture.m_w; ++x)
            if ((y / cell_px) * 4 + x / cell_px < 11 && texture.texel(x, y)[3] != 0) ++covered;
    EXPECT_EQ(0, covered);
}

TEST(Fontgen, CodeListsAreSortedWithoutRepeatsAndBadOnesAreRefusedWithTheirItem) {
    EXPECT_EQ((std::vector<unsigned short>{32, 33, 34, 63, 0x401}),
              qorfontgen::parse_code_list("0x401,32-34, 33,0X3f"));
    EXPECT_EQ((std::vector<unsigned short>{65535}), qorfontgen::parse_code_list("65535"));
    struct {
        char const *mp_list;
        char const *mp_message;
    } const rows[] = {
        {"200-100", "bad range '200-100': its first code is above its last"},
        {"65536", "character code '65536' is above 65535 (0xFFFF)"},
        {"32-x", "bad character code 'x' in '32-x'"},
        {"-5", "bad character code '' in '-5'"},
        {"32,,33", "empty item in the character list '32,,33'"},
        {"", "empty item in the character list ''"},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.mp_list);
        try {
            qorfontgen::parse_code_list(row.mp_list);
            ADD_FAILURE() << "accepted";
        } catch (qorfontgen::CFontgenError const &error) {
            EXPECT_STREQ(row.mp_message, error.what());
        }
    }
}

namespace {

qorfontgen::SGlyph glyph_box(int _left, int _top, int _width, int _rows, int _advance) {
    qorfontgen::SGlyph glyph;
    glyph.m_left = _left, glyph.m_top = _top, glyph.m_width = _width, glyph.m_rows = _rows;
    glyph.m_advance = _advance;
    return glyph;
}

} // namespace

TEST(Fontgen, TheGridHoldsTheWidestGlyphAndTheTallestLineWithASparePixel) {
    // A glyph left of the pen moves right into the cell: -1 + 11 columns need 11.
    std::vector<qorfontgen::SGlyph> glyphs = {glyph_box(-1, 10, 11, 10, 9), glyph_box(1, 5, 3, 5, 6),
                                              glyph_box(0, 10, 9, 10, 8)};
    qorfontgen::fit_drawn_widths(glyphs, false);
    EXPECT_EQ(11, glyphs[0].m_drawn_width);
    EXPECT_EQ(6, glyphs[1].m_drawn_width);
    qorfontgen::fit_drawn_widths(glyphs, true); // fixed width: the widest
    EXPECT_EQ(11, glyphs[2].m_drawn_width);

    std::vector<qorfontgen::SGlyph> five(5, glyph_box(0, 15, 4, 18, 5)); // 3 rows below the baseline
    five[0].m_drawn_width = 15;
    // Above: max(ascender 14, top 15) = 15; below: max(descender 4, 18 - 15) = 4; line 19, and
    // one spare pixel makes 20: cells of 32. Five glyphs need a 4 by 4 grid: 128 pixels.
    qorfontgen::SGrid const grid = qorfontgen::plan_grid(five, 14, -4);
    EXPECT_EQ(15, grid.m_baseline);
    EXPECT_EQ(19, grid.m_line_height);
    EXPECT_EQ(4, grid.m_dimension);
    EXPECT_EQ(32, grid.m_cell);
    EXPECT_EQ(128, grid.m_texture);
    // A line of 16 takes cells of 32 for its spare pixel; a line of 15 fits cells of 16.
    EXPECT_EQ(32, qorfontgen::plan_grid({glyph_box(0, 12, 4, 16, 5)}, 12, -4).m_cell);
    EXPECT_EQ(16, qorfontgen::plan_grid({glyph_box(0, 12, 4, 15, 5)}, 12, -3).m_cell);
    // A side given is cut into the fewest cells that hold the glyphs: 161 glyphs need 13 by 13
    // cells or more, and 15 cells of 20 are the first to divide 300 pixels.
    std::vector<qorfontgen::SGlyph> const many(161, glyph_box(0, 13, 4, 17, 9)); // cells of 18 needed
    qorfontgen::SGrid const given = qorfontgen::plan_grid(many, 13, -4, 300);
    EXPECT_EQ(15, given.m_dimension);
    EXPECT_EQ(20, given.m_cell);
    EXPECT_EQ(300, given.m_texture);
    EXPECT_EQ(16, qorfontgen::plan_grid(many, 13, -4, 288).m_dimension); // cells of exactly 18
    try {
        qorfontgen::plan_grid(many, 13, -4, 200);
        ADD_FAILURE() << "accepted";
    } catch (qorfontgen::CFontgenError const &error) {
        EXPECT_STREQ(
            "no grid of cells of 18 pixels or more fills a texture of 200 pixels with 161 characters: ask "
            "for another texture side",
            error.what());
    }
    try { // 65536 glyphs need 256 cells per side; cells of 32 make 8192 pixels
        qorfontgen::plan_grid(std::vector<qorfontgen::SGlyph>(65536, glyph_box(0, 15, 4, 18, 5)), 15, -3);
        ADD_FAILURE() << "accepted";
    } catch (qorfontgen::CFontgenError const &error) {
        EXPECT_STREQ("the texture would be 8192 pixels wide, more than 4096: ask for fewer characters or a "
                     "smaller size",
                     error.what());
    }
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
        {run(SANS, "15", "0xFFFF"), "qorfontgen: warning: '" + SANS +
                                        "' has no glyph for 0xFFFF; left out\nqorfontgen: '" + SANS +
                                        "' has none of the characters asked for\n"},
    };
    for (auto const &row : rows) {
        EXPECT_EQ(1, row.m_run.m_exit_code) << row.m_err;
        EXPECT_EQ(row.m_err, row.m_run.m_err);
    }
    EXPECT_EQ(0u, run_fontgen(dir, {}).m_err.rfind("usage: qorfontgen", 0));
    EXPECT_EQ("", qortest::read_file(out + ".fnt") + qortest::read_file(out + ".tga"));

    SRun const some = run(SANS, "15", "65,0xFFFF"); // U+FFFF is no character: no font has it
    EXPECT_EQ(0, some.m_exit_code);
    EXPECT_EQ("qorfontgen: warning: '" + SANS + "' has no glyph for 0xFFFF; left out\n", some.m_err);
    EXPECT_EQ(1u, read_charset(qortest::read_file(out + ".fnt")).m_chars.size());
}

// 95 of ASCII, 64 of the alphabet, Ë and ë, at one texel a pixel; courier of one width.
TEST(Fontgen, TheDefaultFontsHaveAsciiAndCyrillicAtOneTexelPerPixel) {
    std::string const data = std::string(QOR_SOURCE_DIR) + "/data";
    for (char const *p_name : {"arial_white", "courier"}) {
        SCOPED_TRACE(p_name);
        SFontEntry const entry = read_font_entry(data + "/ui/fonts.lua", p_name);
        EXPECT_EQ(p_name, entry.m_charset_name);
        EXPECT_EQ("nehe", entry.m_file_type);
        EXPECT_EQ("ui_image", entry.m_template);
        SCharset const charset = read_charset(qortest::read_file(data + "/fonts/" + entry.m_file_name));
        EXPECT_EQ(161u, charset.m_chars.size());
        EXPECT_EQ(2u, charset.m_chars.count(0x401) + charset.m_chars.count(0x451));
        EXPECT_EQ(32, charset.m_chars.begin()->first) << "a missing character is drawn as a space";
        EXPECT_EQ(static_cast<int>(entry.m_size), read_texture(data + "/textures/" + entry.m_texture).m_w);
        EXPECT_GE(static_cast<int>(charset.m_height * entry.m_size), 15); // a line of 15 to 24 pixels
        EXPECT_LE(static_cast<int>(charset.m_height * entry.m_size), 24);
        if (entry.m_charset_name == "courier") {
            for (auto const &c : charset.m_chars)
                EXPECT_EQ(charset.m_chars.begin()->second.m_w, c.second.m_w) << c.first;
            // The size the build-version page draws the fixed font at: one texel a pixel there too.
            EXPECT_EQ(300.0, entry.m_size);
        }
    }
}
