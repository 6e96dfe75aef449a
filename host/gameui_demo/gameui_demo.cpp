// The demo game's interface library: the engine loads it beside the UI library, named by
// "gameui_library" in the configuration. It announces itself in the log and adds three commands:
// "gameui_demo" echoes its arguments to the log, "gameui_demo_scene" builds the demo's windows on
// the desktop and places the console (the host runs it at start from its configuration),
// "gameui_show_stats NAME" shows one stats page; the thread strip adds "gameui_threads" and
// "gameui_threads_save" (thread_strip.h). In the scene, the button "Ask" of the second
// dialog opens a modal message box and shows its answer.
#include "qor_commands.h"
#include "qor_interfaces.h"
#include "qor_log.h"
#include "qorbase.h"
#include "engine_interfaces.h"
#include "ui_button.h"
#include "ui_console.h"
#include "ui_dialog.h"
#include "ui_desktop.h"
#include "ui_drop_down_list.h"
#include "ui_edit_box.h"
#include "ui_items.h"
#include "ui_list_box.h"
#include "ui_page_control.h"
#include "ui_selector_box.h"
#include "ui_font.h"
#include "ui_interfaces.h"
#include "ui_material.h"
#include "ui_static_text.h"
#include "ui_string.h"
#include "ui_value_bar.h"
#include "qorscriptsystem.h"
#include "thread_strip.h"

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
    CDemoText(CDesktop *_p_desktop, char const *_name) : CWindowVisual(_p_desktop, _name) {
        set_passive(true);
    }
    CDemoText(CDesktop *_p_desktop, char const *_name, char const *_text) : CDemoText(_p_desktop, _name) {
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

// The configured background picture, as an imported layout shows it.
CMaterial *background(CDesktop *_p_desktop) {
    CMaterial *p_material = _p_desktop->create_material();
    if (!p_material) return nullptr;
    char const *p_picture = qorbase::get_config_string("ui", "background", "_back.tga");
    p_material->init("ui_image", p_picture, nullptr, nullptr, nullptr, nullptr, true, false);
    return p_material;
}

// A material of data/ui/ui_material_presets.lua; a layout exported from the scene refers to it
// by name. Every material of the scene is one, so an export writes every preset back.
CMaterial *preset(CDesktop *_p_desktop, char const *_name) {
    return create_preset_material(_p_desktop, _name);
}

// Materials of a window by state, from presets; null names are skipped.
void dress(CDesktop *_p_desktop, CWindowVisual *_p_wnd,
           std::initializer_list<std::pair<HUID, char const *>> _looks) {
    for (auto const &look : _looks)
        if (look.second) _p_wnd->add_material(look.first, preset(_p_desktop, look.second));
}

template <class TWindow>
TWindow *place(CWindow *_p_parent, TWindow *_p_wnd, int _x, int _y, int _w, int _h) {
    _p_parent->attach_child(_p_wnd);
    _p_wnd->set_pos(_x, _y);
    _p_wnd->set_size(_w, _h);
    return _p_wnd;
}

void dress_button(CDesktop *_p_desktop, CButton *_p_button) {
    dress(_p_desktop, _p_button,
          {{MAT_NAME_NORMAL, "button_normal"},
           {MAT_NAME_HIGHLIGHTED, "button_highlighted"},
           {MAT_NAME_PUSHED, "button_pushed"},
           {MAT_NAME_DISABLED, "button_disabled"}});
}

CButton *make_button(CDesktop *_p_desktop, CWindow *_p_parent, char const *_name, char const *_caption,
                     int _x, int _y) {
    CButton *p_button = place(_p_parent, new CButton(_p_desktop, _name), _x, _y, 110, 30);
    dress_button(_p_desktop, p_button);
    p_button->m_text = CString(_caption);
    return p_button;
}

// A check box or a radio button of the given picture set ("checker" or "radio") with its label
// beside it as a static text, so that a layout keeps the label.
template <class TChecker>
TChecker *make_checker(CDesktop *_p_desktop, CWindowVisual *_p_parent, char const *_name, char const *_label,
                       char const *_pictures, int _x, int _y) {
    TChecker *p_checker = place(_p_parent, new TChecker(_p_desktop, _name), _x, _y, 18, 20);
    std::string const set = _pictures;
    std::string const on = set + "_on", off = set + "_off", on_disabled = set + "_on_disabled",
                      off_disabled = set + "_off_disabled", highlighted = set + "_highlighted";
    dress(_p_desktop, p_checker,
          {{MAT_NAME_CHECKER_ON, on.c_str()},
           {MAT_NAME_CHECKER_OFF, off.c_str()},
           {MAT_NAME_CHECKER_ON_DISABLED, on_disabled.c_str()},
           {MAT_NAME_CHECKER_OFF_DISABLED, off_disabled.c_str()},
           {MAT_NAME_HIGHLIGHTED, highlighted.c_str()}});
    _p_parent->make_static_text(CString(_label), CRectArea(_x + 22, _y + 1, 100, 20),
                                (std::string(_name) + " label").c_str());
    return p_checker;
}

// The desktop's pictures for the step buttons and scrollers of the scroll bars and selectors made
// by code.
void dress_desktop_for_step_buttons(CDesktop *_p_desktop) {
    dress(_p_desktop, _p_desktop,
          {{MAT_NAME_BUTTON_UP, "arrow_up"},
           {MAT_NAME_BUTTON_UP_HIGHLIGHTED, "arrow_up_highlighted"},
           {MAT_NAME_BUTTON_UP_PUSHED, "arrow_up_pushed"},
           {MAT_NAME_BUTTON_DOWN, "arrow_down"},
           {MAT_NAME_BUTTON_DOWN_HIGHLIGHTED, "arrow_down_highlighted"},
           {MAT_NAME_BUTTON_DOWN_PUSHED, "arrow_down_pushed"},
           {MAT_NAME_BUTTON_LEFT, "arrow_left"},
           {MAT_NAME_BUTTON_LEFT_HIGHLIGHTED, "arrow_left_highlighted"},
           {MAT_NAME_BUTTON_LEFT_PUSHED, "arrow_left_pushed"},
           {MAT_NAME_BUTTON_RIGHT, "arrow_right"},
           {MAT_NAME_BUTTON_RIGHT_HIGHLIGHTED, "arrow_right_highlighted"},
           {MAT_NAME_BUTTON_RIGHT_PUSHED, "arrow_right_pushed"},
           {MAT_NAME_BUTTON_SCROLLER, "scroller"},
           {MAT_NAME_BUTTON_SCROLLER_HIGHLIGHTED, "scroller_highlighted"},
           {MAT_NAME_BUTTON_SCROLLER_PUSHED, "scroller_pushed"}});
}

// A dialog-like window: a title bar to drag it by, over a body of the given size.
CWindowVisual *make_dialog(CDesktop *_p_desktop, char const *_name, char const *_title, int _x, int _y,
                           int _w, int _h) {
    CWindowVisual *p_dialog = place(_p_desktop, new CWindowVisual(_p_desktop, _name), _x, _y, _w, _h);
    p_dialog->set_can_drag(true);
    p_dialog->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "panel"));
    CWindowVisual *p_title = place(p_dialog, new CWindowVisual(_p_desktop, "title bar"), 0, 0, _w, 26);
    p_title->set_passive(true);
    p_title->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "title_bar"));
    place(p_title, new CDemoText(_p_desktop, "title", _title), 10, 4, _w - 20, 20);
    return p_dialog;
}

