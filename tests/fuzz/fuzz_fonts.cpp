// A fonts.lua: every font it names made and drawn with, then the real file again.
#include "fuzz_world.h"
#include "engine_interfaces.h"
#include "LuaTableIterator.h"
#include "ui_font.h"
#include "ui_string.h"
#include "ui_window_visual.h"

#include <vector>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorui::CDesktop *p_desktop = qorfuzz::new_desktop();
    qorui::CWindowVisual *p_wnd = new qorui::CWindowVisual(p_desktop, "w");
    p_desktop->attach_child(p_wnd);
    p_wnd->set_size(150, 100);
    qorfuzz::write_ui_file("fonts.lua", _p_data, _size);
    qorui::get_fonts_factory().init();
    std::vector<qorui::string> names;
    LuaPlus::LuaObject const fonts = qorui::lua_machine().GetGlobals().GetByName("fonts");
    if (fonts.IsTable())
        qorui::for_each_entry(fonts, [&names](LuaPlus::LuaObject const &key, LuaPlus::LuaObject const &) {
            if (key.IsString() && names.size() < 16) names.push_back(key.GetString());
        });
    qorui::CString const text("Fuzz <color 255 0 0 255>red</color> \xC3\xA9");
    for (qorui::string const &name : names) {
        qorui::CFont *p_font = qorui::get_fonts_factory().create(name.c_str(), p_desktop);
        p_wnd->get_canvas().text_out(-3, 2, text, p_font);
        p_wnd->get_canvas().get_text_width(text, p_font, -1);
        delete p_font;
    }
    delete p_desktop;
    qorfuzz::restore_ui_file("fonts.lua");
    qorui::get_fonts_factory().init();
    qorfuzz::reset_lua();
    return 0;
}
