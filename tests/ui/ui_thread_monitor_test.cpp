// The thread monitor on recorded rings and a clock the test holds (the merge, the bars and the busy
// ratio, the two-second fetch, names, recording files), and on this machine's real sampler.
#include "ui_thread_monitor.h"

#include "qor_platform.h"
#include "test_common.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <condition_variable>
#include <mutex>
#include <thread>
#include <tuple>
#include <vector>

using namespace qorui;

namespace {

unsigned const k_other = ~0u; // the rest of the system

// Records for a device's buffer, each placed in a ring's slot.
struct SPlaced {
    unsigned m_ring, m_slot;
    SThreadSample m_sample;
};

std::vector<unsigned char> rings(std::vector<SPlaced> const &_records,
                                 std::vector<uint32_t> const &_heads = {}) {
    std::vector<unsigned char> buffer(k_ring_buffer_bytes, 0);
    for (unsigned ring = 0; ring < _heads.size(); ++ring)
        memcpy(&buffer[ring * k_ring_section_bytes], &_heads[ring], 4);
    for (SPlaced const &placed : _records)
        memcpy(&buffer[placed.m_ring * k_ring_section_bytes + 4 + placed.m_slot * 16], &placed.m_sample, 16);
    return buffer;
}

// Samples of ring 0 in slot order, times in microseconds of the test's counter (1000 ticks each)
// from a second on, so that none is taken for an unfilled slot.
std::vector<unsigned char> ring_of(std::vector<SThreadSample> const &_samples) {
    std::vector<SPlaced> placed;
    for (SThreadSample const &sample : _samples)
        placed.push_back({0,
                          unsigned(placed.size()),
                          {sample.m_process_id, sample.m_thread_id, 1000000000 + sample.m_time * 1000}});
    return rings(placed);
}

std::vector<std::tuple<int64_t, uint32_t, uint32_t>> sorted(std::vector<SThreadSample> const &_samples) {
    std::vector<std::tuple<int64_t, uint32_t, uint32_t>> keys;
    for (SThreadSample const &sample : _samples)
        keys.emplace_back(sample.m_time, sample.m_process_id, sample.m_thread_id);
    std::sort(keys.begin(), keys.end());
    return keys;
}

// A monitor on recorded rings. The clock's counter runs at 1e9 a second and stands in for the time
// stamp counter, so the first refresh, 16 ms after the monitor is made, measures 1e9 ticks a second.
class ThreadMonitorTest : public ::testing::Test {
protected:
    ~ThreadMonitorTest() override { qorplatform::set_clock(nullptr); }

    void fetch(std::vector<unsigned char> const &_buffer) {
        m_device.set_buffer(_buffer.data());
        m_clock.advance_ms(2000);
        int status = -1;
        ASSERT_TRUE(m_monitor.refresh(&status));
        EXPECT_EQ(0, status);
    }

    qorplatform::CManualClock m_clock{10000};
    bool m_clock_set = (qorplatform::set_clock(&m_clock), true); // before the monitor reads it
    CThreadRingsRecording m_device;
    CThreadMonitor m_monitor{&m_device};
};

} // namespace

// Four full rings, each in time order from its head on, the processors' samples interleaved.
std::vector<SPlaced> full_rings_in_order(std::vector<uint32_t> const &_heads) {
    std::vector<SPlaced> placed;
    for (unsigned ring = 0; ring < k_ring_count; ++ring)
        for (unsigned i = 0; i < k_ring_records; ++i)
            placed.push_back(
                {ring, (_heads[ring] + i) % k_ring_records, {ring + 1, i, 10 + 4 * int64_t(i) + ring}});
    return placed;
}

