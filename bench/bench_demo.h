// What the benchmarks of the demo scene share: the reference host on the source tree's data
// folder, its output in a temporary folder removed at the end, the demo scene built and faded in,
// and the renderer calls of one of its frames, recorded so that they can be played again into any
// renderer.
#pragma once
#include "host.h"
#include "qordebug.h"
#include "recording_renderer.h"

#include <cstdlib>
#include <filesystem>
#include <string>
#include <vector>

class CBenchDemo {
public:
    // Headless, the recorder stands in front of the software renderer, so that frames can be
    // captured; with _window the host runs on the real clock for a window. No frame is written.
    explicit CBenchDemo(bool _window = false) : m_out(make_out()), m_host(options(m_out, _window)) {
        qordebug::set_report_handler([](qordebug::EReportKind, char const *, void *) {}, nullptr);
        m_host.renderer().set_frame_sink(nullptr);
    }
    ~CBenchDemo() {
        std::error_code ignored;
        std::filesystem::remove_all(m_out, ignored);
    }
    CBenchDemo(CBenchDemo const &) = delete;
    CBenchDemo &operator=(CBenchDemo const &) = delete;

    qorhost::CHost &host() { return m_host; }

    // The interface started and twelve frames run, so that the scene has faded in; false when the
    // library doesn't load.
    bool start() {
        if (!m_host.start()) return false;
        for (int i = 0; i < 12; ++i)
            m_host.frame();
        return true;
    }

    // The calls of the next frame, from clear to present.
    std::vector<qorhost::SRenderCall> record_frame() {
        m_host.recorder().clear();
        m_host.frame();
        return m_host.recorder().calls();
    }

    // Plays the 2D calls of a recorded frame into _renderer, whose material handles are those of
    // the recording; views and presenting are left out.
    static void replay(std::vector<qorhost::SRenderCall> const &_calls, IRenderQOR &_renderer) {
        for (qorhost::SRenderCall const &call : _calls) {
            std::vector<vec2_t> const &p = call.m_points;
            std::vector<vec2_t> const &t = call.m_uvs;
            std::vector<rgba_t> const &c = call.m_colours;
            if (call.m_op == "draw_quad")
                _renderer.draw_quad(p[0], t[0], c[0], p[1], t[1], c[1], p[2], t[2], c[2], p[3], t[3], c[3]);
            else if (call.m_op == "set_material")
                _renderer.set_material(call.m_handle);
            else if (call.m_op == "set_clip_rect")
                _renderer.set_clip_rect(p[0], p[1]);
            else if (call.m_op == "push_clip_rect")
                _renderer.push_clip_rect();
            else if (call.m_op == "pop_clip_rect")
                _renderer.pop_clip_rect();
            else if (call.m_op == "draw_line")
                _renderer.draw_line(p[0], c[0], p[1], c[1], t[0].x);
        }
    }

private:
    static std::string make_out() {
        std::string pattern = (std::filesystem::temp_directory_path() / "qorbench_XXXXXX").string();
        return mkdtemp(pattern.data()) ? pattern : std::string();
    }
    static qorhost::SHostOptions options(std::string const &_out, bool _window) {
        qorhost::SHostOptions options;
        options.m_data = std::string(QOR_SOURCE_DIR) + "/data";
        options.m_out = _out;
        options.m_quiet = true;
        options.m_record = !_window;
        options.m_window = _window;
        options.m_manual_clock = !_window;
        return options;
    }

    std::string m_out;
    qorhost::CHost m_host;
};
