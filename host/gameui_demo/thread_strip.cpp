// The demo's thread strip: a window over the scene with a row for each thread of the watched
// process and one for the rest of the system, each a name, a bar of when the thread had a
// processor over the last four seconds and its busy share; and the commands that show it.
#include "thread_strip.h"

#include "qor_commands.h"
#include "qor_interfaces.h"
#include "qor_platform.h"
#include "qordebug.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_interfaces.h"
#include "ui_material.h"
#include "ui_string.h"
#include "ui_thread_monitor.h"
#include "ui_window_visual.h"

#include <algorithm>
#include <cstdio>
#include <memory>
#include <string>

using namespace qorui;

namespace gameui_demo {

namespace {

IInterfaceServer *gp_server = nullptr;

// The strip's geometry: a heading, then one row a thread; the bar is a column a pixel.
int const k_row_h = 18;
int const k_heading_h = 22;
int const k_name_w = 140;
int const k_bar_w = 300;
int const k_share_w = 60;
int const k_margin = 8;
int const k_strip_w = k_margin + k_name_w + k_bar_w + k_margin + k_share_w;
unsigned const k_period = 8; // half seconds

HUID const MAT_THREAD_TRACK("thread_strip_track");
HUID const MAT_THREAD_BAR("thread_strip_bar");
HUID const MAT_THREAD_OTHER("thread_strip_other");

class CThreadStrip;
CThreadStrip *gp_strip = nullptr;

// One row: a thread (or the rest of the system), its bars and busy share after the last fetch.
struct SThreadRow {
    unsigned m_thread_id;
    qor_vector<SActivitySegment> m_bars;
    unsigned m_per_mille;
};

class CThreadStrip : public CWindowVisual {
public:
    // Live on the machine's sampler when _p_recording is null; else on the recording, which the
    // strip takes.
    CThreadStrip(CDesktop *_p_desktop, CThreadRingsRecording *_p_recording)
        : CWindowVisual(_p_desktop, "thread strip"), mp_recording(_p_recording),
          mp_sampler(_p_recording ? nullptr : new CThreadSampler),
          m_process_id(_p_recording ? _p_recording->get_process_id() : qorplatform::get_current_process_id()),
          m_monitor(_p_recording ? static_cast<IThreadMonitorDevice *>(_p_recording) : mp_sampler.get()) {
        set_passive(true);
        add_material(MAT_NAME_NORMAL, create_color_material(_p_desktop, rgba_t(16, 20, 32, 225)));
        add_material(MAT_THREAD_TRACK, create_color_material(_p_desktop, rgba_t(44, 52, 70, 255)));
        add_material(MAT_THREAD_BAR, create_color_material(_p_desktop, rgba_t(96, 210, 130, 255)));
        add_material(MAT_THREAD_OTHER, create_color_material(_p_desktop, rgba_t(230, 150, 70, 255)));
    }
    ~CThreadStrip() override {
        if (gp_strip == this) gp_strip = nullptr;
    }

    // The live rings with the names of the threads that they show, for a replay later.
    bool save(char const *_path) {
        if (!mp_sampler) return false;
        qor_vector<unsigned char> buffer(k_ring_buffer_bytes, 0);
        if (!mp_sampler->fetch(buffer.data())) return false;
        CThreadRingsRecording recording(buffer.data());
        recording.set_process_id(m_process_id);
        return recording.save(_path);
    }

protected:
    void on_event_update(CWndEvent const *_p_event) override {
        CWindowVisual::on_event_update(_p_event);
        // The first fetch measures the counter's frequency against the time since the monitor was
        // made, so it waits until the clock has moved (a host's own clock may stand still between
        // a command and the next frame).
        if (qorplatform::query_performance_counter() == m_made_at) return;
        int status = 0;
        uint32_t const last = m_fetches;
        if (m_monitor.refresh(&status) && m_monitor.get_ticks_per_second()) ++m_fetches;
        if (m_fetches != last) take_rows();
    }

