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
#include "vertex_copy_renderer.h"

#include <benchmark/benchmark.h>

#include <cstdio>

using namespace qorui;

namespace {

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
