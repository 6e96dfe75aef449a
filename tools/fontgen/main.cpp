// qorfontgen: makes a bitmap font for the interface from a TrueType font.
//
//   qorfontgen --font FILE --size PIXELS --chars LIST --out BASE [--texture-dir DIR] [--color RRGGBB]
//              [--texture PIXELS]
//
// Writes BASE.fnt, the character description (font category of the data folder), and NAME.tga,
// the texture (a texture folder), NAME being the file name part of BASE; then prints the entries
// for "fonts.lua" that name both. Exit code 0 on success, 1 on bad input or a failed write.
#include "font_files.h"
#include "font_grid.h"
#include "glyph_raster.h"

#include <cstdio>
#include <map>
#include <string>
#include <vector>

namespace {

using namespace qorfontgen;

char const USAGE[] =
    "usage: qorfontgen --font FILE --size PIXELS --chars LIST --out BASE [--texture-dir DIR] "
    "[--color RRGGBB] [--texture PIXELS]\n"
    "  LIST: codes and ranges, decimal or 0x hexadecimal, as 32-126,0x401,0x410-0x44F\n"
    "  PIXELS of --texture: the texture's side, which is also the font's size (the smallest power of\n"
    "  two that holds the characters unless given)\n"
    "  writes BASE.fnt and NAME.tga (beside BASE, or in DIR), NAME being BASE's file name\n";

struct SOptions {
    std::string m_font;
    int m_size = 0;
    std::string m_chars;
    std::string m_out;
    std::string m_texture_dir;
    SColor m_color;
    int m_texture = 0; // the texture's side; 0 for a power of two
};

std::string file_name_of(std::string const &_path) {
    std::size_t const slash = _path.rfind('/');
    return slash == std::string::npos ? _path : _path.substr(slash + 1);
}

std::string folder_of(std::string const &_path) {
    std::size_t const slash = _path.rfind('/');
    return slash == std::string::npos ? "." : _path.substr(0, slash);
}

// A whole number of pixels from _least to _most, or a CFontgenError about the _what.
int parse_pixels(std::string const &_text, char const *_what, int _least, int _most) {
    bool const digits =
        !_text.empty() && _text.size() < 5 && _text.find_first_not_of("0123456789") == std::string::npos;
    int const pixels = digits ? std::stoi(_text) : 0;
    if (pixels < _least || pixels > _most)
        throw CFontgenError(std::string("bad ") + _what + " '" + _text + "': give " + std::to_string(_least) +
                            " to " + std::to_string(_most) + " pixels");
    return pixels;
}

// "--key value" pairs; each key once, the first four required.
SOptions parse_options(int _argc, char **_argv) {
    std::map<std::string, std::string> values;
    for (int i = 1; i < _argc; i += 2) {
        std::string const key = _argv[i];
        static char const *const KEYS[] = {"--font",        "--size",  "--chars",  "--out",
                                           "--texture-dir", "--color", "--texture"};
        bool known = false;
        for (char const *p_known : KEYS)
            known = known || key == p_known;
        if (!known) throw CFontgenError("unknown option '" + key + "'");
        if (i + 1 >= _argc) throw CFontgenError("option '" + key + "' needs a value");
        if (!values.emplace(key, _argv[i + 1]).second)
            throw CFontgenError("option '" + key + "' given twice");
    }
    for (char const *p_required : {"--font", "--size", "--chars", "--out"})
        if (!values.count(p_required))
            throw CFontgenError(std::string("option '") + p_required + "' is missing");
    SOptions options;
    options.m_font = values["--font"];
    options.m_size = parse_pixels(values["--size"], "size", 4, 256);
    options.m_chars = values["--chars"];
    options.m_out = values["--out"];
    options.m_texture_dir =
        values.count("--texture-dir") ? values["--texture-dir"] : folder_of(options.m_out);
    if (values.count("--color")) options.m_color = parse_color(values["--color"]);
    if (values.count("--texture"))
        options.m_texture = parse_pixels(values["--texture"], "texture side", 16, MAX_TEXTURE_SIDE);
    if (file_name_of(options.m_out).empty()) throw CFontgenError("'" + options.m_out + "' names no file");
    return options;
}

// The glyphs of the codes that the face has; a code without a glyph is left out with a warning.
std::vector<SGlyph> render_glyphs(CGlyphRasterizer const &_rasterizer,
                                  std::vector<unsigned short> const &_codes, std::string const &_font) {
    std::vector<SGlyph> glyphs;
    for (unsigned short code : _codes) {
        if (_rasterizer.has_glyph(code))
            glyphs.push_back(_rasterizer.render(code));
        else
            std::fprintf(stderr, "qorfontgen: warning: '%s' has no glyph for 0x%04X; left out\n",
                         _font.c_str(), code);
    }
    if (glyphs.empty()) throw CFontgenError("'" + _font + "' has none of the characters asked for");
    return glyphs;
}

void run(SOptions const &_options) {
    std::vector<unsigned short> const codes = parse_code_list(_options.m_chars);
    CGlyphRasterizer const rasterizer(_options.m_font, _options.m_size);
    std::vector<SGlyph> glyphs = render_glyphs(rasterizer, codes, _options.m_font);
    fit_drawn_widths(glyphs, rasterizer.is_fixed_width());
    SGrid const grid =
        plan_grid(glyphs, rasterizer.get_ascender(), rasterizer.get_descender(), _options.m_texture);

    std::string const name = file_name_of(_options.m_out);
    std::string const texture_file = name + ".tga";
    std::string const description_file = name + ".fnt";
    write_texture(_options.m_texture_dir + "/" + texture_file,
                  compose_texture(glyphs, grid, _options.m_color), grid.m_texture);
    std::string const comment =
        name + ": " + file_name_of(_options.m_font) + " at " + std::to_string(_options.m_size) + " pixels, " +
        std::to_string(glyphs.size()) + " characters, made by qorfontgen.\n" + "Texture " + texture_file +
        ", " + std::to_string(grid.m_texture) + " by " + std::to_string(grid.m_texture) +
        " pixels; cells of " + std::to_string(grid.m_cell) + " pixels; widths in cells.";
    write_text(_options.m_out + ".fnt", describe_charset(glyphs, grid, rasterizer.get_family(), comment));
    std::fputs(lua_entries(name, description_file, texture_file, grid).c_str(), stdout);
}

} // namespace

int main(int _argc, char **_argv) {
    if (_argc < 2) {
        std::fputs(USAGE, stderr);
        return 1;
    }
    try {
        run(parse_options(_argc, _argv));
    } catch (std::exception const &error) {
        std::fprintf(stderr, "qorfontgen: %s\n", error.what());
        return 1;
    }
    return 0;
}
