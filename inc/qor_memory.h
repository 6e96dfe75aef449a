// The library's memory: every byte comes from the engine's memory manager, which the client loads
// by name at the first allocation or pool handle.
//
//   routed allocation   qor_malloc, qor_calloc, qor_realloc, qor_free, qor_msize; the library's
//                       operator new and delete (module-local, see src/memory_client.cpp)
//   fixed pools         fixed_pool_helpers::SPool, CPooled<T,N>
//   containers          qor_small_allocator, qor_vector, qor_map, string, wstring
#pragma once
#include <cstddef>
#include <map>
#include <new>
#include <string>
#include <vector>

struct SFixedPool;
struct SMMHeapStats;

namespace qorui {

// ---------------------------------------------------------------------------------------------
// Routed allocation
// ---------------------------------------------------------------------------------------------

// A block of the library's heap; null when the manager has none.
void *qor_malloc(size_t _size);
// As qor_malloc, zero-filled; null when the product overflows.
void *qor_calloc(size_t _count, size_t _size);
// Size 0 frees and gives null; null allocates; a block never shrinks; a block that can't grow in
// place is moved with its old content.
void *qor_realloc(void *_p, size_t _size);
// Gives a block of qor_malloc back; null is ignored.
void qor_free(void *_p);
// The usable size of a block in bytes; 0 for null.
size_t qor_msize(void *_p);

// The manager's small-block allocator: blocks that only qor_small_free may give back
// (null is ignored there).
// @{
void *qor_small_alloc(size_t _size);
void qor_small_free(void *_p);
// @}

// The manager's MMGetMemoryStatus, MMGetStatsForModules and MMGetMemoryBlockStatus; 0 (or -1 for
// the per-module statistics) while the manager isn't loaded.
// @{
int qor_get_memory_status(SMMHeapStats *_p_out);
int qor_get_stats_for_modules(SMMHeapStats *_p_out, int _max);
int qor_get_memory_block_status(void const *_p);
// @}
// False without calling anything while the manager isn't loaded, true after the call.
bool qor_check_memory_corrupt();

// This module's heap id, -1 until the first allocation.
int qor_heap_id();

// ---------------------------------------------------------------------------------------------
// Fixed pools
// ---------------------------------------------------------------------------------------------

namespace fixed_pool_helpers {

// A handle on the manager's pool record for one element size and block count. Built during
// static initialisation; a take that comes before the construction (from an earlier static
// constructor) acquires the record itself.
struct SPool {
    SFixedPool *mp_pool; // zero before construction: statics are zeroed before any constructor runs

    // Acquires the record for elements of that size in blocks of that many, unless a take came
    // first.
    SPool(size_t _element_size, size_t _block_elements);
    // Releases the record to the manager.
    ~SPool();
    SPool(SPool const &) = delete;
    SPool &operator=(SPool const &) = delete;

    // The most recently given-back element first; a new block when the free list is empty. The
    // sizes are those of the constructor, repeated for a take that comes before it.
    void *take(size_t _element_size, size_t _block_elements);
    // Puts an element of this pool back at the head of the free list.
    void give(void *_p);

private:
    void acquire(size_t _element_size, size_t _block_elements);
    void add_block();
};

} // namespace fixed_pool_helpers

// Gives T pooled allocation: T derives from CPooled<T,N>, and single objects of T come from a
// pool of blocks of N elements. Arrays bypass the pool.
template <class T, unsigned N>
class CPooled {
public:
    // An element of the pool; a new block of N elements when the free list is empty.
    static void *operator new(size_t) { return m_pool.take(sizeof(T), N); }
    // The same, for new (std::nothrow).
    static void *operator new(size_t, std::nothrow_t const &) noexcept { return m_pool.take(sizeof(T), N); }
    // Placement: _p itself.
    static void *operator new(size_t, void *_p) noexcept { return _p; }
    // Gives the element back to the pool; null is ignored.
    static void operator delete(void *_p) {
        if (_p) m_pool.give(_p);
    }
    // The same, for a nothrow new whose constructor threw.
    static void operator delete(void *_p, std::nothrow_t const &) noexcept {
        if (_p) m_pool.give(_p);
    }
    // Placement: nothing to free.
    static void operator delete(void *, void *) noexcept {}

