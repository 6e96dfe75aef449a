// The reference engine: it owns the engine's interfaces, puts them on the interface server, loads
// the UI library as an engine does, and runs its frames.
//
//   interfaces    server, input, commands and variables, level, log, sound, renderer
//   lifecycle     load_ui, init, frames of update and draw, shutdown
#pragma once
#include "commands.h"
#include "frame_timer.h"
#include "input_system.h"
#include "interface_server.h"
#include "level_description.h"
#include "log_manager.h"
#include "qor_platform.h"
#include "recording_renderer.h"
#include "software_renderer.h"
#include "sound_system.h"

#include <memory>
#include <string>
#include <vector>

namespace qorui {
class IUserInterface;
}

namespace qorhost {

// The data folder a host runs on when none is given: the installed data of an installed host,
// else "data" in the current folder.
std::string default_data_folder();

struct SHostOptions {
    std::string m_data = default_data_folder(); // the data folder
    int m_w = 1024;                             // screen size in pixels
    int m_h = 768;
    unsigned m_frames = 12;              // in a window, 0 runs until the window is closed
    std::string m_out = "out";           // frames, stats and the configuration written back; "" for none
    bool m_quiet = false;                // the log isn't printed
    bool m_record = false;               // a recorder stands in front of the renderer
    bool m_manual_clock = true;          // time moves 16 ms a frame, so runs repeat exactly
    std::vector<std::string> m_commands; // run after init, "name arguments"
    std::string m_script;                // an input script played instead of the frames; "" for none
    bool m_window = false; // frames are shown in a window that gives the input; none are written
};

class CHost {
public:
    explicit CHost(SHostOptions const &_options);
    ~CHost();
    CHost(CHost const &) = delete;
    CHost &operator=(CHost const &) = delete;

    // Opens libqorui.so and fetches its service; false, with a message, when either fails.
    bool load_ui();
    qorui::IUserInterface *ui() const { return mp_ui; }

    // init, the commands, the frames or the input script, shutdown. Result 0; 1 without a
    // service, 2 for a script that doesn't load.
    int run();
    // The two ends of a run, for a host that runs the frames itself: init and the commands
    // (false without a service), and shutdown with the configuration written back.
    bool start();
    void finish();
    // One frame: clear, update, draw, present.
    void frame();
    // Opens a module that registers a frame timer on the server, which then hears of the phases
    // of every frame; false, with a warning, when the module doesn't load or registers none.
    bool load_frame_timer(char const *_library_name);

    CInterfaceServer &server() { return m_server; }
    CInputSystem &input() { return m_input; }
    CCmdManager &commands() { return m_commands; }
    CVarManager &vars() { return m_vars; }
    CLogManager &log() { return m_log; }
    CSoundSystem &sound() { return m_sound; }
    // The software renderer, which draws headless; and the renderer that the frames are drawn with.
    CSoftwareRenderer &renderer() { return m_renderer; }
    CHostRenderer &active_renderer() { return *mp_active_renderer; }
    // Frames are drawn with _renderer from now on, in place of the one on the server (the software
    // renderer, or the recorder in front of it), with the host's texture folders; before start,
    // since the library keeps the renderer it finds at init.
    void use_renderer(CHostRenderer &_renderer);
    CRecordingRenderer &recorder() { return m_recorder; }
    CLevelDescription &level() { return m_level; }
    qorplatform::CManualClock &clock() { return m_clock; }
    SHostOptions const &options() const { return m_options; }

    // Path of a presented frame's file.
    std::string frame_path(unsigned _index) const;

private:
    void run_startup_commands();
    void configure_files();
    IRenderQOR *served(CHostRenderer *_p_renderer);
    void write_frame(SImage const &_frame, unsigned _index);
    static void log_sink(char const *_line, void *_user);
    // A phase of the frame: the timer's brackets and, on the manual clock, the phase's share of the
    // frame's time, which _elapsed_ms adds up.
    void enter_phase(bool _timed, char const *_phase);
    void exit_phase(bool _timed, unsigned _share_ms, unsigned &_elapsed_ms);

    SHostOptions m_options;
    CInterfaceServer &m_server; // lives to the end of the process
    CInputSystem m_input;
    CVarManager m_vars;
    CCmdManager m_commands;
    CLevelDescription m_level;
    CLogManager m_log;
    ILogger *mp_engine_logger;
    CSoundSystem m_sound;
    CSoftwareRenderer m_renderer;
    CRecordingRenderer m_recorder;
    CHostRenderer *mp_active_renderer; // the one on the server, or the recorder's target
    qorplatform::CManualClock m_clock;
    qorui::IUserInterface *mp_ui;
    IFrameTimer *mp_frame_timer; // on the server, from a module; null for none
    unsigned m_frame_time; // handed to update, ms: 16 a frame on the manual clock, else since m_start_tick
    uint32_t m_start_tick; // the system clock's when the host was made
};

} // namespace qorhost
