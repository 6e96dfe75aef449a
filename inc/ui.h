// The user-interface service: the one object the engine talks to. It owns the desktop and the
// stats pages, receives the engine's input through two listeners and forwards it to the desktop,
// keeps the console key for itself, and draws the start-up plaque.
//
//   construction        RegisterInterface makes one static CUserInterface
//   lifecycle           init, update, draw, shutdown
//   input               the pointer and key listeners
//   stats pages         create_stats_page and the getters
#pragma once
#include "qor_memory.h"
#include "ui_interfaces.h"
#include "ui_render.h"
#include "ui_string.h"

#include "qor_input.h"

class IConfigValue;

namespace qorui {

class CStatsPage;

// The user-interface service: owns the desktop and the stats pages and forwards the engine's input.
class CUserInterface : public IUserInterface, public IPointerListener, public IKeyListener {
public:
    // Sets the fields only; the engine and the server are untouched until init.
    CUserInterface();
    // Deletes the stats pages, last first, and the desktop if shutdown didn't.
    virtual ~CUserInterface();
    CUserInterface(CUserInterface const &) = delete;
    CUserInterface &operator=(CUserInterface const &) = delete;

    // qor_uid::USER_INTERFACE, version 1.
    // @{
    SInterfaceUID get_uid() const override { return qor_uid::USER_INTERFACE; }
    int get_version() const override { return 1; }
    // @}

    // Lifecycle

    void init(bool _hide_console) override;
    void shutdown() override;
    void update(int _time) override;
    void draw() override;

    IConsole *get_console() override;
    CDesktop *get_desktop() override { return mp_desktop; }
    void on_app_activate(bool _active) override;
    unsigned short const *get_local_string(char const *_key) override;
    char const *get_local_key(unsigned short const *_text) override;
    // The desktop's size over the screen's; 1.0 without a desktop.
    float get_scale_w() override;
    float get_scale_h() override;
    bool get_hide_console() override { return m_hide_console; }
    void *get_reserved() override { return mp_reserved; }

    // Stats pages

    IStatsPage *create_stats_page(char const *_name) override;
    unsigned get_stats_pages_count() override;
    IStatsPage *get_stats_page(unsigned _idx) override;
    IStatsPage *get_stats_page(char const *_name) override;
    IStatsPage *get_current_stats_page() override;

    // Input from the engine

    // Forwarded to the desktop, when there is one.
    // @{
    void on_button_down(unsigned _button) override;
    void on_button_up(unsigned _button) override;
    void on_pointer_move(vec2_t const &_movement) override;
    void on_wheel(float _rotation) override;
    // @}
    // Forwarded to the desktop; then the key 0xC0 hides the console when it is the active
    // window, and otherwise shows and activates it.
    void on_key_down(unsigned _key, unsigned _extra) override;
    // Forwarded to the desktop, when there is one.
    void on_key_up(unsigned _key) override;
    // Forwarded to the desktop, except 0x60 and 0x7E, the characters of the console key.
    void on_char(unsigned _code) override;

    // The work of the commands "ui_export", "ui_import" and "print_stats_page".

    // Saves the desktop's tree to the layout file (category 16); nothing without a desktop.
    void export_layout(char const *_file);
    // Loads the layout file into the desktop's tree, then gives the desktop its background
    // picture and the console its saved position and size from the configuration.
    void import_layout(char const *_file);
    // Logs the current stats page without its colour tags and writes it to the dump file
    // "stats_<page>_<level>_<nnnn>.txt"; only a log line when no page is shown.
    void print_stats_page();

    // The screen size read at init, in real pixels.
    // @{
    int get_screen_w() const { return m_scr_w; }
    int get_screen_h() const { return m_scr_h; }
    // @}

    // The engine's server, handed in by RegisterInterface; init gives it to the cache of
    // interfaces.
    void set_server(IInterfaceServer *_p_server) { mp_server = _p_server; }

private:
    // A string of the engine's configuration, _default without it; a _required section that is
    // missing breaks a contract.
    static char const *config_string(char const *_section, char const *_key, char const *_default,
                                     bool _required);
    // A key of the console's geometry in the section "ui"; _contract names it in the report when
    // it can't be had.
    static IConfigValue *console_config(char const *_key, char const *_contract);
    void draw_plaque();
    void read_screen_size();
    void load_game_library();
    void load_local_strings();
    void init_desktop();
    void init_console();
    void toggle_console();
    void register_commands();
    void register_event_names();
    void unregister_commands();
    void draw_build_version();

    IInterfaceServer *mp_server;              // the engine's, not owned
    CRender m_render;                         // the desktop's bridge to the engine's renderer
    CDesktop *mp_desktop;                     // owned
    CConsole *mp_console;                     // a child of the desktop, owned by the window tree
    void *mp_reserved;                        // only the constructor writes it
    qor_vector<CStatsPage *> m_stats_pages;   // in order of creation; owned
    IStatsPage *mp_ui_page;                   // the desktop's figures, made at the first update
    CStatsPage *mp_build_version_page;        // made at the first drawn frame; one of m_stats_pages
    qor_map<string, CString> m_local_strings; // local strings by key
    int m_scr_w;                              // "scr_resx" at init
    int m_scr_h;                              // "scr_resy" at init
    bool m_hide_console;                      // the argument of init
};

} // namespace qorui
