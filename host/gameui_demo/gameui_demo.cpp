// The demo game's interface library: the engine loads it beside the UI library, named by
// "gameui_library" in the configuration. It announces itself in the log and adds two commands:
// "gameui_demo" echoes its arguments to the log, "gameui_demo_scene" builds the demo's windows on
// the desktop (the host runs it at start from its configuration), "gameui_show_stats NAME" shows
// one stats page.
#include "qor_commands.h"
#include "qor_interfaces.h"
#include "qor_log.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_interfaces.h"
#include "ui_material.h"
#include "ui_string.h"
#include "qorscriptsystem.h"

#include <string>

using namespace qorui;

namespace {

IInterfaceServer *gp_server = nullptr;

ILogger *demo_logger() {
    ILogManager *p_log = static_cast<ILogManager *>(gp_server->query_interface(qor_uid::LOG_MANAGER, 1));
    return p_log ? p_log->create_logger("GameUI", "GameUI: ") : nullptr;
}

void cmd_gameui_demo(char const *_arguments, void *) {
    if (ILogger *p_logger = demo_logger())
        p_logger->write((std::string("gameui_demo ") + (_arguments ? _arguments : "")).c_str(), 0);
}

// A line of text in the window's default font (inherited from the desktop), in a colour of its
// own; the window is passive, so a press on it activates its dialog. The class registers itself in
// the windows factory as "DemoText", so layouts can make it and keep its "text".
class CDemoText : public CWindowVisual {
public:
    CDemoText(IWindowDesktop *_p_desktop, char const *_name) : CWindowVisual(_p_desktop, _name) {
        set_passive(true);
    }
    CDemoText(IWindowDesktop *_p_desktop, char const *_name, char const *_text)
        : CDemoText(_p_desktop, _name) {
        m_text = CString(_text);
    }

    QOR_CLASS_ID(CDemoText, CWindowVisual, "DemoText")

