// A malloc that counts: the C allocation functions of the whole process are defined here and
// forward to glibc's own, counting the calls that return memory and the usable bytes that are
// live. Every module's heap use passes through here, libstdc++'s operator new included; qorui's
// memory manager does when it runs on its system backend.
#include "scenes.h"

#include <malloc.h>

#include <cerrno>
#include <cstddef>

extern "C" {
void *__libc_malloc(size_t);
void *__libc_calloc(size_t, size_t);
void *__libc_realloc(void *, size_t);
void *__libc_memalign(size_t, size_t);
void __libc_free(void *);
}

namespace {

uint64_t g_allocations = 0;
int64_t g_live_bytes = 0;

void *counted(void *_p) {
    if (_p) {
        ++g_allocations;
        g_live_bytes += static_cast<int64_t>(malloc_usable_size(_p));
    }
    return _p;
}

void uncount(void *_p) {
    if (_p) g_live_bytes -= static_cast<int64_t>(malloc_usable_size(_p));
}

} // namespace

scenes::SHeapCount scenes::heap_count() {
    return SHeapCount{g_allocations, g_live_bytes};
}

extern "C" {

void *malloc(size_t _size) {
    return counted(__libc_malloc(_size));
}

void *calloc(size_t _count, size_t _size) {
    return counted(__libc_calloc(_count, _size));
}

void *realloc(void *_p, size_t _size) {
    uncount(_p);
    void *p_new = __libc_realloc(_p, _size);
    if (!p_new && _size) { // the old block stays
        if (_p) g_live_bytes += static_cast<int64_t>(malloc_usable_size(_p));
        return nullptr;
    }
    return counted(p_new);
}

void free(void *_p) {
    uncount(_p);
    __libc_free(_p);
}

void *memalign(size_t _alignment, size_t _size) {
    return counted(__libc_memalign(_alignment, _size));
}

void *aligned_alloc(size_t _alignment, size_t _size) {
    return counted(__libc_memalign(_alignment, _size));
}

int posix_memalign(void **_pp, size_t _alignment, size_t _size) {
    void *p = counted(__libc_memalign(_alignment, _size));
    if (!p) return ENOMEM;
    *_pp = p;
    return 0;
}

} // extern "C"
