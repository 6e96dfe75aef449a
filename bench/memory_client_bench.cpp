// The memory client's hot paths: a pooled take and give against the global operator new and
// delete of the program, and the steady allocation path (heap select, then allocate).
#include "qor_memory.h"

#include <benchmark/benchmark.h>

using namespace qorui;

namespace {

struct SPooledNode : CPooled<SPooledNode, 1024> {
    void *mp_links[4];
};

struct SPlainNode {
    void *mp_links[4];
};

void BM_PooledTakeAndGive(benchmark::State &_state) {
    delete new SPooledNode; // the first block exists before timing
    for (auto _ : _state) {
        SPooledNode *p = new SPooledNode;
        benchmark::DoNotOptimize(p);
        delete p;
    }
}
BENCHMARK(BM_PooledTakeAndGive);

void BM_GlobalNewAndDelete(benchmark::State &_state) {
    for (auto _ : _state) {
        SPlainNode *p = new SPlainNode;
        benchmark::DoNotOptimize(p);
        delete p;
    }
}
BENCHMARK(BM_GlobalNewAndDelete);

// 64 objects alive at once, taken and given in turn, as a tree of windows would.
void BM_PooledBatchOf64(benchmark::State &_state) {
    SPooledNode *nodes[64];
    for (auto _ : _state) {
        for (SPooledNode *&p : nodes)
            p = new SPooledNode;
        benchmark::DoNotOptimize(nodes);
        for (SPooledNode *p : nodes)
            delete p;
    }
}
BENCHMARK(BM_PooledBatchOf64);

void BM_GlobalBatchOf64(benchmark::State &_state) {
    SPlainNode *nodes[64];
    for (auto _ : _state) {
        for (SPlainNode *&p : nodes)
            p = new SPlainNode;
        benchmark::DoNotOptimize(nodes);
        for (SPlainNode *p : nodes)
            delete p;
    }
}
BENCHMARK(BM_GlobalBatchOf64);

void BM_SteadyAllocationPath(benchmark::State &_state) {
    size_t const size = static_cast<size_t>(_state.range(0));
    qor_free(qor_malloc(1)); // past the first-allocation path
    for (auto _ : _state) {
        void *p = qor_malloc(size);
        benchmark::DoNotOptimize(p);
        qor_free(p);
    }
}
BENCHMARK(BM_SteadyAllocationPath)->Arg(32)->Arg(256)->Arg(4096);

void BM_SmallAllocator(benchmark::State &_state) {
    for (auto _ : _state) {
        void *p = qor_small_alloc(32);
        benchmark::DoNotOptimize(p);
        qor_small_free(p);
    }
}
BENCHMARK(BM_SmallAllocator);

} // namespace
