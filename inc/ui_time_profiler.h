// The engine-wide hierarchical timer. Any module makes named nodes, wraps code in begin and end,
// and has the tree printed with mean and total times to a stats page. Nodes nest by the call
// order at their creation: a node made while another is open becomes its child.
#pragma once
#include "qor_memory.h"
#include "ui_interfaces.h"

#include <cstdint>
#include <list>

namespace qorui {

// Counts per second of the performance counter, read once at the first node; shared by all the
// library's profilers.
int64_t profiler_frequency();

class CTimeProfilerNode;
// Nodes in order of creation; a list, so that their addresses stay valid.
typedef std::list<CTimeProfilerNode, qor_allocator<CTimeProfilerNode>> CTimeProfilerNodes;

// One named timer of the profiler's tree: its children, count, and mean and total times.
class CTimeProfilerNode {
public:
    // A zeroed node named _name, which isn't copied.
    explicit CTimeProfilerNode(char const *_name);

    enum { N_SAMPLES = 64 }; // durations kept for the mean

    char const *mp_name;           // the caller's text, not copied; must outlive the node
    int64_t m_start;               // counter at the last begin
    int64_t m_end;                 // counter at the last end
    int64_t m_samples[N_SAMPLES];  // the last 64 durations in counter ticks, a ring
    int64_t m_sum;                 // sum of the ring
    int32_t m_count;               // samples in the ring, up to 64
    int32_t m_index;               // the ring's last written slot
    int64_t m_total_us;            // total time in microseconds since the node was made
    int64_t m_average_us;          // mean of the ring in microseconds
    CTimeProfilerNodes m_children; // in order of creation; addresses stay valid

    // Adds one measured duration of _ticks counter ticks.
    void add_sample(int64_t _ticks);
};

// The engine-wide hierarchical timer, put on the interface server by the library.
class CTimeProfiler : public ITimeProfiler {
public:
    // Disabled, no nodes.
    CTimeProfiler();

    // qor_uid::TIME_PROFILER, version 1.
    // @{
    SInterfaceUID get_uid() const override { return qor_uid::TIME_PROFILER; }
    int get_version() const override { return 1; }
    // @}

    CTimeProfilerNode *create_node(char const *_name) override;
    CTimeProfilerNode *get_root() override { return nullptr; }
    void begin(CTimeProfilerNode *_p_node) override;
    void end() override;
    void reset_node(CTimeProfilerNode *) override {}
    void enable() override { m_enabled = true; }
    void disable() override { m_enabled = false; }
    void dump(IStatsPage *_p_page, int _reserved) override;

    // Whether begin and end take time.
    bool is_enabled() const { return m_enabled; }

private:
    void dump_node(IStatsPage *_p_page, CTimeProfilerNode const &_node, unsigned _depth,
                   unsigned &_line) const;

    bool m_enabled;
    CTimeProfilerNodes m_roots;              // top-level nodes, in order of creation
    qor_vector<CTimeProfilerNode *> m_stack; // the nodes open now, innermost last
};

} // namespace qorui
