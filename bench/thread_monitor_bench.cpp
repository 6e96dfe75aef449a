// The thread monitor's work at each fetch: the merge of four full rings into 16000 sorted samples,
// then the bars and busy share of 16 threads over the four seconds that the rings hold.
#include "qor_platform.h"
#include "ui_thread_monitor.h"

#include <benchmark/benchmark.h>

#include <cstring>
#include <random>
#include <vector>

using namespace qorui;

namespace {

unsigned const k_threads = 16;
uint32_t const k_process = 4242;

// Four full rings, a record each millisecond in each, the processors a quarter of a millisecond
// apart, their heads at different places; half the samples are the process's 16 threads, the
// rest other programs and the idle process. Times are of a counter at 1e9 a second.
std::vector<unsigned char> full_rings() {
    std::vector<unsigned char> buffer(k_ring_buffer_bytes, 0);
    std::mt19937 random(7); // 32-bit draws
    for (unsigned ring = 0; ring < k_ring_count; ++ring) {
        uint32_t const head = ring * 997;
        unsigned char *p_section = &buffer[ring * k_ring_section_bytes];
        memcpy(p_section, &head, 4);
        for (unsigned i = 0; i < k_ring_records; ++i) {
            uint32_t const kind = random() % 4, other = uint32_t(random());
            SThreadSample const sample = {kind < 2    ? k_process
                                          : kind == 2 ? 100 + other % 50
                                                      : 0,
                                          kind < 2 ? k_process + other % k_threads : other % 1000,
                                          int64_t(5000000000) + int64_t(i) * 1000000 + ring * 250000};
            memcpy(p_section + 4 + ((head + i) % k_ring_records) * 16, &sample, 16);
        }
    }
    return buffer;
}

void BM_MergeAndActivityOf16Threads(benchmark::State &_state) {
    qorplatform::CManualClock clock(10000);
    qorplatform::set_clock(&clock);
    std::vector<unsigned char> const buffer = full_rings();
    CThreadRingsRecording device(buffer.data());
    CThreadMonitor monitor(&device);
    qor_vector<SActivitySegment> segments;
    segments.reserve(512);
    for (auto _ : _state) {
        clock.advance_ms(2000);
        int status;
        monitor.refresh(&status);
        for (unsigned thread = 0; thread < k_threads; ++thread) {
            unsigned per_mille = 0;
            segments.clear();
            monitor.get_thread_activity(k_process, k_process + thread, segments, 300, 8, &per_mille);
            benchmark::DoNotOptimize(per_mille);
        }
    }
    qorplatform::set_clock(nullptr);
}
BENCHMARK(BM_MergeAndActivityOf16Threads)->Unit(benchmark::kMillisecond);

} // namespace
