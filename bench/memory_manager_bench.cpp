// The memory manager's hot paths against the C heap: a 32-byte block through a module heap (the
// heap selected before each allocation, as every module does), through the small-block
// allocator, and through malloc and free. QOR_MM_BACKEND picks the backend as in any run.
#include "qorMemoryManager.h"

#include <benchmark/benchmark.h>

#include <cstdlib>

namespace {

size_t const k_block_size = 32;

int bench_heap() {
    static int const s_heap = MMHeapCreate(0x1000000, 0x800000);
    return s_heap;
}

void BM_HeapSelectAllocateDeallocate(benchmark::State &_state) {
    int const heap = bench_heap();
    for (auto _ : _state) {
        MMHeapSelect(heap);
        void *p = MMAllocate(k_block_size, 0);
        benchmark::DoNotOptimize(p);
        MMDeallocate(p);
    }
}
BENCHMARK(BM_HeapSelectAllocateDeallocate);

void BM_SmallAllocFree(benchmark::State &_state) {
    for (auto _ : _state) {
        void *p = MMSmallAlloc(k_block_size);
        benchmark::DoNotOptimize(p);
        MMSmallFree(p);
    }
}
BENCHMARK(BM_SmallAllocFree);

void BM_MallocFree(benchmark::State &_state) {
    for (auto _ : _state) {
        void *p = malloc(k_block_size);
        benchmark::DoNotOptimize(p);
        free(p);
    }
}
BENCHMARK(BM_MallocFree);

} // namespace
