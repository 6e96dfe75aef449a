// Layouts of 1,000 windows: the export of a whole tree to its Lua file, and the import of that
// file over a desktop that already has the windows (the usual case) and into an empty one.
#include "engine_interfaces.h"
#include "qorbase.h"
#include "qordebug.h"
#include "qorscriptsystem.h"
#include "ui_desktop.h"
#include "ui_render.h"

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <filesystem>
#include <string>

using namespace qorui;

namespace {

// Ten dialogs of a hundred windows each, a little nesting in each.
void build_tree(CDesktop &_desktop) {
    for (int d = 0; d < 10; ++d) {
        CWindowVisual *p_dialog = new CWindowVisual(&_desktop, ("dialog " + std::to_string(d)).c_str());
        _desktop.attach_child(p_dialog);
        p_dialog->set_pos(d * 10, d * 10);
        p_dialog->set_size(300, 200);
        for (int i = 0; i < 99; ++i) {
            CWindowVisual *p_wnd = new CWindowVisual(&_desktop, ("part " + std::to_string(i)).c_str());
            p_dialog->attach_child(p_wnd);
            p_wnd->set_pos(i % 10 * 30, i / 10 * 20);
            p_wnd->set_size(28, 18);
        }
    }
}

struct SSetup {
    SSetup() {
        qordebug::set_report_handler([](qordebug::EReportKind, char const *, void *) {}, nullptr);
        char dir[] = "/tmp/qorui_bench_XXXXXX";
        m_dir = mkdtemp(dir);
        qorbase::set_category_root(qorbase::FILE_CATEGORY_UI, m_dir.c_str());
        qorbase::set_category_root(qorbase::FILE_CATEGORY_STATS, m_dir.c_str());
    }
    // The exports go with the folder when the program ends.
    ~SSetup() {
        std::error_code ignored;
        std::filesystem::remove_all(m_dir, ignored);
    }
    std::string m_dir;
};

SSetup &setup() {
    static SSetup s_setup;
    return s_setup;
}

void BM_ExportLayoutOf1000Windows(benchmark::State &_state) {
    setup();
    CRender render;
    CDesktop desktop(&render, 1024, 768, "desktop");
    build_tree(desktop);
    for (auto _ : _state)
        desktop.export_layout(qorbase::FILE_CATEGORY_UI, "bench_layout.lua");
}
BENCHMARK(BM_ExportLayoutOf1000Windows)->Unit(benchmark::kMillisecond);

void BM_ImportLayoutOf1000WindowsOverExistingOnes(benchmark::State &_state) {
    setup();
    CRender render;
    CDesktop desktop(&render, 1024, 768, "desktop");
    build_tree(desktop);
    desktop.export_layout(qorbase::FILE_CATEGORY_UI, "bench_layout.lua");
    for (auto _ : _state)
        desktop.import(qorbase::FILE_CATEGORY_UI, "bench_layout.lua");
}
BENCHMARK(BM_ImportLayoutOf1000WindowsOverExistingOnes)->Unit(benchmark::kMillisecond);

void BM_ImportLayoutOf1000WindowsIntoAnEmptyDesktop(benchmark::State &_state) {
    setup();
    CRender render;
    {
        CDesktop desktop(&render, 1024, 768, "desktop");
        build_tree(desktop);
        desktop.export_layout(qorbase::FILE_CATEGORY_UI, "bench_layout.lua");
    }
    for (auto _ : _state) {
        CDesktop desktop(&render, 1024, 768, "desktop");
        desktop.import(qorbase::FILE_CATEGORY_UI, "bench_layout.lua");
        benchmark::DoNotOptimize(desktop.get_children_count());
    }
}
BENCHMARK(BM_ImportLayoutOf1000WindowsIntoAnEmptyDesktop)->Unit(benchmark::kMillisecond);

} // namespace
