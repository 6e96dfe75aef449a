// What the generator writes: the grid texture, the character description file read by the
// interface's charsets, and the entries of "fonts.lua" that name both.
#pragma once
#include "font_grid.h"

#include <string>
#include <vector>

namespace qorfontgen {

struct SColor {
    unsigned char m_r = 255, m_g = 255, m_b = 255;
};

// "ffffff" or "#ffffff"; throws on anything else.
SColor parse_color(std::string const &_text);

// RGBA pixels, rows from the top: every pixel has the colour, and its alpha is the coverage of the
// glyph drawn in its cell, so the renderer's colour multiplies into the text.
std::vector<unsigned char> compose_texture(std::vector<SGlyph> const &_glyphs, SGrid const &_grid,
                                           SColor const &_color);

// A 32-bit TGA of a square texture; throws when the file can't be written.
void write_texture(std::string const &_path, std::vector<unsigned char> const &_pixels, int _side);

// The description file: a comment, "[common]" with "font1", "dimension" and "font_h", then
// "[chars]" with dimension * dimension entries "code = width", row by row, widths and the height in
// cells. _comment is written as "//" lines at the top.
std::string describe_charset(std::vector<SGlyph> const &_glyphs, SGrid const &_grid,
                             std::string const &_family, std::string const &_comment);

// The charset and the font of that name for "fonts.lua": the font's size is the texture's side, so
// one texel is one pixel on the screen. The material is white: the colour is in the texture, and
// colour tags in a text multiply into it.
std::string lua_entries(std::string const &_name, std::string const &_description_file,
                        std::string const &_texture_file, SGrid const &_grid);

// Writes the text whole; throws when the file can't be written.
void write_text(std::string const &_path, std::string const &_text);

} // namespace qorfontgen
