// The thread monitor: the map of thread names, the machine's sampler and the recorded rings that
// feed it, and the monitor's fetch, merge, process and thread lists, and activity bars.
//
//   thread names        set_thread_name, get_thread_name
//   rings               writing a ring, reading the four rings of a buffer
//   recorded rings      CThreadRingsRecording: a buffer replayed, recording files
//   the sampler         CThreadSampler: its thread, the kernel's events, /proc
//   the monitor         construction, refresh and merge, processes and threads, activity
#include "ui_thread_monitor.h"

#include "qor_platform.h"
#include "ui_debug.h"

#include <algorithm>
#include <atomic>
#include <cerrno>
#include <condition_variable>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <fcntl.h>
#include <linux/perf_event.h>
#include <mutex>
#include <pthread.h>
#include <sys/ioctl.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <thread>
#include <unistd.h>

namespace qorui {

// ---------------------------------------------------------------------------------------------
// Thread names
// ---------------------------------------------------------------------------------------------

namespace {

// Thread id to a name on the library's heap. A name freed by a monitor's end leaves its entry
// behind with no text; what is left at process end is freed with the map.
struct SThreadNames {
    qor_map<unsigned, char *> m_names;
    ~SThreadNames() {
        for (auto &entry : m_names)
            qor_free(entry.second);
    }
};

SThreadNames &thread_names() {
    static SThreadNames s_names;
    return s_names;
}

// Made at the library's load at the latest, so that the map exists before any thread is named;
// reached through thread_names(), which a static of another file may call before this line runs.
[[maybe_unused]] SThreadNames &g_thread_names = thread_names();

char *copy_text(char const *_text) {
    size_t const size = strlen(_text) + 1;
    char *p_copy = static_cast<char *>(qor_malloc(size));
    if (p_copy) memcpy(p_copy, _text, size);
    return p_copy;
}

// Debuggers and tools on Linux know a thread by the kernel's name of it, which holds 15 bytes. The
// main thread keeps its own: its name is the process's, by which tools find the program.
void tell_debuggers(unsigned _thread_id, char const *_name) {
    if (_thread_id == qorplatform::get_current_process_id()) return;
    char path[64];
    snprintf(path, sizeof(path), "/proc/self/task/%u/comm", _thread_id);
    int const file = open(path, O_WRONLY | O_CLOEXEC);
    if (file < 0) return; // not a thread of this process
    ssize_t const written = write(file, _name, std::min<size_t>(strlen(_name), 15));
    (void)written; // a name that the kernel refuses leaves the old one, which is harmless
    close(file);
}

} // namespace

void CThreadMonitor::set_thread_name(unsigned _thread_id, char const *_name) {
    if (!QOR_CHECK(_name)) return;
    tell_debuggers(_thread_id, _name);
    char *&p_name = thread_names().m_names[_thread_id];
    qor_free(p_name);
    p_name = copy_text(_name);
}

void CThreadMonitor::set_current_thread_name(char const *_name) {
    set_thread_name(qorplatform::get_current_thread_id(), _name);
}

char const *CThreadMonitor::get_thread_name(unsigned _thread_id) {
    if (_thread_id == ~0u) return "System/Other";
    qor_map<unsigned, char *> const &names = thread_names().m_names;
    auto found = names.find(_thread_id);
    return found != names.end() && found->second ? found->second : "Unknown";
}

// ---------------------------------------------------------------------------------------------
// Rings
// ---------------------------------------------------------------------------------------------

namespace {

// One ring as a device keeps it: filled from slot 0 while it has room; once full, each new record
// replaces the oldest and the head moves on.
struct SRing {
    uint32_t m_head = 0;
    uint32_t m_count = 0;
    SThreadSample m_records[k_ring_records] = {};

