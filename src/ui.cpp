// The user-interface service.
//
//   RegisterInterface   the library's entry point
//   construction
//   lifecycle           init (and its steps), update, draw, shutdown
//   input               the listeners
//   stats pages
//   configuration       config_string
#include "ui.h"

#include "engine_interfaces.h"
#include "qor_commands.h"
#include "qor_render.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qor_level.h"
#include "tokenizer.h"
#include "ui_debug.h"
#include "ui_logger.h"
#include "ui_text.h"
#include "ui_console.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"
#include "ui_stats_page.h"
#include "ui_time_profiler.h"

#include <cstdio>
#include <cstring>

namespace qorui {

namespace {

// The console key, and the two characters that it types.
unsigned const k_console_key = 0xC0;
unsigned const k_console_char = 0x60;
unsigned const k_console_char_shifted = 0x7E;

char const k_default_plaque[] = "ui_init_plaque.tga";
char const k_no_library[] = "no_lib";
char const k_default_cursor[] = "kursor.tga";
char const k_default_background[] = "_back.tga";

// The first token of a command's arguments, quotes allowing blanks; false when there is none.
bool first_token(char const *_arguments, string &_token) {
    CTokenizerRules rules(_arguments, static_cast<unsigned>(std::strlen(_arguments)), default_separators());
    try {
        CTokenizer tokenizer(rules, 7, 0);
        _token = tokenizer.get_token();
        return true;
    } catch (char const *) {
        return false;
    }
}

// A command whose argument is a file name: the service's work on the first token, or the
// command's use when there is none.
void run_with_file(char const *_arguments, void *_user, char const *_command,
                   void (CUserInterface::*_work)(char const *)) {
    if (!_user || !_arguments) return;
    string file;
    if (!first_token(_arguments, file)) {
        qordebug::warning("Use of command '%s':\n%s [filename]", _command, _command);
        return;
    }
    (static_cast<CUserInterface *>(_user)->*_work)(file.c_str());
}

void cmd_ui_export(char const *_arguments, void *_user) {
    run_with_file(_arguments, _user, "ui_export", &CUserInterface::export_layout);
}

void cmd_ui_import(char const *_arguments, void *_user) {
    run_with_file(_arguments, _user, "ui_import", &CUserInterface::import_layout);
}

void cmd_print_stats_page(char const *, void *_user) {
    if (!_user) return;
    static_cast<CUserInterface *>(_user)->print_stats_page();
}

struct SCommand {
    char const *mp_name;
    command_callback_t mp_callback;
};
SCommand const k_commands[] = {
    {"ui_export", cmd_ui_export},
    {"ui_import", cmd_ui_import},
    {"print_stats_page", cmd_print_stats_page},
};

} // namespace

// ---------------------------------------------------------------------------------------------
// RegisterInterface
// ---------------------------------------------------------------------------------------------
} // namespace qorui

// Builds the time profiler and the service at the first call and registers both on the server;
// a later call registers the same two objects again. The service does its work at init.
extern "C" __attribute__((visibility("default"))) int RegisterInterface(IInterfaceServer *_p_server) {
    using namespace qorui;
    if (!QOR_CHECK(_p_server)) return -1;
    static CTimeProfiler s_time_profiler;
    _p_server->register_interface(&s_time_profiler);
    static CUserInterface s_user_interface;
    s_user_interface.set_server(_p_server);
    return _p_server->register_interface(&s_user_interface);
}

