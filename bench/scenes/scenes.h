// The fixed scenes that every program of the comparison builds, and the measuring that they all
// share: a timed loop with warm-up, the median, minimum and percentiles of one iteration, and the
// heap allocations made per iteration, counted by the malloc of counting_malloc.cpp.
//
//   S1   one frame of 1,000 push buttons of 25 by 30 pixels, 40 by 25 of them on 1024 by 768,
//        captions "Button0001" to "Button1000", each clipped to its button
//   S2   one pointer move to the centre of button (617 k) mod 1000: every move changes the
//        hovered button; with and without a frame behind it
//   S3   the S1 scene loaded from a layout file and attached, then destroyed
//   S4   one frame of a window with 200 lines of exactly 80 characters, the lines below the
//        window clipped
//   MEM  bytes and heap allocations per button, heap allocations per steady frame
#pragma once
#include <algorithm>
#include <chrono>
#include <cstdint>
#include <cstdio>
#include <string>
#include <vector>

namespace scenes {

// ---------------------------------------------------------------------------------------------
// The scenes
// ---------------------------------------------------------------------------------------------

int const k_screen_w = 1024;
int const k_screen_h = 768;

int const k_columns = 40;
int const k_rows = 25;
int const k_buttons = k_columns * k_rows;
int const k_button_w = 25;
int const k_button_h = 30;

struct SRect {
    int x, y, w, h;
};

// Button _index from 0, row by row from the top left.
inline SRect button_rect(int _index) {
    return SRect{(_index % k_columns) * k_button_w, (_index / k_columns) * k_button_h, k_button_w,
                 k_button_h};
}

// "Button0001" for the button of index 0.
inline std::string button_caption(int _index) {
    char caption[16];
    std::snprintf(caption, sizeof caption, "Button%04d", _index + 1);
    return caption;
}

// The button that the _k-th move of S2 goes to: 617 is prime to 1000, so consecutive moves never
// land on the same button and all buttons are visited.
inline int move_target(uint64_t _k) {
    return static_cast<int>((617 * _k) % k_buttons);
}

inline void button_centre(int _index, int &_x, int &_y) {
    SRect const r = button_rect(_index);
    _x = r.x + r.w / 2;
    _y = r.y + r.h / 2;
}

// S4: the window, and its lines of exactly 80 characters.
SRect const k_text_window{192, 144, 640, 480};
int const k_text_lines = 200;
int const k_line_chars = 80;

inline std::string text_line(int _index) {
    char head[16];
    std::snprintf(head, sizeof head, "Line %03d: ", _index + 1);
    std::string line = head;
    static char const words[] = "the quick brown fox jumps over the lazy dog ";
    for (size_t i = 0; line.size() < static_cast<size_t>(k_line_chars); ++i)
        line += words[(i + static_cast<size_t>(_index)) % (sizeof words - 1)];
    return line;
}

// ---------------------------------------------------------------------------------------------
// Counting the heap (counting_malloc.cpp)
// ---------------------------------------------------------------------------------------------

struct SHeapCount {
    uint64_t m_allocations; // calls that returned memory, since the process began
    int64_t m_live_bytes;   // usable bytes of the blocks not yet freed
};

SHeapCount heap_count();

// ---------------------------------------------------------------------------------------------
// Measuring
// ---------------------------------------------------------------------------------------------

struct SSummary {
    double m_median_us, m_min_us, m_p10_us, m_p90_us, m_p99_us;
    double m_allocations; // per iteration
    size_t m_samples;
};

// Times _body once per sample after _warm_up untimed runs; each sample is _batch runs, so that a
// body of a microsecond or two isn't lost in the clock's own cost.
template <class TBody>
SSummary measure(TBody &&_body, size_t _samples, size_t _batch = 1, size_t _warm_up = 20) {
    for (size_t i = 0; i < _warm_up; ++i)
        _body();
    std::vector<double> times;
    times.reserve(_samples);
    uint64_t const allocations_before = heap_count().m_allocations;
    for (size_t s = 0; s < _samples; ++s) {
        auto const start = std::chrono::steady_clock::now();
        for (size_t b = 0; b < _batch; ++b)
            _body();
        auto const end = std::chrono::steady_clock::now();
        times.push_back(std::chrono::duration<double, std::micro>(end - start).count() / _batch);
    }
    uint64_t const allocations = heap_count().m_allocations - allocations_before; // times was reserved
    std::sort(times.begin(), times.end());
    auto at = [&times](double _q) { return times[static_cast<size_t>(_q * (times.size() - 1))]; };
    return SSummary{at(0.5),  times.front(),
                    at(0.1),  at(0.9),
                    at(0.99), static_cast<double>(allocations) / static_cast<double>(_samples * _batch),
                    _samples};
}

// One line per measurement, the same columns in every program:
//   library scene median_us min_us p10_us p90_us p99_us allocs_per_iter samples
inline void print(char const *_library, char const *_scene, SSummary const &_s) {
    std::printf("%-8s %-14s median_us=%.3f min_us=%.3f p10_us=%.3f p90_us=%.3f p99_us=%.3f allocs=%.2f "
                "samples=%zu\n",
                _library, _scene, _s.m_median_us, _s.m_min_us, _s.m_p10_us, _s.m_p90_us, _s.m_p99_us,
                _s.m_allocations, _s.m_samples);
    std::fflush(stdout);
}

// A figure that isn't a time: bytes or allocations per button, quads of a frame.
inline void print_value(char const *_library, char const *_scene, double _value) {
    std::printf("%-8s %-14s value=%.2f\n", _library, _scene, _value);
    std::fflush(stdout);
}

} // namespace scenes
