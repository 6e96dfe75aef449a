// The thread monitor: which thread had a processor when, across the whole machine, in the last
// few seconds. A sampling device records timestamped samples of the running process and thread
// into four rings; the monitor fetches them at most every two seconds, merges them into one
// time-ordered list and turns that list into busy bars and a busy ratio for any thread. It also
// keeps the names of threads, in a map that exists without a monitor.
//
//   the rings' format    k_ring_*, SThreadSample
//   devices              IThreadMonitorDevice, CThreadSampler (the machine), CThreadRingsRecording
//   the monitor          CThreadMonitor: refresh, processes and threads, activity, thread names
#pragma once
#include "qor_memory.h"

#include <cstdint>
#include <memory>

namespace qorui {

// ---------------------------------------------------------------------------------------------
// The rings' format
// ---------------------------------------------------------------------------------------------

// A device's buffer: four ring sections in a row, each an unsigned head (the ring's oldest record,
// 0 to 3999) followed by 4000 records. Slots that the device hasn't filled stay zero.
enum : unsigned {
    k_ring_count = 4,
    k_ring_records = 4000,
    k_ring_section_bytes = 4 + k_ring_records * 16,            // 64004
    k_ring_buffer_bytes = k_ring_count * k_ring_section_bytes, // 256016
    k_ring_samples = k_ring_count * k_ring_records,            // 16000
};

// One sample, 16 bytes as the device writes it.
struct SThreadSample {
    uint32_t m_process_id; // the process that was running; 0 is the idle process
    uint32_t m_thread_id;  // the thread that was running
    int64_t m_time;        // the time stamp counter at the sample
};
static_assert(sizeof(SThreadSample) == 16, "a sample is 16 bytes in the rings");

// ---------------------------------------------------------------------------------------------
// Devices
// ---------------------------------------------------------------------------------------------

// Where the samples come from. The monitor installs and starts its device when it is made, and
// stops and removes it when it goes.
class IThreadMonitorDevice {
public:
    virtual ~IThreadMonitorDevice() {}
    // Makes the device ready to record (the sampler opens its sources), then starts recording;
    // stop and remove undo them in the reverse order.
    // @{
    virtual void install() = 0;
    virtual void start() = 0;
    virtual void stop() = 0;
    virtual void remove() = 0;
    // @}
    // Copies the four rings with their heads into _p_buffer of k_ring_buffer_bytes. False when the
    // device can't be reached (not installed or not running): the buffer is left alone then.
    virtual bool fetch(unsigned char *_p_buffer) = 0;
};

// The machine's sampler: a thread of its own that records, for each processor, which process and
// thread ran on it, about 250 times a second, stamped with the processor's time stamp counter.
// Processor p writes ring p modulo 4. The samples come from the kernel's processor-clock events
// (perf_event_open) where the kernel lets this process watch every processor; elsewhere from
// /proc, about 50 times a second: of the threads in state R on a processor, one drawn by its run
// time since the last look, so that each has its share of the samples. The sampler's thread is
// named "Thread_Sampler" in the monitor's map.
class CThreadSampler : public IThreadMonitorDevice {
public:
    // Where the samples come from.
    enum ESource {
        SOURCE_BEST, // the kernel's events where allowed, else /proc
        SOURCE_PERF, // the kernel's processor-clock events
        SOURCE_PROC, // /proc
        SOURCE_NONE, // not installed, or nothing could be opened
    };

    // A sampler that will use _wanted at install: SOURCE_PROC to leave the kernel's events alone.
    explicit CThreadSampler(ESource _wanted = SOURCE_BEST);
    ~CThreadSampler() override;
    CThreadSampler(CThreadSampler const &) = delete;
    CThreadSampler &operator=(CThreadSampler const &) = delete;

    // install opens the kernel's events (or settles on /proc) and remove closes them; start and
    // stop run and end the sampling thread.
    // @{
    void install() override;
    void start() override;
    void stop() override;
    void remove() override;
    // @}
    // The rings as the sampling thread has filled them so far.
    bool fetch(unsigned char *_p_buffer) override;

    // Where the samples come from after install.
    ESource get_source() const;

private:
    struct SState;
    std::unique_ptr<SState> mp_state;
};

// Rings recorded before: a test's or a replayed session's. Fetching gives the same buffer every
// time. A recording file is text, one item a line ('#' starts a comment):
//   process ID           the process that the recording watched
//   name ID TEXT         a thread's name, entered into the monitor's map at load
//   ring R HEAD          the ring that the following records fill, and its head
//   PROCESS THREAD TIME  one record, in slot order from slot 0
class CThreadRingsRecording : public IThreadMonitorDevice {
public:
    // An empty recording: every slot zero.
    CThreadRingsRecording();
    // A recording of the buffer given, k_ring_buffer_bytes long.
    explicit CThreadRingsRecording(unsigned char const *_p_buffer);