    void write(SThreadSample const &_sample) {
        if (m_count < k_ring_records) {
            m_records[m_count++] = _sample;
            return;
        }
        m_records[m_head] = _sample;
        m_head = (m_head + 1) % k_ring_records;
    }
    // The section of a device's buffer: head, then the slots.
    void copy_to(unsigned char *_p_section) const {
        memcpy(_p_section, &m_head, 4);
        memcpy(_p_section + 4, m_records, sizeof(m_records));
    }
};

unsigned char const *section(unsigned char const *_p_buffer, unsigned _ring) {
    return _p_buffer + _ring * k_ring_section_bytes;
}

uint32_t section_head(unsigned char const *_p_section) {
    uint32_t head;
    memcpy(&head, _p_section, 4);
    return head;
}

SThreadSample section_record(unsigned char const *_p_section, unsigned _slot) {
    SThreadSample record;
    memcpy(&record, _p_section + 4 + _slot * sizeof(SThreadSample), sizeof(record));
    return record;
}

} // namespace

// ---------------------------------------------------------------------------------------------
// Recorded rings
// ---------------------------------------------------------------------------------------------

CThreadRingsRecording::CThreadRingsRecording() : m_buffer(k_ring_buffer_bytes, 0), m_process_id(0) {}

CThreadRingsRecording::CThreadRingsRecording(unsigned char const *_p_buffer) : CThreadRingsRecording() {
    set_buffer(_p_buffer);
}

void CThreadRingsRecording::set_buffer(unsigned char const *_p_buffer) {
    if (QOR_CHECK(_p_buffer)) memcpy(m_buffer.data(), _p_buffer, k_ring_buffer_bytes);
}

bool CThreadRingsRecording::fetch(unsigned char *_p_buffer) {
    if (!QOR_CHECK(_p_buffer)) return false;
    memcpy(_p_buffer, m_buffer.data(), k_ring_buffer_bytes);
    return true;
}

namespace {

// A recording file's lines, read into a buffer of the device's format and names to enter.
class CRecordingReader {
public:
    CRecordingReader() : m_buffer(k_ring_buffer_bytes, 0) {}

    // The reason of a bad line, or empty.
    string read_line(char const *_line) {
        char word[16] = "";
        int used = 0;
        if (sscanf(_line, " %15[a-z#]%n", word, &used) == 1) {
            if (word[0] == '#') return "";
            if (!strcmp(word, "process")) return read_process(_line + used);
            if (!strcmp(word, "name")) return read_name(_line + used);
            if (!strcmp(word, "ring")) return read_ring(_line + used);
            return string("unknown item '") + word + "'";
        }
        unsigned long long process, thread;
        long long time;
        char rest;
        int const items = sscanf(_line, " %llu %llu %lld %c", &process, &thread, &time, &rest);
        if (items == EOF) return ""; // a blank line
        if (items != 3 || process > UINT32_MAX || thread > UINT32_MAX) return "expected PROCESS THREAD TIME";
        if (m_ring < 0) return "a record before the first ring";
        if (m_slot >= k_ring_records) return "more than 4000 records in a ring";
        SThreadSample const record = {uint32_t(process), uint32_t(thread), int64_t(time)};
        memcpy(&m_buffer[m_ring * k_ring_section_bytes + 4 + m_slot++ * sizeof(record)], &record,
               sizeof(record));
        return "";
    }

    qor_vector<unsigned char> m_buffer;
    qor_vector<std::pair<unsigned, string>> m_names;
    uint32_t m_process_id = 0;

private:
    string read_process(char const *_rest) {
        unsigned long long id;
        char extra;
        if (sscanf(_rest, " %llu %c", &id, &extra) != 1 || id > UINT32_MAX) return "expected process ID";
        m_process_id = uint32_t(id);
        return "";
    }
    string read_name(char const *_rest) {
        unsigned long long id;
        int used = 0;
        if (sscanf(_rest, " %llu %n", &id, &used) != 1 || id > UINT32_MAX || !_rest[used])
            return "expected name ID TEXT";
        string text(_rest + used);
        text.erase(text.find_last_not_of(" \t\r\n") + 1);
        m_names.emplace_back(unsigned(id), text);
        return "";
    }
    string read_ring(char const *_rest) {
        unsigned ring, head;
        char extra;
        if (sscanf(_rest, " %u %u %c", &ring, &head, &extra) != 2 || ring >= k_ring_count ||
            head >= k_ring_records)
            return "expected ring R HEAD with R below 4 and HEAD below 4000";
        m_ring = int(ring);
        m_slot = 0;
        memcpy(&m_buffer[ring * k_ring_section_bytes], &head, 4);
        return "";
    }

