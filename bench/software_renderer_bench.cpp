// The host's software renderer on one frame of the demo scene (1024 by 768, faded in): the frame's
// renderer calls, recorded once, played into the renderer and rasterised; and the whole frame of
// the host (the library's update and draw, then the rasteriser) for comparison.
#include "bench_demo.h"

#include <benchmark/benchmark.h>

namespace {

// One demo for the process: the library's service is a static of the process, so a second host
// would meet the first one's desktop. Null when the library doesn't load.
CBenchDemo *demo() {
    static CBenchDemo s_demo;
    static bool const s_started = s_demo.start();
    return s_started ? &s_demo : nullptr;
}

void BM_DemoFrameRasterised(benchmark::State &_state) {
    CBenchDemo *p_demo = demo();
    if (!p_demo) return _state.SkipWithError("libqorui.so did not load");
    std::vector<qorhost::SRenderCall> const calls = p_demo->record_frame();
    qorhost::CSoftwareRenderer &renderer = p_demo->host().renderer();
    size_t quads = 0;
    for (qorhost::SRenderCall const &call : calls)
        quads += call.m_op == "draw_quad";
    for (auto _ : _state) {
        renderer.begin_frame(rgba_t(0, 0, 0, 255));
        CBenchDemo::replay(calls, renderer);
        benchmark::DoNotOptimize(renderer.get_frame().m_pixels.data());
    }
    _state.counters["quads"] = static_cast<double>(quads);
}
BENCHMARK(BM_DemoFrameRasterised)->Unit(benchmark::kMillisecond);

void BM_DemoFrameWholeHost(benchmark::State &_state) {
    CBenchDemo *p_demo = demo();
    if (!p_demo) return _state.SkipWithError("libqorui.so did not load");
    for (auto _ : _state) {
        p_demo->host().frame();
        benchmark::DoNotOptimize(p_demo->host().renderer().get_frame().m_pixels.data());
    }
}
BENCHMARK(BM_DemoFrameWholeHost)->Unit(benchmark::kMillisecond);

} // namespace
