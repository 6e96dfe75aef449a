// A TrueType face at one pixel size, through FreeType: vertical metrics and one anti-aliased
// glyph at a time.
#pragma once
#include "font_grid.h"

#include <ft2build.h>
#include FT_FREETYPE_H

#include <string>

namespace qorfontgen {

class CGlyphRasterizer {
public:
    // Opens the face; throws when the file is missing or no font, or the size is out of range.
    CGlyphRasterizer(std::string const &_font_file, int _pixels);
    ~CGlyphRasterizer();
    CGlyphRasterizer(CGlyphRasterizer const &) = delete;
    CGlyphRasterizer &operator=(CGlyphRasterizer const &) = delete;

    std::string get_family() const;
    int get_ascender() const;  // pixels above the baseline, rounded up
    int get_descender() const; // pixels below the baseline, negative, rounded down
    bool has_glyph(unsigned short _code) const;
    bool is_fixed_width() const;

    // The glyph of a character, hinted and anti-aliased. Throws when FreeType fails.
    SGlyph render(unsigned short _code) const;

private:
    FT_Library mp_library = nullptr;
    FT_Face mp_face = nullptr;
};

} // namespace qorfontgen