// Text and two buttons.
void make_message_dialog(CDesktop *_p_desktop, char const *_name, char const *_title, int _x, int _y) {
    CWindowVisual *p_dialog = make_dialog(_p_desktop, _name, _title, _x, _y, 360, 200);
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

// A dialog's buttons in the scene's button look, 110 by 30, on a bottom margin of 20.
void dress_dialog_buttons(CDesktop *_p_desktop, CDialog *_p_dialog) {
    _p_dialog->set_button_size(110, 30);
    _p_dialog->set_bottom_margin(20);
    for (unsigned i = 0; i < _p_dialog->get_buttons_count(); ++i)
        dress_button(_p_desktop, _p_dialog->get_button(i));
}

// A modal message box in the middle of the desktop: a click on "Yes" or "No" writes the answer into
// _p_answer and the log, and closes the box, which deletes itself when it has faded out.
void ask(CDesktop *_p_desktop, CStaticText *_p_answer) {
    CMessageBox *p_box = new CMessageBox(_p_desktop, "question");
    // Placed as a plain window: GCC folds the identical instantiations of place and then warns of
    // the largest class's size against the smaller objects of the others.
    place<CWindow>(_p_desktop, p_box, _p_desktop->get_w() / 2 - 180, _p_desktop->get_h() / 2 - 80, 360, 160);
    // The box comes and goes, so its colour is its own rather than a preset's that an export of the
    // scene without it would leave out.
    p_box->add_material(MAT_NAME_NORMAL, create_color_material(_p_desktop, rgba_t(48, 40, 72, 245)));
    p_box->set_uniform_margins(8);
    p_box->set_caption_h(30);
    p_box->set_caption(CString("Question"));
    p_box->set_caption_alignment(ALIGNMENT_CENTER);
    p_box->set_message_text(CString("Do you like the demo?"));
    p_box->set_auto_delete(true);
    for (char const *p_choice : {"Yes", "No"})
        p_box->add_button(CString(p_choice))
            ->register_callback(EVENT_CLICK, CEventCallback([p_box, _p_answer, p_choice](CWndEvent const *) {
                                    _p_answer->set_text(
                                        CString((std::string("Answer: ") + p_choice).c_str()));
                                    if (ILogger *p_logger = demo_logger())
                                        p_logger->write((std::string("answer ") + p_choice).c_str(), 0);
                                    p_box->send_event(p_box, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
                                }));
    dress_dialog_buttons(_p_desktop, p_box);
    _p_desktop->set_active_window(p_box);
}

// A dialog of the library, framed by its borders, by which it can be resized; its button "Ask"
// opens a message box, and the answer stands below the text.
void make_question_dialog(CDesktop *_p_desktop, char const *_name, char const *_caption, int _x, int _y) {
    CDialog *p_dialog = place(_p_desktop, new CDialog(_p_desktop, _name), _x, _y, 360, 200);
    p_dialog->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "framed_panel"));
    for (char const *p_edge : {"border left", "border right", "border top", "border bottom"})
        if (CBorder *p_border = class_cast<CBorder>(p_dialog->get_child(p_edge, "Border", true)))
            p_border->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "title_bar"));
    p_dialog->set_left_margin(16);
    p_dialog->set_top_margin(8);
    p_dialog->set_caption_h(30);
    p_dialog->set_caption(CString(_caption));
    place(p_dialog, new CDemoText(_p_desktop, "line 1", "Drag my frame to resize me."), 16, 44, 330, 20);
    CStaticText *p_answer =
        p_dialog->make_static_text(CString("Not asked yet."), CRectArea(16, 70, 330, 20), "answer");
    p_dialog->add_button(CString("Ask"))
        ->register_callback(EVENT_CLICK, CEventCallback([_p_desktop, p_answer](CWndEvent const *) {
                                ask(_p_desktop, p_answer);
                            }));
    dress_dialog_buttons(_p_desktop, p_dialog);
}