    void on_event_draw(CWndEvent const *_p_event) override {
        CWindowVisual::on_event_draw(_p_event);
        CFont *p_font = get_font(FNT_NAME_DEFAULT);
        char heading[96];
        snprintf(heading, sizeof(heading), "Threads of process %u, last %u s", m_process_id, k_period / 2);
        m_canvas.text_out(k_margin, 2, CString(heading), p_font);
        int y = k_heading_h;
        for (SThreadRow const &row : m_rows) {
            draw_row(row, y, p_font);
            y += k_row_h;
        }
    }

private:
    // The threads of the process, in id order, with the rest of the system last. Live, the
    // process's threads now; from a recording, those that its samples show.
    void take_rows() {
        qor_vector<unsigned> threads;
        if (mp_recording) {
            SThreadSample const *p_samples = m_monitor.get_samples();
            for (unsigned i = 0; i < k_ring_samples; ++i)
                if (p_samples[i].m_process_id == m_process_id && p_samples[i].m_thread_id != ~0u)
                    threads.push_back(p_samples[i].m_thread_id);
        } else {
            m_monitor.update_threads(m_process_id);
            threads = m_monitor.get_threads();
        }
        std::sort(threads.begin(), threads.end());
        threads.erase(std::unique(threads.begin(), threads.end()), threads.end());
        threads.push_back(~0u);
        m_rows.clear();
        for (unsigned thread : threads) {
            SThreadRow row{thread, {}, 0};
            m_monitor.get_thread_activity(m_process_id, thread, row.m_bars, k_bar_w, k_period,
                                          &row.m_per_mille);
            m_rows.push_back(row);
        }
        set_size(k_strip_w, k_heading_h + int(m_rows.size()) * k_row_h + k_margin / 2);
    }

    void draw_row(SThreadRow const &_row, int _y, CFont *_p_font) {
        m_canvas.text_out(k_margin, _y, CString(CThreadMonitor::get_thread_name(_row.m_thread_id)), _p_font);
        int const bar_x = k_margin + k_name_w;
        m_canvas.draw_rect(bar_x, _y + 3, k_bar_w, k_row_h - 6, get_material(MAT_THREAD_TRACK));
        CMaterial *p_bar = get_material(_row.m_thread_id == ~0u ? MAT_THREAD_OTHER : MAT_THREAD_BAR);
        for (SActivitySegment const &bar : _row.m_bars)
            m_canvas.draw_rect(bar_x + bar.m_begin, _y + 3, bar.m_end - bar.m_begin + 1, k_row_h - 6, p_bar);
        char share[16];
        snprintf(share, sizeof(share), "%u.%u%%", _row.m_per_mille / 10, _row.m_per_mille % 10);
        m_canvas.text_out(bar_x + k_bar_w + k_margin, _y, CString(share), _p_font);
    }

    std::unique_ptr<CThreadRingsRecording> mp_recording;
    std::unique_ptr<CThreadSampler> mp_sampler;
    unsigned m_process_id;
    CThreadMonitor m_monitor; // after its device, which it stops and removes as it goes
    qor_vector<SThreadRow> m_rows;
    uint32_t m_fetches = 0;
    int64_t const m_made_at = qorplatform::query_performance_counter();
};

CDesktop *desktop() {
    IUserInterface *p_ui =
        static_cast<IUserInterface *>(gp_server->query_interface(qor_uid::USER_INTERFACE, 1));
    return p_ui ? p_ui->get_desktop() : nullptr;
}

std::string trimmed(char const *_text) {
    std::string text(_text ? _text : "");
    text.erase(0, text.find_first_not_of(' '));
    text.erase(text.find_last_not_of(' ') + 1);
    return text;
}

// Shows the strip at the bottom left of the scene, live or on a recording; without a file, a
// second call hides it.
void cmd_gameui_threads(char const *_arguments, void *) {
    CDesktop *p_desktop = desktop();
    if (!p_desktop) return;
    std::string const path = trimmed(_arguments);
    std::unique_ptr<CThreadRingsRecording> p_recording;
    if (!path.empty()) {
        p_recording.reset(new CThreadRingsRecording);
        string error;
        if (!p_recording->load(path.c_str(), error)) {
            qordebug::warning("%s", error.c_str());
            return;
        }
    }
    bool const hide = gp_strip && !p_recording;
    if (gp_strip) p_desktop->delete_window(gp_strip);
    gp_strip = nullptr;
    if (hide) return;
    gp_strip = new CThreadStrip(p_desktop, p_recording.release());
    p_desktop->attach_child(gp_strip);
    gp_strip->set_pos(16, 636);
    gp_strip->set_size(k_strip_w, k_heading_h);
}

void cmd_gameui_threads_save(char const *_arguments, void *) {
    std::string const path = trimmed(_arguments);
    if (!gp_strip || path.empty() || !gp_strip->save(path.c_str()))
        qordebug::warning("gameui_threads_save: no live thread strip, or '%s' can't be written",
                          path.c_str());
}

} // namespace

void register_thread_strip_commands(IInterfaceServer *_p_server, ICmdManagerBase *_p_commands) {
    gp_server = _p_server;
    _p_commands->register_command("gameui_threads", cmd_gameui_threads, nullptr);
    _p_commands->register_command("gameui_threads_save", cmd_gameui_threads_save, nullptr);
}

} // namespace gameui_demo