    int m_ring = -1;
    unsigned m_slot = 0;
};

} // namespace

bool CThreadRingsRecording::load(char const *_path, string &_error) {
    FILE *p_file = _path ? fopen(_path, "r") : nullptr;
    if (!p_file) {
        _error = string("Cannot open '") + (_path ? _path : "") + "'";
        return false;
    }
    CRecordingReader reader;
    char line[512];
    unsigned number = 0;
    _error.clear();
    while (_error.empty() && fgets(line, sizeof(line), p_file)) {
        ++number;
        _error = reader.read_line(line);
    }
    fclose(p_file);
    if (!_error.empty()) {
        _error = string(_path) + ":" + std::to_string(number).c_str() + ": " + _error;
        return false;
    }
    m_buffer.swap(reader.m_buffer);
    m_process_id = reader.m_process_id;
    for (auto const &name : reader.m_names)
        CThreadMonitor::set_thread_name(name.first, name.second.c_str());
    return true;
}

bool CThreadRingsRecording::save(char const *_path) const {
    FILE *p_file = _path ? fopen(_path, "w") : nullptr;
    if (!p_file) return false;
    fprintf(p_file, "# Rings of the thread monitor: rings of PROCESS THREAD TIME records, in slot order.\n");
    fprintf(p_file, "process %u\n", m_process_id);
    qor_map<unsigned, bool> named;
    for (unsigned ring = 0; ring < k_ring_count; ++ring)
        for (unsigned slot = 0; slot < k_ring_records; ++slot) {
            unsigned const thread = section_record(section(m_buffer.data(), ring), slot).m_thread_id;
            if (strcmp(CThreadMonitor::get_thread_name(thread), "Unknown") && !named[thread])
                fprintf(p_file, "name %u %s\n", thread, CThreadMonitor::get_thread_name(thread));
            named[thread] = true;
        }
    for (unsigned ring = 0; ring < k_ring_count; ++ring) {
        unsigned char const *p_section = section(m_buffer.data(), ring);
        fprintf(p_file, "ring %u %u\n", ring, section_head(p_section));
        // Slots behind the last filled one stay zero at load.
        unsigned filled = k_ring_records;
        while (filled > 0 && !section_record(p_section, filled - 1).m_time)
            --filled;
        for (unsigned slot = 0; slot < filled; ++slot) {
            SThreadSample const record = section_record(p_section, slot);
            fprintf(p_file, "%u %u %lld\n", record.m_process_id, record.m_thread_id,
                    (long long)record.m_time);
        }
    }
    return fclose(p_file) == 0;
}

// ---------------------------------------------------------------------------------------------
// The sampler
// ---------------------------------------------------------------------------------------------

namespace {

int64_t const k_perf_period_ns = 4000000; // a sample of each processor every 4 ms
int const k_perf_drain_ms = 50;           // the kernel's buffers are read this often
unsigned const k_perf_pages = 8;          // data pages of each processor's buffer
int const k_proc_period_ms = 20;          // a look at /proc this often
size_t const k_proc_threads_room = 4096;  // threads in state R that a look keeps the run times of

// One processor's clock event and the buffer that the kernel writes its samples into.
struct SPerfEvent {
    int m_fd;
    unsigned m_cpu;
    perf_event_mmap_page *mp_page;
    size_t m_map_size;
};

// A sample record of the events as opened below: process and thread ids, then the time.
struct SPerfSample {
    uint32_t m_pid;
    uint32_t m_tid;
    uint64_t m_time;
};

// The kernel's times are of the monotonic clock; samples carry the time stamp counter. Two
// readings of both, the first at install and the latest at each drain, map one onto the other.
struct SClockMap {
    int64_t m_tsc0 = 0, m_ns0 = 0, m_tsc1 = 0, m_ns1 = 0;

    static void read(int64_t &_tsc, int64_t &_ns) {
        _ns = qorplatform::read_monotonic_ns();
        _tsc = qorplatform::read_hardware_time_stamp_counter();
    }
    void begin() {
        read(m_tsc0, m_ns0);
        m_tsc1 = m_tsc0;
        m_ns1 = m_ns0;
    }
    void update() { read(m_tsc1, m_ns1); }
    int64_t to_tsc(int64_t _ns) const {
        if (m_ns1 == m_ns0) return m_tsc0;
        return m_tsc0 + int64_t(__int128(_ns - m_ns0) * (m_tsc1 - m_tsc0) / (m_ns1 - m_ns0));
    }
};

} // namespace

struct CThreadSampler::SState {
    ESource m_wanted;
    ESource m_source = SOURCE_NONE;
    unsigned m_cpus = 1;
    qor_vector<SPerfEvent> m_events;
    SClockMap m_clock_map;