// A scroll bar made by code has parts of no size: square step buttons as thick as the bar and a
// scroller _length long.
void size_parts(CScrollBar *_p_bar, int _length) {
    for (CButton *p_button : {_p_bar->get_button_min(), _p_bar->get_button_max()})
        p_button->set_size(16, 16);
    if (_p_bar->get_horizontal())
        _p_bar->get_button_scroller()->set_size(_length, 16);
    else
        _p_bar->get_button_scroller()->set_size(16, _length);
    _p_bar->set_scroller_for_position();
}

// The everyday controls: a check box, a radio group, a scroll bar with its value, a progress bar
// and an edit box. (An edit box saves neither its text nor whether it has a scroll bar, so the
// scene keeps to what its layout brings back.)
void make_controls_dialog(CDesktop *_p_desktop, int _x, int _y) {
    CWindowVisual *p_dialog = make_dialog(_p_desktop, "controls", "Controls", _x, _y, 420, 330);
    make_checker<CCheckBox>(_p_desktop, p_dialog, "subtitles", "Subtitles", "checker", 16, 40);

    CWindowVisual *p_group = place(p_dialog, new CWindowVisual(_p_desktop, "difficulty"), 16, 70, 390, 22);
    p_group->set_passive(true);
    char const *const levels[][2] = {{"easy", "Easy"}, {"normal", "Normal"}, {"hard", "Hard"}};
    for (int i = 0; i < 3; ++i) {
        CRadioButton *p_radio =
            make_checker<CRadioButton>(_p_desktop, p_group, levels[i][0], levels[i][1], "radio", i * 120, 0);
        p_radio->set_checked(i == 1);
    }

    p_dialog->make_static_text(CString("Volume"), CRectArea(16, 104, 70, 20), "volume label");
    CScrollBar *p_volume = place(p_dialog, new CScrollBar(_p_desktop, "volume"), 90, 106, 310, 16);
    p_volume->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "bar_track"));
    dress(_p_desktop, p_volume->get_button_min(),
          {{MAT_NAME_NORMAL, "arrow_left"},
           {MAT_NAME_HIGHLIGHTED, "arrow_left_highlighted"},
           {MAT_NAME_PUSHED, "arrow_left_pushed"}});
    dress(_p_desktop, p_volume->get_button_max(),
          {{MAT_NAME_NORMAL, "arrow_right"},
           {MAT_NAME_HIGHLIGHTED, "arrow_right_highlighted"},
           {MAT_NAME_PUSHED, "arrow_right_pushed"}});
    size_parts(p_volume, 40);
    p_volume->set_max(100);
    p_volume->set_position(70);

    p_dialog->make_static_text(CString("Loading"), CRectArea(16, 134, 70, 20), "loading label");
    CProgressBar *p_loading = place(p_dialog, new CProgressBar(_p_desktop, "loading"), 90, 138, 310, 12);
    p_loading->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "bar_track"));
    p_loading->add_material(MAT_NAME_PROGRESS, preset(_p_desktop, "progress"));
    p_loading->set_position(60);

    CEditBox *p_notes = place(p_dialog, new CEditBox(_p_desktop, "notes"), 16, 166, 388, 110);
    p_notes->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "text_field"));
    p_notes->set_uniform_margins(4);
    p_notes->get_caret()->add_material(MAT_NAME_CHECKED, preset(_p_desktop, "caret"));

    make_button(_p_desktop, p_dialog, "apply", "Apply", 294, 288);
}

