// The factory of fonts: charsets and fonts from the tables of "fonts.lua".
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "ui_debug.h"
#include "LuaTableIterator.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_window.h"
#include "ui_desktop.h"

#include <cstring>

namespace qorui {

CFontsFactory &get_fonts_factory() {
    static CFontsFactory s_factory;
    return s_factory;
}

void CFontsFactory::init() {
    LuaPlus::LuaState &lua = lua_machine();
    lua.DoString("charsets={}", true);
    lua.DoString("fonts={}", true);
    lua.DoFile(qorbase::FILE_CATEGORY_UI, "fonts.lua", true);
}

CCharset *CFontsFactory::find_charset(char const *_name) {
    for (CCharset *p_charset : m_charsets) {
        if (!QOR_CHECK_AS(p_charset, "m_charsets[i]")) continue;
        if (std::strcmp(p_charset->get_name(), _name) == 0) return p_charset;
    }
    return nullptr;
}

// A charset is read once per process and then shared by name.
CCharset *CFontsFactory::load_charset(char const *_name) {
    LuaPlus::LuaObject const lo_charsets = lua_machine().GetGlobals().GetByName("charsets");
    if (!QOR_CHECK(lo_charsets.IsTable())) return nullptr;
    LuaPlus::LuaObject const entry = lo_charsets.GetByName(_name);
    if (!entry.IsTable()) {
        qordebug::warning("Cannot load the charset '%s'", _name);
        return nullptr;
    }
    CCharset *p_charset = new CCharset();
    p_charset->init(_name, entry);
    m_charsets.push_back(p_charset);
    return p_charset;
}

CFont *CFontsFactory::create(char const *_name, CDesktop *_p_desktop) {
    if (!QOR_CHECK(_p_desktop) || !_name) return nullptr;
    LuaPlus::LuaObject const lo_fonts = lua_machine().GetGlobals().GetByName("fonts");
    if (!QOR_CHECK(lo_fonts.IsTable())) return nullptr;
    LuaPlus::LuaObject const entry = lo_fonts.GetByName(_name);
    if (!entry.IsTable()) {
        qordebug::warning("Cannot load the font '%s'", _name);
        return nullptr;
    }
    LuaPlus::LuaObject const charset_name = entry.GetByName("charset_name");
    if (!charset_name.IsString()) {
        qordebug::warning("Cannot load the font '%s'\n'charset' record not found", _name);
        return nullptr;
    }
    CCharset *p_charset = find_charset(charset_name.GetString());
    if (!p_charset) p_charset = load_charset(charset_name.GetString());
    if (!p_charset) return nullptr;
    LuaPlus::LuaObject const material = entry.GetByName("material");
    if (!material.IsTable()) {
        qordebug::warning("Cannot load the font '%s'\n'material' record not found", _name);
        return nullptr;
    }
    CFont *p_font = new CFont(p_charset, _name);
    CMaterial *p_material = _p_desktop->create_material();
    if (p_material) {
        p_material->load_state(material);
        p_font->m_materials.push_back(p_material);
    }
    float size;
    if (read_float(entry, "size", size)) p_font->set_size(size);
    return p_font;
}

} // namespace qorui
