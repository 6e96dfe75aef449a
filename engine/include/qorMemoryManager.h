// libqorMemoryManager.so: the engine's memory manager. Every module gets a heap of its own, a
// small-block allocator and fixed-size pools. Entry points have C linkage and are bound by name:
// the UI library loads this module with dlopen at its first allocation.
#pragma once
#include <cstddef>
#include <cstdint>

extern "C" {

// The pool record handed out by MMGetFixedPool. It lives in the manager's memory; the client
// reads and writes it directly. Field order is a contract; the two links are pointer-sized, and
// so are a free element's link word and a block's header word.
struct SFixedPool {
    uint32_t m_blocks;         // blocks allocated so far
    uint32_t m_used;           // elements handed out and not given back
    uint32_t m_total_bytes;    // bytes of all blocks
    uint32_t m_element_size;   // bytes per element, at least one pointer
    uint32_t m_block_elements; // elements per block
    void *mp_free;             // head of the free list; a free element's first word links on
    void *mp_blocks;           // head of the block list; a block's first word links on
};
// The record's layout is shared with every client module: five words, then two pointers.
static_assert(offsetof(SFixedPool, m_block_elements) == 16 && offsetof(SFixedPool, mp_free) == 24 &&
                  offsetof(SFixedPool, mp_blocks) == 32,
              "the fixed pool record keeps its field order");

// What MMGetMemoryStatus and MMGetStatsForModules report: one record per heap.
struct SMMHeapStats {
    int m_heap;                   // heap id
    uint64_t m_allocations;       // MMAllocate calls that returned memory
    uint64_t m_deallocations;     // MMDeallocate calls on blocks of this heap
    uint64_t m_live_bytes;        // requested bytes of blocks not yet freed
    uint64_t m_small_allocations; // MMSmallAlloc calls (process-wide, same in every record)
};

// Creates a heap for the calling module; result its id (0 or more), -1 on failure.
int MMHeapCreate(size_t _initial_size, size_t _reserve_size);
// Makes that heap the current one for the next MMAllocate.
void MMHeapSelect(int _heap);
// From the selected heap; _flags is 0. Never null for a reasonable size.
void *MMAllocate(size_t _size, int _flags);
// Frees a block of MMAllocate, whichever heap is selected. Null is ignored. A block that no heap
// of the manager owns (memory that crossed a module boundary) goes back to the C heap.
void MMDeallocate(void *_p);
// Grows a block in place if it can; nonzero on success.
int MMExpand(void *_p, size_t _new_size);
// Usable size of a block of MMAllocate (at least what was asked for).
size_t MMGetBlockSize(void *_p);
// Totals over all heaps into *_p_out; result 1, or 0 for a null argument.
int MMGetMemoryStatus(SMMHeapStats *_p_out);
// One record per heap into _p_out (at most _max); result the number of heaps, -1 on bad arguments.
int MMGetStatsForModules(SMMHeapStats *_p_out, int _max);
// Walks the heaps' own checks; nonzero when nothing is found corrupt.
int MMCheckMemoryCorrupt();
// 1 if _p is a live block of MMAllocate, 0 otherwise.
int MMGetMemoryBlockStatus(void const *_p);
// Writes the statistics as text lines to _path, or to stdout for null.
void MMDumpMemoryStats(char const *_path);
// The small-block allocator, shared by all modules; MMSmallFree ignores
// null, MMSmallMsize gives the usable size.
// @{
void *MMSmallAlloc(size_t _size);
void *MMSmallRealloc(void *_p, size_t _size);
void MMSmallFree(void *_p);
size_t MMSmallMsize(void *_p);
// @}
// The pool for that element size and count; one MMReleaseFixedPool for each call.
SFixedPool *MMGetFixedPool(size_t _element_size, size_t _block_elements);
// Gives back one reference to the pool record; the last release frees its blocks.
void MMReleaseFixedPool(SFixedPool *_p_pool);

} // extern "C"