// A row of one text per column, with an icon when given.
CItem *row(std::initializer_list<char const *> _texts, CMaterial *_p_icon) {
    qor_vector<CText> texts;
    for (char const *p_text : _texts)
        texts.emplace_back(CString(p_text));
    return new CItem(std::move(texts), _p_icon);
}

// The look of a list: its body, the row under the pointer and the chosen row.
void dress_list(CDesktop *_p_desktop, CListBox *_p_list) {
    _p_list->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "text_field"));
    _p_list->add_material(MAT_NAME_SELECTION, preset(_p_desktop, "row_under_pointer"));
    _p_list->add_material(MAT_NAME_CHECKED, preset(_p_desktop, "row_chosen"));
    _p_list->add_material(MAT_NAME_LISTBOX_HEADER, preset(_p_desktop, "bar_track"));
}

// A tabbed options screen: "Video" holds a list of display modes in three columns with icons,
// "Game" a selector of the language and a drop-down of the difficulty.
void make_options_dialog(CDesktop *_p_desktop, int _x, int _y) {
    CWindowVisual *p_dialog = make_dialog(_p_desktop, "options", "Options", _x, _y, 440, 300);
    CPageControl *p_pages = place(p_dialog, new CPageControl(_p_desktop, "pages"), 10, 34, 420, 256);
    p_pages->set_tab_size(90, 26);
    CWindowVisual *p_video = p_pages->add_page("Video");
    CWindowVisual *p_game = p_pages->add_page("Game");
    for (char const *p_tab : {"Video", "Game"})
        if (CButton *p_button = class_cast<CButton>(p_pages->get_child(p_tab, "Button", true)))
            dress(_p_desktop, p_button,
                  {{MAT_NAME_NORMAL, "button_normal"},
                   {MAT_NAME_HIGHLIGHTED, "button_highlighted"},
                   {MAT_NAME_PUSHED, "button_pushed"},
                   {MAT_NAME_CHECKED, "button_checked"}});

    CListBox *p_modes = place(p_video, new CListBox(_p_desktop, "modes"), 0, 0, 420, 222);
    dress_list(_p_desktop, p_modes);
    char const *const titles[] = {"Resolution", "Rate", "Aspect"};
    int const widths[] = {170, 100, 100};
    for (unsigned i = 0; i < 3; ++i) {
        p_modes->add_column();
        p_modes->set_column_w(i, widths[i]);
        p_modes->set_column_title(i, CString(titles[i]));
    }
    p_modes->set_columns_h(22);
    p_modes->set_item_height(24);
    p_modes->show_columns(true);
    int const sizes[][2] = {{640, 480},   {800, 600},  {1024, 768},  {1280, 720},
                            {1280, 1024}, {1600, 900}, {1920, 1080}, {2560, 1440}};
    for (auto const &size : sizes) {
        for (char const *p_rate : {"60 Hz", "75 Hz", "120 Hz"}) {
            bool const wide = size[0] * 9 == size[1] * 16;
            char const *p_aspect = wide ? "16:9" : size[0] * 4 == size[1] * 5 ? "5:4" : "4:3";
            std::string const resolution = std::to_string(size[0]) + " x " + std::to_string(size[1]);
            p_modes->get_items().add(row({resolution.c_str(), p_rate, p_aspect},
                                         preset(_p_desktop, wide ? "radio_on" : "checker_on")));
        }
    }
    if (CScrollBar *p_bar = p_modes->get_scroll_bar_vert()) {
        p_bar->set_w(16);
        p_bar->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "bar_track"));
        size_parts(p_bar, 30);
    }
    p_modes->send_event(p_modes, EVENT_RESIZED, CWndEvent::DISPATCH_NONE);

    p_game->make_static_text(CString("Language"), CRectArea(0, 8, 110, 20), "language label");
    CSelectorBox *p_language = place(p_game, new CSelectorBox(_p_desktop, "language"), 120, 6, 220, 24);
    p_language->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "text_field"));
    for (char const *p_language_name : {"English", "Deutsch",
                                        "Fran\xC3\xA7"
                                        "ais",
                                        "\xD0\xA0\xD1\x83\xD1\x81\xD1\x81\xD0\xBA\xD0\xB8\xD0\xB9"})
        p_language->get_items().add(row({p_language_name}, nullptr));
    p_language->get_items().select(0);

    p_game->make_static_text(CString("Difficulty"), CRectArea(0, 48, 110, 20), "difficulty label");
    CDropDownList *p_level = place(p_game, new CDropDownList(_p_desktop, "level"), 120, 46, 220, 24);
    p_level->add_material(MAT_NAME_NORMAL, preset(_p_desktop, "text_field"));
    dress_list(_p_desktop, p_level->get_list_box());
    p_level->get_list_box()->set_item_height(22);
    for (char const *p_level_name : {"Story", "Easy", "Normal", "Hard", "Nightmare"})
        p_level->get_items().add(row({p_level_name}, nullptr));
    p_level->check(2);
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

