// The platform layer: the few operating-system calls the engine and the library were written
// against (tick count, performance counter, module loading, message box), as thin Linux functions.
#pragma once
#include <cstdint>

namespace qorplatform {

// Milliseconds of a monotonic clock, 32-bit, wrapping after about 49.7 days.
uint32_t get_tick_count();
// Nanoseconds of a monotonic clock; the frequency is 1e9 counts per second.
int64_t query_performance_counter();
// Counts of query_performance_counter per second: always 1e9.
int64_t query_performance_frequency();
// Nanoseconds of the kernel's monotonic clock, read each time and never replaced by a test's clock:
// the clock that the kernel's own time stamps (of scheduler events, for one) are in.
int64_t read_monotonic_ns();

// A clock that replaces the system's: tests set the time themselves, so fades, double clicks
// and blinks are exact. Null restores the system clock.
struct IClock {
    virtual ~IClock() {}
    virtual uint32_t tick_count() = 0;         // ms
    virtual int64_t performance_counter() = 0; // ns
};
// Puts the clock in place of the system clock; null restores the system clock. The caller
// keeps ownership and keeps the clock alive while it is set.
void set_clock(IClock *_p_clock);

// A clock that only moves when told to; a convenience for tests and replayed input.
class CManualClock : public IClock {
public:
    // Starts at _start_ms milliseconds (and the same time in nanoseconds).
    explicit CManualClock(uint32_t _start_ms = 1000) : m_ms(_start_ms), m_ns(int64_t(_start_ms) * 1000000) {}
    uint32_t tick_count() override { return m_ms; }
    int64_t performance_counter() override { return m_ns; }
    // Moves both counts forward; the millisecond count wraps like the system one.
    void advance_ms(uint32_t _ms) {
        m_ms += _ms;
        m_ns += int64_t(_ms) * 1000000;
    }
    // Moves the nanosecond count forward; the millisecond count follows it, truncated.
    void advance_ns(int64_t _ns) {
        m_ns += _ns;
        m_ms = uint32_t(m_ns / 1000000);
    }

private:
    uint32_t m_ms;
    int64_t m_ns;
};

// dlopen / dlsym / dlclose. Null on failure; last_module_error() tells why.
void *load_library(char const *_file_name);
// The address of an exported symbol of a loaded module.
void *get_proc_address(void *_module, char const *_name);
// Unloads a module that load_library gave.
void free_library(void *_module);
// The text of the last failure of the three above.
char const *last_module_error();

// The message box of a desktop system: here the caption and text go to stderr.
void message_box(char const *_text, char const *_caption);

// ---------------------------------------------------------------------------------------------
// Threads, processors and processes
// ---------------------------------------------------------------------------------------------

// The kernel's ids of the calling thread and of its process.
// @{
uint32_t get_current_thread_id();
uint32_t get_current_process_id();
// @}

// The calling thread's processors as a mask of processors 0 to 63. Setting gives the mask before
// the change, or 0 when the kernel refuses it (a processor that the thread may not use); the
// thread then stays where it was allowed to run.
// @{
uint64_t get_thread_affinity_mask();
uint64_t set_thread_affinity_mask(uint64_t _mask);
// @}
// Gives up the rest of the thread's time slice, so that a new affinity takes effect.
void yield_thread();

// The processor's time stamp counter (rdtsc), read where the thread runs now. With a clock set by
// set_clock, that clock's performance counter stands in for it: a replaced clock's counter is the
// only time base its runs have.
int64_t read_time_stamp_counter();
// The counter of the processor itself, whatever clock is set: for samplers that stamp what the
// hardware does.
int64_t read_hardware_time_stamp_counter();

// Each process of the machine from /proc: its id and the file name of its executable (the
// kernel's short name for a process without one, such as a kernel thread). False when /proc can't
// be read, and nothing was visited.
// @{
typedef void (*process_visitor_t)(uint32_t _id, char const *_name, void *_user);
bool for_each_process(process_visitor_t _visit, void *_user);
// @}
// The same, ids only, for callers that look at many processes often.
// @{
typedef void (*id_visitor_t)(uint32_t _id, void *_user);
bool for_each_process_id(id_visitor_t _visit, void *_user);
// @}
// Each thread of the process _process_id from /proc/ID/task, in the kernel's order. False when
// the process's task folder can't be read.
bool for_each_thread(uint32_t _process_id, id_visitor_t _visit, void *_user);

} // namespace qorplatform
