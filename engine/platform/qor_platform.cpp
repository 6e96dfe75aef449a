// The platform layer over Linux: monotonic clocks, dlopen, stderr for message boxes, thread
// affinity and the time stamp counter, and the processes and threads of /proc.
#include "qor_platform.h"

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <dirent.h>
#include <dlfcn.h>
#include <limits.h>
#include <sched.h>
#include <sys/syscall.h>
#include <unistd.h>
#include <x86intrin.h>

namespace qorplatform {

namespace {

IClock *gp_clock = nullptr;
char g_module_error[512] = "";

// The time stamp counter in nanoseconds of the monotonic clock. Where the processor's counter runs
// at one rate whatever its power state, reading it costs a fraction of a reading of the kernel's
// clock, which a profiler pays twice for every stretch it times. The rate is measured once, over
// the first two milliseconds of the first reading; where the counter can't be trusted, the kernel's
// clock is read instead.
class CCounterClock {
public:
    CCounterClock() : m_usable(counter_is_constant()), m_tsc0(0), m_ns0(0), m_ns_per_count(0.0) {
        if (!m_usable) return;
        read_both(m_tsc0, m_ns0);
        int64_t tsc1 = m_tsc0, ns1 = m_ns0;
        while (ns1 - m_ns0 < 2000000)
            read_both(tsc1, ns1);
        m_usable = tsc1 > m_tsc0;
        if (m_usable) m_ns_per_count = double(ns1 - m_ns0) / double(tsc1 - m_tsc0);
    }

    int64_t now_ns() const {
        if (!m_usable) return read_monotonic_ns();
        return m_ns0 + static_cast<int64_t>(double(int64_t(__rdtsc()) - m_tsc0) * m_ns_per_count);
    }

private:
    // The kernel says so in the processor's flags: a constant rate that doesn't stop when idle.
    static bool counter_is_constant() {
        FILE *p_file = fopen("/proc/cpuinfo", "r");
        if (!p_file) return false;
        char line[4096];
        bool found = false;
        while (!found && fgets(line, sizeof(line), p_file))
            found = strncmp(line, "flags", 5) == 0;
        fclose(p_file);
        return found && strstr(line, " constant_tsc") && strstr(line, " nonstop_tsc");
    }
    // The kernel's clock paired with the middle of two readings of the counter; a pair that the
    // scheduler split (more than 100,000 counts apart) is read again.
    static void read_both(int64_t &_tsc, int64_t &_ns) {
        for (int attempt = 0; attempt < 100; ++attempt) {
            int64_t const before = int64_t(__rdtsc());
            _ns = read_monotonic_ns();
            int64_t const after = int64_t(__rdtsc());
            _tsc = before + (after - before) / 2;
            if (after - before < 100000) return;
        }
    }

