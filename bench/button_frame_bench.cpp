// One frame of a screen full of buttons: 1,000 buttons of 25 by 30 pixels, 40 by 25 of them on a
// 1024 by 768 desktop, each with a caption of ten characters, updated and drawn into a renderer
// that only copies the vertices into a buffer made once. The counters give the quads of a frame
// and the library's heap allocations per frame, which a steady frame should not make.
#include "bench_desktop.h"
#include "qorMemoryManager.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qor_render.h"
#include "ui_button.h"
#include "ui_desktop.h"
#include "ui_font.h"
#include "ui_material.h"
#include "ui_render.h"
#include "ui_string.h"

#include <benchmark/benchmark.h>

#include <cstdio>
#include <vector>

using namespace qorui;

namespace {

// The cheapest renderer that still takes every vertex: a copy into a buffer reserved up front.
class CVertexCopyRenderer : public IRenderQOR {
public:
    struct SVertex {
        vec2_t m_pos, m_tex;
        rgba_t m_color;
    };

    CVertexCopyRenderer() { m_vertices.reserve(1 << 18); }

    SInterfaceUID get_uid() const override { return qor_uid::RENDER; }
    int get_version() const override { return 1; }
    void render_view(IRenderCamera *) override {}
    void finish_view() override {}
    void present() override {}
    int create_material(char const *, char const *, char const *, char const *, char const *, char const *,
                        bool, bool) override {
        return m_next_handle++;
    }
    void destroy_material(int) override {}
    IAviTexture *get_avi_texture(int) override { return nullptr; }
    void begin_2d() override { m_vertices.clear(); }
    void end_2d() override {}
    void set_material(int _handle) override { m_material = _handle; }
    void draw_quad(vec2_t const &_p0, vec2_t const &_t0, rgba_t const &_c0, vec2_t const &_p1,
                   vec2_t const &_t1, rgba_t const &_c1, vec2_t const &_p2, vec2_t const &_t2,
                   rgba_t const &_c2, vec2_t const &_p3, vec2_t const &_t3, rgba_t const &_c3) override {
        if (m_vertices.size() + 4 > m_vertices.capacity()) return; // never grows inside a frame
        m_vertices.push_back(SVertex{_p0, _t0, _c0});
        m_vertices.push_back(SVertex{_p1, _t1, _c1});
        m_vertices.push_back(SVertex{_p2, _t2, _c2});
        m_vertices.push_back(SVertex{_p3, _t3, _c3});
    }
    void set_clip_rect(vec2_t const &, vec2_t const &) override {}
    void push_clip_rect() override {}
    void pop_clip_rect() override {}
    void draw_line(vec2_t const &, rgba_t const &, vec2_t const &, rgba_t const &, float) override {}

    size_t quads() const { return m_vertices.size() / 4; }

private:
    std::vector<SVertex> m_vertices;
    int m_next_handle = 1;
    int m_material = -1;
};

// Allocations of every heap of the memory manager so far.
uint64_t allocations() {
    SMMHeapStats stats[16];
    int const heaps = MMGetStatsForModules(stats, 16);
    uint64_t total = 0;
    for (int i = 0; i < heaps; ++i)
        total += stats[i].m_allocations;
    return total + (heaps > 0 ? stats[0].m_small_allocations : 0);
}

void BM_FrameOf1000Buttons(benchmark::State &_state) {
    CVertexCopyRenderer renderer;
    CBenchDesktop bench(&renderer);
    CDesktop &desktop = bench.desktop();
    for (int row = 0; row < 25; ++row) {
        for (int column = 0; column < 40; ++column) {
            char name[16];
            std::snprintf(name, sizeof name, "Button%04d", row * 40 + column);
            CButton *p_button = new CButton(&desktop, name);
            desktop.attach_child(p_button);
            p_button->set_pos(column * 25, row * 30);
            p_button->set_size(25, 30);
            CMaterial *p_material = desktop.create_material();
            p_material->init("ui_color", nullptr, nullptr, nullptr, nullptr, nullptr, true, false);
            p_material->set_color(rgba_t(58, 74, 104, 255));
            p_button->add_material(MAT_NAME_NORMAL, p_material);
            p_button->m_text = CString(name);
            p_button->send_event(p_button, EVENT_SHOW, CWndEvent::DISPATCH_NONE);
        }
    }
    // Two frames first: fades end, fonts are cached, buffers have their size.
    for (int i = 0; i < 2; ++i) {
        desktop.update(0);
        desktop.draw();
    }
    uint64_t const before = allocations();
    for (auto _ : _state) {
        desktop.update(0);
        desktop.draw();
    }
    _state.counters["quads"] = static_cast<double>(renderer.quads());
    _state.counters["allocs_per_frame"] =
        static_cast<double>(allocations() - before) / static_cast<double>(_state.iterations());
}
BENCHMARK(BM_FrameOf1000Buttons)->Unit(benchmark::kMicrosecond);

} // namespace
