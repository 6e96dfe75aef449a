// The memory client: pools, the realloc rules, module-local routing and the two load errors.
#include "qor_memory.h"

#include "qorMemoryManager.h"
#include "test_support.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <cstring>
#include <string>

using namespace qorui;

namespace {

struct SPooledItem : CPooled<SPooledItem, 4> {
    char m_payload[24];
};

SFixedPool &item_pool() { return *SPooledItem::m_pool.mp_pool; }

// The record of this library's heap in the manager's statistics.
SMMHeapStats heap_stats() {
    SMMHeapStats stats[64] = {};
    int const count = qor_get_stats_for_modules(stats, 64);
    for (int i = 0; i < count; ++i)
        if (stats[i].m_heap == qor_heap_id()) return stats[i];
    ADD_FAILURE() << "no statistics for heap " << qor_heap_id();
    return SMMHeapStats();
}

} // namespace

TEST(PooledAllocation, BlocksComeOnePerNElementsAndHandOutRisingAddresses) {
    // A pool may be shared, so the counts are taken relative to what is there now.
    SPooledItem *warm = new SPooledItem; // makes sure a block exists
    delete warm;
    while (item_pool().mp_free) { // drain the free list, so the next take needs a new block
        new SPooledItem;
    }
    uint32_t const blocks = item_pool().m_blocks;
    uint32_t const used = item_pool().m_used;

    SPooledItem *items[5];
    for (int i = 0; i < 4; ++i) items[i] = new SPooledItem;
    EXPECT_EQ(blocks + 1, item_pool().m_blocks); // four takes: one block
    for (int i = 1; i < 4; ++i)
        EXPECT_EQ(reinterpret_cast<char *>(items[i - 1]) + item_pool().m_element_size,
                  reinterpret_cast<char *>(items[i]));
    items[4] = new SPooledItem;
    EXPECT_EQ(blocks + 2, item_pool().m_blocks); // the fifth: a second block
    EXPECT_EQ(used + 5, item_pool().m_used);

    delete items[2];
    SPooledItem *again = new SPooledItem; // the element given back last comes first
    EXPECT_EQ(items[2], again);
    EXPECT_EQ(blocks + 2, item_pool().m_blocks);
    items[2] = again;
    for (SPooledItem *p : items) delete p;
    EXPECT_EQ(used, item_pool().m_used);
}

TEST(PooledAllocation, RecordFieldsAreInContractOrder) {
    EXPECT_EQ(0u, offsetof(SFixedPool, m_blocks));
    EXPECT_EQ(4u, offsetof(SFixedPool, m_used));
    EXPECT_EQ(8u, offsetof(SFixedPool, m_total_bytes));
    EXPECT_EQ(12u, offsetof(SFixedPool, m_element_size));
    EXPECT_EQ(16u, offsetof(SFixedPool, m_block_elements));
    EXPECT_EQ(24u, offsetof(SFixedPool, mp_free)); // pointer-sized and aligned
    EXPECT_EQ(32u, offsetof(SFixedPool, mp_blocks));
    EXPECT_EQ(24u, item_pool().m_element_size);
    EXPECT_EQ(4u, item_pool().m_block_elements);
}

TEST(PooledAllocation, DeleteOfNullAndArraysLeaveThePoolAlone) {
    delete new SPooledItem;
    uint32_t const used = item_pool().m_used;
    uint32_t const blocks = item_pool().m_blocks;
    void *const head = item_pool().mp_free;

    SPooledItem *p_null = nullptr;
    delete p_null;
    SPooledItem *p_array = new SPooledItem[9];
    delete[] p_array;

    EXPECT_EQ(used, item_pool().m_used);
    EXPECT_EQ(blocks, item_pool().m_blocks);
    EXPECT_EQ(head, item_pool().mp_free);
}