    bool m_usable;
    int64_t m_tsc0, m_ns0;
    double m_ns_per_count;
};

CCounterClock const &counter_clock() {
    static CCounterClock const s_clock;
    return s_clock;
}

// Keeps a copy of the loader's last error: dlerror() forgets it once read.
void keep_error(char const *_fallback) {
    char const *error = dlerror();
    snprintf(g_module_error, sizeof(g_module_error), "%s", error ? error : _fallback);
}

} // namespace

int64_t read_monotonic_ns() {
    timespec now;
    clock_gettime(CLOCK_MONOTONIC, &now);
    return int64_t(now.tv_sec) * 1000000000 + now.tv_nsec;
}

uint32_t get_tick_count() {
    if (gp_clock) return gp_clock->tick_count();
    return static_cast<uint32_t>(read_monotonic_ns() / 1000000); // wraps, as a 32-bit tick count does
}

int64_t query_performance_counter() {
    return gp_clock ? gp_clock->performance_counter() : counter_clock().now_ns();
}

int64_t query_performance_frequency() {
    return 1000000000;
}

void set_clock(IClock *_p_clock) {
    gp_clock = _p_clock;
}

// A null file name would give the program itself; here it is a failure.
void *load_library(char const *_file_name) {
    if (!_file_name) {
        snprintf(g_module_error, sizeof(g_module_error), "no file name");
        return nullptr;
    }
    void *module = dlopen(_file_name, RTLD_NOW | RTLD_LOCAL);
    if (!module) keep_error("unknown error");
    return module;
}

void *get_proc_address(void *_module, char const *_name) {
    if (!_module || !_name) {
        snprintf(g_module_error, sizeof(g_module_error), "%s", _module ? "no symbol name" : "no module");
        return nullptr;
    }
    dlerror(); // a null symbol is an error only if dlerror says so afterwards
    void *symbol = dlsym(_module, _name);
    if (!symbol) keep_error("symbol is null");
    return symbol;
}

void free_library(void *_module) {
    if (_module && dlclose(_module) != 0) keep_error("unknown error");
}

char const *last_module_error() {
    return g_module_error;
}

void message_box(char const *_text, char const *_caption) {
    fprintf(stderr, "%s: %s\n", _caption ? _caption : "", _text ? _text : "");
    fflush(stderr);
}

// ---------------------------------------------------------------------------------------------
// Threads, processors and processes
// ---------------------------------------------------------------------------------------------

uint32_t get_current_thread_id() {
    return static_cast<uint32_t>(syscall(SYS_gettid));
}

uint32_t get_current_process_id() {
    return static_cast<uint32_t>(getpid());
}

uint64_t get_thread_affinity_mask() {
    cpu_set_t set;
    CPU_ZERO(&set);
    if (sched_getaffinity(0, sizeof(set), &set) != 0) return 0;
    uint64_t mask = 0;
    for (int cpu = 0; cpu < 64; ++cpu)
        if (CPU_ISSET(cpu, &set)) mask |= uint64_t(1) << cpu;
    return mask;
}

uint64_t set_thread_affinity_mask(uint64_t _mask) {
    uint64_t const old_mask = get_thread_affinity_mask();
    cpu_set_t set;
    CPU_ZERO(&set);
    for (int cpu = 0; cpu < 64; ++cpu)
        if (_mask & (uint64_t(1) << cpu)) CPU_SET(cpu, &set);
    if (old_mask == 0 || sched_setaffinity(0, sizeof(set), &set) != 0) return 0;
    return old_mask;
}

void yield_thread() {
    sched_yield();
}

int64_t read_time_stamp_counter() {
    return gp_clock ? gp_clock->performance_counter() : read_hardware_time_stamp_counter();
}

int64_t read_hardware_time_stamp_counter() {
    return static_cast<int64_t>(__rdtsc());
}

namespace {

// The numbered entries of a /proc folder, as ids.
template <class TVisit>
bool for_each_numbered_entry(char const *_folder, TVisit _visit) {
    DIR *p_dir = opendir(_folder);
    if (!p_dir) return false;
    while (dirent *p_entry = readdir(p_dir)) {
        char *p_end = nullptr;
        unsigned long const id = strtoul(p_entry->d_name, &p_end, 10);
        if (p_end != p_entry->d_name && *p_end == 0 && id <= UINT32_MAX) _visit(static_cast<uint32_t>(id));
    }
    closedir(p_dir);
    return true;
}

// The file name of the process's executable; its short name from "comm" when it has none that we
// may read.
void process_name(uint32_t _id, char *_name, size_t _size) {
    char path[64], target[PATH_MAX];
    snprintf(path, sizeof(path), "/proc/%u/exe", _id);
    ssize_t const length = readlink(path, target, sizeof(target) - 1);
    if (length > 0) {
        target[length] = 0;
        char const *p_slash = strrchr(target, '/');
        snprintf(_name, _size, "%s", p_slash ? p_slash + 1 : target);
        return;
    }
    _name[0] = 0;
    snprintf(path, sizeof(path), "/proc/%u/comm", _id);
    if (FILE *p_file = fopen(path, "r")) {
        if (fgets(_name, static_cast<int>(_size), p_file)) _name[strcspn(_name, "\n")] = 0;
        fclose(p_file);
    }
}

} // namespace

bool for_each_process(process_visitor_t _visit, void *_user) {
    if (!_visit) return false;
    return for_each_numbered_entry("/proc", [&](uint32_t _id) {
        char name[PATH_MAX];
        process_name(_id, name, sizeof(name));
        _visit(_id, name, _user);
    });
}

bool for_each_process_id(id_visitor_t _visit, void *_user) {
    if (!_visit) return false;
    return for_each_numbered_entry("/proc", [&](uint32_t _id) { _visit(_id, _user); });
}

bool for_each_thread(uint32_t _process_id, id_visitor_t _visit, void *_user) {
    if (!_visit) return false;
    char folder[64];
    snprintf(folder, sizeof(folder), "/proc/%u/task", _process_id);
    return for_each_numbered_entry(folder, [&](uint32_t _id) { _visit(_id, _user); });
}

} // namespace qorplatform
