// Bitmap fonts: a charset is the metrics of a square grid of character cells in one texture, read
// from a "nehe" font file; a font is a charset, one material that shows the texture, and a size
// in pixels per unit of texture space. The factory makes both from the tables of "fonts.lua".
//
// A character of width w (texture space) in a charset of height h drawn by a font of size s is a
// quad of trunc(w * s) by trunc(h * s) pixels showing the texture rectangle (x, y, w, h).
#pragma once
#include "qor_memory.h"

#include <cstdint>
#include <map>

namespace LuaPlus {
class LuaObject;
}

namespace qorui {

class CMaterial;
class CDesktop;
class CFontsFactory;

// The metrics of a grid of character cells in one texture, read from a "nehe" font file.
class CCharset {
public:
    // One character's cell in texture space; its height is the charset's.
    struct SChar {
        float x; // left edge of the cell
        float y; // upper edge of the cell
        float w; // the character's width
    };

    // The name the charset has in "fonts.lua".
    char const *get_name() const { return m_name.c_str(); }
    // The height of every character in texture space (1/16 unless the file says otherwise).
    float get_height() const { return m_height; }
    // Null for a charset without characters; a code that is missing gets the lowest code's cell.
    SChar const *get_char_description(unsigned short _code) const {
        uint32_t const slot = _code < m_slots.size() ? m_slots[_code] : 0;
        return slot ? &m_cells[slot - 1] : m_cells.empty() ? nullptr : &m_cells[0];
    }
    // No character moves the pen to the left: a line's pen only grows.
    bool has_no_negative_width() const { return m_no_negative_width; }

protected:
    friend class CFontsFactory;
    // Empty; the factory makes charsets.
    CCharset();
    // Only the factory deletes charsets, at process end.
    virtual ~CCharset() {}
    // Takes the name and reads the font file that the charset's table names (a "file_type" of
    // "nehe" and a "file_name"); a table without them is reported as an error and leaves the
    // charset empty.
    void init(char const *_p_name, LuaPlus::LuaObject _lo);

private:
    typedef std::map<unsigned short, SChar, std::less<unsigned short>,
                     qor_small_allocator<std::pair<unsigned short const, SChar>>>
        CCharMap;

    // Reads what it can; any bad or missing token ends the reading quietly.
    void load_from_nehe(char const *_file_name);
    void read_nehe(char const *_p_text, unsigned _length, CCharMap &_chars);
    void set_chars(CCharMap const &_chars);

    string m_name;
    // The characters in the order of their codes, and for each code up to the highest one the
    // place of its cell plus one, 0 for a code without a cell: one look-up per character.
    qor_vector<SChar> m_cells;
    qor_vector<uint32_t> m_slots;
    bool m_no_negative_width;
    float m_height; // of every character, in texture space
};

// A charset, the material that shows its texture and a size in pixels per texture unit.
class CFont {
public:
    // Destroys the font's material; the charset stays with the factory.
    virtual ~CFont();

    // The name the font has in "fonts.lua"; layouts save fonts by it.
    char const *get_name() const { return m_name.c_str(); }
    // Pixels per unit of texture space (320 until the font's table or a caller sets it).
    // @{
    float get_size() const { return m_size; }
    void set_size(float _size) { m_size = _size; }
    // @}
    // The charset's cell of the code, as CCharset gives it.
    CCharset::SChar const *get_char_description(unsigned short _code) const;
    // The shared charset; null for a font made without one.
    CCharset const *get_charset() const { return mp_charset; }
    // The one material, for any code.
    CMaterial *get_char_material(unsigned short _code);
    // The charset's height in texture space; times the size, the line height in pixels.
    float get_height() const;

protected:
    friend class CFontsFactory;
    // A font of the shared charset, without a material yet; the factory adds it.
    CFont(CCharset *_p_charset, char const *_name);

private:
    string m_name;
    float m_size;                        // pixels per unit of texture space
    CCharset *mp_charset;                // shared, owned by the factory
    qor_vector<CMaterial *> m_materials; // owned
};

// Makes charsets and fonts from the tables of "fonts.lua".
class CFontsFactory {
public:
    // No charsets.
    CFontsFactory() {}
    // The charsets live to the end of the process.
    virtual ~CFontsFactory() {}

    // Fresh tables "charsets" and "fonts", then "fonts.lua" of the interface folder.
    void init();
    // A new font with its own material, its charset shared by name; null after a warning when the
    // tables don't describe it. The caller owns the font.
    CFont *create(char const *_name, CDesktop *_p_desktop);

private:
    CCharset *find_charset(char const *_name);
    CCharset *load_charset(char const *_name);

    qor_vector<CCharset *> m_charsets;
};

// The library's one fonts factory, built at the first call.
CFontsFactory &get_fonts_factory();

} // namespace qorui
