// The engine's memory manager.
//
//   state and backend   one SManager built at first use; the backend is read from QOR_MM_BACKEND then
//   block ownership     which heap made a block, and the size it is counted with
//   heaps               MMHeapCreate, MMHeapSelect, MMAllocate, MMDeallocate, MMExpand, MMGetBlockSize
//   statistics, checks  MMGetMemoryStatus, MMGetStatsForModules, MMCheckMemoryCorrupt, ...
//   small blocks        MMSmallAlloc and its family: one process-wide allocator
//   fixed pools         records shared by element size and count, counted by reference
//
// Backends:
//   mimalloc (default)  one mimalloc heap per MMHeapCreate; small blocks from mi_malloc. mimalloc's
//                       address map tells its memory from the C heap's, and a block's page tells
//                       its heap. Two kinds of block escape that and are kept in the table of
//                       tracked blocks instead: memory that mimalloc had to map outside the range
//                       its map covers (all of it under the address sanitizer, whose shadow takes
//                       that range), and a huge block whose page belongs to no heap (as some
//                       mimalloc versions make them, to be freed from any thread).
//   system              the C heap, so that sanitizers and valgrind see every block. Every block of
//                       MMAllocate is in the table of tracked blocks with its heap and size.
//
// Live bytes count each block with the size MMGetBlockSize reports for it: with the C heap the
// requested size (grown by MMExpand), with mimalloc the usable size, that is the request rounded
// up to mimalloc's size class.
//
// A block that no heap of the manager made (memory that crossed a module boundary, such as a
// buffer that libstdc++ allocated and the UI library frees) goes back to whoever made it: the C
// heap, or mimalloc for a small block.
//
// All calls come from one thread, as the client's contract says; nothing here locks.
#include "qorMemoryManager.h"

#include <mimalloc.h>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <malloc.h>
#include <unordered_map>
#include <vector>

