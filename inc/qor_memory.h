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

void *qor_malloc(size_t _size);
void *qor_calloc(size_t _count, size_t _size);
// Size 0 frees and gives null; null allocates; a block never shrinks; a block that can't grow in
// place is moved with its old content.
void *qor_realloc(void *_p, size_t _size);
void qor_free(void *_p);
size_t qor_msize(void *_p);

void *qor_small_alloc(size_t _size);
void qor_small_free(void *_p);

// Status wrappers: 0 (or -1 for the per-module statistics) while the manager isn't loaded.
int qor_get_memory_status(SMMHeapStats *_p_out);
int qor_get_stats_for_modules(SMMHeapStats *_p_out, int _max);
int qor_get_memory_block_status(void const *_p);
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

    SPool(size_t _element_size, size_t _block_elements);
    ~SPool();
    SPool(SPool const &) = delete;
    SPool &operator=(SPool const &) = delete;

    // The most recently given-back element first; a new block when the free list is empty. The
    // sizes are those of the constructor, repeated for a take that comes before it.
    void *take(size_t _element_size, size_t _block_elements);
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
    static void *operator new(size_t) { return m_pool.take(sizeof(T), N); }
    static void *operator new(size_t, std::nothrow_t const &) noexcept { return m_pool.take(sizeof(T), N); }
    static void *operator new(size_t, void *_p) noexcept { return _p; }
    static void operator delete(void *_p) {
        if (_p) m_pool.give(_p);
    }
    static void operator delete(void *_p, std::nothrow_t const &) noexcept {
        if (_p) m_pool.give(_p);
    }
    static void operator delete(void *, void *) noexcept {}

    static void *operator new[](size_t _size) { return ::operator new[](_size); }
    static void *operator new[](size_t _size, std::nothrow_t const &_nt) noexcept {
        return ::operator new[](_size, _nt);
    }
    static void *operator new[](size_t, void *_p) noexcept { return _p; }
    static void operator delete[](void *_p) { ::operator delete[](_p); }
    static void operator delete[](void *_p, std::nothrow_t const &_nt) noexcept {
        ::operator delete[](_p, _nt);
    }
    static void operator delete[](void *, void *) noexcept {}

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
    typedef T value_type;

    qor_small_allocator() noexcept {}
    template <class U>
    qor_small_allocator(qor_small_allocator<U> const &) noexcept {}

    T *allocate(size_t _n) { return static_cast<T *>(qor_small_alloc(_n * sizeof(T))); }
    void deallocate(T *_p, size_t) noexcept { qor_small_free(_p); }

    template <class U>
    bool operator==(qor_small_allocator<U> const &) const noexcept {
        return true;
    }
    template <class U>
    bool operator!=(qor_small_allocator<U> const &) const noexcept {
        return false;
    }
};

// A standard allocator over the library's operator new: the routed heap. Containers of the
// library's public types carry it, so that storage allocated in the library and freed by inline
// code in another module (or the other way round) always meets the same heap.
template <class T>
class qor_allocator {
public:
    typedef T value_type;

    qor_allocator() noexcept {}
    template <class U>
    qor_allocator(qor_allocator<U> const &) noexcept {}

    T *allocate(size_t _n) {
        void *p = qor_malloc(_n * sizeof(T));
        if (!p) throw std::bad_alloc();
        return static_cast<T *>(p);
    }
    void deallocate(T *_p, size_t) noexcept { qor_free(_p); }

    template <class U>
    bool operator==(qor_allocator<U> const &) const noexcept {
        return true;
    }
    template <class U>
    bool operator!=(qor_allocator<U> const &) const noexcept {
        return false;
    }
};

template <class T>
using qor_vector = std::vector<T, qor_allocator<T>>;

template <class K, class V, class Compare = std::less<K>>
using qor_map = std::map<K, V, Compare, qor_small_allocator<std::pair<K const, V>>>;

typedef std::basic_string<char, std::char_traits<char>, qor_small_allocator<char>> string;
// 16-bit text units; never wchar_t, which has 32 bits here.
typedef std::basic_string<unsigned short, std::char_traits<unsigned short>,
                          qor_small_allocator<unsigned short>>
    wstring;

} // namespace qorui