namespace qorui {

// ---------------------------------------------------------------------------------------------
// Construction
// ---------------------------------------------------------------------------------------------

// Touches neither the engine nor the server.
CUserInterface::CUserInterface()
    : mp_server(nullptr), mp_desktop(nullptr), mp_console(nullptr), mp_reserved(nullptr), mp_ui_page(nullptr),
      mp_build_version_page(nullptr), m_scr_w(0), m_scr_h(0), m_hide_console(false) {}

// The pages go from the last to the first.
CUserInterface::~CUserInterface() {
    while (!m_stats_pages.empty()) {
        delete m_stats_pages.back();
        m_stats_pages.pop_back();
    }
    delete mp_desktop;
}

// ---------------------------------------------------------------------------------------------
// Lifecycle
// ---------------------------------------------------------------------------------------------

// The order is settled: each step relies on the ones before it.
void CUserInterface::init(bool _hide_console) {
    engine_interfaces().set_server(mp_server);
    draw_plaque();
    m_hide_console = _hide_console;
    engine_interfaces().get_time_profiler(true)->enable();
    read_screen_size();
    load_game_library();

    IInputSystem *p_input = engine_interfaces().get_input_system(true);
    if (p_input) {
        p_input->add_pointer_listener(this);
        p_input->add_key_listener(this);
    }
    load_local_strings();
    init_desktop();
    init_console();
    register_commands();
    register_event_names();
}

// The desktop of 1024 by 768 pixels, whatever the screen's size, with its default fonts and the
// pointer with the cursor's picture.
void CUserInterface::init_desktop() {
    get_fonts_factory().init();
    m_render.init(engine_interfaces().get_render(true));
    if (!QOR_CHECK(mp_desktop == NULL)) return;
    mp_desktop = new CDesktop(&m_render, 1024, 768, "desktop");
    mp_desktop->send_event(mp_desktop, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    mp_desktop->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("arial_white", mp_desktop));
    mp_desktop->add_font(FNT_NAME_FIXED, get_fonts_factory().create("courier", mp_desktop));

    char const *cursor = config_string("ui", "cursor", k_default_cursor, true);
    CPointer &pointer = mp_desktop->get_pointer();
    pointer.set_size(32, 32);
    CMaterial *p_material = mp_desktop->create_material();
    if (p_material) p_material->init("ui_image", cursor, nullptr, nullptr, nullptr, nullptr, true, false);
    pointer.add_material(MAT_NAME_NORMAL, p_material);
    pointer.set_hotspot(point_t{3, 3});
}

// The console, a child of the desktop: hidden when init was asked to, otherwise the active window.
void CUserInterface::init_console() {
    if (!mp_desktop || mp_console) return;
    mp_console = new CConsole(mp_desktop, "console");
    mp_desktop->attach_child(mp_console);
    if (m_hide_console)
        mp_desktop->send_event(mp_console, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
    else
        mp_desktop->set_active_window(mp_console);
    mp_console->set_caption(CString("Console"));
}

// The names that layouts may give events, for the sounds of windows.
void CUserInterface::register_event_names() {
    static struct {
        char const *mp_name;
        EEventType m_id;
    } const names[] = {
        {"EVENT_SHOW", EVENT_SHOW},
        {"EVENT_CHANGED", EVENT_CHANGED},
        {"EVENT_CLICK", EVENT_CLICK},
        {"EVENT_POINTER_ENTER", EVENT_POINTER_ENTER},
        {"EVENT_CHECKED", EVENT_CHECKED},
        {"EVENT_UNCHECKED", EVENT_UNCHECKED},
        {"EVENT_HIGHLIGHTED", EVENT_HIGHLIGHTED},
    };
    for (auto const &name : names)
        CWndEvent::register_event_name(name.mp_name, name.m_id);
}

// The start-up plaque goes straight to the renderer, full screen, and is presented at once:
// nothing else of the library is there to draw yet.
void CUserInterface::draw_plaque() {
    char const *name = config_string("ui", "init_plaque", k_default_plaque, true);

    IRenderQOR *p_render = engine_interfaces().get_render(true);
    if (!p_render) return;
    int const material =
        p_render->create_material("ui_image", name, nullptr, nullptr, nullptr, nullptr, true, false);
    p_render->begin_2d();
    p_render->set_material(material);
    rgba_t const white(255, 255, 255, 255);
    p_render->draw_quad(vec2_t{-1.0f, 1.0f}, vec2_t{0.0f, 0.0f}, white, vec2_t{-1.0f, -1.0f},
                        vec2_t{0.0f, 1.0f}, white, vec2_t{1.0f, -1.0f}, vec2_t{1.0f, 1.0f}, white,
                        vec2_t{1.0f, 1.0f}, vec2_t{1.0f, 0.0f}, white);
    p_render->end_2d();
    p_render->present();
    p_render->destroy_material(material);
}

void CUserInterface::read_screen_size() {
    IVarManagerBase *p_vars = engine_interfaces().get_var_manager(true);
    if (!p_vars) return;
    SVariable const *p_w = p_vars->find_var("scr_resx");
    SVariable const *p_h = p_vars->find_var("scr_resy");
    m_scr_w = p_w ? p_w->m_int_value : 0;
    m_scr_h = p_h ? p_h->m_int_value : 0;
}

void CUserInterface::load_game_library() {
    char const *name = config_string("ui_libraries", "gameui_library", k_no_library, true);
    if (strcmp(name, k_no_library) == 0) {
        qordebug::error(
            "GameUI library name is not specified.\nPlease, specify parameter '%s' in '[%s]' section "
            "of GDF file",
            "gameui_library", "ui_libraries");
        return;
    }
    if (mp_server) mp_server->load_module(1, name);
}

void CUserInterface::register_commands() {
    ICmdManagerBase *p_commands = engine_interfaces().get_cmd_manager(true);
    if (!p_commands) return;
    for (SCommand const &command : k_commands)
        p_commands->register_command(command.mp_name, command.mp_callback, this);
}

void CUserInterface::unregister_commands() {
    ICmdManagerBase *p_commands = engine_interfaces().get_cmd_manager(true);
    if (!p_commands) return;
    for (SCommand const &command : k_commands)
        p_commands->unregister_command(command.mp_name);
}

// The first of the two calls of a frame. The "ui" page is made at the first update; when it is
// shown it gets the desktop's figures.
void CUserInterface::update(int _time) {
    if (mp_desktop) mp_desktop->update(_time);
    if (!mp_ui_page) mp_ui_page = create_stats_page("ui");
    if (mp_ui_page->is_show() && mp_desktop) mp_desktop->show_stats(mp_ui_page, 0);
}

// The second call of a frame: the desktop draws the whole tree. Without a desktop, nothing.
void CUserInterface::draw() {
    if (!mp_desktop) return;
    mp_desktop->draw();
    draw_build_version();
}

// The console's geometry goes to the configuration; then the desktop goes, and every window with
// it, the console too; then the listeners and the commands.
void CUserInterface::shutdown() {
    if (mp_console) {
        if (IConfigValue *p_pos = console_config("console_pos", "p_pos"))
            p_pos->set_vec2(static_cast<float>(mp_console->get_pos().x),
                            static_cast<float>(mp_console->get_pos().y));
        if (IConfigValue *p_size = console_config("console_size", "p_size"))
            p_size->set_vec2(static_cast<float>(mp_console->get_w()),
                             static_cast<float>(mp_console->get_h()));
    }
    delete mp_desktop;
    mp_desktop = nullptr;
    mp_console = nullptr;
    IInputSystem *p_input = engine_interfaces().get_input_system(true);
    if (p_input) {
        p_input->remove_pointer_listener(this);
        p_input->remove_key_listener(this);
    }
    unregister_commands();
}

IConsole *CUserInterface::get_console() {
    return mp_console;
}

void CUserInterface::on_app_activate(bool _active) {
    if (mp_desktop && !_active)
        mp_desktop->send_event(mp_desktop, EVENT_LOST_FOCUS, CWndEvent::DISPATCH_NONE);
}

// One screen pixel in desktop pixels.
float CUserInterface::get_scale_w() {
    return mp_desktop && m_scr_w ? static_cast<float>(mp_desktop->get_w()) / static_cast<float>(m_scr_w)
                                 : 1.0f;
}

float CUserInterface::get_scale_h() {
    return mp_desktop && m_scr_h ? static_cast<float>(mp_desktop->get_h()) / static_cast<float>(m_scr_h)
                                 : 1.0f;
}

// ---------------------------------------------------------------------------------------------
// Input: everything goes to the desktop, once there is one.
// ---------------------------------------------------------------------------------------------

void CUserInterface::on_button_down(unsigned _button) {
    if (mp_desktop) mp_desktop->on_pointer_down(_button);
}

void CUserInterface::on_button_up(unsigned _button) {
    if (mp_desktop) mp_desktop->on_pointer_up(_button);
}

void CUserInterface::on_pointer_move(vec2_t const &_movement) {
    if (mp_desktop) mp_desktop->on_pointer_move(_movement);
}

void CUserInterface::on_wheel(float _rotation) {
    if (mp_desktop) mp_desktop->on_wheel_rotated(_rotation);
}

// The desktop has the key first; then the console key toggles the console.
void CUserInterface::on_key_down(unsigned _key, unsigned _extra) {
    if (mp_desktop) mp_desktop->on_key_down(_key, _extra);
    if (_key == k_console_key && mp_desktop && mp_console) toggle_console();
}

// A console that is shown but not active is activated, not hidden.
void CUserInterface::toggle_console() {
    if (!mp_console->is_hidden() && mp_desktop->get_active_window() == mp_console) {
        mp_desktop->send_event(mp_console, EVENT_HIDE, CWndEvent::DISPATCH_NONE);
        return;
    }
    mp_desktop->send_event(mp_console, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    mp_desktop->set_active_window(mp_console);
}

void CUserInterface::on_key_up(unsigned _key) {
    if (mp_desktop) mp_desktop->on_key_up(_key);
}

// The console key's characters go no further.
void CUserInterface::on_char(unsigned _code) {
    if (_code == k_console_char || _code == k_console_char_shifted) return;
    if (mp_desktop) mp_desktop->on_char(_code);
}

// ---------------------------------------------------------------------------------------------
// Stats pages
// ---------------------------------------------------------------------------------------------

// A name that exists gives its page again.
IStatsPage *CUserInterface::create_stats_page(char const *_name) {
    if (IStatsPage *p_page = get_stats_page(_name)) return p_page;
    CStatsPage *p_page = new CStatsPage(this, _name);
    m_stats_pages.push_back(p_page);
    return p_page;
}

unsigned CUserInterface::get_stats_pages_count() {
    return static_cast<unsigned>(m_stats_pages.size());
}

IStatsPage *CUserInterface::get_stats_page(unsigned _idx) {
    return _idx < m_stats_pages.size() ? m_stats_pages[_idx] : nullptr;
}

// Exact, case-sensitive names; the first page of that name in creation order.
IStatsPage *CUserInterface::get_stats_page(char const *_name) {
    if (!_name) return nullptr;
    for (CStatsPage *p_page : m_stats_pages) {
        if (!QOR_CHECK(p_page)) continue;
        if (std::strcmp(p_page->get_name(), _name) == 0) return p_page;
    }
    return nullptr;
}

// The earliest page that is shown.
IStatsPage *CUserInterface::get_current_stats_page() {
    for (CStatsPage *p_page : m_stats_pages)
        if (p_page && p_page->is_show()) return p_page;
    return nullptr;
}

// ---------------------------------------------------------------------------------------------
// Configuration
// ---------------------------------------------------------------------------------------------

char const *CUserInterface::config_string(char const *_section, char const *_key, char const *_default,
                                          bool _required) {
    if (_required) QOR_CHECK_AS(qorbase::find_config_section(_section), "p_sect");
    return qorbase::get_config_string(_section, _key, _default);
}

// A key of the console's geometry in the section "ui", made when it is missing.
IConfigValue *CUserInterface::console_config(char const *_key, char const *_contract) {
    IConfigSection *p_sect = qorbase::find_config_section("ui");
    if (!QOR_CHECK_AS(p_sect, "p_sect")) return nullptr;
    IConfigValue *p_value = p_sect->get_value(_key, true);
    QOR_CHECK_AS(p_value, _contract);
    return p_value;
}

// ---------------------------------------------------------------------------------------------
// The commands' work
// ---------------------------------------------------------------------------------------------

void CUserInterface::export_layout(char const *_file) {
    if (mp_desktop) mp_desktop->export_layout(qorbase::FILE_CATEGORY_UI, _file);
}

// The layout, then the desktop's picture and the console's geometry from the configuration.
void CUserInterface::import_layout(char const *_file) {
    if (!mp_desktop) return;
    mp_desktop->import(qorbase::FILE_CATEGORY_UI, _file);
    char const *background = config_string("ui", "background", k_default_background, true);
    CMaterial *p_material = mp_desktop->create_material();
    if (p_material) p_material->init("ui_image", background, nullptr, nullptr, nullptr, nullptr, true, false);
    mp_desktop->add_material(MAT_NAME_NORMAL, p_material);
    if (!mp_console) return;
    if (IConfigValue *p_pos = console_config("console_pos", "p_pos")) {
        vec2_t const pos = p_pos->get_vec2(20.0f, 30.0f);
        mp_console->set_pos(trunc_to_int(pos.x), trunc_to_int(pos.y));
    }
    if (IConfigValue *p_size = console_config("console_size", "p_size")) {
        vec2_t const size = p_size->get_vec2(400.0f, 500.0f);
        mp_console->set_size(trunc_to_int(size.x), trunc_to_int(size.y));
    }
}

namespace {

// Lines up to the last one with text once its tags are gone.
unsigned page_length(CText const &_text) {
    unsigned length = _text.get_num_strings();
    for (; length > 0; --length) {
        CString const *p_line = _text.get_string(length - 1);
        if (!p_line) break;
        CString bare(*p_line);
        bare.remove_tags();
        if (!bare.empty()) break;
    }
    return length;
}

// The lowest free "stats_<page>_<level>_%04u.txt" of the output category; "$$$" if none is.
string dump_file_name(char const *_page) {
    string name = "$$$";
    IFileSystem *p_files = GetFileSystem();
    ILevelDescription *p_level = engine_interfaces().get_level_description(false);
    for (unsigned i = 0; p_files && i < 100000; ++i) {
        SLevelDescription description = {nullptr, nullptr, nullptr, nullptr};
        if (p_level) p_level->get_description(description);
        char buffer[260];
        std::snprintf(buffer, sizeof buffer, "stats_%s_%s_%04u.txt", _page,
                      description.mp_name ? description.mp_name : "", i);
        if (p_files->load_file(qorbase::FILE_CATEGORY_STATS, buffer, nullptr, true) == 0) {
            name = buffer;
            break;
        }
    }
    return name;
}

} // namespace

// The page in view, without its tags, to the log and to the lowest free numbered file.
void CUserInterface::print_stats_page() {
    IStatsPage *p_current = get_current_stats_page();
    if (!p_current) {
        ui_logger().log_message("No current stats page");
        return;
    }
    CStatsPage *p_page = static_cast<CStatsPage *>(p_current);
    CText const &text = p_page->get_text();
    unsigned const length = page_length(text);
    string const file = dump_file_name(p_page->get_name());
    char const *const dashes = "---------------------------------------------------------------";
    ui_logger().log_message("%s", dashes);
    ui_logger().log_message("Stats page: '%s'", p_page->get_name());
    ui_logger().log_message("Out file: '%s'", file.c_str());
    ui_logger().log_message("%s", dashes);
    string dump;
    for (unsigned i = 0; i < length; ++i) {
        CString const *p_line = text.get_string(i);
        if (!QOR_CHECK_AS(p_line, "text.get_string(i)")) continue;
        CString bare(*p_line);
        bare.remove_tags();
        string const narrow = bare.length() < 256 ? bare.get_str_c() : CString(bare, 255).get_str_c();
        ui_logger().log_message("%s", narrow.c_str());
        dump += narrow;
        dump += '\n';
    }
    ui_logger().log_message("%s", dashes);
    if (IFileSystem *p_files = GetFileSystem())
        p_files->save_file(qorbase::FILE_CATEGORY_STATS, file.c_str(), dump.data(),
                           static_cast<unsigned>(dump.size()), 0);
    qor_check_memory_corrupt();
}

} // namespace qorui
