// The host's graph profiler, a module beside the library: it registers the console command
// "graph_profiler", which shows the profiler over the scene or hides it, and a frame timer through
// which the host's phases ("update", "draw", "renderer") become the profiler's nodes while it is
// shown. Its root is the time from frame to frame. The module links the library for the profiler's
// class; the host loads it after the library, through the interface server, so the library itself
// is still loaded only as an engine loads it.
#include "frame_timer.h"
#include "qor_commands.h"
#include "ui_desktop.h"
#include "ui_graph_profiler.h"
#include "ui_interfaces.h"

namespace {

char const *const k_command = "graph_profiler";
// Below the demo scene's left-hand dialogs, one sample a pixel across.
int const k_x = 20, k_y = 624, k_w = 480, k_h = 136;

class CGraphProfilerTimer : public qorhost::IFrameTimer {
public:
    explicit CGraphProfilerTimer(IInterfaceServer *_p_server) : mp_server(_p_server) {}

    bool is_timing() override { return m_shown; }
    void enter(char const *_phase) override { mp_profiler->enter_node(qorui::HUID(_phase)); }
    void exit() override { mp_profiler->exit_node(); }

    // Shown and measuring, or hidden and off. Commands run between frames, where no phase is open,
    // as starting requires.
    void toggle() {
        if (!make_profiler()) return;
        m_shown = !m_shown;
        if (m_shown) {
            mp_profiler->start();
            mp_profiler->show(true);
        } else {
            mp_profiler->stop();
            mp_profiler->show(false);
        }
    }

private:
    // At the first command, on the desktop of the interface on the server.
    bool make_profiler() {
        if (mp_profiler) return true;
        qorui::IUserInterface *p_ui =
            static_cast<qorui::IUserInterface *>(mp_server->query_interface(qor_uid::USER_INTERFACE, 1));
        qorui::CDesktop *p_desktop = p_ui ? p_ui->get_desktop() : nullptr;
        if (!p_desktop) return false;
        qorui::CGraphProfiler *p_profiler = new qorui::CGraphProfiler(p_desktop, "graph profiler");
        p_desktop->attach_child(p_profiler);
        p_profiler->set_pos(k_x, k_y);
        p_profiler->set_size(k_w, k_h);
        mp_profiler = p_profiler;
        return true;
    }

    IInterfaceServer *mp_server;
    qorui::IGraphProfiler *mp_profiler = nullptr; // owned by the desktop's window tree
    bool m_shown = false;
};

// Lives as long as the module; the window goes with the desktop at the interface's shutdown.
CGraphProfilerTimer *gp_timer = nullptr;

void cmd_graph_profiler(char const *, void *) {
    if (gp_timer) gp_timer->toggle();
}

} // namespace

extern "C" __attribute__((visibility("default"))) int RegisterInterface(IInterfaceServer *_p_server) {
    if (!_p_server) return -1;
    static CGraphProfilerTimer s_timer(_p_server);
    gp_timer = &s_timer;
    if (ICmdManagerBase *p_commands =
            static_cast<ICmdManagerBase *>(_p_server->query_interface(qor_uid::CMD_MANAGER, 1)))
        p_commands->register_command(k_command, cmd_graph_profiler, nullptr);
    return _p_server->register_interface(gp_timer);
}
