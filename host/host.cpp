// The reference engine: its interfaces on the server, the configuration's copy, the library's
// loading, the startup commands, and the frames or the input script of a run.
#include "host.h"
#include "input_script.h"

#include "qorbase.h"
#include "qordebug.h"
#include "ui_interfaces.h"

#include <algorithm>
#include <cstdio>
#include <memory>
#include <vector>
#include <sys/stat.h>

namespace qorhost {

namespace {
unsigned const k_frame_ms = 16;
// The shares of a watched frame on the manual clock, in ms: clearing, update, draw, presenting.
unsigned const k_clear_ms = 1, k_update_ms = 3, k_draw_ms = 7, k_present_ms = 5;
static_assert(k_clear_ms + k_update_ms + k_draw_ms + k_present_ms == k_frame_ms, "a frame is 16 ms");

bool folder_exists(std::string const &_path) {
    struct stat info;
    return stat(_path.c_str(), &info) == 0 && S_ISDIR(info.st_mode);
}
} // namespace

namespace {

// A module's statics may still talk to the server they were given when the process ends, after
// the host that made it is gone (a module with unique symbols stays loaded to the end). So the
// servers live to the end of the process; this list, made before any module, dies after them.
CInterfaceServer &new_server() {
    static std::vector<std::unique_ptr<CInterfaceServer>> s_servers;
    s_servers.push_back(std::make_unique<CInterfaceServer>());
    return *s_servers.back();
}

} // namespace

CHost::CHost(SHostOptions const &_options)
    : m_options(_options), m_server(new_server()), m_commands(&m_vars), mp_engine_logger(nullptr),
      m_renderer(_options.m_w, _options.m_h), m_recorder(&m_renderer), mp_active_renderer(&m_renderer),
      mp_ui(nullptr), mp_frame_timer(nullptr), m_frame_time(0), m_start_tick(qorplatform::get_tick_count()) {
    m_log.set_quiet(m_options.m_quiet);
    mp_engine_logger = m_log.create_logger("Engine", "");
    qorbase::set_log_sink(log_sink, this);
    if (m_options.m_manual_clock) qorplatform::set_clock(&m_clock);
    configure_files();

    m_vars.set_var("scr_resx", std::to_string(m_options.m_w).c_str());
    m_vars.set_var("scr_resy", std::to_string(m_options.m_h).c_str());
    m_renderer.set_texture_folders({m_options.m_data + "/textures", m_options.m_data});
    m_renderer.set_frame_sink([this](SImage const &_frame, unsigned _index) { write_frame(_frame, _index); });
    // A game ships its interface library with its data; the host's own modules lie beside it, or
    // in the library folder of an installed host.
    m_server.set_modules_folders(
        {m_options.m_data, executable_folder(), executable_folder() + "/" + QORHOST_LIBDIR_FROM_BIN});

    m_server.register_interface(&m_input);
    m_server.register_interface(&m_vars);
    m_server.register_interface(&m_commands);
    m_server.register_interface(&m_level);
    m_server.register_interface(&m_log);
    m_server.register_interface(&m_sound);
    m_server.register_interface(served(&m_renderer));
}

// The software renderer goes on the server behind the recorder when there is one.
IRenderQOR *CHost::served(CHostRenderer *_p_renderer) {
    return _p_renderer == &m_renderer && m_options.m_record ? static_cast<IRenderQOR *>(&m_recorder)
                                                            : _p_renderer;
}

void CHost::use_renderer(CHostRenderer &_renderer) {
    if (&_renderer == mp_active_renderer) return;
    m_server.withdraw_interface(served(mp_active_renderer));
    _renderer.set_texture_folders(m_renderer.get_texture_folders());
    m_server.register_interface(served(&_renderer));
    mp_active_renderer = &_renderer;
}

// Every interface is withdrawn before it goes, so no module keeps a pointer to it; then the
// modules close while the server they hold on to still stands.
CHost::~CHost() {
    m_server.withdraw_all();
    mp_frame_timer = nullptr;
    m_server.close_modules();
    qorbase::set_log_sink(nullptr, nullptr);
    if (m_options.m_manual_clock) qorplatform::set_clock(nullptr);
}

// The configuration is read from the data folder on every run, so an edit there always takes
// effect; what the interface writes back goes to the output folder's qor.gdf (the configuration
// with the changed values), never into the data. Without an output folder it goes nowhere.
void CHost::configure_files() {
    std::string const data = m_options.m_data;
    qorbase::set_category_root(qorbase::FILE_CATEGORY_CONFIG, data.c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, (data + "/ui").c_str());
    qorbase::set_category_root(qorbase::FILE_CATEGORY_FONTS, (data + "/fonts").c_str());
    std::string written_back;
    if (!m_options.m_out.empty()) {
        mkdir(m_options.m_out.c_str(), 0755);
        qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, m_options.m_out.c_str());
        written_back = m_options.m_out + "/qor.gdf";
    }
    qorbase::set_gdf_path((data + "/qor.gdf").c_str(), written_back.c_str());
}