    void save_state(LuaPlus::LuaObject &_lo_table) override {
        CWindowVisual::save_state(_lo_table);
        save_string(_lo_table, "text", m_text);
    }
    void load_state(LuaPlus::LuaObject &_lo_table) override {
        CWindowVisual::load_state(_lo_table);
        load_string(_lo_table, "text", m_text);
    }

protected:
    void on_event_draw(CWndEvent const *_p_event) override {
        CWindowVisual::on_event_draw(_p_event);
        m_canvas.text_out(0, 0, m_text, get_font(FNT_NAME_DEFAULT));
    }

private:
    CString m_text;
};

CWindowRegistrar<CDemoText> const s_demo_text_registrar("DemoText");

CMaterial *colour(CDesktop *_p_desktop, unsigned char _r, unsigned char _g, unsigned char _b,
                  unsigned char _a = 255) {
    CMaterial *p_material = _p_desktop->create_material();
    if (!p_material) return nullptr;
    p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
    p_material->set_color(rgba_t(_r, _g, _b, _a));
    return p_material;
}

template <class TWindow>
TWindow *place(CWindow *_p_parent, TWindow *_p_wnd, int _x, int _y, int _w, int _h) {
    _p_parent->attach_child(_p_wnd);
    _p_wnd->set_pos(_x, _y);
    _p_wnd->set_size(_w, _h);
    return _p_wnd;
}

// A button: normal, highlighted and pushed colours, and its caption.
void make_button(CDesktop *_p_desktop, CWindow *_p_parent, char const *_name, char const *_caption, int _x,
                 int _y) {
    CWindowVisual *p_button = place(_p_parent, new CWindowVisual(_p_desktop, _name), _x, _y, 110, 30);
    p_button->add_material(MAT_NAME_NORMAL, colour(_p_desktop, 58, 74, 104));
    p_button->add_material(MAT_NAME_HIGHLIGHTED, colour(_p_desktop, 78, 100, 140));
    p_button->add_material(MAT_NAME_PUSHED, colour(_p_desktop, 40, 52, 76));
    place(p_button, new CDemoText(_p_desktop, "caption", _caption), 12, 6, 96, 20);
}

// A dialog-like window: a title bar to drag it by, a body with text and two buttons.
void make_dialog(CDesktop *_p_desktop, char const *_name, char const *_title, int _x, int _y) {
    CWindowVisual *p_dialog = place(_p_desktop, new CWindowVisual(_p_desktop, _name), _x, _y, 360, 200);
    p_dialog->set_can_drag(true);
    p_dialog->add_material(MAT_NAME_NORMAL, colour(_p_desktop, 30, 36, 48, 235));
    CWindowVisual *p_title = place(p_dialog, new CWindowVisual(_p_desktop, "title bar"), 0, 0, 360, 26);
    p_title->set_passive(true);
    p_title->add_material(MAT_NAME_NORMAL, colour(_p_desktop, 90, 70, 150));
    place(p_title, new CDemoText(_p_desktop, "title", _title), 10, 4, 340, 20);
    place(p_dialog,
          new CDemoText(_p_desktop, "line 1",
                        "<color 255 210 90 255>qorui</color> demo: drag me by my background."),
          16, 44, 330, 20);
    place(p_dialog,
          new CDemoText(_p_desktop, "line 2",
                        "\xD0\x9F\xD1\x80\xD0\xB8\xD0\xB2\xD0\xB5\xD1\x82, \xD0\xBC\xD0\xB8\xD1\x80!"),
          16, 70, 330, 20);
    make_button(_p_desktop, p_dialog, "ok", "OK", 110, 150);
    make_button(_p_desktop, p_dialog, "cancel", "Cancel", 234, 150);
}

IUserInterface *user_interface() {
    return static_cast<IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
}

// "gameui_show_stats NAME": shows the stats page of that name, hiding the others.
void cmd_gameui_show_stats(char const *_arguments, void *) {
    IUserInterface *p_ui = user_interface();
    if (!p_ui || !_arguments) return;
    std::string name(_arguments);
    name.erase(0, name.find_first_not_of(' '));
    name.erase(name.find_last_not_of(' ') + 1);
    for (unsigned i = 0; i < p_ui->get_stats_pages_count(); ++i) {
        IStatsPage *p_page = p_ui->get_stats_page(i);
        p_page->show(name == p_page->get_name());
    }
}

void cmd_gameui_demo_scene(char const *, void *) {
    IUserInterface *p_ui =
        static_cast<IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
    CDesktop *p_desktop = p_ui ? p_ui->get_desktop() : nullptr;
    if (!p_desktop) return;
    p_desktop->add_material(MAT_NAME_NORMAL, colour(p_desktop, 22, 26, 34));
    CWindowVisual *p_bar = place(p_desktop, new CWindowVisual(p_desktop, "top bar"), 0, 0, 1024, 36);
    p_bar->set_alignment(ALIGNMENT_TOP);
    p_bar->add_material(MAT_NAME_NORMAL, colour(p_desktop, 40, 48, 66));
    place(p_bar, new CDemoText(p_desktop, "heading", "qorui - demo scene"), 16, 8, 400, 20);
    make_dialog(p_desktop, "dialog", "A dialog you can drag", 120, 120);
    make_dialog(p_desktop, "second dialog",
                "\xD0\x92\xD1\x82\xD0\xBE\xD1\x80\xD0\xBE\xD0\xB5 \xD0\xBE\xD0\xBA\xD0\xBD\xD0\xBE", 540,
                300);
    if (ILogger *p_logger = demo_logger()) p_logger->write("Demo scene built", 0);
}

} // namespace

extern "C" __attribute__((visibility("default"))) int RegisterInterface(IInterfaceServer *_p_server) {
    if (!_p_server) return -1;
    gp_server = _p_server;
    if (ILogger *p_logger = demo_logger()) p_logger->write("Demo game interface library attached", 0);
    if (ICmdManagerBase *p_commands =
            static_cast<ICmdManagerBase *>(_p_server->query_interface(qor_uid::CMD_MANAGER, 1))) {
        p_commands->register_command("gameui_demo", cmd_gameui_demo, nullptr);
        p_commands->register_command("gameui_demo_scene", cmd_gameui_demo_scene, nullptr);
        p_commands->register_command("gameui_show_stats", cmd_gameui_show_stats, nullptr);
    }
    return 1;
}
