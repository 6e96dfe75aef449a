// The memory client: pools, the realloc rules, module-local routing and the two load errors.
#include "qor_memory.h"

#include "qorMemoryManager.h"
#include "test_support.h"

#include <gtest/gtest.h>

using namespace qorui;

namespace {

struct SPooledItem : CPooled<SPooledItem, 4> {
    char m_payload[24];
};

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

TEST(MemoryClient, PoolBlocksComeOnePerNElementsAndTheLastGivenBackIsTakenFirst) {
    SFixedPool &pool = *SPooledItem::m_pool.mp_pool;
    delete new SPooledItem; // a block exists
    while (pool.mp_free)    // drain the free list, so the next take needs a new block
        new SPooledItem;
    uint32_t const blocks = pool.m_blocks, used = pool.m_used;
    SPooledItem *items[5];
    for (SPooledItem *&p_item : items)
        p_item = new SPooledItem;
    EXPECT_EQ(blocks + 2, pool.m_blocks); // four in the first block, the fifth in a second
    EXPECT_EQ(reinterpret_cast<char *>(items[0]) + pool.m_element_size, reinterpret_cast<char *>(items[1]));
    SPooledItem *const p_given_back = items[2];
    delete items[2];
    items[2] = new SPooledItem;
    EXPECT_EQ(p_given_back, items[2]);
    delete[] new SPooledItem[9]; // arrays leave the pool alone
    for (SPooledItem *p_item : items)
        delete p_item;
    EXPECT_EQ(used, pool.m_used);
}

// Size 0 frees, null allocates, blocks don't shrink, and growing keeps the contents; only the
// library allocates from its heap.
TEST(MemoryClient, ReallocFollowsItsRulesOnTheLibrarysOwnHeap) {
    EXPECT_EQ(nullptr, qor_realloc(qor_malloc(10), 0));
    SMMHeapStats const before = heap_stats();
    delete new std::string(200, 'x'); // the test program allocates as it always does
    EXPECT_EQ(before.m_allocations, heap_stats().m_allocations);
    char *p = static_cast<char *>(qor_realloc(nullptr, 40));
    ASSERT_NE(nullptr, p);
    EXPECT_EQ(before.m_allocations + 1, heap_stats().m_allocations);
    size_t const block = qor_msize(p);
    EXPECT_EQ(p, qor_realloc(p, 8));
    EXPECT_EQ(block, qor_msize(p));
    for (int i = 0; i < 40; ++i)
        p[i] = static_cast<char>(i);
    char *q = static_cast<char *>(qor_realloc(p, 1 << 20));
    for (int i = 0; i < 40; ++i)
        ASSERT_EQ(static_cast<char>(i), q[i]);
    qor_free(q);
    EXPECT_EQ(before.m_live_bytes, heap_stats().m_live_bytes);
    unsigned char *p_zeros = static_cast<unsigned char *>(qor_calloc(16, 8));
    EXPECT_EQ(std::string(128, '\0'), std::string(reinterpret_cast<char *>(p_zeros), 128));
    qor_free(p_zeros);
    EXPECT_TRUE(qor_check_memory_corrupt());
}

TEST(MemoryClient, AManagerThatDoesNotLoadEndsTheProcessWithItsMessage) {
    qortest::SChildResult const missing =
        qortest::run_child("mm_probe", {"QOR_MM_LIBRARY=libqorNoSuchManager.so"});
    EXPECT_EQ(1, missing.m_exit_code);
    EXPECT_NE(std::string::npos, missing.m_output.find("MemoryManager: libqorMemoryManager.so load error!"))
        << missing.m_output;
    // The incomplete manager lacks "MMExpand" and "MMSmallFree"; Expand comes first.
    qortest::SChildResult const incomplete = qortest::run_child(
        "mm_probe", {"QOR_MM_LIBRARY=" + qortest::bin_dir() + "/libqorIncompleteManager.so"});
    EXPECT_EQ(1, incomplete.m_exit_code);
    EXPECT_NE(std::string::npos, incomplete.m_output.find("load error!\nCannot find function 'Expand'"))
        << incomplete.m_output;
    EXPECT_EQ(0, qortest::run_child("mm_probe", {}).m_exit_code);
}
