// The font generator, run as a program on a system font: its description file read back with the
// interface's own tokenizer by the charset reader's rules, its texture read back as the host reads
// textures, and its answers to bad input.
#include "font_grid.h"
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
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

namespace {

namespace fs = std::filesystem;

std::string const SANS = "/usr/share/fonts/truetype/dejavu/DejaVuSans.ttf";

// ---------------------------------------------------------------------------------------------
// Running the generator
// ---------------------------------------------------------------------------------------------

struct SRun {
    int m_exit_code = -1;
    std::string m_out; // what it printed on stdout
    std::string m_err; // and on stderr
};

std::string read_whole(fs::path const &_path) {
    std::ifstream file(_path, std::ios::binary);
    std::stringstream text;
    text << file.rdbuf();
    return text.str();
}

fs::path make_temp_dir() {
    std::string pattern = (fs::temp_directory_path() / "qorfontgen_XXXXXX").string();
    char *p_dir = mkdtemp(pattern.data());
    EXPECT_NE(p_dir, nullptr);
    return p_dir ? fs::path(p_dir) : fs::temp_directory_path();
}

// Arguments are single-quoted for the shell; none of the tests' arguments holds a quote.
SRun run_fontgen(fs::path const &_dir, std::vector<std::string> const &_args) {
    std::string command = QORFONTGEN;
    for (std::string const &arg : _args)
        command += " '" + arg + "'";
    command += " >'" + (_dir / "stdout.txt").string() + "' 2>'" + (_dir / "stderr.txt").string() + "'";
    int const status = std::system(command.c_str());
    SRun run;
    run.m_exit_code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    run.m_out = read_whole(_dir / "stdout.txt");
    run.m_err = read_whole(_dir / "stderr.txt");
    return run;
}

// ---------------------------------------------------------------------------------------------
// Reading back
// ---------------------------------------------------------------------------------------------

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

STexture read_texture(fs::path const &_path) {
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

bool is_power_of_two(int _value) {
    return _value > 0 && (_value & (_value - 1)) == 0;
}

// ---------------------------------------------------------------------------------------------
// A small font: space, A, B, I and Ë at 15 pixels
// ---------------------------------------------------------------------------------------------

class FontgenOutput : public testing::Test {
protected:
    static void SetUpTestSuite() {
        s_dir = make_temp_dir();
        s_run = run_fontgen(s_dir, {"--font", SANS, "--size", "15", "--chars", "0x401,73,32, 65-66", "--out",
                                    (s_dir / "small").string()});
        s_charset = read_charset(read_whole(s_dir / "small.fnt"));
        s_texture = read_texture(s_dir / "small.tga");
    }
    static void TearDownTestSuite() { fs::remove_all(s_dir); }

    static fs::path s_dir;
    static SRun s_run;
    static SCharset s_charset;
    static STexture s_texture;
};

fs::path FontgenOutput::s_dir;
SRun FontgenOutput::s_run;
SCharset FontgenOutput::s_charset;
STexture FontgenOutput::s_texture;

TEST_F(FontgenOutput, RunSucceedsAndDescribesEveryCodeOnce) {
    EXPECT_EQ(s_run.m_exit_code, 0) << s_run.m_err;
    EXPECT_EQ(s_run.m_err, "");
    // Five characters need a grid of 4 by 4.
    EXPECT_EQ(s_charset.m_dimension, 4);
    std::vector<unsigned short> codes;
    for (auto const &entry : s_charset.m_chars)
        codes.push_back(entry.first);
    EXPECT_EQ(codes, (std::vector<unsigned short>{32, 65, 66, 73, 0x401}));
}

TEST_F(FontgenOutput, CharactersTakeTheLastCellsInCodeOrder) {
    // 16 cells, 5 characters: the first 11 cells are spare, the characters fill cells 11 to 15.
    int cell = 11;
    for (auto const &entry : s_charset.m_chars) {
        SCOPED_TRACE("code " + std::to_string(entry.first));
        EXPECT_EQ(entry.second.m_x, (cell % 4) / 4.0f);
        EXPECT_EQ(entry.second.m_y, (cell / 4) / 4.0f);
        ++cell;
    }
}

TEST_F(FontgenOutput, TextureIsSquarePowerOfTwoAndFontSizeIsItsSide) {
    ASSERT_GT(s_texture.m_w, 0) << "the texture doesn't load";
    EXPECT_EQ(s_texture.m_w, s_texture.m_h);
    EXPECT_TRUE(is_power_of_two(s_texture.m_w)) << s_texture.m_w;
    EXPECT_TRUE(is_power_of_two(s_texture.m_w / s_charset.m_dimension));
    std::string const side = std::to_string(s_texture.m_w);
    EXPECT_NE(s_run.m_out.find("charsets[\"small\"] = { file_type = \"nehe\", file_name = \"small.fnt\" }"),
              std::string::npos)
        << s_run.m_out;
    EXPECT_NE(s_run.m_out.find("size = " + side + ","), std::string::npos) << s_run.m_out;
    EXPECT_NE(s_run.m_out.find("diffuse_texture = \"small.tga\","), std::string::npos) << s_run.m_out;
}

TEST_F(FontgenOutput, WidthsAndHeightAreWholeTexelsThatFitTheCell) {
    ASSERT_GT(s_texture.m_w, 0);
    float const side = static_cast<float>(s_texture.m_w), cell = 1.0f / s_charset.m_dimension;
    // At the texture's side as the font's size, the canvas's quads are whole pixels: no rounding.
    EXPECT_EQ(s_charset.m_height * side, std::trunc(s_charset.m_height * side));
    EXPECT_GE(s_charset.m_height * side, 15.0f);
    EXPECT_LT(s_charset.m_height, cell);
    for (auto const &entry : s_charset.m_chars) {
        SCOPED_TRACE("code " + std::to_string(entry.first));
        EXPECT_GT(entry.second.m_w, 0.0f);
        EXPECT_LT(entry.second.m_w, cell);
        EXPECT_EQ(entry.second.m_w * side, std::trunc(entry.second.m_w * side));
    }
    EXPECT_LT(s_charset.m_chars[73].m_w, s_charset.m_chars[65].m_w) << "I is narrower than A";
}

TEST_F(FontgenOutput, SpaceIsBlankAndLettersLieInsideTheirDrawnRectangle) {
    ASSERT_GT(s_texture.m_w, 0);
    SCellCoverage const space = cell_coverage(s_texture, s_charset, s_charset.m_chars[32]);
    EXPECT_EQ(space.m_inside + space.m_outside, 0);
    for (unsigned short code : {65, 66, 73, 0x401}) {
        SCOPED_TRACE("code " + std::to_string(code));
        SCellCoverage const letter = cell_coverage(s_texture, s_charset, s_charset.m_chars[code]);
        EXPECT_GT(letter.m_inside, 10);
        EXPECT_EQ(letter.m_outside, 0);
        EXPECT_TRUE(letter.m_all_white);
    }
}

TEST_F(FontgenOutput, SpareCellsAreBlank) {
    ASSERT_GT(s_texture.m_w, 0);
    int const cell = s_texture.m_w / 4;
    int covered = 0;
    for (int y = 0; y < s_texture.m_h; ++y)
        for (int x = 0; x < s_texture.m_w; ++x)
            if ((y / cell) * 4 + x / cell < 11 && s_texture.texel(x, y)[3] != 0) ++covered;
    EXPECT_EQ(covered, 0);
}

// ---------------------------------------------------------------------------------------------
// Codes and bad input
// ---------------------------------------------------------------------------------------------

TEST(FontgenCodeList, RangesAndCodesAreSortedWithoutRepeats) {
    EXPECT_EQ(qorfontgen::parse_code_list("0x401,32-34, 33,0X3f"),
              (std::vector<unsigned short>{32, 33, 34, 63, 0x401}));
    EXPECT_EQ(qorfontgen::parse_code_list("65535"), (std::vector<unsigned short>{65535}));
}

TEST(FontgenCodeList, BadListsAreRefusedWithTheirItem) {
    struct SCase {
        char const *m_list;
        char const *m_message;
    } const CASES[] = {
        {"200-100", "bad range '200-100': its first code is above its last"},
        {"65536", "character code '65536' is above 65535 (0xFFFF)"},
        {"32-x", "bad character code 'x' in '32-x'"},
        {"-5", "bad character code '' in '-5'"},
        {"32,,33", "empty item in the character list '32,,33'"},
        {"", "empty item in the character list ''"},
    };
    for (SCase const &test_case : CASES) {
        SCOPED_TRACE(test_case.m_list);
        try {
            qorfontgen::parse_code_list(test_case.m_list);
            ADD_FAILURE() << "accepted";
        } catch (qorfontgen::CFontgenError const &error) {
            EXPECT_STREQ(error.what(), test_case.m_message);
        }
    }
}

qorfontgen::SGlyph glyph_box(int _left, int _top, int _width, int _rows, int _advance) {
    qorfontgen::SGlyph glyph;
    glyph.m_left = _left, glyph.m_top = _top, glyph.m_width = _width, glyph.m_rows = _rows;
    glyph.m_advance = _advance;
    return glyph;
}

TEST(FontgenGrid, DrawnWidthsCoverGlyphsAndFixedWidthTakesTheWidest) {
    // A glyph left of the pen moves right into the cell: -1 + 11 columns need 11.
    std::vector<qorfontgen::SGlyph> glyphs = {glyph_box(-1, 10, 11, 10, 9), glyph_box(1, 5, 3, 5, 6),
                                              glyph_box(0, 10, 9, 10, 8)};
    qorfontgen::fit_drawn_widths(glyphs, false);
    EXPECT_EQ(glyphs[0].m_drawn_width, 11);
    EXPECT_EQ(glyphs[1].m_drawn_width, 6);
    EXPECT_EQ(glyphs[2].m_drawn_width, 9);
    qorfontgen::fit_drawn_widths(glyphs, true);
    for (qorfontgen::SGlyph const &glyph : glyphs)
        EXPECT_EQ(glyph.m_drawn_width, 11);
}

TEST(FontgenGrid, CellHoldsTheTallestLineAndWidestGlyphWithASparePixel) {
    std::vector<qorfontgen::SGlyph> glyphs(5, glyph_box(0, 15, 4, 18, 5)); // 3 rows below the baseline
    glyphs[0].m_drawn_width = 15;
    // Above: max(ascender 14, top 15) = 15; below: max(descender 4, 18 - 15) = 4; line 19, and
    // one spare pixel makes 20: cells of 32. Five glyphs need a 4 by 4 grid: 128 pixels.
    qorfontgen::SGrid const grid = qorfontgen::plan_grid(glyphs, 14, -4);
    EXPECT_EQ(grid.m_baseline, 15);
    EXPECT_EQ(grid.m_line_height, 19);
    EXPECT_EQ(grid.m_dimension, 4);
    EXPECT_EQ(grid.m_cell, 32);
    EXPECT_EQ(grid.m_texture, 128);
    // A line of 16 takes cells of 32 for its spare pixel; a line of 15 fits cells of 16.
    EXPECT_EQ(qorfontgen::plan_grid({glyph_box(0, 12, 4, 16, 5)}, 12, -4).m_cell, 32);
    EXPECT_EQ(qorfontgen::plan_grid({glyph_box(0, 12, 4, 15, 5)}, 12, -3).m_cell, 16);
}

TEST(FontgenGrid, TextureAboveTheLimitIsRefused) {
    // 65536 glyphs need 256 cells per side; cells of 32 make 8192 pixels.
    std::vector<qorfontgen::SGlyph> glyphs(65536, glyph_box(0, 15, 4, 18, 5));
    try {
        qorfontgen::plan_grid(glyphs, 15, -3);
        ADD_FAILURE() << "accepted";
    } catch (qorfontgen::CFontgenError const &error) {
        EXPECT_STREQ(error.what(),
                     "the texture would be 8192 pixels wide, more than 4096: ask for fewer characters or a "
                     "smaller size");
    }
}

class FontgenCommandLine : public testing::Test {
protected:
    void SetUp() override { m_dir = make_temp_dir(); }
    void TearDown() override { fs::remove_all(m_dir); }

    SRun run(std::string const &_font, std::string const &_size, std::string const &_chars) {
        return run_fontgen(
            m_dir, {"--font", _font, "--size", _size, "--chars", _chars, "--out", (m_dir / "bad").string()});
    }
    bool wrote_files() const { return fs::exists(m_dir / "bad.fnt") || fs::exists(m_dir / "bad.tga"); }

    fs::path m_dir;
};

TEST_F(FontgenCommandLine, MissingFontFileEndsWithCodeOneAndWritesNothing) {
    std::string const missing = (m_dir / "missing.ttf").string();
    SRun const result = run(missing, "15", "32-126");
    EXPECT_EQ(result.m_exit_code, 1);
    EXPECT_EQ(result.m_err, "qorfontgen: cannot open the font file '" + missing + "'\n");
    EXPECT_FALSE(wrote_files());
}

TEST_F(FontgenCommandLine, FileThatIsNoFontEndsWithCodeOne) {
    std::string const text = (m_dir / "text.ttf").string();
    std::ofstream(text) << "no font\n";
    SRun const result = run(text, "15", "32-126");
    EXPECT_EQ(result.m_exit_code, 1);
    EXPECT_EQ(result.m_err, "qorfontgen: '" + text + "' is no font that FreeType can read\n");
    EXPECT_FALSE(wrote_files());
}

TEST_F(FontgenCommandLine, BadRangeEndsWithCodeOneAndWritesNothing) {
    SRun const result = run(SANS, "15", "126-32");
    EXPECT_EQ(result.m_exit_code, 1);
    EXPECT_EQ(result.m_err, "qorfontgen: bad range '126-32': its first code is above its last\n");
    EXPECT_FALSE(wrote_files());
}

TEST_F(FontgenCommandLine, BadSizeAndMissingOptionsEndWithCodeOne) {
    EXPECT_EQ(run(SANS, "0", "32").m_err, "qorfontgen: bad size '0': give 4 to 256 pixels\n");
    EXPECT_EQ(run(SANS, "15px", "32").m_exit_code, 1);
    SRun const no_out = run_fontgen(m_dir, {"--font", SANS, "--size", "15", "--chars", "32"});
    EXPECT_EQ(no_out.m_exit_code, 1);
    EXPECT_EQ(no_out.m_err, "qorfontgen: option '--out' is missing\n");
    SRun const no_arguments = run_fontgen(m_dir, {});
    EXPECT_EQ(no_arguments.m_exit_code, 1);
    EXPECT_EQ(no_arguments.m_err.rfind("usage: qorfontgen", 0), 0u) << no_arguments.m_err;
    EXPECT_FALSE(wrote_files());
}

TEST_F(FontgenCommandLine, CodesWithoutGlyphAreLeftOutWithAWarning) {
    // U+FFFF is no character: no font has a glyph for it.
    SRun const some = run(SANS, "15", "65,0xFFFF");
    EXPECT_EQ(some.m_exit_code, 0);
    EXPECT_EQ(some.m_err, "qorfontgen: warning: '" + SANS + "' has no glyph for 0xFFFF; left out\n");
    EXPECT_EQ(read_charset(read_whole(m_dir / "bad.fnt")).m_chars.size(), 1u);

    fs::remove(m_dir / "bad.fnt");
    fs::remove(m_dir / "bad.tga");
    SRun const none = run(SANS, "15", "0xFFFF");
    EXPECT_EQ(none.m_exit_code, 1);
    EXPECT_NE(none.m_err.find("qorfontgen: '" + SANS + "' has none of the characters asked for"),
              std::string::npos);
    EXPECT_FALSE(wrote_files());
}

// ---------------------------------------------------------------------------------------------
// The data folder's default fonts
// ---------------------------------------------------------------------------------------------

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

SFontEntry read_font_entry(fs::path const &_fonts_lua, char const *_p_name) {
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

TEST(FontgenDefaultFonts, BothFontsLoadWithAsciiAndCyrillicAtOneTexelPerPixel) {
    fs::path const data = fs::path(QOR_SOURCE_DIR) / "data";
    for (char const *p_name : {"arial_white", "courier"}) {
        SCOPED_TRACE(p_name);
        SFontEntry const entry = read_font_entry(data / "ui" / "fonts.lua", p_name);
        EXPECT_EQ(entry.m_charset_name, p_name);
        EXPECT_EQ(entry.m_file_type, "nehe");
        EXPECT_EQ(entry.m_template, "ui_image");
        SCharset const charset = read_charset(read_whole(data / "fonts" / entry.m_file_name));
        STexture const texture = read_texture(data / "textures" / entry.m_texture);
        // 95 of ASCII, 64 of the alphabet, Ë and ë.
        EXPECT_EQ(charset.m_chars.size(), 161u);
        EXPECT_EQ(charset.m_chars.count(0x401) + charset.m_chars.count(0x451), 2u);
        EXPECT_EQ(charset.m_chars.begin()->first, 32) << "a missing character is drawn as a space";
        EXPECT_EQ(texture.m_w, static_cast<int>(entry.m_size));
        // A line of 16 to 24 pixels on the screen.
        EXPECT_GE(static_cast<int>(charset.m_height * entry.m_size), 16);
        EXPECT_LE(static_cast<int>(charset.m_height * entry.m_size), 24);
    }
}

TEST(FontgenDefaultFonts, CourierHasOneWidthForAllCharacters) {
    fs::path const data = fs::path(QOR_SOURCE_DIR) / "data";
    SCharset const charset = read_charset(read_whole(data / "fonts" / "courier.fnt"));
    ASSERT_FALSE(charset.m_chars.empty());
    for (auto const &entry : charset.m_chars)
        EXPECT_EQ(entry.second.m_w, charset.m_chars.begin()->second.m_w);
}

} // namespace