std::string default_data_folder() {
    std::string const installed = executable_folder() + "/" + QORHOST_DATA_FROM_BIN;
    return folder_exists(installed) ? installed : "data";
}

void CHost::log_sink(char const *_line, void *_user) {
    CHost *p_host = static_cast<CHost *>(_user);
    p_host->mp_engine_logger->write(_line, 0);
}

bool CHost::load_ui() {
    if (!m_server.open_module("libqorui.so")) return false;
    mp_ui = static_cast<qorui::IUserInterface *>(m_server.query_interface(qor_uid::USER_INTERFACE, 1));
    if (!mp_ui) qordebug::error("libqorui.so registered no user interface");
    return mp_ui != nullptr;
}

std::string CHost::frame_path(unsigned _index) const {
    char name[32];
    snprintf(name, sizeof(name), "frame_%04u.png", _index);
    return m_options.m_out + "/" + name;
}

void CHost::write_frame(SImage const &_frame, unsigned _index) {
    if (m_options.m_out.empty() || m_options.m_window) return;
    if (!write_png(frame_path(_index), _frame))
        qordebug::warning("Cannot write '%s'", frame_path(_index).c_str());
}

void CHost::frame() {
    if (!mp_ui) return;
    bool const timed = mp_frame_timer && mp_frame_timer->is_timing();
    unsigned elapsed_ms = 0;
    enter_phase(timed, "renderer");
    mp_active_renderer->begin_frame(rgba_t(0, 0, 0, 255));
    exit_phase(timed, k_clear_ms, elapsed_ms);
    enter_phase(timed, "update");
    mp_ui->update(static_cast<int>(m_frame_time));
    exit_phase(timed, k_update_ms, elapsed_ms);
    enter_phase(timed, "draw");
    mp_ui->draw();
    exit_phase(timed, k_draw_ms, elapsed_ms);
    enter_phase(timed, "renderer");
    mp_active_renderer->present();
    exit_phase(timed, k_present_ms, elapsed_ms);
    if (m_options.m_manual_clock) {
        m_clock.advance_ms(k_frame_ms - elapsed_ms);
        m_frame_time += k_frame_ms;
    } else {
        m_frame_time = qorplatform::get_tick_count() - m_start_tick;
    }
}

void CHost::enter_phase(bool _timed, char const *_phase) {
    if (_timed) mp_frame_timer->enter(_phase);
}

// Untimed, the manual clock moves once at the end of the frame, as it always has.
void CHost::exit_phase(bool _timed, unsigned _share_ms, unsigned &_elapsed_ms) {
    if (!_timed) return;
    if (m_options.m_manual_clock) {
        m_clock.advance_ms(_share_ms);
        _elapsed_ms += _share_ms;
    }
    mp_frame_timer->exit();
}

bool CHost::load_frame_timer(char const *_library_name) {
    if (!m_server.open_module(_library_name)) return false;
    mp_frame_timer = static_cast<IFrameTimer *>(m_server.query_interface(qor_uid::FRAME_TIMER, 1));
    if (!mp_frame_timer) qordebug::warning("'%s' registered no frame timer", _library_name);
    return mp_frame_timer != nullptr;
}

// The configuration's "[host] startup" line, as a game's autoexec: commands separated by ';'.
void CHost::run_startup_commands() {
    std::string const commands = qorbase::get_config_string("host", "startup", "");
    size_t start = 0;
    while (start < commands.size()) {
        size_t const end = std::min(commands.find(';', start), commands.size());
        std::string const line = commands.substr(start, end - start);
        if (line.find_first_not_of(' ') != std::string::npos) m_commands.run_line(line.c_str());
        start = end + 1;
    }
}

int CHost::run() {
    if (!mp_ui && !load_ui()) return 1;
    CInputScript script;
    std::string error;
    if (!m_options.m_script.empty() && !script.load(m_options.m_script, error)) {
        fprintf(stderr, "qorhost: %s\n", error.c_str());
        return 2;
    }
    start();
    if (m_options.m_script.empty()) {
        for (unsigned i = 0; i < m_options.m_frames; ++i)
            frame();
    } else {
        script.play(*this);
    }
    finish();
    return 0;
}

bool CHost::start() {
    if (!mp_ui && !load_ui()) return false;
    mp_ui->init(true); // the console starts closed; its key opens it
    run_startup_commands();
    for (std::string const &line : m_options.m_commands)
        m_commands.run_line(line.c_str());
    // The library puts its pointer where the pointer is at the first movement; one of nothing tells
    // it at once, so that the pointer isn't drawn in the corner until the mouse moves.
    m_input.pointer_move(vec2_t{0.0f, 0.0f});
    return true;
}

void CHost::finish() {
    if (mp_ui) mp_ui->shutdown();
    qorbase::flush_gdf();
}

} // namespace qorhost
