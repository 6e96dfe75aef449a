// The engine's memory manager.
//
//   backends      mimalloc heaps (default) or the C heap (QOR_MM_BACKEND=system), chosen once
//   heaps         one per module, selected before each allocation; statistics per heap
//   small blocks  a process-wide small-block allocator
//   fixed pools   records shared by element size and count, counted by reference
//
// Blocks are told apart by their owner: a block that no heap of the manager made (memory that
// crossed a module boundary, such as a buffer that libstdc++ allocated and the UI library frees)
// goes back to the C heap. With mimalloc the owner is found from the block's page; with the C heap
// the manager keeps a table of its live blocks.
#include "qorMemoryManager.h"

#include <mimalloc.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <unordered_map>
#include <utility>
#include <vector>

namespace {

enum EBackend { BACKEND_UNSET, BACKEND_MIMALLOC, BACKEND_SYSTEM };

struct SHeap {
    mi_heap_t *mp_heap; // mimalloc only
    SMMHeapStats m_stats;
};

struct SPoolEntry {
    SFixedPool *mp_record;
    size_t m_requested_size;
    unsigned m_references;
};

struct SBlockInfo {
    int m_heap;
    size_t m_size;
};

// All state lives in one object built at first use, so no static constructor order matters.
struct SManager {
    EBackend m_backend = BACKEND_UNSET;
    std::vector<SHeap> m_heaps;
    int m_selected = -1;
    uint64_t m_small_allocations = 0;
    std::vector<SPoolEntry> m_pools;
    std::unordered_map<void *, SBlockInfo> m_system_blocks; // the C heap's live blocks
};

SManager &manager() {
    static SManager *sp_manager = nullptr;
    if (!sp_manager) {
        sp_manager = new SManager; // lives until the process ends; modules may free late
        char const *backend = getenv("QOR_MM_BACKEND");
        sp_manager->m_backend = backend && strcmp(backend, "system") == 0 ? BACKEND_SYSTEM : BACKEND_MIMALLOC;
    }
    return *sp_manager;
}

bool is_system() { return manager().m_backend == BACKEND_SYSTEM; }

// The heap to allocate from: the selected one, or a default heap made on demand.
SHeap &allocation_heap() {
    SManager &mm = manager();
    if (mm.m_selected < 0 || mm.m_selected >= static_cast<int>(mm.m_heaps.size()))
        mm.m_selected = MMHeapCreate(0, 0);
    return mm.m_heaps[mm.m_selected];
}

// The heap that made a block, -1 for memory the manager didn't hand out.
int owner_of(void *_p, size_t *_p_size) {
    SManager &mm = manager();
    if (mm.m_backend == BACKEND_SYSTEM) {
        auto found = mm.m_system_blocks.find(_p);
        if (found == mm.m_system_blocks.end()) return -1;
        *_p_size = found->second.m_size;
        return found->second.m_heap;
    }
    if (!mi_is_in_heap_region(_p)) return -1;
    for (size_t i = 0; i < mm.m_heaps.size(); ++i)
        if (mm.m_heaps[i].mp_heap && mi_heap_contains_block(mm.m_heaps[i].mp_heap, _p)) {
            *_p_size = mi_usable_size(_p);
            return static_cast<int>(i);
        }
    return -1;
}

void count_allocation(SHeap &_heap, size_t _size) {
    ++_heap.m_stats.m_allocations;
    _heap.m_stats.m_live_bytes += _size;
}

} // namespace

