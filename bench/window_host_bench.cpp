// The window host (qorhost --window) on the demo scene at 1024 by 768, drawn by SDL's renderer:
// the time of a step (the window's events, the library's update and draw, present) with vsync
// off, as frames a second, with the batches of triangles a frame hands to SDL; then runs of 60
// frames paced as the host paces them for a person. The label names SDL's driver; a counter gives
// the pixels of a shown frame that differ from the headless golden image of the scene by more
// than 2 in a channel. Needs a display: bench/window_fps.sh runs it under Xvfb.
// QOR_WINDOW_PICTURE names a PNG file to write that frame to.
#ifdef QORHOST_WITH_SDL2
#include "bench_demo.h"
#include "sdl_renderer.h"
#include "window_host.h"

#include <benchmark/benchmark.h>

#include <cstdlib>
#include <memory>

namespace {

struct SWindowDemo {
    CBenchDemo m_demo{true};
    qorhost::CWindowHost m_window{m_demo.host()};
    std::string m_error;
    bool m_started = false;

    SWindowDemo() {
        SDL_SetHint(SDL_HINT_RENDER_VSYNC, "0");
        m_started = m_window.open(m_error) && m_demo.start();
    }
};

// SDL's driver, and for OpenGL the implementation that draws (Mesa's "llvmpipe" under Xvfb).
std::string driver(qorhost::CSdlRenderer const &_screen) {
    std::string name = _screen.get_driver();
    typedef unsigned char const *(*get_string_t)(unsigned);
    unsigned const gl_renderer = 0x1F01;
    auto p_get_string = reinterpret_cast<get_string_t>(SDL_GL_GetProcAddress("glGetString"));
    unsigned char const *p_gl =
        name.rfind("opengl", 0) == 0 && p_get_string ? p_get_string(gl_renderer) : nullptr;
    return p_gl ? name + " (" + reinterpret_cast<char const *>(p_gl) + ")" : name;
}

// One for the process: the library's service is a static of the process.
SWindowDemo &window_demo() {
    static SWindowDemo s_demo;
    return s_demo;
}

// A frame shown, read back, against the golden image of the scene.
long pixels_unlike_golden(SWindowDemo &_demo) {
    qorhost::SImage shown, golden;
    qorhost::CSdlRenderer *p_screen = _demo.m_window.screen();
    p_screen->set_frame_sink([&](qorhost::SImage const &_frame, unsigned) { shown = _frame; });
    _demo.m_window.step();
    p_screen->set_frame_sink(nullptr);
    if (char const *p_path = std::getenv("QOR_WINDOW_PICTURE")) qorhost::write_png(p_path, shown);
    if (!qorhost::load_image(std::string(QOR_SOURCE_DIR) + "/tests/golden/demo_scene_1024x768.png", golden))
        return -1;
    return qorhost::compare_images(shown, golden, 2);
}

void BM_WindowHostStep(benchmark::State &_state) {
    SWindowDemo &demo = window_demo();
    if (!demo.m_started) return _state.SkipWithError(("no window: " + demo.m_error).c_str());
    unsigned const batches = demo.m_window.screen()->get_batches_drawn();
    for (auto _ : _state)
        demo.m_window.step();
    _state.SetLabel(driver(*demo.m_window.screen()));
    _state.counters["batches"] = static_cast<double>(demo.m_window.screen()->get_batches_drawn() - batches) /
                                 static_cast<double>(_state.iterations());
    _state.counters["fps"] =
        benchmark::Counter(static_cast<double>(_state.iterations()), benchmark::Counter::kIsRate);
    _state.counters["pixels_unlike_golden"] = static_cast<double>(pixels_unlike_golden(demo));
}
BENCHMARK(BM_WindowHostStep)->Unit(benchmark::kMillisecond)->UseRealTime();

void BM_WindowHostPaced60Frames(benchmark::State &_state) {
    SWindowDemo &demo = window_demo();
    if (!demo.m_started) return _state.SkipWithError(("no window: " + demo.m_error).c_str());
    for (auto _ : _state)
        demo.m_window.run(60);
    _state.counters["fps"] =
        benchmark::Counter(60.0 * static_cast<double>(_state.iterations()), benchmark::Counter::kIsRate);
}
BENCHMARK(BM_WindowHostPaced60Frames)->Unit(benchmark::kMillisecond)->UseRealTime()->Iterations(3);

} // namespace
#endif