    // A recording has nothing to install or run.
    // @{
    void install() override {}
    void start() override {}
    void stop() override {}
    void remove() override {}
    // @}
    // The recorded buffer, the same at every fetch.
    bool fetch(unsigned char *_p_buffer) override;

    // Reads a recording file; false with the reason in _error (file and line) on a bad one, and the
    // recording as it was before.
    bool load(char const *_path, string &_error);
    // Writes the rings with the process and the names of its threads that the map knows.
    bool save(char const *_path) const;

    // The buffer, as a device would give it.
    // @{
    unsigned char const *get_buffer() const { return m_buffer.data(); }
    void set_buffer(unsigned char const *_p_buffer);
    // @}
    // The process that the recording watched.
    // @{
    uint32_t get_process_id() const { return m_process_id; }
    void set_process_id(uint32_t _process_id) { m_process_id = _process_id; }
    // @}

private:
    qor_vector<unsigned char> m_buffer;
    uint32_t m_process_id;
};

// ---------------------------------------------------------------------------------------------
// The monitor
// ---------------------------------------------------------------------------------------------

// A process of the machine, as update_processes lists it.
struct SProcessInfo {
    uint32_t m_id;    // the process id
    char m_name[260]; // the executable's name, terminated
};

// A bar of a thread's activity: columns of the bar's width, m_end inclusive.
struct SActivitySegment {
    uint16_t m_begin; // the first column
    uint16_t m_end;   // the last column
};

// Which thread had a processor when: the samples of a device merged by time, and a thread's
// activity from them.
class CThreadMonitor {
public:
    // Installs and starts _p_device, which must outlive the monitor; with none, a CThreadSampler
    // of the monitor's own. The thread that makes the monitor is named "Main_Thread".
    explicit CThreadMonitor(IThreadMonitorDevice *_p_device = nullptr);
    // Stops and removes the device.
    ~CThreadMonitor();
    CThreadMonitor(CThreadMonitor const &) = delete;
    CThreadMonitor &operator=(CThreadMonitor const &) = delete;

    // Fetches the device's samples, at most once in 2000 ms, and merges them. False only when the
    // device can't be reached; the samples stay as they were then. *_p_status becomes 0.
    bool refresh(int *_p_status);

    // Fill get_processes() and get_threads() from the machine's list; empty when it can't be read.
    // @{
    void update_processes();
    void update_threads(unsigned _process_id);
    // @}
    // The lists that the last updates filled: the machine's processes and the threads of one.
    // @{
    qor_vector<SProcessInfo> const &get_processes() const { return m_processes; }
    qor_vector<unsigned> const &get_threads() const { return m_threads; }
    // @}

    // The bars of one thread over the last _period half seconds, drawn _width columns wide, and its
    // busy share of the period in thousandths. _thread_id -1 stands for every other process but the
    // idle one. Nothing changes before a refresh has measured the counter's frequency.
    void get_thread_activity(unsigned _process_id, unsigned _thread_id,
                             qor_vector<SActivitySegment> &_segments, unsigned _width, unsigned _period,
                             unsigned *_p_per_mille) const;

    // All samples of the last refresh, oldest first.
    SThreadSample const *get_samples() const { return m_samples; }
    // Counts of the time stamp counter per second, as the last refresh measured it; 0 before.
    int64_t get_ticks_per_second() const { return m_ticks_per_second; }

    // The map of thread names, which exists without a monitor. Names are set on one thread at a
    // time; a name is copied. The second form names the calling thread.
    // @{
    static void set_thread_name(unsigned _thread_id, char const *_name);
    static void set_current_thread_name(char const *_name);
    // @}
    // "System/Other" for -1, the stored name, or "Unknown".
    static char const *get_thread_name(unsigned _thread_id);

private:
    void merge(unsigned char const *_p_buffer);
    int64_t read_time_stamp_counter() const;

    qor_vector<SProcessInfo> m_processes;
    qor_vector<unsigned> m_threads;
    unsigned m_base;                         // index of the oldest sample; every refresh sets it to 0
    SThreadSample m_samples[k_ring_samples]; // sorted by time
    int64_t m_ticks_per_second;              // measured frequency of the counter; 0 not yet
    uint32_t m_last_refresh;                 // tick count of the last fetch, ms
    int m_status;                            // what refresh reports; always 0
    int64_t m_last_tsc;                      // time stamp counter at the last fetch
    int64_t m_last_counter;                  // performance counter at the last fetch
    IThreadMonitorDevice *mp_device;
    std::unique_ptr<CThreadSampler> mp_own_device; // the sampler made when none is given
};

} // namespace qorui