    std::mutex m_mutex; // the rings and m_running, between the sampling thread and the others
    std::condition_variable m_wake;
    bool m_running = false;
    // A thread of the system's own making: std::thread would put its start record on the library's
    // heap and free it on the new thread.
    pthread_t m_thread;
    bool m_started = false;

    static void *thread_main(void *_p_state) {
        static_cast<SState *>(_p_state)->run();
        return nullptr;
    }
    std::atomic<uint32_t> m_thread_id{0};
    SRing m_rings[k_ring_count];

    void write(unsigned _cpu, SThreadSample const &_sample) {
        std::lock_guard<std::mutex> lock(m_mutex);
        m_rings[_cpu % k_ring_count].write(_sample);
    }

    // -- the kernel's events

    bool open_events() {
        perf_event_attr attributes;
        memset(&attributes, 0, sizeof(attributes));
        attributes.size = sizeof(attributes);
        attributes.type = PERF_TYPE_SOFTWARE;
        attributes.config = PERF_COUNT_SW_CPU_CLOCK;
        attributes.sample_period = k_perf_period_ns;
        attributes.sample_type = PERF_SAMPLE_TID | PERF_SAMPLE_TIME;
        attributes.use_clockid = 1;
        attributes.clockid = CLOCK_MONOTONIC;
        attributes.disabled = 1;
        size_t const page = size_t(sysconf(_SC_PAGESIZE));
        for (unsigned cpu = 0; cpu < m_cpus; ++cpu) {
            int const fd =
                int(syscall(SYS_perf_event_open, &attributes, -1, int(cpu), -1, PERF_FLAG_FD_CLOEXEC));
            if (fd < 0 && errno == ENODEV) continue; // a processor that is offline
            if (fd < 0) return false;
            size_t const size = (1 + k_perf_pages) * page;
            void *p_map = mmap(nullptr, size, PROT_READ | PROT_WRITE, MAP_SHARED, fd, 0);
            if (p_map == MAP_FAILED) {
                close(fd);
                return false;
            }
            m_events.push_back(SPerfEvent{fd, cpu, static_cast<perf_event_mmap_page *>(p_map), size});
        }
        return !m_events.empty();
    }

    void close_events() {
        for (SPerfEvent const &event : m_events) {
            munmap(event.mp_page, event.m_map_size);
            close(event.m_fd);
        }
        m_events.clear();
    }

    // The processors' clocks are started a fraction of the period apart: a merged sample stands
    // for the time up to the next one of any processor, so samples that came in step would give
    // one processor the whole period and the others nothing.
    void enable_events() {
        int64_t const stagger_ns = k_perf_period_ns / int64_t(std::max<size_t>(m_events.size(), 1));
        for (SPerfEvent const &event : m_events) {
            if (&event != &m_events.front())
                std::this_thread::sleep_for(std::chrono::nanoseconds(stagger_ns));
            ioctl(event.m_fd, PERF_EVENT_IOC_ENABLE, 0);
        }
    }
    void disable_events() {
        for (SPerfEvent const &event : m_events)
            ioctl(event.m_fd, PERF_EVENT_IOC_DISABLE, 0);
    }

    // Takes what the kernel has written since the last drain into the processor's ring. A record
    // may wrap around the end of the data area.
    void drain(SPerfEvent const &_event) {
        perf_event_mmap_page *p_page = _event.mp_page;
        unsigned char const *p_data = reinterpret_cast<unsigned char const *>(p_page) + p_page->data_offset;
        uint64_t const size = p_page->data_size;
        uint64_t const head = __atomic_load_n(&p_page->data_head, __ATOMIC_ACQUIRE);
        uint64_t tail = p_page->data_tail;
        while (tail + sizeof(perf_event_header) <= head) {
            unsigned char record[256];
            perf_event_header header;
            copy_wrapped(&header, p_data, size, tail, sizeof(header));
            if (header.size < sizeof(header) || tail + header.size > head) break;
            if (header.type == PERF_RECORD_SAMPLE && header.size >= sizeof(header) + sizeof(SPerfSample) &&
                header.size <= sizeof(record)) {
                copy_wrapped(record, p_data, size, tail, header.size);
                SPerfSample sample;
                memcpy(&sample, record + sizeof(header), sizeof(sample));
                write(_event.m_cpu,
                      SThreadSample{sample.m_pid, sample.m_tid, m_clock_map.to_tsc(int64_t(sample.m_time))});
            }
            tail += header.size;
        }
        __atomic_store_n(&p_page->data_tail, tail, __ATOMIC_RELEASE);
    }

