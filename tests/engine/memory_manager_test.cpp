// The memory manager: entry points by name, heaps and their statistics, blocks that crossed a module
// boundary, the heap checks, small blocks and the fixed pool records. The backend is the one that
// QOR_MM_BACKEND names for this process; one test runs the backend-neutral suites again in a child
// process with the other backend.
#include "qorMemoryManager.h"
#include "test_common.h"

#include <gtest/gtest.h>

#include <cstddef>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <malloc.h>
#include <spawn.h>
#include <string>
#include <sys/wait.h>
#include <unistd.h>
#include <vector>

extern char **environ;

namespace {

bool is_system_backend() {
    char const *backend = getenv("QOR_MM_BACKEND");
    return backend && strcmp(backend, "system") == 0;
}

int new_heap() {
    return MMHeapCreate(0x1000000, 0x800000);
}

void *allocate_on(int _heap, size_t _size) {
    MMHeapSelect(_heap);
    return MMAllocate(_size, 0);
}

std::vector<SMMHeapStats> all_heap_stats() {
    std::vector<SMMHeapStats> stats(MMGetStatsForModules(nullptr, 0));
    MMGetStatsForModules(stats.data(), static_cast<int>(stats.size()));
    return stats;
}

// A heap's allocations, deallocations and live bytes.
std::vector<uint64_t> counts(int _heap) {
    SMMHeapStats const stats = all_heap_stats().at(_heap);
    return {stats.m_allocations, stats.m_deallocations, stats.m_live_bytes};
}

SMMHeapStats totals() {
    SMMHeapStats total = {};
    MMGetMemoryStatus(&total);
    return total;
}

std::string dump_text() {
    std::string const path = qortest::make_temp_dir() + "/dump.txt";
    MMDumpMemoryStats(path.c_str());
    return qortest::read_file(path);
}

// The pool line of the dump for element size and count, or "" when there is no such pool.
std::string pool_line(uint32_t _element_size, uint32_t _block_elements) {
    std::string const text = dump_text();
    std::string const head =
        "pool " + std::to_string(_element_size) + " x " + std::to_string(_block_elements) + ":";
    size_t const at = text.find(head);
    return at == std::string::npos ? "" : text.substr(at, text.find('\n', at) - at);
}

// Runs this test program again with the other backend and a filter; true when the child ran at
// least one test and all of them passed.
bool child_passes(char const *_filter, char const *_backend) {
    char self[4096] = {};
    if (readlink("/proc/self/exe", self, sizeof(self) - 1) <= 0) return false;
    std::string const report = qortest::make_temp_dir() + "/child.json";
    std::string filter_arg = std::string("--gtest_filter=") + _filter;
    std::string output_arg = "--gtest_output=json:" + report;
    char *argv[] = {self, &filter_arg[0], &output_arg[0], nullptr};
    std::vector<std::string> env_text;
    for (char **p_entry = environ; *p_entry; ++p_entry)
        if (strncmp(*p_entry, "QOR_MM_BACKEND=", 15) != 0) env_text.push_back(*p_entry);
    env_text.push_back(std::string("QOR_MM_BACKEND=") + _backend);
    std::vector<char *> envp;
    for (std::string &entry : env_text)
        envp.push_back(&entry[0]);
    envp.push_back(nullptr);
    // The child's output stays out of this test's: a test runner that reads "SKIPPED" in it would
    // take this test for skipped, whatever its result.
    posix_spawn_file_actions_t quiet;
    posix_spawn_file_actions_init(&quiet);
    posix_spawn_file_actions_addopen(&quiet, STDOUT_FILENO, "/dev/null", O_WRONLY, 0);
    pid_t child = 0;
    int const spawned = posix_spawn(&child, self, &quiet, nullptr, argv, envp.data());
    posix_spawn_file_actions_destroy(&quiet);
    if (spawned != 0) return false;
    int status = 0;
    waitpid(child, &status, 0);
    std::string const json = qortest::read_file(report);
    size_t const count_at = json.find("\"tests\": "); // the first one is the whole run's
    int const tests_run = count_at == std::string::npos ? 0 : atoi(json.c_str() + count_at + 9);
    return WIFEXITED(status) && WEXITSTATUS(status) == 0 && tests_run > 0;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Backend
// ---------------------------------------------------------------------------------------------

TEST(MemoryManagerBackend, IsTheOneTheEnvironmentNames) {
    std::string const expected = is_system_backend() ? "backend system," : "backend mimalloc,";
    EXPECT_EQ(0u, dump_text().rfind(expected, 0)) << dump_text();
}

TEST(MemoryManagerBackend, OtherBackendPassesTheSameSuitesInAChildProcess) {
    char const *const filter = "MemoryManagerBackend.IsTheOneTheEnvironmentNames:MemoryManagerHeaps.*:"
                               "MemoryManagerForeignBlocks.*:MemoryManagerChecks.*:MemoryManagerFixedPools.*";
    EXPECT_TRUE(child_passes(filter, is_system_backend() ? "mimalloc" : "system"));
}

// ---------------------------------------------------------------------------------------------
// Heaps
// ---------------------------------------------------------------------------------------------

// Consecutive ids with a record each; blocks are counted on the heap that made them, whichever is
// selected when they are freed; the status is the sum of the records.
TEST(MemoryManagerHeaps, BlocksAreCountedOnTheHeapThatMadeThem) {
    int const a = new_heap(), b = new_heap();
    ASSERT_GE(a, 0);
    EXPECT_EQ(a + 1, b);
    EXPECT_EQ(b + 1, MMGetStatsForModules(nullptr, 0));
    EXPECT_EQ(b, all_heap_stats().at(b).m_heap);
    EXPECT_EQ((std::vector<uint64_t>{0, 0, 0}), counts(b));
    void *p_a = allocate_on(a, 100), *p_b1 = allocate_on(b, 40), *p_b2 = allocate_on(b, 40);
    ASSERT_TRUE(p_a && p_b1 && p_b2);
    EXPECT_EQ((std::vector<uint64_t>{1, 0, MMGetBlockSize(p_a)}), counts(a));
    EXPECT_EQ((std::vector<uint64_t>{2, 0, is_system_backend() ? 80 : counts(b)[2]}), counts(b));
    std::vector<uint64_t> sum(3); // of every heap's record
    for (int heap = 0; heap < MMGetStatsForModules(nullptr, 0); ++heap)
        for (size_t i = 0; i < 3; ++i)
            sum[i] += counts(heap)[i];
    SMMHeapStats const total = totals();
    EXPECT_EQ(sum, (std::vector<uint64_t>{total.m_allocations, total.m_deallocations, total.m_live_bytes}));
    EXPECT_EQ(-1, total.m_heap);
    EXPECT_EQ(0, MMGetMemoryStatus(nullptr));

    MMHeapSelect(b); // freeing doesn't depend on the selection
    MMDeallocate(p_a);
    EXPECT_EQ((std::vector<uint64_t>{1, 1, 0}), counts(a));
    EXPECT_EQ(0u, counts(b)[1]);
    EXPECT_EQ(1, MMGetMemoryBlockStatus(p_b1));
    MMDeallocate(p_b1);
    EXPECT_EQ(0, MMGetMemoryBlockStatus(p_b1));
    MMDeallocate(p_b2);
    EXPECT_EQ((std::vector<uint64_t>{2, 2, 0}), counts(b));
}

// An id that names no heap allocates on one default heap, made once.
TEST(MemoryManagerHeaps, AllocationWithoutAValidSelectionUsesOneDefaultHeap) {
    MMHeapSelect(-1);
    void *p_first = MMAllocate(16, 0);
    int const heaps = MMGetStatsForModules(nullptr, 0);
    void *p_second = allocate_on(heaps + 100, 16), *p_third = allocate_on(-1, 16);
    EXPECT_EQ(heaps, MMGetStatsForModules(nullptr, 0));
    EXPECT_EQ(1, MMGetMemoryBlockStatus(p_second));
    for (void *p : {p_first, p_second, p_third})
        MMDeallocate(p);
}

// Block sizes cover the request and every byte is usable; a block grows only into room it already
// has and never shrinks. Bigger than a heap's pages, mimalloc gives a block a segment of its own.
TEST(MemoryManagerHeaps, BlockSizesAndExpand) {
    int const heap = new_heap();
    for (size_t size : {size_t(1), size_t(24), size_t(100), size_t(4096), size_t(100000), size_t(40) << 20}) {
        char *p = static_cast<char *>(allocate_on(heap, size));
        ASSERT_NE(nullptr, p) << size;
        size_t const block_size = MMGetBlockSize(p);
        EXPECT_GE(block_size, size);
        EXPECT_GE(counts(heap)[2], size);
        if (is_system_backend()) {
            EXPECT_EQ(size, block_size);
        }
        memset(p, 0x5a, block_size);
        EXPECT_NE(0, MMCheckMemoryCorrupt());
        MMDeallocate(p);
        EXPECT_EQ(0, MMGetMemoryBlockStatus(p));
    }
    EXPECT_EQ(0u, counts(heap)[2]);

    char *p = static_cast<char *>(allocate_on(heap, 100));
    size_t const size = MMGetBlockSize(p);
    size_t const room = is_system_backend() ? malloc_usable_size(p) : size; // 100 under the sanitizers
    EXPECT_EQ(1, MMExpand(p, 50));
    EXPECT_EQ(size, MMGetBlockSize(p));
    EXPECT_EQ(1, MMExpand(p, room));
    EXPECT_EQ(0, MMExpand(p, room + 1));
    EXPECT_EQ(0, MMExpand(p, 1 << 20));
    EXPECT_EQ(room, MMGetBlockSize(p));
    EXPECT_EQ(room, counts(heap)[2]);
    EXPECT_EQ(0, MMExpand(nullptr, 10));
    MMDeallocate(p);
    EXPECT_EQ(0u, counts(heap)[2]);
}

// ---------------------------------------------------------------------------------------------
// Blocks the manager didn't make
// ---------------------------------------------------------------------------------------------

TEST(MemoryManagerForeignBlocks, AreGivenBackToTheirAllocatorWithoutCounting) {
    SMMHeapStats const before = totals();
    void *p = malloc(64);
    memset(p, 1, 64);
    EXPECT_EQ(0, MMGetMemoryBlockStatus(p));
    EXPECT_EQ(0, MMExpand(p, 32));
    MMDeallocate(p); // the sanitizers see a wrong allocator here; mimalloc would crash
    void *p_small = MMSmallAlloc(48);
    EXPECT_EQ(0, MMGetMemoryBlockStatus(p_small));
    MMDeallocate(p_small);
    EXPECT_EQ(before.m_deallocations, totals().m_deallocations);
    EXPECT_EQ(before.m_live_bytes, totals().m_live_bytes);
    int on_stack = 0;
    MMDeallocate(nullptr);
    EXPECT_EQ(0, MMGetMemoryBlockStatus(nullptr));
    EXPECT_EQ(0, MMGetMemoryBlockStatus(&on_stack));
    EXPECT_EQ(0u, MMGetBlockSize(nullptr));
}

// ---------------------------------------------------------------------------------------------
// Statistics and checks
// ---------------------------------------------------------------------------------------------

TEST(MemoryManagerChecks, StatsForModulesWritesAtMostMaxRecordsAndRejectsBadArguments) {
    new_heap();
    new_heap();
    int const count = MMGetStatsForModules(nullptr, 0);
    ASSERT_GE(count, 2);
    SMMHeapStats records[2] = {};
    records[1].m_heap = 12345;
    EXPECT_EQ(count, MMGetStatsForModules(records, 1));
    EXPECT_EQ(0, records[0].m_heap);
    EXPECT_EQ(12345, records[1].m_heap); // untouched
    EXPECT_EQ(-1, MMGetStatsForModules(nullptr, 3));
    EXPECT_EQ(-1, MMGetStatsForModules(records, -1));
}

TEST(MemoryManagerChecks, SmallAllocationsAreCountedProcessWideAndKeepTheirContent) {
    uint64_t const before = totals().m_small_allocations;
    char *p_a = static_cast<char *>(MMSmallAlloc(10));
    void *p_b = MMSmallAlloc(0), *p_c = MMSmallAlloc(300);
    ASSERT_TRUE(p_a && p_b && p_c);
    for (SMMHeapStats const &stats : all_heap_stats())
        EXPECT_EQ(before + 3, stats.m_small_allocations);
    EXPECT_GE(MMSmallMsize(p_a), 10u);
    EXPECT_GE(MMSmallMsize(p_c), 300u);
    memcpy(p_a, "ten bytes", 10);
    p_a = static_cast<char *>(MMSmallRealloc(p_a, 5000));
    ASSERT_NE(nullptr, p_a);
    EXPECT_STREQ("ten bytes", p_a);
    EXPECT_GE(MMSmallMsize(p_a), 5000u);
    EXPECT_EQ(before + 3, totals().m_small_allocations); // realloc isn't an MMSmallAlloc call
    for (void *p : {static_cast<void *>(p_a), p_b, p_c, static_cast<void *>(nullptr)})
        MMSmallFree(p);
    EXPECT_EQ(0u, MMSmallMsize(nullptr));
}

// Blocks of two heaps freed out of order leave nothing the check finds corrupt.
TEST(MemoryManagerChecks, NothingIsCorruptAfterOrdinaryUse) {
    int const heaps[] = {new_heap(), new_heap()};
    std::vector<void *> blocks;
    for (int i = 0; i < 200; ++i)
        blocks.push_back(allocate_on(heaps[i % 2], size_t(16 + i * 8)));
    for (size_t i : {size_t(0), size_t(1), size_t(2)})
        for (size_t k = i; k < blocks.size(); k += 3) {
            MMDeallocate(blocks[k]);
            EXPECT_NE(0, MMCheckMemoryCorrupt());
        }
}

TEST(MemoryManagerChecks, BlockFreedBehindTheManagersBackIsFound) {
    if (is_system_backend()) GTEST_SKIP() << "the C heap's blocks are checked by the sanitizers";
    // In a child, since the heap stays inconsistent for the rest of the process.
    EXPECT_EXIT(
        {
            void *p = allocate_on(new_heap(), 64);
            MMSmallFree(p); // the small-block allocator frees it without the heap knowing
            exit(MMCheckMemoryCorrupt() == 0 ? 0 : 1);
        },
        testing::ExitedWithCode(0), "");
}

TEST(MemoryManagerChecks, DumpWritesALinePerHeap) {
    int const heap = new_heap();
    void *p = allocate_on(heap, 64);
    MMDeallocate(allocate_on(heap, 64));
    std::string const text = dump_text();
    std::string const line = "heap " + std::to_string(heap) + ": 2 allocations, 1 deallocations, " +
                             std::to_string(MMGetBlockSize(p)) + " live bytes\n";
    EXPECT_NE(std::string::npos, text.find(line)) << text;
    EXPECT_NE(std::string::npos, text.find(std::to_string(MMGetStatsForModules(nullptr, 0)) + " heaps, "));
    MMDeallocate(p);
}

// ---------------------------------------------------------------------------------------------
// Fixed pools
// ---------------------------------------------------------------------------------------------

// A new record is empty with at least a pointer per element; equal size and count share one.
TEST(MemoryManagerFixedPools, EqualSizeAndCountShareOneRecord) {
    SFixedPool *p_small = MMGetFixedPool(3, 50);
    ASSERT_NE(nullptr, p_small);
    EXPECT_EQ(sizeof(void *), p_small->m_element_size);
    EXPECT_EQ(50u, p_small->m_block_elements);
    EXPECT_TRUE(!p_small->m_blocks && !p_small->m_used && !p_small->m_total_bytes && !p_small->mp_free &&
                !p_small->mp_blocks);
    SFixedPool *p_a = MMGetFixedPool(24, 77), *p_b = MMGetFixedPool(24, 77);
    SFixedPool *p_other_count = MMGetFixedPool(24, 78), *p_other_size = MMGetFixedPool(32, 77);
    SFixedPool *p_word = MMGetFixedPool(sizeof(void *), 50);
    EXPECT_EQ(p_a, p_b);
    EXPECT_NE(p_a, p_other_count);
    EXPECT_NE(p_a, p_other_size);
    EXPECT_EQ(p_small, p_word);
    EXPECT_EQ("pool 24 x 77: 2 references, 0 blocks, 0 used, 0 bytes", pool_line(24, 77));
    SFixedPool stranger = *p_a; // a record the manager doesn't know changes nothing
    MMReleaseFixedPool(&stranger);
    MMReleaseFixedPool(nullptr);
    EXPECT_EQ("pool 24 x 77: 2 references, 0 blocks, 0 used, 0 bytes", pool_line(24, 77));
    for (SFixedPool *p : {p_a, p_b, p_other_count, p_other_size, p_small, p_word})
        MMReleaseFixedPool(p);
    EXPECT_EQ("", pool_line(24, 77));
}

TEST(MemoryManagerFixedPools, LastReleaseGivesTheClientsBlocksBackToTheirHeap) {
    int const heap = new_heap();
    SFixedPool *p_pool = MMGetFixedPool(40, 4), *p_shared = MMGetFixedPool(40, 4);
    for (int i = 0; i < 2; ++i) { // blocks allocated and linked into the record as the client does
        size_t const bytes = size_t(p_pool->m_element_size) * p_pool->m_block_elements + sizeof(void *);
        void *p_block = allocate_on(heap, bytes);
        *static_cast<void **>(p_block) = p_pool->mp_blocks;
        p_pool->mp_blocks = p_block;
        ++p_pool->m_blocks;
        p_pool->m_total_bytes += static_cast<uint32_t>(bytes);
    }
    MMReleaseFixedPool(p_shared);
    EXPECT_EQ(1, MMGetMemoryBlockStatus(p_pool->mp_blocks));
    EXPECT_EQ(2u, counts(heap)[0]);
    EXPECT_EQ(0u, counts(heap)[1]);
    MMReleaseFixedPool(p_pool);
    EXPECT_EQ((std::vector<uint64_t>{2, 2, 0}), counts(heap));
    EXPECT_EQ("", pool_line(40, 4));
}
