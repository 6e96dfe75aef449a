// The shared harness of the fuzz targets: folders, desktop, host, Lua bounds and report policy.
#include "fuzz_world.h"

#include "engine_interfaces.h"
#include "qor_platform.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "software_renderer.h"
#include "ui_font.h"
#include "ui_render.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <fstream>
#include <lua.hpp>
#include <luajit.h>

using namespace qorui;
namespace fs = std::filesystem;

namespace qorfuzz {

namespace {

std::string const k_source_data = QOR_SOURCE_DIR "/data";

// The contracts that data breaks by design: a layout meant for another window (the root's name
// and class), and a static text or dialog drawn without a font after a layout named one that the
// factory couldn't make (the factory has warned, the entry holds null, the window draws no text).
bool is_expected_contract(char const *_text) {
    return std::strstr(_text, "GetByName(\"name\").GetString(), get_name()") ||
           std::strstr(_text, "GetByName(\"class_name\").GetString(), get_class_id().GetName()") ||
           (std::strstr(_text, "Expression:   p_font, ") &&
            (std::strstr(_text, "ui_static_text.cpp") || std::strstr(_text, "ui_dialog.cpp")));
}

void on_report(qordebug::EReportKind _kind, char const *_text, void *) {
    if (_kind != qordebug::REPORT_ASSERT || is_expected_contract(_text ? _text : "")) return;
    std::fprintf(stderr, "contract broken by data:\n%s\n", _text ? _text : "");
    std::abort();
}

// A script runs at most this many Lua instructions: an endless loop is the script's error.
int const k_lua_instructions = 1000000;

void on_lua_count(lua_State *_l, lua_Debug *) {
    luaL_error(_l, "the script runs too long");
}

// Nothing of a fuzzed script reaches files, processes or the process's memory at large.
char const k_sandbox[] = "io = nil; os = nil; require = nil; package = nil; debug = nil; dofile = nil;"
                         " loadfile = nil; string.rep = nil; collectgarbage = nil; jit = nil;"
                         " fuzz_keep = {}; for k in pairs(_G) do fuzz_keep[k] = true end";
char const k_reset[] = "for k in pairs(_G) do if not fuzz_keep[k] then _G[k] = nil end end";

// The run's copy of the data: ui, the configuration and the build version copied, fonts and
// textures linked. Removed at the end of the process.
std::string make_run_dir() {
    std::string pattern = (fs::temp_directory_path() / "qorfuzz_XXXXXX").string();
    if (!mkdtemp(pattern.data())) std::abort();
    fs::copy(k_source_data + "/ui", pattern + "/ui");
    fs::copy(k_source_data + "/qor.gdf", pattern + "/qor.gdf");
    fs::copy(k_source_data + "/build_version.cfg", pattern + "/build_version.cfg");
    fs::create_directory_symlink(k_source_data + "/fonts", pattern + "/fonts");
    fs::create_directory_symlink(k_source_data + "/textures", pattern + "/textures");
    return pattern;
}

std::string const &run_dir() {
    static std::string const s_dir = make_run_dir();
    static bool const s_removed_at_exit = [] {
        std::atexit([] {
            std::error_code ignored;
            fs::remove_all(s_dir, ignored);
        });
        return true;
    }();
    (void)s_removed_at_exit;
    return s_dir;
}

struct SScreen {
    qorhost::CSoftwareRenderer m_renderer{160, 120};
    CRender m_render;
};

SScreen &screen() {
    static SScreen *sp_screen = [] {
        SScreen *p_screen = new SScreen; // lives to the end, as the library's statics do
        p_screen->m_renderer.set_texture_folders({run_dir() + "/textures", run_dir()});
        p_screen->m_render.init(&p_screen->m_renderer);
        p_screen->m_render.set_resolution(160, 120);
        return p_screen;
    }();
    return *sp_screen;
}

} // namespace

void init() {
    static bool const s_done = [] {
        qordebug::set_report_handler(on_report, nullptr);
        host(); // its server stands behind the library's engine interfaces
        engine_interfaces().set_server(&host().server());
        qorplatform::set_clock(&host().clock());
        restore_folders();
        clean_output();
        get_fonts_factory().init();
        lua_State *l = lua_machine().GetCState();
        luaJIT_setmode(l, 0, LUAJIT_MODE_ENGINE | LUAJIT_MODE_OFF); // so that the count hook runs
        lua_sethook(l, on_lua_count, LUA_MASKCOUNT, k_lua_instructions);
        lua_machine().DoString(k_sandbox);
        return true;
    }();
    (void)s_done;
}

std::string const &ui_dir() {
    static std::string const s_dir = run_dir() + "/ui";
    return s_dir;
}

void write_ui_file(char const *_name, uint8_t const *_p_data, size_t _size) {
    std::ofstream(ui_dir() + "/" + _name, std::ios::binary)
        .write(reinterpret_cast<char const *>(_p_data), _size);
}

void restore_ui_file(char const *_name) {
    fs::copy_file(k_source_data + "/ui/" + _name, ui_dir() + "/" + _name,
                  fs::copy_options::overwrite_existing);
}

CDesktop *new_desktop() {
    CDesktop *p_desktop = new CDesktop(&screen().m_render, 160, 120, "desktop");
    p_desktop->send_event(p_desktop, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
    p_desktop->add_font(FNT_NAME_DEFAULT, get_fonts_factory().create("arial_white", p_desktop));
    p_desktop->add_font(FNT_NAME_FIXED, get_fonts_factory().create("courier", p_desktop));
    return p_desktop;
}

void frame(CDesktop *_p_desktop) {
    _p_desktop->update(0);
    screen().m_renderer.begin_frame(rgba_t(0, 0, 0, 255));
    _p_desktop->draw();
}

qorhost::CHost &host() {
    static qorhost::CHost *sp_host = [] {
        qorhost::SHostOptions options;
        options.m_data = run_dir();
        options.m_out = run_dir() + "/out";
        options.m_w = 160;
        options.m_h = 120;
        options.m_quiet = true;
        qorhost::CHost *p_host = new qorhost::CHost(options); // the library's statics keep its server
        if (!p_host->load_ui()) std::abort();
        return p_host;
    }();
    return *sp_host;
}

qorhost::CHost &started_host() {
    static bool const s_started = host().start();
    if (!s_started) std::abort();
    restore_folders();
    return host();
}

void clean_output() {
    std::error_code ignored;
    fs::remove_all(ui_dir(), ignored);
    fs::copy(k_source_data + "/ui", ui_dir());
    fs::create_directory(run_dir() + "/out", ignored);
    for (fs::directory_entry const &entry : fs::directory_iterator(run_dir() + "/out", ignored))
        if (entry.path().filename() != "qor.gdf")
            fs::remove_all(entry.path(), ignored); // the host's copy stays
}

void restore_folders() {
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, run_dir().c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (run_dir() + "/fonts").c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, ui_dir().c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, (run_dir() + "/out").c_str());
}

void reset_lua() {
    lua_machine().DoString(k_reset, true);
}

} // namespace qorfuzz