    static void copy_wrapped(void *_p_out, unsigned char const *_p_data, uint64_t _size, uint64_t _at,
                             size_t _count) {
        uint64_t const offset = _at % _size;
        size_t const first = size_t(std::min<uint64_t>(_count, _size - offset));
        memcpy(_p_out, _p_data + offset, first);
        memcpy(static_cast<unsigned char *>(_p_out) + first, _p_data, _count - first);
    }

    // -- /proc

    // Of the threads in state R that the processor field puts on a processor, one is taken to have
    // had it, drawn with a chance in proportion to its run time since the last look (schedstat):
    // so over many looks each thread has its share of the samples. A processor without one ran
    // the idle process. The sampler's own thread, running as it looks, is passed over.
    void look_at_proc() {
        std::fill(m_seen.begin(), m_seen.end(), SCandidate());
        m_run_times_now.clear();
        int64_t const now = qorplatform::read_hardware_time_stamp_counter();
        qorplatform::for_each_process_id(
            [](uint32_t _pid, void *_p_self) {
                SState *p_self = static_cast<SState *>(_p_self);
                p_self->m_pid = _pid;
                qorplatform::for_each_thread(
                    _pid,
                    [](uint32_t _tid, void *_p_state) {
                        static_cast<SState *>(_p_state)->look_at_thread(_tid);
                    },
                    p_self);
            },
            this);
        std::sort(m_run_times_now.begin(), m_run_times_now.end(), SRunTime::by_thread);
        m_run_times.swap(m_run_times_now);
        for (unsigned cpu = 0; cpu < m_cpus; ++cpu)
            write(cpu, SThreadSample{m_seen[cpu].m_pid, m_seen[cpu].m_tid, now});
    }

    void look_at_thread(uint32_t _tid) {
        if (_tid == m_thread_id) return;
        char line[1024];
        if (!read_task_file(_tid, "stat", line, sizeof(line))) return;
        // After the name in parentheses, which may hold anything: the state, then fields 4 to 39,
        // the last of them the processor.
        char const *p_field = strrchr(line, ')');
        if (!p_field || p_field[1] != ' ' || p_field[2] != 'R') return;
        p_field += 2;
        for (int field = 3; field < 39 && p_field; ++field) {
            p_field = strchr(p_field, ' ');
            if (p_field) ++p_field;
        }
        if (!p_field) return;
        unsigned const cpu = unsigned(strtoul(p_field, nullptr, 10));
        if (cpu >= m_cpus || !read_task_file(_tid, "schedstat", line, sizeof(line))) return;
        uint64_t const run_time = strtoull(line, nullptr, 10);
        if (m_run_times_now.size() < m_run_times_now.capacity())
            m_run_times_now.push_back(SRunTime{_tid, run_time});
        auto before =
            std::lower_bound(m_run_times.begin(), m_run_times.end(), SRunTime{_tid, 0}, SRunTime::by_thread);
        uint64_t const ran = before != m_run_times.end() && before->m_tid == _tid && run_time > before->m_ns
                                 ? run_time - before->m_ns
                                 : 0;
        SCandidate &seen = m_seen[cpu];
        seen.m_ran += ran;
        if (seen.m_pid == 0 || (ran > 0 && next_random() % seen.m_ran < ran)) {
            seen.m_pid = m_pid;
            seen.m_tid = _tid;
        }
    }

    // xorshift64: the draws need no quality beyond an even spread.
    uint64_t next_random() {
        m_random ^= m_random << 13;
        m_random ^= m_random >> 7;
        m_random ^= m_random << 17;
        return m_random;
    }

