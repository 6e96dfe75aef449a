// gameui_hello: a game interface library. An engine loads it beside libqorui.so because the
// configuration names it ("[ui_libraries] gameui_library = libgameui_hello.so"). It shows one
// window with a title, a line of text and a button that counts its clicks.
//
// RegisterInterface is called by the UI library's init while the interface starts, before the
// desktop exists: there the library only registers its command. Its window class registers itself
// in the windows factory when the module loads. The scene is built by the command "hello_scene",
// which the engine runs once init has returned (qorhost: the configuration's "[host] startup").
#include "qor_commands.h"
#include "qor_interfaces.h"
#include "qorbase.h"
#include "qorscriptsystem.h"
#include "engine_interfaces.h"
#include "ui_button.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_interfaces.h"
#include "ui_material.h"
#include "ui_static_text.h"

#include <string>

using namespace qorui;

namespace {

IInterfaceServer *gp_server = nullptr;

// A line of text that counts the clicks of a button. The class is registered in the windows
// factory as "ClickCounter", so a layout exported from this scene is imported again with the
// count it had.
class CClickCounter : public CStaticText {
public:
    CClickCounter(CDesktop *_p_desktop, char const *_name) : CStaticText(_p_desktop, _name) { show_count(); }

    QOR_CLASS_ID(CClickCounter, CStaticText, "ClickCounter")

    // The callback of the button's EVENT_CLICK.
    void on_click(CWndEvent const *) {
        ++m_clicks;
        show_count();
    }

    void save_state(LuaPlus::LuaObject &_lo_table) override {
        CStaticText::save_state(_lo_table);
        _lo_table.SetInteger("clicks", m_clicks);
    }
    void load_state(LuaPlus::LuaObject &_lo_table) override {
        CStaticText::load_state(_lo_table);
        LuaPlus::LuaObject const clicks = _lo_table.GetByName("clicks");
        if (clicks.IsNumber()) m_clicks = clicks.GetInteger();
        show_count();
    }

private:
    void show_count() { set_text(CString(("Clicks: " + std::to_string(m_clicks)).c_str())); }

    int m_clicks = 0;
};

CWindowRegistrar<CClickCounter> const s_click_counter_registrar("ClickCounter");

// "hello_scene": the window, in the middle of the 1024 by 768 desktop.
void cmd_hello_scene(char const *, void *) {
    IUserInterface *p_ui =
        static_cast<IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
    CDesktop *p_desktop = p_ui ? p_ui->get_desktop() : nullptr;
    if (!p_desktop) return;
    // The presets of data/ui/ui_material_presets.lua, which the button's materials refer to by name.
    lua_machine().DoFile(qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua");
    p_desktop->add_material(MAT_NAME_NORMAL, create_color_material(p_desktop, rgba_t(24, 28, 36, 255)));

    // Windows are made with new and owned by the parent they are attached to; places and sizes
    // are in desktop pixels (the desktop is 1024 by 768 whatever the screen).
    CWindowVisual *p_window = new CWindowVisual(p_desktop, "hello");
    p_desktop->attach_child(p_window);
    p_window->set_pos(312, 259);
    p_window->set_size(400, 250);
    p_window->set_can_drag(true);
    p_window->add_material(MAT_NAME_NORMAL, create_color_material(p_desktop, rgba_t(36, 44, 60, 255)));

    CWindowVisual *p_title_bar = new CWindowVisual(p_desktop, "title bar");
    p_window->attach_child(p_title_bar);
    p_title_bar->set_pos(0, 0);
    p_title_bar->set_size(400, 30);
    p_title_bar->set_passive(true);
    p_title_bar->add_material(MAT_NAME_NORMAL, create_color_material(p_desktop, rgba_t(70, 90, 150, 255)));
    p_title_bar->make_static_text(CString("Hello, qorui"), CRectArea(12, 6, 376, 20), "title");

    CStaticText *p_line = p_window->make_static_text(CString("Made by libgameui_hello.so."),
                                                     CRectArea(20, 60, 360, 20), "line");
    // The fixed-width font for this line; the factory makes fonts named in the data's fonts.lua.
    p_line->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("courier", p_desktop));

    CClickCounter *p_counter = new CClickCounter(p_desktop, "counter");
    p_window->attach_child(p_counter);
    p_counter->set_pos(20, 110);
    p_counter->set_size(360, 20);
    CButton *p_button = new CButton(p_desktop, "click me");
    p_window->attach_child(p_button);
    p_button->set_pos(140, 170);
    p_button->set_size(120, 34);
    p_button->m_text = CString("Click me");
    p_button->add_material(MAT_NAME_NORMAL, create_preset_material(p_desktop, "button_normal"));
    p_button->add_material(MAT_NAME_HIGHLIGHTED, create_preset_material(p_desktop, "button_highlighted"));
    p_button->add_material(MAT_NAME_PUSHED, create_preset_material(p_desktop, "button_pushed"));
    p_button->register_callback(EVENT_CLICK, CEventCallback(p_counter, &CClickCounter::on_click));
}

} // namespace

// The one entry point of a game interface library, with C linkage.
extern "C" __attribute__((visibility("default"))) int RegisterInterface(IInterfaceServer *_p_server) {
    if (!_p_server) return -1;
    gp_server = _p_server;
    if (ICmdManagerBase *p_commands =
            static_cast<ICmdManagerBase *>(_p_server->query_interface(qor_uid::CMD_MANAGER, 1)))
        p_commands->register_command("hello_scene", cmd_hello_scene, nullptr);
    return 1;
}
