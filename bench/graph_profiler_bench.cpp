// The graph profiler's brackets: an enter_node and exit_node pair, the price that every timed
// stretch of code pays, on the system's performance counter. Callers keep their HUIDs, so the
// pairs look nodes up by hash and make none.
#include "bench_desktop.h"
#include "qor_platform.h"
#include "recording_renderer.h"
#include "ui_graph_profiler.h"

#include <benchmark/benchmark.h>

using namespace qorui;

namespace {

// A measuring profiler on the desktop, with the nodes of the benchmark already made.
class CBenchProfiler {
public:
    CBenchProfiler() : m_desktop(&m_renderer) {
        mp_profiler = new CGraphProfiler(&m_desktop.desktop(), "graph profiler");
        m_desktop.desktop().attach_child(mp_profiler);
        mp_profiler->start();
    }
    CGraphProfiler &profiler() { return *mp_profiler; }

private:
    qorhost::CRecordingRenderer m_renderer;
    CBenchDesktop m_desktop;
    CGraphProfiler *mp_profiler;
};

// One node under the root.
void BM_EnterExitPair(benchmark::State &_state) {
    CBenchProfiler bench;
    HUID const id("update");
    for (auto _ : _state) {
        bench.profiler().enter_node(id);
        bench.profiler().exit_node();
    }
}
BENCHMARK(BM_EnterExitPair);

// The innermost of three open nodes, among 16 siblings: the lookup of a busy frame.
void BM_EnterExitPairAmongSiblings(benchmark::State &_state) {
    CBenchProfiler bench;
    HUID const outer("frame"), middle("draw");
    char name[16];
    for (int i = 0; i < 16; ++i) {
        snprintf(name, sizeof(name), "window %d", i);
        bench.profiler().enter_node(outer);
        bench.profiler().enter_node(middle);
        bench.profiler().enter_node(HUID(name));
        for (int depth = 0; depth < 3; ++depth)
            bench.profiler().exit_node();
    }
    HUID const inner("window 11");
    bench.profiler().enter_node(outer);
    bench.profiler().enter_node(middle);
    for (auto _ : _state) {
        bench.profiler().enter_node(inner);
        bench.profiler().exit_node();
    }
    bench.profiler().exit_node();
    bench.profiler().exit_node();
}
BENCHMARK(BM_EnterExitPairAmongSiblings);

// The floor of a pair: the two readings of the performance counter that it takes.
void BM_TwoCounterReadings(benchmark::State &_state) {
    for (auto _ : _state) {
        int64_t const start = qorplatform::query_performance_counter();
        int64_t const stop = qorplatform::query_performance_counter();
        benchmark::DoNotOptimize(stop - start);
    }
}
BENCHMARK(BM_TwoCounterReadings);

} // namespace