    bool read_task_file(uint32_t _tid, char const *_name, char *_line, size_t _size) const {
        char path[64];
        snprintf(path, sizeof(path), "/proc/%u/task/%u/%s", m_pid, _tid, _name);
        int const file = open(path, O_RDONLY | O_CLOEXEC);
        if (file < 0) return false;
        ssize_t const length = read(file, _line, _size - 1);
        close(file);
        if (length <= 0) return false;
        _line[length] = 0;
        return true;
    }

    struct SCandidate {
        uint32_t m_pid = 0, m_tid = 0;
        uint64_t m_ran = 0; // ns on the processor since the last look, of all threads drawn from
    };
    // The run times of the threads in state R at the last look, by id, and of this one.
    struct SRunTime {
        uint32_t m_tid;
        uint64_t m_ns;
        static bool by_thread(SRunTime const &_a, SRunTime const &_b) { return _a.m_tid < _b.m_tid; }
    };
    // The room of these is made before the sampling thread starts, which must not allocate: the
    // library's heap belongs to the thread that drives the library.
    qor_vector<SCandidate> m_seen; // by processor, during a look
    qor_vector<SRunTime> m_run_times, m_run_times_now;

    void make_room() {
        m_seen.assign(m_cpus, SCandidate());
        m_run_times.clear();
        m_run_times_now.clear();
        m_run_times.reserve(k_proc_threads_room);
        m_run_times_now.reserve(k_proc_threads_room);
    }
    uint32_t m_pid = 0; // the process whose threads a look goes through
    uint64_t m_random = 0x9E3779B97F4A7C15ull;

    // -- the thread

