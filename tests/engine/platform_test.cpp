// The platform layer: the clocks and their replacement, module loading and its errors, the message
// box on stderr.
#include "qorMemoryManager.h"
#include "qor_platform.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <ctime>
#include <string>
#include <unistd.h>

using namespace qorplatform;

namespace {

int64_t monotonic_ns() {
    timespec now;
    clock_gettime(CLOCK_MONOTONIC, &now);
    return int64_t(now.tv_sec) * 1000000000 + now.tv_nsec;
}

// Puts the system clock back whatever a test does.
class PlatformClockTest : public testing::Test {
protected:
    void TearDown() override { set_clock(nullptr); }
};

} // namespace

// The tick count is the monotonic clock's; the performance counter goes in step with it (within
// a thousandth: the kernel's clock may be slewed); an installed clock replaces both counters until
// it is removed.
TEST_F(PlatformClockTest, SystemClocksGoWithTheMonotonicClockUnlessOneIsInstalled) {
    int64_t const before = monotonic_ns();
    uint32_t const ticks = get_tick_count();
    int64_t const counter = query_performance_counter(), counter_ns = monotonic_ns();
    EXPECT_EQ(1000000000, query_performance_frequency());
    // Tick counts wrap, so they compare by their distance modulo 2^32.
    EXPECT_LE(uint32_t(ticks - uint32_t(before / 1000000)), uint32_t((counter_ns - before) / 1000000 + 1));
    usleep(20000);
    int64_t const later = query_performance_counter(), later_ns = monotonic_ns();
    EXPECT_NEAR(double(later_ns - counter_ns), double(later - counter),
                (later_ns - counter_ns) / 1000.0 + 10000);

    CManualClock clock(5000);
    set_clock(&clock);
    EXPECT_EQ(5000u, get_tick_count());
    clock.advance_ms(16);
    EXPECT_EQ(5016u, get_tick_count());
    EXPECT_EQ(int64_t(5016) * 1000000, query_performance_counter());
    set_clock(nullptr);
    EXPECT_GT(query_performance_counter(), later);
}

// A module and its entry point are found; a missing file, symbol or argument fails with a message.
TEST(PlatformModules, LoadsTheMemoryManagerAndFindsItsEntryPoint) {
    void *module = load_library("libqorMemoryManager.so");
    ASSERT_NE(nullptr, module) << last_module_error();
    // The module is already a neighbour of this program, so it is the same code.
    EXPECT_EQ(reinterpret_cast<void *>(&MMAllocate), get_proc_address(module, "MMAllocate"));
    EXPECT_EQ(nullptr, get_proc_address(module, "MMNoSuchEntry"));
    EXPECT_NE(std::string::npos, std::string(last_module_error()).find("MMNoSuchEntry"))
        << last_module_error();
    free_library(module);
    EXPECT_EQ(nullptr, load_library("libqorNoSuchModule.so"));
    EXPECT_NE(std::string::npos, std::string(last_module_error()).find("libqorNoSuchModule.so"))
        << last_module_error();
    EXPECT_EQ(nullptr, load_library(nullptr));
    EXPECT_STREQ("no file name", last_module_error());
    EXPECT_EQ(nullptr, get_proc_address(nullptr, "MMAllocate"));
    EXPECT_STREQ("no module", last_module_error());
    free_library(nullptr);
}

TEST(PlatformMessageBox, WritesCaptionAndTextToStderr) {
    EXPECT_EXIT(
        {
            message_box("libqorMemoryManager.so load error!", "MemoryManager");
            exit(0);
        },
        testing::ExitedWithCode(0), "^MemoryManager: libqorMemoryManager.so load error!\n$");
}
