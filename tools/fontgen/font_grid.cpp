// The font generator's model: the list of character codes, and the square grid of cells the
// glyphs are laid out in, with their places and drawn widths.
#include "font_grid.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>

namespace qorfontgen {

namespace {

// One code of a list: decimal, or hexadecimal behind "0x".
unsigned short parse_code(std::string const &_text, std::string const &_item) {
    bool const hex = _text.size() > 2 && _text[0] == '0' && (_text[1] == 'x' || _text[1] == 'X');
    std::string const digits = hex ? _text.substr(2) : _text;
    char const *valid = hex ? "0123456789abcdefABCDEF" : "0123456789";
    if (digits.empty() || digits.find_first_not_of(valid) != std::string::npos)
        throw CFontgenError("bad character code '" + _text + "' in '" + _item + "'");
    errno = 0;
    unsigned long const value = std::strtoul(digits.c_str(), nullptr, hex ? 16 : 10);
    if (errno == ERANGE || value > 0xFFFF)
        throw CFontgenError("character code '" + _text + "' is above 65535 (0xFFFF)");
    return static_cast<unsigned short>(value);
}

// One item of a list: a code or "first-last".
void append_item(std::string const &_item, std::vector<unsigned short> &_codes) {
    std::size_t const dash = _item.find('-');
    if (dash == std::string::npos) {
        _codes.push_back(parse_code(_item, _item));
        return;
    }
    unsigned short const first = parse_code(_item.substr(0, dash), _item);
    unsigned short const last = parse_code(_item.substr(dash + 1), _item);
    if (first > last) throw CFontgenError("bad range '" + _item + "': its first code is above its last");
    for (unsigned code = first; code <= last; ++code)
        _codes.push_back(static_cast<unsigned short>(code));
}

} // namespace

std::vector<unsigned short> parse_code_list(std::string const &_text) {
    std::vector<unsigned short> codes;
    std::size_t start = 0;
    while (start <= _text.size()) {
        std::size_t end = _text.find(',', start);
        if (end == std::string::npos) end = _text.size();
        std::string item = _text.substr(start, end - start);
        item.erase(std::remove(item.begin(), item.end(), ' '), item.end());
        if (item.empty()) throw CFontgenError("empty item in the character list '" + _text + "'");
        append_item(item, codes);
        start = end + 1;
    }
    std::sort(codes.begin(), codes.end());
    codes.erase(std::unique(codes.begin(), codes.end()), codes.end());
    return codes;
}

int next_power_of_two(int _value) {
    int power = 1;
    while (power < _value)
        power *= 2;
    return power;
}

int glyph_column(SGlyph const &_glyph) {
    return std::max(_glyph.m_left, 0);
}

int glyph_row(SGlyph const &_glyph, SGrid const &_grid) {
    return _grid.m_baseline - _glyph.m_top;
}

SGrid plan_grid(std::vector<SGlyph> const &_glyphs, int _ascender, int _descender, int _texture) {
    int above = std::max(_ascender, 0);
    int below = std::max(-_descender, 0);
    int right = 0;
    for (SGlyph const &glyph : _glyphs) {
        above = std::max(above, glyph.m_top);
        below = std::max(below, glyph.m_rows - glyph.m_top);
        right = std::max(right, glyph.m_drawn_width);
    }
    SGrid grid;
    grid.m_baseline = above;
    grid.m_line_height = above + below;
    // One pixel to spare on the right and below keeps a filtering renderer from picking up the
    // neighbouring cell at the edge of a character.
    int const cell = std::max(grid.m_line_height, right) + 1;
    grid.m_dimension = 1;
    if (_texture > 0) {
        auto const holds = [&](int _dimension) {
            return _texture % _dimension == 0 && _texture / _dimension >= cell &&
                   static_cast<std::size_t>(_dimension) * _dimension >= _glyphs.size();
        };
        while (grid.m_dimension <= _texture / cell && !holds(grid.m_dimension))
            ++grid.m_dimension;
        if (grid.m_dimension > _texture / cell)
            throw CFontgenError("no grid of cells of " + std::to_string(cell) +
                                " pixels or more fills a texture of " + std::to_string(_texture) +
                                " pixels with " + std::to_string(_glyphs.size()) +
                                " characters: ask for another texture side");
        grid.m_cell = _texture / grid.m_dimension;
    } else {
        while (static_cast<std::size_t>(grid.m_dimension) * grid.m_dimension < _glyphs.size())
            grid.m_dimension *= 2;
        grid.m_cell = next_power_of_two(cell);
    }
    grid.m_texture = grid.m_dimension * grid.m_cell;
    if (grid.m_texture > MAX_TEXTURE_SIDE)
        throw CFontgenError("the texture would be " + std::to_string(grid.m_texture) +
                            " pixels wide, more than " + std::to_string(MAX_TEXTURE_SIDE) +
                            ": ask for fewer characters or a smaller size");
    return grid;
}

void fit_drawn_widths(std::vector<SGlyph> &_glyphs, bool _fixed_width) {
    int widest = 0;
    for (SGlyph &glyph : _glyphs) {
        glyph.m_drawn_width = std::max(glyph.m_advance, glyph_column(glyph) + glyph.m_width);
        widest = std::max(widest, glyph.m_drawn_width);
    }
    if (_fixed_width)
        for (SGlyph &glyph : _glyphs)
            glyph.m_drawn_width = widest;
}

std::size_t glyph_of_cell(std::size_t _cell, std::size_t _glyph_count, SGrid const &_grid) {
    std::size_t const cells = static_cast<std::size_t>(_grid.m_dimension) * _grid.m_dimension;
    std::size_t const spare = cells > _glyph_count ? cells - _glyph_count : 0;
    return _cell < spare ? NO_GLYPH : _cell - spare;
}

} // namespace qorfontgen
