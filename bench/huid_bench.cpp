// HUID construction: copying and hashing a name, the cost of every HUID made at run time (window
// names, material and font lookups by text), against the comparison that lookups pay instead.
#include "ui_huid.h"

#include <benchmark/benchmark.h>

using namespace qorui;

namespace {

// 16 characters: one block, with upper-case letters to fold.
char const k_name[] = "ButtonScrollerUp";

void BM_HuidOf16Characters(benchmark::State &_state) {
    for (auto _ : _state) {
        HUID id(k_name);
        benchmark::DoNotOptimize(id);
    }
    _state.SetBytesProcessed(static_cast<int64_t>(_state.iterations()) * (sizeof(k_name) - 1));
}
BENCHMARK(BM_HuidOf16Characters);

// 100 characters: two blocks.
void BM_HuidOf100Characters(benchmark::State &_state) {
    char name[101];
    for (int i = 0; i < 100; ++i)
        name[i] = static_cast<char>('A' + i % 26);
    name[100] = 0;
    for (auto _ : _state) {
        HUID id(name);
        benchmark::DoNotOptimize(id);
    }
    _state.SetBytesProcessed(static_cast<int64_t>(_state.iterations()) * 100);
}
BENCHMARK(BM_HuidOf100Characters);

void BM_HuidCompare(benchmark::State &_state) {
    HUID const a(k_name);
    HUID const b("ButtonScrollerDown");
    for (auto _ : _state) {
        bool less = a < b;
        benchmark::DoNotOptimize(less);
        benchmark::DoNotOptimize(&a);
    }
}
BENCHMARK(BM_HuidCompare);

} // namespace
