// A layout file imported into a desktop, drawn twice and saved again.
#include "fuzz_world.h"
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"

#include <sstream>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorfuzz::write_ui_file("fuzz_layout.lua", _p_data, _size);
    qorui::CDesktop *p_desktop = qorfuzz::new_desktop();
    p_desktop->import(qorbase::FILE_CATEGORY_UI, "fuzz_layout.lua");
    qorfuzz::frame(p_desktop);
    qorfuzz::frame(p_desktop);
    LuaPlus::LuaObject saved;
    saved.AssignNewTable(&qorui::lua_machine());
    p_desktop->save_state(saved);
    std::ostringstream text;
    saved.dump("ui_windows_ini", text);
    delete p_desktop;
    qorfuzz::reset_lua();
    return 0;
}