extern "C" {

int MMHeapCreate(size_t, size_t) {
    SManager &mm = manager();
    SHeap heap = {};
    heap.m_stats.m_heap = static_cast<int>(mm.m_heaps.size());
    if (mm.m_backend == BACKEND_MIMALLOC) {
        heap.mp_heap = mi_heap_new();
        if (!heap.mp_heap) return -1;
    }
    mm.m_heaps.push_back(heap);
    return heap.m_stats.m_heap;
}

void MMHeapSelect(int _heap) { manager().m_selected = _heap; }

void *MMAllocate(size_t _size, int) {
    SManager &mm = manager();
    SHeap &heap = allocation_heap();
    int const heap_id = heap.m_stats.m_heap;
    if (mm.m_backend == BACKEND_SYSTEM) {
        void *p = malloc(_size ? _size : 1);
        if (!p) return nullptr;
        mm.m_system_blocks[p] = SBlockInfo{heap_id, _size};
        count_allocation(mm.m_heaps[heap_id], _size);
        return p;
    }
    void *p = mi_heap_malloc(heap.mp_heap, _size ? _size : 1);
    if (p) count_allocation(heap, mi_usable_size(p));
    return p;
}

void MMDeallocate(void *_p) {
    if (!_p) return;
    SManager &mm = manager();
    size_t size = 0;
    int const heap = owner_of(_p, &size);
    if (heap < 0) { // not ours: the C heap made it
        free(_p);
        return;
    }
    SMMHeapStats &stats = mm.m_heaps[heap].m_stats;
    ++stats.m_deallocations;
    stats.m_live_bytes -= size;
    if (mm.m_backend == BACKEND_SYSTEM) {
        mm.m_system_blocks.erase(_p);
        free(_p);
    } else {
        mi_free(_p);
    }
}

int MMExpand(void *_p, size_t _new_size) {
    if (!_p) return 0;
    SManager &mm = manager();
    size_t size = 0;
    int const heap = owner_of(_p, &size);
    if (heap < 0) return 0;
    if (mm.m_backend == BACKEND_SYSTEM) {
        // The C heap can't grow a block in place beyond what it already has room for.
        if (malloc_usable_size(_p) < _new_size) return 0;
        mm.m_heaps[heap].m_stats.m_live_bytes += _new_size - size;
        mm.m_system_blocks[_p].m_size = _new_size;
        return 1;
    }
    if (!mi_expand(_p, _new_size)) return 0;
    mm.m_heaps[heap].m_stats.m_live_bytes += mi_usable_size(_p) - size;
    return 1;
}

size_t MMGetBlockSize(void *_p) {
    if (!_p) return 0;
    if (is_system()) {
        auto found = manager().m_system_blocks.find(_p);
        return found != manager().m_system_blocks.end() ? found->second.m_size : malloc_usable_size(_p);
    }
    return mi_is_in_heap_region(_p) ? mi_usable_size(_p) : malloc_usable_size(_p);
}

int MMGetMemoryStatus(SMMHeapStats *_p_out) {
    if (!_p_out) return 0;
    SMMHeapStats total = {};
    total.m_heap = -1;
    for (SHeap const &heap : manager().m_heaps) {
        total.m_allocations += heap.m_stats.m_allocations;
        total.m_deallocations += heap.m_stats.m_deallocations;
        total.m_live_bytes += heap.m_stats.m_live_bytes;
    }
    total.m_small_allocations = manager().m_small_allocations;
    *_p_out = total;
    return 1;
}

int MMGetStatsForModules(SMMHeapStats *_p_out, int _max) {
    if (!_p_out || _max < 0) return -1;
    SManager &mm = manager();
    int const count = static_cast<int>(mm.m_heaps.size());
    for (int i = 0; i < count && i < _max; ++i) {
        _p_out[i] = mm.m_heaps[i].m_stats;
        _p_out[i].m_small_allocations = mm.m_small_allocations;
    }
    return count;
}

// mimalloc checks its own invariants as it goes; a walk over every block of every heap touches
// each page's metadata, which is where corruption shows.
int MMCheckMemoryCorrupt() {
    SManager &mm = manager();
    if (mm.m_backend == BACKEND_MIMALLOC) {
        for (SHeap const &heap : mm.m_heaps)
            mi_heap_visit_blocks(heap.mp_heap, true,
                                 [](mi_heap_t const *, mi_heap_area_t const *, void *, size_t, void *) { return true; },
                                 nullptr);
    }
    return 1;
}

int MMGetMemoryBlockStatus(void const *_p) {
    size_t size = 0;
    return _p && owner_of(const_cast<void *>(_p), &size) >= 0 ? 1 : 0;
}

void MMDumpMemoryStats(char const *_path) {
    FILE *out = _path ? fopen(_path, "w") : stdout;
    if (!out) return;
    SManager &mm = manager();
    fprintf(out, "backend %s, %zu heaps, %llu small allocations\n",
            mm.m_backend == BACKEND_SYSTEM ? "system" : "mimalloc", mm.m_heaps.size(),
            static_cast<unsigned long long>(mm.m_small_allocations));
    for (SHeap const &heap : mm.m_heaps)
        fprintf(out, "heap %d: %llu allocations, %llu deallocations, %llu live bytes\n", heap.m_stats.m_heap,
                static_cast<unsigned long long>(heap.m_stats.m_allocations),
                static_cast<unsigned long long>(heap.m_stats.m_deallocations),
                static_cast<unsigned long long>(heap.m_stats.m_live_bytes));
    for (SPoolEntry const &pool : mm.m_pools)
        fprintf(out, "pool %u x %u: %u blocks, %u used, %u bytes\n", pool.mp_record->m_element_size,
                pool.mp_record->m_block_elements, pool.mp_record->m_blocks, pool.mp_record->m_used,
                pool.mp_record->m_total_bytes);
    if (out != stdout) fclose(out);
}

void *MMSmallAlloc(size_t _size) {
    ++manager().m_small_allocations;
    return is_system() ? malloc(_size ? _size : 1) : mi_malloc(_size ? _size : 1);
}

void *MMSmallRealloc(void *_p, size_t _size) { return is_system() ? realloc(_p, _size) : mi_realloc(_p, _size); }

void MMSmallFree(void *_p) {
    if (!_p) return;
    if (is_system() || !mi_is_in_heap_region(_p))
        free(_p);
    else
        mi_free(_p);
}

size_t MMSmallMsize(void *_p) {
    if (!_p) return 0;
    return is_system() || !mi_is_in_heap_region(_p) ? malloc_usable_size(_p) : mi_usable_size(_p);
}

SFixedPool *MMGetFixedPool(size_t _element_size, size_t _block_elements) {
    SManager &mm = manager();
    for (SPoolEntry &entry : mm.m_pools)
        if (entry.m_requested_size == _element_size && entry.mp_record->m_block_elements == _block_elements) {
            ++entry.m_references;
            return entry.mp_record;
        }
    SFixedPool *p_record = static_cast<SFixedPool *>(calloc(1, sizeof(SFixedPool)));
    size_t const word = sizeof(void *);
    p_record->m_element_size = static_cast<uint32_t>(_element_size < word ? word : _element_size);
    p_record->m_block_elements = static_cast<uint32_t>(_block_elements ? _block_elements : 1);
    mm.m_pools.push_back(SPoolEntry{p_record, _element_size, 1});
    return p_record;
}

// At the last release the record goes, and with it the blocks the client linked into it: they
// came from the client's MMAllocate.
void MMReleaseFixedPool(SFixedPool *_p_pool) {
    SManager &mm = manager();
    for (size_t i = 0; i < mm.m_pools.size(); ++i) {
        SPoolEntry &entry = mm.m_pools[i];
        if (entry.mp_record != _p_pool) continue;
        if (--entry.m_references > 0) return;
        for (void *p_block = _p_pool->mp_blocks; p_block;) {
            void *p_next = *static_cast<void **>(p_block);
            MMDeallocate(p_block);
            p_block = p_next;
        }
        free(_p_pool);
        mm.m_pools.erase(mm.m_pools.begin() + static_cast<long>(i));
        return;
    }
}

} // extern "C"
