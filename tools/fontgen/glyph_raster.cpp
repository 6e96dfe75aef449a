// Glyphs of a TrueType face rasterised by FreeType into cells of the font's grid.
#include "glyph_raster.h"

#include <fstream>

namespace qorfontgen {

namespace {

// 26.6 fixed point to whole pixels.
int floor_pixels(FT_Pos _value) {
    return static_cast<int>(_value >= 0 ? _value / 64 : -((-_value + 63) / 64));
}
int ceil_pixels(FT_Pos _value) {
    return -floor_pixels(-_value);
}

// Coverage of one bitmap row as bytes 0 to 255, from 8-bit grey or 1-bit bitmaps.
void copy_row(FT_Bitmap const &_bitmap, unsigned _row, unsigned char *_p_out) {
    int const pitch = _bitmap.pitch;
    unsigned char const *p_row = _bitmap.buffer + static_cast<long>(_row) * pitch;
    for (unsigned x = 0; x < _bitmap.width; ++x) {
        if (_bitmap.pixel_mode == FT_PIXEL_MODE_MONO)
            _p_out[x] = (p_row[x / 8] & (0x80 >> (x % 8))) ? 255 : 0;
        else
            _p_out[x] = static_cast<unsigned char>(p_row[x] * 255 /
                                                   (_bitmap.num_grays > 1 ? _bitmap.num_grays - 1 : 1));
    }
}

} // namespace

CGlyphRasterizer::CGlyphRasterizer(std::string const &_font_file, int _pixels) {
    if (!std::ifstream(_font_file)) throw CFontgenError("cannot open the font file '" + _font_file + "'");
    if (FT_Init_FreeType(&mp_library) != 0) throw CFontgenError("cannot start FreeType");
    if (FT_New_Face(mp_library, _font_file.c_str(), 0, &mp_face) != 0) {
        FT_Done_FreeType(mp_library);
        throw CFontgenError("'" + _font_file + "' is no font that FreeType can read");
    }
    if (FT_Set_Pixel_Sizes(mp_face, 0, static_cast<FT_UInt>(_pixels)) != 0) {
        FT_Done_Face(mp_face);
        FT_Done_FreeType(mp_library);
        throw CFontgenError("'" + _font_file + "' has no size of " + std::to_string(_pixels) + " pixels");
    }
}

CGlyphRasterizer::~CGlyphRasterizer() {
    FT_Done_Face(mp_face);
    FT_Done_FreeType(mp_library);
}

std::string CGlyphRasterizer::get_family() const {
    return mp_face->family_name ? mp_face->family_name : "";
}

int CGlyphRasterizer::get_ascender() const {
    return ceil_pixels(mp_face->size->metrics.ascender);
}

int CGlyphRasterizer::get_descender() const {
    return floor_pixels(mp_face->size->metrics.descender);
}

bool CGlyphRasterizer::has_glyph(unsigned short _code) const {
    return FT_Get_Char_Index(mp_face, _code) != 0;
}

bool CGlyphRasterizer::is_fixed_width() const {
    return FT_IS_FIXED_WIDTH(mp_face);
}

SGlyph CGlyphRasterizer::render(unsigned short _code) const {
    if (FT_Load_Char(mp_face, _code, FT_LOAD_RENDER) != 0)
        throw CFontgenError("FreeType cannot render the character " + std::to_string(_code));
    FT_GlyphSlot const p_slot = mp_face->glyph;
    SGlyph glyph;
    glyph.m_code = _code;
    glyph.m_left = p_slot->bitmap_left;
    glyph.m_top = p_slot->bitmap_top;
    glyph.m_width = static_cast<int>(p_slot->bitmap.width);
    glyph.m_rows = static_cast<int>(p_slot->bitmap.rows);
    glyph.m_advance = static_cast<int>((p_slot->advance.x + 32) / 64); // hinted: whole pixels already
    glyph.m_coverage.resize(static_cast<std::size_t>(glyph.m_width) * glyph.m_rows);
    for (int row = 0; row < glyph.m_rows; ++row)
        copy_row(p_slot->bitmap, static_cast<unsigned>(row),
                 &glyph.m_coverage[static_cast<std::size_t>(row) * glyph.m_width]);
    return glyph;
}

} // namespace qorfontgen