TEST(Realloc, FollowsTheFiveRules) {
    EXPECT_EQ(nullptr, qor_realloc(qor_malloc(10), 0)); // size 0 frees

    char *p = static_cast<char *>(qor_realloc(nullptr, 40)); // null allocates
    ASSERT_NE(nullptr, p);
    size_t const block = qor_msize(p);
    EXPECT_GE(block, 40u);
    EXPECT_EQ(p, qor_realloc(p, 8)); // no shrinking
    EXPECT_EQ(block, qor_msize(p));
    EXPECT_EQ(p, qor_realloc(p, block)); // still fits

    for (int i = 0; i < 40; ++i) p[i] = static_cast<char>(i);
    char *q = static_cast<char *>(qor_realloc(p, 1 << 20)); // grows, in place or moved
    ASSERT_NE(nullptr, q);
    for (int i = 0; i < 40; ++i) ASSERT_EQ(static_cast<char>(i), q[i]);
    EXPECT_GE(qor_msize(q), size_t(1) << 20);
    qor_free(q);
}

TEST(Realloc, CallocZeroFills) {
    unsigned char *p = static_cast<unsigned char *>(qor_calloc(16, 8));
    for (int i = 0; i < 128; ++i) ASSERT_EQ(0, p[i]);
    qor_free(p);
}

TEST(Routing, OnlyTheLibraryAllocatesFromItsHeap) {
    qor_free(qor_malloc(1)); // the heap exists from here on
    SMMHeapStats const before = heap_stats();

    // The test program allocates as it always does: no effect on the library's heap.
    std::string *p_text = new std::string(200, 'x');
    void *p_block = malloc(300);
    delete p_text;
    free(p_block);
    SMMHeapStats const after_host = heap_stats();
    EXPECT_EQ(before.m_allocations, after_host.m_allocations);
    EXPECT_EQ(before.m_live_bytes, after_host.m_live_bytes);

    // The library's own allocations do go there.
    void *p_library = qor_malloc(300);
    EXPECT_EQ(before.m_allocations + 1, heap_stats().m_allocations);
    qor_free(p_library);
    EXPECT_EQ(before.m_live_bytes, heap_stats().m_live_bytes);
}

TEST(Routing, StatusWrappersAnswerOnceLoaded) {
    qor_free(qor_malloc(1));
    SMMHeapStats total = {};
    EXPECT_EQ(1, qor_get_memory_status(&total));
    EXPECT_TRUE(qor_check_memory_corrupt());
}

TEST(ManagerLoading, MissingManagerEndsTheProcessWithItsMessage) {
    qortest::SChildResult const result = qortest::run_child("mm_probe", {"QOR_MM_LIBRARY=libqorNoSuchManager.so"});
    EXPECT_EQ(1, result.m_exit_code);
    EXPECT_NE(std::string::npos, result.m_output.find("MemoryManager: libqorMemoryManager.so load error!"))
        << result.m_output;
    EXPECT_EQ(std::string::npos, result.m_output.find("allocated"));
}

TEST(ManagerLoading, MissingEntryPointNamesTheFirstInLookupOrder) {
    // The incomplete manager lacks "MMExpand" and "MMSmallFree"; Expand comes first.
    qortest::SChildResult const result =
        qortest::run_child("mm_probe", {"QOR_MM_LIBRARY=" + qortest::bin_dir() + "/libqorIncompleteManager.so"});
    EXPECT_EQ(1, result.m_exit_code);
    EXPECT_NE(std::string::npos,
              result.m_output.find("qorMemoryManager error: libqorMemoryManager.so load error!\nCannot find "
                                   "function 'Expand'"))
        << result.m_output;
}

TEST(ManagerLoading, TheRealManagerLoadsInAFreshProcess) {
    qortest::SChildResult const result = qortest::run_child("mm_probe", {});
    EXPECT_EQ(0, result.m_exit_code);
    EXPECT_NE(std::string::npos, result.m_output.find("allocated yes")) << result.m_output;
}