// Every slot of every ring is read once, from its head on and wrapping at 4000, whatever the head;
// the unfilled zero slots sort to the front.
TEST_F(ThreadMonitorTest, MergeReadsEverySlotOnceAndSortsByTime) {
    struct {
        char const *m_case;
        std::vector<uint32_t> m_heads;
        std::vector<SPlaced> m_records;
    } const rows[] = {
        {"wrapped head",
         {0, 3998},
         {{1, 3998, {1, 10, 30}}, {1, 3999, {1, 11, 10}}, {1, 0, {1, 12, 20}}, {1, 1, {1, 13, 40}}}},
        {"equal times in two rings",
         {0, 0, 0},
         {{0, 0, {2, 20, 50}}, {2, 0, {3, 30, 50}}, {2, 1, {3, 31, 60}}}},
        {"head beyond the ring",
         {0, 0, 0, 70000},
         {{3, 3999, {4, 40, 5}}, {3, 0, {4, 41, 6}}, {0, 17, {5, 50, 7}}}},
        {"full rings in time order", {5, 0, 3999, 2000}, full_rings_in_order({5, 0, 3999, 2000})},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        fetch(rings(row.m_records, row.m_heads));
        SThreadSample const *p_samples = m_monitor.get_samples();
        size_t const zeros = k_ring_samples - row.m_records.size();
        std::vector<SThreadSample> given, newest(p_samples + zeros, p_samples + k_ring_samples);
        for (SPlaced const &placed : row.m_records)
            given.push_back(placed.m_sample);
        EXPECT_EQ(sorted(given), sorted(newest));
        EXPECT_TRUE(std::is_sorted(
            newest.begin(), newest.end(),
            [](SThreadSample const &_a, SThreadSample const &_b) { return _a.m_time < _b.m_time; }));
        EXPECT_EQ(0, zeros > 0 ? p_samples[zeros - 1].m_time : 0);
    }
}

// 100 columns over a period of 2 half seconds: a column is 10 ms, the period 1000 ms from the
// sample before it. Times below are in microseconds; process 1 stands for some other program.
TEST_F(ThreadMonitorTest, BarsAndBusyShareAtTheEdgesOfThePeriod) {
    struct {
        char const *m_case;
        std::vector<SThreadSample> m_samples;
        unsigned m_process, m_thread;
        std::vector<std::pair<int, int>> m_bars;
        unsigned m_per_mille;
    } const rows[] = {
        {"busy for the whole period", {{7, 70, 0}, {7, 70, 500000}, {1, 1, 1100000}}, 7, 70, {{0, 99}}, 1000},
        {"half a millisecond is one column and rounds up",
         {{1, 1, 0}, {7, 70, 300000}, {1, 1, 300500}, {1, 1, 1100000}},
         7,
         70,
         {{30, 31}},
         1},
        {"slices meeting in a column make one bar", // the second starts in column 31, where the first ends
         {{1, 1, 0}, {7, 70, 300000}, {1, 1, 305000}, {7, 70, 310000}, {1, 1, 315000}, {1, 1, 1100000}},
         7,
         70,
         {{30, 32}},
         10},
        {"a gap of a column makes two bars",
         {{1, 1, 0}, {7, 70, 300000}, {1, 1, 305000}, {7, 70, 320000}, {1, 1, 325000}, {1, 1, 1100000}},
         7,
         70,
         {{30, 31}, {32, 33}},
         10},
        {"a slice beyond the period's end is cut",
         {{1, 1, 0}, {7, 70, 900000}, {1, 1, 1100000}},
         7,
         70,
         {{90, 99}},
         100},
        {"the rest of the system leaves out the idle process and the process's own threads",
         {{1, 1, 0}, {0, 0, 200000}, {7, 70, 400000}, {7, k_other, 600000}, {2, 5, 800000}, {1, 1, 1100000}},
         7,
         k_other,
         {{0, 20}, {60, 99}},
         600},
        {"an unknown thread has nothing", {{1, 1, 0}, {7, 70, 500000}, {1, 1, 1100000}}, 7, 71, {}, 0},
    };
    for (auto const &row : rows) {
        SCOPED_TRACE(row.m_case);
        fetch(ring_of(row.m_samples));
        ASSERT_EQ(1000000000, m_monitor.get_ticks_per_second());
        qor_vector<SActivitySegment> segments;
        unsigned per_mille = 12345;
        m_monitor.get_thread_activity(row.m_process, row.m_thread, segments, 100, 2, &per_mille);
        std::vector<std::pair<int, int>> bars;
        for (SActivitySegment const &segment : segments)
            bars.emplace_back(segment.m_begin, segment.m_end);
        EXPECT_EQ(row.m_bars, bars);
        EXPECT_EQ(row.m_per_mille, per_mille);
    }
}

