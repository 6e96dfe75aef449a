// The font generator's files: the colour argument, the "nehe" description, the TGA texture and
// the lines of "fonts.lua".
#include "font_files.h"

#include <cctype>
#include <cstdio>
#include <fstream>

#define STB_IMAGE_WRITE_STATIC
#define STB_IMAGE_WRITE_IMPLEMENTATION
#include <stb/stb_image_write.h>

namespace qorfontgen {

namespace {

// Texture-space and cell values here are multiples of a power of two, so nine significant digits
// write them exactly and the reader gets back the very value.
std::string number(double _value) {
    char buffer[32];
    std::snprintf(buffer, sizeof buffer, "%.9g", _value);
    return buffer;
}

// A plain token for the description: no blank, separator, quote or comment start can end or
// break it.
std::string as_token(std::string const &_text) {
    std::string token;
    for (char c : _text) {
        bool const plain = std::isalnum(static_cast<unsigned char>(c)) || c == '-' || c == '_' || c == '.';
        token += plain ? c : '_';
    }
    return token.empty() ? "unnamed" : token;
}

int hex_digit(char _c) {
    if (_c >= '0' && _c <= '9') return _c - '0';
    if (_c >= 'a' && _c <= 'f') return _c - 'a' + 10;
    if (_c >= 'A' && _c <= 'F') return _c - 'A' + 10;
    return -1;
}

void draw_glyph(SGlyph const &_glyph, SGrid const &_grid, std::size_t _cell,
                std::vector<unsigned char> &_pixels) {
    int const cell_x = static_cast<int>(_cell % _grid.m_dimension) * _grid.m_cell;
    int const cell_y = static_cast<int>(_cell / _grid.m_dimension) * _grid.m_cell;
    int const x0 = glyph_column(_glyph), y0 = glyph_row(_glyph, _grid);
    for (int row = 0; row < _glyph.m_rows; ++row)
        for (int column = 0; column < _glyph.m_width; ++column) {
            std::size_t const texel =
                static_cast<std::size_t>(cell_y + y0 + row) * _grid.m_texture + cell_x + x0 + column;
            _pixels[texel * 4 + 3] =
                _glyph.m_coverage[static_cast<std::size_t>(row) * _glyph.m_width + column];
        }
}

} // namespace

SColor parse_color(std::string const &_text) {
    std::string const digits = !_text.empty() && _text[0] == '#' ? _text.substr(1) : _text;
    int values[6];
    for (std::size_t i = 0; i < 6 && i < digits.size(); ++i)
        values[i] = hex_digit(digits[i]);
    bool valid = digits.size() == 6;
    for (std::size_t i = 0; valid && i < 6; ++i)
        valid = values[i] >= 0;
    if (!valid) throw CFontgenError("bad colour '" + _text + "': give six hexadecimal digits, as ffffff");
    SColor color;
    color.m_r = static_cast<unsigned char>(values[0] * 16 + values[1]);
    color.m_g = static_cast<unsigned char>(values[2] * 16 + values[3]);
    color.m_b = static_cast<unsigned char>(values[4] * 16 + values[5]);
    return color;
}

std::vector<unsigned char> compose_texture(std::vector<SGlyph> const &_glyphs, SGrid const &_grid,
                                           SColor const &_color) {
    std::size_t const texels = static_cast<std::size_t>(_grid.m_texture) * _grid.m_texture;
    std::vector<unsigned char> pixels(texels * 4);
    for (std::size_t texel = 0; texel < texels; ++texel) {
        pixels[texel * 4 + 0] = _color.m_r;
        pixels[texel * 4 + 1] = _color.m_g;
        pixels[texel * 4 + 2] = _color.m_b;
        pixels[texel * 4 + 3] = 0;
    }
    std::size_t const cells = static_cast<std::size_t>(_grid.m_dimension) * _grid.m_dimension;
    for (std::size_t cell = 0; cell < cells; ++cell) {
        std::size_t const glyph = glyph_of_cell(cell, _glyphs.size(), _grid);
        if (glyph != NO_GLYPH) draw_glyph(_glyphs[glyph], _grid, cell, pixels);
    }
    return pixels;
}

void write_texture(std::string const &_path, std::vector<unsigned char> const &_pixels, int _side) {
    if (!stbi_write_tga(_path.c_str(), _side, _side, 4, _pixels.data()))
        throw CFontgenError("cannot write the texture '" + _path + "'");
}

std::string describe_charset(std::vector<SGlyph> const &_glyphs, SGrid const &_grid,
                             std::string const &_family, std::string const &_comment) {
    if (_glyphs.empty()) throw CFontgenError("no characters to describe");
    std::string text;
    std::size_t line_start = 0;
    while (line_start < _comment.size()) {
        std::size_t line_end = _comment.find('\n', line_start);
        if (line_end == std::string::npos) line_end = _comment.size();
        text += "// " + _comment.substr(line_start, line_end - line_start) + "\n";
        line_start = line_end + 1;
    }
    text += "[common]\n";
    text += "font1 = " + as_token(_family) + "\n";
    text += "dimension = " + std::to_string(_grid.m_dimension) + "\n";
    text += "font_h = " + number(double(_grid.m_line_height) / _grid.m_cell) + "\n";
    text += "[chars]\n";
    std::size_t const cells = static_cast<std::size_t>(_grid.m_dimension) * _grid.m_dimension;
    if (cells > _glyphs.size())
        text += "// The first " + std::to_string(cells - _glyphs.size()) + " cells are blank; code " +
                std::to_string(_glyphs[0].m_code) + " takes its own cell again further on.\n";
    for (int row = 0; row < _grid.m_dimension; ++row) {
        for (int column = 0; column < _grid.m_dimension; ++column) {
            std::size_t const cell = static_cast<std::size_t>(row) * _grid.m_dimension + column;
            std::size_t const index = glyph_of_cell(cell, _glyphs.size(), _grid);
            SGlyph const &glyph = _glyphs[index == NO_GLYPH ? 0 : index];
            text += (column ? " " : "") + std::to_string(glyph.m_code) + " = " +
                    number(double(glyph.m_drawn_width) / _grid.m_cell);
        }
        text += "\n";
    }
    return text;
}

std::string lua_entries(std::string const &_name, std::string const &_description_file,
                        std::string const &_texture_file, SGrid const &_grid) {
    std::string const side = std::to_string(_grid.m_texture);
    return "charsets[\"" + _name + "\"] = { file_type = \"nehe\", file_name = \"" + _description_file +
           "\" }\n"
           "fonts[\"" +
           _name +
           "\"] = {\n"
           "    charset_name = \"" +
           _name +
           "\",\n"
           "    size = " +
           side +
           ",\n"
           "    material = {\n"
           "        material_template = \"ui_image\",\n"
           "        diffuse_texture = \"" +
           _texture_file +
           "\",\n"
           "        tex_size = { " +
           side + ", " + side +
           " },\n"
           "        color = { r = 255, g = 255, b = 255, a = 255 },\n"
           "    },\n"
           "}\n";
}

void write_text(std::string const &_path, std::string const &_text) {
    std::ofstream file(_path, std::ios::binary);
    file << _text;
    file.close();
    if (!file) throw CFontgenError("cannot write '" + _path + "'");
}

} // namespace qorfontgen
