// The font generator's model: the character codes asked for, the rasterised glyphs, and the grid
// of square cells they are laid out in. A character's description in the font file is its cell
// (from its place in the grid) and its width; the reader computes the cell from the place alone, so
// the layout here and the order of the entries in the file must agree.
#pragma once
#include <cstddef>
#include <stdexcept>
#include <string>
#include <vector>

namespace qorfontgen {

// Bad input or a failed write; the program prints the message and ends with exit code 1.
class CFontgenError : public std::runtime_error {
public:
    using std::runtime_error::runtime_error;
};

// One rasterised character: 8-bit coverage rows from the top, placed relative to the pen, which
// stands on the baseline. Pixels.
struct SGlyph {
    unsigned short m_code = 0;
    int m_left = 0;                        // from the pen to the first column
    int m_top = 0;                         // from the baseline up to the first row
    int m_width = 0;                       // columns of coverage
    int m_rows = 0;                        // rows of coverage
    int m_advance = 0;                     // how far the face moves the pen
    int m_drawn_width = 0;                 // the width in the font file; see fit_drawn_widths
    std::vector<unsigned char> m_coverage; // m_width * m_rows, 0 (blank) to 255 (covered)
};

// A square texture of dimension by dimension square cells, filled row by row from the top left.
struct SGrid {
    int m_dimension = 0;   // cells per side, a power of two unless the texture's side is given
    int m_cell = 0;        // pixels per side of a cell, likewise
    int m_texture = 0;     // pixels per side of the texture: dimension * cell
    int m_baseline = 0;    // pixels from a cell's top down to the baseline
    int m_line_height = 0; // pixels of a line: the drawn height of every character, from a cell's top
};

// The largest texture side the generator makes, in pixels.
constexpr int MAX_TEXTURE_SIDE = 4096;

// "32-126,1024-1103,0x401": codes and inclusive ranges, decimal or 0x hexadecimal, separated by
// commas, each from 0 to 65535. The result is sorted and without repeats. Throws on bad input.
std::vector<unsigned short> parse_code_list(std::string const &_text);

// The smallest power of two not below _value (1 for 0).
int next_power_of_two(int _value);

// The grid that holds every glyph in a cell of its own with the baseline at the same height:
// the line reaches from the higher of the font's ascender and the highest glyph down to the lower
// of its descender and the lowest glyph. _ascender is above the baseline, _descender below it
// (negative), both in pixels. The texture is the smallest of powers of two; or, with a _texture
// side in pixels, that side cut into the fewest cells that hold the glyphs (a font whose size is
// its texture's side is drawn at one texel a pixel, so a side can match the size a font is drawn
// at). Throws when the texture would be too large, or the side given holds no such grid.
SGrid plan_grid(std::vector<SGlyph> const &_glyphs, int _ascender, int _descender, int _texture = 0);

// The interface draws a character as a quad of its width from its cell's left edge and moves the
// pen by that width, so a glyph whose coverage reaches past its advance would be cut. Each drawn
// width is the advance, widened to the glyph's last column; in a fixed-width face every character
// takes the widest, so that the columns of a text stay aligned.
void fit_drawn_widths(std::vector<SGlyph> &_glyphs, bool _fixed_width);

// Which glyph a cell shows, or NO_GLYPH. The reader takes dimension * dimension entries, and a code
// that appears twice keeps the place of its last entry. So the cells that the glyphs leave over
// come first, blank, with entries of the first glyph's code that its own entry later replaces; the
// glyphs fill the rest in order, and every code keeps the cell of its glyph.
constexpr std::size_t NO_GLYPH = static_cast<std::size_t>(-1);
std::size_t glyph_of_cell(std::size_t _cell, std::size_t _glyph_count, SGrid const &_grid);

// Where a glyph's coverage starts in its cell, in pixels from the cell's upper left corner. A glyph
// that reaches left of the pen is moved right to keep all its columns inside the cell.
int glyph_column(SGlyph const &_glyph);
int glyph_row(SGlyph const &_glyph, SGrid const &_grid);

} // namespace qorfontgen