// The console, closed until its key opens it, where the configuration keeps it: as the import of
// a game's layout would place it.
void place_console(IUserInterface *_p_ui) {
    IConsole *p_console = _p_ui->get_console();
    IConfigSection *p_section = qorbase::find_config_section("ui");
    if (!p_console || !p_section) return;
    IConfigValue *p_pos = p_section->get_value("console_pos", false);
    IConfigValue *p_size = p_section->get_value("console_size", false);
    vec2_t const pos = p_pos ? p_pos->get_vec2(20.0f, 30.0f) : vec2_t{20.0f, 30.0f};
    vec2_t const size = p_size ? p_size->get_vec2(400.0f, 500.0f) : vec2_t{400.0f, 500.0f};
    p_console->get_console()->set_pos(static_cast<int>(pos.x), static_cast<int>(pos.y));
    p_console->get_console()->set_size(static_cast<int>(size.x), static_cast<int>(size.y));
}

void cmd_gameui_demo_scene(char const *, void *) {
    IUserInterface *p_ui =
        static_cast<IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
    CDesktop *p_desktop = p_ui ? p_ui->get_desktop() : nullptr;
    if (!p_desktop) return;
    lua_machine().DoFile(qorbase::FILE_CATEGORY_UI, "ui_material_presets.lua");
    p_desktop->add_material(MAT_NAME_NORMAL, background(p_desktop));
    CWindowVisual *p_bar = place(p_desktop, new CWindowVisual(p_desktop, "top bar"), 0, 0, 1024, 36);
    p_bar->set_alignment(ALIGNMENT_TOP);
    p_bar->add_material(MAT_NAME_NORMAL, preset(p_desktop, "top_bar"));
    place(p_bar, new CDemoText(p_desktop, "heading", "qorui - demo scene"), 16, 8, 400, 20);
    dress_desktop_for_step_buttons(p_desktop);
    make_message_dialog(p_desktop, "dialog", "A dialog you can drag", 120, 120);
    make_question_dialog(p_desktop, "second dialog",
                         "\xD0\x92\xD1\x82\xD0\xBE\xD1\x80\xD0\xBE\xD0\xB5 \xD0\xBE\xD0\xBA\xD0\xBD\xD0\xBE",
                         120, 420);
    make_controls_dialog(p_desktop, 540, 80);
    make_options_dialog(p_desktop, 540, 430);
    place_console(p_ui);
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
        gameui_demo::register_thread_strip_commands(_p_server, p_commands);
    }
    return 1;
}