    void run() {
        m_thread_id = qorplatform::get_current_thread_id();
        int const wait_ms = m_source == SOURCE_PERF ? k_perf_drain_ms : k_proc_period_ms;
        std::unique_lock<std::mutex> lock(m_mutex);
        while (m_running) {
            m_wake.wait_for(lock, std::chrono::milliseconds(wait_ms));
            if (!m_running) break;
            lock.unlock();
            if (m_source == SOURCE_PERF) {
                m_clock_map.update();
                for (SPerfEvent const &event : m_events)
                    drain(event);
            } else {
                look_at_proc();
            }
            lock.lock();
        }
    }
};

CThreadSampler::CThreadSampler(ESource _wanted) : mp_state(new SState) {
    mp_state->m_wanted = _wanted;
    long const cpus = sysconf(_SC_NPROCESSORS_CONF);
    mp_state->m_cpus = cpus > 0 ? unsigned(cpus) : 1;
}

CThreadSampler::~CThreadSampler() {
    stop();
    remove();
}

void CThreadSampler::install() {
    SState &state = *mp_state;
    if (state.m_source != SOURCE_NONE) return;
    if (state.m_wanted != SOURCE_PROC) {
        if (state.open_events()) {
            state.m_source = SOURCE_PERF;
            return;
        }
        state.close_events();
    }
    if (state.m_wanted != SOURCE_PERF) state.m_source = SOURCE_PROC;
}

void CThreadSampler::start() {
    SState &state = *mp_state;
    if (state.m_source == SOURCE_NONE || state.m_started) return;
    state.m_running = true;
    state.make_room();
    if (state.m_source == SOURCE_PERF) {
        state.m_clock_map.begin();
        state.enable_events();
    }
    if (pthread_create(&state.m_thread, nullptr, SState::thread_main, &state) != 0) {
        state.m_running = false;
        state.disable_events();
        return;
    }
    state.m_started = true;
    while (!state.m_thread_id)
        std::this_thread::yield();
    CThreadMonitor::set_thread_name(state.m_thread_id, "Thread_Sampler");
}

void CThreadSampler::stop() {
    SState &state = *mp_state;
    if (!state.m_started) return;
    {
        std::lock_guard<std::mutex> lock(state.m_mutex);
        state.m_running = false;
    }
    state.m_wake.notify_all();
    pthread_join(state.m_thread, nullptr);
    state.m_started = false;
    state.m_thread_id = 0;
    state.disable_events();
}

void CThreadSampler::remove() {
    stop();
    mp_state->close_events();
    mp_state->m_source = SOURCE_NONE;
}

bool CThreadSampler::fetch(unsigned char *_p_buffer) {
    SState &state = *mp_state;
    if (!QOR_CHECK(_p_buffer) || !state.m_started) return false;
    std::lock_guard<std::mutex> lock(state.m_mutex);
    for (unsigned ring = 0; ring < k_ring_count; ++ring)
        state.m_rings[ring].copy_to(_p_buffer + ring * k_ring_section_bytes);
    return true;
}

CThreadSampler::ESource CThreadSampler::get_source() const {
    return mp_state->m_source;
}

// ---------------------------------------------------------------------------------------------
// The monitor
// ---------------------------------------------------------------------------------------------

namespace {
uint32_t const k_refresh_ms = 2000;
} // namespace

// The timer resolution that a desktop system must be asked for is the kernel's own here.
CThreadMonitor::CThreadMonitor(IThreadMonitorDevice *_p_device)
    : m_base(0), m_ticks_per_second(0), m_last_refresh(0), m_status(0), m_last_tsc(0), m_last_counter(0),
      mp_device(_p_device) {
    memset(m_samples, 0, sizeof(m_samples));
    m_last_tsc = read_time_stamp_counter();
    m_last_refresh = qorplatform::get_tick_count() - 2 * k_refresh_ms;
    m_last_counter = qorplatform::query_performance_counter();
    if (!mp_device) {
        mp_own_device.reset(new CThreadSampler);
        mp_device = mp_own_device.get();
    }
    mp_device->install();
    mp_device->start();
    set_thread_name(qorplatform::get_current_thread_id(), "Main_Thread");
}

CThreadMonitor::~CThreadMonitor() {
    mp_device->stop();
    mp_device->remove();
    for (auto &entry : thread_names().m_names) {
        qor_free(entry.second);
        entry.second = nullptr;
    }
}

// All readings come from one processor, the first, so that they compare across processors whose
// counters might not agree.
int64_t CThreadMonitor::read_time_stamp_counter() const {
    uint64_t const old_mask = qorplatform::set_thread_affinity_mask(1);
    qorplatform::yield_thread();
    int64_t const tsc = qorplatform::read_time_stamp_counter();
    if (old_mask) qorplatform::set_thread_affinity_mask(old_mask);
    return tsc;
}

bool CThreadMonitor::refresh(int *_p_status) {
    int status_unused;
    int &status = _p_status ? *_p_status : status_unused;
    status = 0;
    uint32_t const now = qorplatform::get_tick_count();
    if (now - m_last_refresh < k_refresh_ms) {
        status = m_status;
        return true;
    }
    m_last_refresh = now;

    // The counter's frequency against the performance counter's over the time since the last
    // fetch; a fetch in the same instant as the last has nothing to measure.
    int64_t const tsc = read_time_stamp_counter();
    int64_t const counter = qorplatform::query_performance_counter();
    int64_t const frequency = qorplatform::query_performance_frequency();
    int64_t const d_tsc = tsc - m_last_tsc, d_counter = counter - m_last_counter;
    m_last_tsc = tsc;
    m_last_counter = counter;
    if (d_counter / 1024 != 0) m_ticks_per_second = ((d_tsc / 1024) * frequency) / (d_counter / 1024);

    qor_vector<unsigned char> buffer(k_ring_buffer_bytes, 0);
    if (!mp_device->fetch(buffer.data())) return false;
    merge(buffer.data());
    status = m_status = 0;
    return true;
}

// Each ring is read from its oldest record on, and the four together sorted by time; unfilled
// slots are zero and so come first. A ring so read is mostly in time order already: then the four
// runs are merged in linear time, else the whole is sorted. Equal times keep no defined order.
void CThreadMonitor::merge(unsigned char const *_p_buffer) {
    m_base = 0;
    auto const earlier = [](SThreadSample const &_a, SThreadSample const &_b) {
        return _a.m_time < _b.m_time;
    };
    qor_vector<SThreadSample> runs(k_ring_samples);
    bool in_order = true;
    for (unsigned ring = 0; ring < k_ring_count; ++ring) {
        unsigned char const *p_section = section(_p_buffer, ring);
        SThreadSample *p_run = runs.data() + ring * k_ring_records;
        for (unsigned i = 0; i < k_ring_records; ++i)
            p_run[i] = section_record(p_section, (section_head(p_section) + i) % k_ring_records);
        in_order = in_order && std::is_sorted(p_run, p_run + k_ring_records, earlier);
    }
    if (!in_order) {
        std::copy(runs.begin(), runs.end(), m_samples);
        std::sort(m_samples, m_samples + k_ring_samples, earlier);
        return;
    }
    unsigned const half = k_ring_samples / 2;
    qor_vector<SThreadSample> halves(k_ring_samples);
    std::merge(&runs[0], &runs[k_ring_records], &runs[k_ring_records], &runs[half], &halves[0], earlier);
    std::merge(&runs[half], &runs[half + k_ring_records], &runs[half + k_ring_records],
               runs.data() + k_ring_samples, &halves[half], earlier);
    std::merge(&halves[0], &halves[half], &halves[half], halves.data() + k_ring_samples, m_samples, earlier);
}

// ---------------------------------------------------------------------------------------------
// Processes and threads
// ---------------------------------------------------------------------------------------------

void CThreadMonitor::update_processes() {
    qor_vector<SProcessInfo>().swap(m_processes);
    qorplatform::for_each_process(
        [](uint32_t _id, char const *_name, void *_p_list) {
            SProcessInfo info;
            info.m_id = _id;
            strncpy(info.m_name, _name, sizeof(info.m_name) - 1);
            info.m_name[sizeof(info.m_name) - 1] = 0;
            static_cast<qor_vector<SProcessInfo> *>(_p_list)->push_back(info);
        },
        &m_processes);
}

void CThreadMonitor::update_threads(unsigned _process_id) {
    qor_vector<unsigned>().swap(m_threads);
    qorplatform::for_each_thread(
        _process_id,
        [](uint32_t _id, void *_p_list) { static_cast<qor_vector<unsigned> *>(_p_list)->push_back(_id); },
        &m_threads);
}

// ---------------------------------------------------------------------------------------------
// Activity
// ---------------------------------------------------------------------------------------------

// Over the last T = _period * ticks per second / 2 counter ticks: each sample of the thread stands
// for the time up to the next sample of any thread. Its slice becomes columns
// [a * width * 2 / ticks / period, the same of b], at least one column wide; slices that meet in a
// column make one bar. The busy share is the slices' total over T in thousandths, rounded.
void CThreadMonitor::get_thread_activity(unsigned _process_id, unsigned _thread_id,
                                         qor_vector<SActivitySegment> &_segments, unsigned _width,
                                         unsigned _period, unsigned *_p_per_mille) const {
    if (m_ticks_per_second == 0) return;
    int64_t const period_ticks = int64_t(_period) * m_ticks_per_second / 2;
    if (!QOR_CHECK(_p_per_mille) || !QOR_CHECK(period_ticks > 0)) return;
    SThreadSample const *p_samples = m_samples + m_base;
    unsigned const newest = k_ring_samples - 1;

    unsigned start = newest;
    while (start > 0 && p_samples[newest].m_time - p_samples[start].m_time <= period_ticks)
        --start;

    int64_t total = 0;
    int64_t const start_time = p_samples[start].m_time;
    for (unsigned k = start; k < newest; ++k) {
        SThreadSample const &sample = p_samples[k];
        bool const counts = _thread_id == ~0u
                                ? (sample.m_process_id != _process_id && sample.m_process_id != 0) ||
                                      (sample.m_process_id == _process_id && sample.m_thread_id == ~0u)
                                : sample.m_process_id == _process_id && sample.m_thread_id == _thread_id;
        if (!counts) continue;
        int64_t const a = sample.m_time - start_time;
        int64_t b = std::max(a, p_samples[k + 1].m_time - start_time);
        if (a > period_ticks) break;
        b = std::min(b, period_ticks);
        total += b - a;
        int64_t const x0 = a * _width * 2 / m_ticks_per_second / _period;
        int64_t x1 = b * _width * 2 / m_ticks_per_second / _period;
        if (x0 >= int64_t(_width)) break;
        if (x1 == x0) x1 = x0 + 1;
        x1 = std::min<int64_t>(x1, int64_t(_width) - 1);
        if (_segments.empty() || _segments.back().m_end < x0)
            _segments.push_back(SActivitySegment{uint16_t(x0), uint16_t(x1)});
        else
            _segments.back().m_end = uint16_t(x1);
    }
    *_p_per_mille = unsigned((total * 1000 + period_ticks / 2) / period_ticks);
}

} // namespace qorui