namespace {

// ---------------------------------------------------------------------------------------------
// State and backend
// ---------------------------------------------------------------------------------------------

enum EBackend { BACKEND_MIMALLOC, BACKEND_SYSTEM };

// Owners of a block that are not heaps of the manager.
int const k_c_heap = -1;   // the C heap: another module's memory, or anything with the system backend
int const k_mimalloc = -2; // mimalloc outside the heaps: a small block

struct SHeap {
    mi_heap_t *mp_heap; // mimalloc backend only
    SMMHeapStats m_stats;
};

struct STrackedBlock {
    int m_owner;   // heap id, or k_mimalloc for a small block
    size_t m_size; // for a block of a heap, the size it is counted with
};

struct SPoolEntry {
    SFixedPool *mp_record;
    unsigned m_references;
};

// The manager lives on the C heap and is never destroyed: modules free their blocks and release
// their pools while the process ends, in no order the manager can know.
struct SManager {
    EBackend m_backend = BACKEND_MIMALLOC;
    std::vector<SHeap> m_heaps;
    int m_selected = -1;
    int m_default = -1; // the heap of allocations without a valid selection, made on demand
    uint64_t m_small_allocations = 0;
    std::unordered_map<void *, STrackedBlock> m_tracked;
    std::vector<SPoolEntry> m_pools;
};

SManager *gp_manager = nullptr; // zero before any constructor of the process runs

__attribute__((noinline)) void create_manager() {
    gp_manager = new SManager;
    char const *backend = getenv("QOR_MM_BACKEND");
    if (backend && strcmp(backend, "system") == 0) gp_manager->m_backend = BACKEND_SYSTEM;
}

inline SManager &manager() {
    if (__builtin_expect(!gp_manager, 0)) create_manager();
    return *gp_manager;
}

bool is_system() {
    return manager().m_backend == BACKEND_SYSTEM;
}

bool is_valid_heap(int _heap) {
    return _heap >= 0 && _heap < static_cast<int>(manager().m_heaps.size());
}

// ---------------------------------------------------------------------------------------------
// Block ownership
// ---------------------------------------------------------------------------------------------

struct SBlock {
    int m_owner;   // heap id, k_c_heap or k_mimalloc
    size_t m_size; // for a block of a heap, the size it is counted with
};

SBlock find_block(void const *_p) {
    SManager &mm = manager();
    bool const mapped = mm.m_backend == BACKEND_MIMALLOC && mi_is_in_heap_region(_p);
    if (mapped)
        for (SHeap const &heap : mm.m_heaps)
            if (mi_heap_contains_block(heap.mp_heap, _p))
                return SBlock{heap.m_stats.m_heap, mi_usable_size(_p)};
    auto found = mm.m_tracked.find(const_cast<void *>(_p));
    if (found != mm.m_tracked.end()) return SBlock{found->second.m_owner, found->second.m_size};
    return SBlock{mapped ? k_mimalloc : k_c_heap, 0};
}

// The owner of a small block; cheaper than find_block, since small blocks belong to no heap.
int small_block_owner(void const *_p) {
    if (is_system()) return k_c_heap;
    if (mi_is_in_heap_region(_p)) return k_mimalloc;
    return manager().m_tracked.count(const_cast<void *>(_p)) ? k_mimalloc : k_c_heap;
}

// Keeps a fresh mimalloc block in the table when its address can't tell whose it is. _p_heap is
// the heap that made it, null for a small block.
void track_if_needed(void *_p, SHeap const *_p_heap, size_t _size, size_t _counted) {
    bool const outside_map = !mi_is_in_heap_region(_p);
    // Only a huge block can have a page outside its heap.
    bool const outside_heap =
        _p_heap && _size > MI_SMALL_SIZE_MAX && !mi_heap_contains_block(_p_heap->mp_heap, _p);
    if (outside_map || outside_heap)
        manager().m_tracked[_p] = STrackedBlock{_p_heap ? _p_heap->m_stats.m_heap : k_mimalloc, _counted};
}

// Gives memory back to the allocator that made it, and forgets it.
void release_memory(void *_p, int _owner) {
    SManager &mm = manager();
    if (mm.m_backend == BACKEND_SYSTEM || _owner == k_c_heap)
        free(_p);
    else
        mi_free(_p);
    if (!mm.m_tracked.empty()) mm.m_tracked.erase(_p);
}

// The heap to allocate from: the selected one, or the default heap.
SHeap *allocation_heap() {
    SManager &mm = manager();
    if (is_valid_heap(mm.m_selected)) return &mm.m_heaps[mm.m_selected];
    if (mm.m_default < 0) mm.m_default = MMHeapCreate(0, 0);
    return mm.m_default >= 0 ? &mm.m_heaps[mm.m_default] : nullptr;
}

// A fresh block of _size bytes from the heap, counted; null if the allocator has none.
void *allocate_block(SHeap &_heap, size_t _size) {
    SManager &mm = manager();
    void *p = nullptr;
    size_t counted = _size;
    if (mm.m_backend == BACKEND_SYSTEM) {
        p = malloc(_size ? _size : 1);
        if (!p) return nullptr;
        mm.m_tracked[p] = STrackedBlock{_heap.m_stats.m_heap, _size};
    } else {
        p = mi_heap_malloc(_heap.mp_heap, _size ? _size : 1);
        if (!p) return nullptr;
        counted = mi_usable_size(p);
        track_if_needed(p, &_heap, _size, counted);
    }
    ++_heap.m_stats.m_allocations;
    _heap.m_stats.m_live_bytes += counted;
    return p;
}

// ---------------------------------------------------------------------------------------------
// Walking the heaps
// ---------------------------------------------------------------------------------------------

// What a walk over one heap found.
struct SHeapWalk {
    void const *mp_wanted = nullptr; // a block to look for, or null
    bool m_found = false;
    uint64_t m_blocks = 0;
    uint64_t m_bytes = 0;
};

bool visit_block(mi_heap_t const *, mi_heap_area_t const *, void *_p_block, size_t, void *_p_walk) {
    if (!_p_block) return true; // the area itself
    SHeapWalk &walk = *static_cast<SHeapWalk *>(_p_walk);
    ++walk.m_blocks;
    walk.m_bytes += mi_usable_size(_p_block);
    if (_p_block == walk.mp_wanted) walk.m_found = true;
    return true;
}

// Counts the live blocks of a heap: those in its mimalloc pages, and the tracked ones outside them.
SHeapWalk walk_heap(int _heap, void const *_p_wanted) {
    SManager &mm = manager();
    mi_heap_t *p_pages = mm.m_heaps[_heap].mp_heap; // null with the system backend
    SHeapWalk walk;
    walk.mp_wanted = _p_wanted;
    if (p_pages) mi_heap_visit_blocks(p_pages, true, visit_block, &walk);
    for (auto const &tracked : mm.m_tracked) {
        if (tracked.second.m_owner != _heap) continue;
        if (p_pages && mi_heap_contains_block(p_pages, tracked.first)) continue; // walked already
        ++walk.m_blocks;
        walk.m_bytes += tracked.second.m_size;
        if (tracked.first == _p_wanted) walk.m_found = true;
    }
    return walk;
}

void write_stats(FILE *_p_out) {
    SManager &mm = manager();
    fprintf(_p_out, "backend %s, %zu heaps, %llu small allocations\n", is_system() ? "system" : "mimalloc",
            mm.m_heaps.size(), static_cast<unsigned long long>(mm.m_small_allocations));
    for (SHeap const &heap : mm.m_heaps)
        fprintf(_p_out, "heap %d: %llu allocations, %llu deallocations, %llu live bytes\n",
                heap.m_stats.m_heap, static_cast<unsigned long long>(heap.m_stats.m_allocations),
                static_cast<unsigned long long>(heap.m_stats.m_deallocations),
                static_cast<unsigned long long>(heap.m_stats.m_live_bytes));
    for (SPoolEntry const &pool : mm.m_pools)
        fprintf(_p_out, "pool %u x %u: %u references, %u blocks, %u used, %u bytes\n",
                pool.mp_record->m_element_size, pool.mp_record->m_block_elements, pool.m_references,
                pool.mp_record->m_blocks, pool.mp_record->m_used, pool.mp_record->m_total_bytes);
}

} // namespace

