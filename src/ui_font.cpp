// Charsets read from "nehe" files (a square grid of character cells and their widths) and the
// fonts that draw them at a size with a material.
#include "ui_font.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "tokenizer.h"
#include "ui_debug.h"
#include "ui_material.h"

#include <strings.h>

namespace qorui {

// ---------------------------------------------------------------------------------------------
// Charsets
// ---------------------------------------------------------------------------------------------

CCharset::CCharset() : m_no_negative_width(true), m_height(0.0625f) {}

// A code without a cell is drawn with the lowest code's cell, which the table's first place holds.
void CCharset::set_chars(CCharMap const &_chars) {
    m_cells.clear();
    m_slots.assign(_chars.empty() ? 0 : static_cast<size_t>(_chars.rbegin()->first) + 1, 0);
    m_no_negative_width = true;
    for (auto const &entry : _chars) {
        m_cells.push_back(entry.second);
        m_slots[entry.first] = static_cast<uint32_t>(m_cells.size());
        m_no_negative_width = m_no_negative_width && entry.second.w >= 0.0f;
    }
}

void CCharset::init(char const *_p_name, LuaPlus::LuaObject _lo) {
    if (!QOR_CHECK(_p_name)) _p_name = "";
    m_name = _p_name;
    if (!_lo.IsTable()) {
        qordebug::error("Cannot load the charset '%s'\n", _p_name);
        return;
    }
    LuaPlus::LuaObject const file_type = _lo.GetByName("file_type");
    LuaPlus::LuaObject const file_name = _lo.GetByName("file_name");
    if (!file_type.IsString()) {
        qordebug::error("Cannot load the charset '%s'\nunknown 'file_type' record", _p_name);
        return;
    }
    if (!file_name.IsString()) {
        qordebug::error("Cannot load the charset '%s'\nunknown 'file_name' record", _p_name);
        return;
    }
    if (strcasecmp(file_type.GetString(), "nehe") == 0)
        load_from_nehe(file_name.GetString());
    else
        qordebug::error(
            "Cannot load the charset '%s'\nunknown 'file_type' record\nfile_type '%s'\nfile_name '%s'",
            _p_name, file_type.GetString(), file_name.GetString());
}

void CCharset::load_from_nehe(char const *_file_name) {
    void *p_content = nullptr;
    IFileSystem *p_files = GetFileSystem();
    unsigned const length =
        p_files ? p_files->load_file(qorbase::FILE_CATEGORY_FONTS, _file_name, &p_content, true) : 0;
    if (!p_content) {
        qordebug::warning("Cannot open '%s'", _file_name);
        return;
    }
    CCharMap chars;
    try {
        read_nehe(static_cast<char const *>(p_content), length, chars);
    } catch (char const *) {
        // The file ends or breaks here; what was read stays.
    }
    set_chars(chars);
    qor_free(p_content);
}

// [common], its key = value pairs, [chars], then dimension * dimension entries code = width, row
// by row from the top.
void CCharset::read_nehe(char const *_p_text, unsigned _length, CCharMap &_chars) {
    CTokenizerRules rules(_p_text, _length, default_separators());
    CTokenizer tokenizer(rules, 7, 0);
    int dimension = 16;
    tokenizer.expect("[common]");
    tokenizer.next();
    for (;;) {
        string const key = tokenizer.get_token();
        if (key != "font1" && key != "dimension" && key != "font_h") break;
        tokenizer.next();
        tokenizer.expect("=");
        tokenizer.next();
        if (key == "dimension") dimension = tokenizer.as_int();
        if (key == "font_h") m_height = static_cast<float>(tokenizer.as_float());
        tokenizer.next();
    }
    if (dimension <= 0) { // bad data: the cells can't be laid out
        qordebug::warning("Cannot load the charset '%s'\nbad 'dimension' record %d", m_name.c_str(),
                          dimension);
        return;
    }
    m_height /= static_cast<float>(dimension);
    tokenizer.expect("[chars]");
    float const cells = static_cast<float>(dimension);
    for (int row = 0; row < dimension; ++row) {
        for (int column = 0; column < dimension; ++column) {
            tokenizer.next();
            unsigned short const code = static_cast<unsigned short>(tokenizer.as_int());
            tokenizer.next();
            tokenizer.expect("=");
            tokenizer.next();
            float const width = static_cast<float>(tokenizer.as_float());
            _chars[code] =
                SChar{static_cast<float>(column) / cells, static_cast<float>(row) / cells, width / cells};
        }
    }
}

// ---------------------------------------------------------------------------------------------
// Fonts
// ---------------------------------------------------------------------------------------------

CFont::CFont(CCharset *_p_charset, char const *_name)
    : m_name(_name ? _name : ""), m_size(320.0f), mp_charset(_p_charset) {}

CFont::~CFont() {
    for (CMaterial *p_material : m_materials)
        delete p_material;
}

CCharset::SChar const *CFont::get_char_description(unsigned short _code) const {
    if (!QOR_CHECK(mp_charset)) return nullptr;
    return mp_charset->get_char_description(_code);
}

CMaterial *CFont::get_char_material(unsigned short) {
    if (!QOR_CHECK(m_materials.size() > 0)) return nullptr;
    return m_materials[0];
}

float CFont::get_height() const {
    if (!QOR_CHECK(mp_charset)) return 0.0f;
    return mp_charset->get_height();
}

} // namespace qorui