// The first refresh fetches at once; the next one within 2000 ms leaves the samples alone. Before
// the first, the counter's frequency is unknown and the activity changes nothing.
TEST_F(ThreadMonitorTest, RefreshFetchesAtMostEveryTwoSecondsAndMeasuresTheCounterFirst) {
    std::vector<unsigned char> const first = ring_of({{7, 70, 1}}), second = ring_of({{8, 80, 1}});
    m_device.set_buffer(first.data());
    qor_vector<SActivitySegment> segments(1, SActivitySegment{5, 6});
    unsigned per_mille = 12345;
    m_monitor.get_thread_activity(7, 70, segments, 100, 2, &per_mille);
    EXPECT_EQ(1u, segments.size());
    EXPECT_EQ(12345u, per_mille);
    int status = -1;
    for (auto const &step : std::vector<std::pair<unsigned, unsigned>>{{16, 70}, {1999, 70}, {1, 80}}) {
        m_clock.advance_ms(step.first);
        EXPECT_TRUE(m_monitor.refresh(&status));
        EXPECT_EQ(0, status);
        EXPECT_EQ(step.second, m_monitor.get_samples()[k_ring_samples - 1].m_thread_id) << step.first;
        m_device.set_buffer(second.data());
    }
    EXPECT_EQ(1000000000, m_monitor.get_ticks_per_second());
}

TEST(ThreadMonitor, ADeviceThatCantBeReachedFailsTheRefreshAndKeepsTheSamples) {
    CThreadSampler sampler(CThreadSampler::SOURCE_PROC);
    CThreadMonitor monitor(&sampler);
    sampler.stop();
    int status = -1;
    EXPECT_FALSE(monitor.refresh(&status));
    EXPECT_EQ(0, status);
    EXPECT_EQ(0, monitor.get_samples()[k_ring_samples - 1].m_time);
}

TEST(ThreadMonitor, NamesOfThreads) {
    CThreadMonitor::set_thread_name(501, "first");
    CThreadMonitor::set_thread_name(501, "second");
    CThreadMonitor::set_thread_name(k_other, "not used");
    char name[] = "Worker";
    CThreadMonitor::set_thread_name(502, name);
    name[0] = 'X'; // the map keeps a copy
    struct {
        unsigned m_id;
        char const *m_name;
    } const rows[] = {{501, "second"}, {502, "Worker"}, {503, "Unknown"}, {k_other, "System/Other"}};
    for (auto const &row : rows)
        EXPECT_STREQ(row.m_name, CThreadMonitor::get_thread_name(row.m_id)) << row.m_id;
    {
        CThreadRingsRecording device;
        CThreadMonitor monitor(&device);
        EXPECT_STREQ("Main_Thread", CThreadMonitor::get_thread_name(qorplatform::get_current_thread_id()));
    }
    EXPECT_STREQ("Unknown", CThreadMonitor::get_thread_name(501)); // the monitor's end frees the names
}