extern "C" {

// ---------------------------------------------------------------------------------------------
// Heaps
// ---------------------------------------------------------------------------------------------

// The sizes are hints of a fixed-size heap; both backends grow on demand.
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

void MMHeapSelect(int _heap) {
    manager().m_selected = _heap;
}

void *MMAllocate(size_t _size, int) {
    SHeap *p_heap = allocation_heap();
    return p_heap ? allocate_block(*p_heap, _size) : nullptr;
}

void MMDeallocate(void *_p) {
    if (!_p) return;
    SManager &mm = manager();
    SBlock const block = find_block(_p);
    if (block.m_owner >= 0) {
        SMMHeapStats &stats = mm.m_heaps[block.m_owner].m_stats;
        ++stats.m_deallocations;
        stats.m_live_bytes -= block.m_size;
    }
    release_memory(_p, block.m_owner);
}

// Blocks don't shrink: a size within the block succeeds as it is.
int MMExpand(void *_p, size_t _new_size) {
    if (!_p) return 0;
    SManager &mm = manager();
    SBlock const block = find_block(_p);
    if (block.m_owner < 0) return 0;
    if (_new_size <= block.m_size) return 1;
    if (mm.m_backend == BACKEND_MIMALLOC) return mi_expand(_p, _new_size) ? 1 : 0;
    // The C heap grows nothing in place; a block may already have the room, though.
    if (malloc_usable_size(_p) < _new_size) return 0;
    mm.m_tracked[_p].m_size = _new_size;
    mm.m_heaps[block.m_owner].m_stats.m_live_bytes += _new_size - block.m_size;
    return 1;
}

size_t MMGetBlockSize(void *_p) {
    if (!_p) return 0;
    SBlock const block = find_block(_p);
    if (block.m_owner >= 0) return block.m_size;
    return block.m_owner == k_mimalloc ? mi_usable_size(_p) : malloc_usable_size(_p);
}

// ---------------------------------------------------------------------------------------------
// Statistics and checks
// ---------------------------------------------------------------------------------------------

// The totals carry heap id -1.
int MMGetMemoryStatus(SMMHeapStats *_p_out) {
    if (!_p_out) return 0;
    SManager &mm = manager();
    SMMHeapStats total = {};
    total.m_heap = -1;
    for (SHeap const &heap : mm.m_heaps) {
        total.m_allocations += heap.m_stats.m_allocations;
        total.m_deallocations += heap.m_stats.m_deallocations;
        total.m_live_bytes += heap.m_stats.m_live_bytes;
    }
    total.m_small_allocations = mm.m_small_allocations;
    *_p_out = total;
    return 1;
}

// A null array with _max 0 asks for the number of heaps only.
int MMGetStatsForModules(SMMHeapStats *_p_out, int _max) {
    if (_max < 0 || (!_p_out && _max > 0)) return -1;
    SManager &mm = manager();
    int const count = static_cast<int>(mm.m_heaps.size());
    for (int i = 0; i < count && i < _max; ++i) {
        _p_out[i] = mm.m_heaps[i].m_stats;
        _p_out[i].m_small_allocations = mm.m_small_allocations;
    }
    return count;
}

// Every heap is walked and what the walk finds must agree with the statistics: the number of live
// blocks and their bytes. With mimalloc the walk goes through each page's free lists, where a
// block freed behind the manager's back or a broken list shows. With the C heap the walk covers the
// table of tracked blocks; the blocks themselves are the business of the sanitizers and valgrind
// that run with that backend.
int MMCheckMemoryCorrupt() {
    SManager &mm = manager();
    for (SHeap const &heap : mm.m_heaps) {
        SHeapWalk const walk = walk_heap(heap.m_stats.m_heap, nullptr);
        if (walk.m_blocks != heap.m_stats.m_allocations - heap.m_stats.m_deallocations) return 0;
        if (walk.m_bytes != heap.m_stats.m_live_bytes) return 0;
    }
    return 1;
}

// With mimalloc, a block in a heap's page is looked for among the page's live blocks, so a block
// already freed is told apart from a live one.
int MMGetMemoryBlockStatus(void const *_p) {
    if (!_p) return 0;
    SBlock const block = find_block(_p);
    if (block.m_owner < 0) return 0;
    if (is_system()) return 1;
    return walk_heap(block.m_owner, _p).m_found ? 1 : 0;
}

void MMDumpMemoryStats(char const *_path) {
    if (!_path) {
        write_stats(stdout);
        fflush(stdout);
        return;
    }
    FILE *p_file = fopen(_path, "w");
    if (!p_file) return;
    write_stats(p_file);
    fclose(p_file);
}

// ---------------------------------------------------------------------------------------------
// Small blocks
// ---------------------------------------------------------------------------------------------

// A size of 0 gives a block of its own, as MMAllocate does.
void *MMSmallAlloc(size_t _size) {
    ++manager().m_small_allocations;
    if (is_system()) return malloc(_size ? _size : 1);
    void *p = mi_malloc(_size ? _size : 1);
    if (p) track_if_needed(p, nullptr, _size, 0);
    return p;
}

// A block of the C heap stays on the C heap.
void *MMSmallRealloc(void *_p, size_t _size) {
    size_t const size = _size ? _size : 1;
    if (_p && small_block_owner(_p) == k_c_heap) return realloc(_p, size);
    manager().m_tracked.erase(_p);
    void *p = mi_realloc(_p, size);
    if (p) track_if_needed(p, nullptr, size, 0);
    return p;
}

void MMSmallFree(void *_p) {
    if (_p) release_memory(_p, small_block_owner(_p));
}

size_t MMSmallMsize(void *_p) {
    if (!_p) return 0;
    return small_block_owner(_p) == k_c_heap ? malloc_usable_size(_p) : mi_usable_size(_p);
}

// ---------------------------------------------------------------------------------------------
// Fixed pools
// ---------------------------------------------------------------------------------------------

// Requests that normalise to the same element size and count share one record.
SFixedPool *MMGetFixedPool(size_t _element_size, size_t _block_elements) {
    SManager &mm = manager();
    uint32_t const element_size =
        static_cast<uint32_t>(_element_size < sizeof(void *) ? sizeof(void *) : _element_size);
    uint32_t const block_elements = static_cast<uint32_t>(_block_elements ? _block_elements : 1);
    for (SPoolEntry &entry : mm.m_pools)
        if (entry.mp_record->m_element_size == element_size &&
            entry.mp_record->m_block_elements == block_elements) {
            ++entry.m_references;
            return entry.mp_record;
        }
    SFixedPool *p_record = static_cast<SFixedPool *>(calloc(1, sizeof(SFixedPool)));
    if (!p_record) return nullptr;
    p_record->m_element_size = element_size;
    p_record->m_block_elements = block_elements;
    mm.m_pools.push_back(SPoolEntry{p_record, 1});
    return p_record;
}

// The client allocates the blocks with MMAllocate and links them into the record. At the last
// release they go back through MMDeallocate, so a pool released while the process ends leaves
// nothing behind; the record goes with them. An unknown record is ignored.
void MMReleaseFixedPool(SFixedPool *_p_pool) {
    SManager &mm = manager();
    for (size_t i = 0; i < mm.m_pools.size(); ++i) {
        if (mm.m_pools[i].mp_record != _p_pool) continue;
        if (--mm.m_pools[i].m_references > 0) return;
        mm.m_pools.erase(mm.m_pools.begin() + static_cast<std::ptrdiff_t>(i));
        for (void *p_block = _p_pool->mp_blocks; p_block;) {
            void *p_next = *static_cast<void **>(p_block);
            MMDeallocate(p_block);
            p_block = p_next;
        }
        free(_p_pool);
        return;
    }
}

} // extern "C"
