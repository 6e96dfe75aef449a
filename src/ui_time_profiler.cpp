// The hierarchical time profiler.
#include "ui_time_profiler.h"

#include "qor_platform.h"

#include <cstdio>
#include <cstring>

namespace qorui {

namespace {
int64_t g_frequency = 0;
bool g_frequency_read = false;

// A buffer line: the name indented by depth, dots to this column, then the two times.
int const k_numbers_column = 65;
int const k_line_size = 81;
int const k_numbers_size = 15;
} // namespace

int64_t profiler_frequency() {
    if (!g_frequency_read) {
        g_frequency = qorplatform::query_performance_frequency();
        g_frequency_read = true;
    }
    return g_frequency;
}

// ---------------------------------------------------------------------------------------------
// CTimeProfilerNode
// ---------------------------------------------------------------------------------------------

CTimeProfilerNode::CTimeProfilerNode(char const *_name)
    : mp_name(_name), m_start(0), m_end(0), m_samples(), m_sum(0), m_count(0), m_index(0), m_total_us(0),
      m_average_us(0) {
    profiler_frequency();
}

// Times multiply before they divide, in 64 bits; the quotients are taken as 32-bit values.
void CTimeProfilerNode::add_sample(int64_t _ticks) {
    int64_t const frequency = profiler_frequency();
    m_total_us += static_cast<int32_t>(_ticks * 1000000 / frequency);

    m_index = m_index + 1 == N_SAMPLES ? 0 : m_index + 1;
    m_sum += _ticks - m_samples[m_index];
    m_samples[m_index] = _ticks;

    if (m_count < N_SAMPLES) ++m_count;
    m_average_us = static_cast<int32_t>((m_sum * 1000000 / frequency) / m_count);
}

// ---------------------------------------------------------------------------------------------
// CTimeProfiler
// ---------------------------------------------------------------------------------------------

CTimeProfiler::CTimeProfiler() : m_enabled(false) {}

CTimeProfilerNode *CTimeProfiler::create_node(char const *_name) {
    CTimeProfilerNodes &siblings = m_stack.empty() ? m_roots : m_stack.back()->m_children;
    siblings.emplace_back(_name);
    return &siblings.back();
}

// The stack works while disabled too, so pairs of begin and end stay matched.
void CTimeProfiler::begin(CTimeProfilerNode *_p_node) {
    if (m_enabled && _p_node) _p_node->m_start = qorplatform::query_performance_counter();
    m_stack.push_back(_p_node);
}

void CTimeProfiler::end() {
    if (m_stack.empty()) return;
    CTimeProfilerNode *p_node = m_stack.back();
    if (m_enabled && p_node) {
        p_node->m_end = qorplatform::query_performance_counter();
        p_node->add_sample(p_node->m_end - p_node->m_start);
    }
    m_stack.pop_back();
}

void CTimeProfiler::dump(IStatsPage *_p_page, int) {
    if (!_p_page) return;
    unsigned line = 0;
    for (CTimeProfilerNode const &root : m_roots) {
        dump_node(_p_page, root, 0, line);
        ++line;
    }
}

// "  name.......... 0.500, 12.000": name indented by depth, dots up to column 65, then mean and
// total in milliseconds.
void CTimeProfiler::dump_node(IStatsPage *_p_page, CTimeProfilerNode const &_node, unsigned _depth,
                              unsigned &_line) const {
    char buffer[k_line_size];
    int length = static_cast<int>(_depth < k_numbers_column ? _depth : k_numbers_column);
    memset(buffer, ' ', length);
    int const room = k_line_size - 1 - length; // the name is bounded to 80 - depth bytes
    if (room > 0) {
        char const *name = _node.mp_name ? _node.mp_name : "";
        int const name_length = static_cast<int>(strnlen(name, room));
        memcpy(buffer + length, name, name_length);
        length += name_length;
    }
    while (length < k_numbers_column)
        buffer[length++] = '.';
    if (length > k_numbers_column) length = k_numbers_column; // numbers stand at column 65 always
    snprintf(buffer + length, k_numbers_size, " %.3f, %.3f", _node.m_average_us * 0.001f,
             _node.m_total_us * 0.001f);
    buffer[k_line_size - 1] = '\0';
    _p_page->print(_line, "%s", buffer);

    for (CTimeProfilerNode const &child : _node.m_children) {
        ++_line;
        dump_node(_p_page, child, _depth + 1, _line);
    }
}

} // namespace qorui
