// A presets file: each preset loaded as a material table of its own and by its name, and drawn
// plain, stretched, tiled and as text.
#include "fuzz_world.h"
#include "engine_interfaces.h"
#include "LuaTableIterator.h"
#include "qorbase.h"
#include "ui_material.h"
#include "ui_window_visual.h"

#include <vector>

extern "C" int LLVMFuzzerTestOneInput(uint8_t const *_p_data, size_t _size) {
    qorfuzz::init();
    qorfuzz::write_ui_file("ui_material_presets.lua", _p_data, _size);
    qorui::CDesktop *p_desktop = qorfuzz::new_desktop();
    // The import runs the presets file; the layout is missing, so the tree stays.
    p_desktop->import(qorbase::FILE_CATEGORY_UI, "no_layout.lua");
    qorui::CWindowVisual *p_wnd = new qorui::CWindowVisual(p_desktop, "w");
    p_desktop->attach_child(p_wnd);
    p_wnd->set_size(100, 60);
    std::vector<qorui::string> names;
    LuaPlus::LuaObject const presets = qorui::lua_machine().GetGlobals().GetByName("ui_material_presets");
    if (presets.IsTable())
        qorui::for_each_entry(presets, [&names](LuaPlus::LuaObject const &key, LuaPlus::LuaObject const &) {
            if (key.IsString() && names.size() < 64) names.push_back(key.GetString());
        });
    for (qorui::string const &name : names) {
        for (bool const by_name : {false, true}) {
            qorui::CMaterial *p_material = p_desktop->create_material();
            LuaPlus::LuaObject table;
            if (by_name) {
                table.AssignNewTable(&qorui::lua_machine());
                table.SetString("material_preset", name.c_str());
            } else {
                table = presets.GetByName(name.c_str());
                if (!table.IsTable()) table.AssignNewTable(&qorui::lua_machine());
            }
            p_material->load_state(table);
            p_wnd->get_canvas().draw_rect(-5, -5, 120, 70, p_material);
            p_wnd->get_canvas().draw_tiled(0, 0, 100, 60, p_material->get_tex_x(), p_material->get_tex_y(),
                                           p_material->get_tex_w(), p_material->get_tex_h(),
                                           p_material->get_tex_real_w(), p_material->get_tex_real_h(),
                                           p_material);
            delete p_material;
        }
    }
    qorfuzz::frame(p_desktop);
    delete p_desktop;
    qorfuzz::restore_ui_file("ui_material_presets.lua");
    qorfuzz::reset_lua();
    return 0;
}