// A recording written and read back gives the same rings and the names of its threads; a bad file
// is reported by file and line and leaves the recording as it was.
TEST(ThreadMonitor, RecordingFilesRoundTripAndBadLinesAreRefused) {
    std::string const dir = qortest::make_temp_dir();
    std::vector<unsigned char> const buffer =
        rings({{0, 0, {7, 70, 100}}, {0, 1, {7, 71, 200}}, {3, 3999, {9, 90, 300}}}, {1, 0, 0, 3999});
    CThreadMonitor::set_thread_name(71, "Render_Thread");
    CThreadRingsRecording saved(buffer.data());
    saved.set_process_id(7);
    ASSERT_TRUE(saved.save((dir + "/rings.txt").c_str()));
    CThreadMonitor::set_thread_name(71, "renamed");
    CThreadRingsRecording loaded;
    string error;
    ASSERT_TRUE(loaded.load((dir + "/rings.txt").c_str(), error)) << error.c_str();
    EXPECT_EQ(0, memcmp(buffer.data(), loaded.get_buffer(), k_ring_buffer_bytes));
    EXPECT_EQ(7u, loaded.get_process_id());
    EXPECT_STREQ("Render_Thread", CThreadMonitor::get_thread_name(71));

    struct {
        char const *m_text, *m_error;
    } const rows[] = {
        {"process 7\nring 4 0\n", ":2: expected ring R HEAD with R below 4 and HEAD below 4000"},
        {"ring 0 0\n7 70\n", ":2: expected PROCESS THREAD TIME"},
        {"# no ring yet\n7 70 5\n", ":2: a record before the first ring"},
        {"threads 3\n", ":1: unknown item 'threads'"},
    };
    for (auto const &row : rows) {
        std::string const path = qortest::write_file(dir + "/bad.txt", row.m_text);
        EXPECT_FALSE(loaded.load(path.c_str(), error));
        EXPECT_EQ(path + row.m_error, error.c_str());
        EXPECT_EQ(0, memcmp(buffer.data(), loaded.get_buffer(), k_ring_buffer_bytes)) << row.m_text;
    }
}

// On this machine, by either source: a thread of the test that spins is seen busy and one that
// sleeps is seen idle over the last three seconds; the process and its threads are listed.
TEST(ThreadMonitor, TheSamplerSeesABusyThreadBusyAndASleepingOneIdle) {
    for (CThreadSampler::ESource source : {CThreadSampler::SOURCE_PERF, CThreadSampler::SOURCE_PROC}) {
        SCOPED_TRACE(source == CThreadSampler::SOURCE_PERF ? "kernel events" : "/proc");
        CThreadSampler sampler(source);
        CThreadMonitor monitor(&sampler);
        if (sampler.get_source() != source) {
            ASSERT_EQ(CThreadSampler::SOURCE_PERF, source) << "/proc can always be read";
            continue; // the kernel doesn't let this process watch every processor
        }
        std::atomic<bool> done{false};
        std::atomic<unsigned> busy_id{0}, sleeping_id{0};
        std::thread busy([&] {
            busy_id = qorplatform::get_current_thread_id();
            while (!done) {
            }
        });
        // The sleeping thread waits on a condition rather than waking on a timer: a timer in step
        // with the sampler's looks would have it runnable at every look.
        std::mutex mutex;
        std::condition_variable wake;
        std::thread sleeping([&] {
            sleeping_id = qorplatform::get_current_thread_id();
            std::unique_lock<std::mutex> lock(mutex);
            wake.wait(lock, [&] { return done.load(); });
        });
        std::this_thread::sleep_for(std::chrono::milliseconds(3200));
        int status;
        ASSERT_TRUE(monitor.refresh(&status));
        {
            std::lock_guard<std::mutex> lock(mutex);
            done = true;
        }
        wake.notify_one();
        busy.join();
        sleeping.join();

        unsigned const process = qorplatform::get_current_process_id();
        unsigned busy_share = 0, sleeping_share = 1000;
        qor_vector<SActivitySegment> busy_bars, sleeping_bars;
        monitor.get_thread_activity(process, busy_id, busy_bars, 100, 6, &busy_share);
        monitor.get_thread_activity(process, sleeping_id, sleeping_bars, 100, 6, &sleeping_share);
        // Two processors share the machine with other work: a thread that spins on one of them has
        // up to half of all samples, less the more work there is.
        EXPECT_GE(busy_share, 10u);
        EXPECT_FALSE(busy_bars.empty());
        EXPECT_LE(sleeping_share, 10u) << "the busy thread had " << busy_share;

        monitor.update_processes();
        auto const &processes = monitor.get_processes();
        auto own = std::find_if(processes.begin(), processes.end(),
                                [&](SProcessInfo const &_info) { return _info.m_id == process; });
        ASSERT_NE(processes.end(), own);
        EXPECT_STREQ("qorui_tests", own->m_name);
        monitor.update_threads(process);
        EXPECT_NE(monitor.get_threads().end(),
                  std::find(monitor.get_threads().begin(), monitor.get_threads().end(),
                            qorplatform::get_current_thread_id()));
    }
}