    // Arrays bypass the pool: the library's global operator new[] and delete[].
    static void *operator new[](size_t _size) { return ::operator new[](_size); }
    // The same, for new (std::nothrow) [].
    static void *operator new[](size_t _size, std::nothrow_t const &_nt) noexcept {
        return ::operator new[](_size, _nt);
    }
    // Placement: _p itself.
    static void *operator new[](size_t, void *_p) noexcept { return _p; }
    // Gives an array back to the library's heap.
    static void operator delete[](void *_p) { ::operator delete[](_p); }
    // The same, for a nothrow new[] whose constructor threw.
    static void operator delete[](void *_p, std::nothrow_t const &_nt) noexcept {
        ::operator delete[](_p, _nt);
    }
    // Placement: nothing to free.
    static void operator delete[](void *, void *) noexcept {}

    // The one pool of T.
    static fixed_pool_helpers::SPool m_pool;
};

template <class T, unsigned N>
fixed_pool_helpers::SPool CPooled<T, N>::m_pool(sizeof(T), N);

// ---------------------------------------------------------------------------------------------
// Containers
// ---------------------------------------------------------------------------------------------

// A standard allocator over the manager's small-block allocator.
template <class T>
class qor_small_allocator {
public:
    // The element type.
    typedef T value_type;

    // Stateless: every instance is the same.
    // @{
    qor_small_allocator() noexcept {}
    template <class U>
    qor_small_allocator(qor_small_allocator<U> const &) noexcept {}
    // @}

    // Room for _n elements, and its release; null when the manager has none.
    // @{
    T *allocate(size_t _n) { return static_cast<T *>(qor_small_alloc(_n * sizeof(T))); }
    void deallocate(T *_p, size_t) noexcept { qor_small_free(_p); }
    // @}

    template <class U>
    // Any two instances are interchangeable.
    // @{
    bool operator==(qor_small_allocator<U> const &) const noexcept {
        return true;
    }
    template <class U>
    bool operator!=(qor_small_allocator<U> const &) const noexcept {
        return false;
        // @}
    }
};

// A standard allocator over the library's operator new: the routed heap. Containers of the
// library's public types carry it, so that storage allocated in the library and freed by inline
// code in another module (or the other way round) always meets the same heap.
template <class T>
class qor_allocator {
public:
    // The element type.
    typedef T value_type;

    // Stateless: every instance is the same.
    // @{
    qor_allocator() noexcept {}
    template <class U>
    qor_allocator(qor_allocator<U> const &) noexcept {}
    // @}

    // Room for _n elements (std::bad_alloc when the heap has none), and its release.
    // @{
    T *allocate(size_t _n) {
        void *p = qor_malloc(_n * sizeof(T));
        if (!p) throw std::bad_alloc();
        return static_cast<T *>(p);
    }
    void deallocate(T *_p, size_t) noexcept { qor_free(_p); }
    // @}

    template <class U>
    // Any two instances are interchangeable.
    // @{
    bool operator==(qor_allocator<U> const &) const noexcept {
        return true;
    }
    template <class U>
    bool operator!=(qor_allocator<U> const &) const noexcept {
        return false;
        // @}
    }
};

template <class T>
// A vector on the library's heap.
using qor_vector = std::vector<T, qor_allocator<T>>;

template <class K, class V, class Compare = std::less<K>>
// A map on the small-block allocator.
using qor_map = std::map<K, V, Compare, qor_small_allocator<std::pair<K const, V>>>;

// 8-bit text on the small-block allocator.
typedef std::basic_string<char, std::char_traits<char>, qor_small_allocator<char>> string;
// 16-bit text units; never wchar_t, which has 32 bits here.
typedef std::basic_string<unsigned short, std::char_traits<unsigned short>,
                          qor_small_allocator<unsigned short>>
    wstring;

} // namespace qorui
