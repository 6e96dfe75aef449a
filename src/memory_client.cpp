// The memory client: binds the engine's memory manager by name at the first allocation or pool
// handle and routes every allocation of this module to it.
//
//   state and loading     the entry table, load_manager
//   allocation routes     first-allocation path, steady path, realloc
//   operator new/delete   module-local (hidden by qorui.map), so only this library changes heap
//   fixed pools           SPool: take, give, add_block
#include "qor_memory.h"

#include "qorMemoryManager.h"
#include "qor_platform.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>

namespace qorui {

// ---------------------------------------------------------------------------------------------
// State and loading
// ---------------------------------------------------------------------------------------------
namespace {

// The manager's file name as every message spells it. QOR_MM_LIBRARY may name another file to
// load in its place (tests use it to load a missing or incomplete manager).
char const k_manager_file[] = "libqorMemoryManager.so";

struct SEntryPoints {
    decltype(&MMHeapCreate) heap_create;
    decltype(&MMHeapSelect) heap_select;
    decltype(&MMAllocate) allocate;
    decltype(&MMDeallocate) deallocate;
    decltype(&MMExpand) expand;
    decltype(&MMGetBlockSize) get_block_size;
    decltype(&MMGetMemoryStatus) get_memory_status;
    decltype(&MMGetStatsForModules) get_stats_for_modules;
    decltype(&MMCheckMemoryCorrupt) check_memory_corrupt;
    decltype(&MMGetMemoryBlockStatus) get_memory_block_status;
    decltype(&MMDumpMemoryStats) dump_memory_stats;
    decltype(&MMSmallAlloc) small_alloc;
    decltype(&MMSmallRealloc) small_realloc;
    decltype(&MMSmallFree) small_free;
    decltype(&MMSmallMsize) small_msize;
    decltype(&MMGetFixedPool) get_fixed_pool;
    decltype(&MMReleaseFixedPool) release_fixed_pool;
};

// All of it is zero or constant before any constructor of the process runs.
void *g_module = nullptr;
SEntryPoints g_mm = {};
int g_heap = -1;
size_t const k_heap_size = 0x1000000;
size_t const k_heap_reserve = 0x800000;

void *first_allocation(size_t _size);
void *steady_allocation(size_t _size);
void *(*g_route)(size_t) = first_allocation;

// The entry points in lookup order, with the slot each one fills.
struct SEntry {
    char const *mp_name;
    void **mp_slot;
};

void fail_load(char const *_text, char const *_caption) {
    qorplatform::message_box(_text, _caption);
    exit(1);
}

void load_manager() {
    SEntry const entries[] = {
        {"MMHeapCreate", reinterpret_cast<void **>(&g_mm.heap_create)},
        {"MMHeapSelect", reinterpret_cast<void **>(&g_mm.heap_select)},
        {"MMAllocate", reinterpret_cast<void **>(&g_mm.allocate)},
        {"MMDeallocate", reinterpret_cast<void **>(&g_mm.deallocate)},
        {"MMExpand", reinterpret_cast<void **>(&g_mm.expand)},
        {"MMGetBlockSize", reinterpret_cast<void **>(&g_mm.get_block_size)},
        {"MMGetMemoryStatus", reinterpret_cast<void **>(&g_mm.get_memory_status)},
        {"MMGetStatsForModules", reinterpret_cast<void **>(&g_mm.get_stats_for_modules)},
        {"MMCheckMemoryCorrupt", reinterpret_cast<void **>(&g_mm.check_memory_corrupt)},
        {"MMGetMemoryBlockStatus", reinterpret_cast<void **>(&g_mm.get_memory_block_status)},
        {"MMDumpMemoryStats", reinterpret_cast<void **>(&g_mm.dump_memory_stats)},
        {"MMSmallAlloc", reinterpret_cast<void **>(&g_mm.small_alloc)},
        {"MMSmallRealloc", reinterpret_cast<void **>(&g_mm.small_realloc)},
        {"MMSmallFree", reinterpret_cast<void **>(&g_mm.small_free)},
        {"MMSmallMsize", reinterpret_cast<void **>(&g_mm.small_msize)},
        {"MMGetFixedPool", reinterpret_cast<void **>(&g_mm.get_fixed_pool)},
        {"MMReleaseFixedPool", reinterpret_cast<void **>(&g_mm.release_fixed_pool)},
    };

    char const *file = getenv("QOR_MM_LIBRARY");
    void *module = qorplatform::load_library(file && *file ? file : k_manager_file);
    if (!module) fail_load("libqorMemoryManager.so load error!", "MemoryManager");

    for (SEntry const &entry : entries) {
        *entry.mp_slot = qorplatform::get_proc_address(module, entry.mp_name);
        if (!*entry.mp_slot) {
            char text[160];
            snprintf(text, sizeof(text), "%s load error!\nCannot find function '%s'", k_manager_file,
                     entry.mp_name + 2); // the name without "MM"
            fail_load(text, "qorMemoryManager error");
        }
    }
    g_module = module;
    g_route = steady_allocation;
}

void ensure_loaded() {
    if (!g_module) load_manager();
}

// ---------------------------------------------------------------------------------------------
// Allocation routes
// ---------------------------------------------------------------------------------------------

void *first_allocation(size_t _size) {
    load_manager();
    if (g_heap == -1) g_heap = g_mm.heap_create(k_heap_size, k_heap_reserve);
    g_mm.heap_select(g_heap);
    return g_mm.allocate(_size, 0);
}

// The selection is repeated on every allocation: other modules select their own heaps between.
void *steady_allocation(size_t _size) {
    if (g_heap == -1) g_heap = g_mm.heap_create(k_heap_size, k_heap_reserve);
    g_mm.heap_select(g_heap);
    return g_mm.allocate(_size, 0);
}

} // namespace

void *qor_malloc(size_t _size) { return g_route(_size); }

void *qor_calloc(size_t _count, size_t _size) {
    if (_size && _count > SIZE_MAX / _size) return nullptr;
    void *p = g_route(_count * _size);
    if (p) memset(p, 0, _count * _size);
    return p;
}

void qor_free(void *_p) {
    if (!_p) return;
    ensure_loaded();
    g_mm.deallocate(_p);
}

size_t qor_msize(void *_p) {
    if (!_p) return 0;
    ensure_loaded();
    return g_mm.get_block_size(_p);
}

void *qor_realloc(void *_p, size_t _size) {
    if (_size == 0) {
        qor_free(_p);
        return nullptr;
    }
    if (!_p) return qor_malloc(_size);
    size_t const old_size = qor_msize(_p);
    if (_size <= old_size) return _p; // blocks don't shrink
    if (g_mm.expand(_p, _size)) return _p;
    void *p_new = qor_malloc(_size);
    memcpy(p_new, _p, old_size);
    qor_free(_p);
    return p_new;
}

void *qor_small_alloc(size_t _size) {
    ensure_loaded();
    return g_mm.small_alloc(_size);
}

void qor_small_free(void *_p) {
    if (!_p) return;
    ensure_loaded();
    g_mm.small_free(_p);
}

int qor_get_memory_status(SMMHeapStats *_p_out) { return g_module ? g_mm.get_memory_status(_p_out) : 0; }

int qor_get_stats_for_modules(SMMHeapStats *_p_out, int _max) {
    return g_module ? g_mm.get_stats_for_modules(_p_out, _max) : -1;
}

int qor_get_memory_block_status(void const *_p) { return g_module ? g_mm.get_memory_block_status(_p) : 0; }

bool qor_check_memory_corrupt() {
    if (!g_module) return false;
    g_mm.check_memory_corrupt();
    return true;
}

int qor_heap_id() { return g_heap; }

// ---------------------------------------------------------------------------------------------
// Fixed pools
// ---------------------------------------------------------------------------------------------
namespace fixed_pool_helpers {

namespace {
// Elements keep pointer alignment: the first word of a free element is a link.
size_t pointer_aligned(size_t _size) {
    size_t const word = sizeof(void *);
    return _size < word ? word : (_size + word - 1) / word * word;
}
} // namespace

// A take by an earlier static constructor may have acquired the record already; the manager hands
// out the same record for the same sizes, so acquiring again keeps those elements in it.
SPool::SPool(size_t _element_size, size_t _block_elements) : mp_pool(nullptr) {
    acquire(_element_size, _block_elements);
}

SPool::~SPool() {
    if (mp_pool) g_mm.release_fixed_pool(mp_pool);
    mp_pool = nullptr;
}

void SPool::acquire(size_t _element_size, size_t _block_elements) {
    ensure_loaded();
    mp_pool = g_mm.get_fixed_pool(pointer_aligned(_element_size), _block_elements ? _block_elements : 1);
}

void *SPool::take(size_t _element_size, size_t _block_elements) {
    if (!mp_pool) acquire(_element_size, _block_elements);
    SFixedPool &pool = *mp_pool;
    if (!pool.mp_free) add_block();
    ++pool.m_used;
    void *p_element = pool.mp_free;
    pool.mp_free = *static_cast<void **>(p_element);
    return p_element;
}

void SPool::give(void *_p) {
    SFixedPool &pool = *mp_pool;
    *static_cast<void **>(_p) = pool.mp_free;
    pool.mp_free = _p;
    --pool.m_used;
}

// A block is one header word that links to the previous block, then the elements, linked in
// address order so that a fresh block hands them out rising.
void SPool::add_block() {
    SFixedPool &pool = *mp_pool;
    size_t const element_size = pool.m_element_size;
    size_t const count = pool.m_block_elements;
    size_t const bytes = element_size * count + sizeof(void *);

    char *p_block = static_cast<char *>(::operator new(bytes));
    ++pool.m_blocks;
    pool.m_total_bytes += static_cast<uint32_t>(bytes);
    *reinterpret_cast<void **>(p_block) = pool.mp_blocks;
    pool.mp_blocks = p_block;

    char *p_first = p_block + sizeof(void *);
    for (size_t i = 0; i + 1 < count; ++i)
        *reinterpret_cast<void **>(p_first + i * element_size) = p_first + (i + 1) * element_size;
    *reinterpret_cast<void **>(p_first + (count - 1) * element_size) = pool.mp_free;
    pool.mp_free = p_first;
}

} // namespace fixed_pool_helpers
} // namespace qorui

// ---------------------------------------------------------------------------------------------
// operator new and delete of this module. qorui.map keeps them local: the host, libstdc++ and
// LuaJIT allocate as they always do.
// ---------------------------------------------------------------------------------------------

void *operator new(size_t _size) { return qorui::qor_malloc(_size); }
void *operator new[](size_t _size) { return qorui::qor_malloc(_size); }
void *operator new(size_t _size, std::nothrow_t const &) noexcept { return qorui::qor_malloc(_size); }
void *operator new[](size_t _size, std::nothrow_t const &) noexcept { return qorui::qor_malloc(_size); }
void operator delete(void *_p) noexcept { qorui::qor_free(_p); }
void operator delete[](void *_p) noexcept { qorui::qor_free(_p); }
void operator delete(void *_p, size_t) noexcept { qorui::qor_free(_p); }
void operator delete[](void *_p, size_t) noexcept { qorui::qor_free(_p); }
void operator delete(void *_p, std::nothrow_t const &) noexcept { qorui::qor_free(_p); }
void operator delete[](void *_p, std::nothrow_t const &) noexcept { qorui::qor_free(_p); }
